// SPDX-License-Identifier: Apache-2.0
#include "objects/code_page_check.hpp"

#include <algorithm>
#include <cstring>
#include <initializer_list>

namespace lx {
namespace {

// More than fit into a section, also after the conversion of an older layout has lengthened it.
constexpr uint32_t kMaxStates = (0x10000 + sizeof(CodePageHeader)) / sizeof(TypeState) / 64 * 64;

// A set of state numbers, small enough for the stack.
class StateSet {
 public:
  void insert(uint32_t state) { words_[state / 64] |= uint64_t{1} << (state % 64); }
  void clear() { std::memset(words_, 0, sizeof words_); }
  template <class Visit>
  bool all_of(uint32_t count, Visit visit) const {
    for (uint32_t word = 0; word * 64 < count; ++word) {
      for (uint64_t rest = words_[word]; rest != 0; rest &= rest - 1) {
        if (!visit(word * 64 + static_cast<uint32_t>(__builtin_ctzll(rest)))) return false;
      }
    }
    return true;
  }

 private:
  uint64_t words_[kMaxStates / 64] = {};
};

bool has_shift_states(const CodePageHeader& header) {
  return (header.flags & kShiftSensitive) != 0 && header.max_length > 1;
}

// Longest walk that may begin with this byte; 0 when no reader ever starts one there.
unsigned allowed_depth(const CodePageHeader& header, unsigned first_byte) {
  if (header.char_length[first_byte] >= 2) return header.char_length[first_byte];
  return has_shift_states(header) ? header.max_length : 0;
}

// What the walks over the two state tables have in common.
struct Step {
  bool final;
  uint8_t mask;
  uint8_t low;
  uint8_t high;
  uint16_t index;
};

// The last byte whose masked value none before it has.
unsigned last_distinct(const Step& step) {
  const bool low_bits = (step.mask & (step.mask + 1)) == 0;
  return low_bits ? std::min<unsigned>(step.high, step.low + step.mask) : step.high;
}

// Checks the walks from all states of `level` at once, byte by byte, every state once a byte: a walk may take
// `max_depth` bytes. `read` gives a state, `leaf` judges one that ends a character.
template <class Read, class Leaf>
bool walks_end(StateSet& level, uint32_t state_count, unsigned max_depth, Read read, Leaf leaf) {
  StateSet next;
  for (unsigned depth = 1;; ++depth) {
    bool more = false;
    bool sound = level.all_of(state_count, [&](uint32_t number) {
      Step step = read(number);
      if (step.final) return leaf(step);
      const unsigned last = last_distinct(step);
      for (unsigned byte = step.low; byte <= last; ++byte) {
        uint32_t target = step.index + (byte & step.mask);
        if (target >= state_count) return false;
        next.insert(target);
        more = true;
      }
      return true;
    });
    if (!sound) return false;
    if (!more) return true;
    if (depth == max_depth) return false;
    level = next;
    next.clear();
  }
}

// Checks the walks behind each first byte that `start` accepts, those for characters of one length at a time: a walk
// that read more bytes than the character has would read past its end.
template <class Read, class Leaf>
bool walks_fit_lengths(const CodePageHeader& header, const Step& start, uint32_t state_count, Read read, Leaf leaf) {
  for (unsigned length = 2; length <= header.max_length; ++length) {
    StateSet level;
    for (unsigned byte = start.low; byte <= start.high; ++byte) {
      if (allowed_depth(header, byte) != length) continue;
      uint32_t next = start.index + (byte & start.mask);
      if (next >= state_count) return false;
      level.insert(next);
    }
    if (!walks_end(level, state_count, length - 1, read, leaf)) return false;
  }
  return true;
}

unsigned greatest_masked(unsigned mask, unsigned low, unsigned high) {
  if (mask == 0xFF) return high;
  unsigned greatest = 0;
  for (unsigned byte = low; byte <= high; ++byte) {
    if ((byte & mask) > greatest) greatest = byte & mask;
  }
  return greatest;
}

bool in_range(uint64_t offset, uint64_t size, const SectionBytes& section) { return offset + size <= section.size; }

bool is_utf8(uint16_t id) { return id == kUtf8Id; }

const char* check_lengths(uint16_t id, const CodePageHeader& header) {
  if (header.max_length < 1 || header.max_length > kMaxCharacterLength) return "maximum character length";
  if (is_utf8(id) && header.max_length < 3) return "maximum character length";
  for (unsigned byte = 0; byte < 256; ++byte) {
    unsigned length = header.char_length[byte];
    if (length > header.max_length) return "character length table";
    if (!is_utf8(id)) continue;
    // Decoding by rule reads three bytes from a lead byte of E0 on and two below.
    unsigned needed = byte >= 0xE0 ? 3 : 2;
    if (byte < 0x80 ? length != 1 : (length > 1 && (byte < 0xC0 || length < needed))) return "character length table";
  }
  // Behind shift bytes every character has two bytes: the readers and writers of such text count on it.
  if (has_shift_states(header) && header.max_length != 2) return "maximum character length";
  if (has_shift_states(header) &&
      (header.enter_byte == 0 || header.leave_byte == 0 || header.enter_byte == header.leave_byte)) {
    return "shift bytes";
  }
  return nullptr;
}

const char* check_from_unicode(const CodePageHeader& header, const SectionBytes (&sections)[4]) {
  for (const FromUnicodePage& page : header.from_unicode) {
    if (page.low > page.high || page.kind >= kFromUnicodeKindCount) continue;
    const FromUnicodeKind& kind = kFromUnicodeKinds[page.kind];
    if (kind.character_length > header.max_length) return "from-Unicode page kind";
    uint64_t elements = uint64_t{greatest_masked(page.mask, page.low, page.high)} + 1;
    if (!in_range(page.values, elements * kind.value_width, sections[2])) return "from-Unicode values";
    if (kind.high_part_width != 0 && !in_range(page.high_parts, elements * kind.high_part_width, sections[3])) {
      return "from-Unicode high parts";
    }
  }
  return nullptr;
}

const char* check_to_unicode(const CodePageHeader& header, const SectionBytes& section, CheckedCodePage& checked) {
  if (section.size < sizeof(ToUnicodeState)) return "to-Unicode section";
  uint32_t array = header.to_unicode_array;
  if (array > section.size) return "to-Unicode array offset";
  checked.states = reinterpret_cast<const ToUnicodeState*>(section.data);
  checked.state_count = array / sizeof(ToUnicodeState);
  checked.to_unicode_array = section.data + array;
  if (checked.state_count == 0) return "to-Unicode states";
  uint32_t elements = (section.size - array) / 2;
  auto read = [&](uint32_t number) {
    const ToUnicodeState& state = checked.states[number];
    return Step{state.final != 0, state.mask, state.low, state.high, state.index};
  };
  auto leaf = [&](const Step& step) {
    return step.low > step.high || step.index + greatest_masked(step.mask, step.low, step.high) < elements;
  };
  StateSet level;
  level.insert(0);
  if (!walks_end(level, checked.state_count, header.max_length, read, leaf)) return "to-Unicode states";
  Step start = read(0);
  if (!start.final && !walks_fit_lengths(header, start, checked.state_count, read, leaf)) return "to-Unicode states";
  return nullptr;
}

const char* check_types(const CodePageHeader& header, const SectionBytes& section, CheckedCodePage& checked) {
  uint32_t states_at = header.type_states;
  uint32_t entries_at = header.type_entries;
  if (states_at + sizeof(TypeState) > section.size) return "character-type states";
  if (entries_at + sizeof(TypeEntry) > section.size) return "character-type entries";
  const auto* states = reinterpret_cast<const TypeState*>(section.data + states_at);
  auto state_count = static_cast<uint32_t>((section.size - states_at) / sizeof(TypeState));
  if (state_count > kMaxStates) state_count = kMaxStates;
  auto entry_room = static_cast<uint32_t>((section.size - entries_at) / sizeof(TypeEntry));
  uint32_t entry_count = 1;
  auto read = [&](uint32_t number) {
    const TypeState& state = states[number];
    return Step{state.final != 0, state.mask, 0, 0xFF, state.index};
  };
  auto leaf = [&](const Step& step) {
    uint32_t last = uint32_t{step.index} + step.mask;
    if (last >= entry_count) entry_count = last + 1;
    return last < entry_room;
  };
  Step start = read(0);
  if (start.final ? !leaf(start) : !walks_fit_lengths(header, start, state_count, read, leaf)) {
    return "character-type states";
  }
  checked.type_states = states;
  checked.type_entries = reinterpret_cast<const TypeEntry*>(section.data + entries_at);
  checked.type_entry_count = entry_count;
  return nullptr;
}

const char* check_widths(const CodePageHeader& header, const SectionBytes& section, CheckedCodePage& checked) {
  if (uint32_t at = header.full_width; at != 0) {
    if (!in_range(at, 256 * sizeof(BeU32), section)) return "full-width table";
    checked.full_width = reinterpret_cast<const BeU32*>(section.data + at);
  }
  if (uint32_t at = header.half_to_full; at != 0 && header.half_to_full_count != 0) {
    if (!in_range(at, header.half_to_full_count * sizeof(WidthPair), section)) return "half-to-full table";
    checked.half_to_full = reinterpret_cast<const WidthPair*>(section.data + at);
    checked.half_to_full_count = header.half_to_full_count;
  }
  return nullptr;
}

}  // namespace

const char* check_code_page(uint16_t id, const SectionBytes (&sections)[4], CheckedCodePage& checked) {
  checked = {};
  if (sections[0].size < sizeof(CodePageHeader)) return "section 1 size";
  const auto& header = *reinterpret_cast<const CodePageHeader*>(sections[0].data);
  checked.header = &header;
  checked.values = sections[2].data;
  checked.high_parts = sections[3].data;
  if (const char* wrong = check_lengths(id, header)) return wrong;
  if (!is_utf8(id)) {
    if (const char* wrong = check_from_unicode(header, sections)) return wrong;
    if (header.max_length > 1) {
      if (const char* wrong = check_to_unicode(header, sections[1], checked)) return wrong;
    }
  }
  if (header.max_length > 1 && header.type_states != 0) {
    if (const char* wrong = check_types(header, sections[0], checked)) return wrong;
  }
  return check_widths(header, sections[0], checked);
}

const char* check_code_page_v1(const SectionBytes& section1, const SectionBytes& section2) {
  constexpr size_t kSingleByteSize = offsetof(CodePageHeaderV1, full_width);
  if (section1.size < kSingleByteSize) return "section 1 size";
  const auto& header = *reinterpret_cast<const CodePageHeaderV1*>(section1.data);
  if (header.max_length < 2) return nullptr;
  if (section1.size < sizeof(CodePageHeaderV1)) return "section 1 size";
  uint32_t start = header.full_width;
  if (start < sizeof(CodePageHeaderV1) || start > section1.size) return "start of the variable part";
  uint32_t new_start = sizeof(CodePageHeader);
  for (uint32_t offset : {uint32_t{header.full_width}, uint32_t{header.half_to_full}, uint32_t{header.type_states},
                          uint32_t{header.type_entries}}) {
    if (offset != 0 && (offset < start || offset - start + new_start > 0xFFFF)) return "offset of a table";
  }
  if (section2.data != nullptr) {
    uint32_t array = header.to_unicode_array;
    if (array > section2.size || array % sizeof(ToUnicodeStateV1) != 0) return "to-Unicode array offset";
    uint32_t states = array / uint32_t{sizeof(ToUnicodeStateV1)};
    if (states * sizeof(ToUnicodeState) + 3 > 0xFFFF) return "to-Unicode array offset";
  }
  return nullptr;
}

}  // namespace lx
