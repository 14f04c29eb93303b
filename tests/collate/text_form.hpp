// SPDX-License-Identifier: Apache-2.0
// The four forms of text of the collating functions, on the pages of the collation directory, under one interface.
#pragma once

#include "collate/weight_model.hpp"
#include "support/edge_buffer.hpp"

namespace lx::test {

enum class Kind { plain, shifted, wide, ucs2 };

// A text as it stands in memory.
struct Stored {
  std::string raw;
  int32_t units = 0;
  Pieces pieces;
};

// What a reader of weights is given and gives back.
struct Reading {
  int32_t offset = 0;
  int32_t remaining = 0;
  uint32_t state = 0;
  uint16_t position = 0;
  uint16_t pending = 0xFFFF;
  bool operator==(const Reading&) const = default;
};

class TextForm {
 public:
  TextForm(Kind kind, std::string page, const std::string& sort, const std::string& language = "English");

  Kind kind() const { return kind_; }
  LXLocale* locale() const { return locale_.get(); }
  const std::string& name() const { return name_; }
  int unit_size() const { return kind_ == Kind::wide ? 4 : kind_ == Kind::ucs2 ? 2 : 1; }
  const SortSpec& sort() const { return sort_; }

  // Characters that the page has: of Single U+0000-U+00FF; of Small and Mixed ASCII and U+3040-U+304F, of Small also
  // U+4E00-U+4E0F and U+5000-U+5007. The other pages need no pieces.
  Stored store(std::u16string_view text) const;
  ModelReader reader(const Stored& text) const { return {&sort_, &text.pieces, text.units}; }

  // Each at the edge of its memory. The lengths are in units, or as given.
  int32_t compare(const Stored& a, const Stored& b, uint32_t options = 0) const;
  int32_t compare(const Stored& a, int32_t length_a, const Stored& b, int32_t length_b, uint32_t options) const;
  int32_t transform(void* key, int32_t size, const Stored& text, uint32_t options = 0) const;
  int32_t transform(void* key, int32_t size, const Stored& text, int32_t length, uint32_t options) const;
  // The key of a text, with room for it and for the work.
  std::string key(const Stored& text, uint32_t options = 0) const;
  ModelWeights next_weight(const void* text, Reading& reading) const;

 private:
  std::string character(char16_t value, bool wide) const;

  Kind kind_;
  std::string page_;
  std::string name_;
  SortSpec sort_;
  Locale locale_;
};

// Every form of text on every page of our own, with that sort.
std::vector<TextForm> own_forms(const std::string& sort);

inline int sign(int value) { return (value > 0) - (value < 0); }
std::string shown(std::u16string_view text);
// All texts of up to `length` letters.
std::vector<std::u16string> all_texts(std::u16string_view letters, size_t length);

}  // namespace lx::test
