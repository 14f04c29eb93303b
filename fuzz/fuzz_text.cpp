// SPDX-License-Identifier: Apache-2.0
// A code page, a kind of text, a function on characters or strings, its options and lengths from the first bytes of the
// input; the rest are its texts. Each text ends where its block of memory ends; results must stay inside.
#include <algorithm>

#include "fuzz_support.hpp"
#include "support/text_calls.hpp"

namespace lx::fuzz {
namespace {

using test::Form;
using test::State;
using test::StateAt;

const std::vector<std::string> kPages = {"US-ASCII", "Latin1", "UTF-8",  "MS932",   "MS936",   "JapanEUC",
                                         "EUC-TW",   "IBM037", "IBM930", "IBM1364", "IBM1388", "EUC-KR"};
constexpr size_t kLongestText = 400;
const uint32_t kOptions[] = {0,
                             LX_OPT_CHARS,
                             LX_OPT_TERMINATE,
                             LX_STR_LAST,
                             LX_CMP_NOCASE,
                             LX_CMP_NOWIDTH,
                             LX_CMP_TRIM,
                             LX_CMP_NOCASE | LX_CMP_TRIM | LX_OPT_CHARS,
                             LX_CMP_NOWIDTH | LX_CMP_TRIM,
                             LX_CMP_NOWIDTH | LX_OPT_CHARS,
                             LX_MAP_H2F,
                             LX_MAP_F2H,
                             LX_MAP_COPY,
                             LX_MAP_LOWER,
                             LX_MAP_UPPER,
                             LX_MAP_UPPER | LX_MAP_PLAIN | LX_OPT_CHARS,
                             LX_MAP_H2F | LX_OPT_CHARS,
                             LX_MAP_DIGITS,
                             LX_EOL_21,
                             0xF00 | LX_OPT_CHARS,
                             0x1F00,
                             LX_TRUNC_STRIP | LX_CMP_NOWIDTH,
                             LX_TRUNC_STRIP | LX_OPT_CHARS,
                             1,
                             0xFFFFFFFF};

class Texts : public Target {
 public:
  Texts() {
    start(LEXARO_DATA, "German_Germany.", kPages, "@BINARY");  // German has special pairs of upper and lower case
  }

  void run(InputBytes input) override {
    l_ = locales_[input.byte() % locales_.size()];
    uint8_t kind = input.byte() % 5;
    function_ = input.byte() % 12;
    uint8_t option = input.byte();
    options_ = option < 0x80 ? kOptions[option % std::size(kOptions)] : 1u << option % 32;
    size_ = input.byte();
    uint8_t first = input.byte();
    uint8_t second = input.byte();
    std::string_view all = input.rest().substr(0, kLongestText);
    std::string_view text = all.substr(0, all.size() - std::min<size_t>(all.size(), second % 64u));
    std::string_view other = all.substr(text.size());
    if (kind == 4) return characters(text, first);
    const Form form = {static_cast<Form::Kind>(kind), nullptr};
    test::with_calls(form, [&](auto calls) { strings<decltype(calls)>(text, other, first, second); });
  }

 private:
  bool copies() const { return function_ < 2 || function_ > 9; }

  // The length of a text as a call is told it: measured, all, a part, or a count of characters. Copies of counted
  // characters that end inside a double-byte run read the byte behind, which may close the run.
  template <class Calls, class U = typename Calls::Unit>
  Text<U> given(std::string_view bytes, uint8_t choice) {
    const bool measured = choice % 4 == 0;
    const bool ex = std::is_same_v<Calls, test::Calls<Form::shifted>>;
    Text<U> text(bytes, measured || (ex && copies() && (options_ & LX_OPT_CHARS) != 0));
    text.shift_state = choice >> 7;
    auto units = static_cast<int32_t>(text.units);
    if ((options_ & LX_OPT_CHARS) != 0 && sizeof(U) == 1) {
      auto at = reinterpret_cast<const char*>(text.at());
      units = ex ? LXNumCharsEx(l_, at, text.shift_state, units) : LXNumChars(l_, at, units);
    }
    text.length = measured ? -1 : choice % 4 == 1 ? units : units * (choice >> 2 & 15) / 16;
    return text;
  }

