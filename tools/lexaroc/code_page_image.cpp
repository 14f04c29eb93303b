// SPDX-License-Identifier: Apache-2.0
#include "code_page_image.hpp"

#include <algorithm>
#include <iterator>
#include <utility>

namespace lx::compiler {

namespace {

constexpr uint8_t kLastByte = 0xFF;

// The older header without the tables that only multibyte pages have may end before them.
CodePageHeaderV1 read_header_v1(std::string_view section) {
  constexpr size_t kSingleByteSize = offsetof(CodePageHeaderV1, full_width);
  std::string bytes(section.substr(0, std::min(section.size(), sizeof(CodePageHeaderV1))));
  if (bytes.size() == kSingleByteSize && record_at<uint8_t>(bytes, offsetof(CodePageHeaderV1, max_length)) < 2) {
    bytes.resize(sizeof(CodePageHeaderV1));
  }
  return record_at<CodePageHeaderV1>(bytes, 0);
}

CodePageHeader current_header(const CodePageHeaderV1& old) {
  CodePageHeader header{};
  header.substitution = old.substitution;
  std::copy(std::begin(old.line_bytes), std::end(old.line_bytes), header.line_bytes);
  header.max_length = old.max_length;
  header.half_to_full_count = old.half_to_full_count;
  std::copy(std::begin(old.char_length), std::end(old.char_length), header.char_length);
  std::copy(std::begin(old.upper), std::end(old.upper), header.upper);
  std::copy(std::begin(old.lower), std::end(old.lower), header.lower);
  std::copy(std::begin(old.to_unicode), std::end(old.to_unicode), header.to_unicode);
  std::copy(std::begin(old.types), std::end(old.types), header.types);
  std::copy(std::begin(old.from_unicode), std::end(old.from_unicode), header.from_unicode);
  header.flags = old.flags;
  if ((header.flags & kShiftSensitive) != 0) {
    header.enter_byte = 0x0E;
    header.leave_byte = 0x0F;
  }
  if (old.max_length > 1) {
    header.full_width = old.full_width;
    header.half_to_full = old.half_to_full;
    header.type_states = old.type_states;
    header.type_entries = old.type_entries;
    header.to_unicode_array = old.to_unicode_array;
  }
  return header;
}

// As many whole records as lie between two offsets.
template <class T>
std::vector<T> records(std::string_view section, size_t first, size_t end) {
  std::vector<T> list;
  for (size_t offset = first; offset <= end && end - offset >= sizeof(T); offset += sizeof(T)) {
    list.push_back(record_at<T>(section, offset));
  }
  return list;
}

void read_to_unicode(CodePageImage& image, std::string_view section) {
  size_t array = image.header.to_unicode_array;
  if (array > section.size()) throw StructureError("the to-Unicode array lies outside section 2");
  if (image.bounded) {
    for (const auto& state : records<ToUnicodeState>(section, 0, array)) {
      image.states.push_back({state.final != 0, state.mask, state.low, state.high, state.index});
    }
  } else {
    if (array % sizeof(ToUnicodeStateV1) != 0) throw StructureError("the to-Unicode array is not behind whole states");
    for (const auto& state : records<ToUnicodeStateV1>(section, 0, array)) {
      image.states.push_back({state.final != 0, state.mask, 0, kLastByte, state.index});
    }
  }
  for (uint16_t value : records<BeU16>(section, array, section.size())) image.to_unicode.push_back(value);
}

void read_types(CodePageImage& image) {
  if (image.header.type_states == 0) return;
  for (const auto& state : records<TypeState>(image.section1, image.header.type_states, image.section1.size())) {
    image.type_states.push_back({state.final != 0, state.mask, 0, kLastByte, state.index});
  }
  image.type_entries = records<TypeEntry>(image.section1, image.header.type_entries, image.section1.size());
}

class Unpacker {
 public:
  explicit Unpacker(const CodePageImage& image) : image_(image) {}

