// SPDX-License-Identifier: Apache-2.0
// The objects of the locale data by type and name.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace lx::tool {

// Names of all objects of a type, in the order of the directory.
std::vector<std::string> object_names(uint8_t type);

// An object of that name is listed, or it is the binary sort.
bool object_exists(uint8_t type, const std::string& name);

}  // namespace lx::tool
