// SPDX-License-Identifier: Apache-2.0
// What the functions by number begin with.
#pragma once

#include <lexaro/nls1.h>

#include "frame/call.hpp"

namespace lx {

inline constexpr uint32_t kNotInitialised = 1;  // of the functions that give a locale; the others say LX_E_MANAGER

// Initialises the library on first use. False: it is not usable.
inline bool ready() {
  if (__atomic_load_n(&qlginflg, __ATOMIC_ACQUIRE) >= 1) [[likely]]
    return true;
  NLS1_PrivateFunction_GetProcessLocale();
  return __atomic_load_n(&qlginflg, __ATOMIC_ACQUIRE) >= 1;
}

inline LXObjEntry* object_by_id(uint8_t type, uint16_t id, bool load, uint32_t& rc) {
  return LXGetObjFromID(LXGetObjManager(), type, id, load ? 0 : 1, &rc);
}

}  // namespace lx
