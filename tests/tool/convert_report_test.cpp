// SPDX-License-Identifier: Apache-2.0
// The audit, and converting back.
#include <nlohmann/json.hpp>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using Json = nlohmann::json;
using ConvertReport = ToolTest;

TEST_F(ConvertReport, CountsAndPositions) {
  const std::string one = write("one", "ab\xE2\x82\xAC\xFF\xE2\x82\xAC\xE2");
  const std::string two = write("two", "c");
  const ToolResult result = run_tool({"convert", "-t", "37", "-s", "-o", path("out"), "--report", "-", one, two});
  ASSERT_EQ(result.status, 1) << result.errors;
  EXPECT_EQ(result.errors, "");
  const Json report = Json::parse(result.output);
  EXPECT_EQ(report["from"], (Json{{"name", "UTF-8"}, {"id", 57352}}));
  EXPECT_EQ(report["to"], (Json{{"name", "IBM037"}, {"id", 37}}));
  EXPECT_EQ(report["exit_status"], 1);
  ASSERT_EQ(report["files"].size(), 2U);

  const Json wanted = Json::parse(R"({
      "bytes_in": 10, "bytes_out": 6, "substituted": 2, "malformed": 1, "cut": 1, "shifts": 0,
      "substituted_characters": {"U+20AC": 2}, "malformed_sequences": {"FF": 1},
      "first_problems": [
        {"offset": 2, "kind": "substituted", "unicode": "U+20AC", "bytes": "E282AC"},
        {"offset": 5, "kind": "malformed", "unicode": "U+FFFD", "bytes": "FF"},
        {"offset": 6, "kind": "substituted", "unicode": "U+20AC", "bytes": "E282AC"},
        {"offset": 9, "kind": "cut", "unicode": "U+FFFD", "bytes": "E2"}]})");
  const Json& file = report["files"][0];
  EXPECT_EQ(file["name"], one);
  for (const auto& [key, value] : wanted.items()) EXPECT_EQ(file[key], value) << key;
  EXPECT_EQ(report["files"][1]["bytes_out"], 1);
  EXPECT_EQ(report["totals"]["bytes_in"], 11);
  EXPECT_EQ(report["totals"]["substituted"], 2);
}

TEST_F(ConvertReport, StaysSmall) {
  std::string text;
  for (char32_t c = 0x3400; c < 0x3400 + 3000; ++c) {
    text += static_cast<char>(0xE0 | c >> 12);
    text += static_cast<char>(0x80 | (c >> 6 & 0x3F));
    text += static_cast<char>(0x80 | (c & 0x3F));
  }
  const ToolResult result = run_tool("convert -t 37 -o /dev/null --report -", text);
  const Json report = Json::parse(result.output);
  const Json& file = report["files"][0];
  EXPECT_EQ(file["name"], "standard input");
  EXPECT_EQ(file["first_problems"].size(), 20U);
  EXPECT_EQ(file["substituted"], 3000);
  EXPECT_EQ(file["substituted_characters"].size(), 1001U);
  EXPECT_EQ(file["substituted_characters"]["other"], 2000);
}

TEST_F(ConvertReport, WrittenWhenTheRunFails) {
  const std::string odd = write("odd\xFF\nname", "a");
  EXPECT_EQ(run_tool({"convert", "-t", "37", "-o", path("out"), "--report", path("r"), odd, path("no")}).status, 3);
  const Json report = Json::parse(read("r"));
  EXPECT_EQ(report["exit_status"], 3);
  EXPECT_EQ(report["files"].size(), 1U);
  EXPECT_NE(report["error"].get<std::string>().find("No such file"), std::string::npos);
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
    const Json file = Json::parse(result.output)["files"][0];
    EXPECT_EQ(file["converts_back"], c.offset < 0) << c.input;
    EXPECT_EQ(file.value("first_difference", -1), c.offset) << c.input;
  }
}

}  // namespace
}  // namespace lx::test
