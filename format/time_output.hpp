// SPDX-License-Identifier: Apache-2.0
// Times written: the room that they go to, and the writer that follows a format.
#pragma once

#include "codepage/text/copy.hpp"
#include "format/directives.hpp"
#include "format/local_text.hpp"

namespace lx {

// use(writer), for text without shift states.
template <class Kind, class Use>
auto with_plain_writer(const CodePage& page, typename Kind::Unit* out, size_t room, Use use) {
  if constexpr (Kind::kBytes) {
    return with_writer(page, {}, bytes_of(out), room, use);
  } else if constexpr (std::same_as<Kind, WideKind>) {
    return use(WideWriter(page, out, room));
  } else {
    return use(Ucs2Writer(out, room));
  }
}

// The caller's room and how far it is filled: never past its end, never with part of a character, and with room kept
// for the leave byte that an open double-byte run needs.
template <class Kind>
class TimeOutput {
 public:
  using Unit = typename Kind::Unit;

  // The page is needed for shift bytes and names only.
  TimeOutput(const CodePage* page, Unit* begin, size_t at, size_t room, uint32_t state = 0)
      : page_(page), begin_(begin), at_(at), room_(room), double_byte_(shifts() && state != 0) {}

  size_t at() const { return at_; }
  size_t left() const { return at_ < room_ ? room_ - at_ : 0; }
  // An open double-byte run needs the last byte for its end.
  bool full() const { return left() <= state(); }
  uint32_t state() const { return double_byte_ ? 1 : 0; }

  bool put(const Unit* character, size_t units) {
    size_t needed = units;
    bool turns = false;
    if (shifts()) {
      bool wide = units > 1;
      turns = wide != double_byte_;
      needed += (turns ? 1u : 0u) + (wide ? 1u : 0u);
    }
    if (needed > left()) return false;
    if (turns) turn();
    begin_[at_++] = *character;
    for (size_t i = 1; i < units; ++i) begin_[at_++] = character[i];
    return true;
  }
  bool put(unsigned character) {
    auto unit = static_cast<Unit>(character);
    return put(&unit, 1);
  }
  // Room for single-byte characters that the caller then stores; null: there is none, or it takes a shift byte.
  Unit* claim(size_t units) {
    if (units > left() || double_byte_) return nullptr;
    Unit* claimed = begin_ + at_;
    at_ += units;
    return claimed;
  }
  // A text that begins and ends in the single-byte state, or as many of its characters as there is room for. A
  // double-byte run at its end stays open: what comes next may go on with it, as leaving and entering again would leave
  // an empty run behind, which not every reader takes.
  bool put_text(const Unit* text, size_t length) {
    if (shifts()) return put_shifted(text, length);
    if (length <= left()) {
      std::memcpy(begin_ + at_, text, length * sizeof(Unit));
      at_ += length;
      return true;
    }
    int32_t room = static_cast<int32_t>(left());
    at_ +=
        static_cast<size_t>(copy_text<Kind>(*page_, begin_ + at_, room, text, 0, static_cast<int32_t>(length), false));
    return false;
  }
  // The same for a name of the language, without a copy of it.
  bool put_name(const LXUChar* name) {
    constexpr size_t kLongest = kTimeTextRoom - 1;
    size_t room = std::min(left(), kLongest);
    at_ += with_plain_writer<Kind>(*page_, begin_ + at_, room, [&](auto writer) {
      for (; *name != 0; ++name) {
        uint32_t code = writer.code(*name);
        if (!writer.fits(code)) break;
        writer.put(code);
      }
      return static_cast<size_t>(writer.at - writer.begin);
    });
    return *name == 0 || room == kLongest;
  }
  // Returns to the single-byte state, for which there is room behind every double-byte character.
  void close() {
    if (double_byte_ && left() != 0) turn();
  }

  // What formats of the locale are written to: the room that is left, laid over the start of the output or behind what
  // is there.
  TimeOutput laid_over() const { return {page_, begin_, 0, left(), at_ == 0 ? state() : 0}; }
  TimeOutput behind() const { return {page_, begin_ + at_, 0, left(), state()}; }
  // A double-byte run stays open where the output goes on behind it.
  void advance(TimeOutput& part) {
    if (at_ == 0 || part.begin_ != begin_) {
      double_byte_ = part.double_byte_;
    } else {
      part.close();
    }
    at_ += part.at_;
  }

