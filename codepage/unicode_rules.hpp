// SPDX-License-Identifier: Apache-2.0
// What the library knows of Unicode characters without a code page.
#pragma once

#include <cstdint>

namespace lx {

// The character-type word: all three classes.
uint32_t type_of(uint16_t character);

// Other forms of a character; the character itself when it has none.
uint16_t listed_lower(uint16_t character);
uint16_t listed_upper(uint16_t character);
inline uint16_t to_lower(uint16_t character) {
  if (character >= 0x80) return listed_lower(character);
  return character >= 'A' && character <= 'Z' ? static_cast<uint16_t>(character + 32) : character;
}
inline uint16_t to_upper(uint16_t character) {
  if (character >= 0x80) return listed_upper(character);
  return character >= 'a' && character <= 'z' ? static_cast<uint16_t>(character - 32) : character;
}
uint16_t half_to_full(uint16_t character);
uint16_t full_to_half(uint16_t character);

// The ASCII digit that a digit of any script stands for; 0: it is none.
uint16_t ascii_digit(uint16_t character);

}  // namespace lx
