// SPDX-License-Identifier: Apache-2.0
#include "dump.hpp"

#include "code_page_image.hpp"
#include "code_page_source.hpp"
#include "language.hpp"
#include "sort_source.hpp"
#include "structure.hpp"
#include "territory.hpp"

namespace lx::compiler {

namespace {

std::string name_beside(const fs::path& path, const DirectoryEntry& object) {
  fs::path control = path.parent_path() / kControlFile;
  if (fs::exists(control)) {
    for (const DirectoryEntry& entry : check_control_file(read_file(control))) {
      if (entry.type == object.type && entry.id == object.id) return entry.name;
    }
  }
  return type_name(object.type) + std::to_string(object.id);
}

template <class T>
T with_identity(T object, const DirectoryEntry& entry) {
  object.id = entry.id;
  object.name = entry.name;
  return object;
}

// One-way and missing mappings that a source cannot state, as a comment.
std::string unstated(const CodePage& page) {
  size_t count = 0;
  for (auto [code, unicode] : page.to_unicode) count += page.from_unicode[unicode] == kNoCode;
  for (Code code : page.from_unicode) count += code != kNoCode && page.unicode_of(code) == kUnassigned;
  return count == 0 ? "" : "# " + std::to_string(count) + " mappings of the file cannot be stated in a source\n";
}

}  // namespace

std::string dump_file(const fs::path& path) {
  std::string bytes = read_file(path);
  std::string title = "# printed from " + path.filename().string() + "\n";
  if (path.filename() == kControlFile) return title + write_directory(check_control_file(bytes));
  auto entry = parse_object_stem(path.stem().string());
  if (!entry) throw StructureError("the file name tells no object type and number");
  check_object(entry->type, entry->id, bytes);
  entry->name = name_beside(path, *entry);
  ObjectFile file = split_object_file(bytes);
  switch (entry->type) {
    case ObjectType::language:
      return title + write_language(with_identity(unpack_language(file.sections[0]), *entry));
    case ObjectType::territory:
      return title + write_territory(with_identity(unpack_territory(file.sections[0]), *entry));
    case ObjectType::sort: {
      Sort sort;
      sort.weights = unpack_sort(file.sections[0]);
      return title + write_sort(with_identity(std::move(sort), *entry));
    }
    default: {
      CodePage page = with_identity(unpack_code_page(read_code_page_image(file, entry->id)), *entry);
      return title + unstated(page) + write_code_page(page);
    }
  }
}

}  // namespace lx::compiler
