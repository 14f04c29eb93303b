// SPDX-License-Identifier: Apache-2.0
// Sources made of "key = value" lines: languages and territories.
#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "source_text.hpp"

namespace lx::compiler {

// The rest of the line as an object's name: 1 to 32 printable ASCII characters without the signs that separate the
// parts of a locale name.
std::string object_name(Cursor& cursor);

class FieldFile {
 public:
  // `repeatable` keys may stand on several lines.
  FieldFile(const SourceFile& source, const std::set<std::string>& repeatable, Report& report);

  // Each value is read once, at a cursor behind "key = "; what `read` throws goes to the report. A key that is not
  // there is reported unless it is optional or repeatable.
  void read(const std::string& key, const std::function<void(Cursor&)>& read, bool optional = false);
  uint16_t number(const std::string& key, unsigned largest = 65535);
  std::u16string text(const std::string& key, bool optional = false);
  std::string name(const std::string& key);
  // Reports the keys that nobody has asked for.
  void end();

  const std::map<std::string, Spot>& spots() const { return spots_; }  // of the values

 private:
  struct Field {
    Line line;
    size_t value;  // index of its first character
  };
  const SourceFile& source_;
  Report& report_;
  std::set<std::string> repeatable_;
  std::map<std::string, std::vector<Field>> fields_;
  std::map<std::string, Spot> spots_;
};

// The rest of the line: plain text, or text in quotes when it is empty or has blanks at its ends. Escapes: \\ \"
// \uXXXX.
std::u16string read_text(Cursor& cursor);
std::string write_text(const std::u16string& text, bool quoted = false);

}  // namespace lx::compiler
