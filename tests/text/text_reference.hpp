// SPDX-License-Identifier: Apache-2.0
// The text functions done slowly: every text is a list of characters. Works on the readable sources of the code pages
// and shares no code with the library.
#pragma once

#include <string>
#include <vector>

#include "support/text_model.hpp"

namespace lx::test {

struct TextCharacter {
  size_t at;       // its first unit
  size_t size;     // units
  size_t end;      // behind it and the shift bytes that follow
  uint32_t code;   // packed
  uint32_t state;  // in which it stands

  bool same(const TextCharacter& other) const { return size == other.size && code == other.code; }
};

struct Characters {
  std::vector<TextCharacter> list;
  size_t whole = 0;    // units of whole characters and all shift bytes around them
  bool cut = false;    // a character follows that the end cuts off
  uint32_t state = 0;  // at the end of them
};

Characters characters_of(const Form& form, const Units& text);

enum class Function { cpy, cat, chr, str, spn, cspn, tok, eol };
const char* name_of(Function function);

// One call. Texts with a negative length are followed by a zero in memory, the others by nothing.
struct TextCall {
  Function function;
  Form form;
  Units text;
  int32_t length = -1;
  Units other = {};  // the character, pattern, set or delimiters; for cat what is appended, `text` is appended to
  int32_t other_length = -1;
  uint32_t other_state = 0;
  int32_t size = 0;  // room of cpy
  uint32_t options = 0;

  bool writes_text() const { return function == Function::cat || function == Function::tok; }
  std::string describe() const;
};

inline constexpr uint32_t kUnwritten = 0x5A;

// What comes of it. Positions are units from the beginning of the text; -1: null.
struct Outcome {
  int64_t result = -1;
  uint32_t status = 0;
  Units memory = {};  // written by cpy, cat and tok
  int64_t next = -1;
  int32_t rest = 0;  // tok: length that is left; eol: units of the line end
  uint32_t type = 0;
  uint32_t state = 0;

  bool operator==(const Outcome&) const = default;
  std::string describe() const;
};

// Without the options that fold case or width.
Outcome reference(const TextCall& call);

}  // namespace lx::test
