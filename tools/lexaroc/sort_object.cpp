// SPDX-License-Identifier: Apache-2.0
#include "sort_object.hpp"

#include "object_file.hpp"
#include "pack_pool.hpp"

namespace lx::compiler {

namespace {

constexpr unsigned kMaskBits = 15;

SortWeight pack_entry(const SortEntry& entry) {
  SortWeight weight{};
  weight.weight = entry.weight;
  weight.secondary = entry.secondary;
  weight.tertiary = entry.tertiary;
  weight.flags = static_cast<uint16_t>((entry.special ? kWeightIsSpecial : 0) | (entry.expands ? kWeightExpands : 0) |
                                       (entry.mask & kMaskBits) << kWeightMaskShift);
  return weight;
}

SortEntry unpack_entry(const SortWeight& weight) {
  uint16_t flags = weight.flags;
  return {weight.weight,
          weight.secondary,
          weight.tertiary,
          (flags & kWeightIsSpecial) != 0,
          (flags & kWeightExpands) != 0,
          static_cast<uint8_t>(flags >> kWeightMaskShift & kMaskBits)};
}

SortPage pack_page(const SortPageRule& rule, unsigned tables_before) {
  switch (rule.kind) {
    case SortPageKind::empty:
      return {kSortPageEmpty, 0, 0};
    case SortPageKind::table:
      return {0, 0, static_cast<uint16_t>(tables_before * 256)};
    case SortPageKind::primary:
      return {kSortPagePrimary, rule.mask, rule.base};
    case SortPageKind::special:
      break;
  }
  return {kSortPageSpecial, rule.mask, rule.base};
}

SortPageKind kind_of(uint8_t flags) {
  if ((flags & kSortPageEmpty) != 0) return SortPageKind::empty;
  if ((flags & kSortPagePrimary) != 0) return SortPageKind::primary;
  return (flags & kSortPageSpecial) != 0 ? SortPageKind::special : SortPageKind::table;
}

SortTable unpack_table(std::string_view section, size_t offset) {
  SortTable table;
  for (unsigned low = 0; low < table.size(); ++low) {
    table[low] = unpack_entry(record_at<SortWeight>(section, offset + low * sizeof(SortWeight)));
  }
  return table;
}

}  // namespace

std::string pack_sort(const SortObject& sort) {
  size_t weights = sizeof(SortHeader);
  size_t expansions = weights + sort.tables.size() * 256 * sizeof(SortWeight);
  size_t combinations = expansions + sort.expansions.size() * sizeof(SortExpansion);
  size_t size = combinations + sort.pairs.size() * sizeof(SortCombination);
  if (size > kLargestSection) {
    throw PackError(
        tool::message("the sort object would have {0} bytes ({1} tables, {2} expansions, {3} pairs); {4} are possible",
                      size, sort.tables.size(), sort.expansions.size(), sort.pairs.size(), kLargestSection));
  }
  SortHeader header{};
  header.default_secondary = sort.default_secondary;
  header.default_tertiary = sort.default_tertiary;
  header.expansion_count = static_cast<uint16_t>(sort.expansions.size());
  header.combination_count = static_cast<uint16_t>(sort.pairs.size());
  header.weights = static_cast<uint16_t>(weights);
  header.expansions = static_cast<uint16_t>(expansions);
  header.combinations = static_cast<uint16_t>(combinations);
  unsigned tables = 0;
  for (unsigned page = 0; page < 256; ++page) {
    header.pages[page] = pack_page(sort.pages[page], tables);
    tables += sort.pages[page].kind == SortPageKind::table;
  }
  std::string section(bytes_of(header));
  for (const auto& [page, table] : sort.tables) {
    for (const SortEntry& entry : table) section += bytes_of(pack_entry(entry));
  }
  for (const SortExpansionRow& row : sort.expansions) {
    const auto& [first, second] = row.sets;
    section += bytes_of(SortExpansion{row.character,
                                      first.primary,
                                      first.secondary,
                                      first.tertiary,
                                      second.primary,
                                      second.secondary,
                                      second.tertiary,
                                      {}});
  }
  for (const SortPairRow& row : sort.pairs) {
    section += bytes_of(SortCombination{row.first, row.second, pack_entry(row.weights)});
  }
  return section;
}

SortObject unpack_sort(std::string_view section) {
  auto header = record_at<SortHeader>(section, 0);
  SortObject sort;
  sort.default_secondary = header.default_secondary;
  sort.default_tertiary = header.default_tertiary;
  for (unsigned page = 0; page < 256; ++page) {
    const SortPage& packed = header.pages[page];
    SortPageRule& rule = sort.pages[page];
    rule.kind = kind_of(packed.flags);
    if (rule.kind == SortPageKind::table) {
      sort.tables.emplace(page, unpack_table(section, header.weights + packed.value * sizeof(SortWeight)));
    } else if (rule.kind != SortPageKind::empty) {
      rule.mask = packed.mask & kMaskBits;
      rule.base = packed.value;
    }
  }
  for (unsigned i = 0; i < header.expansion_count; ++i) {
    auto packed = record_at<SortExpansion>(section, header.expansions + i * sizeof(SortExpansion));
    sort.expansions.push_back({packed.character,
                               {{packed.primary1, packed.secondary1, packed.tertiary1},
                                {packed.primary2, packed.secondary2, packed.tertiary2}}});
  }
  for (unsigned i = 0; i < header.combination_count; ++i) {
    auto packed = record_at<SortCombination>(section, header.combinations + i * sizeof(SortCombination));
    sort.pairs.push_back({packed.first, packed.second, unpack_entry(packed.weight)});
  }
  return sort;
}

}  // namespace lx::compiler
