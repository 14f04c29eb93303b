// SPDX-License-Identifier: Apache-2.0
// Character counts into byte counts and back.
#include "codepage/lengths.hpp"

#include "codepage/text/algorithms.hpp"
#include "codepage/text/kinds.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "lengths", 0};

int32_t clamped(size_t length) { return length > INT32_MAX ? INT32_MAX : static_cast<int32_t>(length); }

}  // namespace

size_t bytes_of_characters(const CodePage& page, const uint8_t* text, uint32_t state, size_t characters,
                           bool look_behind) {
  if (!page.shift_sensitive) {
    return PlainKind::length_of_characters(page, {reinterpret_cast<const char*>(text)}, characters);
  }
  // The caller vouches for the characters, not for where the text ends: each step looks only at what it is sure of.
  ShiftedWalker walker(page, text, 0, state);
  auto skip_shifts = [&] {
    do {
      walker.end = walker.at + 1;
    } while (walker.skip_shift());
  };
  for (; characters != 0; --characters) {
    skip_shifts();
    walker.at += walker.length_here();
    if (characters == 1 && look_behind) skip_shifts();
  }
  return static_cast<size_t>(walker.at - text);
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
    return clamped(ShiftedKind::with_walker(code_page_of(*record), {string, length, shift_state},
                                            [](auto walker) { return count_characters(walker); }));
  });
}

}  // extern "C"
