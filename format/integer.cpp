// SPDX-License-Identifier: Apache-2.0
// Integers written as the locale writes them.
#include "format/decimal.hpp"
#include "format/grouping.hpp"
#include "format/number_output.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "integer", 0};

// The characters of the result are counted behind it, as callers have come to expect; as far as the buffer is known to
// go.
template <class Unit>
size_t characters_behind(const CodePage& page, const Destination<Unit>& to, size_t written) {
  const auto length = static_cast<size_t>(to.length);
  const size_t known = length > written ? std::min(written, length - written) : 0;
  return characters_in(page, to.buffer + written, known) + (written - known);
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t write_integer(LocaleCall& call, int32_t value, const Destination<Unit>& to) {
  if (to.empty()) return call.fail(LX_E_BUFFER, 0);
  const CodePage& page = page_of(call.locale);
  const bool negative = value < 0 && (to.flags & LX_NUM_UNSIGNED) == 0;
  const auto magnitude = static_cast<uint32_t>(value);

  char digits[kMaxDigits];
  char* const end = digits + kMaxDigits;
  const char* begin = put_digits(end, negative ? 0 - magnitude : magnitude);
  Grouping<Kind> grouping(call.locale, LX_ITEM_THOUSANDS, LX_ITEM_GROUPING, to.flags);
  Unit text[2 * kMaxDigits];
  Unit* const text_end = text + 2 * kMaxDigits;
  const Unit* text_begin = grouping.write(text_end, {begin, static_cast<size_t>(end - begin)});

  Output<Unit> out(to.buffer, to.room());
  if (negative) out.put(grouping.spelling.minus);
  out.widen(character_width<Kind>(page, to));
  out.put(text_begin, static_cast<size_t>(text_end - text_begin));
  if (to.terminated()) out.terminate();
  if (out.cut()) call.status = LX_E_BUFFER;
  size_t count = out.written();
  return static_cast<int32_t>(to.in_characters() ? characters_behind(page, to, count) : count);
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t integer_call(const char* function, LXLocale* locale, int32_t value, const Destination<Unit>& to) {
  constexpr uint32_t kFlags = LX_NUM_TEXTOPT | LX_NUM_TERMINATE | LX_NUM_UNSIGNED | LX_NUM_CHARLEN;
  return locale_call(trace_unit, function, locale, to.flags, kFlags, int32_t{-1},
                     [&](LocaleCall& call) { return write_integer<Kind>(call, value, to); });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXLongToString(LXLocale* locale, int32_t value, char* buffer, int32_t length, uint32_t flags) noexcept {
  return integer_call<PlainKind>(__func__, locale, value, {buffer, 0, length, flags});
}

int32_t LXLongToStringEx(LXLocale* locale, int32_t value, char* buffer, uint32_t state, int32_t length,
                         uint32_t flags) noexcept {
  return integer_call<ShiftedKind>(__func__, locale, value, {buffer, state, length, flags});
}

int32_t LXLongToStringW(LXLocale* locale, int32_t value, LXWChar* buffer, int32_t length, uint32_t flags) noexcept {
  return integer_call<WideKind>(__func__, locale, value, {buffer, 0, length, flags});
}

int32_t LXLongToStringU(LXLocale* locale, int32_t value, LXUChar* buffer, int32_t length, uint32_t flags) noexcept {
  return integer_call<Ucs2Kind>(__func__, locale, value, {buffer, 0, length, flags});
}

}  // extern "C"
