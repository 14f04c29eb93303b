// SPDX-License-Identifier: Apache-2.0
// What every data file begins with, and the records of the control file's object directory.
#pragma once

#include <cstddef>

#include "frame/big_endian.hpp"

namespace lx {

inline constexpr uint32_t kFileMagic = 0x4C78F462;
inline constexpr unsigned kMaxSections = 4;

struct SectionSlot {
  BeU16 size;
  BeU16 reserved;
  BeU32 offset;
};

struct FileHeader {
  BeU32 magic;
  BeU32 format;  // bits 28-31: layout version; the rest zero
  BeU16 section_count;
  BeU16 section1_size;
  BeU32 section1_offset;
  SectionSlot more[kMaxSections - 1];
  uint8_t unused[36];

  constexpr unsigned layout_version() const { return format >> 28; }
  // Sections are counted from 0 here and everywhere in the code.
  constexpr uint32_t size_of(unsigned section) const {
    return section == 0 ? uint32_t{section1_size} : uint32_t{more[section - 1].size};
  }
  constexpr uint32_t offset_of(unsigned section) const {
    return section == 0 ? uint32_t{section1_offset} : uint32_t{more[section - 1].offset};
  }
};
static_assert(sizeof(FileHeader) == 76 && alignof(FileHeader) == 1);
static_assert(offsetof(FileHeader, section_count) == 8 && offsetof(FileHeader, section1_offset) == 12);
static_assert(offsetof(FileHeader, more) == 16 && offsetof(FileHeader, unused) == 40);

struct DirectoryRecord {
  BeU16 id;
  uint8_t type;
  uint8_t flags;
  char name[34];
};
static_assert(sizeof(DirectoryRecord) == 38 && offsetof(DirectoryRecord, name) == 4);

// Layout versions of code page objects; every other value is read as the current one.
inline constexpr unsigned kCodePageLayoutV1 = 1;
inline constexpr uint32_t kCurrentFormat = 0x20000000;

}  // namespace lx
