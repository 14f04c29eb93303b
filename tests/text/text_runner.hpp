// SPDX-License-Identifier: Apache-2.0
// Makes the calls that the model describes, on memory that ends where texts and rooms end; and what tests are made of.
#pragma once

#include <map>
#include <random>

#include "support/text_calls.hpp"
#include "text/text_functions.hpp"

namespace lx::test {

using namespace std::string_view_literals;

class TextRunner {
 public:
  LXLocale* locale(const PageSource& page, const TestLanguage& language = test_languages()[kEnglish]) {
    auto& locale = locales_[{&language, page.id}];
    if (!locale) locale.reset(LXGetLocale((language.name + page.name + "@BINARY").c_str(), 0, nullptr));
    EXPECT_NE(locale, nullptr) << language.name << page.name;
    return locale.get();
  }

  // Compares the call with its model. Gives up after some differences: one fault makes many.
  void check(const TextCall& call) { check(call, model(call)); }
  void check(const TextCall& call, const Outcome& expected, const char* name = "") {
    if (differences_ > 10) return;
    Outcome got = run(call, expected.memory.size());
    if (call.function == Function::cmp) {  // also that the other way round the sign is the other one
      int64_t back = run(call.swapped(), 0).result;
      if (sign(back) != -sign(got.result)) ADD_FAILURE() << call.describe() << " and back " << back;
      if (expected.sign_only) got.result = sign(got.result);
      got.sign_only = expected.sign_only;
    }
    Outcome wanted = expected;
    if (expected.sign_only) wanted.result = sign(expected.result);
    if (got == wanted) return;
    ++differences_;
    ADD_FAILURE() << name << " " << call.describe() << "\n     got " << got.describe() << "\nexpected "
                  << wanted.describe();
  }

  // `room`: units that cpy, cat and map have. Texts are mapped in place when `in_place`.
  Outcome run(const TextCall& call, size_t room, bool in_place = false) {
    return with_calls(call.form, [&](auto calls) { return run_as(calls, call, room, in_place); });
  }

 private:
  static int64_t sign(int64_t value) { return value < 0 ? -1 : value > 0; }

  // A character stands alone, or before the terminator that cuts it off.
  template <class U>
  U* place_character(const TextCall& call) {
    Units units = call.other;
    auto whole = characters_of(call.other_form(), units).list;
    if (!whole.empty()) units.resize(whole[0].size);
    auto zero = std::find(units.begin(), units.end(), 0u);
    bool terminated = zero != units.end();
    if (terminated) units.erase(zero + 1, units.end());
    return place<U>(other_, units, whole.empty() && !terminated ? -1 : 0);
  }

  template <class KindOfCalls>
  Outcome run_as(KindOfCalls calls, const TextCall& call, size_t room, bool in_place) {
    using U = typename KindOfCalls::Unit;
    LXLocale* l = locale(*call.form.page, *call.language);
    LXStrcpy(l, nullptr, 0, nullptr, 0, 1);  // an error for the call to clear
    Outcome outcome;
    U* other =
        call.function == Function::chr ? place_character<U>(call) : place<U>(other_, call.other, call.other_length);
    U* text = nullptr;
    if (call.writes_text()) {
      outcome.memory = call.text;
      if (call.function == Function::cat || call.length < 0) outcome.memory.push_back(0);
      outcome.memory.resize(std::max(room, outcome.memory.size()), kUnwritten);
      text = place<U>(text_, outcome.memory, 0);
    } else {
      text = place<U>(text_, call.text, call.length);
    }
    auto position = [&](const U* at) { return at == nullptr ? int64_t{-1} : at - text; };
    auto read_back = [&](const U* from) {
      for (uint32_t& unit : outcome.memory) unit = static_cast<std::make_unsigned_t<U>>(*from++);
    };
    const State state = {call.form.state}, other_state = {call.other_state};
    auto two_texts = [&](auto family) {
      return calls(family, l, text, state, call.length, other, other_state, call.other_length, call.options);
    };
    uint32_t match = kUnwritten;
    switch (call.function) {
      case Function::cpy:
      case Function::map: {
        outcome.memory.assign(room, kUnwritten);
        U* out = in_place ? text : place<U>(out_, outcome.memory, 0);
        outcome.result = call.function == Function::cpy
                             ? calls(kStrcpy, l, out, call.size, text, state, call.length, call.options)
                             : calls(kMapString, l, out, call.size, text, state, call.length, call.options);
        read_back(out);
        break;
      }
      case Function::cat:
        outcome.result = calls(kStrcat, l, text, other, other_state, call.other_length, call.options);
        read_back(text);
        break;
      case Function::chr: {
        auto find = [&](auto wanted) {
          return calls(kStrchr, l, text, state, call.length, wanted, other_state, StateAt{&match}, call.options);
        };
        if constexpr (std::is_same_v<U, char>) {
          outcome.result = position(find(other));
        } else {
          outcome.result = position(find(*other));
        }
        break;
      }
      case Function::str:
        outcome.result = position(calls(kStrstr, l, text, state, call.length, other, other_state, call.other_length,
                                        StateAt{&match}, call.options));
        break;
      case Function::spn:
        outcome.result = two_texts(kStrspn);
        break;
      case Function::cspn:
        outcome.result = two_texts(kStrcspn);
        break;
      case Function::cmp:
        outcome.result = two_texts(kStrcmp);
        break;
      case Function::tok: {
        int32_t length = call.length;
        U* next = text;
        match = state.value;
        outcome.result = position(calls(kStrtok, l, text, StateAt{&match}, &length, other, other_state,
                                        call.other_length, &next, call.options));
        read_back(text);
        outcome.next = position(next);
        outcome.rest = length;
        break;
      }
      case Function::eol:
        outcome.rest = -1;
        outcome.result =
            position(calls(kGetEol, l, text, state, call.length, &outcome.type, &outcome.rest, call.options));
        break;
    }
    bool gives_state = call.function == Function::tok                                     ? outcome.next >= 0
                       : call.function == Function::chr || call.function == Function::str ? outcome.result >= 0
                                                                                          : false;
    if (call.form.follows_shifts() && gives_state) outcome.state = match;
    outcome.status = LXGetError(l);
    return outcome;
  }

