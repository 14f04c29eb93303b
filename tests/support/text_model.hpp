// SPDX-License-Identifier: Apache-2.0
// Text done slowly: a text is a list of characters, whatever units it has in memory. It works on the readable sources
// of the code pages and shares no code with the library.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "support/page_source.hpp"

namespace lx::test {

// Elements of a text of any kind, one a number.
using Units = std::vector<uint32_t>;

Units units_of(std::string_view bytes);
std::string bytes_of_units(const Units& units);
std::string hex_units(const Units& units);
Units first_units(const Units& text, size_t count);

// How text stands in memory.
struct Form {
  enum Kind {
    plain,    // bytes
    shifted,  // bytes, shift bytes of mixed pages followed
    wide,     // packed characters
    ucs2,
  };
  Kind kind;
  const PageSource* page;  // may be null for ucs2
  uint32_t state = 0;

  bool follows_shifts() const { return kind == shifted && page->mixed(); }
  bool is_bytes() const { return kind == plain || kind == shifted; }
  bool is_shift(uint32_t unit) const { return follows_shifts() && (unit == page->enter || unit == page->leave); }
  size_t unit_size() const { return kind == wide ? 4 : kind == ucs2 ? 2 : 1; }
  size_t length_of(uint32_t first, uint32_t in_state) const;
  std::string name() const;
};

struct Character {
  size_t at;       // its first unit
  size_t size;     // units
  size_t end;      // behind it and the shift bytes that follow
  uint32_t code;   // packed
  uint32_t state;  // in which it stands

  bool same(const Character& other) const { return size == other.size && code == other.code; }
  size_t own_end() const { return at + size; }
};

struct Characters {
  std::vector<Character> list;
  size_t whole = 0;    // units of whole characters and all shift bytes around them
  bool cut = false;    // a character follows that the end cuts off
  uint32_t state = 0;  // at the end of them
};

// `most_shifts`: as many shift bytes are looked at in one place, more are text.
Characters characters_of(const Form& form, const Units& text, size_t most_shifts = SIZE_MAX);
// Bytes of a packed value with that many.
std::string bytes_of_code(uint32_t code, size_t size);
// Of one as it is written: zero bytes before the last are not.
std::string written_bytes(uint32_t packed);
char16_t unicode_of(const Form& form, const Character& character);

// A text that grows by whole characters.
struct Writer {
  Form form;
  Units units = {};
  bool inside = form.state != 0 && form.follows_shifts();  // a double-byte run

  // A character with the shift byte that it needs before it.
  Units piece(uint16_t unicode) const;
  Units piece_of_bytes(const std::string& code) const;
  void add(const Units& piece);
};

// A text in its form; shift bytes are closed.
Units spelled(const Form& form, std::u16string_view text);
std::string encoded(const PageSource& page, std::u16string_view text);
// As it stands in memory.
std::string raw(const Form& form, const Units& units);

// ---- Conversion ----

struct StringOptions {
  int32_t out_size;
  int32_t in_length;  // negative: the text is followed by a zero
  bool terminate;
  bool characters;
};

struct StringResult {
  int32_t count = 0;
  Units written;
  size_t consumed = 0;
};

// A whole string. `packed`: the characters keep their bytes instead of going through Unicode.
StringResult convert_model(const Form& to, const Form& from, const Units& text, const StringOptions& options,
                           bool packed_transfer = false);

}  // namespace lx::test
