// SPDX-License-Identifier: Apache-2.0
#include "collate/sort_builder.hpp"

#include <filesystem>

namespace lx::test {
namespace {

constexpr unsigned kAll = mask_flags(15);
constexpr unsigned kHeaderSize = 1036;

void put_entry(Image& image, const SortSpec::Entry& entry) {
  image.u16(image.size(), entry.weight);
  image.u8(image.size(), entry.secondary);
  image.u8(image.size(), entry.tertiary);
  image.u16(image.size(), entry.flags);
}

}  // namespace

Bytes SortSpec::section() const {
  Image image(kHeaderSize);
  image.u8(0, default_secondary);
  image.u8(1, default_tertiary);
  image.u16(2, static_cast<unsigned>(expansions.size()));
  image.u16(4, static_cast<unsigned>(combinations.size()));
  unsigned tabulated = 0;
  image.u16(1030, kHeaderSize);
  for (unsigned high = 0; high < 256; ++high) {
    const Page& page = pages[high];
    image.u8(6 + 4 * high, page.flags);
    image.u8(7 + 4 * high, page.mask);
    bool has_table = (page.flags & (kEmptyPage | kPrimaryPage | kSpecialPage)) == 0;
    image.u16(8 + 4 * high, has_table ? 256 * tabulated++ : page.base);
    for (unsigned low = 0; has_table && low < 256; ++low) {
      auto found = entries.find(static_cast<char16_t>(high << 8 | low));
      put_entry(image, found != entries.end() ? found->second : Entry{});
    }
  }
  image.u16(1032, static_cast<unsigned>(image.size()));
  for (const Expansion& row : expansions) {
    image.u16(image.size(), row.character);
    for (const Entry& set : {row.first, row.second}) {
      image.u16(image.size(), set.weight);
      image.u8(image.size(), set.secondary);
      image.u8(image.size(), set.tertiary);
    }
    image.u32(image.size(), 0xEEEEEEEE);  // not for comparison
  }
  image.u16(1034, static_cast<unsigned>(image.size()));
  for (const Combination& row : combinations) {
    image.u16(image.size(), row.first);
    image.u16(image.size(), row.second);
    put_entry(image, row.entry);
  }
  return image.bytes();
}

SortSpec test_sort(bool combinations) {
  SortSpec sort;
  sort.pages[0x00] = sort.pages[0x01] = sort.pages[0x03] = {0, 0, 0};
  sort.pages[0x30] = {kPrimaryPage, 15, 0x3000};
  sort.pages[0x31] = {kSpecialPage, 15, 0x0500};
  sort.pages[0x4E] = {kPrimaryPage | kSpecialPage, 0xF7, 0xFFFC};  // its weights pass the highest number
  sort.pages[0x50] = {kSpecialPage, 0x0E, 0x0600};
  sort.pages[0x51] = {kEmptyPage | kPrimaryPage, 15, 0x0700};
  sort.entries = {
      // One weight a level, in order.
      {u' ', {0x0100, 0x20, 2, kAll}},
      {u'a', {0x0110, 0x20, 2, kAll}},
      {u'A', {0x0110, 0x20, 4, kAll}},
      {u'b', {0x0112, 0x20, 2, kAll}},
      {u'B', {0x0112, 0x21, 2, kAll}},
      {u'c', {0x0114, 0x20, 2, kAll}},
      {u'S', {0x0130, 0x20, 4, kAll}},
      {u's', {0x0130, 0x20, 2, kAll}},
      {u'I', {0x0120, 0x20, 4, kAll}},
      {u'i', {0x0120, 0x20, 2, kAll}},
      {0x130, {0x0121, 0x20, 4, kAll}},
      {0xDF, {0x0135, 0x20, 2, kAll}},
      // Levels stored backwards.
      {u'e', {0x0116, 0x24, 3, mask_flags(0xB)}},
      {u'f', {0x0116, 0x25, 4, mask_flags(0x9)}},
      {u'p', {0x0117, 0x20, 2, mask_flags(0x7)}},
      {u'q', {0x0118, 0x22, 3, mask_flags(0x7)}},
      {u'Q', {0x0117, 0x22, 4, mask_flags(0x0)}},
      // Nothing at some levels.
      {u'-', {0x0011, 9, 9, kIsSpecial | kAll}},
      {u'+', {0x0012, 0, 0, kIsSpecial | kAll}},
      {u'*', {0x0013, 0, 0, kIsSpecial | mask_flags(0xE)}},
      {u'm', {0, 0x30, 3, kAll}},
      {u'n', {0, 0x31, 2, mask_flags(0xB)}},
      {u'd', {0, 0x20, 0, kAll}},
      {u't', {0, 0, 7, kAll}},
      {u'0', {0, 0, 0, kAll}},
      // Expansions.
      {u'x', {0x7777, 7, 7, kExpands | kIsSpecial | kAll}},
      {u'y', {0, 0, 0, kExpands | mask_flags(0x7)}},
      {u'w', {0, 0, 0, kExpands | kAll}},
      {u'z', {0x0119, 0x20, 2, kExpands | mask_flags(0xA)}},  // has no row
  };
  sort.expansions = {{u'y', {0x0110, 0x20, 2}, {0x0112, 0x21, 2}},
                     {u'x', {0x0110, 0x20, 2}, {0x0112, 0x21, 2}},
                     {u'x', {0x0999, 0x20, 2}, {0x0999, 0x21, 2}},
                     {u'w', {0, 0x33, 0}, {0x0112, 0, 2}}};
  sort.combinations = {{u'c', u'b', {0x0115, 0x20, 2, kAll}},
                       {u'c', u'c', {0x0113, 0x26, 5, mask_flags(0xB)}},
                       {u'c', u'-', {0x0040, 1, 1, kIsSpecial | kExpands | kAll}},
                       {u'c', u'b', {0x0999, 0x20, 2, kAll}},
                       {u'a', 0x3041, {0x0111, 0x26, 5, mask_flags(0x1)}},
                       {u'c', 0xFFFF, {0x0111, 0x20, 2, kAll}}};
  if (!combinations) sort.combinations.clear();
  return sort;
}

void write_collation_directory(const DataDirectory& directory) {
  write_small_directory(directory);
  std::vector<ObjectRecord> records = {{LX_LANGUAGE, 1, "English"},           {LX_LANGUAGE, 2, "German"},
                                       {LX_LANGUAGE, 3, "Turkish"},           {LX_TERRITORY, 1, "UnitedStates"},
                                       {LX_CODEPAGE, 367, "Single"},          {LX_CODEPAGE, 900, "Small"},
                                       {LX_CODEPAGE, 901, "Mixed"},           {LX_CODEPAGE, 930, "IBM930"},
                                       {LX_CODEPAGE, 57352, "UTF8"},          {LX_SORT, kPlainSort, "Plain"},
                                       {LX_SORT, kCombiningSort, "Combining"}};
  directory.write_control(records);
  directory.write_object(LX_LANGUAGE, 3, language_file({1, 367, 0, {{u'i', 0, 0x130, 0}, {0xFD, 0, u'I', 0}}}));
  directory.write_object(LX_SORT, kPlainSort, test_sort(false).file());
  directory.write_object(LX_SORT, kCombiningSort, test_sort(true).file());
  for (uint16_t page : {uint16_t{930}, uint16_t{57352}}) {
    std::string name = directory.object_name(LX_CODEPAGE, page);
    std::filesystem::copy_file(std::string(LEXARO_DATA) + "/" + name, directory.file(name));
  }
}

}  // namespace lx::test
