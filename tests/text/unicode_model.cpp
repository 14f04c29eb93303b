// SPDX-License-Identifier: Apache-2.0
#include "text/text_functions.hpp"

#include <lexaro/lexaro.h>

#include <vector>

namespace lx::test {
namespace {

struct Add {
  uint32_t first, last;
  int32_t add;
};
struct Table {
  uint32_t first, last;
  const uint16_t* rows;
  uint32_t origin;
};
struct Rules {
  std::vector<Add> ranges;
  std::vector<Table> tables;

  uint16_t operator()(uint32_t c) const {
    for (auto [first, last, rows, origin] : tables) {
      if (c >= first && c <= last) return rows[c - origin];
    }
    for (auto [first, last, add] : ranges) {
      if (c >= first && c <= last) return static_cast<uint16_t>(static_cast<int32_t>(c) + add);
    }
    return static_cast<uint16_t>(c);
  }
};

const Rules kLower = {{{0x41, 0x5A, 32},
                       {0xC0, 0xD6, 32},
                       {0xD8, 0xDE, 32},
                       {0x531, 0x556, 48},
                       {0x10A0, 0x10C5, 48},
                       {0x2160, 0x216F, 16},
                       {0x24B6, 0x24CF, 26},
                       {0xFF21, 0xFF3A, 32}},
                      {{0x100, 0x1FE, LX_UNICODE_Lower1, 0x100},
                       {0x200, 0x275, LX_UNICODE_Lower2, 0x200},
                       {0x386, 0x3EE, LX_UNICODE_Lower3, 0x380},
                       {0x401, 0x4F8, LX_UNICODE_Lower4, 0x400},
                       {0x1E00, 0x1EF8, LX_UNICODE_Lower5, 0x1E00},
                       {0x1F08, 0x1FFC, LX_UNICODE_Lower6, 0x1F00}}};
const Rules kUpper = {{{0x61, 0x7A, -32},
                       {0xE0, 0xF6, -32},
                       {0xF8, 0xFE, -32},
                       {0xFF, 0xFF, 0x178 - 0xFF},
                       {0x561, 0x586, -48},
                       {0x2170, 0x217F, -16},
                       {0x24D0, 0x24E9, -26},
                       {0xFF41, 0xFF5A, -32}},
                      {{0x101, 0x1FF, LX_UNICODE_Upper1, 0x100},
                       {0x200, 0x292, LX_UNICODE_Upper2, 0x200},
                       {0x3AC, 0x3F1, LX_UNICODE_Upper3, 0x3A0},
                       {0x430, 0x4F9, LX_UNICODE_Upper4, 0x430},
                       {0x1E01, 0x1EF9, LX_UNICODE_Upper5, 0x1E00},
                       {0x1F00, 0x1FF3, LX_UNICODE_Upper6, 0x1F00}}};
const Rules kFull = {{{0x20, 0x20, 0x3000 - 0x20}, {0x21, 0x7E, 0xFEE0}, {0x20A9, 0x20A9, 0xFFE6 - 0x20A9}},
                     {{0xA2, 0xAF, LX_UNICODE_H2F1, 0xA0}, {0xFF61, 0xFFEE, LX_UNICODE_H2F2, 0xFF60}}};
const Rules kHalf = {{{0xFF01, 0xFF5E, -0xFEE0}, {0x2190, 0x2193, 0xFFE9 - 0x2190}},
                     {{0x2502, 0x25CB, LX_UNICODE_F2H1, 0x2500},
                      {0x3000, 0x30FC, LX_UNICODE_F2H2, 0x3000},
                      {0x3131, 0x3164, LX_UNICODE_F2H3, 0x3130},
                      {0xFFE0, 0xFFE6, LX_UNICODE_F2H4, 0xFFE0}}};

struct Words {
  uint32_t first, last;
  const uint32_t* rows;
};
const Words kTypeTables[] = {{0x0000, 0x06F9, LX_UNICODE_Ctype1}, {0x0901, 0x0EDD, LX_UNICODE_Ctype2},
                             {0x10A0, 0x11F9, LX_UNICODE_Ctype3}, {0x1E00, 0x21FF, LX_UNICODE_Ctype4},
                             {0x22F2, 0x27BE, LX_UNICODE_Ctype5}, {0x3000, 0x33FE, LX_UNICODE_Ctype6},
                             {0xFB00, 0xFBD2, LX_UNICODE_Ctype7}, {0xFD3E, 0xFFFF, LX_UNICODE_Ctype8}};
constexpr uint32_t kUnassigned = 0x400;
struct Range {
  uint32_t first, last, word;
};
const Range kTypeRanges[] = {{0x2212, 0x2213, 0x2008020},   {0x221E, 0x221E, 0x200020},    {0x2200, 0x22F1, 0x2200020},
                             {0x4E00, 0x9FA5, 0x40000801},  {0xAC00, 0xD7A3, 0x801},       {0xF900, 0xFA2D, 0x40000801},
                             {0xFBE9, 0xFBE9, kUnassigned}, {0xFCE1, 0xFCE1, kUnassigned}, {0xFBD3, 0xFD3D, 0x1001}};

}  // namespace

uint32_t type_model(uint32_t c) {
  for (auto [first, last, rows] : kTypeTables) {
    if (c >= first && c <= last) return rows[c - first];
  }
  for (auto [first, last, word] : kTypeRanges) {
    if (c >= first && c <= last) return word;
  }
  return kUnassigned;
}

uint16_t lower_model(uint32_t c) { return kLower(c); }
uint16_t upper_model(uint32_t c) { return kUpper(c); }
uint16_t full_model(uint32_t c) { return kFull(c); }
uint16_t half_model(uint32_t c) { return kHalf(c); }

uint16_t digit_model(uint32_t c) {
  for (const auto& [digit, ascii] : LXDigits) {
    if (digit == c) return ascii;
  }
  return 0;
}

}  // namespace lx::test
