// SPDX-License-Identifier: Apache-2.0
// Sections 3 and 4: from Unicode to bytes.
#include <algorithm>

#include "pack_code_page.hpp"
#include "pack_pool.hpp"

namespace lx::compiler {

namespace {

struct Page {
  uint8_t number;
  uint8_t kind;
  uint8_t low;
  std::vector<Code> values;  // from `low` on; holes hold the substitution byte

  uint8_t high() const { return static_cast<uint8_t>(low + values.size() - 1); }
  uint8_t mask() const { return narrowest_mask(low, high()); }
};

constexpr uint8_t kTwoBytes = 1;       // kind: one array of 16-bit values
constexpr uint8_t kTwoBytesSplit = 4;  // kind: an array of bytes in each section

uint8_t kind_for(Code largest) {
  // Kind 0 holds one byte, and the next three one byte more each.
  return static_cast<uint8_t>(code_length(largest) - 1);
}

std::vector<Page> used_pages(const CodePage& page) {
  std::vector<Page> pages;
  for (unsigned number = 0; number < 256; ++number) {
    const Code* codes = &page.from_unicode[size_t{number} << 8];
    unsigned low = 0, high = 256;
    while (low < 256 && codes[low] == kNoCode) ++low;
    if (low == 256) continue;
    while (codes[high - 1] == kNoCode) --high;
    Page used{static_cast<uint8_t>(number), 0, static_cast<uint8_t>(low), {codes + low, codes + high}};
    std::replace(used.values.begin(), used.values.end(), kNoCode, Code{page.substitution});
    used.kind = kind_for(*std::max_element(used.values.begin(), used.values.end()));
    pages.push_back(std::move(used));
  }
  return pages;
}

// Places one array of elements of `width` bytes, each a part of a value, and returns the offset of its element 0.
size_t place(Pool& pool, const Page& page, unsigned width, unsigned shift) {
  std::vector<uint64_t> bytes;
  for (Code value : page.values) {
    for (unsigned i = width; i-- > 0;) bytes.push_back(value >> (shift + 8 * i) & 0xFF);
  }
  size_t before = size_t{static_cast<uint8_t>(page.low & page.mask())} * width;
  return pool.place(bytes, before, width) - before;
}

std::string pool_bytes(Pool& pool) {
  std::string bytes;
  for (uint64_t byte : pool.take(0)) bytes.push_back(static_cast<char>(byte));
  return bytes;
}

FromUnicodeSections pack(std::vector<Page> pages) {
  // Pages that need nothing before them come first, so that the rest can begin after them.
  std::stable_sort(pages.begin(), pages.end(), [](const Page& a, const Page& b) {
    auto rank = [](const Page& page) {
      return std::pair(page.low & page.mask(), -static_cast<int>(page.values.size()));
    };
    return rank(a) < rank(b);
  });
  FromUnicodeSections result{};
  for (FromUnicodePage& page : result.pages) page = {0, 0, 255, 0, 0, 0};
  Pool values, high_parts;
  for (const Page& page : pages) {
    const FromUnicodeKind& kind = kFromUnicodeKinds[page.kind];
    size_t value_offset = place(values, page, kind.value_width, 0);
    size_t high_offset =
        kind.high_part_width == 0 ? 0 : place(high_parts, page, kind.high_part_width, kind.high_part_shift);
    // An offset that does not fit belongs to a section that is too large, which the caller sees.
    result.pages[page.number] = {page.kind,
                                 page.mask(),
                                 page.low,
                                 page.high(),
                                 static_cast<uint16_t>(value_offset),
                                 static_cast<uint16_t>(high_offset)};
  }
  result.values = pool_bytes(values);
  result.high_parts = pool_bytes(high_parts);
  return result;
}

// Splits the largest two-byte pages until about `excess` bytes have moved to section 4; false when none is left.
bool split_pages(std::vector<Page>& pages, size_t excess) {
  std::vector<Page*> wide;
  for (Page& page : pages) {
    if (page.kind == kTwoBytes) wide.push_back(&page);
  }
  std::stable_sort(wide.begin(), wide.end(), [](Page* a, Page* b) { return a->values.size() > b->values.size(); });
  size_t moved = 0;
  for (Page* page : wide) {
    if (moved >= excess) break;
    page->kind = kTwoBytesSplit;
    moved += page->values.size();
  }
  return moved != 0;
}

}  // namespace

FromUnicodeSections pack_from_unicode(const CodePage& page) {
  std::vector<Page> pages = used_pages(page);
  for (;;) {
    FromUnicodeSections result = pack(pages);
    if (result.values.size() <= kLargestSection) return result;
    if (!split_pages(pages, result.values.size() - kLargestSection)) {
      throw PackError(tool::message("section 3 would have {0} bytes", result.values.size()));
    }
  }
}

}  // namespace lx::compiler
