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

// `put`: whether there was room.
template <class Put>
int32_t push_back_call(const char* function, LXStream* stream, LXLocale* locale, Put put) {
  return stream_call(trace_unit, function, stream, locale, Direction::read, int32_t{0},
                     [&](LocaleCall& call, LXStream& open) -> int32_t {
                       return put(open, page_of(call.locale)) ? 1 : call.fail(LX_E_BUFFER, 0);
                     });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXUngetChar(LXStream* stream, LXLocale* locale, const char* s, uint32_t /*reserved*/) noexcept {
  return push_back_call(__func__, stream, locale, [&](LXStream& open, const CodePage& page) {
    return push_back(open, page, character_at(page, s));
  });
}

int32_t LXUngetCharU(LXStream* stream, LXLocale* locale, LXUChar ch, uint32_t /*reserved*/) noexcept {
  return push_back_call(__func__, stream, locale,
                        [&](LXStream& open, const CodePage&) { return push_back_unit(open, ch); });
}

int32_t LXUngetCharW(LXStream* stream, LXLocale* locale, LXWChar packed, uint32_t /*reserved*/) noexcept {
  return push_back_call(__func__, stream, locale, [&](LXStream& open, const CodePage& page) {
    return push_back(open, page, character_of(page, packed));
  });
}

int32_t LXUngetCharEx(LXStream* stream, LXLocale* locale, const char* s, uint32_t state,
                      uint32_t /*reserved*/) noexcept {
  return push_back_call(__func__, stream, locale, [&](LXStream& open, const CodePage& page) {
    return push_back(open, page, character_at(page, s, state));
  });
}

}  // extern "C"
