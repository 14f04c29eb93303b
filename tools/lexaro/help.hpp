// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <CLI/CLI.hpp>

namespace lx::tool {

// Puts the help of a command and those below it into the user's language, when it is about to be shown.
void translate_help(CLI::App& app);

}  // namespace lx::tool
