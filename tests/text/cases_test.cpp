// SPDX-License-Identifier: Apache-2.0
// What is not as one would expect, limits, and what the model of the text functions has no part in.
#include "text/text_runner.hpp"

namespace lx::test {
namespace {

using enum Function;

class TextCases : public testing::Test {
 protected:
  TextRunner runner_;
};

// The model agrees, so that it is known to be right where that is not obvious.
TEST_F(TextCases, Quirks) {
  const Form latin = {Form::plain, &PageSource::of(819)}, turkish = {Form::plain, &PageSource::of(920)},
             sjis = {Form::plain, &PageSource::of(932)}, utf8 = {Form::plain, &PageSource::of(57352)},
             greek = {Form::plain, &PageSource::of(813)}, mixed = {Form::shifted, &PageSource::of(930)},
             inside = {Form::shifted, &PageSource::of(930), 1};
  const uint32_t kUpper = LX_MAP_UPPER, kTrim = LX_CMP_TRIM, kFold = LX_CMP_NOCASE;
  const std::string many(300, 'a');
  struct {
    const char* name;
    Function function;
    Form form;
    std::string_view text, other;
    uint32_t options;
    int64_t result;
    std::string_view memory = "";
    int32_t size = 0;
    LanguageIndex language = kEnglish;
    int32_t length = 0;  // of both texts, where it is not that of all their units
  } cases[] = {
      {"a copy one byte short", cpy, sjis, "ab\x83\x5C", "", 0, 2, "abZ", 3},
      {"counted: no more than there is room for", cpy, utf8, "ab", "", LX_OPT_CHARS, 1, "a", 1, kEnglish, 1000000},
      {"counted: with the end of the run", cpy, mixed, "\x0E\x44\x81\x0F", "", LX_OPT_CHARS, 1, "\x0E\x44\x81\x0F", 9,
       kEnglish, 1},
      {"appended so", cat, mixed, "", "\x0E\x44\x81\x0F\x0E", LX_OPT_CHARS, 1, "\x0E\x44\x81\x0F", 0, kEnglish, 1},
      {"one s, two s and one", str, latin, "\xDFss", "ss\xDF", kFold, 0, "", 0, kGerman},
      {"in another order", str, latin, "xs\xDF", "\xDFs", kFold, 1, "", 0, kGerman},
      {"nothing appended: terminator counts", cat, latin, "aX", "", 0, 3, "aX\0"sv},
      {"a long delimiter becomes zeros", tok, sjis, "a\x83\x5Cz", "\x83\x5C", 0, 0, "a\0\0z"sv},
      {"Turkish", map, turkish, "iI\xFD", "", kUpper, 3, "\xDDII", 3, kTurkish},
      {"replacement that the page lacks", map, latin, "ai", "", kUpper, 2, "A\x1A", 2, kTurkish},
      {"Lithuanian: both characters", map, utf8, "i\xCC\x87", "", kUpper, 1, "I", 1, kLithuanian},
      {"final sigma", map, greek, "\xD3\xC1\xD3 \xD3", "", LX_MAP_LOWER, 5, "\xF3\xE1\xF2 \xF3", 5, kGreek},
      {"inside a run: leaves and enters", map, inside, "\x42\xC1", "", LX_MAP_F2H, 3, "\x0F\xC1\x0E", 3},
      {"counted: a limited area", map, utf8, many, "", LX_MAP_H2F | LX_OPT_CHARS, 170, "", INT32_MAX},
      {"one byte and two, of no matter which value", cmp, sjis, "\xDF", "\x82\x60", kFold, -1},
      {"width is not case", cmp, sjis, "a", "\x82\x60", LX_CMP_NOWIDTH, 32},
      {"but each of its bits is", cmp, sjis, "a", "A", 1, 0},
      {"German", cmp, latin, "\xDF", "SS", kFold, 0, "", 0, kGerman},
      {"shift bytes at the end", cmp, mixed, "\x0E\x42\xC1", "\x0E\x42\xC1\x0F\x0E", 0, 0},
      {"an open run keeps its last character", cmp, inside, "\x42\xC1", "\x0E\x42\xC2", kTrim, -1},
      {"a last byte goes with blanks before it", cmp, sjis, "Plan A", "Plan", kTrim, 0},
  };
  for (const auto& c : cases) {
    TextCall call = {c.function, c.form, units_of(c.text), static_cast<int32_t>(c.text.size()), units_of(c.other)};
    call.other_length = static_cast<int32_t>(c.other.size());
    if (c.length != 0) call.length = call.other_length = c.length;
    call.size = c.size;
    call.options = c.options;
    call.language = &test_languages()[c.language];
    Outcome expected = model(call);
    EXPECT_EQ(expected.result, c.result) << c.name;
    EXPECT_TRUE(c.memory.empty() || expected.memory == units_of(c.memory)) << c.name;
    runner_.check(call);
  }
}

TEST_F(TextCases, LineEndsAreWrittenInAFixedOrder) {
  struct {
    uint32_t flags;
    std::u16string_view text;
  } cases[] = {{0, u"1"},     {0x1000, u"1"}, {0x100, u"1"},   {0x200, u"21"},  {0x300, u"121"},   {0x400, u"3"},
               {0x800, u"4"}, {0xC00, u"43"}, {0x1100, u"11"}, {0x1200, u"21"}, {0xF00, u"43121"}, {0x1500, u"311"}};
  for (uint16_t id : {uint16_t{819}, uint16_t{930}}) {
    const PageSource& page = PageSource::of(id);
    for (const Form& form : forms_of(page, true)) {
      LXLocale* l = runner_.locale(page);
      with_calls(form, [&](auto calls) {
        using U = typename decltype(calls)::Unit;
        for (const auto& c : cases) {
          Units expected;
          if (form.follows_shifts() && form.state != 0) expected.push_back(page.leave);
          for (size_t number : c.text) {
            const size_t i = number - u'1';
            expected.push_back(form.kind == Form::ucs2 ? U"\n\r\u2028\u2029"[i] : page.line_ends[i]);
          }
          Guarded out(expected.size() * sizeof(U));
          U* end = calls(kPutEol, l, out.template as<U>(), State{form.state}, c.flags);
          EXPECT_EQ(end, out.template as<U>() + expected.size()) << form.name() << c.flags;
          EXPECT_EQ(out.view(), raw(form, expected)) << form.name() << c.flags;
          for (uint32_t bad : {0x4100u, 1u, 0x2000u, 0x80000100u}) {
            EXPECT_EQ(calls(kPutEol, l, end, State{form.state}, bad), nullptr);
            EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
          }
        }
      });
    }
  }
}

TEST_F(TextCases, Truncation) {
  struct {
    const char* name;
    uint16_t page;
    std::string_view text;
    int32_t size;
    uint32_t flags;
    int32_t result;
    std::string_view left;
  } cases[] = {
      {"no size: empty", 819, "ab", 0, 0, 1, ""},
      {"negative size: empty", 932, "ab", -3, 0, 1, ""},
      {"three of the bits are needed", 932, "a\x81\x40", 9, LX_TRUNC_STRIP | 0x80000040, 4, "a\x81\x40"},
      {"size in characters", 932, "\x83\x5C\x83\x5C\x83\x5C", 3, LX_OPT_CHARS, 3, "\x83\x5C\x83\x5C"},
      {"in characters: fits", 932, "\x83\x5C\x83\x5C", 3, LX_OPT_CHARS, 0, "\x83\x5C\x83\x5C"},
      {"size in characters, shifted", 930, "\x0E\x44\x81\x44\x82\x44\x83\x0F", 3, LX_OPT_CHARS, 3,
       "\x0E\x44\x81\x44\x82\x0F"},
  };
  for (const auto& c : cases) {
    LXLocale* l = runner_.locale(PageSource::of(c.page));
    Guarded text{std::string(c.text) + '\0'};
    EXPECT_EQ(c.page == 930 ? LXTruncateStringEx(l, text.data(), 0, c.size, c.flags)
                            : LXTruncateString(l, text.data(), c.size, c.flags),
              c.result)
        << c.name;
    EXPECT_EQ(hex(text.data()), hex(c.left)) << c.name;
    EXPECT_EQ(LXGetError(l), LX_OK) << c.name;
    for (uint32_t bad : {2u, 0x200000u, 0x80u}) {
      EXPECT_EQ(LXTruncateString(l, text.data(), 1, c.flags | bad), -1);
      EXPECT_EQ(LXTruncateStringEx(l, text.data(), 0, 1, c.flags | bad), -1);
      EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
    }
  }
}

TEST_F(TextCases, TerminatedInTheSingleByteState) {
  const struct {
    uint16_t page;
    uint32_t state, flags;
    std::string_view written;
  } cases[] = {{930, 0, 0, ""},     {930, 0, LX_OPT_TERMINATE, "\0"sv},
               {930, 1, 0, "\x0F"}, {930, 1, LX_OPT_TERMINATE, "\x0F\0"sv},
               {932, 1, 0, ""},     {932, 1, LX_OPT_TERMINATE, "\0"sv}};
  for (const auto& c : cases) {
    LXLocale* l = runner_.locale(PageSource::of(c.page));
    Guarded out(c.written.size());
    EXPECT_EQ(LXTerminateStringEx(l, out.data(), c.state, c.flags), static_cast<int32_t>(c.written.size()));
    EXPECT_EQ(out.view(), c.written);
    EXPECT_EQ(LXTerminateStringEx(l, nullptr, c.state, 1), -1);
    EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
  }
}

TEST_F(TextCases, LengthsOfPackedCharactersAndUnits) {
  LXLocale* l = runner_.locale(PageSource::of(932));
  for (auto [value, length] : {std::pair(0u, 1), {0xFFu, 1}, {0xFF00u, 2}, {0xFF0000u, 3}, {0x01000000u, 4}}) {
    EXPECT_EQ(LXByteLengthW(l, value), length);
    EXPECT_EQ(LXStrByteLength(l, value), length);
  }
  const LXWChar wide[] = {0x83000000, 1, 0};
  EXPECT_EQ(LXWcslen(l, wide), 2);
  EXPECT_EQ(LXStrlenU(l, reinterpret_cast<const LXUChar*>(u"a\u0100")), 2);
  uint32_t state = 1;
  LXInitState(l, &state);
  EXPECT_EQ(state, 0u);
}

TEST_F(TextCases, UnknownClassOfTypesStillGivesTheFirst) {
  LXLocale* l = runner_.locale(PageSource::of(819));
  for (uint32_t type_class : {0u, 5u, 0x80000013u}) {
    const Units types = {LXGetCharType(l, "A", type_class), LXGetCharTypeEx(l, "!", 0, type_class),
                         LXGetCharTypeW(l, 'a', type_class), LXGetCharTypeU(l, 0xA0, type_class)};
    EXPECT_EQ(types, Units({0x213, 0x220, 0x215, 0x0C0}));
    EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
  }
  EXPECT_EQ(LXGetCharTypeU(l, '0', LX_CTYPE_1), 0x218u);
  EXPECT_EQ(LXGetError(l), LX_OK);
}

TEST_F(TextCases, MovingBackwards) {
  const char* s = &"abc"[2];
  EXPECT_EQ(LXMoveStringPointer(runner_.locale(PageSource::of(819)), s, -2, 0), s - 2);
  for (LXLocale* l : {runner_.locale(PageSource::of(930)), runner_.locale(PageSource::of(57352))}) {
    EXPECT_EQ(LXMoveStringPointer(l, s, -2, 0), nullptr);
    EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
    EXPECT_EQ(LXMoveStringPointerEx(l, s, 0, -1, LX_OPT_CHARS), nullptr);
    EXPECT_EQ(LXMoveStringPointer(l, s, 0, 8), nullptr);
    EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
  }
}

// Some functions by a null locale; nothing may be touched when there is no default either.
void call_without_locale(bool works) {
  char bytes[8] = "ab";
  EXPECT_EQ(LXStrcpy(nullptr, bytes, 0, "ab", 2, 0), works ? 0 : -1);
  EXPECT_EQ(LXStrcat(nullptr, bytes, "", 0, 0), works ? 3 : -1);
  EXPECT_EQ(LXStrchr(nullptr, bytes, 2, "b", 0), works ? bytes + 1 : nullptr);
  EXPECT_EQ(LXStrcmp(nullptr, "a", 1, "b", 1, 0) < 0, works);
  EXPECT_EQ(LXMapString(nullptr, bytes + 4, 4, "b", 1, LX_MAP_UPPER), works ? 1 : -1);
  EXPECT_EQ(LXNextChar(nullptr, bytes), works ? bytes + 1 : nullptr);
  EXPECT_EQ(LXGetCharTypeU(nullptr, 'a', LX_CTYPE_1), works ? 0x215u : 0u);
  EXPECT_EQ(LXTruncateString(nullptr, bytes, 8, 0), works ? 0 : -1);
  EXPECT_EQ(LXGetError(nullptr), works ? LX_OK : LX_E_ARGUMENT);
  EXPECT_EQ(bytes[0], 'a');
}

TEST(TextWithoutALocale, DefaultOrNothing) {
  call_without_locale(false);
  Session session;
  call_without_locale(false);
  ASSERT_EQ(LXSetLocale("English_UnitedStates.Latin1@BINARY", 0), LX_OK);
  call_without_locale(true);
}

}  // namespace
}  // namespace lx::test
