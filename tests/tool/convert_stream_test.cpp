// SPDX-License-Identifier: Apache-2.0
// Text that comes in pieces, and more of it than fits into memory.
#include <random>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using ConvertStream = ToolTest;

// Text with single- and double-byte characters, line ends of all kinds, and some damage.
std::string mixed_utf8(std::mt19937& random, std::size_t characters, bool damaged) {
  const char* const samples[] = {"a",  "Z",  "7", "\n", "\r\n", "\r",       "\u0085", "あ",
                                 "ア", "漢", "ｱ", "€",  "\xFF", "\xE3\x81", "😀"};
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
  const Arguments pages[] = {"-t IBM930", "-f IBM930",           "-f MS932 -t IBM939", "-f EUC-TW",
                             "-f IBM037", "-f IBM939 -t IBM930", "-f IBM037 -t IBM500"};
  const Arguments ways[] = {{}, "--nl lf", "--nl crlf -c", "--verify"};
  for (const Arguments& pair : pages) {
    for (const Arguments& way : ways) {
      const Arguments options = {"convert", "--report", path("report"), "-o", "/dev/stdout"};
      const Arguments arguments = options + pair + way;
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

TEST_F(ConvertStream, MemoryStaysSmall) {
  std::mt19937 random(11);
  const std::string good = mixed_utf8(random, 40000, false);
  const std::string damaged = mixed_utf8(random, 40000, true);
  const std::string cards(1000000, '\xC1');
  std::string shifts, lines;  // shifts around nothing: input that yields no output
  for (int i = 0; i < 50000; ++i) {
    shifts += "\x0E\x0F";
    lines += "\r\n";
  }
  const struct {
    Arguments arguments;
    const std::string& block;
    int status;
  } cases[] = {{"records -f 37 --length 80 -t 819", cards, 0},
               {"records -f 37 --length 80 -t UTF-8 --to-length 100", cards, 0},
               {"records -f 37 --length 80 -t UTF-8 --line-out", cards, 0},
               {"convert -t IBM930 --verify", good, 0},
               {"convert -t IBM930 -o /dev/null --report - -s", damaged, 1},
               {"convert -f IBM930 --verify", shifts, 1},
               {"convert -t IBM037 --nl nel", lines, 0}};
  for (const auto& c : cases) {
    const int times = static_cast<int>((std::size_t{48} << 20) / c.block.size());
    const ToolResult result = run_tool(c.arguments, repeated(c.block, times));
    EXPECT_EQ(result.status, c.status) << result.errors;
#ifndef LEXARO_SANITIZED
    EXPECT_LT(result.peak_kib, 32 * 1024) << testing::PrintToString(c.arguments);
#endif
  }
}

// What was read is converted and written at once: a reader of a slow pipe need not wait for more.
TEST_F(ConvertStream, OutputFollowsInput) {
  ToolInput input;
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
  EXPECT_EQ(run_in_shell("exec \"$0\" convert -f 37 > " + path("seen"), input).status, 0);
  EXPECT_EQ(seen_before_end, "A");
}

TEST_F(ConvertStream, ProgressIsTakenAway) {
  const std::string file = write("in", std::string(3 << 20, 'a'));
  const ToolResult result = run_tool({"convert", "-t", "37", "--progress", file, "-o", path("out")});
  EXPECT_EQ(result.status, 0);
  expect_told(result, "of 3.1 MB (");
  EXPECT_TRUE(result.errors.ends_with('\r')) << result.errors;
  check_runs("convert -t 37", {{{file, "-o", path("out")}}});
}

}  // namespace
}  // namespace lx::test
