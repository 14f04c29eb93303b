// SPDX-License-Identifier: Apache-2.0
#include "unicode_tables.hpp"

#include <algorithm>
#include <iterator>
#include <optional>

#include "objects/code_page_format.hpp"
#include "source_text.hpp"

namespace lx::compiler {

namespace {

// The library tabulates these blocks and types everything else by rule.
struct Block {
  const char* name;   // in the sources
  const char* array;  // in the library, behind LX_UNICODE_
  uint16_t first, last;
};
constexpr Block kTypeBlocks[] = {{"1", "Ctype1", 0x0000, 0x06F9}, {"2", "Ctype2", 0x0901, 0x0EDD},
                                 {"3", "Ctype3", 0x10A0, 0x11F9}, {"4", "Ctype4", 0x1E00, 0x21FF},
                                 {"5", "Ctype5", 0x22F2, 0x27BE}, {"6", "Ctype6", 0x3000, 0x33FE},
                                 {"7", "Ctype7", 0xFB00, 0xFBD2}, {"8", "Ctype8", 0xFD3E, 0xFFFF}};
constexpr Block kCaseBlocks[] = {{"lower 1", "Lower1", 0x0100, 0x01FE}, {"lower 2", "Lower2", 0x0200, 0x0275},
                                 {"lower 3", "Lower3", 0x0380, 0x03EE}, {"lower 4", "Lower4", 0x0400, 0x04F8},
                                 {"lower 5", "Lower5", 0x1E00, 0x1EF8}, {"lower 6", "Lower6", 0x1F00, 0x1FFC},
                                 {"upper 1", "Upper1", 0x0100, 0x01FF}, {"upper 2", "Upper2", 0x0200, 0x0292},
                                 {"upper 3", "Upper3", 0x03A0, 0x03F1}, {"upper 4", "Upper4", 0x0430, 0x04F9},
                                 {"upper 5", "Upper5", 0x1E00, 0x1EF9}, {"upper 6", "Upper6", 0x1F00, 0x1FF3}};
constexpr Block kWidthBlocks[] = {{"H2F1", "H2F1", 0x00A0, 0x00AF}, {"H2F2", "H2F2", 0xFF60, 0xFFEE},
                                  {"F2H1", "F2H1", 0x2500, 0x25CB}, {"F2H2", "F2H2", 0x3000, 0x30FC},
                                  {"F2H3", "F2H3", 0x3130, 0x3164}, {"F2H4", "F2H4", 0xFFE0, 0xFFE6}};

constexpr const char* kClasses[] = {"alpha", "upper", "lower", "digit", "xdigit",
                                    "punct", "space", "blank", "cntrl", "ascii"};
constexpr const char* kDirections[] = {"-", "L", "R", "EN", "ES", "ET", "AN", "CS", "B", "S", "WS", "ON"};
constexpr const char* kForms[] = {"nonspacing", "diacritic", "vowel",     "symbol",    "katakana",
                                  "hiragana",   "halfwidth", "fullwidth", "ideograph", "kashida"};
constexpr unsigned kDirectionShift = 10;
constexpr unsigned kFormShift = 22;

// Follows the "table" lines of a source, which must name the blocks in order, and the ascending code points between.
class BlockReader {
 public:
  template <size_t N>
  explicit BlockReader(const Block (&blocks)[N]) : next_(blocks), end_(blocks + N) {}

  bool accept_table(Cursor& cursor) {
    Spot start = cursor.spot();
    if (!cursor.accept("table ")) return false;
    if (next_ == end_) throw SourceError(start, "there is no further table");
    std::string expected = std::string(next_->name) + " " + hex_text(next_->first, 4) + " " + hex_text(next_->last, 4);
    if (!cursor.accept(expected)) cursor.fail(tool::message("expected \"{0}\"", expected));
    cursor.end();
    current_ = next_++;
    least_ = current_->first;
    return true;
  }
  uint16_t code_point(Cursor& cursor) {
    Spot start = cursor.spot();
    uint32_t value = cursor.hex(4);
    if (current_ == nullptr) throw SourceError(start, "expected \"table\"");
    if (value < least_ || value > current_->last) throw SourceError(start, "out of order, or outside its table");
    least_ = value + 1;
    return static_cast<uint16_t>(value);
  }
  bool complete() const { return next_ == end_; }
  const Block* current() const { return current_; }

