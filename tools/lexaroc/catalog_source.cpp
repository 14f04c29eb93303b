// SPDX-License-Identifier: Apache-2.0
#include "catalog_source.hpp"

#include <set>
#include <utility>

#include "source_text.hpp"

namespace lx::compiler {

namespace {

constexpr unsigned kLargestNumber = INT32_MAX;
constexpr uint32_t kDefaultSet = 1;  // of messages that stand before the first $set
constexpr std::u32string_view kEscapes = U"ntvbrf";
constexpr std::u32string_view kEscaped = U"\n\t\v\b\r\f";

bool is_blank(char32_t c) { return c == U' ' || c == U'\t'; }
bool is_digit(char32_t c) { return c >= U'0' && c <= U'9'; }
bool is_octal(char32_t c) { return c >= U'0' && c <= U'7'; }
bool is_identifier(std::string_view word) {
  constexpr std::string_view kLetters = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz_";
  return kLetters.find(word[0]) != word.npos &&
         word.find_first_not_of(std::string(kLetters) + "0123456789") == word.npos;
}

std::vector<Line> split_lines(const std::string& file, std::string_view source, Report& report) {
  std::vector<Line> lines;
  for (unsigned number = 1; !source.empty(); ++number) {
    size_t end = source.find('\n');
    std::string_view bytes = source.substr(0, end);
    source.remove_prefix(end == source.npos ? source.size() : end + 1);
    if (!bytes.empty() && bytes.back() == '\r') bytes.remove_suffix(1);
    bool valid = true;
    lines.push_back({number, decode_utf8(bytes, valid)});
    if (!valid) {
      report.error(file, {number, static_cast<unsigned>(lines.back().text.size()) + 1}, "bytes that are not UTF-8");
    }
  }
  return lines;
}

class CatalogParser {
 public:
  CatalogParser(const CatalogText& text, Catalog& catalog) : text_(text), catalog_(catalog) {}

  std::vector<CatalogName> names;

  // Reads the line, and those that continue it.
  void read(const std::vector<Line>& lines, size_t& at) {
    Cursor cursor(lines[at]);
    if (cursor.accept("$")) {
      read_directive(cursor);
    } else if (is_digit(cursor.peek())) {
      read_message(cursor, lines, at);
    } else {
      cursor.skip_blanks();
      if (!cursor.done()) cursor.fail("expected a directive or the number of a message");
    }
  }

 private:
  void read_directive(Cursor& cursor) {
    if (cursor.done() || is_blank(cursor.peek())) {
      skip(cursor);
      Spot spot = cursor.spot();
      if (cursor.accept("@")) pending_name_ = {identifier(cursor), 0, spot};
      return;
    }
    Spot spot = cursor.spot();
    std::string word = cursor.word("a directive");
    skip(cursor);
    if (word == "set") {
      open_set(cursor);
    } else if (word == "delset") {
      catalog_.sets.erase(cursor.decimal(kLargestNumber));
    } else if (word == "quote") {
      quote_ = cursor.done() ? 0 : cursor.next();
    } else {
      throw SourceError(spot, "an unknown directive: $set, $delset and $quote are known");
    }
  }
  static void skip(Cursor& cursor) {
    while (is_blank(cursor.peek())) cursor.next();
  }
  static std::string identifier(Cursor& cursor) {
    Spot spot = cursor.spot();
    std::string word = cursor.word("a name");
    if (!is_identifier(word)) throw SourceError(spot, "a name is letters, digits and \"_\"");
    return word;
  }

  void open_set(Cursor& cursor) {
    Spot spot = cursor.spot();
    uint32_t number = positive(cursor);
    if (number <= set_) throw SourceError(spot, "set numbers must ascend");
    set_ = number;
    message_ = 0;
    catalog_.sets[number];
    skip(cursor);
    if (cursor.done()) return;
    // A comment of one word is a name, if it can be one.
    Spot name_spot = cursor.spot();
    std::string comment;
    while (!cursor.done()) append_utf8(comment, cursor.next());
    if (is_identifier(comment)) names.push_back({comment, number, name_spot});
  }
  static uint32_t positive(Cursor& cursor) {
    Spot spot = cursor.spot();
    uint32_t number = cursor.decimal(kLargestNumber);
    if (number == 0) throw SourceError(spot, "numbers begin with 1");
    return number;
  }

