// SPDX-License-Identifier: Apache-2.0
// Strings between a code page and UCS-2.
#include "codepage/one_shot.hpp"
#include "frame/call.hpp"
#include "frame/library.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "unicode_string", 0};

constexpr uint16_t kAsciiCodePage = 367;

OneShotResult to_unicode(const CodePage& page, LXUChar* out, int32_t out_size, const char* in, Shifts shifts,
                         int32_t in_length, uint32_t flags) {
  Source<uint8_t> source = byte_source(page, in, shifts, in_length, flags);
  Target target(out, out_size, flags);
  return with_reader(page, shifts, source.text, source.length, [&](auto reader) {
    return convert_source(source, reader, Ucs2Writer(out, target.text_size()), target);
  });
}

OneShotResult from_unicode(const CodePage& page, char* out, Shifts shifts, int32_t out_size, const LXUChar* in,
                           int32_t in_length, uint32_t flags) {
  Source<LXUChar> source(in, in_length);
  Target target(out, out_size, flags);
  return with_writer(page, shifts, bytes_of(out), target.byte_room(), [&](auto writer) {
    return convert_source(source, Ucs2Reader(source.text, source.length), writer, target);
  });
}

template <class Body>
int32_t string_call(const char* function, LXLocale* locale, uint32_t flags, Body body) {
  return locale_call(trace_unit, function, locale, flags, kStringOptions, int32_t{-1},
                     [&](LocaleCall& call) -> int32_t { return body(page_of(call.locale)).count; });
}

const LXObjEntry* ascii_page() {
  uint32_t rc = LX_OK;
  const LXObjEntry* entry = LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, kAsciiCodePage, 0, &rc);
  return entry;
}

bool usable(const LXObjEntry* record, uint32_t flags) {
  return is_loaded_code_page(record) && (flags & ~kStringOptions) == 0;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStringToUnicode(LXLocale* locale, LXUChar* out, int32_t out_size, const char* in, int32_t in_length,
                          uint32_t flags) noexcept {
  return string_call(__func__, locale, flags,
                     [&](const CodePage& page) { return to_unicode(page, out, out_size, in, {}, in_length, flags); });
}

int32_t LXStringToUnicodeEx(LXLocale* locale, LXUChar* out, int32_t out_size, const char* in, uint32_t shift_state,
                            int32_t in_length, uint32_t flags) noexcept {
  return string_call(__func__, locale, flags, [&](const CodePage& page) {
    return to_unicode(page, out, out_size, in, {true, shift_state}, in_length, flags);
  });
}

int32_t LXStringToUnicodeW(LXLocale* locale, LXUChar* out, int32_t out_size, const LXWChar* in, int32_t in_length,
                           uint32_t flags) noexcept {
  return string_call(__func__, locale, flags, [&](const CodePage& page) {
    Source<LXWChar> source(in, in_length);
    Target target(out, out_size, flags);
    return convert_source(source, WideReader(page, source.text, source.length), Ucs2Writer(out, target.text_size()),
                          target);
  });
}

int32_t LXUnicodeToString(LXLocale* locale, char* out, int32_t out_size, const LXUChar* in, int32_t in_length,
                          uint32_t flags) noexcept {
  return string_call(__func__, locale, flags,
                     [&](const CodePage& page) { return from_unicode(page, out, {}, out_size, in, in_length, flags); });
}

int32_t LXUnicodeToStringEx(LXLocale* locale, char* out, uint32_t shift_state, int32_t out_size, const LXUChar* in,
                            int32_t in_length, uint32_t flags) noexcept {
  return string_call(__func__, locale, flags, [&](const CodePage& page) {
    return from_unicode(page, out, {true, shift_state}, out_size, in, in_length, flags);
  });
}

int32_t LXUnicodeToStringW(LXLocale* locale, LXWChar* out, int32_t out_size, const LXUChar* in, int32_t in_length,
                           uint32_t flags) noexcept {
  return string_call(__func__, locale, flags, [&](const CodePage& page) {
    Source<LXUChar> source(in, in_length);
    Target target(out, out_size, flags);
    return convert_source(source, Ucs2Reader(source.text, source.length), WideWriter(page, out, target.text_size()),
                          target);
  });
}

int32_t LXCpStrToUnicode(const LXObjEntry* record, LXUChar* out, int32_t out_size, const char* in, int32_t in_length,
                         uint32_t flags) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (!usable(record, flags)) return -1;
    return to_unicode(code_page_of(*record), out, out_size, in, {}, in_length, flags).count;
  });
}

int32_t LXCpUnicodeToStr(const LXObjEntry* record, char* out, int32_t out_size, const LXUChar* in, int32_t in_length,
                         uint32_t flags) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (!usable(record, flags)) return -1;
    return from_unicode(code_page_of(*record), out, {}, out_size, in, in_length, flags).count;
  });
}

int32_t LXComStrToUnicode(LXUChar* out, int32_t out_size, const char* in, int32_t in_length, uint32_t flags) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    const LXObjEntry* page = ascii_page();
    if (!usable(page, flags) || Source<uint8_t>(bytes_of(in), in_length).length == 0) return -1;
    return static_cast<int32_t>(to_unicode(code_page_of(*page), out, out_size, in, {}, in_length, flags).consumed);
  });
}

int32_t LXComUnicodeToStr(char* out, int32_t out_size, const LXUChar* in, int32_t in_length, uint32_t flags) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    const LXObjEntry* page = ascii_page();
    if (!usable(page, flags) || Source<LXUChar>(in, in_length).length == 0) return -1;
    return from_unicode(code_page_of(*page), out, {}, out_size, in, in_length, flags).count;
  });
}

}  // extern "C"
