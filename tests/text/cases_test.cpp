// SPDX-License-Identifier: Apache-2.0
// The text functions case by case: each case is written once, in characters, and runs on every page, in every kind of
// text, with lengths in units and in characters.
#include "text/text_runner.hpp"
#include "text/text_samples.hpp"

namespace lx::test {
namespace {

// X and Y stand for characters that are as long as they get, some with bytes that look like others.
struct Samples {
  uint16_t page;
  char16_t x, y;
};
constexpr Samples kSamples[] = {
    {367, 'x', 'y'},
    {819, u'\u00E9', u'\u00FC'},
    {57352, u'\u00E9', u'\u3042'},
    {932, u'\u30BD', u'\u3042'},  // 83 5C
    {954, u'\u4E02', u'\uFF71'},  // 8F B0 A1
    {964, u'\u4E42', u'\u4E00'},  // 8E A2 A1 A1
    {37, u'\u00E9', u'\u00FC'},
    {930, u'\u3042', u'\u3044'},
    {1364, u'\uAC00', u'\uB098'},
};

struct Case {
  const char* name;
  Function function;
  std::u16string_view text;
  int32_t length;  // this and all that follows: characters
  std::u16string_view other = u"";
  int32_t other_length = -1;
  uint32_t options = 0;
  int32_t result = -1;
  int32_t next = -1;
};
using enum Function;

const Case kCases[] = {
    {"measured text with its terminator", cpy, u"aXbY", -1, u"", 0, 0, 5},
    {"any negative length", cpy, u"aX", -9, u"", 0, 0, 3},
    {"part of a text", cpy, u"aXbY", 2, u"", 0, 0, 2},
    {"zeros inside are text", cpy, u"a\0X\0"sv, 4, u"", 0, 0, 4},
    {"nothing", cpy, u"aX", 0, u"", 0, 0, 0},
    {"joined", cat, u"aX", -1, u"YbX", -1, 0, 6},
    {"joined without terminator", cat, u"aX", -1, u"Yb", 2, 0, 4},
    {"joined and terminated", cat, u"aX", -1, u"Ybc", 2, LX_OPT_TERMINATE, 5},
    {"joined with nothing: terminator counted", cat, u"aX", -1, u"Y", 0, 0, 3},
    {"joined to nothing", cat, u"", -1, u"XY", -1, 0, 3},
    {"first occurrence", chr, u"aXbXY", -1, u"X", 1, 0, 1},
    {"last occurrence", chr, u"aXbXY", -1, u"X", 1, LX_STR_LAST, 3},
    {"terminator of a measured text", chr, u"aX", -1, u"\0"sv, 1, 0, 2},
    {"no terminator in a told length", chr, u"aX", 2, u"\0"sv, 1, 0, -1},
    {"absent", chr, u"aXbX", -1, u"Y", 1, 0, -1},
    {"behind the told length", chr, u"aXY", 2, u"Y", 1, 0, -1},
    {"nothing searched", chr, u"aX", 0, u"a", 1, 0, -1},
    {"inside", str, u"aXYXYb", -1, u"XYb", -1, 0, 3},
    {"overlapping beginnings", str, u"XXXY", -1, u"XXY", -1, 0, 1},
    {"at the very end", str, u"abX", 3, u"bX", 2, 0, 1},
    {"one character too long", str, u"abX", 2, u"bX", 2, 0, -1},
    {"empty pattern", str, u"aX", -1, u"", -1, 0, 0},
    {"empty text", str, u"aX", 0, u"X", -1, 0, -1},
    {"zero in the text", str, u"a\0X"sv, 3, u"X", 1, 0, 2},
    {"case folded", str, u"Xabc", -1, u"AbC", -1, LX_CMP_NOCASE, 1},
    {"case of the first letter counts without the option", str, u"Xabc", -1, u"ABC", -1, 0, -1},
    {"folded candidate that goes on differently", str, u"aXabY", -1, u"AbY", -1, LX_CMP_NOCASE, 2},
    {"candidate behind the end", str, u"XaB", 2, u"Ab", -1, LX_CMP_NOCASE, -1},
    {"leading run", spn, u"XaXYb", -1, u"aXY", -1, 0, 4},
    {"whole text in the set", spn, u"XX", -1, u"X", -1, 0, 2},
    {"first not in the set", spn, u"aX", -1, u"XY", -1, 0, 0},
    {"empty set", spn, u"aX", -1, u"", -1, 0, 0},
    {"told part of the set", spn, u"aX", -1, u"aX", 1, 0, 1},
    {"up to the set", cspn, u"abXY", -1, u"YX", -1, 0, 2},
    {"nothing of the set", cspn, u"abX", -1, u"Y", -1, 0, 3},
    {"everything up to an empty set", cspn, u"aX", -1, u"", -1, 0, 2},
    {"two delimiters first", tok, u"X,aYb,c", -1, u",X", -1, 0, 2, 6},
    {"long delimiter", tok, u"abXcd", -1, u"X", -1, 0, 0, 3},
    {"one delimiter of a row belongs to the token", tok, u"aXXb", -1, u"X", -1, 0, 0, 2},
    {"delimiter last: nothing remains", tok, u"aX", -1, u"X", -1, 0, 0, -1},
    {"no delimiter", tok, u"aX", -1, u"Y", -1, 0, 0, -1},
    {"only delimiters", tok, u"X,", -1, u",X", -1, 0, -1, -1},
    {"told length ends the token", tok, u"ab,c", 2, u",", -1, 0, 0, -1},
    {"line feed", eol, u"aX\nb", -1, u"", 0, LX_EOL_1, 3},
    {"line feed without flags", eol, u"aX\nb", -1, u"", 0, 0, 3},
    {"pair behind a lone carriage return and a lone line feed", eol, u"a\rX\n\r\nb", -1, u"", 0, LX_EOL_21, 6},
    {"pair cut by the length", eol, u"a\r\n", 2, u"", 0, LX_EOL_21, -1},
    {"pair before line feed", eol, u"X\r\n", -1, u"", 0, LX_EOL_1 | LX_EOL_21, 3},
    {"none", eol, u"aX", -1, u"", 0, 0xF00, -1},
};

class TextCases : public testing::Test {
 protected:
  static int32_t units_in(const Form& form, const Units& text, int32_t characters) {
    if (characters <= 0) return characters;
    auto list = characters_of(form, text).list;
    return static_cast<int32_t>(list.at(static_cast<size_t>(characters) - 1).end);
  }

