// SPDX-License-Identifier: Apache-2.0
// A locale, a kind of text and options from the first bytes of the input; the rest is a text that holds a number. It
// ends where its block of memory ends; results must stay inside and agree with each other.
#include <lexaro/lexaro.h>

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
    if (kind % 4 == 0) return read<char, false>(text, LXStringToLong, LXStringToDouble);
    if (kind % 4 == 1) return read<char, true>(text, LXStringToLongEx, LXStringToDoubleEx);
    if (kind % 4 == 2) return read<LXWChar, false>(text, LXStringToLongW, LXStringToDoubleW);
    read<LXUChar, false>(text, LXStringToLongU, LXStringToDoubleU);
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
