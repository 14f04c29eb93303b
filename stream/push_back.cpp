// SPDX-License-Identifier: Apache-2.0
// Characters put back, to be read next.
#include "stream/stream.hpp"

namespace lx {

// A shift byte behind the character leads back to the state of what follows.
bool push_back(LXStream& stream, const CodePage& page, const StreamCharacter& character) {
  uint8_t bytes[kMaxCharacterLength + 1];
  uint8_t* end = put_bytes(bytes, character);
  if (page.shift_sensitive && character.double_byte != stream.double_byte)
    *end++ = shift_byte(page, stream.double_byte);
  if (!insert_front(stream, bytes, static_cast<size_t>(end - bytes))) return false;
  stream.double_byte = character.double_byte;
  return true;
}

bool push_back_unit(LXStream& stream, LXUChar unit) {
  return insert_front(stream, reinterpret_cast<const uint8_t*>(&unit), sizeof unit);
}

namespace {

TRC1_Unit trace_unit = {"Lexaro", "push_back", 0};

uint32_t status_of(bool there_was_room) { return there_was_room ? LX_OK : LX_E_BUFFER; }

// `put` returns the status.
template <class Put>
int32_t push_back_call(const char* function, LXStream* stream, LXLocale* locale, Put put) {
  return stream_call(trace_unit, function, stream, locale, Direction::read, int32_t{0},
                     [&](LocaleCall& call, LXStream& open) {
                       call.status = put(open, page_of(call.locale));
                       return call.status == LX_OK ? 1 : 0;
                     });
}

// The character at s; shifted text comes with its state.
template <class... State>
int32_t push_back_text(const char* function, LXStream* stream, LXLocale* locale, const char* s, State... state) {
  return push_back_call(function, stream, locale, [&](LXStream& open, const CodePage& page) -> uint32_t {
    return s != nullptr ? status_of(push_back(open, page, character_at(page, s, state...))) : LX_E_ARGUMENT;
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXUngetChar(LXStream* stream, LXLocale* locale, const char* s, uint32_t /*reserved*/) noexcept {
  return push_back_text(__func__, stream, locale, s);
}

int32_t LXUngetCharU(LXStream* stream, LXLocale* locale, LXUChar ch, uint32_t /*reserved*/) noexcept {
  return push_back_call(__func__, stream, locale,
                        [&](LXStream& open, const CodePage&) { return status_of(push_back_unit(open, ch)); });
}

int32_t LXUngetCharW(LXStream* stream, LXLocale* locale, LXWChar packed, uint32_t /*reserved*/) noexcept {
  return push_back_call(__func__, stream, locale, [&](LXStream& open, const CodePage& page) {
    return status_of(push_back(open, page, character_of(page, packed)));
  });
}

int32_t LXUngetCharEx(LXStream* stream, LXLocale* locale, const char* s, uint32_t state,
                      uint32_t /*reserved*/) noexcept {
  return push_back_text(__func__, stream, locale, s, state);
}

}  // extern "C"
