// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <filesystem>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "tools/lexaroc/report.hpp"

namespace lx::compiler {

namespace fs = std::filesystem;

// The system refused to read or write something: neither the sources nor the command line are to blame.
class IoError : public Fault {
  using Fault::Fault;
};

std::string read_file(const fs::path& path);

// Readers of `path` see the old content or the new, never a part: the bytes go to a temporary that then takes its name.
void write_file(const fs::path& path, std::string_view bytes);

void make_directory(const fs::path& path);

// The regular files of a directory whose names have this extension, in the order of their names; none when there is no
// such directory.
std::vector<fs::path> list_files(const fs::path& directory, std::string_view extension);

}  // namespace lx::compiler
