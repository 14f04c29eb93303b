// SPDX-License-Identifier: Apache-2.0
// Builds the native tables of a checked code page.
#include "objects/code_page.hpp"

#include <pthread.h>

#include <algorithm>
#include <bit>
#include <cstring>
#include <new>

#include "frame/memory.hpp"
#include "objects/code_page_check.hpp"

namespace lx {
namespace {

constexpr size_t kPageSize = 256;

constexpr size_t aligned(size_t size) { return (size + 7) & ~size_t{7}; }

// The numbers of nodes and rows that the to-Unicode states become. Equal states share one.
class StateNumbers {
 public:
  explicit StateNumbers(const CheckedCodePage& page) : page_(page) {
    if (page.state_count == 0) return;
    number_ = Owned<uint16_t>::zeroed(page.state_count);
    if (number_) visit(0);
  }

  bool ok() const { return page_.state_count == 0 || number_; }
  uint16_t nodes() const { return nodes_; }
  uint16_t rows() const { return rows_; }
  uint16_t at(uint32_t state) const { return number_[state] == kEmpty ? uint16_t{0} : number_[state]; }

  // Calls back once for every state that has a number.
  template <class Fill>
  void for_each(Fill fill) const {
    for (uint32_t state = 0; state < page_.state_count; ++state) {
      if (number_[state] != 0 && number_[state] != kEmpty) fill(page_.states[state], number_[state]);
    }
  }

 private:
  // A state that accepts no byte shares row 0, which maps every byte to U+FFFD.
  static constexpr uint16_t kEmpty = 0xFFFF;

  void visit(uint32_t state) {  // no deeper than the longest character
    if (number_[state] != 0) return;
    const ToUnicodeState& step = page_.states[state];
    if (step.low > step.high) {
      number_[state] = kEmpty;
    } else if (step.final != 0) {
      number_[state] = rows_++;
    } else {
      number_[state] = static_cast<uint16_t>(CodePage::kNode | nodes_++);
      for (unsigned byte = step.low; byte <= step.high; ++byte) visit(step.index + (byte & step.mask));
    }
  }

  const CheckedCodePage& page_;
  Owned<uint16_t> number_;
  uint16_t nodes_ = 0;
  uint16_t rows_ = 1;
};

bool has_values(const FromUnicodePage& page) { return page.low <= page.high; }

// Pages from UCS-2 and the width of their elements.
struct FromUnicodePlan {
  uint16_t pages = 1;
  bool wide = false;

