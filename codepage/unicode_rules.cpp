// SPDX-License-Identifier: Apache-2.0
#include "codepage/unicode_rules.hpp"

#include <algorithm>
#include <iterator>

#include "frame/call.hpp"

namespace lx {
namespace {

// A run of characters of the same rule: a table that begins at `origin`, or one value for all of them.
template <class Value>
struct Range {
  uint16_t first;
  uint16_t last;
  Value value;
  uint16_t origin = 0;
  const Value* table = nullptr;
};

// Ranges in ascending order, found by the high byte of the character.
template <class Value, size_t kCount>
class Ranges {
 public:
  constexpr explicit Ranges(const Range<Value> (&ranges)[kCount]) : ranges_(ranges) {
    static_assert(kCount < 256);
    uint8_t range = 0;
    for (unsigned high = 0; high < 256; ++high) {
      while (range < kCount && ranges[range].last < high << 8) ++range;
      begin_[high] = range;
    }
  }

  // Null: no rule for it.
  const Range<Value>* find(uint16_t character) const {
    for (size_t range = begin_[character >> 8]; range < kCount && ranges_[range].first <= character; ++range) {
      if (character <= ranges_[range].last) return &ranges_[range];
    }
    return nullptr;
  }

 private:
  const Range<Value> (&ranges_)[kCount];
  uint8_t begin_[256] = {};  // the first range that does not end before the 256 characters
};

using TypeRange = Range<uint32_t>;
constexpr uint32_t kIdeograph = 0x40000801;
constexpr uint32_t kSyllable = 0x801;
constexpr uint32_t kArabicForm = 0x1001;
constexpr uint32_t kOperator = 0x2200020;

constexpr TypeRange kTypeRanges[] = {
    {0x0000, 0x06F9, 0, 0x0000, LX_UNICODE_Ctype1},
    {0x0901, 0x0EDD, 0, 0x0901, LX_UNICODE_Ctype2},
    {0x10A0, 0x11F9, 0, 0x10A0, LX_UNICODE_Ctype3},
    {0x1E00, 0x21FF, 0, 0x1E00, LX_UNICODE_Ctype4},
    {0x2200, 0x2211, kOperator},
    {0x2212, 0x2213, 0x2008020},  // minus sign, minus-or-plus sign
    {0x2214, 0x221D, kOperator},
    {0x221E, 0x221E, 0x200020},  // infinity
    {0x221F, 0x22F1, kOperator},
    {0x22F2, 0x27BE, 0, 0x22F2, LX_UNICODE_Ctype5},
    {0x3000, 0x33FE, 0, 0x3000, LX_UNICODE_Ctype6},
    {0x4E00, 0x9FA5, kIdeograph},
    {0xAC00, 0xD7A3, kSyllable},
    {0xF900, 0xFA2D, kIdeograph},
    {0xFB00, 0xFBD2, 0, 0xFB00, LX_UNICODE_Ctype7},
    {0xFBD3, 0xFBE8, kArabicForm},
    {0xFBEA, 0xFCE0, kArabicForm},
    {0xFCE2, 0xFD3D, kArabicForm},
    {0xFD3E, 0xFFFF, 0, 0xFD3E, LX_UNICODE_Ctype8},
};
constexpr Ranges kTypes(kTypeRanges);
constexpr uint32_t kNoType = 1024;

// The value is added to the character.
using FormRange = Range<uint16_t>;
constexpr uint16_t minus(uint16_t value) { return static_cast<uint16_t>(0x10000 - value); }

constexpr FormRange kLowerRanges[] = {
    {0x0041, 0x005A, 32},
    {0x00C0, 0x00D6, 32},
    {0x00D8, 0x00DE, 32},
    {0x0100, 0x01FE, 0, 0x0100, LX_UNICODE_Lower1},
    {0x0200, 0x0275, 0, 0x0200, LX_UNICODE_Lower2},
    {0x0386, 0x03EE, 0, 0x0380, LX_UNICODE_Lower3},
    {0x0401, 0x04F8, 0, 0x0400, LX_UNICODE_Lower4},
    {0x0531, 0x0556, 48},
    {0x10A0, 0x10C5, 48},
    {0x1E00, 0x1EF8, 0, 0x1E00, LX_UNICODE_Lower5},
    {0x1F08, 0x1FFC, 0, 0x1F00, LX_UNICODE_Lower6},
    {0x2160, 0x216F, 16},
    {0x24B6, 0x24CF, 26},
    {0xFF21, 0xFF3A, 32},
};
constexpr Ranges kLower(kLowerRanges);

// Georgian has no way back: its small letters are the usual ones.
constexpr FormRange kUpperRanges[] = {
    {0x0061, 0x007A, minus(32)},
    {0x00E0, 0x00F6, minus(32)},
    {0x00F8, 0x00FE, minus(32)},
    {0x00FF, 0x00FF, 0x0178 - 0x00FF},
    {0x0101, 0x01FF, 0, 0x0100, LX_UNICODE_Upper1},
    {0x0200, 0x0292, 0, 0x0200, LX_UNICODE_Upper2},
    {0x03AC, 0x03F1, 0, 0x03A0, LX_UNICODE_Upper3},
    {0x0430, 0x04F9, 0, 0x0430, LX_UNICODE_Upper4},
    {0x0561, 0x0586, minus(48)},
    {0x1E01, 0x1EF9, 0, 0x1E00, LX_UNICODE_Upper5},
    {0x1F00, 0x1FF3, 0, 0x1F00, LX_UNICODE_Upper6},
    {0x2170, 0x217F, minus(16)},
    {0x24D0, 0x24E9, minus(26)},
    {0xFF41, 0xFF5A, minus(32)},
};
constexpr Ranges kUpper(kUpperRanges);

constexpr uint16_t kAsciiToFull = 0xFEE0;
constexpr FormRange kFullRanges[] = {
    {0x0020, 0x0020, 0x3000 - 0x0020},
    {0x0021, 0x007E, kAsciiToFull},
    {0x00A2, 0x00AF, 0, 0x00A0, LX_UNICODE_H2F1},
    {0x20A9, 0x20A9, 0xFFE6 - 0x20A9},
    {0xFF61, 0xFFEE, 0, 0xFF60, LX_UNICODE_H2F2},
};
constexpr Ranges kFull(kFullRanges);

constexpr FormRange kHalfRanges[] = {
    {0x2190, 0x2193, 0xFFE9 - 0x2190},
    {0x2502, 0x25CB, 0, 0x2500, LX_UNICODE_F2H1},
    {0x3000, 0x30FC, 0, 0x3000, LX_UNICODE_F2H2},
    {0x3131, 0x3164, 0, 0x3130, LX_UNICODE_F2H3},
    {0xFF01, 0xFF5E, minus(kAsciiToFull)},
    {0xFFE0, 0xFFE6, 0, 0xFFE0, LX_UNICODE_F2H4},
};
constexpr Ranges kHalf(kHalfRanges);

template <size_t kCount>
uint16_t other_form(const Ranges<uint16_t, kCount>& forms, uint16_t character) {
  const FormRange* range = forms.find(character);
  if (range == nullptr) return character;
  if (range->table != nullptr) return range->table[character - range->origin];
  return static_cast<uint16_t>(character + range->value);
}

}  // namespace

uint32_t type_of(uint16_t character) {
  const TypeRange* range = kTypes.find(character);
  if (range == nullptr) return kNoType;
  return range->table != nullptr ? range->table[character - range->origin] : range->value;
}

uint16_t listed_lower(uint16_t character) { return other_form(kLower, character); }
uint16_t listed_upper(uint16_t character) { return other_form(kUpper, character); }
uint16_t half_to_full(uint16_t character) { return other_form(kFull, character); }
uint16_t full_to_half(uint16_t character) { return other_form(kHalf, character); }

uint16_t ascii_digit(uint16_t character) {
  if (character >= '0' && character <= '9') return character;
  const auto* found = std::lower_bound(std::begin(LXDigits), std::end(LXDigits), character,
                                       [](const uint16_t(&row)[2], uint16_t key) { return row[0] < key; });
  return found != std::end(LXDigits) && (*found)[0] == character ? (*found)[1] : uint16_t{0};
}

namespace {

void clear_error(LXLocale* locale) {
  if (LXLocale* meant = locale_or_default(locale); meant != nullptr) meant->last_error = LX_OK;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

LXUChar LXUnicodeToLower(LXLocale* locale, LXUChar ch) noexcept {
  clear_error(locale);
  return to_lower(ch);
}

LXUChar LXUnicodeToUpper(LXLocale* locale, LXUChar ch) noexcept {
  clear_error(locale);
  return to_upper(ch);
}

LXUChar LXUnicodeToH2F(LXLocale*, LXUChar ch) noexcept { return half_to_full(ch); }
LXUChar LXUnicodeToF2H(LXLocale*, LXUChar ch) noexcept { return full_to_half(ch); }

}  // extern "C"
