// SPDX-License-Identifier: Apache-2.0
// The memory of catalogs, for those who take catalogs apart themselves.
#include "frame/memory.hpp"

#include <algorithm>
#include <bit>

#include "msgcat/catalog.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "catalog_memory", 0};

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXMcGetByteOrder(void) noexcept {
  return exported(trace_unit, __func__, [] { return static_cast<int32_t>(kNativeCatalog); });
}

void* LXMcMalloc(size_t size) noexcept {
  return exported(trace_unit, __func__, [&] { return allocate(size); });
}

int LXMcFree(void* block) noexcept {
  return exported(trace_unit, __func__, [&] { return block == nullptr || release(block) ? 1 : 0; });
}

void* LXMcSetZero(void* block, size_t size) noexcept {
  return exported(trace_unit, __func__, [&] { return size != 0 ? std::memset(block, 0, size) : block; });
}

void* LXMcMemcpy(void* dst, const void* src, size_t size) noexcept {
  return exported(trace_unit, __func__, [&] { return size != 0 ? std::memcpy(dst, src, size) : dst; });
}

void* LXMcRealloc(void* block, size_t new_size, size_t old_size) noexcept {
  return exported(trace_unit, __func__, [&]() -> void* {
    void* copy = allocate(new_size);
    size_t size = std::min(old_size, new_size);
    if (copy == nullptr) {
      if (block != nullptr) release(block);
    } else if (block != nullptr && size != 0) {
      std::memcpy(copy, block, size);
    }
    return copy;
  });
}

}  // extern "C"
