// SPDX-License-Identifier: Apache-2.0
#include "frame/memory.hpp"

#include <cstdlib>

#include "frame/call.hpp"

LXAllocFn lxalloc_cbk = LXDefAlloc;
LXFreeFn lxfree_cbk = LXDefFree;

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "memory", 0};

void* allocation_context = nullptr;

}  // namespace

void set_allocator(LXAllocFn alloc, LXFreeFn free, void* context) {
  lxalloc_cbk = alloc != nullptr ? alloc : LXDefAlloc;
  lxfree_cbk = free != nullptr ? free : LXDefFree;
  allocation_context = context;
}

void* allocate(size_t size) { return lxalloc_cbk(allocation_context, size); }

bool release(const void* block) { return lxfree_cbk(allocation_context, const_cast<void*>(block)) != 0; }

}  // namespace lx

using namespace lx;

extern "C" {

void* LXDefAlloc(void* /*context*/, size_t size) noexcept {
  return exported(trace_unit, __func__, [&] { return std::malloc(size); });
}

int LXDefFree(void* /*context*/, void* block) noexcept {
  return exported(trace_unit, __func__, [&] {
    std::free(block);
    return 1;
  });
}

}  // extern "C"
