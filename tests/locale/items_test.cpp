// SPDX-License-Identifier: Apache-2.0
// What locales report: every item in every form, against the readable sources.
#include <gtest/gtest.h>

#include <cstring>
#include <tuple>

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

TEST(Items, OfAllLanguages) {
  Session session;
  std::vector<std::string> languages;
  auto note = [](void* context, uint8_t type, const char* name) -> int32_t {
    if (type == LX_LANGUAGE) static_cast<decltype(languages)*>(context)->push_back(name);
    return 1;
  };
  LXEnumLocales(note, &languages, 0);
  ASSERT_GT(languages.size(), 20u);
  for (const std::string& language : languages) {
    Locale locale = get(language + "@BINARY");
    const LocaleModel model(language, LXGetObjName(LXGetLocaleObject(locale.get(), LX_TERRITORY)),
                            LXGetObjName(LXGetLocaleObject(locale.get(), LX_CODEPAGE)));
    ASSERT_EQ(model.difference(locale.get(), true), "") << language;
  }
}

TEST(Items, OfTheBuiltInObjects) {
  Session session("/does/not/exist");
  EXPECT_EQ(LocaleModel::built_in().difference(get("").get(), true), "");
}

TEST(Items, BadArguments) {
  Session session;
  Locale locale = get("German.UTF-8");
  for (const TextForm& form : text_forms()) {
    uint32_t buffer[4] = {};
    EXPECT_EQ(form.get(locale.get(), 64, buffer, 4, 2), -1) << form.name;
    EXPECT_EQ(LXGetError(locale.get()), LX_E_ARGUMENT) << form.name;
    EXPECT_EQ(form.get(locale.get(), 88, buffer, -1, 0), 0) << form.name;
    EXPECT_EQ(buffer[0], 0u);
    EXPECT_EQ(form.get(nullptr, 64, buffer, 4, 0), -1) << "no default locale";
  }
  EXPECT_EQ(LXGetLocaleNumInfo(locale.get(), LX_ITEM_TERRITORY_ID, 2), -1);
  EXPECT_EQ(LXGetError(locale.get()), LX_E_ARGUMENT);
  char buffer[8];
  const LXObjEntry* no_page = LXGetLocaleObject(locale.get(), LX_TERRITORY);
  EXPECT_EQ(LXGetLocaleTextInfoEx(locale.get(), LX_ITEM_AM, buffer, 8, no_page, 0), -1);
  ASSERT_EQ(LXSetLocale("Japanese.IBM930", 0), LX_OK);
  EXPECT_EQ(LocaleModel("Japanese", "Japan", "IBM930").difference(nullptr), "") << "null is the default locale";
}

// Objects may be named as defaults that the directory lacks.
TEST(Items, MissingDefaults) {
  DataDirectory directory;
  write_small_directory(directory);
  directory.write_object(LX_LANGUAGE, 1, language_file({7, 8, 9}));
  Session session(directory.path());
  Locale locale = get("English_UnitedStates.US-ASCII@BINARY");
  for (uint32_t item : {LX_ITEM_DEFAULT_TERRITORY, LX_ITEM_DEFAULT_CODEPAGE, LX_ITEM_DEFAULT_SORT}) {
    char buffer[40];
    EXPECT_EQ(LXGetLocaleTextInfo(locale.get(), item, buffer, 40, 0), -1) << item;
    EXPECT_EQ(LXGetError(locale.get()), LX_E_NOTFOUND);
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
  for (auto [page, currency, own_decimal] :
       {std::tuple("Small", "a\x81\x41\x8F\xA1\xA1\xA1\x1Az", ""), {"US-ASCII", "a\x1A\x1A\x1Az", "\x1A"}}) {
    Locale locale = get(std::string("English_Germany.") + page);
    for (auto [item, options, expected] : {std::tuple(LX_ITEM_CURRENCY, 0u, currency),
                                           {LX_ITEM_DECIMAL, 0u, "\x1A"},  // a lone lead byte would spoil the text
                                           {LX_ITEM_DECIMAL, LX_OPT_OBJECT, own_decimal},
                                           {LX_ITEM_DECIMAL, LX_OPT_OBJECT | LX_OPT_CHARS, own_decimal}}) {
      char text[16];
      const int32_t count = LXGetLocaleTextInfo(locale.get(), item, text, 16, options);
      EXPECT_EQ(count, static_cast<int32_t>(std::strlen(expected)) + 1);
      EXPECT_STREQ(text, expected);
    }
    LXUChar units[8];
    EXPECT_EQ(LXGetLocaleTextInfoU(locale.get(), LX_ITEM_DECIMAL, units, 8, 0), 2);
    EXPECT_EQ(units[0], 0x3041);
  }
}

}  // namespace
}  // namespace lx::test
