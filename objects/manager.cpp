// SPDX-License-Identifier: Apache-2.0
// The object manager: creation, lookup, end.
#include <cstring>

#include "frame/call.hpp"
#include "frame/environment.hpp"
#include "frame/memory.hpp"
#include "objects/control_file.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "manager", 0};

constexpr uint32_t kNoDefaults = LX_INIT_NO_DEFAULTS;
constexpr char kBinarySort[] = "BINARY";

// Lookups with a name length may count the terminator.
bool length_matches(size_t wanted, size_t length) { return wanted == length || wanted == length + 1; }

bool is_binary_sort(uint8_t type, const char* name, size_t length) {
  constexpr size_t kLength = sizeof kBinarySort - 1;
  return type == LX_SORT && length_matches(length, kLength) && compare_ignoring_case(name, kBinarySort, length) == 0;
}

// An entry as a lookup delivers it.
LXObjEntry* deliver(LXObjMgr& manager, LXObjEntry& entry, bool no_load, uint32_t& rc) {
  return no_load || entry.loaded() ? &entry : LXLoadObj(&manager, &entry, &rc);
}

LXObjEntry* find_by_name(LXObjMgr& manager, uint8_t type, const char* name, size_t length) {
  for (uint16_t i = manager.first[type]; i < manager.first[type + 1]; ++i) {
    LXObjEntry& entry = manager.entries[i];
    if (length_matches(length, std::strlen(entry.name)) && compare_ignoring_case(name, entry.name, length) == 0)
      return &entry;
  }
  return nullptr;
}

LXObjEntry* find_by_id(LXObjMgr& manager, uint8_t type, uint16_t id) {
  uint32_t low = manager.first[type];
  uint32_t end = manager.first[type + 1];
  uint32_t high = end;
  while (low < high) {
    uint32_t middle = (low + high) / 2;
    if (manager.entries[middle].id < id) {
      low = middle + 1;
    } else {
      high = middle;
    }
  }
  return low < end && manager.entries[low].id == id ? &manager.entries[low] : nullptr;
}

size_t name_size(const char* name, int32_t length) {
  return length < 0 ? std::strlen(name) : static_cast<size_t>(length);
}

// The result is that of the last object, `before` when there is none.
uint32_t unload_all(LXObjMgr& manager, LXObjEntry* entries, uint16_t count, uint32_t before) {
  uint32_t result = before;
  for (LXObjEntry* entry = entries; entry < entries + count; ++entry) {
    if (entry->loaded() && (entry->flags & kEntryBuiltIn) == 0) result = LXUnloadObj(&manager, entry);
  }
  return result;
}

}  // namespace

bool drop_pairs(LXObjMgr& manager) {
  bool all = true;
  for (std::atomic<const void*>& place : manager.pairs) {
    const void* pair = place.exchange(nullptr, std::memory_order_acq_rel);
    if (pair != nullptr && !release(pair)) all = false;
  }
  return all;
}

}  // namespace lx

using namespace lx;

extern "C" {

LXObjMgr* LXInitObjManager(const char* directory, uint32_t options, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXObjMgr* {
    if (directory != nullptr) {
      LX_TRACE(TRC1_LEVEL_PARAMETER, "directory = %s.", directory);
    } else {
      LX_TRACE(TRC1_LEVEL_PARAMETER, "No directory specified");
    }
    LX_TRACE(TRC1_LEVEL_PARAMETER, "options = %d", static_cast<int>(options));
    set_status(rc, LX_OK);
    auto manager = Owned<LXObjMgr>::zeroed();
    if (!manager) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Unable to allocate %d bytes for object manager", static_cast<int>(sizeof(LXObjMgr)));
      set_status(rc, LX_E_MEMORY);
      return nullptr;
    }
    manager->no_defaults = options == kNoDefaults ? 1 : 0;
    uint32_t status = read_control_file(*manager, directory);
    set_status(rc, status);
    if (status == LX_OK) {
      if (LXBuildAliasList(manager.get()) != 0) {
        LX_TRACE(TRC1_LEVEL_DETAIL, "Alias list build failed. No aliases supported");
      }
    } else if (options != kNoDefaults && status != LX_E_MEMORY && LXLoadDefaults(manager.get()) == 0) {
      set_status(rc, LX_E_MEMORY);
      return nullptr;
    }
    return manager.give_up();
  });
}

