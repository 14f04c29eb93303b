// SPDX-License-Identifier: Apache-2.0
// What the system's locale names mean here, and the system's names for locales.
#include <gtest/gtest.h>

#include <set>

#include "locale/native_list.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

// ---- From names of the system ---------------------------------------------------------------------------------------

// A name of each kind of row, and what is no row. A name for each category is: code page, territory, language, sort.
TEST(NativeNames, Mapped) {
  const NativeName cases[] = {{"C", "English_UnitedStates.US-ASCII@Binary"},
                              {"de_CH", "German_German-Switzerland.Latin1@Default"},
                              {"en_US.utf-8", "English_UnitedStates.UTF-8@Default"},
                              {"es_CO", "Spanish_Columbia.Latin1@Spanish"},
                              {"et", "Estonian_Estonia.ISO-8859-2@Czech"},
                              {"fr_CA", "CanadianFrench_French-Canada.Latin1@Default"},
                              {"ja_JP.PCK", "Japanese_Japan.MS932@Binary"},
                              {"no", "Norwegian_Norway.Latin1@Danish"},
                              {"zh_TW.BIG5", "TraditionalChinese_Taiwan.MS950@Binary"},
                              {"en_US.UTF-8", "Unknown"},  // though it is the system's name for that locale
                              {"", "Unknown"},
                              {"DE", "Unknown"},
                              {"de_", "Unknown"},
                              {"en_US.utf-8x", "Unknown"},
                              {"LC_CTYPE=C;LC_NUMERIC=de_CH", "Unknown"},
                              {"/ja/C/de/C/C/C", "German_UnitedStates.JapanEUC@Binary"},
                              {"/en_US.utf-8/ja_JP.PCK/ko.UTF-8/et", "Korean_Japan.UTF-8@Czech"},
                              {"/ja/C/de", "German_UnitedStates.JapanEUC@Unknown"},
                              {"//C//C", "Unknown_UnitedStates.Unknown@Binary"},
                              {"/japanesex/C/d/C", "Unknown_UnitedStates.Unknown@Binary"}};
  for (const auto& [native, name] : cases) {
    for (size_t size = 1; size <= name.size() + 2; ++size) {
      Guarded buffer(size);
      EXPECT_EQ(LXMapNativeLocale(native.c_str(), buffer.data(), static_cast<int32_t>(size)), buffer.data());
      EXPECT_EQ(std::string(buffer.data()), name.substr(0, size - 1)) << native;
    }
  }
  char kept[] = "kept";
  for (int32_t size : {0, -1}) EXPECT_EQ(LXMapNativeLocale("C", kept, size), kept);
  EXPECT_STREQ(kept, "kept");
}

class NativeLocales : public testing::Test {
 protected:
  Session session_;
};

std::string full_name(LXLocale* locale) {
  char name[136];
  return LXLocaleGetLocaleString(locale, name) > 0 ? name : "";
}

TEST_F(NativeLocales, OfAllListedNames) {
  const std::vector<NativeName> all = native_names();
  EXPECT_EQ(native_names(2), std::vector(all.begin(), all.begin() + 2)) << "the callback ends the list";
  std::set<std::string> natives, names;
  for (const auto& [native, name] : all) {
    natives.insert(native);
    names.insert(name);
    char mapped[132];
    EXPECT_EQ(LXMapNativeLocale(native.c_str(), mapped, sizeof mapped), name);
    for (uint32_t options : {0u, LX_NATIVE_INFO, LX_GET_SUBSTITUTE, LX_NATIVE_INFO | LX_GET_SUBSTITUTE}) {
      uint32_t rc = 99;
      Locale locale(LXConvertNativeLocale(native.c_str(), options, &rc));
      ASSERT_NE(locale, nullptr) << native << rc;
      EXPECT_EQ(rc, LX_OK);
      EXPECT_EQ(full_name(locale.get()), name);
    }
  }
  EXPECT_EQ(natives.size(), 60u);
  EXPECT_EQ(names.size(), 57u) << "POSIX is C, japanese is ja, tw is zh_TW";
}

