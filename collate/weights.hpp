// SPDX-License-Identifier: Apache-2.0
// Texts read as weights, and weights filed by level.
#pragma once

#include <algorithm>

#include "codepage/text/text_kinds.hpp"
#include "objects/sort_object.hpp"

namespace lx {

// Reads the characters of a text through one of the readers, with pairs that combine taken as one.
template <class Reader>
class WeightReader {
 public:
  static constexpr uint16_t kNonePending = 0xFFFF;

  WeightReader(const SortTables& sort, Reader in, uint16_t position = 0, uint16_t pending = kNonePending)
      : sort_(sort), in_(in), position_(position), pending_(pending) {}

  const Reader& reader() const { return in_; }
  uint16_t position() const { return position_; }
  uint16_t pending() const { return pending_; }
  bool truncated() const { return truncated_; }
  bool done() const { return pending_ == kNonePending && (truncated_ || in_.done()); }

  Weights next() {
    uint16_t character = pending_;
    if (pending_ != kNonePending) {
      pending_ = kNonePending;
    } else {
      if (in_.next(character) != Got::character) {
        truncated_ = true;
        return {};
      }
      ++position_;
    }
    return sort_.has_combinations() ? look_ahead(character) : sort_.weights_of(character);
  }

 private:
  Weights look_ahead(uint16_t character) {
    Reader ahead = in_;
    uint16_t second = 0;
    if (ahead.next(second) != Got::character) {
      in_ = ahead;  // past the shift bytes at the end
      return sort_.weights_of(character);
    }
    Weights weights;
    if (sort_.combination_of(character, second, weights)) {
      in_ = ahead;
      ++position_;
      return weights;
    }
    // U+FFFF stays in the text: as a pending character it would mean none.
    if (second != kNonePending) {
      in_ = ahead;
      pending_ = second;
    }
    return sort_.weights_of(character);
  }

  const SortTables& sort_;
  Reader in_;
  uint16_t position_;
  uint16_t pending_;
  bool truncated_ = false;
};

// The weights of one level: its elements, in the order in which they count. A run of weights that are not in text order
// stands reversed behind the last one that is. It is turned round once, where it ends.
template <class Element>
struct Level {
  Element* begin;
  Element* run;  // not turned yet; it reaches to the end
  Element* end;

  explicit Level(Element* at) : begin(at), run(at), end(at) {}
  size_t size() const { return static_cast<size_t>(end - begin); }
  void end_run() {
    if (run != end) std::reverse(run, end);
    run = end;
  }
  void file(const Element& element, bool in_order) {
    if (in_order) end_run();
    *end++ = element;
    if (in_order) run = end;
  }
};

struct Levels {
  Level<uint16_t> primary;
  Level<uint8_t> secondary;
  Level<uint8_t> tertiary;
  Level<LXSpecialWeight> special;

  static size_t aligned(size_t size) { return (size + 3) & ~size_t{3}; }
  // Bytes for the weights of so many characters, each of which may have two sets.
  static size_t area_size(size_t characters) { return aligned(8 * characters + 3) + 8 * characters; }

  // `area` is aligned to four bytes.
  Levels(uint8_t* area, size_t characters)
      : primary(reinterpret_cast<uint16_t*>(area)),
        secondary(area + 4 * characters),
        tertiary(area + 6 * characters),
        special(reinterpret_cast<LXSpecialWeight*>(area + aligned(8 * characters))) {}

  void file(const WeightSet& set, uint16_t position, uint8_t mask) {
    if (set.primary != 0) primary.file(set.primary, (mask & kPrimaryInOrder) != 0);
    if (set.secondary != 0) secondary.file(set.secondary, (mask & kSecondaryInOrder) != 0);
    if (set.tertiary != 0) tertiary.file(set.tertiary, (mask & kTertiaryInOrder) != 0);
    if (set.special != 0) special.file({position, set.special}, (mask & kSpecialInOrder) != 0);
  }
  // Behind the last set.
  void finish() {
    primary.end_run();
    secondary.end_run();
    tertiary.end_run();
    special.end_run();
  }
};

}  // namespace lx
