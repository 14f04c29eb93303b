// SPDX-License-Identifier: Apache-2.0
// A locale, a kind of text, what to do and options from the first bytes of the input. The rest is a text that holds a
// number, or a value, a time, a format and a text that holds a time. Texts and rooms end where their blocks of memory
// end; results must stay inside and agree with each other.
#include <lexaro/lexaro.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <memory>
#include <vector>

#include "fuzz_support.hpp"

namespace lx::fuzz {
namespace {

constexpr size_t kLongestText = 200;
const char* const kLocales[] = {"English_UnitedStates.US-ASCII@BINARY",
                                "German_Germany.UTF-8@BINARY",
                                "Swedish_Sweden.Latin1@BINARY",
                                "Japanese_Japan.MS932@BINARY",
                                "English_UnitedStates.IBM037@BINARY",
                                "Japanese_Japan.IBM930@BINARY",
                                "German_German-Switzerland.IBM1364@BINARY"};

// A text in a block of its own size.
template <class U>
struct Text {
  std::unique_ptr<U[]> block;
  int32_t length;

  explicit Text(std::string_view bytes) : length(static_cast<int32_t>(bytes.size() / sizeof(U))) {
    block.reset(new U[static_cast<size_t>(length)]);
    if (length != 0) std::memcpy(block.get(), bytes.data(), static_cast<size_t>(length) * sizeof(U));
  }
  const U* at() const { return block.get(); }
  const U* end() const { return block.get() + length; }
};

class Library {
 public:
  Library() {
    LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS);
    for (const char* name : kLocales) {
      uint32_t rc = 99;
      locales_.push_back(LXGetLocale(name, 0, &rc));
      demand(rc == LX_OK, name);
      LXSetLocaleTextInfo(locales_.back(), LX_ITEM_POSITIVE_SIGN, "+1", -1, 0);
    }
  }
  ~Library() {
    for (LXLocale* locale : locales_) LXReleaseLocale(locale, 0);
    LXTerm();
  }
  Library(const Library&) = delete;
  Library& operator=(const Library&) = delete;

  void run(InputBytes input) {
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
    switch (kind % 4) {
      case 0:
        if (write) return values<char>(text, LXLongToString, LXDoubleToString, LXCurrencyToString);
        if ((kind & 0x20) != 0) return times<char, false>(text, LXTimeToString, LXStringToTime);
        return read<char, false>(text, LXStringToLong, LXStringToDouble);
      case 1:
        if (write) return states(text);
        if ((kind & 0x20) != 0) return times<char, true>(text, LXTimeToStringEx, LXStringToTimeEx);
        return read<char, true>(text, LXStringToLongEx, LXStringToDoubleEx);
      case 2:
        if (write) return values<LXWChar>(text, LXLongToStringW, LXDoubleToStringW, LXCurrencyToStringW);
        if ((kind & 0x20) != 0) return times<LXWChar, false>(text, LXTimeToStringW, LXStringToTimeW);
        return read<LXWChar, false>(text, LXStringToLongW, LXStringToDoubleW);
      default:
        if (write) return values<LXUChar>(text, LXLongToStringU, LXDoubleToStringU, LXCurrencyToStringU);
        if ((kind & 0x20) != 0) return times<LXUChar, false>(text, LXTimeToStringU, LXStringToTimeU);
        return read<LXUChar, false>(text, LXStringToLongU, LXStringToDoubleU);
    }
  }

 private:
  // What is read of the part that was used is the same again, unless overflow stopped before the end.
  template <class U, class Read>
  void twice(const Text<U>& text, bool may_overflow, Read read) {
    const U* end = nullptr;
    uint32_t state = state_;
    const auto value = read(text.at(), text.length, &end, &state);
    const bool failed = LXGetError(l_) != LX_OK;
    demand(end >= text.at() && end <= text.end() && state <= 1, "end outside");
    demand(!std::isnan(value) && (!failed || (value == 0 && end == text.at())), "value");
    const auto units = static_cast<size_t>(end - text.at());
    Text<U> used({reinterpret_cast<const char*>(text.at()), units * sizeof(U)});
    const bool overflow = may_overflow && (value == INT32_MAX || value == INT32_MIN || value == -1);
    demand(overflow || read(used.at(), used.length, &end, &state) == value, "the used part has another value");
    demand(overflow || failed || end == used.end(), "the used part is not used");
  }

  // The Ex functions go on from a state.
  template <class U, bool kStates, class Integer, class Decimal>
  void read(std::string_view bytes, Integer integer, Decimal decimal) {
    const Text<U> text(bytes);
    auto call = [&](auto function, const U* at, int32_t length, const U** end, uint32_t* state, auto... rest) {
      if constexpr (kStates)
        return double(function(l_, at, state_, length, end, state, rest...));
      else
        return double(function(l_, at, length, end, rest...));
    };
    twice(text, true, [&](auto... about) { return call(integer, about..., base_, flags_); });
    twice(text, false, [&](auto... about) { return call(decimal, about..., flags_); });
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

  template <class U, class Integer, class Decimal, class Currency>
  void values(std::string_view bytes, Integer integer, Decimal decimal, Currency currency) {
    const auto room = take<uint8_t>(bytes);
    const auto number = take<int32_t>(bytes);
    const auto value = take<double>(bytes);
    write_into<U>(room, [&](U* out, int32_t size) { return integer(l_, number, out, size, flags_); });
    write_into<U>(room, [&](U* out, int32_t size) { return decimal(l_, value, out, size, flags_); });
    write_into<U>(room, [&](U* out, int32_t size) { return currency(l_, value, out, size, flags_); });
  }
  void states(std::string_view bytes) {
    auto with_state = [this](auto function) {
      return [this, function](LXLocale* l, auto value, char* out, int32_t size, uint32_t flags) {
        return function(l, value, out, state_, size, flags);
      };
    };
    values<char>(bytes, with_state(LXLongToStringEx), with_state(LXDoubleToStringEx), with_state(LXCurrencyToStringEx));
  }

  template <class U, bool kStates, class ToString, class ToTime>
  void times(std::string_view bytes, ToString to_string, ToTime to_time) {
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
      if constexpr (kStates) return to_string(l_, &time, out, state_, size, format.at(), 0, format.length, flags_);
      if constexpr (!kStates) return to_string(l_, &time, out, size, format.at(), format.length, flags_);
    });
    int32_t used = 0;
    if constexpr (kStates)
      used = to_time(l_, &time, text.at(), state_, text.length, format.at(), 0, format.length, flags_);
    if constexpr (!kStates) used = to_time(l_, &time, text.at(), text.length, format.at(), format.length, flags_);
    demand(used >= -1 && used <= text.length, "more than the text");
    demand(used >= 0 || LXGetError(l_) != LX_OK, "failure without a reason");
  }

  std::vector<LXLocale*> locales_;
  LXLocale* l_ = nullptr;
  uint32_t state_ = 0;
  int32_t base_ = 0;
  uint32_t flags_ = 0;
};

}  // namespace
}  // namespace lx::fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static lx::fuzz::Library library;
  library.run({data, size});
  return 0;
}
