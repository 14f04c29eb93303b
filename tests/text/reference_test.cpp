// SPDX-License-Identifier: Apache-2.0
// The library beside its slow reference: on all short strings over bytes that make trouble, and on longer random ones.
#include "text/text_runner.hpp"
#include "text/text_samples.hpp"

namespace lx::test {
namespace {

// A length for a text: measured, in units (of which some cut a character) or in characters.
int32_t choose_length(Choice& choice, const Form& form, const Units& text, bool by_characters) {
  if (choice.below(3) == 0) return -1 - static_cast<int32_t>(choice.below(2));
  size_t all = by_characters ? characters_of(form, text).list.size() : text.size();
  return static_cast<int32_t>(choice.often() ? all : choice.below(all + 1));
}

class TextReference : public testing::Test {
 protected:
  // Lengths, states and options as they come.
  void check_pair(Function function, const Form& form, const Units& text, const Units& other) {
    TextCall call = {function, form, text};
    Form other_form = form;
    if (form.follows_shifts()) other_form.state = static_cast<uint32_t>(choice_.below(2));
    call.other = other;
    call.other_state = other_form.state;
    call.options = choice_.below(2) != 0 ? LX_OPT_CHARS : 0;
    if (function == Function::chr) {
      bool shift = form.follows_shifts() && (other[0] == form.page->enter || other[0] == form.page->leave);
      if (shift) return;
      call.options = choice_.below(2) != 0 ? LX_STR_LAST : 0;
    }
    if (function == Function::cat && std::find(text.begin(), text.end(), 0u) != text.end()) return;
    if (function == Function::cat && choice_.below(2) != 0) call.options |= LX_OPT_TERMINATE;
    bool by_characters = (call.options & LX_OPT_CHARS) != 0;
    call.length = choose_length(choice_, form, text, by_characters);
    call.other_length = choose_length(choice_, other_form, other, by_characters);
    runner_.check(call);
  }
  void check_pairs(const Form& form, const Units& text, const Units& other) {
    for (Function function : {Function::cat, Function::str, Function::spn, Function::cspn, Function::tok}) {
      check_pair(function, form, text, other);
    }
    if (!other.empty()) check_pair(Function::chr, form, text, other);
  }
  void check_cpy(const Form& form, const Units& text, int32_t length, int32_t size, uint32_t options) {
    TextCall call = {Function::cpy, form, text, length};
    call.size = size;
    call.options = options;
    runner_.check(call);
  }

