// SPDX-License-Identifier: Apache-2.0
// Start and end of the library. This file puts the folders together, so it may look into the higher ones.
#include "frame/library.hpp"

#include <cstring>

#include "frame/call.hpp"
#include "frame/memory.hpp"

LXGlobals* lxglobals = nullptr;
LXLocale* lxglocale = nullptr;

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "library", 0};

// The area exists, and whether its lock and manager do too.
enum class Life : uint8_t { none, area, running };
std::atomic<Life> life{Life::none};

// The callbacks belong to the area that they allocated, so a repeated first initialisation keeps them.
bool create_globals(LXAllocFn alloc, LXFreeFn free, void* context) {
  LX_TRACE(TRC1_LEVEL_DETAIL, "Creating global area");
  LXAllocFn area_alloc = alloc != nullptr ? alloc : LXDefAlloc;
  auto* area = static_cast<LXGlobals*>(area_alloc(context, sizeof(LXGlobals)));
  if (area == nullptr) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Unable to allocate %d bytes for globals", static_cast<int>(sizeof(LXGlobals)));
    return false;
  }
  std::memset(static_cast<void*>(area), 0, sizeof *area);
  set_allocator(alloc, free, context);
  area->allocation_context = context;
  lxglobals = area;
  life.store(Life::area, std::memory_order_release);
  return true;
}

uint32_t count_up() {
  GlobalLock lock;
  auto count = static_cast<uint16_t>(lxglobals->init_count.load(std::memory_order_relaxed) + 1);
  lxglobals->init_count.store(count, std::memory_order_relaxed);
  LX_TRACE(TRC1_LEVEL_DETAIL, "Lexaro init count = %d", count);
  return LX_OK;
}

uint32_t start(const char* directory, uint32_t options) {
  LXGlobals& area = *lxglobals;
  LX_TRACE(TRC1_LEVEL_DETAIL, "Lexaro init count = %d", 0);
  if (HSV1_InitializeLock(&area.lock) != 0) return LX_E_MANAGER;
  HSV1_GetLock(&area.lock);
  std::memcpy(area.directory_separator, "/", 2);
  std::memcpy(area.name_separator, "_", 2);
  area.alignment = kDefaultAlignment;
  area.file_access_mode = 1;
  uint32_t rc = LX_OK;
  LXObjMgr* manager = LXInitObjManager(directory, options, &rc);
  if (manager != nullptr) {
    area.manager = manager;
    area.init_count.store(1, std::memory_order_relaxed);
    life.store(Life::running, std::memory_order_release);
  } else {
    area.file_access_mode = 0;
  }
  HSV1_ReleaseLock(&area.lock);
  if (manager == nullptr) {
    HSV1_DestroyLock(&area.lock);
    return LX_E_MANAGER;
  }
  return rc != LX_OK ? LX_E_DEFAULTS : LX_OK;
}

uint32_t stop() {
  LXGlobals& area = *lxglobals;
  uint32_t result = LX_OK;
  if (LXLocale* locale = std::exchange(lxglocale, nullptr)) result = LXReleaseLocale(locale, 0);
  LXObjMgr* manager = std::exchange(area.manager, nullptr);
  uint32_t manager_result = LXTermObjManager(manager);
  if (result == LX_OK) result = manager_result;
  area.file_access_mode = 0;
  life.store(Life::none, std::memory_order_release);
  HSV1_DestroyLock(&area.lock);
  release(&area);
  return result;
}

}  // namespace

LXGlobals* live_globals() { return life.load(std::memory_order_acquire) == Life::running ? lxglobals : nullptr; }

}  // namespace lx

using namespace lx;

extern "C" {

uint32_t LXInit(const char* directory, LXAllocFn alloc_cbk, LXFreeFn free_cbk, void* alloc_context,
                uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (life.load(std::memory_order_acquire) == Life::none && !create_globals(alloc_cbk, free_cbk, alloc_context)) {
      return LX_E_MEMORY;
    }
    return live_globals() != nullptr ? count_up() : start(directory, options);
  });
}

uint32_t LXTerm(void) noexcept {
  return exported(trace_unit, __func__, []() -> uint32_t {
    if (live_globals() == nullptr) return LX_OK;
    uint16_t count = 0;
    {
      GlobalLock lock;
      count = static_cast<uint16_t>(lxglobals->init_count.load(std::memory_order_relaxed) - 1);
      lxglobals->init_count.store(count, std::memory_order_relaxed);
    }
    return count == 0 ? stop() : LX_OK;
  });
}

uint32_t LXGetError(const LXLocale* locale) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (locale == nullptr) locale = lxglocale;
    return locale != nullptr ? locale->last_error : LX_E_ARGUMENT;
  });
}

const char* LXVersion(void) noexcept { return "1.0.0"; }

LXObjMgr* LXGetObjManager(void) noexcept {
  const LXGlobals* area = live_globals();
  return area != nullptr ? area->manager : nullptr;
}

}  // extern "C"
