// SPDX-License-Identifier: Apache-2.0
// Locales by number, of the thread and of the process, and their items.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include "nls1/names.hpp"
#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

constexpr uint32_t kThread = NLS1_THREAD, kProcess = NLS1_PROCESS;

using Locales = FrenchProcess;

TEST_F(Locales, FromIds) {
  const struct {
    int32_t language_territory;
    uint16_t page;
    uint32_t options;
    const char* name;
    uint32_t rc;
    const char* message;
  } cases[] = {
      {0, 0, 0, "", LX_OK, ""},
      {2, 0, 0, "German", LX_OK, ""},
      {both(0, 276), 0, 0, "_Germany", LX_OK, ""},
      {both(2, 40), 0, LX_GET_USER, "French_France.Latin1@BINARY", LX_OK, ""},
      {0, LX_CP_UTF8, kThread | kProcess, ".UTF-8", LX_OK, ""},
      {0xFFFF, 9999, 0, nullptr, LX_E_LANGUAGE, "Invalid Language 65535"},
      {both(1, 0x8001), 9999, LX_GET_SUBSTITUTE, nullptr, LX_E_TERRITORY, "Invalid Territory 32769"},
      {1, LX_CP_UCS2, 0, nullptr, LX_E_CODEPAGE, "Invalid Codepage 1200"},
      {1, 0, 8 | kThread, nullptr, LX_E_ARGUMENT, ""},
  };
  for (const auto& one : cases) {
    TraceCapture trace;
    uint32_t rc = 99;
    Locale locale(NLS1_GetLocale(one.language_territory, one.page, one.options, &rc));
    EXPECT_EQ(rc, one.rc) << std::hex << one.language_territory;
    EXPECT_EQ(full_name(locale.get()), one.name != nullptr ? complete(one.name) : "-");
    EXPECT_NE(trace.all().find(one.message), std::string::npos) << trace.all();
  }
}

TEST_F(Locales, AreSetWhereTheScopeSays) {
  const std::string french = complete("French_France.Latin1"), german = complete("German_Germany.IBM037"),
                    user = complete("French_France.Latin1@BINARY");
  const struct {
    int32_t language_territory;
    uint16_t page;
    uint32_t options, rc;
    std::string thread, process;
  } cases[] = {
      {both(2, 276), 37, 0, LX_OK, french, german},
      {both(2, 276), 37, kProcess | 8, LX_OK, french, german},
      {both(2, 276), 37, kThread, LX_OK, german, french},
      {both(2, 276), 37, kThread | kProcess, LX_OK, german, german},
      {both(2, 276), 37, LX_GET_USER, LX_OK, french, user},
      {both(2, 276), 37, LX_GET_USER | kThread, LX_OK, user, french},
      {both(2, 276), 37, 8 | kThread, LX_E_ARGUMENT, french, french},
      {500, 0, kThread, LX_E_LANGUAGE, french, french},
      {1, 9999, 0, LX_E_CODEPAGE, french, french},
  };
  for (const auto& one : cases) {
    SetUp();
    EXPECT_EQ(NLS1_SetLocale(one.language_territory, one.page, one.options), one.rc);
    EXPECT_EQ(full_name(NLS1_PrivateFunction_GetThreadLocale()), one.thread) << std::hex << one.options;
    EXPECT_EQ(full_name(lxglocale), one.process) << std::hex << one.options;
  }
}

TEST_F(Locales, Numbers) {
  Locale locale(NLS1_GetLocale(both(2, 276), 0, 0, nullptr));
  EXPECT_EQ(NLS1_SetLocaleNumInfo(locale.get(), LX_ITEM_FRACTION_DIGITS, 5), 1);
  EXPECT_EQ(NLS1_GetLocaleNumInfo(locale.get(), LX_ITEM_FRACTION_DIGITS, 0), 5);
  EXPECT_EQ(NLS1_GetLocaleNumInfo(locale.get(), LX_ITEM_FRACTION_DIGITS, 1), 2);
}

TEST_F(Locales, TextsInAnyCodePage) {
  Locale locale(NLS1_GetLocale(both(11, 392), 954, 0, nullptr));
  const auto text_of = [&](uint32_t item, uint16_t page, uint32_t options = 0) -> std::string {
    char text[64];
    const int32_t count = NLS1_GetLocaleTextInfo(locale.get(), item, text, sizeof text, page, options);
    return count > 0 ? text : std::to_string(count);
  };
  EXPECT_EQ(text_of(LX_ITEM_LANGUAGE_OWN_NAME, 0), "\xC6\xFC\xCB\xDC\xB8\xEC");
  EXPECT_EQ(text_of(LX_ITEM_LANGUAGE_OWN_NAME, 930), "\x0E\x45\x62\x45\x66\x48\xE7\x0F");

  EXPECT_EQ(NLS1_SetLocaleTextInfo(locale.get(), LX_ITEM_CURRENCY, "\x0E\x45\x62\x0F\xC1", -1, 930, 0), 1);
  EXPECT_EQ(text_of(LX_ITEM_CURRENCY, LX_CP_UTF8), "日A");
  EXPECT_EQ(NLS1_SetLocaleTextInfo(locale.get(), LX_ITEM_CURRENCY, "\xC6\xFC-", 1, 0, LX_OPT_CHARS), 1);
  EXPECT_EQ(text_of(LX_ITEM_CURRENCY, LX_CP_UTF8), "日");
  EXPECT_EQ(text_of(LX_ITEM_CURRENCY, LX_CP_UTF8, LX_OPT_OBJECT), "￥");

  TraceCapture trace;
  EXPECT_EQ(text_of(LX_ITEM_CURRENCY, 9999), "-1");
  EXPECT_EQ(LXGetError(locale.get()), LX_E_CODEPAGE);
  EXPECT_TRUE(trace.has("Invalid Codepage 9999"));
  EXPECT_EQ(NLS1_SetLocaleTextInfo(nullptr, LX_ITEM_CURRENCY, "C", -1, 9998, 0), 0);
  EXPECT_EQ(LXGetError(nullptr), LX_E_CODEPAGE);
}

}  // namespace
}  // namespace lx::test
