// SPDX-License-Identifier: Apache-2.0
// Types and other forms of all UCS-2 characters, against the tables and rules, and against the C library.
#include <clocale>
#include <cwctype>
#include <functional>
#include <map>

#include <lexaro/lexaro.h>

#include "support/session.hpp"
#include "text_mapping/unicode_model.hpp"

namespace lx::test {
namespace {

class UnicodeCharacters : public testing::Test {
 protected:
  uint32_t bits(uint32_t c, uint32_t class_id) { return LXGetCharTypeU(l, static_cast<LXUChar>(c), class_id); }

  Session session;
  Locale locale = locale_of("Latin1");
  LXLocale* l = locale.get();
};

TEST_F(UnicodeCharacters, TypesAsStated) {
  constexpr struct {
    uint32_t character, classes;
  } cases[] = {{'A', 0x213}, {'a', 0x215},  {'0', 0x218},  {' ', 0x2C0},  {'\t', 0x3C0}, {'\n', 0x340}, {'!', 0x220},
               {0xA0, 0xC0}, {0xDF, 0x005}, {0x4E00, 0x1}, {0x9FA5, 0x1}, {0xAC00, 0x1}, {0xD7A3, 0x1}};
  for (const auto& c : cases) {
    EXPECT_EQ(bits(c.character, LX_CTYPE_1), c.classes) << std::hex << c.character;
    EXPECT_EQ(LXGetError(l), LX_OK);
    for (uint32_t unknown : {0u, 1u, 0x10u, 0x8000000Fu, 0x80000013u, 0xFFFFFFFFu}) {
      EXPECT_EQ(bits(c.character, unknown), c.classes) << std::hex << unknown;
      EXPECT_EQ(LXGetError(l), LX_E_ARGUMENT);
    }
  }
}

TEST_F(UnicodeCharacters, FormsAsStated) {
  using Mapping = LXUChar (*)(LXLocale*, LXUChar);
  constexpr Mapping kLower = LXUnicodeToLower, kUpper = LXUnicodeToUpper;
  constexpr Mapping kFull = LXUnicodeToH2F, kHalf = LXUnicodeToF2H;
  const struct {
    Mapping map;
    LXUChar from, to;
  } cases[] = {
      {kLower, 0xC0, 0xE0},     {kLower, 0xD7, 0xD7},     {kLower, 0xDE, 0xFE},     {kLower, 0x531, 0x561},
      {kLower, 0x556, 0x586},   {kLower, 0x10A0, 0x10D0}, {kLower, 0x2160, 0x2170}, {kLower, 0x24CF, 0x24E9},
      {kLower, 0xFF3A, 0xFF5A}, {kUpper, 0xF7, 0xF7},     {kUpper, 0xFF, 0x178},    {kUpper, 0x561, 0x531},
      {kUpper, 0x10D0, 0x10D0}, {kUpper, 0x217F, 0x216F}, {kUpper, 0x24D0, 0x24B6}, {kUpper, 0xFF41, 0xFF21},
      {kUpper, 0xB5, 0xB5},     {kUpper, 0xDF, 0xDF},     {kFull, 0x20, 0x3000},    {kFull, 0x21, 0xFF01},
      {kFull, 0x7E, 0xFF5E},    {kFull, 0x7F, 0x7F},      {kFull, 0xA2, 0xFFE0},    {kFull, 0x20A9, 0xFFE6},
      {kFull, 0xFF61, 0x3002},  {kHalf, 0xFF01, 0x21},    {kHalf, 0x2190, 0xFFE9},  {kHalf, 0x2193, 0xFFEC},
      {kHalf, 0x3000, 0x20},    {kHalf, 0xFFE6, 0x20A9},  {kHalf, 0x20, 0x20},
  };
  for (const auto& c : cases) {
    LXStrcpyU(l, nullptr, 0, nullptr, 0, 1);  // an error
    EXPECT_EQ(c.map(l, c.from), c.to) << std::hex << c.from;
    EXPECT_EQ(LXGetError(l), c.map == kLower || c.map == kUpper ? LX_OK : LX_E_ARGUMENT);
    EXPECT_EQ(c.map(nullptr, c.from), c.to);
  }
}

TEST_F(UnicodeCharacters, All) {
  int wrong = 0;
  for (uint32_t c = 0; c < 0x10000 && wrong < 5; ++c) {
    auto character = static_cast<LXUChar>(c);
    uint32_t word = bits(c, LX_CTYPE_1) | bits(c, LX_CTYPE_2) << 10 | bits(c, LX_CTYPE_3) << 22;
    bool right = word == type_model(c) && LXUnicodeToLower(l, character) == lower_model(c) &&
                 LXUnicodeToUpper(l, character) == upper_model(c) && LXUnicodeToH2F(l, character) == full_model(c) &&
                 LXUnicodeToF2H(l, character) == half_model(c);
    EXPECT_TRUE(right) << std::hex << c << " type " << word;
    wrong += !right;
  }
}

// ---- The C library, which follows later versions of Unicode ----

constexpr uint32_t kNonSpacing = 1u << 22;
constexpr uint32_t kUnassigned = 0x400;

bool in(uint32_t c, std::initializer_list<std::pair<uint32_t, uint32_t>> ranges) {
  for (auto [first, last] : ranges) {
    if (c >= first && c <= last) return true;
  }
  return false;
}

// Why the two do not agree on a character of which `type` is our word. Listed in the order in which they are tried.
struct Reason {
  const char* what;  // the class, or the direction of case
  const char* because;
  bool ours;       // we say yes, the C library no; for case, we map it
  size_t at_most;  // characters
  bool (*holds)(uint32_t c, uint32_t type);
};
bool any(uint32_t, uint32_t) { return true; }
bool other_digit(uint32_t, uint32_t type) { return (type & LX_CT_DIGIT) != 0; }
bool later_symbol(uint32_t c, uint32_t) { return c == 0x2118 || c == 0x212E; }
// Roman numerals and letters in circles are cased without being letters.
bool letter_number(uint32_t c, uint32_t) { return in(c, {{0x2160, 0x217F}, {0x24B6, 0x24E9}}); }
bool modifier(uint32_t c, uint32_t) {
  return in(c, {{0x2B9, 0x2BA}, {0x2C6, 0x2CF}, {0x374, 0x374}, {0x2132, 0x2132}});
}

const Reason kReasons[] = {
    {"alpha", "digits of other scripts are letters there", false, 139, other_digit},
    {"alpha", "marks are letters there", false, 123, [](uint32_t, uint32_t t) { return (t & kNonSpacing) != 0; }},
    {"alpha", "numerals and circled letters are letters there", false, 84, letter_number},
    {"alpha", "symbols that became letters", false, 14, modifier},
    {"alpha", "vowel signs and numerals that are in no class", false, 95,
     [](uint32_t, uint32_t t) { return (t & 0x3FF) == 0; }},
    {"alpha", "letters that became symbols", true, 2, later_symbol},
    {"upper", "got their small letters later", false, 2,
     [](uint32_t c, uint32_t) { return c == 0x4C0 || c == 0x2132; }},
    {"lower", "small in form, which counts there", false, 22,
     [](uint32_t c, uint32_t) {
       return in(c, {{0x1AA, 0x1AA}, {0x1BE, 0x1BF}, {0x2B0, 0x2E4}, {0x345, 0x37A}, {0x3F3, 0x3F3}});
     }},
    {"lower", "small letters that became something else", true, 3,
     [](uint32_t c, uint32_t t) { return c == 0x294 || later_symbol(c, t); }},
    {"digit", "only ASCII digits are digits there", true, 159, [](uint32_t c, uint32_t) { return c > '9'; }},
    {"xdigit", "nor full-width ones", true, 22, [](uint32_t c, uint32_t) { return c >= 0xFF10; }},
    {"punct", "everything visible that is no letter is punctuation there", false, 353,
     [](uint32_t, uint32_t t) { return (t & (LX_CT_ALPHA | LX_CT_PUNCT)) == 0; }},
    {"punct", "letters that became symbols", false, 2, later_symbol},
    {"punct", "numerals and circled letters are letters there", true, 52, letter_number},
    {"punct", "symbols that became letters", true, 14, modifier},
    {"space", "no-break spaces, next line", true, 3,
     [](uint32_t c, uint32_t) { return c == 0x85 || c == 0xA0 || c == 0x2007; }},
    {"blank", "no-break and zero width spaces", true, 3,
     [](uint32_t c, uint32_t) { return c == 0xA0 || c == 0x2007 || c == 0x200B; }},
    {"cntrl", "line and paragraph separator", false, 2,
     [](uint32_t c, uint32_t) { return c == 0x2028 || c == 0x2029; }},
    {"tolower", "Georgian got capitals of its own", true, 38,
     [](uint32_t c, uint32_t) { return (c & 0xFF00) == 0x1000; }},
    {"tolower", "small letters that came later, and signs outside the tables", false, 9,
     [](uint32_t c, uint32_t) {
       return in(c, {{0x3DA, 0x3E0}, {0x4C0, 0x4C0}, {0x2126, 0x2132}});
     }},
    {"toupper", "capitals that came later, and micro sign and ypogegrammeni outside the tables", false, 66, any},
};

TEST_F(UnicodeCharacters, AgreeWithTheCLibrary) {
  locale_t utf8 = newlocale(LC_ALL_MASK, "C.UTF-8", nullptr);
  if (utf8 == nullptr) GTEST_SKIP() << "the system has no C.UTF-8";
  struct Row {
    const char* name;
    uint32_t bit;
    int (*theirs)(wint_t, locale_t);
  };
  const Row classes[] = {
      {"alpha", LX_CT_ALPHA, iswalpha_l}, {"upper", LX_CT_UPPER, iswupper_l},    {"lower", LX_CT_LOWER, iswlower_l},
      {"digit", LX_CT_DIGIT, iswdigit_l}, {"xdigit", LX_CT_XDIGIT, iswxdigit_l}, {"punct", LX_CT_PUNCT, iswpunct_l},
      {"space", LX_CT_SPACE, iswspace_l}, {"blank", LX_CT_BLANK, iswblank_l},    {"cntrl", LX_CT_CNTRL, iswcntrl_l}};
  std::map<const Reason*, size_t> found;
  size_t agreed = 0;
  auto explain = [&](std::string_view what, uint32_t c, bool agrees, bool ours) {
    uint32_t type = type_model(c);
    if (type == kUnassigned) return;  // unknown to us: came later, or private
    if (agrees) {
      ++agreed;
      return;
    }
    for (const Reason& reason : kReasons) {
      if (what != reason.what || ours != reason.ours || !reason.holds(c, type)) continue;
      ++found[&reason];
      return;
    }
    ADD_FAILURE() << what << " of " << std::hex << c << ", ours " << ours;
  };
  for (uint32_t c = 0; c < 0x10000; ++c) {
    uint32_t word = bits(c, LX_CTYPE_1);
    for (const Row& row : classes) {
      bool ours = (word & row.bit) != 0;
      explain(row.name, c, ours == (row.theirs(c, utf8) != 0), ours);
    }
    uint32_t lower = LXUnicodeToLower(l, static_cast<LXUChar>(c));
    uint32_t upper = LXUnicodeToUpper(l, static_cast<LXUChar>(c));
    explain("tolower", c, lower == towlower_l(c, utf8), lower != c);
    explain("toupper", c, upper == towupper_l(c, utf8), upper != c);
  }
  for (const Reason& reason : kReasons) {
    EXPECT_GT(found[&reason], 0u) << reason.what << ": " << reason.because;
    EXPECT_LE(found[&reason], reason.at_most) << reason.what << ": " << reason.because;
  }
  EXPECT_GT(agreed, 400000u);
  freelocale(utf8);
}

}  // namespace
}  // namespace lx::test
