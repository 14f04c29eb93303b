// SPDX-License-Identifier: Apache-2.0
#include "collation_host.hpp"

#include <set>

namespace lx::compiler {

namespace {

constexpr uint8_t kExact = 1;
constexpr uint8_t kOneWay = 2;  // of characters that only become the bytes of another one

class HostOrder {
 public:
  HostOrder(const CodePage& page, const std::vector<HostBlock>& blocks, Spot spot)
      : page_(page), blocks_(blocks), spot_(spot) {}

  SortObject run() {
    find_tables();
    host_characters();
    one_way_characters();
    other_characters();
    return std::move(sort_);
  }

 private:
  void find_tables() {
    for (const HostBlock& block : blocks_) {
      for (unsigned page : block.pages) {
        if (!in_block_.insert(page).second)
          throw SourceError(block.spot, tool::message("page {0} is given twice", hex_text(page, 2)));
      }
    }
    for (unsigned c = 0; c < 0x10000; ++c) {
      if (page_.from_unicode[c] == kNoCode || in_block_.count(c >> 8) != 0) continue;
      sort_.pages[c >> 8].kind = SortPageKind::table;
      sort_.tables[c >> 8];
    }
    constexpr size_t kMostTables = (65535 - sizeof(SortHeader)) / (256 * sizeof(SortWeight));
    if (sort_.tables.size() > kMostTables) {
      throw SourceError(spot_,
                        tool::message("the characters of the code page lie on {0} pages, and there is room for {1} "
                                      "tables: give pages that may follow their code points as \"block\"",
                                      sort_.tables.size(), kMostTables));
    }
  }

  // In the order of the bytes; packed codes are ordered by length first.
  void host_characters() {
    auto block = blocks_.begin();
    for (auto [code, unicode] : page_.to_unicode) {
      while (block != blocks_.end() && block->place <= code) put_block(*block++);
      if (page_.exact_code(unicode) != code || in_block_.count(unicode >> 8u) != 0) continue;
      put(unicode, next_++, kExact);
    }
    while (block != blocks_.end()) put_block(*block++);
  }

  void put_block(const HostBlock& block) {
    for (unsigned page : block.pages) put_page(page);
  }

  void put_page(unsigned page) {
    if (next_ > 0x10000 - 256)
      throw SourceError(spot_, "there are more primary weights than the 65,535 that are possible");
    sort_.pages[page] = {SortPageKind::primary, kForwardMask, static_cast<uint16_t>(next_)};
    next_ += 256;
  }

  void one_way_characters() {
    for (unsigned c = 0; c < 0x10000; ++c) {
      Code code = page_.from_unicode[c];
      auto unicode = static_cast<uint16_t>(c);
      if (code == kNoCode || page_.exact_code(unicode) != kNoCode || in_block_.count(c >> 8) != 0) continue;
      uint16_t twin = page_.unicode_of(code);
      if (in_block_.count(twin >> 8u) == 0) put(unicode, place(twin).weight, kOneWay);
    }
  }

  // The halves of characters beyond U+FFFF: the first ones keep their order, and the second ones differ only where
  // all else is equal, since there are not enough primary weights.
  void other_characters() {
    for (unsigned page = 0; page < 256; ++page) {
      if (in_block_.count(page) != 0) continue;
      if (page >= 0xDC && page <= 0xDF && sort_.pages[page].kind == SortPageKind::empty) {
        sort_.pages[page] = {SortPageKind::special, kForwardMask, static_cast<uint16_t>((page - 0xDB) * 256)};
      } else if (sort_.pages[page].kind == SortPageKind::table) {
        rest_of_table(page);
      } else {
        put_page(page);
      }
    }
  }

  void rest_of_table(unsigned page) {
    for (unsigned low = 0; low < 256; ++low) {
      auto c = static_cast<uint16_t>(page << 8 | low);
      if (place(c).weight == 0) put(c, next_++, kExact);
    }
  }

  SortEntry& place(uint16_t c) { return sort_.tables[c >> 8u][c & 0xFF]; }

  void put(uint16_t c, unsigned primary, uint8_t tertiary) {
    if (primary > 0xFFFF) throw SourceError(spot_, "there are more primary weights than the 65,535 that are possible");
    place(c) = {static_cast<uint16_t>(primary), 1, tertiary, false, false, kForwardMask};
  }

  const CodePage& page_;
  const std::vector<HostBlock>& blocks_;
  Spot spot_;
  SortObject sort_;
  std::set<unsigned> in_block_;
  unsigned next_ = kFirstPrimary;
};

}  // namespace

SortObject order_of_code_page(const CodePage& page, const std::vector<HostBlock>& blocks, Spot spot) {
  return HostOrder(page, blocks, spot).run();
}

}  // namespace lx::compiler