 private:
  const Block* next_;
  const Block* end_;
  const Block* current_ = nullptr;
  uint32_t least_ = 0;
};

template <size_t N>
uint32_t read_bits(Cursor& cursor, const char* const (&names)[N]) {
  uint32_t bits = 0;
  while (!cursor.done() && cursor.peek() != U';') {
    Spot start = cursor.spot();
    std::string word = cursor.word("a property");
    const char* const* name = std::find(std::begin(names), std::end(names), word);
    if (name == std::end(names)) throw SourceError(start, tool::message("unknown property \"{0}\"", word));
    bits |= 1u << (name - std::begin(names));
    cursor.skip_blanks();
  }
  return bits;
}

void separator(Cursor& cursor) {
  cursor.expect(U';');
  cursor.skip_blanks();
}

uint32_t type_by_rule(uint32_t c) {
  auto in = [c](uint32_t first, uint32_t last) { return c >= first && c <= last; };
  if (in(0x4E00, 0x9FA5) || in(0xF900, 0xFA2D)) return 0x40000801;
  if (in(0xAC00, 0xD7A3)) return 0x801;
  if (in(0x2212, 0x2213)) return 0x2008020;
  if (c == 0x221E) return 0x200020;
  if (in(0x2200, 0x22F1)) return 0x2200020;
  if (c == 0xFBE9 || c == 0xFCE1) return kUnassignedType;
  if (in(0xFBD3, 0xFD3D)) return 0x1001;
  return kUnassignedType;
}

void add(std::vector<uint16_t>& map, uint32_t first, uint32_t last, int difference) {
  for (uint32_t c = first; c <= last; ++c) map[c] = static_cast<uint16_t>(static_cast<int>(c) + difference);
}

// Tables of pairs: a code point and what it is mapped to.
template <size_t N, class Store>
void read_mappings(const fs::path& path, const Block (&tables)[N], Report& report, Store store) {
  SourceFile source(path.string(), read_file(path), report);
  BlockReader blocks(tables);
  source.for_each_line(report, [&](Cursor& cursor) {
    if (blocks.accept_table(cursor)) return;
    uint16_t c = blocks.code_point(cursor);
    cursor.expect(U' ');
    uint16_t mapped = cursor.unicode_escape();
    cursor.end();
    store(*blocks.current(), c, mapped);
  });
  if (!blocks.complete()) report.error(source.name(), source.end(), "tables are missing");
}

template <class Value>
UnicodeArray cut(const Block& block, const std::vector<Value>& map) {
  return {std::string("LX_UNICODE_") + block.array, block.first, {&map[block.first], &map[block.last] + 1}};
}

}  // namespace

// Mappings that follow a rule; the sources give the rest.
UnicodeTables::UnicodeTables() : type_(65536), lower_(65536), upper_(65536), full_width_(65536), half_width_(65536) {
  for (uint32_t c = 0; c < 65536; ++c) type_[c] = type_by_rule(c);
  for (auto* map : {&lower_, &upper_, &full_width_, &half_width_}) add(*map, 0, 0xFFFF, 0);
  constexpr struct {
    uint16_t first, last;
    int difference;
    bool both_ways;
  } kPairs[] = {{0x41, 0x5A, 32, true},      {0xC0, 0xDE, 32, true},     {0x531, 0x556, 48, true},
                {0x10A0, 0x10C5, 48, false}, {0x2160, 0x216F, 16, true}, {0x24B6, 0x24CF, 26, true},
                {0xFF21, 0xFF3A, 32, true}};
  for (const auto& pair : kPairs) {
    add(lower_, pair.first, pair.last, pair.difference);
    auto first = static_cast<uint32_t>(pair.first + pair.difference);
    auto last = static_cast<uint32_t>(pair.last + pair.difference);
    if (pair.both_ways) add(upper_, first, last, -pair.difference);
  }
  lower_[0xD7] = 0xD7;  // the signs in the middle of the letters
  upper_[0xF7] = 0xF7;
  upper_[0xFF] = 0x178;
  add(full_width_, 0x21, 0x7E, 0xFEE0);
  full_width_[0x20] = 0x3000;
  full_width_[0x20A9] = 0xFFE6;
}

void UnicodeTables::read_types(const fs::path& path, Report& report) {
  SourceFile source(path.string(), read_file(path), report);
  BlockReader blocks(kTypeBlocks);
  source.for_each_line(report, [&](Cursor& cursor) {
    if (blocks.accept_table(cursor)) {
      for (uint32_t c = blocks.current()->first; c <= blocks.current()->last; ++c) type_[c] = kUnassignedType;
      return;
    }
    uint32_t first = blocks.code_point(cursor);
    uint32_t last = cursor.accept("..") ? blocks.code_point(cursor) : first;
    cursor.skip_blanks();
    separator(cursor);
    uint32_t word = read_bits(cursor, kClasses);
    separator(cursor);
    Spot spot = cursor.spot();
    uint32_t direction = read_bits(cursor, kDirections);
    if (direction == 0 || (direction & (direction - 1)) != 0) throw SourceError(spot, "expected one direction");
    separator(cursor);
    word |= direction << kDirectionShift | read_bits(cursor, kForms) << kFormShift;
    cursor.end();
    for (uint32_t c = first; c <= last; ++c) type_[c] = word;
  });
  if (!blocks.complete()) report.error(source.name(), source.end(), "tables are missing");
}

void UnicodeTables::read_cases(const fs::path& path, Report& report) {
  read_mappings(path, kCaseBlocks, report, [&](const Block& block, uint16_t c, uint16_t mapped) {
    (block.name[0] == 'l' ? lower_ : upper_)[c] = mapped;
  });
}

void UnicodeTables::read_widths(const fs::path& path, Report& report) {
  read_mappings(path, kWidthBlocks, report, [&](const Block& block, uint16_t c, uint16_t mapped) {
    (block.name[0] == 'H' ? full_width_ : half_width_)[c] = mapped;
  });
}

void UnicodeTables::read_digits(const fs::path& path, Report& report) {
  SourceFile source(path.string(), read_file(path), report);
  std::vector<bool> listed(65536);
  uint32_t least = 0;
  source.for_each_line(report, [&](Cursor& cursor) {
    uint16_t c = cursor.unicode_escape();
    if (c < least) throw SourceError({cursor.spot().line, 1}, "out of order");
    least = c + 1u;
    cursor.expect(U' ');
    Spot spot = cursor.spot();
    uint16_t digit = cursor.unicode_escape();
    if (digit < 0x30 || digit > 0x39) throw SourceError(spot, "expected an ASCII digit");
    cursor.end();
    listed[c] = true;
    digits_.push_back({c, digit});
  });
  for (uint32_t c = 0; c < 65536; ++c) {
    if ((type_[c] & kDigit) != 0 && !listed[c]) {
      report.error(source.name(), source.end(),
                   tool::message("{0} has the type digit but is not listed", unicode_name(c)));
    }
  }
}

UnicodeTables UnicodeTables::read(const fs::path& directory, Report& report) {
  UnicodeTables tables;
  tables.read_types(directory / "ctype.txt", report);
  tables.read_cases(directory / "case.txt", report);
  tables.read_widths(directory / "width.txt", report);
  tables.read_digits(directory / "digits.txt", report);
  return tables;
}

std::vector<UnicodeArray> UnicodeTables::type_arrays() const {
  std::vector<UnicodeArray> arrays;
  for (const Block& block : kTypeBlocks) arrays.push_back(cut(block, type_));
  return arrays;
}

std::vector<UnicodeArray> UnicodeTables::map_arrays() const {
  std::vector<UnicodeArray> arrays;
  for (const Block& block : kCaseBlocks) arrays.push_back(cut(block, block.name[0] == 'l' ? lower_ : upper_));
  for (const Block& block : kWidthBlocks)
    arrays.push_back(cut(block, block.name[0] == 'H' ? full_width_ : half_width_));
  return arrays;
}

}  // namespace lx::compiler
