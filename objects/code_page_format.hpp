// SPDX-License-Identifier: Apache-2.0
// The sections of a code page object as they stand in the file.
#pragma once

#include <cstddef>

#include "frame/big_endian.hpp"

namespace lx {

inline constexpr uint16_t kUtf8Id = 57352;
inline constexpr uint16_t kUnassigned = 0xFFFD;    // to-Unicode value of bytes that are no character
inline constexpr uint32_t kUnassignedType = 1024;  // character-type word of the same
inline constexpr unsigned kMaxCharacterLength = 4;

inline constexpr uint16_t kAsciiFamily = 1;  // flags of section 1
inline constexpr uint16_t kShiftSensitive = 2;

// One page of 256 UCS-2 values on the way to bytes. The low byte must lie in [low, high]; masked, it is the index
// into the arrays at `values` (section 3) and `high_parts` (section 4), which hold the packed character in pieces.
struct FromUnicodePage {
  uint8_t kind;
  uint8_t mask;
  uint8_t low;
  uint8_t high;
  BeU16 values;
  BeU16 high_parts;
};
static_assert(sizeof(FromUnicodePage) == 8);

// Width in bytes of the array elements for each kind, and the least maximum character length that it needs.
struct FromUnicodeKind {
  uint8_t value_width;
  uint8_t high_part_width;
  uint8_t high_part_shift;
  uint8_t character_length;
};
inline constexpr FromUnicodeKind kFromUnicodeKinds[] = {
    {1, 0, 0, 1}, {2, 0, 0, 2}, {2, 1, 16, 3}, {2, 2, 16, 4}, {1, 1, 8, 2}};
inline constexpr unsigned kFromUnicodeKindCount = sizeof kFromUnicodeKinds / sizeof kFromUnicodeKinds[0];

// What both layouts of section 1 share, in one piece of the current one.
struct CodePageHeader {
  uint8_t substitution;
  uint8_t line_bytes[4];
  uint8_t max_length;
  BeU16 half_to_full_count;
  uint8_t enter_byte;        // begins a double-byte run of a shift-sensitive page,
  uint8_t leave_byte;        // and ends it
  uint8_t char_length[256];  // by first byte; 0: begins no character
  uint8_t upper[256];        // other case of one-byte characters
  uint8_t lower[256];
  BeU16 to_unicode[256];  // of one-byte characters
  BeU16 reserved;
  BeU32 types[256];
  FromUnicodePage from_unicode[256];  // by high byte
  BeU16 flags;
  BeU16 full_width;  // offsets from the start of the section; 0 on single-byte pages
  BeU16 half_to_full;
  BeU16 type_states;
  BeU16 type_entries;
  BeU16 to_unicode_array;  // offset from the start of section 2
};
static_assert(sizeof(CodePageHeader) == 4376 && alignof(CodePageHeader) == 1);
static_assert(offsetof(CodePageHeader, enter_byte) == 8 && offsetof(CodePageHeader, char_length) == 10);
static_assert(offsetof(CodePageHeader, upper) == 266 && offsetof(CodePageHeader, lower) == 522);
static_assert(offsetof(CodePageHeader, to_unicode) == 778 && offsetof(CodePageHeader, reserved) == 1290);
static_assert(offsetof(CodePageHeader, types) == 1292 && offsetof(CodePageHeader, from_unicode) == 2316);
static_assert(offsetof(CodePageHeader, flags) == 4364 && offsetof(CodePageHeader, full_width) == 4366);
static_assert(offsetof(CodePageHeader, type_states) == 4370 && offsetof(CodePageHeader, to_unicode_array) == 4374);

// One step of the to-Unicode walk (section 2): the byte must lie in [low, high]; masked and added to `index` it names
// the next entry, or, when `final` is set, the element of the to-Unicode array.
struct ToUnicodeState {
  uint8_t final;
  uint8_t mask;
  uint8_t low;
  uint8_t high;
  BeU16 index;
};
static_assert(sizeof(ToUnicodeState) == 6);

// One step of the character-type walk (section 1); it has no bounds.
struct TypeState {
  uint8_t final;
  uint8_t mask;
  BeU16 index;
};
static_assert(sizeof(TypeState) == 4);

struct TypeEntry {
  BeU32 flags;
  BeI32 delta;
};
static_assert(sizeof(TypeEntry) == 8);

struct WidthPair {
  BeU32 half;
  BeU32 full;
};
static_assert(sizeof(WidthPair) == 8);

// The older layout: no shift bytes, no reserved word, states of section 2 without bounds.
struct CodePageHeaderV1 {
  uint8_t substitution;
  uint8_t line_bytes[4];
  uint8_t max_length;
  BeU16 half_to_full_count;
  uint8_t char_length[256];
  uint8_t upper[256];
  uint8_t lower[256];
  BeU16 to_unicode[256];
  BeU32 types[256];
  FromUnicodePage from_unicode[256];
  BeU16 flags;
  // The rest is there on multibyte pages only.
  BeU16 full_width;  // also the start of the variable part
  BeU16 half_to_full;
  BeU16 type_states;
  BeU16 type_entries;
  BeU16 to_unicode_array;
};
static_assert(offsetof(CodePageHeaderV1, char_length) == 8 && offsetof(CodePageHeaderV1, upper) == 264);
static_assert(offsetof(CodePageHeaderV1, to_unicode) == 776 && offsetof(CodePageHeaderV1, types) == 1288);
static_assert(offsetof(CodePageHeaderV1, from_unicode) == 2312 && offsetof(CodePageHeaderV1, flags) == 4360);
static_assert(offsetof(CodePageHeaderV1, full_width) == 4362 && offsetof(CodePageHeaderV1, to_unicode_array) == 4370);
static_assert(sizeof(CodePageHeaderV1) == 4372 && alignof(CodePageHeaderV1) == 1);

struct ToUnicodeStateV1 {
  uint8_t final;
  uint8_t mask;
  BeU16 index;
};
static_assert(sizeof(ToUnicodeStateV1) == 4);

}  // namespace lx
