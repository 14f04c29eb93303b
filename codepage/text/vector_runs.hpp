// SPDX-License-Identifier: Apache-2.0
// Runs of characters on processors that look bytes up in a table of 128 and close gaps between them with one
// instruction. Blocks are loaded and stored as far as there is text and room, so short texts gain as well.
#pragma once

#include "codepage/text/byte_runs.hpp"

namespace lx {

// Below this the plain loops are as quick as loading the tables.
inline constexpr size_t kWorthVectors = 16;

bool has_table_vectors();

// As their namesakes in byte_runs.hpp; the text to UCS-2 may be of any single-byte page. Only with has_table_vectors().
void map_bytes_vectors(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out);
void to_utf8_vectors(const CodePage& page, Run<uint8_t, uint8_t>& run);
void from_utf8_vectors(const CodePage& page, Run<uint8_t, uint8_t>& run);
void to_ucs2_vectors(const CodePage& page, Run<uint8_t, uint16_t>& run);
void from_ucs2_vectors(const CodePage& page, Run<uint16_t, uint8_t>& run);

// The characters at the beginning of UTF-8 text, as many as are whole, well-formed and within UCS-2.
struct Utf8Block {
  static constexpr size_t kMost = 16;
  uint16_t characters[kMost];
  size_t count;
  size_t length;  // bytes
};
void decode_utf8(const uint8_t* text, size_t length, Utf8Block& block);

}  // namespace lx
