// SPDX-License-Identifier: Apache-2.0
// The root collation, which the rules of every language change.
#pragma once

#include <optional>

#include "collation.hpp"

namespace lx::compiler {

inline constexpr const char* kCollationRootFile = "root.txt";

// Nothing when the report has errors for this source.
std::optional<Collation> read_collation_root(const SourceFile& source, Report& report);

}  // namespace lx::compiler
