// SPDX-License-Identifier: Apache-2.0
// Collation done slowly: weights looked up in the description of a sort object, levels as lists, keys as strings. It
// shares no code with the library.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "collate/sort_builder.hpp"

namespace lx::test {

struct ModelSet {
  unsigned primary = 0;
  unsigned secondary = 0;
  unsigned tertiary = 0;
  unsigned special = 0;
  bool operator==(const ModelSet&) const = default;
};

struct ModelWeights {
  std::vector<ModelSet> sets = {};  // 0 to 2
  int mask = -1;                    // -1: not told
  bool operator==(const ModelWeights&) const = default;
};

ModelWeights model_weights(const SortSpec& sort, char16_t character);
bool model_combination(const SortSpec& sort, char16_t first, char16_t second, ModelWeights& weights);

// A piece of text as it is stored: a character, or a shift byte. The last one may be cut short by the end.
struct Piece {
  char16_t character = 0;
  int units = 1;  // all that the character has
  bool shift = false;
  uint32_t state = 0;  // behind a shift byte
};
using Pieces = std::vector<Piece>;

// One character after the other, with a look at the one behind it where pairs may combine.
struct ModelReader {
  const SortSpec* sort;
  const Pieces* text;
  int32_t remaining;
  uint32_t state = 0;
  size_t at = 0;
  int offset = 0;  // of the piece, in units
  uint16_t position = 0;
  uint16_t pending = 0xFFFF;

  bool more() const { return remaining > 0 || pending != 0xFFFF; }
  ModelWeights next();

 private:
  void skip_shifts();
  bool read(char16_t& character);
};

// Elements in level order.
template <class Element>
struct ModelLevel {
  std::vector<Element> list;
  size_t insertion = 0;

  void file(const Element& element, bool in_order) {
    if (in_order) {
      list.push_back(element);
      insertion = list.size();
    } else {
      list.insert(list.begin() + static_cast<ptrdiff_t>(insertion), element);
    }
  }
};
struct ModelLevels {
  ModelLevel<unsigned> primary, secondary, tertiary;
  ModelLevel<std::pair<unsigned, unsigned>> special;

  void file(const ModelSet& set, uint16_t position, int mask);
};

std::string model_key(const SortSpec& sort, std::u16string_view text);

struct ModelResult {
  int value = 0;
  bool exact = false;  // otherwise only its sign counts
};
ModelResult model_compare(ModelReader a, ModelReader b);

}  // namespace lx::test
