// SPDX-License-Identifier: Apache-2.0
#include "collation.hpp"

#include <algorithm>

namespace lx::compiler {

bool Collation::is_tabulated(uint16_t character) const {
  return std::find(tabulated.begin(), tabulated.end(), character >> 8) != tabulated.end();
}

bool Collation::is_special(uint16_t character) const {
  return std::any_of(specials.begin(), specials.end(), [character](const std::vector<uint16_t>& group) {
    return std::find(group.begin(), group.end(), character) != group.end();
  });
}

void Collation::remove_special(uint16_t character) {
  for (std::vector<uint16_t>& group : specials) std::erase(group, character);
  std::erase_if(specials, [](const std::vector<uint16_t>& group) { return group.empty(); });
}

uint16_t read_character(Cursor& cursor) {
  if (cursor.done() || cursor.peek() == U' ') cursor.fail("expected a character");
  Spot spot = cursor.spot();
  char32_t c = cursor.next();
  if (c == U'\\') {
    if (!cursor.accept("u")) throw SourceError(spot, "an unknown escape: only \\uXXXX is known");
    return cursor.unicode_escape();
  }
  if (must_be_escaped(c)) throw SourceError(spot, tool::message("{0} must be written as an escape", unicode_name(c)));
  if (c > 0xFFFF) throw SourceError(spot, "only characters up to U+FFFF are possible");
  return static_cast<uint16_t>(c);
}

std::vector<unsigned> read_pages(Cursor& cursor) {
  std::vector<unsigned> pages;
  do {
    cursor.expect(U' ');
    Spot spot = cursor.spot();
    unsigned first = cursor.hex(2);
    unsigned last = cursor.accept("-") ? cursor.hex(2) : first;
    if (last < first) throw SourceError(spot, "the range is empty");
    for (unsigned page = first; page <= last; ++page) pages.push_back(page);
  } while (!cursor.done());
  return pages;
}

std::string element_name(const std::u16string& characters) {
  std::string name;
  for (char16_t c : characters) name += (name.empty() ? "" : " ") + unicode_name(c);
  return name;
}

namespace {

class Distinct {
 public:
  void add(const std::u16string& characters, const Element& element) {
    if (element.equal) return;
    auto [found, added] = holders_.emplace(element.sets, Holder{characters, element.spot});
    if (added) return;
    const Holder& other = found->second;
    bool second = element.spot.line > other.spot.line ||
                  (element.spot.line == other.spot.line && element.spot.column > other.spot.column);
    Spot spot = second ? element.spot : other.spot;
    if (spot.line == 0) return;
    throw SourceError(spot, tool::message("{0} gets the weights that {1} has; write \"=\" if that is meant",
                                          element_name(second ? characters : other.characters),
                                          element_name(second ? other.characters : characters)));
  }

 private:
  struct Holder {
    std::u16string characters;
    Spot spot;
  };
  std::map<WeightSets, Holder> holders_;
};

}  // namespace

void check_distinct(const Collation& collation) {
  Distinct distinct;
  for (const auto& [character, element] : collation.characters)
    distinct.add({static_cast<char16_t>(character)}, element);
  for (const auto& [pair, element] : collation.pairs) {
    distinct.add({static_cast<char16_t>(pair.first), static_cast<char16_t>(pair.second)}, element);
  }
}

}  // namespace lx::compiler
