// SPDX-License-Identifier: Apache-2.0
// Locales that get another territory or code page.
#include <gtest/gtest.h>

#include "support/locale_model.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

LXObjEntry* entry(uint8_t type, const char* name) {
  return LXGetObjFromName(LXGetObjManager(), type, name, -1, 0, nullptr);
}

void set_some(LocaleModel& model, LXLocale* locale) {
  for (auto [item, text] : {std::pair(59u, u"\u00B7"), {67u, u" "}, {64u, u"\u00E9t\u00E9 \u00A3"}, {81u, u"%Y"}}) {
    EXPECT_EQ(LXSetLocaleTextInfoU(locale, item, reinterpret_cast<const LXUChar*>(text), -1, 0), 1) << item;
    model.texts[item] = model.through_page(text);
  }
  for (auto [item, value] : {std::pair(63u, 5), {73u, 1}, {78u, 2}}) {
    EXPECT_EQ(LXSetLocaleNumInfo(locale, item, value), 1) << item;
    model.numbers[item] = value;
  }
}

// Texts and numbers that were set stay, all others come from the new territory in the new page.
TEST(Change, ThroughPagesAndTerritories) {
  Session session;
  for (bool some : {false, true}) {
    LocaleModel model("German", "Germany", "Latin1");
    Locale locale(LXGetLocale(model.name().c_str(), 0, nullptr));
    if (some) set_some(model, locale.get());
    for (const char* page : {"UTF-8", "IBM037", "MS932", "IBM930", "US-ASCII", "JapanEUC", "Latin1"}) {
      EXPECT_EQ(LXLocaleChangeCodePage(locale.get(), entry(LX_CODEPAGE, page)), LX_OK);
      model.set_page(page);
      ASSERT_EQ(model.difference(locale.get()), "");
      for (const char* territory : {"Germany", "Russia", "German-Switzerland", "Japan"}) {
        EXPECT_EQ(LXLocaleChangeTerritory(locale.get(), entry(LX_TERRITORY, territory)), LX_OK);
        model.set_territory(territory);
        ASSERT_EQ(model.difference(locale.get()), "");
      }
    }
  }
}

// A refill and calls that are refused leave what was set.
TEST(Change, LeavesTheRest) {
  Session session;
  LocaleModel model("German", "Germany", "IBM930");
  Locale locale(LXGetLocale(model.name().c_str(), 0, nullptr));
  set_some(model, locale.get());
  EXPECT_EQ(LXLocaleSetModifiable(locale.get()), LX_OK);
  EXPECT_NE(LXLocaleChangeTerritory(locale.get(), entry(LX_CODEPAGE, "UTF-8")), LX_OK);
  EXPECT_NE(LXLocaleChangeCodePage(locale.get(), entry(LX_TERRITORY, "Japan")), LX_OK);
  LXLocaleFreeOldText(locale.get(), locale.get());
  LXLocaleFreeOldText(nullptr, locale.get());
  EXPECT_EQ(model.difference(locale.get()), "");
}

TEST(Change, TextBetweenPages) {
  Session session;
  for (auto [from, to, given, result] : {std::tuple("Latin1", "IBM037", "a1", "\x81\xF1"),
                                         {"UTF-8", "US-ASCII", "\xE5\x86\x86z", "\x1Az"},
                                         {"US-ASCII", "US-ASCII", "", ""}}) {
    char* text = LXLocaleCnvText(entry(LX_CODEPAGE, from), entry(LX_CODEPAGE, to), given);
    EXPECT_STREQ(text, result);
    LXUnloadFile(text);
  }
  EXPECT_EQ(LXLocaleCnvText(entry(LX_CODEPAGE, "Latin1"), entry(LX_TERRITORY, "Japan"), "x"), nullptr);
}

}  // namespace
}  // namespace lx::test
