// SPDX-License-Identifier: Apache-2.0
// Texts that the tests of text functions are made of.
#pragma once

#include <random>
#include <string_view>
#include <vector>

#include "support/text_model.hpp"

namespace lx::test {

using namespace std::string_view_literals;

struct Alphabet {
  uint16_t page;
  std::string_view units;  // lead bytes, bytes that are lead and trail, that begin nothing; line ends; shift bytes
};
inline constexpr Alphabet kAlphabets[] = {
    {367, "ab\x0A\xFF\0"sv},
    {819, "a\xE4\x0A\x0D\0"sv},
    {57352, "a\xC3\xA9\xE3\x80\xFF\0"sv},
    {932, "a\x83\x5C\xB1\x0A\x0D\0"sv},
    {954, "a\x8E\x8F\xB1\xA4\x0A\xFF"sv},
    {964, "a\x8E\xA2\xA1\x0D\x0A\0"sv},
    {37, "\x81\x0E\x0F\x25\x15\0"sv},
    {930, "\x81\x0E\x0F\x41\x25\x0D\0"sv},
    {1364, "\x81\x0E\x0F\x40\xFE\x25\x15"sv},
};

// Kinds and start states of a page's text.
inline std::vector<Form> forms_of(const PageSource& page) {
  std::vector<Form> forms = {{Form::plain, &page}, {Form::shifted, &page}, {Form::shifted, &page, 1}};
  if (page.id == 930 || page.id == 37) {
    forms.push_back({Form::wide, &page});
    forms.push_back({Form::ucs2, &page});
  }
  return forms;
}

inline Units letters(const Form& form, std::string_view units) {
  if (form.kind == Form::wide) return {0x81, 0x4181, 0x81000000, 0x25, 0x0D, 0};
  if (form.kind == Form::ucs2) return {'a', 0x2028, 0x0A, 0x0D, 0x2029, 0};
  return units_of(units);
}

// A text in its form; shift bytes are closed.
inline Units spelled(const Form& form, std::u16string_view text) {
  Units units;
  if (form.kind == Form::shifted) return units_of(encoded(*form.page, text));
  for (char16_t c : text) {
    std::string code = form.page->encode(c);
    if (form.kind == Form::plain) {
      for (uint32_t unit : units_of(code)) units.push_back(unit);
    } else {
      units.push_back(form.kind == Form::wide ? packed(code) : c);
    }
  }
  return units;
}

template <class Use>
void for_all_strings(const Units& alphabet, size_t longest, Use use) {
  for (size_t length = 0; length <= longest; ++length) {
    std::vector<size_t> digits(length);
    for (bool more = true; more;) {
      Units text;
      for (size_t digit : digits) text.push_back(alphabet[digit]);
      use(text);
      more = false;
      for (size_t i = 0; i < length && !more; ++i) {
        more = ++digits[i] < alphabet.size();
        if (!more) digits[i] = 0;
      }
    }
  }
}

// The same for everybody, so that a failure can be repeated.
class Choice {
 public:
  size_t below(size_t limit) { return std::uniform_int_distribution<size_t>(0, limit - 1)(engine_); }
  bool often() { return below(3) != 0; }

 private:
  std::mt19937 engine_{20};
};

}  // namespace lx::test
