// SPDX-License-Identifier: Apache-2.0
#include "codepage/line_ends.hpp"

#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "line_ends", 0};

constexpr uint32_t kAnyOption = ~0u;  // checked by the body, which has more to say than a status

template <class Kind, class Unit = typename Kind::Unit>
Unit* get_line_end(const char* function, LXLocale* locale, const Unit* s, uint32_t state, int32_t length,
                   uint32_t* type, int32_t* eol_length, uint32_t flags) {
  constexpr Unit* kNone = nullptr;
  return locale_call(trace_unit, function, locale, flags, kAnyOption, kNone, [&](LocaleCall& call) -> Unit* {
    auto answer = [&](const LineEnd& found) {
      if (type != nullptr) *type = found.type;
      if (eol_length != nullptr) *eol_length = found.length;
      return found.length != 0 ? const_cast<Unit*>(s) + found.behind : kNone;
    };
    uint32_t wanted = flags & ~LX_OPT_CHARS;
    if ((wanted & ~kLineEnds) != 0) {
      answer({LX_EOL_BAD, 0, 0});
      return call.fail(LX_E_ARGUMENT, kNone);
    }
    if (wanted == 0) wanted = LX_EOL_1;
    const CodePage& page = page_of(call.locale);
    Text<Unit> text = {s, 0, state};
    text.length = length < 0 ? measured_length(s) : static_cast<size_t>(length);
    if (length > 0 && (flags & LX_OPT_CHARS) != 0) text.length = Kind::length_of_characters(page, text, text.length);
    return answer(Kind::with_walker(
        page, text, [&](auto walker) { return find_line_end(walker, line_characters<Kind>(page), wanted); }));
  });
}

template <class Kind, class Unit = typename Kind::Unit>
Unit* put_line_end(const char* function, LXLocale* locale, Unit* out, uint32_t state, uint32_t flags) {
  constexpr Unit* kNone = nullptr;
  return locale_call(trace_unit, function, locale, flags, kLineEnds | LX_EOL_DEFAULT, kNone, [&](LocaleCall& call) {
    const CodePage& page = page_of(call.locale);
    const LineCharacters line = line_characters<Kind>(page);
    uint32_t wanted = flags != 0 ? flags : LX_EOL_DEFAULT;
    Unit* at = out;
    auto put = [&](uint32_t when, uint32_t code) {
      if ((wanted & when) != 0) *at++ = static_cast<Unit>(code);
    };
    if (Kind::kShifted && page.shift_sensitive && state != 0) *at++ = static_cast<Unit>(page.leave_byte);
    put(LX_EOL_4, line.code[3]);
    put(LX_EOL_3, line.code[2]);
    put(LX_EOL_1, line.code[0]);
    put(LX_EOL_21, line.code[1]);
    put(LX_EOL_21 | LX_EOL_DEFAULT, line.code[0]);
    return at;
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

char* LXGetEol(LXLocale* locale, const char* s, int32_t length, uint32_t* type, int32_t* eol_length,
               uint32_t flags) noexcept {
  return get_line_end<PlainKind>(__func__, locale, s, 0, length, type, eol_length, flags);
}

LXUChar* LXGetEolU(LXLocale* locale, const LXUChar* s, int32_t length, uint32_t* type, int32_t* eol_length,
                   uint32_t flags) noexcept {
  return get_line_end<Ucs2Kind>(__func__, locale, s, 0, length, type, eol_length, flags);
}

LXWChar* LXGetEolW(LXLocale* locale, const LXWChar* s, int32_t length, uint32_t* type, int32_t* eol_length,
                   uint32_t flags) noexcept {
  return get_line_end<WideKind>(__func__, locale, s, 0, length, type, eol_length, flags);
}

char* LXGetEolEx(LXLocale* locale, const char* s, uint32_t state, int32_t length, uint32_t* type, int32_t* eol_length,
                 uint32_t flags) noexcept {
  return get_line_end<ShiftedKind>(__func__, locale, s, state, length, type, eol_length, flags);
}

char* LXPutEol(LXLocale* locale, char* out, uint32_t flags) noexcept {
  return put_line_end<PlainKind>(__func__, locale, out, 0, flags);
}

LXUChar* LXPutEolU(LXLocale* locale, LXUChar* out, uint32_t flags) noexcept {
  return put_line_end<Ucs2Kind>(__func__, locale, out, 0, flags);
}

LXWChar* LXPutEolW(LXLocale* locale, LXWChar* out, uint32_t flags) noexcept {
  return put_line_end<WideKind>(__func__, locale, out, 0, flags);
}

char* LXPutEolEx(LXLocale* locale, char* out, uint32_t state, uint32_t flags) noexcept {
  return put_line_end<ShiftedKind>(__func__, locale, out, state, flags);
}

}  // extern "C"
