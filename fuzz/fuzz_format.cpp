// SPDX-License-Identifier: Apache-2.0
// A locale, a kind of text, what to do and options from the first bytes of the input. The rest is a text that holds a
// number, or a value, a time, a format and a text that holds a time. Texts and rooms end where their blocks of memory
// end; results must stay inside and agree with each other.
#include <algorithm>
#include <cmath>

#include "fuzz_support.hpp"
#include "support/text_calls.hpp"

namespace lx::fuzz {
namespace {

using test::Family;
using test::Form;
using test::State;
using test::StateAt;

constexpr Family<LXStringToLong, LXStringToLongEx, LXStringToLongW, LXStringToLongU> kStringToLong;
constexpr Family<LXStringToDouble, LXStringToDoubleEx, LXStringToDoubleW, LXStringToDoubleU> kStringToDouble;
constexpr Family<LXLongToString, LXLongToStringEx, LXLongToStringW, LXLongToStringU> kLongToString;
constexpr Family<LXDoubleToString, LXDoubleToStringEx, LXDoubleToStringW, LXDoubleToStringU> kDoubleToString;
constexpr Family<LXCurrencyToString, LXCurrencyToStringEx, LXCurrencyToStringW, LXCurrencyToStringU> kCurrencyToString;
constexpr Family<LXTimeToString, LXTimeToStringEx, LXTimeToStringW, LXTimeToStringU> kTimeToString;
constexpr Family<LXStringToTime, LXStringToTimeEx, LXStringToTimeW, LXStringToTimeU> kStringToTime;

constexpr size_t kLongestText = 200;
const std::vector<std::string> kLocales = {"English_UnitedStates.US-ASCII@BINARY",
                                           "German_Germany.UTF-8@BINARY",
                                           "Swedish_Sweden.Latin1@BINARY",
                                           "Japanese_Japan.MS932@BINARY",
                                           "English_UnitedStates.IBM037@BINARY",
                                           "Japanese_Japan.IBM930@BINARY",
                                           "German_German-Switzerland.IBM1364@BINARY"};

class Formats : public Target {
 public:
  Formats() {
    start(LEXARO_DATA, "", kLocales);
    for (LXLocale* locale : locales_) LXSetLocaleTextInfo(locale, LX_ITEM_POSITIVE_SIGN, "+1", -1, 0);
  }

  void run(InputBytes input) override {
    l_ = locales_[input.byte() % locales_.size()];
    const uint8_t kind = input.byte();
    state_ = kind >> 7;
    base_ = static_cast<int8_t>(input.byte()) % 40;
    const uint8_t flags = input.byte();
    // A count of characters that the text may not have would be the caller's mistake.
    flags_ = flags < 0x80 ? flags & 0x31u : uint32_t{flags} << 24 | (flags & 0x80);
    std::string_view text = input.rest().substr(0, kLongestText);
    const bool write = (kind & 0x10) != 0;
    if ((kind & 0x30) != 0) flags_ = flags & (write ? 0xC9u : 0x09u);
    const Form form = {static_cast<Form::Kind>(kind % 4), nullptr};
    test::with_calls(form, [&](auto calls) {
      if (write) return values(calls, text);
      if ((kind & 0x20) != 0) return times(calls, text);
      read(calls, text);
    });
  }

 private:
  // What is read of the part that was used is the same again, unless overflow stopped before the end.
  template <class U, class Read>
  void twice(const Text<U>& text, bool may_overflow, Read read) {
    const U* end = nullptr;
    uint32_t state = state_;
    const auto value = read(text.at(), text.length, &end, &state);
    const bool failed = LXGetError(l_) != LX_OK;
    demand(end >= text.at() && end <= text.at() + text.length && state <= 1, "end outside");
    demand(!std::isnan(value) && (!failed || (value == 0 && end == text.at())), "value");
    const auto units = static_cast<size_t>(end - text.at());
    Text<U> used(std::string_view(reinterpret_cast<const char*>(text.at()), units * sizeof(U)));
    const bool overflow = may_overflow && (value == INT32_MAX || value == INT32_MIN || value == -1);
    demand(overflow || read(used.at(), used.length, &end, &state) == value, "the used part has another value");
    demand(overflow || failed || end == used.at() + used.length, "the used part is not used");
  }

  template <class Calls, class U = typename Calls::Unit>
  void read(Calls call, std::string_view bytes) {
    const Text<U> text(bytes);
    auto with = [&](auto function, auto... options) {
      return [=, this](const U* at, int32_t length, const U** end, uint32_t* state) {
        return call(function, l_, at, State{state_}, length, end, StateAt{state}, options..., flags_);
      };
    };
    twice(text, true, with(kStringToLong, base_));
    twice(text, false, with(kStringToDouble));
  }

  // A value or a whole record from the beginning of the bytes; zeros behind their end.
  template <class Value>
  static Value take(std::string_view& bytes) {
    Value value{};
    const size_t count = std::min(sizeof value, bytes.size());
    std::memcpy(&value, bytes.data(), count);
    bytes.remove_prefix(count);
    return value;
  }

  // Writes into a block of just the room that the call is told.
  template <class U, class Write>
  void write_into(uint8_t room, Write write) {
    std::unique_ptr<U[]> out(new U[room]);
    const int32_t count = write(out.get(), int32_t{room});
    demand(count >= -1 && count <= room, "more than the room");
    demand(count >= 0 || LXGetError(l_) == LX_E_ARGUMENT, "failure without a reason");
  }

  template <class Calls, class U = typename Calls::Unit>
  void values(Calls call, std::string_view bytes) {
    const auto room = take<uint8_t>(bytes);
    const auto number = take<int32_t>(bytes);
    const auto value = take<double>(bytes);
    auto with = [&](auto function, auto written) {
      return [=, this](U* out, int32_t size) { return call(function, l_, written, out, State{state_}, size, flags_); };
    };
    write_into<U>(room, with(kLongToString, number));
    write_into<U>(room, with(kDoubleToString, value));
    write_into<U>(room, with(kCurrencyToString, value));
  }

  template <class Calls, class U = typename Calls::Unit>
  void times(Calls call, std::string_view bytes) {
    const auto room = take<uint8_t>(bytes);
    const auto format_bytes = take<uint8_t>(bytes);
    LXTime time{};
    for (int* field : {&time.tm_sec, &time.tm_min, &time.tm_hour, &time.tm_mday, &time.tm_mon, &time.tm_year,
                       &time.tm_wday, &time.tm_yday}) {
      *field = take<int8_t>(bytes);
    }
    const Text<U> format(bytes.substr(0, format_bytes));
    const Text<U> text(bytes.substr(std::min<size_t>(format_bytes, bytes.size())));
    write_into<U>(room, [&](U* out, int32_t size) {
      return call(kTimeToString, l_, &time, out, State{state_}, size, format.at(), State{0}, format.length, flags_);
    });
    const int32_t used = call(kStringToTime, l_, &time, text.at(), State{state_}, text.length, format.at(), State{0},
                              format.length, flags_);
    demand(used >= -1 && used <= text.length, "more than the text");
    demand(used >= 0 || LXGetError(l_) != LX_OK, "failure without a reason");
  }

  LXLocale* l_ = nullptr;
  uint32_t state_ = 0;
  int32_t base_ = 0;
  uint32_t flags_ = 0;
};

}  // namespace

std::unique_ptr<Target> make_target() { return std::make_unique<Formats>(); }

}  // namespace lx::fuzz
