// SPDX-License-Identifier: Apache-2.0
#include "format/directives.hpp"

#include <array>

#include "format/byte_table.hpp"

namespace lx {
namespace {

using Kind = DirectiveKind;

constexpr Directive plain(char letter, int8_t code, Kind kind) {
  return {.letter = letter, .code = code, .kind = kind};
}
constexpr Directive number(char letter, int8_t code, int LXTime::*field, int16_t highest, uint8_t width, int16_t limit,
                           int16_t offset = 0) {
  return {.letter = letter,
          .code = code,
          .kind = Kind::number,
          .width = width,
          .field = field,
          .highest = highest,
          .limit = limit,
          .offset = offset};
}
constexpr Directive of_kind(Kind kind, Directive directive) {
  directive.kind = kind;
  return directive;
}
constexpr Directive week(char letter, int8_t code, uint8_t first_weekday) {
  Directive directive = of_kind(Kind::week, number(letter, code, &LXTime::tm_wday, 6, 2, 0));
  directive.first_weekday = first_weekday;
  return directive;
}
constexpr Directive name(char letter, int8_t code, int LXTime::*field, int16_t highest, uint8_t item, uint8_t count) {
  return {.letter = letter,
          .code = code,
          .kind = Kind::name,
          .item = item,
          .count = count,
          .field = field,
          .highest = highest};
}
constexpr Directive format(char letter, int8_t code, Kind kind, uint8_t item, uint8_t alternate_item) {
  return {.letter = letter, .code = code, .kind = kind, .item = item, .alternate_item = alternate_item};
}

constexpr Directive kDirectives[] = {
    plain('%', kPercentCode, Kind::percent),
    plain('#', kAlternateCode, Kind::unknown),
    name('a', 60, &LXTime::tm_wday, 6, LX_ITEM_ABDAY_1, 7),
    name('A', 90, &LXTime::tm_wday, 6, LX_ITEM_DAY_1, 7),
    name('b', 61, &LXTime::tm_mon, 11, LX_ITEM_ABMON_1, 12),
    name('B', 91, &LXTime::tm_mon, 11, LX_ITEM_MON_1, 12),
    format('c', 62, Kind::date_time, LX_ITEM_SHORT_DATE, LX_ITEM_LONG_DATE),
    number('d', 63, &LXTime::tm_mday, 31, 2, 31),
    number('H', 97, &LXTime::tm_hour, 23, 2, 23),
    of_kind(Kind::hour12, number('I', 98, &LXTime::tm_hour, 23, 2, 12)),
    number('j', 68, &LXTime::tm_yday, 365, 3, 366),
    number('m', 72, &LXTime::tm_mon, 11, 2, 12, 1),
    number('M', 102, &LXTime::tm_min, 59, 2, 59),
    of_kind(Kind::half_day, name('p', 75, &LXTime::tm_hour, 23, LX_ITEM_AM, 2)),
    number('S', 108, &LXTime::tm_sec, 59, 2, 59),
    week('U', 110, 0),
    week('W', 112, 1),
    number('w', 82, &LXTime::tm_wday, 6, 1, 6),
    format('x', 83, Kind::format, LX_ITEM_SHORT_DATE, LX_ITEM_LONG_DATE),
    format('X', 113, Kind::format, LX_ITEM_TIME_FORMAT, LX_ITEM_TIME_FORMAT),
    of_kind(Kind::year, number('y', 84, &LXTime::tm_year, 0, 2, 99)),
    of_kind(Kind::year, number('Y', 114, &LXTime::tm_year, 0, 4, 9999, 1900)),
    plain('z', 85, Kind::unknown),
    plain('Z', 115, Kind::unknown),
};

// ---- Where the characters are ----

constexpr uint8_t ascii_byte(char letter) { return static_cast<uint8_t>(letter); }

// Nine letters from A and from J on, eight from S on, each a column.
constexpr uint8_t ebcdic_byte(char letter) {
  if (letter == '%') return 0x6C;
  if (letter == '#') return 0x7B;
  bool small = letter >= 'a';
  int index = letter - (small ? 'a' : 'A');
  int byte = index < 9 ? 0x81 + index : index < 18 ? 0x91 + index - 9 : 0xA2 + index - 18;
  return static_cast<uint8_t>(small ? byte : byte + 0x40);
}

// Small letters between the Katakana, q, r and s apart from the others: no directive has those.
constexpr uint8_t katakana_byte(char letter) {
  if (letter < 'a') return ebcdic_byte(letter);
  int index = letter - 'a';
  return static_cast<uint8_t>(index < 8 ? 0x62 + index : index < 16 ? 0x71 + index - 8 : 0xB3 + index - 19);
}

template <class ByteOf>
constexpr std::array<int32_t, 256> codes_by(ByteOf byte_of) {
  std::array<int32_t, 256> table = {};
  table.fill(kNoDirective);
  for (const Directive& directive : kDirectives) table[byte_of(directive.letter)] = directive.code;
  return table;
}
constexpr std::array<int32_t, 256> kAscii = codes_by(ascii_byte);
constexpr std::array<int32_t, 256> kEbcdic = codes_by(ebcdic_byte);
constexpr std::array<int32_t, 256> kKatakana = codes_by(katakana_byte);

}  // namespace

constexpr DirectiveTable::DirectiveTable() {
  for (const Directive& directive : kDirectives) entries[static_cast<size_t>(directive.code) + 1] = directive;
}
constinit const DirectiveTable kDirectiveTable;

}  // namespace lx

extern "C" {

const int32_t LXAsciiTMChar[256] = {LX_TABLE_256(lx::kAscii)};
const int32_t LXEbcdicTMChar[256] = {LX_TABLE_256(lx::kEbcdic)};
const int32_t LXEbcdic930TMChar[256] = {LX_TABLE_256(lx::kKatakana)};

}  // extern "C"
