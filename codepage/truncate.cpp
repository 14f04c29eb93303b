// SPDX-License-Identifier: Apache-2.0
// Strings cut to fit their buffers.
#include "codepage/truncate.hpp"

#include <algorithm>

#include "codepage/text/algorithms.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit unit = {"Lexaro", "truncate", 0};

constexpr uint32_t kOptions = LX_OPT_CHARS | LX_TRUNC_STRIP | LX_CMP_NOWIDTH;

int number(size_t value) { return static_cast<int>(value); }

// The run of blanks at the end of what has been walked over.
class BlankRun {
 public:
  BlankRun(TRC1_Unit& trace, const Blanks& blanks) : trace_unit(trace), blanks_(blanks) {}

  void note(const Character& character, const Cut& before, bool last) {
    if (character.units == 1 ? character.code == blanks_.narrow : character.code == blanks_.full_width) {
      if (character.units == 1) {
        LX_TRACE(TRC1_LEVEL_DETAIL, "Blank encountered at %d", number(before.at));
      } else {
        LX_TRACE(TRC1_LEVEL_DETAIL, "Full width blank encountered at %d", number(before.at));
      }
      if (open_) return;
      LX_TRACE(TRC1_LEVEL_DETAIL, "Blank position set to %d", number(before.at));
      open_ = true;
      begin_ = before;
    } else if (character.units > 1 || !last) {
      // A last character of one byte leaves the run open: long-standing behaviour that callers rely on.
      if (open_) LX_TRACE(TRC1_LEVEL_DETAIL, "Blank position reset");
      open_ = false;
    }
  }
  Cut begin_or(const Cut& end) const {
    if (!open_) return end;
    LX_TRACE(TRC1_LEVEL_DETAIL, "index set to %d", number(begin_.at));
    return begin_;
  }

 private:
  TRC1_Unit& trace_unit;
  const Blanks& blanks_;
  bool open_ = false;
  Cut begin_;
};

template <class Walker>
Cut walk_to_cut(TRC1_Unit& trace, Walker text, size_t room, const Blanks& blanks) {
  auto state = [](const Walker& walker) {
    if constexpr (requires { walker.double_byte; }) {
      return walker.double_byte;
    } else {
      return false;
    }
  };
  const Walker begin = text;
  Cut cut = {0, state(text)};
  BlankRun run(trace, blanks);
  for (Character character; text.next(character);) {
    Cut next = {passed(begin, text), state(text)};
    if (next.at + (next.double_byte ? 1 : 0) >= room) break;
    if (blanks.any()) run.note(character, cut, text.at == text.end);
    cut = next;
  }
  return run.begin_or(cut);
}

Cut strip_bytes(TRC1_Unit& trace_unit, const Text<char>& text, size_t room, const Blanks& blanks) {
  size_t at = std::min(text.length, room - 1);
  while (blanks.any() && at != 0 && static_cast<uint8_t>(text.at[at - 1]) == blanks.narrow) {
    --at;
    LX_TRACE(TRC1_LEVEL_DETAIL, "Stripping blank at position %d", number(at));
  }
  return {at, false};
}

// Bytes that `size` characters may take, the terminator being one of them.
template <class Kind>
size_t room_of_characters(const CodePage& page, const Text<char>& text, size_t size) {
  return Kind::with_walker(page, text, [&](auto walker) {
    auto begin = walker;
    return skip_characters(walker, size) < size ? text.length + 1 : passed(begin, walker);
  });
}

// Ends the string at the cut, in the single-byte state. Returns the bytes used.
size_t end_string(const CodePage& page, char* string, Cut cut, size_t room) {
  if (cut.double_byte) {
    if (cut.at + 1 < room) string[cut.at++] = static_cast<char>(page.leave_byte);
  }
  string[cut.at] = '\0';
  return cut.at + 1;
}

template <class Kind>
int32_t truncate(const CodePage& page, char* string, uint32_t state, int32_t size, uint32_t flags) {
  TRC1_Unit& trace_unit = unit;
  if (size < 1) {
    *string = '\0';
    return 1;
  }
  const Text<char> text = {string, std::strlen(string), state};
  LX_TRACE(TRC1_LEVEL_DETAIL, "Input length = %d", number(text.length));
  if (page.max_length == 1) {
    LX_TRACE(TRC1_LEVEL_DETAIL, "Single byte code page, string length = %d", number(text.length));
  }
  size_t room = static_cast<size_t>(size);
  if ((flags & LX_OPT_CHARS) != 0) room = room_of_characters<Kind>(page, text, room);
  bool strip = (flags & LX_TRUNC_STRIP) != 0;
  bool whole = text.length < room;
  if (whole && !strip) return 0;
  Blanks blanks;
  if (strip) blanks = blanks_of(page, (flags & LX_CMP_NOWIDTH) == LX_CMP_NOWIDTH);
  // A text that is left as it is needs no shift byte more than it has.
  Cut cut = find_cut(unit, page, text, Kind::kShifted, whole ? text.length + 2 : room, blanks);
  if (cut.at == text.length) cut.double_byte = false;
  size_t used = end_string(page, string, cut, room);
  LX_TRACE(TRC1_LEVEL_DETAIL, "Truncated string: %s", string);
  if ((flags & LX_OPT_CHARS) != 0) {
    used = Kind::with_walker(page, {string, used, state}, [](auto walker) { return count_characters(walker); });
  }
  return static_cast<int32_t>(used);
}

template <class Kind>
int32_t truncate_call(const char* function, LXLocale* locale, char* string, uint32_t state, int32_t size,
                      uint32_t flags) {
  return locale_call(unit, function, locale, flags, kOptions, int32_t{-1}, [&](LocaleCall& call) {
    return truncate<Kind>(page_of(call.locale), string, state, size, flags);
  });
}

}  // namespace

Cut find_cut(TRC1_Unit& trace_unit, const CodePage& page, const Text<char>& text, bool shifted, size_t room,
             const Blanks& blanks) {
  if (page.max_length == 1) return strip_bytes(trace_unit, text, room, blanks);
  auto walk = [&](auto walker) { return walk_to_cut(trace_unit, walker, room, blanks); };
  return shifted ? ShiftedKind::with_walker(page, text, walk) : PlainKind::with_walker(page, text, walk);
}

}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXTruncateString(LXLocale* locale, char* string, int32_t size, uint32_t flags) noexcept {
  return truncate_call<PlainKind>(__func__, locale, string, 0, size, flags);
}

int32_t LXTruncateStringEx(LXLocale* locale, char* string, uint32_t state, int32_t size, uint32_t flags) noexcept {
  return truncate_call<ShiftedKind>(__func__, locale, string, state, size, flags);
}

}  // extern "C"
