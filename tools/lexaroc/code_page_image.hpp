// SPDX-License-Identifier: Apache-2.0
// A compiled code page, in either layout, as one kind of tables.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "code_page.hpp"
#include "object_file.hpp"

namespace lx::compiler {

// One step of either walk over the bytes of a character.
struct Step {
  bool final;
  uint8_t mask, low, high;
  uint16_t index;
};

struct CodePageImage {
  uint16_t id = 0;
  bool bounded = true;    // the states of the to-Unicode walk have bounds
  CodePageHeader header;  // offsets are those of the file
  std::string_view section1, values, high_parts;
  std::vector<Step> states;  // to-Unicode walk
  std::vector<uint16_t> to_unicode;
  std::vector<Step> type_states;
  std::vector<TypeEntry> type_entries;  // all that lies behind the start of the table

  bool multibyte() const { return header.max_length > 1; }
  bool by_rule() const { return id == kUtf8Id; }
  bool mixed() const { return multibyte() && (header.flags & kShiftSensitive) != 0; }
};

// Finds the tables and checks the header. The image looks into `file`. Throws StructureError.
CodePageImage read_code_page_image(const ObjectFile& file, uint16_t id);

// Proves that no walk over any bytes leaves the tables. Throws StructureError.
void check_code_page_image(const CodePageImage& image);

// The mapping of a checked image. Characters that no code page source could state are left out.
CodePage unpack_code_page(const CodePageImage& image);

}  // namespace lx::compiler
