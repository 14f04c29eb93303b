// SPDX-License-Identifier: Apache-2.0
// From a code page to the sections of its object file.
#pragma once

#include <vector>

#include "code_page.hpp"
#include "object_file.hpp"
#include "unicode_tables.hpp"

namespace lx::compiler {

enum class Layout { current, version1 };

// Throws PackError when the page does not fit the format.
Sections pack_code_page(const CodePage& page, const UnicodeTables& unicode, Layout layout);

// ---- The steps of it

struct ToUnicodeSection {
  std::string bytes;
  uint16_t array_offset = 0;
};
ToUnicodeSection pack_to_unicode(const CodePage& page, Layout layout);

struct FromUnicodeSections {
  FromUnicodePage pages[256];
  std::string values;      // section 3
  std::string high_parts;  // section 4
};
FromUnicodeSections pack_from_unicode(const CodePage& page);

struct TypeTables {
  std::string states;
  std::string entries;
  // The entry table must be followed by this many bytes in all, whatever they hold: the walk knows no bounds, so bytes
  // that are no character reach beyond the entries.
  size_t reach = 0;
};
TypeTables pack_types(const CodePage& page, const UnicodeTables& unicode);

// Type and case of one character of the page.
uint64_t type_entry(const CodePage& page, const UnicodeTables& unicode, Code code, uint16_t value);

}  // namespace lx::compiler
