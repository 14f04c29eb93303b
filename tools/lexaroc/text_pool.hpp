// SPDX-License-Identifier: Apache-2.0
// The texts behind the header of a language or territory: zero-terminated UCS-2, each different one once.
#pragma once

#include <map>
#include <string>
#include <string_view>

#include "object_file.hpp"
#include "pack_pool.hpp"

namespace lx::compiler {

class TextPool {
 public:
  // `start`: offset of the pool in its section.
  explicit TextPool(size_t start) : start_(start) {}

  uint16_t place(const std::u16string& text) {
    auto [found, added] = offsets_.emplace(text, start_ + bytes_.size());
    if (found->second > kLargestSection) throw PackError("the texts are too long");
    if (added) {
      for (char16_t c : text) bytes_ += bytes_of(BeU16(c));
      bytes_ += bytes_of(BeU16(0));
    }
    return static_cast<uint16_t>(found->second);
  }
  const std::string& bytes() const { return bytes_; }

 private:
  size_t start_;
  std::string bytes_;
  std::map<std::u16string, size_t> offsets_;
};

// Throws StructureError when the text does not end inside the section.
inline std::u16string text_at(std::string_view section, size_t offset) {
  std::u16string text;
  for (;; offset += sizeof(BeU16)) {
    uint16_t c = record_at<BeU16>(section, offset);
    if (c == 0) return text;
    text.push_back(c);
  }
}

}  // namespace lx::compiler
