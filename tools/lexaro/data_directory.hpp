// SPDX-License-Identifier: Apache-2.0
// Where the locale data are.
#pragma once

#include <optional>
#include <string>

namespace lx::tool {

// The directory asked for, or else the first that holds a control file: LX_LOCALEDIR, the data of the prefix or build
// tree that this program stands in, the library's default.
std::string find_data_directory(const std::optional<std::string>& wanted);

}  // namespace lx::tool
