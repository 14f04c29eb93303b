// SPDX-License-Identifier: Apache-2.0
#include "support/object_builder.hpp"

#include <stdlib.h>
#include <unistd.h>

#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>

namespace lx::test {

void Image::u8(size_t at, unsigned value) {
  if (bytes_.size() <= at) bytes_.resize(at + 1);
  bytes_[at] = static_cast<uint8_t>(value);
}

void Image::u16(size_t at, unsigned value) {
  u8(at, value >> 8 & 0xFF);
  u8(at + 1, value & 0xFF);
}

void Image::u32(size_t at, uint32_t value) {
  u16(at, value >> 16);
  u16(at + 2, value & 0xFFFF);
}

size_t Image::text(std::u16string_view units) {
  size_t begin = size();
  for (char16_t unit : units) u16(size(), unit);
  u16(size(), 0);
  return begin;
}

Bytes object_file(const std::vector<Bytes>& sections, uint32_t format) {
  Image header(76);
  header.u32(0, 0x4C78F462);
  header.u32(4, format);
  header.u16(8, static_cast<unsigned>(sections.size()));
  Bytes body;
  for (size_t i = 0; i < sections.size(); ++i) {
    header.u16(i == 0 ? 10 : 8 + 8 * i, static_cast<unsigned>(sections[i].size()));
    header.u32(12 + 8 * i, static_cast<uint32_t>(76 + body.size()));
    body.insert(body.end(), sections[i].begin(), sections[i].end());
  }
  Bytes file = header.bytes();
  file.insert(file.end(), body.begin(), body.end());
  return file;
}

Bytes control_file(const std::vector<ObjectRecord>& records) {
  Image directory(records.size() * 38);
  size_t at = 0;
  for (const ObjectRecord& record : records) {
    directory.u16(at, record.id);
    directory.u8(at + 2, record.type);
    directory.u8(at + 3, record.flags);
    for (size_t i = 0; i < record.name.size() && i < 34; ++i) {
      directory.u8(at + 4 + i, static_cast<uint8_t>(record.name[i]));
    }
    at += 38;
  }
  return object_file({directory.bytes()});
}

// ---- Languages and territories --------------------------------------------------------------------------------------

Bytes language_file(const LanguageParts& parts) {
  bool special = !parts.upper.empty() || !parts.lower.empty();
  Image image(special ? 102 : 98);
  image.u16(0, parts.territory);
  image.u16(2, parts.code_page);
  image.u16(4, parts.sort);
  image.u16(6, static_cast<unsigned>(parts.upper.size()));
  image.u16(8, static_cast<unsigned>(parts.lower.size()));
  for (unsigned slot = 0; slot < 44; ++slot) {
    char16_t text[] = {u'T', static_cast<char16_t>('a' + slot % 26), 0};
    image.u16(10 + 2 * slot, static_cast<unsigned>(image.text(text)));
  }
  for (size_t list = 0; list < 2; ++list) {
    const std::vector<SpecialRow>& rows = list == 0 ? parts.upper : parts.lower;
    if (rows.empty()) continue;
    image.u16(98 + 2 * list, static_cast<unsigned>(image.size()));
    for (const SpecialRow& row : rows) {
      for (uint16_t value : {row.key1, row.key2, row.value1, row.value2}) image.u16(image.size(), value);
    }
  }
  return object_file({image.bytes()});
}

Bytes territory_file(const TerritoryParts& parts) {
  Image image(44);
  const char16_t separators[] = {parts.decimal, parts.thousands, u';', parts.decimal, parts.thousands};
  for (size_t i = 0; i < 5; ++i) image.u16(2 * i, separators[i]);
  image.u16(10, parts.fraction_digits);
  image.u16(12, 3);  // currency digits
  image.u16(14, 4);  // the same of the international currency
  image.u8(16, 1);   // positions of the signs
  image.u8(17, 2);
  image.u16(20, 0x2A);  // the symbol precedes positive and negative amounts, and item 82
  const std::u16string_view texts[] = {u"TE", u"Territory", u"3;0",   u"3;2;0",    parts.currency, u"CUR",
                                       u"+",  u"-",         u"%H:%M", u"%d.%m.%y", u"%A, %d"};
  for (size_t i = 0; i < 11; ++i) image.u16(22 + 2 * i, static_cast<unsigned>(image.text(texts[i])));
  return object_file({image.bytes()});
}

// ---- Code pages -----------------------------------------------------------------------------------------------------

namespace {

// Where the two layouts of section 1 have the same fields.
struct Layout {
  size_t lengths, cases, to_unicode, types, pages, flags, offsets, fixed_size;
  bool bounds;  // states of section 2 have them
};
constexpr Layout kOlder = {8, 264, 776, 1288, 2312, 4360, 4362, 4372, false};
constexpr Layout kCurrent = {10, 266, 778, 1292, 2316, 4364, 4366, 4376, true};

struct State {
  unsigned final, mask, low, high, index;
};
struct FromPage {
  unsigned high_byte, kind, mask, low, high, values, high_parts;
};

// The parts that every page here has: ASCII both ways, all other pages empty.
Image ascii_section1(const Layout& layout, unsigned last_single_byte) {
  Image image(layout.fixed_size);
  image.u8(0, 0x1A);
  for (unsigned i = 0; i < 4; ++i) image.u8(1 + i, 0x0A + i);
  image.u8(5, 1);
  for (unsigned byte = 0; byte < 256; ++byte) {
    bool character = byte <= last_single_byte;
    bool lower = byte >= 'a' && byte <= 'z';
    bool upper = byte >= 'A' && byte <= 'Z';
    image.u8(layout.lengths + byte, character ? 1 : 0);
    image.u8(layout.cases + byte, lower ? byte - 32 : byte);
    image.u8(layout.cases + 256 + byte, upper ? byte + 32 : byte);
    image.u16(layout.to_unicode + 2 * byte, character ? byte : 0xFFFD);
    image.u32(layout.types + 4 * byte, lower ? LX_CT_ALPHA | LX_CT_LOWER : upper ? LX_CT_ALPHA | LX_CT_UPPER : 0);
    image.u8(layout.pages + 8 * byte + 2, 1);  // low above high: no characters
  }
  image.u16(layout.flags, 1);
  return image;
}

void put_from_page(Image& image, const Layout& layout, const FromPage& page) {
  size_t at = layout.pages + 8 * page.high_byte;
  image.u8(at, page.kind);
  image.u8(at + 1, page.mask);
  image.u8(at + 2, page.low);
  image.u8(at + 3, page.high);
  image.u16(at + 4, page.values);
  image.u16(at + 6, page.high_parts);
}

void put_states(Image& image, const std::vector<State>& states, bool bounds) {
  for (const State& state : states) {
    for (unsigned value : {state.final, state.mask}) image.u8(image.size(), value);
    for (unsigned value : {state.low, state.high}) {
      if (bounds) image.u8(image.size(), value);
    }
    image.u16(image.size(), state.index);
  }
}

// Values of one or two bytes, one behind the other.
void put_run(Image& image, size_t size, unsigned first, unsigned count, unsigned step = 1) {
  for (unsigned value = first; count-- > 0; value += step) {
    size == 1 ? image.u8(image.size(), value) : image.u16(image.size(), value);
  }
}

// States that work with and without their bounds.
std::vector<State> multibyte_states() {
  std::vector<State> states = {{0, 0x0F, 0x81, 0x8F, 1}};
  for (unsigned first = 0; first < 16; ++first) states.push_back({1, 0, 1, 0, 40});
  states[1 + 0x1] = {1, 0x0F, 0x40, 0x4F, 0};
  states[1 + 0xE] = {0, 0x01, 0xA0, 0xA1, 17};
  states[1 + 0xF] = {0, 0x00, 0xA1, 0xA1, 19};
  states.push_back({1, 0x07, 0xA0, 0xA7, 16});
  states.push_back({1, 0x07, 0xA0, 0xA7, 24});
  states.push_back({0, 0x00, 0xA1, 0xA1, 20});
  states.push_back({1, 0x07, 0xA0, 0xA7, 32});
  return states;
}

// The tables behind the fixed part, and their offsets.
void put_types_and_widths(Image& image, const Layout& layout) {
  const size_t full_width = image.size();
  image.u32(full_width + 255 * 4, 0);
  image.u32(full_width + 4 * ' ', 0x8140);
  image.u32(full_width + 4 * 'A', 0x8141);
  const size_t pairs = image.size();
  image.u16(6, 2);
  for (uint32_t width : {0x8142u, 0x8EA0A0u, 0x8143u, 0x8EA0A1u}) image.u32(image.size(), width);

  std::vector<State> states = {{0, 0x0F, 0, 0, 1}};
  for (unsigned first = 0; first < 16; ++first) states.push_back({1, 0, 0, 0, 0});
  states[1 + 0x1] = {1, 0x0F, 0, 0, 1};
  states[1 + 0xE] = {0, 0, 0, 0, 17};
  states[1 + 0xF] = {0, 0, 0, 0, 18};
  states.push_back({1, 0, 0, 0, 0});
  states.push_back({0, 0, 0, 0, 17});
  const size_t type_states = image.size();
  put_states(image, states, false);
  const size_t type_entries = image.size();
  image.u32(type_entries, 1024);
  image.u32(type_entries + 4, 0);
  for (unsigned i = 0; i < 16; ++i) {  // U+3040-U+304F: pairs of a capital and a small letter
    image.u32(image.size(), LX_CT_ALPHA | (i % 2 == 0 ? LX_CT_UPPER : LX_CT_LOWER));
    image.u32(image.size(), i % 2 == 0 ? 1u : 0xFFFFFFFFu);
  }
  const size_t offsets[] = {full_width, pairs, type_states, type_entries};
  for (size_t i = 0; i < 4; ++i) image.u16(layout.offsets + 2 * i, static_cast<unsigned>(offsets[i]));
}

}  // namespace

Bytes single_byte_page_file(bool older_layout) {
  const Layout& layout = older_layout ? kOlder : kCurrent;
  Image section1 = ascii_section1(layout, 0xFF);
  put_from_page(section1, layout, {0, 0, 0xFF, 0, 0xFF, 0, 0});
  Bytes fixed = section1.bytes();
  if (older_layout) fixed.resize(kOlder.offsets);
  Bytes values;
  for (unsigned byte = 0; byte < 256; ++byte) values.push_back(static_cast<uint8_t>(byte));
  return object_file({fixed, {}, values}, older_layout ? kFormatV1 : kFormatV2);
}

Bytes multibyte_page_file(bool older_layout) {
  const Layout& layout = older_layout ? kOlder : kCurrent;
  Image section1 = ascii_section1(layout, 0x7F);
  section1.u8(5, 4);
  section1.u8(layout.lengths + 0x81, 2);
  section1.u8(layout.lengths + 0x8E, 3);
  section1.u8(layout.lengths + 0x8F, 4);
  const FromPage pages[] = {{0x00, 0, 0x7F, 0, 0x7F, 0, 0},
                            {0x30, 1, 0x0F, 0x40, 0x4F, 128, 0},
                            {0x31, 4, 0x03, 0, 3, 160, 0},
                            {0x4E, 2, 0x0F, 0, 0x0F, 164, 4},
                            {0x50, 3, 0x07, 0, 7, 196, 20}};
  for (const FromPage& page : pages) put_from_page(section1, layout, page);
  put_types_and_widths(section1, layout);
  Image unicode, values, high_parts;
  put_states(unicode, multibyte_states(), layout.bounds);
  section1.u16(layout.offsets + 8, static_cast<unsigned>(unicode.size()));
  put_run(unicode, 2, 0x3040, 16);
  put_run(unicode, 2, 0x4E00, 16);
  put_run(unicode, 2, 0x5000, 8);
  put_run(unicode, 2, 0xFFFD, 1);
  put_run(values, 1, 0, 128);
  put_run(values, 2, 0x8140, 16);
  put_run(values, 1, 0x40, 4);
  put_run(values, 2, 0xA0A0, 8);
  put_run(values, 2, 0xA1A0, 8);
  put_run(values, 2, 0xA1A0, 8);
  put_run(high_parts, 1, 0x81, 4, 0);
  put_run(high_parts, 1, 0x8E, 16, 0);
  put_run(high_parts, 2, 0x8FA1, 8, 0);
  return object_file({section1.bytes(), unicode.bytes(), values.bytes(), high_parts.bytes()},
                     older_layout ? kFormatV1 : kFormatV2);
}

Bytes mixed_page_file() {
  Image section1 = ascii_section1(kCurrent, 0xFF);
  section1.u8(5, 2);
  section1.u8(8, 0x0E);
  section1.u8(9, 0x0F);
  section1.u16(kCurrent.flags, 1 | 2);
  put_from_page(section1, kCurrent, {0x00, 0, 0x7F, 0, 0x7F, 0, 0});
  put_from_page(section1, kCurrent, {0x30, 1, 0x1F, 0x40, 0x5F, 128, 0});
  Image unicode, values;
  put_states(unicode, {{0, 0x03, 0x41, 0x42, 0}, {1, 0x0F, 0x40, 0x4F, 0}, {1, 0x0F, 0x40, 0x4F, 16}}, true);
  section1.u16(kCurrent.offsets + 8, static_cast<unsigned>(unicode.size()));
  put_run(unicode, 2, 0x3040, 32);
  put_run(values, 1, 0, 128);
  put_run(values, 2, 0x4140, 16);
  put_run(values, 2, 0x4240, 16);
  return object_file({section1.bytes(), unicode.bytes(), values.bytes()});
}

// ---- Directories ----------------------------------------------------------------------------------------------------

DataDirectory::DataDirectory() {
  std::error_code none;
  std::filesystem::path base = std::filesystem::is_directory("/dev/shm", none) ? "/dev/shm" : "/tmp";
  path_ = base / "lexaro-test-XXXXXX";
  if (mkdtemp(path_.data()) == nullptr) std::perror("mkdtemp");
}

DataDirectory::~DataDirectory() {
  std::error_code ignored;
  std::filesystem::remove_all(path_, ignored);
}

std::string DataDirectory::object_name(uint8_t type, uint16_t id) const {
  const char* const prefixes[] = {"la", "te", "cp", "so"};
  char name[16];
  std::snprintf(name, sizeof name, "%s_%05u.nls", prefixes[type & 3], unsigned{id});
  return name;
}

void DataDirectory::write(std::string_view name, const Bytes& bytes) const {
  write(name, std::string_view(reinterpret_cast<const char*>(bytes.data()), bytes.size()));
}

void DataDirectory::write(std::string_view name, std::string_view text) const {
  std::ofstream(file(name), std::ios::binary).write(text.data(), static_cast<std::streamsize>(text.size()));
}

void DataDirectory::write_object(uint8_t type, uint16_t id, const Bytes& bytes) const {
  write(object_name(type, id), bytes);
}

void DataDirectory::remove(std::string_view name) const { unlink(file(name).c_str()); }

std::vector<ObjectRecord> small_directory_records() {
  return {{LX_LANGUAGE, 1, "English"},  {LX_LANGUAGE, 2, "German"},     {LX_TERRITORY, 1, "UnitedStates"},
          {LX_TERRITORY, 2, "Germany"}, {LX_CODEPAGE, 367, "US-ASCII"}, {LX_CODEPAGE, 900, "Small"},
          {LX_CODEPAGE, 901, "Mixed"},  {LX_CODEPAGE, 902, "OldSmall"}, {LX_CODEPAGE, 903, "OldSingle"}};
}

void write_small_directory(const DataDirectory& directory) {
  directory.write_control(small_directory_records());
  directory.write_object(LX_LANGUAGE, 1, language_file());
  directory.write_object(
      LX_LANGUAGE, 2, language_file({2, 900, 0, {{0xDF, 0, 'S', 'S'}, {'i', 0x307, 0x130, 0}}, {{'S', 'S', 0xDF, 0}}}));
  directory.write_object(LX_TERRITORY, 1, territory_file());
  directory.write_object(LX_TERRITORY, 2, territory_file({',', '.', u"\u3041\u5001", 7}));
  directory.write_object(LX_CODEPAGE, 367, single_byte_page_file());
  directory.write_object(LX_CODEPAGE, 900, multibyte_page_file());
  directory.write_object(LX_CODEPAGE, 901, mixed_page_file());
  directory.write_object(LX_CODEPAGE, 902, multibyte_page_file(true));
  directory.write_object(LX_CODEPAGE, 903, single_byte_page_file(true));
  directory.write("alias.txt", "# further names\nUS-ASCII ascii latin_1 a.b@c\nSmall tiny\n    little\n");
}

}  // namespace lx::test
