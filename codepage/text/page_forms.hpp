// SPDX-License-Identifier: Apache-2.0
// Types and other forms of the characters of a page that are longer than a byte; one-byte characters have theirs in
// tables of bytes.
#pragma once

#include "objects/code_page.hpp"

namespace lx {

inline constexpr LXCharType kNoTypeEntry = {kUnassignedType, 0};

// The walk is proved for bytes that begin a multibyte character.
inline const LXCharType& type_entry(const CodePage& page, const uint8_t* bytes) {
  const TypeState* state = page.raw.type_states;
  if (state == nullptr || (!page.shift_sensitive && page.char_length[*bytes] < 2)) return kNoTypeEntry;
  while (state->final == 0) {
    state = page.raw.type_states + state->index + (*bytes & state->mask);
    ++bytes;
  }
  return page.types[state->index + (*bytes & state->mask)];
}

inline uint32_t other_case(uint32_t packed, const LXCharType& type) {
  return packed + static_cast<uint32_t>(type.delta);
}

// 0: none.
inline uint32_t full_width(const CodePage& page, uint32_t packed) {
  const CheckedCodePage& raw = page.raw;
  if (raw.half_to_full_count == 0) return 0;
  uint32_t low = 0;
  uint32_t high = raw.half_to_full_count - 1;
  while (high > low) {
    uint32_t middle = (low + high) / 2;
    if (packed > raw.half_to_full[middle].half) {
      low = middle + 1;
    } else {
      high = middle;
    }
  }
  return raw.half_to_full[high].half == packed ? uint32_t{raw.half_to_full[high].full} : 0;
}

}  // namespace lx