  void read_message(Cursor& cursor, const std::vector<Line>& lines, size_t& at) {
    Spot spot = cursor.spot();
    uint32_t number = positive(cursor);
    if (number <= message_) throw SourceError(spot, "message numbers must ascend");
    message_ = number;
    if (set_ == 0) set_ = kDefaultSet;
    CatalogMessages& messages = catalog_.sets[set_];
    if (!pending_name_.name.empty()) {
      pending_name_.number = number;
      names.push_back(std::exchange(pending_name_, {}));
    }
    if (cursor.done()) {
      messages.erase(number);
      return;
    }
    if (!is_blank(cursor.peek())) cursor.fail("expected a blank");
    cursor.next();
    messages[number] = text_.encode(read_text(cursor, lines, at));
  }

  MessageParts read_text(Cursor& cursor, const std::vector<Line>& lines, size_t& at) const {
    MessageParts parts;
    bool quoted = quote_ != 0 && cursor.peek() == quote_;
    if (quoted) cursor.next();
    for (;;) {
      if (cursor.done()) break;
      Spot spot = cursor.spot();
      char32_t c = cursor.next();
      if (quoted && c == quote_) {
        quoted = false;
        skip(cursor);
        if (!cursor.done()) cursor.fail("expected the end of the line");
        break;
      }
      if (c != U'\\') {
        parts.push_back({c, false, spot});
      } else if (!cursor.done()) {
        parts.push_back(escape(cursor, spot));
      } else if (at + 1 < lines.size()) {
        cursor = Cursor(lines[++at]);
      } else {
        throw SourceError(spot, "the line is continued, but none follows");
      }
    }
    if (quoted) cursor.fail("the closing quote is missing");
    return parts;
  }
  static MessagePart escape(Cursor& cursor, Spot spot) {
    char32_t c = cursor.next();
    if (size_t known = kEscapes.find(c); known != kEscapes.npos) return {kEscaped[known], false, spot};
    if (!is_octal(c)) return {c, false, spot};
    unsigned value = c - U'0';
    for (int i = 0; i < 2 && is_octal(cursor.peek()); ++i) value = value * 8 + (cursor.next() - U'0');
    if (value > 0xFF) throw SourceError(spot, "a byte is at most \\377");
    return {value, true, spot};
  }

  const CatalogText& text_;
  Catalog& catalog_;
  uint32_t set_ = 0;
  uint32_t message_ = 0;
  char32_t quote_ = 0;
  CatalogName pending_name_{};
};

std::string source_text(const MessageParts& parts) {
  std::string out = "\"";
  for (const MessagePart& part : parts) {
    if (part.is_byte) {
      out += '\\';
      for (unsigned shift : {6u, 3u, 0u}) out += static_cast<char>('0' + (part.value >> shift & 7));
    } else if (size_t known = kEscaped.find(part.value); known != kEscaped.npos) {
      out += '\\';
      append_utf8(out, kEscapes[known]);
    } else {
      if (part.value == U'\\' || part.value == U'"') out += '\\';
      append_utf8(out, part.value);
    }
  }
  return out + "\"";
}

}  // namespace

std::vector<CatalogName> read_catalog_source(const std::string& file, std::string_view source, const CatalogText& text,
                                             Catalog& catalog, Report& report) {
  std::vector<Line> lines = split_lines(file, source, report);
  CatalogParser parser(text, catalog);
  if (!report.clean()) return {};
  for (size_t at = 0; at < lines.size(); ++at) {
    try {
      parser.read(lines, at);
    } catch (const SourceError& error) {
      report.error(file, error);
    }
  }
  if (catalog.sets.empty()) report.error(file, "the catalog would have no sets");
  return std::move(parser.names);
}

std::string write_catalog_source(const Catalog& catalog, const CatalogText& text) {
  std::string out = "$ locale " + catalog.locale + "\n$quote \"\n";
  for (const auto& [set, messages] : catalog.sets) {
    out += "$set " + std::to_string(set) + "\n";
    for (const auto& [number, bytes] : messages) {
      out += std::to_string(number) + " " + source_text(text.decode(bytes)) + "\n";
    }
  }
  return out;
}

std::string write_catalog_header(const std::vector<CatalogName>& names, const std::string& file, Report& report) {
  std::string out = "#pragma once\n\n";
  std::set<std::string> known;
  for (const CatalogName& name : names) {
    if (!known.insert(name.name).second)
      report.error(file, name.spot, tool::message("the name {0} is given twice", name.name));
    out += "#define " + name.name + " " + std::to_string(name.number) + "\n";
  }
  return out;
}

}  // namespace lx::compiler
