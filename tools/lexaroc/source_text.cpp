// SPDX-License-Identifier: Apache-2.0
#include "source_text.hpp"

#include <algorithm>
#include <cstdio>
#include <iterator>

namespace lx::compiler {

namespace {

int hex_value(char32_t c) {
  if (c >= U'0' && c <= U'9') return static_cast<int>(c - U'0');
  if (c >= U'A' && c <= U'F') return static_cast<int>(c - U'A') + 10;
  return -1;
}

// Takes one character off `bytes`; false when it is not well-formed.
bool take_utf8(std::string_view& bytes, char32_t& c) {
  auto lead = static_cast<uint8_t>(bytes[0]);
  unsigned length = lead < 0x80 ? 1 : lead >= 0xF0 ? 4 : lead >= 0xE0 ? 3 : 2;
  if (length > 1 && (lead < 0xC2 || lead > 0xF4)) return false;
  if (bytes.size() < length) return false;
  char32_t value = length == 1 ? lead : lead & (0x7Fu >> length);
  for (unsigned i = 1; i < length; ++i) {
    auto trail = static_cast<uint8_t>(bytes[i]);
    if ((trail & 0xC0) != 0x80) return false;
    value = value << 6 | (trail & 0x3Fu);
  }
  constexpr char32_t kLeast[] = {0, 0, 0x80, 0x800, 0x10000};
  if (value < kLeast[length] || value > 0x10FFFF || (value >= 0xD800 && value <= 0xDFFF)) return false;
  bytes.remove_prefix(length);
  c = value;
  return true;
}

struct Range {
  char32_t first, last;
};

constexpr Range kEscaped[] = {
    {0x0000, 0x001F}, {0x007F, 0x00A0}, {0x00AD, 0x00AD}, {0x0300, 0x036F}, {0x0374, 0x0374}, {0x037E, 0x037E},
    {0x0387, 0x0387}, {0x0483, 0x0489}, {0x0590, 0x08FF}, {0x093C, 0x093C}, {0x094D, 0x094D}, {0x0958, 0x095F},
    {0x0E31, 0x0E31}, {0x0E34, 0x0E3A}, {0x0E47, 0x0E4E}, {0x1F71, 0x1F71}, {0x1F73, 0x1F73}, {0x1F75, 0x1F75},
    {0x1F77, 0x1F77}, {0x1F79, 0x1F79}, {0x1F7B, 0x1F7B}, {0x1F7D, 0x1F7D}, {0x2000, 0x200F}, {0x2028, 0x202F},
    {0x205F, 0x206F}, {0x20D0, 0x20FF}, {0x2126, 0x2126}, {0x212A, 0x212B}, {0x2329, 0x232A}, {0x3000, 0x3000},
    {0x302A, 0x302F}, {0x3099, 0x309A}, {0xD800, 0xFA0D}, {0xFA10, 0xFA10}, {0xFA12, 0xFA12}, {0xFA15, 0xFA1E},
    {0xFA20, 0xFA20}, {0xFA22, 0xFA22}, {0xFA25, 0xFA26}, {0xFA2A, 0xFAFF}, {0xFB1D, 0xFDFF}, {0xFE00, 0xFE0F},
    {0xFE20, 0xFE2F}, {0xFE70, 0xFEFF}, {0xFFF0, 0xFFFF},
};

}  // namespace

bool must_be_escaped(char32_t c) {
  const Range* range =
      std::lower_bound(std::begin(kEscaped), std::end(kEscaped), c, [](Range r, char32_t v) { return r.last < v; });
  return range != std::end(kEscaped) && c >= range->first;
}

std::string hex_text(uint32_t value, unsigned digits) {
  char text[16];
  std::snprintf(text, sizeof text, "%0*X", static_cast<int>(digits), value);
  return text;
}

std::string unicode_name(uint32_t value) { return "U+" + hex_text(value, 4); }

void append_utf8(std::string& out, char32_t c) {
  auto put = [&out](char32_t byte) { out.push_back(static_cast<char>(byte)); };
  if (c < 0x80) {
    put(c);
  } else if (c < 0x800) {
    put(0xC0 | c >> 6);
    put(0x80 | (c & 0x3F));
  } else {
    if (c < 0x10000) {
      put(0xE0 | c >> 12);
    } else {
      put(0xF0 | c >> 18);
      put(0x80 | (c >> 12 & 0x3F));
    }
    put(0x80 | (c >> 6 & 0x3F));
    put(0x80 | (c & 0x3F));
  }
}

void Cursor::expect(char32_t wanted) {
  if (peek() == wanted && !done()) {
    ++at_;
    return;
  }
  std::string name;
  append_utf8(name, wanted);
  fail(wanted == U' ' ? tool::message("expected a blank") : tool::message("expected \"{0}\"", name));
}

bool Cursor::accept(std::string_view word) {
  if (line_->text.size() - at_ < word.size()) return false;
  for (size_t i = 0; i < word.size(); ++i) {
    if (line_->text[at_ + i] != static_cast<unsigned char>(word[i])) return false;
  }
  at_ += word.size();
  return true;
}

std::string Cursor::word(const char* what) {
  std::string result;
  while (!done() && peek() > U' ' && peek() < 0x7F) result.push_back(static_cast<char>(next()));
  if (result.empty() || (!done() && peek() != U' ' && peek() != U'\t'))
    fail(tool::message("expected {0}", tool::message(what)));
  return result;
}

void Cursor::skip_blanks() {
  while (!done() && (peek() == U' ' || peek() == U'\t')) ++at_;
}

void Cursor::end() const {
  if (!done()) fail("expected the end of the line");
}

unsigned Cursor::decimal(unsigned largest) {
  if (peek() < U'0' || peek() > U'9') fail("expected a number");
  Spot start = spot();
  uint64_t value = 0;
  while (peek() >= U'0' && peek() <= U'9') {
    value = value * 10 + (next() - U'0');
    if (value > largest) throw SourceError(start, tool::message("the number is larger than {0}", largest));
  }
  return static_cast<unsigned>(value);
}

uint32_t Cursor::hex(unsigned digits) {
  uint32_t value = 0;
  for (unsigned i = 0; i < digits; ++i) {
    int digit = hex_value(peek());
    if (digit < 0) fail(tool::message("expected {0} hexadecimal digits in upper case", digits));
    value = value << 4 | static_cast<uint32_t>(digit);
    ++at_;
  }
  return value;
}

uint32_t Cursor::hex_bytes(unsigned& length) {
  Spot start = spot();
  uint32_t value = 0;
  for (length = 0; hex_value(peek()) >= 0; ++length) {
    if (length == 4) throw SourceError(start, "a character has at most 4 bytes");
    value = value << 8 | hex(2);
  }
  if (length == 0) fail("expected bytes in hexadecimal digits, upper case");
  return value;
}

uint16_t Cursor::unicode_escape() {
  Spot start = spot();
  uint32_t value = hex(4);
  if (value >= 0xD800 && value <= 0xDFFF) throw SourceError(start, "a surrogate is no character");
  return static_cast<uint16_t>(value);
}

SourceFile::SourceFile(std::string name, std::string_view bytes, Report& report) : name_(std::move(name)) {
  while (!bytes.empty()) {
    size_t size = bytes.find('\n');
    std::string_view rest = bytes.substr(0, size);
    Line line{++line_count_, {}};
    bool clean = true;
    while (clean && !rest.empty()) {
      char32_t c = 0;
      clean = take_utf8(rest, c) && (c >= U' ' || c == U'\t');
      if (clean) line.text.push_back(c);
    }
    Spot spot{line.number, static_cast<unsigned>(line.text.size()) + 1};
    if (!clean) {
      report.error(name_, spot, "a control character, or bytes that are not UTF-8");
    } else if (size == std::string_view::npos) {
      report.error(name_, spot, "the last line does not end in a line feed");
    }
    bool blank = line.text.find_first_not_of(U" \t") == std::u32string::npos;
    if (clean && !blank && line.text[0] != U'#') lines_.push_back(std::move(line));
    bytes.remove_prefix(size == std::string_view::npos ? bytes.size() : size + 1);
  }
}

void SourceFile::for_each_line(Report& report, const std::function<void(Cursor&)>& read) const {
  for (const Line& line : lines_) {
    try {
      Cursor cursor(line);
      read(cursor);
    } catch (const SourceError& error) {
      report.error(name_, error);
    }
  }
}

}  // namespace lx::compiler
