// SPDX-License-Identifier: Apache-2.0
// Doubles written in fixed-point notation.
#include "format/fixed_point.hpp"

#include <bit>
#include <cmath>

#include "format/decimal.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "fixed_point", 0};

__extension__ using Uint128 = unsigned __int128;

constexpr int kMantissaBits = 52;
constexpr int kExponentBias = 1075;  // of the mantissa taken as an integer
constexpr unsigned kNoNumber = 0x7FF;
constexpr uint32_t kMillion = 1000000;

// The millionths in rest / 2^bits, of which the rest is less than one and than 2^53.
uint32_t millionths(uint64_t rest, int bits) {
  if (bits > 74) return 0;  // less than half of one
  Uint128 scaled = Uint128{rest} * kMillion;
  auto whole = static_cast<uint32_t>(scaled >> bits);
  Uint128 left = scaled - (Uint128{whole} << bits);
  Uint128 half = Uint128{1} << (bits - 1);
  return left > half || (left == half && whole % 2 != 0) ? whole + 1 : whole;
}

// The digits of mantissa * 2^exponent; returns where they begin.
char* put_huge(char* to, uint64_t mantissa, int exponent) {
  constexpr uint32_t kPart = 1000000000;  // nine digits
  constexpr int kStep = 29;               // so that a part times 2^kStep, and what is carried, has 64 bits
  uint32_t parts[FixedPoint::kIntegerDigits / 9 + 1];
  size_t count = 0;
  for (; mantissa != 0; mantissa /= kPart) parts[count++] = static_cast<uint32_t>(mantissa % kPart);
  for (; exponent > 0; exponent -= kStep) {
    uint64_t carry = 0;
    for (size_t i = 0; i < count; ++i) {
      carry += uint64_t{parts[i]} << std::min(exponent, kStep);
      parts[i] = static_cast<uint32_t>(carry % kPart);
      carry /= kPart;
    }
    if (carry != 0) parts[count++] = static_cast<uint32_t>(carry);
  }
  for (size_t i = 0; i + 1 < count; ++i) to = put_digits(to, parts[i], 9);
  return put_digits(to, parts[count - 1]);
}

}  // namespace

FixedPoint::FixedPoint(double value) : negative_(value < 0) {
  const auto bits = std::bit_cast<uint64_t>(value);
  const auto exponent = static_cast<unsigned>(bits >> kMantissaBits & 0x7FF);
  finite_ = exponent != kNoNumber;
  if (!finite_) {
    begin_ = text_ + kIntegerDigits - 3;
    std::memcpy(text_ + kIntegerDigits - 3, std::isnan(value) ? "nan" : "inf", 3);
    return;
  }
  const uint64_t fraction = bits & ((uint64_t{1} << kMantissaBits) - 1);
  const uint64_t hidden = exponent != 0 ? uint64_t{1} << kMantissaBits : 0;
  put(fraction | hidden, static_cast<int>(std::max(exponent, 1u)) - kExponentBias);
}

void FixedPoint::put(uint64_t mantissa, int exponent) {
  char* const end = text_ + kIntegerDigits;
  if (exponent > 63 - kMantissaBits) {
    begin_ = put_huge(end, mantissa, exponent);
    put_digits(end + kFractionDigits, 0, kFractionDigits);
    return;
  }
  uint64_t whole = exponent >= 0 ? mantissa << exponent : -exponent > kMantissaBits ? 0 : mantissa >> -exponent;
  uint32_t part = 0;
  if (exponent < 0) {
    part = millionths(-exponent > kMantissaBits ? mantissa : mantissa - (whole << -exponent), -exponent);
    if (part == kMillion) {
      part = 0;
      ++whole;
    }
  }
  begin_ = put_digits(end, whole);
  put_digits(end + kFractionDigits, part, kFractionDigits);
}

uint16_t local_number(const LXLocale& locale, uint32_t number, uint32_t options) {
  const Item& item = item_of(number);
  const TerritoryHeader& territory = territory_of(*locale.territory);
  const bool own = (options & LX_NUM_TEXTOPT) == 0;
  if (item.kind == ItemKind::yes_no) return own ? own_flag(locale, item) : given_flag(territory, item);
  return own ? locale.numbers[item.index] : given_number(territory, item);
}

namespace {

template <class Kind, class Unit = typename Kind::Unit>
int32_t write_double(LocaleCall& call, double value, const Destination<Unit>& to) {
  if (to.empty()) return call.fail(LX_E_BUFFER, 0);
  constexpr NumberItems kItems = {LX_ITEM_DECIMAL, LX_ITEM_THOUSANDS, LX_ITEM_GROUPING, LX_ITEM_FRACTION_DIGITS};
  const CodePage& page = page_of(call.locale);
  const FixedPoint number(value);
  Output<Unit> out(to.buffer, to.room());
  out.widen(character_width<Kind>(page, to));
  if (number.negative()) out.put(spelling_of<Kind>(page).minus);
  FixedPointText<Kind>(call.locale, number, kItems, to.flags).put(out);
  if (to.terminated()) out.terminate();
  if (out.cut()) call.status = LX_E_BUFFER;
  return static_cast<int32_t>(to.in_characters() ? characters_in(page, to.buffer, out.written()) : out.written());
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t double_call(const char* function, LXLocale* locale, double value, const Destination<Unit>& to) {
  constexpr uint32_t kFlags = LX_NUM_TEXTOPT | LX_NUM_TERMINATE | LX_NUM_CHARLEN;
  return locale_call(trace_unit, function, locale, to.flags, kFlags, int32_t{-1},
                     [&](LocaleCall& call) { return write_double<Kind>(call, value, to); });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXDoubleToString(LXLocale* locale, double value, char* buffer, int32_t length, uint32_t flags) noexcept {
  return double_call<PlainKind>(__func__, locale, value, {buffer, 0, length, flags});
}

int32_t LXDoubleToStringEx(LXLocale* locale, double value, char* buffer, uint32_t state, int32_t length,
                           uint32_t flags) noexcept {
  return double_call<ShiftedKind>(__func__, locale, value, {buffer, state, length, flags});
}

int32_t LXDoubleToStringW(LXLocale* locale, double value, LXWChar* buffer, int32_t length, uint32_t flags) noexcept {
  return double_call<WideKind>(__func__, locale, value, {buffer, 0, length, flags});
}

int32_t LXDoubleToStringU(LXLocale* locale, double value, LXUChar* buffer, int32_t length, uint32_t flags) noexcept {
  return double_call<Ucs2Kind>(__func__, locale, value, {buffer, 0, length, flags});
}

}  // extern "C"
