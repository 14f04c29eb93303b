// SPDX-License-Identifier: Apache-2.0
// The control file: the list of all objects of a data directory.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "object_file.hpp"

namespace lx::compiler {

enum class ObjectType : uint8_t { language, territory, code_page, sort };
inline constexpr unsigned kObjectTypes = 4;
inline constexpr const char* kControlFile = "control.nls";

struct DirectoryEntry {
  ObjectType type;
  uint16_t id;
  std::string name;
};

const char* type_name(ObjectType type);
// "cp_00037", the stem of source and object file names.
std::string object_stem(ObjectType type, uint16_t id);
// The reverse; nothing for any other name.
std::optional<DirectoryEntry> parse_object_stem(std::string_view stem);

// Entries must be ordered by type, then by id.
std::string pack_directory(const std::vector<DirectoryEntry>& entries);
// Throws StructureError.
std::vector<DirectoryEntry> unpack_directory(std::string_view section);
// One line an object: type, id, name.
std::string write_directory(const std::vector<DirectoryEntry>& entries);

}  // namespace lx::compiler
