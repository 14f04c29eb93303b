// SPDX-License-Identifier: Apache-2.0
#include "catalog_file.hpp"

#include <cstddef>
#include <cstring>

#include "object_file.hpp"
#include "pack_pool.hpp"

namespace lx::compiler {

namespace {

// Readers take offsets as signed numbers.
constexpr size_t kLargestCatalog = INT32_MAX;

uint32_t in_order(uint32_t value, uint32_t byte_order) {
  return byte_order == kNativeCatalog ? value : __builtin_bswap32(value);
}

// Records are their numbers, one after the other.
template <class Record>
void turn(Record& record, size_t numbers, uint32_t byte_order) {
  auto* bytes = reinterpret_cast<char*>(&record);
  for (size_t i = 0; i < numbers; ++i) {
    auto value = in_order(catalog_record<uint32_t>(bytes + i * sizeof(uint32_t)), byte_order);
    std::memcpy(bytes + i * sizeof value, &value, sizeof value);
  }
}
void turn(CatalogHeader& header, uint32_t byte_order) {
  turn(header, offsetof(CatalogHeader, locale) / sizeof(uint32_t), byte_order);
}
template <class Record>
void turn(Record& record, uint32_t byte_order) {
  turn(record, sizeof record / sizeof(uint32_t), byte_order);
}

template <class Record>
void append(std::string& out, Record record, uint32_t byte_order) {
  turn(record, byte_order);
  out += bytes_of(record);
}

// Where the parts of a file lie: the header, all set records, all indexes, all texts.
struct Measures {
  size_t index = 0;
  size_t texts = 0;
  size_t end = 0;

  explicit Measures(const Catalog& catalog) {
    index = sizeof(CatalogHeader) + catalog.sets.size() * sizeof(CatalogSet);
    texts = index;
    size_t bytes = 0;
    for (const auto& [number, messages] : catalog.sets) {
      texts += messages.size() * sizeof(CatalogMessage);
      for (const auto& [message, text] : messages) bytes += text.size();
    }
    end = texts + bytes;
  }
};

class CatalogReader {
 public:
  explicit CatalogReader(std::string_view bytes) : bytes_(bytes) {}

  Catalog read() {
    auto header = record_at<CatalogHeader>(bytes_, 0);
    catalog_.byte_order = byte_order_of(header);
    turn(header, catalog_.byte_order);
    if (header.version != kCatalogVersion) throw StructureError("the format version is not known");
    if (header.sets == 0) throw StructureError("there are no sets");
    if (std::memchr(header.locale, 0, sizeof header.locale) == nullptr) {
      throw StructureError("the locale name is not terminated");
    }
    catalog_.locale = header.locale;
    if (bytes_.size() > kLargestCatalog) throw StructureError("the file is too large");
    uint32_t offset = header.first_set;
    for (uint32_t i = 0, before = 0; i < header.sets; ++i) {
      auto set = read<CatalogSet>(offset);
      if (i != 0 && set.number <= before) fail(set, tool::message("the set is out of order"));
      before = set.number;
      read_set(set);
      offset = set.next;
    }
    return std::move(catalog_);
  }

 private:
  [[noreturn]] static void fail(const CatalogSet& set, const tool::Message& what) {
    throw StructureError(tool::message("set {0}: {1}", set.number, what));
  }
  static uint32_t byte_order_of(const CatalogHeader& header) {
    uint32_t foreign = kBigEndianCatalog + kLittleEndianCatalog - kNativeCatalog;
    for (uint32_t order : {kNativeCatalog, foreign}) {
      if (in_order(header.magic, order) == kCatalogMagic && in_order(header.byte_order, order) == order) return order;
    }
    throw StructureError("this is no message catalog");
  }

  template <class Record>
  Record read(size_t offset) const {
    auto record = record_at<Record>(bytes_, offset);
    turn(record, catalog_.byte_order);
    return record;
  }

  void read_set(const CatalogSet& set) {
    auto size = static_cast<uint32_t>(bytes_.size());
    if (!lies_inside(size, set.index_offset, set.messages, sizeof(CatalogMessage))) {
      fail(set, tool::message("the index reaches beyond the file"));
    }
    if (!lies_inside(size, set.text_offset, set.text_size, 1))
      fail(set, tool::message("the texts reach beyond the file"));
    CatalogMessages& messages = catalog_.sets[set.number];
    for (uint32_t i = 0, before = 0; i < set.messages; ++i) {
      auto message = read<CatalogMessage>(set.index_offset + i * sizeof(CatalogMessage));
      auto bad = [&](const char* what) { fail(set, tool::message(what, message.number)); };
      if (message.number <= before) bad("message {0} is out of order");
      if (message.number > INT32_MAX) bad("message {0} has too large a number");
      if (!lies_inside(set.text_size, message.offset, message.length, 1)) bad("message {0} is outside the texts");
      before = message.number;
      messages.emplace(message.number, bytes_.substr(set.text_offset + message.offset, message.length));
    }
  }

  std::string_view bytes_;
  Catalog catalog_;
};

}  // namespace

bool is_catalog(std::string_view bytes) {
  if (bytes.size() < sizeof(CatalogHeader)) return false;
  auto magic = catalog_record<uint32_t>(bytes.data());
  return magic == kCatalogMagic || magic == __builtin_bswap32(kCatalogMagic);
}

std::string pack_catalog(const Catalog& catalog) {
  Measures measures(catalog);
  if (measures.end > kLargestCatalog) throw PackError(tool::message("the catalog would have {0} bytes", measures.end));
  auto number = [](size_t value) { return static_cast<uint32_t>(value); };
  CatalogHeader header{
      kCatalogMagic, kCatalogVersion, catalog.byte_order, number(catalog.sets.size()), number(sizeof header), {}};
  catalog.locale.copy(header.locale, kLongestCatalogLocale);
  std::string sets, indexes, texts;
  append(sets, header, catalog.byte_order);
  for (const auto& [set_number, messages] : catalog.sets) {
    bool last = set_number == catalog.sets.rbegin()->first;
    CatalogSet set{set_number,
                   last ? 0 : number(sets.size() + sizeof set),
                   number(messages.size()),
                   number(measures.index + indexes.size()),
                   number(measures.texts + texts.size()),
                   0,
                   0};
    size_t begin = texts.size();
    for (const auto& [message_number, text] : messages) {
      append(indexes, CatalogMessage{message_number, number(text.size()), number(texts.size() - begin)},
             catalog.byte_order);
      texts += text;
    }
    set.text_size = number(texts.size() - begin);
    append(sets, set, catalog.byte_order);
  }
  return sets + indexes + texts;
}

Catalog unpack_catalog(std::string_view bytes) { return CatalogReader(bytes).read(); }

}  // namespace lx::compiler
