// SPDX-License-Identifier: Apache-2.0
// JSON for programs: always UTF-8, its keys in the order they were made.
#pragma once

#include <nlohmann/json.hpp>

#include "tools/lexaro/output_file.hpp"

namespace lx::tool {

using Json = nlohmann::ordered_json;

inline void print_json(const Json& json) { print(json.dump(2, ' ', false, Json::error_handler_t::replace) + "\n"); }

}  // namespace lx::tool
