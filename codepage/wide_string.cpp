// SPDX-License-Identifier: Apache-2.0
// Strings between bytes and packed characters of the same code page.
#include "codepage/one_shot.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "wide_string", 0};

// The terminator of a measured text is packed like any character, also behind a character that it cuts off.
struct AsPackedText {
  template <class In, class Out>
  Stop operator()(In& in, Out& out) const {
    Stop stop = transfer(in, out);
    return stop == Stop::partial ? Stop::done : stop;
  }
};

OneShotResult pack_text(const CodePage& page, LXWChar* out, int32_t out_size, const char* in, Shifts shifts,
                        int32_t in_length, uint32_t flags) {
  Source<uint8_t> source = byte_source(page, in, shifts, in_length, flags);
  Target target(out, out_size, flags);
  return with_reader(page, shifts, source.text, source.length, [&](auto reader) {
    return convert_source(source, reader, WideWriter(page, out, target.text_size()), target, AsPackedText());
  });
}

OneShotResult unpack_text(const CodePage& page, char* out, Shifts shifts, int32_t out_size, const LXWChar* in,
                          int32_t in_length, uint32_t flags) {
  Source<LXWChar> source(in, in_length);
  Target target(out, out_size, flags);
  WideReader reader(page, source.text, source.length);
  if (shifts.followed && page.shift_sensitive) {
    return convert_source(source, reader, ShiftedWriter(page, bytes_of(out), target.byte_room(), shifts.state), target,
                          AsPacked());
  }
  return convert_source(source, reader, PackedWriter(bytes_of(out), target.byte_room()), target, AsPacked());
}

template <class Body>
int32_t wide_call(const char* function, LXLocale* locale, uint32_t flags, Body body) {
  return locale_call(trace_unit, function, locale, flags, kStringOptions, int32_t{-1},
                     [&](LocaleCall& call) -> int32_t { return body(page_of(call.locale)).count; });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXMbToWide(LXLocale* locale, LXWChar* out, int32_t out_size, const char* in, int32_t in_length,
                   uint32_t flags) noexcept {
  return wide_call(__func__, locale, flags,
                   [&](const CodePage& page) { return pack_text(page, out, out_size, in, {}, in_length, flags); });
}

int32_t LXMbToWideEx(LXLocale* locale, LXWChar* out, int32_t out_size, const char* in, uint32_t shift_state,
                     int32_t in_length, uint32_t flags) noexcept {
  return wide_call(__func__, locale, flags, [&](const CodePage& page) {
    return pack_text(page, out, out_size, in, {true, shift_state}, in_length, flags);
  });
}

int32_t LXWideToMb(LXLocale* locale, char* out, int32_t out_size, const LXWChar* in, int32_t in_length,
                   uint32_t flags) noexcept {
  return wide_call(__func__, locale, flags,
                   [&](const CodePage& page) { return unpack_text(page, out, {}, out_size, in, in_length, flags); });
}

int32_t LXWideToMbEx(LXLocale* locale, char* out, uint32_t shift_state, int32_t out_size, const LXWChar* in,
                     int32_t in_length, uint32_t flags) noexcept {
  return wide_call(__func__, locale, flags, [&](const CodePage& page) {
    return unpack_text(page, out, {true, shift_state}, out_size, in, in_length, flags);
  });
}

}  // extern "C"
