// SPDX-License-Identifier: Apache-2.0
// Times read: numbers, names of the locale, and the reader that follows a format.
#pragma once

#include <algorithm>

#include "codepage/text/algorithms.hpp"
#include "format/directives.hpp"
#include "format/local_text.hpp"

namespace lx {

// -1: no number is there. LX_E_NOTFOUND then, at the end of the text (0), and for a number above the limit.
template <class Walker>
[[gnu::always_inline]] inline int32_t read_number(Walker& text, int32_t most_digits, int32_t limit, unsigned zero,
                                                  uint32_t& status) {
  constexpr int64_t kTooHigh = int64_t{INT32_MAX} + 1;
  status = LX_E_NOTFOUND;
  if (text.at == text.end) return 0;
  text.finish();  // shift bytes that nobody has passed yet
  auto* at = text.at;
  auto digit_here = [&] { return at != text.end && *at - zero <= 9; };
  if (shift_state(text) != 0 || !digit_here()) return -1;
  int64_t value = 0;
  int32_t digits = 0;
  do {
    value = std::min(value * 10 + (*at++ - zero), kTooHigh);
  } while (++digits < most_digits && digit_here());
  text.at = at;
  text.finish();
  if (value <= limit) status = LX_OK;
  return static_cast<int32_t>(std::min(value, kTooHigh - 1));
}

// The longest of some names that the text goes on with.
template <class Kind, class Walker>
class LongestName {
 public:
  LongestName(const LXLocale& locale, const Walker& text)
      : page_(page_of(locale)), codes_(page_, nullptr, 0), text_(text), end_(text) {}

  // Behind the longest name so far.
  const Walker& end() const { return end_; }

  // Whether names can be compared as the language has them: not where double-byte characters stand without shift bytes.
  bool by_characters() const { return Kind::kShifted || !Kind::kBytes || !page_.shift_sensitive; }

  // Names of the language need no conversion: most of them differ in their first character.
  bool longer(const LXUChar* name) {
    Character character;
    Walker ahead = text_;
    size_t units = 0;
    for (; *name != 0; ++name) {
      Walker before = ahead;
      if (!ahead.next(character) || character.code != code(*name)) return false;
      units += character.units;
      if (units < kTimeTextRoom) continue;
      ahead = before;  // longer names are cut wherever they are used
      break;
    }
    return note(ahead);
  }
  bool longer(const LocalText<Kind, kTimeTextRoom>& name) {
    Walker ahead = text_;
    Walker wanted = walker_over(ahead, Text<typename Kind::Unit>{name.begin(), name.length(), 0});
    Character character;
    Character found;
    while (wanted.next(character)) {
      if (!ahead.next(found) || found != character) return false;
    }
    return note(ahead);
  }

 private:
  uint32_t code(LXUChar character) const { return std::same_as<Kind, Ucs2Kind> ? character : codes_.code(character); }
  bool note(const Walker& ahead) {
    if (ahead.at <= end_.at) return false;
    end_ = ahead;
    return true;
  }

  const CodePage& page_;
  WideWriter codes_;
  const Walker& text_;
  Walker end_;
};

// The number of the name that the text goes on with, or -1.
template <class Kind, class Walker>
int32_t read_word(const LXLocale& locale, Walker& text, uint32_t first_item, int32_t count, uint32_t text_option) {
  LongestName<Kind, Walker> longest(locale, text);
  int32_t found = -1;
  uint32_t items = first_item < kItems ? kItems - first_item : 0;
  for (int32_t i = 0; i < std::min(count, static_cast<int32_t>(items)); ++i) {
    uint32_t item = first_item + static_cast<uint32_t>(i);
    const LXUChar* name = longest.by_characters() ? language_name(locale, item) : nullptr;
    bool longer = name != nullptr ? longest.longer(name)
                                  : longest.longer(LocalText<Kind, kTimeTextRoom>(locale, item, text_option));
    if (longer) found = i;
  }
  if (found >= 0) {
    text = longest.end();
    text.finish();
  }
  return found;
}

template <class Kind>
class TimeReader {
 public:
  TimeReader(const LXLocale& locale, LXTime& time, bool ascii, uint32_t text_option)
      : locale_(locale),
        time_(time),
        zero_((ascii ? kAsciiSpelling : kEbcdicSpelling).zero),
        codes_(DirectiveCodes::of<Kind>(page_of(locale), ascii)),
        text_option_(text_option) {}

