// SPDX-License-Identifier: Apache-2.0
// Doubles in fixed-point notation: the digits, and how a locale lays them out.
#pragma once

#include <string_view>

#include "format/grouping.hpp"
#include "format/number_output.hpp"

namespace lx {

// What "%f" prints, whatever the C library's locale: six fraction digits, rounded to nearest, ties to even.
class FixedPoint {
 public:
  static constexpr size_t kIntegerDigits = 309;
  static constexpr size_t kFractionDigits = 6;

  explicit FixedPoint(double value);
  FixedPoint(const FixedPoint&) = delete;
  FixedPoint& operator=(const FixedPoint&) = delete;

  bool negative() const { return negative_; }
  bool finite() const { return finite_; }
  // Digits, or the letters for what is no number.
  std::string_view integer() const { return {begin_, static_cast<size_t>(integer_end() - begin_)}; }
  // Empty for what is no number.
  std::string_view fraction() const { return {integer_end(), finite_ ? kFractionDigits : 0}; }

 private:
  void put(uint64_t mantissa, int exponent);
  const char* integer_end() const { return text_ + kIntegerDigits; }

  bool negative_;
  bool finite_;
  const char* begin_;
  char text_[kIntegerDigits + kFractionDigits];
};

// So many of the fraction's digits, then zeros. More digits than there are cost the last one.
struct FractionLayout {
  size_t digits;
  size_t zeros;

  FractionLayout(size_t given, size_t wanted)
      : digits(wanted <= given ? wanted : given - 1), zeros(wanted <= given ? 0 : wanted - given) {}
};

// The items that say how a number is laid out.
struct NumberItems {
  uint32_t decimal;
  uint32_t thousands;
  uint32_t grouping;
  uint32_t fraction_digits;
};

// A number of the locale, or setting, as LXGetLocaleNumInfo reads it.
uint16_t local_number(const LXLocale& locale, uint32_t item, uint32_t options);

// A fixed-point number in the units of a kind, without its sign.
template <class Kind>
class FixedPointText {
 public:
  using Unit = typename Kind::Unit;

  FixedPointText(const LXLocale& locale, const FixedPoint& value, const NumberItems& items, uint32_t options) {
    Grouping<Kind> grouping(locale, items.thousands, items.grouping, options);
    zero_ = grouping.spelled('0');
    if (!value.finite()) {
      put_letters(WideWriter(page_of(locale), nullptr, 0), value.integer());
      return;
    }
    using TextKind = typename Grouping<Kind>::TextKind;
    const FractionLayout fraction(FixedPoint::kFractionDigits, local_number(locale, items.fraction_digits, options));
    zeros_ = fraction.zeros;
    Unit point = local_separator<TextKind>(locale, items.decimal, options);
    if (point != 0) *end_++ = point;
    for (char digit : value.fraction().substr(0, fraction.digits)) *end_++ = grouping.spelled(digit);
    begin_ = grouping.write(begin_, value.integer());
  }
  FixedPointText(const FixedPointText&) = delete;
  FixedPointText& operator=(const FixedPointText&) = delete;

  void put(Output<Unit>& out) const {
    out.put(begin_, static_cast<size_t>(end_ - begin_));
    out.put_repeated(zero_, zeros_);
  }

 private:
  static constexpr size_t kIntegerRoom = 2 * FixedPoint::kIntegerDigits;  // each digit may be a group

  void put_letters(const WideWriter& page, std::string_view letters) {
    for (char letter : letters) {
      auto ascii = static_cast<uint8_t>(letter);
      *end_++ = static_cast<Unit>(std::same_as<Kind, Ucs2Kind> ? ascii : page.code(ascii));
    }
  }

  Unit text_[kIntegerRoom + 1 + FixedPoint::kFractionDigits];
  Unit* begin_ = text_ + kIntegerRoom;
  Unit* end_ = begin_;
  Unit zero_;
  size_t zeros_ = 0;
};

}  // namespace lx
