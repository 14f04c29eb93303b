// SPDX-License-Identifier: Apache-2.0
// What locales know, by the names that users and systems give them.
#include <algorithm>
#include <filesystem>

#include "tests/support/environment.hpp"
#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

namespace fs = std::filesystem;
using Locale = ToolTest;

ToolResult run_in(const Environment& environment, const Arguments& arguments) {
  ToolInput input;
  input.environment = environment;
  return run_tool(arguments, input);
}

TEST_F(Locale, OfTheUser) {
  const struct {
    Environment environment;
    const char* locale;
    const char* message;  // part of the notice; empty: none
  } cases[] = {
      {{}, "English_UnitedStates.US-ASCII@Binary", ""},
      {{{"LANG", "ja_JP.PCK"}}, "Japanese_Japan.MS932@Binary", ""},
      {{{"LANG", "de_CH.UTF-8"}}, "German_German-Switzerland.UTF-8@Default", "de_CH.UTF-8 wird als German_German-S"},
      {{{"LANG", "nb_NO.UTF-8"}}, "Norwegian_Norway.UTF-8@Danish", "is taken as"},
      {{{"LANG", "fr_CH.ISO8859-15@euro"}}, "French_French-Switzerland.ISO-8859-15@Default", "modifier euro"},
      {{{"LANG", "fr_LU"}}, "French_France.Latin1@Default", "territory LU"},
      {{{"LANG", "it_IT.KLINGON"}}, "Italian_Italy.Latin1@Default", "code set KLINGON"},
      {{{"LANG", "xx_YY.UTF-8"}}, "English_UnitedStates.UTF-8@Default", "\"xx_YY.UTF-8\" of the system is not known"},
      {{{"LANG", "C"}, {"LC_ALL", "cs_CZ.UTF-8"}}, "Czech_CzechRepublic.UTF-8@Czech", "cs_CZ.UTF-8 is taken"},
      {{{"LANG", "de_DE.UTF-8"}, {"LC_TIME", "fr_CA.UTF-8"}, {"LC_CTYPE", "ja_JP.eucJP"}},
       "CanadianFrench_Germany.JapanEUC@Default",
       "/ja_JP.eucJP/de_DE.UTF-8/fr_CA.UTF-8/"},
      {{{"LANG", "fr"}, {"LX_LANG", "German_Austria.IBM-930@binary"}}, "German_Austria.IBM930@Binary", ""},
      {{{"LX_LANG", "German_Nowhere"}}, "German_Germany.Latin1@Default", "LX_LANG is not known (territory not found)"},
      {{{"LX_LANG", ""}}, "English_UnitedStates.Latin1@Default", ""},
  };
  for (const auto& c : cases) {
    check_runs("locale --item locale", {{{}, "", std::string(c.locale) + "\n", 0, c.message, c.environment}});
  }
}

TEST_F(Locale, ByName) {
  check_runs("locale --item 88",
             {{"German_Austria.latin1", "", "German_Austria.Latin1@Default\n"},
              {".utf8", "", "English_UnitedStates.UTF-8@Default\n"},
              {"/ja/C/de/C", "", "German_UnitedStates.JapanEUC@Binary\n"},
              {"de_CH.utf8", "", "German_German-Switzerland.UTF-8@Default\n", 0, "is taken as"},
              {"Germn", "", "", 4, "unknown locale or language \"Germn\"; did you mean German?"},
              {"German_Germny.UTF-8", "", "", 4, "unknown territory \"Germny\"; did you mean Germany?"},
              {"German.utf9", "", "", 4, "unknown code page \"utf9\"; did you mean UTF-8?"},
              {"German@Nosort", "", "", 4, "unknown sort \"Nosort\""},
              {"\x1B[31m", "", "", 4, "\"?[31m\""}});
}

// Each number has one name, each name one value, and the long list shows them all.
TEST_F(Locale, AllItemsByNumberAndName) {
  const Environment utf8 = {{"LANG", "C.UTF-8"}};
  const Arguments locale = "locale German_German-Switzerland.UTF-8";
  const std::string json = run_in({}, locale + "--json").output, text = run_in(utf8, locale).output;
  expect_json(json, R"({"language.id": 2, "month.3": "März", "month.13": ""})");
  for (const char* row : {"1  language.id ", "32  month.3 ", "78  n_sign_posn "}) {
    EXPECT_NE(text.find(row), std::string::npos) << text;
  }
  Arguments all = locale;
  for (int number = 1; number <= 88; ++number) all.insert(all.end(), {"--item", std::to_string(number)});
  const auto items = json_items(run_tool(all + "--json").output), listed = json_items(json);
  EXPECT_TRUE(items.size() == 88 && std::is_permutation(items.begin(), items.end(), listed.begin(), listed.end()));
  std::string values;
  for (const auto& [name, value] : items) {
    values += value + "\n";
    EXPECT_NE(text.find(" " + name + " "), std::string::npos) << name;
  }
  EXPECT_EQ(run_in(utf8, all).output, values);
}

