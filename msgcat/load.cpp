// SPDX-License-Identifier: Apache-2.0
// Catalogs read whole and checked once; their sets are views into the file's bytes.
#include <algorithm>

#include "locale/locale.hpp"
#include "msgcat/catalog.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "catalog_load", 0};

bool messages_lie_inside(const LXCatSet& set) {
  uint64_t furthest = 0;
  for (uint32_t i = 0; i < set.messages; ++i) {
    MessageEntry entry(set.index, i);
    furthest = std::max(furthest, uint64_t{entry.offset()} + entry.length());
  }
  return furthest <= set.text_size;
}

uint32_t load_set(const LXCatalog& catalog, const CatalogSet& record, LXCatSet& set) {
  if (!set_lies_inside(record, catalog.size)) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Set %u lies outside the file", record.number);
    return LX_E_CATALOG;
  }
  LXCatSet loaded = set_of_record(record);
  loaded.index = catalog.image + record.index_offset;
  loaded.text = reinterpret_cast<char*>(catalog.image + record.text_offset);
  if (!messages_lie_inside(loaded)) {
    LX_TRACE(TRC1_LEVEL_ERROR, "A message of set %u lies outside its texts", record.number);
    return LX_E_CATALOG;
  }
  set = loaded;
  return LX_OK;
}

// Follows the chain for as many sets as there are, so that one that runs in circles ends too.
uint32_t load_sets(LXCatalog& catalog, const CatalogHeader& header) {
  uint32_t offset = header.first_set;
  uint64_t messages = 0;
  catalog.ascending = true;
  for (uint32_t i = 0; i < header.sets; ++i) {
    if (!lies_inside(catalog.size, offset, 1, sizeof(CatalogSet))) return LX_E_CATALOG;
    auto record = catalog_record<CatalogSet>(catalog.image + offset);
    // Sets may share their messages, but not so often that a small file takes hours.
    messages += record.messages;
    if (messages > catalog.size) return LX_E_CATALOG;
    uint32_t status = load_set(catalog, record, catalog.sets[i]);
    if (status != LX_OK) return status;
    if (i != 0 && record.number <= catalog.sets[i - 1].number) catalog.ascending = false;
    if (catalog.dense_sets == i && record.number == i + 1) ++catalog.dense_sets;
    offset = record.next;
    ++catalog.set_count;
  }
  return LX_OK;
}

struct CloseCatalog {
  LXCatalog* catalog;
  ~CloseCatalog() {
    if (catalog != nullptr) close_catalog(catalog);
  }
};

LXCatalog* load_whole(LXLocale* locale, LXFile* file, uint32_t size, uint32_t& rc) {
  rc = LX_E_CATALOG;
  if (size < sizeof(CatalogHeader)) return nullptr;
  Owned<uint8_t> image(static_cast<uint8_t*>(LXLoadFile(file, 0, size, &rc)));
  if (!image) {
    if (rc != LX_E_MEMORY) rc = LX_E_CATALOG;
    return nullptr;
  }
  auto header = catalog_record<CatalogHeader>(image.get());
  rc = check_catalog_header(header, size);
  if (rc != LX_OK) return nullptr;

  rc = LX_E_MEMORY;
  void* block = allocate(sizeof(LXCatalog) + size_t{header.sets} * sizeof(LXCatSet));
  if (block == nullptr) return nullptr;
  auto* catalog = static_cast<LXCatalog*>(block);
  *catalog = {.image = image.give_up(),
              .size = size,
              .set_count = 0,
              .dense_sets = 0,
              .sets = reinterpret_cast<LXCatSet*>(catalog + 1),
              .locale = locale,
              .own_locale = {},
              .file = nullptr,
              .ascending = false};
  CloseCatalog on_failure = {catalog};
  rc = load_sets(*catalog, header);
  if (rc == LX_OK) rc = find_own_page(*catalog, header);
  if (rc != LX_OK) return nullptr;
  close_catalog_file(file);
  return std::exchange(on_failure.catalog, nullptr);
}

