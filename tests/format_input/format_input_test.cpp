// SPDX-License-Identifier: Apache-2.0
// Texts, what is read from them as numbers, and how far, in all forms of text.
#include <cmath>
#include <functional>
#include <random>

#include "support/session.hpp"
#include "support/text_calls.hpp"

namespace lx::test {
namespace {

constexpr Family<LXStringToLong, LXStringToLongEx, LXStringToLongW, LXStringToLongU> kStringToLong;
constexpr Family<LXStringToDouble, LXStringToDoubleEx, LXStringToDoubleW, LXStringToDoubleU> kStringToDouble;
constexpr int32_t kDecimal = -100;  // as a base: a number with a fraction
constexpr std::pair<const char*, uint16_t> kPages[] = {
    {"US-ASCII", 367}, {"UTF-8", 57352}, {"IBM037", 37}, {"IBM930", 930}};

using Reading = std::tuple<double, size_t, uint32_t, uint32_t>;  // value, end in units, status, state

// The text stands at the edge of memory; a negative length has it measured.
Reading read(const Form& form, LXLocale* l, const Units& text, int32_t base, uint32_t flags = 0,
             int32_t n = INT32_MAX) {
  static EdgeBuffer edge(4096);
  if (n == INT32_MAX) n = static_cast<int32_t>(text.size());
  return with_calls(form, [&](auto call) {
    using Unit = typename decltype(call)::Unit;
    const Unit *at = place<Unit>(edge, text, n), *end = nullptr;
    uint32_t state = form.state;
    double value = base == kDecimal ? call(kStringToDouble, l, at, State{state}, n, &end, StateAt{&state}, flags)
                                    : call(kStringToLong, l, at, State{state}, n, &end, StateAt{&state}, base, flags);
    return Reading{value, static_cast<size_t>(end - at), LXGetError(l), state};
  });
}

// use(form, locale) for every page and form. The locales have signs and separators of their own for money.
void for_each_form(const std::function<void(const Form&, LXLocale*)>& use,
                   const std::string& name = "English_UnitedStates") {
  Session session;
  for (auto [page, id] : kPages) {
    Locale locale(LXGetLocale((name + "." + page + "@BINARY").c_str(), 0, nullptr));
    for (auto [item, text] : {std::pair(66u, u";"), {67u, u"'"}, {71u, u"pl"}, {72u, u"(-"}}) {
      LXSetLocaleTextInfoU(locale.get(), item, reinterpret_cast<const LXUChar*>(text), -1, 0);
    }
    for (Form::Kind kind : {Form::plain, Form::shifted, Form::wide, Form::ucs2}) {
      SCOPED_TRACE(std::string(page) + " form " + std::to_string(kind));
      use(Form{kind, &PageSource::of(id)}, locale.get());
    }
  }
}

bool can_be_spelled(const Form& form, std::u16string_view text) {
  if (form.kind == Form::ucs2) return true;
  bool no_shifts = form.kind == Form::plain && form.page->mixed();
  return std::ranges::all_of(text, [&](char16_t c) { return c < 0x80 || (!no_shifts && form.page->has(c)); });
}

struct Case {
  const char* name;
  std::u16string_view text;
  int32_t base;
  uint32_t flags;
  double value;
  size_t end;  // characters
  uint32_t status = LX_OK;
};
constexpr uint32_t kFull = LX_NUM_FULLWIDTH, kMoney = LX_NUM_MONETARY, kUnsigned = LX_NUM_UNSIGNED;

const Case kCases[] = {
    {"blanks, a sign and a prefix", u"  -0x1F", 0, 0, -31, 7},
    {"no prefix and no octal digit", u"0,7", 0, 0, 0, 1},
    {"octal", u"0178", 0, 0, 15, 3},
    {"a separator behind a prefix", u"0x,1", 0, 0, 1, 4},
    {"a prefix without digits", u"0x", 16, 0, 0, 2},
    {"separators anywhere behind the first digit", u"1,2,,3,", 10, 0, 123, 7},
    {"white space behind the sign", u"- 5", 10, 0, 0, 1},
    {"a digit too high at the end", u"129", 9, 0, 11, 2},
    {"overflow at the end takes all", u"2147483648", 10, 0, INT32_MAX, 10},
    {"overflow before the end stops at the digit", u"21474836480", 10, 0, INT32_MAX, 9},
    {"the lowest value counts as overflow: it stops before its last digit", u"-2147483648;", 10, 0, INT32_MIN, 10},
    {"the highest unsigned value", u"4294967295;", 10, kUnsigned, -1, 10},
    {"a minus has no place before unsigned values", u"-5", 10, kUnsigned, 0, 0},
    {"bases", u"1", 37, 0, 0, 0, LX_E_BASE},
    {"the base counts before the flags", u"1", 1, 0x40, 0, 0, LX_E_BASE},
    {"flags", u"1", 10, 0x40, 0, 0, LX_E_ARGUMENT},
    {"full width among half width", u"\uFF0B1\uFF0C2\uFF4634g", 16, kFull, 0x12F34, 7},
    {"money has its own signs and separator", u"(-1'2,3", 10, kMoney, -12, 5},
    {"and no others", u"-12", 10, kMoney, 0, 0},
    {"a sign of full width", u"\uFF08-12", 10, kMoney | kFull, -12, 4},
    {"a sign comes before the digits that it is made of", u"pl", 36, kMoney, 0, 2},
    {"no separator before the point", u"1,.5", kDecimal, 0, 1, 2},
    {"D marks an exponent too", u"1,002.5d-3", kDecimal, 0, 1.0025, 10},
    {"no exponent without a point", u"25E3", kDecimal, 0, 25, 2},
    {"a marker without exponent", u"1.5e", kDecimal, 0, 1.5, 3},
    {"no fraction of an exponent", u"1.5e3.2", kDecimal, 0, 1500, 5},
    {"each fraction digit is added", u"0.3", kDecimal, 0, 0.30000000000000004, 3},
    {"but not the one behind a point that comes first", u".3", kDecimal, 0, 0.3, 2},
    {"zero stays zero", u"0.e999999999999", kDecimal, 0, 0, 15},
    {"full width", u"-\uFF11\uFF0E\uFF12\uFF25\uFF0B\uFF11", kDecimal, kFull, -12, 7},
    {"the sign of an exponent is plain in amounts too", u"(-1'2;5e-1", kDecimal, kMoney, -1.25, 10},
};

TEST(NumbersRead, Cases) {
  for_each_form([](const Form& form, LXLocale* locale) {
    for (const Case& one : kCases) {
      if (!can_be_spelled(form, one.text)) continue;
      const Units text = spelled(form, one.text);
      const size_t behind = one.end == 0 ? 0 : characters_of(form, text).list[one.end - 1].end;
      auto characters = static_cast<int32_t>(one.text.size());
      if (!text.empty() && form.is_shift(text.back())) characters = -1;  // a count of characters leaves it out
      for (int32_t length : {static_cast<int32_t>(text.size()), -1, characters}) {
        const uint32_t count = length == characters && one.status == LX_OK ? LX_NUM_CHARLEN : 0;
        auto [value, end, status, state] = read(form, locale, text, one.base, one.flags | count, length);
        EXPECT_EQ(value, one.value) << one.name;
        EXPECT_EQ(std::pair(end, status), std::pair(behind, one.status)) << one.name;
        EXPECT_TRUE(end < text.size() || state == 0) << one.name;
      }
    }
  });
}

TEST(NumbersRead, DoubleByteRunsGoOnFromTheStateOfTheCall) {
  Session session;
  Locale locale = locale_of("IBM930");
  const Form inside = {Form::shifted, &PageSource::of(930), 1};
  const Units run = {0x42, 0xF1, 0x42, 0xF2, 0x0F, 0xF3, 0x0E, 0x44, 0x81};
  EXPECT_EQ(read(inside, locale.get(), run, 10, kFull), (Reading{123, 7, LX_OK, 1}));
  EXPECT_EQ(read(inside, locale.get(), {0x42, 0xF1, 0x42}, 10, kFull), (Reading{1, 2, LX_OK, 1}));
  for (int32_t base : {10, kDecimal}) {  // behind the whole text, the state of its beginning
    EXPECT_EQ(read(inside, locale.get(), {0x42, 0xF1, 0x0F}, base, kFull), (Reading{1, 3, LX_OK, 1}));
  }
  EXPECT_EQ(read(inside, locale.get(), run, 10), (Reading{0, 0, LX_OK, 1}));
}

TEST(NumbersRead, SeparatorsOfLocales) {
  const std::tuple<const char*, std::u16string_view, double, size_t> kTexts[] = {
      {"German_Germany", u"-1.234.567,5", -1234567.5, 12},
      {"Swedish_Sweden", u"1234,5", 1234.5, 6},
      {"Swedish_Sweden", u"1 234,5", 1, 1},
      {"Polish_Poland", u"1,5", 1.5, 3},
      {"Japanese_Japan", u"1,234.5", 1234.5, 7}};
  for (const auto& each : kTexts) {
    auto expect = [&each](const Form& form, LXLocale* locale) {
      const auto& [name, text, value, end] = each;
      if (!can_be_spelled(form, text)) return;
      for (uint32_t flags : {0u, LX_NUM_TEXTOPT | kMoney}) {  // the separators of money have been changed
        EXPECT_EQ(read(form, locale, spelled(form, text), kDecimal, flags), (Reading{value, end, LX_OK, 0})) << name;
      }
    };
    for_each_form(expect, std::get<0>(each));
  }
}

TEST(NumbersRead, RandomIntegers) {
  std::mt19937 random(71);
  for_each_form([&](const Form& form, LXLocale* locale) {
    for (int i = form.kind == Form::ucs2 && form.page->id == 367 ? 1'000'000 : 3000; i-- > 0;) {
      auto value = static_cast<int32_t>(random()) >> random() % 31;
      std::string digits = std::to_string(std::abs(int64_t{value}));
      for (size_t at = digits.size(); at > 3; at -= 3) digits.insert(at - 3, ",");
      Units text = spelled(form, (value < 0 ? u"-" : u"") + std::u16string(digits.begin(), digits.end()));
      ASSERT_EQ(read(form, locale, text, 10), (Reading{value, text.size(), LX_OK, 0})) << value;
    }
  });
}

TEST(NumbersRead, DecimalsLieCloseToTheNearestDouble) {
  Session session;
  Locale locale = locale_of("US-ASCII");
  auto value_of = [&](std::string text) {
    return std::get<0>(read({Form::plain, &PageSource::of(367)}, locale.get(), units_of(text), kDecimal));
  };
  std::mt19937 random(73);
  for (int i = 0; i < 100'000; ++i) {
    std::string text = std::to_string(random() >> random() % 32) + ".";
    text += std::to_string(random()).substr(0, random() % 7);
    double nearest = std::strtod(text.c_str(), nullptr);
    ASSERT_LE(std::abs(value_of(text) - nearest), 2 * (std::nextafter(nearest, HUGE_VAL) - nearest)) << text;
  }
  for (int n = -400; n <= 400; ++n) {
    std::string text = "1.e" + std::to_string(n);
    ASSERT_EQ(value_of(text), std::strtod(text.c_str(), nullptr)) << n;
  }
  EXPECT_EQ(value_of("-" + std::string(310, '9') + ".e-999"), -HUGE_VAL);
}

// ---- Step by step ----

TEST(Digits, TablesAgreeWithTheirPages) {
  for (auto [page, table] : {std::pair(367, LXAsciiToNum), {37, LXEbcdicToNum}, {930, LXEbcdic930ToNum}}) {
    for (unsigned byte = 0; byte < 256; ++byte) {
      uint16_t c = PageSource::of(static_cast<uint16_t>(page)).decode(std::string(1, static_cast<char>(byte)));
      const int32_t expected = c > 0x7F || std::isalnum(c) == 0 ? -1 : std::stoi(std::string(1, char(c)), nullptr, 36);
      EXPECT_EQ(table[byte], expected) << page << " " << byte;
    }
  }
}

constexpr auto kDigitW = [](auto l, auto s, auto n, auto at, auto thousands, auto point, auto... rest) {
  return LXStrGetDigitW(l, s, n, at, *thousands, *point, rest...);
};
constexpr auto kDigitU = [](auto l, auto s, auto n, auto at, auto thousands, auto point, auto plus, auto minus, auto,
                            auto flags) { return LXStrGetDigitU(l, s, n, at, *thousands, *point, plus, minus, flags); };
constexpr Family<LXStrGetDigit, LXStrGetDigitEx, kDigitW, kDigitU> kGetDigit;

// The codes of a text up to where there is none, and the units left. Separators "," and ".", signs "1+" and "-".
std::vector<int32_t> codes_of(const Form& form, LXLocale* locale, std::u16string_view text, uint32_t flags) {
  std::vector<int32_t> codes;
  with_calls(form, [&](auto call) {
    using Unit = typename decltype(call)::Unit;
    auto stored = [&](std::u16string_view given) {
      const Units units = spelled(form, given);
      std::vector<Unit> result(units.begin(), units.end());
      return result.push_back(0), result;
    };
    const auto separators = stored(u",."), plus = stored(u"1+"), minus = stored(u"-"), units = stored(text);
    const Unit *at = units.data(), *end = at + units.size() - 1;
    for (uint32_t state = 0; codes.empty() || codes.back() != -1;) {
      codes.push_back(call(kGetDigit, locale, at, State{state}, static_cast<int32_t>(end - at), &at, StateAt{&state},
                           &separators[0], &separators[1], plus.data(), minus.data(), form.page->ascii_family, flags));
    }
    codes.push_back(static_cast<int32_t>(end - at));
  });
  return codes;
}

TEST(Digits, Codes) {
  for_each_form([](const Form& form, LXLocale* locale) {
    const std::vector<int32_t> kCodes = {44, 40, 1, 42, 2, 43, 10, 35, 44, 41, -1, 1},
                               kWide = {2, 42, 42, 41, 40, 44, -1, 1};
    EXPECT_EQ(codes_of(form, locale, u" \t 1+1,2.aZ\n-<", 0), kCodes);
    EXPECT_EQ(codes_of(form, locale, u"1", 2), (std::vector<int32_t>{-1, 1}));
    EXPECT_EQ(LXGetError(locale), LX_E_ARGUMENT);
    std::u16string_view wide = u"\uFF12\uFF0C,-1\uFF0B\u3000<";
    EXPECT_TRUE(!can_be_spelled(form, wide) || codes_of(form, locale, wide, LX_NUM_FULLWIDTH) == kWide);
  });
}

TEST(DecimalMachine, EveryStep) {
  const char* const kNext[] = {"3-11-20", "3----2-", "5------", "3---45-", "3------",  // by digit, marker, codes 40-44
                               "56-----", "8-77---", "8------", "8------", "-------"};
  using Numbers = std::tuple<double, int32_t, int32_t, int32_t, int32_t>;
  auto step = [](int32_t state, int32_t code, Numbers& numbers) {
    return std::apply([&](auto&... each) { return LXStrDoubleNextState(state, code, &each...); }, numbers);
  };
  for (int32_t state = 0; state <= 9; ++state) {
    for (int32_t code = -2; code <= 50; ++code) {
      const bool digit = code >= 0 && code <= 9, marker = code == 13 || code == 14, sign = code >= 40 && code <= 44;
      const char next = digit || marker || sign ? kNext[state][digit ? 0 : marker ? 1 : code - 38] : '-';
      Numbers numbers = {7, 1, -3, 1, 2};
      EXPECT_EQ(step(state, code, numbers), next == '-' ? -1 : next - '0') << state << " " << code;
      EXPECT_TRUE(next != '-' || numbers == Numbers(7, 1, -3, 1, 2)) << state << " " << code;
    }
  }
  Numbers numbers = {0, 1, 0, 1, 0};
  int32_t state = 0;
  for (int32_t code : {44, 41, 1, 42, 2, 43, 5, 0, 13, 41, 3, 1}) state = step(state, code, numbers);
  EXPECT_EQ(numbers, Numbers(12.5, -1, -2, -1, 31));
}

}  // namespace
}  // namespace lx::test
