// SPDX-License-Identifier: Apache-2.0
// One step of reading a number, for callers that read numbers of their own making.
#include "format/digits.hpp"

#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "digits", 0};

template <class Unit>
struct Marks {
  Separators separators;
  const Unit* positive;
  const Unit* negative;
  bool ascii;
};

uint32_t byte_or_none(const char* separator) { return separator != nullptr ? static_cast<uint8_t>(*separator) : 0u; }

template <class Unit>
Text<Unit> terminated(const Unit* text) {
  return text != nullptr ? Text<Unit>{text, measured_length(text)} : Text<Unit>{};
}

template <class Kind, class Unit = typename Kind::Unit>
int32_t digit_call(const char* function, LXLocale* locale, const Unit* string, uint32_t state, int32_t length,
                   const Unit** position, uint32_t* new_state, const Marks<Unit>& marks, uint32_t flags) {
  *position = string;
  if (new_state != nullptr) *new_state = state;
  return locale_call(trace_unit, function, locale, flags, LX_NUM_FULLWIDTH, kNoDigit, [&](LocaleCall& call) {
    const CodePage& page = page_of(call.locale);
    if (string == nullptr) return kNoDigit;
    Text<Unit> text = {string, length < 0 ? measured_length(string) : static_cast<size_t>(length), state};
    return Kind::with_walker(page, text, [&](auto walker) {
      DigitReader reader(page, walker, marks.ascii, marks.separators, flags != 0);
      reader.set_signs(terminated(marks.positive), terminated(marks.negative));
      int32_t code = reader.next();
      auto place = reader.place();
      *position = reinterpret_cast<const Unit*>(place.at);
      if (new_state != nullptr && reader.kShifted) *new_state = uint32_t{place.double_byte};
      return code;
    });
  });
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXStrGetDigit(LXLocale* locale, const char* string, int32_t length, const char** position,
                      const char* thousands, const char* decimal, const char* positive, const char* negative,
                      int32_t ascii, uint32_t flags) noexcept {
  Marks<char> marks = {{byte_or_none(thousands), byte_or_none(decimal)}, positive, negative, ascii != 0};
  return digit_call<PlainKind>(__func__, locale, string, 0, length, position, nullptr, marks, flags);
}

int32_t LXStrGetDigitEx(LXLocale* locale, const char* string, uint32_t state, int32_t length, const char** position,
                        uint32_t* new_state, const char* thousands, const char* decimal, const char* positive,
                        const char* negative, int32_t ascii, uint32_t flags) noexcept {
  Marks<char> marks = {{byte_or_none(thousands), byte_or_none(decimal)}, positive, negative, ascii != 0};
  return digit_call<ShiftedKind>(__func__, locale, string, state, length, position, new_state, marks, flags);
}

int32_t LXStrGetDigitW(LXLocale* locale, const LXWChar* string, int32_t length, const LXWChar** position,
                       LXWChar thousands, LXWChar decimal, const LXWChar* positive, const LXWChar* negative,
                       int32_t ascii, uint32_t flags) noexcept {
  Marks<LXWChar> marks = {{thousands, decimal}, positive, negative, ascii != 0};
  return digit_call<WideKind>(__func__, locale, string, 0, length, position, nullptr, marks, flags);
}

int32_t LXStrGetDigitU(LXLocale* locale, const LXUChar* string, int32_t length, const LXUChar** position,
                       LXUChar thousands, LXUChar decimal, const LXUChar* positive, const LXUChar* negative,
                       uint32_t flags) noexcept {
  Marks<LXUChar> marks = {{thousands, decimal}, positive, negative, true};
  return digit_call<Ucs2Kind>(__func__, locale, string, 0, length, position, nullptr, marks, flags);
}

}  // extern "C"
