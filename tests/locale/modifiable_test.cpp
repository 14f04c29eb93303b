// SPDX-License-Identifier: Apache-2.0
// A locale's own copies of its territory's values.
#include <gtest/gtest.h>

#include "frame/records.hpp"
#include "support/environment.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

struct Values {
  const char* name;
  unsigned fraction, currency, currency_intl;
  unsigned yes_no;  // the first six flags
  unsigned positive_position, negative_position;
  const char* separators;
  const char* texts[8];
};

constexpr unsigned kYesNoFlags = kLocalePositivePrecedes | kLocalePositiveSpaced | kLocaleNegativePrecedes |
                                 kLocaleNegativeSpaced | kLocaleYesNo82 | kLocaleYesNo83;

void expect_values(const LXLocale& locale, const Values& wanted) {
  SCOPED_TRACE(wanted.name);
  EXPECT_EQ(locale.fraction_digits, wanted.fraction);
  EXPECT_EQ(locale.currency_digits, wanted.currency);
  EXPECT_EQ(locale.currency_intl_digits, wanted.currency_intl);
  EXPECT_EQ(locale.flags & kYesNoFlags, wanted.yes_no);
  EXPECT_EQ(locale.positive_sign_position, wanted.positive_position);
  EXPECT_EQ(locale.negative_sign_position, wanted.negative_position);
  EXPECT_EQ(std::string(locale.separators, 5), wanted.separators);
  for (unsigned i = 0; i < 8; ++i) EXPECT_STREQ(locale.strings[i], wanted.texts[i]) << i;
}

// From the territory sources: grouping, currency, monetary grouping, signs, time, dates.
const Values kUnitedStates = {"English_UnitedStates.US-ASCII",
                              2,
                              2,
                              2,
                              kLocalePositivePrecedes | kLocaleNegativePrecedes | kLocaleYesNo82 | kLocaleYesNo83,
                              3,
                              0,
                              ".,,.,",
                              {"3;0", "$", "3;0", "", "-", "%#I:%M:%S %p", "%#m/%#d/%y", "%A, %B %d, %Y"}};
const Values kGermany = {"German_Germany.UTF-8",
                         2,
                         2,
                         2,
                         kLocalePositiveSpaced | kLocaleNegativeSpaced | kLocaleYesNo82 | kLocaleYesNo83,
                         1,
                         1,
                         ",.;,.",
                         {"3;0", "EUR", "3;0", "", "-", "%H:%M:%S", "%d.%m.%y", "%A, %#d. %B %Y"}};

TEST(Modifiable, ShippedTerritories) {
  Session session;
  for (const Values& wanted : {kUnitedStates, kGermany}) {
    Locale locale(LXGetLocale(wanted.name, 0, nullptr));
    ASSERT_NE(locale, nullptr);
    expect_values(*locale, wanted);
    for (unsigned i = 0; i < 5; ++i) EXPECT_EQ(locale->ucs2_separators[i], static_cast<uint8_t>(wanted.separators[i]));
  }
}

TEST(Modifiable, BuiltInTerritoryIsTheShippedOne) {
  Session session("/does/not/exist");
  Locale locale(LXGetLocale("", 0, nullptr));
  ASSERT_NE(locale, nullptr);
  expect_values(*locale, kUnitedStates);
}

TEST(Modifiable, TextsAreInTheCodePage) {
  Session session;
  Locale host(LXGetLocale("English_UnitedStates.IBM-037", 0, nullptr));
  ASSERT_NE(host, nullptr);
  EXPECT_STREQ(host->strings[0], "\xF3\x5E\xF0") << "3;0";
  EXPECT_STREQ(host->strings[1], "\x5B");
  EXPECT_EQ(host->separators[0], '\x4B');
}

TEST(Modifiable, CharactersOfSeveralBytes) {
  DataDirectory directory;
  write_small_directory(directory);
  TerritoryParts parts;
  parts.decimal = u'\u3041';  // two bytes in the multibyte page, none in ASCII
  parts.currency = u"a\u3041\u5001\u6000z";
  directory.write_object(LX_TERRITORY, 2, territory_file(parts));
  Session session(directory.path());
  Locale small(LXGetLocale("English_Germany.Small", 0, nullptr));
  ASSERT_NE(small, nullptr);
  EXPECT_STREQ(small->strings[1], "a\x81\x41\x8F\xA1\xA1\xA1\x1Az");
  EXPECT_EQ(small->separators[0], '\x1A') << "a lone lead byte would spoil the text";
  EXPECT_EQ(small->ucs2_separators[0], 0x3041);
  EXPECT_EQ(small->separators[1], ',');
  Locale ascii(LXGetLocale("English_Germany.US-ASCII", 0, nullptr));
  ASSERT_NE(ascii, nullptr);
  EXPECT_STREQ(ascii->strings[1], "a\x1A\x1A\x1Az");
}

TEST(Modifiable, ValuesSetByTheCallerStay) {
  Session session;
  Locale locale(LXGetLocale(kGermany.name, 0, nullptr));
  ASSERT_NE(locale, nullptr);
  locale->fraction_digits = 9;
  locale->currency_digits = 9;
  locale->flags |= kLocalePositivePrecedes | kLocaleNegativePrecedes;
  locale->separators[0] = locale->separators[1] = '#';
  std::strcpy(locale->strings[1], "X");
  std::strcpy(locale->strings[5], "Y");
  locale->set_mask = 0x001 | 0x008 | 0x800 | 0x20000;  // fraction digits, positive precedes, decimal, currency
  EXPECT_EQ(LXLocaleSetModifiable(locale.get()), LX_OK);
  Values wanted = kGermany;
  wanted.fraction = 9;
  wanted.yes_no |= kLocalePositivePrecedes;
  wanted.separators = "#.;,.";
  wanted.texts[1] = "X";
  expect_values(*locale, wanted);
}

TEST(Modifiable, OfTheDefaultLocale) {
  EXPECT_EQ(LXLocaleSetModifiable(nullptr), LX_E_ARGUMENT);
  Session session;
  ASSERT_EQ(LXSetLocale(kGermany.name, 0), LX_OK);
  lxglocale->fraction_digits = 9;
  EXPECT_EQ(LXLocaleSetModifiable(nullptr), LX_OK);
  expect_values(*lxglocale, kGermany);
}

// With the name C the system's conventions say "not available" to nearly everything.
TEST(Modifiable, SystemValuesOfTheUsersLocale) {
  Variable lang("LX_LANG", nullptr);
  Variable all("LC_ALL", "C");
  Session session;
  uint32_t rc = 99;
  Locale locale(LXGetLocale(nullptr, LX_GET_USER, &rc));
  ASSERT_NE(locale, nullptr);
  expect_values(*locale, kUnitedStates);
}

}  // namespace
}  // namespace lx::test
