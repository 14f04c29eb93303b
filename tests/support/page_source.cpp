// SPDX-License-Identifier: Apache-2.0
#include "support/page_source.hpp"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <memory>
#include <sstream>
#include <stdexcept>

namespace lx::test {
namespace {

uint32_t hex_number(std::string_view digits) {
  return static_cast<uint32_t>(std::stoul(std::string(digits), nullptr, 16));
}

std::string bytes_of_hex(std::string_view digits) {
  std::string bytes;
  for (size_t i = 0; i < digits.size(); i += 2) bytes += static_cast<char>(hex_number(digits.substr(i, 2)));
  return bytes;
}

uint8_t byte_at(std::string_view bytes, size_t index) { return static_cast<uint8_t>(bytes[index]); }

std::string utf8(uint16_t c) {
  auto rest = [](unsigned bits) { return static_cast<char>(0x80 | (bits & 0x3F)); };
  if (c < 0x80) return {static_cast<char>(c)};
  if (c < 0x800) return {static_cast<char>(0xC0 | c >> 6), rest(c)};
  return {static_cast<char>(0xE0 | c >> 12), rest(c >> 6), rest(c)};
}

uint16_t utf8_value(std::string_view bytes) {
  const uint32_t first = byte_at(bytes, 0);
  if (bytes.size() == 1) return first < 0x80 ? static_cast<uint16_t>(first) : kNoCharacter;
  uint32_t value = first & (first < 0xE0 ? 0x1Fu : 0x0Fu);
  for (size_t i = 1; i < (first < 0xE0 ? 2u : 3u); ++i) value = value << 6 | (byte_at(bytes, i) & 0x3Fu);
  return static_cast<uint16_t>(value);
}

// The next character of a source file, which is well-formed.
uint32_t take_utf8(std::string_view& text) {
  const uint8_t first = byte_at(text, 0);
  const size_t length = first < 0x80 ? 1 : first < 0xE0 ? 2 : 3;
  const uint32_t value = utf8_value(text.substr(0, length));
  text.remove_prefix(length);
  return value;
}

}  // namespace

PageSource::PageSource(const std::string& file) : from_unicode_(65536) {
  std::ifstream in(file);
  if (!in) throw std::runtime_error("cannot read " + file);
  for (std::string line; std::getline(in, line);) {
    if (!line.empty() && line[0] != '#') read_line(line);
  }
  finish();
}

std::vector<std::string> PageSource::all_files() {
  std::vector<std::string> files;
  for (const auto& entry : std::filesystem::directory_iterator(LEXARO_SOURCE_DATA "/codepage")) {
    if (entry.path().extension() == ".txt") files.push_back(entry.path().string());
  }
  std::sort(files.begin(), files.end());
  return files;
}

const PageSource& PageSource::of(uint16_t id) {
  static std::map<uint16_t, std::unique_ptr<PageSource>> pages;
  auto& page = pages[id];
  if (!page) {
    const std::string number = std::to_string(100000u + id).substr(1);
    page = std::make_unique<PageSource>(LEXARO_SOURCE_DATA "/codepage/cp_" + number + ".txt");
  }
  return *page;
}

void PageSource::read_line(std::string_view line) {
  const size_t space = line.find(' ');
  const std::string_view key = line.substr(0, space), rest = line.substr(space + 1);
  std::istringstream words{std::string(rest)};
  auto next = [&words, word = std::string()]() mutable { return words >> word, word; };
  auto next_byte = [&] { return static_cast<uint8_t>(hex_number(next())); };
  if (key == "id") {
    id = static_cast<uint16_t>(std::stoul(std::string(rest)));
  } else if (key == "name") {
    name = rest;
  } else if (key == "family") {
    ascii_family = rest == "ascii";
  } else if (key == "kind") {
    kind = rest == "single"      ? Kind::single
           : rest == "multibyte" ? Kind::multibyte
           : rest == "mixed"     ? Kind::mixed
                                 : Kind::utf8;
  } else if (key == "substitution") {
    substitution = next_byte();
  } else if (key == "line-ends") {
    for (uint8_t& byte : line_ends) byte = next_byte();
  } else if (key == "shift") {
    enter = next_byte();
    leave = next_byte();
  } else if (key == "from" || key == "prefer") {
    const std::string unicode = next();
    from_unicode_[hex_number(unicode.substr(2))] = bytes_of_hex(next());
  } else {
    read_row(key, rest);
  }
}

// Rows come before "from" and "prefer", and in the order of their codes.
void PageSource::read_row(std::string_view codes, std::string_view characters) {
  std::string code = bytes_of_hex(codes);
  auto next = [&] { ++code.back(); };
  while (!characters.empty()) {
    if (characters.substr(0, 2) == "\\u") {
      add(code, hex_number(characters.substr(2, 4)));
      next();
      characters.remove_prefix(6);
    } else if (characters.substr(0, 3) == "\\-{") {
      size_t end = characters.find('}');
      for (auto holes = std::stoul(std::string(characters.substr(3, end - 3))); holes != 0; --holes) next();
      characters.remove_prefix(end + 1);
    } else if (characters.substr(0, 2) == "\\-") {
      next();
      characters.remove_prefix(2);
    } else if (characters.substr(0, 2) == "\\{") {
      uint32_t last = hex_number(characters.substr(7, 4));
      for (uint32_t c = hex_number(characters.substr(2, 4)); c <= last; ++c, next()) add(code, c);
      characters.remove_prefix(12);
    } else {
      add(code, take_utf8(characters));
      next();
    }
  }
}

void PageSource::add(const std::string& code, uint32_t unicode) {
  auto character = static_cast<uint16_t>(unicode);
  if (!to_unicode_.emplace(code, character).second) throw std::runtime_error(name + ": " + hex(code) + " given twice");
  max_length = std::max(max_length, static_cast<uint8_t>(code.size()));
  lengths[byte_at(code, 0)] = static_cast<uint8_t>(code.size());
  // Of several codes for a character the shortest is written, then the lowest.
  std::string& written = from_unicode_[character];
  if (written.empty() || packed(code) < packed(written)) written = code;
}

void PageSource::finish() {
  if (kind == Kind::utf8) {
    max_length = 3;
    for (unsigned byte = 0; byte < 256; ++byte) {
      lengths[byte] = byte < 0x80 ? 1 : byte < 0xC2 ? 0 : byte < 0xE0 ? 2 : byte < 0xF0 ? 3 : 0;
    }
    return;
  }
  if (max_length == 1 || mixed()) lengths.fill(1);
  one_.fill(kNoCharacter);
  if (mixed()) {  // where nobody follows them, shift bytes are the controls of the same name
    one_[enter] = 0x0E;
    one_[leave] = 0x0F;
  }
  two_.assign(65536, kNoCharacter);
  for (const auto& [code, character] : to_unicode_) {
    if (code.size() == 1) one_[byte_at(code, 0)] = character;
    if (code.size() == 2) two_[packed(code)] = character;
  }
}

uint16_t PageSource::decode(std::string_view bytes) const {
  if (kind == Kind::utf8) return utf8_value(bytes);
  if (bytes.size() == 1) return one_[byte_at(bytes, 0)];
  if (bytes.size() == 2) return two_[packed(bytes)];
  auto found = to_unicode_.find(bytes);
  return found == to_unicode_.end() ? kNoCharacter : found->second;
}

bool PageSource::has(uint16_t unicode) const { return kind == Kind::utf8 || !from_unicode_[unicode].empty(); }

std::string PageSource::encode(uint16_t unicode) const {
  if (kind == Kind::utf8) return utf8(unicode);
  return has(unicode) ? from_unicode_[unicode] : std::string(1, static_cast<char>(substitution));
}

std::vector<std::string> PageSource::long_codes() const {
  std::vector<std::string> codes;
  for (const auto& [code, character] : to_unicode_) {
    if (code.size() > 1) codes.push_back(code);
  }
  for (unsigned c = 0x80; kind == Kind::utf8 && c < 0x10000; ++c) codes.push_back(utf8(static_cast<uint16_t>(c)));
  return codes;
}

uint32_t packed(std::string_view bytes) {
  uint32_t value = 0;
  for (size_t i = 0; i < bytes.size(); ++i) value = value << 8 | byte_at(bytes, i);
  return value;
}

std::string unpacked(uint32_t value) {
  std::string bytes;
  for (; value != 0; value >>= 8) bytes.insert(bytes.begin(), static_cast<char>(value));
  return bytes.empty() ? std::string(1, '\0') : bytes;
}

std::string hex(std::string_view bytes) {
  static const char kDigits[] = "0123456789ABCDEF";
  std::string text;
  for (size_t i = 0; i < bytes.size(); ++i) text += {kDigits[byte_at(bytes, i) >> 4], kDigits[byte_at(bytes, i) & 0xF]};
  return text;
}

}  // namespace lx::test
