// SPDX-License-Identifier: Apache-2.0
// Source text as lines of characters, and a cursor that reads one line strictly.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "report.hpp"

namespace lx::compiler {

struct Line {
  unsigned number;
  std::u32string text;
};

class Cursor {
 public:
  explicit Cursor(const Line& line, size_t at = 0) : line_(&line), at_(at) {}

  const Line& line() const { return *line_; }
  bool done() const { return at_ == line_->text.size(); }
  char32_t peek() const { return done() ? U'\0' : line_->text[at_]; }
  char32_t next() { return line_->text[at_++]; }
  Spot spot() const { return {line_->number, static_cast<unsigned>(at_) + 1}; }
  [[noreturn]] void fail(const tool::Message& message) const { throw SourceError(spot(), message); }

  // Takes the character, or fails.
  void expect(char32_t wanted);
  // Takes the word if it stands here.
  bool accept(std::string_view word);
  // Takes what stands before the next blank, which must be printable ASCII and not empty.
  std::string word(const char* what);
  void skip_blanks();
  // Fails unless the line ends here.
  void end() const;

  unsigned decimal(unsigned largest);
  // Exactly this many digits, upper case.
  uint32_t hex(unsigned digits);
  // Two digits a byte, 1 to 4 bytes, up to the next character that is no digit: the bytes packed. `length` is their
  // number.
  uint32_t hex_bytes(unsigned& length);
  // After a backslash and "u".
  uint16_t unicode_escape();

 private:
  const Line* line_;
  size_t at_;
};

class SourceFile {
 public:
  // Reports what is not clean UTF-8 with lines ended by line feeds, and leaves such lines out.
  SourceFile(std::string name, std::string_view bytes, Report& report);

  const std::string& name() const { return name_; }
  // Comments and blank lines are left out.
  const std::vector<Line>& lines() const { return lines_; }
  // The place after the last line: where something missing is reported.
  Spot end() const { return {line_count_ + 1, 1}; }

  // Calls `read` for each line; what it throws goes to the report and ends that line only.
  void for_each_line(Report& report, const std::function<void(Cursor&)>& read) const;

 private:
  std::string name_;
  std::vector<Line> lines_;
  unsigned line_count_ = 0;
};

// Characters that an editor could damage or hide: controls, blanks other than the space, combining and right-to-left
// characters, private ones, and those that normalisation replaces.
bool must_be_escaped(char32_t c);

// "U+1234" for messages and sources.
std::string unicode_name(uint32_t value);
std::string hex_text(uint32_t value, unsigned digits);
void append_utf8(std::string& out, char32_t c);

}  // namespace lx::compiler
