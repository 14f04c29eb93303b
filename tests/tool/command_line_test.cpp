// SPDX-License-Identifier: Apache-2.0
// Exit codes, names and messages of the command line.
#include <filesystem>
#include <nlohmann/json.hpp>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

namespace fs = std::filesystem;
using CommandLine = ToolTest;

struct ExitCase {
  const char* what;
  Arguments arguments;
  const char* input;
  int status;
  const char* message;  // part of what standard error must hold; empty: nothing at all
};

TEST_F(CommandLine, ExitCodes) {
  const std::string missing = path("missing");
  const std::string loop = path("loop");
  fs::create_symlink(loop, loop);
  const ExitCase cases[] = {
      {"exact", {"convert", "-f", "UTF-8", "-t", "IBM037"}, "abc\n", 0, ""},
      {"empty input", {"convert", "-f", "IBM930"}, "", 0, ""},
      {"replaced", {"convert", "-t", "IBM037"}, "a\xE2\x82\xAC", 1, "1 character replaced (at byte 1: U+20AC"},
      {"left out", {"convert", "-c", "-t", "IBM037"}, "a\xE2\x82\xAC", 1, "1 character left out (at byte 1: U+20AC"},
      {"left out by suffix", {"convert", "-t", "IBM037//IGNORE"}, "a\xE2\x82\xAC", 1, "1 character left out"},
      {"malformed", {"convert", "-t", "IBM037"}, "ab\xFF", 1, "1 malformed sequence (at byte 2: X'FF')"},
      {"cut", {"convert", "-t", "IBM037"}, "ab\xE2\x82", 1, "1 character cut off by the end (at byte 2: X'E282')"},
      {"shift left open", {"convert", "-f", "IBM930"}, "\x0E\x44\x81", 1, "1 unbalanced shift"},
      {"silent", {"convert", "-s", "-t", "IBM037"}, "a\xE2\x82\xAC", 1, ""},
      {"no command", {}, "", 2, "--help"},
      {"unknown command", {"transmogrify"}, "", 2, "transmogrify"},
      {"unknown option", {"convert", "--frobnicate", "-f", "37"}, "", 2, "--frobnicate"},
      {"no code page", {"convert"}, "", 2, "-f"},
      {"option twice", {"convert", "-f", "37", "-f", "37"}, "", 2, "--from"},
      {"line ends", {"convert", "-f", "37", "--nl", "cr"}, "", 2, "--nl"},
      {"progress", {"convert", "-f", "37", "--progress=often"}, "", 2, "--progress"},
      {"look-alikes", {"convert", "-t", "37//TRANSLIT"}, "", 2, "TRANSLIT"},
      {"unknown suffix", {"convert", "-t", "37//NORMAL"}, "", 2, "NORMAL"},
      {"suffix of the source", {"convert", "-f", "37//IGNORE"}, "", 2, "IGNORE"},
      {"verify what is changed", {"convert", "-f", "37", "--verify", "--nl", "lf"}, "", 2, "--verify"},
      {"verify what is left out", {"convert", "-f", "37", "--verify", "-c"}, "", 2, "--verify"},
      {"two texts on one output", {"convert", "-f", "37", "--report", "-"}, "", 2, "--report"},
      {"unknown help", {"help", "transmogrify"}, "", 2, "transmogrify"},
      {"missing file", {"convert", "-f", "37", missing}, "", 3, "No such file"},
      {"no name", {"convert", "-f", "37", ""}, "", 3, "No such file"},
      {"link to itself", {"convert", "-f", "37", loop}, "", 3, "symbolic link"},
      {"directory as input", {"convert", "-f", "37", path("")}, "", 3, "Is a directory"},
      {"directory as output", {"convert", "-f", "37", "-o", path("")}, "", 3, "Is a directory"},
      {"output in no directory", {"convert", "-f", "37", "-o", missing + "/out"}, "", 3, "No such file"},
      {"full device", {"convert", "-f", "37", "-o", "/dev/full"}, "\xC1", 3, "No space left"},
      {"unknown page", {"convert", "-f", "klingon"}, "", 4, "unknown code page \"klingon\""},
      {"sort in the name", {"convert", "-f", "IBM037@BINARY"}, "", 4, "unknown code page"},
      {"unknown number", {"convert", "-f", "64999"}, "", 4, "unknown code page"},
      {"number too large", {"convert", "-f", "65573"}, "", 4, "unknown code page"},
      {"two byte units", {"convert", "-f", "UTF-16LE"}, "", 4, "UTF-16LE is not a code page"},
      {"two byte units by number", {"convert", "-t", "1200"}, "", 4, "1200 is not a code page"},
      {"no data", {"--locale-dir", missing, "convert", "-f", "37"}, "", 4, "control.nls"},
      {"usage before data", {"--locale-dir", "", "list", "codepages"}, "", 2, "--locale-dir"},
  };
  for (const ExitCase& c : cases) {
    const ToolResult result = run_tool(c.arguments, std::string(c.input));
    EXPECT_EQ(result.status, c.status) << c.what << ": " << result.errors;
    if (*c.message == '\0') {
      EXPECT_EQ(result.errors, "") << c.what;
    } else {
      EXPECT_NE(result.errors.find(c.message), std::string::npos) << c.what << ": " << result.errors;
      EXPECT_EQ(result.errors.rfind("lexaro: ", 0), 0U) << c.what << ": " << result.errors;
    }
  }
}

