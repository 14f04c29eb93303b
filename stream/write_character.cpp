// SPDX-License-Identifier: Apache-2.0
// Characters written to streams.
#include "stream/stream.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "write_character", 0};

// The character goes with the shift byte that it needs before it: both are written or kept, or neither is.
uint32_t write(LXStream& stream, const CodePage& page, const StreamCharacter& character) {
  uint8_t bytes[kMaxCharacterLength + 1];
  uint8_t* end = bytes;
  if (page.shift_sensitive && character.double_byte != stream.double_byte) {
    *end++ = shift_byte(page, character.double_byte);
    stream.shifts = true;
  }
  end = put_bytes(end, character);
  uint32_t status = send(stream, page, bytes, static_cast<size_t>(end - bytes));
  if (status != LX_E_BUFFER) stream.double_byte = character.double_byte;
  return status;
}

// `put` returns the status.
template <class Put>
int32_t write_call(const char* function, LXStream* stream, LXLocale* locale, Put put) {
  return stream_call(trace_unit, function, stream, locale, Direction::write, int32_t{0},
                     [&](LocaleCall& call, LXStream& open) {
                       call.status = put(open, page_of(call.locale));
                       return call.status == LX_OK ? 1 : 0;
                     });
}

// The character at s; shifted text comes with its state.
template <class... State>
int32_t write_text(const char* function, LXStream* stream, LXLocale* locale, const char* s, State... state) {
  return write_call(function, stream, locale, [&](LXStream& open, const CodePage& page) -> uint32_t {
    return s != nullptr ? write(open, page, character_at(page, s, state...)) : LX_E_ARGUMENT;
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXWriteChar(LXStream* stream, LXLocale* locale, const char* s) noexcept {
  return write_text(__func__, stream, locale, s);
}

int32_t LXWriteCharU(LXStream* stream, LXLocale* locale, LXUChar ch) noexcept {
  return write_call(__func__, stream, locale, [&](LXStream& open, const CodePage& page) {
    return send(open, page, reinterpret_cast<const uint8_t*>(&ch), sizeof ch);
  });
}

int32_t LXWriteCharW(LXStream* stream, LXLocale* locale, LXWChar packed) noexcept {
  return write_call(__func__, stream, locale, [&](LXStream& open, const CodePage& page) {
    return write(open, page, character_of(page, packed));
  });
}

int32_t LXWriteCharEx(LXStream* stream, LXLocale* locale, const char* s, uint32_t state) noexcept {
  return write_text(__func__, stream, locale, s, state);
}

}  // extern "C"
