// SPDX-License-Identifier: Apache-2.0
#include "collation_rules.hpp"

#include <algorithm>

namespace lx::compiler {

namespace {

constexpr size_t kMostCharacters = 2;

// One character or more, up to a blank, a slash or the end.
std::u16string read_characters(Cursor& cursor) {
  Spot spot = cursor.spot();
  std::u16string characters;
  do {
    characters.push_back(static_cast<char16_t>(read_character(cursor)));
  } while (!cursor.done() && cursor.peek() != U' ' && cursor.peek() != U'/');
  if (characters.size() > kMostCharacters) {
    throw SourceError(spot, tool::message("{0} characters cannot be weighed together: the format knows single "
                                          "characters and pairs",
                                          characters.size()));
  }
  return characters;
}

}  // namespace

Tailoring::Tailoring(const Collation& root) : root_(root), collation_(root) {}

void Tailoring::option(Cursor& cursor) {
  Spot spot = cursor.spot();
  std::string name = cursor.word("an option");
  cursor.end();
  if (name == "upper-first") {
    collation_.upper_first = true;
  } else if (name == "backward-secondary") {
    collation_.backward_secondary = true;
  } else {
    throw SourceError(spot, "the options are upper-first and backward-secondary");
  }
}

void Tailoring::rule(Cursor& cursor) {
  before_ = cursor.accept("[before 1] ");
  Spot spot = cursor.spot();
  WeightSets current = sets_of(read_characters(cursor), spot);
  if (cursor.done()) cursor.fail("expected <, <<, <<< or = and an element");
  while (!cursor.done()) {
    cursor.expect(U' ');
    Step step = read_step(cursor);
    if (before_ && step.level != Level::primary) throw SourceError(step.spot, "[before 1] wants \"<\" first");
    apply(step, current);
  }
}

Tailoring::Step Tailoring::read_step(Cursor& cursor) const {
  Step step;
  Spot start = cursor.spot();
  std::string sign = cursor.word("<, <<, <<< or =");
  if (sign == "=") {
    step.level = Level::equal;
  } else if (sign == "<" || sign == "<<" || sign == "<<<") {
    step.level = static_cast<Level>(sign.size() - 1);
  } else {
    throw SourceError(start, "expected <, <<, <<< or =");
  }
  cursor.expect(U' ');
  step.spot = cursor.spot();
  step.characters = read_characters(cursor);
  if (cursor.accept("/")) step.extension = read_characters(cursor);
  return step;
}

WeightSets Tailoring::sets_of(const std::u16string& characters, Spot spot) const {
  if (characters.size() == 2) {
    auto pair = collation_.pairs.find({characters[0], characters[1]});
    if (pair != collation_.pairs.end()) return pair->second.sets;
  }
  WeightSets sets;
  for (char16_t c : characters) {
    auto found = collation_.characters.find(c);
    if (found == collation_.characters.end()) {
      const std::string name = unicode_name(c);
      throw SourceError(
          spot, collation_.is_tabulated(c)
                    ? tool::message("{0} has only a special weight: nothing can be placed after it", name)
                    : tool::message("{0} gets its weight from its code point: nothing can be placed after it", name));
    }
    sets.insert(sets.end(), found->second.sets.begin(), found->second.sets.end());
  }
  return sets;
}

// The difference to what stands before lies in the last weight set.
void Tailoring::apply(const Step& step, WeightSets& current) {
  Element element{current, step.spot, step.level == Level::equal};
  WeightSet& last = element.sets.back();
  if (step.level == Level::primary) {
    if (last.primary == 0) throw SourceError(step.spot, "what stands before has no primary weight");
    last = after(last, step);
    element.sets.erase(element.sets.begin(), element.sets.end() - 1);
  } else if (step.level != Level::equal) {
    last = after(last, step);
  }
  current = element.sets;
  if (!step.extension.empty()) {
    WeightSets more = sets_of(step.extension, step.spot);
    element.sets.insert(element.sets.end(), more.begin(), more.end());
  }
  assign(step.characters, element);
}

WeightSet Tailoring::after(const WeightSet& current, const Step& step) {
  WeightSet next = current;
  Tertiary first = first_tertiary(step.characters);
  if (step.level == Level::primary) {
    return {insert_primary(current.primary, step.spot), Rank{}, first};
  }
  if (step.level == Level::secondary) {
    // A form of the plain letter comes after all its accented forms.
    if (next.secondary == Rank{}) next.secondary.number = static_cast<uint16_t>(root_.first_mark - 1);
    ++next.secondary.step;
    next.tertiary = first;
    return next;
  }
  if (first.letter_case == LetterCase::upper && current.tertiary.rank < first.rank) {
    next.tertiary = first;
  } else {
    ++next.tertiary.rank.step;
    next.tertiary.letter_case = first.letter_case;
  }
  return next;
}

Primary Tailoring::insert_primary(Primary current, Spot spot) {
  std::vector<Primary>& order = collation_.primaries;
  auto place = std::find(order.begin(), order.end(), current);
  if (place == order.end()) throw SourceError(spot, "nothing can be placed among the weights of the code points");
  auto primary = static_cast<Primary>(order.size() + 1);
  order.insert(before_ ? place : place + 1, primary);
  before_ = false;
  return primary;
}

Tertiary Tailoring::first_tertiary(const std::u16string& characters) const {
  LetterCase letter_case = case_of(characters);
  if (letter_case != LetterCase::upper) return {Rank{}, letter_case};
  return {Rank{*root_.capitals.begin(), 0}, letter_case};
}

LetterCase Tailoring::case_of(const std::u16string& characters) const {
  auto is_capital = [this](char16_t c) {
    auto found = root_.characters.find(c);
    return found != root_.characters.end() && found->second.sets[0].tertiary.letter_case == LetterCase::upper;
  };
  auto count = std::count_if(characters.begin(), characters.end(), is_capital);
  if (count == 0) return LetterCase::lower;
  return static_cast<size_t>(count) == characters.size() ? LetterCase::upper : LetterCase::mixed;
}

void Tailoring::assign(const std::u16string& characters, const Element& element) {
  size_t room = characters.size() == 1 ? kMostSets : 1;
  if (element.sets.size() > room) {
    const size_t count = element.sets.size();
    throw SourceError(element.spot,
                      room == 1
                          ? tool::message("a pair can have one weight set, and this would have {0}", count)
                          : tool::message("a character can have two weight sets, and this would have {0}", count));
  }
  if (characters.size() == 2) {
    auto [found, added] = collation_.pairs.emplace(CharacterPair(characters[0], characters[1]), element);
    if (!added) throw SourceError(element.spot, tool::message("{0} has a place already", element_name(characters)));
    return;
  }
  uint16_t c = characters[0];
  if (!collation_.is_tabulated(c))
    throw SourceError(element.spot, tool::message("{0} is on no tabulated page", unicode_name(c)));
  Element& place = collation_.characters[c];
  if (place.spot.line != 0)
    throw SourceError(element.spot, tool::message("{0} has a place already", element_name(characters)));
  place = element;
  collation_.remove_special(c);
}

void Tailoring::follow(Cursor& cursor) {
  Spot spot = cursor.spot();
  std::u16string letter = read_characters(cursor);
  WeightSets leader = sets_of(letter, spot);
  if (leader.size() != 1) throw SourceError(spot, "only a letter with one weight set can be followed");
  if (cursor.done()) cursor.fail("expected characters that follow");
  while (!cursor.done()) {
    cursor.expect(U' ');
    spot = cursor.spot();
    std::u16string characters = read_characters(cursor);
    Element element{sets_of(characters, spot), spot};
    if (element.sets.size() != 1) throw SourceError(spot, "only a character with one weight set can follow");
    element.sets[0].primary = leader[0].primary;
    assign(characters, element);
  }
}

}  // namespace lx::compiler
