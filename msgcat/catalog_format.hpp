// SPDX-License-Identifier: Apache-2.0
// The layout of a message catalog: numbers of 32 bits in the order of the machine that it was written for, at offsets
// of any alignment.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

namespace lx {

inline constexpr uint32_t kCatalogMagic = 0x4C78F463;
inline constexpr uint32_t kCatalogVersion = 0x10000000;
inline constexpr uint32_t kBigEndianCatalog = 1;
inline constexpr uint32_t kLittleEndianCatalog = 2;
inline constexpr uint32_t kNativeCatalog =
    std::endian::native == std::endian::big ? kBigEndianCatalog : kLittleEndianCatalog;

struct CatalogHeader {
  uint32_t magic;
  uint32_t version;
  uint32_t byte_order;
  uint32_t sets;
  uint32_t first_set;  // offset in the file
  char locale[132];    // terminated
};
static_assert(offsetof(CatalogHeader, locale) == 20 && sizeof(CatalogHeader) == 152);

// Sets form a chain; offsets are from the start of the file.
struct CatalogSet {
  uint32_t number;
  uint32_t next;
  uint32_t messages;
  uint32_t index_offset;
  uint32_t text_offset;
  uint32_t text_size;
  uint32_t reserved;
};
static_assert(sizeof(CatalogSet) == 28);

// Messages stand in ascending order; their texts are not terminated.
struct CatalogMessage {
  uint32_t number;
  uint32_t length;
  uint32_t offset;  // in the set's texts
};
static_assert(sizeof(CatalogMessage) == 12);

template <class Record>
Record catalog_record(const void* bytes) {
  Record record;
  std::memcpy(&record, bytes, sizeof record);
  return record;
}

// An entry of an index, field by field.
struct MessageEntry {
  const uint8_t* at;

  MessageEntry(const void* index, uint32_t position)
      : at(static_cast<const uint8_t*>(index) + size_t{position} * sizeof(CatalogMessage)) {}
  uint32_t number() const { return catalog_record<uint32_t>(at + offsetof(CatalogMessage, number)); }
  uint32_t length() const { return catalog_record<uint32_t>(at + offsetof(CatalogMessage, length)); }
  uint32_t offset() const { return catalog_record<uint32_t>(at + offsetof(CatalogMessage, offset)); }
};

// Whether `count` records of a size lie inside a file.
constexpr bool lies_inside(uint32_t file_size, uint32_t offset, uint64_t count, uint64_t record_size) {
  return offset <= file_size && count * record_size <= file_size - offset;
}

}  // namespace lx
