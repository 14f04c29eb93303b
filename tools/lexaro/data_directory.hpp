// SPDX-License-Identifier: Apache-2.0
// Where the locale data are.
#pragma once

#include <optional>
#include <string>
#include <vector>

namespace lx::tool {

// The directory asked for, or else the first that holds a control file: LX_LOCALEDIR, the data of the prefix or build
// tree that this program stands in, the library's default.
std::string find_data_directory(const std::optional<std::string>& wanted);
// The one that is found when none is asked for; empty: there is none.
std::string usual_data_directory();

// Where share/lexaro may be: the prefix or build tree that this program stands in.
std::vector<std::string> program_share_directories();

}  // namespace lx::tool
