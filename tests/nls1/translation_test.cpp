// SPDX-License-Identifier: Apache-2.0
// NLS1_TranslateString beside its slow model: all pairs of pages of every kind, all flags, all sizes; texts cut into
// records; bad arguments, absent buffers, messages.
#include <gtest/gtest.h>

#include <cstring>
#include <random>

#include "nls1/translation_model.hpp"
#include "support/edge_buffer.hpp"
#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

using namespace std::string_literals;

constexpr uint16_t kPages[] = {LX_CP_UCS2, LX_CP_UTF8, 37, 290, 367, 819, 932, 954, 964, 930, 937, 1399};
constexpr uint32_t kAllFlags = LX_OPT_TERMINATE | LX_OPT_CHARS | NLS1_XLT_PAD | NLS1_XLT_BLANKS;

// Texts of a page: characters that many pages have, blanks, shift bytes and others where no one expects them.
class Texts {
 public:
  explicit Texts(uint16_t page) : page_(page), form_(form_of(page)) {}

  std::string make(size_t parts) {
    std::string text;
    const bool wild = chance(3);
    for (size_t i = 0; i < parts; ++i) text += wild && chance(3) ? stray() : ordinary();
    if (chance(2)) text += spelled_bytes(page_, std::u16string(random_() % 5, u' '));
    if (wild && !form_.is_bytes() && text.size() > 1 && chance(2)) text.pop_back();
    return text;
  }

 private:
  bool chance(unsigned of) { return random_() % of == 0; }

  std::string ordinary() {
    static constexpr std::u16string_view kWords[] = {u"A",      u"bc",     u" ",  u"  ",   u"9",        u"é",
                                                     u"ﾃ",      u"あ",     u"ア", u"東京", u"山田太郎", u"一二三",
                                                     u"\u00A5", u"\uFFFD", u"€",  u"(12)", u"漢 ",      u"あA"};
    return spelled_bytes(page_, kWords[random_() % std::size(kWords)]);
  }
  std::string stray() {
    if (form_.follows_shifts() && !chance(4)) {
      const uint8_t shift = chance(2) ? form_.page->enter : form_.page->leave;
      return std::string(1 + random_() % 3, static_cast<char>(shift));
    }
    std::string bytes;
    for (unsigned i = form_.is_bytes() ? 1 + random_() % 2 : 2; i != 0; --i) bytes += static_cast<char>(random_());
    return bytes;
  }

  const uint16_t page_;
  const Form form_;
  std::minstd_rand random_{11};
};

class Translation : public testing::TestWithParam<uint16_t> {
 protected:
  // The result with what was written; anything written behind that is reported as well.
  FieldResult translate(uint16_t to, const FieldCall& call, int32_t length, size_t expected) {
    std::string text = call.text;
    if (call.measured) text += std::string(call.from.unit_size(), '\0');
    if (!call.from.is_bytes() && text.size() % 2 != 0) text += '\x5A';
    size_t room = call.has(LX_OPT_CHARS) ? expected : std::max(expected, call.size);
    if (!call.to.is_bytes()) room += room % 2;
    const char* in = in_.text(text);
    char* out = out_.room(room);
    FieldResult result = {0, "", 0, 99};
    result.count = NLS1_TranslateString(to, out, static_cast<int32_t>(call.size), GetParam(), in, length,
                                        &result.consumed, call.flags, &result.error);
    result.written.assign(out, room);
    while (result.written.size() > expected && result.written.back() == '\x5A') result.written.pop_back();
    return result;
  }

  void compare(uint16_t to, FieldCall call, size_t size) {
    call.size = size;
    int32_t length = call.measured ? -1 : static_cast<int32_t>(call.text.size());
    if (!call.measured && call.has(LX_OPT_CHARS)) {
      const auto list = characters_of(call.from, units_in(call.from, call.text)).list;
      call.text.resize(list.empty() ? 0 : list.back().own_end() * call.from.unit_size());
      length = static_cast<int32_t>(list.size());
    }
    const FieldResult expected = translate_model(call);
    const FieldResult got = translate(to, call, length, expected.written.size());
    if (got == expected || ++failures_ > 20) return;
    auto shown = [](const FieldResult& result) {
      return "count " + std::to_string(result.count) + ", consumed " + std::to_string(result.consumed) + ", error " +
             std::to_string(result.error) + ", " + hex(result.written);
    };
    ADD_FAILURE() << GetParam() << " to " << to << ", text " << hex(call.text) << ", length " << length << ", size "
                  << call.size << ", flags " << std::hex << call.flags << "\n  got      " << shown(got)
                  << "\n  expected " << shown(expected);
  }

