// SPDX-License-Identifier: Apache-2.0
// Runs of one-byte characters, many at a time. None of them writes more than it reports.
// What the processor offers is found out at run time; every way gives the same text.
#pragma once

#include <cstddef>
#include <cstdint>

#include "objects/code_page.hpp"

namespace lx {

// The ways that are allowed: plain loops, vectors of 32 bytes, and those that look up bytes in tables. Tests go back to
// the simpler ones, which their machine would never take.
enum class Vectors : uint8_t { none, blocks, tables };
extern Vectors allowed_vectors;

// Copies up to `count` bytes and stops before the first that is not ASCII. Returns the number copied.
size_t copy_ascii(const uint8_t* in, size_t count, uint8_t* out);

// Maps bytes through a table of 256 and stops before the first whose value is above 0x7F.
size_t map_to_ascii(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out);

// Maps ASCII bytes through a table of 128 and stops before the first that is below `from` or not ASCII.
size_t map_from_ascii(const uint8_t* table, uint8_t from, const uint8_t* in, size_t count, uint8_t* out);

// Maps all bytes through a table of 256.
void map_bytes(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out);

// Where a run stands on both sides. What does not go through in bulk is left for the caller, who goes on from there.
template <class In, class Out>
struct Run {
  const In* in;
  const In* in_end;
  Out* out;
  Out* out_end;
};

// Single-byte text to UTF-8, up to a byte that is no character.
void carry_to_utf8(const CodePage& page, Run<uint8_t, uint8_t>& run);

// UTF-8 to single-byte text, up to a sequence that is not well-formed or a character that the page may lack.
void carry_from_utf8(const CodePage& page, Run<uint8_t, uint8_t>& run);

// Single-byte text of a page within Latin1 to UCS-2, and UCS-2 within Latin1 to single-byte text.
void carry_to_ucs2(const CodePage& page, Run<uint8_t, uint16_t>& run);
void carry_from_ucs2(const CodePage& page, Run<uint16_t, uint8_t>& run);

}  // namespace lx
