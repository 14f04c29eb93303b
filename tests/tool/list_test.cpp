// SPDX-License-Identifier: Apache-2.0
#include <algorithm>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using List = ToolTest;

TEST_F(List, Objects) {
  const struct {
    const char* list;
    std::size_t least;
    std::string row;  // one of those
  } cases[] = {
      {"codepages", 60,
       R"({"id":57352,"name":"UTF-8","kind":"multibyte","family":"ASCII","max_length":3,"substitution":26})"},
      {"languages", 25,
       R"({"id":11,"name":"Japanese","abbreviation":"JA","own_name":"日本語","default_territory":"Japan",)"
       R"("default_codepage":"JapanEUC","default_sort":"Binary"})"},
      {"territories", 50,
       R"({"id":826,"name":"UnitedKingdom","abbreviation":"GBR","own_name":"United Kingdom","currency":"£",)"
       R"("currency_intl":"GBP"})"},
      {"sorts", 1, R"({"id":0,"name":"Binary"})"},
      {"aliases", 500, R"({"alias":"CP930","codepage":"IBM930"})"},
      {"native", 60,
       R"({"native":"iso_8859_1","locale":"English_UnitedStates.Latin1@Binary","back":null,"nearest":"en_US"})"},
  };
  for (const auto& c : cases) {
    const auto rows = json_items(run_tool({"list", c.list, "--json"}).output);
    EXPECT_GE(rows.size(), c.least) << c.list;
    const auto is_row = [&c](const auto& row) { return row.second == c.row; };
    EXPECT_EQ(std::count_if(rows.begin(), rows.end(), is_row), 1) << testing::PrintToString(rows);
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
  } cases[] = {{" Deutsch ", "Germany", 0}, {" 日本語 ", "Japan", 3}, {" русский ", "Russia", 7}};
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
