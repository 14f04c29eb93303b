// SPDX-License-Identifier: Apache-2.0
#include "source_tree.hpp"

#include <algorithm>

#include "code_page_source.hpp"
#include "collation_root.hpp"

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
    if (type == ObjectType::sort && path.filename() == kCollationRootFile) continue;
    auto expected = parse_object_stem(path.stem().string());
    if (!expected || expected->type != type) {
      report.error(path.string(), {},
                   tool::message("the file name is not of the form {0}", object_stem(type, 0) + ".txt"));
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

// What sorts refer to, read when the first of them asks for it.
class SortReferences {
 public:
  SortReferences(const fs::path& directory, const std::vector<CodePage>& known, Report& report)
      : directory_(directory), known_(known), report_(report) {}

  SortContext context() {
    return {[this] { return root(); }, [this](uint16_t id) { return code_page(id); }};
  }

 private:
  const Collation* root() {
    fs::path path = directory_ / source_folder(ObjectType::sort) / kCollationRootFile;
    if (!root_read_ && fs::exists(path)) {
      root_ = read_collation_root(SourceFile(path.string(), read_file(path), report_), report_);
    }
    root_read_ = true;
    return root_ ? &*root_ : nullptr;
  }

  // Pages that the tree was not asked for are read here; their faults are not those of the sort.
  const CodePage* code_page(uint16_t id) {
    auto known = std::find_if(known_.begin(), known_.end(), [id](const CodePage& page) { return page.id == id; });
    if (known != known_.end()) return &*known;
    auto [read, first] = pages_.try_emplace(id);
    fs::path path =
        directory_ / source_folder(ObjectType::code_page) / (object_stem(ObjectType::code_page, id) + ".txt");
    if (first && fs::exists(path)) {
      Report unheard;
      read->second = read_code_page(SourceFile(path.string(), read_file(path), unheard), unheard);
    }
    return read->second ? &*read->second : nullptr;
  }

  fs::path directory_;
  const std::vector<CodePage>& known_;
  Report& report_;
  bool root_read_ = false;
  std::optional<Collation> root_;
  std::map<uint16_t, std::optional<CodePage>> pages_;
};

}  // namespace

const char* source_folder(ObjectType type) { return kFolders[static_cast<unsigned>(type)]; }

std::vector<DirectoryEntry> SourceTree::entries() const {
  // File names are read in order and hold the ids, so each list is sorted.
  std::vector<DirectoryEntry> list;
  for (const Language& object : languages) list.push_back({ObjectType::language, object.id, object.name});
  for (const Territory& object : territories) list.push_back({ObjectType::territory, object.id, object.name});
  for (const CodePage& object : code_pages) list.push_back({ObjectType::code_page, object.id, object.name});
  for (const Sort& object : sorts) list.push_back({ObjectType::sort, object.id, object.name});
  return list;
}

SourceTree read_source_tree(const fs::path& directory, const std::set<uint16_t>& only, Report& report) {
  SourceTree tree;
  tree.directory = directory;
  tree.unicode = UnicodeTables::read(directory / "unicode", report);
  tree.languages = read_objects<Language>(directory, ObjectType::language, {}, report, read_language);
  tree.territories = read_objects<Territory>(directory, ObjectType::territory, {}, report, read_territory);
  tree.code_pages = read_objects<CodePage>(directory, ObjectType::code_page, only, report, read_code_page);
  SortReferences references(directory, tree.code_pages, report);
  SortContext context = references.context();
  tree.sorts = read_objects<Sort>(
      directory, ObjectType::sort, {}, report,
      [&context](const SourceFile& source, Report& errors) { return read_sort(source, context, errors); });
  fs::path aliases = directory / kAliasFile;
  tree.alias_file = aliases.string();
  tree.alias_text = read_file(aliases);
  tree.aliases = read_aliases(SourceFile(tree.alias_file, tree.alias_text, report), report);
  return tree;
}

std::optional<Sort> read_sort_file(const SourceFile& source, const fs::path& directory, Report& report) {
  const std::vector<CodePage> none;
  SortReferences references(directory, none, report);
  return read_sort(source, references.context(), report);
}

}  // namespace lx::compiler
