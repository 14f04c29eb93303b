// SPDX-License-Identifier: Apache-2.0
// Typed access to the sections of loaded entries. Only checked sections ever reach an entry.
#pragma once

#include "frame/records.hpp"
#include "objects/code_page.hpp"
#include "objects/text_format.hpp"

namespace lx {

inline const LanguageHeader& language_of(const LXObjEntry& entry) {
  return *reinterpret_cast<const LanguageHeader*>(entry.section1.load(std::memory_order_acquire));
}

inline const TerritoryHeader& territory_of(const LXObjEntry& entry) {
  return *reinterpret_cast<const TerritoryHeader*>(entry.section1.load(std::memory_order_acquire));
}

// A zero-terminated UCS-2 text of a territory, in file order.
inline const BeU16* territory_text(const LXObjEntry& entry, TerritoryText text) {
  const TerritoryHeader& header = territory_of(entry);
  return reinterpret_cast<const BeU16*>(reinterpret_cast<const uint8_t*>(&header) +
                                        header.text_offsets[static_cast<unsigned>(text)]);
}

inline bool is_loaded_code_page(const LXObjEntry* entry) {
  return entry != nullptr && entry->type == LX_CODEPAGE && entry->loaded();
}

inline const CodePage& code_page_of(const LXObjEntry& entry) { return *entry.code_page; }

}  // namespace lx