  const DirectiveCodes& codes() const { return codes_; }

  // As far as both the text and the format go.
  template <class Walker>
  uint32_t read(Walker& text, Walker& format) {
    bool afternoon = false;
    for (Character wanted; text.at != text.end && format.next(wanted); format.finish()) {
      uint32_t status = LX_OK;
      if (codes_.is_percent(wanted)) {
        status = extract(next_request(format, codes_), text, afternoon);
      } else {
        if (wanted.units > static_cast<size_t>(text.end - text.at)) break;
        status = read_literal(wanted, text);
      }
      if (status != LX_OK) return status;
    }
    if (afternoon && time_.tm_hour < 12) time_.tm_hour += 12;
    return LX_OK;
  }

  template <class Walker>
  [[gnu::always_inline]] uint32_t extract(const Request& request, Walker& text, bool& afternoon) {
    const Directive& directive = *request.directive;
    bool number = directive.kind == DirectiveKind::number || directive.kind == DirectiveKind::year;
    return number ? extract_number(directive, text) : extract_other(request, text, afternoon);
  }

 private:
  template <class Walker>
  [[gnu::always_inline]] uint32_t extract_number(const Directive& directive, Walker& text) {
    uint32_t status = LX_OK;
    int32_t value = read_number(text, directive.width, directive.limit, zero_, status);
    if (status == LX_OK) time_.*directive.field = value - directive.offset;
    return status;
  }

  template <class Walker>
  [[gnu::noinline]] uint32_t extract_other(const Request& request, Walker& text, bool& afternoon) {
    const Directive& directive = *request.directive;
    switch (directive.kind) {
      case DirectiveKind::percent: {
        Character character;
        bool same = text.next(character) && codes_.is_percent(character);
        text.finish();
        return same ? LX_OK : LX_E_NOTFOUND;
      }
      case DirectiveKind::hour12: {
        uint32_t status = extract_number(directive, text);
        if (status == LX_OK && time_.tm_hour == 12) time_.tm_hour = 0;
        return status;
      }
      case DirectiveKind::name:
      case DirectiveKind::half_day: {
        int32_t found = read_word<Kind>(locale_, text, directive.item, directive.count, text_option_);
        if (found < 0) return LX_E_NOTFOUND;
        if (directive.kind == DirectiveKind::half_day) {
          afternoon = found == 1;
        } else {
          time_.*directive.field = found;
        }
        return LX_OK;
      }
      case DirectiveKind::format:
        return read_format(request.alternate ? directive.alternate_item : directive.item, text);
      case DirectiveKind::date_time: {
        uint32_t status = read_format(request.alternate ? directive.alternate_item : directive.item, text);
        if (status != LX_OK) return status;
        bool whole = skip_characters(text, 1) != 0;
        text.finish();
        if (!whole) text.at = text.end;  // a character that the end cuts off
        return read_format(LX_ITEM_TIME_FORMAT, text);
      }
      default:
        return LX_E_FORMAT;
    }
  }

  template <class Walker>
  uint32_t read_literal(const Character& wanted, Walker& text) {
    Character found;
    bool there = text.next(found);
    text.finish();
    // Shift bytes may be all that is left of the text.
    if (!there) return text.at == text.end ? LX_OK : LX_E_NOTFOUND;
    return found == wanted ? LX_OK : LX_E_NOTFOUND;
  }

  template <class Walker>
  uint32_t read_format(uint32_t item, Walker& text) {
    if (depth_ == kDeepestFormat) return LX_E_FORMAT;
    LocalText<Kind, kTimeTextRoom> format(locale_, item, text_option_);
    ++depth_;
    Walker directives = walker_over(text, Text<typename Kind::Unit>{format.begin(), format.length(), 0});
    uint32_t status = read(text, directives);
    --depth_;
    return status;
  }

  const LXLocale& locale_;
  LXTime& time_;
  unsigned zero_;
  DirectiveCodes codes_;
  uint32_t text_option_;
  unsigned depth_ = 0;
};

}  // namespace lx
