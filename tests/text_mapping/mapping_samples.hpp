// SPDX-License-Identifier: Apache-2.0
// Texts that mapping and comparison are tried on.
#pragma once

#include "text/text_samples.hpp"
#include "text_mapping/mapping_model.hpp"

namespace lx::test {

// Lead bytes, trail bytes like letters, bytes that begin nothing, blanks, letters with special pairs, shift bytes,
// zero.
inline constexpr Alphabet kMappingAlphabets[] = {
    {819, "ai\xDF\xFF\xB2 \0"sv},          {920, "iI\xDF\xDD\xFD "sv},
    {813, "\xC1\xE1\xD3\xF3. "sv},         {57352, "ai\xCC\x87\xC4\xB0\xEF\xFF "sv},
    {932, "a\x82\x81\x40\xB1\xDE "sv},     {954, "a\x8E\x8F\xB1\xA3\xC1\xFF "sv},
    {964, "a\x8E\xA2\xA1\xA3\xC1 \0"sv},   {37, "\x81\xC1\x0E\x0F\x59\x40\0"sv},
    {930, "\x81\xC1\x0E\x0F\x42\x40\0"sv}, {1364, "\x81\xC1\x0E\x0F\x42\x40\xFE"sv},
};

// With special pairs, digits, both cases, both widths, one way only, and blanks.
inline constexpr std::u16string_view kMappingCharacters =
    u"aAiIjJzZ09 .;~\u00A0\u00A2\u00B2\u00B5\u00B7\u00DF\u00E9\u00C9\u00FF\u012E\u012F\u0130\u0131\u0178\u01C4\u01C5"
    u"\u01C6\u0307\u03A3\u03B1\u03C2\u03C3\u0416\u0436\u0660\u0966\u10A0\u10D0\u2010\u2160\u2170\u20A9\u2190\u24D0"
    u"\u3000\u3001\u3042\u3099\u309B\u30A2\u30FC\u3131\u4E00\uAC00\uFF10\uFF21\uFF41\uFF5E\uFF61\uFF71\uFF9E\uFFA1"
    u"\uFFE0";

inline std::vector<Form> mapping_forms(const PageSource& page) {
  std::vector<Form> forms = {{Form::plain, &page}, {Form::shifted, &page}};
  if (page.mixed()) forms.push_back({Form::shifted, &page, 1});
  forms.push_back({Form::wide, &page});
  if (page.id == 819 || page.id == 57352) forms.push_back({Form::ucs2, &page});
  return forms;
}

// The units of the alphabet as the form has them: packed and UCS-2 characters are some that the page has.
inline Units mapping_letters(const Form& form, std::string_view bytes) {
  if (form.is_bytes()) return units_of(bytes);
  Units units = {0, 0x20};
  for (size_t i = 0; i < kMappingCharacters.size() && units.size() < 9; i += 7) {
    uint16_t character = kMappingCharacters[i];
    if (form.kind == Form::ucs2) {
      units.push_back(character);
    } else if (form.page->has(character)) {
      units.push_back(packed(form.page->encode(character)));
    }
  }
  return units;
}

// Characters of the page, now and then a unit out of place.
inline Units mapping_text(Choice& choice, const Form& form, const Units& letters, size_t longest) {
  Units text;
  uint32_t state = form.state;
  for (size_t count = choice.below(longest + 1); count != 0; --count) {
    uint16_t character = kMappingCharacters[choice.below(kMappingCharacters.size())];
    if (form.kind == Form::ucs2) {
      text.push_back(character);
      continue;
    }
    if (choice.below(12) == 0) text.push_back(letters[choice.below(letters.size())]);
    if (!form.page->has(character)) continue;
    Units code = units_of(form.page->encode(character));
    if (form.kind == Form::wide) code = {packed(form.page->encode(character))};
    if (form.follows_shifts() && state != (code.size() > 1)) {
      text.push_back(state != 0 ? form.page->leave : form.page->enter);
      state = code.size() > 1;
    }
    text.insert(text.end(), code.begin(), code.end());
  }
  return text;
}

// A length for a text: measured, in units (of which some cut a character) or in characters.
inline int32_t mapping_length(Choice& choice, const Form& form, const Units& text, bool by_characters) {
  if (choice.below(3) == 0) return -1 - static_cast<int32_t>(choice.below(2));
  size_t all = by_characters && form.is_bytes() ? characters_of(form, text).list.size() : text.size();
  return static_cast<int32_t>(choice.often() ? all : choice.below(all + 1));
}

}  // namespace lx::test
