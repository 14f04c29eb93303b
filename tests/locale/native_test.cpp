// SPDX-License-Identifier: Apache-2.0
// What the system's locale names mean here, and the system's names for locales.
#include <gtest/gtest.h>

#include <tuple>
#include <vector>

#include "support/session.hpp"

namespace lx::test {
namespace {

using NativeName = std::pair<std::string, std::string>;  // of the system, and what it means here

// The first of those that the library lists, at most so many.
std::vector<NativeName> native_names(size_t most = SIZE_MAX) {
  std::pair<size_t, std::vector<NativeName>> list(most, {});
  auto note = [](void* context, const char* native, const char* name) -> int32_t {
    auto& [limit, names] = *static_cast<decltype(list)*>(context);
    names.push_back({native, name});
    return names.size() < limit;
  };
  LXEnumNativeNames(note, &list);
  return list.second;
}

// ---- From names of the system ---------------------------------------------------------------------------------------

// Names of which not all come back, and what is no name. A name for each category is: code page, territory, language,
// sort.
TEST(NativeNames, Mapped) {
  const NativeName cases[] = {{"C", "English_UnitedStates.US-ASCII@Binary"},
                              {"en_US.utf-8", "English_UnitedStates.UTF-8@Default"},
                              {"es_CO", "Spanish_Columbia.Latin1@Spanish"},
                              {"et", "Estonian_Estonia.ISO-8859-2@Czech"},
                              {"zh_TW.BIG5", "TraditionalChinese_Taiwan.MS950@Binary"},
                              {"en_US.UTF-8", "Unknown"},  // though it is the system's name for that locale
                              {"", "Unknown"},
                              {"DE", "Unknown"},
                              {"de_", "Unknown"},
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

std::string full_name(LXLocale* locale) {
  char name[136];
  return LXLocaleGetLocaleString(locale, name) > 0 ? name : "";
}

TEST(NativeLocales, OfAllListedNames) {
  Session session;
  const std::vector<NativeName> all = native_names();
  EXPECT_EQ(all.size(), 60u);
  EXPECT_EQ(native_names(2), std::vector(all.begin(), all.begin() + 2)) << "the callback ends the list";
  for (const auto& [native, name] : all) {
    char mapped[132];
    EXPECT_EQ(LXMapNativeLocale(native.c_str(), mapped, sizeof mapped), name);
    for (uint32_t options : {0u, LX_NATIVE_INFO | LX_GET_SUBSTITUTE}) {
      Locale locale(LXConvertNativeLocale(native.c_str(), options, nullptr));
      EXPECT_EQ(full_name(locale.get()), name);
    }
  }
}

TEST(NativeLocales, OfUnknownNames) {
  Session session;
  for (auto [unknown, options, rc] : {std::tuple("en_US.UTF-8", 0u, LX_E_LANGUAGE),
                                      {"/xx/C/xx/C", 0u, LX_E_LANGUAGE},
                                      {"C", LX_GET_USER, LX_E_ARGUMENT}}) {
    uint32_t status = 99;
    EXPECT_EQ(LXConvertNativeLocale(unknown, options, &status), nullptr);
    EXPECT_EQ(status, rc) << unknown;
  }
  Locale locale(LXConvertNativeLocale("/xx/C/xx/C", LX_GET_SUBSTITUTE, nullptr));
  EXPECT_EQ(full_name(locale.get()), "English_UnitedStates.Latin1@Binary");
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
TEST(NativeLocales, NamesThatComeBackAsOthers) {
  Session session;
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
TEST(NativeLocales, Nearest) {
  Session session;
  const struct {
    const char *name, *exact, *nearest;
  } cases[] = {
      {"TraditionalChinese_Taiwan.MS949@BINARY", "zh_TW.BIG5", "zh_TW.BIG5"},
      {"Korean_Korea.UTF-8@Default", "32", "ko.UTF-8"},
      {"Korean_Korea.IBM037@BINARY", "32", "ko.UTF-8"},
      {"English_UnitedStates.Latin1@BINARY", "32", "en_US"},
      {"English_Ireland.Latin1@Default", "32", "C"},
      {"French_Ireland.Latin1@Default", "32", "fr_BE"},
      {"Polish_Poland.ISO-8859-2@Default", "32", "C"},  // a language without any name
  };
  for (const auto& [name, exact, nearest] : cases) {
    Locale locale(LXGetLocale(name, 0, nullptr));
    ASSERT_NE(locale, nullptr) << name;
    EXPECT_EQ(native_name(locale.get(), 0), exact) << name;
    EXPECT_EQ(native_name(locale.get(), LX_NATIVE_INFO | LX_GET_SUBSTITUTE), nearest) << name;
  }
  ASSERT_EQ(LXSetLocale("English_UnitedStates.UTF-8@Default", 0), LX_OK);
  EXPECT_EQ(native_name(nullptr, 0), "en_US.UTF-8");
  EXPECT_EQ(native_name(nullptr, LX_GET_USER), "2");
}

}  // namespace
}  // namespace lx::test
