// SPDX-License-Identifier: Apache-2.0
// What locales know, by the names that users and systems give them.
#include <filesystem>
#include <nlohmann/json.hpp>
#include <sstream>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

namespace fs = std::filesystem;
using Environment = std::map<std::string, std::string>;
using Locale = ToolTest;

ToolResult run_in(const Environment& environment, const Arguments& arguments) {
  ToolInput input;
  input.environment = environment;
  return run_tool(arguments, input);
}

nlohmann::json json_in(const Environment& environment, const Arguments& arguments) {
  const ToolResult result = run_in(environment, arguments);
  EXPECT_EQ(result.status, 0) << result.errors;
  return nlohmann::json::parse(result.output, nullptr, false);
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
      {{{"LANG", "C.UTF-8"}}, "English_UnitedStates.UTF-8@Binary", "is taken as"},
      {{{"LANG", "en_GB.utf8"}}, "English_UnitedKingdom.UTF-8@Default", "is taken as"},
      {{{"LANG", "nb_NO.UTF-8"}}, "Norwegian_Norway.UTF-8@Danish", "is taken as"},
      {{{"LANG", "zh_TW.UTF-8"}}, "TraditionalChinese_Taiwan.UTF-8@Binary", "is taken as"},
      {{{"LANG", "fr_CH.ISO8859-15@euro"}}, "French_French-Switzerland.ISO-8859-15@Default", "modifier euro"},
      {{{"LANG", "fr_LU"}}, "French_France.Latin1@Default", "territory LU"},
      {{{"LANG", "it_IT.KLINGON"}}, "Italian_Italy.Latin1@Default", "code set KLINGON"},
      {{{"LANG", "xx_YY.UTF-8"}}, "English_UnitedStates.UTF-8@Default", "\"xx_YY.UTF-8\" of the system is not known"},
      {{{"LANG", "C"}, {"LC_ALL", "cs_CZ.UTF-8"}}, "Czech_CzechRepublic.UTF-8@Czech", "cs_CZ.UTF-8 is taken"},
      {{{"LANG", "de_DE.UTF-8"}, {"LC_TIME", "fr_CA.UTF-8"}, {"LC_CTYPE", "ja_JP.eucJP"}},
       "CanadianFrench_Germany.JapanEUC@Default",
       "/ja_JP.eucJP/de_DE.UTF-8/fr_CA.UTF-8/"},
      {{{"LANG", "fr"}, {"LX_LANG", "German_Austria.IBM-930@binary"}}, "German_Austria.IBM930@Binary", ""},
      {{{"LX_LANG", "pl_PL.UTF-8"}}, "Polish_Poland.UTF-8@Default", "is taken as"},
      {{{"LX_LANG", "German_Nowhere"}}, "German_Germany.Latin1@Default", "LX_LANG is not known (territory not found)"},
      {{{"LX_LANG", ""}}, "English_UnitedStates.Latin1@Default", ""},
  };
  for (const auto& c : cases) {
    const ToolResult result = run_in(c.environment, {"locale", "--item", "locale"});
    EXPECT_EQ(result.status, 0) << c.locale;
    EXPECT_EQ(result.output, std::string(c.locale) + "\n");
    EXPECT_NE(result.errors.find(c.message), std::string::npos) << result.errors;
    EXPECT_EQ(result.errors.empty(), *c.message == '\0') << result.errors;
  }
}

TEST_F(Locale, ByName) {
  const struct {
    const char* name;
    int status;
    const char* text;  // the locale, or part of the message
  } cases[] = {
      {"German_Austria.latin1", 0, "German_Austria.Latin1@Default\n"},
      {"french.850", 0, "French_France.IBM850@Default\n"},
      {".utf8", 0, "English_UnitedStates.UTF-8@Default\n"},
      {"/ja/C/de/C", 0, "German_UnitedStates.JapanEUC@Binary\n"},
      {"de_CH.utf8", 0, "German_German-Switzerland.UTF-8@Default\n"},
      {"Germn", 4, "unknown locale or language \"Germn\"; did you mean German?"},
      {"xx_YY", 4, "unknown locale or language \"xx\""},
      {"/", 4, "unknown locale or language"},
      {"German_Germny.UTF-8", 4, "unknown territory \"Germny\"; did you mean Germany?"},
      {"German.utf9", 4, "unknown code page \"utf9\"; did you mean UTF-8?"},
      {"German@Nosort", 4, "unknown sort \"Nosort\""},
      {"\x1B[31m", 4, "\"?[31m\""},
  };
  for (const auto& c : cases) {
    const ToolResult result = run_in({{"LANG", "C"}}, {"locale", c.name, "--item", "88"});
    EXPECT_EQ(result.status, c.status) << c.name;
    const std::string& told = c.status == 0 ? result.output : result.errors;
    EXPECT_NE(told.find(c.text), std::string::npos) << c.name << ": " << told;
    EXPECT_EQ(result.output.empty(), c.status != 0) << result.output;
  }
}