  bool shifts() const {
    if constexpr (Kind::kShifted) {
      return page_->shift_sensitive;
    } else {
      return false;
    }
  }

 private:
  void turn() {
    double_byte_ = !double_byte_;
    begin_[at_++] = static_cast<Unit>(double_byte_ ? page_->enter_byte : page_->leave_byte);
  }
  bool put_shifted(const Unit* text, size_t length) {
    if constexpr (Kind::kShifted) {
      ShiftedWalker walker(*page_, bytes_of(text), length, 0);
      for (Character character; walker.next(character);) {
        if (!put(text + (walker.at - bytes_of(text)) - character.units, character.units)) return false;
      }
    }
    return true;
  }

  const CodePage* page_;
  Unit* begin_;
  size_t at_;
  size_t room_;
  bool double_byte_;
};

inline constexpr int32_t kMostDigits = 10;

inline int32_t significant_digits(uint32_t value) {
  int32_t count = 0;
  for (; value != 0; value /= 10) ++count;
  return count;
}

template <class Kind>
[[gnu::noinline]] uint32_t write_any_number(TimeOutput<Kind>& out, uint32_t value, int32_t width, unsigned zero,
                                            bool alternate) {
  if (alternate) width = value == 0 ? 1 : std::min(width, significant_digits(value));
  uint8_t digits[kMostDigits];
  for (uint8_t& digit : digits) {
    digit = static_cast<uint8_t>(value % 10);
    value /= 10;
  }
  for (int32_t i = std::max(width, 0); i-- > 0;) {
    if (!out.put(zero + (i < kMostDigits ? digits[i] : 0u))) return LX_E_BUFFER;
  }
  return out.full() ? LX_E_BUFFER : LX_OK;
}

// The low digits of a value, or as many as it has. LX_E_BUFFER also when the output is full then.
template <class Kind>
[[gnu::always_inline]] inline uint32_t write_number(TimeOutput<Kind>& out, uint32_t value, int32_t width, unsigned zero,
                                                    bool alternate) {
  if (!alternate && (width == 2 || width == 4)) {  // nearly always
    if (auto* at = out.claim(static_cast<size_t>(width))) {
      auto digit = [zero](uint32_t of) { return static_cast<typename Kind::Unit>(zero + of % 10); };
      if (width == 4) {
        *at++ = digit(value / 1000);
        *at++ = digit(value / 100);
      }
      at[0] = digit(value / 10);
      at[1] = digit(value);
      return out.full() ? LX_E_BUFFER : LX_OK;
    }
  }
  return write_any_number(out, value, width, zero, alternate);
}

template <class Kind>
uint32_t write_word(TimeOutput<Kind>& out, const LXLocale& locale, uint32_t item, uint32_t text_option) {
  // Plain text of mixed pages has bytes for characters: a name is cut at any of them, as LXStrcpy does.
  const bool by_characters = !Kind::kBytes || !page_of(locale).shift_sensitive;
  const LXUChar* name = by_characters ? language_name(locale, item) : nullptr;
  if (name != nullptr) return out.put_name(name) ? LX_OK : LX_E_BUFFER;
  LocalText<Kind, kTimeTextRoom> word(locale, item, text_option);
  return out.put_text(word.begin(), word.length()) ? LX_OK : LX_E_BUFFER;
}

template <class Kind>
class TimeWriter {
 public:
  using Output = TimeOutput<Kind>;

  // Formats of the locale take their texts by `nested_option`.
  TimeWriter(const LXLocale& locale, const LXTime& time, bool ascii, uint32_t text_option, uint32_t nested_option)
      : locale_(locale),
        page_(page_of(locale)),
        time_(time),
        spelling_(ascii ? kAsciiSpelling : kEbcdicSpelling),
        codes_(DirectiveCodes::of<Kind>(page_, ascii)),
        text_option_(text_option),
        nested_option_(nested_option) {}

  const DirectiveCodes& codes() const { return codes_; }

