// SPDX-License-Identifier: Apache-2.0
// Reads an object file, checks its sections and publishes them; or attaches the built-in data.
#include <cstring>

#include "frame/call.hpp"
#include "frame/data_file.hpp"
#include "frame/environment.hpp"
#include "objects/code_page_check.hpp"
#include "objects/entry.hpp"
#include "objects/file_format.hpp"
#include "objects/native_texts.hpp"
#include "objects/sort_object.hpp"
#include "objects/text_check.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "loader", 0};

// An object on its way into its entry. Sections become visible to readers only by publish().
struct Loading {
  Owned<uint8_t> sections[kMaxSections];
  uint32_t sizes[kMaxSections] = {};
  uint8_t flags = 0;
  Owned<CodePage> code_page;
  Owned<const LXUChar* const> texts;
  Owned<const SortTables> sort;

  SectionBytes bytes(unsigned section) const { return {sections[section].get(), sizes[section]}; }
};

uint32_t corrupted(const LXObjEntry& entry, const char* field) {
  LX_TRACE(TRC1_LEVEL_ERROR, "Object %s (type %d, id %d): %s is not valid", entry.name, entry.type, entry.id, field);
  return LX_E_HEADER;
}

uint32_t read_header(const LXObjEntry& entry, LXFile* file, FileHeader& header) {
  uint32_t rc = LX_OK;
  Owned<uint8_t> bytes(static_cast<uint8_t*>(LXLoadFile(file, 0, sizeof header, &rc)));
  if (!bytes) return rc;
  std::memcpy(static_cast<void*>(&header), bytes.get(), sizeof header);
  if (header.magic != kFileMagic) return corrupted(entry, "header");
  if (header.section_count < 1 || header.section_count > kMaxSections) return corrupted(entry, "number of sections");
  return LX_OK;
}

uint32_t read_sections(const LXObjEntry& entry, LXFile* file, const FileHeader& header, Loading& loading) {
  for (unsigned i = 0; i < header.section_count; ++i) {
    uint32_t rc = LX_OK;
    loading.sections[i].reset(static_cast<uint8_t*>(LXLoadFile(file, header.offset_of(i), header.size_of(i), &rc)));
    if (rc != LX_OK) return rc;
    loading.sizes[i] = header.size_of(i);
  }
  return loading.sections[0] ? LX_OK : corrupted(entry, "section 1 size");
}

// Replaces sections in the older layout by converted ones.
uint32_t convert_from_v1(const LXObjEntry& entry, Loading& loading) {
  if (const char* wrong = check_code_page_v1(loading.bytes(0), loading.bytes(1))) return corrupted(entry, wrong);
  const auto& old = *reinterpret_cast<const CodePageHeaderV1*>(loading.sections[0].get());
  bool multibyte = old.max_length >= 2;
  uint32_t variable_start = multibyte ? uint32_t{old.full_width} : 0;
  uint32_t old_array = multibyte ? uint32_t{old.to_unicode_array} : 0;
  uint8_t* section2 = nullptr;
  uint8_t* section1 = LXCpV1toV2(loading.sections[0].get(), static_cast<uint16_t>(loading.sizes[0]),
                                 loading.sections[1].get(), static_cast<uint16_t>(loading.sizes[1]), &section2);
  if (section1 == nullptr) return LX_E_MEMORY;
  uint32_t size1 = sizeof(CodePageHeader) + (multibyte ? loading.sizes[0] - variable_start : 0);
  uint32_t size2 = 0;
  if (section2 != nullptr) {
    size2 = reinterpret_cast<const CodePageHeader*>(section1)->to_unicode_array + loading.sizes[1] - old_array;
  }
  loading.sections[0].reset(section1);
  loading.sections[1].reset(section2);
  loading.sizes[0] = size1;
  loading.sizes[1] = size2;
  loading.flags = kEntryConverted[0];
  if (section2 != nullptr) loading.flags = static_cast<uint8_t>(loading.flags | kEntryConverted[1]);
  return LX_OK;
}

uint32_t check_code_page_object(const LXObjEntry& entry, const FileHeader& header, Loading& loading) {
  if (header.layout_version() == kCodePageLayoutV1) {
    uint32_t rc = convert_from_v1(entry, loading);
    if (rc != LX_OK) return rc;
  }
  const SectionBytes sections[kMaxSections] = {loading.bytes(0), loading.bytes(1), loading.bytes(2), loading.bytes(3)};
  CheckedCodePage checked;
  if (const char* wrong = check_code_page(entry.id, sections, checked)) return corrupted(entry, wrong);
  loading.code_page.reset(build_code_page(entry.id, checked));
  return loading.code_page ? LX_OK : LX_E_MEMORY;
}

uint32_t check_object(const LXObjEntry& entry, const FileHeader& header, Loading& loading) {
  const SectionBytes section = loading.bytes(0);
  const char* wrong = nullptr;
  switch (entry.type) {
    case LX_LANGUAGE:
    case LX_TERRITORY:
      wrong = entry.type == LX_LANGUAGE ? check_language(section) : check_territory(section);
      if (wrong != nullptr) break;
      loading.texts.reset(build_texts(entry.type, section.data));
      return loading.texts ? LX_OK : LX_E_MEMORY;
    case LX_CODEPAGE:
      return check_code_page_object(entry, header, loading);
    default:
      wrong = check_sort(section);
      if (wrong != nullptr) break;
      loading.sort.reset(build_sort_tables(section.data));
      return loading.sort ? LX_OK : LX_E_MEMORY;
  }
  return corrupted(entry, wrong);
}

