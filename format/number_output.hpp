// SPDX-License-Identifier: Apache-2.0
// Where numbers and amounts are written: never past the room, and nothing behind what found none.
#pragma once

#include <algorithm>
#include <cstring>

#include "codepage/text/algorithms.hpp"
#include "codepage/text/kinds.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {

// What a call says about its output.
template <class Unit>
struct Destination {
  Unit* buffer;
  uint32_t state;
  int32_t length;
  uint32_t flags;

  bool empty() const { return buffer == nullptr || length <= 0; }
  bool terminated() const { return (flags & LX_NUM_TERMINATE) != 0; }
  bool in_characters() const { return (flags & LX_NUM_CHARLEN) != 0; }
  // Without the place of the terminator.
  size_t room() const { return static_cast<size_t>(length) - (terminated() ? 1 : 0); }
};

template <class Unit>
class Output {
 public:
  // Room for so many units, and for so many characters.
  Output(Unit* buffer, size_t room, size_t characters = SIZE_MAX)
      : begin_(buffer), at_(buffer), left_(room), characters_left_(characters) {}

  // The room that is left counts characters of so many units.
  void widen(size_t width) { left_ *= width; }

  // Units that are characters.
  void put(uint32_t code) {
    if (take(1) != 0) *at_++ = static_cast<Unit>(code);
  }
  void put(const Unit* text, size_t length) {
    length = take(length);
    std::memcpy(at_, text, length * sizeof(Unit));
    at_ += length;
  }
  void put_repeated(Unit unit, size_t count) {
    count = take(count);
    at_ = std::fill_n(at_, count, unit);
  }
  // A text, of which at most so many characters are wanted. Double-byte runs are closed, whatever is cut off, but one
  // that begins where another ends goes on with it: not every reader takes an empty run.
  template <class Kind>
  void put_text(const CodePage& page, Text<Unit> text, size_t wanted) {
    if (Kind::kShifted && continues_run(page, text)) {
      text = {text.at + 1, text.length - 1, 1};
      --at_;
      ++left_;
    }
    Kind::with_walker(page, text, [&](auto walker) {
      const auto begin = walker;
      auto ahead = walker;
      for (Character character; wanted != 0 && !cut_ && ahead.next(character); --wanted) {
        cut_ = characters_left_ == 0 || passed(begin, ahead) + (open_run(ahead) ? 1 : 0) > left_;
        if (cut_) break;
        walker = ahead;
        --characters_left_;
      }
      const size_t length = passed(begin, walker);
      std::memcpy(at_, text.at, length * sizeof(Unit));
      at_ += length;
      left_ -= length;
      if (open_run(walker)) {
        *at_++ = static_cast<Unit>(page.leave_byte);
        --left_;
      }
    });
  }

  // Its place was kept free.
  void terminate() { *at_++ = 0; }
  bool cut() const { return cut_; }
  size_t written() const { return static_cast<size_t>(at_ - begin_); }
  size_t characters_left() const { return characters_left_; }

 private:
  size_t take(size_t count) {
    const size_t taken = std::min({count, left_, characters_left_});
    if (taken < count) cut_ = true;
    left_ -= taken;
    characters_left_ -= taken;
    return taken;
  }
  bool continues_run(const CodePage& page, const Text<Unit>& text) const {
    return page.shift_sensitive && at_ != begin_ && at_[-1] == static_cast<Unit>(page.leave_byte) && text.length != 0 &&
           *text.at == static_cast<Unit>(page.enter_byte);
  }
  template <class Walker>
  static bool open_run(const Walker& walker) {
    if constexpr (requires { walker.double_byte; }) return walker.double_byte;
    return false;
  }

  Unit* const begin_;
  Unit* at_;
  size_t left_;
  size_t characters_left_;
  bool cut_ = false;
};

// Units of a character of the lengths that count characters: digits inside a double-byte run are taken in pairs.
template <class Kind, class Unit = typename Kind::Unit>
size_t character_width(const CodePage& page, const Destination<Unit>& to) {
  return Kind::kShifted && page.shift_sensitive && to.in_characters() && to.state != 0 ? page.max_length : 1;
}

// Characters in so many units, shift states left alone.
template <class Unit>
size_t characters_in(const CodePage& page, const Unit* text, size_t length) {
  if constexpr (std::same_as<Unit, char>) {
    return PlainKind::with_walker(page, {text, length}, [](auto walker) { return count_characters(walker); });
  } else {
    return length;
  }
}

}  // namespace lx
