// SPDX-License-Identifier: Apache-2.0
// A locale with a sort object, a kind of text and options from the first bytes of the input; the rest are
// two texts. Each text ends where its block of memory ends; results must stay inside and agree with each other.
#include <algorithm>

#include "fuzz_support.hpp"
#include "support/text_calls.hpp"

namespace lx::fuzz {
namespace {

using test::Form;
using test::State;
using test::StateAt;

constexpr size_t kLongestText = 300;
const std::vector<std::string> kLocales = {"German_Germany.Latin1@Default",
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

class Collation : public Target {
 public:
  Collation() { start(LEXARO_DATA, "", kLocales); }

  void run(InputBytes input) override {
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
    const Form form = {static_cast<Form::Kind>(kind % 4), nullptr};
    test::with_calls(form, [&](auto calls) { use<decltype(calls)>(first, second); });
  }

 private:
  template <class Calls, class U = typename Calls::Unit>
  void use(std::string_view first, std::string_view second) {
    Text<U> a(first), b(second);
    // Without a count of characters that the text may not have.
    if (sizeof(U) == 1) options_ &= ~LX_OPT_CHARS;
    auto compare = [&](const Text<U>& m, const Text<U>& n) {
      return Calls()(test::kStrcoll, l_, m.at(), m.length, State{state_}, n.at(), n.length, State{state_}, options_);
    };
    int32_t result = compare(a, b);
    uint32_t error = LXGetError(l_);
    demand(error == LX_OK || (error == LX_E_ARGUMENT && result == 0), "status of a comparison");
    bool one_way = sizeof(U) == 1 &&
                   (options_ & LX_COLL_TRIM) != 0;  // the first text cuts the second, which may then end in blanks
    demand(one_way || (result > 0) == (compare(b, a) < 0), "the order depends on the order of the call");
    demand(one_way || compare(a, a) == 0, "a text differs from itself");
    keys<Calls>(a, b, result);
    weights<Calls>(a);
  }

  template <class Calls, class U = typename Calls::Unit>
  std::vector<uint8_t> key(const Text<U>& text) {
    auto transform = [&](uint8_t* out, size_t room) {
      return Calls()(test::kStrxfrm, l_, out, static_cast<int32_t>(room), text.at(), text.length, State{state_},
                     options_);
    };
    int32_t length = transform(nullptr, 0);
    if (length < 0) return {};
    size_t size = static_cast<size_t>(length);
    std::vector<uint8_t> exact(size);
    demand(transform(exact.data(), size) == length, "length of a key");
    std::unique_ptr<uint8_t[]> other(new uint8_t[key_size_]);
    demand(transform(other.get(), key_size_) == length || text.length == 0, "length of a key in another room");
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
      int32_t sets = Calls()(test::kGetNextWeight, l_, &at, &left, StateAt{&state}, words, words + 1, bytes, bytes + 1,
                             words + 2, words + 3, bytes + 2, bytes + 3, words + 4, bytes + 4, words + 5);
      demand(sets >= 0 && sets <= 2, "number of weights");
      demand(at >= text.at() && at <= text.at() + text.length, "reader outside");
    }
  }

  LXLocale* l_ = nullptr;
  uint32_t state_ = 0;
  uint32_t options_ = 0;
  size_t key_size_ = 0;
};

}  // namespace

std::unique_ptr<Target> make_target() { return std::make_unique<Collation>(); }

}  // namespace lx::fuzz
