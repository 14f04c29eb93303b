// SPDX-License-Identifier: Apache-2.0
#include "check.hpp"

#include <algorithm>

#include "catalog_file.hpp"
#include "code_page_source.hpp"
#include "collation_root.hpp"
#include "lint.hpp"
#include "structure.hpp"

namespace lx::compiler {

namespace {

constexpr const char* kCompiledExtension = ".nls";

void check_builtin(const fs::path& directory, Report& report) {
  fs::path language = directory / "builtin" / "language.txt";
  fs::path territory = directory / "builtin" / "territory.txt";
  read_language(SourceFile(language.string(), read_file(language), report), report);
  if (auto object = read_territory(SourceFile(territory.string(), read_file(territory), report), report)) {
    lint_territory(*object, report);
  }
}

void check_sources(const fs::path& directory, Report& report) {
  SourceTree tree = read_source_tree(directory, {}, report);
  for (const Territory& territory : tree.territories) lint_territory(territory, report);
  for (const CodePage& page : tree.code_pages) {
    lint_code_page(page, report);
    lint_round_trip(page, *tree.unicode, report);
  }
  for (const Sort& sort : tree.sorts) lint_sort(sort, report);
  lint_tree(tree, report);
  if (fs::exists(directory / "builtin")) check_builtin(directory, report);
}

void check_source(const fs::path& path, Report& report) {
  std::string name = path.filename().string();
  constexpr const char* kUnicodeFiles[] = {"ctype.txt", "case.txt", "width.txt", "digits.txt"};
  if (std::find(std::begin(kUnicodeFiles), std::end(kUnicodeFiles), name) != std::end(kUnicodeFiles)) {
    UnicodeTables::read(path.parent_path(), report);
    return;
  }
  SourceFile source(path.string(), read_file(path), report);
  auto object = parse_object_stem(path.stem().string());
  if (name == kAliasFile) {
    read_aliases(source, report);
  } else if (name == "language.txt" || (object && object->type == ObjectType::language)) {
    read_language(source, report);
  } else if (name == "territory.txt" || (object && object->type == ObjectType::territory)) {
    if (auto territory = read_territory(source, report)) lint_territory(*territory, report);
  } else if (object && object->type == ObjectType::code_page) {
    if (auto page = read_code_page(source, report)) lint_code_page(*page, report);
  } else if (name == kCollationRootFile) {
    read_collation_root(source, report);
  } else if (object && object->type == ObjectType::sort) {
    if (auto sort = read_sort_file(source, path.parent_path() / "..", report)) lint_sort(*sort, report);
  } else {
    report.error(path.string(), Spot{}, "the file name tells no kind of source");
  }
}

void check_compiled(const fs::path& path, Report& report) {
  try {
    std::string bytes = read_file(path);
    if (path.extension() == kCatalogExtension) {
      unpack_catalog(bytes);
    } else if (path.filename() == kControlFile) {
      check_control_file(bytes);
    } else if (auto object = parse_object_stem(path.stem().string())) {
      check_object(object->type, object->id, bytes);
    } else {
      report.error(path.string(), "the file name tells no object type and number");
    }
  } catch (const StructureError& error) {
    report.error(path.string(), error.text);
  }
}

void check_data_directory(const fs::path& directory, Report& report) {
  fs::path control = directory / kControlFile;
  std::vector<DirectoryEntry> entries;
  try {
    entries = check_control_file(read_file(control));
  } catch (const StructureError& error) {
    report.error(control.string(), error.text);
  }
  for (const DirectoryEntry& entry : entries) {
    fs::path path = directory / (object_stem(entry.type, entry.id) + kCompiledExtension);
    if (fs::exists(path)) {
      check_compiled(path, report);
    } else {
      report.error(path.string(), "listed in the control file but not there");
    }
  }
  fs::path aliases = directory / kAliasFile;
  if (fs::exists(aliases)) read_aliases(SourceFile(aliases.string(), read_file(aliases), report), report);
}

}  // namespace

void check_path(const fs::path& path, Report& report) {
  if (fs::is_directory(path)) {
    if (fs::exists(path / kControlFile)) {
      check_data_directory(path, report);
    } else {
      check_sources(path, report);
    }
  } else if (path.extension() == kCompiledExtension || path.extension() == kCatalogExtension) {
    check_compiled(path, report);
  } else {
    check_source(path, report);
  }
}

}  // namespace lx::compiler