TEST_F(Locale, InTheEncodingOfTheTerminal) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  const auto in = [](const char* locale) { return Environment{{"LANG", locale}}; };
  check_runs(
      "locale",
      {{"French --item 4", "", "français\n"},
       {"French --item 4", "", bytes("6672616EE7616973 0A"), 0, "", in("fr_FR.ISO-8859-1")},
       {"Japanese --item 4", "", bytes("C6FC CBDC B8EC 0A"), 0, "", {{"LC_ALL", "ja_JP.eucJP"}, {"LC_CTYPE", "C"}}},
       {"Japanese --item 4", "", bytes("93FA 967B 8CEA 0A"), 0, "", {{"LANG", "C"}, {"LC_CTYPE", "ja_JP.SJIS"}}},
       {"Japanese --item 4", "", "???\n", 0, "", in("C")},
       // The code page of the locale lacks the pound sign, that of the terminal has it.
       {"English_UnitedKingdom.US-ASCII --item currency --territory", "", "£\n"}});
  expect_json(run_in(in("C"), "locale French --item 4 --json").output, R"({"language.own_name": "français"})");
}

TEST_F(Locale, SystemNames) {
  const struct {
    const char *locale, *exact, *nearest, *nearest_locale;
  } cases[] = {
      {"Japanese.MS932", "\"ja_JP.PCK\"", "ja_JP.PCK", "\"Japanese_Japan.MS932@Binary\""},
      {"English_UnitedKingdom.UTF-8@BINARY", "null", "en_UK", "\"English_UnitedKingdom.Latin1@Default\""},
      {"English_UnitedStates.UTF-8@BINARY", "null", "en_US.UTF-8", "null"},
      {"Polish", "null", "C", "\"English_UnitedStates.US-ASCII@Binary\""},
  };
  for (const auto& c : cases) {
    const Arguments native = {"locale", c.locale, "--native"};
    const std::string nearest = c.nearest;
    expect_json(run_tool(native + "--json").output, std::string(R"({"exact":)") + c.exact + R"(,"nearest":")" +
                                                        nearest + R"(","nearest_locale":)" + c.nearest_locale + "}");
    EXPECT_NE(run_tool(native).output.find("nearest name       " + nearest + "\n"), std::string::npos);
  }
}

TEST_F(Locale, WrongUse) {
  check_runs("locale", {{"--item 89", "", "", 2, "89"},
                        {"--item 0", "", "", 2, "0"},
                        {{"--item", "Decimal point"}, "", "", 2, "Decimal point"},
                        {"--item", "", "", 2, "--item"},
                        {"--native --item 1", "", "", 2, "--item"},
                        {"C POSIX", "", "", 2, "POSIX"}});
  EXPECT_EQ(run_in_shell("exec \"$0\" locale > /dev/full").status, 3);
}

TEST_F(Locale, WithoutData) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  // A program that stands alone finds no data beside it, only the library that the linker is told of.
  fs::create_directory(path("bin"));
  fs::copy(LEXARO_TOOL_FILE, path("bin/lexaro"));
  const Arguments program = Arguments(LEXARO_EMULATOR) + Arguments{path("bin/lexaro")};
  ToolInput input;
  input.program = "/usr/bin/env";
  input.environment = {{"LD_LIBRARY_PATH", LEXARO_LIBRARY_DIR}, {"LANG", "de_CH.UTF-8"}};
  const ToolResult user = run_tool(program + "locale --item day.sunday --item codepage.name", input);
  EXPECT_EQ(user.status, 0);
  EXPECT_EQ(user.output, "Sunday\nUS-ASCII\n");
  expect_told(user, "built-in");
  expect_told(user, "\"de_CH.UTF-8\" of the system is not known");
  EXPECT_EQ(run_tool(program + "locale German", input).status, 4);
  EXPECT_EQ(run_tool(program + "locale C --json", input).status, 0);
  EXPECT_EQ(run_tool(program + Arguments{"--locale-dir", path("bin"), "locale"}, input).status, 4);
  EXPECT_EQ(run_tool(program + "list languages", input).status, 4);
}

}  // namespace
}  // namespace lx::test