  void compare_flags(uint16_t to, const std::string& text, size_t first_size, size_t last_size) {
    for (uint32_t flags = kAllFlags;; flags = (flags - 1) & kAllFlags) {
      for (bool measured : {false, true}) {
        FieldCall call = {form_of(to), form_of(GetParam()), text, measured, 0, flags};
        if (measured) {
          Units units = units_in(call.from, text);
          units.erase(std::find(units.begin(), units.end(), 0u), units.end());
          call.text = raw(call.from, units);
        }
        for (size_t size = first_size; size <= last_size; ++size) compare(to, call, size);
      }
      if (flags == 0) break;
    }
  }

  static size_t needed(uint16_t to, const std::string& text) {
    return translate_model({form_of(to), form_of(GetParam()), text, false, 1000, LX_OPT_TERMINATE}).written.size();
  }

 private:
  EdgeBuffer in_{2000}, out_{4000};
  int failures_ = 0;
};

TEST_P(Translation, FollowsTheModel) {
  for (uint16_t to : kPages) {
    Texts texts(GetParam());
    for (size_t parts = 0; parts <= 6; ++parts) {
      const std::string text = texts.make(parts);
      compare_flags(to, text, 0, needed(to, text) + 3);
    }
    for (int i = 0; i < 3; ++i) {  // long enough for the ways that take many characters at once
      std::string text = texts.make(40);
      if (i == 0) text = spelled_bytes(GetParam(), std::u16string(100, u'A') + u"é" + std::u16string(30, u' '));
      const size_t most = needed(to, text);
      for (size_t size : {most / 2, most - std::min<size_t>(most, 5)}) compare_flags(to, text, size, size + 2);
    }
  }
}

INSTANTIATE_TEST_SUITE_P(FromPages, Translation, testing::ValuesIn(kPages));

// ---- Single calls ----

TEST(TranslationCases, WorkAsWritten) {
  constexpr uint32_t kPad = NLS1_XLT_PAD, kBlanks = NLS1_XLT_BLANKS;
  const std::string units = raw(form_of(1200), {'A', 'B', 'C'});
  const struct {
    uint16_t to, from;
    std::string in;
    int32_t length;  // -1: measured
    int32_t size;
    uint32_t flags;
    FieldResult expected;
  } cases[] = {
      {1200, 367, "AB", 2, 1, 0, {-1, "", 0, 40}},
      {367, 367, "AB   ", 5, 2, kBlanks, {2, "AB", 2, 0}},
      {37, 367, "abc", 3, 10, kPad, {10, "\x81\x82\x83@@@@@@@", 3, 0}},
      {930, 57352, "日A", 4, 9, 0, {5, "\x0E\x45\x62\x0F\xC1", 4, 0}},
      {930, 57352, "日本", 6, 5, 0, {4, "\x0E\x45\x62\x0F", 3, 40}},  // the leave byte needs the last one's room
      {930, 57352, "A日", 2, 2, LX_OPT_CHARS, {2, "\xC1\x0E\x45\x62\x0F", 2, 0}},
      {367, 930, "\x0E\x0E\x0F\x0F\xC1\x0F\x0F", 7, 9, 0, {1, "A", 7, 0}},
      {57352, 930, "\x0E\x41\x0E\x45\x66\x0F", 6, 3, 0, {3, "\xEF\xBF\xBD", 3, 40}},  // no enter byte
      {930, 933, "\xC1\x0E\x88\x61\x0F", 5, 2, 0, {2, "\xC1\x3F", 5, 0}},  // the shift byte behind goes with it
      {367, 1200, units, 6, 5, 0, {2, "AB", 4, 40}},                       // one byte each uses half of the room
      {367, 1200, units, 5, 4, 0, {2, "AB", 4, 0}},                        // half a unit is none
      {1200, 1200, units, 6, 2, LX_OPT_TERMINATE | kPad, {6, units, 6, 0}},
  };
  for (const auto& one : cases) {
    SCOPED_TRACE(std::to_string(one.from) + " to " + std::to_string(one.to) + ": " + hex(one.in));
    alignas(2) char in[64] = {}, out[64] = {};
    one.in.copy(in, sizeof in);
    FieldResult got;
    got.count =
        NLS1_TranslateString(one.to, out, one.size, one.from, in, one.length, &got.consumed, one.flags, &got.error);
    got.written.assign(out, one.expected.written.size());
    EXPECT_EQ(got, one.expected) << got.count << ' ' << hex(got.written) << got.consumed << ' ' << got.error;
  }
}

