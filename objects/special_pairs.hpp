// SPDX-License-Identifier: Apache-2.0
// The list of special pairs of a language for one direction of case mapping.
#pragma once

#include "objects/entry.hpp"

namespace lx {

class SpecialPairs {
 public:
  // Empty when the language has no such list, or the entry is no loaded language. `slot`: kUpper- or kLowerSpecialSlot.
  SpecialPairs(const LXObjEntry* language, uint32_t slot);

  bool empty() const { return count_ == 0; }
  // Cheap and rarely true for characters that begin no pair.
  bool may_begin(uint16_t character) const { return (beginnings_ >> (character & 63) & 1) != 0; }
  // Null: not listed. key2 0: the first character stands alone.
  const SpecialPair* find(uint16_t key1, uint16_t key2) const {
    for (const SpecialPair* pair = pairs_; pair != pairs_ + count_; ++pair) {
      if (pair->key1 == key1 && pair->key2 == key2) return pair;
    }
    return nullptr;
  }

 private:
  const SpecialPair* pairs_ = nullptr;
  uint32_t count_ = 0;
  uint64_t beginnings_ = 0;
};

}  // namespace lx
