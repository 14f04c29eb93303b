// SPDX-License-Identifier: Apache-2.0
// Where a text may be cut, and where its trailing blanks begin.
#pragma once

#include "codepage/text/kinds.hpp"
#include "frame/call.hpp"

namespace lx {

// The blanks that are stripped. Zero stands for no blank of that width.
struct Blanks {
  uint32_t narrow = 0;
  uint32_t full_width = 0;

  bool any() const { return narrow != 0; }
};

inline uint32_t blank_byte(const CodePage& page) { return page.ascii_family ? 0x20 : 0x40; }

inline Blanks blanks_of(const CodePage& page, bool full_width) {
  Blanks blanks = {blank_byte(page), 0};
  if (full_width && page.raw.full_width != nullptr) {
    uint32_t wide = page.raw.full_width[blanks.narrow];
    if (wide > 0xFF) blanks.full_width = wide;
  }
  return blanks;
}

struct Cut {
  size_t at = 0;
  bool double_byte = false;  // a double-byte run is open there
};

// The end of the part of a text that fits in `room` bytes with a terminator, and with the shift byte that it may need;
// without its trailing blanks, if any are given.
Cut find_cut(TRC1_Unit& trace_unit, const CodePage& page, const Text<char>& text, bool shifted, size_t room,
             const Blanks& blanks);

}  // namespace lx
