// SPDX-License-Identifier: Apache-2.0
// Writers put characters together as text of one kind. They never write past their room and never part of a character.
//
//   code(character)            what is stored for a UCS-2 character: its packed value in the writer's code page
//   stands_in(code, character) whether that is only the substitution byte
//   doubtful(code)             whether it may be so, or the character is U+FFFD; cheaper to ask
//   fits(code)                 room for it, with the shift byte that it may need
//   put(code)                  stores it; the caller has asked fits, or is within fast_characters
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "codepage/text/packed.hpp"
#include "objects/code_page.hpp"

namespace lx {

// The way from UCS-2 to packed characters, with what every character asks for at hand.
struct FromUnicode {
  const uint16_t* const* narrow;
  const uint32_t* const* wide;
  uint32_t substitution;
  uint16_t substituted;  // the character whose place in the page the substitution byte has
  bool usual;

  explicit FromUnicode(const CodePage& page)
      : narrow(page.from_narrow[0] != nullptr ? page.from_narrow : nullptr),
        wide(page.from_wide),
        substitution(page.substitution),
        substituted(page.to_unicode[page.substitution]),
        usual(page.usual) {}
  uint32_t packed(uint16_t ucs2) const {
    return narrow != nullptr ? narrow[ucs2 >> 8][ucs2 & 0xFF] : wide[ucs2 >> 8][ucs2 & 0xFF];
  }
  bool stands_in(uint32_t packed_value, uint16_t ucs2) const {
    return packed_value == substitution && ucs2 != substituted;
  }
};

// The first byte lowest in the address.
inline void store_two(uint8_t* to, uint32_t packed) {
  auto two = static_cast<uint16_t>(packed);
  if (std::endian::native == std::endian::little) two = __builtin_bswap16(two);
  std::memcpy(to, &two, sizeof two);
}

template <class U>
struct UnitWriter {
  using Unit = U;
  static constexpr bool kShifted = false;

  U* begin;
  U* at;
  U* end;

  UnitWriter(U* out, size_t room) : begin(out), at(out), end(out + room) {}
  size_t room() const { return static_cast<size_t>(end - at); }
  // Goes on where a copy of this writer has come to.
  void advance_to(const UnitWriter& copy) { at = copy.at; }
};

// The codes of a page's characters.
struct PageCodes {
  const CodePage* page;
  FromUnicode from;

  explicit PageCodes(const CodePage& code_page) : page(&code_page), from(code_page) {}
  uint32_t code(uint16_t character) const { return from.packed(character); }
  bool stands_in(uint32_t code, uint16_t character) const { return from.stands_in(code, character); }
  bool doubtful(uint32_t code) const { return code == from.substitution; }
};

struct SingleByteWriter : UnitWriter<uint8_t>, PageCodes {
  SingleByteWriter(const CodePage& code_page, uint8_t* out, size_t size)
      : UnitWriter(out, size), PageCodes(code_page) {}
  bool fits(uint32_t) const { return at != end; }
  void put(uint32_t code) { *at++ = static_cast<uint8_t>(code); }
  size_t fast_characters() const { return from.usual ? room() : 0; }
};

// Bytes of packed characters, of any code page.
struct PackedWriter : UnitWriter<uint8_t> {
  using UnitWriter::UnitWriter;
  bool fits(uint32_t code) const { return room() >= unpacked_length(code); }
  void put(uint32_t code) {
    if (code < 0x100) {
      *at++ = static_cast<uint8_t>(code);
    } else if (code < 0x10000) {
      store_two(at, code);
      at += 2;
    } else {
      at += unpack(at, code);
    }
  }
  size_t fast_characters() const { return room() / kMaxCharacterLength; }
};

struct MultibyteWriter : PackedWriter, PageCodes {
  MultibyteWriter(const CodePage& code_page, uint8_t* out, size_t size)
      : PackedWriter(out, size), PageCodes(code_page) {}
  size_t fast_characters() const { return from.usual ? PackedWriter::fast_characters() : 0; }
};

// The code of a character is the character: its bytes follow by rule.
struct Utf8Writer : UnitWriter<uint8_t> {
  const CodePage* page;

