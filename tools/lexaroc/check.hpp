// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "files.hpp"
#include "report.hpp"

namespace lx::compiler {

// Checks a directory of sources, a compiled data directory, or one file of either.
void check_path(const fs::path& path, Report& report);

}  // namespace lx::compiler
