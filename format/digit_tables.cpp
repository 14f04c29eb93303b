// SPDX-License-Identifier: Apache-2.0
// Values of digits and letters by their bytes.
#include <lexaro/lexaro.h>

#include "format/byte_table.hpp"

namespace {

struct ValueTable {
  int32_t values[256];

  constexpr ValueTable() : values() {
    for (int32_t& value : values) value = -1;
  }
  // Consecutive values for the bytes from first to last; returns the one behind them.
  constexpr int32_t run(unsigned first, unsigned last, int32_t value) {
    for (unsigned byte = first; byte <= last; ++byte) values[byte] = value++;
    return value;
  }
};

constexpr ValueTable ascii_table() {
  ValueTable table;
  table.run(0x30, 0x39, 0);
  table.run(0x41, 0x5A, 10);
  table.run(0x61, 0x7A, 10);
  return table;
}

// EBCDIC has its letters in three runs, a column apart.
constexpr void add_letters(ValueTable& table, unsigned a, unsigned j, unsigned s) {
  table.run(s, s + 7, table.run(j, j + 8, table.run(a, a + 8, 10)));
}

constexpr ValueTable ebcdic_digits_and_capitals() {
  ValueTable table;
  table.run(0xF0, 0xF9, 0);
  add_letters(table, 0xC1, 0xD1, 0xE2);
  return table;
}

constexpr ValueTable ebcdic_table() {
  ValueTable table = ebcdic_digits_and_capitals();
  add_letters(table, 0x81, 0x91, 0xA2);
  return table;
}

// Katakana stand where other pages have the small letters, which fill the gaps between them.
constexpr ValueTable katakana_table() {
  ValueTable table = ebcdic_digits_and_capitals();
  int32_t value = table.run(0x71, 0x78, table.run(0x62, 0x69, 10));
  for (unsigned byte = 0x8B; byte <= 0xAB; byte += 0x10) value = table.run(byte, byte, value);
  table.run(0xB3, 0xB9, value);
  return table;
}

constexpr ValueTable kAscii = ascii_table();
constexpr ValueTable kEbcdic = ebcdic_table();
constexpr ValueTable kKatakana = katakana_table();

static_assert(kAscii.values[0x5A] == 35 && kEbcdic.values[0xE9] == 35 && kKatakana.values[0xB9] == 35);

}  // namespace

extern "C" {

const int32_t LXAsciiToNum[256] = {LX_TABLE_256(kAscii.values)};
const int32_t LXEbcdicToNum[256] = {LX_TABLE_256(kEbcdic.values)};
const int32_t LXEbcdic930ToNum[256] = {LX_TABLE_256(kKatakana.values)};

}  // extern "C"
