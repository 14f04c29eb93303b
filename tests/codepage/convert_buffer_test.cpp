// SPDX-License-Identifier: Apache-2.0
// Resumable conversion: real and random text between thirteen code pages, cut everywhere on both sides. Every call is
// compared with the slow model, every cut run with the uncut one, and all text and room ends at an unmapped page.
#include <algorithm>
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
    static EdgeBuffer in_buffer(8192);
    static EdgeBuffer out_buffer(65536);
    size_t given = std::min(step.in, text.size());
    const char* const in_begin = in_buffer.text(text.substr(0, given));
    char* const out_begin = out_buffer.room(step.room);
    const char* in = in_begin;
    char* out = out_begin;
    auto in_left = static_cast<int32_t>(given);
    auto room = static_cast<int32_t>(step.room);
    uint32_t status = LXConvertBuffer(handle_.get(), &out, &room, &in, &in_left, 0);

    std::string_view rest = text.substr(0, given);
    std::string expected;
    uint32_t expected_status = model_.convert(expected, step.room, rest);
    auto written = static_cast<size_t>(out - out_begin);
    auto used = static_cast<size_t>(in - in_begin);
    bool consistent = used + static_cast<size_t>(in_left) == given && written + static_cast<size_t>(room) == step.room;
    bool right = consistent && status == expected_status && used == given - rest.size() &&
                 std::string_view(out_begin, written) == expected &&
                 std::all_of(out_begin + written, out_begin + step.room, [](char unit) { return unit == '\x5A'; });
    if (!right) {
      ADD_FAILURE() << name_ << ", input " << hex(text.substr(0, given)) << ", room " << step.room << ": status "
                    << status << ", used " << used << ", " << hex({out_begin, written}) << "; not status "
                    << expected_status << ", used " << given - rest.size() << ", " << hex(expected);
      return false;
    }
    EXPECT_LE(model_.held(), 5u);
    EXPECT_LE(model_.pending(), 5u);
    output_ += expected;
    text.remove_prefix(used);
    status_ = status;
    return true;
  }
  // Steps in turn, the last one again and again, until all is converted.
  bool all(std::string_view text, const std::vector<Step>& steps) {
    for (size_t i = 0; !text.empty() || status_ == LX_E_FULL || i < steps.size(); ++i) {
      if (!step(text, steps[std::min(i, steps.size() - 1)])) return false;
    }
    return true;
  }
  const std::string& output() const { return output_; }
  uint32_t status() const { return status_; }

 private:
  std::string name_;
  Conversion handle_;
  BufferModel model_;
  std::string output_;
  uint32_t status_ = 0;
};

constexpr size_t kAll = 4096;

template <class Each>
void for_each_pair(Each each) {
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

TEST_F(ConvertBuffer, EveryCutOfRealText) {
  for_each_pair([&](uint16_t target, uint16_t source) {
    std::string text = sentences(PageSource::of(source));
    auto converted = [&](const std::vector<Step>& steps) {
      Trial trial(target, source, locale(target), locale(source));
      trial.all(text, steps);
      return trial.output();
    };
    std::string whole = converted({{kAll, kAll}});
    ASSERT_FALSE(whole.empty());
    for (size_t cut = 0; cut <= text.size(); ++cut) {
      ASSERT_EQ(converted({{cut, kAll}, {kAll, kAll}}), whole) << "input cut at " << cut;
    }
    for (size_t cut = 0; cut <= whole.size(); ++cut) {
      ASSERT_EQ(converted({{kAll, cut}, {kAll, kAll}}), whole) << "output cut at " << cut;
    }
    for (size_t room = 1; room <= 6; ++room) {
      ASSERT_EQ(converted({{1, room}}), whole) << "single bytes into rooms of " << room;
      ASSERT_EQ(converted({{kAll, room}}), whole) << "everything into rooms of " << room;
    }
  });
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
    for (int round = 0; round < 40; ++round) {
      std::string text = round % 2 == 0 ? random_bytes(random, 60) : sentences(PageSource::of(source));
      std::vector<Step> steps;
      if (round % 4 != 0) {
        for (int i = 0; i < 80; ++i) steps.push_back({random() % 9, random() % 7});
      }
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
    std::string whole;
    for (size_t start : {0u, 1u, 2u, 3u, 7u, 15u, 31u}) {
      for (size_t room : {kAll * 2, size_t{17}, size_t{64}, size_t{129}}) {
        Trial trial(target, source, locale(target), locale(source));
        if (!trial.all(bytes, {{start, room}, {kAll, room}})) return;
        if (whole.empty()) whole = trial.output();
        ASSERT_EQ(trial.output(), whole);
      }
    }
  });
}

// ---- Statuses
// -----------------------------------------------------------------------------------------------------------

// One call each, in order; every one of them says what is to be seen from outside.
struct Call {
  std::string in;
  size_t room;
  uint32_t status;
  std::string out;
  size_t unused = 0;  // bytes of the input that are left
};

