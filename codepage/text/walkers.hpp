// SPDX-License-Identifier: Apache-2.0
// Walkers take text apart into characters without asking what they mean: for counting, finding and cutting. A walker is
// a small value; a copy is a bookmark.
//
//   next(character)  the next character; false at the end, and before a character that the end cuts off
//   finish()         moves past what belongs to the character before: shift bytes
//   at, end          where the walker stands, and where the text ends
#pragma once

#include <cstddef>
#include <cstdint>

#include "codepage/text/packed.hpp"
#include "objects/code_page.hpp"

namespace lx {

// A character as it is stored: its bytes packed, or its unit; and how many units it has. Two characters are the same
// only when both agree.
struct Character {
  uint32_t code = 0;
  uint32_t units = 0;

  bool operator==(const Character&) const = default;
};

template <class U>
struct UnitWalker {
  using Unit = U;
  static constexpr bool kOneUnit = true;

  const U* at;
  const U* end;

  UnitWalker(const U* text, size_t length) : at(text), end(text + length) {}
  bool next(Character& character) {
    if (at == end) return false;
    character = {*at++, 1};
    return true;
  }
  void finish() {}
};

// The first byte tells the length.
struct MultibyteWalker {
  using Unit = uint8_t;
  static constexpr bool kOneUnit = false;

  const CodePage* page;
  const uint8_t* at;
  const uint8_t* end;

  MultibyteWalker(const CodePage& code_page, const uint8_t* text, size_t length)
      : page(&code_page), at(text), end(text + length) {}
  bool next(Character& character) {
    if (at == end) return false;
    uint32_t length = page->char_length[*at];
    if (length == 1) {
      character = {*at++, 1};
      return true;
    }
    if (length > static_cast<size_t>(end - at)) return false;
    character = {pack(at, length), length};
    at += length;
    return true;
  }
  void finish() {}
};

// The shift state does. Shift bytes belong to the character before them, except at the start of a text.
struct ShiftedWalker {
  using Unit = uint8_t;
  static constexpr bool kOneUnit = false;

  const CodePage* page;
  const uint8_t* at;
  const uint8_t* end;
  bool double_byte;

  ShiftedWalker(const CodePage& code_page, const uint8_t* text, size_t length, uint32_t state)
      : page(&code_page), at(text), end(text + length), double_byte(state != 0) {}
  bool at_shift() const { return at != end && (*at == page->enter_byte || *at == page->leave_byte); }
  bool skip_shift() {
    if (!at_shift()) return false;
    double_byte = *at++ == page->enter_byte;
    return true;
  }
  uint32_t length_here() const { return double_byte ? page->max_length : 1u; }
  bool next(Character& character) {
    while (skip_shift()) {
    }
    uint32_t length = length_here();
    if (at == end || length > static_cast<size_t>(end - at)) return false;
    character = {pack(at, length), length};
    at += length;
    return true;
  }
  void finish() {
    while (skip_shift()) {
    }
  }
};

// The state that a walker has come to; 0 where there are none.
template <class Walker>
uint32_t shift_state(const Walker& walker) {
  if constexpr (requires { walker.double_byte; }) {
    return walker.double_byte ? 1 : 0;
  } else {
    return 0;
  }
}

}  // namespace lx
