// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "frame/records.hpp"

namespace lx {

// Finds the control file (the given directory, then LX_LOCALEDIR, then the default one) and reads its directory of
// objects into the manager. Returns the status; the manager is complete or has no entries.
uint32_t read_control_file(LXObjMgr& manager, const char* directory);

}  // namespace lx
