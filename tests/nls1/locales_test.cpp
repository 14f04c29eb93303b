// SPDX-License-Identifier: Apache-2.0
// Locales by number, of the thread and of the process, and their items.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <thread>

#include "nls1/names.hpp"
#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

constexpr uint32_t kThread = NLS1_THREAD, kProcess = NLS1_PROCESS;

std::string thread_name() { return full_name(NLS1_PrivateFunction_GetThreadLocale()); }

class Locales : public FrenchProcess {
 protected:
  const std::string kBefore = complete("French_France.Latin1");
};

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
      {1, 0, 0, "English", LX_OK, ""},
      {both(0, 276), 0, 0, "_Germany", LX_OK, ""},
      {both(2, 40), 0, LX_GET_SUBSTITUTE, "German_Austria", LX_OK, ""},
      {0, LX_CP_UTF8, kThread | kProcess, ".UTF-8", LX_OK, ""},
      {0xFFFF, 9999, 0, nullptr, LX_E_LANGUAGE, "Invalid Language 65535"},
      {both(1, 1), 9999, 0, nullptr, LX_E_TERRITORY, "Invalid Territory 1"},
      {both(1, 0x8001), 0, LX_GET_SUBSTITUTE, nullptr, LX_E_TERRITORY, "Invalid Territory 32769"},
      {1, LX_CP_UCS2, 0, nullptr, LX_E_CODEPAGE, "Invalid Codepage 1200"},
      {1, 0, 1, nullptr, LX_E_ARGUMENT, ""},
      {1, 0, 8 | kThread, nullptr, LX_E_ARGUMENT, ""},
  };
  for (const auto& one : cases) {
    TraceCapture trace;
    uint32_t rc = 99;
    Locale locale(NLS1_GetLocale(one.language_territory, one.page, one.options, &rc));
    EXPECT_EQ(rc, one.rc) << std::hex << one.language_territory;
    EXPECT_EQ(full_name(locale.get()), one.name != nullptr ? complete(one.name) : "-");
    const std::string messages = trace.all();
    EXPECT_TRUE(messages.find(one.message) != messages.npos) << messages;
  }
  Locale locale(NLS1_GetLocale(0, 0, 0, nullptr));
  EXPECT_NE(locale, nullptr) << "the status is optional";
}

TEST_F(Locales, AreSetWhereTheScopeSays) {
  const std::string german = complete("German_Germany.IBM037");
  for (uint32_t options : {0u, kProcess, LX_GET_SUBSTITUTE, kThread, kThread | LX_GET_SUBSTITUTE, kThread | kProcess}) {
    SetUp();
    const bool of_thread = (options & kThread) != 0, of_process = !of_thread || (options & kProcess) != 0;
    EXPECT_EQ(NLS1_SetLocale(both(2, 276), 37, options), LX_OK);
    EXPECT_EQ(thread_name(), of_thread ? german : kBefore) << std::hex << options;
    EXPECT_EQ(full_name(lxglocale), of_process ? german : kBefore) << std::hex << options;
    std::thread([&] { EXPECT_EQ(thread_name(), complete("French_France.Latin1@BINARY")); }).join();
  }
}

TEST_F(Locales, FailuresChangeNothing) {
  for (uint32_t options : {0u, kThread, kProcess, kThread | kProcess}) {
    EXPECT_EQ(NLS1_SetLocale(500, 0, options), LX_E_LANGUAGE);
    EXPECT_EQ(NLS1_SetLocale(1, 9999, options), LX_E_CODEPAGE);
  }
  EXPECT_EQ(NLS1_SetLocale(2, 0, kThread | 8), LX_E_ARGUMENT);
  EXPECT_EQ(thread_name(), kBefore);
  EXPECT_EQ(full_name(lxglocale), kBefore);
  EXPECT_EQ(NLS1_SetLocale(2, 0, 8), LX_OK) << "of the process's options only those of LXSetLocale are looked at";
  EXPECT_EQ(full_name(lxglocale), complete("German"));
  EXPECT_EQ(NLS1_SetLocale(both(2, 276), 37, LX_GET_USER | LX_GET_SUBSTITUTE), LX_OK);
  EXPECT_EQ(full_name(lxglocale), complete("French_France.Latin1@BINARY")) << "the user's";
}