  Utf8Writer(const CodePage& code_page, uint8_t* out, size_t size) : UnitWriter(out, size), page(&code_page) {}
  uint32_t code(uint16_t character) const { return character; }
  bool stands_in(uint32_t, uint16_t) const { return false; }
  bool doubtful(uint32_t code) const { return code == kUnassigned; }
  bool fits(uint32_t code) const { return room() >= (code < 0x80 ? 1u : code < 0x800 ? 2u : 3u); }
  void put(uint32_t code) {
    if (code < 0x80) {
      *at++ = static_cast<uint8_t>(code);
    } else if (code < 0x800) {
      at[0] = static_cast<uint8_t>(0xC0 | code >> 6);
      at[1] = static_cast<uint8_t>(0x80 | (code & 0x3F));
      at += 2;
    } else {
      at[0] = static_cast<uint8_t>(0xE0 | code >> 12);
      at[1] = static_cast<uint8_t>(0x80 | (code >> 6 & 0x3F));
      at[2] = static_cast<uint8_t>(0x80 | (code & 0x3F));
      at += 3;
    }
  }
  size_t fast_characters() const { return room() / 3; }
};

// Mixed host text: a shift byte goes before each character of the other width.
struct ShiftedWriter : UnitWriter<uint8_t> {
  static constexpr bool kShifted = true;

  const CodePage* page;
  FromUnicode from;
  bool double_byte;
  uint8_t* run = nullptr;  // where the double-byte run begins, behind its enter byte, when that was written here

  ShiftedWriter(const CodePage& code_page, uint8_t* out, size_t size, uint32_t state)
      : UnitWriter(out, size), page(&code_page), from(code_page), double_byte(state != 0) {}
  void advance_to(const ShiftedWriter& copy) {
    at = copy.at;
    double_byte = copy.double_byte;
    run = copy.run;
  }
  uint32_t code(uint16_t character) const { return from.packed(character); }
  bool stands_in(uint32_t code, uint16_t character) const { return from.stands_in(code, character); }
  bool doubtful(uint32_t code) const { return code == from.substitution; }
  bool needs_shift(uint32_t code) const { return (code > 0xFF) != double_byte; }
  bool fits(uint32_t code) const { return room() >= unpacked_length(code) + (needs_shift(code) ? 1 : 0); }
  void put(uint32_t code) {
    if (needs_shift(code)) shift();
    if (code < 0x100) {
      *at++ = static_cast<uint8_t>(code);
    } else if (code < 0x10000) {
      store_two(at, code);
      at += 2;
    } else {
      at += unpack(at, code);
    }
  }
  // Returns to the single-byte state: takes an enter byte back that has nothing behind it, or writes the leave byte,
  // for which characters make way until `needed` units are free. False: there is no room even so.
  bool close(size_t needed) {
    while (double_byte) {
      if (run != nullptr && at == run) {
        --at;
        double_byte = false;
      } else if (room() >= needed) {
        *at++ = page->leave_byte;
        double_byte = false;
      } else if (static_cast<size_t>(at - (run != nullptr ? run : begin)) >= page->max_length) {
        at -= page->max_length;
      } else {
        return false;
      }
    }
    return true;
  }
  size_t fast_characters() const { return from.usual ? room() / (kMaxCharacterLength + 1) : 0; }

 private:
  void shift() {
    double_byte = !double_byte;
    *at++ = double_byte ? page->enter_byte : page->leave_byte;
    run = at;
  }
};

struct WideWriter : UnitWriter<uint32_t> {
  const CodePage* page;
  FromUnicode from;

  WideWriter(const CodePage& code_page, uint32_t* out, size_t size)
      : UnitWriter(out, size), page(&code_page), from(code_page) {}
  uint32_t code(uint16_t character) const {
    return page->kind == PageKind::utf8 ? utf8_packed(character) : from.packed(character);
  }
  bool fits(uint32_t) const { return at != end; }
  void put(uint32_t code) { *at++ = code; }
  size_t fast_characters() const { return room(); }
};

struct Ucs2Writer : UnitWriter<uint16_t> {
  using UnitWriter::UnitWriter;
  uint32_t code(uint16_t character) const { return character; }
  bool fits(uint32_t) const { return at != end; }
  void put(uint32_t code) { *at++ = static_cast<uint16_t>(code); }
  size_t fast_characters() const { return room(); }
};

}  // namespace lx