  template <class Calls, class U = typename Calls::Unit>
  void strings(std::string_view text_bytes, std::string_view other_bytes, uint8_t first, uint8_t second) {
    Text<U> text = given<Calls>(text_bytes, first);
    Text<U> other = given<Calls>(other_bytes, second);
    U* s = text.at();
    const size_t allocated = text.units + (text.length < 0);
    auto limit = static_cast<int64_t>(allocated);
    auto size = static_cast<int32_t>(size_);
    const State state = {text.shift_state};
    auto inside = [&](const U* at) { demand(at == nullptr || (at >= s && at <= s + limit), "position outside"); };
    auto with_other = [&](auto function, auto... more) {
      return Calls()(function, l_, s, state, text.length, other.at(), State{other.shift_state}, other.length, more...,
                     options_);
    };
    switch (function_) {
      case 0: {
        // Any number of shift bytes may stand between characters.
        size_t room = (options_ & LX_OPT_CHARS) != 0 ? allocated : size_;
        std::unique_ptr<U[]> out(new U[room]);
        demand(Calls()(test::kStrcpy, l_, out.get(), size, s, state, text.length, options_) <= size, "result of cpy");
        return;
      }
      case 1: {
        Text<U> target(other_bytes, true);
        std::vector<U> joined(target.units + text.units + 1);
        std::copy_n(target.at(), target.units + 1, joined.begin());
        int32_t result = Calls()(test::kStrcat, l_, joined.data(), s, state, text.length, options_);
        demand(result <= static_cast<int64_t>(joined.size()), "result of cat");
        return;
      }
      case 2: {
        Text<U> wanted(other_bytes, true);
        U* at = wanted.at();
        auto character = [at] {
          if constexpr (sizeof(U) == 1) return static_cast<const char*>(at);
          if constexpr (sizeof(U) != 1) return *at;
        };
        inside(Calls()(test::kStrchr, l_, s, state, text.length, character(), State{other.shift_state},
                       StateAt{nullptr}, options_));
        return;
      }
      case 3:
        return inside(with_other(test::kStrstr, StateAt{nullptr}));
      case 4:
        return demand(with_other(test::kStrspn) <= limit, "result of spn");
      case 5:
        return demand(with_other(test::kStrcspn) <= limit, "result of cspn");
      case 6:
        return tokens<Calls>(text, other);
      case 7: {
        uint32_t type = 0;
        int32_t length = -1;
        inside(Calls()(test::kGetEol, l_, s, state, text.length, &type, &length, options_));
        demand(length >= 0 && length <= 2, "length of a line end");
        return;
      }
      case 8: {
        U line[8];
        U* end = Calls()(test::kPutEol, l_, line, state, options_);
        demand(end == nullptr || end - line <= 6, "line end");
        return;
      }
      case 9:
        with_other(test::kStrcmp);
        demand(Calls()(test::kStrcmp, l_, s, state, text.length, s, state, text.length, options_ & ~LX_CMP_TRIM) == 0,
               "a text differs from itself");
        return;
      default: {
        size_t room = (options_ & LX_OPT_CHARS) != 0 ? std::max(size_ * 6, allocated) : size_;
        std::unique_ptr<U[]> out(new U[room]);
        demand(Calls()(test::kMapString, l_, out.get(), size, s, state, text.length, options_) <= size,
               "result of map");
      }
    }
  }

