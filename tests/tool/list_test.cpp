// SPDX-License-Identifier: Apache-2.0
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

TEST_F(List, ShortFormAndExplanation) {
  EXPECT_EQ(run_tool({"convert", "-l"}).output, run_tool({"list", "codepages", "--aliases"}).output);
  EXPECT_NE(run_tool({"list"}).output.find("lexaro list codepages"), std::string::npos);
}

}  // namespace
}  // namespace lx::test
