// SPDX-License-Identifier: Apache-2.0
// Readers take text apart into characters, one kind of text each. A reader is a small value; a copy is a bookmark.
//
//   place(), return_to() a smaller bookmark, for a step that may have to be taken back
//   done()               nothing left
//   next(character)      the next character as UCS-2, or why there is none
//   next_packed(value)   the next character as it is, packed
//   fast_characters()    how many calls of next_fast are allowed without a look at the end of the text
//   next_fast(character) as next, for well-formed characters only; false: ask next instead (the reader may have moved)
#pragma once

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

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
  void skip(size_t length) { at += length; }
  bool turn() { return false; }
  const uint8_t* place() const { return at; }
  void return_to(const uint8_t* place) { at = place; }
  // The character of `length` bytes that begins here, when it is all there.
  bool take(size_t length) {
    if (left() < length) return false;
    start = at;
    at += length;
    return true;
  }
};

// Whether eight bytes of ASCII follow: fewer are not worth a run.
inline bool word_of_ascii(const ByteReader& in) {
  uint64_t word = 0;
  if (in.left() < sizeof word) return false;
  std::memcpy(&word, in.at, sizeof word);
  return (word & 0x8080808080808080u) == 0;
}

// The way from the bytes of one single-byte page to those of another.
struct ByteMap {
  uint8_t value[256];
  bool inexact[256];  // unassigned in the source, or missing in the target
  bool exact;         // none is inexact

  ByteMap(const CodePage& from, const CodePage& to);
};

// Every byte is a character.
struct SingleByteReader : ByteReader {
  const uint16_t* one_byte_;
  SingleByteReader(const CodePage& code_page, const uint8_t* text, size_t length)
      : ByteReader(code_page, text, length), one_byte_(code_page.to_unicode) {}
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
  size_t peek(uint16_t& character) const {
    character = one_byte_[*at];
    return 1;
  }
  bool ascii_ahead() const { return !done() && page->ascii_of_byte[*at] < 0x80; }
};

// The first byte tells the length.
struct VariableLengthReader : ByteReader {
  using ByteReader::ByteReader;

  Got next_packed(uint32_t& value) {
    if (done()) return Got::end;
    size_t length = page->char_length[*at];
    if (!take(length)) return Got::partial;
    value = pack(start, length);
    return Got::character;
  }
  bool ascii_ahead() const { return word_of_ascii(*this); }
};

// Such text converted by tables.
struct MultibyteReader : VariableLengthReader {
  MultibyteReader(const CodePage& code_page, const uint8_t* text, size_t length)
      : VariableLengthReader(code_page, text, length),
        lead_(code_page.lead),
        rows_(code_page.rows),
        one_byte_(code_page.to_unicode) {}

  Got next(uint16_t& character) {
    if (done()) return Got::end;
    size_t length = page->char_length[*at];
    if (strict && length > 1) [[unlikely]]
      return next_strict(character, length);
    if (!take(length)) return Got::partial;
    character = length == 1 ? page->to_unicode[*start] : page->decode(start);
    return Got::character;
  }
  size_t fast_characters() const { return page->max_length == 2 ? left() / 2 : left() / kMaxCharacterLength; }
  size_t peek(uint16_t& character) const {
    unsigned row = lead_[*at];
    if (row < CodePage::kOtherLength) {
      character = rows_[row << 8 | at[1]];
      return 2;
    }
    if (row == CodePage::kNoLead) {
      character = one_byte_[*at];
      return 1;
    }
    character = page->decode(at);
    return page->char_length[*at];
  }

 private:
  // What is no character ends before the first byte that ends or continues none: a lead byte before a control character
  // or a line end does not swallow it. A code without a character, on the other hand, is taken whole.
  Got next_strict(uint16_t& character, size_t length) {
    size_t fits = 1;
    while (fits < length && fits < left() && at[fits] >= page->trail_low && at[fits] <= page->trail_high) ++fits;
    if (fits == left() && fits < length) return Got::partial;
    take(fits);
    character = fits < length ? kUnassigned : page->decode(start);
    return Got::character;
  }

  const uint16_t* lead_;
  const uint16_t* rows_;
  const uint16_t* one_byte_;
};

// And by rule.
struct Utf8Reader : VariableLengthReader {
  using VariableLengthReader::VariableLengthReader;

  static uint16_t decode(const uint8_t* bytes) {
    if (bytes[0] < 0xE0) return static_cast<uint16_t>((bytes[0] & 0x1F) << 6 | (bytes[1] & 0x3F));
    return static_cast<uint16_t>((bytes[0] & 0x0F) << 12 | (bytes[1] & 0x3F) << 6 | (bytes[2] & 0x3F));
  }

  // The first byte lowest.
  static uint32_t load_four(const uint8_t* bytes) {
    uint32_t four = 0;
    std::memcpy(&four, bytes, sizeof four);
    return std::endian::native == std::endian::little ? four : __builtin_bswap32(four);
  }

  static bool well_formed(const uint8_t* bytes, size_t length) {
    auto follows = [=](size_t i) { return (bytes[i] & 0xC0) == 0x80; };
    unsigned first = bytes[0];
    switch (length) {
      case 1:
        return first < 0x80;
      case 2:
        return first >= 0xC2 && first < 0xE0 && follows(1);
      case 3:
        return (first & 0xF0) == 0xE0 && follows(1) && follows(2) && (first != 0xE0 || bytes[1] >= 0xA0) &&
               (first != 0xED || bytes[1] < 0xA0);
      default:
        return first >= 0xF0 && first < 0xF5 && follows(1) && follows(2) && follows(3) &&
               (first != 0xF0 || bytes[1] >= 0x90) && (first != 0xF4 || bytes[1] < 0x90);
    }
  }

