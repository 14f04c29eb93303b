// SPDX-License-Identifier: Apache-2.0
// Conversion done slowly: whole strings as lists of characters, buffers a character at a time. It works on the
// readable sources of the code pages and shares no code with the library.
#pragma once

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
// Well-formed text of the page: mixed pages have their shift bytes, and end in the single-byte state.
std::string encoded(const PageSource& page, std::u16string_view text);
std::string hex_units(const Units& units);

// How text stands in memory.
struct Form {
  enum Kind {
    plain,    // bytes
    shifted,  // bytes, shift bytes of mixed pages followed
    wide,     // packed characters
    ucs2,
  };
  Kind kind;
  const PageSource* page;  // null for ucs2
  uint32_t state = 0;

  bool follows_shifts() const { return kind == shifted && page->mixed(); }
  bool is_bytes() const { return kind == plain || kind == shifted; }
};

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

// Bytes of the first characters, one shift byte looked at before and after each.
int32_t char_to_byte_model(const PageSource& page, std::string_view text, uint32_t state, int32_t chars);
int32_t byte_to_char_model(const PageSource& page, std::string_view text, uint32_t state);

// A resumable conversion: what is left over on either side waits for the next call.
class BufferModel {
 public:
  BufferModel(const PageSource& target, const PageSource& source) : target_(target), source_(source) {}

  // Takes bytes from the front of `in` and appends at most `room` bytes to `out`.
  uint32_t convert(std::string& out, size_t room, std::string_view& in);
  // Waiting inside.
  size_t held() const { return held_.size(); }
  size_t pending() const { return pending_.size(); }

 private:
  size_t length_of(char first) const;

  const PageSource& target_;
  const PageSource& source_;
  std::string held_;
  std::string pending_;
  bool source_inside_ = false;
  bool behind_shift_ = false;  // which was the last byte; the next is text
  bool target_inside_ = false;
  bool past_shift_ = false;
};

}  // namespace lx::test
