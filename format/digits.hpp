// SPDX-License-Identifier: Apache-2.0
// What the next character of a number is, once for all kinds of text.
#pragma once

#include "codepage/text/algorithms.hpp"
#include "codepage/text/characters.hpp"
#include "codepage/text/kinds.hpp"
#include "format/spelling.hpp"

namespace lx {

inline constexpr int32_t kNoDigit = -1;

// Values of the characters of a page that take one byte.
inline const int32_t* digit_values(const CodePage& page, bool ascii) {
  constexpr uint16_t kKatakanaPage = 930;  // has its small letters elsewhere
  if (ascii) return LXAsciiToNum;
  return page.id == kKatakanaPage ? LXEbcdic930ToNum : LXEbcdicToNum;
}

// Characters that count as separators; 0: none.
struct Separators {
  uint32_t thousands = 0;
  uint32_t decimal = 0;
};

template <class Walker>
class DigitReader {
 public:
  static constexpr bool kShifted = requires(Walker walker) { walker.double_byte; };

  struct Place {
    const typename Walker::Unit* at;
    bool double_byte;
  };

  DigitReader(const CodePage& page, const Walker& text, bool ascii, const Separators& separators, bool full_width)
      : characters_(page),
        text_(text),
        values_(digit_values(page, ascii)),
        zero_(ascii ? kAsciiSpelling.zero : kEbcdicSpelling.zero),
        separators_(separators),
        full_width_(full_width) {
    note_plain_digits();
  }

  // Signs are texts of their own, in the single-byte state; an empty one is none.
  template <class Unit>
  void set_signs(const Text<Unit>& positive, const Text<Unit>& negative) {
    positive_ = Sign(walker_over(positive));
    negative_ = Sign(walker_over(negative));
    note_plain_digits();
  }
  void set_plain_signs(const Spelling& spelling) {
    positive_ = Sign(Character{spelling.plus, 1}, nothing());
    negative_ = Sign(Character{spelling.minus, 1}, nothing());
  }

  bool done() const { return text_.at == text_.end; }
  Place place() const {
    if constexpr (kShifted) return {text_.at, text_.double_byte};
    return {text_.at, false};
  }
  void return_to(const Place& place) {
    text_.at = place.at;
    if constexpr (kShifted) text_.double_byte = place.double_byte;
  }

  // A digit's value or an LX_DIG_ code, and the reader behind it; kNoDigit: the reader stays.
  int32_t next() {
    if (at_plain_digit()) return static_cast<int32_t>(*text_.at++ - zero_);
    return next_of_any();
  }

 private:
  struct Sign {
    Character first;  // no units: the sign matches nothing
    Walker rest;

    explicit Sign(const Walker& text) : rest(text) { rest.next(first); }
    Sign(const Character& only, const Walker& nothing) : first(only), rest(nothing) {}
    bool begins_with(const Character& character, const Character& form) const {
      return first == character || first == form;
    }
  };

  template <class Unit>
  Walker walker_over(const Text<Unit>& text) const {
    Walker walker = text_;
    walker.at = reinterpret_cast<const typename Walker::Unit*>(text.at);
    walker.end = walker.at + text.length;
    if constexpr (kShifted) walker.double_byte = false;
    return walker;
  }
  Walker nothing() const { return walker_over(Text<typename Walker::Unit>{}); }

  // Apart from next(), which is short as long as this is not part of it.
  [[gnu::noinline]] int32_t next_of_any() {
    Walker behind = text_;
    Character character;
    if (!behind.next(character)) return kNoDigit;
    int32_t code = classify(character, behind);
    if (code == kNoDigit) return kNoDigit;
    behind.finish();
    text_ = behind;
    return code;
  }

  bool is_decimal(uint32_t code) const { return code - zero_ < 10; }

  // Most characters of a number are decimal digits. Where no mark is or begins with one, they need no questions.
  void note_plain_digits() {
    plain_digits_ = !full_width_ && !is_decimal(separators_.thousands) && !is_decimal(separators_.decimal) &&
                    !is_decimal(positive_.first.code) && !is_decimal(negative_.first.code);
  }
  bool at_plain_digit() const {
    if (kShifted || done() || !plain_digits_ || !is_decimal(*text_.at)) return false;
    if constexpr (requires { text_.page; }) return text_.page->char_length[*text_.at] == 1;
    return true;
  }

  bool is_space(const Character& character) const { return (characters_.type(character) & LX_CT_SPACE) != 0; }
  Character form_of(const Character& character) const {
    return full_width_ ? characters_.full_to_half(character) : character;
  }

  // White space comes before everything else: a separator that is a blank is not seen.
  int32_t classify(const Character& character, Walker& behind) const {
    if (is_space(character)) {
      skip_while(behind, [&](const Character& next) { return is_space(next); });
      return LX_DIG_SPACE;
    }
    Character form = form_of(character);
    if (positive_.begins_with(character, form) && goes_on(positive_, behind)) return LX_DIG_PLUS;
    if (negative_.begins_with(character, form) && goes_on(negative_, behind)) return LX_DIG_MINUS;
    if (form.units != 1 || form.code == 0) return kNoDigit;
    if (form.code == separators_.thousands) return LX_DIG_THOUSANDS;
    if (form.code == separators_.decimal) return LX_DIG_DECIMAL;
    return form.code < 256 ? values_[form.code] : kNoDigit;
  }

  // Whether the rest of a sign follows, behind which the walker then moves.
  bool goes_on(const Sign& sign, Walker& behind) const {
    Walker text = behind;
    Walker rest = sign.rest;
    for (Character wanted, found; rest.next(wanted);) {
      if (!text.next(found) || (found != wanted && form_of(found) != wanted)) return false;
    }
    rest.finish();
    if (rest.at != rest.end) return false;  // half a character is nowhere
    behind = text;
    return true;
  }

  CharactersOf<Walker> characters_;
  Walker text_;
  const int32_t* values_;
  uint32_t zero_;
  Separators separators_;
  bool full_width_;
  bool plain_digits_;
  Sign positive_{Character{}, nothing()};
  Sign negative_{Character{}, nothing()};
};

}  // namespace lx
