// SPDX-License-Identifier: Apache-2.0
// Section 1 of a sort object as it stands in the file.
#pragma once

#include <cstddef>

#include "frame/big_endian.hpp"

namespace lx {

struct SortPage {
  uint8_t flags;
  uint8_t mask;  // of the characters of an algorithmic page
  BeU16 value;   // tabulated: number of the page's first weight entry; algorithmic: base weight
};
static_assert(sizeof(SortPage) == 4);

inline constexpr uint8_t kSortPageEmpty = 0x01;
inline constexpr uint8_t kSortPagePrimary = 0x02;  // primary weights by rule
inline constexpr uint8_t kSortPageSpecial = 0x04;  // special weights by rule

struct SortHeader {
  uint8_t default_secondary;
  uint8_t default_tertiary;
  BeU16 expansion_count;
  BeU16 combination_count;
  SortPage pages[256];
  BeU16 weights;
  BeU16 expansions;
  BeU16 combinations;
};
static_assert(sizeof(SortHeader) == 1036 && offsetof(SortHeader, pages) == 6 && offsetof(SortHeader, weights) == 1030);

// Flags of weight and combination entries.
inline constexpr uint16_t kWeightIsSpecial = 0x8000;
inline constexpr uint16_t kWeightExpands = 0x4000;
inline constexpr unsigned kWeightMaskShift = 10;  // of the four mask bits

struct SortWeight {
  BeU16 weight;  // primary, or special
  uint8_t secondary;
  uint8_t tertiary;
  BeU16 flags;
};
static_assert(sizeof(SortWeight) == 6);

struct SortExpansion {
  BeU16 character;
  BeU16 primary1;
  uint8_t secondary1;
  uint8_t tertiary1;
  BeU16 primary2;
  uint8_t secondary2;
  uint8_t tertiary2;
  uint8_t unused[4];
};
static_assert(sizeof(SortExpansion) == 14);

struct SortCombination {
  BeU16 first;
  BeU16 second;
  SortWeight weight;
};
static_assert(sizeof(SortCombination) == 10);

}  // namespace lx
