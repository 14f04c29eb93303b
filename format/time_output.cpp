// SPDX-License-Identifier: Apache-2.0
// Times written by a format.
#include "format/time_output.hpp"

#include <algorithm>

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "time_output", 0};

constexpr uint32_t kFlags = LX_NUM_TEXTOPT | LX_NUM_TERMINATE | LX_NUM_CHARLEN;

template <class Kind>
uint32_t write_time(const LXLocale& locale, const LXTime& time, const Text<typename Kind::Unit>& format, uint32_t flags,
                    TimeOutput<Kind>& out) {
  const CodePage& page = page_of(locale);
  uint32_t option = flags & LX_NUM_TEXTOPT;
  TimeWriter<Kind> writer(locale, time, spelling_of<Kind>(page).ascii, option, option);
  uint32_t status = Kind::with_walker(page, format, [&](auto walker) { return writer.write(walker, out); });
  if (out.at() != 0 || (flags & LX_NUM_TERMINATE) != 0) out.close();
  return status;
}

// A length in characters says little about bytes: these are written elsewhere first, and then as many characters taken
// as are wanted. Their room is the caller's to provide.
template <class Kind>
int32_t write_characters(LocaleCall& call, const LXTime& time, char* buffer, uint32_t state, int32_t length,
                         const Text<char>& format, uint32_t flags) {
  constexpr size_t kArea = 512;
  constexpr size_t kLongestCharacter = 6;
  char area[kArea] = {};
  const CodePage& page = page_of(call.locale);
  size_t terminator = (flags & LX_NUM_TERMINATE) != 0 ? 1 : 0;
  size_t wanted = static_cast<size_t>(length) - terminator;
  size_t room = std::min(static_cast<size_t>(length) * kLongestCharacter, kArea) - terminator;
  TimeOutput<Kind> out(&page, area, 0, room, state);
  call.status = write_time<Kind>(call.locale, time, format, flags, out);

  return Kind::with_walker(page, {area, out.at(), state}, [&](auto walker) {
    auto begin = walker;
    size_t count = skip_characters(walker, wanted);
    size_t used = passed(begin, walker);
    std::memcpy(buffer, area, used);
    if (shift_state(walker) != 0 && used + terminator != 0) buffer[used++] = static_cast<char>(page.leave_byte);
    if (count_characters(walker) != 0 && call.status == LX_OK) call.status = LX_E_BUFFER;
    if (terminator != 0) buffer[used] = 0;
    return static_cast<int32_t>(count + terminator);
  });
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t time_to_string(const char* function, LXLocale* locale, const LXTime* time, Unit* buffer, uint32_t state,
                       int32_t length, const Unit* format, uint32_t format_state, int32_t format_length,
                       uint32_t flags) {
  constexpr uint32_t kAny = ~0u;
  return locale_call(trace_unit, function, locale, flags, kAny, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
    if ((flags & LX_NUM_CHARLEN) != 0 && length <= 0) return call.fail(LX_E_BUFFER, 0);
    if ((flags & ~kFlags) != 0 || time == nullptr) return call.fail(LX_E_ARGUMENT, -1);
    if (format == nullptr && format_length != 0) return call.fail(LX_E_ARGUMENT, -1);
    if (length <= 0 || buffer == nullptr) return call.fail(LX_E_BUFFER, 0);

    const CodePage& page = page_of(call.locale);
    Text<Unit> text = text_of_call<Kind>(page, format, format_state, format_length, flags);
    if constexpr (Kind::kBytes) {
      if ((flags & LX_NUM_CHARLEN) != 0) return write_characters<Kind>(call, *time, buffer, state, length, text, flags);
    }
    size_t terminator = (flags & LX_NUM_TERMINATE) != 0 ? 1 : 0;
    TimeOutput<Kind> out(&page, buffer, 0, static_cast<size_t>(length) - terminator, state);
    call.status = write_time<Kind>(call.locale, *time, text, flags, out);
    if (terminator != 0) buffer[out.at()] = 0;
    return static_cast<int32_t>(out.at() + terminator);
  });
}

// A room that is filled from a position on; both move with what is written.
template <class Kind>
struct Filling {
  typename Kind::Unit* buffer;
  uint32_t* state;
  int32_t* position;
  int32_t length;

  bool given() const { return buffer != nullptr && position != nullptr && *position >= 0; }
  TimeOutput<Kind> output(const CodePage* page) const {
    return {page, buffer, static_cast<size_t>(*position), static_cast<size_t>(std::max(length, 0)),
            state != nullptr ? *state : 0};
  }
  uint32_t moved(const TimeOutput<Kind>& out, uint32_t status) const {
    *position = static_cast<int32_t>(out.at());
    if (state != nullptr) *state = out.state();
    return status;
  }
};

