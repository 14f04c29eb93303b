// SPDX-License-Identifier: Apache-2.0
// C++ source of the objects that are built into the library.
#pragma once

#include <string>

#include "files.hpp"
#include "report.hpp"

namespace lx::compiler {

struct BuiltinSources {
  std::string images;   // builtin_images.hpp: the bytes, for use at compile time
  std::string objects;  // builtin_objects.cpp: the exported arrays
};

// Of no use when the report has errors.
BuiltinSources make_builtin_sources(const fs::path& sources, Report& report);

}  // namespace lx::compiler
