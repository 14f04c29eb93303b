// SPDX-License-Identifier: Apache-2.0
// The audit, and converting back.
#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using ConvertReport = ToolTest;

TEST_F(ConvertReport, CountsAndPositions) {
  write("one", "ab\xE2\x82\xAC\xFF\xE2\x82\xAC\xE2");
  write("two", "c");
  const ToolResult result =
      run_in_shell("cd " + path("") + "; exec \"$0\" convert -f UTF-8 -t 37 -s -o out --report - one two");
  EXPECT_EQ(result.errors, "");
  expect_json(result.output, R"({
      "from": {"name": "UTF-8", "id": 57352}, "to": {"name": "IBM037", "id": 37}, "exit_status": 1,
      "files": [{
        "name": "one", "bytes_in": 10, "bytes_out": 6, "substituted": 2, "malformed": 1, "cut": 1, "shifts": 0,
        "substituted_characters": {"U+20AC": 2}, "malformed_sequences": {"FF": 1},
        "first_problems": [
          {"offset": 2, "kind": "substituted", "unicode": "U+20AC", "bytes": "E282AC"},
          {"offset": 5, "kind": "malformed", "unicode": "U+FFFD", "bytes": "FF"},
          {"offset": 6, "kind": "substituted", "unicode": "U+20AC", "bytes": "E282AC"},
          {"offset": 9, "kind": "cut", "unicode": "U+FFFD", "bytes": "E2"}]}, {"bytes_out": 1}],
      "totals": {"bytes_in": 11, "substituted": 2}})");
}

std::size_t count(const std::string& text, const std::string& part) {
  std::size_t found = 0;
  for (std::size_t at = 0; (at = text.find(part, at)) != std::string::npos; ++at) ++found;
  return found;
}

TEST_F(ConvertReport, StaysSmall) {
  std::string text;
  for (char32_t c = 0x3400; c < 0x3400 + 3000; ++c) {
    text += static_cast<char>(0xE0 | c >> 12);
    text += static_cast<char>(0x80 | (c >> 6 & 0x3F));
    text += static_cast<char>(0x80 | (c & 0x3F));
  }
  const std::string report = run_tool("convert -t 37 -o /dev/null --report -", text).output;
  expect_json(report, R"({"files": [{"name": "standard input", "substituted": 3000,
      "substituted_characters": {"U+3400": 1, "other": 2000}}]})");
  EXPECT_EQ(count(report, "\"kind\""), 20U);
  EXPECT_EQ(count(report, "\"U+"), 20U + 1000);
}

TEST_F(ConvertReport, WrittenWhenTheRunFails) {
  const std::string odd = write("odd\xFF\nname", "a");
  EXPECT_EQ(run_tool({"convert", "-t", "37", "-o", path("out"), "--report", path("r"), odd, path("no")}).status, 3);
  expect_json(read("r"), R"({"exit_status": 3, "files": [{"bytes_in": 1}]})");
  EXPECT_NE(read("r").find("No such file"), std::string::npos);
  EXPECT_EQ(files(), (std::vector<std::string>{"odd\xFF\nname", "r"}));
  EXPECT_EQ(run_tool({"convert", "-t", "37", "--report", path("no/r"), odd}).status, 3);
}

TEST_F(ConvertReport, VerifyFindsTheFirstDifference) {
  const struct {
    Arguments pages;
    const char* input;
    int offset;  // of the first difference; -1: none
    const char* message;
  } cases[] = {
      {"-f IBM037", "C8 85 93 93 96 15 25 0D", -1, ""},
      {"-f IBM930", "C1 0E 4481 4482 0F C2 0E 4481 0F", -1, ""},
      {"-t IBM930", "61 E3 81 82 62", -1, ""},
      {"-f IBM037", "", -1, ""},
      {"-t IBM037", "61 62 E2 82 AC 63", 2, "byte 2 (X'E2' comes back as X'1A')"},
      {"-f IBM930", "C1 0E 4481 0F 0E 4482 0F", 4, "byte 4 (X'0F' comes back as X'44')"},
      {"-f IBM930", "C1 0E 0F", 1, "byte 1 (X'0E' comes back as nothing)"},
      {"-f IBM930", "C1 0E 4481", 4, "byte 4 (the end comes back as X'0F')"},
      {"-f UTF-8", "61 E3 81", 1, "byte 1 (X'E3' comes back as X'EF')"},
  };
  for (const auto& c : cases) {
    const Arguments verify = {"convert", "--verify", "-o", path("out"), "--report", "-"};
    const ToolResult result = run_tool(verify + c.pages, bytes(c.input));
    EXPECT_EQ(result.status, c.offset < 0 ? 0 : 1) << c.input;
    expect_told(result, c.message);
    const std::string difference = R"(false,"first_difference":)" + std::to_string(c.offset);
    expect_json(result.output, R"({"files":[{"converts_back":)" + (c.offset < 0 ? "true" : difference) + "}]}");
    EXPECT_EQ(result.output.find("first_difference") == std::string::npos, c.offset < 0) << c.input;
  }
}

}  // namespace
}  // namespace lx::test
