// SPDX-License-Identifier: Apache-2.0
#include "pack_code_page.hpp"

#include <algorithm>

#include "pack_pool.hpp"

namespace lx::compiler {

namespace {

// Two characters of JIS X 0208 have two readings in Unicode. A page gives one of them back and understands both.
uint16_t other_reading(uint16_t wide) {
  switch (wide) {
    case 0xFF0D:  // full-width hyphen-minus
      return 0x2212;
    case 0xFF5E:  // full-width tilde
      return 0x301C;
    default:
      return wide;
  }
}

// The full-width form in the page, when it is a character of several bytes other than the one that is asked for.
Code full_width_code(const CodePage& page, const UnicodeTables& unicode, Code code, uint16_t value) {
  uint16_t wide = unicode.full_width(value);
  Code wide_code = wide == value ? kNoCode : page.from_unicode[wide];
  uint16_t reading = page.unicode_of(wide_code);
  if (reading != wide && reading != other_reading(wide)) wide_code = kNoCode;
  return wide_code == code || (wide_code != kNoCode && code_length(wide_code) == 1 && code_length(code) == 1)
             ? kNoCode
             : wide_code;
}

uint16_t single_byte_value(const CodePage& page, uint8_t byte) {
  // Read without regard to shift states, a shift byte is the control character of that number.
  if (page.mixed() && (byte == page.enter_byte || byte == page.leave_byte)) return byte;
  return page.unicode_of(byte);
}

// The byte of the mapped character, or the byte itself when the page has no such one-byte character.
uint8_t partner_byte(const CodePage& page, uint8_t byte, uint16_t value, uint16_t mapped) {
  Code code = mapped == value ? kNoCode : page.exact_code(mapped);
  return code < 0x100 ? static_cast<uint8_t>(code) : byte;
}

// What both layouts have in common; both structs name these fields alike.
template <class Header>
void fill_header(Header& header, const CodePage& page, const UnicodeTables& unicode) {
  header.substitution = page.substitution;
  std::copy(page.line_bytes.begin(), page.line_bytes.end(), header.line_bytes);
  header.max_length = static_cast<uint8_t>(page.max_length());
  bool every_byte = header.max_length == 1 || page.mixed();
  for (unsigned i = 0; i < 256; ++i) {
    auto byte = static_cast<uint8_t>(i);
    uint16_t value = single_byte_value(page, byte);
    header.char_length[i] = every_byte || value != kUnassigned;
    header.upper[i] = partner_byte(page, byte, value, unicode.upper(value));
    header.lower[i] = partner_byte(page, byte, value, unicode.lower(value));
    header.to_unicode[i] = value;
    header.types[i] = value == kUnassigned ? kUnassignedType : unicode.type(value);
  }
  if (!every_byte) {
    for (auto [code, value] : page.to_unicode) {
      unsigned length = code_length(code);
      header.char_length[code_byte(code, length, 0)] = static_cast<uint8_t>(length);
    }
  }
  header.flags =
      static_cast<uint16_t>((page.family == Family::ascii ? kAsciiFamily : 0) | (page.mixed() ? kShiftSensitive : 0));
}

// The tables behind the header of a multibyte page.
struct VariablePart {
  std::string full_width;
  std::string half_to_full;
  TypeTables types;
};

VariablePart pack_variable_part(const CodePage& page, const UnicodeTables& unicode) {
  VariablePart part;
  for (unsigned byte = 0; byte < 256; ++byte) {
    uint16_t value = page.unicode_of(byte);
    Code wide = value == kUnassigned ? kNoCode : full_width_code(page, unicode, byte, value);
    part.full_width += bytes_of(BeU32(wide == kNoCode ? 0 : wide));
  }
  for (auto [code, value] : page.to_unicode) {
    Code wide = code_length(code) == 1 ? kNoCode : full_width_code(page, unicode, code, value);
    if (wide != kNoCode) part.half_to_full += bytes_of(WidthPair{code, wide});
  }
  part.types = pack_types(page, unicode);
  return part;
}

uint16_t offset16(size_t offset) {
  if (offset > kLargestSection) throw PackError("section 1 would have more than 65535 bytes");
  return static_cast<uint16_t>(offset);
}

// The section with its variable part. The full-width table opens that part in the older layout; in the current one the
// type entries do, so that what follows them serves as the room that the boundless walk needs.
template <class Header>
std::string with_variable_part(Header& header, const VariablePart& part, bool entries_first) {
  std::string tables;
  auto append = [&tables](BeU16& field, const std::string& table) {
    field = offset16(sizeof(Header) + tables.size());
    tables += table;
  };
  if (entries_first) append(header.type_entries, part.types.entries);
  if (entries_first) append(header.type_states, part.types.states);
  append(header.full_width, part.full_width);
  append(header.half_to_full, part.half_to_full);
  if (!entries_first) append(header.type_states, part.types.states);
  if (!entries_first) append(header.type_entries, part.types.entries);
  header.half_to_full_count = static_cast<uint16_t>(part.half_to_full.size() / sizeof(WidthPair));
  size_t least = header.type_entries + part.types.reach - sizeof(Header);
  if (tables.size() < least) tables.resize(least);
  return std::string(bytes_of(header)) + tables;
}

template <class Header>
Sections pack(const CodePage& page, const UnicodeTables& unicode, Layout layout) {
  Sections sections;
  Header header{};
  fill_header(header, page, unicode);
  if constexpr (std::is_same_v<Header, CodePageHeader>) {
    header.enter_byte = page.enter_byte;
    header.leave_byte = page.leave_byte;
  }
  bool by_rule = page.kind == PageKind::utf8;
  if (by_rule) {
    for (FromUnicodePage& entry : header.from_unicode) entry = {0, 0, 255, 0, 0, 0};
  } else {
    FromUnicodeSections from = pack_from_unicode(page);
    std::copy(std::begin(from.pages), std::end(from.pages), header.from_unicode);
    sections[2] = std::move(from.values);
    sections[3] = std::move(from.high_parts);
  }
  if (header.max_length == 1) {
    sections[0] = bytes_of(header);
    return sections;
  }
  if (!by_rule) {
    ToUnicodeSection to = pack_to_unicode(page, layout);
    header.to_unicode_array = to.array_offset;
    sections[1] = std::move(to.bytes);
  }
  sections[0] = with_variable_part(header, pack_variable_part(page, unicode), layout == Layout::current);
  return sections;
}

}  // namespace

Sections pack_code_page(const CodePage& page, const UnicodeTables& unicode, Layout layout) {
  if (layout == Layout::current) return pack<CodePageHeader>(page, unicode, layout);
  if (page.kind != PageKind::single && page.kind != PageKind::multibyte) {
    throw PackError("the version-1 layout knows neither shift bytes nor UTF-8");
  }
  Sections sections = pack<CodePageHeaderV1>(page, unicode, layout);
  if (page.kind == PageKind::single) sections[0].resize(offsetof(CodePageHeaderV1, full_width));
  return sections;
}

}  // namespace lx::compiler
