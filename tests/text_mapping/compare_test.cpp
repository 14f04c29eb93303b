// SPDX-License-Identifier: Apache-2.0
// Comparison without collation: cases in tables, then everything beside the slow model.
#include <functional>

#include "support/counting_allocator.hpp"
#include "text_mapping/mapping_runner.hpp"
#include "text_mapping/mapping_samples.hpp"

namespace lx::test {
namespace {

constexpr uint32_t kAllOptions = LX_CMP_NOWIDTH | LX_CMP_NOCASE | LX_CMP_TRIM | LX_OPT_CHARS;
const TestLanguage& kEnglish = test_languages()[0];
const TestLanguage& kGerman = test_languages()[1];

class Compare : public testing::Test {
 protected:
  // Lengths, states, languages and options as they come.
  void check_pair(const Form& form, const Units& text1, const Units& text2) {
    static const uint32_t kFolds[] = {0, LX_CMP_NOCASE, LX_CMP_NOCASE, LX_CMP_NOWIDTH, LX_CMP_NOWIDTH,
                                      1, 0x40,          0x41,          0x80000000,     0x80000001};
    CompareCall call = {&test_languages()[choice_.below(test_languages().size())], form, text1, 0, text2, 0, 0, 0};
    call.options = kFolds[choice_.below(std::size(kFolds))];
    if (choice_.below(3) == 0) call.options |= LX_CMP_TRIM;
    if (choice_.below(3) == 0) call.options |= LX_OPT_CHARS;
    bool by_characters = (call.options & LX_OPT_CHARS) != 0;
    Form other = form;
    if (form.follows_shifts()) call.state2 = other.state = static_cast<uint32_t>(choice_.below(2));
    call.length1 = mapping_length(choice_, form, text1, by_characters);
    call.length2 = mapping_length(choice_, other, text2, by_characters);
    runner_.check(call);
  }
  CompareCall latin(std::string_view a, std::string_view b, uint32_t options, uint16_t page = 819) {
    return {&kEnglish,   {Form::plain, &PageSource::of(page)}, units_of(a), static_cast<int32_t>(a.size()),
            units_of(b), static_cast<int32_t>(b.size()),       0,           options};
  }

