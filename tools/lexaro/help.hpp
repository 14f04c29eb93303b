// SPDX-License-Identifier: Apache-2.0
// What the command line parser has to say, in the user's language.
#pragma once

#include <CLI/CLI.hpp>
#include <string>

#include "tools/messages/message.hpp"

namespace lx::tool {

// The help of a command, whole in one language, in the encoding of the terminal.
std::string help_text(const CLI::App& command, const std::string& name);
// ... of the command that was given on the command line, or of the program.
std::string requested_help(const CLI::App& program);

// The parser's own text in English, where there is no other.
Message parse_error_text(const CLI::App& program, const CLI::ParseError& error);

}  // namespace lx::tool
