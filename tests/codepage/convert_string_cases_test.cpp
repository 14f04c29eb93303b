// SPDX-License-Identifier: Apache-2.0
// Whole strings, case by case: how they end, what a locale or an option that is missing or wrong does.
#include <functional>
#include <memory>

#include "support/page_source.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

class ConvertStringCases : public testing::Test {
 private:
  Session session_;
};

// Leaves a status behind that a later success has to clear.
void spoil_status(LXLocale* locale) { EXPECT_EQ(LXStringToUnicode(locale, nullptr, 0, nullptr, 0, 1), -1); }

// -----------------------------------------------------------------------------------------------------

struct Case {
  const char* name;
  const char* target;
  const char* source;
  bool shifted;  // LXConvertStringEx
  std::string in;
  int32_t in_length;
  int32_t out_size;
  uint32_t flags;
  int32_t count;
  std::string out;
};

std::string zeros(std::string_view text) { return std::string(text); }

TEST_F(ConvertStringCases, SingleCases) {
  using namespace std::string_view_literals;
  const Case kCases[] = {
      {"measured: a terminator when there is room", "Latin1", "Latin1", false, "abc", -1, 4, 0, 4, zeros("abc\0"sv)},
      {"measured: none when the text just fits", "Latin1", "Latin1", false, "abc", -1, 3, 0, 3, "abc"},
      {"measured: any negative length", "Latin1", "Latin1", false, "abc", -7, 9, 0, 4, zeros("abc\0"sv)},
      {"given: no terminator", "Latin1", "Latin1", false, "abc", 3, 9, 0, 3, "abc"},
      {"terminator takes one from the text", "Latin1", "Latin1", false, "abc", -1, 3, 8, 3, zeros("ab\0"sv)},
      {"room for the terminator alone", "Latin1", "Latin1", false, "abc", -1, 1, 8, 1, zeros("\0"sv)},
      {"no text, terminator", "Latin1", "Latin1", false, "", 0, 5, 8, 1, zeros("\0"sv)},
      {"no room, terminator", "Latin1", "Latin1", false, "abc", 3, 0, 8, 0, ""},
      {"negative room is none", "Latin1", "Latin1", false, "abc", 3, -4, 8, 0, ""},
      {"zero bytes inside a given length", "Latin1", "IBM037", false, zeros("\xC1\0\xC2"sv), 3, 9, 0, 3,
       zeros("A\0B"sv)},
      {"cut character dropped silently", "Latin1", "MS932", false, "ab\x83", 3, 9, 0, 2, "ab"},
      {"cut character dropped silently, measured: not all consumed", "Latin1", "MS932", false, "ab\x83", -1, 9, 0, 2,
       "ab"},
      {"unmapped becomes the substitution byte", "IBM037", "Latin1", false, "\x41", 1, 9, 0, 1, "\xC1"},
      {"unassigned bytes become U+FFFD", "UTF-8", "US-ASCII", false, "\x80", 1, 9, 0, 3, "\xEF\xBF\xBD"},
      {"byte that begins nothing is a character", "UTF-8", "UTF-8", false,
       "\x80"
       "a",
       2, 9, 0, 4,
       "\xEF\xBF\xBD"
       "a"},
      {"never half a character", "UTF-8", "Latin1", false, "\xE4\xE4", 2, 3, 0, 2, "\xC3\xA4"},
      {"characters: room and result", "UTF-8", "Latin1", false, "\xE4\xF6\xFC", 3, 2, 0x4000, 2, "\xC3\xA4\xC3\xB6"},
      {"characters: length", "UTF-8", "MS932", false, "\x83\x41\x83\x42z", 2, 9, 0x4008, 3,
       zeros("\xE3\x82\xA2\xE3\x82\xA3\0"sv)},
      {"shift bytes are left alone by the plain form", "UTF-8", "IBM930", false, "\x0E\xC1\x0F", 3, 9, 0, 3,
       "\x0E"
       "A\x0F"},
      {"double-byte characters without shift bytes in the plain form", "IBM930", "UTF-8", false, "\xE3\x80\x80", 3, 9,
       0, 2, "\x40\x40"},
      {"shift bytes followed", "UTF-8", "IBM930", true, "\xC1\x0E\x40\x40\x0F\xC2", 6, 9, 0, 5,
       "A\xE3\x80\x80"
       "B"},
      {"one shift byte before each character: a second one is text", "UTF-8", "IBM930", true, "\x0E\x0E\x41\x41", 4, 9,
       0, 3, "\xEF\xBF\xBD"},
      {"shift byte at the end is consumed", "UTF-8", "IBM930", true, "\xC1\x0E", -1, 9, 0, 2, zeros("A\0"sv)},
      {"run is closed", "IBM930", "UTF-8", true, "a\xE3\x80\x80", 4, 9, 0, 5, "\x62\x0E\x40\x40\x0F"},
      {"run is closed before the terminator", "IBM930", "UTF-8", true, "\xE3\x80\x80", 3, 9, 8, 5,
       zeros("\x0E\x40\x40\x0F\0"sv)},
      {"character that the leave byte pushes out, and its enter byte", "IBM930", "UTF-8", true, "a\xE3\x80\x80", 4, 4,
       0, 1, "\x62"},
      {"... and what is before stays", "IBM930", "UTF-8", true, "\xE3\x80\x80\xE3\x80\x80", 6, 5, 0, 4,
       "\x0E\x40\x40\x0F"},
      {"reserved terminator is no room for the leave byte", "IBM930", "UTF-8", true, "a\xE3\x80\x80", 4, 5, 8, 2,
       zeros("\x62\0"sv)},
      {"measured: the terminator takes a character when only the leave byte fits", "IBM930", "UTF-8", true,
       "\xE3\x80\x80\xE3\x80\x80", -1, 6, 0, 5, zeros("\x0E\x40\x40\x0F\0"sv)},
      {"measured: none due when the text just fits", "IBM930", "UTF-8", true, "\xE3\x80\x80\xE3\x80\x80", -1, 5, 0, 4,
       "\x0E\x40\x40\x0F"},
  };
  for (const Case& c : kCases) {
    Locale target = locale_of(c.target);
    Locale source = locale_of(c.source);
    spoil_status(target.get());
    std::string in = c.in;
    if (c.in_length < 0) in += '\0';
    Guarded text{std::string_view(in)};
    size_t room = (c.flags & LX_OPT_CHARS) != 0 ? c.out.size() : static_cast<size_t>(std::max(c.out_size, 0));
    Guarded out(room);
    int32_t count = c.shifted ? LXConvertStringEx(target.get(), out.data(), 0, c.out_size, source.get(), text.data(), 0,
                                                  c.in_length, c.flags)
                              : LXConvertString(target.get(), out.data(), c.out_size, source.get(), text.data(),
                                                c.in_length, c.flags);
    EXPECT_EQ(count, c.count) << c.name;
    EXPECT_EQ(hex(out.view().substr(0, c.out.size())), hex(c.out)) << c.name;
    EXPECT_EQ(LXGetError(target.get()), LX_OK) << c.name;
  }
}

