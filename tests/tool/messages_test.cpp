// SPDX-License-Identifier: Apache-2.0
// The tools' own messages: the catalogs against the code, and what users of other languages see.
#include <filesystem>
#include <fstream>
#include <regex>
#include <set>
#include <sstream>

#include "tests/support/environment.hpp"
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

std::string parts(const std::string& text) {
  std::set<std::string> found;
  for (std::size_t at = 0; (at = text.find('{', at)) != std::string::npos; ++at) {
    if (text.substr(at + 2, 1) == "}") found.insert(text.substr(at, 3));
  }
  return testing::PrintToString(found);
}

// All texts between quotes, neighbours joined, and those that are meant for people: the first argument of message(),
// and what has words among the arguments of functions that report something.
void collect_literals(const fs::path& file, std::set<std::string>& all, std::set<std::string>& messages) {
  static const std::regex comment(R"re((^|\n) *//[^\n]*)re"), words("[a-z}] [a-z]"), message(R"re(message\(\s*$)re"),
      piece(R"re("((?:[^"\\]|\\.)*)")re"), literal(R"re(R"\(((?:.|\n)*?)\)"|'"'|(?:"(?:[^"\\]|\\.)*"\s*)+)re"),
      report(R"re((^|[^_])(error|fail|bad|need|require|word|check_alone|Fault|Error)\()re");
  std::ostringstream content;
  content << std::ifstream(file).rdbuf();
  const std::string code = std::regex_replace(content.str(), comment, "");
  std::string statement;  // up to here, without its texts
  for (std::sregex_iterator at(code.begin(), code.end(), literal), end; at != end; ++at) {
    statement += at->prefix();
    for (const char* begin : {";", "{\n", "}\n"}) statement.erase(0, statement.rfind(begin) + 1);
    const std::string pieces = at->str();
    std::string text = (*at)[1];
    const bool raw = (*at)[1].matched;
    for (std::sregex_iterator one(pieces.begin(), pieces.end(), piece); !raw && one != end; ++one) {
      text += unescaped((*one)[1]);
    }
    all.insert(text);
    const bool is_reported = std::regex_search(statement, report) && std::regex_search(text, words);
    if (is_reported || std::regex_search(statement, message)) messages.insert(text);
  }
}

// The texts in the help of a command and those below it: what it does, the lists' second column and the notes.
void collect_help(const ToolInput& program, const Arguments& command, std::set<std::string>& texts) {
  constexpr std::size_t kColumn = 30;
  static const std::set<std::string> headings = {"Positionals:", "Options:", "Subcommands:"};
  const std::string help = run_tool(command + "--help", program).output;
  std::string list;
  for (std::size_t at = 0, end = 0; at < help.size(); at = end + 1) {
    end = help.find('\n', at);
    const std::string line = help.substr(at, end - at);
    if (at == 0) texts.insert(line);
    if (headings.contains(line)) {
      list = line;
    } else if (!list.empty() && !line.empty() && line[0] != ' ') {
      texts.insert(help.substr(at, help.size() - at - 1));
      return;
    } else if (!list.empty() && line.size() > kColumn && line[kColumn - 1] == ' ') {
      texts.insert(line.substr(kColumn));
      if (list != "Subcommands:") continue;
      collect_help(program, command + Arguments{line.substr(2, line.find(' ', 2) - 2)}, texts);
    }
  }
}

TEST(MessageCatalogs, HoldTheTextsOfTheCodeInAllLanguages) {
  std::set<std::string> all = {"Print this help message and exit", "Display program version information and exit"};
  std::set<std::string> messages;
  for (const char* folder : {"/tools/lexaro", "/tools/lexaroc"}) {
    for (const auto& entry : fs::directory_iterator(LEXARO_SOURCE + std::string(folder))) {
      if (entry.path().extension() != ".txt") collect_literals(entry.path(), all, messages);
    }
  }
  ToolInput program;
  program.environment["LC_ALL"] = "C.UTF-8";
  for (const char* path : {LEXARO_TOOL, LEXAROC_TOOL}) {
    program.program = path;
    collect_help(program, {}, messages);
  }
  EXPECT_TRUE(messages.contains("List the sort orders") && messages.contains("Check sources or compiled files"));
  Texts german = catalog("de");
  Texts japanese = catalog("ja");
  std::set<std::string> english;
  for (const auto& [number, text] : catalog("en")) {
    english.insert(text);
    const bool of_code = !number.starts_with("8 ");  // the others are the system's
    EXPECT_TRUE(!of_code || all.contains(text)) << number << " is not in the code: " << text;
    EXPECT_EQ(parts(german[number]), parts(text)) << number;
    EXPECT_EQ(parts(japanese[number]), parts(text)) << number;
    EXPECT_FALSE(german[number].empty() || japanese[number].empty()) << number;
  }
  for (const std::string& text : messages) EXPECT_TRUE(english.contains(text)) << "not in the catalogs: " << text;
  EXPECT_EQ(german.size(), japanese.size());
}

TEST_F(Messages, SpeakTheUsersLanguage) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  const std::string broken = fs::path(write("lexaro", "no catalog")).parent_path();
  const std::string english = "there is no command \"x\"";
  const std::string long_name(300, 'x');
  const std::string page = write("cp_00001.txt", "41 A\n41 B\nname X\n");
  const struct {
    Environment environment;
    Arguments arguments;
    std::string text;
    const char* program = LEXARO_TOOL;
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
      {{{"LANG", "de_DE.UTF-8"}}, "convert -f", "--from: 1 Wert fehlt: FROM"},
      {{{"LANG", "ja_JP.UTF-8"}}, "convert --nl cr", "--nl: cr は {keep,lf,nel,crlf} のいずれでもありません"},
      {{{"LANG", "de_DE.UTF-8"}}, "", "Es fehlt ein Befehl\nMehr zeigt der Aufruf mit --help.\n", LEXAROC_TOOL},
      {{{"LANG", "de_DE.UTF-8"}}, "data a", "OUTPUT_DIR fehlt", LEXAROC_TOOL},
      {{{"LANG", "ja_JP.UTF-8"}}, "data --layout 3", "値 3 は 1 から 2 の範囲にありません", LEXAROC_TOOL},
      {{{"LANG", "de_DE.UTF-8"}}, {"check", page}, ":2:4: die Bytes 41 sind doppelt angegeben\n", LEXAROC_TOOL},
      {{{"LANG", "de_DE.UTF-8"}},
       {"check", long_name},
       "lexaroc: " + long_name + ": Dateiname zu lang\n",
       LEXAROC_TOOL},
      // Columns, and help that is whole or English
      {{{"LANG", "ja_JP.UTF-8"}}, "data -h", "\n  SOURCE_DIR TEXT 必須        ソース", LEXAROC_TOOL},
      {{{"LANG", "de_DE.ISO-8859-1"}}, "catalog -h", "Compile a message catalog\nUsage", LEXAROC_TOOL},
  };
  for (const auto& one : cases) {
    ToolInput input;
    input.environment = one.environment;
    input.program = one.program;
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

TEST_F(Messages, AreShownInTheEncodingOfTheTerminal) {
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
