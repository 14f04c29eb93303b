// SPDX-License-Identifier: Apache-2.0
// Data directories made by the tests themselves, byte by byte at the offsets of the file formats: neither the data
// compiler nor the library's own view of the formats has a part in them.
#pragma once

#include <lexaro/lexaro.h>

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace lx::test {

using Bytes = std::vector<uint8_t>;

// Big-endian fields of a section; it grows with what is stored.
class Image {
 public:
  explicit Image(size_t size = 0) : bytes_(size) {}
  void u8(size_t at, unsigned value);
  void u16(size_t at, unsigned value);
  void u32(size_t at, uint32_t value);
  size_t text(std::u16string_view units);  // appends them with a terminator; returns the offset
  size_t size() const { return bytes_.size(); }
  const Bytes& bytes() const { return bytes_; }

 private:
  Bytes bytes_;
};

inline constexpr uint32_t kFormatV1 = 0x10000000;
inline constexpr uint32_t kFormatV2 = 0x20000000;

// A file of up to four sections behind its header.
Bytes object_file(const std::vector<Bytes>& sections, uint32_t format = kFormatV2);

struct ObjectRecord {
  uint8_t type;
  uint16_t id;
  std::string name;
  uint8_t flags = 0;
};
Bytes control_file(const std::vector<ObjectRecord>& records);

struct SpecialRow {
  uint16_t key1, key2, value1, value2;
};
struct LanguageParts {
  uint16_t territory = 1;
  uint16_t code_page = 367;
  uint16_t sort = 0;
  std::vector<SpecialRow> upper = {};
  std::vector<SpecialRow> lower = {};
};
Bytes language_file(const LanguageParts& parts = {});

struct TerritoryParts {
  char16_t decimal = '.';
  char16_t thousands = ',';
  std::u16string_view currency = u"$";
  unsigned fraction_digits = 2;
};
Bytes territory_file(const TerritoryParts& parts = {});

// One byte a character, U+0000-U+00FF as themselves.
Bytes single_byte_page_file(bool older_layout = false);
// Characters of one to four bytes, every kind of from-Unicode page, types and widths: 00-7F; 81 40-81 4F for
// U+3040-U+304F and also U+3100-U+3103; 8E A0 A0-8E A1 A7 for U+4E00-U+4E0F; 8F A1 A1 A0-8F A1 A1 A7 for U+5000-U+5007.
Bytes multibyte_page_file(bool older_layout = false);
// A mixed host page with ASCII for its single bytes; 41 40-42 4F for U+3040-U+305F between 0E and 0F.
Bytes mixed_page_file();

// A new directory that is removed with all files in it.
class DataDirectory {
 public:
  DataDirectory();
  ~DataDirectory();
  DataDirectory(const DataDirectory&) = delete;
  DataDirectory& operator=(const DataDirectory&) = delete;

  const char* path() const { return path_.c_str(); }
  std::string file(std::string_view name) const { return path_ + "/" + std::string(name); }
  std::string object_name(uint8_t type, uint16_t id) const;
  void write(std::string_view name, const Bytes& bytes) const;
  void write(std::string_view name, std::string_view text) const;
  void write_control(const std::vector<ObjectRecord>& records) const { write("control.nls", control_file(records)); }
  void write_object(uint8_t type, uint16_t id, const Bytes& bytes) const;
  void remove(std::string_view name) const;

 private:
  std::string path_;
};

// What write_small_directory() puts into a directory.
std::vector<ObjectRecord> small_directory_records();
// Two languages and territories, the pages above under the names US-ASCII (367), Small (900), Mixed (901), OldSmall
// (902), OldSingle (903), and aliases for them.
void write_small_directory(const DataDirectory& directory);

}  // namespace lx::test
