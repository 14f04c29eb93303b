// SPDX-License-Identifier: Apache-2.0
// Long random text through handles that report problems: where each stands and what it is must not depend on the runs
// in which text is moved, nor may the looking change the result.
#include <random>

#include "support/session.hpp"
#include "support/text_model.hpp"

namespace lx::test {
namespace {

struct Problem {
  uint64_t offset;
  uint32_t kind;
  std::string bytes;
  bool operator==(const Problem&) const = default;
};

struct Outcome {
  std::string output;
  std::vector<Problem> problems;
};

std::string shown(const std::vector<Problem>& problems) {
  std::string text;
  for (const Problem& problem : problems) {
    text += std::to_string(problem.offset) + ":" + std::to_string(problem.kind) + ":" + hex(problem.bytes) + " ";
  }
  return text;
}

void note(void* context, const LXConversionProblem* problem) {
  static_cast<std::vector<Problem>*>(context)->push_back(
      {problem->offset, problem->kind, {reinterpret_cast<const char*>(problem->bytes), problem->length}});
}

// In pieces and rooms of random size, or all at once.
Outcome run(LXLocale* target, LXLocale* source, uint32_t options, bool watched, std::string_view text,
            std::mt19937* random) {
  Outcome outcome;
  Conversion handle(LXOpenConversion(target, source, 0));
  if (watched) {
    EXPECT_EQ(LXSetConversionOptions(handle.get(), options, note, &outcome.problems), LX_OK);
  }
  Guarded memory(text);
  const char* in = memory.data();
  size_t left = text.size();
  char room[8192];
  uint32_t status = LX_OK;
  while (left != 0 || status == LX_E_FULL) {
    auto given = static_cast<int32_t>(random != nullptr ? std::min<size_t>(left, (*random)() % 100) : left);
    auto out_room = static_cast<int32_t>(random != nullptr ? (*random)() % 100 : sizeof room);
    int32_t rest = given;
    char* out = room;
    status = LXConvertBuffer(handle.get(), &out, &out_room, &in, &rest, 0);
    left -= static_cast<size_t>(given - rest);
    outcome.output.append(room, out);
  }
  char* out = room;
  int32_t out_room = sizeof room;
  EXPECT_EQ(LXFinishConversion(handle.get(), &out, &out_room), LX_OK);
  outcome.output.append(room, out);
  return outcome;
}

// Long runs of ASCII and of real text, now and then a byte that is anything.
std::string random_text(const PageSource& page, std::mt19937& random) {
  static const std::u16string kPieces[] = {
      u"0123456789abcdefghijklmnopqrstuvwxyz", u"é漢字", u"Жук", u"アイウ", u"한글", u" ", u"\n"};
  std::string text;
  while (text.size() < 600) {
    auto value = random();
    if (value % 8 == 0) {
      text += static_cast<char>(value >> 8);
    } else {
      text += encoded(page, kPieces[value / 8 % std::size(kPieces)]);
    }
  }
  return text;
}

class ConversionProblems : public testing::Test {
 protected:
  static void SetUpTestSuite() { session = std::make_unique<Session>(); }
  static void TearDownTestSuite() { session.reset(); }
  static std::unique_ptr<Session> session;
};
std::unique_ptr<Session> ConversionProblems::session;

constexpr uint16_t kIds[] = {819, 367, 37, 273, 932, 954, 964, 57352, 930, 1388};

TEST_F(ConversionProblems, LookingChangesNothing) {
  std::mt19937 random(1);
  for (uint16_t source : kIds) {
    for (uint16_t target : kIds) {
      Locale from = locale_of(PageSource::of(source).name);
      Locale to = locale_of(PageSource::of(target).name);
      for (int round = 0; round < 6; ++round) {
        std::string text = random_text(PageSource::of(source), random);
        Outcome plain = run(to.get(), from.get(), 0, false, text, nullptr);
        Outcome watched = run(to.get(), from.get(), 0, true, text, nullptr);
        ASSERT_EQ(hex(plain.output), hex(watched.output)) << source << " to " << target;
        Outcome cut = run(to.get(), from.get(), 0, true, text, &random);
        ASSERT_EQ(hex(cut.output), hex(watched.output)) << source << " to " << target;
        ASSERT_EQ(shown(cut.problems), shown(watched.problems)) << source << " to " << target;
      }
    }
  }
}

// Every character of the source in turn, where the first byte tells its length.
Outcome expected_outcome(const PageSource& to, const PageSource& from, std::string_view text, bool discard) {
  Outcome outcome;
  bool inside = false;
  auto put = [&](const std::string& code) {
    if (to.mixed() && inside != (code.size() > 1)) outcome.output += static_cast<char>(inside ? to.leave : to.enter);
    if (to.mixed()) inside = code.size() > 1;
    outcome.output += code;
  };
  for (size_t at = 0; at < text.size();) {
    std::string bytes(text.substr(at, from.length_of(static_cast<uint8_t>(text[at]))));
    bool cut = bytes.size() < from.length_of(static_cast<uint8_t>(text[at]));
    uint16_t unicode = cut ? kNoCharacter : from.decode(bytes);
    uint32_t kind = cut                       ? LX_PROBLEM_CUT
                    : unicode == kNoCharacter ? LX_PROBLEM_MALFORMED
                    : !to.has(unicode)        ? LX_PROBLEM_SUBSTITUTED
                                              : 0;
    if (kind != 0) outcome.problems.push_back({at, kind, bytes});
    if (kind == 0 || !discard) put(to.encode(unicode));
    at += bytes.size();
  }
  if (inside) outcome.output += static_cast<char>(to.leave);
  return outcome;
}

TEST_F(ConversionProblems, EachIsWhereItIs) {
  std::mt19937 random(2);
  for (uint16_t source : {uint16_t{819}, uint16_t{367}, uint16_t{37}, uint16_t{932}, uint16_t{954}, uint16_t{964}}) {
    for (uint16_t target : kIds) {
      const PageSource& from_page = PageSource::of(source);
      const PageSource& to_page = PageSource::of(target);
      Locale from = locale_of(from_page.name);
      Locale to = locale_of(to_page.name);
      for (bool discard : {false, true}) {
        for (int round = 0; round < 4; ++round) {
          std::string text = random_text(from_page, random);
          Outcome expected = expected_outcome(to_page, from_page, text, discard);
          Outcome got = run(to.get(), from.get(), discard ? LX_CONV_DISCARD : 0, true, text, &random);
          ASSERT_EQ(hex(got.output), hex(expected.output)) << from_page.name << " to " << to_page.name;
          ASSERT_EQ(shown(got.problems), shown(expected.problems)) << from_page.name << " to " << to_page.name;
        }
      }
    }
  }
}

// Well-formed UTF-8 by its table; a beginning of a row that goes no further is one malformed character.
Outcome strict_utf8(std::string_view text) {
  struct Row {
    unsigned first, first_end, second, second_end;
    size_t length;
  };
  static constexpr Row kRows[] = {
      {0x00, 0x7F, 0, 0, 1},       {0xC2, 0xDF, 0x80, 0xBF, 2}, {0xE0, 0xE0, 0xA0, 0xBF, 3},
      {0xE1, 0xEC, 0x80, 0xBF, 3}, {0xED, 0xED, 0x80, 0x9F, 3}, {0xEE, 0xEF, 0x80, 0xBF, 3},
      {0xF0, 0xF0, 0x90, 0xBF, 4}, {0xF1, 0xF3, 0x80, 0xBF, 4}, {0xF4, 0xF4, 0x80, 0x8F, 4},
  };
  Outcome outcome;
  auto byte = [&](size_t at) { return static_cast<unsigned>(static_cast<uint8_t>(text[at])); };
  for (size_t at = 0; at < text.size();) {
    const Row* row = nullptr;
    for (const Row& candidate : kRows) {
      if (byte(at) >= candidate.first && byte(at) <= candidate.first_end) row = &candidate;
    }
    size_t wanted = row != nullptr ? row->length : 1;
    size_t length = 1;
    while (length < wanted && at + length < text.size()) {
      unsigned low = length == 1 ? row->second : 0x80;
      unsigned high = length == 1 ? row->second_end : 0xBF;
      if (byte(at + length) < low || byte(at + length) > high) break;
      ++length;
    }
    std::string bytes(text.substr(at, length));
    uint32_t kind = 0;
    if (row != nullptr && length == wanted) {
      kind = wanted == 4 ? LX_PROBLEM_SUBSTITUTED : 0;
    } else {
      kind = row != nullptr && at + length == text.size() ? LX_PROBLEM_CUT : LX_PROBLEM_MALFORMED;
    }
    if (kind != 0) outcome.problems.push_back({at, kind, bytes});
    outcome.output += kind == 0 ? bytes : "\xEF\xBF\xBD";
    at += length;
  }
  return outcome;
}

TEST_F(ConversionProblems, StrictUtf8) {
  std::mt19937 random(3);
  Locale utf8 = locale_of("UTF-8");
  static constexpr unsigned char kBytes[] = {0x00, 0x41, 0x7F, 0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xBF, 0xC0, 0xC1, 0xC2,
                                             0xDF, 0xE0, 0xE1, 0xEC, 0xED, 0xEE, 0xEF, 0xF0, 0xF1, 0xF4, 0xF5, 0xFF};
  for (int round = 0; round < 2000; ++round) {
    std::string text = round % 2 == 0 ? random_text(PageSource::of(57352), random) : "";
    for (int i = round % 2 == 0 ? 100 : 0; i < 100; ++i) text += static_cast<char>(kBytes[random() % sizeof kBytes]);
    Outcome expected = strict_utf8(text);
    Outcome got = run(utf8.get(), utf8.get(), LX_CONV_STRICT, true, text, &random);
    ASSERT_EQ(hex(got.output), hex(expected.output));
    ASSERT_EQ(shown(got.problems), shown(expected.problems));
  }
}

}  // namespace
}  // namespace lx::test
