// SPDX-License-Identifier: Apache-2.0
// A locale with a sort object, a kind of text and options from the first bytes of the input; the rest are
// two texts. Each text ends where its block of memory ends; results must stay inside and agree with each other.
#include <lexaro/lexaro.h>

#include <algorithm>
#include <cstring>
#include <memory>
#include <vector>

#include "fuzz_support.hpp"

namespace lx::fuzz {
namespace {

constexpr size_t kLongestText = 300;
const char* const kLocales[] = {"German_Germany.Latin1@Default",
                                "German_Germany.UTF-8@Hungarian",
                                "German_Germany.MS932@Default",
                                "German_Germany.IBM930@Default",
                                "English_UnitedStates.UTF-8@CanadianFrench",
                                "German_Germany.JapanEUC@Czech",
                                "German_Germany.IBM037@IBM037"};
const uint32_t kOptions[] = {0,
                             LX_CMP_NOCASE,
                             LX_CMP_NOWIDTH,
                             LX_COLL_TRIM,
                             LX_CMP_TRIM,
                             LX_OPT_CHARS,
                             LX_CMP_TRIM | LX_CMP_NOCASE,
                             LX_CMP_TRIM | LX_CMP_NOWIDTH,
                             LX_CMP_NOCASE | LX_OPT_CHARS,
                             LX_COLL_TRIM | LX_OPT_CHARS,
                             2};

template <class U>
struct Text {
  std::unique_ptr<U[]> block;
  int32_t length;

  explicit Text(std::string_view bytes) : length(static_cast<int32_t>(bytes.size() / sizeof(U))) {
    block.reset(new U[static_cast<size_t>(length)]);
    if (length != 0) std::memcpy(block.get(), bytes.data(), static_cast<size_t>(length) * sizeof(U));
  }
  U* at() const { return block.get(); }
};

// The four forms of the calls, with the states of those that have them.
struct Plain {
  using Unit = char;
  static int32_t compare(LXLocale* l, const char* a, int32_t m, const char* b, int32_t n, uint32_t, uint32_t options) {
    return LXStrcoll(l, a, m, b, n, options);
  }
  static int32_t transform(LXLocale* l, void* key, int32_t size, const char* s, int32_t n, uint32_t, uint32_t options) {
    return LXStrxfrm(l, key, size, s, n, options);
  }
  static int32_t weight(LXLocale* l, const char** s, int32_t* n, uint32_t*, uint16_t* words, uint8_t* bytes) {
    return LXStrGetNextWeight(l, s, n, words, words + 1, bytes, bytes + 1, words + 2, words + 3, bytes + 2, bytes + 3,
                              words + 4, bytes + 4, words + 5);
  }
};
struct Shifted {
  using Unit = char;
  static int32_t compare(LXLocale* l, const char* a, int32_t m, const char* b, int32_t n, uint32_t state,
                         uint32_t options) {
    return LXStrcollEx(l, a, m, state, b, n, state, options);
  }
  static int32_t transform(LXLocale* l, void* key, int32_t size, const char* s, int32_t n, uint32_t state,
                           uint32_t options) {
    return LXStrxfrmEx(l, key, size, s, n, state, options);
  }
  static int32_t weight(LXLocale* l, const char** s, int32_t* n, uint32_t* state, uint16_t* words, uint8_t* bytes) {
    return LXStrGetNextWeightEx(l, s, n, state, words, words + 1, bytes, bytes + 1, words + 2, words + 3, bytes + 2,
                                bytes + 3, words + 4, bytes + 4, words + 5);
  }
};
template <class U, auto Compare, auto Transform, auto Weight>
struct Units {
  using Unit = U;
  static int32_t compare(LXLocale* l, const U* a, int32_t m, const U* b, int32_t n, uint32_t, uint32_t options) {
    return Compare(l, a, m, b, n, options);
  }
  static int32_t transform(LXLocale* l, void* key, int32_t size, const U* s, int32_t n, uint32_t, uint32_t options) {
    return Transform(l, key, size, s, n, options);
  }
  static int32_t weight(LXLocale* l, const U** s, int32_t* n, uint32_t*, uint16_t* words, uint8_t* bytes) {
    return Weight(l, s, n, words, words + 1, bytes, bytes + 1, words + 2, words + 3, bytes + 2, bytes + 3, words + 4,
                  bytes + 4, words + 5);
  }
};
using Wide = Units<LXWChar, LXWcscoll, LXWcsxfrm, LXStrGetNextWeightW>;
using Ucs2 = Units<LXUChar, LXStrcollU, LXStrxfrmU, LXStrGetNextWeightU>;

class Library {
 public:
  Library() {
    LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS);
    for (const char* name : kLocales) {
      uint32_t rc = 99;
      locales_.push_back(LXGetLocale(name, 0, &rc));
      demand(rc == LX_OK, name);
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
    uint8_t kind = input.byte();
    state_ = kind >> 7;
    uint8_t option = input.byte();
    options_ = option < 0x80 ? kOptions[option % std::size(kOptions)] : 1u << option % 32;
    key_size_ = input.byte() * 16u + input.byte() % 16u;
    uint8_t split = input.byte();
    std::string_view all = input.rest().substr(0, kLongestText);
    std::string_view first = all.substr(0, all.size() * split / 255);
    std::string_view second = all.substr(first.size());
    switch (kind % 4) {
      case 0:
        return use<Plain>(first, second);
      case 1:
        return use<Shifted>(first, second);
      case 2:
        return use<Wide>(first, second);
      default:
        return use<Ucs2>(first, second);
    }
  }