TEST(TranslationCases, AbsentBuffersHaveNoLength) {
  constexpr uint32_t kTerminate = LX_OPT_TERMINATE, kPad = NLS1_XLT_PAD;
  const char* in = "AB";
  alignas(2) char out[8];
  const struct {
    uint16_t to;
    char* out;
    int32_t size;
    const char* in;
    int32_t length;
    uint32_t flags;
    int32_t count;
  } cases[] = {{367, nullptr, 8, in, 2, kTerminate, 0},
               {367, out, -1, in, 2, kTerminate | kPad, 0},
               {367, out, 0, in, 2, kPad, 0},
               {367, out, 8, nullptr, 2, kPad, 0},
               {367, out, 8, nullptr, -1, kTerminate, 1},
               {1200, out, 1, nullptr, 0, kTerminate, 1},
               {1200, out, 2, nullptr, 0, kTerminate, 1},
               {1200, nullptr, 2, nullptr, -1, kTerminate, 0}};
  for (const auto& one : cases) {
    std::memset(out, 'Z', sizeof out);
    int32_t consumed = 99;
    uint32_t error = 99;
    EXPECT_EQ(NLS1_TranslateString(one.to, one.out, one.size, 367, one.in, one.length, &consumed, one.flags, &error),
              one.count);
    EXPECT_EQ(consumed, 0);
    EXPECT_EQ(error, LX_OK);
    const size_t zeros = one.count == 0 ? 0 : one.to == 1200 && one.size > 1 ? 2 : 1;
    EXPECT_EQ(std::string(out, sizeof out), std::string(zeros, '\0') + std::string(sizeof out - zeros, 'Z'));
  }
  EXPECT_EQ(NLS1_TranslateString(37, out, 8, 367, "A", 1, nullptr, 0, nullptr), 1) << "results are optional";
}

TEST(TranslationCases, RefuseFlagsAndPages) {
  char out[4] = "ZZZ";
  for (uint32_t flag = 1; flag != 0; flag <<= 1) {
    if ((flag & kAllFlags) != 0) continue;
    int32_t consumed = 99;
    uint32_t error = 99;
    EXPECT_EQ(NLS1_TranslateString(9999, out, 4, 367, "A", 1, &consumed, flag | NLS1_XLT_PAD, &error), -1);
    EXPECT_EQ(error, LX_E_ARGUMENT) << std::hex << flag;
    EXPECT_EQ(consumed, 0);
  }
  for (auto [to, from] : {std::pair<uint16_t, uint16_t>{9999, 367}, {367, 9999}, {1200, 0}, {0xFFFF, 1200}}) {
    for (int32_t length : {0, 1}) {
      TraceCapture trace;
      uint32_t error = 99;
      EXPECT_EQ(NLS1_TranslateString(to, out, 4, from, "A", length, nullptr, LX_OPT_TERMINATE, &error), -1);
      EXPECT_EQ(error, LX_E_CODEPAGE) << from << " to " << to;
      const int missing = from == 9999 || from == 0 ? from : to;
      EXPECT_TRUE(trace.has("Unable to locate codepage " + std::to_string(missing))) << trace.all();
    }
  }
  EXPECT_STREQ(out, "ZZZ");
}

