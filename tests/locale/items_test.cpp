// SPDX-License-Identifier: Apache-2.0
// What locales report: every item in every form, against the readable sources.
#include <gtest/gtest.h>

#include <cstring>
#include <set>

#include "locale/native_rows.hpp"
#include "support/locale_model.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

Locale get(const std::string& name, uint32_t options = 0) {
  uint32_t rc = 99;
  Locale locale(LXGetLocale(name.c_str(), options, &rc));
  EXPECT_NE(locale, nullptr) << name << ": " << rc;
  return locale;
}

std::string sort_name(LXLocale* locale) {
  char name[33];
  return LXGetLocaleTextInfo(locale, LX_ITEM_SORT_NAME, name, sizeof name, 0) > 0 ? name : "";
}

TEST(Items, OfAllSystemLocales) {
  Session session;
  std::set<std::string> languages;
  for (const NativeRow& row : kNativeRows) {
    char name[132];
    Locale locale = get(LXMapNativeLocale(row.native, name, sizeof name), LX_GET_SUBSTITUTE);
    EXPECT_EQ(sort_name(locale.get()), row.sort) << row.native;
    ASSERT_EQ(LXSetLocaleNumInfo(locale.get(), LX_ITEM_SORT_ID, 0), 1);
    const LocaleModel model(row.language, row.territory, row.code_page);
    ASSERT_EQ(model.difference(locale.get(), languages.insert(row.language).second), "") << row.native;
    Locale binary = get(row.locale_name().substr(0, row.locale_name().find('@')) + "@BINARY");
    ASSERT_EQ(model.difference(binary.get()), "") << row.native;
  }
}

// Pages of all kinds, which need not have the characters of the texts.
TEST(Items, OnPagesOfAllKinds) {
  Session session;
  struct Case {
    const char* language;
    const char* territory;
  };
  for (const Case& one : {Case{"English", "UnitedStates"},
                          {"German", "German-Switzerland"},
                          {"Japanese", "Japan"},
                          {"Russian", "Russia"},
                          {"Korean", "Korea"},
                          {"Czech", "Poland"}}) {
    for (const char* page : {"US-ASCII", "Latin1", "UTF-8", "MS932", "IBM037", "IBM930", "IBM933"}) {
      const LocaleModel model(one.language, one.territory, page);
      Locale locale = get(model.name());
      ASSERT_EQ(model.difference(locale.get(), one.language == std::string("Japanese")), "");
    }
  }
}

TEST(Items, OfTheBuiltInObjects) {
  Session session("/does/not/exist");
  EXPECT_EQ(LocaleModel::built_in().difference(get("").get(), true), "");
}

TEST(Items, BadArguments) {
  Session session;
  Locale locale = get("German.UTF-8");
  for (uint32_t item : {0u, 1u, 58u, 63u, 70u, 78u, 82u, 89u, 0x10000u + 59, 0xFFFFFFFFu}) {
    EXPECT_EQ(LXLocaleGetTextItem(locale.get(), item, 1, nullptr), nullptr);
    EXPECT_EQ(LXLocaleGetTextItemU(locale.get(), item, 1, nullptr), nullptr);
  }
  EXPECT_NE(LXLocaleGetTextItem(locale.get(), LX_ITEM_AM, 1, nullptr), nullptr) << "the form is optional";
  for (uint32_t item : {59u, 64u, 88u}) {
    for (const TextForm& form : text_forms()) {
      uint32_t buffer[4] = {};
      for (uint32_t options : {2u, 8u, 0x4002u, 0x80000000u}) {
        EXPECT_EQ(form.get(locale.get(), item, buffer, 4, options), -1) << form.name;
        EXPECT_EQ(LXGetError(locale.get()), LX_E_ARGUMENT) << form.name;
      }
      EXPECT_EQ(form.get(locale.get(), item, nullptr, 4, 0), -1) << form.name;
      EXPECT_EQ(LXGetError(locale.get()), LX_E_ARGUMENT) << form.name;
      for (int32_t size : {0, -1, INT32_MIN}) {
        EXPECT_EQ(form.get(locale.get(), item, buffer, size, 0), 0) << form.name;
        EXPECT_EQ(LXGetError(locale.get()), LX_OK) << form.name;
      }
      EXPECT_EQ(buffer[0], 0u);
      EXPECT_EQ(form.get(nullptr, item, buffer, 4, 0), -1) << "no default locale";
    }
  }
  for (uint32_t source : {2u, 0xFFFFFFFFu}) {
    EXPECT_EQ(LXGetLocaleNumInfo(locale.get(), LX_ITEM_TERRITORY_ID, source), -1);
    EXPECT_EQ(LXGetError(locale.get()), LX_E_ARGUMENT);
  }
  EXPECT_EQ(LXGetLocaleNumInfo(nullptr, LX_ITEM_TERRITORY_ID, 0), -1);
  EXPECT_EQ(LXLocaleGetTextItem(nullptr, LX_ITEM_AM, 1, nullptr), nullptr);
  char none[136] = "kept";
  EXPECT_EQ(LXLocaleGetLocaleString(nullptr, none), -1);
  // Not a code page: an error, but no harm.
  char buffer[8];
  EXPECT_EQ(
      LXGetLocaleTextInfoEx(locale.get(), LX_ITEM_AM, buffer, 8, LXGetLocaleObject(locale.get(), LX_TERRITORY), 0), -1);
}

