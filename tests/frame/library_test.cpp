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

uint32_t init(const char* directory) { return LXInit(directory, nullptr, nullptr, nullptr, 0); }

class Library : public testing::Test {
 protected:
  Library() { write_small_directory(directory_); }
  Variable location_{"LX_LOCALEDIR", nullptr};
  DataDirectory directory_;
  CountingAllocator allocator_;
};

TEST_F(Library, CountsItsUsers) {
  ASSERT_EQ(init(directory_.path()), LX_OK);
  ASSERT_EQ(init("/does/not/exist"), LX_OK) << "later calls only count";
  ASSERT_EQ(LXSetLocale("English", 0), LX_OK);
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_NE(LXGetObjManager(), nullptr);
  EXPECT_EQ(LXGetError(nullptr), LX_OK);
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(LXGetObjManager(), nullptr);
  EXPECT_EQ(lxglocale, nullptr);
  EXPECT_EQ(LXGetError(nullptr), LX_E_ARGUMENT);
  EXPECT_EQ(LXTerm(), LX_OK) << "nothing is left to end";
}

TEST_F(Library, KeepsTheCallbacksOfTheFirstCall) {
  CountingAllocator second;
  ASSERT_EQ(allocator_.init(directory_.path()), LX_OK);
  ASSERT_EQ(second.init(directory_.path()), LX_OK);
  Locale(LXGetLocale("German", 0, nullptr)).reset();
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_GT(allocator_.calls, 10);
  EXPECT_EQ(second.calls, 0);
  EXPECT_EQ(allocator_.live, 0);

  // What is freed after the end goes back to the allocator that made it; the next start brings its own.
  EXPECT_EQ(lxalloc_cbk, &CountingAllocator::allocate);
  ASSERT_EQ(LXInit(directory_.path(), CountingAllocator::allocate, nullptr, &second, 0), LX_OK);
  EXPECT_EQ(lxfree_cbk, &LXDefFree) << "an absent one is the default";
  EXPECT_EQ(LXTerm(), LX_OK);
  ASSERT_EQ(init(directory_.path()), LX_OK);
  EXPECT_EQ(lxalloc_cbk, &LXDefAlloc);
  EXPECT_EQ(LXTerm(), LX_OK);
}

TEST_F(Library, StartsCleanlyAgainAndAgain) {
  const long before = open_descriptors();
  for (int cycle = 0; cycle < 100; ++cycle) {
    const bool missing = cycle % 3 == 2;
    ASSERT_EQ(allocator_.init(missing ? "/does/not/exist" : directory_.path()), missing ? LX_E_DEFAULTS : LX_OK);
    ASSERT_EQ(LXSetLocale("English.us-ascii", 0), LX_OK);
    LXGlobals* area = lxglobals;
    allocator_.free_fails = cycle % 5 == 4;  // the first error of the end is told, and the end comes
    ASSERT_EQ(LXTerm(), allocator_.free_fails ? 1u : LX_OK);
    allocator_.free_fails = false;
    ASSERT_EQ(lxglobals, area) << "the value stays, though the area is gone";
    ASSERT_EQ(allocator_.live, 0);
  }
  EXPECT_EQ(open_descriptors(), before);
}

}  // namespace
}  // namespace lx::test
