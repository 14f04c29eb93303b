// SPDX-License-Identifier: Apache-2.0
// The walk from multibyte characters to their types and case partners.
#include <algorithm>

#include "pack_code_page.hpp"
#include "pack_pool.hpp"

namespace lx::compiler {

namespace {

using Tree = ByteTree<uint64_t>;
using Row = std::map<uint8_t, uint64_t>;

constexpr uint64_t packed(uint32_t flags, int64_t delta) {
  return uint64_t{flags} << 32 | static_cast<uint32_t>(delta);
}
constexpr uint64_t kNothing = packed(kUnassignedType, 0);

// The row's elements by masked byte, or nothing when two different ones would fall together.
std::vector<uint64_t> masked_row(const Row& row, unsigned mask) {
  std::vector<uint64_t> elements(mask + 1, Pool::kFree);
  for (auto [byte, entry] : row) {
    uint64_t& element = elements[byte & mask];
    if (element != Pool::kFree && element != entry) return {};
    element = entry;
  }
  return elements;
}

class TypeWalk {
 public:
  explicit TypeWalk(const Tree& tree) {
    pool_.place({kNothing}, 0);
    states_.resize(1, kUnused);
    place(tree, 0, 0xFF);
    place_rows();
  }

  TypeTables tables() {
    TypeTables result;
    for (const TypeState& state : states_) {
      result.states += bytes_of(state);
      if (state.final != 0)
        result.reach = std::max(result.reach, (size_t{state.index} + state.mask + 1) * sizeof(TypeEntry));
    }
    for (uint64_t entry : pool_.take(kNothing)) {
      TypeEntry record{static_cast<uint32_t>(entry >> 32), static_cast<int32_t>(static_cast<uint32_t>(entry))};
      result.entries += bytes_of(record);
    }
    return result;
  }

 private:
  // There are no bounds in this table, so a slot that no character uses must still end the walk.
  static constexpr TypeState kUnused = {1, 0, 0};

  void place(const Tree& node, size_t slot, uint8_t mask) {
    if (!node.leaves.empty()) {
      rows_.emplace_back(slot, &node.leaves);
      return;
    }
    size_t start = states_.size();
    states_.resize(start + mask + 1, kUnused);
    states_[slot] = {0, mask, index16(start)};
    for (const auto& [byte, branch] : node.branches) {
      uint8_t next_mask = 0xFF;
      if (!branch->branches.empty()) {
        next_mask = narrowest_mask(branch->branches.begin()->first, branch->branches.rbegin()->first);
      }
      place(*branch, start + (byte & mask), next_mask);
    }
  }

  void place_rows() {
    std::vector<std::pair<size_t, const Row*>> uneven;
    for (auto [slot, row] : rows_) {
      uint64_t first = row->begin()->second;
      if (std::all_of(row->begin(), row->end(), [first](const auto& entry) { return entry.second == first; })) {
        states_[slot] = {1, 0, index16(pool_.place({first}, 0))};
      } else {
        uneven.emplace_back(slot, row);
      }
    }
    std::stable_sort(uneven.begin(), uneven.end(),
                     [](const auto& a, const auto& b) { return a.second->size() > b.second->size(); });
    for (auto [slot, row] : uneven) place_row(slot, *row);
  }

  void place_row(size_t slot, const Row& row) {
    unsigned mask = 0xFF;
    std::vector<uint64_t> elements = masked_row(row, mask);
    while (mask != 0) {
      std::vector<uint64_t> narrower = masked_row(row, mask >> 1);
      if (narrower.empty()) break;
      elements = std::move(narrower);
      mask >>= 1;
    }
    auto used = [](uint64_t element) { return element != Pool::kFree; };
    auto first = std::find_if(elements.begin(), elements.end(), used);
    auto last = std::find_if(elements.rbegin(), elements.rend(), used).base();
    auto before = static_cast<size_t>(first - elements.begin());
    size_t position = pool_.place({first, last}, before);
    states_[slot] = {1, static_cast<uint8_t>(mask), index16(position - before)};
  }

  static uint16_t index16(size_t index) {
    if (index > 0xFFFF) throw PackError("the character type tables are too large");
    return static_cast<uint16_t>(index);
  }

  std::vector<TypeState> states_;
  std::vector<std::pair<size_t, const Row*>> rows_;
  Pool pool_;
};

}  // namespace

uint64_t type_entry(const CodePage& page, const UnicodeTables& unicode, Code code, uint16_t value) {
  uint32_t flags = unicode.type(value);
  // A titlecase letter is both; one entry has one partner, and comparison folds to upper case.
  if ((flags & kUpper) != 0 && (flags & kLower) != 0) flags &= ~kUpper;
  uint16_t partner = (flags & kLower) != 0   ? unicode.upper(value)
                     : (flags & kUpper) != 0 ? unicode.lower(value)
                                             : value;
  Code partner_code = partner == value ? kNoCode : page.exact_code(partner);
  return packed(flags, partner_code == kNoCode ? 0 : int64_t{partner_code} - int64_t{code});
}

TypeTables pack_types(const CodePage& page, const UnicodeTables& unicode) {
  Tree tree;
  for (auto [code, value] : page.to_unicode) {
    if (code_length(code) > 1) tree.insert(code, type_entry(page, unicode, code, value));
  }
  return TypeWalk(tree).tables();
}

}  // namespace lx::compiler
