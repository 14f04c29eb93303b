// SPDX-License-Identifier: Apache-2.0
// The weights of a sort object, field by field as the file holds them.
#pragma once

#include <array>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "objects/sort_format.hpp"

namespace lx::compiler {

// A primary weight below 0x0100 would look like the end of a level in a sort key; the next ones are left free.
inline constexpr uint16_t kFirstPrimary = 0x0200;
inline constexpr uint8_t kForwardMask = 15;  // all four levels in text order
inline constexpr uint8_t kBackwardSecondaryMask = 11;

struct SortEntry {
  uint16_t weight = 0;  // primary, or special
  uint8_t secondary = 0, tertiary = 0;
  bool special = false, expands = false;
  uint8_t mask = kForwardMask;
};
using SortTable = std::array<SortEntry, 256>;

enum class SortPageKind { empty, table, primary, special };

struct SortPageRule {
  SortPageKind kind = SortPageKind::empty;
  uint8_t mask = 0;   // the last two are for pages without table
  uint16_t base = 0;  // weight of the page's first character
};

struct SortSet {
  uint16_t primary = 0;
  uint8_t secondary = 0, tertiary = 0;
};

struct SortExpansionRow {
  uint16_t character = 0;
  SortSet sets[2];
};

struct SortPairRow {
  uint16_t first = 0, second = 0;
  SortEntry weights;
};

struct SortObject {
  uint8_t default_secondary = 1, default_tertiary = 1;
  std::array<SortPageRule, 256> pages = {};
  std::map<unsigned, SortTable> tables;  // by page
  std::vector<SortExpansionRow> expansions;
  std::vector<SortPairRow> pairs;
};

// Section 1 of the object; throws PackError.
std::string pack_sort(const SortObject& sort);
// The reverse; throws StructureError when the section does not keep to the format.
SortObject unpack_sort(std::string_view section);

}  // namespace lx::compiler
