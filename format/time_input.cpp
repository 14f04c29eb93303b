// SPDX-License-Identifier: Apache-2.0
// Times read by a format.
#include "format/time_input.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "time_input", 0};

template <class Kind, class Unit = typename Kind::Unit>
int32_t string_to_time(const char* function, LXLocale* locale, LXTime* time, const Unit* string, uint32_t state,
                       int32_t length, const Unit* format, uint32_t format_state, int32_t format_length,
                       uint32_t flags) {
  constexpr uint32_t kFlags = LX_NUM_TEXTOPT | LX_NUM_CHARLEN;
  return locale_call(trace_unit, function, locale, flags, kFlags, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
    bool given = (string != nullptr || length == 0) && (format != nullptr || format_length == 0);
    if (time == nullptr || !given) return call.fail(LX_E_ARGUMENT, -1);
    const CodePage& page = page_of(call.locale);
    Text<Unit> text = text_of_call<Kind>(page, string, state, length, flags);
    Text<Unit> directives = text_of_call<Kind>(page, format, format_state, format_length, flags);
    if (text.length == 0 || directives.length == 0) return 0;
    TimeReader<Kind> reader(call.locale, *time, spelling_of<Kind>(page).ascii, flags);
    return Kind::with_walker(page, text, [&](auto walker) -> int32_t {
      auto begin = walker;
      auto format_walker = walker_over(walker, directives);
      call.status = reader.read(walker, format_walker);
      if (call.status != LX_OK) return -1;
      size_t used = passed(begin, walker);
      begin.end = walker.at;
      return static_cast<int32_t>((flags & LX_NUM_CHARLEN) != 0 ? count_characters(begin) : used);
    });
  });
}

// A text that is read from a position on; both move with what is read.
template <class Kind>
struct Reading {
  using Unit = typename Kind::Unit;

  const Unit* string;
  uint32_t* state;
  int32_t* position;
  int32_t length;

  bool given() const { return string != nullptr && position != nullptr && *position >= 0; }
  Text<Unit> rest() const {
    if (!given()) return {};
    size_t whole = length < 0 ? measured_length(string) : static_cast<size_t>(length);
    size_t from = std::min(static_cast<size_t>(*position), whole);
    return Text<Unit>{string, whole, state != nullptr ? *state : 0}.tail(from);
  }
  template <class Walker>
  void move(const Walker& from, const Walker& to) const {
    *position += static_cast<int32_t>(passed(from, to));
    if (state != nullptr) *state = shift_state(to);
  }
};

template <class Kind>
uint32_t extract_time(const char* function, LXLocale* locale, LXTime* time, const Reading<Kind>& from,
                      const Reading<Kind>& format, int32_t* afternoon, int32_t ascii, uint32_t flags) {
  return locale_call(trace_unit, function, locale, 0, 0, LX_E_ARGUMENT, [&](LocaleCall& call) -> uint32_t {
    if (time == nullptr || !from.given() || !format.given()) return call.status = LX_E_ARGUMENT;
    const CodePage& page = page_of(call.locale);
    TimeReader<Kind> reader(call.locale, *time, ascii != 0, flags);
    bool is_afternoon = afternoon != nullptr && *afternoon != 0;
    return Kind::with_walker(page, from.rest(), [&](auto text) {
      auto directive = walker_over(text, format.rest());
      auto text_begin = text;
      auto format_begin = directive;
      skip_characters(directive, 1);  // the percent sign
      Request request = next_request(directive, reader.codes());
      call.status = reader.extract(request, text, is_afternoon);
      if (call.status == LX_OK) {
        from.move(text_begin, text);
        format.move(format_begin, directive);
        if (afternoon != nullptr) *afternoon = is_afternoon ? 1 : 0;
      }
      return call.status;
    });
  });
}

template <class Kind, class Walker>
int32_t read_number_at(const Reading<Kind>& from, Walker walker, int32_t max_digits, int32_t max_value, bool ascii,
                       uint32_t& status) {
  status = LX_E_ARGUMENT;
  if (!from.given()) return -1;
  Walker begin = walker;
  unsigned zero = ascii ? kAsciiSpelling.zero : kEbcdicSpelling.zero;
  int32_t value = read_number(walker, max_digits, max_value, zero, status);
  if (value >= 0) from.move(begin, walker);
  return value;
}

