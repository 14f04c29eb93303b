// SPDX-License-Identifier: Apache-2.0
// Message catalogs shown by the tool.
#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

using Catalogs = ToolTest;

TEST_F(Catalogs, AreShownInTheEncodingOfTheTerminal) {
  const std::string source = write("m.msg", "$quote \"\n$set 2\n1 \"one\\n\"\n7 \"Grüße\\\\\"\n$set 9\n1 \"x\"\n");
  const std::string catalog = path("m.cat");
  ToolInput compile;
  compile.program = LEXAROC_TOOL;
  const ToolResult compiled =
      run_tool({"catalog", source, "-o", catalog, "--locale", "German.IBM273", "--locale-dir", LEXARO_DATA}, compile);
  ASSERT_EQ(compiled.status, 0) << compiled.errors;

  const struct {
    Arguments arguments;
    const char* terminal;
    std::string output;
    int status;
    const char* error;
  } cases[] = {
      {{catalog}, "C.UTF-8", "2 1 one\\n\n2 7 Grüße\\\\\n9 1 x\n", 0, ""},
      {{catalog, "9"}, "C.UTF-8", "9 1 x\n", 0, ""},
      {{catalog, "2", "7"}, "C.UTF-8", "Grüße\\\n", 0, ""},
      {{catalog, "2", "7"},
       "de_DE.ISO-8859-1",
       "Gr\xFC\xDF"
       "e\\\n",
       0,
       ""},
      {{catalog, "2", "2"}, "C.UTF-8", "", 1, "no such message"},
      {{catalog, "3"}, "C.UTF-8", "", 1, "no such set"},
      {{source}, "C.UTF-8", "", 1, "no message catalog"},
      {{path("none")}, "C.UTF-8", "", 3, "No such file"},
  };
  for (const auto& one : cases) {
    Arguments arguments = one.arguments;
    arguments.insert(arguments.begin(), "catalog");
    ToolInput input;
    input.environment["LC_ALL"] = one.terminal;
    const ToolResult result = run_tool(arguments, input);
    EXPECT_EQ(result.output, one.output) << testing::PrintToString(arguments) << result.errors;
    EXPECT_EQ(result.status, one.status) << result.errors;
    EXPECT_NE(result.errors.find(one.error), std::string::npos) << result.errors;
  }
}

}  // namespace
}  // namespace lx::test
