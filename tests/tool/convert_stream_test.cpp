// SPDX-License-Identifier: Apache-2.0
// Text that comes in pieces, and more of it than fits into memory.
#include <nlohmann/json.hpp>
#include <random>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using ConvertStream = ToolTest;

// Text with single- and double-byte characters, line ends of all kinds, and some damage.
std::string mixed_utf8(std::mt19937& random, std::size_t characters, bool damaged) {
  const char* const samples[] = {"a",
                                 "Z",
                                 "7",
                                 "\n",
                                 "\r\n",
                                 "\r",
                                 "\xC2\x85",
                                 "\xE3\x81\x82",
                                 "\xE3\x82\xA2",
                                 "\xE6\xBC\xA2",
                                 "\xEF\xBD\xB1",
                                 "\xE2\x82\xAC",
                                 "\xFF",
                                 "\xE3\x81",
                                 "\xF0\x9F\x98\x80"};
  const std::size_t kinds = damaged ? std::size(samples) : std::size(samples) - 4;
  std::string text;
  for (std::size_t i = 0; i < characters; ++i) text += samples[random() % kinds];
  return text;
}

// Bytes that a host page often gives a meaning beyond its letters, between any others.
std::string noise(std::mt19937& random, std::size_t size) {
  const char telling[] = {0x0E, 0x0F, 0x0D, 0x0A, 0x15, 0x25};
  std::string text;
  while (text.size() < size) {
    text += random() % 3 == 0 ? telling[random() % std::size(telling)] : static_cast<char>(random());
  }
  return text;
}

// However the text is cut into pieces, the result is that of the whole.
TEST_F(ConvertStream, PiecesMakeNoDifference) {
  std::mt19937 random(20240607);
  const Arguments pages[] = {{"-t", "IBM930"},
                             {"-f", "IBM930"},
                             {"-f", "MS932", "-t", "IBM939"},
                             {"-f", "EUC-TW"},
                             {"-f", "IBM037"},
                             {"-f", "IBM939", "-t", "IBM930"},
                             {"-f", "IBM037", "-t", "IBM500"}};
  const Arguments ways[] = {{}, {"--nl", "lf"}, {"--nl", "crlf", "-c"}, {"--verify"}};
  for (const Arguments& pair : pages) {
    for (const Arguments& way : ways) {
      Arguments arguments = {"convert", "--report", path("report"), "-o", "/dev/stdout"};
      arguments.insert(arguments.end(), pair.begin(), pair.end());
      arguments.insert(arguments.end(), way.begin(), way.end());
      const std::string text = pair[0] == "-t" ? mixed_utf8(random, 500, true) : noise(random, 1000);
      const ToolResult whole = run_tool(arguments, text);
      const std::string report = read("report");

      std::size_t done = 0;
      ToolInput pieces;
      pieces.wait_for_reader = true;
      pieces.next = [&](std::string& piece) {
        piece = text.substr(done, 1 + random() % 5);
        done += piece.size();
        return !piece.empty();
      };
      const ToolResult cut = run_tool(arguments, pieces);
      const std::string what = testing::PrintToString(arguments);
      EXPECT_TRUE(cut.output == whole.output) << what;
      EXPECT_EQ(cut.errors, whole.errors) << what;
      EXPECT_EQ(cut.status, whole.status) << what;
      EXPECT_EQ(read("report"), report) << what;
    }
  }
}

TEST_F(ConvertStream, ThereAndBackAgain) {
  std::mt19937 random(7);
  const std::string text = mixed_utf8(random, 400000, false);
  for (const char* page : {"IBM930", "IBM939", "IBM1390"}) {
    const ToolResult there = run_tool({"convert", "--verify", "-t", page}, text);
    EXPECT_EQ(there.status, 0) << page << ": " << there.errors;
    const ToolResult back = run_tool({"convert", "-f", page}, there.output);
    EXPECT_EQ(back.status, 0) << page << ": " << back.errors;
    EXPECT_TRUE(back.output == text) << page;
  }
}

ToolInput repeated(const std::string& block, int times) {
  ToolInput input;
  input.keep_output = false;
  input.next = [block, times](std::string& piece) mutable {
    piece = block;
    return times-- > 0;
  };
  return input;
}

TEST_F(ConvertStream, MemoryStaysSmall) {
  std::mt19937 random(11);
  const std::string good = mixed_utf8(random, 40000, false);
  const std::string damaged = mixed_utf8(random, 40000, true);
  std::string shifts;  // around nothing: input that yields no output
  for (int i = 0; i < 50000; ++i) shifts += "\x0E\x0F";
  std::string lines;
  for (int i = 0; i < 50000; ++i) lines += "\r\n";
  const struct {
    Arguments arguments;
    const std::string& block;
    int status;
  } cases[] = {{{"convert", "-t", "IBM930", "--verify"}, good, 0},
               {{"convert", "-t", "IBM930", "-o", "/dev/null", "--report", "-", "-s"}, damaged, 1},
               {{"convert", "-f", "IBM930", "--verify"}, shifts, 1},
               {{"convert", "-t", "IBM037", "--nl", "nel"}, lines, 0}};
  for (const auto& c : cases) {
    const int times = static_cast<int>((std::size_t{48} << 20) / c.block.size());
    const ToolResult result = run_tool(c.arguments, repeated(c.block, times));
    EXPECT_EQ(result.status, c.status) << result.errors;
#ifndef LEXARO_SANITIZED
    EXPECT_LT(result.peak_kib, 24 * 1024) << c.arguments[2];
#endif
  }
}

// What was read is converted and written at once: a reader of a slow pipe need not wait for more.
TEST_F(ConvertStream, OutputFollowsInput) {
  ToolInput input;
  input.output_path = path("seen");
  int step = 0;
  std::string seen_before_end;
  input.wait_for_reader = true;
  input.next = [&](std::string& piece) {
    piece = "\xC1";
    if (step == 1) {
      for (int tries = 0; tries < 1000000 && seen_before_end.empty(); ++tries) seen_before_end = read("seen");
    }
    return step++ < 1;
  };
  EXPECT_EQ(run_tool({"convert", "-f", "37"}, input).status, 0);
  EXPECT_EQ(seen_before_end, "A");
}

TEST_F(ConvertStream, ProgressIsTakenAway) {
  const std::string text(3 << 20, 'a');
  const std::string file = write("in", text);
  const ToolResult result = run_tool({"convert", "-t", "37", "--progress", file, "-o", path("out")});
  EXPECT_EQ(result.status, 0);
  EXPECT_NE(result.errors.find("of 3.1 MB ("), std::string::npos) << result.errors;
  ASSERT_FALSE(result.errors.empty());
  EXPECT_EQ(result.errors.back(), '\r');
  EXPECT_EQ(run_tool({"convert", "-t", "37", file, "-o", path("out")}).errors, "");
}

}  // namespace
}  // namespace lx::test
