// SPDX-License-Identifier: Apache-2.0
// Numbers and amounts as they are written: what they look like, and how they fit their room.
#include <bit>
#include <cstdio>
#include <limits>
#include <random>

#include "format/fixed_point.hpp"
#include "support/counting_allocator.hpp"
#include "support/text_calls.hpp"

namespace lx::test {
namespace {

constexpr Family<LXLongToString, LXLongToStringEx, LXLongToStringW, LXLongToStringU> kLongToString;
constexpr Family<LXDoubleToString, LXDoubleToStringEx, LXDoubleToStringW, LXDoubleToStringU> kDoubleToString;
constexpr Family<LXCurrencyToString, LXCurrencyToStringEx, LXCurrencyToStringW, LXCurrencyToStringU> kCurrencyToString;
constexpr Form::Kind kKinds[] = {Form::plain, Form::shifted, Form::wide, Form::ucs2};
constexpr uint16_t kUtf8 = 57352;
const std::vector<uint16_t> kPages = {367, 37, 932, 930, kUtf8};
enum class What { integer, number, money };
using enum What;

struct Job {
  What what;
  double value;
  uint32_t flags = 0;
};

int32_t write(const Form& form, LXLocale* locale, const Job& job, void* to, int32_t length, uint32_t more_flags = 0) {
  return with_calls(form, [&](auto call) {
    auto* out = static_cast<typename decltype(call)::Unit*>(to);
    const uint32_t flags = job.flags | more_flags;
    if (job.what == money) return call(kCurrencyToString, locale, job.value, out, State{0}, length, flags);
    if (job.what == number) return call(kDoubleToString, locale, job.value, out, State{0}, length, flags);
    return call(kLongToString, locale, static_cast<int32_t>(job.value), out, State{0}, length, flags);
  });
}

constexpr const char16_t* kNumber = nullptr;
struct Setting {
  uint32_t item;
  const char16_t* text;
  int32_t value = 0;
};

void set(LXLocale* locale, const Setting& setting) {
  auto* text = reinterpret_cast<const LXUChar*>(setting.text);
  const size_t length = text == nullptr ? 0 : std::max<size_t>(std::u16string_view(setting.text).size(), 1);
  EXPECT_EQ(text == nullptr ? LXSetLocaleNumInfo(locale, setting.item, setting.value)
                            : LXSetLocaleTextInfoU(locale, setting.item, text, static_cast<int32_t>(length), 0),
            1);
}

// With room for all of it.
Units written(const Form& form, LXLocale* locale, const Job& job) {
  return with_calls(form, [&](auto call) -> Units {
    using Unit = typename decltype(call)::Unit;
    static Unit buffer[12000];
    const int32_t count = write(form, locale, job, buffer, 12000);
    Units units;
    for (int32_t i = 0; i < count; ++i) units.push_back(std::make_unsigned_t<Unit>(buffer[i]));
    return units;
  });
}

// In all forms of text, on these pages, of which there are all kinds.
void expect(const std::vector<Setting>& settings, const Job& job, const std::u16string& expected,
            const std::string& name = "English", const std::vector<uint16_t>& pages = kPages) {
  Session session;
  for (uint16_t id : pages) {
    const PageSource& page = PageSource::of(id);
    Locale locale(LXGetLocale((name + "." + page.name).c_str(), 0, nullptr));
    ASSERT_NE(locale, nullptr) << name;
    for (const Setting& setting : settings) set(locale.get(), setting);
    for (Form::Kind kind : kKinds) {
      const Form form = {kind, &page};
      EXPECT_EQ(written(form, locale.get(), job), spelled(form, expected))
          << name << "." << form.name() << ", value " << job.value;
      EXPECT_EQ(LXGetError(locale.get()), LX_OK);
    }
  }
}

TEST(WrittenNumbers, LookAsPeopleOfTheCountryExpect) {
  constexpr Job kJobs[] = {
      {integer, -1234567}, {number, 1234567.891}, {money, 1234.5}, {money, -1234.5}, {money, 1234.5, LX_NUM_INTLSYM}};
  const struct {
    const char* locale;
    const char16_t* expected[5];
  } cases[] = {
      {"English", {u"-1,234,567", u"1,234,567.89", u"$1,234.50", u"($1,234.50)", u"USD1,234.50"}},
      {"German", {u"-1.234.567", u"1.234.567,89", u"1.234,50 EUR", u"-1.234,50 EUR", u"1.234,50 EUR"}},
      {"_German-Switzerland", {u"-1'234'567", u"1'234'567.89", u"CHF 1'234.50", u"CHF-1'234.50", u"CHF 1'234.50"}},
      {"Polish", {u"-1 234 567", u"1 234 567,89", u"1 234,50 zł", u"-1 234,50 zł", u"1 234,50 PLN"}},
      {"Japanese", {u"-1,234,567", u"1,234,567.89", u"￥1,234.", u"-￥1,234.", u"JPY1,234."}},
      {"Hungarian", {u"-1 234 567", u"1 234 567,89", u"1 234, Ft", u"-1 234, Ft", u"1 234,50 HUF"}},
  };
  for (const auto& c : cases) {
    for (size_t i = 0; i < 5; ++i) expect({}, kJobs[i], c.expected[i], c.locale, {kUtf8});
  }
}

TEST(WrittenNumbers, AreGroupedFromTheUnitsDigit) {
  const struct {
    const char16_t* grouping;
    double value;
    std::u16string text;
  } cases[] = {{u"3;0", 1234567, u"1,234,567"}, {u"3;0", 123456, u"123,456"},      {u"3;0", 0, u"0"},
               {u"3", 1234567, u"1234,567"},    {u"3;2;0", 1234567, u"12,34,567"}, {u"1;0", 123, u"1,2,3"},
               {u"0", 12345, u"12345"},         {u"2;x;0", 12345, u"123,45"},      {u"x", 12345, u"12345"},
               {u"3;", 1234567, u"1234,567"},   {u";3", 12345, u"12345"},          {u"4294967297;1", 123, u"123"}};
  for (const auto& [grouping, value, text] : cases) {
    expect({{LX_ITEM_GROUPING, grouping}}, {integer, -value}, value != 0 ? u"-" + text : text);
    expect({{LX_ITEM_GROUPING, grouping}}, {number, value}, text + u".00");
    expect({{LX_ITEM_MON_GROUPING, grouping}}, {money, value}, u"$" + text + u".00");
  }
}

TEST(WrittenNumbers, QuirksStay) {
  const std::u16string symbol(40, u'x');
  const struct {
    const char* name;
    std::vector<Setting> settings;
    Job job;
    std::u16string text;
  } cases[] = {
      {"the fraction is cut, not rounded", {}, {number, -2.999}, u"-2.99"},
      {"six digits of a fraction", {{LX_ITEM_FRACTION_DIGITS, kNumber, 6}}, {number, 0.123456}, u"0.123456"},
      {"more lose one", {{LX_ITEM_FRACTION_DIGITS, kNumber, 7}}, {number, 0.123456}, u"0.123450"},
      {"many", {{LX_ITEM_CURRENCY_DIGITS, kNumber, 10000}}, {money, 1.5}, u"$1.5" + std::u16string(9998, u'0')},
      {"a point without fraction", {{LX_ITEM_FRACTION_DIGITS, kNumber, 0}}, {number, 42}, u"42."},
      {"and in amounts", {{LX_ITEM_CURRENCY_INTL_DIGITS, kNumber, 0}}, {money, 42, LX_NUM_INTLSYM}, u"USD42."},
      {"the minus of a value that becomes zero", {}, {number, -1e-9}, u"-0.00"},
      {"zero has none", {}, {number, -0.0}, u"0.00"},
      {"what is no number has no point", {}, {money, -std::numeric_limits<double>::infinity()}, u"($inf)"},
      {"nor this", {}, {number, -std::numeric_limits<double>::quiet_NaN()}, u"nan"},
      {"a minus has at most three characters",
       {{LX_ITEM_NEGATIVE_SIGN, u"minus"}, {LX_ITEM_N_SIGN_POSN, kNumber, 1}},
       {money, -1},
       u"min$1.00"},
      {"a plus has more", {{LX_ITEM_POSITIVE_SIGN, u"plus"}}, {money, 1}, u"plus$1.00"},
      {"texts have at most 31 units", {{LX_ITEM_CURRENCY, symbol.c_str()}}, {money, 1}, symbol.substr(9) + u"1.00"},
      {"without separator", {{LX_ITEM_THOUSANDS, u""}}, {number, 1234567}, u"1234567.00"},
      {"the lowest integer", {}, {integer, -2147483648.0}, u"-2,147,483,648"},
      {"unsigned", {}, {integer, -5, LX_NUM_UNSIGNED}, u"4,294,967,291"},
  };
  for (const auto& [name, settings, job, text] : cases) {
    SCOPED_TRACE(name);
    expect(settings, job, text);
  }
}

TEST(WrittenNumbers, SignsStandInFivePlaces) {
  constexpr const char16_t* kLayouts[] = {u"($1.00)", u"($ 1.00)", u"(1.00$)", u"(1.00 $)",  //
                                          u"-$1.00",  u"-$ 1.00",  u"-1.00$",  u"-1.00 $",   //
                                          u"$1.00-",  u"$ 1.00-",  u"1.00$-",  u"1.00 $-",   //
                                          u"-$1.00",  u"-$ 1.00",  u"1.00-$",  u"1.00 -$",   //
                                          u"$-1.00",  u"$- 1.00",  u"1.00$-",  u"1.00 $-"};
  for (int32_t i = 0; i < 20; ++i) {
    const Setting position = {LX_ITEM_N_SIGN_POSN, kNumber, i / 4};
    const Setting first = {LX_ITEM_N_CS_PRECEDES, kNumber, 1 - i / 2 % 2};
    expect({position, first, {LX_ITEM_N_SEP_BY_SPACE, kNumber, i % 2}}, {money, -1}, kLayouts[i]);
  }
}

TEST(WrittenNumbers, TerritoryIsAskedOnRequest) {
  const std::vector<Setting> settings = {{LX_ITEM_MON_GROUPING, u"2;0"}, {LX_ITEM_P_CS_PRECEDES, kNumber, 0}};
  expect(settings, {money, 1234}, u"12,34.00$");
  expect(settings, {money, 1234, LX_NUM_TEXTOPT}, u"$1,234.00");
}

TEST(WrittenNumbers, CharactersAreCountedBehindTheResult) {
  Session session;
  Locale locale = locale_of("MS932");
  // There stand lead bytes, of which two are a character, as far as the buffer goes.
  constexpr int32_t kCounts[][2] = {{10, 2}, {9, 3}, {7, 4}, {5, 5}};
  for (const auto& [length, count] : kCounts) {
    Guarded buffer(static_cast<size_t>(length), '\x81');
    EXPECT_EQ(LXLongToString(locale.get(), 1234, buffer.data(), length, LX_NUM_CHARLEN), count) << length;
  }
}

TEST(WrittenNumbers, LengthsAndTextsFollowShiftStates) {
  Session session;
  Locale locale = locale_of("IBM930");
  const Form form = {Form::shifted, &PageSource::of(930)};
  set(locale.get(), {LX_ITEM_CURRENCY, u"円"});
  EXPECT_EQ(written(form, locale.get(), {money, 1}), spelled(form, u"円1.00"));
  set(locale.get(), {LX_ITEM_POSITIVE_SIGN, u"円"});
  EXPECT_EQ(written(form, locale.get(), {money, 1}), spelled(form, u"円円1.00"));
  static char buffer[1000];
  // Digits inside a double-byte run count in pairs; an integer's sign counts for itself.
  EXPECT_EQ(LXLongToStringEx(locale.get(), -123456, buffer, 1, 3, LX_NUM_CHARLEN), 5);
  EXPECT_EQ(LXDoubleToStringEx(locale.get(), -123456, buffer, 1, 3, LX_NUM_CHARLEN), 6);
  set(locale.get(), {LX_ITEM_CURRENCY_DIGITS, kNumber, 999});
  EXPECT_EQ(LXCurrencyToString(locale.get(), 1, buffer, 1000, LX_NUM_CHARLEN), 512);
}

TEST(WrittenNumbers, RefuseOtherFlags) {
  Session session;
  Locale locale = locale_of("UTF-8");
  char buffer[8];
  constexpr uint32_t kAccepted[] = {0x4089, 0x4009, 0x4049};
  for (uint32_t i = 0; i < 96; ++i) {
    const bool good = (kAccepted[i / 32] & 1u << i % 32) != 0;
    const Job job = {static_cast<What>(i / 32), 1};
    EXPECT_EQ(write({Form::plain, nullptr}, locale.get(), job, buffer, 8, 1u << i % 32) == -1, !good) << i;
    EXPECT_EQ(LXGetError(locale.get()), good ? LX_OK : LX_E_ARGUMENT);
  }
  for (int32_t length : {0, -1}) {  // no room comes first here
    EXPECT_EQ(LXCurrencyToString(locale.get(), 1, buffer, length, LX_NUM_CHARLEN | 0x100), 0);
  }
}

TEST(WrittenNumbers, NeedNoMemory) {
  CountingAllocator allocator;
  ASSERT_EQ(allocator.init(LEXARO_DATA), LX_OK);
  Locale locale = locale_of("IBM930");
  allocator.calls = 0;
  for (int i = 0; i < 12; ++i) {
    written({kKinds[i / 3], &PageSource::of(930)}, locale.get(), {static_cast<What>(i % 3), -1e9});
  }
  EXPECT_EQ(allocator.calls, 0);
  locale.reset();
  LXTerm();
}

TEST(GroupingSizes, AreReadOneByOne) {
  constexpr LXUChar kText[] = {'1', '2', ';', '0', ';', 'x', 0};
  int32_t cases[][5] = {{0, 6, 12, 3, 4}, {0, 1, 1, -1, 0}, {0, 0, 0, 1, 0},
                        {3, 4, 0, 5, 3},  {5, 3, -1, 5, 3}, {6, 3, -1, 6, 3}};
  for (auto [from, left, size, to, left_then] : cases) {
    const LXUChar* next = kText + from;
    EXPECT_EQ(LXStrGroupingSizeU(nullptr, next, &left, &next), size);
    EXPECT_TRUE(next == (to < 0 ? nullptr : kText + to) && left == left_then) << from;
  }
}

// Double-byte runs end with their text.
Units first_characters(const Form& form, const Units& text, const std::vector<Character>& list, size_t count) {
  if (count == 0) return {};
  Units first = first_units(text, list[count - 1].own_end());
  if (list[count - 1].state != 0) first.push_back(form.page->leave);
  return first;
}

TEST(WrittenNumbers, FitTheRoom) {
  constexpr Job kJobs[] = {{integer, -1234567}, {number, -12.5}, {money, 12}, {money, -1234}};
  Session session;
  EdgeBuffer edge(1024);
  for (int variant = 0; variant < 5 * 4 * 4 * 4; ++variant) {
    const PageSource& page = PageSource::of(kPages[static_cast<size_t>(variant) % 5]);
    const Form form = {kKinds[variant / 5 % 4], &page};
    const Job& job = kJobs[variant / 20 % 4];
    const bool in_characters = variant / 80 % 2 != 0;
    const size_t ending = variant / 160 != 0 ? 1 : 0;
    const uint32_t flags = (ending != 0 ? LX_NUM_TERMINATE : 0) | (in_characters ? LX_NUM_CHARLEN : 0);
    Locale locale = locale_of(page.name);
    set(locale.get(), {LX_ITEM_CURRENCY, u"$円x名"});
    set(locale.get(), {LX_ITEM_NEGATIVE_SIGN, u"円-"});
    set(locale.get(), {LX_ITEM_N_CS_PRECEDES, kNumber, 0});
    set(locale.get(), {LX_ITEM_N_SIGN_POSN, kNumber, 4});
    set(locale.get(), {LX_ITEM_FRACTION_DIGITS, kNumber, 9});
    const Units all = written(form, locale.get(), job);
    const std::vector<Character> list = characters_of(form, all).list;

    for (size_t length = 0; length <= all.size() + 3; ++length) {
      const size_t most = std::max(length, ending) - ending;
      size_t count = in_characters ? std::min(most, list.size()) : list.size();
      while (!in_characters && first_characters(form, all, list, count).size() > most) --count;
      Units wanted = first_characters(form, all, list, count);
      const uint32_t status = length == 0 || wanted.size() < all.size() ? LX_E_BUFFER : LX_OK;
      if (length != 0) wanted.resize(wanted.size() + ending);
      const std::string expected = raw(form, wanted);
      char* room =
          edge.room(in_characters ? std::max(length * form.unit_size(), expected.size()) : length * form.unit_size());
      const int32_t result = write(form, locale.get(), job, room, static_cast<int32_t>(length), flags);
      EXPECT_EQ(LXGetError(locale.get()), status);
      ASSERT_EQ(result, length == 0     ? 0
                        : in_characters ? count + ending
                                        : wanted.size())
          << variant << ", length " << length;
      ASSERT_EQ(hex({room, expected.size()}), hex(expected)) << variant << ", length " << length;
    }
  }
}

void expect_as_printed(double value) {
  char printed[400];
  std::snprintf(printed, sizeof printed, "%f", value);
  const FixedPoint fixed(value);
  std::string text = (fixed.negative() ? "-" : "") + std::string(fixed.integer());
  if (fixed.finite()) text += "." + std::string(fixed.fraction());
  ASSERT_EQ(text, printed);
}

TEST(FixedPoint, IsWhatTheCLibraryPrints) {
  std::mt19937_64 random(4711);
  for (int i = 0; i < 250000; ++i) {
    const uint64_t bits = random();
    if (const auto any = std::bit_cast<double>(bits); any == any) expect_as_printed(any);
    expect_as_printed(std::ldexp(static_cast<double>(bits >> 11), static_cast<int>(bits % 128) - 96));
    expect_as_printed(static_cast<double>(bits >> 34) / 128);  // the seventh digit is often a lone five
  }
  for (double value :
       {0.5e-6, 1.5e-6, 0.9999995, 4503599627370495.5, 0x1p63, 0x1p64, 0x1p53, 5e-324, 1.7976931348623157e308}) {
    expect_as_printed(-value);
  }
}

}  // namespace
}  // namespace lx::test
