// SPDX-License-Identifier: Apache-2.0
// Exit codes, names and messages of the command line.
#include <cerrno>
#include <cstring>
#include <filesystem>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

namespace fs = std::filesystem;
using CommandLine = ToolTest;

TEST_F(CommandLine, ExitCodes) {
  const std::string missing = path("missing");
  const std::string loop = path("loop");
  fs::create_symlink(loop, loop);
  check_runs({}, {{{}, "", "", 2, "--help"},
                  {"transmogrify -f 37", "", "", 2, "transmogrify"},
                  {"convert --frobnicate -f 37", "", "", 2, "--frobnicate"},
                  {"convert", "", "", 2, "-f"},
                  {"convert -f 37 -f 37", "", "", 2, "--from"},
                  {"convert -f 37 --nl cr", "", "", 2, "--nl"},
                  {"convert -t 37//TRANSLIT", "", "", 2, "TRANSLIT"},
                  {"convert -f 37//IGNORE", "", "", 2, "IGNORE"},
                  {"convert -f 37 --verify --nl lf", "", "", 2, "--verify"},
                  {"convert -f 37 --verify -c", "", "", 2, "--verify"},
                  {"convert -f 37 --report -", "", "", 2, "--report"},
                  {{"convert", "-f", "37", missing}, "", "", 3, "No such file"},
                  {{"convert", "-f", "37", ""}, "", "", 3, "No such file"},
                  {{"convert", "-f", "37", loop}, "", "", 3, std::strerror(ELOOP)},
                  {{"convert", "-f", "37", path("")}, "", "", 3, "Is a directory"},
                  {{"convert", "-f", "37", "-o", path("")}, "", "", 3, "Is a directory"},
                  {{"convert", "-f", "37", "-o", missing + "/out"}, "", "", 3, "No such file"},
                  {"convert -f 37 -o /dev/full", "\xC1", "", 3, "No space left"},
                  {"convert -f klingon", "", "", 4, "unknown code page \"klingon\""},
                  {"convert -f 65573", "", "", 4, "unknown code page"},  // 37 and 65536
                  {"convert -f UTF-16LE", "", "", 4, "UTF-16LE is not a code page"},
                  {"convert -t 1200", "", "", 4, "1200 is not a code page"},
                  {"convert -f utf9", "", "", 4, "did you mean UTF-8"},
                  {"convert -f ibm1074", "", "", 4, "IBM1047"},
                  {{"--locale-dir", missing, "convert", "-f", "37"}, "", "", 4, "control.nls"},
                  {{"--locale-dir", "", "list", "codepages"}, "", "", 2, "--locale-dir"}});
}

TEST_F(CommandLine, CodePageNames) {
  const std::pair<std::string, const char*> cases[] = {
      {"IBM-930 ibm930 cp930 930 00930 CCSID00930", "IBM930"},
      {"37", "IBM037"},
      {"utf8 utf-8 57352 UTF-8//", "UTF-8"},
      {"latin1 819 ISO_8859-1:1987", "Latin1"},
      {"ascii ISO_646.irv:1991", "US-ASCII"},
  };
  for (const auto& [names, page] : cases) {
    for (const std::string& name : Arguments(names.c_str())) {
      const ToolResult result = run_tool({"convert", "-f", name, "--report", "-", "-o", "/dev/null"});
      ASSERT_EQ(result.status, 0) << name << ": " << result.errors;
      EXPECT_NE(result.output.find('"' + std::string(page) + '"'), std::string::npos) << name << result.output;
    }
  }
}

TEST_F(CommandLine, FileNamesAreTakenAsTheyAre) {
  fs::current_path(path(""));
  for (const char* name : {"list", "help", "convert", "[x]", "{}", "%%", "a b", "x=y", "@x", "-n"}) {
    write(name, name);
    check_runs("convert -f UTF-8", {{{"--", name}, "", name}});
  }
  check_runs("convert -f UTF-8", {{{"[x]", "list", "--", "-n", "-", "{}"}, "|", "[x]list-n|{}"}});
  fs::current_path("/");
}

TEST_F(CommandLine, HelpAndVersion) {
  ToolInput compiler;
  compiler.program = LEXAROC_TOOL;
  EXPECT_EQ(run_tool("--version").output.rfind("lexaro 1.", 0), 0U);
  EXPECT_EQ(run_tool("--version", compiler).output.rfind("lexaroc 1.", 0), 0U);
  EXPECT_EQ(run_tool("help").output, run_tool("--help").output);
  EXPECT_NE(run_tool("list sorts -h").output.find("What can be listed"), std::string::npos);
  const ToolResult help = run_tool("convert -h");
  EXPECT_EQ(help.output, run_tool("help convert").output);
  EXPECT_NE(help.output.find("Usage: lexaro"), std::string::npos) << help.output;
  EXPECT_EQ(help.status, 0);
}

// The data directory: the option, then the variable, then beside the program.
TEST_F(CommandLine, LocaleDataDirectory) {
  fs::create_directories(path("broken"));
  write("broken/control.nls", "not a control file");
  const auto variable = [](const std::string& value) { return Environment{{"LX_LOCALEDIR", value}}; };
  const Environment broken = variable(path("broken"));
  check_runs({}, {{"convert -f 37", "\xC1", "A", 0, "", variable(LEXARO_DATA)},
                  {"convert -f 37", "\xC1", "A", 0, "", variable(path("nothing here"))},
                  {"convert -f 37", "\xC1", "", 4, path("broken"), broken},
                  {{"--locale-dir", LEXARO_DATA, "convert", "-f", "37"}, "\xC1", "A", 0, "", broken},
                  {{"convert", "--locale-dir", LEXARO_DATA, "-f", "37"}, "\xC1", "A", 0, "", broken}});
}

// A damaged or missing object is never replaced by another one's tables or values.
TEST_F(CommandLine, DamagedObjects) {
  fs::copy(LEXARO_DATA, path("data"));
  for (const char* name : {"data/cp_00037.nls", "data/la_00002.nls"}) write(name, "short");
  for (const char* name : {"data/cp_00273.nls", "data/te_00826.nls"}) fs::remove(path(name));
  const Arguments tool = {"--locale-dir", path("data")};
  check_runs(tool, {{"convert -f 37 -t 37", "\xC1", "", 4, "37"},
                    {"convert -f 273 -t 273", "\xC1", "", 4, "273"},
                    {"convert -f 500", "\xC1", "A"},
                    {"locale German --item 4", "", "", 4, "German"},
                    {"locale de_CH.UTF-8 --item 4", "", "", 4, "German"},
                    {"locale English_UnitedKingdom --item 4", "", "", 4, "UnitedKingdom"},
                    {"locale French --item 4", "", "français\n"}});
  const ToolResult pages = run_tool(tool + "list codepages"), languages = run_tool(tool + "list languages");
  EXPECT_TRUE(pages.status == 4 && languages.status == 4);
  for (const char* name : {"IBM037", "IBM500"}) EXPECT_NE(pages.output.find(name), std::string::npos);
  expect_told(languages, "German: its file ");
  EXPECT_EQ(languages.output.find("Deutsch"), std::string::npos);
  EXPECT_NE(languages.output.find("italiano"), std::string::npos);
}

}  // namespace
}  // namespace lx::test
