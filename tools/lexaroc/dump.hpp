// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <string>

#include "files.hpp"

namespace lx::compiler {

// The readable source of a compiled file, which its name tells the type and number of. The name of an object stands in
// the control file beside it. Throws StructureError.
std::string dump_file(const fs::path& path);

}  // namespace lx::compiler
