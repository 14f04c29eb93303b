// SPDX-License-Identifier: Apache-2.0
// Lines in the order of a locale.
#include <algorithm>
#include <random>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using Sort = ToolTest;

TEST(SortText, InTheOrderOfTheLocale) {
  check_runs("sort --locale", {{"German", "Zebra\nÄpfel\nApfel\nöde\nOfen\nstraße\nstrasse\n",
                                "Apfel\nÄpfel\nöde\nOfen\nstrasse\nstraße\nZebra\n"},
                               {"sv_SE.ISO8859-1", "ö\nä\nå\nz\na\n", "a\nz\nå\nä\nö\n", 0, "is taken as"},
                               {"English@IBM037", "1\nA\na\nZ\n", "a\nA\nZ\n1\n"},
                               // equal lines keep their sequence, backwards too
                               {"English --ignore-case", "b\nA\na\nB\nA\n", "A\na\nA\nb\nB\n"},
                               {"English --ignore-case -r", "b\nA\na\nB\nA\n", "b\nB\nA\na\nA\n"},
                               {"English --ignore-case -u", "b\nA\na\nB\nA\n", "A\nb\n"},
                               {"English --ignore-case -u -r", "b\nA\na\nB\nA\n", "b\nA\n"},
                               {"English -u", "b\nA\na\nb\nA\n", "a\nA\nb\n"},
                               {"Japanese@Default --ignore-width -u", "Ａ\nA\nア\nｱ\n", "Ａ\nア\n"}});
  check_runs("sort", {{{}, "ö\nz\n", "z\nö\n", 0, "", {{"LX_LANG", "Swedish.ISO-8859-1"}}},
                      {{}, "ö\nz\n", "ö\nz\n", 0, "", {{"LX_LANG", "German"}}}});
}

TEST(SortText, LineEnds) {
  check_runs("sort --locale English -f",
             {{"UTF-8", "", ""},
              {"UTF-8", "b\na", "a\nb\n"},
              {"UTF-8", "b\r\na", "a\r\nb\r\n"},
              {"UTF-8", "b\r\na\na\r\n", "a\na\r\nb\r\n"},
              {"UTF-8", "b\n\n\na\n", "\n\na\nb\n"},
              {"IBM-1047", bytes("82 15 81 15 C1"), bytes("81 15 C1 15 82 15")},
              {"IBM-1047", bytes("82 0D25 81"), bytes("81 0D25 82 0D25")},
              {"IBM-930", bytes("0E4482 0F 15 0E4481 0F 15"), bytes("0E4481 0F 15 0E4482 0F 15")},
              // a zero byte is a character like others
              {"UTF-8", bytes("62 00 62 0A 62 00 61 0A"), bytes("62 00 61 0A 62 00 62 0A")}});
}

TEST(SortText, PrintsKeys) {
  const ToolResult result = run_tool("sort --locale French --keys", std::string("côté\ncote\nCôte\n\n"));
  std::string last, texts;
  for (const std::string& line : lines_of(result.output)) {
    const std::string key = line.substr(0, line.find('\t'));
    texts += line.substr(key.size()) + "\n";
    EXPECT_EQ(key.find_first_not_of("0123456789ABCDEF"), std::string::npos) << key;
    EXPECT_LT(std::exchange(last, key), key);
  }
  EXPECT_EQ(texts, "\t\n\tcote\n\tCôte\n\tcôté\n");
  check_runs("sort --locale English@BINARY --keys", {{"-f IBM-037", bytes("C1 25"), bytes("C3F1 05 C1 25")}});
}

TEST_F(Sort, Checks) {
  const std::string swedish = write("swedish", "a\nz\nå\nä\nö\n"), more = write("more", "ö\nö\n");
  const std::string host = write("host", bytes("81 25 83 25 82 25")), wild = write("wild", "b\na\x1B[31m\n");
  check_runs("sort --check --locale",
             {{{"Swedish", swedish}},
              {{"German", swedish}, "", "", 1, swedish + ": line 3 is out of order: å\n"},
              {{"Swedish", "-r", swedish}, "", "", 1, swedish + ": line 2 is out of order: z\n"},
              {{"Swedish", swedish, more}},
              {{"Swedish", "-u", swedish, more}, "", "", 1, more + ": line 1 is equal to the line before it: ö\n"},
              {{"English", "-f", "IBM-037", host}, "", "", 1, host + ": line 3 is out of order: b\n"},
              {{"English", write("empty", "")}},
              {{"English", wild}, "", "", 1, wild + ": line 2 is out of order: a?[31m\n"}});
}

