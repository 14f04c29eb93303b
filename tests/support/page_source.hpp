// SPDX-License-Identifier: Apache-2.0
// A code page as its readable source states it, looked up the slow and obvious way: what the library is checked
// against. It shares no code with the library or the compiler.
#pragma once

#include <array>
#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace lx::test {

inline constexpr uint16_t kNoCharacter = 0xFFFD;

class PageSource {
 public:
  enum class Kind { single, multibyte, mixed, utf8 };

  // data/codepage/cp_NNNNN.txt; throws std::runtime_error.
  explicit PageSource(const std::string& file);
  static std::vector<std::string> all_files();
  // The shipped page of that number, read once.
  static const PageSource& of(uint16_t id);

  uint16_t id = 0;
  std::string name;
  bool ascii_family = false;
  Kind kind = Kind::single;
  uint8_t substitution = 0;
  std::array<uint8_t, 4> line_ends = {};
  uint8_t enter = 0;
  uint8_t leave = 0;
  uint8_t max_length = 1;
  std::array<uint8_t, 256> lengths = {};  // by first byte; 0: begins no character

  bool mixed() const { return kind == Kind::mixed; }
  size_t length_of(uint8_t first) const { return lengths[first] == 0 ? 1 : lengths[first]; }
  // The character of these bytes, all of them; U+FFFD when they are none.
  uint16_t decode(std::string_view bytes) const;
  // The bytes of a character, or the substitution byte.
  std::string encode(uint16_t unicode) const;
  bool has(uint16_t unicode) const;
  // All codes of more than one byte, in order.
  std::vector<std::string> long_codes() const;

 private:
  void read_line(std::string_view line);
  void read_row(std::string_view codes, std::string_view characters);
  void add(const std::string& code, uint32_t unicode);
  void finish();

  std::map<std::string, uint16_t, std::less<>> to_unicode_;
  std::vector<std::string> from_unicode_;
  std::array<uint16_t, 256> one_ = {};
  std::vector<uint16_t> two_;
};

// The bytes as one big-endian number, and the bytes of such a number without its leading zeros.
uint32_t packed(std::string_view bytes);
std::string unpacked(uint32_t value);
std::string hex(std::string_view bytes);

}  // namespace lx::test
