// SPDX-License-Identifier: Apache-2.0
// NLS1_TranslateString beside its slow model: all pairs of pages of every kind, all flags, all sizes.
#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "nls1/translation_model.hpp"
#include "support/edge_buffer.hpp"

namespace lx::test {
namespace {

constexpr uint16_t kPages[] = {LX_CP_UCS2, LX_CP_UTF8, 37, 290, 367, 819, 932, 954, 964, 930, 937, 1399};
constexpr uint32_t kAllFlags = LX_OPT_TERMINATE | LX_OPT_CHARS | NLS1_XLT_PAD | NLS1_XLT_BLANKS;

// Texts of a page: characters that many pages have, blanks, shift bytes and others where no one expects them.
class Texts {
 public:
  explicit Texts(const PageSource* page) : page_(page) {}

  std::string make(size_t parts) {
    std::string text;
    const bool wild = chance(3);
    for (size_t i = 0; i < parts; ++i) text += wild && chance(3) ? stray() : ordinary();
    if (chance(2)) text += spelled(page_, std::u16string(random_() % 5, u' '));
    if (wild && page_ == nullptr && text.size() > 1 && chance(2)) text.pop_back();
    return text;
  }

 private:
  bool chance(unsigned of) { return random_() % of == 0; }

  std::string ordinary() {
    static constexpr std::u16string_view kWords[] = {u"A",      u"bc",     u" ",  u"  ",   u"9",        u"é",
                                                     u"ﾃ",      u"あ",     u"ア", u"東京", u"山田太郎", u"一二三",
                                                     u"\u00A5", u"\uFFFD", u"€",  u"(12)", u"漢 ",      u"あA"};
    return spelled(page_, kWords[random_() % std::size(kWords)]);
  }
  std::string stray() {
    if (page_ != nullptr && page_->mixed() && !chance(4)) {
      return std::string(1 + random_() % 3, static_cast<char>(chance(2) ? page_->enter : page_->leave));
    }
    std::string bytes;
    for (unsigned i = page_ == nullptr ? 2 : 1 + random_() % 2; i != 0; --i) bytes += static_cast<char>(random_());
    return bytes;
  }

  const PageSource* page_;
  std::minstd_rand random_{11};
};

std::string shown(const FieldResult& result) {
  return "count " + std::to_string(result.count) + ", consumed " + std::to_string(result.consumed) + ", error " +
         std::to_string(result.error) + ", " + hex(result.written);
}

class Translation : public testing::TestWithParam<uint16_t> {
 protected:
  // The result with what was written; anything written behind that is reported as well.
  FieldResult translate(uint16_t to, uint16_t from, const FieldCall& call, int32_t length, size_t expected) {
    std::string text = call.text;
    if (call.measured) text += std::string(call.from == nullptr ? 2 : 1, '\0');
    if (call.from == nullptr && text.size() % 2 != 0) text += '\x5A';
    size_t room = call.has(LX_OPT_CHARS) ? expected : std::max(expected, call.size);
    if (call.to == nullptr) room += room % 2;
    const char* in = in_.text(text);
    char* out = out_.room(room);
    FieldResult result;
    result.error = 99;
    result.count = NLS1_TranslateString(to, out, static_cast<int32_t>(call.size), from, in, length, &result.consumed,
                                        call.flags, &result.error);
    result.written.assign(out, room);
    while (result.written.size() > expected && result.written.back() == '\x5A') result.written.pop_back();
    return result;
  }

  void compare(uint16_t to, FieldCall call, size_t size) {
    call.size = size;
    int32_t length = call.measured ? -1 : static_cast<int32_t>(call.text.size());
    if (!call.measured && call.has(LX_OPT_CHARS)) {
      Counted counted = count_characters(call.from, call.text);
      call.text.resize(counted.bytes);
      length = counted.characters;
    }
    const FieldResult expected = translate_model(call);
    const FieldResult got = translate(to, GetParam(), call, length, expected.written.size());
    if (got == expected) return;
    if (++failures_ > 20) return;
    ADD_FAILURE() << GetParam() << " to " << to << ", text " << hex(call.text) << ", length " << length << ", size "
                  << call.size << ", flags " << std::hex << call.flags << "\n  got      " << shown(got)
                  << "\n  expected " << shown(expected);
  }

  static std::string without_zeros(const std::string& text, bool units) {
    for (size_t at = 0; at + (units ? 1 : 0) < text.size(); at += units ? 2 : 1) {
      if (text[at] == '\0' && (!units || text[at + 1] == '\0')) return text.substr(0, at);
    }
    return units ? text.substr(0, text.size() / 2 * 2) : text;
  }

  void compare_flags(uint16_t to, const std::string& text, size_t first_size, size_t last_size) {
    for (uint32_t flags = kAllFlags;; flags = (flags - 1) & kAllFlags) {
      for (bool measured : {false, true}) {
        FieldCall call = {page_of(to), page_of(GetParam()), text, measured, 0, flags};
        if (measured) call.text = without_zeros(text, call.from == nullptr);
        for (size_t size = first_size; size <= last_size; ++size) compare(to, call, size);
      }
      if (flags == 0) break;
    }
  }

  static size_t needed(uint16_t to, const std::string& text) {
    FieldCall call = {page_of(to), page_of(GetParam()), text, false, 1000, LX_OPT_TERMINATE};
    return translate_model(call).written.size();
  }

 private:
  EdgeBuffer in_{2000};
  EdgeBuffer out_{4000};
  int failures_ = 0;
};

TEST_P(Translation, FollowsTheModel) {
  for (uint16_t to : kPages) {
    Texts texts(page_of(GetParam()));
    for (size_t parts = 0; parts <= 6; ++parts) {
      const std::string text = texts.make(parts);
      compare_flags(to, text, 0, needed(to, text) + 3);
    }
  }
}

// Long enough for the ways that take many characters at once.
TEST_P(Translation, FollowsTheModelInLongTexts) {
  for (uint16_t to : kPages) {
    Texts texts(page_of(GetParam()));
    for (int i = 0; i < 3; ++i) {
      std::string text = texts.make(40);
      if (i == 0) text = spelled(page_of(GetParam()), std::u16string(100, u'A') + u"é" + std::u16string(30, u' '));
      const size_t most = needed(to, text);
      for (size_t size : {most / 2, most - std::min<size_t>(most, 5)}) compare_flags(to, text, size, size + 2);
    }
  }
}

INSTANTIATE_TEST_SUITE_P(FromPages, Translation, testing::ValuesIn(kPages));

}  // namespace
}  // namespace lx::test
