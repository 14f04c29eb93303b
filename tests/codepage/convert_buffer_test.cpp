// SPDX-License-Identifier: Apache-2.0
// Resumable conversion: real and random text between thirteen code pages, cut on both sides. Every call is compared
// with the slow model, and all text and room ends at an unmapped page.
#include <algorithm>
#include <functional>
#include <map>
#include <random>

#include "support/edge_buffer.hpp"
#include "support/text_model.hpp"

namespace lx::test {
namespace {

constexpr uint16_t kPages[] = {37, 273, 819, 367, 932, 954, 964, 936, 57352, 930, 939, 933, 1388};

constexpr const char16_t* kSentences[] = {
    u"Zwölf Boxkämpfer jagen Viktor quer über den großen Sylter Deich.\n",
    u"いろはにほへと、ABC ちりぬるを。ﾊﾝｶｸ\n",
    u"Съешь же ещё этих мягких булок!\r\n",
    u"我能吞下玻璃而不伤身体。臺灣 x 學\u0085",
    u"키스의 고유조건은 입술끼리 a만나야\n",
};

class ConvertBuffer : public testing::Test {
 protected:
  ConvertBuffer() {
    for (uint16_t id : kPages) locales_[id] = locale_of(PageSource::of(id).name);
  }
  LXLocale* locale(uint16_t id) const { return locales_.at(id).get(); }

 private:
  Session session_;
  std::map<uint16_t, Locale> locales_;
};

// How much of the text and of room a call is given.
struct Step {
  size_t in;
  size_t room;
};

// A handle and its model, fed alike.
class Trial {
 public:
  Trial(uint16_t target, uint16_t source, LXLocale* to, LXLocale* from)
      : name_(PageSource::of(source).name + " to " + PageSource::of(target).name),
        handle_(LXOpenConversion(to, from, 0)),
        model_(PageSource::of(target), PageSource::of(source)) {}

  // False after the first difference.
  bool step(std::string_view& text, Step step) {
    static EdgeBuffer in_buffer(8192), out_buffer(65536);
    const std::string_view given = text.substr(0, step.in);
    const char* const in_begin = in_buffer.text(given);
    char* const out_begin = out_buffer.room(step.room);
    const char* in = in_begin;
    char* out = out_begin;
    auto in_left = static_cast<int32_t>(given.size()), room = static_cast<int32_t>(step.room);
    status_ = LXConvertBuffer(handle_.get(), &out, &room, &in, &in_left, 0);
    const auto written = static_cast<size_t>(out - out_begin), used = static_cast<size_t>(in - in_begin);
    EXPECT_EQ(used + static_cast<size_t>(in_left), given.size());
    EXPECT_EQ(written + static_cast<size_t>(room), step.room);
    EXPECT_TRUE(std::all_of(out, out_begin + step.room, [](char unit) { return unit == '\x5A'; }));

    std::string_view rest = given;
    std::string expected;
    const uint32_t status = model_.convert(expected, step.room, rest);
    text.remove_prefix(used);
    if (status_ == status && used == given.size() - rest.size() && std::string_view(out_begin, written) == expected) {
      return !testing::Test::HasFailure();
    }
    ADD_FAILURE() << name_ << ", input " << hex(given) << ", room " << step.room << ": status " << status_ << ", used "
                  << used << ", " << hex({out_begin, written}) << "; not status " << status << ", used "
                  << given.size() - rest.size() << ", " << hex(expected);
    return false;
  }
  // Steps in turn, the last one again and again, until all is converted.
  bool all(std::string_view text, const std::vector<Step>& steps) {
    for (size_t i = 0; !text.empty() || status_ == LX_E_FULL || i < steps.size(); ++i) {
      if (!step(text, steps[std::min(i, steps.size() - 1)])) return false;
    }
    return true;
  }
  uint32_t status() const { return status_; }