  void run(const Case& c, const Form& form, const Samples& samples, bool by_characters) {
    auto with_samples = [&](std::u16string_view text) {
      std::u16string whole(text);
      std::replace(whole.begin(), whole.end(), u'X', samples.x);
      std::replace(whole.begin(), whole.end(), u'Y', samples.y);
      return spelled(form, whole);
    };
    TextCall call = {c.function, form, with_samples(c.text), c.length, with_samples(c.other), c.other_length};
    call.options = c.options | (by_characters ? LX_OPT_CHARS : 0);
    call.size = static_cast<int32_t>(call.text.size()) + 3;
    Units terminated = call.text;
    terminated.push_back(0);
    auto units = [&](int32_t characters) { return units_in(form, terminated, characters); };
    if (!by_characters) {
      call.length = units(c.length);
      call.other_length = units_in(form, call.other, c.other_length);
    }
    if (c.function == chr && form.follows_shifts()) {  // the character alone, without shift bytes
      TextCharacter character = characters_of(form, call.other).list[0];
      call.other_state = character.state;
      call.other = spelled({Form::plain, form.page}, {c.other == u"X" ? &samples.x : &c.other[0], 1});
      if (c.other == u"Y") call.other = spelled({Form::plain, form.page}, {&samples.y, 1});
    }
    Outcome expected;
    bool folds = (c.options & LX_CMP_NOCASE) == LX_CMP_NOCASE;
    if (!folds) expected = reference(call);
    // Where the case says it is, and the reference says so too.
    int64_t result = c.result;
    if (c.function == chr || c.function == str || c.function == tok) {
      auto list = characters_of(form, terminated).list;
      const TextCharacter* character = result < 0 ? nullptr : &list[static_cast<size_t>(result)];
      result = character == nullptr ? -1 : static_cast<int64_t>(character->at);
      if (character == nullptr || !form.follows_shifts()) character = nullptr;
      if (c.other.empty()) result = c.result;
      if (folds && character != nullptr) expected.state = character->state;
    } else if (c.function == eol) {
      result = units(c.result);
    } else if (!by_characters && c.function != cat) {
      result = units(c.result);
    }
    if (folds) expected.result = result;
    SCOPED_TRACE(std::string(c.name) + " " + call.describe());
    EXPECT_TRUE(expected.result == result || (c.function == cat && !by_characters)) << expected.result;
    EXPECT_TRUE(expected.next == units(c.next) || c.function != tok) << expected.next;
    runner_.check(call, expected, c.name);
  }

