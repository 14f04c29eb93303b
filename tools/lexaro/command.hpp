// SPDX-License-Identifier: Apache-2.0
// The subcommands: each adds itself to the command line, in a file of its own.
#pragma once

#include <CLI/CLI.hpp>
#include <functional>
#include <optional>
#include <string>

#include "tools/lexaro/failure.hpp"

namespace lx::tool {

struct CommonOptions {
  std::optional<std::string> locale_directory;
};

struct Command {
  CLI::App* app;  // its part of the command line
  std::function<ExitStatus(const CommonOptions&)> run;
};

Command add_catalog_command(CLI::App& program);
Command add_convert_command(CLI::App& program);
Command add_format_command(CLI::App& program);
Command add_list_command(CLI::App& program);
Command add_locale_command(CLI::App& program);
Command add_parse_command(CLI::App& program);
Command add_records_command(CLI::App& program);
Command add_sort_command(CLI::App& program);

// Prints the code pages with their aliases.
ExitStatus list_code_pages(const CommonOptions& common, bool aliases, bool json);

}  // namespace lx::tool