  Got next(uint16_t& character) {
    if (done()) return Got::end;
    if (strict && *at >= 0x80) return next_strict(character);
    size_t length = page->char_length[*at];
    if (!take(length)) return Got::partial;
    character = length == 1 ? page->to_unicode[*start] : decode(start);
    return Got::character;
  }
  // No character takes more than three bytes, but peek looks at four.
  size_t fast_characters() const { return page->standard_utf8 && !done() ? (left() - 1) / 3 : 0; }
  size_t peek(uint16_t& character) const {
    uint32_t four = load_four(at);
    if ((four & 0x80) == 0) {
      character = static_cast<uint16_t>(four & 0x7F);
      return 1;
    }
    if ((four & 0xC0C0F0) == 0x8080E0) {
      uint32_t value = (four & 0x0F) << 12 | (four >> 2 & 0xFC0) | (four >> 16 & 0x3F);
      character = static_cast<uint16_t>(value);
      return value - 0x800 < 0xD000 || value >= 0xE000 ? 3 : 0;
    }
    character = static_cast<uint16_t>((four & 0x1F) << 6 | (four >> 8 & 0x3F));
    return (four & 0xC0E0) == 0x80C0 && character >= 0x80 ? 2 : 0;
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
  bool all_shifts = false;             // a shift byte is never a character, however many there are
  const uint8_t* odd_shift = nullptr;  // a shift byte that changed nothing, until somebody takes note of it

  ShiftedReader(const CodePage& code_page, const uint8_t* text, size_t length, uint32_t state)
      : ByteReader(code_page, text, length),
        double_byte(state != 0),
        lead_(code_page.lead),
        rows_(code_page.rows),
        one_byte_(code_page.to_unicode),
        enter_(code_page.enter_byte),
        leave_(code_page.leave_byte) {}

  struct Place {
    const uint8_t* at;
    bool double_byte;
    bool past_shift;
  };
  Place place() const { return {at, double_byte, past_shift}; }
  void return_to(const Place& place) {
    at = place.at;
    double_byte = place.double_byte;
    past_shift = place.past_shift;
    odd_shift = nullptr;
  }

  bool at_shift() const { return *at == page->enter_byte || *at == page->leave_byte; }
  void skip_shifts() {
    for (; !done() && at_shift(); ++at) double_byte = *at == page->enter_byte;
  }
  size_t length_here() const { return double_byte ? page->max_length : size_t{1}; }
  uint16_t decode() const {
    if (!double_byte) return page->to_unicode[*start];
    if (at - start < page->max_length) return kUnassigned;
    return page->decode(start);
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
  // Shift bytes are steps of their own, which look at the byte behind them.
  size_t fast_characters() const {
    if (past_shift) return 0;
    return page->max_length == 2 ? left() / 2 : left() / kMaxCharacterLength;
  }
  size_t peek(uint16_t& character) const {
    if (double_byte) {
      unsigned row = lead_[*at];
      if (row >= CodePage::kOtherLength) return 0;
      character = rows_[row << 8 | at[1]];
      return 2;
    }
    if (*at == enter_ || *at == leave_) return 0;
    character = one_byte_[*at];
    return 1;
  }
  // Takes a shift byte that does what it should; with another shift byte behind it, that is for next to see.
  bool turn() {
    if (*at != (double_byte ? leave_ : enter_) || at[1] == enter_ || at[1] == leave_) return false;
    double_byte = !double_byte;
    ++at;
    return true;
  }
  bool ascii_ahead() const {
    return !double_byte && left() >= 8 && page->ascii_of_byte[at[0]] < 0x80 && page->ascii_of_byte[at[1]] < 0x80;
  }

 private:
  Got find_character() {
    while (!past_shift && !done() && at_shift()) {
      bool enters = *at == page->enter_byte;
      if (enters == double_byte) odd_shift = at;
      double_byte = enters;
      ++at;
      if (all_shifts) continue;
      if (strict && !done() && at_shift()) return Got::shift;
      past_shift = !strict;
      break;
    }
    if (done()) return Got::end;
    size_t length = length_here();
    if (strict && double_byte) length = length_before_shift(length);
    past_shift = !take(length);
    return past_shift ? Got::partial : Got::character;
  }
  // Strict reading ends a double-byte character before a shift byte: a lost byte must not cost the text behind the run.
  size_t length_before_shift(size_t length) const {
    for (size_t i = 1; i < length && i < left(); ++i) {
      if (at[i] == page->enter_byte || at[i] == page->leave_byte) return i;
    }
    return length;
  }

  const uint16_t* lead_;
  const uint16_t* rows_;
  const uint16_t* one_byte_;
  uint8_t enter_;
  uint8_t leave_;
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
  size_t peek(uint16_t& character) const {
    character = unicode_of_packed(*page, *at);
    return 1;
  }
  void skip(size_t length) { at += length; }
  bool turn() { return false; }
  const uint32_t* place() const { return at; }
  void return_to(const uint32_t* place) { at = place; }

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
  size_t peek(uint16_t& character) const {
    character = *at;
    return 1;
  }
  void skip(size_t length) { at += length; }
  bool turn() { return false; }
  const uint16_t* place() const { return at; }
  void return_to(const uint16_t* place) { at = place; }
};

}  // namespace lx
