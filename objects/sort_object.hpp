// SPDX-License-Identifier: Apache-2.0
// A sort object as the collating functions read it: its section, checked once, with indexes for what the file wants
// searched from its start.
#pragma once

#include "objects/code_page_check.hpp"
#include "objects/sort_format.hpp"

namespace lx {

// One level after the other; 0: nothing at that level.
struct WeightSet {
  uint16_t primary = 0;
  uint8_t secondary = 0;
  uint8_t tertiary = 0;
  uint16_t special = 0;
};

// What a character, or a pair of them, weighs.
struct Weights {
  WeightSet sets[2];
  uint8_t mask = 0;
  uint8_t count = 0;        // of sets
  bool mask_known = false;  // characters of a page without weights have none
};

// Bits of the mask: the weight of that level stands in text order.
inline constexpr uint8_t kPrimaryInOrder = 8;
inline constexpr uint8_t kSecondaryInOrder = 4;
inline constexpr uint8_t kTertiaryInOrder = 2;
inline constexpr uint8_t kSpecialInOrder = 1;
inline constexpr uint8_t kAllInOrder = 15;

class SortTables {
 public:
  // Weights of a character in one number, for quick comparison: primary, secondary, tertiary, of which none is 0; or a
  // special weight above sixteen zero bits. 0: the character has other weights, or not in text order, or may begin a
  // pair. Objects with pairs have no special weights here, since looking for pairs changes their positions.
  static constexpr unsigned kQuickCharacters = 0x180;
  uint32_t quick[kQuickCharacters];
  static bool is_special(uint32_t weights) { return weights != 0 && (weights & 0xFFFF) == 0; }

  uint8_t default_secondary;
  uint8_t default_tertiary;
  bool ascii_in_order;  // no ASCII character, or pair that one begins, counts from the end

  bool has_combinations() const { return combination_count_ != 0; }
  bool may_begin_combination(uint16_t character) const {
    return (beginnings_[character >> 5 & 7] >> (character & 31) & 1) != 0;
  }
  Weights weights_of(uint16_t character) const;
  // False: the pair is none.
  bool combination_of(uint16_t first, uint16_t second, Weights& weights) const;

 private:
  friend const SortTables* build_sort_tables(const uint8_t* checked_section);

  // By character or pair; of equal ones the first in the file is kept in front.
  struct Index {
    uint32_t key;
    uint32_t number;
  };
  static const Index* find(const Index* index, uint32_t count, uint32_t key);

  const SortHeader* header_;
  const SortWeight* weights_;
  const SortExpansion* expansions_;
  const SortCombination* combinations_;
  uint32_t expansion_count_;
  uint32_t combination_count_;
  uint32_t beginnings_[8];  // a few bits of the characters that begin pairs
  const Index* expansion_index_;
  const Index* combination_index_;
};

// Null, or the name of the first field that is wrong.
const char* check_sort(const SectionBytes& section);

// One block of memory; null: there is none.
const SortTables* build_sort_tables(const uint8_t* checked_section);

}  // namespace lx
