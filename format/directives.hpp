// SPDX-License-Identifier: Apache-2.0
// The directives that times are written and read by, described once for both.
#pragma once

#include "format/spelling.hpp"
#include "locale/locale.hpp"

namespace lx {

enum class DirectiveKind : uint8_t {
  unknown,
  percent,
  number,     // the field, and `offset`, as digits
  year,       // the year of the calendar as digits
  hour12,     // the hour on a clock of twelve, as digits
  week,       // from the days of the week and of the year; `first_weekday` begins it
  name,       // text number `field` of those from `item` on
  half_day,   // text `item` before noon, the next one from noon on
  format,     // text `item` as a format, or `alternate_item`
  date_time,  // the same, and the time
};

struct Directive {
  char letter = 0;  // in ASCII
  int8_t code = -1;
  DirectiveKind kind = DirectiveKind::unknown;
  uint8_t item = 0;
  uint8_t alternate_item = 0;
  uint8_t count = 0;  // names
  uint8_t width = 0;  // digits
  uint8_t first_weekday = 0;
  int LXTime::*field = nullptr;
  int16_t highest = 0;  // of the field when it is written; the lowest is 0
  int16_t limit = 0;    // the highest number when it is read
  int16_t offset = 0;   // what a number is more than its field
};

inline constexpr int32_t kPercentCode = 50;
inline constexpr int32_t kAlternateCode = 51;
inline constexpr int32_t kNoDirective = -1;

// As deep as formats of the locale may name each other; deeper ones never end.
inline constexpr unsigned kDeepestFormat = 4;

// Room for a name or a format of the locale.
inline constexpr size_t kTimeTextRoom = 32;

// A name of a day, a month or half of a day as the language has it; null: the item is something else.
inline const LXUChar* language_name(const LXLocale& locale, uint32_t item) {
  const Item& what = item_of(item);
  return what.kind == ItemKind::language_text ? language_text(*locale.language, what.index) : nullptr;
}

// The codes of directive characters in text of one kind and code page.
class DirectiveCodes {
 public:
  template <class Kind>
  static DirectiveCodes of(const CodePage& page, bool ascii) {
    constexpr uint16_t kKatakanaPage = 930;
    if (std::same_as<Kind, Ucs2Kind> || ascii) return {LXAsciiTMChar, '#'};
    return {page.id == kKatakanaPage ? LXEbcdic930TMChar : LXEbcdicTMChar, page.packed('#')};
  }

  bool is_percent(const Character& character) const { return of(character) == kPercentCode; }
  // EBCDIC pages of some countries have the number sign in a place of their own, where the table knows nothing of it.
  bool is_alternate(const Character& character) const {
    return of(character) == kAlternateCode || (character.units == 1 && character.code == number_sign_);
  }
  int32_t of(const Character& character) const {
    return character.units == 1 && character.code < 256 ? table_[character.code] : kNoDirective;
  }

 private:
  DirectiveCodes(const int32_t* table, uint32_t number_sign) : table_(table), number_sign_(number_sign) {}

  const int32_t* table_;
  uint32_t number_sign_;
};

struct DirectiveTable {
  Directive entries[129];  // by code and 1

  constexpr DirectiveTable();
};
extern const DirectiveTable kDirectiveTable;

inline const Directive& directive_of(int32_t code) { return kDirectiveTable.entries[code + 1]; }

// A directive of a format.
struct Request {
  const Directive* directive;
  bool alternate;
};

// Reads on behind the percent sign. Unknown: no directive is there.
template <class Walker>
[[gnu::always_inline]] inline Request next_request(Walker& format, const DirectiveCodes& codes) {
  Character character;
  bool there = format.next(character);
  bool alternate = there && codes.is_alternate(character);
  if (alternate) there = format.next(character);
  return {&directive_of(there ? codes.of(character) : kNoDirective), alternate};
}

// A text of a call: a negative length is measured, with LX_NUM_CHARLEN a positive one counts characters.
template <class Kind, class Unit = typename Kind::Unit>
Text<Unit> text_of_call(const CodePage& page, const Unit* at, uint32_t state, int32_t length, uint32_t flags) {
  Text<Unit> text = {at, 0, state};
  text.length = length < 0 ? measured_length(at) : static_cast<size_t>(length);
  if (length > 0 && (flags & LX_NUM_CHARLEN) != 0) text.length = Kind::length_of_characters(page, text, text.length);
  return text;
}

// A walker of the same kind over another text.
template <class Walker, class Unit>
Walker walker_over(Walker walker, const Text<Unit>& text) {
  walker.at = reinterpret_cast<decltype(walker.at)>(text.at);
  walker.end = walker.at + text.length;
  if constexpr (requires { walker.double_byte; }) walker.double_byte = text.state != 0;
  return walker;
}

}  // namespace lx
