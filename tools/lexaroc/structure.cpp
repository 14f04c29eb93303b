// SPDX-License-Identifier: Apache-2.0
#include "structure.hpp"

#include "code_page_image.hpp"
#include "language.hpp"
#include "sort_object.hpp"
#include "territory.hpp"

namespace lx::compiler {

void check_object(ObjectType type, uint16_t id, std::string_view bytes) {
  ObjectFile file = split_object_file(bytes);
  switch (type) {
    case ObjectType::language:
      unpack_language(file.sections[0]);
      return;
    case ObjectType::territory:
      unpack_territory(file.sections[0]);
      return;
    case ObjectType::code_page:
      check_code_page_image(read_code_page_image(file, id));
      return;
    case ObjectType::sort:
      unpack_sort(file.sections[0]);
      return;
  }
  throw StructureError("objects of this type are not known");
}

std::vector<DirectoryEntry> check_control_file(std::string_view bytes) {
  ObjectFile file = split_object_file(bytes);
  if (file.sections[0].size() % sizeof(DirectoryRecord) != 0) throw StructureError("the last record is cut short");
  std::vector<DirectoryEntry> entries = unpack_directory(file.sections[0]);
  for (size_t i = 1; i < entries.size(); ++i) {
    const DirectoryEntry& before = entries[i - 1];
    const DirectoryEntry& entry = entries[i];
    if (entry.type < before.type || (entry.type == before.type && entry.id <= before.id)) {
      throw StructureError(tool::message("record {0} is out of order", i + 1));
    }
  }
  return entries;
}

}  // namespace lx::compiler
