// SPDX-License-Identifier: Apache-2.0
// What the command line parser has to say, in the user's language.
#pragma once

#include <CLI/CLI.hpp>
#include <string>

#include "tools/messages/message.hpp"

namespace lx::tool {

// The help of a command, whole in one language, in the encoding of the terminal.
std::string help_text(const CLI::App& command, const std::string& name);
// What --help or --version asked for, which the parser reports as errors too.
std::string requested_text(const CLI::App& program, const CLI::ParseError& error);

// The parser's own text in English, where there is no other.
Message parse_error_text(const CLI::App& program, const CLI::ParseError& error);

}  // namespace lx::tool
