// SPDX-License-Identifier: Apache-2.0
// The text functions done slowly, on lists of characters that are looked up in the readable source of the page, in its
// compiled object read by a second reader. Shares no code with the library but what single characters are in Unicode.
#pragma once

#include "support/page_object.hpp"
#include "support/text_model.hpp"

namespace lx::test {

struct Special {
  uint16_t key1, key2, value1, value2;
};
struct TestLanguage {
  const char* name;  // of the locale, up to its page
  std::vector<Special> upper;
  std::vector<Special> lower;
};
const std::vector<TestLanguage>& test_languages();
enum LanguageIndex { kEnglish, kGerman, kTurkish, kLithuanian, kGreek };

enum class Function { cpy, cat, chr, str, spn, cspn, tok, eol, map, cmp };

// One call. Texts with a negative length are followed by a zero in memory, the others by nothing.
struct TextCall {
  Function function;
  Form form;
  Units text;
  int32_t length = -1;
  Units other = {};  // the character, pattern, set, delimiters or second text; cat appends it to `text`
  int32_t other_length = -1;
  uint32_t other_state = 0;
  int32_t size = 0;  // room of cpy and map
  uint32_t options = 0;
  const TestLanguage* language = &test_languages()[kEnglish];

  Form other_form() const { return {form.kind, form.page, other_state}; }
  bool counts_characters() const;  // in place of units that are bytes
  bool writes_text() const { return function == Function::cat || function == Function::tok; }
  TextCall swapped() const;
  std::string describe() const;
};

inline constexpr uint32_t kUnwritten = 0x5A;

// What comes of it. Positions are units from the beginning of the text; -1: null.
struct Outcome {
  int64_t result = -1;
  uint32_t status = 0;
  Units memory = {};  // written by cpy, cat, tok and map
  int64_t next = -1;
  int32_t rest = 0;  // tok: length that is left; eol: units of the line end
  uint32_t type = 0;
  uint32_t state = 0;
  bool sign_only = false;  // cmp: of the result

  bool operator==(const Outcome&) const = default;
  std::string describe() const;
};

Outcome model(const TextCall& call);
Outcome map_model(const TextCall& call);
Outcome compare_model(const TextCall& call);

// The part of a text that a length tells. Counted characters that are copied come with the shift byte that closes their
// run.
Units told(const Form& form, Units text, int32_t length, bool by_characters, bool with_terminator = false,
           bool run_closed = false);

// ---- Unicode: what the library says of single characters, which has tests of its own ----

uint32_t type_model(uint32_t character);
uint16_t lower_model(uint32_t character);
uint16_t upper_model(uint32_t character);
uint16_t full_model(uint32_t character);
uint16_t half_model(uint32_t character);
uint16_t digit_model(uint32_t character);  // 0: no digit

}  // namespace lx::test