TEST_F(ConvertStringCases, OpenTargetStateIsClosed) {
  using namespace std::string_view_literals;
  Locale target = locale_of("IBM930");
  Locale source = locale_of("UTF-8");
  struct {
    std::string in;
    int32_t size;
    uint32_t flags;
    int32_t count;
    std::string out;
  } cases[] = {
      {"", 3, 8, 2, zeros("\x0F\0"sv)},           // no text: the leave byte before the terminator
      {"", 1, 8, 0, ""},                          // ... needs room for both
      {"", 1, 0x4008, 1, zeros("\x0F\0"sv)},      // ... of which in characters only one counts
      {"", 3, 0, 0, ""},                          // ... and comes only with it
      {"a", 9, 0, 2, "\x0F\x62"},                 // a single-byte character ends the run
      {"\xE3\x80\x80", 9, 0, 3, "\x40\x40\x0F"},  // a double-byte one needs no enter byte
      {"\xE3\x80\x80", 2, 0, 1, "\x0F"},          // backed up to the very start
      {"\xE3\x80\x80", 1, 0, 1, "\x0F"},          // nothing but the leave byte fits
      {"\xE3\x80\x80", 1, 8, 0, ""},              // not even that: neither it nor the terminator
  };
  for (const auto& c : cases) {
    Guarded out((c.flags & LX_OPT_CHARS) != 0 ? c.out.size() : static_cast<size_t>(c.size));
    int32_t count = LXConvertStringEx(target.get(), out.data(), 1, c.size, source.get(), c.in.data(), 0,
                                      static_cast<int32_t>(c.in.size()), c.flags);
    EXPECT_EQ(count, c.count) << hex(c.in) << " " << c.size << " " << c.flags;
    EXPECT_EQ(hex(out.view().substr(0, c.out.size())), hex(c.out)) << hex(c.in) << " " << c.size << " " << c.flags;
  }
}

