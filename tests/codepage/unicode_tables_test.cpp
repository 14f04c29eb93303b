// SPDX-License-Identifier: Apache-2.0
// The exported tables of character types, case, width and digits.
#include "lexaro/lexaro.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <map>
#include <optional>

namespace {

template <class Value>
struct Table {
  template <size_t N>
  Table(const Value (&array)[N], uint32_t first_character)
      : values(array), first(first_character), last(first_character + N - 1) {}

  const Value* values;
  uint32_t first, last;
};
using TypeTable = Table<uint32_t>;
using MapTable = Table<uint16_t>;

const TypeTable kTypes[] = {{LX_UNICODE_Ctype1, 0x0000}, {LX_UNICODE_Ctype2, 0x0901}, {LX_UNICODE_Ctype3, 0x10A0},
                            {LX_UNICODE_Ctype4, 0x1E00}, {LX_UNICODE_Ctype5, 0x22F2}, {LX_UNICODE_Ctype6, 0x3000},
                            {LX_UNICODE_Ctype7, 0xFB00}, {LX_UNICODE_Ctype8, 0xFD3E}};
const MapTable kToLower[] = {{LX_UNICODE_Lower1, 0x0100}, {LX_UNICODE_Lower2, 0x0200}, {LX_UNICODE_Lower3, 0x0380},
                             {LX_UNICODE_Lower4, 0x0400}, {LX_UNICODE_Lower5, 0x1E00}, {LX_UNICODE_Lower6, 0x1F00}};
const MapTable kToUpper[] = {{LX_UNICODE_Upper1, 0x0100}, {LX_UNICODE_Upper2, 0x0200}, {LX_UNICODE_Upper3, 0x03A0},
                             {LX_UNICODE_Upper4, 0x0430}, {LX_UNICODE_Upper5, 0x1E00}, {LX_UNICODE_Upper6, 0x1F00}};
const MapTable kToFullWidth[] = {{LX_UNICODE_H2F1, 0x00A0}, {LX_UNICODE_H2F2, 0xFF60}};
const MapTable kToHalfWidth[] = {
    {LX_UNICODE_F2H1, 0x2500}, {LX_UNICODE_F2H2, 0x3000}, {LX_UNICODE_F2H3, 0x3130}, {LX_UNICODE_F2H4, 0xFFE0}};

template <class Value, size_t N>
std::optional<Value> look_up(const Table<Value> (&tables)[N], uint32_t c) {
  for (const auto& table : tables) {
    if (c >= table.first && c <= table.last) return table.values[c - table.first];
  }
  return std::nullopt;
}

uint32_t type(uint32_t c) { return look_up(kTypes, c).value(); }

// Characters that the tables change.
template <size_t N>
std::map<uint16_t, uint16_t> changes(const MapTable (&tables)[N]) {
  std::map<uint16_t, uint16_t> changed;
  for (const MapTable& table : tables) {
    for (uint32_t c = table.first; c <= table.last; ++c) {
      if (table.values[c - table.first] != c) changed[static_cast<uint16_t>(c)] = table.values[c - table.first];
    }
  }
  return changed;
}

// Characters that do not come back: where they end instead. Those that leave the tables are not followed.
template <size_t N>
std::map<uint16_t, uint16_t> one_way(const std::map<uint16_t, uint16_t>& there, const MapTable (&back)[N]) {
  std::map<uint16_t, uint16_t> lost;
  for (const auto& [c, mapped] : there) {
    auto returned = look_up(back, mapped);
    if (returned && *returned != c) lost[c] = *returned;
  }
  return lost;
}

// Ten bits of classes, eleven of directions, eleven of forms; also the ends of every table.
TEST(UnicodeTables, Types) {
  constexpr struct {
    uint16_t character;
    uint32_t type;
  } cases[] = {
      {0x0000, 0x00200300}, {0x0009, 0x000803C0}, {0x000A, 0x00040340}, {0x0020, 0x001002C0}, {0x0024, 0x02008220},
      {0x002C, 0x00020220}, {0x002F, 0x00004220}, {0x0030, 0x00002218}, {0x0046, 0x00000A13}, {0x0047, 0x00000A03},
      {0x0060, 0x02A00220}, {0x0061, 0x00000A15}, {0x007F, 0x00200300}, {0x0085, 0x00200140}, {0x00A0, 0x000200C0},
      {0x00B2, 0x00002008}, {0x00BC, 0x00200000}, {0x00D7, 0x02200020}, {0x00DF, 0x00000805}, {0x01C5, 0x00000807},
      {0x02B0, 0x00800801}, {0x0301, 0x00E00000}, {0x05B4, 0x01E00000}, {0x05D0, 0x00001001}, {0x0627, 0x00001001},
      {0x0640, 0x80001001}, {0x0660, 0x00010008}, {0x06F9, 0x00002008}, {0x0901, 0x00600000}, {0x0E34, 0x01600000},
      {0x0EDD, 0x00000801}, {0x10A0, 0x00000803}, {0x11F9, 0x00000801}, {0x1E00, 0x00000803}, {0x2028, 0x00100040},
      {0x20AC, 0x02008020}, {0x2160, 0x00000802}, {0x21FF, 0x00000400}, {0x22F2, 0x00000400}, {0x24D0, 0x02000824},
      {0x27BE, 0x02200020}, {0x3000, 0x201000C0}, {0x3007, 0x40000800}, {0x3042, 0x08000801}, {0x309B, 0x0EA00020},
      {0x30A2, 0x04000801}, {0x30FC, 0x0C800801}, {0x33FE, 0x02000820}, {0xFB00, 0x00000805}, {0xFBD2, 0x00000400},
      {0xFD3E, 0x00200020}, {0xFF10, 0x20002018}, {0xFF21, 0x20000813}, {0xFF71, 0x14000801}, {0xFFA1, 0x10000801},
      {0xFFE5, 0x22008020}, {0xFFFF, 0x00000400},
  };
  for (const auto& c : cases) EXPECT_EQ(type(c.character), c.type) << std::hex << c.character;
}

TEST(UnicodeTables, EveryCharacterHasOneDirection) {
  constexpr uint32_t kUnassigned = 0x400;
  for (const TypeTable& table : kTypes) {
    for (uint32_t c = table.first; c <= table.last; ++c) {
      uint32_t direction = type(c) & 0x3FFC00;
      EXPECT_TRUE(direction != 0 && (direction & (direction - 1)) == 0) << std::hex << c;
      EXPECT_EQ(direction == kUnassigned, type(c) == kUnassigned) << std::hex << c;
    }
  }
}

TEST(UnicodeTables, Case) {
  constexpr struct {
    uint16_t upper, lower;
  } pairs[] = {{0x0100, 0x0101}, {0x0178, 0x00FF}, {0x01FE, 0x01FF}, {0x0200, 0x0201}, {0x0216, 0x0217},
               {0x018F, 0x0259}, {0x01B7, 0x0292}, {0x0386, 0x03AC}, {0x03A3, 0x03C3}, {0x03AB, 0x03CB},
               {0x03EE, 0x03EF}, {0x0401, 0x0451}, {0x0410, 0x0430}, {0x04F8, 0x04F9}, {0x1E00, 0x1E01},
               {0x1EF8, 0x1EF9}, {0x1F08, 0x1F00}, {0x1FFB, 0x1F7D}, {0x1FFC, 0x1FF3}};
  for (const auto& pair : pairs) {
    EXPECT_EQ(look_up(kToLower, pair.upper), pair.lower) << std::hex << pair.upper;
    EXPECT_EQ(look_up(kToUpper, pair.lower).value_or(pair.upper), pair.upper) << std::hex << pair.lower;
  }
  for (uint32_t c : {0x0138u, 0x0149u, 0x0274u, 0x0380u, 0x03A2u, 0x0482u, 0x1E96u, 0x1F50u}) {
    EXPECT_EQ(look_up(kToLower, c).value_or(c), c);
    EXPECT_EQ(look_up(kToUpper, c).value_or(c), c);
  }
}

// A character changes case only if its type says so, and becomes one of the other case.
TEST(UnicodeTables, CaseAgreesWithTypes) {
  for (const auto& [c, lower] : changes(kToLower)) {
    EXPECT_NE(type(c) & LX_CT_UPPER, 0u) << std::hex << c;
    EXPECT_NE(type(lower) & LX_CT_LOWER, 0u) << std::hex << c;
  }
  for (const auto& [c, upper] : changes(kToUpper)) {
    EXPECT_NE(type(c) & LX_CT_LOWER, 0u) << std::hex << c;
    EXPECT_NE(type(upper) & LX_CT_UPPER, 0u) << std::hex << c;
  }
}

TEST(UnicodeTables, CaseGoesBothWays) {
  std::map<uint16_t, uint16_t> title_case = {{0x01C5, 0x01C4}, {0x01C8, 0x01C7}, {0x01CB, 0x01CA}, {0x01F2, 0x01F1}};
  EXPECT_EQ(one_way(changes(kToLower), kToUpper), title_case);
  std::map<uint16_t, uint16_t> variants = {{0x03C2, 0x03C3}, {0x03D0, 0x03B2}, {0x03D1, 0x03B8}, {0x03D5, 0x03C6},
                                           {0x03D6, 0x03C0}, {0x03F0, 0x03BA}, {0x03F1, 0x03C1}, {0x1E9B, 0x1E61},
                                           {0x1FBE, 0x03B9}, {0x01C5, 0x01C6}, {0x01C8, 0x01C9}, {0x01CB, 0x01CC},
                                           {0x01F2, 0x01F3}};
  EXPECT_EQ(one_way(changes(kToUpper), kToLower), variants);

  // Into ASCII.
  EXPECT_EQ(look_up(kToLower, 0x0130), 'i');
  EXPECT_EQ(look_up(kToUpper, 0x0131), 'I');
  EXPECT_EQ(look_up(kToUpper, 0x017F), 'S');
}

TEST(UnicodeTables, Width) {
  constexpr struct {
    uint16_t half, full;
  } pairs[] = {{0x0020, 0x3000}, {0x00A2, 0xFFE0}, {0x00A3, 0xFFE1}, {0x00A5, 0xFFE5}, {0x00A6, 0xFFE4},
               {0x00AC, 0xFFE2}, {0x00AF, 0xFFE3}, {0x20A9, 0xFFE6}, {0xFF61, 0x3002}, {0xFF66, 0x30F2},
               {0xFF70, 0x30FC}, {0xFF71, 0x30A2}, {0xFF9D, 0x30F3}, {0xFF9E, 0x309B}, {0xFF9F, 0x309C},
               {0xFFA0, 0x3164}, {0xFFA1, 0x3131}, {0xFFDC, 0x3163}, {0xFFE8, 0x2502}, {0xFFE9, 0x2190},
               {0xFFEC, 0x2193}, {0xFFED, 0x25A0}, {0xFFEE, 0x25CB}};
  for (const auto& pair : pairs) {
    EXPECT_EQ(look_up(kToFullWidth, pair.half).value_or(pair.full), pair.full) << std::hex << pair.half;
    EXPECT_EQ(look_up(kToHalfWidth, pair.full).value_or(pair.half), pair.half) << std::hex << pair.full;
  }
  for (uint32_t c : {0x00A0u, 0x00A9u, 0xFF60u, 0xFFBFu, 0xFFE7u}) EXPECT_EQ(look_up(kToFullWidth, c).value_or(c), c);
  for (uint32_t c : {0x2500u, 0x2503u, 0x3005u, 0x3041u, 0x304Cu, 0x30ACu, 0x3130u})
    EXPECT_EQ(look_up(kToHalfWidth, c), c);
}

TEST(UnicodeTables, WidthGoesBothWays) {
  EXPECT_TRUE(one_way(changes(kToFullWidth), kToHalfWidth).empty());
  // The combining voice marks become the spacing ones.
  std::map<uint16_t, uint16_t> combining = {{0x3099, 0x309B}, {0x309A, 0x309C}};
  EXPECT_EQ(one_way(changes(kToHalfWidth), kToFullWidth), combining);

  constexpr uint32_t kHalfForm = 1u << 28;
  auto full_width = changes(kToFullWidth);
  for (uint32_t c = 0xFF61; c <= 0xFFEE; ++c) {
    bool half = (type(c) & kHalfForm) != 0;
    EXPECT_EQ(full_width.count(static_cast<uint16_t>(c)) == 1, half) << std::hex << c;
  }
}

TEST(UnicodeTables, Digits) {
  constexpr struct {
    uint16_t first, last, value;
  } runs[] = {{0x0030, 0x0039, 0}, {0x00B2, 0x00B3, 2}, {0x00B9, 0x00B9, 1}, {0x0660, 0x0669, 0}, {0x06F0, 0x06F9, 0},
              {0x0966, 0x096F, 0}, {0x09E6, 0x09EF, 0}, {0x0A66, 0x0A6F, 0}, {0x0AE6, 0x0AEF, 0}, {0x0B66, 0x0B6F, 0},
              {0x0BE7, 0x0BEF, 1}, {0x0C66, 0x0C6F, 0}, {0x0CE6, 0x0CEF, 0}, {0x0D66, 0x0D6F, 0}, {0x0E50, 0x0E59, 0},
              {0x0ED0, 0x0ED9, 0}, {0x0F20, 0x0F29, 0}, {0x2070, 0x2070, 0}, {0x2074, 0x2079, 4}, {0x2080, 0x2089, 0},
              {0xFF10, 0xFF19, 0}};
  size_t at = 0;
  for (const auto& run : runs) {
    for (uint32_t c = run.first; c <= run.last; ++c, ++at) {
      ASSERT_LT(at, std::size(LXDigits));
      EXPECT_EQ(LXDigits[at][0], c);
      EXPECT_EQ(LXDigits[at][1], '0' + run.value + c - run.first) << std::hex << c;
    }
  }
  EXPECT_EQ(at, std::size(LXDigits));
  for (const TypeTable& table : kTypes) {
    for (uint32_t c = table.first; c <= table.last; ++c) {
      bool listed =
          std::any_of(std::begin(LXDigits), std::end(LXDigits), [c](const auto& pair) { return pair[0] == c; });
      EXPECT_EQ((type(c) & LX_CT_DIGIT) != 0, listed) << std::hex << c;
    }
  }
}

}  // namespace
