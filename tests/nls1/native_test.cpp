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
  void TearDown() override {
    std::setlocale(LC_ALL, system_.c_str());
    FrenchProcess::TearDown();
  }
  static std::string system(int category) { return std::setlocale(category, nullptr); }

  const std::string system_ = std::setlocale(LC_ALL, nullptr);
};

TEST_F(Native, ConvertsNames) {
  uint32_t rc = 99;
  Locale locale(NLS1_ConvertNativeLocale("C", 0, &rc));
  EXPECT_EQ(rc, LX_OK);
  EXPECT_EQ(full_name(locale.get()), "English_UnitedStates.US-ASCII@Binary");
  TraceCapture trace;
  EXPECT_EQ(NLS1_ConvertNativeLocale("xx", 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_LANGUAGE);
  EXPECT_TRUE(trace.has("LXConvertNativeLocale failed for xx with rc 31")) << trace.all();
  EXPECT_EQ(NLS1_ConvertNativeLocale("C", LX_GET_USER, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_ARGUMENT);
  Locale of_none(NLS1_ConvertNativeLocale(nullptr, 0, nullptr));
}

TEST_F(Native, MakesTheProcessLocale) {
  const LXLocale* thread = NLS1_PrivateFunction_GetThreadLocale();
  ASSERT_NE(thread, nullptr);
  const std::string before = full_name(lxglocale);
  EXPECT_EQ(NLS1_SetLocaleFromNative("xx", 0), LX_E_LANGUAGE);
  EXPECT_EQ(full_name(lxglocale), before) << "unknown names change nothing";
  EXPECT_EQ(NLS1_PrivateFunction_GetThreadLocale(), thread);
  EXPECT_EQ(NLS1_SetLocaleFromNative("ja", 0), LX_OK);
  EXPECT_EQ(full_name(lxglocale), "Japanese_Japan.JapanEUC@Binary");
  EXPECT_EQ(NLS1_PrivateFunction_GetThreadLocale(), nullptr) << "the thread has none of its own any more";
  EXPECT_EQ(NLS1_SetLocaleFromNative("C", 8), LX_OK) << "options that no step knows are left out";
  EXPECT_EQ(full_name(lxglocale), "English_UnitedStates.US-ASCII@Binary");
  EXPECT_EQ(NLS1_SetLocaleFromNative("xx", LX_GET_SUBSTITUTE), LX_OK);
  EXPECT_EQ(full_name(lxglocale), complete("English"));
  EXPECT_EQ(NLS1_SetLocaleFromNative("ja", LX_GET_USER), LX_OK);
  EXPECT_EQ(full_name(lxglocale), "French_France.Latin1@Binary") << "the user's instead of the name";
}

TEST_F(Native, SwitchesTheSystem) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  Locale japanese(LXGetLocale("Japanese_Japan.JapanEUC@BINARY", 0, nullptr));
  {
    TraceCapture trace;
    EXPECT_EQ(NLS1_SetNativeFromLocale(japanese.get(), LC_NUMERIC, 0), LX_E_NATIVE);
    EXPECT_TRUE(trace.has("setlocale failed to setlocale to ja")) << trace.all();
    EXPECT_EQ(NLS1_SetNativeFromLocale(japanese.get(), 12345, LX_GET_SUBSTITUTE), LX_E_NATIVE);
  }
  SystemLocales locales({{"ja", "ja_JP", "EUC-JP"}});
  if (!locales.made()) GTEST_SKIP() << "no localedef";
  EXPECT_EQ(NLS1_SetNativeFromLocale(japanese.get(), LC_NUMERIC, 0), LX_OK);
  EXPECT_EQ(system(LC_NUMERIC), "ja");
  EXPECT_EQ(system(LC_CTYPE), "C") << "only the category that was asked for";
  EXPECT_EQ(NLS1_SetNativeLocale(both(1, 840), 367, LC_NUMERIC, LX_GET_SUBSTITUTE), LX_OK);
  EXPECT_EQ(system(LC_NUMERIC), "C");
  ASSERT_EQ(NLS1_SetLocaleFromNative("ja", 0), LX_OK);
  EXPECT_EQ(NLS1_SetNativeFromLocale(nullptr, LC_TIME, 0), LX_OK) << "null is the locale of the process";
  EXPECT_EQ(system(LC_TIME), "ja");
  if (full_name(Locale(NLS1_GetLocale(both(11, 392), 954, 0, nullptr)).get()) == "Japanese_Japan.JapanEUC@Binary") {
    EXPECT_EQ(NLS1_SetNativeLocale(both(11, 392), 954, LC_CTYPE, 0), LX_OK);
    EXPECT_EQ(system(LC_CTYPE), "ja");
  }
}

TEST_F(Native, LocalesWithoutANativeName) {
  Locale locale(LXGetLocale("English_UnitedStates.IBM037@BINARY", 0, nullptr));
  TraceCapture trace;
  EXPECT_EQ(NLS1_SetNativeFromLocale(locale.get(), LC_ALL, 0), LX_E_NATIVE);
  EXPECT_TRUE(trace.has("NLS1_ConvertLocale failed with rc = 32")) << trace.all();
  EXPECT_EQ(NLS1_SetNativeFromLocale(locale.get(), LC_ALL, LX_GET_SUBSTITUTE), LX_OK);
  EXPECT_EQ(NLS1_SetNativeLocale(999, 0, LC_ALL, 0), LX_E_LANGUAGE);
  EXPECT_EQ(NLS1_SetNativeLocale(1, 9999, LC_ALL, 0), LX_E_CODEPAGE);
  EXPECT_EQ(system(LC_ALL), system_);
}

}  // namespace
}  // namespace lx::test
