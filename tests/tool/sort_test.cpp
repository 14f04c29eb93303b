// SPDX-License-Identifier: Apache-2.0
// Lines in the order of a locale.
#include <algorithm>
#include <random>
#include <sstream>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using Sort = ToolTest;

std::vector<std::string> lines_of(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream in(text);
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
}

ToolResult sort(Arguments arguments, const std::string& text) {
  arguments.insert(arguments.begin(), "sort");
  return run_tool(arguments, text);
}

TEST(SortText, InTheOrderOfTheLocale) {
  const struct {
    Arguments arguments;
    const char* text;
    const char* sorted;
  } cases[] = {
      {{"--locale", "German"},
       "Zebra\nÄpfel\nApfel\nöde\nOfen\nstraße\nstrasse\n",
       "Apfel\nÄpfel\nöde\nOfen\nstrasse\nstraße\nZebra\n"},
      {{"--locale", "Swedish"}, "ö\nä\nå\nz\na\n", "a\nz\nå\nä\nö\n"},
      {{"--locale", "sv_SE.ISO8859-1"}, "ö\nä\nå\nz\na\n", "a\nz\nå\nä\nö\n"},
      {{"--locale", "Danish"}, "Aarhus\nZ\nÅ\nØ\nÆ\nA\na\n", "A\na\nZ\nÆ\nØ\nÅ\nAarhus\n"},
      {{"--locale", "Czech"}, "chata\nhora\ncena\nibis\n", "cena\nhora\nchata\nibis\n"},
      {{"--locale", "Spanish"}, "ñu\nnz\no\n", "nz\nñu\no\n"},
      {{"--locale", "Turkish"}, "ızgara\niz\nhız\n", "hız\nızgara\niz\n"},
      {{"--locale", "English@BINARY"}, "b\na\nB\nä\n", "B\na\nb\nä\n"},
      {{"--locale", "English@IBM037"}, "1\nA\na\nZ\n", "a\nA\nZ\n1\n"},
      {{"--locale", "English"}, "co-op\ncoop\nCOOP\nco op\n\n", "\ncoop\nco op\nco-op\nCOOP\n"},
      // equal lines keep their sequence, backwards too
      {{"--locale", "English", "--ignore-case"}, "b\nA\na\nB\nA\n", "A\na\nA\nb\nB\n"},
      {{"--locale", "English", "--ignore-case", "-r"}, "b\nA\na\nB\nA\n", "b\nB\nA\na\nA\n"},
      {{"--locale", "English", "--ignore-case", "-u"}, "b\nA\na\nB\nA\n", "A\nb\n"},
      {{"--locale", "English", "--ignore-case", "-u", "-r"}, "b\nA\na\nB\nA\n", "b\nA\n"},
      {{"--locale", "English", "-u"}, "b\nA\na\nb\nA\n", "a\nA\nb\n"},
      {{"--locale", "Japanese@Default", "--ignore-width", "-u"}, "Ａ\nA\nア\nｱ\n", "Ａ\nア\n"},
  };
  for (const auto& one : cases) {
    const ToolResult result = sort(one.arguments, one.text);
    EXPECT_EQ(result.output, one.sorted) << testing::PrintToString(one.arguments) << result.errors;
    EXPECT_EQ(result.status, 0);
  }
}

TEST(SortText, LineEnds) {
  const struct {
    const char* page;
    std::string text, sorted;
  } cases[] = {
      {"UTF-8", "", ""},
      {"UTF-8", "\n", "\n"},
      {"UTF-8", "b", "b"},
      {"UTF-8", "a\nb", "a\nb"},
      {"UTF-8", "b\na", "a\nb\n"},
      {"UTF-8", "b\r\na", "a\r\nb\r\n"},
      {"UTF-8", "b\r\na\na\r\n", "a\na\r\nb\r\n"},
      {"UTF-8", "b\n\n\na\n", "\n\na\nb\n"},
      {"IBM-1047", bytes("82 15 81 15 C1"), bytes("81 15 C1 15 82 15")},
      {"IBM-1047", bytes("82 25 81 25 C1"), bytes("81 25 C1 25 82 25")},
      {"IBM-1047", bytes("82 0D25 81"), bytes("81 0D25 82 0D25")},
      {"IBM-930", bytes("0E4482 0F 15 0E4481 0F 15"), bytes("0E4481 0F 15 0E4482 0F 15")},
      {"MS932", bytes("8360 0A 8341 0A"), bytes("8341 0A 8360 0A")},
      // a zero byte is a character like others
      {"UTF-8", std::string("b\0b\nb\0a\n", 8), std::string("b\0a\nb\0b\n", 8)},
  };
  for (const auto& one : cases) {
    const ToolResult result = sort({"--locale", "English", "-f", one.page}, one.text);
    EXPECT_EQ(result.output, one.sorted) << one.page << " " << one.text << result.errors;
    EXPECT_EQ(result.status, 0);
  }
}

TEST(SortText, PrintsKeys) {
  const ToolResult result = sort({"--locale", "French", "--keys"}, "côté\ncote\nCôte\n\n");
  std::string last;
  std::string texts;
  for (const std::string& line : lines_of(result.output)) {
    const std::string key = line.substr(0, line.find('\t'));
    texts += line.substr(line.find('\t')) + "\n";
    EXPECT_EQ(key.find_first_not_of("0123456789ABCDEF"), std::string::npos) << key;
    EXPECT_EQ(key.size() % 2, 0u);
    EXPECT_LT(last, key);
    last = key;
  }
  EXPECT_EQ(texts, "\t\n\tcote\n\tCôte\n\tcôté\n");
  EXPECT_EQ(sort({"--locale", "English@BINARY", "--keys", "-f", "IBM-037"}, bytes("C1 25")).output,
            bytes("C3F1 05 C1 25"));
}

