// SPDX-License-Identifier: Apache-2.0
// Readers take text apart into characters, one kind of text each. A reader is a small value; a copy is a bookmark.
//
//   done()               nothing left
//   next(character)      the next character as UCS-2, or why there is none
//   next_packed(value)   the next character as it is, packed
//   fast_characters()    how many calls of next_fast are allowed without a look at the end of the text
//   next_fast(character) as next, for well-formed characters only; false: ask next instead (the reader may have moved)
#pragma once

#include <cstddef>
#include <cstdint>

#include "codepage/text/byte_runs.hpp"
#include "codepage/text/packed.hpp"
#include "objects/code_page.hpp"

namespace lx {

enum class Got : uint8_t {
  character,
  end,
  partial,  // the text ends inside a character, on which the reader stays
  shift,    // a shift byte that changes nothing (strict reading only)
};

// What the readers of bytes have in common.
struct ByteReader {
  using Unit = uint8_t;
  static constexpr bool kShifted = false;

  const CodePage* page;
  const uint8_t* at;
  const uint8_t* end;
  const uint8_t* start;  // of the character read last
  bool strict = false;   // what is not well-formed ends before the first byte that does not fit

  ByteReader(const CodePage& code_page, const uint8_t* text, size_t length)
      : page(&code_page), at(text), end(text + length), start(text) {}

  bool done() const { return at == end; }
  size_t left() const { return static_cast<size_t>(end - at); }
  // The character of `length` bytes that begins here, when it is all there.
  bool take(size_t length) {
    if (left() < length) return false;
    start = at;
    at += length;
    return true;
  }
};

// The way from the bytes of one single-byte page to those of another.
struct ByteMap {
  uint8_t value[256];
  bool inexact[256];  // unassigned in the source, or missing in the target
  bool exact;         // none is inexact

  ByteMap(const CodePage& from, const CodePage& to);
};

// Every byte is a character.
struct SingleByteReader : ByteReader {
  using ByteReader::ByteReader;
  const ByteMap* map = nullptr;  // to the page of the writer, where somebody has made it

  Got next(uint16_t& character) {
    if (!take(1)) return Got::end;
    character = page->to_unicode[*start];
    return Got::character;
  }
  Got next_packed(uint32_t& value) {
    if (!take(1)) return Got::end;
    value = *start;
    return Got::character;
  }
  size_t fast_characters() const { return left(); }
  bool next_fast(uint16_t& character) {
    character = page->to_unicode[*at++];
    return true;
  }
};

// The first byte tells the length.
struct MultibyteReader : ByteReader {
  using ByteReader::ByteReader;

  Got next(uint16_t& character) {
    if (done()) return Got::end;
    size_t length = page->char_length[*at];
    if (!take(length)) return Got::partial;
    character = length == 1 ? page->to_unicode[*start] : page->decode(start);
    if (character == kUnassigned && strict && length > 1) [[unlikely]]
      at = start + well_formed_prefix();
    return Got::character;
  }
  Got next_packed(uint32_t& value) {
    if (done()) return Got::end;
    size_t length = page->char_length[*at];
    if (!take(length)) return Got::partial;
    value = pack(start, length);
    return Got::character;
  }
  size_t fast_characters() const { return left() / kMaxCharacterLength; }
  bool next_fast(uint16_t& character) {
    size_t length = page->char_length[*at];
    character = length == 1 ? page->to_unicode[*at] : page->decode(at);
    at += length;
    return true;
  }

 private:
  // Bytes that some character of the page could begin with; at least one. A lead byte before a control character or
  // a line end does not swallow it.
  size_t well_formed_prefix() const {
    const ToUnicodeState* states = page->raw.states;
    if (states == nullptr) return 1;
    const ToUnicodeState* state = states;
    const uint8_t* byte = start;
    while (byte < at && *byte >= state->low && *byte <= state->high) {
      if (state->final != 0) return static_cast<size_t>(byte + 1 - start);
      state = states + state->index + (*byte & state->mask);
      ++byte;
    }
    return byte == start ? 1 : static_cast<size_t>(byte - start);
  }
};

// Multibyte text converted by rule.
struct Utf8Reader : ByteReader {
  using ByteReader::ByteReader;

  static uint16_t decode(const uint8_t* bytes) {
    if (bytes[0] < 0xE0) return static_cast<uint16_t>((bytes[0] & 0x1F) << 6 | (bytes[1] & 0x3F));
    return static_cast<uint16_t>((bytes[0] & 0x0F) << 12 | (bytes[1] & 0x3F) << 6 | (bytes[2] & 0x3F));
  }

  Got next(uint16_t& character) {
    if (done()) return Got::end;
    if (strict && *at >= 0x80) return next_strict(character);
    size_t length = page->char_length[*at];
    if (!take(length)) return Got::partial;
    character = length == 1 ? page->to_unicode[*start] : decode(start);
    return Got::character;
  }
  Got next_packed(uint32_t& value) {
    if (done()) return Got::end;
    size_t length = page->char_length[*at];
    if (!take(length)) return Got::partial;
    value = pack(start, length);
    return Got::character;
  }
  size_t fast_characters() const { return page->standard_utf8 ? left() / 3 : 0; }
  bool next_fast(uint16_t& character) {
    unsigned first = *at;
    if (first < 0x80) {
      character = static_cast<uint16_t>(first);
      at += 1;
      return true;
    }
    unsigned second = at[1] ^ 0x80u;  // below 0x40 for a continuation byte
    if (first - 0xE0 < 0x10) {
      unsigned third = at[2] ^ 0x80u;
      unsigned value = (first & 0x0F) << 12 | second << 6 | third;
      character = static_cast<uint16_t>(value);
      at += 3;
      return (second | third) < 0x40 && value >= 0x800 && value - 0xD800 >= 0x800;
    }
    character = static_cast<uint16_t>((first & 0x1F) << 6 | second);
    at += 2;
    return first - 0xC2 < 0x1E && second < 0x40;
  }