  Session session_;
  std::map<std::pair<const TestLanguage*, uint16_t>, Locale> locales_;
  EdgeBuffer text_{1 << 13}, other_{1 << 13}, out_{1 << 14};
  int differences_ = 0;
};

// ---- Texts ----

// Units of pages that make trouble: lead bytes, bytes that are lead and trail, that begin nothing; line ends, shift
// bytes, zero.
struct Alphabet {
  uint16_t page;
  std::string_view units;
};
inline constexpr Alphabet kAlphabets[] = {{367, "ab\x0A\xFF\0"sv},
                                          {819, "a\xE4\x0A\x0D\0"sv},
                                          {57352, "a\xC3\xA9\xE3\x80\xFF\0"sv},
                                          {932, "a\x83\x5C\xB1\x0A\x0D\0"sv},
                                          {954, "a\x8E\x8F\xB1\xA4\x0A\xFF"sv},
                                          {964, "a\x8E\xA2\xA1\x0D\x0A\0"sv},
                                          {37, "\x81\x0E\x0F\x25\x15\0"sv},
                                          {930, "\x81\x0E\x0F\x41\x25\x0D\0"sv},
                                          {1364, "\x81\x0E\x0F\x40\xFE\x25\x15"sv}};
// Also trail bytes like letters, blanks, and letters with special pairs.
inline constexpr Alphabet kMappingAlphabets[] = {
    {819, "ai\xDF\xFF\xB2 \0"sv},          {920, "iI\xDF\xDD\xFD "sv},
    {813, "\xC1\xE1\xD3\xF3. "sv},         {57352, "ai\xCC\x87\xC4\xB0\xEF\xFF "sv},
    {932, "a\x82\x81\x40\xB1\xDE "sv},     {954, "a\x8E\x8F\xB1\xA3\xC1\xFF "sv},
    {964, "a\x8E\xA2\xA1\xA3\xC1 \0"sv},   {37, "\x81\xC1\x0E\x0F\x59\x40\0"sv},
    {930, "\x81\xC1\x0E\x0F\x42\x40\0"sv}, {1364, "\x81\xC1\x0E\x0F\x42\x40\xFE"sv}};
// With special pairs, digits, both cases, both widths, one way only, and blanks.
inline constexpr std::u16string_view kMappingCharacters =
    u"aAiIjJzZ09 .;~\u00A0\u00A2\u00B2\u00B5\u00B7\u00DF\u00E9\u00C9\u00FF\u012E\u012F\u0130\u0131\u0178\u01C4\u01C5"
    u"\u01C6\u0307\u03A3\u03B1\u03C2\u03C3\u0416\u0436\u0660\u0966\u10A0\u10D0\u2010\u2160\u2170\u20A9\u2190\u24D0"
    u"\u3000\u3001\u3042\u3099\u309B\u30A2\u30FC\u3131\u4E00\uAC00\uFF10\uFF21\uFF41\uFF5E\uFF61\uFF71\uFF9E\uFFA1"
    u"\uFFE0";

// Kinds and start states of a page's text.
inline std::vector<Form> forms_of(const PageSource& page, bool all) {
  std::vector<Form> forms = {{Form::plain, &page}, {Form::shifted, &page}};
  if (page.mixed() || page.id == 932) forms.push_back({Form::shifted, &page, 1});
  if (all || page.id == 37 || page.id == 930) forms.push_back({Form::wide, &page});
  if (page.id == 37 || page.id == 930 || page.id == 819 || page.id == 57352) forms.push_back({Form::ucs2, &page});
  return forms;
}

// Characters of a text that ends inside a double-byte run cannot be counted: behind the last one is nothing to look at.
inline bool ends_inside(const Form& form, const Units& text) {
  const Characters all = characters_of(form, text);
  if (!form.follows_shifts() || all.list.empty() || all.cut || all.list.back().state == 0) return false;
  return std::find(text.begin() + static_cast<ptrdiff_t>(all.list.back().own_end()), text.end(), form.page->leave) ==
         text.end();
}

// The same choices for everybody, so that a failure can be repeated.
class Choice {
 public:
  size_t below(size_t limit) { return std::uniform_int_distribution<size_t>(0, limit - 1)(engine_); }
  bool often() { return below(3) != 0; }
  uint32_t one_of(const Units& units) { return units[below(units.size())]; }

  // A length for a text: measured, in units (of which some cut a character) or in characters.
  int32_t length(const Form& form, const Units& text, bool by_characters) {
    if (below(3) == 0 || (by_characters && ends_inside(form, text))) return -1 - static_cast<int32_t>(below(2));
    size_t all = by_characters ? characters_of(form, text).list.size() : text.size();
    return static_cast<int32_t>(often() ? all : below(all + 1));
  }

 private:
  std::mt19937 engine_{20};
};

template <class Use>
void for_all_strings(const Units& alphabet, size_t longest, Use use) {
  std::vector<Units> texts = {{}};
  for (size_t i = 0; i < texts.size(); ++i) {
    const Units text = texts[i];
    use(text);
    for (uint32_t unit : alphabet) {
      if (text.size() == longest) break;
      texts.push_back(text);
      texts.back().push_back(unit);
    }
  }
}

}  // namespace lx::test