  CodePage page() {
    const CodePageHeader& header = image_.header;
    page_.id = image_.id;
    page_.family = (header.flags & kAsciiFamily) != 0 ? Family::ascii : Family::ebcdic;
    page_.kind = !image_.multibyte() ? PageKind::single
                 : image_.by_rule()  ? PageKind::utf8
                 : image_.mixed()    ? PageKind::mixed
                                     : PageKind::multibyte;
    page_.substitution = header.substitution;
    std::copy(std::begin(header.line_bytes), std::end(header.line_bytes), page_.line_bytes.begin());
    if (page_.kind == PageKind::utf8) {
      fill_utf8(page_);
      return std::move(page_);
    }
    if (page_.mixed()) {
      page_.enter_byte = header.enter_byte;
      page_.leave_byte = header.leave_byte;
    }
    add_single_bytes();
    if (image_.multibyte()) add_branch(0, 0, 0);
    for (uint32_t unicode = 0; unicode < 0x10000; ++unicode) add_from_unicode(static_cast<uint16_t>(unicode));
    return std::move(page_);
  }

 private:
  void add_single_bytes() {
    for (unsigned byte = 0; byte < 256; ++byte) {
      bool shift = page_.mixed() && (byte == page_.enter_byte || byte == page_.leave_byte);
      uint16_t value = image_.header.to_unicode[byte];
      if (value != kUnassigned && !shift) page_.to_unicode.emplace(byte, value);
    }
  }

  void add_branch(size_t state, Code before, unsigned length) {
    const Step& step = image_.states[state];
    bool seen[256] = {};
    // Without bounds, several bytes reach one element. They were packed for the bytes above 7F.
    for (unsigned byte = step.high + 1u; byte-- > step.low;) {
      uint8_t masked = static_cast<uint8_t>(byte) & step.mask;
      bool begins = length > 0 || image_.mixed() || image_.header.char_length[byte] > 1;
      if (byte == 0 || !begins || (!image_.bounded && std::exchange(seen[masked], true))) continue;
      Code code = before << 8 | byte;
      size_t target = size_t{step.index} + masked;
      if (!step.final) {
        add_branch(target, code, length + 1);
      } else if (code > 0xFF && image_.to_unicode[target] != kUnassigned) {
        page_.to_unicode.emplace(code, image_.to_unicode[target]);
      }
    }
  }

  void add_from_unicode(uint16_t unicode) {
    const FromUnicodePage& entry = image_.header.from_unicode[unicode >> 8];
    auto low_byte = static_cast<uint8_t>(unicode);
    if (low_byte < entry.low || low_byte > entry.high || entry.kind >= kFromUnicodeKindCount) return;
    const FromUnicodeKind& kind = kFromUnicodeKinds[entry.kind];
    size_t index = low_byte & entry.mask;
    Code code = number_at(image_.values, entry.values + index * kind.value_width, kind.value_width);
    if (kind.high_part_width != 0) {
      code += number_at(image_.high_parts, entry.high_parts + index * kind.high_part_width, kind.high_part_width)
              << kind.high_part_shift;
    }
    // Holes hold the substitution byte.
    if (code != page_.substitution || page_.unicode_of(code) == unicode) page_.from_unicode[unicode] = code;
  }

  static Code number_at(std::string_view section, size_t offset, unsigned width) {
    return width == 1 ? record_at<uint8_t>(section, offset) : Code{record_at<BeU16>(section, offset)};
  }

  const CodePageImage& image_;
  CodePage page_;
};

}  // namespace

CodePageImage read_code_page_image(const ObjectFile& file, uint16_t id) {
  CodePageImage image;
  image.id = id;
  image.section1 = file.sections[0];
  image.values = file.sections[2];
  image.high_parts = file.sections[3];
  image.bounded = file.layout_version != kCodePageLayoutV1;
  image.header =
      image.bounded ? record_at<CodePageHeader>(image.section1, 0) : current_header(read_header_v1(image.section1));
  unsigned length = image.header.max_length;
  if (length < 1 || length > kMaxCharacterLength) throw StructureError("the maximum character length is not 1 to 4");
  if (image.by_rule() && length < 3) throw StructureError("UTF-8 needs characters of three bytes");
  if (!image.multibyte()) return image;
  if (!image.by_rule()) read_to_unicode(image, file.sections[1]);
  read_types(image);
  return image;
}

CodePage unpack_code_page(const CodePageImage& image) { return Unpacker(image).page(); }

}  // namespace lx::compiler
