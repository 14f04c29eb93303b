// SPDX-License-Identifier: Apache-2.0
// What every exported function does first and last.
#pragma once

#include <type_traits>

#include "frame/records.hpp"

namespace lx {

inline bool traces(const TRC1_Unit& unit, uint32_t levels) {
  return (__atomic_load_n(&unit.flags, __ATOMIC_RELAXED) & levels) != 0;
}

// Messages of the module whose unit is called trace_unit; arguments are evaluated only when the level is on.
#define LX_TRACE(level, ...)                           \
  do {                                                 \
    if (lx::traces(trace_unit, (level))) [[unlikely]]  \
      TRC1_Printf(&trace_unit, __LINE__, __VA_ARGS__); \
  } while (false)

template <class Result>
intptr_t trace_value(Result result) {
  if constexpr (std::is_pointer_v<Result>) {
    return reinterpret_cast<intptr_t>(result);
  } else {
    return static_cast<intptr_t>(result);
  }
}

// Runs the body of an exported function between its entry and exit events.
template <class Body>
auto exported(TRC1_Unit& unit, const char* function, Body body, int32_t line = __builtin_LINE()) {
  TRC1_Sync(&unit);
  if (traces(unit, TRC1_LEVEL_FLOW)) [[unlikely]]
    TRC1_Event(&unit, line, TRC1_ENTRY, function, 0);
  if constexpr (std::is_void_v<decltype(body())>) {
    body();
    if (traces(unit, TRC1_LEVEL_FLOW)) [[unlikely]]
      TRC1_Event(&unit, line, TRC1_EXIT, function, 0);
  } else {
    auto result = body();
    if (traces(unit, TRC1_LEVEL_FLOW)) [[unlikely]] {
      TRC1_Event(&unit, line, TRC1_EXIT_RESULT, function, trace_value(result));
    }
    return result;
  }
}

inline LXLocale* locale_or_default(LXLocale* locale) { return locale != nullptr ? locale : lxglocale; }

// What the body of a function with a locale works on: the locale that is meant, and the status to leave in it.
struct LocaleCall {
  LXLocale& locale;
  uint32_t status = LX_OK;

  template <class Result>
  Result fail(uint32_t code, Result failure) {
    status = code;
    return failure;
  }
};

// As exported(), for a function with a locale and an option word. Helpers on the same locale that the body calls may
// overwrite the status in the record, so it is stored once more at the end.
template <class Result, class Body>
Result locale_call(TRC1_Unit& unit, const char* function, LXLocale* given, uint32_t options, uint32_t accepted,
                   Result failure, Body body, int32_t line = __builtin_LINE()) {
  return exported(
      unit, function,
      [&]() -> Result {
        LXLocale* locale = locale_or_default(given);
        if (locale == nullptr) return failure;
        if ((options & ~accepted) != 0) {
          locale->last_error = LX_E_ARGUMENT;
          return failure;
        }
        LocaleCall call{*locale};
        locale->last_error = LX_OK;
        Result result = body(call);
        locale->last_error = call.status;
        return result;
      },
      line);
}

// Out pointers of status codes are optional.
inline void set_status(uint32_t* rc, uint32_t status) {
  if (rc != nullptr) *rc = status;
}

}  // namespace lx