 private:
  std::string name_;
  Conversion handle_;
  BufferModel model_;
  uint32_t status_ = 0;
};

constexpr size_t kAll = 4096;

void for_each_pair(const std::function<void(uint16_t target, uint16_t source)>& each) {
  for (uint16_t source : kPages) {
    for (uint16_t target : kPages) {
      if (testing::Test::HasFailure()) return;
      each(target, source);
    }
  }
}

std::string sentences(const PageSource& page) {
  std::u16string text;
  for (const char16_t* sentence : kSentences) text += sentence;
  return encoded(page, text);
}

// Bytes that make trouble: lead bytes, shift bytes, continuation bytes, ASCII, zeros.
std::string random_bytes(std::mt19937& random, size_t length) {
  static constexpr unsigned char kLikely[] = {0x0E, 0x0F, 0x0E, 0x0F, 0x41, 0x42, 0x81, 0x8E, 0x8F, 0xA2, 0xE3, 0x00};
  std::string text;
  while (text.size() < length) {
    auto value = random();
    text += static_cast<char>(value % 2 == 0 ? kLikely[value / 2 % sizeof kLikely] : value / 2);
  }
  return text;
}

TEST_F(ConvertBuffer, RandomCuts) {
  std::mt19937 random(2);
  for_each_pair([&](uint16_t target, uint16_t source) {
    for (int round = 0; round < 30; ++round) {
      const std::string text =
          round % 3 == 0 ? sentences(PageSource::of(source)) + random_bytes(random, 10) : random_bytes(random, 60);
      std::vector<Step> steps;
      for (int i = 0; i < 300 && round % 4 != 0; ++i) steps.push_back({random() % 9, random() % 7});
      steps.push_back({kAll, kAll});
      Trial trial(target, source, locale(target), locale(source));
      if (!trial.all(text, steps)) return;
    }
  });
}

// Long enough for the runs that move many bytes at a time, at every place beside the edge of the memory.
TEST_F(ConvertBuffer, LongRunsBetweenOddCharacters) {
  std::mt19937 random(3);
  for_each_pair([&](uint16_t target, uint16_t source) {
    const PageSource& page = PageSource::of(source);
    std::u16string text;
    for (size_t run = 0; run < 70; ++run) {
      text.append(run, u'a');
      text += run % 2 == 0 ? u'漢' : u'é';
    }
    std::string bytes = encoded(page, text);
    for (size_t start : {0u, 1u, 2u, 3u, 7u, 15u, 31u}) {
      for (size_t room : {kAll * 2, size_t{17}, size_t{64}, size_t{129}}) {
        Trial trial(target, source, locale(target), locale(source));
        if (!trial.all(bytes, {{start, room}, {kAll, room}})) return;
      }
    }
  });
}

TEST_F(ConvertBuffer, Arguments) {
  LXLocale* latin = locale(819);
  Conversion handle(LXOpenConversion(latin, latin, 0));
  char memory[4], *out = memory;
  const char* in = "ab";
  int32_t room = -3, left = -3;
  EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0), LX_OK);  // less than nothing is nothing
  left = 1;
  EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0), LX_E_FULL);
  EXPECT_EQ(LXConvertBuffer(nullptr, &out, &room, &in, &left, 0), LX_E_ARGUMENT);
  EXPECT_EQ(LXConvertBuffer(handle.get(), nullptr, &room, &in, &left, 0), LX_E_ARGUMENT);
  EXPECT_EQ(LXCloseConversion(nullptr), LX_OK);
}

// Well-formed text of any pair, and between different pages any bytes at all, fit into the room that the ratio gives.
TEST_F(ConvertBuffer, RatioIsAnUpperBound) {
  std::mt19937 random(4);
  for_each_pair([&](uint16_t target, uint16_t source) {
    const PageSource &to = PageSource::of(target), &from = PageSource::of(source);
    EXPECT_EQ(LXStringToUnicode(locale(target), nullptr, 0, nullptr, 0, 1), -1);
    const int32_t ratio = LXConversionRatio(locale(target), locale(source), 0);
    EXPECT_EQ(ratio, target == source ? 1 : to.max_length + (to.mixed() ? 1 : 0)) << to.name;
    EXPECT_EQ(LXGetError(locale(target)), LX_OK);
    std::u16string alternating;
    for (int i = 0; i < 20; ++i) alternating += i % 2 == 0 ? u'\u3000' : u'a';
    std::vector<std::string> texts = {sentences(from), "", encoded(from, alternating)};
    for (int i = 0; i < 20 && target != source; ++i) texts.push_back(random_bytes(random, 50));
    for (const std::string& text : texts) {
      Trial trial(target, source, locale(target), locale(source));
      std::string_view rest = text;
      ASSERT_TRUE(trial.step(rest, {kAll, static_cast<size_t>(ratio) * text.size()}));
      EXPECT_NE(trial.status(), LX_E_FULL) << hex(text);
    }
  });
}

}  // namespace
}  // namespace lx::test