TEST_F(Locale, AllItemsByNumberAndName) {
  const auto json = json_in({}, {"locale", "German_German-Switzerland.UTF-8", "--json"});
  const struct {
    const char* number;
    const char* name;
    nlohmann::json value;
  } cases[] = {{"1", "language.id", 2},          {"8", "territory.own_name", "Schweiz"},
               {"9", "codepage.id", 57352},      {"12", "sort.name", "Default"},
               {"16", "day.sunday", "Sonntag"},  {"23", "abday.sunday", "So."},
               {"32", "month.3", "M\u00E4rz"},   {"42", "month.13", ""},
               {"59", "decimal", "."},           {"60", "thousands", "'"},
               {"65", "currency_intl", "CHF"},   {"78", "n_sign_posn", 4},
               {"85", "codepage.max_length", 3}, {"88", "locale", "German_German-Switzerland.UTF-8@Default"}};
  for (const auto& c : cases) EXPECT_EQ(json[c.name], c.value) << c.name;

  // Each number has one name, each name one value, and the long list shows them all.
  Arguments all = {"locale", "German_German-Switzerland.UTF-8"};
  for (int number = 1; number <= 88; ++number) all.insert(all.end(), {"--item", std::to_string(number)});
  std::istringstream values(run_in({{"LANG", "C.UTF-8"}}, all).output);
  all.push_back("--json");
  const auto in_order = nlohmann::ordered_json::parse(run_tool(all).output);
  const std::string text = run_in({{"LANG", "C.UTF-8"}}, {"locale", "German_German-Switzerland.UTF-8"}).output;
  for (const auto& [name, value] : in_order.items()) {
    std::string line;
    std::getline(values, line);
    EXPECT_EQ(line, value.is_string() ? value.get<std::string>() : value.dump()) << name;
    EXPECT_EQ(nlohmann::json(value), json[name]) << name;
    EXPECT_NE(text.find(" " + name + " "), std::string::npos) << name;
  }
  EXPECT_EQ(in_order.size(), 88U);
  EXPECT_EQ(json.size(), 88U);
  for (const auto& c : cases) EXPECT_NE(text.find(std::string(c.number) + "  " + c.name), std::string::npos) << c.name;
}

// The code page of the locale lacks the pound sign, that of the terminal has it.
TEST_F(Locale, ValuesAreNotCutToTheCodePageOfTheLocale) {
  const Arguments own = {"locale", "English_UnitedKingdom.US-ASCII", "--item", "currency"};
  Arguments territory = own;
  territory.push_back("--territory");
  for (const Arguments& arguments : {own, territory}) {
    EXPECT_EQ(run_in({{"LANG", "C.UTF-8"}}, arguments).output, "\u00A3\n");
  }
}

TEST_F(Locale, InTheEncodingOfTheTerminal) {
  const struct {
    Environment environment;
    const char* name;
    std::string own_name;
  } cases[] = {{{{"LANG", "C.UTF-8"}}, "French", "fran\u00E7ais\n"},
               {{{"LANG", "fr_FR.ISO-8859-1"}},
                "French",
                "fran\xE7"
                "ais\n"},
               {{{"LANG", "ja_JP.eucJP"}}, "Japanese", bytes("C6FC CBDC B8EC 0A")},
               {{{"LANG", "C"}, {"LC_CTYPE", "ja_JP.SJIS"}}, "Japanese", bytes("93FA 967B 8CEA 0A")},
               {{{"LANG", "fr_FR.KLINGON"}}, "French", "fran\u00E7ais\n"},
               {{{"LANG", "C"}}, "Japanese", "???\n"}};
  for (const auto& c : cases) {
    EXPECT_EQ(run_in(c.environment, {"locale", c.name, "--item", "4"}).output, c.own_name);
    EXPECT_EQ(json_in(c.environment, {"locale", "French", "--item", "4", "--json"})["language.own_name"],
              "fran\u00E7ais");
  }
}

