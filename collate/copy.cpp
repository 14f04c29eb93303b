// SPDX-License-Identifier: Apache-2.0
// Strings copied, joined and measured.
#include "codepage/text/copy.hpp"
#include "collate/arguments.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "copy", 0};

template <class Kind, class Unit = typename Kind::Unit>
int32_t copy_call(const char* function, LXLocale* locale, Unit* dst, int32_t dst_size, const Unit* src, uint32_t state,
                  int32_t src_len, uint32_t options) {
  return locale_call(trace_unit, function, locale, options, LX_OPT_CHARS, int32_t{-1}, [&](LocaleCall& call) {
    return copy_text<Kind>(page_of(call.locale), dst, dst_size, src, state, src_len, (options & LX_OPT_CHARS) != 0);
  });
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t join_call(const char* function, LXLocale* locale, Unit* dst, const Unit* src, uint32_t state, int32_t src_len,
                  uint32_t options) {
  constexpr uint32_t kOptions = LX_OPT_CHARS | LX_OPT_TERMINATE;
  return locale_call(trace_unit, function, locale, options, kOptions, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
    if (dst == nullptr) return call.fail(LX_E_ARGUMENT, -1);
    const CodePage& page = page_of(call.locale);
    Text<Unit> before = {dst, measured_length(dst), 0};
    Text<Unit> text = given_text<Kind>(page, src, state, src_len, options, Terminator::excluded, Purpose::copying);
    bool terminate = src_len < 0 || (options & LX_OPT_TERMINATE) != 0;
    int32_t length = counted<Kind>(page, before, options);
    if (src_len == 0 || src == nullptr) return length + 1;
    if (src_len > 0) text.length = Kind::with_walker(page, text, [](auto walker) { return whole_length(walker); });
    length += counted<Kind>(page, text, options);
    std::memmove(dst + before.length, src, text.length * sizeof(Unit));
    if (terminate) dst[before.length + text.length] = 0;
    return length + (terminate ? 1 : 0);
  });
}

template <class Unit>
int32_t length_call(const char* function, LXLocale* locale, const Unit* text) {
  return locale_call(trace_unit, function, locale, 0, 0, int32_t{0},
                     [&](LocaleCall&) { return text != nullptr ? static_cast<int32_t>(measured_length(text)) : 0; });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStrcpy(LXLocale* locale, char* dst, int32_t dst_size, const char* src, int32_t src_len,
                 uint32_t options) noexcept {
  return copy_call<PlainKind>(__func__, locale, dst, dst_size, src, 0, src_len, options);
}

int32_t LXStrcpyEx(LXLocale* locale, char* dst, int32_t dst_size, const char* src, uint32_t state, int32_t src_len,
                   uint32_t options) noexcept {
  return copy_call<ShiftedKind>(__func__, locale, dst, dst_size, src, state, src_len, options);
}

int32_t LXWcscpy(LXLocale* locale, LXWChar* dst, int32_t dst_size, const LXWChar* src, int32_t src_len,
                 uint32_t options) noexcept {
  return copy_call<WideKind>(__func__, locale, dst, dst_size, src, 0, src_len, options);
}

int32_t LXStrcpyU(LXLocale* locale, LXUChar* dst, int32_t dst_size, const LXUChar* src, int32_t src_len,
                  uint32_t options) noexcept {
  return copy_call<Ucs2Kind>(__func__, locale, dst, dst_size, src, 0, src_len, options);
}

int32_t LXStrcat(LXLocale* locale, char* dst, const char* src, int32_t src_len, uint32_t options) noexcept {
  return join_call<PlainKind>(__func__, locale, dst, src, 0, src_len, options);
}

int32_t LXStrcatEx(LXLocale* locale, char* dst, const char* src, uint32_t state, int32_t src_len,
                   uint32_t options) noexcept {
  return join_call<ShiftedKind>(__func__, locale, dst, src, state, src_len, options);
}

int32_t LXWcscat(LXLocale* locale, LXWChar* dst, const LXWChar* src, int32_t src_len, uint32_t options) noexcept {
  return join_call<WideKind>(__func__, locale, dst, src, 0, src_len, options);
}

int32_t LXStrcatU(LXLocale* locale, LXUChar* dst, const LXUChar* src, int32_t src_len, uint32_t options) noexcept {
  return join_call<Ucs2Kind>(__func__, locale, dst, src, 0, src_len, options);
}

int32_t LXWcslen(LXLocale* locale, const LXWChar* wstr) noexcept { return length_call(__func__, locale, wstr); }

int32_t LXStrlenU(LXLocale* locale, const LXUChar* ustr) noexcept { return length_call(__func__, locale, ustr); }

int32_t LXStrByteLength(LXLocale* locale, LXWChar value) noexcept {
  return locale_call(trace_unit, __func__, locale, 0, 0, int32_t{0},
                     [&](LocaleCall&) { return static_cast<int32_t>(packed_length(value)); });
}

}  // extern "C"
