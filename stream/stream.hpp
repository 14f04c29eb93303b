// SPDX-License-Identifier: Apache-2.0
// The record of a stream, and all that is done to the bytes that it keeps.
#pragma once

#include "codepage/text/walkers.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {

inline constexpr size_t kKeptBytes = 80;

}  // namespace lx

struct LXStream {
  LXTransferFn routine;
  void* context;
  bool writes;
  bool double_byte;       // the state in front of the kept bytes when reading, behind them when writing
  bool sent_double_byte;  // writing: the state behind the bytes that the routine has taken
  bool shifts;            // writing: there are shift bytes among what was written
  uint16_t kept;
  uint8_t bytes[lx::kKeptBytes];  // to be read before anything new, or still to be written
};

namespace lx {

// A character and the shift state that it stands in. Its units are bytes; a UCS-2 unit has one of its own.
struct StreamCharacter : Character {
  bool double_byte = false;
};

inline bool is_shift(const CodePage& page, uint8_t byte) {
  return page.shift_sensitive && (byte == page.enter_byte || byte == page.leave_byte);
}
inline uint8_t shift_byte(const CodePage& page, bool double_byte) {
  return double_byte ? page.enter_byte : page.leave_byte;
}

// Writes the bytes of a character, all that it had.
inline uint8_t* put_bytes(uint8_t* out, const Character& character) {
  for (uint32_t left = character.units; left-- > 0;) *out++ = static_cast<uint8_t>(character.code >> 8 * left);
  return out;
}

// A packed value as a character, by the bytes that it is written with.
StreamCharacter character_of(const CodePage& page, LXWChar packed);
// The character at s. One that a terminator cuts off ends there.
StreamCharacter character_at(const CodePage& page, const char* s);
StreamCharacter character_at(const CodePage& page, const char* s, uint32_t state);

// ---- Kept bytes ----

void drop_front(LXStream& stream, size_t count);
bool insert_front(LXStream& stream, const uint8_t* bytes, size_t count);  // false: no room
// Reads until `count` bytes are kept. What came stays when it fails with LX_E_TRANSFER, LX_E_HALF or LX_E_COUNT.
uint32_t complete(LXStream& stream, size_t count);
// Writes what is kept and then these bytes. LX_E_REFUSED: some of them are kept now; LX_E_BUFFER: there was no room to.
uint32_t send(LXStream& stream, const CodePage& page, const uint8_t* bytes, size_t count);

// ---- Characters of read streams ----

// False with the status unchanged: the stream has ended.
bool read_character(LXStream& stream, const CodePage& page, StreamCharacter& character, uint32_t& status);
bool read_unit(LXStream& stream, StreamCharacter& unit, uint32_t& status);

// False: no room.
bool push_back(LXStream& stream, const CodePage& page, const StreamCharacter& character);
bool push_back_unit(LXStream& stream, LXUChar unit);

// ---- Exported functions ----

enum class Direction : bool { read, write };

// As locale_call(), on a stream of that direction.
template <class Result, class Body>
Result stream_call(TRC1_Unit& unit, const char* function, LXStream* stream, LXLocale* locale, Direction direction,
                   Result failure, Body body, uint32_t options = 0, uint32_t accepted = 0,
                   int32_t line = __builtin_LINE()) {
  return locale_call(
      unit, function, locale, options, accepted, failure,
      [&](LocaleCall& call) -> Result {
        if (stream == nullptr) return call.fail(LX_E_ARGUMENT, failure);
        if (stream->writes != (direction == Direction::write)) return call.fail(LX_E_DIRECTION, failure);
        return body(call, *stream);
      },
      line);
}

}  // namespace lx
