// SPDX-License-Identifier: Apache-2.0
// lexaroc catalog, and what dump and check do with catalogs.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "files.hpp"
#include "report.hpp"

namespace lx::compiler {

struct CatalogRun {
  fs::path source;
  fs::path output;
  fs::path header;  // empty: none
  std::vector<fs::path> merged;
  std::string locale;
  std::string byte_order;  // "little", "big", or empty: this machine's
  std::string encoding = "UTF-8";
  std::optional<std::string> locale_directory;
};

inline constexpr const char* kCatalogHelp =
    "The source has the format that POSIX gives to gencat. Names for --header: a single word behind the number, as in "
    "\"$set 1 Errors\", names the set, and a comment line \"$ @NotFound\" names the message that follows it. Escapes "
    "\\ddd are bytes of the catalog's code page.";

void compile_catalog(const CatalogRun& run, Report& report);
// Throws StructureError.
std::string dump_catalog(const fs::path& path, const std::string& bytes,
                         const std::optional<std::string>& locale_directory);

}  // namespace lx::compiler
