// SPDX-License-Identifier: Apache-2.0
// Which columns of a record are text, which are kept as they are, and how wide they become.
#pragma once

#include <cstddef>
#include <cstdint>
#include <limits>
#include <string>
#include <vector>

namespace lx::tool {

inline constexpr std::size_t kEndless = std::numeric_limits<std::size_t>::max();

// Byte columns of an input record, from 1, both ends included.
struct Columns {
  std::size_t first;
  std::size_t last;
};

// "5-8,21-24", in ascending order.
std::vector<Columns> parse_columns(const std::string& text);

struct Piece {
  bool kept;
  std::size_t begin;  // from 0
  std::size_t width;
  std::size_t to_width;
};

struct RecordLayout {
  std::vector<Piece> pieces;
  bool padded;        // all records become equally long; else the text at a record's end takes the room that it needs
  std::size_t limit;  // bytes of the longest output record

  bool keeps(std::size_t column) const;  // from 0
};

// Records of `length` become records of `to_length` bytes; the last text takes the difference.
RecordLayout fixed_layout(std::size_t length, std::size_t to_length, const std::vector<Columns>& kept);
// Records of any length become records of `limit` bytes at most.
RecordLayout variable_layout(std::size_t limit, const std::vector<Columns>& kept);
// Texts of any length become records of `length` bytes.
RecordLayout padding_layout(std::size_t length);

}  // namespace lx::tool
