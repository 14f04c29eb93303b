// SPDX-License-Identifier: Apache-2.0
// Makes the calls that the model describes, on memory that ends where texts and rooms end; and what tests are made of.
#pragma once

#include <functional>
#include <map>
#include <random>

#include "support/text_calls.hpp"
#include "text/text_functions.hpp"

namespace lx::test {

using namespace std::string_view_literals;

class TextRunner {
 public:
  LXLocale* locale(const PageSource& page, const TestLanguage& language = test_languages()[kEnglish]);

  // Compares the call with its model. Gives up after some differences: one fault makes many.
  void check(const TextCall& call);

  // `room`: units that cpy, cat and map have. Texts are mapped in place when `in_place`.
  Outcome run(const TextCall& call, size_t room, bool in_place = false);

 private:
  template <class U>
  U* place_character(const TextCall& call);
  template <class KindOfCalls>
  Outcome run_as(KindOfCalls calls, const TextCall& call, size_t room, bool in_place);

  Session session_;
  std::map<std::pair<const TestLanguage*, uint16_t>, Locale> locales_;
  EdgeBuffer text_{1 << 13}, other_{1 << 13}, out_{1 << 14};
  int differences_ = 0;
};

// ---- Texts ----

// Kinds and start states of a page's text.
std::vector<Form> forms_of(const PageSource& page, bool all);

// A form of text, and units that make trouble in it.
struct Lettered {
  Form form;
  Units letters;
};
// Lead bytes, bytes that are lead and trail, that begin nothing; line ends, shift bytes, zero.
std::vector<Lettered> text_forms();
// Also trail bytes like letters, blanks, and letters with special pairs. Packed and UCS-2 characters are some that the
// page has.
std::vector<Lettered> mapping_forms();
// With special pairs, digits, both cases, both widths, one way only, and blanks.
inline constexpr std::u16string_view kMappingCharacters =
    u"aAiIjJzZ09 .;~\u00A0\u00A2\u00B2\u00B5\u00B7\u00DF\u00E9\u00C9\u00FF\u012E\u012F\u0130\u0131\u0178\u01C4\u01C5"
    u"\u01C6\u0307\u03A3\u03B1\u03C2\u03C3\u0416\u0436\u0660\u0966\u10A0\u10D0\u2010\u2160\u2170\u20A9\u2190\u24D0"
    u"\u3000\u3001\u3042\u3099\u309B\u30A2\u30FC\u3131\u4E00\uAC00\uFF10\uFF21\uFF41\uFF5E\uFF61\uFF71\uFF9E\uFFA1"
    u"\uFFE0";

void for_all_strings(const Units& letters, size_t longest, const std::function<void(const Units&)>& use);

// The characters of such a text cannot be counted for a copy: behind the last one is nothing to look at.
bool ends_inside_run(const Form& form, const Units& text);

// The same choices for everybody, so that a failure can be repeated.
class Choice {
 public:
  size_t below(size_t limit) { return std::uniform_int_distribution<size_t>(0, limit - 1)(engine_); }
  bool often() { return below(3) != 0; }
  bool half() { return below(2) != 0; }
  uint32_t one_of(const Units& units) { return units[below(units.size())]; }
  // A length for a text: measured, in units (of which some cut a character) or in characters.
  int32_t length(const Form& form, const Units& text, bool by_characters);

 private:
  std::mt19937 engine_{20};
};

}  // namespace lx::test