TEST_F(NativeLocales, OfUnknownNames) {
  const std::string english = "English_UnitedStates.Latin1@";
  for (const auto& [unknown, sort] : {std::pair("en_US.UTF-8", "Default"), {"", "Default"}, {"/xx/C/xx/C", "Binary"}}) {
    uint32_t rc = 99;
    EXPECT_EQ(LXConvertNativeLocale(unknown, 0, &rc), nullptr);
    EXPECT_EQ(rc, LX_E_LANGUAGE) << unknown;
    Locale locale(LXConvertNativeLocale(unknown, LX_GET_SUBSTITUTE, &rc));
    EXPECT_EQ(full_name(locale.get()), english + sort) << unknown;
  }
  uint32_t rc = 99;
  EXPECT_EQ(LXConvertNativeLocale("C", LX_GET_USER, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_ARGUMENT);
}

// ---- To names of the system -----------------------------------------------------------------------------------------

// Its name, or the status.
std::string native_name(LXLocale* locale, uint32_t options) {
  Guarded buffer(12);
  const bool found = LXConvertLocale(locale, buffer.data(), options) == 1;
  EXPECT_EQ(found, LXGetError(locale) == LX_OK);
  return found ? buffer.data() : std::to_string(LXGetError(locale));
}

// The two tables were made apart: where they do not agree is known.
TEST_F(NativeLocales, NamesThatComeBackAsOthers) {
  std::string others;
  for (const auto& [native, name] : native_names()) {
    Locale locale(LXGetLocale(name.c_str(), LX_GET_SUBSTITUTE, nullptr));
    const std::string back = native_name(locale.get(), LX_NATIVE_INFO);
    if (back != native) others += native + "=" + back + " ";
  }
  EXPECT_EQ(others,
            "en_IE=32 en_NZ=32 en_US.utf-8=en_US.UTF-8 es_BO=32 es_CO=32 es_CR=32 es_EC=32 es_GT=32 es_NI=32 es_PA=32 "
            "es_PE=32 es_PY=32 es_SV=32 es_UY=32 es_VE=32 et=32 hu=32 iso_8859_1=32 japanese=ja pl=32 POSIX=C tr=32 "
            "tw=zh_TW zh_TW.BIG5=32 ");
}

// Without a row of their own locales have none, or the first of those that agree in as many parts, from the left.
TEST_F(NativeLocales, Nearest) {
  const struct {
    const char *name, *exact, *nearest;
  } cases[] = {
      {"English_UnitedStates.UTF-8@Default", "en_US.UTF-8", "en_US.UTF-8"},
      {"TraditionalChinese_Taiwan.MS949@BINARY", "zh_TW.BIG5", "zh_TW.BIG5"},
      {"Korean_Korea.MS949@Default", "32", "ko"},
      {"Korean_Korea.UTF-8@Default", "32", "ko.UTF-8"},
      {"Korean_Korea.IBM037@BINARY", "32", "ko.UTF-8"},
      {"English_UnitedStates.Latin1@BINARY", "32", "en_US"},
      {"English_UnitedKingdom.UTF-8@Default", "32", "en_UK"},
      {"English_Ireland.Latin1@Default", "32", "C"},
      {"French_Ireland.Latin1@Default", "32", "fr_BE"},
      {"Spanish_Ireland.Latin1@Spanish", "32", "es"},
      {"Polish_Poland.ISO-8859-2@Default", "32", "C"},  // a language without any name
  };
  for (const auto& [name, exact, nearest] : cases) {
    Locale locale(LXGetLocale(name, 0, nullptr));
    ASSERT_NE(locale, nullptr) << name;
    for (uint32_t option : {0u, LX_NATIVE_INFO}) {
      EXPECT_EQ(native_name(locale.get(), option), exact) << name;
      EXPECT_EQ(native_name(locale.get(), option | LX_GET_SUBSTITUTE), nearest) << name;
    }
  }
  ASSERT_EQ(LXSetLocale("English_UnitedStates.UTF-8@Default", 0), LX_OK);
  EXPECT_EQ(native_name(nullptr, 0), "en_US.UTF-8");
  EXPECT_EQ(native_name(nullptr, LX_GET_USER), "2");
}

}  // namespace
}  // namespace lx::test
