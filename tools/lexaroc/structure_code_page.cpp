// SPDX-License-Identifier: Apache-2.0
#include <algorithm>

#include "code_page_image.hpp"

namespace lx::compiler {

namespace {

void require(bool condition, const char* error_text) {
  if (!condition) throw StructureError(error_text);
}

// Follows every path of one walk.
class Walk {
 public:
  Walk(const tool::Message& name, const std::vector<Step>& states, size_t elements, unsigned longest)
      : name_(name), states_(states), elements_(elements), longest_(longest), depths_(states.size()) {}

  // Bytes of the longest path that begins with this byte.
  unsigned depth_of_first(uint8_t byte) {
    require(!states_.empty(), "{0} has no states");
    const Step& start = states_[0];
    return byte < start.low || byte > start.high ? 1 : depth_behind(start, byte, 1);
  }

 private:
  void require(bool condition, const char* error_text) const {
    if (!condition) throw StructureError(tool::message(error_text, name_));
  }

  unsigned depth_behind(const Step& step, unsigned byte, unsigned level) {
    size_t target = size_t{step.index} + (byte & step.mask);
    if (step.final) {
      require(target < elements_, "{0} leaves its table of results");
      return 1;
    }
    require(target < states_.size(), "{0} leaves its states");
    require(level < longest_, "{0} takes more bytes than a character has");
    return 1 + depth_from(target, level + 1);
  }

  unsigned depth_from(size_t state, unsigned level) {
    unsigned& depth = depths_[state];
    if (depth != 0) {
      require(level + depth - 1 <= longest_, "{0} takes more bytes than a character has");
      return depth;
    }
    unsigned deepest = 1;
    const Step& step = states_[state];
    for (unsigned byte = step.low; byte <= step.high; ++byte) {
      deepest = std::max(deepest, depth_behind(step, byte, level));
    }
    return depths_[state] = deepest;
  }

  tool::Message name_;
  const std::vector<Step>& states_;
  size_t elements_;
  unsigned longest_;
  std::vector<unsigned> depths_;  // 0: not known yet
};

void check_walk(const CodePageImage& image, Walk walk, bool all_first_bytes) {
  for (unsigned byte = 0; byte < 256; ++byte) {
    unsigned length = image.header.char_length[byte];
    if (!all_first_bytes && !image.mixed() && length < 2) continue;
    unsigned depth = walk.depth_of_first(static_cast<uint8_t>(byte));
    require(image.mixed() || length < 2 || depth <= length, "a walk reads beyond the length of its character");
  }
}

void check_lengths(const CodePageImage& image) {
  const CodePageHeader& header = image.header;
  for (unsigned length : header.char_length) {
    require(length <= header.max_length, "the length table exceeds the maximum length");
  }
  if (image.mixed()) {
    require(header.enter_byte != 0 && header.leave_byte != 0 && header.enter_byte != header.leave_byte,
            "the shift bytes are zero or alike");
  }
  if (!image.by_rule()) return;
  for (unsigned byte = 0; byte < 256; ++byte) {
    unsigned length = header.char_length[byte];
    unsigned least = byte >= 0xE0 ? 3 : byte >= 0xC0 ? 2 : 1;
    require(byte < 0x80 ? length == 1 : length <= 1 || length >= least, "the length table contradicts UTF-8");
  }
}

void check_from_unicode(const CodePageImage& image) {
  if (image.by_rule()) return;
  for (const FromUnicodePage& page : image.header.from_unicode) {
    if (page.low > page.high || page.kind >= kFromUnicodeKindCount) continue;
    const FromUnicodeKind& kind = kFromUnicodeKinds[page.kind];
    size_t last = 0;
    for (unsigned byte = page.low; byte <= page.high; ++byte) last = std::max<size_t>(last, byte & page.mask);
    auto inside = [last](size_t offset, size_t width, std::string_view section) {
      return width == 0 || offset + (last + 1) * width <= section.size();
    };
    require(inside(page.values, kind.value_width, image.values), "a from-Unicode page leaves section 3");
    require(inside(page.high_parts, kind.high_part_width, image.high_parts), "a from-Unicode page leaves section 4");
    require(kind.character_length <= image.header.max_length, "a from-Unicode page has too long characters");
  }
}

void check_widths(const CodePageImage& image) {
  const CodePageHeader& header = image.header;
  size_t size = image.section1.size();
  require(header.full_width == 0 || header.full_width + 256 * sizeof(BeU32) <= size,
          "the full-width table leaves section 1");
  require(header.half_to_full == 0 || header.half_to_full + header.half_to_full_count * sizeof(WidthPair) <= size,
          "the half-to-full table leaves section 1");
}

}  // namespace

void check_code_page_image(const CodePageImage& image) {
  check_lengths(image);
  check_from_unicode(image);
  if (!image.multibyte()) return;
  check_widths(image);
  unsigned longest = image.header.max_length;
  if (!image.by_rule()) {
    check_walk(image, Walk(tool::message("the to-Unicode walk"), image.states, image.to_unicode.size(), longest), true);
  }
  if (image.header.type_states != 0) {
    check_walk(image, Walk(tool::message("the type walk"), image.type_states, image.type_entries.size(), longest),
               false);
  }
}

}  // namespace lx::compiler
