// SPDX-License-Identifier: Apache-2.0
#include "codepage/text/byte_runs.hpp"

#include <cstring>

#if defined(__x86_64__)
#include <immintrin.h>
#define LX_AVX2 1
#endif

namespace lx {
namespace {

constexpr uint64_t kHighBits = 0x8080808080808080u;

uint64_t load_word(const uint8_t* from) {
  uint64_t word;
  std::memcpy(&word, from, sizeof word);
  return word;
}

#ifdef LX_AVX2

constexpr size_t kBlock = 32;

bool has_avx2() { return __builtin_cpu_supports("avx2") != 0; }

// A table lookup for 32 bytes: each of the table's rows of 16 is shuffled by the low nibbles and kept where the high
// nibble is the row's number.
struct VectorTable {
  __m256i rows[16];
};

__attribute__((target("avx2"))) inline void load_rows(VectorTable& table, const uint8_t* bytes, unsigned count) {
  for (unsigned row = 0; row < count; ++row) {
    table.rows[row] = _mm256_broadcastsi128_si256(_mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes + 16 * row)));
  }
}

// Adding 0x70 with saturation to the distance from the row's first byte leaves the high bit clear only for the row's
// own 16 bytes; the shuffle gives zero for the others.
template <unsigned kRows>
__attribute__((target("avx2"))) inline __m256i look_up(const VectorTable& table, __m256i bytes) {
  __m256i result = _mm256_setzero_si256();
  for (unsigned row = 0; row < kRows; ++row) {
    __m256i distance = _mm256_sub_epi8(bytes, _mm256_set1_epi8(static_cast<char>(16 * row)));
    __m256i index = _mm256_adds_epu8(distance, _mm256_set1_epi8(0x70));
    result = _mm256_or_si256(result, _mm256_shuffle_epi8(table.rows[row], index));
  }
  return result;
}

__attribute__((target("avx2"))) inline __m256i load_block(const uint8_t* from) {
  return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(from));
}

__attribute__((target("avx2"))) inline void store_block(uint8_t* to, __m256i block) {
  _mm256_storeu_si256(reinterpret_cast<__m256i*>(to), block);
}

__attribute__((target("avx2"))) size_t copy_ascii_blocks(const uint8_t* in, size_t count, uint8_t* out) {
  size_t done = 0;
  for (; count - done >= kBlock; done += kBlock) {
    __m256i block = load_block(in + done);
    if (_mm256_movemask_epi8(block) != 0) break;
    store_block(out + done, block);
  }
  return done;
}

__attribute__((target("avx2"))) size_t map_to_ascii_blocks(const uint8_t* table, const uint8_t* in, size_t count,
                                                           uint8_t* out) {
  VectorTable vectors;
  load_rows(vectors, table, 16);
  size_t done = 0;
  for (; count - done >= kBlock; done += kBlock) {
    __m256i block = look_up<16>(vectors, load_block(in + done));
    if (_mm256_movemask_epi8(block) != 0) break;
    store_block(out + done, block);
  }
  return done;
}

__attribute__((target("avx2"))) size_t map_from_ascii_blocks(const uint8_t* table, const uint8_t* in, size_t count,
                                                             uint8_t* out) {
  VectorTable vectors;
  load_rows(vectors, table, 8);
  size_t done = 0;
  for (; count - done >= kBlock; done += kBlock) {
    __m256i block = load_block(in + done);
    if (_mm256_movemask_epi8(block) != 0) break;
    store_block(out + done, look_up<8>(vectors, block));
  }
  return done;
}

__attribute__((target("avx2"))) size_t map_bytes_blocks(const uint8_t* table, const uint8_t* in, size_t count,
                                                        uint8_t* out) {
  VectorTable vectors;
  load_rows(vectors, table, 16);
  size_t done = 0;
  for (; count - done >= kBlock; done += kBlock) store_block(out + done, look_up<16>(vectors, load_block(in + done)));
  return done;
}

// Below this the plain loops are as quick as loading the rows.
constexpr size_t kWorthwhile = 64;

#define LX_BLOCKS(call) (count >= kWorthwhile && has_avx2() ? (call) : 0)
#else
#define LX_BLOCKS(call) \
  size_t { 0 }
#endif

}  // namespace

size_t copy_ascii(const uint8_t* in, size_t count, uint8_t* out) {
  size_t done = LX_BLOCKS(copy_ascii_blocks(in, count, out));
  for (; count - done >= sizeof(uint64_t); done += sizeof(uint64_t)) {
    uint64_t word = load_word(in + done);
    if ((word & kHighBits) != 0) break;
    std::memcpy(out + done, &word, sizeof word);
  }
  for (; done < count && in[done] < 0x80; ++done) out[done] = in[done];
  return done;
}

size_t map_to_ascii(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out) {
  size_t done = LX_BLOCKS(map_to_ascii_blocks(table, in, count, out));
  for (; done < count; ++done) {
    uint8_t value = table[in[done]];
    if (value > 0x7F) break;
    out[done] = value;
  }
  return done;
}

size_t map_from_ascii(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out) {
  size_t done = LX_BLOCKS(map_from_ascii_blocks(table, in, count, out));
  for (; done < count && in[done] < 0x80; ++done) out[done] = table[in[done]];
  return done;
}

void map_bytes(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out) {
  size_t done = LX_BLOCKS(map_bytes_blocks(table, in, count, out));
  for (; done < count; ++done) out[done] = table[in[done]];
}

}  // namespace lx