  TextRunner runner_;
};

TEST_F(TextCases, CasesInEveryKindOfText) {
  for (const Samples& samples : kSamples) {
    const PageSource& page = PageSource::of(samples.page);
    ASSERT_TRUE(page.has(samples.x) && page.has(samples.y)) << page.name;
    for (Form form : {Form{Form::plain, &page}, {Form::shifted, &page}, {Form::wide, &page}, {Form::ucs2, &page}}) {
      if (form.kind == Form::plain && page.mixed()) continue;  // which has no characters X and Y
      for (const Case& c : kCases) {
        run(c, form, samples, false);
        if (c.function != chr) run(c, form, samples, true);
      }
    }
  }
}

// Latin letters have a wide form only in East Asian pages.
TEST_F(TextCases, WidthFolded) {
  for (uint16_t id : {uint16_t{932}, uint16_t{954}, uint16_t{57352}, uint16_t{930}, uint16_t{1364}}) {
    const PageSource& page = PageSource::of(id);
    for (Form form : {Form{Form::plain, &page}, {Form::shifted, &page}, {Form::wide, &page}, {Form::ucs2, &page}}) {
      if (form.kind == Form::plain && page.mixed()) continue;
      for (uint32_t options : {LX_CMP_NOWIDTH, LX_CMP_NOWIDTH | LX_OPT_CHARS}) {
        TextCall call = {str, form, spelled(form, u"ab\uFF21\uFF22c"), -1, spelled(form, u"AB"), -1, 0, 0, options};
        Outcome expected;
        TextCharacter found = characters_of(form, call.text).list[2];
        expected.result = static_cast<int64_t>(found.at);
        expected.state = found.state;
        runner_.check(call, expected, "width folded");
        call.other = spelled(form, u"\uFF42\uFF23");
        runner_.check(call, {}, "case counts");
      }
    }
  }
}

TEST_F(TextCases, WidthPlaysNoPartOnSingleBytePages) {
  const PageSource& page = PageSource::of(819);
  TextCall call = {str, {Form::plain, &page}, units_of("abAB"), -1, units_of("AB"), -1, 0, 0, LX_CMP_NOWIDTH};
  Outcome expected;
  expected.result = 2;
  runner_.check(call, expected);
}

// ---- What is not as one would expect ----

TEST_F(TextCases, CopyOneByteShortLeavesTheCharacterOut) {
  TextCall call = {cpy, {Form::plain, &PageSource::of(932)}, units_of("ab\x83\x5C"), -1};
  call.size = 3;
  Outcome expected;
  expected.result = 2;
  expected.memory = {'a', 'b', kUnwritten};
  runner_.check(call, expected, "no terminator is added");
}

TEST_F(TextCases, LongDelimiterBecomesAsManyZeros) {
  TextCall call = {tok,
                   {Form::plain, &PageSource::of(932)},
                   units_of("a\x83\x5C"
                            "b"),
                   4,
                   units_of("\x83\x5C"),
                   2};
  Outcome expected = {0, 0, {'a', 0, 0, 'b'}, 3, 1};
  runner_.check(call, expected);
}

TEST_F(TextCases, TokensInATextWithShiftBytes) {
  const PageSource& page = PageSource::of(930);
  LXLocale* l = runner_.locale(page);
  std::string bytes = encoded(page, u"\u3042\u3001a\u3044\u3001\u3042");
  std::string delimiter = encoded(page, u"\u3001");
  Guarded text{std::string_view(bytes)};
  char* at = text.data();
  uint32_t state = 0;
  auto length = static_cast<int32_t>(bytes.size());
  std::u16string tokens;
  for (char* next = nullptr; at != nullptr; at = next) {
    uint32_t before = state;
    char* token =
        LXStrtokEx(l, at, &state, &length, delimiter.data(), 0, static_cast<int32_t>(delimiter.size()), &next, 0);
    ASSERT_NE(token, nullptr);
    const char* end = std::find(token, text.data() + text.size(), '\0');
    for (const auto& c : characters_of({Form::shifted, &page, before}, units_of({at, end})).list) {
      tokens += static_cast<char16_t>(page.decode(unpacked(c.code)));
    }
    tokens += u'|';
  }
  EXPECT_EQ(tokens, u"\u3042|a\u3044|\u3042|");
  EXPECT_EQ(length, 0);
}

TEST_F(TextCases, LineEndsAreWrittenInAFixedOrder) {
  struct {
    uint32_t flags;
    std::u16string_view text;
  } cases[] = {{0, u"1"},         {0x1000, u"1"},     {0x100, u"1"},   {0x200, u"21"},  {0x300, u"121"},
               {0x400, u"3"},     {0x800, u"4"},      {0xC00, u"43"},  {0x1100, u"11"}, {0x1200, u"21"},
               {0xF00, u"43121"}, {0x1F00, u"43121"}, {0x1500, u"311"}};
  auto check = [&](auto calls, Form::Kind kind, const PageSource& page, uint32_t state) {
    using Calls = decltype(calls);
    using U = typename Calls::Unit;
    for (const auto& c : cases) {
      Units expected;
      if (page.mixed() && state != 0) expected.push_back(page.leave);
      for (char16_t number : c.text) {
        size_t i = number - u'1';
        expected.push_back(kind == Form::ucs2 ? U"\n\r\u2028\u2029"[i] : page.line_ends[i]);
      }
      Guarded out(expected.size() * sizeof(U));
      LXLocale* l = runner_.locale(page);
      EXPECT_EQ(Calls::put_eol(l, out.as<U>(), state, c.flags), out.as<U>() + expected.size()) << c.flags;
      for (size_t i = 0; i < expected.size(); ++i) EXPECT_EQ(static_cast<uint32_t>(out.as<U>()[i]), expected[i]);
      for (uint32_t bad : {0x4100u, 1u, 0x2000u, 0x80000100u}) {
        EXPECT_EQ(Calls::put_eol(l, out.as<U>(), state, bad), nullptr);
        EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
      }
    }
  };
  for (uint16_t id : {uint16_t{819}, uint16_t{37}, uint16_t{930}}) {
    const PageSource& page = PageSource::of(id);
    check(PlainCalls(), Form::plain, page, 0);
    check(ShiftedCalls(), Form::shifted, page, 0);
    check(ShiftedCalls(), Form::shifted, page, 1);
    check(WideCalls(), Form::wide, page, 0);
    check(Ucs2Calls(), Form::ucs2, page, 0);
  }
}

TEST_F(TextCases, Truncation) {
  const uint32_t kWide = LX_TRUNC_STRIP | LX_CMP_NOWIDTH;
  struct {
    const char* name;
    uint16_t page;
    bool shifted;
    std::string_view text;
    int32_t size;
    uint32_t flags;
    int32_t result;
    std::string_view left;
  } cases[] = {
      {"no size: empty", 819, false, "ab", 0, 0, 1, ""},
      {"negative size: empty", 932, false, "ab", -3, 0, 1, ""},
      {"fits: left alone", 819, false, "ab", 10, 0, 0, "ab"},
      {"just fits", 819, false, "ab", 3, 0, 0, "ab"},
      {"cut", 819, false, "ab", 2, 0, 2, "a"},
      {"one-byte page strips", 819, false, "ab  ", 9, LX_TRUNC_STRIP, 3, "ab"},
      {"blanks alone", 37, false, "\x40\x40", 9, LX_TRUNC_STRIP, 1, ""},
      {"one-byte page keeps what is not blank", 819, false, "Plan A", 9, LX_TRUNC_STRIP, 7, "Plan A"},
      {"multibyte page: a last single byte ends no run", 932, false, "Plan A", 9, LX_TRUNC_STRIP, 5, "Plan"},
      {"... but two do", 932, false, "Plan AB", 9, LX_TRUNC_STRIP, 8, "Plan AB"},
      {"... and a long character does", 932, false, "Plan \x83\x5C", 9, LX_TRUNC_STRIP, 8, "Plan \x83\x5C"},
      {"... and one that is cut away does not count", 932, false, "Plan A", 6, LX_TRUNC_STRIP, 5, "Plan"},
      {"character not split", 932, false, "a\x83\x5C", 3, 0, 2, "a"},
      {"full-width blanks are kept", 932, false, "a \x81\x40", 9, LX_TRUNC_STRIP, 5, "a \x81\x40"},
      {"full-width blanks are stripped", 932, false, "a \x81\x40 ", 9, kWide, 2, "a"},
      {"three of the bits are needed", 932, false, "a\x81\x40", 9, LX_TRUNC_STRIP | 0x80000040, 4, "a\x81\x40"},
      {"full-width blank of three bytes", 57352, false, "a\xE3\x80\x80", 9, kWide, 2, "a"},
      {"size in characters", 932, false, "\x83\x5C\x83\x5C\x83\x5C", 3, LX_OPT_CHARS, 3, "\x83\x5C\x83\x5C"},
      {"in characters: fits", 932, false, "\x83\x5C\x83\x5C", 3, LX_OPT_CHARS, 0, "\x83\x5C\x83\x5C"},
      {"run closed", 930, true, "\x81\x0E\x44\x81\x44\x82\x0F", 6, 0, 6, "\x81\x0E\x44\x81\x0F"},
      {"no room to close: character dropped, and the run", 930, true, "\x81\x0E\x44\x81\x44\x82\x0F", 5, 0, 2, "\x81"},
      {"shift bytes fit", 930, true, "\x81\x0E\x44\x81\x0F", 6, 0, 0, "\x81\x0E\x44\x81\x0F"},
      {"blanks around a run", 930, true, "\x81\x40\x0E\x40\x40\x0F\x40", 20, kWide, 2, "\x81"},
      {"blanks inside a run", 930, true, "\x0E\x44\x81\x40\x40\x0F\x40", 20, kWide, 5, "\x0E\x44\x81\x0F"},
      {"run of blanks alone", 930, true, "\x0E\x40\x40\x0F", 20, kWide, 1, ""},
      {"size in characters, shifted", 930, true, "\x0E\x44\x81\x44\x82\x44\x83\x0F", 3, LX_OPT_CHARS, 3,
       "\x0E\x44\x81\x44\x82\x0F"},
  };
  for (const auto& c : cases) {
    LXLocale* l = runner_.locale(PageSource::of(c.page));
    Guarded text{std::string(c.text) + '\0'};
    EXPECT_EQ(c.shifted ? LXTruncateStringEx(l, text.data(), 0, c.size, c.flags)
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
  for (uint16_t id : {uint16_t{930}, uint16_t{932}}) {
    LXLocale* l = runner_.locale(PageSource::of(id));
    for (uint32_t state : {0u, 1u}) {
      for (uint32_t flags : {0u, LX_OPT_TERMINATE}) {
        std::string expected = id == 930 && state != 0 ? "\x0F" : "";
        if (flags != 0) expected += '\0';
        Guarded out(expected.size());
        EXPECT_EQ(LXTerminateStringEx(l, out.data(), state, flags), static_cast<int32_t>(expected.size()));
        EXPECT_EQ(out.view(), expected);
      }
      EXPECT_EQ(LXTerminateStringEx(l, nullptr, state, 1), -1);
      EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
    }
  }
}

TEST_F(TextCases, LengthsOfPackedCharactersAndUnits) {
  LXLocale* l = runner_.locale(PageSource::of(932));
  struct {
    LXWChar value;
    int32_t length;
  } cases[] = {{0, 1}, {0xFF, 1}, {0xA1A2, 2}, {0xFF00, 2}, {0xFF0000, 3}, {0x01000000, 4}, {0xFFFFFFFF, 4}};
  for (const auto& c : cases) {
    EXPECT_EQ(LXByteLengthW(l, c.value), c.length);
    EXPECT_EQ(LXStrByteLength(l, c.value), c.length);
  }
  const LXWChar wide[] = {0x83000000, 1, 0};
  EXPECT_EQ(LXWcslen(l, wide), 2);
  EXPECT_EQ(LXWcslen(l, wide + 2), 0);
  EXPECT_EQ(LXStrlenU(l, reinterpret_cast<const LXUChar*>(u"a\u0100")), 2);
  uint32_t state = 1;
  LXInitState(l, &state);
  EXPECT_EQ(state, 0u);
}

TEST_F(TextCases, UnknownClassOfTypesStillGivesTheFirst) {
  LXLocale* l = runner_.locale(PageSource::of(819));
  EXPECT_EQ(LXGetCharType(l, "A", 5), 0x213u);
  EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
  for (uint32_t type_class : {0u, 0x80000013u}) {
    EXPECT_EQ(LXGetCharTypeEx(l, "!", 0, type_class), 0x220u);
    EXPECT_EQ(LXGetCharTypeW(l, 'a', type_class), 0x215u);
    EXPECT_EQ(LXGetCharTypeU(l, 0xA0, type_class), 0x0C0u);
    EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
  }
  EXPECT_EQ(LXGetCharTypeU(l, '0', LX_CTYPE_1), 0x218u);
  EXPECT_EQ(LXGetError(l), LX_OK);
}

TEST_F(TextCases, MovingBackwards) {
  LXLocale* latin = runner_.locale(PageSource::of(819));
  LXLocale* mixed = runner_.locale(PageSource::of(930));
  const char* s = &"abc"[2];
  EXPECT_EQ(LXMoveStringPointer(latin, s, -2, 0), s - 2);
  for (LXLocale* l : {mixed, runner_.locale(PageSource::of(57352))}) {
    EXPECT_EQ(LXMoveStringPointer(l, s, -2, 0), nullptr);
    EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
    EXPECT_EQ(LXMoveStringPointerEx(l, s, 0, -1, LX_OPT_CHARS), nullptr);
    EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
    EXPECT_EQ(LXMoveStringPointer(l, s, 0, 8), nullptr);
  }
}

// ---- Options and locales that are wrong or missing ----

bool accepted(Function function, uint32_t options) {
  switch (function) {
    case cpy:
    case spn:
    case cspn:
    case tok:
      return (options & ~LX_OPT_CHARS) == 0;
    case cat:
      return (options & ~(LX_OPT_CHARS | LX_OPT_TERMINATE)) == 0;
    case chr:
      return options == 0 || options == LX_STR_LAST;
    case str:
      return (options & ~(LX_CMP_NOWIDTH | LX_OPT_CHARS)) == 0;
    case eol:
      return (options & ~(0xF00 | LX_OPT_CHARS)) == 0;
  }
  return false;
}

TEST_F(TextCases, EveryOptionBit) {
  for (const PageSource* page : {&PageSource::of(819), &PageSource::of(932), &PageSource::of(930)}) {
    for (Form form : {Form{Form::plain, page}, {Form::shifted, page}, {Form::wide, page}, {Form::ucs2, page}}) {
      for (Function function : {cpy, cat, chr, str, spn, cspn, tok, eol}) {
        for (unsigned bit = 0; bit <= 32; ++bit) {
          for (uint32_t others : {0u, LX_OPT_CHARS, LX_CMP_NOWIDTH, LX_STR_LAST}) {
            uint32_t options = others | (bit == 32 ? 0 : 1u << bit);
            TextCall call = {function, form, {0xC1, 0xC1}, 1, {0xC1, 0xC1}, 1, 0, 2, options};
            if (page->id == 932) call.text = call.other = {'a', 'a'};
            Outcome got = runner_.run(call, 8);
            EXPECT_EQ(got.status, accepted(function, options) ? LX_OK : LX_E_ARGUMENT) << call.describe();
            if (accepted(function, options)) continue;
            EXPECT_LE(got.result, 0) << call.describe();
            EXPECT_TRUE(function != eol || (got.type == LX_EOL_BAD && got.rest == 0));
          }
        }
      }
    }
  }
}

// The plain and the U family by a null locale; nothing may be touched when there is no default either.
void call_everything(bool works) {
  char bytes[8] = "ab";
  LXUChar units[8] = {'a', 'b'};
  int32_t failed = works ? 0 : -1;
  EXPECT_EQ(LXStrcpy(nullptr, bytes, 0, "ab", 2, 0), failed);
  EXPECT_EQ(LXStrcpyU(nullptr, units, 0, units, 2, 0), failed);
  EXPECT_EQ(LXStrcat(nullptr, bytes, "", 0, 0), works ? 3 : -1);
  EXPECT_EQ(LXStrchr(nullptr, bytes, 2, "b", 0), works ? bytes + 1 : nullptr);
  EXPECT_EQ(LXStrstr(nullptr, bytes, 2, "b", 1, 0), works ? bytes + 1 : nullptr);
  EXPECT_EQ(LXStrstrU(nullptr, units, 2, units + 1, 1, 0), works ? units + 1 : nullptr);
  EXPECT_EQ(LXStrspn(nullptr, bytes, 2, "b", 1, 0) > 0, false);
  EXPECT_EQ(LXNextChar(nullptr, bytes), works ? bytes + 1 : nullptr);
  EXPECT_EQ(LXPrevChar(nullptr, bytes, bytes + 2), works ? bytes + 1 : nullptr);
  EXPECT_EQ(LXGetChar(nullptr, bytes), works ? LXWChar{'a'} : 0u);
  EXPECT_EQ(LXGetCharTypeU(nullptr, 'a', LX_CTYPE_1), works ? 0x215u : 0u);
  EXPECT_EQ(LXGetEol(nullptr, "\n", 1, nullptr, nullptr, 0) != nullptr, works);
  EXPECT_EQ(LXPutEol(nullptr, bytes + 4, 0), works ? bytes + 5 : nullptr);
  EXPECT_EQ(LXTruncateString(nullptr, bytes, 8, 0), works ? 0 : -1);
  EXPECT_EQ(LXTerminateStringEx(nullptr, bytes, 1, 0), works ? 0 : -1);
  EXPECT_EQ(LXGetError(nullptr), works ? LX_OK : LX_E_ARGUMENT);
  EXPECT_EQ(LXStrcpy(nullptr, bytes, 8, "ab", 2, 1), -1);
  EXPECT_EQ(LXGetError(nullptr), LX_E_ARGUMENT);
  EXPECT_EQ(bytes[0], 'a');
}

TEST(TextWithoutALocale, DefaultOrNothing) {
  call_everything(false);
  Session session;
  call_everything(false);
  ASSERT_EQ(LXSetLocale("English_UnitedStates.Latin1@BINARY", 0), LX_OK);
  call_everything(true);
}

}  // namespace
}  // namespace lx::test