LXCatalog* stay_on_disk(LXLocale* locale, LXFile* file, uint32_t size, uint32_t& rc) {
  auto catalog = Owned<LXCatalog>::zeroed();
  if (!catalog) {
    rc = LX_E_MEMORY;
    return nullptr;
  }
  catalog->size = size;
  catalog->locale = locale;
  catalog->file = file;
  rc = LX_OK;
  return catalog.give_up();
}

}  // namespace

LXCatalog* load_catalog(LXLocale* locale, LXFile* file, bool loaded, uint32_t& rc) {
  int32_t size = LXFileSize(file);
  if (size < 0 || locale == nullptr) {
    rc = LX_E_CATALOG;
    return nullptr;
  }
  auto bytes = static_cast<uint32_t>(size);
  return loaded ? load_whole(locale, file, bytes, rc) : stay_on_disk(locale, file, bytes, rc);
}

void close_catalog_file(LXFile* file) {
  // A close that fails keeps the handle for the caller to see, who has no use for it here.
  if (file != nullptr && LXCloseFile(file, 0) != 0) release(file);
}

void close_catalog(LXCatalog* catalog) {
  close_catalog_file(catalog->file);
  if (catalog->image != nullptr) release(catalog->image);
  release(catalog);
}

uint32_t check_catalog_header(const CatalogHeader& header, uint32_t file_size) {
  auto refused = [&](const char* field) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Catalog refused: %s", field);
    return LX_E_CATALOG;
  };
  if (header.magic != kCatalogMagic) return refused("magic");
  if (header.version != kCatalogVersion) return refused("version");
  if (header.byte_order != kNativeCatalog) return refused("byte order");
  if (header.sets == 0 || header.sets > file_size / sizeof(CatalogSet)) return refused("number of sets");
  if (std::memchr(header.locale, 0, sizeof header.locale) == nullptr) return refused("locale name");
  return LX_OK;
}

uint32_t find_own_page(LXCatalog& catalog, const CatalogHeader& header) {
  // Mostly it is the caller's locale, which need not be made once more.
  char callers_name[kFullNameRoom];
  write_full_name(*catalog.locale, callers_name);
  if (std::strcmp(callers_name, header.locale) == 0) {
    catalog.own_locale.code_page = catalog.locale->code_page;
    return LX_OK;
  }
  uint32_t rc = LX_OK;
  LXLocale* locale = LXGetLocale(header.locale, 0, &rc);
  if (locale == nullptr) {
    LX_TRACE(TRC1_LEVEL_ERROR, "No locale %s for the catalog, rc = %d", header.locale, static_cast<int>(rc));
    return rc == LX_E_MEMORY ? LX_E_MEMORY : LX_E_CATALOG;
  }
  catalog.own_locale.code_page = locale->code_page;
  LXReleaseLocale(locale, 0);
  return LX_OK;
}

bool set_lies_inside(const CatalogSet& set, uint32_t file_size) {
  return lies_inside(file_size, set.text_offset, set.text_size, 1) &&
         lies_inside(file_size, set.index_offset, set.messages, sizeof(CatalogMessage));
}

LXCatSet set_of_record(const CatalogSet& record) {
  return {.number = record.number,
          .next = record.next,
          .messages = record.messages,
          .index_offset = record.index_offset,
          .text_offset = record.text_offset,
          .text_size = record.text_size,
          .index = nullptr,
          .text = nullptr};
}

}  // namespace lx

using namespace lx;

extern "C" {

LXCatalog* LXMcLoadCat(LXLocale* locale, LXFile* file, int32_t loaded, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&] {
    uint32_t status = LX_OK;
    LXCatalog* catalog = load_catalog(locale_or_default(locale), file, loaded != 0, status);
    set_status(rc, status);
    return catalog;
  });
}

uint32_t LXMcLoadSet(LXCatalog* catalog, const uint32_t* record, LXCatSet* set) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (catalog == nullptr) return LX_E_NOCATALOG;
    if (record == nullptr || set == nullptr) return LX_E_ARGUMENT;
    if (catalog->image == nullptr) return LX_E_CATALOG;
    return load_set(*catalog, catalog_record<CatalogSet>(record), *set);
  });
}

}  // extern "C"
