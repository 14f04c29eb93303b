// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <nlohmann/json.hpp>
#include <sstream>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using List = ToolTest;

TEST_F(List, CodePagesAsTable) {
  const ToolResult result = run_tool({"list", "codepages"});
  ASSERT_EQ(result.status, 0) << result.errors;
  std::istringstream lines(result.output);
  std::string line;
  std::getline(lines, line);
  const std::size_t name = line.find("NAME");
  const std::size_t kind = line.find("KIND");
  const std::size_t family = line.find("FAMILY");
  bool seen = false;
  int last_id = 0;
  while (std::getline(lines, line)) {
    const int id = std::stoi(line);
    EXPECT_LT(last_id, id);
    last_id = id;
    if (id != 930) continue;
    seen = true;
    EXPECT_EQ(line.substr(name, 7), "IBM930 ");
    EXPECT_EQ(line.substr(kind, 6), "mixed ");
    EXPECT_EQ(line.substr(family), "EBCDIC");
  }
  EXPECT_TRUE(seen);
}

TEST_F(List, CodePagesAsJson) {
  const ToolResult result = run_tool({"list", "codepages", "--json", "--aliases"});
  ASSERT_EQ(result.status, 0) << result.errors;
  const struct {
    int id;
    const char* name;
    const char* kind;
    const char* family;
    const char* alias;
  } cases[] = {{37, "IBM037", "single-byte", "EBCDIC", "EBCDIC-CP-US"},
               {930, "IBM930", "mixed", "EBCDIC", "CP930"},
               {932, "MS932", "multibyte", "ASCII", "SJIS"},
               {57352, "UTF-8", "multibyte", "ASCII", "UTF8"}};
  const auto pages = nlohmann::json::parse(result.output);
  for (const auto& c : cases) {
    bool found = false;
    for (const auto& page : pages) {
      if (page["id"] != c.id) continue;
      found = true;
      EXPECT_EQ(page["name"], c.name);
      EXPECT_EQ(page["kind"], c.kind);
      EXPECT_EQ(page["family"], c.family);
      const auto aliases = page["aliases"].get<std::vector<std::string>>();
      EXPECT_NE(std::find(aliases.begin(), aliases.end(), c.alias), aliases.end()) << c.alias;
    }
    EXPECT_TRUE(found) << c.id;
  }
}

TEST_F(List, Objects) {
  using Row = nlohmann::json;
  const struct {
    const char* list;
    std::size_t least;
    Row row;  // one of those
  } cases[] = {
      {"languages",
       25,
       {{"id", 11},
        {"name", "Japanese"},
        {"abbreviation", "JA"},
        {"own_name", "\u65E5\u672C\u8A9E"},
        {"default_territory", "Japan"},
        {"default_codepage", "JapanEUC"},
        {"default_sort", "Binary"}}},
      {"territories",
       50,
       {{"id", 826},
        {"name", "UnitedKingdom"},
        {"abbreviation", "GBR"},
        {"own_name", "United Kingdom"},
        {"currency", "\u00A3"},
        {"currency_intl", "GBP"}}},
      {"sorts", 1, {{"id", 0}, {"name", "Binary"}}},
      {"aliases", 500, {{"alias", "CP930"}, {"codepage", "IBM930"}}},
      {"native",
       60,
       {{"native", "tw"},
        {"locale", "TraditionalChinese_Taiwan.EUC-TW@Binary"},
        {"back", "zh_TW"},
        {"nearest", "zh_TW"}}},
      {"native",
       60,
       {{"native", "iso_8859_1"},
        {"locale", "English_UnitedStates.Latin1@Binary"},
        {"back", nullptr},
        {"nearest", "en_US"}}},
  };
  for (const auto& c : cases) {
    const ToolResult result = run_tool({"list", c.list, "--json"});
    EXPECT_EQ(result.status, 0) << result.errors;
    const auto rows = nlohmann::json::parse(result.output);
    EXPECT_GE(rows.size(), c.least) << c.list;
    EXPECT_NE(std::find(rows.begin(), rows.end(), c.row), rows.end()) << c.list << rows.front();
    const std::string table = run_tool({"list", c.list}).output;
    EXPECT_EQ(static_cast<std::size_t>(std::count(table.begin(), table.end(), '\n')), rows.size() + 1) << c.list;
  }
}

// Wide characters take two columns, so the cells behind them must begin one byte, but no column, later.
TEST_F(List, TablesAlignByDisplayWidth) {
  ToolInput input;
  input.environment["LANG"] = "C.UTF-8";
  std::istringstream lines(run_tool({"list", "languages"}, input).output);
  std::string line;
  std::getline(lines, line);
  const std::size_t column = line.find("TERRITORY");
  const struct {
    const char* own_name;
    const char* territory;
    std::size_t more_bytes;  // than columns
  } cases[] = {{"Deutsch", "Germany", 0},
               {"fran\u00E7ais ", "France", 1},
               {"\u65E5\u672C\u8A9E", "Japan", 3},
               {"\uD55C\uAD6D\uC5B4", "Korea", 3},
               {"\u0440\u0443\u0441\u0441\u043A\u0438\u0439", "Russia", 7}};
  std::size_t seen = 0;
  while (std::getline(lines, line)) {
    for (const auto& c : cases) {
      if (line.find(std::string(c.own_name) + " ") == std::string::npos) continue;
      ++seen;
      EXPECT_EQ(line.find(c.territory, column), column + c.more_bytes) << line;
    }
  }
  EXPECT_EQ(seen, std::size(cases));
}

TEST_F(List, ShortFormAndExplanation) {
  EXPECT_EQ(run_tool({"convert", "-l"}).output, run_tool({"list", "codepages", "--aliases"}).output);
  EXPECT_NE(run_tool({"list"}).output.find("lexaro list codepages"), std::string::npos);
}

}  // namespace
}  // namespace lx::test