// Digits are single units, and nothing else is looked at, so the code page does not matter.
template <class Unit, class Kind>
int32_t read_number_call(const char* function, uint32_t* error, const Reading<Kind>& from, int32_t max_digits,
                         int32_t max_value, bool ascii) {
  return exported(trace_unit, function, [&] {
    Text<typename Kind::Unit> rest = from.rest();
    UnitWalker<Unit> walker(reinterpret_cast<const Unit*>(rest.at), rest.length);
    uint32_t status = LX_OK;
    int32_t value = read_number_at(from, walker, max_digits, max_value, ascii, status);
    set_status(error, status);
    return value;
  });
}

template <class Kind>
int32_t read_word_call(const char* function, LXLocale* locale, uint32_t* error, const Reading<Kind>& from,
                       uint32_t first_item, int32_t count, uint32_t text_option) {
  uint32_t status = LX_E_ARGUMENT;
  int32_t found = locale_call(trace_unit, function, locale, 0, 0, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
    call.status = status;
    if (!from.given()) return -1;
    const CodePage& page = page_of(call.locale);
    return Kind::with_walker(page, from.rest(), [&](auto walker) {
      auto begin = walker;
      int32_t index = read_word<Kind>(call.locale, walker, first_item, count, text_option);
      from.move(begin, walker);
      call.status = status = index >= 0 ? LX_OK : LX_E_NOTFOUND;
      return index;
    });
  });
  set_status(error, status);
  return found;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStringToTime(LXLocale* locale, LXTime* time, const char* string, int32_t length, const char* format,
                       int32_t format_length, uint32_t flags) noexcept {
  return string_to_time<PlainKind>(__func__, locale, time, string, 0, length, format, 0, format_length, flags);
}

int32_t LXStringToTimeW(LXLocale* locale, LXTime* time, const LXWChar* string, int32_t length, const LXWChar* format,
                        int32_t format_length, uint32_t flags) noexcept {
  return string_to_time<WideKind>(__func__, locale, time, string, 0, length, format, 0, format_length, flags);
}

int32_t LXStringToTimeU(LXLocale* locale, LXTime* time, const LXUChar* string, int32_t length, const LXUChar* format,
                        int32_t format_length, uint32_t flags) noexcept {
  return string_to_time<Ucs2Kind>(__func__, locale, time, string, 0, length, format, 0, format_length, flags);
}

int32_t LXStringToTimeEx(LXLocale* locale, LXTime* time, const char* string, uint32_t state, int32_t length,
                         const char* format, uint32_t format_state, int32_t format_length, uint32_t flags) noexcept {
  return string_to_time<ShiftedKind>(__func__, locale, time, string, state, length, format, format_state, format_length,
                                     flags);
}

uint32_t LXStrExtractTime(LXLocale* locale, LXTime* time, const char* string, int32_t* position, int32_t length,
                          const char* format, int32_t* format_position, int32_t format_length, int32_t* afternoon,
                          int32_t ascii, uint32_t flags) noexcept {
  return extract_time<PlainKind>(__func__, locale, time, {string, nullptr, position, length},
                                 {format, nullptr, format_position, format_length}, afternoon, ascii, flags);
}

uint32_t LXStrExtractTimeW(LXLocale* locale, LXTime* time, const LXWChar* string, int32_t* position, int32_t length,
                           const LXWChar* format, int32_t* format_position, int32_t format_length, int32_t* afternoon,
                           int32_t ascii, uint32_t flags) noexcept {
  return extract_time<WideKind>(__func__, locale, time, {string, nullptr, position, length},
                                {format, nullptr, format_position, format_length}, afternoon, ascii, flags);
}

