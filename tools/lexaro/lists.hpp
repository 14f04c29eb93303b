// SPDX-License-Identifier: Apache-2.0
// The lists that "lexaro list" prints, beside the code pages.
#pragma once

#include "tools/lexaro/command.hpp"

namespace lx::tool {

ExitStatus list_aliases(const CommonOptions& common, bool json);
ExitStatus list_languages(const CommonOptions& common, bool json);
ExitStatus list_territories(const CommonOptions& common, bool json);
ExitStatus list_sorts(const CommonOptions& common, bool json);
ExitStatus list_native_names(const CommonOptions& common, bool json);

}  // namespace lx::tool