uint32_t LXTermObjManager(LXObjMgr* manager) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (manager == nullptr) return LX_OK;
    uint32_t result = LXDestroyAliasList(manager);
    result = unload_all(*manager, manager->replaced, manager->replaced_count, result);
    result = unload_all(*manager, manager->entries, manager->first[kObjectTypes], result);
    if (!drop_pairs(*manager)) result = 1;
    for (LXObjEntry* entries : {manager->replaced, manager->entries}) {
      if (entries != nullptr && !release(entries)) result = 1;
    }
    if (!release(manager)) result = 1;
    return result;
  });
}

LXObjEntry* LXGetObjFromName(LXObjMgr* manager, uint8_t type, const char* name, int32_t name_length, int32_t no_load,
                             uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXObjEntry* {
    uint32_t status = LX_E_NOTFOUND;
    LXObjEntry* found = nullptr;
    if (name != nullptr) {
      size_t length = name_size(name, name_length);
      LX_TRACE(TRC1_LEVEL_PARAMETER, "Searching for type %d, name %.*s", type, static_cast<int>(length), name);
      if (is_binary_sort(type, name, length)) {
        status = LX_OK;
      } else if (manager != nullptr && type < kObjectTypes && length != 0) {
        found = find_by_name(*manager, type, name, length);
      }
    }
    if (found != nullptr) {
      status = LX_OK;
      found = deliver(*manager, *found, no_load == 1, status);
    }
    set_status(rc, status);
    return found;
  });
}

LXObjEntry* LXGetObjFromNameW(LXObjMgr* manager, uint8_t type, const LXWChar* name, int32_t name_length,
                              int32_t no_load, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXObjEntry* {
    size_t length = 0;
    if (name != nullptr) {
      while (name_length < 0 ? name[length] != 0 : length < static_cast<size_t>(name_length)) ++length;
    }
    if (length == 0 || length > INT32_MAX) {
      set_status(rc, LX_E_NOTFOUND);
      return nullptr;
    }
    auto narrow = Owned<char>::array(length);
    if (!narrow) {
      set_status(rc, LX_E_MEMORY);
      return nullptr;
    }
    for (size_t i = 0; i < length; ++i) narrow[i] = static_cast<char>(name[i] & 0xFF);
    return LXGetObjFromName(manager, type, narrow.get(), static_cast<int32_t>(length), no_load, rc);
  });
}

LXObjEntry* LXGetObjFromID(LXObjMgr* manager, uint8_t type, uint16_t id, int32_t no_load, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXObjEntry* {
    LX_TRACE(TRC1_LEVEL_PARAMETER, "Searching for type %d, id %d", type, id);
    set_status(rc, LX_OK);
    if (type == LX_SORT && id == 0) return nullptr;
    LXObjEntry* found = manager != nullptr && type < kObjectTypes ? find_by_id(*manager, type, id) : nullptr;
    uint32_t status = found != nullptr ? LX_OK : LX_E_NOTFOUND;
    if (found != nullptr) found = deliver(*manager, *found, no_load == 1, status);
    set_status(rc, status);
    return found;
  });
}

uint16_t LXGetObjId(const LXObjEntry* entry) noexcept { return entry != nullptr ? entry->id : uint16_t{0}; }

uint8_t LXGetObjType(const LXObjEntry* entry) noexcept { return entry != nullptr ? entry->type : uint8_t{0xFF}; }

const char* LXGetObjName(const LXObjEntry* entry) noexcept { return entry != nullptr ? entry->name : nullptr; }

}  // extern "C"
