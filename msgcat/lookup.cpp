// SPDX-License-Identifier: Apache-2.0
// Sets and messages by number, in memory and on disk.
#include <algorithm>

#include "msgcat/catalog.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "catalog_lookup", 0};

constexpr uint32_t kNowhere = UINT32_MAX;

// ---- In memory ----

// Where a number stands among ascending ones. They are mostly 1, 2, 3 and so on, so the search begins where that would
// have it and goes on in halves.
template <class NumberAt>
uint32_t position_of(uint32_t wanted, uint32_t count, NumberAt number_at) {
  int64_t low = 0;
  int64_t high = int64_t{count} - 1;
  int64_t at = wanted - 1 < count ? wanted - 1 : count / 2;
  while (low <= high) {
    uint32_t number = number_at(static_cast<uint32_t>(at));
    if (number == wanted) return static_cast<uint32_t>(at);
    if (number < wanted) {
      low = at + 1;
      at += std::max<int64_t>(1, (high - at) / 2);
    } else {
      high = at - 1;
      at -= std::max<int64_t>(1, (at - low) / 2);
    }
  }
  return kNowhere;
}

// ---- On disk ----

// Reads that reach beyond the file are not even tried.
bool read_at(const LXCatalog& catalog, uint32_t offset, void* out, uint32_t size) {
  if (!lies_inside(catalog.size, offset, size, 1)) return false;
  if (LXSeekFile(catalog.file, static_cast<int32_t>(offset), LX_SEEK_SET) != 0) return false;
  uint32_t rc = LX_OK;
  return LXReadFile(catalog.file, out, size, &rc) == size && rc == LX_OK;
}

// Follows the chain for as many sets as there are. LX_OK with `found` or without.
uint32_t read_set_record(const LXCatalog& catalog, const CatalogHeader& header, uint32_t number, CatalogSet& set,
                         bool& found) {
  found = false;
  uint32_t offset = header.first_set;
  for (uint32_t i = 0; i < header.sets; ++i) {
    if (!read_at(catalog, offset, &set, sizeof set)) return LX_E_CATALOG;
    if (set.number == number) {
      found = true;
      return set_lies_inside(set, catalog.size) ? LX_OK : LX_E_CATALOG;
    }
    offset = set.next;
  }
  return LX_OK;
}

// The entry where consecutive numbers have it, else the first of that number.
uint32_t read_entry(const LXCatalog& catalog, const LXCatSet& set, uint32_t number, CatalogMessage& message,
                    bool& found) {
  auto read_entries = [&](uint32_t first, uint32_t count, CatalogMessage* entries) {
    return read_at(catalog, set.index_offset + first * uint32_t{sizeof message}, entries,
                   count * uint32_t{sizeof message});
  };
  found = true;
  if (number - 1 < set.messages) {
    if (!read_entries(number - 1, 1, &message)) return LX_E_CATALOG;
    if (message.number == number) return LX_OK;
  }
  constexpr uint32_t kBlock = 21;  // what 256 bytes hold
  CatalogMessage entries[kBlock];
  for (uint32_t first = 0; first < set.messages; first += kBlock) {
    uint32_t count = std::min(kBlock, set.messages - first);
    if (!read_entries(first, count, entries)) return LX_E_CATALOG;
    auto* entry = std::find_if(entries, entries + count, [=](const auto& each) { return each.number == number; });
    if (entry == entries + count) continue;
    message = *entry;
    return LX_OK;
  }
  found = false;
  return LX_OK;
}

}  // namespace

LXCatSet* search_sets(const LXCatalog& catalog, uint32_t number) {
  LXCatSet* end = catalog.sets + catalog.set_count;
  if (!catalog.ascending) {
    LXCatSet* set = std::find_if(catalog.sets, end, [=](const LXCatSet& each) { return each.number == number; });
    return set != end ? set : nullptr;
  }
  uint32_t at = position_of(number, catalog.set_count, [&](uint32_t i) { return catalog.sets[i].number; });
  return at != kNowhere ? catalog.sets + at : nullptr;
}

MessageText search_messages(const LXCatSet& set, uint32_t number) {
  uint32_t at = position_of(number, set.messages, [&](uint32_t i) { return MessageEntry(set.index, i).number(); });
  if (at == kNowhere) return {};
  MessageEntry entry(set.index, at);
  return {set.text + entry.offset(), entry.length()};
}

LXCatSet* read_set(LXCatalog& catalog, uint32_t number, LXCatSet& scratch, uint32_t& rc) {
  auto fail = [&](uint32_t status) {
    rc = status;
    return static_cast<LXCatSet*>(nullptr);
  };
  CatalogHeader header;
  if (!read_at(catalog, 0, &header, sizeof header)) return fail(LX_E_CATALOG);
  uint32_t status = check_catalog_header(header, catalog.size);
  if (status == LX_OK && catalog.own_locale.code_page == nullptr) status = find_own_page(catalog, header);
  if (status != LX_OK) return fail(status);
  CatalogSet set;
  bool found = false;
  status = read_set_record(catalog, header, number, set, found);
  if (status != LX_OK || !found) return fail(status);
  scratch = set_of_record(set);
  return &scratch;
}

Owned<char> read_message(const LXCatalog& catalog, const LXCatSet& set, uint32_t number, uint32_t& length,
                         uint32_t& rc) {
  auto fail = [&](uint32_t status) {
    rc = status;
    return Owned<char>();
  };
  // The set may be the caller's.
  if (!lies_inside(catalog.size, set.index_offset, set.messages, sizeof(CatalogMessage))) return fail(LX_E_CATALOG);
  CatalogMessage message;
  bool found = false;
  rc = read_entry(catalog, set, number, message, found);
  if (rc != LX_OK || !found) return {};
  if (!lies_inside(set.text_size, message.offset, message.length, 1) ||
      !lies_inside(catalog.size, set.text_offset, set.text_size, 1)) {
    return fail(LX_E_CATALOG);
  }
  auto text = Owned<char>::array(size_t{message.length} + 1);
  if (!text) return fail(LX_E_MEMORY);
  if (!read_at(catalog, set.text_offset + message.offset, text.get(), message.length)) return fail(LX_E_CATALOG);
  text[message.length] = '\0';
  length = message.length;
  return text;
}

}  // namespace lx

using namespace lx;

extern "C" {

LXCatSet* MCGetSet(LXCatalog* catalog, uint32_t set, LXCatSet* scratch, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXCatSet* {
    uint32_t status = LX_OK;
    LXCatSet* found = nullptr;
    if (catalog == nullptr) {
      status = LX_E_NOCATALOG;
    } else if (catalog->image != nullptr) {
      found = loaded_set(*catalog, set);
    } else if (scratch != nullptr) {
      found = read_set(*catalog, set, *scratch, status);
    } else {
      status = LX_E_ARGUMENT;
    }
    set_status(rc, status);
    return found;
  });
}

char* MCGetMsg(LXCatalog* catalog, LXCatSet* set, int32_t message, uint32_t* length, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> char* {
    MessageText found;
    uint32_t status = catalog != nullptr ? uint32_t{LX_OK} : LX_E_NOCATALOG;
    if (catalog != nullptr && set != nullptr && message > 0) {
      auto number = static_cast<uint32_t>(message);
      if (catalog->image == nullptr) {
        found.at = read_message(*catalog, *set, number, found.length, status).give_up();
      } else if (set->index != nullptr) {
        found = loaded_message(*set, number);
      }
    }
    set_status(rc, status);
    if (length != nullptr) *length = found.length;
    return const_cast<char*>(found.at);
  });
}

}  // extern "C"
