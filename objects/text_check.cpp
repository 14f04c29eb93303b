// SPDX-License-Identifier: Apache-2.0
#include "objects/text_check.hpp"

namespace lx {
namespace {

bool terminated(const SectionBytes& section, uint32_t offset) {
  for (; offset + 2 <= section.size; offset += 2) {
    if (section.data[offset] == 0 && section.data[offset + 1] == 0) return true;
  }
  return false;
}

// The offset of a special list stands behind the texts' offsets, but only when the list has rows.
bool special_list_fits(const SectionBytes& section, unsigned slot, uint32_t rows) {
  if (rows == 0) return true;
  uint32_t slot_at = static_cast<uint32_t>(offsetof(LanguageHeader, text_offsets)) + slot * 2;
  if (slot_at + 2 > section.size) return false;
  uint32_t offset = *reinterpret_cast<const BeU16*>(section.data + slot_at);
  return offset + rows * sizeof(SpecialPair) <= section.size;
}

}  // namespace

const char* check_language(const SectionBytes& section) {
  if (section.size < sizeof(LanguageHeader)) return "section 1 size";
  const auto& header = *reinterpret_cast<const LanguageHeader*>(section.data);
  for (uint32_t offset : header.text_offsets) {
    if (!terminated(section, offset)) return "text offset";
  }
  if (!special_list_fits(section, kUpperSpecialSlot, header.upper_special_count)) return "upper-case special list";
  if (!special_list_fits(section, kLowerSpecialSlot, header.lower_special_count)) return "lower-case special list";
  return nullptr;
}

const char* check_territory(const SectionBytes& section) {
  if (section.size < sizeof(TerritoryHeader)) return "section 1 size";
  for (uint32_t offset : reinterpret_cast<const TerritoryHeader*>(section.data)->text_offsets) {
    if (!terminated(section, offset)) return "text offset";
  }
  return nullptr;
}

}  // namespace lx
