// SPDX-License-Identifier: Apache-2.0
// Further names of code pages. The source is shipped as it is.
#pragma once

#include <string>
#include <vector>

#include "source_text.hpp"

namespace lx::compiler {

struct Alias {
  std::string code_page;
  std::string alias;
  Spot spot;
};

// Reports what the library would stop at, or could not tell apart.
std::vector<Alias> read_aliases(const SourceFile& source, Report& report);

// ASCII letters in upper case: names are compared without regard to case.
std::string folded(const std::string& name);

}  // namespace lx::compiler
