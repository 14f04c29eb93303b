// SPDX-License-Identifier: Apache-2.0
// Initialisation and termination.
#include <gtest/gtest.h>

#include "support/counting_allocator.hpp"
#include "support/descriptors.hpp"
#include "support/environment.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

uint32_t init(const char* directory, uint32_t options = 0) {
  return LXInit(directory, nullptr, nullptr, nullptr, options);
}

TEST(Library, CountsItsUsers) {
  ASSERT_EQ(init(LEXARO_DATA), LX_OK);
  ASSERT_EQ(init("/does/not/exist"), LX_OK) << "later calls only count";
  ASSERT_EQ(LXSetLocale("English", 0), LX_OK);
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_NE(LXGetObjManager(), nullptr);
  EXPECT_NE(lxglocale, nullptr);
  EXPECT_EQ(LXGetError(nullptr), LX_OK);
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(LXGetObjManager(), nullptr);
  EXPECT_EQ(lxglocale, nullptr);
  EXPECT_EQ(LXGetError(nullptr), LX_E_ARGUMENT);
  EXPECT_EQ(LXTerm(), LX_OK) << "nothing is left to end";
}

TEST(Library, KeepsTheCallbacksOfTheFirstCall) {
  DataDirectory directory;
  write_small_directory(directory);
  CountingAllocator first;
  CountingAllocator second;
  ASSERT_EQ(first.init(directory.path()), LX_OK);
  ASSERT_EQ(second.init(directory.path()), LX_OK);
  Locale locale(LXGetLocale("German", 0, nullptr));
  ASSERT_NE(locale, nullptr);
  locale.reset();
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_GT(first.calls, 10);
  EXPECT_EQ(second.calls, 0);
  EXPECT_EQ(first.live, 0);

  // What is freed after the end goes back to the allocator that made it; the next start brings its own.
  EXPECT_EQ(lxalloc_cbk, &CountingAllocator::allocate);
  ASSERT_EQ(init(directory.path()), LX_OK);
  EXPECT_EQ(lxalloc_cbk, &LXDefAlloc);
  EXPECT_EQ(lxfree_cbk, &LXDefFree);
  EXPECT_EQ(LXTerm(), LX_OK);
}

TEST(Library, AnAbsentCallbackIsTheDefaultOne) {
  CountingAllocator allocator;
  ASSERT_EQ(LXInit(LEXARO_DATA, CountingAllocator::allocate, nullptr, &allocator, 0), LX_OK);
  EXPECT_EQ(lxfree_cbk, &LXDefFree);
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_GT(allocator.live, 0);
}

TEST(Library, StartsCleanlyAgainAndAgain) {
  DataDirectory directory;
  write_small_directory(directory);
  CountingAllocator allocator;
  long before = open_descriptors();
  for (int cycle = 0; cycle < 100; ++cycle) {
    ASSERT_EQ(allocator.init(cycle % 3 == 2 ? "/does/not/exist" : directory.path()),
              cycle % 3 == 2 ? LX_E_DEFAULTS : LX_OK);
    ASSERT_EQ(LXSetLocale("English.us-ascii", 0), LX_OK);
    LXGlobals* area = lxglobals;
    ASSERT_EQ(LXTerm(), LX_OK);
    ASSERT_EQ(lxglobals, area) << "the value stays, though the area is gone";
    ASSERT_EQ(allocator.live, 0);
  }
  EXPECT_EQ(open_descriptors(), before);
}

struct Start {
  const char* what;
  int failing_allocation;
  bool all_after;
  uint32_t status;
};

TEST(Library, ReportsHowItStarted) {
  DataDirectory directory;
  write_small_directory(directory);
  const Start starts[] = {
      {"all is there", -1, false, LX_OK},
      {"no global area", 0, false, LX_E_MEMORY},
      {"no object manager", 1, false, LX_E_MANAGER},
      {"no directory of objects", 3, false, LX_E_DEFAULTS},
  };
  for (const Start& start : starts) {
    SCOPED_TRACE(start.what);
    CountingAllocator allocator;
    allocator.arm(start.failing_allocation, start.all_after);
    EXPECT_EQ(allocator.init(directory.path()), start.status);
    allocator.disarm();
    bool running = start.status == LX_OK || start.status == LX_E_DEFAULTS;
    EXPECT_EQ(LXGetObjManager() != nullptr, running);
    if (!running) {  // what is there of the library is used by the next attempt
      EXPECT_EQ(LXTerm(), LX_OK);
      EXPECT_EQ(allocator.init(directory.path()), LX_OK);
    }
    EXPECT_EQ(LXTerm(), LX_OK);
    EXPECT_EQ(allocator.live, 0);
  }
}

