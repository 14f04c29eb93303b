// SPDX-License-Identifier: Apache-2.0
// Steps over the characters of a text.
#include <algorithm>

#include "codepage/text/algorithms.hpp"
#include "codepage/text/kinds.hpp"
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "navigation", 0};

size_t length_at(const CodePage& page, const char* s) { return page.char_length[static_cast<uint8_t>(*s)]; }
size_t length_in_state(const CodePage& page, uint32_t state) { return state != 0 ? page.max_length : 1u; }
char* position(const char* s) { return const_cast<char*>(s); }

template <class Result, class Body>
Result page_call(const char* function, LXLocale* locale, Result failure, Body body) {
  return locale_call(trace_unit, function, locale, 0, 0, failure,
                     [&](LocaleCall& call) { return body(page_of(call.locale)); });
}

// The same for functions without a result.
template <class Body>
void put_call(const char* function, LXLocale* locale, Body body) {
  exported(trace_unit, function, [&] {
    locale = locale_or_default(locale);
    if (locale == nullptr) return;
    locale->last_error = LX_OK;
    body(code_page_of(*locale->code_page));
  });
}

// A state that a shift byte at s changes; false: there is none.
bool turned(const CodePage& page, char byte, uint32_t& state) {
  auto value = static_cast<uint8_t>(byte);
  if (value != page.enter_byte && value != page.leave_byte) return false;
  state = value == page.enter_byte ? 1 : 0;
  return true;
}

// Bytes of a character that come before a terminator.
size_t present(const char* s, size_t length) {
  size_t count = 0;
  while (count < length && s[count] != '\0') ++count;
  return count;
}

const char* next_in_state(const CodePage& page, const char* s, uint32_t& state) {
  if (turned(page, *s, state)) ++s;
  size_t length = length_in_state(page, state);
  size_t there = present(s, length);
  // A character that the terminator cuts off ends there, so that nothing behind it is looked at.
  if (there < length && there > 0) return s + there;
  s += there > 0 ? length : 1;
  if (there > 0 && turned(page, *s, state)) ++s;
  return s;
}

const char* previous(const CodePage& page, const char* start, const char* current) {
  if (current <= start) return start;
  if (page.max_length == 1) return current - 1;
  const char* at = start;
  for (const char* next = at + length_at(page, at); next < current; next += length_at(page, next)) at = next;
  return at;
}

const char* previous_in_state(const CodePage& page, const char* start, const char* current, uint32_t& state) {
  if (current <= start) return start;
  uint32_t behind = 0;
  if (turned(page, current[-1], behind)) {
    state = behind == 0 ? 1 : 0;  // before the byte, the other state was in force
    --current;
  }
  auto length = static_cast<ptrdiff_t>(length_in_state(page, state));
  return current - std::min(length, current - start);
}

template <class Kind>
const char* moved(const CodePage& page, const Text<char>& text, bool characters) {
  if (characters && Kind::kShifted) {  // a shift byte belongs to the character before it
    return text.at + bytes_of_characters(page, bytes_of(text.at), text.state, text.length, true);
  }
  if (characters) return text.at + Kind::length_of_characters(page, text, text.length);
  return text.at + Kind::with_walker(page, text, [](auto walker) { return whole_length(walker); });
}

template <class Kind>
char* move_call(const char* function, LXLocale* locale, const char* s, uint32_t state, int32_t count, uint32_t flags) {
  return locale_call(trace_unit, function, locale, flags, LX_OPT_CHARS, static_cast<char*>(nullptr),
                     [&](LocaleCall& call) -> char* {
                       const CodePage& page = page_of(call.locale);
                       if (page.max_length == 1) return position(s) + count;
                       if (count < 0) return call.fail(LX_E_ARGUMENT, static_cast<char*>(nullptr));
                       Text<char> text = {s, static_cast<size_t>(count), state};
                       return position(moved<Kind>(page, text, (flags & LX_OPT_CHARS) != 0));
                     });
}

