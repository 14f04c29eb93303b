// SPDX-License-Identifier: Apache-2.0
// The tools' own messages: the catalogs against the code, and what users of other languages see.
#include <filesystem>
#include <fstream>
#include <regex>
#include <set>
#include <sstream>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

namespace fs = std::filesystem;
using Texts = std::map<std::string, std::string>;  // "set message" and the text, as a source would write it
using Messages = ToolTest;

std::string unescaped(const std::string& literal) {
  std::string text;
  for (std::size_t i = 0; i < literal.size(); ++i) {
    const bool escape = literal[i] == '\\' && i + 1 < literal.size();
    text += !escape ? literal[i] : literal[++i] == 'n' ? '\n' : literal[i];
  }
  return text;
}

Texts catalog(const std::string& language) {
  ToolInput input;
  input.environment["LC_ALL"] = "C.UTF-8";
  const ToolResult result = run_tool({"catalog", LEXARO_MESSAGES "/lexaro." + language + ".cat"}, input);
  EXPECT_EQ(result.status, 0) << result.errors;
  Texts texts;
  for (const std::string& line : lines_of(result.output)) {
    const std::size_t blank = line.find(' ', line.find(' ') + 1);
    texts[line.substr(0, blank)] = unescaped(line.substr(blank + 1));
  }
  return texts;
}

std::set<std::string> placeholders(const std::string& text) {
  static const std::regex field("\\{[0-9]\\}");
  return {std::sregex_token_iterator(text.begin(), text.end(), field), {}};
}

// All texts between quotes, neighbours joined, and those that are the first argument of message().
void collect_literals(const fs::path& file, std::set<std::string>& all, std::set<std::string>& messages) {
  std::ostringstream content;
  content << std::ifstream(file).rdbuf();
  const std::string code = content.str();
  std::string joined;
  std::size_t end = 0;
  bool is_message = false;
  const auto finish = [&] {
    all.insert(joined);
    if (is_message && !joined.empty()) messages.insert(joined);
    joined.clear();
  };
  for (std::size_t at = code.find('"'); at != std::string::npos; at = code.find('"', end)) {
    const bool raw = code.compare(at - 1, 3, "R\"(") == 0;
    if (!raw && code[at - 1] == '\'' && (end = at + 1)) continue;  // the character '"'
    if (code.find_first_not_of(" \n", end) != at || end == 0) {
      finish();
      is_message = at >= 8 && code.substr(0, code.find_last_not_of(" \n", at - 1) + 1).ends_with("message(");
    }
    end = raw ? code.find(")\"", at) + 1 : at + 1;
    while (!raw && code[end] != '"') end += code[end] == '\\' ? 2 : 1;
    joined += raw ? code.substr(at + 2, end - at - 3) : unescaped(code.substr(at + 1, end - at - 1));
    ++end;
  }
  finish();
}

TEST(MessageCatalogs, HoldTheTextsOfTheCodeInAllLanguages) {
  std::set<std::string> all = {"Print this help message and exit", "Display program version information and exit"};
  std::set<std::string> messages;
  for (const char* folder : {"/tools/lexaro", "/tools/lexaroc"}) {
    for (const auto& entry : fs::directory_iterator(LEXARO_SOURCE + std::string(folder))) {
      if (entry.path().extension() != ".txt") collect_literals(entry.path(), all, messages);
    }
  }
  Texts german = catalog("de");
  Texts japanese = catalog("ja");
  std::set<std::string> english;
  for (const auto& [number, text] : catalog("en")) {
    english.insert(text);
    const bool of_code = !number.starts_with("8 ");  // the others are the system's
    EXPECT_TRUE(!of_code || all.contains(text)) << number << " is not in the code: " << text;
    EXPECT_EQ(placeholders(german[number]), placeholders(text)) << number;
    EXPECT_EQ(placeholders(japanese[number]), placeholders(text)) << number;
    EXPECT_FALSE(german[number].empty() || japanese[number].empty()) << number;
  }
  for (const std::string& text : messages) EXPECT_TRUE(english.contains(text)) << "not in the catalogs: " << text;
  EXPECT_EQ(german.size(), japanese.size());
}

TEST_F(Messages, SpeakTheUsersLanguage) {
  const std::string broken = fs::path(write("lexaro", "no catalog")).parent_path();
  const std::string english = "there is no command \"x\"";
  const struct {
    Environment environment;
    Arguments arguments;
    std::string text;
  } cases[] = {
      {{{"LANG", "de_DE.UTF-8"}}, "help x", "Es gibt keinen Befehl „x“"},
      {{{"LANG", "ja_JP.UTF-8"}}, "help x", "コマンド「x」はありません"},
      {{{"LANG", "ja_JP.eucJP"}}, "help x", bytes("A5B3A5DEA5F3A5C9A1D6") + "x"},
      {{{"LANG", "ja_JP.UTF-8"}, {"LC_ALL", "C"}}, "help x", english},
      {{{"LANG", "ja_JP.UTF-8"}, {"LX_LANG", "German"}}, "help x", "keinen Befehl"},
      {{{"LANG", "de_DE.UTF-8"}, {"LX_NLSPATH", broken}}, "help x", "keinen Befehl"},
      {{{"LANG", "de_DE.UTF-8"}}, "convert -f 37 none", "Datei oder Verzeichnis nicht gefunden"},
      {{{"LANG", "de_DE.UTF-8"}}, "help", "Aufruf: lexaro [OPTIONEN] BEFEHL"},
      {{{"LANG", "ja_JP.eucJP"}}, "sort --help", bytes("B9D4A4F2A5EDA5B1A1BCA5EBA4CE")},
      {{}, "parse integer --base 16 FFFFFFFF", "the value does not fit into 32 bits"},
  };
  for (const auto& one : cases) {
    ToolInput input;
    input.environment = one.environment;
    const ToolResult result = run_tool(one.arguments, input);
    EXPECT_NE((result.output + result.errors).find(one.text), std::string::npos)
        << testing::PrintToString(one.environment) << " " << result.output << result.errors;
  }
}

TEST_F(Messages, AreReplacedByTheUsersOwn) {
  // The second one has lost its part, so the installed one serves.
  const std::string source = write("m.msg", "$quote \"\n$set 1\n4 \"Nö: {0}\"\n6 \"Nö\"\n");
  ToolInput input;
  input.program = LEXAROC_TOOL;
  ASSERT_EQ(run_tool({"catalog", source, "-o", path("lexaro"), "--locale", "German.UTF-8"}, input).status, 0);
  input.program = LEXARO_TOOL;
  input.environment = {{"LANG", "de_DE.UTF-8"}, {"LX_NLSPATH", fs::path(source).parent_path()}};
  EXPECT_EQ(run_tool("help x", input).errors, "lexaro: Nö: x\n");
  EXPECT_NE(run_tool("sort --frob", input).errors.find("Versuchen Sie"), std::string::npos);
}

}  // namespace
}  // namespace lx::test
