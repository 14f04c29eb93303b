// SPDX-License-Identifier: Apache-2.0
// The global area as the other folders see it.
#pragma once

#include "frame/records.hpp"

namespace lx {

// The global area while the library is initialised, else null. lxglobals cannot tell: it outlives the area.
LXGlobals* live_globals();

inline constexpr uint32_t kDefaultAlignment = 4;

// Holds the global lock; without a live area there is nothing to guard.
class GlobalLock {
 public:
  GlobalLock() : globals_(live_globals()) {
    if (globals_ != nullptr && HSV1_GetLock(&globals_->lock) != 0) globals_ = nullptr;
  }
  ~GlobalLock() {
    if (globals_ != nullptr) HSV1_ReleaseLock(&globals_->lock);
  }
  GlobalLock(const GlobalLock&) = delete;
  GlobalLock& operator=(const GlobalLock&) = delete;

 private:
  LXGlobals* globals_;
};

}  // namespace lx
