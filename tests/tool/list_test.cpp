// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <nlohmann/json.hpp>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using List = ToolTest;

TEST_F(List, CodePagesAsTable) {
  const auto lines = lines_of(run_tool("list codepages").output);
  const std::size_t name = lines.at(0).find("NAME");
  int last_id = 0;
  for (std::size_t i = 1; i < lines.size(); ++i) {
    const int id = std::stoi(lines[i]);
    EXPECT_LT(last_id, id);
    last_id = id;
    if (id != 930) continue;
    EXPECT_EQ(lines[i].substr(name, 7), "IBM930 ");
    EXPECT_EQ(lines[i].substr(lines[0].find("KIND"), 6), "mixed ");
    EXPECT_EQ(lines[i].substr(lines[0].find("FAMILY")), "EBCDIC");
  }
}

TEST_F(List, Objects) {
  const struct {
    const char* list;
    std::size_t least;
    const char* row;  // one of those
  } cases[] = {
      {"codepages", 60, R"({"id": 37, "name": "IBM037", "kind": "single-byte", "family": "EBCDIC",
        "max_length": 1, "substitution": 63})"},
      {"codepages", 60, R"({"id": 57352, "name": "UTF-8", "kind": "multibyte", "family": "ASCII",
        "max_length": 3, "substitution": 26})"},
      {"languages", 25, R"({"id": 11, "name": "Japanese", "abbreviation": "JA", "own_name": "日本語",
        "default_territory": "Japan", "default_codepage": "JapanEUC", "default_sort": "Binary"})"},
      {"territories", 50, R"({"id": 826, "name": "UnitedKingdom", "abbreviation": "GBR",
        "own_name": "United Kingdom", "currency": "£", "currency_intl": "GBP"})"},
      {"sorts", 1, R"({"id": 0, "name": "Binary"})"},
      {"aliases", 500, R"({"alias": "CP930", "codepage": "IBM930"})"},
      {"native", 60, R"({"native": "iso_8859_1", "locale": "English_UnitedStates.Latin1@Binary", "back": null,
        "nearest": "en_US"})"},
  };
  for (const auto& c : cases) {
    const ToolResult result = run_tool({"list", c.list, "--json"});
    EXPECT_EQ(result.status, 0) << result.errors;
    const auto rows = nlohmann::json::parse(result.output);
    EXPECT_GE(rows.size(), c.least) << c.list;
    EXPECT_EQ(std::count(rows.begin(), rows.end(), nlohmann::json::parse(c.row)), 1) << c.list << rows.front();
    EXPECT_EQ(lines_of(run_tool({"list", c.list}).output).size(), rows.size() + 1) << c.list;
  }
}

// Wide characters take two columns, so the cells behind them must begin one byte, but no column, later.
TEST_F(List, TablesAlignByDisplayWidth) {
  ToolInput input;
  input.environment["LANG"] = "C.UTF-8";
  const auto lines = lines_of(run_tool("list languages", input).output);
  const std::size_t column = lines.at(0).find("TERRITORY");
  const struct {
    const char *own_name, *territory;
    std::size_t more_bytes;  // than columns
  } cases[] = {{" Deutsch ", "Germany", 0},
               {" français ", "France", 1},
               {" 日本語 ", "Japan", 3},
               {" 한국어 ", "Korea", 3},
               {" русский ", "Russia", 7}};
  for (const auto& c : cases) {
    const auto has_name = [&c](const std::string& line) { return line.find(c.own_name) != std::string::npos; };
    const auto line = std::find_if(lines.begin(), lines.end(), has_name);
    ASSERT_NE(line, lines.end()) << c.own_name;
    EXPECT_EQ(line->find(c.territory, column), column + c.more_bytes) << *line;
  }
}

TEST_F(List, ShortFormAndAliases) {
  const std::string aliases = run_tool("list codepages --aliases").output;
  EXPECT_EQ(run_tool("convert -l").output, aliases);
  EXPECT_NE(aliases.find("EBCDIC-CP-US"), std::string::npos);
  EXPECT_NE(run_tool("list").output.find("lexaro list codepages"), std::string::npos);
}

}  // namespace
}  // namespace lx::test
