// SPDX-License-Identifier: Apache-2.0
// What the system's locale names mean here.
#include <gtest/gtest.h>

#include "support/session.hpp"

namespace lx::test {
namespace {

TEST(NativeLocale, Names) {
  struct Case {
    const char* native;
    const char* name;
  };
  const Case cases[] = {
      {"C", "English_UnitedStates.US-ASCII@Binary"},
      {"POSIX", "English_UnitedStates.US-ASCII@Binary"},
      {"de", "German_Germany.Latin1@Default"},
      {"de_CH", "German_German-Switzerland.Latin1@Default"},
      {"es_CO", "Spanish_Columbia.Latin1@Spanish"},
      {"en_US", "English_UnitedStates.Latin1@Default"},
      {"en_US.utf-8", "English_UnitedStates.UTF-8@Default"},
      {"en_US.UTF-8", "Unknown"},
      {"en_UK", "English_UnitedKingdom.Latin1@Default"},
      {"en_GB", "Unknown"},
      {"fr_CA", "CanadianFrench_French-Canada.Latin1@Default"},
      {"iso_8859_1", "English_UnitedStates.Latin1@Binary"},
      {"ja", "Japanese_Japan.JapanEUC@Binary"},
      {"japanese", "Japanese_Japan.JapanEUC@Binary"},
      {"ja_JP.PCK", "Japanese_Japan.MS932@Binary"},
      {"ko.UTF-8", "Korean_Korea.UTF-8@Binary"},
      {"et", "Estonian_Estonia.ISO-8859-2@Czech"},
      {"no", "Norwegian_Norway.Latin1@Danish"},
      {"su", "Finnish_Finland.Latin1@Finnish"},
      {"tw", "TraditionalChinese_Taiwan.EUC-TW@Binary"},
      {"zh_TW.BIG5", "TraditionalChinese_Taiwan.MS950@Binary"},
      {"zh", "SimplifiedChinese_China.MS936@Binary"},
      {"", "Unknown"},
      {"c", "Unknown"},
      {"de_", "Unknown"},
      {"DE", "Unknown"},
      {"LC_CTYPE=C;LC_NUMERIC=de_CH", "Unknown"},
      // A name for each category: code page, territory, language, sort.
      {"/ja/C/de/C/C/C", "German_UnitedStates.JapanEUC@Binary"},
      {"/de_CH/fr/es/it", "Spanish_France.Latin1@Default"},
      {"/ja/C/de", "German_UnitedStates.JapanEUC@Unknown"},
      {"/ja", "Unknown_Unknown.JapanEUC@Unknown"},
      {"/", "Unknown_Unknown.Unknown@Unknown"},
      {"//C//C", "Unknown_UnitedStates.Unknown@Binary"},
      {"/xx/C/de/C", "German_UnitedStates.Unknown@Binary"},
      {"/japanesex/C/d/C", "Unknown_UnitedStates.Unknown@Binary"},
  };
  for (const Case& one : cases) {
    Guarded buffer(132);
    EXPECT_EQ(LXMapNativeLocale(one.native, buffer.data(), 132), buffer.data());
    EXPECT_STREQ(buffer.data(), one.name) << one.native;
  }
}

TEST(NativeLocale, NameIsCutToItsRoom) {
  for (const char* native : {"de_CH", "xx", "/de/de/de/de"}) {
    char whole[132];
    LXMapNativeLocale(native, whole, sizeof whole);
    for (int32_t size : {1, 2, 7, 8, 9, 40}) {
      Guarded buffer(static_cast<size_t>(size));
      EXPECT_EQ(LXMapNativeLocale(native, buffer.data(), size), buffer.data());
      EXPECT_EQ(std::string(buffer.data()), std::string(whole).substr(0, static_cast<size_t>(size - 1))) << native;
    }
  }
  char kept[] = "kept";
  EXPECT_EQ(LXMapNativeLocale("C", kept, 0), kept);
  EXPECT_EQ(LXMapNativeLocale("C", kept, -1), kept);
  EXPECT_EQ(LXMapNativeLocale(nullptr, kept, 5), kept);
  EXPECT_STREQ(kept, "kept");
  EXPECT_EQ(LXMapNativeLocale("C", nullptr, 5), nullptr);
}

// Every name of a locale that is mapped is one that the data has, or the user gets no locale.
TEST(NativeLocale, LanguagesAndTerritoriesExist) {
  Session session;
  for (const char* native :
       {"C",     "da",    "de",    "de_AT", "de_CH",      "el",    "en_AU",     "en_CA", "en_IE",    "en_NZ",
        "en_UK", "en_US", "es",    "es_AR", "es_BO",      "es_CL", "es_CO",     "es_CR", "es_EC",    "es_GT",
        "es_MX", "es_NI", "es_PA", "es_PE", "es_PY",      "es_SV", "es_UY",     "es_VE", "et",       "fr",
        "fr_BE", "fr_CA", "fr_CH", "hu",    "it",         "ja",    "ja_JP.PCK", "ko",    "ko.UTF-8", "lt",
        "lv",    "nl",    "nl_BE", "no",    "pl",         "pt",    "pt_BR",     "ru",    "su",       "sv",
        "tr",    "tw",    "zh",    "zh_TW", "zh_TW.BIG5", "cz"}) {
    char name[132];
    LXMapNativeLocale(native, name, sizeof name);
    std::string without_sort(name, std::string_view(name).find('@'));
    uint32_t rc = 99;
    Locale locale(LXGetLocale((without_sort + "@BINARY").c_str(), 0, &rc));
    EXPECT_NE(locale, nullptr) << native << " " << name << " " << rc;
  }
}

}  // namespace
}  // namespace lx::test
