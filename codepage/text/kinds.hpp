// SPDX-License-Identifier: Apache-2.0
// The kinds of text that a call may give, as types: each algorithm over characters is a template over one of these and
// is called once for each.
//
//   Unit                     what the text is made of
//   with_walker(text, use)   use(walker), with the walker that fits the code page; chosen once a call
//   length_of_characters     units of so many characters
//   characters_of_length     whole characters in so many units
#pragma once

#include "codepage/lengths.hpp"
#include "codepage/text/text_kinds.hpp"
#include "codepage/text/walkers.hpp"

namespace lx {

// A text with its length in units; the state at its start counts in the shifted kind only.
template <class U>
struct Text {
  const U* at = nullptr;
  size_t length = 0;
  uint32_t state = 0;

  Text tail(size_t from) const { return {at + from, length - from, state}; }
};

struct PlainKind {
  using Unit = char;
  static constexpr bool kBytes = true;
  static constexpr bool kShifted = false;

  template <class Use>
  static auto with_walker(const CodePage& page, const Text<char>& text, Use use) {
    if (page.max_length == 1) return use(UnitWalker<uint8_t>(bytes_of(text.at), text.length));
    return use(MultibyteWalker(page, bytes_of(text.at), text.length));
  }
  static size_t length_of_characters(const CodePage& page, const Text<char>& text, size_t characters) {
    const uint8_t* at = bytes_of(text.at);
    if (page.kind == PageKind::single) return characters;  // mixed pages too, where shift bytes are not followed
    for (; characters != 0; --characters) at += page.char_length[*at];
    return static_cast<size_t>(at - bytes_of(text.at));
  }
};

struct ShiftedKind {
  using Unit = char;
  static constexpr bool kBytes = true;
  static constexpr bool kShifted = true;

  template <class Use>
  static auto with_walker(const CodePage& page, const Text<char>& text, Use use) {
    if (!page.shift_sensitive) return PlainKind::with_walker(page, text, use);
    return use(ShiftedWalker(page, bytes_of(text.at), text.length, text.state));
  }
  static size_t length_of_characters(const CodePage& page, const Text<char>& text, size_t characters) {
    return bytes_of_characters(page, bytes_of(text.at), text.state, characters);
  }
  // With the shift byte that closes the double-byte run in which they end: it belongs to the last of them, and a copy
  // without it would be broken. Only behind such a run is a byte read that the caller has not counted.
  static size_t length_with_run_closed(const CodePage& page, const Text<char>& text, size_t characters) {
    const size_t length = length_of_characters(page, text, characters);
    if (!page.shift_sensitive) return length;
    ShiftedWalker walker(page, bytes_of(text.at), length, text.state);
    for (Character character; walker.next(character);) {
    }
    while (walker.double_byte) {
      walker.end = walker.at + 1;
      if (!walker.skip_shift()) break;
    }
    return static_cast<size_t>(walker.at - bytes_of(text.at));
  }
};

template <class U>
struct UnitKind {
  using Unit = U;
  static constexpr bool kBytes = false;
  static constexpr bool kShifted = false;

  template <class Use>
  static auto with_walker(const CodePage&, const Text<U>& text, Use use) {
    return use(UnitWalker<U>(text.at, text.length));
  }
  static size_t length_of_characters(const CodePage&, const Text<U>&, size_t characters) { return characters; }
};
using WideKind = UnitKind<LXWChar>;
using Ucs2Kind = UnitKind<LXUChar>;

// Units of a text that is given as so many characters, where the units themselves count and not only what they mean.
template <class Kind>
size_t length_to_copy(const CodePage& page, const Text<typename Kind::Unit>& text, size_t characters) {
  if constexpr (Kind::kShifted) {
    return Kind::length_with_run_closed(page, text, characters);
  } else {
    return Kind::length_of_characters(page, text, characters);
  }
}

}  // namespace lx
