// SPDX-License-Identifier: Apache-2.0
// The records that callers hold by pointer: plain fields that every folder may look at.
#pragma once

#include <lexaro/host.h>
#include <lexaro/lexaro.h>

#include <atomic>

namespace lx {

struct CodePage;   // native tables of a code page, objects/code_page.hpp
class SortTables;  // of a sort object, objects/sort_object.hpp
struct Alias;      // objects/aliases.hpp

inline constexpr unsigned kObjectTypes = 4;

// Flags of a directory entry: data that is part of the library, and sections made by the version-1 converter.
inline constexpr uint8_t kEntryBuiltIn = 0x01;
inline constexpr uint8_t kEntryConverted[] = {0x02, 0x04, 0x08, 0x10};

// Locale flags (LXLocale::flags). The first six are the locale's copies of the territory's yes/no settings.
inline constexpr uint16_t kLocalePositivePrecedes = 0x001;
inline constexpr uint16_t kLocalePositiveSpaced = 0x002;
inline constexpr uint16_t kLocaleNegativePrecedes = 0x004;
inline constexpr uint16_t kLocaleNegativeSpaced = 0x008;
inline constexpr uint16_t kLocaleYesNo82 = 0x010;
inline constexpr uint16_t kLocaleYesNo83 = 0x020;
inline constexpr uint16_t kLocaleSingleByte = 0x040;  // every character of the code page is one byte
inline constexpr uint16_t kLocaleBinarySort = 0x080;
inline constexpr uint16_t kLocaleShiftSensitive = 0x100;

// The numbers, separators and strings that a locale has copies of, in the order of its fields.
inline constexpr unsigned kLocaleNumbers = 5;
inline constexpr unsigned kLocaleSeparators = 5;
inline constexpr unsigned kLocaleStrings = 8;

}  // namespace lx

struct LXGlobals {
  void* allocation_context;
  std::atomic<uint16_t> init_count;
  HSV1_Lock lock;
  uint32_t file_access_mode;
  LXObjMgr* manager;
  uint32_t alignment;
  char directory_separator[2];
  char name_separator[2];
};

struct LXObjEntry {
  uint16_t id;
  uint8_t type;
  uint8_t flags;
  char name[34];
  // Section 1 is published last: a reader that sees it sees everything else of the entry too.
  std::atomic<const uint8_t*> section1;
  const uint8_t* more_sections[3];
  const lx::CodePage* code_page;
  const lx::SortTables* sort;
  const LXUChar* const* texts;  // of a language or territory, in machine order: see objects/entry.hpp

  bool loaded() const { return section1.load(std::memory_order_acquire) != nullptr; }
};

// Places for the code page pairs that a manager was asked for, each a block of its own (nls1/translate.cpp).
namespace lx {
inline constexpr unsigned kPairPlaces = 64;
}

struct LXObjMgr {
  LXObjEntry* entries;
  uint16_t first[lx::kObjectTypes + 1];  // entries of type t: [first[t], first[t + 1])
  uint8_t no_defaults;
  char directory[256];  // empty on built-in data
  lx::Alias* aliases;
  uint32_t alias_count;
  char* alias_text;
  std::atomic<const void*> pairs[lx::kPairPlaces];
  bool built_in;         // the entries are those of the library itself
  LXObjEntry* replaced;  // what these took the place of; locales may still point there
  uint16_t replaced_count;
};

struct LXLocale {
  LXObjEntry* language;
  LXObjEntry* territory;
  LXObjEntry* code_page;
  LXObjEntry* sort;  // null: binary
  uint32_t set_mask;
  uint16_t numbers[lx::kLocaleNumbers];
  uint16_t flags;
  char separators[lx::kLocaleSeparators];
  char* strings[lx::kLocaleStrings];  // in the locale's code page
  uint16_t mirror_bits;               // which strings have a current UCS-2 copy
  LXUChar ucs2_separators[lx::kLocaleSeparators];
  LXUChar* ucs2_strings[lx::kLocaleStrings];
  uint32_t last_error;
};