 private:
  template <class Calls, class U = typename Calls::Unit>
  void use(std::string_view first, std::string_view second) {
    Text<U> a(first), b(second);
    // Without a count of characters that the text may not have.
    if (sizeof(U) == 1) options_ &= ~LX_OPT_CHARS;
    int32_t result = Calls::compare(l_, a.at(), a.length, b.at(), b.length, state_, options_);
    uint32_t error = LXGetError(l_);
    demand(error == LX_OK || (error == LX_E_ARGUMENT && result == 0), "status of a comparison");
    bool one_way = sizeof(U) == 1 &&
                   (options_ & LX_COLL_TRIM) != 0;  // the first text cuts the second, which may then end in blanks
    int32_t reverse = Calls::compare(l_, b.at(), b.length, a.at(), a.length, state_, options_);
    demand(one_way || (result > 0) == (reverse < 0), "the order depends on the order of the call");
    demand(one_way || Calls::compare(l_, a.at(), a.length, a.at(), a.length, state_, options_) == 0,
           "a text differs from itself");
    keys<Calls>(a, b, result);
    weights<Calls>(a);
  }

  template <class Calls, class U = typename Calls::Unit>
  std::vector<uint8_t> key(const Text<U>& text) {
    int32_t length = Calls::transform(l_, nullptr, 0, text.at(), text.length, state_, options_);
    if (length < 0) return {};
    size_t size = static_cast<size_t>(length);
    std::vector<uint8_t> exact(size);
    demand(Calls::transform(l_, exact.data(), length, text.at(), text.length, state_, options_) == std::max(length, 0),
           "length of a key");
    std::unique_ptr<uint8_t[]> other(new uint8_t[key_size_]);
    int32_t again =
        Calls::transform(l_, other.get(), static_cast<int32_t>(key_size_), text.at(), text.length, state_, options_);
    demand(again == length || text.length == 0, "length of a key in another room");
    if (size <= key_size_) demand(std::equal(exact.begin(), exact.end(), other.get()), "a key depends on its room");
    return exact;
  }

  template <class Calls, class U = typename Calls::Unit>
  void keys(const Text<U>& a, const Text<U>& b, int32_t result) {
    std::vector<uint8_t> key_a = key<Calls>(a);
    std::vector<uint8_t> key_b = key<Calls>(b);
    if (a.length == 0 || b.length == 0 || options_ != LX_CMP_NOCASE) return;
    demand((result < 0) == (key_a < key_b) && (result > 0) == (key_b < key_a), "keys have another order");
  }

  template <class Calls, class U = typename Calls::Unit>
  void weights(const Text<U>& text) {
    const U* at = text.at();
    int32_t left = text.length;
    uint32_t state = state_;
    uint16_t words[6] = {0, 0, 0, 0, 0, 0xFFFF};
    uint8_t bytes[5] = {};
    for (int32_t calls = 0; left > 0 || words[5] != 0xFFFF; ++calls) {
      demand(calls <= text.length, "no end of the weights");
      int32_t sets = Calls::weight(l_, &at, &left, &state, words, bytes);
      demand(sets >= 0 && sets <= 2, "number of weights");
      demand(at >= text.at() && at <= text.at() + text.length, "reader outside");
    }
  }

  std::vector<LXLocale*> locales_;
  LXLocale* l_ = nullptr;
  uint32_t state_ = 0;
  uint32_t options_ = 0;
  size_t key_size_ = 0;
};

}  // namespace
}  // namespace lx::fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static lx::fuzz::Library library;
  library.run({data, size});
  return 0;
}
