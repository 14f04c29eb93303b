// SPDX-License-Identifier: Apache-2.0
// The lines of a file, one after the other.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "tools/lexaro/code_page_names.hpp"
#include "tools/lexaro/input_file.hpp"

namespace lx::tool {

inline constexpr std::size_t kLongestLine = std::size_t{64} << 20;

// The bytes that end lines in a code page. A carriage return before them belongs to the line end.
class LineEnds {
 public:
  explicit LineEnds(const CodePage& page);
  bool ends_line(char byte) const { return ends_[static_cast<unsigned char>(byte)]; }
  bool is_return(char byte) const { return byte == carriage_return_; }
  // What ends a line where the text has no example.
  std::string_view usual() const { return {&line_feed_, 1}; }

 private:
  bool ends_[256] = {};
  char line_feed_;
  char carriage_return_;
};

struct Line {
  std::string_view text;
  std::string_view end;  // empty for a last line without line end
};

class LineReader {
 public:
  LineReader(InputFile& input, const LineEnds& ends);
  // False at the end of the file. The line stands until the next call.
  bool next(Line& line);
  uint64_t number() const { return number_; }

 private:
  // More of the file behind what is there; false at its end.
  bool fill();
  Line take(std::size_t length, std::size_t end_length);

  InputFile& input_;
  const LineEnds& ends_;
  std::vector<char> buffer_;
  std::size_t begin_ = 0;  // of the line
  std::size_t end_ = 0;    // of what was read
  uint64_t number_ = 0;
};

}  // namespace lx::tool
