// SPDX-License-Identifier: Apache-2.0
// Mapping and comparison done slowly: texts are lists of characters, looked up in the readable source of the page, in
// its compiled object read by a second reader, and in the Unicode tables. Shares no code with the library.
#pragma once

#include <string>
#include <vector>

#include "support/page_object.hpp"
#include "text/text_reference.hpp"

namespace lx::test {

struct Glyph {
  uint32_t code;  // packed
  size_t size;    // units

  bool operator==(const Glyph&) const = default;
};

// What a character means in texts of this form.
class Meanings {
 public:
  explicit Meanings(const Form& form);

  uint32_t type(Glyph glyph) const;
  Glyph upper(Glyph glyph) const { return cased(glyph, true); }
  Glyph lower(Glyph glyph) const { return cased(glyph, false); }
  Glyph full(Glyph glyph) const;
  Glyph half(Glyph glyph) const;
  Glyph digit(Glyph glyph) const;
  uint16_t unicode(Glyph glyph) const;
  Glyph glyph(uint16_t unicode) const;

 private:
  bool ucs2() const { return form_.kind == Form::ucs2; }
  bool one_byte(Glyph glyph) const { return glyph.size == 1 && glyph.code < 0x100; }
  std::string bytes_of(Glyph glyph) const;
  Glyph spelled(uint32_t packed) const;
  Glyph form_or(uint32_t packed, Glyph glyph) const { return packed != 0 ? spelled(packed) : glyph; }
  bool has(uint16_t unicode) const;
  std::pair<uint32_t, int32_t> entry(Glyph glyph) const;
  Glyph cased(Glyph glyph, bool upper) const;

  Form form_;
  const PageObject* object_;
};

struct Special {
  uint16_t key1, key2, value1, value2;
};
struct TestLanguage {
  const char* name;  // of the locale, up to its page
  std::vector<Special> upper;
  std::vector<Special> lower;
};
const std::vector<TestLanguage>& test_languages();

// Texts with a negative length are followed by a zero in memory, the others by nothing.
struct MapCall {
  const TestLanguage* language;
  Form form;
  Units text;
  int32_t length;
  int32_t size;
  uint32_t flags;

  std::string describe() const;
};
struct MapResult {
  int32_t count = 0;
  uint32_t status = 0;
  Units written = {};

  bool operator==(const MapResult&) const = default;
  std::string describe() const;
};
MapResult map_model(const MapCall& call);

struct CompareCall {
  const TestLanguage* language;
  Form form;  // of the first text
  Units text1;
  int32_t length1;
  Units text2;
  int32_t length2;
  uint32_t state2;
  uint32_t options;

  CompareCall swapped() const;
  std::string describe() const;
};
struct CompareResult {
  int32_t value = 0;  // only its sign counts unless `exact`
  bool exact = true;
};
CompareResult compare_model(const CompareCall& call);

// What the trailing blanks leave.
Units trimmed(const Form& form, const Units& text, bool full_width);

}  // namespace lx::test