template <class Body>
uint32_t status_call(const char* function, LXLocale* locale, Body body) {
  return locale_call(trace_unit, function, locale, 0, 0, LX_E_ARGUMENT,
                     [&](LocaleCall& call) { return call.status = body(call); });
}

template <class Kind, class Unit = typename Kind::Unit>
uint32_t expand_time(const char* function, LXLocale* locale, const LXTime* time, const Filling<Kind>& to,
                     const Unit* format, uint32_t* format_state, int32_t* format_position, uint32_t text_option,
                     int32_t ascii, int32_t alternate, uint32_t flags) {
  return status_call(function, locale, [&](LocaleCall& call) -> uint32_t {
    if (!to.given() || time == nullptr || format == nullptr || format_position == nullptr || *format_position < 0)
      return LX_E_ARGUMENT;
    const CodePage& page = page_of(call.locale);
    TimeOutput<Kind> out = to.output(&page);
    TimeWriter<Kind> writer(call.locale, *time, ascii != 0, text_option, flags & LX_NUM_TEXTOPT);
    const Unit* at = format + *format_position;
    Text<Unit> text = {at, measured_length(at) + 1, format_state != nullptr ? *format_state : 0};
    uint32_t status = Kind::with_walker(page, text, [&](auto walker) {
      auto begin = walker;
      skip_characters(walker, alternate != 0 ? 2 : 1);
      Character letter;
      int32_t code = walker.next(letter) ? writer.codes().of(letter) : kNoDirective;
      *format_position += static_cast<int32_t>(passed(begin, walker));
      if (format_state != nullptr) *format_state = shift_state(walker);
      return writer.expand({&directive_of(code), alternate != 0}, out);
    });
    if (out.at() != static_cast<size_t>(*to.position)) out.close();
    return to.moved(out, status);
  });
}

template <class Kind>
uint32_t write_word_call(const char* function, LXLocale* locale, const Filling<Kind>& to, uint32_t item,
                         uint32_t text_option) {
  return status_call(function, locale, [&](LocaleCall& call) -> uint32_t {
    if (!to.given()) return LX_E_ARGUMENT;
    TimeOutput<Kind> out = to.output(&page_of(call.locale));
    uint32_t status = write_word(out, call.locale, item, text_option);
    out.close();
    return to.moved(out, status);
  });
}

