// SPDX-License-Identifier: Apache-2.0
// What the library knows about UCS-2 characters, from the sources in unicode/.
#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "files.hpp"
#include "report.hpp"

namespace lx::compiler {

inline constexpr uint32_t kUpper = 0x002;  // bits of the type word
inline constexpr uint32_t kLower = 0x004;
inline constexpr uint32_t kDigit = 0x008;

// One of the arrays that the library exports: what it says about each character, beginning with `first`.
struct UnicodeArray {
  std::string name;
  uint16_t first;
  std::vector<uint32_t> values;
};

class UnicodeTables {
 public:
  // Reads ctype.txt, case.txt, width.txt and digits.txt.
  static UnicodeTables read(const fs::path& directory, Report& report);

  uint32_t type(uint16_t unicode) const { return type_[unicode]; }
  // Mapped characters; the character itself where nothing changes.
  uint16_t lower(uint16_t unicode) const { return lower_[unicode]; }
  uint16_t upper(uint16_t unicode) const { return upper_[unicode]; }
  uint16_t full_width(uint16_t unicode) const { return full_width_[unicode]; }

  std::vector<UnicodeArray> type_arrays() const;
  std::vector<UnicodeArray> map_arrays() const;  // of case and width
  // Digits in ascending order, each with the ASCII digit that it stands for.
  const std::vector<std::array<uint16_t, 2>>& digits() const { return digits_; }

 private:
  UnicodeTables();
  void read_types(const fs::path& path, Report& report);
  void read_cases(const fs::path& path, Report& report);
  void read_widths(const fs::path& path, Report& report);
  void read_digits(const fs::path& path, Report& report);

  std::vector<uint32_t> type_;
  std::vector<uint16_t> lower_, upper_, full_width_, half_width_;
  std::vector<std::array<uint16_t, 2>> digits_;
};

}  // namespace lx::compiler
