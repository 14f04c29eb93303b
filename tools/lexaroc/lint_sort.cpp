// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <set>

#include "lint.hpp"

namespace lx::compiler {

namespace {

class SortLint {
 public:
  SortLint(const Sort& sort, Report& report) : sort_(sort.weights), source_(sort), report_(report) {}

  void run() {
    for (unsigned page = 0; page < 256; ++page) check_page(page);
    for (const auto& [page, table] : sort_.tables) {
      for (unsigned low = 0; low < table.size(); ++low) check_entry(page << 8 | low, table[low]);
    }
    for (size_t i = 0; i < sort_.expansions.size(); ++i) check_expansion(i);
    for (const SortPairRow& row : sort_.pairs) check_pair(row);
    if (smallest_.secondary != sort_.default_secondary) error("the default secondary weight is not the smallest one");
    if (smallest_.tertiary != sort_.default_tertiary) error("the default tertiary weight is not the smallest one");
  }

 private:
  void error(const tool::Message& message) { report_.error(source_.file, source_.spot, message); }

  void check_page(unsigned page) {
    const SortPageRule& rule = sort_.pages[page];
    tool::Message name = tool::message("page {0}", hex_text(page, 2));
    if (rule.kind == SortPageKind::empty) error(tool::message("{0} has no weights", name));
    if (rule.kind == SortPageKind::primary) check_primary(rule.base, name);
    if (rule.kind == SortPageKind::special && rule.base == 0)
      error(tool::message("{0} begins with a special weight 0", name));
    bool by_base = rule.kind == SortPageKind::primary || rule.kind == SortPageKind::special;
    if (by_base && rule.base > 0x10000 - 256) error(tool::message("{0} runs past the weight FFFF", name));
  }

  // Zero bytes end the levels of a sort key.
  void check_primary(unsigned primary, const tool::Message& name) {
    if (primary < kFirstPrimary)
      error(tool::message("{0} has a primary weight below {1}", name, hex_text(kFirstPrimary, 4)));
  }

  void check_set(const SortSet& set, const tool::Message& name) {
    if (set.primary != 0) check_primary(set.primary, name);
    if (set.secondary == 0 || set.tertiary == 0) error(tool::message("{0} lacks a secondary or tertiary weight", name));
    if (set.secondary != 0) smallest_.secondary = std::min(smallest_.secondary, set.secondary);
    if (set.tertiary != 0) smallest_.tertiary = std::min(smallest_.tertiary, set.tertiary);
  }

  void check_weights(const SortEntry& entry, const tool::Message& name) {
    if (!entry.special) {
      check_set({entry.weight, entry.secondary, entry.tertiary}, name);
    } else if (entry.weight == 0) {
      error(tool::message("{0} has no weights", name));
    }
  }

  void check_entry(unsigned character, const SortEntry& entry) {
    if (!entry.expands) {
      check_weights(entry, unicode_name(character));
      return;
    }
    bool found = std::any_of(sort_.expansions.begin(), sort_.expansions.end(),
                             [character](const SortExpansionRow& row) { return row.character == character; });
    if (!found) error(tool::message("{0} expands to nothing", unicode_name(character)));
  }

  void check_expansion(size_t i) {
    const SortExpansionRow& row = sort_.expansions[i];
    tool::Message name = tool::message("the expansion of {0}", unicode_name(row.character));
    if (i > 0 && row.character <= sort_.expansions[i - 1].character) error(tool::message("{0} is out of order", name));
    auto table = sort_.tables.find(row.character >> 8);
    if (table == sort_.tables.end() || !table->second[row.character & 0xFF].expands)
      error(tool::message("{0} is never read", name));
    for (const SortSet& set : row.sets) check_set(set, name);
  }

  void check_pair(const SortPairRow& row) {
    tool::Message name = tool::message("the pair {0} {1}", unicode_name(row.first), unicode_name(row.second));
    if (!pairs_.insert({row.first, row.second}).second) error(tool::message("{0} is given twice", name));
    check_weights(row.weights, name);
  }

  const SortObject& sort_;
  const Sort& source_;
  Report& report_;
  SortSet smallest_{0, 255, 255};
  std::set<CharacterPair> pairs_;
};

}  // namespace

void lint_sort(const Sort& sort, Report& report) {
  try {
    pack_sort(sort.weights);
    SortLint(sort, report).run();
  } catch (const Fault& error) {
    report.error(sort.file, sort.spot, error.text);
  }
}

}  // namespace lx::compiler
