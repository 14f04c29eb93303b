// SPDX-License-Identifier: Apache-2.0
#include "objects/sort_object.hpp"

#include <algorithm>

#include "frame/memory.hpp"

namespace lx {
namespace {

bool fits(const SectionBytes& section, uint32_t offset, uint64_t size) { return offset + size <= section.size; }

bool is_tabulated(const SortPage& page) {
  return (page.flags & (kSortPageEmpty | kSortPagePrimary | kSortPageSpecial)) == 0;
}

uint8_t mask_of(uint16_t flags) { return static_cast<uint8_t>(flags >> kWeightMaskShift & kAllInOrder); }

Weights single(const SortWeight& entry) {
  Weights weights;
  weights.count = 1;
  weights.mask = mask_of(entry.flags);
  weights.mask_known = true;
  if ((entry.flags & kWeightIsSpecial) != 0) {
    weights.sets[0].special = entry.weight;
  } else {
    weights.sets[0] = {entry.weight, entry.secondary, entry.tertiary, 0};
  }
  return weights;
}

}  // namespace

const char* check_sort(const SectionBytes& section) {
  if (section.size < sizeof(SortHeader)) return "section 1 size";
  const auto& header = *reinterpret_cast<const SortHeader*>(section.data);
  for (const SortPage& page : header.pages) {
    if (!is_tabulated(page)) continue;
    if (!fits(section, header.weights, (uint64_t{page.value} + 256) * sizeof(SortWeight))) return "weight table";
  }
  if (!fits(section, header.expansions, uint64_t{header.expansion_count} * sizeof(SortExpansion))) {
    return "expansion table";
  }
  if (!fits(section, header.combinations, uint64_t{header.combination_count} * sizeof(SortCombination))) {
    return "combination table";
  }
  return nullptr;
}

const SortTables::Index* SortTables::find(const Index* index, uint32_t count, uint32_t key) {
  const Index* at =
      std::lower_bound(index, index + count, key, [](const Index& row, uint32_t wanted) { return row.key < wanted; });
  return at != index + count && at->key == key ? at : nullptr;
}

Weights SortTables::weights_of(uint16_t character) const {
  Weights weights;
  const SortPage& page = header_->pages[character >> 8];
  unsigned low = character & 0xFF;
  if ((page.flags & kSortPageEmpty) != 0) return weights;
  weights.mask_known = true;
  if (!is_tabulated(page)) {
    auto weight = static_cast<uint16_t>(page.value + low);
    weights.count = 1;
    weights.mask = page.mask & kAllInOrder;
    ((page.flags & kSortPagePrimary) != 0 ? weights.sets[0].primary : weights.sets[0].special) = weight;
    return weights;
  }
  const SortWeight& entry = weights_[page.value + low];
  if ((entry.flags & kWeightExpands) == 0) return single(entry);
  weights.mask = mask_of(entry.flags);
  const Index* found = find(expansion_index_, expansion_count_, character);
  if (found == nullptr) return weights;
  const SortExpansion& expansion = expansions_[found->number];
  weights.count = 2;
  weights.sets[0] = {expansion.primary1, expansion.secondary1, expansion.tertiary1, 0};
  weights.sets[1] = {expansion.primary2, expansion.secondary2, expansion.tertiary2, 0};
  return weights;
}

bool SortTables::combination_of(uint16_t first, uint16_t second, Weights& weights) const {
  if (!may_begin_combination(first)) return false;
  const Index* found = find(combination_index_, combination_count_, uint32_t{first} << 16 | second);
  if (found == nullptr) return false;
  weights = single(combinations_[found->number].weight);
  return true;
}

static bool weighs(const Weights& weights) {
  return std::any_of(weights.sets, weights.sets + weights.count, [](const WeightSet& set) {
    return set.primary != 0 || set.secondary != 0 || set.tertiary != 0 || set.special != 0;
  });
}

const SortTables* build_sort_tables(const uint8_t* checked_section) {
  using Index = SortTables::Index;
  const auto& header = *reinterpret_cast<const SortHeader*>(checked_section);
  uint32_t expansions = header.expansion_count;
  uint32_t combinations = header.combination_count;
  void* block = allocate(sizeof(SortTables) + (expansions + combinations) * sizeof(Index));
  if (block == nullptr) return nullptr;
  auto* tables = static_cast<SortTables*>(block);
  auto* index = reinterpret_cast<Index*>(tables + 1);

  tables->default_secondary = header.default_secondary;
  tables->default_tertiary = header.default_tertiary;
  tables->header_ = &header;
  tables->weights_ = reinterpret_cast<const SortWeight*>(checked_section + header.weights);
  tables->expansions_ = reinterpret_cast<const SortExpansion*>(checked_section + header.expansions);
  tables->combinations_ = reinterpret_cast<const SortCombination*>(checked_section + header.combinations);
  tables->expansion_count_ = expansions;
  tables->combination_count_ = combinations;
  tables->expansion_index_ = index;
  tables->combination_index_ = index + expansions;

  tables->ascii_in_order = true;
  for (uint32_t& bits : tables->beginnings_) bits = 0;
  for (uint32_t i = 0; i < expansions; ++i) index[i] = {tables->expansions_[i].character, i};
  for (uint32_t i = 0; i < combinations; ++i) {
    const SortCombination& row = tables->combinations_[i];
    index[expansions + i] = {uint32_t{row.first} << 16 | row.second, i};
    tables->beginnings_[row.first >> 5 & 7] |= 1u << (row.first & 31);
    if (row.first < 0x80 && single(row.weight).mask != kAllInOrder) tables->ascii_in_order = false;
  }
  auto in_order = [](const Index& a, const Index& b) { return a.key != b.key ? a.key < b.key : a.number < b.number; };
  for (Index* part : {index, index + expansions}) {
    Index* end = part == index ? index + expansions : index + expansions + combinations;
    if (!std::is_sorted(part, end, in_order)) std::sort(part, end, in_order);
  }

  for (unsigned i = 0; i < SortTables::kQuickCharacters; ++i) {
    auto character = static_cast<uint16_t>(i);
    Weights weights = tables->weights_of(character);
    const WeightSet& set = weights.sets[0];
    bool plain = weights.count == 1 && weights.mask == kAllInOrder && set.primary != 0 && set.secondary != 0 &&
                 set.tertiary != 0 && !tables->may_begin_combination(character);
    bool special = combinations == 0 && weights.count == 1 && (weights.mask & kSpecialInOrder) != 0 &&
                   set.special != 0 && set.primary == 0 && set.secondary == 0 && set.tertiary == 0;
    tables->quick[i] = plain     ? uint32_t{set.primary} << 16 | uint32_t{set.secondary} << 8 | set.tertiary
                       : special ? uint32_t{set.special} << 16
                                 : 0;
    if (i < 0x80 && weighs(weights) && weights.mask != kAllInOrder) tables->ascii_in_order = false;
  }
  return tables;
}

}  // namespace lx
