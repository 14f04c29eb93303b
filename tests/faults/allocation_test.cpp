// SPDX-License-Identifier: Apache-2.0
// The library's start, the loading of its objects and the reading of the system's values, without memory at every place
// where they take some. Calls on a library that runs are the campaign's.
#include <gtest/gtest.h>

#include <clocale>
#include <functional>

#include "support/counting_allocator.hpp"
#include "support/environment.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"
#include "support/system_locales.hpp"

namespace lx::test {
namespace {

class Allocation : public testing::Test {
 protected:
  Allocation() { write_small_directory(directory_); }

  // The body begins to fail at the n-th allocation, once or for good, and tells whether it came to that. Whatever it
  // has met, nothing is left at the end.
  void at_each(const std::function<bool(CountingAllocator& allocator, int n, bool for_good)>& body) {
    for (bool for_good : {false, true}) {
      bool failed = true;
      for (int n = 0; failed && !HasFailure(); ++n) {
        SCOPED_TRACE("allocation " + std::to_string(n) + (for_good ? " and on" : ""));
        CountingAllocator allocator;
        failed = body(allocator, n, for_good);
        EXPECT_EQ(LXTerm(), LX_OK);
        EXPECT_EQ(allocator.live, 0);
      }
    }
  }

  Variable location_{"LX_LOCALEDIR", nullptr};
  DataDirectory directory_;
  uint32_t rc_ = 99;
};

// The global area, the object manager and the directory of objects are missed; aliases less so.
TEST_F(Allocation, OfTheLibrary) {
  const uint32_t firsts[] = {LX_E_MEMORY, LX_E_MANAGER, LX_E_DEFAULTS, LX_E_DEFAULTS};
  for (const char* directory : {directory_.path(), "/does/not/exist"}) {
    at_each([&](CountingAllocator& allocator, int n, bool for_good) {
      allocator.arm(n, for_good);
      uint32_t status = allocator.init(directory);
      const bool failed = allocator.has_failed();
      allocator.disarm();
      EXPECT_TRUE(n >= 4 || status == firsts[n]) << status;
      EXPECT_EQ(LXGetObjManager() != nullptr, status == LX_OK || status == LX_E_DEFAULTS);
      if (LXGetObjManager() == nullptr) {  // what is there of the library is used by the next attempt
        EXPECT_EQ(LXTerm(), LX_OK);
        status = allocator.init(directory);
      }
      EXPECT_TRUE(status == LX_OK || status == LX_E_DEFAULTS) << status;
      Locale(LXGetLocale("English", 0, nullptr)).reset();
      return failed;
    });
  }
}

// Objects of every type and layout. What could not be loaded still can.
TEST_F(Allocation, OfObjects) {
  for (const ObjectRecord& record : small_directory_records()) {
    at_each([&](CountingAllocator& allocator, int n, bool for_good) {
      EXPECT_EQ(allocator.init(directory_.path(), LX_INIT_NO_DEFAULTS), LX_OK);
      auto load = [&] { return LXGetObjFromID(LXGetObjManager(), record.type, record.id, 0, &rc_) != nullptr; };
      const int before = allocator.live;
      allocator.arm(n, for_good);
      const bool loaded = load();
      const bool failed = allocator.has_failed();
      allocator.disarm();
      EXPECT_EQ(loaded, !failed) << record.name;
      EXPECT_EQ(rc_, failed ? LX_E_MEMORY : LX_OK) << record.name;
      EXPECT_TRUE(loaded || allocator.live == before) << record.name;
      EXPECT_TRUE(load()) << record.name;
      return failed;
    });
  }
}

// The system's values are an extra: without memory for them the locale keeps its territory's, each as a whole.
TEST_F(Allocation, OfSystemValues) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  const SystemLocales system({{"de_CH", "de_CH", "ISO-8859-1"}});
  const char* const name = system.made() ? "de_CH" : "C";
  Variable lx_lang("LX_LANG", nullptr);
  Variable all("LC_ALL", name);
  for (bool user : {false, true}) {
    at_each([&](CountingAllocator& allocator, int n, bool for_good) {
      EXPECT_EQ(allocator.init(directory_.path(), LX_INIT_NO_DEFAULTS), LX_OK);
      allocator.arm(n, for_good);
      Locale locale(user ? LXGetLocale(nullptr, LX_GET_USER | LX_GET_SUBSTITUTE, &rc_)
                         : LXConvertNativeLocale(name, LX_GET_SUBSTITUTE, &rc_));
      const bool failed = allocator.has_failed();
      allocator.disarm();
      EXPECT_EQ(rc_, locale != nullptr ? LX_OK : LX_E_MEMORY);
      EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C");
      if (locale == nullptr) return failed;
      for (uint32_t item : {LX_ITEM_GROUPING, LX_ITEM_MON_GROUPING}) {
        char text[16];
        EXPECT_GT(LXGetLocaleTextInfo(locale.get(), item, text, 16, 0), 1);
        EXPECT_TRUE(text == std::string("3;0") || text == std::string("3;2;0") || text == std::string("3;3;0")) << text;
      }
      EXPECT_EQ(LXGetLocaleNumInfo(locale.get(), LX_ITEM_CURRENCY_DIGITS, 0), system.made() ? 2 : 3);
      return failed;
    });
  }
}

}  // namespace
}  // namespace lx::test