  MappingRunner runner_;
  Choice choice_;
};

TEST_F(Compare, Cases) {
  struct {
    const char* name;
    uint16_t page;
    Form::Kind kind;
    const TestLanguage& language;
    std::string_view a, b;
    uint32_t options;
    int32_t result;
    uint32_t state1 = 0, state2 = 0;
  } cases[] = {
      {"extension", 819, Form::plain, kEnglish, "ab", "abc", 0, -1},
      {"extension, folded", 819, Form::plain, kEnglish, "ab", "ABC", LX_CMP_NOCASE, -1},
      {"extension, width", 932, Form::plain, kEnglish, "ab", "abc", LX_CMP_NOWIDTH, -1},
      {"extension by trimmed blanks", 819, Form::plain, kEnglish, "ab", "ab  ", LX_CMP_TRIM, 0},
      {"empty", 819, Form::plain, kEnglish, "", "a", 0, -1},
      {"empty, through special pairs", 819, Form::plain, kGerman, "", "\xDF", LX_CMP_NOCASE, -1},
      {"bytes are unsigned", 819, Form::plain, kEnglish, "a\x80", "a\x7F", LX_CMP_NOWIDTH, 1},
      {"difference of upper case", 819, Form::plain, kEnglish, "az", "AC", LX_CMP_NOCASE, 23},
      {"single and double byte", 932, Form::plain, kEnglish, "a", "\x82\x81", LX_CMP_NOCASE, -1},
      {"... of no matter which value", 932, Form::plain, kEnglish, "\xDF", "\x82\x60", LX_CMP_NOCASE, -1},
      {"... are equal without width", 932, Form::plain, kEnglish, "A\xB1", "\x82\x60\x83\x41", LX_CMP_NOWIDTH, 0},
      {"... with what is left", 932, Form::plain, kEnglish, "AA", "\x82\x60", LX_CMP_NOWIDTH, 1},
      {"width is not case", 932, Form::plain, kEnglish, "a", "\x82\x60", LX_CMP_NOWIDTH, 32},
      {"double bytes fold", 932, Form::plain, kEnglish, "\x82\x81", "\x82\x60", LX_CMP_NOCASE, 0},
      {"cut character left out", 932, Form::plain, kEnglish, "a\x82", "a", 0, 0},
      {"width has no part on single-byte pages", 819, Form::plain, kEnglish, "\xA2", "\xA3", LX_CMP_NOWIDTH, -1},
      {"German", 819, Form::plain, kGerman,
       "Stra\xDF"
       "e",
       "STRASSE", LX_CMP_NOCASE, 0},
      {"not in English", 819, Form::plain, kEnglish, "\xDF\xDF", "ss", LX_CMP_NOCASE, 0xDF - 'S'},
      {"case counts without the option", 819, Form::plain, kGerman, "\xDF", "SS", LX_CMP_NOWIDTH, 0xDF - 'S'},
      {"shift bytes at the beginning", 930, Form::shifted, kEnglish, "\x0E\x42\xC1\x0F", "\x42\xC1", 0, 0, 0, 1},
      {"shift bytes at the end", 930, Form::shifted, kEnglish, "\x0E\x42\xC1", "\x0E\x42\xC1\x0F\x0E", 0, 0},
      {"shift bytes alone", 930, Form::shifted, kEnglish, "\x0E\x0F", "", 0, 0},
      {"widths differ", 930, Form::shifted, kEnglish, "\xC1", "\x0E\x42\xC1\x0F", LX_CMP_NOCASE, -1},
      {"widths do not count", 930, Form::shifted, kEnglish, "\xC1", "\x0E\x42\xC1\x0F", LX_CMP_NOWIDTH, 0},
      {"full-width blank trimmed", 930, Form::shifted, kEnglish, "\xC1\x0E\x40\x40\x0F", "\xC1",
       LX_CMP_NOWIDTH | LX_CMP_TRIM, 0},
      {"not with case", 930, Form::shifted, kEnglish, "\xC1\x0E\x40\x40\x0F", "\xC1", LX_CMP_NOCASE | LX_CMP_TRIM, 3},
      {"an open run keeps its last character", 930, Form::shifted, kEnglish, "\x42\xC1", "\x42\xC2", LX_CMP_TRIM, -1, 1,
       1},
      {"a last byte goes with the blanks before it", 932, Form::plain, kEnglish, "Plan A", "Plan", LX_CMP_TRIM, 0},
      {"on single-byte pages it does not", 819, Form::plain, kEnglish, "Plan A", "Plan", LX_CMP_TRIM, 2},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.name);
    CompareCall call = {&c.language,   {c.kind, &PageSource::of(c.page), c.state1},
                        units_of(c.a), static_cast<int32_t>(c.a.size()),
                        units_of(c.b), static_cast<int32_t>(c.b.size()),
                        c.state2,      c.options};
    CompareResult model = compare_model(call);
    EXPECT_TRUE(model.exact ? model.value == c.result : (model.value < 0) == (c.result < 0)) << model.value;
    runner_.check(call, {c.result, model.exact});
    call.length1 = -1;
    call.length2 = -2;
    if (std::string_view(c.name) != "cut character left out") runner_.check(call, {c.result, model.exact});
  }
}

TEST_F(Compare, UnitsByValue) {
  const PageSource& page = PageSource::of(930);
  const Form wide = {Form::wide, &page};
  const Form ucs2 = {Form::ucs2, &page};
  struct {
    Form form;
    Units a, b;
    uint32_t options;
    int32_t result;
  } cases[] = {
      {wide, {0x42C1}, {0xC1}, 0, 1},
      {wide, {0xC1}, {0x80000000}, 0, -1},
      {wide, {0x4281}, {0x42C1}, LX_CMP_NOCASE, 0},
      {wide, {0xC1}, {0x42C1}, LX_CMP_NOWIDTH, 0},
      {wide, {0xC1, 0x40, 0x4040}, {0xC1}, LX_CMP_NOWIDTH | LX_CMP_TRIM, 0},
      {wide, {0xC1, 0x40, 0x4040}, {0xC1}, LX_CMP_TRIM, 2},
      {ucs2, {0xFF21}, {'A'}, 0, 0xFF21 - 'A'},
      {ucs2, {0xFF21}, {'A'}, LX_CMP_NOWIDTH, 0},
      {ucs2, {0x430, 'b'}, {0x410, 'B'}, LX_CMP_NOCASE, 0},
      {ucs2, {'a', ' '}, {'a'}, LX_CMP_TRIM, 0},
      {ucs2, {'a', ' ', 'b'}, {'a'}, LX_CMP_TRIM, 2},
      {ucs2, {'a', 0x3000}, {'a'}, LX_CMP_TRIM, 1},
      {ucs2, {'a', 0x3000}, {'a'}, LX_CMP_TRIM | LX_CMP_NOWIDTH, 0},
  };
  for (const auto& c : cases) {
    CompareCall call = {&kEnglish, c.form, c.a, -1, c.b, -1, 0, c.options};
    EXPECT_EQ(compare_model(call).value, c.result);
    runner_.check(call, {c.result});
  }
}

TEST_F(Compare, EveryOptionBit) {
  for (const Form& form : mapping_forms(PageSource::of(819))) {
    for (uint32_t bit = 1; bit != 0; bit <<= 1) {
      CompareCall call = {&kEnglish, form, {'a'}, 1, {'B'}, 1, 0, bit};
      LXLocale* l = runner_.locale(kEnglish, *form.page);
      char a[] = "a", b[] = "B";
      bool known = (bit & kAllOptions) != 0;
      if (known) runner_.check(call);
      if (known || form.kind != Form::plain) continue;
      for (uint32_t more : {0u, LX_CMP_NOCASE, LX_OPT_CHARS}) {
        EXPECT_EQ(LXStrcmp(l, a, 1, b, 1, bit | more), 0) << std::hex << bit;
        EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT) << std::hex << bit;
        EXPECT_EQ(LXStrcmpEx(l, a, 0, 1, b, 0, 1, bit | more), 0);
        EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
        LXWChar wide[] = {'a', 'B'};
        EXPECT_EQ(LXWcscmp(l, wide, 1, wide + 1, 1, bit | more), 0);
        EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
        LXUChar units[] = {'a', 'B'};
        EXPECT_EQ(LXStrcmpU(l, units, 1, units + 1, 1, bit | more), 0);
        EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
      }
    }
  }
}

