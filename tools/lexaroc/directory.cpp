// SPDX-License-Identifier: Apache-2.0
#include "directory.hpp"

#include <algorithm>
#include <cstdio>
#include <cstring>

namespace lx::compiler {

namespace {

constexpr const char* kPrefixes[kObjectTypes] = {"la", "te", "cp", "so"};
constexpr const char* kTypeNames[kObjectTypes] = {"language", "territory", "codepage", "sort"};

}  // namespace

const char* type_name(ObjectType type) { return kTypeNames[static_cast<unsigned>(type)]; }

std::string object_stem(ObjectType type, uint16_t id) {
  char stem[16];
  std::snprintf(stem, sizeof stem, "%s_%05u", kPrefixes[static_cast<unsigned>(type)], unsigned{id});
  return stem;
}

std::optional<DirectoryEntry> parse_object_stem(std::string_view stem) {
  constexpr size_t kStemLength = 8;
  if (stem.size() != kStemLength) return std::nullopt;
  unsigned id = 0;
  for (char digit : stem.substr(3)) {
    if (digit < '0' || digit > '9') return std::nullopt;
    id = id * 10 + static_cast<unsigned>(digit - '0');
  }
  for (unsigned type = 0; type < kObjectTypes && id <= 0xFFFF; ++type) {
    DirectoryEntry entry{static_cast<ObjectType>(type), static_cast<uint16_t>(id), ""};
    if (object_stem(entry.type, entry.id) == stem) return entry;
  }
  return std::nullopt;
}

std::string pack_directory(const std::vector<DirectoryEntry>& entries) {
  std::string section;
  for (const DirectoryEntry& entry : entries) {
    DirectoryRecord record{};
    record.id = entry.id;
    record.type = static_cast<uint8_t>(entry.type);
    std::memcpy(record.name, entry.name.data(), std::min(entry.name.size(), sizeof record.name - 1));
    section += bytes_of(record);
  }
  return section;
}

std::vector<DirectoryEntry> unpack_directory(std::string_view section) {
  std::vector<DirectoryEntry> entries;
  for (size_t offset = 0; section.size() - offset >= sizeof(DirectoryRecord); offset += sizeof(DirectoryRecord)) {
    auto record = record_at<DirectoryRecord>(section, offset);
    size_t number = entries.size() + 1;
    if (record.type >= kObjectTypes)
      throw StructureError(tool::message("record {0} has an unknown object type", number));
    const void* end = std::memchr(record.name, 0, sizeof record.name);
    if (end == nullptr) throw StructureError(tool::message("record {0} has a name without end", number));
    entries.push_back({static_cast<ObjectType>(record.type), record.id, std::string(record.name)});
  }
  return entries;
}

std::string write_directory(const std::vector<DirectoryEntry>& entries) {
  std::string out;
  for (const DirectoryEntry& entry : entries) {
    out += std::string(type_name(entry.type)) + " " + std::to_string(entry.id) + " " + entry.name + "\n";
  }
  return out;
}

}  // namespace lx::compiler
