// SPDX-License-Identifier: Apache-2.0
// Lines read from streams, in every kind of text.
#include "codepage/line_ends.hpp"
#include "stream/stream.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "read_line", 0};

constexpr uint32_t kFlags = kLineEnds | LX_EOL_KEEP | LX_OPT_TERMINATE | LX_OPT_CHARS;
constexpr int32_t kEnded = -1;
constexpr int32_t kFailed = -2;

template <class Kind>
class LineReader {
 public:
  using Unit = typename Kind::Unit;

  LineReader(LXStream& stream, const CodePage& page, Unit* buffer, int32_t size, uint32_t flags)
      : stream_(stream),
        page_(page),
        line_(line_characters<Kind>(page)),
        flags_((flags & kLineEnds) != 0 ? flags : flags | LX_EOL_1),
        buffer_(buffer),
        room_(static_cast<size_t>(size)),
        terminated_((flags & LX_OPT_TERMINATE) != 0) {
    if (terminated_) --room_;
  }

  int32_t read(uint32_t& status) {
    StreamCharacter character;
    if (!next(character, status)) return status == LX_OK ? kEnded : kFailed;
    do {
      if (!fits(character)) {
        put_back(character);
        break;
      }
      store(character);
      if (uint32_t length = line_end(character); length != 0) {
        if ((flags_ & LX_EOL_KEEP) == 0) take_back(length);
        break;
      }
      half_pair_ = is_line_character(character, 1);
    } while (next(character, status));
    return finish();
  }

 private:
  static constexpr bool kUnits = std::same_as<Kind, Ucs2Kind>;

  bool next(StreamCharacter& character, uint32_t& status) {
    if constexpr (kUnits) return read_unit(stream_, character, status);
    return read_character(stream_, page_, character, status);
  }
  void push(const StreamCharacter& character) {
    if constexpr (kUnits) {
      push_back_unit(stream_, static_cast<LXUChar>(character.code));
    } else {
      push_back(stream_, page_, character);
    }
  }

  bool counts_characters() const { return (flags_ & LX_OPT_CHARS) != 0; }
  bool follows_shifts() const { return Kind::kShifted && page_.shift_sensitive; }
  bool is_line_character(const StreamCharacter& character, size_t number) const {
    return character.units == 1 && character.code == line_.code[number];
  }

  // Characters of the line end that is complete with this one; 0: none is.
  uint32_t line_end(const StreamCharacter& character) const {
    auto ends = [&](size_t number, uint32_t flag) {
      return (flags_ & flag) != 0 && is_line_character(character, number);
    };
    if (half_pair_ && ends(0, LX_EOL_21)) return 2;
    return ends(0, LX_EOL_1) || ends(2, LX_EOL_3) || ends(3, LX_EOL_4) ? 1 : 0;
  }

  // A double-byte run needs its shift bytes too, also the one that will close it.
  bool fits(const StreamCharacter& character) const {
    if (counts_characters()) return count_ < room_;
    size_t needed = Kind::kBytes ? character.units : 1;
    if (follows_shifts())
      needed += (character.double_byte != double_byte_ ? 1u : 0u) + (character.double_byte ? 1u : 0u);
    return needed <= room_ - at_;
  }
  void store(const StreamCharacter& character) {
    if (follows_shifts() && character.double_byte != double_byte_) turn();
    if constexpr (Kind::kBytes) {
      put_bytes(bytes_of(buffer_ + at_), character);
      at_ += character.units;
    } else {
      buffer_[at_++] = static_cast<Unit>(character.code);
    }
    ++count_;
  }
  void turn() {
    double_byte_ = !double_byte_;
    buffer_[at_++] = static_cast<Unit>(shift_byte(page_, double_byte_));
  }
  // Of line ends, whose characters are a unit each.
  void take_back(uint32_t characters) {
    at_ -= characters;
    count_ -= characters;
  }
  // The pair is not torn apart, its second half alone would end no line; unless there is room for no more than that.
  void put_back(const StreamCharacter& character) {
    push(character);
    if (count_ > 1 && line_end(character) == 2) {
      take_back(1);
      push({{line_.code[1], 1}, false});
    }
  }

  int32_t finish() {
    if (double_byte_) turn();
    if (terminated_) {
      buffer_[at_++] = 0;
      ++count_;
    }
    return static_cast<int32_t>(counts_characters() ? count_ : at_);
  }

  LXStream& stream_;
  const CodePage& page_;
  const LineCharacters line_;
  const uint32_t flags_;
  Unit* const buffer_;
  size_t room_;  // units, or characters
  const bool terminated_;
  size_t at_ = 0;
  size_t count_ = 0;          // of characters
  bool double_byte_ = false;  // a run is open in the buffer
  bool half_pair_ = false;    // the last character may begin a line end of two
};

template <class Kind, class Unit = typename Kind::Unit>
int32_t read_line(const char* function, LXStream* stream, LXLocale* locale, Unit* buffer, int32_t size,
                  uint32_t flags) {
  return stream_call(
      trace_unit, function, stream, locale, Direction::read, kFailed,
      [&](LocaleCall& call, LXStream& open) -> int32_t {
        if (size <= 0) return 0;
        if (buffer == nullptr) return call.fail(LX_E_ARGUMENT, kFailed);
        return LineReader<Kind>(open, page_of(call.locale), buffer, size, flags).read(call.status);
      },
      flags, kFlags);
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXReadString(LXStream* stream, LXLocale* locale, char* buffer, int32_t size, uint32_t flags) noexcept {
  return read_line<PlainKind>(__func__, stream, locale, buffer, size, flags);
}

int32_t LXReadStringU(LXStream* stream, LXLocale* locale, LXUChar* buffer, int32_t size, uint32_t flags) noexcept {
  return read_line<Ucs2Kind>(__func__, stream, locale, buffer, size, flags);
}

int32_t LXReadStringW(LXStream* stream, LXLocale* locale, LXWChar* buffer, int32_t size, uint32_t flags) noexcept {
  return read_line<WideKind>(__func__, stream, locale, buffer, size, flags);
}

int32_t LXReadStringEx(LXStream* stream, LXLocale* locale, char* buffer, int32_t size, uint32_t flags) noexcept {
  return read_line<ShiftedKind>(__func__, stream, locale, buffer, size, flags);
}

}  // extern "C"