// Each of the bits alone folds case; only all of them together look at widths instead.
TEST_F(Compare, WhatFoldsCase) {
  for (uint32_t options : {1u, 0x40u, 0x41u, 0x80000000u, 0x80000001u, 0x80000040u}) {
    runner_.check(latin("aBc", "AbC", options), {0});
    runner_.check(latin("A", "\x82\x60", options, 932), {-1});
  }
  for (uint32_t options : {0u, LX_CMP_TRIM, LX_OPT_CHARS, LX_CMP_NOWIDTH}) {
    EXPECT_GT(runner_.run(latin("aBc", "AbC", options)), 0) << options;
  }
}

TEST_F(Compare, AllShortPairs) {
  for (const Alphabet& alphabet : kMappingAlphabets) {
    for (const Form& form : mapping_forms(PageSource::of(alphabet.page))) {
      Units letters = mapping_letters(form, alphabet.units);
      for_all_strings(letters, 3, [&](const Units& text1) {
        for_all_strings(letters, text1.size() < 3 ? 2 : 1, [&](const Units& text2) { check_pair(form, text1, text2); });
        check_pair(form, text1, text1);
      });
    }
  }
}

// Longer texts that begin alike.
TEST_F(Compare, RandomPairs) {
  for (const Alphabet& alphabet : kMappingAlphabets) {
    for (const Form& form : mapping_forms(PageSource::of(alphabet.page))) {
      Units letters = mapping_letters(form, alphabet.units);
      for (int i = 0; i < 800; ++i) {
        Units text1 = mapping_text(choice_, form, letters, 20);
        Units text2 = text1;
        uint32_t flags = choice_.below(2) != 0 ? LX_MAP_F2H : LX_MAP_UPPER;
        auto length = static_cast<int32_t>(text1.size());
        if (choice_.often()) text2 = map_model({&kEnglish, form, text1, length, 3 * length, flags}).written;
        if (choice_.below(2) != 0 && !text2.empty())
          text2[choice_.below(text2.size())] = letters[choice_.below(letters.size())];
        for (size_t blanks = choice_.below(4); form.page->ascii_family && blanks > 1; --blanks) text2.push_back(0x20);
        check_pair(form, text1, text2);
      }
    }
  }
}

