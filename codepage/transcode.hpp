// SPDX-License-Identifier: Apache-2.0
// The one loop that carries characters from a reader to a writer, and what lets it go fast.
#pragma once

#include <algorithm>
#include <concepts>
#include <cstring>
#include <type_traits>

#include "codepage/text/text_kinds.hpp"
#include "codepage/text/vector_runs.hpp"

namespace lx {

enum class Stop : uint8_t {
  none,     // one character more was carried over
  done,     // all of the text was
  partial,  // the text ends inside a character
  full,     // the next character does not fit
};

// Nobody looks at single characters.
struct NoWatch {
  static constexpr bool kWatching = false;
  static constexpr bool each_character() { return false; }
};

// ---- Runs of ASCII ----

// How ASCII stands in a byte text: as itself, through a table, or not in a way that a run can use. Characters below
// `from` are left to others.
struct AsciiForm {
  enum Way : uint8_t { none, itself, by_table } way;
  const uint8_t* table;
  uint8_t from = 0;
};

inline AsciiForm ascii_form(const SingleByteReader& in) {
  if (in.page->ascii_bytes) return {AsciiForm::itself, nullptr};
  return {AsciiForm::by_table, in.page->ascii_of_byte};
}
inline AsciiForm ascii_form(const MultibyteReader& in) {
  return {in.page->ascii_bytes ? AsciiForm::itself : AsciiForm::none, nullptr};
}
inline AsciiForm ascii_form(const Utf8Reader& in) {
  return {in.page->standard_utf8 ? AsciiForm::itself : AsciiForm::none, nullptr};
}
inline AsciiForm ascii_form(const ShiftedReader& in) {
  return {in.double_byte || in.past_shift ? AsciiForm::none : AsciiForm::by_table, in.page->ascii_of_byte};
}
inline AsciiForm ascii_form_of_target(const CodePage& page) {
  if (page.ascii_bytes) return {AsciiForm::itself, nullptr};
  return {page.ascii_from < 0x80 ? AsciiForm::by_table : AsciiForm::none, page.byte_of_latin1, page.ascii_from};
}
inline AsciiForm ascii_form(const SingleByteWriter& out) { return ascii_form_of_target(*out.page); }
inline AsciiForm ascii_form(const MultibyteWriter& out) { return ascii_form_of_target(*out.page); }
inline AsciiForm ascii_form(const Utf8Writer&) { return {AsciiForm::itself, nullptr}; }
inline AsciiForm ascii_form(const ShiftedWriter& out) {
  return out.double_byte ? AsciiForm{AsciiForm::none, nullptr} : ascii_form_of_target(*out.page);
}

template <class In, class Out>
concept BytesToBytes = std::same_as<typename In::Unit, uint8_t> && std::same_as<typename Out::Unit, uint8_t>;

template <class In, class Out, class InUnit, class OutUnit>
void carry_run(void (*carry)(const CodePage&, Run<InUnit, OutUnit>&), const CodePage& page, In& in, Out& out) {
  Run<InUnit, OutUnit> run = {in.at, in.end, out.at, out.end};
  carry(page, run);
  in.at = run.in;
  out.at = run.out;
}

template <class In, class Out>
void carry_ascii(In& in, Out& out) {
  if constexpr (BytesToBytes<In, Out>) {
    if constexpr (std::same_as<In, SingleByteReader> && std::same_as<Out, Utf8Writer>) {
      carry_run(carry_to_utf8, *in.page, in, out);
    }
    if constexpr (std::same_as<In, Utf8Reader> && std::same_as<Out, SingleByteWriter>) {
      if (in.page->standard_utf8 && out.from.usual && out.page->ascii_from < 0x80)
        carry_run(carry_from_utf8, *out.page, in, out);
    }
    AsciiForm from = ascii_form(in);
    AsciiForm to = ascii_form(out);
    if (from.way == AsciiForm::none || to.way == AsciiForm::none) return;
    size_t room = std::min(in.left(), out.room());
    size_t done = 0;
    if (from.way == AsciiForm::itself) {
      done = to.way == AsciiForm::itself ? copy_ascii(in.at, room, out.at)
                                         : map_from_ascii(to.table, to.from, in.at, room, out.at);
    } else if (to.way == AsciiForm::itself) {
      done = map_to_ascii(from.table, in.at, room, out.at);
    }
    in.at += done;
    out.at += done;
  }
  if constexpr (std::same_as<In, SingleByteReader> && std::same_as<Out, Ucs2Writer>) {
    if (in.page->latin1) carry_run(carry_to_ucs2, *in.page, in, out);
  }
  if constexpr (std::same_as<In, Ucs2Reader> && std::same_as<Out, SingleByteWriter>) {
    carry_run(carry_from_ucs2, *out.page, in, out);
  }
}

// Two single-byte pages: every byte goes through the map, where there is one.
template <class Watch>
bool carry_mapped(SingleByteReader& in, SingleByteWriter& out, const Watch&) {
  if (in.map == nullptr) return false;
  size_t room = std::min(in.left(), out.room());
  if (Watch::kWatching && !in.map->exact) {
    const bool* inexact = in.map->inexact;
    room = static_cast<size_t>(std::find_if(in.at, in.at + room, [=](uint8_t byte) { return inexact[byte]; }) - in.at);
  }
  map_bytes(in.map->value, in.at, room, out.at);
  in.at += room;
  out.at += room;
  return true;
}
template <class In, class Out, class Watch>
bool carry_mapped(In&, Out&, const Watch&) {
  return false;
}

// ---- Single characters ----

// Whether the processor takes the text apart in blocks.
template <class In>
bool in_blocks(const In& in) {
  if constexpr (std::same_as<In, Utf8Reader>) {
    return in.page->standard_utf8 && has_table_vectors();
  } else {
    return false;
  }
}

// Copies ASCII word by word where it is the same on both sides.
template <class In, class Out>
void copy_words(In& in, Out& out) {
  uint64_t word = 0;
  while (in.left() >= sizeof word && out.room() >= sizeof word) {
    std::memcpy(&word, in.at, sizeof word);
    if ((word & 0x8080808080808080u) != 0) break;
    std::memcpy(out.at, &word, sizeof word);
    in.at += sizeof word;
    out.at += sizeof word;
  }
}

// Carries well-formed characters that a watch need not see, as many as surely fit. True: a run of ASCII follows. The
// loop works on copies of the two sides: nothing that is written to the output can change them, so they stay in
// registers.
template <class In, class Out, class Watch>
bool carry_fast(In& given_in, Out& given_out, const Watch&) {
  if (given_in.done()) return false;
  In in = given_in;
  Out out = given_out;
  bool ascii = false;
  bool copies = false;
  if constexpr (BytesToBytes<In, Out>) {
    copies = !in_blocks(in) && ascii_form(in).way == AsciiForm::itself && ascii_form(out).way == AsciiForm::itself;
  }
  while (size_t count = std::min(in.fast_characters(), out.fast_characters())) {
    for (; count != 0; --count) {
      uint16_t character = 0;
      size_t length = in.peek(character);
      if (length == 0) [[unlikely]] {
        if (in.turn()) continue;
        goto end;
      }
      uint32_t code = out.code(character);
      if constexpr (Watch::kWatching) {
        if (out.doubtful(code)) [[unlikely]]
          goto end;
      }
      in.skip(length);
      out.put(code);
      if constexpr (BytesToBytes<In, Out>) {
        if (character >= 0x80 || !in.ascii_ahead()) continue;
        if (copies) {
          copy_words(in, out);
          break;
        }
        ascii = true;
        goto end;
      }
    }
  }
end:
  given_in.return_to(in.place());
  given_out.advance_to(out);
  return ascii;
}

// Carries blocks of characters, as far as a watch need not see them.
template <class In, class Out, class Watch>
void carry_blocks(In& in, Out& given_out, const Watch&) {
  if constexpr (std::same_as<In, Utf8Reader>) {
    if (in.left() < kWorthVectors || !in_blocks(in)) return;
    Out out = given_out;
    Utf8Block block;
    while (out.fast_characters() >= Utf8Block::kMost && !in.ascii_ahead()) {
      decode_utf8(in.at, in.left(), block);
      size_t count = 0;
      for (; count < block.count; ++count) {
        uint32_t code = out.code(block.characters[count]);
        if constexpr (Watch::kWatching) {
          if (out.doubtful(code)) [[unlikely]]
            break;
        }
        out.put(code);
      }
      in.at += count == block.count ? block.length : utf8_length(block.characters, count);
      if (count != Utf8Block::kMost) break;
    }
    given_out.advance_to(out);
  }
}

// Carries one character, however long it takes.
template <class In, class Out, class Watch>
Stop carry_one(In& in, Out& out, Watch& watch) {
  auto place = in.place();
  uint16_t character = 0;
  Got got = in.next(character);
  if (got == Got::character) {
    if constexpr (Watch::kWatching) {
      if (!watch.carry(in, out, character)) {
        in.return_to(place);
        return Stop::full;
      }
    } else {
      uint32_t code = out.code(character);
      if (!out.fits(code)) {
        in.return_to(place);
        return Stop::full;
      }
      out.put(code);
    }
  }
  if constexpr (Watch::kWatching && In::kShifted) watch.note_odd_shift(in);
  switch (got) {
    case Got::end:
      return Stop::done;
    case Got::partial:
      return Stop::partial;
    default:
      return Stop::none;
  }
}

// Carries all that can be carried.
template <class In, class Out, class Watch>
Stop transcode(In& in, Out& out, Watch& watch) {
  for (;;) {
    if (!watch.each_character() && !carry_mapped(in, out, watch)) {
      do {
        carry_ascii(in, out);
        carry_blocks(in, out, watch);
      } while (carry_fast(in, out, watch));
    }
    if (!In::kShifted && in.done()) return Stop::done;
    Stop stop = carry_one(in, out, watch);
    if (stop != Stop::none) return stop;
  }
}

// The same for packed characters, which keep their bytes.
template <class In, class Out>
Stop transfer(In& in, Out& out) {
  for (;;) {
    auto place = in.place();
    uint32_t value = 0;
    switch (in.next_packed(value)) {
      case Got::end:
        return Stop::done;
      case Got::partial:
        return Stop::partial;
      case Got::shift:
        continue;
      case Got::character:
        break;
    }
    if (!out.fits(value)) {
      in.return_to(place);
      return Stop::full;
    }
    out.put(value);
  }
}

}  // namespace lx