TEST_F(Sort, Checks) {
  const std::string swedish = write("swedish", "a\nz\nå\nä\nö\n");
  const struct {
    Arguments arguments;
    int status;
    std::string message;
  } cases[] = {
      {{"--locale", "Swedish", swedish}, 0, ""},
      {{"--locale", "German", swedish}, 1, swedish + ": line 3 is out of order: å\n"},
      {{"--locale", "Swedish", "-r", swedish}, 1, swedish + ": line 2 is out of order: z\n"},
      {{"--locale", "Swedish", swedish, write("more", "ö\nö\n")}, 0, ""},
      {{"--locale", "Swedish", "-u", swedish, path("more")},
       1,
       path("more") + ": line 1 is equal to the line before it: ö\n"},
      {{"--locale", "English", "-f", "IBM-037", write("host", bytes("81 25 83 25 82 25"))},
       1,
       path("host") + ": line 3 is out of order: b\n"},
      {{"--locale", "English", write("empty", "")}, 0, ""},
      {{"--locale", "English", write("wild", "b\na\x1B[31m\n")},
       1,
       path("wild") + ": line 2 is out of order: a?[31m\n"},
  };
  for (const auto& one : cases) {
    Arguments arguments = {"sort", "--check"};
    arguments.insert(arguments.end(), one.arguments.begin(), one.arguments.end());
    const ToolResult result = run_tool(arguments);
    EXPECT_EQ(result.status, one.status) << result.errors;
    EXPECT_EQ(result.errors, one.message.empty() ? "" : "lexaro: " + one.message);
    EXPECT_EQ(result.output, "");
  }
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
    std::string before = read("text");
    std::string after = read("sorted");
    const ToolResult check = run_tool({"sort", "--locale", "Czech", "-f", page, "--check", path("sorted")});
    EXPECT_EQ(check.errors.find("order:"), std::string::npos) << check.errors;
    std::sort(before.begin(), before.end());
    std::sort(after.begin(), after.end());
    EXPECT_EQ(before, after) << page;
  }
}

TEST(SortText, UnknownCharactersAreToldAndNotEqual) {
  const ToolResult result = sort({"--locale", "English", "-u"}, "x😁\nx\nx😀\nx\xFF\nx😁\n");
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(lines_of(result.output).size(), 4u) << result.output;
  EXPECT_NE(result.errors.find("4 characters that the order does not know"), std::string::npos) << result.errors;
  EXPECT_NE(result.errors.find("the first in line 1"), std::string::npos) << result.errors;
}

TEST_F(Sort, FilesInAndOut) {
  write("one", "b\nd");
  write("two", "c\na\n");
  EXPECT_EQ(run_tool({"sort", "--locale", "English", path("one"), path("two")}).output, "a\nb\nc\nd");
  EXPECT_EQ(run_tool({"sort", "--locale", "English", "-o", path("two"), path("two")}).status, 0);
  EXPECT_EQ(read("two"), "a\nc\n");
  EXPECT_EQ(run_tool({"sort", "--locale", "English", "-o", path("two"), path("one"), path("missing")}).status, 3);
  EXPECT_EQ(read("two"), "a\nc\n");
  EXPECT_EQ(files(), (std::vector<std::string>{"one", "two"}));
}

TEST_F(Sort, ExitCodes) {
  const struct {
    Arguments arguments;
    int status;
    const char* message;
  } cases[] = {
      {{"--locale", "Swedisch"}, 4, "Swedish"},
      {{"--locale", "English@Swedis"}, 4, "Swedish"},
      {{"-f", "IBM-9999"}, 4, "IBM-9999"},
      {{path("missing")}, 3, "missing"},
      {{path("")}, 3, "directory"},
      {{"--ignore-case", "--ignore-width"}, 2, "--ignore"},
      {{"--check", "--keys"}, 2, "--keys"},
      {{"--check", "-o", path("out")}, 2, "--output"},
      {{"--backwards"}, 2, "--backwards"},
  };
  for (const auto& one : cases) {
    const ToolResult result = sort(one.arguments, "");
    EXPECT_EQ(result.status, one.status) << testing::PrintToString(one.arguments);
    EXPECT_NE(result.errors.find(one.message), std::string::npos) << result.errors;
  }
}

TEST(SortText, TheUsersLocale) {
  ToolInput input;
  input.text = "ö\nz\n";
  input.environment = {{"LX_LANG", "Swedish.ISO-8859-1"}};
  EXPECT_EQ(run_tool({"sort"}, input).output, "z\nö\n");
  input.environment = {{"LX_LANG", "German"}};
  EXPECT_EQ(run_tool({"sort"}, input).output, "ö\nz\n");
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
    uint64_t left = 4000;  // 250 MiB
    ToolInput input;
    input.program = "/bin/sh";
    input.next = [&](std::string& text) {
      text = piece;
      return left-- > 0;
    };
    const ToolResult result =
        run_tool({"-c", "ulimit -v 300000; exec \"$0\" sort --locale English", LEXARO_TOOL}, input);
    EXPECT_EQ(result.status, 3) << result.signal;
    EXPECT_NE(result.errors.find(one.message), std::string::npos) << result.errors;
    EXPECT_EQ(result.output, "");
  }
}
#endif

}  // namespace
}  // namespace lx::test