  template <class Calls, class U = typename Calls::Unit>
  void tokens(Text<U>& text, const Text<U>& delimiters) {
    int32_t length = text.length;
    U* at = text.at();
    const U* end = at + text.units + (text.length < 0);
    for (size_t rounds = 0; at != nullptr; ++rounds) {
      demand(rounds <= text.units, "no end of the tokens");
      U* next = at;
      U* token = Calls()(test::kStrtok, l_, at, StateAt{&text.shift_state}, &length, delimiters.at(),
                         State{delimiters.shift_state}, delimiters.length, &next, options_);
      if (LXGetError(l_) != LX_OK) return;
      demand(token == nullptr || (token >= at && token <= end), "token outside");
      demand(next == nullptr || (token != nullptr && next > token && next < end), "rest outside");
      demand(length >= 0 && length <= end - at, "length of the rest");
      at = next;
    }
  }

  // Steps over a terminated text.
  void characters(std::string_view bytes, uint8_t choice) {
    Text<char> text(bytes.substr(0, 64), true);
    char* s = text.at();
    size_t size = std::strlen(s);
    char* end = s + size;
    uint32_t state = choice & 1;
    auto inside = [&](const char* at) { demand(at >= s && at <= end, "step outside"); };
    size_t steps = 0;
    uint32_t walked = state;
    for (const char* at = s; at < end; ++steps) {
      uint32_t before = walked;
      const char* next = LXNextCharEx(l_, at, before, &walked);
      demand(next > at, "no step forward");
      LXGetCharTypeEx(l_, at, before, LX_CTYPE_1);
      demand(LXValidCharEx(l_, at, before) <= end - at, "valid bytes");
      at = next;
    }
    demand(steps <= size, "no end of the steps");
    for (size_t n = 0; n <= size; ++n) {
      auto length = static_cast<int32_t>(n);
      LXGetCharType(l_, s + n, LX_CTYPE_2);
      demand(LXValidChar(l_, s + n) <= end - s - length, "valid bytes");
      demand(LXNumChars(l_, s, length) <= length && LXNumCharsEx(l_, s, state, length) <= length, "count");
      demand(AdjustLength(l_, s, state, length) <= length, "AdjustLength");
      inside(LXMoveStringPointer(l_, s, length, 0));
      inside(LXMoveStringPointerEx(l_, s, state, length, 0));
      const char* before = LXPrevChar(l_, s, s + n);
      inside(before);
      demand(n == 0 || before < s + n, "no step back");
      inside(LXPrevCharEx(l_, s, s + n, state, nullptr));
    }
    inside(LXMoveStringPointer(l_, s, LXNumChars(l_, s, -1), LX_OPT_CHARS));
    inside(LXMoveStringPointerEx(l_, s, state, LXNumCharsEx(l_, s, state, -1), LX_OPT_CHARS));
    auto room = static_cast<int32_t>(size_ % 80);
    int32_t cut =
        function_ % 2 == 0 ? LXTruncateString(l_, s, room, options_) : LXTruncateStringEx(l_, s, state, room, options_);
    demand(cut <= std::max(room, 1), "result of a cut");
    demand(std::strlen(s) <= size, "cut text is longer");
    LXUChar unit = static_cast<LXUChar>(size_ << 8 | choice);
    demand(LXUnicodeToLower(l_, LXUnicodeToLower(l_, unit)) == LXUnicodeToLower(l_, unit), "lower case of lower case");
    LXUnicodeToUpper(l_, LXUnicodeToF2H(l_, LXUnicodeToH2F(l_, unit)));
    LXGetCharTypeU(l_, unit, LX_CTYPE_3);
    LXGetCharTypeW(l_, static_cast<LXWChar>(unit) << (choice % 3 * 8), LX_CTYPE_1);
  }

  LXLocale* l_ = nullptr;
  unsigned function_ = 0;
  uint32_t options_ = 0;
  size_t size_ = 0;
};

}  // namespace

std::unique_ptr<Target> make_target() { return std::make_unique<Texts>(); }

}  // namespace lx::fuzz
