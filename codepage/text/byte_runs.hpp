// SPDX-License-Identifier: Apache-2.0
// Runs of one-byte characters, many at a time. None of them writes more than it reports.
#pragma once

#include <cstddef>
#include <cstdint>

namespace lx {

// Copies up to `count` bytes and stops before the first that is not ASCII. Returns the number copied.
size_t copy_ascii(const uint8_t* in, size_t count, uint8_t* out);

// Maps bytes through a table of 256 and stops before the first whose value is above 0x7F.
size_t map_to_ascii(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out);

// Maps ASCII bytes through a table of 128 and stops before the first byte that is not ASCII.
size_t map_from_ascii(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out);

// Maps all bytes through a table of 256.
void map_bytes(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out);

}  // namespace lx
