// SPDX-License-Identifier: Apache-2.0
// Character counts into byte counts and back.
#include "codepage/lengths.hpp"

#include "codepage/text/text_kinds.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "lengths", 0};

// Walks over mixed host text without converting it.
struct ShiftWalk {
  const CodePage& page;
  const uint8_t* at;
  bool double_byte;

  bool take_shift() {
    if (*at != page.enter_byte && *at != page.leave_byte) return false;
    double_byte = *at++ == page.enter_byte;
    return true;
  }
  size_t length_here() const { return double_byte ? page.max_length : size_t{1}; }
};

size_t characters_of_bytes(const CodePage& page, const uint8_t* text, uint32_t state, size_t bytes) {
  if (!page.shift_sensitive && page.kind == PageKind::single) return bytes;
  const uint8_t* end = text + bytes;
  size_t count = 0;
  ShiftWalk walk = {page, text, state != 0};
  while (walk.at != end) {
    if (page.shift_sensitive && walk.take_shift()) continue;
    size_t length = page.shift_sensitive ? walk.length_here() : page.char_length[*walk.at];
    if (length > static_cast<size_t>(end - walk.at)) break;
    walk.at += length;
    ++count;
  }
  return count;
}

int32_t clamped(size_t length) { return length > INT32_MAX ? INT32_MAX : static_cast<int32_t>(length); }

}  // namespace

size_t bytes_of_characters(const CodePage& page, const uint8_t* text, uint32_t state, size_t characters,
                           bool look_behind) {
  const uint8_t* at = text;
  if (!page.shift_sensitive) {
    if (page.kind == PageKind::single) return characters;
    for (; characters != 0; --characters) at += page.char_length[*at];
    return static_cast<size_t>(at - text);
  }
  ShiftWalk walk = {page, text, state != 0};
  for (; characters != 0; --characters) {
    walk.take_shift();
    walk.at += walk.length_here();
    if (characters > 1 || look_behind) walk.take_shift();
  }
  return static_cast<size_t>(walk.at - text);
}

}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXCpStrCharToByteLen(const LXObjEntry* record, const char* string, uint32_t shift_state,
                             int32_t chars) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (!is_loaded_code_page(record) || string == nullptr || chars <= 0) return 0;
    return clamped(
        bytes_of_characters(code_page_of(*record), bytes_of(string), shift_state, static_cast<size_t>(chars), true));
  });
}

int32_t LXCpStrByteToCharLen(const LXObjEntry* record, const char* string, uint32_t shift_state,
                             int32_t bytes) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (!is_loaded_code_page(record) || string == nullptr) return 0;
    const uint8_t* text = bytes_of(string);
    size_t length = bytes < 0 ? measured_length(text) : static_cast<size_t>(bytes);
    return clamped(characters_of_bytes(code_page_of(*record), text, shift_state, length));
  });
}

}  // extern "C"
