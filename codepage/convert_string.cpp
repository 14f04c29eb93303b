// SPDX-License-Identifier: Apache-2.0
// Strings from one locale's code page into another's.
#include "codepage/one_shot.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "convert_string", 0};

// From here on making the map of a pair of single-byte pages costs less than it saves.
constexpr size_t kWorthMapping = 1024;

template <class In, class Out>
OneShotResult convert_pair(const Source<uint8_t>& source, const In& in, const Out& out, const Target& target) {
  return convert_source(source, in, out, target);
}
OneShotResult convert_pair(const Source<uint8_t>& source, SingleByteReader in, const SingleByteWriter& out,
                           const Target& target) {
  if (source.length < kWorthMapping) return convert_source(source, in, out, target);
  ByteMap map(*in.page, *out.page);
  in.map = &map;
  return convert_source(source, in, out, target);
}

OneShotResult convert_bytes(const CodePage& to, Shifts to_shifts, uint8_t* out, const Target& target,
                            const CodePage& from, Shifts from_shifts, const Source<uint8_t>& source) {
  return with_reader(from, from_shifts, source.text, source.length, [&](const auto& in) {
    return with_writer(to, to_shifts, out, target.byte_room(),
                       [&](const auto& writer) { return convert_pair(source, in, writer, target); });
  });
}

int32_t convert_string(const char* function, LXLocale* target_locale, char* out, Shifts to_shifts, int32_t out_size,
                       LXLocale* source_locale, const char* in, Shifts from_shifts, int32_t in_length, uint32_t flags) {
  return locale_call(
      trace_unit, function, target_locale, flags, kStringOptions, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
        const LXLocale* source = locale_or_default(source_locale);
        if (source == nullptr) return call.fail(LX_E_ARGUMENT, -1);
        const CodePage& from = page_of(*source);
        return convert_bytes(page_of(call.locale), to_shifts, bytes_of(out), Target(out, out_size, flags), from,
                             from_shifts, byte_source(from, in, from_shifts, in_length, flags))
            .count;
      });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXConvertString(LXLocale* target_locale, char* out, int32_t out_size, LXLocale* source_locale, const char* in,
                        int32_t in_length, uint32_t flags) noexcept {
  return convert_string(__func__, target_locale, out, {}, out_size, source_locale, in, {}, in_length, flags);
}

int32_t LXConvertStringEx(LXLocale* target_locale, char* out, uint32_t target_shift_state, int32_t out_size,
                          LXLocale* source_locale, const char* in, uint32_t source_shift_state, int32_t in_length,
                          uint32_t flags) noexcept {
  return convert_string(__func__, target_locale, out, {true, target_shift_state}, out_size, source_locale, in,
                        {true, source_shift_state}, in_length, flags);
}

int32_t LXConvertStringW(LXLocale* target_locale, LXWChar* out, int32_t out_size, LXLocale* source_locale,
                         const LXWChar* in, int32_t in_length, uint32_t flags) noexcept {
  return locale_call(trace_unit, __func__, target_locale, flags, kStringOptions, int32_t{-1},
                     [&](LocaleCall& call) -> int32_t {
                       const LXLocale* source_record = locale_or_default(source_locale);
                       if (source_record == nullptr) return call.fail(LX_E_ARGUMENT, -1);
                       Source<LXWChar> source(in, in_length);
                       Target target(out, out_size, flags);
                       return convert_source(source, WideReader(page_of(*source_record), source.text, source.length),
                                             WideWriter(page_of(call.locale), out, target.text_size()), target)
                           .count;
                     });
}

}  // extern "C"
