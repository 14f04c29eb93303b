// SPDX-License-Identifier: Apache-2.0
#include "codepage/text/byte_runs.hpp"

#include <algorithm>
#include <cstring>

#include "codepage/text/vector_runs.hpp"

#if defined(__x86_64__)
#include <immintrin.h>
#define LX_AVX2 1
#endif

namespace lx {

Vectors allowed_vectors = Vectors::tables;

namespace {

constexpr uint64_t kHighBits = 0x8080808080808080u;

uint64_t load_word(const uint8_t* from) {
  uint64_t word;
  std::memcpy(&word, from, sizeof word);
  return word;
}

#ifdef LX_AVX2

constexpr size_t kBlock = 32;

bool has_avx2() { return allowed_vectors >= Vectors::blocks && __builtin_cpu_supports("avx2") != 0; }

// A table lookup for 32 bytes. The table's rows of 16 are kept as differences from the row before: a shuffle takes from
// every row up to the right one, and the differences add up to its value. Behind the right row the index is negative,
// for which a shuffle gives nothing. The upper half of the table is a table of its own.
struct VectorTable {
  __m256i rows[16];
};

__attribute__((target("avx2"))) inline void load_rows(VectorTable& table, const uint8_t* bytes, unsigned count) {
  __m128i before = _mm_setzero_si128();
  for (unsigned row = 0; row < count; ++row) {
    if (row == 8) before = _mm_setzero_si128();
    __m128i values = _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes + 16 * row));
    table.rows[row] = _mm256_broadcastsi128_si256(_mm_xor_si128(values, before));
    before = values;
  }
}

__attribute__((target("avx2"))) inline __m256i look_up_half(const __m256i* rows, __m256i bytes) {
  __m256i row_size = _mm256_set1_epi8(16);
  __m256i result = _mm256_shuffle_epi8(rows[0], bytes);
  for (unsigned row = 1; row < 8; ++row) {
    bytes = _mm256_subs_epi8(bytes, row_size);
    result = _mm256_xor_si256(result, _mm256_shuffle_epi8(rows[row], bytes));
  }
  return result;
}