// The terminator of a measured text is packed and counted like any character, once.
TEST_F(ConvertStringCases, PackedTextCarriesItsTerminator) {
  Locale locale = locale_of("MS932");
  struct {
    int32_t size;
    uint32_t flags;
    std::vector<LXWChar> out;
  } cases[] = {
      {9, 0, {'a', 0x8341, 0}}, {9, 8, {'a', 0x8341, 0}}, {3, 8, {'a', 0x8341, 0}},
      {2, 0, {'a', 0x8341}},    {2, 8, {'a', 0}},         {1, 0, {'a'}},
  };
  for (const auto& c : cases) {
    Guarded out(static_cast<size_t>(c.size) * sizeof(LXWChar));
    auto count = static_cast<size_t>(LXMbToWide(locale.get(), out.as<LXWChar>(), c.size, "a\x83\x41", -1, c.flags));
    EXPECT_EQ(count, c.out.size()) << c.size << " " << c.flags;
    EXPECT_TRUE(std::equal(c.out.begin(), c.out.end(), out.as<LXWChar>())) << c.size << " " << c.flags;
  }
}

// What is written counts, not how long the value looks: zero bytes in the middle are skipped.
TEST_F(ConvertStringCases, PackedValuesWithZeroBytes) {
  Locale locale = locale_of("EUC-TW");
  const LXWChar text[] = {0x410041, 0x41000041, 0x8EA20000};
  char out[8];
  EXPECT_EQ(LXWideToMb(locale.get(), out, 8, text, 3, 0), 7);
  EXPECT_EQ(hex({out, 7}),
            "41414141"
            "8EA200");
  EXPECT_EQ(LXWideToMb(locale.get(), out, 6, text, 3, 0), 4);
}

// ---- Locales and flags
// ------------------------------------------------------------------------------------------------

// All functions of the family that take a locale, with a minimal text.
struct LocaleFunction {
  const char* name;
  std::function<int32_t(LXLocale*, uint32_t flags)> call;
};

std::vector<LocaleFunction> locale_functions() {
  static char bytes[8];
  static LXUChar units[8];
  static LXWChar wides[8];
  static const LXUChar unit_text[] = {'x', 0};
  static const LXWChar wide_text[] = {'x', 0};
  return {
      {"LXConvertString", [](LXLocale* l, uint32_t f) { return LXConvertString(l, bytes, 8, l, "x", 1, f); }},
      {"LXConvertStringW", [](LXLocale* l, uint32_t f) { return LXConvertStringW(l, wides, 8, l, wide_text, 1, f); }},
      {"LXConvertStringEx", [](LXLocale* l, uint32_t f) { return LXConvertStringEx(l, bytes, 0, 8, l, "x", 0, 1, f); }},
      {"LXStringToUnicode", [](LXLocale* l, uint32_t f) { return LXStringToUnicode(l, units, 8, "x", 1, f); }},
      {"LXStringToUnicodeW", [](LXLocale* l, uint32_t f) { return LXStringToUnicodeW(l, units, 8, wide_text, 1, f); }},
      {"LXStringToUnicodeEx", [](LXLocale* l, uint32_t f) { return LXStringToUnicodeEx(l, units, 8, "x", 0, 1, f); }},
      {"LXUnicodeToString", [](LXLocale* l, uint32_t f) { return LXUnicodeToString(l, bytes, 8, unit_text, 1, f); }},
      {"LXUnicodeToStringW", [](LXLocale* l, uint32_t f) { return LXUnicodeToStringW(l, wides, 8, unit_text, 1, f); }},
      {"LXUnicodeToStringEx",
       [](LXLocale* l, uint32_t f) { return LXUnicodeToStringEx(l, bytes, 0, 8, unit_text, 1, f); }},
      {"LXMbToWide", [](LXLocale* l, uint32_t f) { return LXMbToWide(l, wides, 8, "x", 1, f); }},
      {"LXMbToWideEx", [](LXLocale* l, uint32_t f) { return LXMbToWideEx(l, wides, 8, "x", 0, 1, f); }},
      {"LXWideToMb", [](LXLocale* l, uint32_t f) { return LXWideToMb(l, bytes, 8, wide_text, 1, f); }},
      {"LXWideToMbEx", [](LXLocale* l, uint32_t f) { return LXWideToMbEx(l, bytes, 0, 8, wide_text, 1, f); }},
  };
}

