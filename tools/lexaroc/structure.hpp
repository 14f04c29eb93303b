// SPDX-License-Identifier: Apache-2.0
// Whether compiled files keep to their formats, so that a reader without bounds tests is safe on them.
#pragma once

#include <string_view>

#include "directory.hpp"

namespace lx::compiler {

// Throw StructureError at the first fault.
void check_object(ObjectType type, uint16_t id, std::string_view bytes);
std::vector<DirectoryEntry> check_control_file(std::string_view bytes);

}  // namespace lx::compiler
