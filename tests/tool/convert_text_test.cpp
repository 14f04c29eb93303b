// SPDX-License-Identifier: Apache-2.0
// What comes out of a conversion.
#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using ConvertText = ToolTest;

struct TextCase {
  const char* from;
  const char* to;
  Arguments options;
  const char* input;   // as hexadecimal digits
  const char* output;  // the same
  int status;
};

void expect_conversions(const std::vector<TextCase>& cases) {
  for (const TextCase& c : cases) {
    Arguments arguments = {"convert", "-f", c.from, "-t", c.to};
    arguments.insert(arguments.end(), c.options.begin(), c.options.end());
    const ToolResult result = run_tool(arguments, bytes(c.input));
    EXPECT_EQ(result.output, bytes(c.output)) << c.from << " to " << c.to << ", " << c.input << ": " << result.errors;
    EXPECT_EQ(result.status, c.status) << c.from << " to " << c.to << ", " << c.input << ": " << result.errors;
  }
}

TEST_F(ConvertText, KnownTexts) {
  expect_conversions({
      {"IBM037", "UTF-8", {}, "C8 85 93 93 96 5A 15", "48 65 6C 6C 6F 21 C2 85", 0},
      {"UTF-8", "IBM037", {}, "48 65 6C 6C 6F 21 0A", "C8 85 93 93 96 5A 25", 0},
      {"IBM1140", "UTF-8", {}, "9F", "E2 82 AC", 0},
      {"UTF-8", "IBM930", {}, "41 E3 81 82 E3 81 84 42", "C1 0E 4481 4482 0F C2", 0},
      {"IBM930", "UTF-8", {}, "C1 0E 4481 4482 0F C2", "41 E3 81 82 E3 81 84 42", 0},
      {"IBM930", "MS932", {}, "C1 0E 4481 0F C2", "41 82A0 42", 0},
      {"MS932", "IBM930", {}, "41 82A0", "C1 0E 4481 0F", 0},
      {"UTF-8", "UTF-8", {}, "E3 81 82 00 41", "E3 81 82 00 41", 0},
  });
}

TEST_F(ConvertText, WhatTheTargetLacks) {
  expect_conversions({
      {"UTF-8", "IBM037", {}, "41 E2 82 AC 42", "C1 3F C2", 1},
      {"UTF-8", "IBM037", {"-c"}, "41 E2 82 AC 42", "C1 C2", 1},
      {"UTF-8", "Latin1", {}, "41 E2 82 AC 42", "41 1A 42", 1},
      {"UTF-8", "IBM930", {"-c"}, "E3 81 82 C2 B2 E3 81 84", "0E 4481 4482 0F", 1},
  });
}

TEST_F(ConvertText, MalformedInput) {
  expect_conversions({
      {"UTF-8", "UTF-8", {}, "41 FF 42", "41 EF BF BD 42", 1},
      {"UTF-8", "UTF-8", {"-c"}, "41 FF 42", "41 42", 1},
      {"UTF-8", "UTF-8", {}, "41 E3 81 42", "41 EF BF BD 42", 1},
      {"UTF-8", "UTF-8", {}, "41 E3 81", "41 EF BF BD", 1},
      {"UTF-8", "UTF-8", {"-c"}, "41 E3 81", "41", 1},
      {"UTF-8", "UTF-8", {}, "C0 80", "EF BF BD EF BF BD", 1},
      {"MS932", "UTF-8", {}, "41 82", "41 EF BF BD", 1},
  });
}

