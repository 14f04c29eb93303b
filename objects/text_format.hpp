// SPDX-License-Identifier: Apache-2.0
// The sections of language and territory objects as they stand in the file. Texts are zero-terminated UCS-2.
#pragma once

#include <cstddef>

#include "frame/big_endian.hpp"

namespace lx {

// Text slots of a language: abbreviation, own name, 7 day names, 7 abbreviated ones, 13 months, 13 abbreviated ones,
// AM and PM. After them, present only when their count is not zero, the two special case lists.
inline constexpr unsigned kLanguageTexts = 44;
inline constexpr unsigned kUpperSpecialSlot = 44;
inline constexpr unsigned kLowerSpecialSlot = 45;

struct LanguageHeader {
  BeU16 default_territory;
  BeU16 default_code_page;
  BeU16 default_sort;
  BeU16 upper_special_count;
  BeU16 lower_special_count;
  BeU16 text_offsets[kLanguageTexts];
};
static_assert(sizeof(LanguageHeader) == 98 && offsetof(LanguageHeader, text_offsets) == 10);

struct SpecialPair {
  BeU16 key1;
  BeU16 key2;  // 0: key1 stands alone
  BeU16 value1;
  BeU16 value2;
};
static_assert(sizeof(SpecialPair) == 8);

// Flag word of a territory.
inline constexpr uint16_t kTerritoryYesNo = 0x01;          // item 58
inline constexpr uint16_t kPositiveSymbolPrecedes = 0x02;  // 73
inline constexpr uint16_t kPositiveSymbolSpaced = 0x04;    // 74
inline constexpr uint16_t kNegativeSymbolPrecedes = 0x08;  // 75
inline constexpr uint16_t kNegativeSymbolSpaced = 0x10;    // 76
inline constexpr uint16_t kYesNo82 = 0x20;
inline constexpr uint16_t kYesNo83 = 0x40;

// The order of the texts of a territory.
enum class TerritoryText : unsigned {
  abbreviation,       // item 7
  own_name,           // 8
  grouping,           // 62
  monetary_grouping,  // 68
  currency,           // 64
  currency_intl,      // 65
  positive_sign,      // 71
  negative_sign,      // 72
  time_format,        // 79
  short_date,         // 80
  long_date,          // 81
};
inline constexpr unsigned kTerritoryTexts = 11;

struct TerritoryHeader {
  BeU16 separators[5];    // items 59, 60, 61, 66, 67: decimal, thousands, third, monetary decimal, monetary thousands
  BeU16 fraction_digits;  // item 63
  BeU16 currency_digits;  // 69
  BeU16 currency_intl_digits;      // 70
  uint8_t positive_sign_position;  // 77
  uint8_t negative_sign_position;  // 78
  BeU16 value84;
  BeU16 flags;
  BeU16 text_offsets[kTerritoryTexts];
};
static_assert(sizeof(TerritoryHeader) == 44 && offsetof(TerritoryHeader, fraction_digits) == 10);
static_assert(offsetof(TerritoryHeader, positive_sign_position) == 16 && offsetof(TerritoryHeader, value84) == 18);
static_assert(offsetof(TerritoryHeader, flags) == 20 && offsetof(TerritoryHeader, text_offsets) == 22);

}  // namespace lx
