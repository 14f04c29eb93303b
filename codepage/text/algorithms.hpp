// SPDX-License-Identifier: Apache-2.0
// What is done with the characters of a text, once for all kinds of it. Lengths and positions are in units.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "codepage/text/walkers.hpp"

namespace lx {

template <class Walker>
size_t passed(const Walker& from, const Walker& to) {
  return static_cast<size_t>(to.at - from.at);
}

// Steps over the leading characters that `wanted` accepts.
template <class Walker, class Wanted>
void skip_while(Walker& text, Wanted wanted) {
  Character character;
  for (Walker ahead = text; ahead.next(character) && wanted(character); text = ahead) {
  }
}

// Steps over at most `limit` characters; returns how many.
template <class Walker>
size_t skip_characters(Walker& text, size_t limit) {
  if constexpr (Walker::kOneUnit) {
    size_t count = std::min(limit, static_cast<size_t>(text.end - text.at));
    text.at += count;
    return count;
  } else {
    size_t count = 0;
    skip_while(text, [&](const Character&) { return count < limit && ++count != 0; });
    return count;
  }
}

template <class Walker>
size_t count_characters(Walker text) {
  return skip_characters(text, SIZE_MAX);
}

// Length of the whole characters, with the shift bytes behind them.
template <class Walker>
size_t whole_length(Walker text) {
  Walker begin = text;
  skip_characters(text, SIZE_MAX);
  text.finish();
  return passed(begin, text);
}

}  // namespace lx
