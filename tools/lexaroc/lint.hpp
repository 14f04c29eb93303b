// SPDX-License-Identifier: Apache-2.0
// Faults of sources that compile but would serve users badly.
#pragma once

#include "source_tree.hpp"

namespace lx::compiler {

void lint_code_page(const CodePage& page, Report& report);
// The compiled page must read back as its source says.
void lint_round_trip(const CodePage& page, const UnicodeTables& unicode, Report& report);

void lint_sort(const Sort& sort, Report& report);

void lint_territory(const Territory& territory, Report& report);

// What concerns several objects: references, names, texts against code pages, aliases.
void lint_tree(const SourceTree& tree, Report& report);

}  // namespace lx::compiler
