// SPDX-License-Identifier: Apache-2.0
#include "collation_root.hpp"

namespace lx::compiler {

namespace {

constexpr unsigned kMostRanks = 999;

class RootReader {
 public:
  RootReader(const SourceFile& source, Report& report) : source_(source), report_(report) {}

  std::optional<Collation> read() {
    size_t errors = report_.count();
    source_.for_each_line(report_, [this](Cursor& cursor) { line(cursor); });
    if (report_.count() == errors) check();
    if (report_.count() != errors) return std::nullopt;
    for (auto& [character, element] : root_.characters) element.spot = {0, 0};
    return std::move(root_);
  }

 private:
  void line(Cursor& cursor) {
    Spot start = cursor.spot();
    std::string key = cursor.word("a keyword");
    if (key == "tabulated" || key == "algorithmic") {
      pages(cursor, key == "tabulated" ? root_.tabulated : root_.algorithmic);
    } else if (key == "capitals") {
      capitals(cursor);
    } else if (key == "s") {
      specials(cursor);
    } else if (key == "m") {
      members(cursor, 0);
    } else if (key == "p") {
      auto primary = static_cast<Primary>(root_.primaries.size() + 1);
      root_.primaries.push_back(primary);
      members(cursor, primary);
    } else if (key == "x") {
      expansion(cursor);
    } else {
      throw SourceError(start, tool::message("unknown keyword \"{0}\"", key));
    }
  }

  void pages(Cursor& cursor, std::vector<unsigned>& list) {
    Spot start = cursor.spot();
    for (unsigned page : read_pages(cursor)) {
      if (!pages_.insert(page).second)
        throw SourceError(start, tool::message("page {0} is given twice", hex_text(page, 2)));
      list.push_back(page);
    }
  }

  void capitals(Cursor& cursor) {
    while (!cursor.done()) {
      cursor.expect(U' ');
      root_.capitals.insert(static_cast<uint16_t>(cursor.decimal(kMostRanks)));
    }
  }

  // A character that has no weights yet.
  uint16_t new_character(Cursor& cursor) {
    Spot spot = cursor.spot();
    uint16_t c = read_character(cursor);
    if (!root_.is_tabulated(c)) throw SourceError(spot, tool::message("{0} is on no tabulated page", unicode_name(c)));
    if (!seen_.insert(c).second) throw SourceError(spot, tool::message("{0} is given twice", unicode_name(c)));
    return c;
  }

  void specials(Cursor& cursor) {
    while (!cursor.done()) {
      cursor.expect(U' ');
      Spot spot = cursor.spot();
      bool same = cursor.accept("= ");
      if (same && root_.specials.empty()) throw SourceError(spot, "there is no character before this one");
      if (!same) root_.specials.emplace_back();
      root_.specials.back().push_back(new_character(cursor));
    }
  }

  // "18.6+1"
  WeightSet weights(Cursor& cursor, Primary primary) {
    WeightSet set;
    set.primary = primary;
    set.secondary = {rank(cursor), 0};
    cursor.expect(U'.');
    Tertiary& tertiary = set.tertiary;
    tertiary.rank.number = rank(cursor);
    if (cursor.accept("+")) tertiary.rank.step = rank(cursor);
    if (root_.capitals.count(tertiary.rank.number) != 0) tertiary.letter_case = LetterCase::upper;
    return set;
  }

  uint16_t rank(Cursor& cursor) {
    Spot spot = cursor.spot();
    unsigned number = cursor.decimal(kMostRanks);
    if (number == 0) throw SourceError(spot, "weights begin with 1");
    return static_cast<uint16_t>(number);
  }

  // Characters with one weight set each; "=": the same as the one before.
  void members(Cursor& cursor, Primary primary) {
    Spot start = cursor.spot();
    if (primary != 0) previous_.clear();
    while (!cursor.done()) {
      cursor.expect(U' ');
      Element element;
      element.spot = cursor.spot();
      uint16_t c = new_character(cursor);
      cursor.expect(U' ');
      element.equal = cursor.accept("=");
      if (element.equal && previous_.empty()) cursor.fail("there is no character before this one");
      if (!element.equal) previous_ = {weights(cursor, primary)};
      element.sets = previous_;
      root_.characters.emplace(c, element);
    }
    if (previous_.empty()) throw SourceError(start, "expected a character");
  }

  Primary base(Cursor& cursor) {
    if (cursor.accept("-")) return 0;
    Spot spot = cursor.spot();
    uint16_t c = read_character(cursor);
    auto found = root_.characters.find(c);
    if (found != root_.characters.end() && found->second.sets.size() == 1) return found->second.sets[0].primary;
    if (root_.is_tabulated(c))
      throw SourceError(spot, tool::message("{0} has no primary weight of its own before here", unicode_name(c)));
    return kByCodePoint + c;
  }

  void expansion(Cursor& cursor) {
    cursor.expect(U' ');
    Element element;
    element.spot = cursor.spot();
    uint16_t c = new_character(cursor);
    while (!cursor.done()) {
      cursor.expect(U' ');
      if (element.sets.size() == kMostSets) cursor.fail("a character can have two weight sets at most");
      Primary primary = base(cursor);
      cursor.expect(U':');
      element.sets.push_back(weights(cursor, primary));
    }
    if (element.sets.empty()) cursor.fail("expected weights");
    root_.characters.emplace(c, element);
  }

  void check() {
    for (unsigned page = 0; page < 256; ++page) {
      if (pages_.count(page) != 0) continue;
      report_.error(source_.name(), source_.end(),
                    tool::message("page {0} is neither tabulated nor algorithmic", hex_text(page, 2)));
    }
    for (const auto& [character, element] : root_.characters) {
      const WeightSet& set = element.sets[0];
      uint16_t& first = root_.first_mark;
      if (set.primary == 0 && (first == 0 || set.secondary.number < first)) first = set.secondary.number;
    }
    if (root_.first_mark < 2) report_.error(source_.name(), source_.end(), "there are no marks, or no letters");
    if (root_.capitals.empty()) report_.error(source_.name(), source_.end(), "\"capitals\" is missing");
    try {
      check_distinct(root_);
    } catch (const SourceError& error) {
      report_.error(source_.name(), error);
    }
  }

  const SourceFile& source_;
  Report& report_;
  Collation root_;
  std::set<unsigned> pages_;
  std::set<uint16_t> seen_;
  WeightSets previous_;
};

}  // namespace

std::optional<Collation> read_collation_root(const SourceFile& source, Report& report) {
  return RootReader(source, report).read();
}

}  // namespace lx::compiler
