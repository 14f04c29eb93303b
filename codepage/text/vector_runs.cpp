// SPDX-License-Identifier: Apache-2.0
#include "codepage/text/vector_runs.hpp"

#include <algorithm>
#include <array>
#include <bit>

#if defined(__x86_64__)
#ifndef __clang__  // GCC's header begins results with undefined vectors, of which it then warns
#pragma GCC diagnostic ignored "-Wuninitialized"
#pragma GCC diagnostic ignored "-Wmaybe-uninitialized"
#endif
#include <immintrin.h>

namespace lx {
namespace {

#define LX_VECTOR __attribute__((target("avx512f,avx512bw,avx512vl,avx512vbmi,avx512vbmi2,bmi,bmi2,lzcnt,popcnt")))

constexpr size_t kBlock = 64;

using Places = std::array<uint8_t, kBlock>;

template <class Place>
constexpr Places places_by(Place place) {
  Places places = {};
  for (unsigned i = 0; i < kBlock; ++i) places[i] = static_cast<uint8_t>(place(i));
  return places;
}

// Bytes of two vectors that become one: of the units in both, or the first with the second as high bytes.
alignas(kBlock) constexpr Places kLowBytes = places_by([](unsigned i) { return 2 * i; });
alignas(kBlock) constexpr Places kHighBytes = places_by([](unsigned i) { return 2 * i + 1; });
alignas(kBlock) constexpr Places kFrontUnits = places_by([](unsigned i) { return i / 2 + (i % 2) * kBlock; });
alignas(kBlock) constexpr Places kBackUnits = places_by([](unsigned i) { return (kBlock + i) / 2 + (i % 2) * kBlock; });
// Lanes of four bytes: the same byte in all of them, and the steps from the first.
alignas(kBlock) constexpr Places kOwnPlace = places_by([](unsigned i) { return i; });
alignas(kBlock) constexpr Places kLane = places_by([](unsigned i) { return i / 4; });
alignas(kBlock) constexpr Places kStep = places_by([](unsigned i) { return i % 4; });

LX_VECTOR inline __m512i load(const Places& places) { return _mm512_load_si512(places.data()); }
LX_VECTOR inline __m512i pick(const Places& places, __m512i a, __m512i b) {
  return _mm512_permutex2var_epi8(a, load(places), b);
}
LX_VECTOR inline __m512i all_bytes(unsigned value) { return _mm512_set1_epi8(static_cast<char>(value)); }

// The lowest `count` bits.
LX_VECTOR inline uint64_t first(size_t count) { return _bzhi_u64(~uint64_t{0}, static_cast<unsigned>(count)); }
LX_VECTOR inline uint32_t low_half(uint64_t mask) { return static_cast<uint32_t>(mask); }
LX_VECTOR inline uint32_t high_half(uint64_t mask) { return static_cast<uint32_t>(mask >> 32); }
LX_VECTOR inline size_t ones(uint64_t mask) { return static_cast<size_t>(_mm_popcnt_u64(mask)); }
LX_VECTOR inline size_t zeros_below(uint64_t mask) { return static_cast<size_t>(_tzcnt_u64(mask)); }

// A table of 256 bytes in four registers.
struct VectorTable {
  __m512i rows[4];
};

LX_VECTOR inline VectorTable table_of(const uint8_t* bytes) {
  VectorTable table;
  for (unsigned row = 0; row < 4; ++row) table.rows[row] = _mm512_loadu_si512(bytes + kBlock * row);
  return table;
}

LX_VECTOR inline VectorTable table_of(const uint16_t* units, const Places& places) {
  VectorTable table;
  for (unsigned row = 0; row < 4; ++row) {
    const uint16_t* at = units + kBlock * row;
    table.rows[row] = pick(places, _mm512_loadu_si512(at), _mm512_loadu_si512(at + kBlock / 2));
  }
  return table;
}

LX_VECTOR inline __m512i look_up(const VectorTable& table, __m512i bytes) {
  __m512i lower = _mm512_permutex2var_epi8(table.rows[0], bytes, table.rows[1]);
  __m512i upper = _mm512_permutex2var_epi8(table.rows[2], bytes, table.rows[3]);
  return _mm512_mask_mov_epi8(lower, _mm512_movepi8_mask(bytes), upper);
}

// The bytes of a single-byte page as UCS-2, in two vectors of bytes.
struct UnicodeTable {
  VectorTable low;
  VectorTable high;
  bool latin1;

