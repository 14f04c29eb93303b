// SPDX-License-Identifier: Apache-2.0
// Calls that run out of memory at every place where they take some: they say so, leak nothing, and leave what the
// caller has as it was.
#include <gtest/gtest.h>

#include <clocale>

#include "faults/each_allocation.hpp"
#include "support/environment.hpp"
#include "support/session.hpp"
#include "support/system_locales.hpp"

namespace lx::test {
namespace {

constexpr char kName[] = "German_Germany.Small@BINARY";
LXLocale* g_locale;
uint32_t g_rc;

void release_locale() { EXPECT_EQ(LXReleaseLocale(std::exchange(g_locale, nullptr), 0), LX_OK); }
uint32_t got_locale() { return (g_locale != nullptr) == (g_rc == LX_OK) ? g_rc : kFailed; }

// Objects of every type and layout, on their own. What was not loaded can still be.
TEST(Allocation, OfObjects) {
  for (const ObjectRecord& record : small_directory_records()) {
    fail_each_allocation({record.name.c_str(), [&] {
                            LXObjEntry* entry = LXGetObjFromID(LXGetObjManager(), record.type, record.id, 0, &g_rc);
                            return (entry != nullptr) == (g_rc == LX_OK) ? g_rc : kFailed;
                          }});
  }
  const LXWChar english[] = {'E', 'n', 'g', 'l', 'i', 's', 'h', 0};
  fail_each_allocation({"LXGetObjFromNameW", [&] {
                          LXObjEntry* entry = LXGetObjFromNameW(LXGetObjManager(), LX_LANGUAGE, english, -1, 1, &g_rc);
                          return (entry != nullptr) == (g_rc == LX_OK) ? g_rc : kFailed;
                        }});
}

// A second manager: its aliases may be incomplete, all else is told.
TEST(Allocation, OfManagers) {
  for (uint32_t options : {0u, LX_INIT_NO_DEFAULTS}) {
    bool failed = true;
    for (int n = 0; failed; ++n) {
      SCOPED_TRACE(n);
      CountingAllocator allocator;
      ASSERT_EQ(allocator.init("/does/not/exist"), LX_E_DEFAULTS);
      int before = allocator.live;
      allocator.arm(n, n % 2 == 1);
      LXObjMgr* manager = LXInitObjManager(small_directory().path(), options, &g_rc);
      failed = allocator.has_failed();
      allocator.disarm();
      EXPECT_EQ(manager == nullptr, n == 0) << "only the manager itself is missed so much";
      EXPECT_TRUE(g_rc == LX_OK || g_rc == LX_E_MEMORY) << g_rc;
      bool found = LXGetObjFromID(manager, LX_CODEPAGE, 900, 1, nullptr) != nullptr;
      EXPECT_EQ(found, g_rc == LX_OK);
      EXPECT_EQ(LXTermObjManager(manager), LX_OK);
      EXPECT_EQ(allocator.live, before);
      EXPECT_EQ(LXTerm(), LX_OK);
      EXPECT_EQ(allocator.live, 0);
    }
  }
}

TEST(Allocation, OfTheLibrary) {
  Variable location("LX_LOCALEDIR", nullptr);
  for (const char* directory : {small_directory().path(), "/does/not/exist"}) {
    for (bool all_after : {false, true}) {
      bool failed = true;
      for (int n = 0; failed; ++n) {
        SCOPED_TRACE(std::string(directory) + " " + std::to_string(n));
        CountingAllocator allocator;
        allocator.arm(n, all_after);
        uint32_t status = allocator.init(directory);
        failed = allocator.has_failed();
        allocator.disarm();
        if (status == LX_E_MEMORY || status == LX_E_MANAGER) {
          EXPECT_EQ(LXGetObjManager(), nullptr);
          EXPECT_EQ(LXTerm(), LX_OK);
          status = allocator.init(directory);
        }
        ASSERT_TRUE(status == LX_OK || status == LX_E_DEFAULTS) << status;
        Locale locale(LXGetLocale("English", 0, nullptr));  // there is none when there was no memory for the directory
        locale.reset();
        EXPECT_EQ(LXTerm(), LX_OK);
        ASSERT_EQ(allocator.live, 0);
      }
    }
  }
}

// An object that does not fit into memory is served by built-in data where that is allowed, as any that cannot be read.
TEST(Allocation, OfObjectsThatHaveStandIns) {
  bool failed = true;
  for (int n = 0; failed; ++n) {
    SCOPED_TRACE(n);
    CountingAllocator allocator;
    ASSERT_EQ(allocator.init(small_directory().path()), LX_OK);
    allocator.arm(n, false);
    g_locale = LXGetLocale(kName, 0, &g_rc);
    failed = allocator.has_failed();
    allocator.disarm();
    EXPECT_EQ(got_locale(), g_locale != nullptr ? LX_OK : LX_E_MEMORY);
    if (g_locale != nullptr) {
      char out[16];
      EXPECT_EQ(LXConvertString(g_locale, out, 16, g_locale, "abc", 3, 0), 3);
    }
    release_locale();
    EXPECT_EQ(LXTerm(), LX_OK);
    ASSERT_EQ(allocator.live, 0);
  }
}

// The system's values are an extra: without memory for them the locale keeps its territory's, each as a whole.
TEST(Allocation, OfSystemValues) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  const SystemLocales system({{"de_CH", "de_CH", "ISO-8859-1"}});
  Variable lx_lang("LX_LANG", nullptr);
  Variable all("LC_ALL", system.made() ? "de_CH" : "C");
  std::string former, latter;
  for (bool user : {false, true}) {
    bool failed = true;
    for (int n = 0; failed; ++n) {
      SCOPED_TRACE(n);
      CountingAllocator allocator;
      ASSERT_EQ(allocator.init(small_directory().path(), LX_INIT_NO_DEFAULTS), LX_OK);
      allocator.arm(n, n % 2 == 1);
      uint32_t rc = 99;
      Locale locale(user ? LXGetLocale(nullptr, LX_GET_USER | LX_GET_SUBSTITUTE, &rc)
                         : LXConvertNativeLocale(system.made() ? "de_CH" : "C", LX_GET_SUBSTITUTE, &rc));
      failed = allocator.has_failed();
      allocator.disarm();
      EXPECT_EQ(rc, locale != nullptr ? LX_OK : LX_E_MEMORY);
      EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C");
      if (locale != nullptr) {
        for (uint32_t item : {LX_ITEM_GROUPING, LX_ITEM_MON_GROUPING}) {
          char text[16];
          EXPECT_GT(LXGetLocaleTextInfo(locale.get(), item, text, 16, 0), 1);
          EXPECT_TRUE(text == std::string("3;0") || text == std::string("3;2;0") || text == std::string("3;3;0"))
              << text;
        }
        EXPECT_EQ(LXGetLocaleNumInfo(locale.get(), LX_ITEM_CURRENCY_DIGITS, 0), system.made() ? 2 : 3);
      }
      locale.reset();
      EXPECT_EQ(LXTerm(), LX_OK);
      ASSERT_EQ(allocator.live, 0);
    }
  }
}

}  // namespace
}  // namespace lx::test