TEST(TranslationCases, SayWhatTheyDo) {
  const struct {
    uint16_t to, from;
    std::vector<const char*> messages;
  } cases[] = {
      {37, 819, {"Source codepage 819 is single byte", "Target codepage 37 is single byte"}},
      {932, 37, {"Target codepage 932 is not shift sensitive", "Process SingleByte Input, Multi-byte output "}},
      {930,
       37,
       {"Target codepage 930 is shift sensitive, Shift-In=0E, Shift-Out=0f",
        "Process SingleByte Input, Extended Multi-byte output "}},
      {57352,
       1399,
       {"Source codepage 1399 is shift sensitive, Shift-In=0E, Shift-Out=0f",
        "Process Multi-Byte Input, Multi-byte output ", "Source length = 1"}},
      {930, 57352, {"Process multi-byte Input, Extended Multi-byte output "}}};
  for (const auto& one : cases) {
    TraceCapture trace;
    char out[8];
    NLS1_TranslateString(one.to, out, sizeof out, one.from, "\xC1", -1, nullptr, 0, nullptr);
    for (const char* message : one.messages) EXPECT_TRUE(trace.has(message)) << message << "\n" << trace.all();
  }
}

// ---- Records ----

// Text cut into host records of a fixed length: every record stands by itself, and none of the text is lost. Where a
// call ends inside a run of a host page, the next one is told so by an enter byte.
TEST(Records, AreBalancedAtEveryLength) {
  static constexpr std::u16string_view kRuns[] = {
      u"山田太郎様",           u"AB", u"東京都", u"X",    u"一", u"あいうえおかきくけこ",
      u"12345678901234567890", u"日", u"C",      u"本語", u"-"};
  std::u16string text;
  for (size_t i = 0; i < 4; ++i) {
    for (std::u16string_view run : kRuns) text += run.substr(0, run.size() - i % run.size());
  }
  EdgeBuffer out(64), rest(4096);
  for (uint16_t to : {uint16_t{930}, uint16_t{1399}, uint16_t{57352}, uint16_t{932}}) {
    for (uint16_t from : {uint16_t{LX_CP_UTF8}, uint16_t{LX_CP_UCS2}, uint16_t{932}, uint16_t{930}, uint16_t{1399}}) {
      const Form target = form_of(to), source = form_of(from);
      for (int32_t length = 0; length <= 40; ++length) {
        SCOPED_TRACE(std::to_string(from) + " to " + std::to_string(to) + ", " + std::to_string(length));
        std::string in = spelled_bytes(from, text);
        std::u16string found;
        while (!in.empty()) {
          char* record = out.room(static_cast<size_t>(length));
          int32_t consumed = 99;
          uint32_t error = 99;
          const int32_t count = NLS1_TranslateString(to, record, length, from, rest.text(in),
                                                     static_cast<int32_t>(in.size()), &consumed, 0, &error);
          ASSERT_TRUE(count >= 0 && count <= length);
          const Units units = units_of({record, static_cast<size_t>(count)});
          const Characters part = characters_of(target, units, 1);
          EXPECT_TRUE(!part.cut && part.state == 0) << hex_units(units);
          std::u16string characters;
          for (const Character& c : part.list) characters += unicode_of(target, c);
          EXPECT_EQ(units, spelled(target, characters)) << "no shift byte more than needed";
          found += characters;
          if (consumed == 0) break;
          const uint32_t state =
              characters_of(source, units_in(source, in.substr(0, static_cast<size_t>(consumed)))).state;
          in.erase(0, static_cast<size_t>(consumed));
          ASSERT_EQ(error, in.empty() ? LX_OK : LX_E_BUFFER);
          if (state != 0) in.insert(in.begin(), static_cast<char>(source.page->enter));
        }
        EXPECT_EQ(found == text, length >= (target.follows_shifts() ? 4 : target.page->max_length));
      }
    }
  }
}

}  // namespace
}  // namespace lx::test