 private:
  // Well-formed sequences beyond UCS-2 and the longest beginnings of broken ones are one U+FFFD each.
  Got next_strict(uint16_t& character) {
    unsigned first = *at;
    size_t length = first < 0xC2 || first > 0xF4 ? 1 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
    uint8_t low = first == 0xE0 ? 0xA0 : first == 0xF0 ? 0x90 : 0x80;
    uint8_t high = first == 0xED ? 0x9F : first == 0xF4 ? 0x8F : 0xBF;
    size_t fits = 1;
    for (; fits < length; ++fits) {
      if (fits == left()) return Got::partial;
      if (at[fits] < low || at[fits] > high) break;
      low = 0x80;
      high = 0xBF;
    }
    take(fits);
    character = length > 1 && length < 4 && fits == length ? decode(start) : kUnassigned;
    return Got::character;
  }
};

// Mixed host text: shift bytes begin and end runs of double-byte characters. One shift byte is looked at before each
// character; strict reading looks at all of them.
struct ShiftedReader : ByteReader {
  static constexpr bool kShifted = true;

  bool double_byte;
  bool past_shift = false;             // the character begins here, whatever its first byte
  const uint8_t* odd_shift = nullptr;  // a shift byte that changed nothing, until somebody takes note of it

  ShiftedReader(const CodePage& code_page, const uint8_t* text, size_t length, uint32_t state)
      : ByteReader(code_page, text, length), double_byte(state != 0) {}

  bool at_shift() const { return *at == page->enter_byte || *at == page->leave_byte; }
  size_t length_here() const { return double_byte ? page->max_length : size_t{1}; }
  uint16_t decode() const {
    if (!double_byte) return page->to_unicode[*start];
    return page->kind == PageKind::utf8 ? Utf8Reader::decode(start) : page->decode(start);
  }

  Got next(uint16_t& character) {
    Got got = find_character();
    if (got != Got::character) return got;
    character = decode();
    return got;
  }
  Got next_packed(uint32_t& value) {
    Got got = find_character();
    if (got != Got::character) return got;
    value = pack(start, static_cast<size_t>(at - start));
    return got;
  }
  size_t fast_characters() const { return past_shift ? 0 : left() / (kMaxCharacterLength + 1); }
  bool next_fast(uint16_t& character) {
    if (at_shift()) [[unlikely]] {
      bool enters = *at == page->enter_byte;
      if (enters == double_byte) return false;
      double_byte = enters;
      ++at;
      if (at_shift()) return false;
    }
    start = at;
    at += length_here();
    character = decode();
    return true;
  }

 private:
  Got find_character() {
    if (!past_shift && !done() && at_shift()) {
      bool enters = *at == page->enter_byte;
      if (enters == double_byte) odd_shift = at;
      double_byte = enters;
      ++at;
      if (strict && !done() && at_shift()) return Got::shift;
    }
    if (done()) return Got::end;
    past_shift = !take(length_here());
    return past_shift ? Got::partial : Got::character;
  }
};

// Packed characters.
struct WideReader {
  using Unit = uint32_t;
  static constexpr bool kShifted = false;

  const CodePage* page;
  const uint32_t* at;
  const uint32_t* end;

  WideReader(const CodePage& code_page, const uint32_t* text, size_t length)
      : page(&code_page), at(text), end(text + length) {}

  bool done() const { return at == end; }
  Got next(uint16_t& character) {
    uint32_t value = 0;
    if (next_packed(value) == Got::end) return Got::end;
    character = unicode_of_packed(*page, value);
    return Got::character;
  }
  Got next_packed(uint32_t& value) {
    if (done()) return Got::end;
    value = *at++;
    return Got::character;
  }
  size_t fast_characters() const { return static_cast<size_t>(end - at); }
  bool next_fast(uint16_t& character) {
    character = unicode_of_packed(*page, *at++);
    return true;
  }

  static uint16_t unicode_of_packed(const CodePage& page, uint32_t value) {
    if (value <= 0xFF) return page.to_unicode[value];
    uint8_t bytes[kMaxCharacterLength] = {};
    unpack(bytes, value);
    return page.kind == PageKind::utf8 ? Utf8Reader::decode(bytes) : page.decode(bytes);
  }
};

struct Ucs2Reader {
  using Unit = uint16_t;
  static constexpr bool kShifted = false;

  const uint16_t* at;
  const uint16_t* end;

  Ucs2Reader(const uint16_t* text, size_t length) : at(text), end(text + length) {}

  bool done() const { return at == end; }
  Got next(uint16_t& character) {
    if (done()) return Got::end;
    character = *at++;
    return Got::character;
  }
  size_t fast_characters() const { return static_cast<size_t>(end - at); }
  bool next_fast(uint16_t& character) {
    character = *at++;
    return true;
  }
};

}  // namespace lx
