// SPDX-License-Identifier: Apache-2.0
// Single calls: worked examples, bad arguments, absent buffers, messages.
#include <gtest/gtest.h>
#include <lexaro/nls1.h>

#include <cstring>
#include <vector>

#include "nls1/translation_model.hpp"
#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

using namespace std::string_literals;

constexpr uint32_t kTerminate = LX_OPT_TERMINATE, kChars = LX_OPT_CHARS;
constexpr uint32_t kPad = NLS1_XLT_PAD, kBlanks = NLS1_XLT_BLANKS;

struct Case {
  uint16_t to, from;
  std::string in;
  int32_t length;  // -1: measured
  int32_t size;
  uint32_t flags;
  FieldResult expected;
};

TEST(TranslationCases, WorkAsWritten) {
  const std::string kanji = "\x0E\x45\x66\x45\xB4\x0F"s;  // two characters of IBM930
  const Case cases[] = {
      {1200, 367, "AB", 2, 4, 0, {4, ucs2_bytes(u"AB"), 2, 0}},
      {1200, 367, "AB", 2, 1, 0, {-1, "", 0, 40}},
      {1200, 367, "AB", 2, 1, kChars, {1, ucs2_bytes(u"A"), 1, 40}},
      {1200, 367, "AB", 2, 5, kTerminate, {4, ucs2_bytes(u"A\0"s), 1, 40}},
      {367, 367, "AB   ", 5, 2, kBlanks, {2, "AB", 2, 0}},
      {367, 367, "AB   ", 5, 2, 0, {2, "AB", 2, 40}},
      {37, 367, "abc", 3, 10, kPad, {10, "\x81\x82\x83@@@@@@@", 3, 0}},
      {37, 367, "abc", 3, 10, kPad | kTerminate, {10, "\x81\x82\x83@@@@@@\0"s, 3, 0}},
      {367, 37, "\x81\x82", -1, 2, 0, {2, "ab", 2, 0}},
      {367, 37, "\x81\x82", -1, 3, 0, {3, "ab\0"s, 2, 0}},
      {930, 57352, "日A", 4, 9, 0, {5, "\x0E\x45\x62\x0F\xC1", 4, 0}},
      // The leave byte needs the room of the last character.
      {930, 57352, "日本", 6, 5, 0, {4, "\x0E\x45\x62\x0F", 3, 40}},
      {930, 57352, "日本", 6, 6, 0, {6, "\x0E\x45\x62\x45\x66\x0F", 6, 0}},
      {930, 57352, "A日", 4, 4, 0, {1, "\xC1", 1, 40}},
      {930, 57352, "A日", 2, 2, kChars, {2, "\xC1\x0E\x45\x62\x0F", 2, 0}},
      // Shift bytes: repeated, a run that has not begun, behind the last character.
      {367, 930, "\x0E\x0E\x0F\x0F\xC1\x0F\x0F", 7, 9, 0, {1, "A", 7, 0}},
      {57352, 930, "\xC1" + kanji, 7, 1, 0, {1, "A", 1, 40}},
      {57352, 930, "\x0E\x45\x66\x0F", -1, 1, kChars, {1, "本", 1, 0}},
      {57352, 930, "\x0E\x45\x66\x45", -1, 1, kChars, {1, "本", 1, 0}},
      {57352, 930, "\x0E\x45\x66\x45", 4, 9, 0, {3, "本", 3, 0}},
      // A double-byte character that ends in the enter byte is not cut.
      {57352, 930, "\x0E\x41\x0E\x45\x66\x0F", 6, 3, 0, {3, "\xEF\xBF\xBD", 3, 40}},
      // UCS-2 into one byte each uses half of the room; UCS-2 into itself does not ask for room.
      {367, 1200, ucs2_bytes(u"ABCDEF"), 12, 10, 0, {5, "ABCDE", 10, 40}},
      {367, 1200, ucs2_bytes(u"ABCDE "), 12, 10, kBlanks, {5, "ABCDE", 10, 0}},
      {1200, 1200, ucs2_bytes(u"ABC"), 6, 2, kTerminate | kPad, {6, ucs2_bytes(u"ABC"), 6, 0}},
  };
  for (const Case& one : cases) {
    SCOPED_TRACE(std::to_string(one.from) + " to " + std::to_string(one.to) + ": " + hex(one.in) + ", size " +
                 std::to_string(one.size));
    alignas(2) char in[64] = {}, out[64] = {};
    one.in.copy(in, sizeof in);
    FieldResult got;
    got.count =
        NLS1_TranslateString(one.to, out, one.size, one.from, in, one.length, &got.consumed, one.flags, &got.error);
    got.written.assign(out, one.expected.written.size());
    EXPECT_EQ(got.count, one.expected.count);
    EXPECT_EQ(got.consumed, one.expected.consumed);
    EXPECT_EQ(got.error, one.expected.error);
    EXPECT_EQ(hex(got.written), hex(one.expected.written));
  }
}

TEST(TranslationCases, AbsentBuffersHaveNoLength) {
  const std::string in = "AB";
  alignas(2) char out[8];
  const struct {
    uint16_t to;
    char* out;
    int32_t size;
    const char* in;
    int32_t length;
    uint32_t flags;
    int32_t count;
  } cases[] = {
      {367, nullptr, 8, in.data(), 2, 0, 0},
      {367, nullptr, 8, in.data(), 2, kTerminate, 0},
      {367, out, -1, in.data(), 2, kTerminate | kPad, 0},
      {367, out, 0, in.data(), 2, kPad, 0},
      {367, out, 8, nullptr, 2, kPad, 0},
      {367, out, 8, nullptr, -1, kTerminate, 1},
      {1200, out, 1, nullptr, 0, kTerminate, 1},
      {1200, out, 2, nullptr, 0, kTerminate, 1},
      {1200, nullptr, 2, nullptr, -1, kTerminate, 0},
  };
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
  for (unsigned bit = 0; bit < 32; ++bit) {
    const uint32_t flag = 1u << bit;
    if ((flag & (kTerminate | kChars | kPad | kBlanks)) != 0) continue;
    int32_t consumed = 99;
    uint32_t error = 99;
    EXPECT_EQ(NLS1_TranslateString(9999, out, 4, 367, "A", 1, &consumed, flag | kPad, &error), -1);
    EXPECT_EQ(error, LX_E_ARGUMENT) << std::hex << flag;
    EXPECT_EQ(consumed, 0);
  }
  for (auto [to, from] : {std::pair<uint16_t, uint16_t>{9999, 367}, {367, 9999}, {1200, 0}, {0xFFFF, 1200}}) {
    for (int32_t length : {0, 1}) {
      TraceCapture trace;
      uint32_t error = 99;
      EXPECT_EQ(NLS1_TranslateString(to, out, 4, from, "A", length, nullptr, kTerminate, &error), -1);
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
      {367, 932, {"Source codepage 932 is not shift sensitive", "Process Multi-Byte Input, Multi-byte output "}},
      {930, 57352, {"Process multi-byte Input, Extended Multi-byte output "}},
  };
  for (const auto& one : cases) {
    TraceCapture trace;
    char out[8];
    NLS1_TranslateString(one.to, out, sizeof out, one.from, "\xC1", -1, nullptr, 0, nullptr);
    for (const char* message : one.messages) EXPECT_TRUE(trace.has(message)) << message << "\n" << trace.all();
  }
}

}  // namespace
}  // namespace lx::test
