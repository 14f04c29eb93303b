// SPDX-License-Identifier: Apache-2.0
#include "objects/control_file.hpp"

#include <cstring>

#include "frame/call.hpp"
#include "frame/data_file.hpp"
#include "objects/file_format.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "control_file", 0};

constexpr int32_t kControlNameRoom = 255;
constexpr int32_t kDirectoryRoom = 255;

template <class T>
Owned<T> allocate_for_control(size_t count, uint32_t& rc) {
  auto block = Owned<T>::zeroed(count);
  if (!block) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Unable to allocate %d bytes for control data", static_cast<int>(count * sizeof(T)));
    rc = LX_E_MEMORY;
  }
  return block;
}

uint32_t corrupted(const char* field) {
  LX_TRACE(TRC1_LEVEL_ERROR, "Control file: %s is not valid", field);
  return LX_E_HEADER;
}

uint32_t read_header(LXFile* file, FileHeader& header) {
  uint32_t rc = LX_OK;
  Owned<uint8_t> bytes(static_cast<uint8_t*>(LXLoadFile(file, 0, sizeof header, &rc)));
  if (!bytes) return rc;
  std::memcpy(static_cast<void*>(&header), bytes.get(), sizeof header);
  if (header.magic != kFileMagic) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Control file header is corrupted");
    return LX_E_HEADER;
  }
  return header.section_count >= 1 ? LX_OK : corrupted("number of sections");
}

uint32_t read_records(LXFile* file, const FileHeader& header, void* records, uint32_t size) {
  uint32_t offset = header.section1_offset;
  if (offset > INT32_MAX || LXSeekFile(file, static_cast<int32_t>(offset), LX_SEEK_SET) != 0) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Seek to offset %d failed for file %p", static_cast<int>(offset),
             static_cast<void*>(file));
    return LX_E_FILE;
  }
  uint32_t rc = LX_OK;
  if (LXReadFile(file, records, size, &rc) == size) return LX_OK;
  if (rc == LX_OK) rc = LX_E_FILE;
  LX_TRACE(TRC1_LEVEL_ERROR, "Read of %d bytes from file %p failed with error %d", static_cast<int>(size),
           static_cast<void*>(file), static_cast<int>(rc));
  return rc;
}

// Copies the records and notes where each type begins. Flags and the last byte of the name are not the file's to set.
uint32_t fill_entries(LXObjMgr& manager, const DirectoryRecord* records, uint16_t count) {
  unsigned type = 0;
  for (uint16_t i = 0; i < count; ++i) {
    const DirectoryRecord& record = records[i];
    if (record.type >= kObjectTypes) return corrupted("object type");
    if (record.type < type) return corrupted("order of the object types");
    while (type < record.type) manager.first[++type] = i;
    LXObjEntry& entry = manager.entries[i];
    entry.id = record.id;
    entry.type = record.type;
    std::memcpy(entry.name, record.name, sizeof entry.name - 1);
    LX_TRACE(TRC1_LEVEL_DETAIL, "Entry = %d, Object Type = %d, Object Id = %d, Object Name = %s", i, entry.type,
             entry.id, entry.name);
  }
  while (type < kObjectTypes) manager.first[++type] = count;
  return LX_OK;
}

void forget_entries(LXObjMgr& manager) {
  if (manager.entries != nullptr) release(std::exchange(manager.entries, nullptr));
  for (uint16_t& first : manager.first) first = 0;
}

uint32_t read_directory(LXObjMgr& manager, LXFile* file) {
  FileHeader header;
  uint32_t rc = read_header(file, header);
  if (rc != LX_OK) return rc;
  uint32_t size = header.size_of(0);
  if (size == 0) return LX_OK;  // a directory of nothing is a directory
  auto records = allocate_for_control<uint8_t>(size, rc);
  if (!records) return rc;
  LX_TRACE(TRC1_LEVEL_DETAIL, "LXObjDisk size = %d", static_cast<int>(sizeof(DirectoryRecord)));
  auto count = static_cast<uint16_t>(size / sizeof(DirectoryRecord));
  auto entries = allocate_for_control<LXObjEntry>(count == 0 ? 1u : count, rc);
  if (!entries) return rc;
  rc = read_records(file, header, records.get(), size);
  if (rc != LX_OK) return rc;
  manager.entries = entries.give_up();
  rc = fill_entries(manager, reinterpret_cast<const DirectoryRecord*>(records.get()), count);
  if (rc != LX_OK) forget_entries(manager);
  return rc;
}

// The search ends at the first file that opens, which is read, or at a place whose name cannot be built.
struct Search {
  LXObjMgr& manager;
  uint32_t rc = LX_OK;
  bool found = false;
  bool ended = false;

  void try_directory(const char* directory) {
    char name[kControlNameRoom];
    if (LXGetControlFileName(directory, name, kControlNameRoom) == nullptr) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Unable to construct control file name in directory %s", directory);
      LX_TRACE(TRC1_LEVEL_ERROR, "control size = %d", kControlNameRoom);
      rc = LX_E_FILE;
      ended = true;
      return;
    }
    DataFile file(name, rc);
    if (!file) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Unable to open %s, err = %d", name, static_cast<int>(rc));
      return;
    }
    found = ended = true;
    if (directory != manager.directory) std::memmove(manager.directory, directory, std::strlen(directory) + 1);
    rc = read_directory(manager, file.get());
  }

  void try_environment() {
    int32_t length = LXGetDataLocation(manager.directory, kDirectoryRoom, 0);
    if (length > 0) {
      try_directory(manager.directory);
    } else if (length == 0) {  // set, but too long to be a directory here
      rc = LX_E_FILE;
      ended = true;
    }
  }

  void try_default() {
    if (LXGetDataLocation(manager.directory, kDirectoryRoom, 1) > 0) try_directory(manager.directory);
  }
};

}  // namespace

uint32_t read_control_file(LXObjMgr& manager, const char* directory) {
  TRC1_Sync(&trace_unit);  // no exported function of this module has done it
  Search search{manager};
  if (directory != nullptr) search.try_directory(directory);
  if (!search.ended) search.try_environment();
  if (!search.ended) search.try_default();
  if (!search.found) LX_TRACE(TRC1_LEVEL_ERROR, "Unable to open control file");
  return search.rc;
}

}  // namespace lx
