// SPDX-License-Identifier: Apache-2.0
// The library beside its slow model: on all short strings over units that make trouble, and on longer random ones.
#include "text/text_runner.hpp"

namespace lx::test {
namespace {

class TextFunctions : public testing::Test {
 protected:
  Units random_units(const Units& letters, size_t longest) {
    Units text(choice_.below(longest + 1));
    for (uint32_t& unit : text) unit = choice_.one_of(letters);
    return text;
  }
  // Characters of the page, now and then a unit out of place.
  Units mapping_text(const Form& form, const Units& letters, size_t longest) {
    Writer out{form};
    for (size_t count = choice_.below(longest + 1); count != 0; --count) {
      uint16_t character = kMappingCharacters[choice_.below(kMappingCharacters.size())];
      if (choice_.below(12) == 0 && form.kind != Form::ucs2) out.units.push_back(choice_.one_of(letters));
      if (form.kind == Form::ucs2 || form.page->has(character)) out.add(out.piece(character));
    }
    return out.units;
  }
  const TestLanguage* any_language() { return &test_languages()[choice_.below(test_languages().size())]; }

  // Lengths, states and options as they come.
  void check_pair(Function function, const Form& form, const Units& text, const Units& other) {
    TextCall call = {function, form, text, -1, other};
    if (form.follows_shifts()) call.other_state = choice_.half();
    call.options = choice_.half() ? LX_OPT_CHARS : 0;
    if (function == Function::chr) {
      if (form.is_shift(other[0])) return;
      call.options = choice_.half() ? LX_STR_LAST : 0;
    }
    if (function == Function::cat && std::find(text.begin(), text.end(), 0u) != text.end()) return;
    if (function == Function::cat && choice_.half()) call.options |= LX_OPT_TERMINATE;
    check_lengths(call);
  }
  void check_lengths(TextCall call) {
    call.length = choice_.length(call.form, call.text, call.counts_characters());
    const bool all = call.function == Function::cat && ends_inside_run(call.other_form(), call.other);
    call.other_length = all ? -1 : choice_.length(call.other_form(), call.other, call.counts_characters());
    runner_.check(call);
  }
  void check_pairs(const Form& form, const Units& text, const Units& other) {
    for (Function function : {Function::cat, Function::str, Function::spn, Function::cspn, Function::tok}) {
      check_pair(function, form, text, other);
    }
    if (!other.empty()) check_pair(Function::chr, form, text, other);
  }
  void check_comparison(const Form& form, const Units& text, const Units& other) {
    static const Units kFolds = {0, LX_CMP_NOCASE, LX_CMP_NOCASE, LX_CMP_NOWIDTH, LX_CMP_NOWIDTH,
                                 1, 0x40,          0x41,          0x80000000,     0x80000001};
    TextCall call = {Function::cmp, form, text, 0, other};
    call.language = any_language();
    call.options = choice_.one_of(kFolds);
    if (!choice_.often()) call.options |= LX_CMP_TRIM;
    if (!choice_.often()) call.options |= LX_OPT_CHARS;
    if (form.follows_shifts()) call.other_state = choice_.half();
    check_lengths(call);
  }
  void check_mappings(const Form& form, const Units& text, bool every_size) {
    for (uint32_t flags :
         {0u, LX_MAP_H2F, LX_MAP_F2H, LX_MAP_COPY, LX_MAP_LOWER, LX_MAP_UPPER, LX_MAP_LOWER | LX_MAP_PLAIN,
          LX_MAP_UPPER | LX_MAP_PLAIN, LX_MAP_DIGITS, LX_MAP_UPPER | LX_MAP_DIGITS}) {
      // Counted copies of text with shift bytes are LXStrcpyEx's.
      const bool copy = flags == 0 || flags == LX_MAP_COPY;
      TextCall call = {Function::map, form, text};
      call.options = flags;
      if (!choice_.often() && !(copy && form.follows_shifts())) call.options |= LX_OPT_CHARS;
      const auto most = static_cast<int32_t>(2 * text.size() + 3);
      for (int32_t size = every_size ? -1 : most - 1; size <= most; ++size) {
        call.size = every_size || size == most ? size : static_cast<int32_t>(choice_.below(2 * text.size() + 3));
        call.language = any_language();
        call.length = choice_.length(form, text, call.counts_characters());
        runner_.check(call);
      }
    }
  }

