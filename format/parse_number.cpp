// SPDX-License-Identifier: Apache-2.0
// Decimal numbers read.
#include <algorithm>
#include <cmath>

#include "format/number_text.hpp"
#include "format/powers_of_ten.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "parse_number", 0};

// ---- The machine ----

enum State : int8_t {
  kStart,
  kSigned,
  kLeadingPoint,
  kInteger,
  kSeparated,  // behind a thousands separator
  kFraction,
  kMarked,  // behind the exponent marker
  kExponentSigned,
  kExponent,
  kStates,
  kStop = -1,
};

enum Class { kDigit, kMarker, kPlus, kMinus, kThousands, kPoint, kSpace, kOther };

Class class_of(int32_t code) {
  constexpr int32_t kLetterD = 13;
  constexpr int32_t kLetterE = 14;
  if (code >= 0 && code <= 9) return kDigit;
  if (code == kLetterD || code == kLetterE) return kMarker;
  return code >= LX_DIG_PLUS && code <= LX_DIG_SPACE ? static_cast<Class>(code - LX_DIG_PLUS + kPlus) : kOther;
}

// An exponent follows a decimal point only, and a separator stands between digits.
constexpr State kNext[kStates][kOther + 1] = {
    // digit    marker   plus             minus            thousands   point          space   other
    {kInteger, kStop, kSigned, kSigned, kStop, kLeadingPoint, kStart, kStop},
    {kInteger, kStop, kStop, kStop, kStop, kLeadingPoint, kStop, kStop},
    {kFraction, kStop, kStop, kStop, kStop, kStop, kStop, kStop},
    {kInteger, kStop, kStop, kStop, kSeparated, kFraction, kStop, kStop},
    {kInteger, kStop, kStop, kStop, kStop, kStop, kStop, kStop},
    {kFraction, kMarked, kStop, kStop, kStop, kStop, kStop, kStop},
    {kExponent, kStop, kExponentSigned, kExponentSigned, kStop, kStop, kStop, kStop},
    {kExponent, kStop, kStop, kStop, kStop, kStop, kStop, kStop},
    {kExponent, kStop, kStop, kStop, kStop, kStop, kStop, kStop},
};

struct Decimal {
  double value = 0.0;
  int32_t mantissa_sign = 1;
  int32_t fraction_exponent = 0;
  int32_t exponent_sign = 1;
  int32_t exponent = 0;

  int32_t step(int32_t state, int32_t code) {
    if (state == kInteger && code >= 0 && code <= 9) {  // most steps are these
      take_integer_digit(code);
      return kInteger;
    }
    return any_step(state, code);
  }

  double result() const {
    if (value == 0.0 || std::isinf(value)) return mantissa_sign * value;  // not zero times infinity
    return mantissa_sign * value * power_of_ten(exponent_sign * exponent);
  }

 private:
  static constexpr int32_t kFarthest = 9999;  // beyond every double

  // Apart from step(), which is short as long as this is not part of it.
  [[gnu::noinline]] int32_t any_step(int32_t state, int32_t code) {
    if (state < 0 || state >= kStates) return kStop;
    const Class what = class_of(code);
    const State next = kNext[state][what];
    if (next == kStop) return kStop;
    if (what == kDigit) {
      take_digit(state, code);
    } else if (what == kMinus) {
      (state == kStart ? mantissa_sign : exponent_sign) = -1;
    } else if (what == kPoint && state == kInteger) {
      fraction_exponent = 0;
    }
    return next;
  }

  void take_integer_digit(int32_t digit) { value = value * 10.0 + digit; }

  // Each digit of a fraction is added for itself, rounding every time: the value is what the steps make of it, which
  // may be some units in its last place beside the nearest double.
  void take_digit(int32_t state, int32_t digit) {
    switch (state) {
      case kStart:
        value = digit;
        break;
      case kLeadingPoint:
        fraction_exponent = -1;
        value = digit / 10.0;
        break;
      case kFraction:
        fraction_exponent = std::max(fraction_exponent, -kFarthest) - 1;
        value += digit * power_of_ten(fraction_exponent);
        break;
      case kMarked:
      case kExponentSigned:
        exponent = digit;
        break;
      case kExponent:
        exponent =
            static_cast<int32_t>(std::clamp(exponent * int64_t{10} + digit, -int64_t{kFarthest}, int64_t{kFarthest}));
        break;
      default:
        take_integer_digit(digit);
    }
  }
};

// ---- The driver ----

// The sign of an exponent is always the plain character, whatever the locale writes for amounts.
template <class Reader>
double read_decimal(Reader& text, const Spelling& spelling) {
  Decimal number;
  int32_t state = kStart;
  typename Reader::Place marker = text.place();
  while (!text.done()) {
    typename Reader::Place before = text.place();
    int32_t next = number.step(state, text.next());
    if (next == kStop) {
      text.return_to(before);
      break;
    }
    if (next == kMarked) {
      marker = before;
      text.set_plain_signs(spelling);
    }
    state = next;
  }
  if (state < kInteger) return 0.0;
  if (state == kMarked || state == kExponentSigned) text.return_to(marker);  // no exponent
  return number.result();
}

template <class Kind>
double decimal_call(const char* function, LXLocale* locale, const NumberText<typename Kind::Unit>& text,
                    uint32_t flags) {
  constexpr uint32_t kFlags = LX_NUM_TEXTOPT | LX_NUM_FULLWIDTH | LX_NUM_MONETARY | LX_NUM_CHARLEN;
  text.stopped(text.at, text.state);
  double result = 0.0;
  locale_call(trace_unit, function, locale, flags, kFlags, int32_t{0}, [&](LocaleCall& call) -> int32_t {
    if (text.at == nullptr) return 0;
    result = read_number<Kind>(call.locale, text, true, flags,
                               [](auto& reader, const Spelling& spelling) { return read_decimal(reader, spelling); });
    return 0;  // the event of the exit tells whole numbers only
  });
  return result;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStrDoubleNextState(int32_t state, int32_t code, double* value, int32_t* mantissa_sign,
                             int32_t* fraction_exponent, int32_t* exponent_sign, int32_t* exponent) noexcept {
  return exported(trace_unit, __func__, [&] {
    Decimal number = {*value, *mantissa_sign, *fraction_exponent, *exponent_sign, *exponent};
    int32_t next = number.step(state, code);
    *value = number.value;
    *mantissa_sign = number.mantissa_sign;
    *fraction_exponent = number.fraction_exponent;
    *exponent_sign = number.exponent_sign;
    *exponent = number.exponent;
    return next;
  });
}

double LXStringToDouble(LXLocale* locale, const char* string, int32_t length, const char** end,
                        uint32_t flags) noexcept {
  return decimal_call<PlainKind>(__func__, locale, {string, 0, length, end}, flags);
}

double LXStringToDoubleW(LXLocale* locale, const LXWChar* string, int32_t length, const LXWChar** end,
                         uint32_t flags) noexcept {
  return decimal_call<WideKind>(__func__, locale, {string, 0, length, end}, flags);
}

double LXStringToDoubleU(LXLocale* locale, const LXUChar* string, int32_t length, const LXUChar** end,
                         uint32_t flags) noexcept {
  return decimal_call<Ucs2Kind>(__func__, locale, {string, 0, length, end}, flags);
}

double LXStringToDoubleEx(LXLocale* locale, const char* string, uint32_t state, int32_t length, const char** end,
                          uint32_t* end_state, uint32_t flags) noexcept {
  return decimal_call<ShiftedKind>(__func__, locale, {string, state, length, end, end_state}, flags);
}

}  // extern "C"
