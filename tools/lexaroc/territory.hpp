// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <array>
#include <map>
#include <optional>
#include <string>

#include "objects/text_format.hpp"
#include "source_text.hpp"

namespace lx::compiler {

// How an amount is written: the place of the currency symbol and of the sign.
struct AmountForm {
  bool symbol_precedes = false;
  bool symbol_spaced = false;
  uint8_t sign_position = 0;
};

inline constexpr unsigned kSeparators = 5;
inline constexpr const char* kSeparatorKeys[kSeparators] = {"decimal", "thousands", "list", "mon-decimal",
                                                            "mon-thousands"};
inline constexpr const char* kTerritoryTextKeys[kTerritoryTexts] = {
    "abbreviation",  "own-name",      "grouping", "mon-grouping", "currency", "currency-intl",
    "positive-sign", "negative-sign", "time",     "short-date",   "long-date"};

struct Territory {
  uint16_t id = 0;
  std::string name;
  std::array<char16_t, kSeparators> separators = {};  // 0: none
  uint16_t fraction_digits = 0, currency_digits = 0, currency_intl_digits = 0;
  AmountForm positive, negative;
  bool item58 = false, item82 = false, item83 = false;
  uint16_t item84 = 0;
  std::array<std::u16string, kTerritoryTexts> texts;

  const std::u16string& text(TerritoryText which) const { return texts[static_cast<unsigned>(which)]; }

  std::string file;
  std::map<std::string, Spot> spots;  // of the values, by key
};

std::optional<Territory> read_territory(const SourceFile& source, Report& report);
std::string write_territory(const Territory& territory);

// Section 1 of the object.
std::string pack_territory(const Territory& territory);
// The reverse, without id and name; throws StructureError.
Territory unpack_territory(std::string_view section);

}  // namespace lx::compiler