// Next line, line feed, carriage return and line feed, and a lone carriage return, in three families of pages.
TEST_F(ConvertText, LineEnds) {
  const struct {
    const char* page;
    const char* text;  // a NL b LF c CR LF d CR e
    const char* lf;
    const char* nel;
    const char* crlf;
    const char* carriage_return;
    const char* letters[5];
  } pages[] = {
      {"IBM037", "81 15 82 25 83 0D25 84 0D 85", "25", "15", "0D25", "0D", {"81", "82", "83", "84", "85"}},
      {"IBM1047", "81 15 82 25 83 0D25 84 0D 85", "25", "15", "0D25", "0D", {"81", "82", "83", "84", "85"}},
      {"IBM930", "62 15 63 25 64 0D25 65 0D 66", "25", "15", "0D25", "0D", {"62", "63", "64", "65", "66"}},
      {"UTF-8", "61 C285 62 0A 63 0D0A 64 0D 65", "0A", "C285", "0D0A", "0D", {"61", "62", "63", "64", "65"}},
  };
  for (const auto& from : pages) {
    for (const auto& to : pages) {
      const auto text = [&](const std::string& nel, const std::string& lf, const std::string& crlf) {
        return to.letters[0] + nel + to.letters[1] + lf + to.letters[2] + crlf + to.letters[3] + to.carriage_return +
               to.letters[4];
      };
      const std::string keep = text(to.nel, to.lf, to.crlf);
      const std::string lf = text(to.lf, to.lf, to.lf);
      const std::string nel = text(to.nel, to.nel, to.nel);
      const std::string crlf = text(to.crlf, to.crlf, to.crlf);
      expect_conversions({{from.page, to.page, {}, from.text, keep.c_str(), 0},
                          {from.page, to.page, {"--nl", "keep"}, from.text, keep.c_str(), 0},
                          {from.page, to.page, {"--nl", "lf"}, from.text, lf.c_str(), 0},
                          {from.page, to.page, {"--nl", "nel"}, from.text, nel.c_str(), 0},
                          {from.page, to.page, {"--nl", "crlf"}, from.text, crlf.c_str(), 0}});
    }
  }
  expect_conversions({
      {"IBM930", "UTF-8", {"--nl", "lf"}, "0E 4481 0F 15 0E 4482 0F", "E3 81 82 0A E3 81 84", 0},
      {"UTF-8", "IBM930", {"--nl", "nel"}, "E3 81 82 0A E3 81 84", "0E 4481 0F 15 0E 4482 0F", 0},
      {"UTF-8", "UTF-8", {"--nl", "lf"}, "61 0D", "61 0D", 0},
  });
}

// Each file is a text of its own: half a character or an open double-byte run ends with its file.
TEST_F(ConvertText, SeveralFiles) {
  const std::string open_run = write("open_run", bytes("0E 4481"));
  const std::string single = write("single", bytes("C1 C2"));
  const ToolResult shifted = run_tool({"convert", "-f", "IBM930", open_run, single});
  EXPECT_EQ(shifted.output,
            "\xE3\x81\x82"
            "AB");
  EXPECT_EQ(shifted.status, 1);
  EXPECT_NE(shifted.errors.find("open_run: 1 unbalanced shift"), std::string::npos) << shifted.errors;
  EXPECT_EQ(shifted.errors.find("single:"), std::string::npos) << shifted.errors;

  const std::string first_half = write("first_half", "x\xE3\x81");
  const std::string second_half = write("second_half", "\x82y");
  const ToolResult halves = run_tool({"convert", "-f", "UTF-8", first_half, "-", second_half}, std::string("-"));
  EXPECT_EQ(halves.output, "x\xEF\xBF\xBD-\xEF\xBF\xBDy");
  EXPECT_NE(halves.errors.find("first_half: 1 character cut off by the end (at byte 1"), std::string::npos)
      << halves.errors;
  EXPECT_NE(halves.errors.find("second_half: 1 malformed sequence (at byte 0"), std::string::npos) << halves.errors;

  const std::string japanese = write("japanese", "\xE3\x81\x82");
  const ToolResult closed = run_tool({"convert", "-t", "IBM930", japanese, japanese});
  EXPECT_EQ(closed.output, bytes("0E 4481 0F 0E 4481 0F"));
  EXPECT_EQ(closed.status, 0);
}

TEST_F(ConvertText, SummaryNamesFirstPositions) {
  const std::string file = write("in.txt", "ab\xE2\x82\xAC\xFF\xE2\x82\xAC\xFE\xE2\x82\xAC");
  const ToolResult result = run_tool({"convert", "-t", "IBM037", file});
  EXPECT_EQ(result.errors, "lexaro: " + file +
                               ": 3 characters replaced (first at byte 2: U+20AC), 2 malformed sequences (first at "
                               "byte 5: X'FF')\n");
}

}  // namespace
}  // namespace lx::test