template <class Kind>
uint32_t write_number_to(const Filling<Kind>& to, const CodePage* page, int32_t value, int32_t width, int32_t ascii,
                         int32_t alternate) {
  if (!to.given()) return LX_E_ARGUMENT;
  TimeOutput<Kind> out = to.output(page);
  bool of_ascii = std::same_as<Kind, Ucs2Kind> || ascii != 0;
  unsigned zero = of_ascii ? kAsciiSpelling.zero : kEbcdicSpelling.zero;
  auto digits = static_cast<uint32_t>(std::abs(int64_t{value}));
  return to.moved(out, write_number(out, digits, width, zero, alternate != 0));
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXTimeToString(LXLocale* locale, const LXTime* time, char* buffer, int32_t length, const char* format,
                       int32_t format_length, uint32_t flags) noexcept {
  return time_to_string<PlainKind>(__func__, locale, time, buffer, 0, length, format, 0, format_length, flags);
}

int32_t LXTimeToStringW(LXLocale* locale, const LXTime* time, LXWChar* buffer, int32_t length, const LXWChar* format,
                        int32_t format_length, uint32_t flags) noexcept {
  return time_to_string<WideKind>(__func__, locale, time, buffer, 0, length, format, 0, format_length, flags);
}

int32_t LXTimeToStringU(LXLocale* locale, const LXTime* time, LXUChar* buffer, int32_t length, const LXUChar* format,
                        int32_t format_length, uint32_t flags) noexcept {
  return time_to_string<Ucs2Kind>(__func__, locale, time, buffer, 0, length, format, 0, format_length, flags);
}

int32_t LXTimeToStringEx(LXLocale* locale, const LXTime* time, char* buffer, uint32_t state, int32_t length,
                         const char* format, uint32_t format_state, int32_t format_length, uint32_t flags) noexcept {
  return time_to_string<ShiftedKind>(__func__, locale, time, buffer, state, length, format, format_state, format_length,
                                     flags);
}

uint32_t LXStrExpandTime(LXLocale* locale, const LXTime* time, char* buffer, int32_t* position, int32_t length,
                         const char* format, int32_t* format_position, uint32_t text_option, int32_t ascii,
                         int32_t alternate, uint32_t flags) noexcept {
  return expand_time<PlainKind>(__func__, locale, time, {buffer, nullptr, position, length}, format, nullptr,
                                format_position, text_option, ascii, alternate, flags);
}

uint32_t LXStrExpandTimeW(LXLocale* locale, const LXTime* time, LXWChar* buffer, int32_t* position, int32_t length,
                          const LXWChar* format, int32_t* format_position, uint32_t text_option, int32_t ascii,
                          int32_t alternate, uint32_t flags) noexcept {
  return expand_time<WideKind>(__func__, locale, time, {buffer, nullptr, position, length}, format, nullptr,
                               format_position, text_option, ascii, alternate, flags);
}

uint32_t LXStrExpandTimeU(LXLocale* locale, const LXTime* time, LXUChar* buffer, int32_t* position, int32_t length,
                          const LXUChar* format, int32_t* format_position, uint32_t text_option, int32_t,
                          int32_t alternate, uint32_t flags) noexcept {
  return expand_time<Ucs2Kind>(__func__, locale, time, {buffer, nullptr, position, length}, format, nullptr,
                               format_position, text_option, 1, alternate, flags);
}

uint32_t LXStrExpandTimeEx(LXLocale* locale, const LXTime* time, char* buffer, uint32_t* state, int32_t* position,
                           int32_t length, const char* format, uint32_t* format_state, int32_t* format_position,
                           uint32_t text_option, int32_t ascii, int32_t alternate, uint32_t flags) noexcept {
  return expand_time<ShiftedKind>(__func__, locale, time, {buffer, state, position, length}, format, format_state,
                                  format_position, text_option, ascii, alternate, flags);
}

uint32_t LXStrWriteWord(LXLocale* locale, char* buffer, int32_t* position, int32_t length, uint32_t item,
                        uint32_t text_option) noexcept {
  return write_word_call<PlainKind>(__func__, locale, {buffer, nullptr, position, length}, item, text_option);
}

uint32_t LXStrWriteWordW(LXLocale* locale, LXWChar* buffer, int32_t* position, int32_t length, uint32_t item,
                         uint32_t text_option) noexcept {
  return write_word_call<WideKind>(__func__, locale, {buffer, nullptr, position, length}, item, text_option);
}

uint32_t LXStrWriteWordU(LXLocale* locale, LXUChar* buffer, int32_t* position, int32_t length, uint32_t item,
                         uint32_t text_option) noexcept {
  return write_word_call<Ucs2Kind>(__func__, locale, {buffer, nullptr, position, length}, item, text_option);
}

uint32_t LXStrWriteWordEx(LXLocale* locale, char* buffer, uint32_t* state, int32_t* position, int32_t length,
                          uint32_t item, uint32_t text_option) noexcept {
  return write_word_call<ShiftedKind>(__func__, locale, {buffer, state, position, length}, item, text_option);
}

uint32_t LXStrWriteNumber(char* buffer, int32_t* position, int32_t length, int32_t value, int32_t width, int32_t ascii,
                          int32_t alternate) noexcept {
  return exported(trace_unit, __func__, [&] {
    return write_number_to<PlainKind>({buffer, nullptr, position, length}, nullptr, value, width, ascii, alternate);
  });
}

uint32_t LXStrWriteNumberW(LXWChar* buffer, int32_t* position, int32_t length, int32_t value, int32_t width,
                           int32_t ascii, int32_t alternate) noexcept {
  return exported(trace_unit, __func__, [&] {
    return write_number_to<WideKind>({buffer, nullptr, position, length}, nullptr, value, width, ascii, alternate);
  });
}

uint32_t LXStrWriteNumberU(LXUChar* buffer, int32_t* position, int32_t length, int32_t value, int32_t width,
                           int32_t ascii, int32_t alternate) noexcept {
  return exported(trace_unit, __func__, [&] {
    return write_number_to<Ucs2Kind>({buffer, nullptr, position, length}, nullptr, value, width, ascii, alternate);
  });
}

uint32_t LXStrWriteNumberEx(LXLocale* locale, char* buffer, uint32_t* state, int32_t* position, int32_t length,
                            int32_t value, int32_t width, int32_t ascii, int32_t alternate) noexcept {
  return status_call(__func__, locale, [&](LocaleCall& call) {
    return write_number_to<ShiftedKind>({buffer, state, position, length}, &page_of(call.locale), value, width, ascii,
                                        alternate);
  });
}

}  // extern "C"
