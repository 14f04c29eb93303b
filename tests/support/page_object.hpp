// SPDX-License-Identifier: Apache-2.0
// A compiled code page object, read by the offsets of its format: slow, obvious, and without code of the library.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <utility>

namespace lx::test {

class PageObject {
 public:
  explicit PageObject(const std::string& file);

  // Flags and case delta of a multibyte character.
  std::pair<uint32_t, int32_t> type(std::string_view bytes) const;
  // The other width; 0: none.
  uint32_t full_width(uint32_t half) const;
  uint32_t half_width(uint32_t full) const;

 private:
  uint8_t byte(size_t at) const { return static_cast<uint8_t>(section_.at(at)); }
  uint16_t u16(size_t at) const { return static_cast<uint16_t>(byte(at) << 8 | byte(at + 1)); }
  uint32_t u32(size_t at) const { return static_cast<uint32_t>(u16(at)) << 16 | u16(at + 2); }

  std::string section_;  // the first
  std::map<uint32_t, uint32_t> full_;
  std::map<uint32_t, uint32_t> half_;
};

}  // namespace lx::test