void publish(LXObjEntry& entry, Loading& loading) {
  entry.flags = loading.flags;
  for (unsigned i = 1; i < kMaxSections; ++i) entry.more_sections[i - 1] = loading.sections[i].give_up();
  entry.code_page = loading.code_page.give_up();
  entry.texts = loading.texts.give_up();
  entry.sort = loading.sort.give_up();
  entry.section1.store(loading.sections[0].give_up(), std::memory_order_release);
}

uint32_t load_open_file(LXObjEntry& entry, LXFile* file) {
  FileHeader header;
  Loading loading;
  uint32_t rc = read_header(entry, file, header);
  if (rc == LX_OK) rc = read_sections(entry, file, header, loading);
  if (rc == LX_OK) rc = check_object(entry, header, loading);
  if (rc == LX_OK) publish(entry, loading);
  return rc;
}

uint32_t load_from_file(const LXObjMgr& manager, LXObjEntry& entry) {
  char name[sizeof manager.directory + kObjectNameRoom];
  if (LXGetDataFileName(manager.directory, entry.type, entry.id, name, sizeof name) == nullptr) return LX_E_FILE;
  uint32_t rc = LX_OK;
  // Closed again at once: a process that starts and ends the library often must not run out of descriptors.
  DataFile file(name, rc);
  return file ? load_open_file(entry, file.get()) : rc;
}

bool free_section(const uint8_t* section, bool converted) {
  if (section == nullptr) return true;
  if (converted) return release(section);
  return LXUnloadFile(const_cast<uint8_t*>(section)) == 0;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

LXObjEntry* LXLoadObj(LXObjMgr* manager, LXObjEntry* entry, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXObjEntry* {
    if (manager == nullptr || entry == nullptr) {
      set_status(rc, LX_E_ARGUMENT);
      return nullptr;
    }
    GlobalLock lock;
    uint32_t status = entry->loaded() ? LX_OK : load_from_file(*manager, *entry);
    set_status(rc, status);
    if (status == LX_OK) return entry;
    return manager->no_defaults == 0 && LXLoadDefaultObj(manager, entry) == 0 ? entry : nullptr;
  });
}

uint32_t LXUnloadObj(LXObjMgr* manager, LXObjEntry* entry) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (entry == nullptr || (entry->flags & kEntryBuiltIn) != 0) return LX_OK;
    uint32_t result = LX_OK;
    if (manager == nullptr) manager = LXGetObjManager();
    if (manager != nullptr && entry->code_page != nullptr && !drop_pairs(*manager)) result = LX_E_FREE;
    for (unsigned i = kMaxSections; i-- > 0;) {
      const uint8_t* section = i == 0 ? entry->section1.exchange(nullptr, std::memory_order_acq_rel)
                                      : std::exchange(entry->more_sections[i - 1], nullptr);
      if (!free_section(section, (entry->flags & kEntryConverted[i]) != 0)) result = LX_E_FREE;
    }
    const CodePage* code_page = std::exchange(entry->code_page, nullptr);
    if (code_page != nullptr && !release(code_page)) result = LX_E_FREE;
    // What was read, and what was made to stand for it, is given back without a look.
    Owned<const LXUChar* const>(std::exchange(entry->texts, nullptr));
    Owned<const SortTables>(std::exchange(entry->sort, nullptr));
    entry->flags = 0;
    return result;
  });
}

uint32_t LXLoadDefaultObj(LXObjMgr* /*manager*/, LXObjEntry* entry) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (entry == nullptr || entry->type >= LX_SORT) return 1;
    if (entry->loaded()) return 0;
    static const uint8_t* const kSections[] = {LXDefaultLanguage, LXDefaultTerritory, LXDefaultCodePage};
    entry->flags = kEntryBuiltIn;
    if (entry->type == LX_CODEPAGE) {
      entry->more_sections[1] = LXDefCP3;
      entry->code_page = &built_in_code_page();
    } else {
      entry->texts = built_in_texts(entry->type);
    }
    entry->section1.store(kSections[entry->type], std::memory_order_release);
    return 0;
  });
}

uint32_t LXLoadDefaults(LXObjMgr* manager) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (manager == nullptr) return 0;
    if (manager->built_in) return 1;
    static constexpr const char* kNames[] = {"English", "UnitedStates", "US-ASCII"};
    constexpr uint16_t kCount = 3;
    auto entries = Owned<LXObjEntry>::zeroed(kCount);
    if (!entries) return 0;
    manager->replaced_count = manager->first[kObjectTypes];
    manager->replaced = std::exchange(manager->entries, entries.give_up());
    for (uint8_t type = 0; type < kCount; ++type) {
      LXObjEntry& entry = manager->entries[type];
      entry.id = 1;
      entry.type = type;
      std::strcpy(entry.name, kNames[type]);
      manager->first[type] = type;
      LXLoadDefaultObj(manager, &entry);
    }
    manager->first[LX_SORT] = kCount;
    manager->first[kObjectTypes] = kCount;
    manager->built_in = true;
    manager->no_defaults = 1;
    manager->directory[0] = '\0';
    return 1;
  });
}

}  // extern "C"
