// SPDX-License-Identifier: Apache-2.0
// Characters found among others.
#pragma once

#include "collate/arguments.hpp"

namespace lx {

// The characters of a text as a set. Those of one unit below 256 are looked up, longer ones are looked for.
template <class Walker>
class CharacterSet {
 public:
  explicit CharacterSet(Walker members) : members_(members) {
    for (Character character; members.next(character);) {
      if (small(character)) {
        small_[character.code / 64] |= uint64_t{1} << character.code % 64;
      } else {
        large_ = true;
      }
    }
  }
  bool has(const Character& wanted) const {
    if (small(wanted)) return (small_[wanted.code / 64] >> wanted.code % 64 & 1) != 0;
    if (!large_) return false;
    Walker members = members_;
    for (Character character; members.next(character);) {
      if (character == wanted) return true;
    }
    return false;
  }

 private:
  static bool small(const Character& character) { return character.units == 1 && character.code < 256; }

  Walker members_;
  uint64_t small_[4] = {};
  bool large_ = false;
};

}  // namespace lx
