// SPDX-License-Identifier: Apache-2.0
// The exported tables of character types, case, width and digits, with the rules between them. That each character has
// what it should have, other tests ask the C library.
#include "lexaro/lexaro.h"

#include <gtest/gtest.h>

#include <map>

#include "codepage/unicode_rules.hpp"

namespace lx::test {
namespace {

using Changes = std::map<uint16_t, uint16_t>;
using Map = uint16_t (*)(uint16_t);

constexpr uint32_t kUnassigned = 0x400;

// Ten bits of classes, eleven of directions, eleven of forms; also the ends of every table and run.
TEST(UnicodeTables, Types) {
  const std::pair<uint16_t, uint32_t> cases[] = {
      {0x0000, 0x00200300}, {0x0009, 0x000803C0}, {0x000A, 0x00040340}, {0x0024, 0x02008220}, {0x002C, 0x00020220},
      {0x002F, 0x00004220}, {0x0060, 0x02A00220}, {0x00A0, 0x000200C0}, {0x00D7, 0x02200020}, {0x01C5, 0x00000807},
      {0x05B4, 0x01E00000}, {0x0640, 0x80001001}, {0x06F9, 0x00002008}, {0x0901, 0x00600000}, {0x0EDD, 0x00000801},
      {0x10A0, 0x00000803}, {0x11F9, 0x00000801}, {0x1E00, 0x00000803}, {0x21FF, 0x00000400}, {0x22F2, 0x00000400},
      {0x27BE, 0x02200020}, {0x3000, 0x201000C0}, {0x3007, 0x40000800}, {0x309B, 0x0EA00020}, {0x33FE, 0x02000820},
      {0xFB00, 0x00000805}, {0xFBD2, 0x00000400}, {0xFD3E, 0x00200020}, {0xFF71, 0x14000801}, {0xFFFF, 0x00000400},
      {0x06FA, 0x00000400}, {0x2200, 0x02200020}, {0x2213, 0x02008020}, {0x221E, 0x00200020}, {0x22F1, 0x02200020},
      {0x4E00, 0x40000801}, {0x9FA5, 0x40000801}, {0x9FA6, 0x00000400}, {0xAC00, 0x00000801}, {0xD7A3, 0x00000801},
      {0xF900, 0x40000801}, {0xFA2D, 0x40000801}, {0xFBD3, 0x00001001}, {0xFBE9, 0x00000400}, {0xFD3D, 0x00001001},
  };
  for (auto [c, type] : cases) EXPECT_EQ(type_of(c), type) << std::hex << c;
}

TEST(UnicodeTables, EveryCharacterHasOneDirection) {
  for (uint16_t c = 0; c < 0xFFFF; ++c) {
    uint32_t direction = type_of(c) & 0x3FFC00;
    EXPECT_TRUE(direction != 0 && (direction & (direction - 1)) == 0) << std::hex << c;
    EXPECT_EQ(direction == kUnassigned, type_of(c) == kUnassigned) << std::hex << c;
  }
}

bool has(uint16_t c, uint32_t bit) { return (type_of(c) & bit) != 0; }

// A character changes case only if its type says so, and becomes one of the other case.
TEST(UnicodeTables, CaseAgreesWithTypes) {
  for (uint16_t c = 0; c < 0xFFFF; ++c) {
    const uint16_t lower = to_lower(c), upper = to_upper(c);
    EXPECT_TRUE(lower == c || (has(c, LX_CT_UPPER) && has(lower, LX_CT_LOWER))) << std::hex << c;
    EXPECT_TRUE(upper == c || (has(c, LX_CT_LOWER) && has(upper, LX_CT_UPPER))) << std::hex << c;
  }
}

// Characters that do not come back: where they end instead.
Changes one_way(Map there, Map back) {
  Changes lost;
  for (uint16_t c = 0; c < 0xFFFF; ++c) {
    if (there(c) != c && back(there(c)) != c) lost[c] = back(there(c));
  }
  return lost;
}

// Title case letters end as capitals, dotted and dotless i, long s and variants of Greek letters as plain ones.
// Georgian has no capitals but in old texts.
TEST(UnicodeTables, CaseGoesBothWays) {
  Changes from_capitals = {{0x0130, 'I'}, {0x01C5, 0x01C4}, {0x01C8, 0x01C7}, {0x01CB, 0x01CA}, {0x01F2, 0x01F1}};
  for (uint16_t c = 0x10A0; c <= 0x10C5; ++c) from_capitals[c] = static_cast<uint16_t>(c + 48);
  EXPECT_EQ(one_way(to_lower, to_upper), from_capitals);
  const Changes from_small = {{0x0131, 'i'},    {0x017F, 's'},    {0x01C5, 0x01C6}, {0x01C8, 0x01C9}, {0x01CB, 0x01CC},
                              {0x01F2, 0x01F3}, {0x03C2, 0x03C3}, {0x03D0, 0x03B2}, {0x03D1, 0x03B8}, {0x03D5, 0x03C6},
                              {0x03D6, 0x03C0}, {0x03F0, 0x03BA}, {0x03F1, 0x03C1}, {0x1E9B, 0x1E61}, {0x1FBE, 0x03B9}};
  EXPECT_EQ(one_way(to_upper, to_lower), from_small);
}

TEST(UnicodeTables, Width) {
  const Changes full_forms = {{0x00A2, 0xFFE0}, {0x00AF, 0xFFE3}, {0x20A9, 0xFFE6}, {0xFF61, 0x3002}, {0xFF70, 0x30FC},
                              {0xFF9F, 0x309C}, {0xFFA0, 0x3164}, {0xFFDC, 0x3163}, {0xFFE8, 0x2502}, {0xFFEE, 0x25CB}};
  for (auto [half, full] : full_forms) EXPECT_EQ(half_to_full(half), full) << std::hex << half;
  EXPECT_EQ(one_way(half_to_full, full_to_half), Changes{});
  const Changes combining = {{0x3099, 0x309B}, {0x309A, 0x309C}};  // the voice marks become the spacing ones
  EXPECT_EQ(one_way(full_to_half, half_to_full), combining);
  for (uint16_t c = 0xFF61; c <= 0xFFEE; ++c) {
    EXPECT_EQ(half_to_full(c) != c, has(c, 1u << 28)) << std::hex << c;
  }
}

// Ten of each script in their order, but for Latin signs, which have gaps, and Tamil, which has no zero.
TEST(UnicodeTables, Digits) {
  const Changes firsts = {{0x00B2, '2'}, {0x00B9, '1'}, {0x0BE7, '1'}, {0x2074, '4'}};
  Changes values;
  for (const auto& [digit, value] : LXDigits) {
    EXPECT_TRUE(values.empty() || digit > values.rbegin()->first) << std::hex << digit;
    const auto before = static_cast<uint16_t>(digit - 1);
    const int first = firsts.contains(digit) ? firsts.at(digit) : '0';
    EXPECT_EQ(value, values.contains(before) ? values[before] + 1 : first) << std::hex << digit;
    EXPECT_LE(value, '9');
    values[digit] = value;
  }
  for (uint16_t c = 0; c < 0xFFFF; ++c) {
    const bool digit = values.contains(c) && type_of(c) != kUnassigned;  // Tibetan ones have no type
    EXPECT_EQ(has(c, LX_CT_DIGIT), digit) << std::hex << c;
  }
}

}  // namespace
}  // namespace lx::test