uint32_t LXStrExtractTimeU(LXLocale* locale, LXTime* time, const LXUChar* string, int32_t* position, int32_t length,
                           const LXUChar* format, int32_t* format_position, int32_t format_length, int32_t* afternoon,
                           int32_t, uint32_t flags) noexcept {
  return extract_time<Ucs2Kind>(__func__, locale, time, {string, nullptr, position, length},
                                {format, nullptr, format_position, format_length}, afternoon, 1, flags);
}

uint32_t LXStrExtractTimeEx(LXLocale* locale, LXTime* time, const char* string, uint32_t* state, int32_t* position,
                            int32_t length, const char* format, uint32_t* format_state, int32_t* format_position,
                            int32_t format_length, int32_t* afternoon, int32_t ascii, uint32_t flags) noexcept {
  return extract_time<ShiftedKind>(__func__, locale, time, {string, state, position, length},
                                   {format, format_state, format_position, format_length}, afternoon, ascii, flags);
}

int32_t LXStrReadNumber(uint32_t* error, const char* string, int32_t* position, int32_t length, int32_t max_digits,
                        int32_t max_value, int32_t ascii) noexcept {
  Reading<PlainKind> from = {string, nullptr, position, length};
  return read_number_call<uint8_t>(__func__, error, from, max_digits, max_value, ascii != 0);
}

int32_t LXStrReadNumberW(uint32_t* error, const LXWChar* string, int32_t* position, int32_t length, int32_t max_digits,
                         int32_t max_value, int32_t ascii) noexcept {
  Reading<WideKind> from = {string, nullptr, position, length};
  return read_number_call<LXWChar>(__func__, error, from, max_digits, max_value, ascii != 0);
}

int32_t LXStrReadNumberU(uint32_t* error, const LXUChar* string, int32_t* position, int32_t length, int32_t max_digits,
                         int32_t max_value, int32_t) noexcept {
  Reading<Ucs2Kind> from = {string, nullptr, position, length};
  return read_number_call<LXUChar>(__func__, error, from, max_digits, max_value, true);
}

int32_t LXStrReadNumberEx(LXLocale* locale, uint32_t* error, const char* string, uint32_t* state, int32_t* position,
                          int32_t length, int32_t max_digits, int32_t max_value, int32_t ascii) noexcept {
  Reading<ShiftedKind> from = {string, state, position, length};
  uint32_t status = LX_E_ARGUMENT;
  int32_t value = locale_call(trace_unit, __func__, locale, 0, 0, int32_t{-1}, [&](LocaleCall& call) {
    return ShiftedKind::with_walker(page_of(call.locale), from.rest(), [&](auto walker) {
      int32_t number = read_number_at(from, walker, max_digits, max_value, ascii != 0, status);
      call.status = status;
      return number;
    });
  });
  set_status(error, status);
  return value;
}

int32_t LXStrReadWord(LXLocale* locale, uint32_t* error, const char* string, int32_t* position, int32_t length,
                      uint32_t first_item, int32_t count, uint32_t text_option) noexcept {
  return read_word_call<PlainKind>(__func__, locale, error, {string, nullptr, position, length}, first_item, count,
                                   text_option);
}

int32_t LXStrReadWordW(LXLocale* locale, uint32_t* error, const LXWChar* string, int32_t* position, int32_t length,
                       uint32_t first_item, int32_t count, uint32_t text_option) noexcept {
  return read_word_call<WideKind>(__func__, locale, error, {string, nullptr, position, length}, first_item, count,
                                  text_option);
}

int32_t LXStrReadWordU(LXLocale* locale, uint32_t* error, const LXUChar* string, int32_t* position, int32_t length,
                       uint32_t first_item, int32_t count, uint32_t text_option) noexcept {
  return read_word_call<Ucs2Kind>(__func__, locale, error, {string, nullptr, position, length}, first_item, count,
                                  text_option);
}

int32_t LXStrReadWordEx(LXLocale* locale, uint32_t* error, const char* string, uint32_t* state, int32_t* position,
                        int32_t length, uint32_t first_item, int32_t count, uint32_t text_option) noexcept {
  return read_word_call<ShiftedKind>(__func__, locale, error, {string, state, position, length}, first_item, count,
                                     text_option);
}

}  // extern "C"
