// SPDX-License-Identifier: Apache-2.0
// C++ source of the objects and tables that are built into the library.
#pragma once

#include <string>

#include "files.hpp"
#include "report.hpp"

namespace lx::compiler {

// builtin_objects.cpp: the objects as exported arrays. Of no use when the report has errors.
std::string make_builtin_source(const fs::path& sources, Report& report);
// unicode_tables.cpp: types, case, width and digits of characters as exported arrays. Likewise.
std::string make_unicode_source(const fs::path& sources, Report& report);

}  // namespace lx::compiler