void expect_calls(const char* name, LXLocale* target, LXLocale* source, const std::vector<Call>& calls) {
  Conversion handle(LXOpenConversion(target, source, 0));
  ASSERT_NE(handle, nullptr);
  for (size_t i = 0; i < calls.size(); ++i) {
    const Call& call = calls[i];
    Guarded text{std::string_view(call.in)};
    Guarded room(call.room);
    const char* in = text.data();
    char* out = room.data();
    auto in_left = static_cast<int32_t>(call.in.size());
    auto out_room = static_cast<int32_t>(call.room);
    EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &out_room, &in, &in_left, 0), call.status) << name << ", call " << i;
    EXPECT_EQ(hex({room.data(), static_cast<size_t>(out - room.data())}), hex(call.out)) << name << ", call " << i;
    EXPECT_EQ(static_cast<size_t>(in_left), call.unused) << name << ", call " << i;
    EXPECT_EQ(static_cast<size_t>(out_room), call.room - call.out.size()) << name << ", call " << i;
  }
}

TEST_F(ConvertBuffer, Statuses) {
  LXLocale* utf8 = locale(57352);
  LXLocale* japanese = locale(932);
  LXLocale* mixed = locale(930);
  LXLocale* latin = locale(819);
  expect_calls("nothing given, all consumed, room just enough", latin, latin, {{"", 0, 0, ""}, {"abc", 3, 0, "abc"}});
  expect_calls("no room: one character is taken in", latin, latin,
               {{"abc", 0, 52, "", 2}, {"bc", 0, 52, "", 2}, {"bc", 9, 0, "abc"}});
  expect_calls("a third of a character is held", japanese, utf8,
               {{"\xE3", 9, 53, ""}, {"", 9, 53, ""}, {"\x82", 9, 53, ""}, {"\xA2", 9, 0, "\x83\x41"}});
  expect_calls(
      "the rest is delivered before new text is looked at", utf8, japanese,
      {{"\x83\x41", 2, 52, "\xE3\x82"}, {"xyz", 0, 52, "", 3}, {"xyz", 1, 52, "\xA2", 2}, {"yz", 9, 0, "xyz"}});
  expect_calls("a shift byte goes out without its character, and the run stays open", mixed, utf8,
               {{"\xE3\x80\x80", 1, 52, "\x0E"}, {"", 2, 0, "\x40\x40"}, {"a", 9, 0, "\x0F\x62"}});
  expect_calls("shift bytes alone are consumed", utf8, mixed,
               {{"\x0E", 0, 0, ""}, {"\x40\x40\x0F", 9, 0, "\xE3\x80\x80"}});
  expect_calls("a second shift byte is text, also in the next call", utf8, mixed,
               {{"\x0E\x0E\x41\x0F", 9, 0, "\xEF\xBF\xBD"}, {"\x0F\x0E", 9, 0, "\x0F"}});
}

TEST_F(ConvertBuffer, Arguments) {
  LXLocale* latin = locale(819);
  Conversion handle(LXOpenConversion(latin, latin, 0));
  char memory[4];
  char* out = memory;
  const char* in = "ab";
  int32_t room = -3;
  int32_t left = -3;
  EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0), LX_OK);  // less than nothing is nothing
  left = 1;
  EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0), LX_E_FULL);
  EXPECT_EQ(LXConvertBuffer(nullptr, &out, &room, &in, &left, 0), LX_E_ARGUMENT);
  EXPECT_EQ(LXConvertBuffer(handle.get(), nullptr, &room, &in, &left, 0), LX_E_ARGUMENT);
  EXPECT_EQ(LXCloseConversion(nullptr), LX_OK);
}

// ---- Ratio
// --------------------------------------------------------------------------------------------------------------

TEST_F(ConvertBuffer, Ratio) {
  for_each_pair([&](uint16_t target, uint16_t source) {
    const PageSource& page = PageSource::of(target);
    int32_t expected = target == source ? 1 : page.max_length + (page.mixed() ? 1 : 0);
    EXPECT_EQ(LXStringToUnicode(locale(target), nullptr, 0, nullptr, 0, 1), -1);
    EXPECT_EQ(LXConversionRatio(locale(target), locale(source), 0), expected) << page.name;
    EXPECT_EQ(LXGetError(locale(target)), LX_OK);
  });
}

// Well-formed text of any pair, and between different pages any bytes at all, fit into the room that the ratio gives.
TEST_F(ConvertBuffer, RatioIsAnUpperBound) {
  std::mt19937 random(4);
  for_each_pair([&](uint16_t target, uint16_t source) {
    auto ratio = static_cast<size_t>(LXConversionRatio(locale(target), locale(source), 0));
    std::vector<std::string> texts = {sentences(PageSource::of(source)), ""};
    const PageSource& page = PageSource::of(source);
    std::u16string alternating;
    for (int i = 0; i < 20; ++i) alternating += i % 2 == 0 ? u'\u3000' : u'a';
    texts.push_back(encoded(page, alternating));
    for (int i = 0; i < 20 && target != source; ++i) texts.push_back(random_bytes(random, 50));
    for (const std::string& text : texts) {
      Trial trial(target, source, locale(target), locale(source));
      std::string_view rest = text;
      ASSERT_TRUE(trial.step(rest, {kAll, ratio * text.size()}));
      EXPECT_NE(trial.status(), LX_E_FULL) << hex(text);
    }
  });
}

}  // namespace
}  // namespace lx::test
