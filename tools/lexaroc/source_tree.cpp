// SPDX-License-Identifier: Apache-2.0
#include "source_tree.hpp"

#include "code_page_source.hpp"

namespace lx::compiler {

namespace {

constexpr const char* kFolders[kObjectTypes] = {"language", "territory", "codepage", "collation"};

// Reads every source of one type with `read`, and checks that file names and ids agree.
template <class T, class Read>
std::vector<T> read_objects(const fs::path& directory, ObjectType type, const std::set<uint16_t>& only, Report& report,
                            Read read) {
  std::vector<T> objects;
  std::set<std::string> names;
  for (const fs::path& path : list_files(directory / source_folder(type), ".txt")) {
    auto expected = parse_object_stem(path.stem().string());
    if (!expected || expected->type != type) {
      report.error(path.string(), {}, "the file name is not of the form " + object_stem(type, 0) + ".txt");
      continue;
    }
    if (!only.empty() && only.count(expected->id) == 0) continue;
    SourceFile source(path.string(), read_file(path), report);
    std::optional<T> object = read(source, report);
    if (!object) continue;
    if (object->id != expected->id) report.error(path.string(), {}, "the id is not that of the file name");
    if (!names.insert(folded(object->name)).second) report.error(path.string(), {}, "another object has this name");
    objects.push_back(std::move(*object));
  }
  for (uint16_t id : only) {
    fs::path path = directory / source_folder(type) / (object_stem(type, id) + ".txt");
    if (!fs::exists(path)) report.error(path.string(), {}, "there is no such object");
  }
  return objects;
}

}  // namespace

const char* source_folder(ObjectType type) { return kFolders[static_cast<unsigned>(type)]; }

std::vector<DirectoryEntry> SourceTree::entries() const {
  // File names are read in order and hold the ids, so each list is sorted.
  std::vector<DirectoryEntry> list;
  for (const Language& object : languages) list.push_back({ObjectType::language, object.id, object.name});
  for (const Territory& object : territories) list.push_back({ObjectType::territory, object.id, object.name});
  for (const CodePage& object : code_pages) list.push_back({ObjectType::code_page, object.id, object.name});
  return list;
}

SourceTree read_source_tree(const fs::path& directory, const std::set<uint16_t>& only, Report& report) {
  SourceTree tree;
  tree.directory = directory;
  tree.unicode = UnicodeTables::read(directory / "unicode", report);
  tree.languages = read_objects<Language>(directory, ObjectType::language, {}, report, read_language);
  tree.territories = read_objects<Territory>(directory, ObjectType::territory, {}, report, read_territory);
  tree.code_pages = read_objects<CodePage>(directory, ObjectType::code_page, only, report, read_code_page);
  fs::path aliases = directory / kAliasFile;
  tree.alias_file = aliases.string();
  tree.alias_text = read_file(aliases);
  tree.aliases = read_aliases(SourceFile(tree.alias_file, tree.alias_text, report), report);
  return tree;
}

}  // namespace lx::compiler
