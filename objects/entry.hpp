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

// Texts in machine order. The separators of a territory stand behind its other texts.
inline const LXUChar* language_text(const LXObjEntry& entry, unsigned slot) { return entry.texts[slot]; }
inline const LXUChar* territory_text(const LXObjEntry& entry, TerritoryText text) {
  return entry.texts[static_cast<unsigned>(text)];
}
inline const LXUChar* separator_text(const LXObjEntry& entry, unsigned separator) {
  return entry.texts[kTerritoryTexts + separator];
}

inline bool is_loaded_code_page(const LXObjEntry* entry) {
  return entry != nullptr && entry->type == LX_CODEPAGE && entry->loaded();
}

// Forgets the pairs of code pages that the manager keeps. False: a free callback failed.
bool drop_pairs(LXObjMgr& manager);

inline const CodePage& code_page_of(const LXObjEntry& entry) { return *entry.code_page; }
inline const CodePage& page_of(const LXLocale& locale) { return code_page_of(*locale.code_page); }

}  // namespace lx
