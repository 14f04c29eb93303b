// SPDX-License-Identifier: Apache-2.0
// Section 2: the walk from bytes to Unicode.
#include <algorithm>

#include "pack_code_page.hpp"
#include "pack_pool.hpp"

namespace lx::compiler {

namespace {

using Tree = ByteTree<uint16_t>;

Tree multibyte_tree(const CodePage& page) {
  Tree tree;
  for (auto [code, unicode] : page.to_unicode) {
    if (code_length(code) > 1) tree.insert(code, unicode);
  }
  return tree;
}

uint16_t index16(size_t index) {
  if (index > 0xFFFF) throw PackError("the to-Unicode tables are too large");
  return static_cast<uint16_t>(index);
}

std::string array_bytes(Pool& pool) {
  std::string bytes;
  for (uint64_t value : pool.take(kUnassigned)) bytes += bytes_of(BeU16(static_cast<uint16_t>(value)));
  return bytes;
}

// The current layout: every state has bounds, so that rows hold only what lies between their first and last character.
class StateTable {
 public:
  explicit StateTable(const Tree& tree) {
    states_.resize(1);
    place(tree, 0);
    place_rows();
  }

  ToUnicodeSection section() {
    ToUnicodeSection result;
    for (const ToUnicodeState& state : states_) result.bytes += bytes_of(state);
    result.array_offset = index16(result.bytes.size());
    result.bytes += array_bytes(pool_);
    return result;
  }

 private:
  struct Row {
    size_t slot;
    const std::map<uint8_t, uint16_t>* characters;
    size_t length() const { return characters->rbegin()->first - characters->begin()->first + 1u; }
  };
  // Bounds that no byte meets.
  static constexpr ToUnicodeState kUnused = {1, 0, 255, 0, 0};

  void place(const Tree& node, size_t slot) {
    if (!node.leaves.empty()) {
      rows_.push_back({slot, &node.leaves});
      return;
    }
    uint8_t low = node.branches.begin()->first;
    uint8_t high = node.branches.rbegin()->first;
    uint8_t mask = narrowest_mask(low, high);
    // The index is the place of a byte 0 that need not exist, but it cannot be negative.
    size_t start = std::max(states_.size(), size_t{low} & mask);
    states_.resize(start + high - low + 1, kUnused);
    states_[slot] = {0, mask, low, high, index16(start - (low & mask))};
    for (const auto& [byte, branch] : node.branches) place(*branch, start + byte - low);
  }

  void place_rows() {
    std::stable_sort(rows_.begin(), rows_.end(), [](const Row& a, const Row& b) { return a.length() > b.length(); });
    for (const Row& row : rows_) {
      uint8_t low = row.characters->begin()->first;
      uint8_t high = row.characters->rbegin()->first;
      uint8_t mask = narrowest_mask(low, high);
      std::vector<uint64_t> values(row.length(), kUnassigned);
      for (auto [byte, unicode] : *row.characters) values[size_t{byte} - low] = unicode;
      size_t position = pool_.place(values, low & mask);
      states_[row.slot] = {1, mask, low, high, index16(position - (low & mask))};
    }
  }

  std::vector<ToUnicodeState> states_;
  std::vector<Row> rows_;
  Pool pool_;
};

// The older layout has no bounds: every table answers all 128 values that its mask lets through.
ToUnicodeSection pack_version1(const Tree& tree) {
  constexpr uint8_t kMask = 0x7F;
  auto upper_half = [](uint8_t byte) { return byte > kMask; };
  Pool pool;
  ToUnicodeStateV1 unused = {1, 0, index16(pool.place({kUnassigned}, 0))};
  std::vector<ToUnicodeStateV1> states(1 + kMask + 1, unused);
  states[0] = {0, kMask, 1};
  for (const auto& [lead, branch] : tree.branches) {
    std::vector<uint64_t> row(kMask + 1, kUnassigned);
    bool possible = upper_half(lead) && branch->branches.empty();
    for (auto [byte, unicode] : branch->leaves) {
      possible = possible && upper_half(byte);
      row[byte & kMask] = unicode;
    }
    if (!possible) throw PackError("the version-1 layout holds only one byte, or two bytes of 80 and above");
    states[1u + (lead & kMask)] = {1, kMask, index16(pool.place(row, 0))};
  }
  ToUnicodeSection result;
  for (const ToUnicodeStateV1& state : states) result.bytes += bytes_of(state);
  result.array_offset = index16(result.bytes.size());
  result.bytes += array_bytes(pool);
  return result;
}

}  // namespace

ToUnicodeSection pack_to_unicode(const CodePage& page, Layout layout) {
  Tree tree = multibyte_tree(page);
  return layout == Layout::current ? StateTable(tree).section() : pack_version1(tree);
}

}  // namespace lx::compiler