// Nothing is lost, whatever the text is, and what was sorted passes the check.
TEST_F(Sort, KeepsEveryLineOfRandomText) {
  const char* const pieces[] = {"a", "B",    "ä",  "Å",    "-",   " ", "\n", "\r\n", "\xE3\x81\x82",
                                "😀", "\xFF", "ch", "\x0E", "\x15"};
  std::mt19937 random(17);
  const char* const pages[] = {"UTF-8", "ISO-8859-1", "IBM-037", "IBM-930", "MS932"};
  for (int round = 0; round < 15; ++round) {
    std::string text;
    for (int i = 0; i < 3000; ++i) text += pieces[random() % std::size(pieces)];
    text += "\n";
    const char* page = pages[random() % std::size(pages)];
    const std::string file = write("text", text + (page[0] == 'I' && page[1] == 'B' ? "\x25" : ""));
    const ToolResult result = run_tool({"sort", "--locale", "Czech", "-f", page, "-o", path("sorted"), file});
    EXPECT_TRUE(result.status == 0 || result.status == 1) << result.errors;
    std::string before = read("text"), after = read("sorted");
    const ToolResult check = run_tool({"sort", "--locale", "Czech", "-f", page, "--check", path("sorted")});
    EXPECT_EQ(check.errors.find("order:"), std::string::npos) << check.errors;
    std::sort(before.begin(), before.end());
    std::sort(after.begin(), after.end());
    EXPECT_EQ(before, after) << page;
  }
}

TEST(SortText, UnknownCharactersAreToldAndNotEqual) {
  const ToolResult result = run_tool("sort --locale English -u", std::string("x😁\nx\nx😀\nx\xFF\nx😁\n"));
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(lines_of(result.output).size(), 4u) << result.output;
  expect_told(result, "4 characters that the order does not know");
  expect_told(result, "the first in line 1");
}

TEST_F(Sort, FilesInAndOut) {
  const std::string one = write("one", "b\nd"), two = write("two", "c\na\n");
  check_runs(
      "sort --locale English",
      {{{one, two}, "", "a\nb\nc\nd"}, {{"-o", two, two}}, {{"-o", two, one, path("missing")}, "", "", 3, "missing"}});
  EXPECT_EQ(read("two"), "a\nc\n");
  EXPECT_EQ(files(), (std::vector<std::string>{"one", "two"}));
}

TEST_F(Sort, ExitCodes) {
  check_runs("sort", {{"--locale Swedisch", "", "", 4, "Swedish"},
                      {"--locale English@Swedis", "", "", 4, "Swedish"},
                      {"-f IBM-9999", "", "", 4, "IBM-9999"},
                      {{path("missing")}, "", "", 3, "missing"},
                      {{path("")}, "", "", 3, "directory"},
                      {"--ignore-case --ignore-width", "", "", 2, "--ignore"},
                      {"--check --keys", "", "", 2, "--keys"},
                      {"--check -o out", "", "", 2, "--output"},
                      {"--backwards", "", "", 2, "--backwards"}});
}

#ifndef LEXARO_SANITIZED
// Sanitizers want address space of their own.
TEST(SortText, TooLargeForMemory) {
  const struct {
    std::string piece;
    const char* message;
  } cases[] = {{std::string(65536, 'x'), "longer than"}, {"word\nother word\n", "not enough memory"}};
  for (const auto& one : cases) {
    std::string piece;
    while (piece.size() < 65536) piece += one.piece;
    const ToolResult result =  // of 250 MiB
        run_in_shell("ulimit -v 300000; exec \"$0\" sort --locale English", repeated(piece, 4000));
    EXPECT_EQ(result.status, 3) << result.signal;
    EXPECT_EQ(result.output_size, 0u);
    expect_told(result, one.message);
  }
}
#endif

}  // namespace
}  // namespace lx::test