  explicit FromUnicodePlan(const CheckedCodePage& checked, bool by_rule) {
    if (by_rule) return;
    for (const FromUnicodePage& page : checked.header->from_unicode) {
      if (!has_values(page)) continue;
      ++pages;
      wide = wide || page.kind == 2 || page.kind == 3;
    }
  }
  size_t size() const { return aligned(pages * kPageSize * (wide ? sizeof(uint32_t) : sizeof(uint16_t))); }
};

uint32_t element(const uint8_t* array, unsigned index, unsigned width) {
  if (width == 1) return array[index];
  return uint32_t{array[2 * index]} << 8 | array[2 * index + 1];
}

uint32_t packed_value(const CheckedCodePage& checked, const FromUnicodePage& page, unsigned low) {
  if (page.kind >= kFromUnicodeKindCount) return 0;
  const FromUnicodeKind& kind = kFromUnicodeKinds[page.kind];
  unsigned index = low & page.mask;
  uint32_t value = element(checked.values + page.values, index, kind.value_width);
  if (kind.high_part_width == 0) return value;
  return value + (element(checked.high_parts + page.high_parts, index, kind.high_part_width) << kind.high_part_shift);
}

template <class Element>
void fill_from_unicode(CodePage& page, Element* pages, const Element* (&by_high)[256]) {
  const CodePageHeader& header = *page.raw.header;
  // The first array holds only the substitution byte and serves all pages without characters.
  for (size_t i = 0; i < kPageSize; ++i) pages[i] = page.substitution;
  Element* next = pages + kPageSize;
  for (unsigned high = 0; high < 256; ++high) {
    const FromUnicodePage& source = header.from_unicode[high];
    by_high[high] = pages;
    if (page.kind == PageKind::utf8 || !has_values(source)) continue;
    Element* values = next;
    for (unsigned low = 0; low < source.low; ++low) values[low] = page.substitution;
    for (unsigned low = source.low; low <= source.high; ++low) {
      values[low] = static_cast<Element>(packed_value(page.raw, source, low));
    }
    for (unsigned low = source.high + 1u; low < 256; ++low) values[low] = page.substitution;
    by_high[high] = values;
    next += kPageSize;
  }
}

void fill_to_unicode(CodePage& page, const StateNumbers& numbers, uint16_t* nodes, uint16_t* rows) {
  for (size_t i = 0; i < kPageSize; ++i) rows[i] = kUnassigned;
  const uint8_t* array = page.raw.to_unicode_array;
  numbers.for_each([&](const ToUnicodeState& step, uint16_t number) {
    if ((number & CodePage::kNode) != 0) {
      uint16_t* node = nodes + (number & ~unsigned{CodePage::kNode}) * kPageSize;
      std::memset(node, 0, kPageSize * sizeof *node);
      for (unsigned byte = step.low; byte <= step.high; ++byte)
        node[byte] = numbers.at(step.index + (byte & step.mask));
    } else {
      uint16_t* row = rows + number * kPageSize;
      for (unsigned byte = 0; byte < 256; ++byte) {
        bool inside = byte >= step.low && byte <= step.high;
        row[byte] = inside ? static_cast<uint16_t>(element(array, step.index + (byte & step.mask), 2)) : kUnassigned;
      }
    }
  });
  page.trail_low = 0xFF;
  page.trail_high = 0;
  numbers.for_each([&](const ToUnicodeState& step, uint16_t) {
    if (&step == page.raw.states) return;
    page.trail_low = std::min(page.trail_low, step.low);
    page.trail_high = std::max(page.trail_high, step.high);
  });
  page.root = page.raw.state_count != 0 ? numbers.at(0) : uint16_t{0};
  page.nodes = nodes;
  page.rows = rows;
}

void fill_leads(CodePage& page) {
  bool walks = (page.root & CodePage::kNode) != 0;
  const uint16_t* node = walks ? page.nodes + (page.root & ~unsigned{CodePage::kNode}) * kPageSize : nullptr;
  for (unsigned byte = 0; byte < 256; ++byte) {
    unsigned length = page.shift_sensitive ? page.max_length : page.char_length[byte];
    bool shifts = page.shift_sensitive && (byte == page.enter_byte || byte == page.leave_byte);
    bool row = length == 2 && walks && (node[byte] & CodePage::kNode) == 0;
    page.lead[byte] = shifts || length == 1 ? CodePage::kNoLead : row ? node[byte] : CodePage::kOtherLength;
  }
}

uint32_t utf8_of(uint16_t ucs2) {
  if (ucs2 == kUnassigned) return 0;
  if (ucs2 < 0x80) return 1u << 24 | ucs2;
  uint32_t last = 0x80u | (ucs2 & 0x3F);
  if (ucs2 < 0x800) return 2u << 24 | last << 8 | (0xC0u | ucs2 >> 6);
  return 3u << 24 | last << 16 | (0x80u | (ucs2 >> 6 & 0x3F)) << 8 | (0xE0u | ucs2 >> 12);
}

void fill_bytes(CodePage& page) {
  const CodePageHeader& header = *page.raw.header;
  page.latin1 = true;
  for (unsigned byte = 0; byte < 256; ++byte) {
    uint8_t length = header.char_length[byte];
    page.char_length[byte] = length == 0 ? 1 : length;
    uint16_t ucs2 = header.to_unicode[byte];
    page.to_unicode[byte] = ucs2;
    page.utf8_of_byte[byte] = utf8_of(ucs2);
    page.latin1_of_byte[byte] = static_cast<uint8_t>(ucs2);
    page.latin1 = page.latin1 && ucs2 < 0x100;
    page.ascii_of_byte[byte] = ucs2 < 0x80 ? static_cast<uint8_t>(ucs2) : uint8_t{0x80};
  }
  if (page.shift_sensitive) page.ascii_of_byte[page.enter_byte] = page.ascii_of_byte[page.leave_byte] = 0x80;
}

PageKind kind_of(const CodePage& page) {
  if (page.id == kUtf8Id) return PageKind::utf8;
  for (uint8_t length : page.char_length) {
    if (length > 1) return PageKind::multibyte;
  }
  // Characters of several bytes can come out of it all the same; only reading needs no length.
  return PageKind::single;
}

// The facts that let runs of ASCII be copied or mapped bytewise.
void note_ascii(CodePage& page) {
  page.ascii_bytes = true;
  page.ascii_from = 0;
  for (unsigned byte = 0; byte < 128; ++byte) {
    auto ucs2 = static_cast<uint16_t>(byte);
    uint32_t packed = page.kind == PageKind::utf8 ? ucs2 : page.packed(ucs2);
    bool plain = page.char_length[byte] == 1 && page.to_unicode[byte] == ucs2 && packed == byte;
    page.ascii_bytes = page.ascii_bytes && plain;
    bool there = packed < 0x100 && page.to_unicode[packed] == ucs2;
    if (!there) page.ascii_from = byte < 0x20 ? 0x20 : 0x80;
  }
  page.latin1_bytes = page.kind == PageKind::single && page.latin1;
  for (unsigned ucs2 = 0; ucs2 < 256; ++ucs2) {
    uint32_t packed = page.packed(static_cast<uint16_t>(ucs2));
    page.byte_of_latin1[ucs2] = static_cast<uint8_t>(packed);
    page.latin1_bytes = page.latin1_bytes && page.latin1_of_byte[ucs2] == ucs2 && packed == ucs2;
  }
  page.usual = page.kind == PageKind::utf8 || page.packed(kUnassigned) == page.substitution;
  page.standard_utf8 = page.kind == PageKind::utf8 && page.ascii_bytes;
  for (unsigned byte = 0x80; byte < 256; ++byte) {
    unsigned usual = byte >= 0xC2 && byte < 0xE0 ? 2 : byte >= 0xE0 && byte < 0xF0 ? 3 : 1;
    page.standard_utf8 = page.standard_utf8 && page.char_length[byte] == usual;
  }
}

void fill_types(CodePage& page, LXCharType* types) {
  page.types = types;
  std::transform(page.raw.type_entries, page.raw.type_entries + page.raw.type_entry_count, types,
                 [](const TypeEntry& entry) {
                   return LXCharType{entry.flags, entry.delta};
                 });
}

uint32_t bits_for_half_forms(const CheckedCodePage& checked) {
  uint32_t forms = (checked.full_width != nullptr ? 256 : 0) + checked.half_to_full_count;
  return forms != 0 ? static_cast<uint32_t>(std::bit_width(forms)) + 1 : 0;
}

void fill_half_forms(CodePage& page, uint64_t* forms, uint32_t bits) {
  if (bits == 0) return;
  page.half_forms = forms;
  page.half_form_bits = bits;
  for (size_t i = 0; i < size_t{1} << bits; ++i) forms[i] = CodePage::kNoHalfForm;
  // Of several half-width forms the first one stays: a byte, then the lowest pair.
  auto add = [&](uint32_t full, uint32_t form) {
    size_t at = page.half_form_place(full);
    while (static_cast<uint32_t>(forms[at]) != CodePage::kNoHalfForm) {
      if (forms[at] >> 32 == full) return;
      at = page.next_half_form(at);
    }
    forms[at] = uint64_t{full} << 32 | form;
  };
  const CheckedCodePage& raw = page.raw;
  for (uint32_t byte = 0; raw.full_width != nullptr && byte < 256; ++byte) add(raw.full_width[byte], byte);
  for (uint32_t i = 0; i < raw.half_to_full_count; ++i) add(raw.half_to_full[i].full, i + 256);
}

void fill_header(CodePage& page, uint16_t id) {
  const CodePageHeader& header = *page.raw.header;
  page.id = id;
  page.max_length = header.max_length;
  page.substitution = header.substitution;
  page.ascii_family = (header.flags & kAsciiFamily) != 0;
  page.shift_sensitive = (header.flags & kShiftSensitive) != 0 && header.max_length > 1;
  page.enter_byte = page.shift_sensitive ? header.enter_byte : uint8_t{0};
  page.leave_byte = page.shift_sensitive ? header.leave_byte : uint8_t{0};
}

// Where the tables of a page lie in its block.
struct BlockPlan {
  StateNumbers numbers;
  FromUnicodePlan from;
  size_t nodes_size;
  size_t rows_size;
  size_t types_size;
  uint32_t half_form_bits;
  size_t half_forms_size;

