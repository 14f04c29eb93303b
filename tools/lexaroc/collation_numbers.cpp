// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <tuple>

#include "collation.hpp"

namespace lx::compiler {

namespace {

constexpr size_t kMostSmallWeights = 255;

// In a collation with capitals first, case counts more than the place in the root.
struct TertiaryOrder {
  bool upper_first;
  bool operator()(const Tertiary& a, const Tertiary& b) const {
    if (upper_first && a.letter_case != b.letter_case) return a.letter_case > b.letter_case;
    return std::tie(a.rank, a.letter_case) < std::tie(b.rank, b.letter_case);
  }
};

class Numbering {
 public:
  explicit Numbering(const Collation& collation)
      : collation_(collation), tertiary_(TertiaryOrder{collation.upper_first}) {}

  SortObject run() {
    small_weights();
    primaries();
    pages();
    specials();
    for (const auto& [character, element] : collation_.characters) put(character, element);
    for (const auto& [pair, element] : collation_.pairs) {
      SortSet set = numbers(element.sets[0]);
      sort_.pairs.push_back({pair.first, pair.second, entry(set)});
    }
    return std::move(sort_);
  }

 private:
  std::vector<const Element*> elements_in_source_order() const {
    std::vector<const Element*> elements;
    for (const auto& [character, element] : collation_.characters) elements.push_back(&element);
    for (const auto& [pair, element] : collation_.pairs) elements.push_back(&element);
    std::stable_sort(elements.begin(), elements.end(), [](const Element* a, const Element* b) {
      return std::tie(a->spot.line, a->spot.column) < std::tie(b->spot.line, b->spot.column);
    });
    return elements;
  }

  // Numbers from 1 for what is used; the smallest are the defaults, which keys leave out at their end.
  void small_weights() {
    for (const Element* element : elements_in_source_order()) {
      for (const WeightSet& set : element->sets) {
        secondary_[set.secondary];
        tertiary_[set.tertiary];
      }
      if (secondary_.size() > kMostSmallWeights) {
        throw SourceError(element->spot, "this needs one secondary weight more than the 255 that are possible");
      }
      if (tertiary_.size() > kMostSmallWeights) {
        throw SourceError(element->spot, "this needs one tertiary weight more than the 255 that are possible");
      }
    }
    uint8_t number = 0;
    for (auto& [rank, value] : secondary_) value = ++number;
    number = 0;
    for (auto& [rank, value] : tertiary_) value = ++number;
  }

  void primaries() {
    unsigned number = kFirstPrimary;
    for (Primary primary : collation_.primaries) primary_[primary] = static_cast<uint16_t>(number++);
    next_primary_ = number;
  }

  void pages() {
    mask_ = collation_.backward_secondary ? kBackwardSecondaryMask : kForwardMask;
    for (unsigned page : collation_.tabulated) {
      sort_.pages[page].kind = SortPageKind::table;
      sort_.tables[page];
    }
    constexpr unsigned kPage = 256;
    unsigned base = (next_primary_ + kPage - 1) / kPage * kPage;
    for (unsigned page : collation_.algorithmic) {
      if (base > 0x10000 - kPage)
        throw SourceError(Spot{}, "there are more primary weights than the 65,535 that are possible");
      sort_.pages[page] = {SortPageKind::primary, mask_, static_cast<uint16_t>(base)};
      base += kPage;
    }
  }

  // Characters without any other weight come last, so that no two texts are equal without being so.
  void specials() {
    uint16_t number = 0;
    for (const std::vector<uint16_t>& group : collation_.specials) {
      ++number;
      for (uint16_t character : group) put_special(character, number);
    }
    for (unsigned page : collation_.tabulated) {
      for (unsigned low = 0; low < 256; ++low) {
        auto character = static_cast<uint16_t>(page << 8 | low);
        if (collation_.characters.count(character) == 0 && sort_.tables[page][low].weight == 0) {
          put_special(character, ++number);
        }
      }
    }
  }

  void put_special(uint16_t character, uint16_t weight) { place(character) = {weight, 0, 0, true, false, mask_}; }

  SortEntry& place(uint16_t character) { return sort_.tables[character >> 8][character & 0xFF]; }

  SortEntry entry(const SortSet& set) const { return {set.primary, set.secondary, set.tertiary, false, false, mask_}; }

  SortSet numbers(const WeightSet& set) const {
    return {primary_number(set.primary), secondary_.at(set.secondary), tertiary_.at(set.tertiary)};
  }

  uint16_t primary_number(Primary primary) const {
    if (primary == 0) return 0;
    if (primary < kByCodePoint) return primary_.at(primary);
    unsigned character = primary - kByCodePoint;
    return static_cast<uint16_t>(sort_.pages[character >> 8].base + (character & 0xFF));
  }

  void put(uint16_t character, const Element& element) {
    if (element.sets.size() == 1) {
      place(character) = entry(numbers(element.sets[0]));
      return;
    }
    place(character) = {0, 0, 0, false, true, mask_};
    sort_.expansions.push_back({character, {numbers(element.sets[0]), numbers(element.sets[1])}});
  }

  const Collation& collation_;
  SortObject sort_;
  uint8_t mask_ = kForwardMask;
  std::map<Rank, uint8_t> secondary_;
  std::map<Tertiary, uint8_t, TertiaryOrder> tertiary_;
  std::map<Primary, uint16_t> primary_;
  unsigned next_primary_ = 0;
};

}  // namespace

SortObject number_weights(const Collation& collation) { return Numbering(collation).run(); }

}  // namespace lx::compiler
