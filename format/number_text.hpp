// SPDX-License-Identifier: Apache-2.0
// A number in a text, with the separators and signs of the locale: what reading integers and decimal numbers share.
#pragma once

#include "format/digits.hpp"
#include "format/local_text.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {

// The text of a call, and where it wants to know how far the number went.
template <class Unit>
struct NumberText {
  const Unit* at;
  uint32_t state;
  int32_t length;
  const Unit** end;
  uint32_t* end_state = nullptr;

  void stopped(const Unit* place, uint32_t place_state) const {
    if (end != nullptr) *end = place;
    if (end_state != nullptr) *end_state = place_state;
  }
};

// read(reader, spelling) on the text, with a reader of digits as the locale and the flags say; `decimal`: it looks for
// a decimal point. The number ends where the reader is left.
template <class Kind, class Read>
auto read_number(const LXLocale& locale, const NumberText<typename Kind::Unit>& given, bool decimal, uint32_t flags,
                 Read read) {
  using Unit = typename Kind::Unit;
  using Code = std::conditional_t<Kind::kBytes, uint8_t, Unit>;
  constexpr size_t kSignRoom = 32;
  const CodePage& page = page_of(locale);
  if constexpr (Kind::kShifted) {
    if (!page.shift_sensitive) return read_number<PlainKind>(locale, given, decimal, flags, read);
  }
  const Spelling& spelling = spelling_of<Kind>(page);

  Text<Unit> text = {given.at, 0, given.state};
  if (given.length < 0) {
    text.length = measured_length(given.at);
  } else {
    text.length = static_cast<size_t>(given.length);
    if ((flags & LX_NUM_CHARLEN) != 0) text.length = Kind::length_of_characters(page, text, text.length);
  }

  const bool monetary = (flags & LX_NUM_MONETARY) != 0;
  auto separator = [&](uint32_t item) -> uint32_t {
    return static_cast<Code>(local_separator<Kind>(locale, item, flags));
  };
  Separators separators = {separator(monetary ? LX_ITEM_MON_THOUSANDS : LX_ITEM_THOUSANDS)};
  if (decimal) separators.decimal = separator(monetary ? LX_ITEM_MON_DECIMAL : LX_ITEM_DECIMAL);

  return Kind::with_walker(page, text, [&](auto walker) {
    DigitReader reader(page, walker, spelling.ascii, separators, (flags & LX_NUM_FULLWIDTH) != 0);
    auto read_and_stop = [&] {
      auto result = read(reader, spelling);
      auto place = reader.place();
      // Behind the whole text, callers have come to expect the state that they gave.
      uint32_t state = reader.kShifted && !reader.done() ? uint32_t{place.double_byte} : given.state;
      given.stopped(reinterpret_cast<const Unit*>(place.at), state);
      return result;
    };
    if (!monetary) {
      reader.set_plain_signs(spelling);
      return read_and_stop();
    }
    LocalText<Kind, kSignRoom> positive(locale, LX_ITEM_POSITIVE_SIGN, flags);
    LocalText<Kind, kSignRoom> negative(locale, LX_ITEM_NEGATIVE_SIGN, flags);
    reader.set_signs(Text<Unit>{positive.begin(), positive.length()}, Text<Unit>{negative.begin(), negative.length()});
    return read_and_stop();
  });
}

}  // namespace lx
