// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <array>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "objects/text_format.hpp"
#include "source_text.hpp"

namespace lx::compiler {

// A row of a language's special case lists; the second character of either side is 0 when there is none.
struct SpecialRow {
  uint16_t key[2] = {};
  uint16_t value[2] = {};
};

struct Language {
  uint16_t id = 0;
  std::string name;
  uint16_t default_territory = 0, default_code_page = 0, default_sort = 0;
  std::array<std::u16string, kLanguageTexts> texts;
  std::vector<SpecialRow> upper_special, lower_special;

  std::string file;
  std::map<std::string, Spot> spots;  // of the values, by key
};

// Keys of the text slots, in their order.
const std::array<std::string, kLanguageTexts>& language_text_keys();

std::optional<Language> read_language(const SourceFile& source, Report& report);
std::string write_language(const Language& language);

// Section 1 of the object.
std::string pack_language(const Language& language);
// The reverse, without id and name; throws StructureError.
Language unpack_language(std::string_view section);

}  // namespace lx::compiler