  TextRunner runner_;
  Choice choice_;
};

TEST_F(TextFunctions, CopiesAndLineEndsOfAllShortTexts) {
  for (const Lettered& lettered : text_forms()) {
    const Form& form = lettered.form;
    const Units& letters = lettered.letters;
    for_all_strings(letters, 4, [&](const Units& text) {
      const auto all = static_cast<int32_t>(text.size());
      TextCall call = {Function::cpy, form, text};
      for (call.length = all < 4 ? -1 : all; call.length <= all; ++call.length) {
        for (call.size = all < 4 ? -1 : 1; call.size <= all + 1; ++call.size) runner_.check(call);
      }
      const auto characters = static_cast<int32_t>(characters_of(form, text).list.size());
      call.options = LX_OPT_CHARS;
      for (call.size = 0; call.size <= characters + 1; ++call.size) {
        call.length = choice_.half() || ends_inside_run(form, text) ? -1 : characters;
        runner_.check(call);
      }
      call.function = Function::eol;
      call.size = 0;
      for (uint32_t kinds = 0; kinds < 16; ++kinds) {
        if (all == 4 && choice_.often()) continue;
        call.options = kinds << 8 | (choice_.half() ? LX_OPT_CHARS : 0);
        call.length = choice_.length(form, text, call.counts_characters());
        runner_.check(call);
      }
    });
  }
}

TEST_F(TextFunctions, AllPairsOfShortTexts) {
  for (const Lettered& one : text_forms()) {
    for_all_strings(one.letters, 3, [&](const Units& text) {
      for_all_strings(one.letters, 2, [&](const Units& other) {
        if (text.size() < 3 || other.size() < 2 || choice_.below(8) == 0) check_pairs(one.form, text, other);
      });
    });
  }
  for (const Lettered& one : mapping_forms()) {
    for_all_strings(one.letters, 3, [&](const Units& text) {
      for_all_strings(one.letters, text.size() < 3 ? 2 : 1,
                      [&](const Units& other) { check_comparison(one.form, text, other); });
      check_comparison(one.form, text, text);
      if (text.size() < 3 || choice_.below(4) == 0) check_mappings(one.form, text, text.size() < 3);
    });
  }
}

TEST_F(TextFunctions, RandomTexts) {
  for (const auto& [form, letters] : text_forms()) {
    for (int i = 0; i < 1000; ++i) check_pairs(form, random_units(letters, 40), random_units(letters, 4));
  }
  for (const auto& [form, letters] : mapping_forms()) {
    for (int i = 0; i < 100; ++i) check_mappings(form, mapping_text(form, letters, 40), i < 2);
    for (int i = 0; i < 600; ++i) {  // texts that begin alike
      const Units text = mapping_text(form, letters, 20);
      Units other = text;
      TextCall call = {Function::map, form, text, static_cast<int32_t>(text.size())};
      call.size = 3 * call.length;
      call.options = choice_.half() ? LX_MAP_F2H : LX_MAP_UPPER;
      const Outcome mapped = map_model(call);
      if (choice_.often()) other = first_units(mapped.memory, static_cast<size_t>(mapped.result));
      if (choice_.half() && !other.empty()) other[choice_.below(other.size())] = choice_.one_of(letters);
      for (size_t blanks = choice_.below(4); form.page->ascii_family && blanks > 1; --blanks) other.push_back(0x20);
      check_comparison(form, text, other);
    }
  }
}

TEST_F(TextFunctions, FoldedSearches) {
  constexpr std::u16string_view kLetters = u"aAbB\uFF41\uFF21\uFF42\u00E9\u00C9\uFF76\u30ABs\u00DF";
  for (uint16_t id : {uint16_t{819}, uint16_t{37}, uint16_t{932}, uint16_t{954}, uint16_t{57352}, uint16_t{930}}) {
    const PageSource& page = PageSource::of(id);
    auto random_text = [&](size_t longest) {
      std::u16string text;
      for (size_t n = 1 + choice_.below(longest); n > 0;) {
        const char16_t c = kLetters[choice_.below(kLetters.size())];
        if (page.has(c)) text += c, --n;
      }
      return text;
    };
    for (int i = 0; i < 1000; ++i) {
      const std::u16string text = random_text(9), pattern = random_text(2);
      for (Form form : {Form{Form::plain, &page}, {Form::shifted, &page}, {Form::wide, &page}, {Form::ucs2, &page}}) {
        if (form.kind == Form::plain && page.mixed()) continue;
        TextCall call = {Function::str, form, spelled(form, text), -1, spelled(form, pattern)};
        call.options = (i % 2 == 0 ? LX_CMP_NOCASE : LX_CMP_NOWIDTH) | (i % 4 < 2 ? LX_OPT_CHARS : 0);
        if (page.max_length == 1 && form.is_bytes()) call.language = any_language();  // every position is tried there
        runner_.check(call);
      }
    }
  }
}

// Where no character grows, and where the output is made elsewhere first.
TEST_F(TextFunctions, MappingInPlace) {
  for (const auto& [form, letters] : mapping_forms()) {
    for (int i = 0; i < 100; ++i) {
      TextCall call = {Function::map, form, mapping_text(form, {0x20}, 30)};
      for (uint32_t flags :
           {0u, LX_MAP_UPPER | LX_MAP_PLAIN, LX_MAP_LOWER | LX_MAP_PLAIN, LX_MAP_DIGITS, LX_MAP_H2F | LX_OPT_CHARS}) {
        call.options = flags;
        const bool counted = call.counts_characters();
        if (!counted && (form.follows_shifts() || flags == (LX_MAP_H2F | LX_OPT_CHARS))) continue;
        call.length = static_cast<int32_t>(counted ? characters_of(form, call.text).list.size() : call.text.size());
        call.size = counted ? call.length / 3 : call.length;
        Outcome expected = map_model(call);
        if (!counted) expected.memory.resize(static_cast<size_t>(expected.result));
        if (expected.memory.size() > call.text.size()) continue;
        EXPECT_EQ(runner_.run(call, expected.memory.size(), true), expected) << call.describe();
      }
    }
  }
}

// Every bit alone and beside others, in every kind of text.
TEST_F(TextFunctions, OptionBits) {
  using enum Function;
  constexpr uint32_t kChars = LX_OPT_CHARS, kFolds = LX_CMP_NOWIDTH | kChars;
  const std::pair<Function, uint32_t> accepted[] = {{cpy, kChars},      {cat, kChars | LX_OPT_TERMINATE},
                                                    {str, kFolds},      {cmp, kFolds | LX_CMP_TRIM},
                                                    {spn, kChars},      {cspn, kChars},
                                                    {tok, kChars},      {eol, kChars | 0xF00},
                                                    {chr, LX_STR_LAST}, {map, 0}};
  std::vector<Form> forms;
  for (uint16_t page : {uint16_t{819}, uint16_t{932}, uint16_t{930}}) {
    for (const Form& form : forms_of(PageSource::of(page), true)) forms.push_back(form);
  }
  for (const Form& form : forms) {
    for (const auto& [function, bits] : accepted) {
      for (unsigned bit = 0; bit <= 32; ++bit) {
        for (uint32_t others : {0u, LX_OPT_CHARS, LX_CMP_NOWIDTH, LX_STR_LAST, LX_MAP_UPPER}) {
          TextCall call = {function, form, {'a', 'a'}, 1, {'a', 'a'}, 1, 0, 2, others | (bit == 32 ? 0 : 1u << bit)};
          if (ends_inside_run(form, call.text)) call.text.push_back(form.page->leave);
          bool good = (call.options & ~bits) == 0;
          if (function == chr) good = call.options == 0 || call.options == LX_STR_LAST;
          if (function == map) good = map_model(call).status == LX_OK;
          const Outcome got = runner_.run(call, 8);
          EXPECT_EQ(got.status, good ? LX_OK : LX_E_ARGUMENT) << call.describe();
          if (good) continue;
          EXPECT_LE(got.result, 0) << call.describe();
          EXPECT_TRUE(function != eol || (got.type == LX_EOL_BAD && got.rest == 0));
        }
      }
    }
  }
}

}  // namespace
}  // namespace lx::test
