// SPDX-License-Identifier: Apache-2.0
// The characters that numbers and times are spelled with, which the family of the code page decides.
#pragma once

#include "codepage/text/kinds.hpp"
#include "objects/code_page.hpp"

namespace lx {

struct Spelling {
  bool ascii;
  uint8_t zero;
  uint8_t minus;
  uint8_t plus;
  uint8_t space;
  uint8_t open;  // parentheses
  uint8_t close;
  uint8_t list;  // between the sizes of a grouping string
};

inline constexpr Spelling kAsciiSpelling = {true, 0x30, 0x2D, 0x2B, 0x20, 0x28, 0x29, 0x3B};
inline constexpr Spelling kEbcdicSpelling = {false, 0xF0, 0x60, 0x4E, 0x40, 0x4D, 0x5D, 0x5E};

// UCS-2 text is of the ASCII family in every locale.
template <class Kind>
const Spelling& spelling_of(const CodePage& page) {
  return std::same_as<Kind, Ucs2Kind> || page.ascii_family ? kAsciiSpelling : kEbcdicSpelling;
}

}  // namespace lx