TEST_F(CommandLine, CodePageNames) {
  const struct {
    const char* given;
    const char* name;
  } cases[] = {{"IBM-930", "IBM930"},
               {"ibm930", "IBM930"},
               {"cp930", "IBM930"},
               {"930", "IBM930"},
               {"00930", "IBM930"},
               {"CCSID00930", "IBM930"},
               {"37", "IBM037"},
               {"utf8", "UTF-8"},
               {"utf-8", "UTF-8"},
               {"57352", "UTF-8"},
               {"UTF-8//", "UTF-8"},
               {"latin1", "Latin1"},
               {"ascii", "US-ASCII"},
               {"819", "Latin1"},
               {"ISO_8859-1:1987", "Latin1"},
               {"ISO_646.irv:1991", "US-ASCII"}};
  for (const auto& c : cases) {
    const Arguments arguments = {"convert", "-f", c.given, "--report", "-", "-o", "/dev/null"};
    const ToolResult result = run_tool(arguments, std::string());
    ASSERT_EQ(result.status, 0) << c.given << ": " << result.errors;
    EXPECT_EQ(nlohmann::json::parse(result.output)["from"]["name"], c.name) << c.given;
  }
}

TEST_F(CommandLine, UnknownNamesGetSuggestions) {
  const struct {
    const char* given;
    const char* hint;
  } cases[] = {{"utf9", "UTF-8"}, {"IBM_930", "IBM930"}, {"ibm1074", "IBM1047"}, {"window1252", "Windows-1252"}};
  for (const auto& c : cases) {
    const ToolResult result = run_tool({"convert", "-f", c.given});
    EXPECT_EQ(result.status, 4) << c.given;
    EXPECT_NE(result.errors.find("did you mean"), std::string::npos) << result.errors;
    EXPECT_NE(result.errors.find(c.hint), std::string::npos) << result.errors;
    EXPECT_NE(result.errors.find("lexaro list codepages"), std::string::npos) << result.errors;
  }
}

TEST_F(CommandLine, FileNamesAreTakenAsTheyAre) {
  fs::current_path(path(""));
  for (const char* name : {"list", "help", "convert", "[x]", "{}", "%%", "a b", "x=y", "@x", "-n"}) {
    write(name, name);
    const ToolResult result = run_tool({"convert", "-f", "UTF-8", "--", name});
    EXPECT_EQ(result.status, 0) << name << ": " << result.errors;
    EXPECT_EQ(result.output, name);
  }
  const ToolResult all = run_tool({"convert", "-f", "UTF-8", "[x]", "list", "--", "-n", "-", "{}"}, std::string("|"));
  EXPECT_EQ(all.output, "[x]list-n|{}") << all.errors;
  fs::current_path("/");
}

TEST_F(CommandLine, HelpAndVersion) {
  EXPECT_EQ(run_tool({"--version"}).output.rfind("lexaro 1.", 0), 0U);
  EXPECT_EQ(run_tool({"help"}).output, run_tool({"--help"}).output);
  EXPECT_EQ(run_tool({"help", "convert"}).output, run_tool({"convert", "--help"}).output);
  for (const Arguments& arguments : {Arguments{"--help"}, {"help"}, {"convert", "-h"}, {"list", "--help"}}) {
    const ToolResult result = run_tool(arguments);
    EXPECT_EQ(result.status, 0);
    EXPECT_NE(result.output.find("Usage: lexaro"), std::string::npos) << result.output;
    EXPECT_EQ(result.errors, "");
  }
}

// The data directory: the option, then the variable, then beside the program.
TEST_F(CommandLine, LocaleDataDirectory) {
  const Arguments convert = {"convert", "-f", "37"};
  ToolInput input;
  input.text = "\xC1";
  input.environment["LX_LOCALEDIR"] = LEXARO_DATA;
  EXPECT_EQ(run_tool(convert, input).output, "A");
  input.environment["LX_LOCALEDIR"] = path("nothing here");
  EXPECT_EQ(run_tool(convert, input).output, "A");

  fs::create_directories(path("broken"));
  write("broken/control.nls", "not a control file");
  input.environment["LX_LOCALEDIR"] = path("broken");
  const ToolResult broken = run_tool(convert, input);
  EXPECT_EQ(broken.status, 4);
  EXPECT_NE(broken.errors.find(path("broken")), std::string::npos) << broken.errors;
  EXPECT_EQ(run_tool({"--locale-dir", LEXARO_DATA, "convert", "-f", "37"}, input).output, "A");
  EXPECT_EQ(run_tool({"convert", "--locale-dir", LEXARO_DATA, "-f", "37"}, input).output, "A");
}

// A damaged or missing object must never be replaced by another page's tables.
TEST_F(CommandLine, DamagedCodePages) {
  fs::copy(LEXARO_DATA, path("data"));
  write("data/cp_00037.nls", "short");
  fs::remove(path("data/cp_00273.nls"));
  for (const char* name : {"37", "273"}) {
    const ToolResult result =
        run_tool({"--locale-dir", path("data"), "convert", "-f", name, "-t", name}, std::string("\xC1"));
    EXPECT_EQ(result.status, 4) << name;
    EXPECT_EQ(result.output, "");
    EXPECT_NE(result.errors.find(name), std::string::npos) << result.errors;
  }
  EXPECT_EQ(run_tool({"--locale-dir", path("data"), "convert", "-f", "500"}, std::string("\xC1")).output, "A");
  const ToolResult list = run_tool({"--locale-dir", path("data"), "list", "codepages"});
  EXPECT_EQ(list.status, 4);
  EXPECT_NE(list.output.find("IBM037"), std::string::npos);
  EXPECT_NE(list.output.find("IBM500"), std::string::npos);
}

}  // namespace
}  // namespace lx::test
