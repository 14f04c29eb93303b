// SPDX-License-Identifier: Apache-2.0
// From the sources to the files of a data directory.
#pragma once

#include "files.hpp"
#include "pack_code_page.hpp"
#include "source_tree.hpp"

namespace lx::compiler {

struct CompiledFile {
  std::string name;
  std::string bytes;
};

// The files in the order in which they should be written: the control file, which announces the others, comes last.
// What does not fit goes to the report.
std::vector<CompiledFile> compile(const SourceTree& tree, Layout layout, Report& report);

}  // namespace lx::compiler
