// SPDX-License-Identifier: Apache-2.0
// The objects of the directory, one call each.
#include "frame/call.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "enumerate", 0};

template <class Visit>
int32_t visit_entries(const char* function, bool wanted, Visit visit) {
  return exported(trace_unit, function, [&]() -> int32_t {
    const LXObjMgr* manager = LXGetObjManager();
    if (manager == nullptr || !wanted) return 0;
    for (uint16_t i = 0; i < manager->first[kObjectTypes]; ++i) {
      if (visit(manager->entries[i]) == 0) break;
    }
    return 0;
  });
}

// Names are ASCII, so their units are their bytes.
template <class Unit>
struct WidenedName {
  Unit text[sizeof LXObjEntry::name];

  explicit WidenedName(const LXObjEntry& entry) {
    for (size_t i = 0; i < sizeof entry.name; ++i) text[i] = static_cast<uint8_t>(entry.name[i]);
  }
};

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXEnumLocales(LXEnumFn callback, void* context, uint32_t /*reserved*/) noexcept {
  return visit_entries(__func__, callback != nullptr,
                       [&](const LXObjEntry& entry) { return callback(context, entry.type, entry.name); });
}

int32_t LXEnumLocalesW(LXEnumWFn callback, void* context, uint32_t /*reserved*/) noexcept {
  return visit_entries(__func__, callback != nullptr, [&](const LXObjEntry& entry) {
    return callback(context, entry.type, WidenedName<LXWChar>(entry).text);
  });
}

int32_t LXEnumLocalesU(LXEnumUFn callback, void* context, uint32_t /*reserved*/) noexcept {
  return visit_entries(__func__, callback != nullptr, [&](const LXObjEntry& entry) {
    return callback(context, entry.type, WidenedName<LXUChar>(entry).text);
  });
}

}  // extern "C"