TEST_F(ConvertStringCases, FlagsAndTheDefaultLocale) {
  ASSERT_EQ(LXSetLocale("English_UnitedStates.IBM037@BINARY", 0), LX_OK);
  Locale latin = locale_of("Latin1");
  Locale host = locale_of("IBM930");
  for (const LocaleFunction& function : locale_functions()) {
    for (LXLocale* locale : {latin.get(), host.get(), static_cast<LXLocale*>(nullptr)}) {
      LXLocale* meant = locale != nullptr ? locale : lxglocale;
      for (uint32_t good : {0u, 8u, 0x4000u, 0x4008u}) {
        EXPECT_EQ(function.call(locale, good), (good & 8) != 0 ? 2 : 1) << function.name << " " << good;
        EXPECT_EQ(LXGetError(meant), LX_OK) << function.name;
      }
      for (uint32_t bad : {1u, 9u, 0x4001u, 0x8000u, 0x80000000u, 0xFFFFFFFFu}) {
        EXPECT_EQ(function.call(locale, bad), -1) << function.name << " " << bad;
        EXPECT_EQ(LXGetError(meant), LX_E_ARGUMENT) << function.name;
      }
    }
  }
  const LXObjEntry* record = LXGetLocaleObject(latin.get(), LX_CODEPAGE);
  LXUChar unit = 'x';
  char byte = 0;
  EXPECT_EQ(LXCpStrToUnicode(nullptr, &unit, 1, "x", 1, 0), -1);
  EXPECT_EQ(LXCpUnicodeToStr(nullptr, &byte, 1, &unit, 1, 0), -1);
  for (uint32_t bad : {1u, 0x80000000u}) {
    EXPECT_EQ(LXCpStrToUnicode(record, &unit, 1, "x", 1, bad), -1);
    EXPECT_EQ(LXCpUnicodeToStr(record, &byte, 1, &unit, 1, bad), -1);
    EXPECT_EQ(LXComStrToUnicode(&unit, 1, "x", 1, bad), -1);
    EXPECT_EQ(LXComUnicodeToStr(&byte, 1, &unit, 1, bad), -1);
  }
}

// The default stands in on either side.
TEST_F(ConvertStringCases, DefaultLocaleOnOneSide) {
  ASSERT_EQ(LXSetLocale("English_UnitedStates.IBM037@BINARY", 0), LX_OK);
  Locale latin = locale_of("Latin1");
  char out[4];
  EXPECT_EQ(LXConvertString(nullptr, out, 4, latin.get(), "A", 1, 0), 1);
  EXPECT_EQ(out[0], '\xC1');
  EXPECT_EQ(LXConvertString(latin.get(), out, 4, nullptr, "\xC1", 1, 0), 1);
  EXPECT_EQ(out[0], 'A');
  EXPECT_EQ(LXConversionRatio(nullptr, nullptr, 0), 1);
}

// Only the target's status changes.
TEST_F(ConvertStringCases, SourceKeepsItsStatus) {
  Locale target = locale_of("Latin1");
  Locale source = locale_of("IBM037");
  spoil_status(source.get());
  char out[4];
  EXPECT_EQ(LXConvertString(target.get(), out, 4, source.get(), "\xC1", 1, 0), 1);
  EXPECT_EQ(LXGetError(target.get()), LX_OK);
  EXPECT_EQ(LXGetError(source.get()), LX_E_ARGUMENT);
}

void expect_no_conversions() {
  ASSERT_EQ(lxglocale, nullptr);
  for (const LocaleFunction& function : locale_functions()) {
    EXPECT_EQ(function.call(nullptr, 0), -1) << function.name;
    EXPECT_EQ(function.call(nullptr, 1), -1) << function.name;
  }
  EXPECT_EQ(LXConversionRatio(nullptr, nullptr, 0), -1);
  EXPECT_EQ(LXOpenConversion(nullptr, nullptr, 0), nullptr);
}

TEST(WithoutADefaultLocale, ConversionsWithoutLocalesFail) {
  expect_no_conversions();  // before the library is up,
  LXUChar unit = 0;
  EXPECT_EQ(LXComStrToUnicode(&unit, 1, "x", 1, 0), -1);
  {
    Session session;
    expect_no_conversions();  // while nobody has set a default,
    EXPECT_EQ(LXComStrToUnicode(&unit, 1, "x", 1, 0), 1);
    ASSERT_EQ(LXSetLocale("English", 0), LX_OK);
    EXPECT_EQ(LXConversionRatio(nullptr, nullptr, 0), 1);
  }
  expect_no_conversions();  // and after the library is down
}

}  // namespace
}  // namespace lx::test