template <class Kind>
int32_t count_call(const char* function, LXLocale* locale, const char* s, uint32_t state, int32_t byte_length) {
  return page_call(function, locale, int32_t{0}, [&](const CodePage& page) {
    size_t length = byte_length < 0 ? measured_length(s) : static_cast<size_t>(byte_length);
    size_t count = Kind::with_walker(page, {s, length, state}, [](auto text) { return count_characters(text); });
    return static_cast<int32_t>(count);
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXByteLength(LXLocale* locale, const char* s) noexcept {
  return page_call(__func__, locale, int32_t{0}, [&](const CodePage& page) -> int32_t {
    return page.raw.header->char_length[static_cast<uint8_t>(*s)];
  });
}

int32_t LXByteLengthW(LXLocale* locale, LXWChar value) noexcept {
  return page_call(__func__, locale, int32_t{0},
                   [&](const CodePage&) { return static_cast<int32_t>(packed_length(value)); });
}

int32_t LXByteLengthEx(LXLocale* locale, const char* s, uint32_t state) noexcept {
  return page_call(__func__, locale, int32_t{0}, [&](const CodePage& page) -> int32_t {
    if (!page.shift_sensitive) return page.raw.header->char_length[static_cast<uint8_t>(*s)];
    turned(page, *s, state);
    return static_cast<int32_t>(length_in_state(page, state));
  });
}

char* LXNextChar(LXLocale* locale, const char* s) noexcept {
  return page_call(__func__, locale, static_cast<char*>(nullptr),
                   [&](const CodePage& page) { return position(s) + length_at(page, s); });
}

char* LXNextCharEx(LXLocale* locale, const char* s, uint32_t state, uint32_t* new_state) noexcept {
  return page_call(__func__, locale, static_cast<char*>(nullptr), [&](const CodePage& page) {
    const char* next = page.shift_sensitive ? next_in_state(page, s, state) : s + length_at(page, s);
    if (new_state != nullptr) *new_state = state;
    return position(next);
  });
}

char* LXPrevChar(LXLocale* locale, const char* start, const char* current) noexcept {
  return page_call(__func__, locale, static_cast<char*>(nullptr),
                   [&](const CodePage& page) { return position(previous(page, start, current)); });
}

char* LXPrevCharEx(LXLocale* locale, const char* start, const char* current, uint32_t state,
                   uint32_t* new_state) noexcept {
  return page_call(__func__, locale, static_cast<char*>(nullptr), [&](const CodePage& page) {
    const char* before =
        page.shift_sensitive ? previous_in_state(page, start, current, state) : previous(page, start, current);
    if (new_state != nullptr) *new_state = state;
    return position(before);
  });
}

int32_t LXNumChars(LXLocale* locale, const char* s, int32_t byte_length) noexcept {
  return count_call<PlainKind>(__func__, locale, s, 0, byte_length);
}

int32_t LXNumCharsEx(LXLocale* locale, const char* s, uint32_t state, int32_t byte_length) noexcept {
  return count_call<ShiftedKind>(__func__, locale, s, state, byte_length);
}

char* LXMoveStringPointer(LXLocale* locale, const char* s, int32_t count, uint32_t flags) noexcept {
  return move_call<PlainKind>(__func__, locale, s, 0, count, flags);
}

char* LXMoveStringPointerEx(LXLocale* locale, const char* s, uint32_t state, int32_t count, uint32_t flags) noexcept {
  return move_call<ShiftedKind>(__func__, locale, s, state, count, flags);
}

LXWChar LXGetChar(LXLocale* locale, const char* s) noexcept {
  return locale_call(trace_unit, __func__, locale, 0, 0, LXWChar{0},
                     [&](LocaleCall& call) { return LXMbToW(call.locale.code_page, s); });
}

LXWChar LXGetCharEx(LXLocale* locale, const char* s, uint32_t state) noexcept {
  return locale_call(trace_unit, __func__, locale, 0, 0, LXWChar{0}, [&](LocaleCall& call) {
    const LXObjEntry* record = call.locale.code_page;
    return page_of(call.locale).shift_sensitive ? LXMbToWS(record, s, state) : LXMbToW(record, s);
  });
}

void LXPutChar(LXLocale* locale, char* out, LXWChar packed) noexcept {
  put_call(__func__, locale, [&](const CodePage&) { LXWToMb(out, packed); });
}

void LXPutCharEx(LXLocale* locale, char* out, LXWChar packed, uint32_t state) noexcept {
  put_call(__func__, locale, [&](const CodePage& page) {
    if (!page.shift_sensitive) {
      LXWToMb(out, packed);
      return;
    }
    for (size_t i = length_in_state(page, state); i-- > 0; packed >>= 8) out[i] = static_cast<char>(packed & 0xFF);
  });
}

void LXInitState(LXLocale* locale, uint32_t* state) noexcept {
  put_call(__func__, locale, [&](const CodePage&) {
    if (state != nullptr) *state = 0;
  });
}

int32_t LXValidChar(LXLocale* locale, const char* s) noexcept {
  return page_call(__func__, locale, int32_t{0},
                   [&](const CodePage& page) { return static_cast<int32_t>(present(s, length_at(page, s))); });
}

int32_t LXValidCharEx(LXLocale* locale, const char* s, uint32_t state) noexcept {
  return page_call(__func__, locale, int32_t{0}, [&](const CodePage& page) {
    size_t length = page.shift_sensitive ? length_in_state(page, state) : length_at(page, s);
    return static_cast<int32_t>(present(s, length));
  });
}

int32_t LXTerminateStringEx(LXLocale* locale, char* out, uint32_t state, uint32_t flags) noexcept {
  return locale_call(trace_unit, __func__, locale, flags, LX_OPT_TERMINATE, int32_t{-1}, [&](LocaleCall& call) {
    const CodePage& page = page_of(call.locale);
    char* at = out;
    if (page.shift_sensitive && state != 0) *at++ = static_cast<char>(page.leave_byte);
    if ((flags & LX_OPT_TERMINATE) != 0) *at++ = '\0';
    return static_cast<int32_t>(at - out);
  });
}

}  // extern "C"
