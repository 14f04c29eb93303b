// SPDX-License-Identifier: Apache-2.0
// Initialisation and termination.
#include <gtest/gtest.h>

#include "support/counting_allocator.hpp"
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

TEST_F(Library, TellsTheFirstErrorOfItsEnd) {
  ASSERT_EQ(allocator_.init(directory_.path()), LX_OK);
  ASSERT_EQ(LXSetLocale("English", 0), LX_OK);
  LXGlobals* area = lxglobals;
  allocator_.free_fails = true;
  EXPECT_EQ(LXTerm(), 1u);
  EXPECT_EQ(allocator_.live, 0) << "the end comes all the same";
  EXPECT_EQ(lxglobals, area) << "the value stays, though the area is gone";
}

}  // namespace
}  // namespace lx::test
