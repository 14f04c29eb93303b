// SPDX-License-Identifier: Apache-2.0
// The readable sources of a data directory.
#pragma once

#include <optional>
#include <set>
#include <string>
#include <vector>

#include "alias_list.hpp"
#include "code_page.hpp"
#include "directory.hpp"
#include "files.hpp"
#include "language.hpp"
#include "sort_source.hpp"
#include "territory.hpp"
#include "unicode_tables.hpp"

namespace lx::compiler {

inline constexpr const char* kAliasFile = "alias.txt";

// The directory of each object type below the sources.
const char* source_folder(ObjectType type);

struct SourceTree {
  fs::path directory;
  std::optional<UnicodeTables> unicode;
  std::vector<Language> languages;
  std::vector<Territory> territories;
  std::vector<CodePage> code_pages;
  std::vector<Sort> sorts;
  std::string alias_file;
  std::string alias_text;
  std::vector<Alias> aliases;

  // All objects in the order of the control file.
  std::vector<DirectoryEntry> entries() const;
  // Where the sources of a type stand.
  std::string folder(ObjectType type) const { return (directory / source_folder(type)).string(); }
};

// Reads everything; what is wrong goes to the report, and the object is left out. `only` limits the code pages by id
// when it is not empty.
SourceTree read_source_tree(const fs::path& directory, const std::set<uint16_t>& only, Report& report);

// Reads one sort, and what it refers to from the directory of its sources.
std::optional<Sort> read_sort_file(const SourceFile& source, const fs::path& directory, Report& report);

}  // namespace lx::compiler