  TextRunner runner_;
  Choice choice_;
};

TEST_F(TextReference, CopiesOfAllShortTexts) {
  for (const Alphabet& alphabet : kAlphabets) {
    for (const Form& form : forms_of(PageSource::of(alphabet.page))) {
      for_all_strings(letters(form, alphabet.units), 4, [&](const Units& text) {
        auto all = static_cast<int32_t>(text.size());
        for (int32_t length = text.size() < 4 ? -1 : all; length <= all; ++length) {
          for (int32_t size = text.size() < 4 ? -1 : 1; size <= all + 1; ++size) check_cpy(form, text, length, size, 0);
        }
        auto characters = static_cast<int32_t>(characters_of(form, text).list.size());
        for (int32_t size = 0; size <= characters + 1; ++size) {
          check_cpy(form, text, choice_.below(2) != 0 ? -1 : characters, size, LX_OPT_CHARS);
        }
      });
    }
  }
}

TEST_F(TextReference, LineEndsOfAllShortTexts) {
  for (const Alphabet& alphabet : kAlphabets) {
    for (const Form& form : forms_of(PageSource::of(alphabet.page))) {
      for_all_strings(letters(form, alphabet.units), 4, [&](const Units& text) {
        for (uint32_t kinds = text.size() < 4 ? 0 : static_cast<uint32_t>(choice_.below(4)); kinds < 16;
             kinds += text.size() < 4 ? 1 : 4) {
          TextCall call = {Function::eol, form, text};
          call.options = kinds << 8 | (choice_.below(2) != 0 ? LX_OPT_CHARS : 0);
          call.length = choose_length(choice_, form, text, (call.options & LX_OPT_CHARS) != 0);
          runner_.check(call);
        }
      });
    }
  }
}

TEST_F(TextReference, AllPairsOfShortTexts) {
  for (const Alphabet& alphabet : kAlphabets) {
    for (const Form& form : forms_of(PageSource::of(alphabet.page))) {
      Units units = letters(form, alphabet.units);
      for_all_strings(units, 3, [&](const Units& text) {
        for_all_strings(units, 2, [&](const Units& other) {
          if (text.size() < 3 || other.size() < 2 || choice_.below(8) == 0) check_pairs(form, text, other);
        });
      });
    }
  }
}

TEST_F(TextReference, RandomTexts) {
  for (const Alphabet& alphabet : kAlphabets) {
    for (const Form& form : forms_of(PageSource::of(alphabet.page))) {
      Units units = letters(form, alphabet.units);
      auto random_text = [&](size_t longest) {
        Units text(choice_.below(longest + 1));
        for (uint32_t& unit : text) unit = units[choice_.below(units.size())];
        return text;
      };
      for (int i = 0; i < 1000; ++i) check_pairs(form, random_text(40), random_text(4));
    }
  }
}

// The first place where as many characters as the pattern has compare equal to it.
template <class Calls>
void check_folded(LXLocale* l, const Form& form, const Units& text, const Units& pattern, uint32_t options) {
  using U = typename Calls::Unit;
  std::vector<U> s, sub;
  for (uint32_t unit : text) s.push_back(static_cast<U>(unit));
  for (uint32_t unit : pattern) sub.push_back(static_cast<U>(unit));
  auto size = [](const std::vector<U>& units) { return static_cast<int32_t>(units.size()); };
  auto list = characters_of(form, text).list;
  size_t count = characters_of({form.kind, form.page}, pattern).list.size();
  ptrdiff_t expected = -1;
  for (size_t i = 0; expected < 0 && i + count <= list.size(); ++i) {
    const TextCharacter& last = list[i + count - 1];
    auto length = static_cast<int32_t>(last.at + last.size - list[i].at);
    U* at = s.data() + list[i].at;
    if (Calls::cmp(l, at, list[i].state, length, sub.data(), 0, size(sub), options) == 0) expected = at - s.data();
  }
  U* found = Calls::str(l, s.data(), form.state, size(s), sub.data(), 0, size(sub), nullptr, options);
  EXPECT_EQ(found == nullptr ? -1 : found - s.data(), expected)
      << TextCall{Function::str, form, text, size(s), pattern, size(sub), 0, 0, options}.describe();
}

TEST_F(TextReference, FoldedSearchIsAComparisonAtEachCharacter) {
  constexpr std::u16string_view kLetters = u"aAbB\uFF41\uFF21\uFF42\u00E9\u00C9\uFF76\u30AB";
  for (uint16_t id : {uint16_t{819}, uint16_t{37}, uint16_t{932}, uint16_t{954}, uint16_t{57352}, uint16_t{930}}) {
    const PageSource& page = PageSource::of(id);
    auto random_text = [&](size_t longest) {
      std::u16string text;
      for (size_t n = 1 + choice_.below(longest); n > 0;) {
        char16_t c = kLetters[choice_.below(kLetters.size())];
        if (page.has(c)) text += c, --n;
      }
      return text;
    };
    for (int i = 0; i < 1000; ++i) {
      std::u16string text = random_text(9), pattern = random_text(2);
      for (uint32_t options : {LX_CMP_NOCASE, LX_CMP_NOWIDTH}) {
        LXLocale* l = runner_.locale(page);
        auto spell = [&](Form::Kind kind) {
          return std::pair(spelled({kind, &page}, text), spelled({kind, &page}, pattern));
        };
        auto [bytes, sub] = spell(Form::shifted);
        if (!page.mixed()) check_folded<PlainCalls>(l, {Form::plain, &page}, bytes, sub, options);
        check_folded<ShiftedCalls>(l, {Form::shifted, &page}, bytes, sub, options);
        auto [wide, wide_sub] = spell(Form::wide);
        check_folded<WideCalls>(l, {Form::wide, &page}, wide, wide_sub, options);
        auto [units, unit_sub] = spell(Form::ucs2);
        check_folded<Ucs2Calls>(l, {Form::ucs2, &page}, units, unit_sub, options);
        if (HasFailure()) return;
      }
    }
  }
}

}  // namespace
}  // namespace lx::test
