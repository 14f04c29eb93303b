// SPDX-License-Identifier: Apache-2.0
// Allocation callbacks that know what is in use and can be told to fail.
#pragma once

#include <lexaro/lexaro.h>

#include <cstdlib>

namespace lx::test {

struct CountingAllocator {
  int calls = 0;
  int live = 0;
  int fail_at = -1;      // the number of the call (from 0) that finds no memory; -1: none
  bool fail_on = false;  // so do all calls after it
  bool free_fails = false;

  // Counts from here on.
  void arm(int at, bool on) {
    calls = 0;
    fail_at = at;
    fail_on = on;
  }
  void disarm() { fail_at = -1; }
  bool has_failed() const { return fail_at >= 0 && calls > fail_at; }

  static void* allocate(void* context, size_t size) {
    auto& self = *static_cast<CountingAllocator*>(context);
    int call = self.calls++;
    if (self.fail_at >= 0 && (call == self.fail_at || (self.fail_on && call > self.fail_at))) return nullptr;
    void* block = std::malloc(size);
    if (block != nullptr) ++self.live;
    return block;
  }
  static int release(void* context, void* block) {
    auto& self = *static_cast<CountingAllocator*>(context);
    --self.live;
    std::free(block);
    return self.free_fails ? 0 : 1;
  }
  uint32_t init(const char* directory, uint32_t options = 0) {
    return LXInit(directory, allocate, release, this, options);
  }
};

}  // namespace lx::test