  BlockPlan(uint16_t id, const CheckedCodePage& checked)
      : numbers(checked),
        from(checked, id == kUtf8Id),
        nodes_size(aligned(numbers.nodes() * kPageSize * sizeof(uint16_t))),
        rows_size(aligned(numbers.rows() * kPageSize * sizeof(uint16_t))),
        types_size(aligned(checked.type_entry_count * sizeof(LXCharType))),
        half_form_bits(bits_for_half_forms(checked)),
        half_forms_size(half_form_bits != 0 ? sizeof(uint64_t) << half_form_bits : 0) {}
  size_t size() const {
    return aligned(sizeof(CodePage)) + nodes_size + rows_size + from.size() + types_size + half_forms_size;
  }
};

CodePage* place(uint8_t* block, uint16_t id, const CheckedCodePage& checked, const BlockPlan& plan) {
  auto* page = new (block) CodePage{};
  uint8_t* tables = block + aligned(sizeof(CodePage));
  auto* nodes = reinterpret_cast<uint16_t*>(tables);
  auto* rows = reinterpret_cast<uint16_t*>(tables + plan.nodes_size);
  uint8_t* from_pages = tables + plan.nodes_size + plan.rows_size;

  page->raw = checked;
  fill_header(*page, id);
  fill_bytes(*page);
  page->kind = kind_of(*page);
  fill_to_unicode(*page, plan.numbers, nodes, rows);
  fill_leads(*page);
  if (plan.from.wide) {
    fill_from_unicode(*page, reinterpret_cast<uint32_t*>(from_pages), page->from_wide);
  } else {
    fill_from_unicode(*page, reinterpret_cast<uint16_t*>(from_pages), page->from_narrow);
  }
  uint8_t* types = from_pages + plan.from.size();
  fill_types(*page, reinterpret_cast<LXCharType*>(types));
  fill_half_forms(*page, reinterpret_cast<uint64_t*>(types + plan.types_size), plan.half_form_bits);
  note_ascii(*page);
  return page;
}

// US-ASCII needs one row and two pages; it must be there when no memory is.
alignas(CodePage) uint8_t built_in_block[aligned(sizeof(CodePage)) + 3 * kPageSize * sizeof(uint16_t)];
const CodePage* built_in_page;

void build_built_in() {
  constexpr uint16_t kBuiltInId = 1;
  const SectionBytes sections[4] = {{LXDefaultCodePage, sizeof LXDefaultCodePage}, {}, {LXDefCP3, sizeof LXDefCP3}, {}};
  CheckedCodePage checked;
  if (check_code_page(kBuiltInId, sections, checked) != nullptr) __builtin_trap();
  BlockPlan plan(kBuiltInId, checked);
  if (plan.size() > sizeof built_in_block) __builtin_trap();
  built_in_page = place(built_in_block, kBuiltInId, checked, plan);
}

}  // namespace

CodePage* build_code_page(uint16_t id, const CheckedCodePage& checked) {
  BlockPlan plan(id, checked);
  if (!plan.numbers.ok()) return nullptr;
  auto* block = static_cast<uint8_t*>(allocate(plan.size()));
  return block != nullptr ? place(block, id, checked, plan) : nullptr;
}

const CodePage& built_in_code_page() {
  static pthread_once_t once = PTHREAD_ONCE_INIT;
  pthread_once(&once, build_built_in);
  return *built_in_page;
}

}  // namespace lx
