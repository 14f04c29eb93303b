// SPDX-License-Identifier: Apache-2.0
// Calls whose allocations fail, one after the other.
#pragma once

#include <gtest/gtest.h>

#include <functional>
#include <string>

#include "support/counting_allocator.hpp"
#include "support/object_builder.hpp"

namespace lx::test {

inline const DataDirectory& small_directory() {
  static const DataDirectory directory;
  static const bool written = [] { return write_small_directory(directory), true; }();
  return written ? directory : directory;
}

inline constexpr uint32_t kFailed = 0xFFFF;

// `call` returns its status, or kFailed where there is none; `undo` frees what a successful call has made.
struct Operation {
  const char* name;
  std::function<uint32_t()> call;
  std::function<void()> undo = [] {};
  uint32_t failure = LX_E_MEMORY;
  std::function<void()> after_failure = [] {};
};

// Every allocation of the call fails once, alone or with all behind it; each time in a new library.
inline void fail_each_allocation(
    const Operation& operation, const std::function<void()>& prepare = [] {},
    const std::function<void()>& clean_up = [] {}) {
  for (bool all_after : {false, true}) {
    bool failed = true;
    int failures = 0;
    for (int n = 0; failed; ++n) {
      SCOPED_TRACE(std::string(operation.name) + ", allocation " + std::to_string(n) + (all_after ? " and on" : ""));
      CountingAllocator allocator;
      ASSERT_EQ(allocator.init(small_directory().path(), LX_INIT_NO_DEFAULTS), LX_OK);
      prepare();
      int before = allocator.live;
      allocator.arm(n, all_after);
      uint32_t status = operation.call();
      failed = allocator.has_failed();
      allocator.disarm();
      EXPECT_EQ(status, failed ? operation.failure : LX_OK);
      if (status == LX_OK) {
        operation.undo();
      } else {
        ++failures;
        operation.after_failure();
        if (n == 0) {
          EXPECT_EQ(allocator.live, before);
        }
        // With memory it works.
        EXPECT_EQ(operation.call(), LX_OK);
        operation.undo();
      }
      clean_up();
      EXPECT_EQ(LXTerm(), LX_OK);
      ASSERT_EQ(allocator.live, 0);
      ASSERT_LT(n, 1000);
    }
    EXPECT_GT(failures, 0) << operation.name << " takes no memory";
  }
}

}  // namespace lx::test
