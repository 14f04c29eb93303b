// SPDX-License-Identifier: Apache-2.0
#include "codepage/host_translation.hpp"

#include <algorithm>

#include "codepage/one_shot.hpp"
#include "codepage/text/byte_runs.hpp"

namespace lx {
namespace {

// What fields are filled with: the first byte of the blank.
uint8_t blank_of(const CodePage& page) {
  uint8_t bytes[kMaxCharacterLength];
  unpack(bytes, WideWriter(page, nullptr, 0).code(0x0020));
  return bytes[0];
}

template <class In>
bool only_blanks(In rest) {
  if constexpr (std::same_as<In, Ucs2Reader>) {
    return std::all_of(rest.at, rest.end, [](LXUChar unit) { return unit == 0x0020; });
  } else {
    if constexpr (In::kShifted) {
      rest.skip_shifts();
      if (rest.double_byte) return false;
    }
    uint8_t blank = blank_of(*rest.page);
    return std::all_of(rest.at, rest.end, [=](uint8_t byte) { return byte == blank; });
  }
}

struct Attempt {
  size_t written = 0;  // units
  size_t characters = 0;
  size_t consumed = 0;  // units
  bool overflow = false;
  bool forgiven = false;  // only blanks were left out
  bool all = false;       // the input was taken to its end
};

// The byte that was held back for the shift byte at the end may still take a character that needs none.
template <class In, class Out>
Stop carry_last(In& in, Out& out) {
  In ahead = in;
  uint16_t character = 0;
  if (ahead.next(character) != Got::character) return Stop::full;
  uint32_t code = out.code(character);
  if (code > 0xFF || !out.fits(code)) return Stop::full;
  out.put(code);
  in = ahead;
  Got next = ahead.next(character);
  if (next == Got::character) return Stop::full;
  in = ahead;  // shift bytes behind the last character are read with it
  return next == Got::end ? Stop::done : Stop::partial;
}

// Carries over what fits in the room of the writer, or as many characters as the limit allows.
template <class In, class Out>
Attempt attempt(const Translation& wanted, In in, Out& out, size_t limit) {
  auto* const begin = in.at;
  auto* const end = in.end;
  Attempt result;
  bool all = true;
  if (wanted.characters) result.characters = limit_characters(in, limit, all);
  NoWatch watch;
  bool held_back = Out::kShifted && !wanted.characters && out.room() != 0;
  if (held_back) --out.end;
  Stop stop = transcode(in, out, watch);
  if (held_back) ++out.end;
  if constexpr (Out::kShifted) {
    if (stop == Stop::full) stop = carry_last(in, out);
  }
  in.end = end;
  result.written = static_cast<size_t>(out.at - out.begin);
  bool more = false;
  if (!all) {  // shift bytes, or part of a character, are nothing that would not fit
    uint16_t character = 0;
    Got next = In(in).next(character);
    more = next == Got::character;
    all = next == Got::end;
  }
  result.overflow = stop == Stop::full || more;
  result.forgiven = result.overflow && wanted.drop_blanks && only_blanks(in);
  result.all = stop == Stop::done && all;
  result.consumed = static_cast<size_t>(in.at - begin);
  return result;
}

// A text ends in the single-byte state: there is a byte left for the shift byte.
template <class In, class Out>
Attempt attempt_closed(const Translation& wanted, const In& in, Out out, size_t limit) {
  Attempt result = attempt(wanted, in, out, limit);
  if constexpr (Out::kShifted) {
    if (out.double_byte) {
      *out.at++ = out.page->leave_byte;
      ++result.written;
    }
  }
  return result;
}

// ---- The kinds of sources and targets ----

template <class Use>
Attempt with_source(const Translation& wanted, Use use) {
  if (wanted.source == nullptr) {
    return use(Ucs2Reader(static_cast<const LXUChar*>(wanted.in), wanted.in_length / sizeof(LXUChar)));
  }
  return with_reader(*wanted.source, {true, 0}, static_cast<const uint8_t*>(wanted.in), wanted.in_length, [&](auto in) {
    if constexpr (decltype(in)::kShifted) in.all_shifts = true;
    return use(in);
  });
}

// The room of the output: in units of the writer, and what may be filled of it, in units or characters.
struct Room {
  size_t units;
  size_t limit;
};

Room room_of(const Translation& wanted) {
  size_t limit = wanted.out_size;
  if (wanted.target == nullptr && !wanted.characters) limit /= sizeof(LXUChar);
  if (wanted.terminate) --limit;
  if (!wanted.characters || wanted.target == nullptr) return {limit, limit};
  return {limit * (kMaxCharacterLength + 1) + 2, limit};
}

// UCS-2 stays as it is, whatever the room: the caller provides for as much as the input.
Attempt copy_units(const Translation& wanted) {
  size_t units = wanted.in_length / sizeof(LXUChar);
  std::memcpy(wanted.out, wanted.in, units * sizeof(LXUChar));
  return {.written = units, .characters = units, .consumed = units, .all = true};
}

// Of UCS-2 into a single-byte page only half of the room is used.
Attempt fill_half(const Translation& wanted, Ucs2Reader in, SingleByteWriter out, size_t limit) {
  auto* const end = in.end;
  const size_t length = wanted.in_length & ~size_t{1};  // half a unit is none
  size_t units = std::min(length, limit) / sizeof(LXUChar);
  in.end = in.at + units;
  Attempt result = attempt(wanted, in, out, units);
  result.overflow = length > limit;
  result.forgiven =
      result.overflow && wanted.drop_blanks && only_blanks(Ucs2Reader(in.end, static_cast<size_t>(end - in.end)));
  result.all = !result.overflow;
  return result;
}

// Every byte becomes a byte.
Attempt map_field(const Translation& wanted, size_t limit) {
  size_t length = std::min(wanted.in_length, limit);
  const auto* in = static_cast<const uint8_t*>(wanted.in);
  map_bytes(wanted.map->value, in, length, static_cast<uint8_t*>(wanted.out));
  Attempt result = {.written = length, .characters = length, .consumed = length};
  result.all = length == wanted.in_length;
  result.overflow = !result.all;
  result.forgiven = result.overflow && wanted.drop_blanks &&
                    only_blanks(SingleByteReader(*wanted.source, in + length, wanted.in_length - length));
  return result;
}

template <class In, class Out>
Attempt carry_between(const Translation& wanted, const Room& room, In in, Out out) {
  if constexpr (std::same_as<Out, SingleByteWriter> && std::same_as<In, Ucs2Reader>) {
    return fill_half(wanted, in, out, room.limit);
  } else {
    return attempt_closed(wanted, in, out, room.limit);
  }
}

template <class In>
Attempt carry_from(const Translation& wanted, const Room& room, In in) {
  if (wanted.target == nullptr) {
    return carry_between(wanted, room, in, Ucs2Writer(static_cast<LXUChar*>(wanted.out), room.units));
  }
  return with_writer(*wanted.target, {true, 0}, static_cast<uint8_t*>(wanted.out), room.units,
                     [&](auto out) { return carry_between(wanted, room, in, out); });
}

Attempt carry(const Translation& wanted, const Room& room) {
  if (wanted.target == nullptr && wanted.source == nullptr) return copy_units(wanted);
  if (wanted.map != nullptr) return map_field(wanted, room.limit);
  return with_source(wanted, [&](auto in) { return carry_from(wanted, room, in); });
}

// ---- What follows the text ----

void put_unit(const Translation& wanted, size_t at, uint16_t value) {
  if (wanted.target != nullptr) {
    static_cast<uint8_t*>(wanted.out)[at] = static_cast<uint8_t>(value);
  } else {
    static_cast<LXUChar*>(wanted.out)[at] = value;
  }
}

// Fills the room behind the text, then terminates it. The counts are of units or characters, as the room's limit.
Translated finish(const Translation& wanted, const Room& room, const Attempt& text) {
  size_t at = text.written;
  size_t count = wanted.characters ? text.characters : at;
  if (wanted.pad) {
    uint16_t blank = wanted.target != nullptr ? blank_of(*wanted.target) : 0x0020;
    for (; count < room.limit; ++count) put_unit(wanted, at++, blank);
  }
  bool due = wanted.terminate ? count <= room.limit : wanted.measured && text.all && count < room.limit;
  if (due) {
    put_unit(wanted, at, 0);
    ++count;
  }
  size_t unit = wanted.characters ? 1 : wanted.target != nullptr ? 1 : sizeof(LXUChar);
  size_t source_unit = wanted.source != nullptr ? 1 : sizeof(LXUChar);
  Translated result;
  result.count = static_cast<int32_t>(count * unit);
  result.consumed = static_cast<int32_t>(wanted.characters ? text.characters : text.consumed * source_unit);
  result.status = text.overflow && !text.forgiven ? LX_E_BUFFER : LX_OK;
  return result;
}

Translated translate_nothing(const Translation& wanted) {
  Translated result;
  if (!wanted.terminate || wanted.out_size == 0) return result;
  bool whole_unit = wanted.target == nullptr && (wanted.characters || wanted.out_size >= sizeof(LXUChar));
  std::memset(wanted.out, 0, whole_unit ? sizeof(LXUChar) : 1);
  result.count = 1;
  return result;
}

}  // namespace

Translated translate(const Translation& wanted) {
  if (wanted.in_length == 0 || wanted.out_size == 0) return translate_nothing(wanted);
  if (wanted.target == nullptr && !wanted.characters && wanted.out_size < sizeof(LXUChar)) {
    return {-1, 0, LX_E_BUFFER};
  }
  const Room room = room_of(wanted);
  return finish(wanted, room, carry(wanted, room));
}

}  // namespace lx
