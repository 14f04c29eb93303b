// SPDX-License-Identifier: Apache-2.0
#include "field_file.hpp"

namespace lx::compiler {

std::string object_name(Cursor& cursor) {
  Spot start = cursor.spot();
  std::string name = cursor.word("a name");
  cursor.end();
  if (name.size() > 32) throw SourceError(start, "the name is longer than 32 characters");
  if (name.find_first_of("_.@") != std::string::npos)
    throw SourceError(start, "a name cannot contain \"_\", \".\" or \"@\"");
  return name;
}

std::u16string read_text(Cursor& cursor) {
  bool quoted = cursor.accept("\"");
  if (!quoted && (cursor.done() || cursor.peek() == U' '))
    cursor.fail("text that is empty or begins with a blank needs quotes");
  std::u16string text;
  while (!cursor.done() && !(quoted && cursor.peek() == U'"')) {
    Spot spot = cursor.spot();
    char32_t c = cursor.next();
    if (c == U'\\') {
      if (cursor.accept("u")) {
        c = cursor.unicode_escape();
        if (c == 0) throw SourceError(spot, "a text cannot contain U+0000");
      } else if (cursor.peek() == U'\\' || cursor.peek() == U'"') {
        c = cursor.next();
      } else {
        throw SourceError(spot, "an unknown escape: \\uXXXX, \\\\ and \\\" are known");
      }
    } else if (must_be_escaped(c)) {
      throw SourceError(spot, tool::message("{0} must be written as an escape", unicode_name(c)));
    } else if (c > 0xFFFF) {
      throw SourceError(spot, "only characters up to U+FFFF are possible");
    }
    if (!quoted && cursor.done() && c == U' ') throw SourceError(spot, "text that ends in a blank needs quotes");
    text.push_back(static_cast<char16_t>(c));
  }
  if (quoted) cursor.expect(U'"');
  cursor.end();
  return text;
}

std::string write_text(const std::u16string& text, bool quoted) {
  quoted = quoted || text.empty() || text.front() == u' ' || text.back() == u' ' || text.front() == u'"';
  std::string out;
  for (char16_t c : text) {
    if (c == u'\\' || (c == u'"' && quoted)) {
      out.push_back('\\');
      out.push_back(static_cast<char>(c));
    } else if (must_be_escaped(c) || c < u' ') {
      out += "\\u" + hex_text(c, 4);
    } else {
      append_utf8(out, c);
    }
  }
  return quoted ? "\"" + out + "\"" : out;
}

FieldFile::FieldFile(const SourceFile& source, const std::set<std::string>& repeatable, Report& report)
    : source_(source), report_(report), repeatable_(repeatable) {
  source.for_each_line(report, [this](Cursor& cursor) {
    Spot start = cursor.spot();
    std::string key = cursor.word("a key");
    cursor.expect(U' ');
    cursor.expect(U'=');
    cursor.expect(U' ');
    auto& values = fields_[key];
    if (!values.empty() && repeatable_.count(key) == 0)
      throw SourceError(start, tool::message("\"{0}\" is given twice", key));
    spots_.emplace(key, cursor.spot());
    values.push_back({cursor.line(), cursor.spot().column - 1});
  });
}

void FieldFile::read(const std::string& key, const std::function<void(Cursor&)>& read, bool optional) {
  auto field = fields_.find(key);
  if (field == fields_.end()) {
    if (!optional && repeatable_.count(key) == 0) {
      report_.error(source_.name(), source_.end(), tool::message("\"{0}\" is missing", key));
    }
    return;
  }
  for (const Field& value : field->second) {
    try {
      Cursor cursor(value.line, value.value);
      read(cursor);
    } catch (const SourceError& error) {
      report_.error(source_.name(), error);
    }
  }
  fields_.erase(field);
}

uint16_t FieldFile::number(const std::string& key, unsigned largest) {
  unsigned number = 0;
  read(key, [&](Cursor& cursor) {
    number = cursor.decimal(largest);
    cursor.end();
  });
  return static_cast<uint16_t>(number);
}

std::u16string FieldFile::text(const std::string& key, bool optional) {
  std::u16string text;
  read(
      key, [&](Cursor& cursor) { text = read_text(cursor); }, optional);
  return text;
}

std::string FieldFile::name(const std::string& key) {
  std::string name;
  read(key, [&](Cursor& cursor) { name = object_name(cursor); });
  return name;
}

void FieldFile::end() {
  for (const auto& [key, values] : fields_) {
    for (const Field& value : values) {
      report_.error(source_.name(), {value.line.number, 1}, tool::message("unknown key \"{0}\"", key));
    }
  }
}

}  // namespace lx::compiler
