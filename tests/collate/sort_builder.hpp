// SPDX-License-Identifier: Apache-2.0
// Sort objects made by the tests themselves, from a readable description that the tests can look things up in too.
#pragma once

#include <array>
#include <map>

#include "support/object_builder.hpp"

namespace lx::test {

inline constexpr unsigned kEmptyPage = 1;
inline constexpr unsigned kPrimaryPage = 2;
inline constexpr unsigned kSpecialPage = 4;
inline constexpr unsigned kIsSpecial = 0x8000;
inline constexpr unsigned kExpands = 0x4000;
constexpr unsigned mask_flags(unsigned mask) { return mask << 10; }

struct SortSpec {
  struct Page {
    unsigned flags = kEmptyPage;
    unsigned mask = 0;
    unsigned base = 0;
  };
  struct Entry {
    unsigned weight = 0;
    unsigned secondary = 0;
    unsigned tertiary = 0;
    unsigned flags = 0;
  };
  struct Expansion {
    char16_t character;
    Entry first, second;  // without flags
  };
  struct Combination {
    char16_t first, second;
    Entry entry;
  };

  unsigned default_secondary = 0x20;
  unsigned default_tertiary = 2;
  std::array<Page, 256> pages = {};
  std::map<char16_t, Entry> entries = {};  // of tabulated pages; those left out weigh nothing
  std::vector<Expansion> expansions = {};
  std::vector<Combination> combinations = {};

  Bytes section() const;
  Bytes file() const { return object_file({section()}); }
};

// Every kind of character on a few letters, see the .cpp.
SortSpec test_sort(bool combinations);
inline constexpr uint16_t kPlainSort = 77;      // without combinations
inline constexpr uint16_t kCombiningSort = 78;  // with

// The small directory with both sorts and with the compiled pages UTF-8 and IBM930; Turkish is a third language.
void write_collation_directory(const DataDirectory& directory);

}  // namespace lx::test
