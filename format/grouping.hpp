// SPDX-License-Identifier: Apache-2.0
// How the digits of a number are parted by a grouping string ("3;2;0"), from the units digit leftwards.
#pragma once

#include <algorithm>
#include <string_view>
#include <type_traits>

#include "format/local_text.hpp"
#include "format/spelling.hpp"

namespace lx {

// The size at `at`, which moves to the next one: null, there is none. -1: no size, and nothing moves. Digits count in
// `remaining`, what stands between the sizes does not.
template <class Unit>
int32_t next_group_size(const Spelling& spelling, const Unit*& at, int32_t& remaining) {
  if (at == nullptr || *at == 0) return -1;
  const int32_t room = remaining > 0 ? remaining : 0;
  int64_t size = 0;
  int32_t digits = 0;
  for (; digits < room && at[digits] != 0 && at[digits] != spelling.list; ++digits) {
    uint32_t digit = uint32_t{static_cast<std::make_unsigned_t<Unit>>(at[digits])} - spelling.zero;
    if (digit > 9) return -1;
    size = std::min<int64_t>(size * 10 + digit, INT32_MAX);
  }
  bool ended = room != 0 && (digits == room || at[digits] == 0);
  remaining = ended ? 0 : room - digits;
  at = ended ? nullptr : at + digits + 1;
  return static_cast<int32_t>(size);
}

// The groups of a locale's numbers. The Ex forms take the texts of the plain ones: digits stand outside shift states.
template <class Kind>
class Grouping {
 public:
  using Unit = typename Kind::Unit;
  using TextKind = std::conditional_t<Kind::kShifted, PlainKind, Kind>;
  static constexpr size_t kRest = SIZE_MAX;  // a group of all digits that are left

  Grouping(const LXLocale& locale, uint32_t separator_item, uint32_t grouping_item, uint32_t options)
      : spelling(spelling_of<Kind>(page_of(locale))),
        separator(local_separator<TextKind>(locale, separator_item, options)),
        text_(locale, grouping_item, options),
        at_(separator != 0 ? text_.begin() : nullptr),
        remaining_(static_cast<int32_t>(text_.length())) {}
  Grouping(const Grouping&) = delete;
  Grouping& operator=(const Grouping&) = delete;

  // Writes the digits backwards from `to`; returns where they begin.
  Unit* write(Unit* to, std::string_view digits) {
    const char* end = digits.data() + digits.size();
    for (;;) {
      const char* group = end - std::min(next(), static_cast<size_t>(end - digits.data()));
      while (end != group) *--to = spelled(*--end);
      if (end == digits.data()) return to;
      *--to = separator;
    }
  }
  Unit spelled(char digit) const { return static_cast<Unit>(digit - '0' + spelling.zero); }

  const Spelling& spelling;
  const Unit separator;  // 0: digits are not parted

 private:
  // The size of the next group.
  size_t next() {
    if (ended_) return size_;
    int32_t size = next_group_size(spelling, at_, remaining_);
    ended_ = size <= 0;
    if (size != 0) size_ = size > 0 ? static_cast<size_t>(size) : kRest;  // 0: the size before it for good
    return size_;
  }

  const LocalText<TextKind, 32> text_;
  const Unit* at_;
  int32_t remaining_;
  size_t size_ = kRest;
  bool ended_ = false;
};

}  // namespace lx
