// SPDX-License-Identifier: Apache-2.0
// Bridges to the system's locales, with locales made for the test.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <clocale>

#include "nls1/names.hpp"
#include "support/environment.hpp"
#include "support/system_locales.hpp"
#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

class Native : public FrenchProcess {
 protected:
  void TearDown() override { std::setlocale(LC_ALL, "C"); }
  static std::string system(int category) { return std::setlocale(category, nullptr); }
};

TEST_F(Native, MakesLocales) {
  uint32_t rc = 99;
  EXPECT_EQ(full_name(Locale(NLS1_ConvertNativeLocale("C", 0, &rc)).get()), "English_UnitedStates.US-ASCII@Binary");
  EXPECT_EQ(rc, LX_OK);
  TraceCapture trace;
  EXPECT_EQ(NLS1_ConvertNativeLocale("xx", 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_LANGUAGE);
  EXPECT_TRUE(trace.has("LXConvertNativeLocale failed for xx with rc 31")) << trace.all();
  EXPECT_EQ(NLS1_ConvertNativeLocale(nullptr, 0, nullptr), nullptr);
}

TEST_F(Native, MakesTheProcessLocale) {
  const struct {
    const char* native;
    uint32_t options, rc;
    std::string name;
  } cases[] = {{"xx", 0, LX_E_LANGUAGE, complete("French_France.Latin1")},
               {"xx", LX_GET_SUBSTITUTE, LX_OK, complete("English")},
               {"ja", LX_GET_USER, LX_OK, "French_France.Latin1@Binary"},
               {"ja", 8, LX_OK, "Japanese_Japan.JapanEUC@Binary"}};  // options that no step knows are left out
  for (const auto& one : cases) {
    SetUp();
    EXPECT_EQ(NLS1_SetLocaleFromNative(one.native, one.options), one.rc);
    EXPECT_EQ(full_name(lxglocale), one.name);
    EXPECT_EQ(NLS1_PrivateFunction_GetThreadLocale() == nullptr, one.rc == LX_OK) << "the thread gives its own up";
  }
}

TEST_F(Native, SwitchesTheSystem) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  Locale japanese(LXGetLocale("Japanese_Japan.JapanEUC@BINARY", 0, nullptr));
  TraceCapture trace;
  EXPECT_EQ(NLS1_SetNativeFromLocale(japanese.get(), LC_NUMERIC, 0), LX_E_NATIVE);
  EXPECT_TRUE(trace.has("setlocale failed to setlocale to ja")) << trace.all();
  SystemLocales locales({{"ja", "ja_JP", "EUC-JP"}});
  if (!locales.made()) GTEST_SKIP() << "no localedef";
  EXPECT_EQ(NLS1_SetNativeFromLocale(japanese.get(), LC_NUMERIC, 0), LX_OK);
  EXPECT_EQ(system(LC_NUMERIC), "ja");
  EXPECT_EQ(system(LC_CTYPE), "C") << "only the category that was asked for";
  EXPECT_EQ(NLS1_SetNativeLocale(both(11, 392), 954, LC_CTYPE, 0), LX_OK);
  EXPECT_EQ(system(LC_CTYPE), "ja");
}

TEST_F(Native, LocalesWithoutANativeName) {
  EXPECT_EQ(NLS1_SetLocale(both(1, 840), 37, NLS1_PROCESS), LX_OK);
  TraceCapture trace;
  EXPECT_EQ(NLS1_SetNativeFromLocale(nullptr, LC_ALL, 0), LX_E_NATIVE);
  EXPECT_TRUE(trace.has("NLS1_ConvertLocale failed with rc = 32")) << trace.all();
  EXPECT_EQ(NLS1_SetNativeLocale(both(1, 840), 37, LC_ALL, LX_GET_SUBSTITUTE), LX_OK) << "the nearest is C";
  EXPECT_EQ(NLS1_SetNativeLocale(1, 9999, LC_ALL, 0), LX_E_CODEPAGE);
}

}  // namespace
}  // namespace lx::test
