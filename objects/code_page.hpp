// SPDX-License-Identifier: Apache-2.0
// A code page in use: the checked sections and, beside them, native tables for the inner loops. Built once when the
// object is loaded, freed with it, read without locks.
#pragma once

#include <lexaro/lexaro.h>

#include "objects/code_page_format.hpp"

namespace lx {

// How plain text of the page (no shift states) is cut into characters and written.
enum class PageKind : uint8_t {
  single,     // every character is one byte; mixed pages count here as long as nobody follows their shift bytes
  multibyte,  // the first byte tells the length
  utf8,       // as multibyte, converted by rule
};

// The sections of a code page after their check. What it proves is what the readers of CodePage rely on.
struct CheckedCodePage {
  const CodePageHeader* header;
  const ToUnicodeState* states;  // null on pages without multibyte characters
  const uint8_t* to_unicode_array;
  uint32_t state_count;
  const uint8_t* values;         // section 3
  const uint8_t* high_parts;     // section 4
  const TypeState* type_states;  // null: absent
  const TypeEntry* type_entries;
  uint32_t type_entry_count;
  const BeU32* full_width;  // null: absent
  const WidthPair* half_to_full;
  uint32_t half_to_full_count;
};

struct CodePage {
  CheckedCodePage raw;
  uint16_t id;
  uint8_t max_length;
  uint8_t substitution;
  uint8_t enter_byte;  // 0 unless shift-sensitive
  uint8_t leave_byte;
  bool shift_sensitive;
  bool ascii_family;
  PageKind kind;
  bool ascii_bytes;  // 00-7F are the ASCII characters, both ways
  // Every ASCII character from this one on is one byte of the page: 0, or 20 where a control character is missing;
  // above 7F when others are.
  uint8_t ascii_from;
  bool usual;                   // U+FFFD is no character of the page, so it becomes the substitution byte
  bool standard_utf8;           // UTF-8 whose length table is the usual one
  uint8_t char_length[256];     // by first byte; never 0, so that every walk ends
  uint16_t to_unicode[256];     // of one-byte characters
  uint32_t utf8_of_byte[256];   // the same in UTF-8, first byte lowest; the top byte counts, 0: U+FFFD
  uint8_t ascii_of_byte[256];   // the same as one byte; 0x80: not an ASCII character, or a shift byte
  uint8_t latin1_of_byte[256];  // the same on pages whose characters are all in Latin1
  uint8_t byte_of_latin1[256];  // of U+0000-U+00FF, the lowest byte of the packed character
  bool latin1;                  // every byte is a Latin1 character,
  bool latin1_bytes;            // and its own value, both ways

  // Multibyte characters to UCS-2: from `root`, a value with kNode set is the number of a node that the next byte
  // indexes; a value without it is a row of values that the last byte indexes. Row 0 holds only U+FFFD.
  static constexpr uint16_t kNode = 0x8000;
  uint16_t root;
  const uint16_t* nodes;
  const uint16_t* rows;

  uint8_t trail_low;  // bytes behind the first of a character lie between these
  uint8_t trail_high;

  // What the first byte of a double-byte character leads to: its row, or one of the two marks. On shift-sensitive pages
  // it holds for the double-byte state, elsewhere for bytes that the length table gives two bytes.
  static constexpr uint16_t kOtherLength = 0x8000;  // ask decode and the length
  static constexpr uint16_t kNoLead = 0xFFFF;       // a character of one byte, or a shift byte
  uint16_t lead[256];

  // UCS-2 to packed characters: arrays of 256 by high byte. They are of the narrow kind unless some character has more
  // than two bytes; those of the other kind are null.
  const uint16_t* from_narrow[256];
  const uint32_t* from_wide[256];

  const LXCharType* types;  // native copies of the type entries

  // Half-width forms, found by the hash of the full-width character: it is in the upper half, in the lower one stands
  // where the half-width form is, a byte, or a pair and 256. Null: the page has none.
  static constexpr uint32_t kNoHalfForm = UINT32_MAX;
  const uint64_t* half_forms;
  uint32_t half_form_bits;  // the table has 1 << bits places, half of them free

  uint32_t packed(uint16_t ucs2) const {
    const uint16_t* narrow = from_narrow[ucs2 >> 8];
    return narrow != nullptr ? narrow[ucs2 & 0xFF] : from_wide[ucs2 >> 8][ucs2 & 0xFF];
  }
  // Whether a packed value stands for the wanted character or merely in its place.
  bool stands_in(uint32_t packed_value, uint16_t ucs2) const {
    return packed_value == substitution && to_unicode[substitution] != ucs2;
  }

  size_t half_form_place(uint32_t full) const { return full * 0x9E3779B1u >> (32 - half_form_bits); }
  size_t next_half_form(size_t place) const { return (place + 1) & ((size_t{1} << half_form_bits) - 1); }
  // 0: none.
  uint32_t half_width(uint32_t full) const {
    if (half_forms == nullptr) return 0;
    for (size_t at = half_form_place(full);; at = next_half_form(at)) {
      auto form = static_cast<uint32_t>(half_forms[at]);
      if (form == kNoHalfForm) return 0;
      if (half_forms[at] >> 32 == full) return form < 256 ? form : uint32_t{raw.half_to_full[form - 256].half};
    }
  }

  // The value of the character at `bytes`, of which the tables never read more than its length.
  uint16_t decode(const uint8_t* bytes) const {
    uint16_t at = root;
    while ((at & kNode) != 0) at = nodes[size_t{at & ~unsigned{kNode}} << 8 | *bytes++];
    return rows[size_t{at} << 8 | *bytes];
  }
};

// One block from the allocation callback, with the tables behind the record; null: no memory.
CodePage* build_code_page(uint16_t id, const CheckedCodePage& checked);

// US-ASCII as it stands in for a missing page; part of the library.
const CodePage& built_in_code_page();

}  // namespace lx
