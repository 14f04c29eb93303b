// SPDX-License-Identifier: Apache-2.0
// Characters read from streams. No more is ever asked of the routine than the character needs.
#include <cstring>

#include "frame/memory.hpp"
#include "stream/stream.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "read_character", 0};

constexpr LXWChar kNoCharacter = 0xFFFFFFFF;
constexpr LXUChar kNoUnit = 0xFFFF;

// Keeps the first byte of a character and follows the shift bytes before it.
bool read_first_byte(LXStream& stream, const CodePage& page, uint32_t& status) {
  for (;;) {
    int32_t came = stream.routine(stream.context, stream.bytes, 1);
    if (came != 1) {
      if (came != -1) status = LX_E_COUNT;
      return false;
    }
    if (!is_shift(page, stream.bytes[0])) break;
    stream.double_byte = stream.bytes[0] == page.enter_byte;
  }
  stream.kept = 1;
  return true;
}

// Keeps the rest of a character. A shift byte where its last byte should be is reported once; who goes on gets both as
// a character.
uint32_t read_rest(LXStream& stream, const CodePage& page, size_t length) {
  size_t before = stream.kept;
  uint32_t status = complete(stream, length);
  for (size_t i = before; i < stream.kept; ++i) {
    if (is_shift(page, stream.bytes[i])) return LX_E_COUNT;
  }
  return status;
}

template <class Result>
Result read_packed(const char* function, LXStream* stream, LXLocale* locale, uint32_t* state, Result failure) {
  return stream_call(trace_unit, function, stream, locale, Direction::read, failure,
                     [&](LocaleCall& call, LXStream& open) {
                       StreamCharacter character;
                       if (!read_character(open, page_of(call.locale), character, call.status)) return failure;
                       if (state != nullptr) *state = character.double_byte ? 1 : 0;
                       return character.code;
                     });
}

}  // namespace

bool read_character(LXStream& stream, const CodePage& page, StreamCharacter& character, uint32_t& status) {
  if (stream.kept == 0 && !read_first_byte(stream, page, status)) return false;
  const bool double_byte = page.shift_sensitive && stream.double_byte;
  size_t length = page.char_length[stream.bytes[0]];
  if (page.shift_sensitive) length = double_byte ? page.max_length : 1;
  if (stream.kept < length) {
    uint32_t rest = read_rest(stream, page, length);
    if (rest != LX_OK) {
      status = rest;
      return false;
    }
  }
  character = {{pack(stream.bytes, length), static_cast<uint32_t>(length)}, double_byte};
  drop_front(stream, length);
  if (stream.kept != 0 && is_shift(page, stream.bytes[0])) {
    stream.double_byte = stream.bytes[0] == page.enter_byte;
    drop_front(stream, 1);
  }
  return true;
}

bool read_unit(LXStream& stream, StreamCharacter& unit, uint32_t& status) {
  LXUChar value = 0;
  if (stream.kept != 0) {
    uint32_t rest = complete(stream, sizeof value);
    if (rest != LX_OK) {
      status = rest;
      return false;
    }
    std::memcpy(&value, stream.bytes, sizeof value);
    drop_front(stream, sizeof value);
  } else {
    auto staged = Owned<LXUChar>::array(1);
    if (!staged) {
      status = LX_E_MEMORY;
      return false;
    }
    constexpr int32_t kSize = sizeof value;
    int32_t came = stream.routine(stream.context, staged.get(), kSize);
    if (came != kSize) {
      if (came == 1) insert_front(stream, reinterpret_cast<const uint8_t*>(staged.get()), 1);
      if (came != -1) status = came == 1 ? LX_E_HALF : LX_E_COUNT;
      return false;
    }
    value = *staged;
  }
  unit = {{value, 1}, false};
  return true;
}

}  // namespace lx

using namespace lx;

extern "C" {

LXUChar LXReadCharU(LXStream* stream, LXLocale* locale, uint32_t /*reserved*/) noexcept {
  return stream_call(trace_unit, __func__, stream, locale, Direction::read, kNoUnit,
                     [](LocaleCall& call, LXStream& open) {
                       StreamCharacter unit;
                       return read_unit(open, unit, call.status) ? static_cast<LXUChar>(unit.code) : kNoUnit;
                     });
}

LXWChar LXReadCharW(LXStream* stream, LXLocale* locale, uint32_t /*reserved*/) noexcept {
  return read_packed(__func__, stream, locale, nullptr, kNoCharacter);
}

LXWChar LXReadChar(LXStream* stream, LXLocale* locale, uint32_t /*reserved*/) noexcept {
  return read_packed(__func__, stream, locale, nullptr, kNoCharacter);
}

LXWChar LXReadCharEx(LXStream* stream, LXLocale* locale, uint32_t* state, uint32_t /*reserved*/) noexcept {
  return read_packed(__func__, stream, locale, state, kNoCharacter);
}

}  // extern "C"
