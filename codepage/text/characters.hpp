// SPDX-License-Identifier: Apache-2.0
// What a character means, one interface for the texts of all kinds:
//
//   upper, lower, half_to_full, full_to_half   the other form; the same character when there is none
//   digit                                      the ASCII digit of a digit of another script, else the same character
//   type                                       the character-type word
//   to_unicode, from_unicode                   UCS-2 and back; the substitution byte stands for what the page lacks
#pragma once

#include "codepage/text/page_forms.hpp"
#include "codepage/text/readers.hpp"
#include "codepage/text/walkers.hpp"
#include "codepage/unicode_rules.hpp"

namespace lx {

template <class Characters>
Character with_ascii_digit(const Characters& characters, const Character& character) {
  if ((characters.type(character) & LX_CT_DIGIT) == 0) return character;
  uint16_t digit = ascii_digit(characters.to_unicode(character));
  return digit != 0 ? characters.from_unicode(digit) : character;
}

// Characters of a page: as bytes, whose number counts, or packed into one unit.
template <bool kPacked>
struct PageCharacters {
  const CodePage& page;

  explicit PageCharacters(const CodePage& code_page) : page(code_page) {}

  Character upper(const Character& character) const {
    if (one_byte(character)) return {page.raw.header->upper[character.code], 1};
    return cased(character, LX_CT_LOWER);
  }
  Character lower(const Character& character) const {
    if (one_byte(character)) return {page.raw.header->lower[character.code], 1};
    return cased(character, LX_CT_UPPER);
  }
  Character half_to_full(const Character& character) const {
    if (page.max_length == 1) return character;
    if (!one_byte(character)) return form(full_width(page, character.code), character);
    return page.raw.full_width == nullptr ? character : form(page.raw.full_width[character.code], character);
  }
  Character full_to_half(const Character& character) const {
    if (page.max_length == 1) return character;
    return form(page.half_width(character.code), character);
  }
  Character digit(const Character& character) const { return with_ascii_digit(*this, character); }
  uint32_t type(const Character& character) const {
    return one_byte(character) ? uint32_t{page.raw.header->types[character.code]} : entry(character).flags;
  }
  uint16_t to_unicode(const Character& character) const {
    if (one_byte(character)) return page.to_unicode[character.code];
    Bytes bytes(character);
    return page.kind == PageKind::utf8 ? Utf8Reader::decode(bytes.at) : page.decode(bytes.at);
  }
  Character from_unicode(uint16_t ucs2) const {
    return stored(page.kind == PageKind::utf8 ? utf8_packed(ucs2) : page.packed(ucs2));
  }

 private:
  // The bytes of a character, and zeros for walks that want more of them.
  struct Bytes {
    uint8_t at[kMaxCharacterLength] = {};

    explicit Bytes(const Character& character) {
      if constexpr (kPacked) {
        unpack(at, character.code);
      } else {
        for (size_t i = std::min<size_t>(character.units, kMaxCharacterLength), rest = character.code; i-- > 0;
             rest >>= 8) {
          at[i] = static_cast<uint8_t>(rest);
        }
      }
    }
  };

  static bool one_byte(const Character& character) { return character.units == 1 && character.code < 0x100; }
  // As it is written: zero middle bytes are left out of bytes.
  static Character stored(uint32_t packed) {
    if constexpr (kPacked) return {packed, 1};
    uint8_t bytes[kMaxCharacterLength];
    size_t length = unpack(bytes, packed);
    return {pack(bytes, length), static_cast<uint32_t>(length)};
  }
  static Character form(uint32_t packed, const Character& character) {
    return packed != 0 ? stored(packed) : character;
  }
  const LXCharType& entry(const Character& character) const { return type_entry(page, Bytes(character).at); }
  Character cased(const Character& character, uint32_t other) const {
    const LXCharType& type = entry(character);
    return (type.flags & other) != 0 ? stored(other_case(character.code, type)) : character;
  }
};

struct UnicodeCharacters {
  UnicodeCharacters() = default;
  explicit UnicodeCharacters(const CodePage&) {}

  Character upper(const Character& character) const { return {to_upper(to_unicode(character)), 1}; }
  Character lower(const Character& character) const { return {to_lower(to_unicode(character)), 1}; }
  Character half_to_full(const Character& character) const { return {lx::half_to_full(to_unicode(character)), 1}; }
  Character full_to_half(const Character& character) const { return {lx::full_to_half(to_unicode(character)), 1}; }
  Character digit(const Character& character) const { return with_ascii_digit(*this, character); }
  uint32_t type(const Character& character) const { return type_of(to_unicode(character)); }
  uint16_t to_unicode(const Character& character) const { return static_cast<uint16_t>(character.code); }
  Character from_unicode(uint16_t ucs2) const { return {ucs2, 1}; }
};

template <class Unit>
struct CharactersOfUnit {
  using Type = PageCharacters<false>;
};
template <>
struct CharactersOfUnit<LXWChar> {
  using Type = PageCharacters<true>;
};
template <>
struct CharactersOfUnit<LXUChar> {
  using Type = UnicodeCharacters;
};

// By kind of text, or by walker.
template <class Kind>
using CharactersOf = typename CharactersOfUnit<typename Kind::Unit>::Type;

}  // namespace lx
