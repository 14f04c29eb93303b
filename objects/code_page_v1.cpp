// SPDX-License-Identifier: Apache-2.0
// Brings code pages of the older layout into the current one.
#include <cstring>

#include "frame/library.hpp"
#include "frame/memory.hpp"
#include "objects/code_page_check.hpp"

namespace lx {
namespace {

// What a mixed page of the older layout means by its flag: it had no place to name its shift bytes.
constexpr uint8_t kHostEnterByte = 0x0E;
constexpr uint8_t kHostLeaveByte = 0x0F;

uint32_t rounded_up(uint32_t size) {
  const LXGlobals* area = live_globals();
  uint32_t unit = area != nullptr ? area->alignment : kDefaultAlignment;
  return (size + unit - 1) / unit * unit;
}

void copy_fixed_part(const CodePageHeaderV1& old, CodePageHeader& header) {
  header.substitution = old.substitution;
  std::memcpy(header.line_bytes, old.line_bytes, sizeof header.line_bytes);
  header.max_length = old.max_length;
  header.half_to_full_count = old.half_to_full_count;
  std::memcpy(header.char_length, old.char_length, sizeof header.char_length);
  std::memcpy(header.upper, old.upper, sizeof header.upper);
  std::memcpy(header.lower, old.lower, sizeof header.lower);
  std::memcpy(static_cast<void*>(header.to_unicode), old.to_unicode, sizeof header.to_unicode);
  std::memcpy(static_cast<void*>(header.types), old.types, sizeof header.types);
  std::memcpy(static_cast<void*>(header.from_unicode), old.from_unicode, sizeof header.from_unicode);
  header.flags = old.flags;
  if ((old.flags & kShiftSensitive) != 0) {
    header.enter_byte = kHostEnterByte;
    header.leave_byte = kHostLeaveByte;
  }
}

// States gain bounds that accept every byte.
Owned<uint8_t> convert_states(const uint8_t* section2, uint32_t size, uint32_t array, uint32_t& new_array) {
  uint32_t count = array / uint32_t{sizeof(ToUnicodeStateV1)};
  new_array = rounded_up(count * uint32_t{sizeof(ToUnicodeState)});
  auto block = Owned<uint8_t>::zeroed(new_array + (size - array));
  if (!block) return block;
  const auto* from = reinterpret_cast<const ToUnicodeStateV1*>(section2);
  auto* to = reinterpret_cast<ToUnicodeState*>(block.get());
  for (uint32_t i = 0; i < count; ++i) to[i] = {from[i].final, from[i].mask, 0, 0xFF, from[i].index};
  std::memcpy(block.get() + new_array, section2 + array, size - array);
  return block;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" uint8_t* LXCpV1toV2(const uint8_t* v1_section1, uint16_t v1_section1_size, const uint8_t* v1_section2,
                               uint16_t v1_section2_size, uint8_t** out_section2) noexcept {
  if (out_section2 != nullptr) *out_section2 = nullptr;
  if (v1_section1 == nullptr || out_section2 == nullptr ||
      check_code_page_v1({v1_section1, v1_section1_size}, {v1_section2, v1_section2_size}) != nullptr) {
    return nullptr;
  }
  const auto& old = *reinterpret_cast<const CodePageHeaderV1*>(v1_section1);
  bool multibyte = old.max_length >= 2;
  uint32_t old_start = multibyte ? uint32_t{old.full_width} : v1_section1_size;
  uint32_t new_start = multibyte ? rounded_up(sizeof(CodePageHeader)) : uint32_t{sizeof(CodePageHeader)};
  uint32_t variable_size = v1_section1_size - old_start;
  auto section1 = Owned<uint8_t>::zeroed(new_start + variable_size);
  if (!section1) return nullptr;
  auto& header = *reinterpret_cast<CodePageHeader*>(section1.get());
  copy_fixed_part(old, header);
  if (!multibyte) return section1.give_up();

  // An offset of 0 says that there is no such table.
  auto moved = [&](uint16_t offset) {
    return offset == 0 ? uint16_t{0} : static_cast<uint16_t>(offset + (new_start - old_start));
  };
  header.full_width = moved(old.full_width);
  header.half_to_full = moved(old.half_to_full);
  header.type_states = moved(old.type_states);
  header.type_entries = moved(old.type_entries);
  std::memcpy(section1.get() + new_start, v1_section1 + old_start, variable_size);
  if (v1_section2 == nullptr) return section1.give_up();

  uint32_t new_array = 0;
  Owned<uint8_t> section2 = convert_states(v1_section2, v1_section2_size, old.to_unicode_array, new_array);
  if (!section2) return nullptr;
  header.to_unicode_array = static_cast<uint16_t>(new_array);
  *out_section2 = section2.give_up();
  return section1.give_up();
}
