// SPDX-License-Identifier: Apache-2.0
// An open message catalog, and what is done with it inside.
#pragma once

#include "frame/call.hpp"
#include "frame/memory.hpp"
#include "msgcat/catalog_format.hpp"

struct LXCatalog {
  uint8_t* image;       // the whole file, checked; null: it is read message by message
  uint32_t size;        // of the file
  uint32_t set_count;   // loaded catalogs only, else 0
  uint32_t dense_sets;  // so many of them are numbered 1, 2, 3 and so on
  LXCatSet* sets;       // views into the image; they stand behind the handle
  LXLocale* locale;     // the caller's
  LXLocale own_locale;  // the catalog's, as far as conversions look at one: its code page; on disk null at first
  LXFile* file;         // on disk only
  bool ascending;       // the set numbers are
};

namespace lx {

struct MessageText {
  const char* at = nullptr;
  uint32_t length = 0;
};

// The first file of the search that opens; null with the status of the last that did not, or LX_E_MEMORY.
LXFile* find_catalog_file(LXLocale& locale, const char* directory, const char* name, bool one_pass, uint32_t& rc);

// Takes the file when it succeeds. Null: LX_E_CATALOG or LX_E_MEMORY.
LXCatalog* load_catalog(LXLocale* locale, LXFile* file, bool loaded, uint32_t& rc);
void close_catalog(LXCatalog* catalog);
void close_catalog_file(LXFile* file);

// LX_OK, or LX_E_CATALOG.
uint32_t check_catalog_header(const CatalogHeader& header, uint32_t file_size);
// Takes the code page of the locale that a checked header names. LX_OK, LX_E_CATALOG or LX_E_MEMORY.
uint32_t find_own_page(LXCatalog& catalog, const CatalogHeader& header);
// Whether what a set refers to lies in the file.
bool set_lies_inside(const CatalogSet& set, uint32_t file_size);
LXCatSet set_of_record(const CatalogSet& record);

// ---- Lookup in memory: where consecutive numbers would have it, else by a search ----

LXCatSet* search_sets(const LXCatalog& catalog, uint32_t number);
MessageText search_messages(const LXCatSet& set, uint32_t number);

inline LXCatSet* loaded_set(const LXCatalog& catalog, uint32_t number) {
  return number - 1 < catalog.dense_sets ? catalog.sets + (number - 1) : search_sets(catalog, number);
}

inline MessageText loaded_message(const LXCatSet& set, uint32_t number) {
  MessageEntry entry(set.index, number - 1);
  if (number - 1 >= set.messages || entry.number() != number) return search_messages(set, number);
  return {set.text + entry.offset(), entry.length()};
}

// ---- Lookup on disk ----

// Null: there is none (LX_OK), LX_E_CATALOG or LX_E_MEMORY.
LXCatSet* read_set(LXCatalog& catalog, uint32_t number, LXCatSet& scratch, uint32_t& rc);
Owned<char> read_message(const LXCatalog& catalog, const LXCatSet& set, uint32_t number, uint32_t& length,
                         uint32_t& rc);  // terminated

}  // namespace lx
