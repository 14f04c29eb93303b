// SPDX-License-Identifier: Apache-2.0
#include "text_mapping/unicode_model.hpp"

#include <lexaro/lexaro.h>

#include <vector>

namespace lx::test {
namespace {

// The first rule that covers a character holds: a table that begins with `origin`, or something added.
struct Rule {
  uint32_t first, last;
  const uint16_t* table;
  uint32_t origin;
  int32_t add = 0;
};
constexpr const uint16_t* kAdd = nullptr;

const std::vector<Rule> kLower = {
    {0x41, 0x5A, kAdd, 0, 32},
    {0xD7, 0xD7, kAdd, 0, 0},
    {0xC0, 0xDE, kAdd, 0, 32},
    {0x100, 0x1FE, LX_UNICODE_Lower1, 0x100},
    {0x200, 0x275, LX_UNICODE_Lower2, 0x200},
    {0x386, 0x3EE, LX_UNICODE_Lower3, 0x380},
    {0x401, 0x4F8, LX_UNICODE_Lower4, 0x400},
    {0x531, 0x556, kAdd, 0, 48},
    {0x10A0, 0x10C5, kAdd, 0, 48},
    {0x1E00, 0x1EF8, LX_UNICODE_Lower5, 0x1E00},
    {0x1F08, 0x1FFC, LX_UNICODE_Lower6, 0x1F00},
    {0x2160, 0x216F, kAdd, 0, 16},
    {0x24B6, 0x24CF, kAdd, 0, 26},
    {0xFF21, 0xFF3A, kAdd, 0, 32},
};
const std::vector<Rule> kUpper = {
    {0x61, 0x7A, kAdd, 0, -32},
    {0xF7, 0xF7, kAdd, 0, 0},
    {0xE0, 0xFE, kAdd, 0, -32},
    {0xFF, 0xFF, kAdd, 0, 0x178 - 0xFF},
    {0x101, 0x1FF, LX_UNICODE_Upper1, 0x100},
    {0x200, 0x292, LX_UNICODE_Upper2, 0x200},
    {0x3AC, 0x3F1, LX_UNICODE_Upper3, 0x3A0},
    {0x430, 0x4F9, LX_UNICODE_Upper4, 0x430},
    {0x561, 0x586, kAdd, 0, -48},
    {0x1E01, 0x1EF9, LX_UNICODE_Upper5, 0x1E00},
    {0x1F00, 0x1FF3, LX_UNICODE_Upper6, 0x1F00},
    {0x2170, 0x217F, kAdd, 0, -16},
    {0x24D0, 0x24E9, kAdd, 0, -26},
    {0xFF41, 0xFF5A, kAdd, 0, -32},
};
const std::vector<Rule> kFull = {
    {0x20, 0x20, kAdd, 0, 0x3000 - 0x20},      {0x21, 0x7E, kAdd, 0, 0xFEE0},
    {0xA2, 0xAF, LX_UNICODE_H2F1, 0xA0},       {0x20A9, 0x20A9, kAdd, 0, 0xFFE6 - 0x20A9},
    {0xFF61, 0xFFEE, LX_UNICODE_H2F2, 0xFF60},
};
const std::vector<Rule> kHalf = {
    {0xFF01, 0xFF5E, kAdd, 0, -0xFEE0},        {0x2190, 0x2193, kAdd, 0, 56921},
    {0x2502, 0x25CB, LX_UNICODE_F2H1, 0x2500}, {0x3000, 0x30FC, LX_UNICODE_F2H2, 0x3000},
    {0x3131, 0x3164, LX_UNICODE_F2H3, 0x3130}, {0xFFE0, 0xFFE6, LX_UNICODE_F2H4, 0xFFE0},
};

uint16_t apply(const std::vector<Rule>& rules, uint32_t c) {
  for (const Rule& rule : rules) {
    if (c < rule.first || c > rule.last) continue;
    return rule.table != kAdd ? rule.table[c - rule.origin] : static_cast<uint16_t>(static_cast<int32_t>(c) + rule.add);
  }
  return static_cast<uint16_t>(c);
}

struct TypeRule {
  uint32_t first, last, word;
  const uint32_t* table = nullptr;
};
const std::vector<TypeRule> kTypes = {
    {0x0000, 0x06F9, 0, LX_UNICODE_Ctype1},
    {0x06FA, 0x0900, 1024},
    {0x0901, 0x0EDD, 0, LX_UNICODE_Ctype2},
    {0x0EDE, 0x109F, 1024},
    {0x10A0, 0x11F9, 0, LX_UNICODE_Ctype3},
    {0x11FA, 0x1DFF, 1024},
    {0x1E00, 0x21FF, 0, LX_UNICODE_Ctype4},
    {0x2212, 0x2213, 0x2008020},
    {0x221E, 0x221E, 0x200020},
    {0x2200, 0x22F1, 0x2200020},
    {0x22F2, 0x27BE, 0, LX_UNICODE_Ctype5},
    {0x27BF, 0x2FFF, 1024},
    {0x3000, 0x33FE, 0, LX_UNICODE_Ctype6},
    {0x33FF, 0x4DFF, 1024},
    {0x4E00, 0x9FA5, 0x40000801},
    {0x9FA6, 0xABFF, 1024},
    {0xAC00, 0xD7A3, 2049},
    {0xD7A4, 0xF8FF, 1024},
    {0xF900, 0xFA2D, 0x40000801},
    {0xFA2E, 0xFAFF, 1024},
    {0xFB00, 0xFBD2, 0, LX_UNICODE_Ctype7},
    {0xFBE9, 0xFBE9, 1024},
    {0xFCE1, 0xFCE1, 1024},
    {0xFBD3, 0xFD3D, 4097},
    {0xFD3E, 0xFFFF, 0, LX_UNICODE_Ctype8},
};

}  // namespace

uint32_t type_model(uint32_t c) {
  for (const TypeRule& rule : kTypes) {
    if (c >= rule.first && c <= rule.last) return rule.table != nullptr ? rule.table[c - rule.first] : rule.word;
  }
  return 0;
}

uint16_t lower_model(uint32_t c) { return apply(kLower, c); }
uint16_t upper_model(uint32_t c) { return apply(kUpper, c); }
uint16_t full_model(uint32_t c) { return apply(kFull, c); }
uint16_t half_model(uint32_t c) { return apply(kHalf, c); }

uint16_t digit_model(uint32_t c) {
  for (const auto& [digit, ascii] : LXDigits) {
    if (digit == c) return ascii;
  }
  return 0;
}

}  // namespace lx::test
