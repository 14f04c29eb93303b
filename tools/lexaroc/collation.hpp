// SPDX-License-Identifier: Apache-2.0
// A collation before its weights have numbers, so that rules can put new ones between those of the root.
#pragma once

#include <compare>
#include <cstdint>
#include <map>
#include <set>
#include <vector>

#include "sort_object.hpp"
#include "source_text.hpp"

namespace lx::compiler {

// A primary weight is known by a number that says nothing about its place. 0: none.
using Primary = uint32_t;
// Added to a character of an algorithmic page: the primary weight that its code point gives it.
inline constexpr Primary kByCodePoint = 0x10000;

// A secondary or tertiary weight: its number in the root, and the steps that rules went beyond it.
struct Rank {
  uint16_t number = 1;
  uint16_t step = 0;
  auto operator<=>(const Rank&) const = default;
};

enum class LetterCase : uint8_t { lower, mixed, upper };

struct Tertiary {
  Rank rank;
  LetterCase letter_case = LetterCase::lower;
  auto operator<=>(const Tertiary&) const = default;
};

struct WeightSet {
  Primary primary = 0;
  Rank secondary;
  Tertiary tertiary;
  auto operator<=>(const WeightSet&) const = default;
};
using WeightSets = std::vector<WeightSet>;  // one or two

// The format has room for two sets and for pairs of characters.
inline constexpr size_t kMostSets = 2;

struct Element {
  WeightSets sets;
  Spot spot{0, 0};     // of the rule that gave the weights; line 0 for those of the root
  bool equal = false;  // weighs the same as another one on purpose
};

using CharacterPair = std::pair<uint16_t, uint16_t>;

struct Collation {
  std::vector<unsigned> tabulated;
  std::vector<unsigned> algorithmic;  // in the order of their weights
  // Characters with nothing but a special weight, ascending; those of one group weigh the same.
  std::vector<std::vector<uint16_t>> specials;
  std::vector<Primary> primaries;  // ascending
  std::map<uint16_t, Element> characters;
  std::map<CharacterPair, Element> pairs;
  std::set<uint16_t> capitals;  // tertiary weights of capital letters; the first is that of plain ones
  uint16_t first_mark = 0;      // secondary weights below this one are those of letters, with and without accents
  bool upper_first = false;
  bool backward_secondary = false;

  bool is_tabulated(uint16_t character) const;
  bool is_special(uint16_t character) const;
  void remove_special(uint16_t character);
};

// A character as it stands, or as \uXXXX.
uint16_t read_character(Cursor& cursor);
// "00-06 10", to the end of the line.
std::vector<unsigned> read_pages(Cursor& cursor);
// How messages call what a rule is about.
std::string element_name(const std::u16string& characters);

// Fails at the second of two elements that weigh the same, unless that is meant or both are the root's.
void check_distinct(const Collation& collation);

// Gives the weights their numbers. Throws SourceError at the rule that made one too many.
SortObject number_weights(const Collation& collation);

}  // namespace lx::compiler
