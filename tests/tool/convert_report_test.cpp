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
  EXPECT_EQ(report["program"], "lexaro");
  EXPECT_EQ(report["from"], (Json{{"name", "UTF-8"}, {"id", 57352}}));
  EXPECT_EQ(report["to"], (Json{{"name", "IBM037"}, {"id", 37}}));
  EXPECT_EQ(report["exit_status"], 1);
  ASSERT_EQ(report["files"].size(), 2U);

  const Json& file = report["files"][0];
  EXPECT_EQ(file["name"], one);
  EXPECT_EQ(file["bytes_in"], 10);
  EXPECT_EQ(file["bytes_out"], 6);
  EXPECT_EQ(file["substituted"], 2);
  EXPECT_EQ(file["malformed"], 1);
  EXPECT_EQ(file["cut"], 1);
  EXPECT_EQ(file["shifts"], 0);
  EXPECT_EQ(file["substituted_characters"], (Json{{"U+20AC", 2}}));
  EXPECT_EQ(file["malformed_sequences"], (Json{{"FF", 1}}));
  const Json& first = file["first_problems"];
  ASSERT_EQ(first.size(), 4U);
  EXPECT_EQ(first[0], (Json{{"offset", 2}, {"kind", "substituted"}, {"unicode", "U+20AC"}, {"bytes", "E282AC"}}));
  EXPECT_EQ(first[1], (Json{{"offset", 5}, {"kind", "malformed"}, {"unicode", "U+FFFD"}, {"bytes", "FF"}}));
  EXPECT_EQ(first[3], (Json{{"offset", 9}, {"kind", "cut"}, {"unicode", "U+FFFD"}, {"bytes", "E2"}}));
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
  const ToolResult result = run_tool({"convert", "-t", "37", "-o", "/dev/null", "--report", "-"}, text);
  const Json report = Json::parse(result.output);
  const Json& file = report["files"][0];
  EXPECT_EQ(file["name"], "standard input");
  EXPECT_EQ(file["first_problems"].size(), 20U);
  EXPECT_EQ(file["substituted"], 3000);
  EXPECT_EQ(file["substituted_characters"].size(), 1001U);
  EXPECT_EQ(file["substituted_characters"]["other"], 2000);
}

TEST_F(ConvertReport, FileNamesOfAnyBytes) {
  const std::string odd = write("odd\xFF\nname", "a");
  const ToolResult result = run_tool({"convert", "-t", "37", "-o", "/dev/null", "--report", "-", odd});
  EXPECT_EQ(result.status, 0) << result.errors;
  EXPECT_TRUE(Json::accept(result.output)) << result.output;
}

TEST_F(ConvertReport, WrittenWhenTheRunFails) {
  const std::string good = write("good", "a");
  EXPECT_EQ(run_tool({"convert", "-t", "37", "-o", path("out"), "--report", path("r"), good, path("no")}).status, 3);
  const Json report = Json::parse(read("r"));
  EXPECT_EQ(report["exit_status"], 3);
  EXPECT_EQ(report["files"].size(), 1U);
  EXPECT_NE(report["error"].get<std::string>().find("No such file"), std::string::npos);
  EXPECT_EQ(files(), (std::vector<std::string>{"good", "r"}));
  EXPECT_EQ(run_tool({"convert", "-t", "37", "--report", path("no/r"), good}).status, 3);
}

TEST_F(ConvertReport, VerifyFindsTheFirstDifference) {
  const struct {
    const char* from;
    const char* to;
    const char* input;
    int status;
    int offset;  // of the first difference; -1: none
    const char* message;
  } cases[] = {
      {"IBM037", "UTF-8", "C8 85 93 93 96 15 25 0D", 0, -1, ""},
      {"IBM930", "UTF-8", "C1 0E 4481 4482 0F C2 0E 4481 0F", 0, -1, ""},
      {"UTF-8", "IBM930", "61 E3 81 82 62", 0, -1, ""},
      {"IBM037", "UTF-8", "", 0, -1, ""},
      {"UTF-8", "IBM037", "61 62 E2 82 AC 63", 1, 2, "byte 2 (X'E2' comes back as X'1A')"},
      {"IBM930", "UTF-8", "C1 0E 4481 0F 0E 4482 0F", 1, 4, "byte 4 (X'0F' comes back as X'44')"},
      {"IBM930", "UTF-8", "C1 0E 0F", 1, 1, "byte 1 (X'0E' comes back as nothing)"},
      {"IBM930", "UTF-8", "C1 0E 4481", 1, 4, "byte 4 (the end comes back as X'0F')"},
      {"UTF-8", "UTF-8", "61 E3 81", 1, 1, "byte 1 (X'E3' comes back as X'EF')"},
  };
  for (const auto& c : cases) {
    const ToolResult result =
        run_tool({"convert", "--verify", "-f", c.from, "-t", c.to, "-o", path("out"), "--report", "-"}, bytes(c.input));
    EXPECT_EQ(result.status, c.status) << c.input << ": " << result.errors;
    EXPECT_NE(result.errors.find(c.message), std::string::npos) << c.input << ": " << result.errors;
    const Json report = Json::parse(result.output);
    const Json& file = report["files"][0];
    EXPECT_EQ(file["converts_back"], c.offset < 0) << c.input;
    EXPECT_EQ(file.value("first_difference", -1), c.offset) << c.input;
  }
}

}  // namespace
}  // namespace lx::test
