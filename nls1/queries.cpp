// SPDX-License-Identifier: Apache-2.0
// Ids and names of objects. Nothing is loaded for them.
#include <cstring>

#include "nls1/state.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "nls1_queries", 0};

uint32_t id_by_name(const char* function, uint8_t type, const char* name, uint32_t* rc) {
  return exported(trace_unit, function, [&]() -> uint32_t {
    if (!ready()) {
      set_status(rc, LX_E_MANAGER);
      return 0;
    }
    LXObjMgr* manager = LXGetObjManager();
    const char* page = type == LX_CODEPAGE && name != nullptr ? LXGetCodepageFromAlias(manager, name) : nullptr;
    return LXGetObjId(LXGetObjFromName(manager, type, page != nullptr ? page : name, -1, 1, rc));
  });
}

uint32_t name_by_id(const char* function, uint8_t type, uint16_t id, char* buffer, int32_t size) {
  return exported(trace_unit, function, [&]() -> uint32_t {
    if (!ready()) return LX_E_MANAGER;
    uint32_t rc = LX_OK;
    const LXObjEntry* entry = object_by_id(type, id, false, rc);
    if (entry == nullptr) return rc;
    const char* name = LXGetObjName(entry);
    auto length = static_cast<int32_t>(std::strlen(name));
    if (buffer == nullptr || length >= size) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Object name length (%d) for %s exceeds output buffer length (%d)", length, name,
               size);
      return LX_E_BUFFER;
    }
    std::memcpy(buffer, name, static_cast<size_t>(length) + 1);
    return LX_OK;
  });
}

// Of both ids in one value, or of a single one.
bool combined(int32_t language_territory) { return static_cast<uint32_t>(language_territory) > 0xFFFF; }

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

uint32_t NLS1_GetCodepageId(const char* name, uint32_t* rc) noexcept {
  return id_by_name(__func__, LX_CODEPAGE, name, rc);
}

uint32_t NLS1_GetLanguageId(const char* name, uint32_t* rc) noexcept {
  return id_by_name(__func__, LX_LANGUAGE, name, rc);
}

uint32_t NLS1_GetTerritoryId(const char* name, uint32_t* rc) noexcept {
  return id_by_name(__func__, LX_TERRITORY, name, rc);
}

uint32_t NLS1_GetSortId(const char* name, uint32_t* rc) noexcept { return id_by_name(__func__, LX_SORT, name, rc); }

uint32_t NLS1_GetObjectName(uint16_t id, char* buffer, int32_t size, uint8_t type) noexcept {
  return name_by_id(__func__, type, id, buffer, size);
}

uint32_t NLS1_GetLanguageName(int32_t language_territory, char* buffer, int32_t size) noexcept {
  return name_by_id(__func__, LX_LANGUAGE, static_cast<uint16_t>(language_territory), buffer, size);
}

uint32_t NLS1_GetTerritoryName(int32_t language_territory, char* buffer, int32_t size) noexcept {
  auto both = static_cast<uint32_t>(language_territory);
  uint32_t id = combined(language_territory) ? both >> 16 : both;
  return name_by_id(__func__, LX_TERRITORY, static_cast<uint16_t>(id), buffer, size);
}

uint32_t NLS1_GetCodepageName(uint16_t id, char* buffer, int32_t size) noexcept {
  return name_by_id(__func__, LX_CODEPAGE, id, buffer, size);
}

uint32_t NLS1_GetSortName(uint16_t id, char* buffer, int32_t size) noexcept {
  return name_by_id(__func__, LX_SORT, id, buffer, size);
}

}  // extern "C"