TEST_F(Locales, Numbers) {
  Locale locale(NLS1_GetLocale(both(2, 276), 0, 0, nullptr));
  EXPECT_EQ(NLS1_GetLocaleNumInfo(locale.get(), LX_ITEM_LANGUAGE_ID, 0), 2);
  EXPECT_EQ(NLS1_GetLocaleNumInfo(nullptr, LX_ITEM_LANGUAGE_ID, 0), 3) << "null is the locale of the process";
  EXPECT_EQ(NLS1_GetLocaleNumInfo(locale.get(), 999, 0), -1);
  EXPECT_EQ(LXGetError(locale.get()), LX_E_ITEM);
  EXPECT_EQ(NLS1_SetLocaleNumInfo(locale.get(), LX_ITEM_LANGUAGE_ID, 3), 1);
  EXPECT_EQ(NLS1_GetLocaleNumInfo(locale.get(), LX_ITEM_LANGUAGE_ID, 0), 3);
  EXPECT_EQ(NLS1_SetLocaleNumInfo(locale.get(), LX_ITEM_LANGUAGE_ID, 999), 0);
  EXPECT_EQ(LXGetError(locale.get()), LX_E_NOTFOUND);
}

TEST_F(Locales, TextsInAnyCodePage) {
  Locale locale(NLS1_GetLocale(both(11, 392), 0, 0, nullptr));
  const auto own = [&](uint16_t page) -> std::string {
    char text[64];
    const int32_t count = NLS1_GetLocaleTextInfo(locale.get(), LX_ITEM_LANGUAGE_OWN_NAME, text, sizeof text, page, 0);
    return count > 0 ? text : std::to_string(count);
  };
  char expected[64];
  LXGetLocaleTextInfo(locale.get(), LX_ITEM_LANGUAGE_OWN_NAME, expected, sizeof expected, 0);
  EXPECT_EQ(own(0), expected);
  EXPECT_EQ(own(LX_CP_UTF8), "日本語");
  EXPECT_EQ(own(930), "\x0E\x45\x62\x45\x66\x48\xE7\x0F");
  EXPECT_EQ(own(932), "\x93\xFA\x96\x7B\x8C\xEA");

  constexpr uint32_t kCurrency = 64;
  EXPECT_EQ(NLS1_SetLocaleTextInfo(locale.get(), kCurrency, "\x0E\x45\x62\x0F\xC1", -1, 930, 0), 1);
  char text[64];
  EXPECT_GT(NLS1_GetLocaleTextInfo(locale.get(), kCurrency, text, sizeof text, LX_CP_UTF8, 0), 0);
  EXPECT_STREQ(text, "日A");
  EXPECT_EQ(NLS1_SetLocaleTextInfo(locale.get(), kCurrency, "B", -1, 0, 0), 1);
  EXPECT_GT(NLS1_GetLocaleTextInfo(locale.get(), kCurrency, text, sizeof text, 37, 0), 0);
  EXPECT_STREQ(text, "\xC2");

  TraceCapture trace;
  EXPECT_EQ(own(9999), "-1");
  EXPECT_EQ(LXGetError(locale.get()), LX_E_CODEPAGE);
  EXPECT_TRUE(trace.has("Invalid Codepage 9999"));
  EXPECT_EQ(NLS1_SetLocaleTextInfo(nullptr, kCurrency, "C", -1, 9998, 0), 0);
  EXPECT_EQ(LXGetError(nullptr), LX_E_CODEPAGE);
  EXPECT_TRUE(trace.has("Invalid Codepage 9998"));
}

}  // namespace
}  // namespace lx::test
