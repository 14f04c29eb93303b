// SPDX-License-Identifier: Apache-2.0
// Text for people: UTF-8 inside the program, the terminal's encoding where it leaves.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "lexaro/lexaro.h"

namespace lx::tool {

std::string utf8_of(const std::vector<LXUChar>& text);
// What is not well-formed, or beyond UCS-2, becomes U+FFFD.
std::vector<LXUChar> ucs2_of(std::string_view utf8);
// Of an argument, which a terminal sends in its own encoding.
std::vector<LXUChar> terminal_ucs2(std::string_view text);

// Columns of a terminal: East Asian wide characters take two, combining ones none.
std::size_t display_width(std::string_view utf8);

// The encoding of the user's terminal.
class Terminal {
 public:
  Terminal();
  // What the terminal lacks, and control characters from data, become "?".
  std::string encode(std::string_view utf8) const;

 private:
  const LXObjEntry* page_;  // null: UTF-8
};

std::string terminal_text(std::string_view utf8);
// Writes it to standard output, once in the program's life.
void print_text(std::string_view utf8);

// A table with columns as wide as their widest cell; columns of numbers stand at the right.
class TextTable {
 public:
  using Row = std::vector<std::string>;

  explicit TextTable(Row headings) { rows_.push_back(std::move(headings)); }
  void add(Row row) { rows_.push_back(std::move(row)); }
  std::string text() const;

 private:
  std::vector<Row> rows_;
};

}  // namespace lx::tool
