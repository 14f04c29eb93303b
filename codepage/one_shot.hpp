// SPDX-License-Identifier: Apache-2.0
// What all conversions of whole strings share: how lengths and options are read, where they stop, how they end.
#pragma once

#include "codepage/text/kinds.hpp"
#include "codepage/transcode.hpp"

namespace lx {

inline constexpr uint32_t kStringOptions = LX_OPT_TERMINATE | LX_OPT_CHARS;

// Where the text begins and how long it is, in units.
template <class Unit>
struct Source {
  const Unit* text;
  size_t length;
  bool measured;

  Source(const Unit* given, int32_t given_length)
      : text(given), length(0), measured(given != nullptr && given_length < 0) {
    if (measured) {
      length = measured_length(given);
    } else if (given != nullptr && given_length > 0) {
      length = static_cast<size_t>(given_length);
    }
  }
  bool given_empty() const { return !measured && length == 0; }
};

// The same for bytes, whose length may be given in characters.
inline Source<uint8_t> byte_source(const CodePage& page, const char* text, Shifts shifts, int32_t length,
                                   uint32_t flags) {
  Source<uint8_t> source(bytes_of(text), length);
  if ((flags & LX_OPT_CHARS) != 0 && !source.measured && source.length != 0) {
    Text<char> given = {text, 0, shifts.state};
    source.length = shifts.followed ? ShiftedKind::length_of_characters(page, given, source.length)
                                    : PlainKind::length_of_characters(page, given, source.length);
  }
  return source;
}

// The room for a result. Counted in characters, it says nothing about bytes: those are the caller's to provide.
struct Target {
  size_t size;
  bool terminate;
  bool characters;

  Target(const void* out, int32_t given_size, uint32_t flags)
      : size(out != nullptr && given_size > 0 ? static_cast<size_t>(given_size) : 0),
        terminate((flags & LX_OPT_TERMINATE) != 0),
        characters((flags & LX_OPT_CHARS) != 0) {}

  size_t text_size() const { return terminate && size != 0 ? size - 1 : size; }
  // Units that a writer of bytes may use.
  size_t byte_room() const {
    return characters && size != 0 ? text_size() * (kMaxCharacterLength + 1) + 2 : text_size();
  }
};

struct OneShotResult {
  int32_t count;    // units or characters written, the terminator included
  size_t consumed;  // units of the source
};

// Cuts the text behind its first `limit` characters; returns how many it has. `all`: nothing was cut off.
template <class In>
size_t limit_characters(In& in, size_t limit, bool& all) {
  In ahead = in;
  size_t count = 0;
  Got got = Got::character;
  for (uint16_t character = 0; count < limit && got == Got::character;) {
    got = ahead.next(character);
    if (got == Got::character) ++count;
  }
  all = got == Got::end || ahead.done();
  in.end = ahead.at;
  return count;
}

template <class Out>
bool close_text(Out& out, bool reserved, bool due) {
  if constexpr (Out::kShifted) {
    return out.close(reserved || !due ? 1 : 2);
  } else {
    return true;
  }
}

// Carries the text over and ends it. `out` has room for target.text_size() units, or for as many characters.
template <class In, class Out, class Carry>
OneShotResult convert_text(In in, Out out, bool measured, const Target& target, Carry carry) {
  constexpr bool kBytes = std::same_as<typename Out::Unit, uint8_t>;
  auto* const text = in.at;
  bool by_characters = kBytes && target.characters;
  bool all = true;
  size_t characters = by_characters ? limit_characters(in, target.text_size(), all) : 0;
  bool done = carry(in, out) == Stop::done && all;
  size_t used = by_characters ? characters : static_cast<size_t>(out.at - out.begin);
  bool due = target.terminate || (measured && done && used < target.size);
  bool closed = close_text(out, target.terminate, due);
  size_t count = by_characters ? characters : static_cast<size_t>(out.at - out.begin);
  if (due && closed) {
    *out.at = 0;
    ++count;
  }
  return {static_cast<int32_t>(count), static_cast<size_t>(in.at - text)};
}

// No text or no room: at most a terminator, and before it the end of an open double-byte run.
template <class Out>
int32_t convert_nothing(Out out, const Target& target) {
  if (!target.terminate || target.size == 0) return 0;
  if constexpr (Out::kShifted) {
    if (out.double_byte) {
      if (!target.characters && target.size < 2) return 0;
      *out.at++ = out.page->leave_byte;
    }
  }
  *out.at = 0;
  if (target.characters) return 1;
  return static_cast<int32_t>(out.at - out.begin) + 1;
}

// Through Unicode, or as packed characters.
struct AsUnicode {
  template <class In, class Out>
  Stop operator()(In& in, Out& out) const {
    NoWatch watch;
    return transcode(in, out, watch);
  }
};
struct AsPacked {
  template <class In, class Out>
  Stop operator()(In& in, Out& out) const {
    return transfer(in, out);
  }
};

// One call, for readers and writers of any kind.
template <class In, class Out, class Unit, class Carry = AsUnicode>
OneShotResult convert_source(const Source<Unit>& source, In in, Out out, const Target& target, Carry carry = {}) {
  if (source.given_empty() || target.size == 0) return {convert_nothing(out, target), 0};
  return convert_text(in, out, source.measured, target, carry);
}

}  // namespace lx
