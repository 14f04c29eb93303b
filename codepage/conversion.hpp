// SPDX-License-Identifier: Apache-2.0
// The conversion handle, and the watch over what it carries.
#pragma once

#include "codepage/transcode.hpp"
#include "frame/records.hpp"

struct LXConversion {
  LXLocale* source;
  uint8_t held[5];  // the beginning of a character
  uint8_t source_state;
  uint8_t held_count;
  LXLocale* target;
  uint8_t pending[16];  // what did not fit: a character with its shift byte, or a line end and one more
  uint8_t target_state;
  uint8_t pending_count;

  // Extensions.
  uint32_t options;
  LXProblemFn callback;
  void* context;
  LXConversionCounts counts;
  bool past_shift;   // the input ended right behind a shift byte; the next byte is text
  bool held_return;  // a carriage return that may be the first half of a line end
  // The pages of the two locales when the handle was opened: a locale may change its own.
  const lx::CodePage* from;
  const lx::CodePage* to;
  const lx::ByteMap* map;  // behind the handle, when both pages are single-byte
};

namespace lx {

// Sees every character that has no exact counterpart, and every line end when they are to be changed.
class ConversionWatch {
 public:
  static constexpr bool kWatching = true;

  // `text` stands at `offset` of all that the handle was given.
  ConversionWatch(LXConversion& handle, const uint8_t* text, uint64_t offset)
      : handle_(handle), text_(text), offset_(offset), lines_(handle.options & LX_CONV_LINES_CRLF) {}

  bool each_character() const { return lines_ != 0; }

  // Writes the character, or what stands for it; false: no room, and the caller comes again with the same character.
  template <class In, class Out>
  bool carry(In& in, Out& out, uint16_t character) {
    Kind kind = classify(in, out, character);
    if (lines_ != 0) {
      bool line = kind != Kind::malformed && is_line_character(character);
      if (handle_.held_return && !(line && character == kLineFeed) && !put_held_return(in, out)) return false;
      if (line) return carry_line(in, out, character);
    }
    if (kind != Kind::exact && discards()) {
      report(in, character, kind);
      return true;
    }
    uint32_t code = out.code(character);
    if (!out.fits(code)) return false;
    out.put(code);
    if (kind != Kind::exact) report(in, character, kind);
    return true;
  }

  template <class In>
  void note_odd_shift(In& in) {
    if (in.odd_shift == nullptr) return;
    LXConversionProblem problem = {offset_of(in.odd_shift), LX_PROBLEM_SHIFT, kUnassigned, 1, {*in.odd_shift}};
    in.odd_shift = nullptr;
    add(problem);
  }

  void add(const LXConversionProblem& problem);

 private:
  enum class Kind : uint8_t { exact, substituted, malformed };

  static constexpr uint16_t kLineFeed = 0x0A;
  static constexpr uint16_t kReturn = 0x0D;
  static constexpr uint16_t kNextLine = 0x85;

  static bool is_line_character(uint16_t character) {
    return character == kLineFeed || character == kReturn || character == kNextLine;
  }
  bool discards() const { return (handle_.options & LX_CONV_DISCARD) != 0; }
  uint64_t offset_of(const uint8_t* place) const { return offset_ + static_cast<uint64_t>(place - text_); }

  template <class In, class Out>
  static Kind classify(const In& in, const Out& out, uint16_t character) {
    if (is_malformed(in, character)) return Kind::malformed;
    if (beyond_ucs2(in)) return Kind::substituted;
    return out.stands_in(out.code(character), character) ? Kind::substituted : Kind::exact;
  }

  template <class In>
  static bool is_malformed(const In& in, uint16_t character) {
    if constexpr (std::same_as<In, Utf8Reader>) {
      return !Utf8Reader::well_formed(in.start, static_cast<size_t>(in.at - in.start));
    } else {
      return character == kUnassigned;
    }
  }
  // Well-formed UTF-8 of four bytes, which strict reading takes as one character.
  template <class In>
  static bool beyond_ucs2(const In& in) {
    return std::same_as<In, Utf8Reader> && in.at - in.start == 4;
  }

  template <class In>
  void report(In& in, uint16_t character, Kind kind) {
    if constexpr (In::kShifted) note_odd_shift(in);  // it stands before the character
    LXConversionProblem problem = {
        offset_of(in.start), LX_PROBLEM_SUBSTITUTED, character, static_cast<uint8_t>(in.at - in.start), {}};
    if (kind == Kind::malformed) {
      problem.kind = LX_PROBLEM_MALFORMED;
      problem.unicode = kUnassigned;
    } else if (beyond_ucs2(in)) {
      problem.unicode = (in.start[0] & 0x07u) << 18 | (in.start[1] & 0x3Fu) << 12 | (in.start[2] & 0x3Fu) << 6 |
                        (in.start[3] & 0x3Fu);
    }
    for (unsigned i = 0; i < problem.length && i < sizeof problem.bytes; ++i) problem.bytes[i] = in.start[i];
    add(problem);
  }

  // Carriage returns wait for the character behind them, because together with a line feed they are one line end.
  template <class In, class Out>
  bool carry_line(In& in, Out& out, uint16_t character) {
    if (character == kReturn) {
      handle_.held_return = true;
      return true;
    }
    bool fits = lines_ == LX_CONV_LINES_CRLF  ? put_all(in, out, kReturn, kLineFeed)
                : lines_ == LX_CONV_LINES_NEL ? put_all(in, out, kNextLine)
                                              : put_all(in, out, kLineFeed);
    if (fits) handle_.held_return = false;
    return fits;
  }

  template <class In, class Out>
  bool put_held_return(In& in, Out& out) {
    if (!put_all(in, out, kReturn)) return false;
    handle_.held_return = false;
    return true;
  }

  template <class In, class Out, class... Characters>
  bool put_all(In& in, Out& out, Characters... characters) {
    Out trial = out;
    for (uint16_t character : {characters...}) {
      uint32_t code = trial.code(character);
      if (!trial.fits(code)) return false;
      trial.put(code);
    }
    for (uint16_t character : {characters...}) {
      if (out.stands_in(out.code(character), character)) report(in, character, Kind::substituted);
    }
    out = trial;
    return true;
  }

  LXConversion& handle_;
  const uint8_t* text_;
  uint64_t offset_;
  uint32_t lines_;
};

}  // namespace lx
