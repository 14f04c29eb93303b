// SPDX-License-Identifier: Apache-2.0
// The readable form of a code page.
#pragma once

#include <optional>
#include <string>

#include "code_page.hpp"
#include "source_text.hpp"

namespace lx::compiler {

// Nothing when the report has errors for this source.
std::optional<CodePage> read_code_page(const SourceFile& source, Report& report);

// Canonical text: reading it gives the page again.
std::string write_code_page(const CodePage& page);

}  // namespace lx::compiler
