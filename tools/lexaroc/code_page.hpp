// SPDX-License-Identifier: Apache-2.0
// A code page as its source states it: which bytes stand for which character.
#pragma once

#include <array>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "objects/code_page_format.hpp"
#include "report.hpp"

namespace lx::compiler {

// The bytes of one character, packed with the first byte in the highest place. No byte of a longer character is zero,
// so the value tells the length.
using Code = uint32_t;
inline constexpr Code kNoCode = 0xFFFFFFFF;

inline constexpr unsigned code_length(Code code) {
  return code < 0x100 ? 1 : code < 0x10000 ? 2 : code < 0x1000000 ? 3 : 4;
}
inline constexpr uint8_t code_byte(Code code, unsigned length, unsigned index) {
  return static_cast<uint8_t>(code >> 8 * (length - 1 - index));
}

enum class Family { ascii, ebcdic };
enum class PageKind { single, multibyte, mixed, utf8 };

struct CodePage {
  uint16_t id = 0;
  std::string name;
  Family family = Family::ascii;
  PageKind kind = PageKind::single;
  uint8_t substitution = 0;
  std::array<uint8_t, 4> line_bytes = {};
  uint8_t enter_byte = 0;  // of mixed pages
  uint8_t leave_byte = 0;

  std::map<Code, uint16_t> to_unicode;
  std::vector<Code> from_unicode = std::vector<Code>(65536, kNoCode);

  std::string file;  // where it was read, and its line with the name, for messages
  Spot spot;

  bool mixed() const { return kind == PageKind::mixed; }
  unsigned max_length() const;
  // Unicode value of a code, kUnassigned when it is no character.
  uint16_t unicode_of(Code code) const;
  // The code of a Unicode value that goes both ways, or kNoCode.
  Code exact_code(uint16_t unicode) const;
};

// The code that is written for a Unicode value when the source says nothing else: the shortest, then the lowest.
std::map<uint16_t, Code> default_codes(const std::map<Code, uint16_t>& to_unicode);

// Fills the tables of a page whose characters follow from the rule of UTF-8.
void fill_utf8(CodePage& page);

// Multibyte characters by their bytes. A node either leads to more bytes or ends characters.
template <class T>
struct ByteTree {
  std::map<uint8_t, std::unique_ptr<ByteTree>> branches;
  std::map<uint8_t, T> leaves;

  void insert(Code code, const T& value) {
    ByteTree* node = this;
    unsigned length = code_length(code);
    for (unsigned i = 0; i + 1 < length; ++i) {
      auto& branch = node->branches[code_byte(code, length, i)];
      if (!branch) branch = std::make_unique<ByteTree>();
      node = branch.get();
    }
    node->leaves.emplace(code_byte(code, length, length - 1), value);
  }
};

}  // namespace lx::compiler
