// SPDX-License-Identifier: Apache-2.0
// Integers read.
#include "format/number_text.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "parse_integer", 0};

constexpr int32_t kPrefixLetter = 33;  // the x of 0x
constexpr int32_t kHighestBase = 36;

bool is_base(int32_t base) { return base >= 0 && base != 1 && base <= kHighestBase; }
bool belongs(int32_t code, uint32_t base) { return code >= 0 && static_cast<uint32_t>(code) < base; }

// The digits up to the first character that is none, which the reader is left at. A digit that makes the value too
// large is the last one; it is left to be read again unless it ends the text.
template <class Reader>
class IntegerReader {
 public:
  IntegerReader(Reader& text, int32_t base, bool has_sign)
      : text_(text), before_(text.place()), base_(static_cast<uint32_t>(base)), has_sign_(has_sign) {}

  int32_t read() {
    bool negative = read_sign();
    bool prefixed = read_prefix();
    if (!prefixed && !belongs(code_, base_)) {
      text_.return_to(before_);
      return 0;
    }
    if (!prefixed) value_ = static_cast<uint32_t>(code_);
    return result(read_digits(), negative);
  }

 private:
  static constexpr uint64_t kLargestSigned = INT32_MAX;
  static constexpr uint64_t kLargestUnsigned = UINT32_MAX;

  void take() {
    before_ = text_.place();
    code_ = text_.next();
  }

  // And what is behind it.
  bool read_sign() {
    take();
    if (code_ == LX_DIG_SPACE) take();
    bool negative = code_ == LX_DIG_MINUS && has_sign_;
    if (negative || code_ == LX_DIG_PLUS) take();
    return negative;
  }

  // Settles the base; whether an x was read.
  bool read_prefix() {
    bool open = base_ == 0;
    if (open) base_ = 10;
    if (code_ != 0 || (!open && base_ != 16)) return false;
    take();
    bool prefixed = code_ == kPrefixLetter;
    if (open) base_ = prefixed ? 16 : 8;
    return prefixed;
  }

  // Whether the value stays in its range.
  bool read_digits() {
    const uint64_t largest = has_sign_ ? kLargestSigned : kLargestUnsigned;
    while (!text_.done()) {
      take();
      if (code_ == LX_DIG_THOUSANDS) continue;
      if (!belongs(code_, base_)) {
        text_.return_to(before_);
        break;
      }
      value_ = value_ * base_ + static_cast<uint32_t>(code_);
      if (value_ > largest) {
        if (!text_.done()) text_.return_to(before_);
        return false;
      }
    }
    return true;
  }

  int32_t result(bool in_range, bool negative) const {
    if (!in_range && !has_sign_) return static_cast<int32_t>(UINT32_MAX);
    if (!in_range) return negative ? INT32_MIN : INT32_MAX;
    return static_cast<int32_t>(negative ? -value_ : value_);
  }

  Reader& text_;
  typename Reader::Place before_;  // the code that was read last
  int32_t code_ = kNoDigit;
  uint32_t base_;
  bool has_sign_;
  uint64_t value_ = 0;
};

template <class Kind>
int32_t integer_call(const char* function, LXLocale* locale, const NumberText<typename Kind::Unit>& text, int32_t base,
                     uint32_t flags) {
  constexpr uint32_t kFlags = LX_NUM_TEXTOPT | LX_NUM_FULLWIDTH | LX_NUM_MONETARY | LX_NUM_UNSIGNED | LX_NUM_CHARLEN;
  text.stopped(text.at, text.state);
  // The base is looked at before the flags.
  return locale_call(trace_unit, function, locale, 0, 0, int32_t{0}, [&](LocaleCall& call) -> int32_t {
    if (!is_base(base)) return call.fail(LX_E_BASE, 0);
    if ((flags & ~kFlags) != 0) return call.fail(LX_E_ARGUMENT, 0);
    if (text.at == nullptr) return 0;
    return read_number<Kind>(call.locale, text, false, flags, [&](auto& reader, const Spelling&) {
      return IntegerReader(reader, base, (flags & LX_NUM_UNSIGNED) == 0).read();
    });
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStringToLong(LXLocale* locale, const char* string, int32_t length, const char** end, int32_t base,
                       uint32_t flags) noexcept {
  return integer_call<PlainKind>(__func__, locale, {string, 0, length, end}, base, flags);
}

int32_t LXStringToLongW(LXLocale* locale, const LXWChar* string, int32_t length, const LXWChar** end, int32_t base,
                        uint32_t flags) noexcept {
  return integer_call<WideKind>(__func__, locale, {string, 0, length, end}, base, flags);
}

int32_t LXStringToLongU(LXLocale* locale, const LXUChar* string, int32_t length, const LXUChar** end, int32_t base,
                        uint32_t flags) noexcept {
  return integer_call<Ucs2Kind>(__func__, locale, {string, 0, length, end}, base, flags);
}

int32_t LXStringToLongEx(LXLocale* locale, const char* string, uint32_t state, int32_t length, const char** end,
                         uint32_t* end_state, int32_t base, uint32_t flags) noexcept {
  return integer_call<ShiftedKind>(__func__, locale, {string, state, length, end, end_state}, base, flags);
}

}  // extern "C"
