// SPDX-License-Identifier: Apache-2.0
// Message catalogs shown by the tool.
#include "tests/support/environment.hpp"
#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using Catalogs = ToolTest;

TEST_F(Catalogs, AreShownInTheEncodingOfTheTerminal) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  const std::string source = write("m.msg", "$quote \"\n$set 2\n1 \"one\\n\"\n7 \"Grüße\\\\\"\n$set 9\n1 \"x\"\n");
  const std::string catalog = path("m.cat");
  ToolInput compile;
  compile.program = LEXAROC_TOOL;
  const ToolResult compiled =
      run_tool({"catalog", source, "-o", catalog, "--locale", "German.IBM273", "--locale-dir", LEXARO_DATA}, compile);
  ASSERT_EQ(compiled.status, 0) << compiled.errors;

  const Environment utf8 = {{"LC_ALL", "C.UTF-8"}};
  check_runs("catalog", {{{catalog}, "", "2 1 one\\n\n2 7 Grüße\\\\\n9 1 x\n", 0, "", utf8},
                         {{catalog, "9"}, "", "9 1 x\n", 0, "", utf8},
                         {{catalog, "2", "7"}, "", "Grüße\\\n", 0, "", utf8},
                         {{catalog, "2", "7"}, "", bytes("4772FCDF655C0A"), 0, "", {{"LC_ALL", "de_DE.ISO-8859-1"}}},
                         {{catalog, "2", "2"}, "", "", 1, "no such message"},
                         {{catalog, "3"}, "", "", 1, "no such set"},
                         {{source}, "", "", 1, "no message catalog"},
                         {{path("none")}, "", "", 3, "No such file"}});
}

}  // namespace
}  // namespace lx::test
