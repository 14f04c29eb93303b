// SPDX-License-Identifier: Apache-2.0
#include "collate/weight_model.hpp"

#include <algorithm>

namespace lx::test {
namespace {

ModelWeights entry_weights(const SortSpec::Entry& entry) {
  ModelWeights weights;
  weights.mask = static_cast<int>(entry.flags >> 10 & 15);
  if ((entry.flags & kIsSpecial) != 0) {
    weights.sets = {{0, 0, 0, entry.weight}};
  } else {
    weights.sets = {{entry.weight, entry.secondary, entry.tertiary, 0}};
  }
  return weights;
}

}  // namespace

ModelWeights model_weights(const SortSpec& sort, char16_t character) {
  const SortSpec::Page& page = sort.pages[character >> 8];
  if ((page.flags & kEmptyPage) != 0) return {};
  unsigned by_rule = (page.base + (character & 0xFFu)) & 0xFFFF;
  int page_mask = static_cast<int>(page.mask & 15);
  if ((page.flags & kPrimaryPage) != 0) return {{{by_rule, 0, 0, 0}}, page_mask};
  if ((page.flags & kSpecialPage) != 0) return {{{0, 0, 0, by_rule}}, page_mask};
  auto found = sort.entries.find(character);
  SortSpec::Entry entry = found != sort.entries.end() ? found->second : SortSpec::Entry{};
  if ((entry.flags & kExpands) == 0) return entry_weights(entry);
  ModelWeights weights;
  weights.mask = static_cast<int>(entry.flags >> 10 & 15);
  for (const SortSpec::Expansion& row : sort.expansions) {
    if (row.character != character) continue;
    for (const SortSpec::Entry& set : {row.first, row.second}) {
      weights.sets.push_back({set.weight, set.secondary, set.tertiary, 0});
    }
    break;
  }
  return weights;
}

bool model_combination(const SortSpec& sort, char16_t first, char16_t second, ModelWeights& weights) {
  for (const SortSpec::Combination& row : sort.combinations) {
    if (row.first != first || row.second != second) continue;
    weights = entry_weights(row.entry);
    return true;
  }
  return false;
}

void ModelReader::skip_shifts() {
  for (; remaining > 0 && (*text)[at].shift; ++at, ++offset, --remaining) state = (*text)[at].state;
}

bool ModelReader::read(char16_t& character) {
  skip_shifts();
  if (remaining <= 0 || (*text)[at].units > remaining) return false;
  const Piece& piece = (*text)[at++];
  character = piece.character;
  remaining -= piece.units;
  offset += piece.units;
  return true;
}

ModelWeights ModelReader::next() {
  char16_t current = 0;
  if (pending != 0xFFFF) {
    current = pending;
    pending = 0xFFFF;
    --remaining;
  } else {
    if (!read(current)) {
      remaining = 0;
      return {};
    }
    ++position;
  }
  char16_t second = 0;
  if (!sort->combinations.empty() && remaining > 0 && read(second)) {
    ModelWeights weights;
    if (model_combination(*sort, current, second, weights)) {
      ++position;
      return weights;
    }
    pending = second;
    ++remaining;
  }
  return model_weights(*sort, current);
}

void ModelLevels::file(const ModelSet& set, uint16_t position, int mask) {
  if (set.primary != 0) primary.file(set.primary, (mask & 8) != 0);
  if (set.secondary != 0) secondary.file(set.secondary, (mask & 4) != 0);
  if (set.tertiary != 0) tertiary.file(set.tertiary, (mask & 2) != 0);
  if (set.special != 0) special.file({position, set.special}, (mask & 1) != 0);
}

std::string model_key(const SortSpec& sort, std::u16string_view text) {
  ModelLevels levels;
  for (size_t i = 0; i < text.size(); ++i) {
    auto position = static_cast<uint16_t>(i + 1);
    ModelWeights weights;
    if (i + 1 < text.size() && model_combination(sort, text[i], text[i + 1], weights)) {
      ++i;
    } else {
      weights = model_weights(sort, text[i]);
    }
    for (const ModelSet& set : weights.sets) levels.file(set, position, weights.mask);
  }
  auto& secondary = levels.secondary.list;
  auto& tertiary = levels.tertiary.list;
  while (!secondary.empty() && secondary.back() == sort.default_secondary) secondary.pop_back();
  while (!tertiary.empty() && tertiary.back() == sort.default_tertiary) tertiary.pop_back();
  std::string key;
  auto one_byte = [&](unsigned value) { key += static_cast<char>(value); };
  auto two_bytes = [&](unsigned value) { one_byte(value >> 8), one_byte(value & 0xFF); };
  for (unsigned weight : levels.primary.list) two_bytes(weight);
  one_byte(0);
  for (unsigned weight : secondary) one_byte(weight);
  one_byte(0);
  for (unsigned weight : tertiary) one_byte(weight);
  one_byte(0);
  bool alone = key.size() == 3;
  for (auto [position, weight] : levels.special.list) {
    if (!alone) two_bytes(position);
    two_bytes(weight);
  }
  return key;
}

namespace {

struct ModelSide {
  ModelReader reader;
  ModelLevels levels = {};
  std::vector<ModelSet> waiting = {};
  int mask = 0;

  // The next primary weight, everything before it filed; 0: the text has ended.
  unsigned next_primary() {
    for (;;) {
      if (waiting.empty()) {
        if (!reader.more()) return 0;
        ModelWeights weights = reader.next();
        waiting = weights.sets;
        mask = weights.mask;
        continue;
      }
      ModelSet set = waiting.front();
      waiting.erase(waiting.begin());
      levels.file(set, reader.position, mask);
      if (set.primary != 0) return set.primary;
    }
  }
};

template <class Element>
int compare_lists(const std::vector<Element>& a, const std::vector<Element>& b, bool lengths) {
  for (size_t i = 0; i < std::min(a.size(), b.size()); ++i) {
    if (a[i] != b[i]) return a[i] < b[i] ? -1 : 1;
  }
  return !lengths || a.size() == b.size() ? 0 : a.size() < b.size() ? -1 : 1;
}

}  // namespace

ModelResult model_compare(ModelReader first, ModelReader second) {
  ModelSide a{first};
  ModelSide b{second};
  bool fast = true;
  for (;;) {
    unsigned x = a.next_primary();
    unsigned y = b.next_primary();
    if ((x != 0 && (a.mask & 8) == 0) || (y != 0 && (b.mask & 8) == 0)) fast = false;
    if (x == 0 && y == 0) break;
    if (!fast) continue;
    if (x == 0 || y == 0) return {x != 0 ? 1 : -1, true};
    if (x != y) return {static_cast<int>(x) - static_cast<int>(y), true};
  }
  int result = fast ? 0 : compare_lists(a.levels.primary.list, b.levels.primary.list, false);
  if (result == 0) result = compare_lists(a.levels.secondary.list, b.levels.secondary.list, true);
  if (result == 0) result = compare_lists(a.levels.tertiary.list, b.levels.tertiary.list, true);
  if (result == 0) result = compare_lists(a.levels.special.list, b.levels.special.list, true);
  return {result, result == 0};
}

}  // namespace lx::test
