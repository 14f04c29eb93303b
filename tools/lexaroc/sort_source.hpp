// SPDX-License-Identifier: Apache-2.0
// The readable forms of a sort object: rules, the order of a code page, or the weights themselves.
#pragma once

#include <functional>
#include <optional>

#include "code_page.hpp"
#include "collation.hpp"

namespace lx::compiler {

struct Sort {
  uint16_t id = 0;
  std::string name;
  SortObject weights;

  std::string file;  // where it was read, and its line with the name, for messages
  Spot spot;
};

// What the sources refer to. Null: not there, or not sound.
struct SortContext {
  std::function<const Collation*()> root;
  std::function<const CodePage*(uint16_t)> code_page;
};

// Nothing when the report has errors for this source.
std::optional<Sort> read_sort(const SourceFile& source, const SortContext& context, Report& report);

// As weights: rules cannot be told from them.
std::string write_sort(const Sort& sort);

}  // namespace lx::compiler