  template <class Walker>
  uint32_t write(Walker& format, Output& out) {
    for (Character character; format.at != format.end; format.finish()) {
      if (out.full()) return LX_E_BUFFER;
      if (!format.next(character)) return format.at == format.end ? LX_OK : LX_E_FORMAT;
      if (!codes_.is_percent(character)) {
        auto* at = reinterpret_cast<const typename Kind::Unit*>(format.at) - character.units;
        if (!out.put(at, character.units)) return LX_E_BUFFER;
        continue;
      }
      uint32_t status = expand(next_request(format, codes_), out);
      if (status != LX_OK) return status;
    }
    return LX_OK;
  }

  [[gnu::always_inline]] uint32_t expand(const Request& request, Output& out) {
    const Directive& directive = *request.directive;
    if (directive.kind != DirectiveKind::number) return expand_other(request, out);
    int field = time_.*directive.field;
    if (field < 0 || field > directive.highest) return LX_E_NOTFOUND;
    return write_field(request, field + directive.offset, out);
  }

 private:
  static constexpr int kLastDay = 365;

  [[gnu::noinline]] uint32_t expand_other(const Request& request, Output& out) {
    const Directive& directive = *request.directive;
    int64_t field = directive.field != nullptr ? time_.*directive.field : 0;
    if (directive.kind != DirectiveKind::year && (field < 0 || field > directive.highest)) return LX_E_NOTFOUND;
    switch (directive.kind) {
      case DirectiveKind::percent:
        return out.put(spelling_.ascii ? 0x25 : 0x6C) ? LX_OK : LX_E_BUFFER;
      case DirectiveKind::year: {
        int64_t year = std::abs(field + 1900);
        return write_field(request, directive.width == 2 ? year % 100 : year, out);
      }
      case DirectiveKind::hour12:
        return write_field(request, (field + 11) % 12 + 1, out);
      case DirectiveKind::week:
        if (time_.tm_yday < 0 || time_.tm_yday > kLastDay) return LX_E_NOTFOUND;
        return write_field(request, week_of_year((field + 7 - directive.first_weekday) % 7), out);
      case DirectiveKind::name:
        return write_word(out, locale_, directive.item + static_cast<uint32_t>(field), text_option());
      case DirectiveKind::half_day:
        return write_word(out, locale_, directive.item + (field < 12 ? 0 : 1), text_option());
      case DirectiveKind::format:
        return write_laid_over(request, out);
      case DirectiveKind::date_time: {
        uint32_t status = write_laid_over(request, out);
        if (status != LX_OK || !out.put(spelling_.space)) return status;
        return write_format(LX_ITEM_TIME_FORMAT, out, out.behind());
      }
      default:
        return LX_E_FORMAT;
    }
  }

  uint32_t text_option() const { return depth_ == 0 ? text_option_ : nested_option_; }

  // Weeks begin with the day that `weekday` counts from.
  int64_t week_of_year(int64_t weekday) const { return (time_.tm_yday + 7 - weekday) / 7; }

  uint32_t write_field(const Request& request, int64_t value, Output& out) {
    return write_number(out, static_cast<uint32_t>(value), request.directive->width, spelling_.zero, request.alternate);
  }

  // A date or time of the locale begins at the start of the output, whatever is there already.
  uint32_t write_laid_over(const Request& request, Output& out) {
    const Directive& directive = *request.directive;
    if (out.at() != 0) out.close();  // nothing goes on with what is there
    return write_format(request.alternate ? directive.alternate_item : directive.item, out, out.laid_over());
  }

  // What goes wrong in it counts no more than what it leaves out, unless it would never end.
  uint32_t write_format(uint32_t item, Output& out, Output part) {
    endless_ = endless_ || depth_ == kDeepestFormat;
    if (endless_) return LX_E_FORMAT;
    LocalText<Kind, kTimeTextRoom> format(locale_, item, text_option());
    ++depth_;
    Kind::with_walker(page_, {format.begin(), format.length(), 0}, [&](auto walker) { write(walker, part); });
    --depth_;
    out.advance(part);
    return endless_ ? LX_E_FORMAT : LX_OK;
  }

  const LXLocale& locale_;
  const CodePage& page_;
  const LXTime& time_;
  const Spelling& spelling_;
  DirectiveCodes codes_;
  uint32_t text_option_;
  uint32_t nested_option_;
  unsigned depth_ = 0;
  bool endless_ = false;
};

}  // namespace lx