TEST(Items, OfTheDefaultLocale) {
  Session session;
  ASSERT_EQ(LXSetLocale("Japanese.IBM930", 0), LX_OK);
  EXPECT_EQ(LocaleModel("Japanese", "Japan", "IBM930").difference(nullptr), "");
}

// Objects may be named as defaults that the directory lacks.
TEST(Items, MissingDefaults) {
  DataDirectory directory;
  write_small_directory(directory);
  directory.write_object(LX_LANGUAGE, 1, language_file({7, 8, 9}));
  Session session(directory.path());
  Locale locale = get("English_UnitedStates.US-ASCII@BINARY");
  for (uint32_t item : {LX_ITEM_DEFAULT_TERRITORY, LX_ITEM_DEFAULT_CODEPAGE, LX_ITEM_DEFAULT_SORT}) {
    for (const TextForm& form : text_forms()) {
      uint32_t buffer[40];
      EXPECT_EQ(form.get(locale.get(), item, buffer, 40, 0), -1) << form.name << item;
      EXPECT_EQ(LXGetError(locale.get()), LX_E_NOTFOUND);
    }
  }
}

// The locale keeps a separator in one byte, and its true value for those who read UCS-2.
TEST(Items, SeparatorsOfSeveralBytes) {
  DataDirectory directory;
  write_small_directory(directory);
  TerritoryParts parts;
  parts.decimal = u'\u3041';  // two bytes in the multibyte page, none in ASCII
  parts.currency = u"a\u3041\u5001\u6000z";
  directory.write_object(LX_TERRITORY, 2, territory_file(parts));
  Session session(directory.path());
  struct Case {
    const char* page;
    const char* currency;
    const char* own_decimal;
  };
  for (const Case& one :
       {Case{"Small", "a\x81\x41\x8F\xA1\xA1\xA1\x1Az", ""}, {"US-ASCII", "a\x1A\x1A\x1Az", "\x1A"}}) {
    Locale locale = get(std::string("English_Germany.") + one.page);
    char text[16];
    LXUChar units[8];
    EXPECT_EQ(LXGetLocaleTextInfo(locale.get(), LX_ITEM_CURRENCY, text, 16, 0),
              static_cast<int32_t>(std::strlen(one.currency)) + 1);
    EXPECT_STREQ(text, one.currency);
    EXPECT_EQ(LXGetLocaleTextInfo(locale.get(), LX_ITEM_DECIMAL, text, 16, 0), 2);
    EXPECT_STREQ(text, "\x1A") << "a lone lead byte would spoil the text";
    for (uint32_t options : {LX_OPT_OBJECT, LX_OPT_OBJECT | LX_OPT_CHARS}) {
      EXPECT_EQ(LXGetLocaleTextInfo(locale.get(), LX_ITEM_DECIMAL, text, 16, options),
                static_cast<int32_t>(std::strlen(one.own_decimal)) + 1);
      EXPECT_STREQ(text, one.own_decimal);
    }
    for (uint32_t options : {0u, LX_OPT_OBJECT}) {
      EXPECT_EQ(LXGetLocaleTextInfoU(locale.get(), LX_ITEM_DECIMAL, units, 8, options), 2);
      EXPECT_EQ(units[0], 0x3041);
    }
  }
}

}  // namespace
}  // namespace lx::test