TEST_F(Locale, SystemNames) {
  const struct {
    const char* name;
    nlohmann::json exact;
    const char* nearest;
    nlohmann::json means;
  } cases[] = {{"Japanese.MS932", "ja_JP.PCK", "ja_JP.PCK", "Japanese_Japan.MS932@Binary"},
               {"English_UnitedKingdom.UTF-8@BINARY", nullptr, "en_UK", "English_UnitedKingdom.Latin1@Default"},
               {"English_UnitedStates.UTF-8@BINARY", nullptr, "en_US.UTF-8", nullptr},
               {"Polish", nullptr, "C", "English_UnitedStates.US-ASCII@Binary"}};
  for (const auto& c : cases) {
    const auto json = json_in({}, {"locale", c.name, "--native", "--json"});
    EXPECT_EQ(json["exact"], c.exact) << c.name;
    EXPECT_EQ(json["nearest"], c.nearest) << c.name;
    EXPECT_EQ(json["nearest_locale"], c.means) << c.name;
    const ToolResult text = run_tool({"locale", c.name, "--native"});
    EXPECT_NE(text.output.find("nearest name       " + std::string(c.nearest) + "\n"), std::string::npos);
  }
}

TEST_F(Locale, WrongUse) {
  for (const Arguments& arguments : {Arguments{"locale", "--item", "89"},
                                     {"locale", "--item", "0"},
                                     {"locale", "--item", "Decimal point"},
                                     {"locale", "--item"},
                                     {"locale", "--native", "--item", "1"},
                                     {"locale", "C", "POSIX"}}) {
    const ToolResult result = run_tool(arguments);
    EXPECT_EQ(result.status, 2) << result.errors;
    EXPECT_EQ(result.output, "");
  }
  ToolInput full;
  full.output_path = "/dev/full";
  EXPECT_EQ(run_tool({"locale"}, full).status, 3);
}

TEST_F(Locale, WithoutData) {
  // A program that stands alone finds no data beside it, only the library that the linker is told of.
  fs::create_directory(path("bin"));
  fs::copy(LEXARO_TOOL, path("bin/lexaro"));
  ToolInput input;
  input.program = path("bin/lexaro");
  input.environment = {{"LD_LIBRARY_PATH", LEXARO_LIBRARY_DIR}, {"LANG", "de_CH.UTF-8"}};
  const ToolResult user = run_tool({"locale", "--item", "day.sunday", "--item", "codepage.name"}, input);
  EXPECT_EQ(user.status, 0);
  EXPECT_EQ(user.output, "Sunday\nUS-ASCII\n");
  EXPECT_NE(user.errors.find("built-in"), std::string::npos) << user.errors;
  EXPECT_NE(user.errors.find("\"de_CH.UTF-8\" of the system is not known"), std::string::npos) << user.errors;
  EXPECT_EQ(run_tool({"locale", "German"}, input).status, 4);
  EXPECT_EQ(run_tool({"locale", "C", "--json"}, input).status, 0);
  EXPECT_EQ(run_tool({"--locale-dir", path("bin"), "locale"}, input).status, 4);
  EXPECT_EQ(run_tool({"list", "languages"}, input).status, 4);
}

// A damaged object is never replaced by another one's values.
TEST_F(Locale, DamagedObjects) {
  fs::copy(LEXARO_DATA, path("data"));
  write("data/la_00002.nls", "short");
  fs::remove(path("data/te_00826.nls"));
  for (const char* name : {"German", "English_UnitedKingdom", "de_CH.UTF-8"}) {
    const ToolResult result = run_tool({"--locale-dir", path("data"), "locale", name});
    EXPECT_EQ(result.status, 4) << name;
    EXPECT_EQ(result.output, "");
  }
  EXPECT_EQ(run_tool({"--locale-dir", path("data"), "locale", "French"}).status, 0);
  const ToolResult list = run_tool({"--locale-dir", path("data"), "list", "languages"});
  EXPECT_EQ(list.status, 4);
  EXPECT_NE(list.errors.find("German: its file "), std::string::npos) << list.errors;
  EXPECT_EQ(list.output.find("Deutsch"), std::string::npos);
  EXPECT_NE(list.output.find("italiano"), std::string::npos);
}

}  // namespace
}  // namespace lx::test
