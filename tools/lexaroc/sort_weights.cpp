// SPDX-License-Identifier: Apache-2.0
#include "sort_weights.hpp"

namespace lx::compiler {

namespace {

uint16_t hex4(Cursor& cursor) {
  cursor.expect(U' ');
  return static_cast<uint16_t>(cursor.hex(4));
}

uint8_t mask(Cursor& cursor) {
  cursor.expect(U' ');
  return static_cast<uint8_t>(cursor.hex(1));
}

uint8_t small_weight(Cursor& cursor) { return static_cast<uint8_t>(cursor.decimal(255)); }

// "0F00.18.6"
SortSet read_set(Cursor& cursor) {
  SortSet set;
  set.primary = static_cast<uint16_t>(cursor.hex(4));
  cursor.expect(U'.');
  set.secondary = small_weight(cursor);
  cursor.expect(U'.');
  set.tertiary = small_weight(cursor);
  return set;
}

// "0F00.18.6 F", "special 0012 F" or "expands F"
SortEntry read_entry(Cursor& cursor, bool may_expand) {
  SortEntry entry;
  cursor.expect(U' ');
  if (cursor.accept("special")) {
    entry.special = true;
    entry.weight = hex4(cursor);
  } else if (may_expand && cursor.accept("expands")) {
    entry.expands = true;
  } else {
    SortSet set = read_set(cursor);
    entry.weight = set.primary;
    entry.secondary = set.secondary;
    entry.tertiary = set.tertiary;
  }
  entry.mask = mask(cursor);
  cursor.end();
  return entry;
}

std::string set_text(const SortSet& set) {
  return hex_text(set.primary, 4) + "." + std::to_string(set.secondary) + "." + std::to_string(set.tertiary);
}

std::string entry_text(const SortEntry& entry) {
  std::string text = entry.expands   ? "expands"
                     : entry.special ? "special " + hex_text(entry.weight, 4)
                                     : set_text({entry.weight, entry.secondary, entry.tertiary});
  return " " + text + " " + hex_text(entry.mask, 1) + "\n";
}

std::string range_text(unsigned first, unsigned last) {
  return hex_text(first, 2) + (last == first ? "" : "-" + hex_text(last, 2));
}

// Whether `next` goes on where the run of pages from `start` to `page` ends.
bool continues(const SortObject& sort, unsigned start, unsigned next) {
  const SortPageRule& a = sort.pages[start];
  const SortPageRule& b = sort.pages[next];
  if (a.kind != b.kind || a.mask != b.mask) return false;
  bool by_base = a.kind == SortPageKind::primary || a.kind == SortPageKind::special;
  return !by_base || b.base == a.base + 256 * (next - start);
}

std::string pages_text(const SortObject& sort) {
  std::string text;
  for (unsigned start = 0, next = 0; start < 256; start = next) {
    do {
      ++next;
    } while (next < 256 && continues(sort, start, next));
    const SortPageRule& rule = sort.pages[start];
    text += "pages " + range_text(start, next - 1);
    switch (rule.kind) {
      case SortPageKind::empty:
        text += " none\n";
        break;
      case SortPageKind::table:
        text += " table\n";
        break;
      case SortPageKind::primary:
      case SortPageKind::special:
        text += (rule.kind == SortPageKind::primary ? " primary " : " special ") + hex_text(rule.base, 4) + " " +
                hex_text(rule.mask, 1) + "\n";
    }
  }
  return text;
}

}  // namespace

void SortWeightsReader::line(Cursor& cursor) {
  Cursor start = cursor;
  std::string key = cursor.word("a keyword or a character");
  if (key == "defaults") {
    cursor.expect(U' ');
    sort_.default_secondary = small_weight(cursor);
    cursor.expect(U' ');
    sort_.default_tertiary = small_weight(cursor);
    cursor.end();
  } else if (key == "pages") {
    pages(cursor);
  } else if (key == "expansion") {
    expansion(cursor);
  } else if (key == "pair") {
    pair(cursor);
  } else {
    cursor = start;
    character(cursor);
  }
}

void SortWeightsReader::pages(Cursor& cursor) {
  cursor.expect(U' ');
  Spot spot = cursor.spot();
  unsigned first = cursor.hex(2);
  unsigned last = cursor.accept("-") ? cursor.hex(2) : first;
  if (last < first) throw SourceError(spot, "the range is empty");
  SortPageRule rule;
  if (cursor.accept(" table")) {
    rule.kind = SortPageKind::table;
  } else if (!cursor.accept(" none")) {
    rule.kind = cursor.accept(" special") ? SortPageKind::special : SortPageKind::primary;
    if (rule.kind == SortPageKind::primary && !cursor.accept(" primary")) {
      cursor.fail("expected table, primary, special or none");
    }
    rule.base = hex4(cursor);
    rule.mask = mask(cursor);
  }
  cursor.end();
  bool by_base = rule.kind == SortPageKind::primary || rule.kind == SortPageKind::special;
  if (last > first && rule.base + 256 * (last - first) > 0xFFFF) throw SourceError(spot, "the weights run past FFFF");
  for (unsigned page = first; page <= last; ++page) {
    if (stated_[page]) throw SourceError(spot, tool::message("page {0} is given twice", hex_text(page, 2)));
    stated_[page] = true;
    sort_.pages[page] = rule;
    if (rule.kind == SortPageKind::table) sort_.tables[page];
    if (by_base) rule.base = static_cast<uint16_t>(rule.base + 256);
  }
}

void SortWeightsReader::character(Cursor& cursor) {
  Spot spot = cursor.spot();
  auto c = static_cast<uint16_t>(cursor.hex(4));
  auto table = sort_.tables.find(c >> 8);
  if (table == sort_.tables.end())
    throw SourceError(spot, tool::message("{0} is on no page with a table", unicode_name(c)));
  if (seen_[c]) throw SourceError(spot, tool::message("{0} is given twice", unicode_name(c)));
  table->second[c & 0xFF] = read_entry(cursor, true);
  seen_[c] = true;
  ++seen_count_;
}

void SortWeightsReader::expansion(Cursor& cursor) {
  SortExpansionRow row;
  row.character = hex4(cursor);
  for (SortSet& set : row.sets) {
    cursor.expect(U' ');
    set = read_set(cursor);
  }
  cursor.end();
  sort_.expansions.push_back(row);
}

void SortWeightsReader::pair(Cursor& cursor) {
  SortPairRow row;
  row.first = hex4(cursor);
  row.second = hex4(cursor);
  row.weights = read_entry(cursor, false);
  sort_.pairs.push_back(row);
}

SortObject SortWeightsReader::take(Spot end) {
  for (unsigned page = 0; page < 256; ++page) {
    if (!stated_[page]) throw SourceError(end, tool::message("page {0} is missing", hex_text(page, 2)));
  }
  if (seen_count_ != sort_.tables.size() * 256) {
    throw SourceError(end, tool::message("{0} characters of the pages with tables are missing",
                                         sort_.tables.size() * 256 - seen_count_));
  }
  return std::move(sort_);
}

std::string write_sort_weights(const SortObject& sort) {
  std::string text = "defaults " + std::to_string(sort.default_secondary) + " " +
                     std::to_string(sort.default_tertiary) + "\n" + pages_text(sort);
  for (const auto& [page, table] : sort.tables) {
    for (unsigned low = 0; low < table.size(); ++low) text += hex_text(page << 8 | low, 4) + entry_text(table[low]);
  }
  for (const SortExpansionRow& row : sort.expansions) {
    text +=
        "expansion " + hex_text(row.character, 4) + " " + set_text(row.sets[0]) + " " + set_text(row.sets[1]) + "\n";
  }
  for (const SortPairRow& row : sort.pairs) {
    text += "pair " + hex_text(row.first, 4) + " " + hex_text(row.second, 4) + entry_text(row.weights);
  }
  return text;
}

}  // namespace lx::compiler
