// SPDX-License-Identifier: Apache-2.0
// Packed characters: the bytes of one character as one big-endian number.
#pragma once

#include <cstddef>
#include <cstdint>

namespace lx {

inline uint32_t pack(const uint8_t* bytes, size_t length) {
  uint32_t value = 0;
  for (size_t i = 0; i < length; ++i) value = value << 8 | bytes[i];
  return value;
}

// No character has a zero byte behind its first, so zero middle bytes are not written.
inline size_t unpack(uint8_t* out, uint32_t value) {
  uint8_t* at = out;
  if (value > 0xFFFFFF) *at++ = static_cast<uint8_t>(value >> 24);
  if ((value & 0xFF0000) != 0) *at++ = static_cast<uint8_t>(value >> 16);
  if ((value & 0xFF00) != 0) *at++ = static_cast<uint8_t>(value >> 8);
  *at++ = static_cast<uint8_t>(value);
  return static_cast<size_t>(at - out);
}

inline size_t unpacked_length(uint32_t value) {
  return size_t{1} + (value > 0xFFFFFF) + ((value & 0xFF0000) != 0) + ((value & 0xFF00) != 0);
}

// The same for values of which a zero middle byte counts.
inline size_t packed_length(uint32_t value) {
  return value > 0xFFFFFF ? 4u : (value & 0xFF0000) != 0 ? 3u : (value & 0xFF00) != 0 ? 2u : 1u;
}

// A character in UTF-8, by rule.
inline uint32_t utf8_packed(uint16_t character) {
  if (character < 0x80) return character;
  if (character < 0x800) return 0xC080u | (character >> 6 & 0x1Fu) << 8 | (character & 0x3Fu);
  return 0xE08080u | (character >> 12 & 0x0Fu) << 16 | (character >> 6 & 0x3Fu) << 8 | (character & 0x3Fu);
}

// Bytes of characters in UTF-8.
inline size_t utf8_length(const uint16_t* characters, size_t count) {
  size_t length = count;
  for (size_t i = 0; i < count; ++i) length += (characters[i] > 0x7F) + (characters[i] > 0x7FF);
  return length;
}

}  // namespace lx