// Bytes above 0x7F are negative in one half, the others in the other.
template <unsigned kRows>
__attribute__((target("avx2"))) inline __m256i look_up(const VectorTable& table, __m256i bytes) {
  __m256i result = look_up_half(table.rows, bytes);
  if constexpr (kRows == 16) {
    __m256i upper = _mm256_xor_si256(bytes, _mm256_set1_epi8(static_cast<char>(0x80)));
    result = _mm256_or_si256(result, look_up_half(table.rows + 8, upper));
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

__attribute__((target("avx2"))) size_t map_from_ascii_blocks(const uint8_t* table, uint8_t from, const uint8_t* in,
                                                             size_t count, uint8_t* out) {
  VectorTable vectors;
  load_rows(vectors, table, 8);
  // Compared as signed bytes, what is not ASCII is below everything.
  __m256i below = _mm256_set1_epi8(static_cast<char>(from - 1));
  size_t done = 0;
  for (; count - done >= kBlock; done += kBlock) {
    __m256i block = load_block(in + done);
    if (_mm256_movemask_epi8(_mm256_cmpgt_epi8(block, below)) != -1) break;
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

// Bytes are mapped in pieces; a piece is done with before the next one begins, so that what is read back from it has
// long been written.
constexpr size_t kPiece = 256;

// ASCII goes over in blocks; before each other character the block is stored as far as it is right, and begun anew
// behind it. `ascii` holds the piece as ASCII, with the high bit set where it is something else. `text` has room to
// spare for the last block. Returns the number of characters carried; `end` is behind their text.
__attribute__((target("avx2"))) size_t piece_to_utf8(const CodePage& page, const uint8_t* ascii, const uint8_t* in,
                                                     size_t count, uint8_t* text, uint8_t*& end) {
  size_t done = 0;
  while (done < count) {
    __m256i block = load_block(ascii + done);
    auto others = static_cast<unsigned>(_mm256_movemask_epi8(block));
    store_block(text, block);
    size_t plain = others == 0 ? kBlock : static_cast<size_t>(__builtin_ctz(others));
    if (plain > count - done) plain = count - done;
    done += plain;
    text += plain;
    for (; done < count && ascii[done] >= 0x80; ++done) {
      uint32_t character = page.utf8_of_byte[in[done]];
      if (character == 0) {
        end = text;
        return done;
      }
      std::memcpy(text, &character, sizeof character);
      text += character >> 24;
    }
  }
  end = text;
  return done;
}

// The text of a piece is made aside, since it is stored in blocks that reach beyond its end.
void to_utf8_blocks(const CodePage& page, Run<uint8_t, uint8_t>& run) {
  uint8_t ascii[kPiece + kBlock];
  uint8_t text[3 * kPiece + kBlock];
  for (;;) {
    auto left = static_cast<size_t>(run.in_end - run.in);
    auto room = static_cast<size_t>(run.out_end - run.out);
    size_t count = std::min({left, room, kPiece}) / kBlock * kBlock;
    if (count == 0) return;
    if (page.ascii_bytes) {
      std::memcpy(ascii, run.in, count);
    } else {
      map_bytes_blocks(page.ascii_of_byte, run.in, count, ascii);
    }
    std::memset(ascii + count, 0, kBlock);
    uint8_t* end = text;
    size_t done = piece_to_utf8(page, ascii, run.in, count, text, end);
    auto size = static_cast<size_t>(end - text);
    if (size > room) return;
    std::memcpy(run.out, text, size);
    run.in += done;
    run.out += size;
    if (done < count) return;
  }
}

// One character of two or three bytes; null: not well-formed, or nothing to be sure of.
inline const uint8_t* sequence_from_utf8(const CodePage& page, const uint8_t* in, uint8_t* out) {
  unsigned first = in[0];
  unsigned second = in[1] ^ 0x80u;  // below 0x40 for a continuation byte
  unsigned character = (first & 0x1F) << 6 | second;
  size_t length = 2;
  bool sound = first >= 0xC2 && second < 0x40;
  if (first >= 0xE0) {
    unsigned third = in[2] ^ 0x80u;
    character = (first & 0x0F) << 12 | second << 6 | third;
    length = 3;
    sound = first < 0xF0 && (second | third) < 0x40 && character >= 0x800;  // no page has surrogates
  }
  if (!sound) return nullptr;
  uint32_t packed = page.from_narrow[character >> 8][character & 0xFF];
  if (packed == page.substitution) return nullptr;
  *out = static_cast<uint8_t>(packed);
  return in + length;
}

// Carries a piece as far as it goes; false: the caller has to look at what comes next.
__attribute__((target("avx2"))) bool piece_from_utf8(const CodePage& page, const VectorTable& vectors,
                                                     Run<uint8_t, uint8_t>& run) {
  __m256i below = _mm256_set1_epi8(static_cast<char>(page.ascii_from - 1));
  const uint8_t* in = run.in;
  uint8_t* out = run.out;
  while (static_cast<size_t>(run.in_end - in) >= kBlock && out < run.out_end) {
    __m256i block = load_block(in);
    auto others = ~static_cast<unsigned>(_mm256_movemask_epi8(_mm256_cmpgt_epi8(block, below)));
    store_block(out, page.ascii_bytes ? block : look_up<8>(vectors, block));
    size_t plain = others == 0 ? kBlock : static_cast<size_t>(__builtin_ctz(others));
    in += plain;
    out += plain;
    if (plain == kBlock) continue;
    const uint8_t* next = in;
    while (run.in_end - in >= 3 && out < run.out_end && *in >= 0x80) {
      next = sequence_from_utf8(page, in, out);
      if (next == nullptr) break;
      in = next;
      ++out;
    }
    if (next == nullptr || *in < page.ascii_from) {
      run.in = in;
      run.out = out;
      return false;
    }
  }
  run.in = in;
  run.out = out;
  return true;
}

__attribute__((target("avx2"))) void from_utf8_blocks(const CodePage& page, Run<uint8_t, uint8_t>& run) {
  VectorTable vectors;
  load_rows(vectors, page.byte_of_latin1, 8);
  uint8_t text[kPiece + kBlock];
  for (;;) {
    auto left = static_cast<size_t>(run.in_end - run.in);
    auto room = static_cast<size_t>(run.out_end - run.out);
    // So much of the input that its text fits.
    size_t count = std::min({left, room, kPiece});
    if (count < kBlock) return;
    Run<uint8_t, uint8_t> piece = {run.in, run.in + count, text, text + kPiece};
    bool more = piece_from_utf8(page, vectors, piece);
    auto size = static_cast<size_t>(piece.out - text);
    std::memcpy(run.out, text, size);
    run.in = piece.in;
    run.out += size;
    if (!more || size == 0) return;
  }
}

// Whole blocks of a piece that both sides have room for.
template <class In, class Out>
size_t piece_size(const Run<In, Out>& run) {
  auto count = static_cast<size_t>(run.in_end - run.in);
  if (static_cast<size_t>(run.out_end - run.out) < count) count = static_cast<size_t>(run.out_end - run.out);
  return (count < kPiece ? count : kPiece) / kBlock * kBlock;
}

__attribute__((target("avx2"))) void to_ucs2_blocks(const CodePage& page, Run<uint8_t, uint16_t>& run) {
  uint8_t mapped[kPiece];
  while (size_t count = piece_size(run)) {
    const uint8_t* piece = run.in;
    if (!page.latin1_bytes) {
      map_bytes_blocks(page.latin1_of_byte, piece, count, mapped);
      piece = mapped;
    }
    for (size_t i = 0; i < count; i += kBlock) {
      __m256i block = load_block(piece + i);
      auto* out = reinterpret_cast<uint8_t*>(run.out + i);
      store_block(out, _mm256_cvtepu8_epi16(_mm256_castsi256_si128(block)));
      store_block(out + kBlock, _mm256_cvtepu8_epi16(_mm256_extracti128_si256(block, 1)));
    }
    run.in += count;
    run.out += count;
  }
}

__attribute__((target("avx2"))) void from_ucs2_blocks(const CodePage& page, Run<uint16_t, uint8_t>& run) {
  __m256i beyond = _mm256_set1_epi16(static_cast<short>(0xFF00));
  uint8_t packed[kPiece];
  while (size_t count = piece_size(run)) {
    uint8_t* piece = page.latin1_bytes ? run.out : packed;
    size_t done = 0;
    for (; done < count; done += kBlock) {
      const auto* in = reinterpret_cast<const uint8_t*>(run.in + done);
      __m256i first = load_block(in);
      __m256i second = load_block(in + kBlock);
      if (!_mm256_testz_si256(_mm256_or_si256(first, second), beyond)) break;
      // Packing works on halves of 128 bits, which are put in order afterwards.
      store_block(piece + done, _mm256_permute4x64_epi64(_mm256_packus_epi16(first, second), 0xD8));
    }
    if (!page.latin1_bytes) map_bytes_blocks(page.byte_of_latin1, packed, done, run.out);
    run.in += done;
    run.out += done;
    if (done < count) return;
  }
}

// Below this the plain loops are as quick as loading the rows.
constexpr size_t kWorthwhile = 64;
constexpr size_t kWorthPieces = 192;

#define LX_BLOCKS(call) (count >= kWorthwhile && has_avx2() ? (call) : 0)
#define LX_RUN_BLOCKS(least, call) \
  if (static_cast<size_t>(run.in_end - run.in) >= (least) && has_avx2()) call
#else
#define LX_BLOCKS(call) \
  size_t { 0 }
#define LX_RUN_BLOCKS(least, call)
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

size_t map_from_ascii(const uint8_t* table, uint8_t from, const uint8_t* in, size_t count, uint8_t* out) {
  size_t done = LX_BLOCKS(map_from_ascii_blocks(table, from, in, count, out));
  for (; done < count && in[done] >= from && in[done] < 0x80; ++done) out[done] = table[in[done]];
  return done;
}

void map_bytes(const uint8_t* table, const uint8_t* in, size_t count, uint8_t* out) {
  if (count >= kWorthVectors && has_table_vectors()) return map_bytes_vectors(table, in, count, out);
  size_t done = LX_BLOCKS(map_bytes_blocks(table, in, count, out));
  for (; done < count; ++done) out[done] = table[in[done]];
}

namespace {

template <class In, class Out>
bool worth_vectors(const Run<In, Out>& run) {
  return static_cast<size_t>(run.in_end - run.in) >= kWorthVectors && has_table_vectors();
}

}  // namespace

void carry_to_utf8(const CodePage& page, Run<uint8_t, uint8_t>& run) {
  if (worth_vectors(run)) return to_utf8_vectors(page, run);
  LX_RUN_BLOCKS(kWorthPieces, to_utf8_blocks(page, run));
}

void carry_from_utf8(const CodePage& page, Run<uint8_t, uint8_t>& run) {
  if (worth_vectors(run)) return from_utf8_vectors(page, run);
  LX_RUN_BLOCKS(kWorthPieces, from_utf8_blocks(page, run));
}

void carry_to_ucs2(const CodePage& page, Run<uint8_t, uint16_t>& run) {
  if (worth_vectors(run)) return to_ucs2_vectors(page, run);
  LX_RUN_BLOCKS(kBlock, to_ucs2_blocks(page, run));
}

void carry_from_ucs2(const CodePage& page, Run<uint16_t, uint8_t>& run) {
  if (worth_vectors(run)) return from_ucs2_vectors(page, run);
  LX_RUN_BLOCKS(kBlock, from_ucs2_blocks(page, run));
}

}  // namespace lx