  LX_VECTOR explicit UnicodeTable(const CodePage& page) : latin1(page.latin1) {
    if (latin1) {
      low = table_of(page.latin1_of_byte);
    } else {
      low = table_of(page.to_unicode, kLowBytes);
      high = table_of(page.to_unicode, kHighBytes);
    }
  }
  LX_VECTOR __m512i high_bytes(__m512i bytes) const { return latin1 ? _mm512_setzero_si512() : look_up(high, bytes); }
};

// Writes units below 0x800 as UTF-8 and counts them in; false: they do not fit.
LX_VECTOR inline bool put_utf8(__m512i units, size_t count, Run<uint8_t, uint8_t>& run) {
  __m512i lead = _mm512_srli_epi16(units, 6);
  __m512i continuation = _mm512_slli_epi16(_mm512_and_si512(units, _mm512_set1_epi16(0x3F)), 8);
  __m512i pair = _mm512_or_si512(_mm512_or_si512(lead, continuation), _mm512_set1_epi16(static_cast<short>(0x80C0)));
  __mmask32 two = _mm512_cmpgt_epu16_mask(units, _mm512_set1_epi16(0x7F));
  __m512i bytes = _mm512_mask_mov_epi16(units, two, pair);
  // Of ASCII characters only the low byte counts.
  uint64_t wanted = (_mm512_movepi8_mask(bytes) | 0x5555555555555555u) & first(2 * count);
  size_t size = ones(wanted);
  if (static_cast<size_t>(run.out_end - run.out) < size) return false;
  _mm512_mask_storeu_epi8(run.out, first(size), _mm512_maskz_compress_epi8(wanted, bytes));
  run.in += count;
  run.out += size;
  return true;
}

// The bytes that the first `characters` characters of a block take up; `ends` marks the last byte of each.
LX_VECTOR inline size_t length_of(size_t characters, uint64_t ends) {
  return kBlock - static_cast<size_t>(_lzcnt_u64(_pdep_u64(first(characters), ends)));
}

}  // namespace

bool has_table_vectors() {
  return allowed_vectors >= Vectors::tables && __builtin_cpu_supports("avx512vbmi2") != 0 &&
         __builtin_cpu_supports("avx512vbmi") != 0 && __builtin_cpu_supports("avx512vl") != 0 &&
         __builtin_cpu_supports("bmi2") != 0;
}

LX_VECTOR void map_bytes_vectors(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out) {
  VectorTable vectors = table_of(table);
  for (size_t done = 0; done < count; done += kBlock) {
    uint64_t here = first(std::min(kBlock, count - done));
    _mm512_mask_storeu_epi8(out + done, here, look_up(vectors, _mm512_maskz_loadu_epi8(here, in + done)));
  }
}

LX_VECTOR void to_ucs2_vectors(const CodePage& page, Run<uint8_t, uint16_t>& run) {
  UnicodeTable table(page);
  auto count = static_cast<size_t>(std::min<ptrdiff_t>(run.in_end - run.in, run.out_end - run.out));
  for (size_t done = 0; done < count; done += kBlock) {
    uint64_t here = first(std::min(kBlock, count - done));
    __m512i bytes = _mm512_maskz_loadu_epi8(here, run.in + done);
    __m512i low = look_up(table.low, bytes);
    __m512i high = table.high_bytes(bytes);
    _mm512_mask_storeu_epi16(run.out + done, low_half(here), pick(kFrontUnits, low, high));
    _mm512_mask_storeu_epi16(run.out + done + kBlock / 2, high_half(here), pick(kBackUnits, low, high));
  }
  run.in += count;
  run.out += count;
}

LX_VECTOR void from_ucs2_vectors(const CodePage& page, Run<uint16_t, uint8_t>& run) {
  VectorTable table = table_of(page.byte_of_latin1);
  __m512i last = _mm512_set1_epi16(0xFF);
  for (;;) {
    auto left = static_cast<size_t>(std::min<ptrdiff_t>(run.in_end - run.in, run.out_end - run.out));
    size_t length = std::min(kBlock, left);
    uint64_t here = first(length);
    __m512i front = _mm512_maskz_loadu_epi16(low_half(here), run.in);
    __m512i back = _mm512_maskz_loadu_epi16(high_half(here), run.in + kBlock / 2);
    uint64_t beyond = uint64_t{_mm512_cmpgt_epu16_mask(back, last)} << 32 | _mm512_cmpgt_epu16_mask(front, last);
    if (beyond != 0) [[unlikely]]
      length = zeros_below(beyond);
    _mm512_mask_storeu_epi8(run.out, first(length), look_up(table, pick(kLowBytes, front, back)));
    run.in += length;
    run.out += length;
    if (length < kBlock) return;
  }
}

LX_VECTOR void to_utf8_vectors(const CodePage& page, Run<uint8_t, uint8_t>& run) {
  UnicodeTable table(page);
  while (run.in != run.in_end) {
    size_t length = std::min(kBlock, static_cast<size_t>(run.in_end - run.in));
    uint64_t here = first(length);
    __m512i bytes = _mm512_maskz_loadu_epi8(here, run.in);
    __m512i low = look_up(table.low, bytes);
    __m512i high = table.high_bytes(bytes);
    if (((_mm512_movepi8_mask(low) | _mm512_test_epi8_mask(high, high)) & here) == 0) {  // nothing but ASCII
      if (static_cast<size_t>(run.out_end - run.out) < length) return;
      _mm512_mask_storeu_epi8(run.out, here, low);
      run.in += length;
      run.out += length;
      continue;
    }
    uint64_t three = _mm512_cmpgt_epu8_mask(high, all_bytes(7)) & here;
    if (three != 0) [[unlikely]]
      length = zeros_below(three);
    size_t front = std::min(length, kBlock / 2);
    if (!put_utf8(pick(kFrontUnits, low, high), front, run)) return;
    if (!put_utf8(pick(kBackUnits, low, high), length - front, run)) return;
    if (three != 0) return;
  }
}

// ASCII, and the two-byte sequences that begin with C2 or C3. A continuation byte is the character that it ends, once
// C3 has added 0x40; lead bytes are left out.
LX_VECTOR void from_utf8_vectors(const CodePage& page, Run<uint8_t, uint8_t>& run) {
  VectorTable table = table_of(page.byte_of_latin1);
  for (bool more = true; more;) {
    auto left = static_cast<size_t>(std::min<ptrdiff_t>(run.in_end - run.in, run.out_end - run.out));
    size_t length = std::min(kBlock, left);
    more = length == kBlock;
    uint64_t ends = first(length);
    __m512i bytes = _mm512_maskz_loadu_epi8(ends, run.in);
    if (uint64_t high = _mm512_movepi8_mask(bytes); high != 0) {
      uint64_t c3 = _mm512_cmpeq_epi8_mask(bytes, all_bytes(0xC3));
      uint64_t leads = c3 | _mm512_cmpeq_epi8_mask(bytes, all_bytes(0xC2));
      uint64_t continuations = _mm512_cmplt_epi8_mask(bytes, all_bytes(0xC0));
      uint64_t wrong = ((leads << 1 ^ continuations) | (high & ~(leads | continuations))) & ends;
      if (wrong != 0) [[unlikely]] {
        ends = first(zeros_below(wrong));
        more = false;
      }
      ends &= ~leads;
      length = more ? kBlock - (leads >> 63) : length_of(kBlock, ends);
      bytes = _mm512_mask_add_epi8(bytes, c3 << 1, bytes, all_bytes(0x40));
      bytes = _mm512_maskz_compress_epi8(ends, bytes);
    }
    size_t characters = ones(ends);
    __m512i result = look_up(table, bytes);
    uint64_t doubtful = _mm512_cmpeq_epi8_mask(result, all_bytes(page.substitution)) & first(characters);
    if (doubtful != 0) [[unlikely]] {
      characters = zeros_below(doubtful);
      length = length_of(characters, ends);
      more = false;
    }
    _mm512_mask_storeu_epi8(run.out, first(characters), result);
    run.in += length;
    run.out += characters;
  }
}

// Every character gets a lane of its own, with its first three bytes.
LX_VECTOR void decode_utf8(const uint8_t* text, size_t size, Utf8Block& block) {
  uint64_t here = first(std::min(kBlock, size));
  __m512i bytes = _mm512_maskz_loadu_epi8(here, text);
  uint64_t continuations = _mm512_cmplt_epi8_mask(bytes, all_bytes(0xC0));
  uint64_t high = _mm512_movepi8_mask(bytes);
  uint64_t three = _mm512_cmpge_epu8_mask(bytes, all_bytes(0xE0));
  uint64_t two = high & ~continuations & ~three;
  uint64_t wrong =
      ((two << 1 | three << 1 | three << 2) ^ continuations) | _mm512_cmpge_epu8_mask(bytes, all_bytes(0xF0));
  uint64_t ends = (~high | two << 1 | three << 2) & here;
  if ((wrong & here) != 0) [[unlikely]]
    ends &= first(zeros_below(wrong & here));
  size_t count = std::min(Utf8Block::kMost, ones(ends));

  __m512i starts = _mm512_maskz_compress_epi8(~continuations, load(kOwnPlace));
  __m512i lanes =
      _mm512_permutexvar_epi8(_mm512_add_epi8(_mm512_permutexvar_epi8(load(kLane), starts), load(kStep)), bytes);
  __m512i low_bits = _mm512_set1_epi32(0x3F);
  __m512i first_byte = _mm512_and_si512(lanes, _mm512_set1_epi32(0xFF));
  __m512i second = _mm512_and_si512(_mm512_srli_epi32(lanes, 8), low_bits);
  __m512i third = _mm512_and_si512(_mm512_srli_epi32(lanes, 16), low_bits);
  __mmask16 long_ones = _mm512_cmpge_epu32_mask(first_byte, _mm512_set1_epi32(0xC0));
  __mmask16 longest = _mm512_cmpge_epu32_mask(first_byte, _mm512_set1_epi32(0xE0));
  __m512i pair = _mm512_or_si512(_mm512_slli_epi32(_mm512_and_si512(first_byte, _mm512_set1_epi32(0x1F)), 6), second);
  __m512i triple = _mm512_or_si512(_mm512_slli_epi32(pair, 6), third);
  __m512i units = _mm512_mask_mov_epi32(_mm512_mask_mov_epi32(first_byte, long_ones, pair), longest, triple);

  // Longer than need be, or half a character beyond UCS-2.
  uint32_t bad = _mm512_mask_cmplt_epu32_mask(long_ones, units, _mm512_set1_epi32(0x80)) |
                 _mm512_mask_cmplt_epu32_mask(longest, units, _mm512_set1_epi32(0x800)) |
                 _mm512_cmpeq_epi32_mask(_mm512_and_si512(units, _mm512_set1_epi32(0xF800)), _mm512_set1_epi32(0xD800));
  if (bad != 0) [[unlikely]]
    count = std::min(count, zeros_below(bad));
  _mm256_storeu_si256(reinterpret_cast<__m256i*>(block.characters), _mm512_cvtepi32_epi16(units));
  block.count = count;
  block.length = length_of(count, ends);
}

}  // namespace lx

#else

namespace lx {

bool has_table_vectors() { return false; }
void map_bytes_vectors(const uint8_t*, const uint8_t*, size_t, uint8_t*) {}
void to_utf8_vectors(const CodePage&, Run<uint8_t, uint8_t>&) {}
void from_utf8_vectors(const CodePage&, Run<uint8_t, uint8_t>&) {}
void to_ucs2_vectors(const CodePage&, Run<uint8_t, uint16_t>&) {}
void from_ucs2_vectors(const CodePage&, Run<uint16_t, uint8_t>&) {}
void decode_utf8(const uint8_t*, size_t, Utf8Block& block) { block.count = block.length = 0; }

}  // namespace lx

#endif
