// SPDX-License-Identifier: Apache-2.0
// Languages and territories as their readable sources state them: what the library's items are checked against. It
// shares no code with the library or the compiler.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace lx::test {

class LocaleSource {
 public:
  // The shipped object of that type (LX_LANGUAGE or LX_TERRITORY) and name; throws std::out_of_range.
  static const LocaleSource& of(uint8_t type, std::string_view name);
  // Id of a shipped object of any type; name of a shipped object.
  static uint16_t id_of(uint8_t type, std::string_view name);
  static std::string name_of(uint8_t type, uint16_t id);

  // data/language/la_NNNNN.txt or data/territory/te_NNNNN.txt
  LocaleSource(uint8_t type, const std::string& file);

  uint8_t type;
  uint16_t id = 0;
  std::string name;
  // The text or number that the object has for an item.
  std::optional<std::u16string> text(uint32_t item) const;
  std::optional<int32_t> number(uint32_t item) const;
  uint16_t default_id(uint8_t of_type) const;

 private:
  int32_t number_of(const std::string& key) const;

  std::map<std::string, std::u16string> values_;
};

std::u16string utf16(std::string_view utf8);

}  // namespace lx::test
