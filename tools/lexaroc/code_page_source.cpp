// SPDX-License-Identifier: Apache-2.0
#include "code_page_source.hpp"

#include <algorithm>
#include <iterator>
#include <set>
#include <vector>

#include "field_file.hpp"

namespace lx::compiler {

namespace {

class CodePageReader {
 public:
  explicit CodePageReader(const SourceFile& source, Report& report) : source_(source), report_(report) {}

  std::optional<CodePage> read();

 private:
  void read_line(Cursor& cursor);
  bool read_header(Cursor& cursor);
  void read_row(Cursor& cursor);
  void read_one_way(Cursor& cursor, bool prefer);
  void put(Spot spot, uint32_t unicode);
  void check_header();
  void check_shape();
  void end_rows();
  void require(bool condition, Spot spot, const tool::Message& message) {
    if (!condition) report_.error(source_.name(), spot, message);
  }

  const SourceFile& source_;
  Report& report_;
  CodePage page_;
  std::set<std::string> seen_;  // header keys
  uint8_t lengths_[256] = {};   // of the characters that a byte begins
  Code next_ = 0;               // code of the next character in the row
  bool row_full_ = false;       // the byte FF has been given out
  bool rows_ended_ = false;
};

uint8_t one_byte(Cursor& cursor) {
  cursor.expect(U' ');
  return static_cast<uint8_t>(cursor.hex(2));
}

bool CodePageReader::read_header(Cursor& cursor) {
  static constexpr std::string_view kKeys[] = {"id", "name", "family", "kind", "substitution", "line-ends", "shift"};
  Cursor start = cursor;
  std::string key = cursor.word("a keyword or bytes");
  if (std::find(std::begin(kKeys), std::end(kKeys), key) == std::end(kKeys)) {
    cursor = start;
    return false;
  }
  if (!page_.to_unicode.empty()) start.fail(tool::message("\"{0}\" must stand before the characters", key));
  if (!seen_.insert(key).second) start.fail(tool::message("\"{0}\" is given twice", key));
  if (key == "id") {
    cursor.expect(U' ');
    page_.id = static_cast<uint16_t>(cursor.decimal(65535));
  } else if (key == "name") {
    cursor.expect(U' ');
    page_.spot = cursor.spot();
    page_.name = object_name(cursor);
  } else if (key == "family") {
    cursor.expect(U' ');
    Spot spot = cursor.spot();
    std::string family = cursor.word("a family");
    if (family != "ascii" && family != "ebcdic") throw SourceError(spot, "the family is ascii or ebcdic");
    page_.family = family == "ascii" ? Family::ascii : Family::ebcdic;
  } else if (key == "kind") {
    static constexpr std::string_view kKinds[] = {"single", "multibyte", "mixed", "utf8"};
    cursor.expect(U' ');
    Spot spot = cursor.spot();
    auto kind = std::find(std::begin(kKinds), std::end(kKinds), cursor.word("a kind"));
    if (kind == std::end(kKinds)) throw SourceError(spot, "the kind is single, multibyte, mixed or utf8");
    page_.kind = static_cast<PageKind>(kind - std::begin(kKinds));
  } else if (key == "substitution") {
    page_.substitution = one_byte(cursor);
  } else if (key == "line-ends") {
    for (uint8_t& byte : page_.line_bytes) byte = one_byte(cursor);
  } else {
    page_.enter_byte = one_byte(cursor);
    Spot spot = cursor.spot();
    page_.leave_byte = one_byte(cursor);
    if (page_.enter_byte == 0 || page_.leave_byte == 0 || page_.enter_byte == page_.leave_byte) {
      throw SourceError(spot, "the shift bytes must differ, and neither is 00");
    }
  }
  cursor.end();
  return true;
}

void CodePageReader::put(Spot spot, uint32_t unicode) {
  auto fail = [&](const tool::Message& message) { throw SourceError(spot, message); };
  if (row_full_) fail("the row runs past the byte FF");
  if (unicode > 0xFFFF) fail("only characters up to U+FFFF are possible");
  if (unicode == kUnassigned) fail("U+FFFD stands for bytes that are no character");
  unsigned length = code_length(next_);
  uint8_t first = code_byte(next_, length, 0);
  if (page_.mixed()) {
    if (length == 1 && (first == page_.enter_byte || first == page_.leave_byte)) fail("a shift byte is no character");
  } else if (lengths_[first] != 0 && lengths_[first] != length) {
    fail(tool::message("the byte {0} begins characters of different length", hex_text(first, 2)));
  }
  lengths_[first] = static_cast<uint8_t>(length);
  if (length > 1 && (next_ & 0xFF) == 0) fail("a later byte of a character cannot be 00");
  if (!page_.to_unicode.emplace(next_, static_cast<uint16_t>(unicode)).second) {
    fail(tool::message("the bytes {0} are given twice", hex_text(next_, 2 * length)));
  }
  row_full_ = (next_ & 0xFF) == 0xFF;
  if (!row_full_) ++next_;
}

void CodePageReader::read_row(Cursor& cursor) {
  Spot start = cursor.spot();
  unsigned length = 0;
  next_ = cursor.hex_bytes(length);
  row_full_ = false;
  if (page_.kind == PageKind::utf8) throw SourceError(start, "the characters of a utf8 page follow from its rule");
  unsigned longest = page_.kind == PageKind::single ? 1 : page_.kind == PageKind::mixed ? 2 : 4;
  if (length > longest) throw SourceError(start, "too many bytes for a page of this kind");
  if (length > 1 && code_length(next_) != length) throw SourceError(start, "the first byte of several cannot be 00");
  for (unsigned i = 1; i + 1 < length; ++i) {
    if (code_byte(next_, length, i) == 0) throw SourceError(start, "a later byte of a character cannot be 00");
  }
  cursor.expect(U' ');
  if (cursor.done()) cursor.fail("expected characters");
  while (!cursor.done()) {
    Spot spot = cursor.spot();
    char32_t c = cursor.next();
    if (c != U'\\') {
      if (c == U' ' || must_be_escaped(c))
        throw SourceError(spot, tool::message("{0} must be written as an escape", unicode_name(c)));
      put(spot, c);
    } else if (cursor.accept("u")) {
      put(spot, cursor.unicode_escape());
    } else if (cursor.accept("{")) {
      uint16_t first = cursor.unicode_escape();
      cursor.expect(U'-');
      uint16_t last = cursor.unicode_escape();
      cursor.expect(U'}');
      if (last <= first || (first < 0xD800 && last > 0xDFFF)) throw SourceError(spot, "the range is empty or too wide");
      for (uint32_t unicode = first; unicode <= last; ++unicode) put(spot, unicode);
    } else if (cursor.accept("-")) {
      unsigned holes = 1;
      if (cursor.accept("{")) {
        holes = cursor.decimal(255);
        cursor.expect(U'}');
      }
      if (row_full_ || (next_ & 0xFF) + holes > 0x100) throw SourceError(spot, "the row runs past the byte FF");
      row_full_ = (next_ & 0xFF) + holes == 0x100;
      if (!row_full_) next_ += holes;
    } else {
      throw SourceError(spot, "an unknown escape: \\uXXXX, \\{XXXX-XXXX}, \\- and \\-{N} are known");
    }
  }
}

void CodePageReader::end_rows() {
  if (rows_ended_) return;
  rows_ended_ = true;
  for (auto [unicode, code] : default_codes(page_.to_unicode)) page_.from_unicode[unicode] = code;
}

void CodePageReader::read_one_way(Cursor& cursor, bool prefer) {
  end_rows();
  cursor.expect(U' ');
  Spot start = cursor.spot();
  cursor.expect(U'U');
  cursor.expect(U'+');
  uint16_t unicode = cursor.unicode_escape();
  cursor.expect(U' ');
  Spot spot = cursor.spot();
  unsigned length = 0;
  Code code = cursor.hex_bytes(length);
  cursor.end();
  if (code_length(code) != length || page_.unicode_of(code) == kUnassigned) {
    throw SourceError(spot, "these bytes are no character of the page");
  }
  Code& current = page_.from_unicode[unicode];
  if (prefer) {
    if (page_.unicode_of(code) != unicode) throw SourceError(spot, "the bytes stand for another character");
    if (current == code) throw SourceError(spot, "these bytes are taken anyway");
  } else {
    if (current != kNoCode) throw SourceError(start, "the character has bytes already");
    if (code == page_.substitution) throw SourceError(spot, "characters without bytes become the substitution anyway");
  }
  current = code;
}

void CodePageReader::read_line(Cursor& cursor) {
  if (read_header(cursor)) return;
  bool prefer = cursor.accept("prefer");
  if (prefer || cursor.accept("from")) return read_one_way(cursor, prefer);
  if (rows_ended_) cursor.fail("characters must stand before \"from\" and \"prefer\"");
  read_row(cursor);
}

void CodePageReader::check_header() {
  for (const char* key : {"id", "name", "family", "kind", "substitution", "line-ends"}) {
    require(seen_.count(key) != 0, source_.end(), tool::message("\"{0}\" is missing", key));
  }
  require(seen_.count("shift") == (page_.mixed() ? 1u : 0u), source_.end(),
          page_.mixed() ? "a mixed page needs \"shift\"" : "only a mixed page has \"shift\"");
}

void CodePageReader::check_shape() {
  if (page_.kind == PageKind::utf8) return;
  require(!page_.to_unicode.empty(), source_.end(), "the page has no characters");
  require((page_.max_length() > 1) == (page_.kind != PageKind::single), source_.end(),
          "a page of this kind needs characters of several bytes");
  require(page_.unicode_of(page_.substitution) != kUnassigned, page_.spot, "the substitution byte is no character");
}

std::optional<CodePage> CodePageReader::read() {
  page_.file = source_.name();
  size_t errors = report_.count();
  source_.for_each_line(report_, [this](Cursor& cursor) { read_line(cursor); });
  check_header();
  check_shape();
  if (report_.count() != errors) return std::nullopt;
  if (page_.kind == PageKind::utf8) {
    fill_utf8(page_);
  } else {
    end_rows();
  }
  return std::move(page_);
}

// Whether a row shows the character itself.
bool is_literal(uint16_t c) { return c > U' ' && c != U'\\' && !must_be_escaped(c) && c != kUnassigned; }

// A run of characters in one row; holes are kUnassigned.
void write_characters(std::string& out, const std::vector<uint16_t>& row) {
  for (size_t i = 0; i < row.size();) {
    size_t end = i + 1;
    if (row[i] == kUnassigned) {
      while (end < row.size() && row[end] == kUnassigned) ++end;
      out += "\\-";
      if (end - i > 1) out += "{" + std::to_string(end - i) + "}";
      i = end;
      continue;
    }
    bool literal = is_literal(row[i]);
    while (end < row.size() && row[end] != kUnassigned && row[end] == row[end - 1] + 1) {
      literal &= is_literal(row[end++]);
    }
    constexpr size_t kShortestRange = 4;
    constexpr size_t kLongestLiteralRun = 23;
    if ((!literal && end - i >= kShortestRange) || end - i > kLongestLiteralRun) {
      out += "\\{" + hex_text(row[i], 4) + "-" + hex_text(row[end - 1], 4) + "}";
      i = end;
    } else {
      if (is_literal(row[i])) {
        append_utf8(out, row[i]);
      } else {
        out += "\\u" + hex_text(row[i], 4);
      }
      ++i;
    }
  }
}

// One line for 16 single bytes, or for all characters that share all bytes but the last.
void write_rows(std::string& out, const CodePage& page) {
  for (auto at = page.to_unicode.begin(); at != page.to_unicode.end();) {
    unsigned length = code_length(at->first);
    unsigned shift = length == 1 ? 4 : 8;
    Code first = length == 1 ? at->first & 0xF0u : at->first;
    std::vector<uint16_t> row;
    for (; at != page.to_unicode.end() && code_length(at->first) == length && at->first >> shift == first >> shift;
         ++at) {
      row.resize(at->first - first, kUnassigned);
      row.push_back(at->second);
    }
    out += hex_text(first, 2 * length) + " ";
    write_characters(out, row);
    out += '\n';
  }
}

void write_one_way(std::string& out, const CodePage& page) {
  std::map<uint16_t, Code> defaults = default_codes(page.to_unicode);
  std::string prefer;
  for (uint32_t unicode = 0; unicode < 0x10000; ++unicode) {
    Code code = page.from_unicode[unicode];
    if (code == kNoCode) continue;
    std::string rest = unicode_name(unicode) + " " + hex_text(code, 2 * code_length(code)) + "\n";
    auto usual = defaults.find(static_cast<uint16_t>(unicode));
    if (usual == defaults.end()) {
      out += "from " + rest;
    } else if (usual->second != code) {
      prefer += "prefer " + rest;
    }
  }
  out += prefer;
}

}  // namespace

std::optional<CodePage> read_code_page(const SourceFile& source, Report& report) {
  return CodePageReader(source, report).read();
}

std::string write_code_page(const CodePage& page) {
  static constexpr const char* kKinds[] = {"single", "multibyte", "mixed", "utf8"};
  std::string out = "id " + std::to_string(page.id) + "\nname " + page.name + "\nfamily " +
                    (page.family == Family::ascii ? "ascii" : "ebcdic") + "\nkind " +
                    kKinds[static_cast<unsigned>(page.kind)] + "\nsubstitution " + hex_text(page.substitution, 2) +
                    "\nline-ends";
  for (uint8_t byte : page.line_bytes) out += " " + hex_text(byte, 2);
  out += '\n';
  if (page.mixed()) out += "shift " + hex_text(page.enter_byte, 2) + " " + hex_text(page.leave_byte, 2) + "\n";
  if (page.kind == PageKind::utf8) return out;
  write_rows(out, page);
  write_one_way(out, page);
  return out;
}

}  // namespace lx::compiler