TEST_F(Compare, AdjustedLengths) {
  EdgeBuffer buffer(64);
  for (const Alphabet& alphabet : kMappingAlphabets) {
    for (const Form& form : mapping_forms(PageSource::of(alphabet.page))) {
      if (form.kind != Form::shifted) continue;
      LXLocale* l = runner_.locale(kEnglish, *form.page);
      for_all_strings(units_of(alphabet.units), 4, [&](const Units& text) {
        size_t expected = characters_of(form, text).whole;
        auto length = static_cast<int32_t>(text.size());
        const char* at = MappingRunner::place<char>(buffer, text, 0);
        EXPECT_EQ(AdjustLength(l, at, form.state, length), static_cast<int32_t>(expected))
            << form.page->name << " " << hex_units(text);
      });
      EXPECT_EQ(AdjustLength(l, "a", 0, -1), 0);
    }
  }
}

// ---- Memory ----

struct MemoryCase {
  const char* name;
  const TestLanguage& language;
  uint32_t options;
  bool allocates;
};

TEST(CompareMemory, OnlySpecialPairsNeedIt) {
  const MemoryCase cases[] = {
      {"exact", kGerman, 0, false},
      {"width", kGerman, LX_CMP_NOWIDTH, false},
      {"trimming", kGerman, LX_CMP_TRIM, false},
      {"case without special pairs", kEnglish, LX_CMP_NOCASE | LX_CMP_TRIM, false},
      {"case", kGerman, LX_CMP_NOCASE, true},
      {"case and trimming", kGerman, LX_CMP_NOCASE | LX_CMP_TRIM, true},
  };
  CountingAllocator allocator;
  ASSERT_EQ(allocator.init(LEXARO_DATA), LX_OK);
  {
    Locale english(LXGetLocale("English_UnitedStates.Latin1@BINARY", 0, nullptr));
    Locale german(LXGetLocale("German_Germany.Latin1@BINARY", 0, nullptr));
    for (const MemoryCase& c : cases) {
      SCOPED_TRACE(c.name);
      LXLocale* l = &c.language == &kGerman ? german.get() : english.get();
      const LXWChar wide[] = {'a', ' ', 'b'};
      const LXUChar units[] = {'a', ' ', 'b'};
      using Call = std::function<int32_t()>;
      for (const Call& compare : {Call([&] { return LXStrcmp(l, "a ", 2, "b", 1, c.options); }),
                                  Call([&] { return LXStrcmpEx(l, "a ", 0, 2, "b", 0, 1, c.options); }),
                                  Call([&] { return LXWcscmp(l, wide, 2, wide + 2, 1, c.options); }),
                                  Call([&] { return LXStrcmpU(l, units, 2, units + 2, 1, c.options); })}) {
        int before = allocator.live;
        int failed = 0;
        for (int n = 0;; ++n) {
          allocator.arm(n, n % 2 == 0);
          int32_t result = compare();
          bool has_failed = allocator.has_failed();
          allocator.disarm();
          EXPECT_EQ(LXGetError(l), has_failed ? LX_E_MEMORY : LX_OK);
          EXPECT_EQ(result < 0, !has_failed);
          EXPECT_EQ(allocator.live, before);
          if (!has_failed) break;
          EXPECT_EQ(result, 0);
          ++failed;
        }
        EXPECT_EQ(failed, c.allocates ? 2 : 0);
      }
    }
  }
  LXTerm();
}

TEST(CompareWithoutALocale, DefaultOrNothing) {
  EXPECT_EQ(LXStrcmp(nullptr, "a", 1, "b", 1, 0), 0);
  Session session;
  EXPECT_EQ(LXStrcmp(nullptr, "a", 1, "b", 1, 1u << 8), 0);
  ASSERT_EQ(LXSetLocale("English_UnitedStates.Latin1@BINARY", 0), LX_OK);
  EXPECT_LT(LXStrcmp(nullptr, "a", 1, "b", 1, 0), 0);
  EXPECT_EQ(LXStrcmp(nullptr, "a", 1, "b", 1, 1u << 8), 0);
  EXPECT_EQ(LXGetError(nullptr), LX_E_ARGUMENT);
}

}  // namespace
}  // namespace lx::test