TEST(Library, StandsOnBuiltInObjectsWithoutData) {
  Variable location("LX_LOCALEDIR", nullptr);
  ASSERT_EQ(init("/does/not/exist"), LX_E_DEFAULTS);
  uint32_t rc = 0;
  for (auto [type, name] :
       {std::pair(LX_LANGUAGE, "english"), {LX_TERRITORY, "UnitedStates"}, {LX_CODEPAGE, "us-ascii"}}) {
    LXObjEntry* entry = LXGetObjFromName(LXGetObjManager(), static_cast<uint8_t>(type), name, -1, 0, &rc);
    EXPECT_NE(entry, nullptr) << name;
    EXPECT_EQ(rc, LX_OK) << name;
    EXPECT_EQ(LXGetObjId(entry), 1) << name;
  }
  EXPECT_EQ(LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, "Latin1", -1, 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_NOTFOUND);
  EXPECT_EQ(LXTerm(), LX_OK);
}

TEST(Library, StandsOnNothingWhenToldSo) {
  Variable location("LX_LOCALEDIR", nullptr);
  ASSERT_EQ(init("/does/not/exist", LX_INIT_NO_DEFAULTS), LX_E_DEFAULTS);
  uint32_t rc = 0;
  EXPECT_EQ(LXGetObjFromName(LXGetObjManager(), LX_LANGUAGE, "English", -1, 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_NOTFOUND);
  EXPECT_EQ(LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, 1, 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_NOTFOUND);
  EXPECT_EQ(LXGetLocale("English", 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_LANGUAGE);
  EXPECT_EQ(LXTerm(), LX_OK);
}

TEST(Library, ReportsTheFirstErrorOfItsEnd) {
  CountingAllocator allocator;
  ASSERT_EQ(allocator.init(LEXARO_DATA), LX_OK);
  ASSERT_EQ(LXSetLocale("English", 0), LX_OK);
  allocator.free_fails = true;
  EXPECT_EQ(LXTerm(), 1u);
  EXPECT_EQ(allocator.live, 0);
  EXPECT_EQ(init(LEXARO_DATA), LX_OK);
  EXPECT_EQ(LXTerm(), LX_OK);
}

TEST(Library, LeavesTheStatusInTheLocale) {
  Session session;
  Locale locale = locale_of("Latin1");
  EXPECT_EQ(LXGetError(locale.get()), LX_OK);
  char out[8];
  EXPECT_EQ(LXConvertString(locale.get(), out, 8, locale.get(), "a", 1, 0x1), -1);
  EXPECT_EQ(LXGetError(locale.get()), LX_E_ARGUMENT);
  EXPECT_EQ(LXGetError(nullptr), LX_E_ARGUMENT) << "no default locale";
  ASSERT_EQ(LXSetLocale("English", 0), LX_OK);
  EXPECT_EQ(LXGetError(nullptr), LX_OK);
  EXPECT_EQ(LXConvertString(nullptr, out, 8, nullptr, "a", 1, 0x1), -1);
  EXPECT_EQ(LXGetError(nullptr), LX_E_ARGUMENT);
  EXPECT_EQ(LXConvertString(nullptr, out, 8, nullptr, "a", 1, 0), 1);
  EXPECT_EQ(LXGetError(nullptr), LX_OK);
}

TEST(Library, DefaultCallbacksAreTheSystemAllocator) {
  void* block = LXDefAlloc(nullptr, 100);
  ASSERT_NE(block, nullptr);
  std::memset(block, 1, 100);
  EXPECT_EQ(LXDefFree(nullptr, block), 1);
  EXPECT_EQ(LXDefFree(nullptr, nullptr), 1);
}

}  // namespace
}  // namespace lx::test
