// SPDX-License-Identifier: Apache-2.0
// The compiler of message catalogs: what it makes is read back by its own dump and by the library.
#include <lexaro/lexaro.h>

#include "compiler_run.hpp"

namespace {

class CatalogCompilerTest : public CompilerTest {
 protected:
  CatalogCompilerTest() { LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, 0); }
  ~CatalogCompilerTest() override { LXTerm(); }

  Outcome catalog(const std::string& source, const std::string& options = "", const std::string& page = "UTF-8") {
    write(work("in.msg"), source);
    return lexaroc("catalog " + quoted(work("in.msg")) + " -o " + quoted(work("out.cat")) +
                   " --locale English_UnitedStates." + page + " --locale-dir " LEXARO_DATA " " + options);
  }
  std::string dump(const std::string& file = "out.cat") {
    Outcome outcome = lexaroc("dump " + quoted(work(file)) + " --locale-dir " LEXARO_DATA);
    EXPECT_EQ(outcome.exit_code, 0) << outcome.output;
    return outcome.output;
  }
  // The messages of what dump prints.
  std::string messages(const std::string& file = "out.cat") {
    std::string text = dump(file);
    return text.substr(text.find("$set"));
  }
};

TEST_F(CatalogCompilerTest, SourcesInTheFormatOfGencat) {
  struct {
    const char *source, *messages;
  } const cases[] = {
      {"1 a\n", "$set 1\n1 \"a\"\n"},
      {"$set 3 x\n$ comment\n\n \t\n1 a b \n2\tc\r\n7  d", "$set 3\n1 \"a b \"\n2 \"c\"\n7 \" d\"\n"},
      {"$set 1\n1 a\\\n b\\\nc\n2 \n", "$set 1\n1 \"a bc\"\n2 \"\"\n"},
      {"1 \\n\\t\\v\\b\\r\\f\\\\\\x\\101\\7\n", "$set 1\n1 \"\\n\\t\\v\\b\\r\\f\\\\xA\\007\"\n"},
      {"$quote '\n1 'a b '\n2 'it\\'s' \n3 it's\n$quote\n4 'q'\n",
       "$set 1\n1 \"a b \"\n2 \"it's\"\n3 \"it's\"\n4 \"'q'\"\n"},
      {"$set 1\n1 a\n$set 2\n1 b\n$delset 1\n", "$set 2\n1 \"b\"\n"},
      {"$set 5\n1 \\377\\200\xE6\x97\xA5\xF0\x9F\x98\x80\n", "$set 5\n1 \"\\377\\200\xE6\x97\xA5\xF0\x9F\x98\x80\"\n"},
  };
  for (const auto& each : cases) {
    Outcome outcome = catalog(each.source);
    ASSERT_EQ(outcome.exit_code, 0) << outcome.output;
    EXPECT_EQ(messages(), each.messages) << each.source;
    EXPECT_EQ(lexaroc("check " + quoted(work("out.cat"))).output, "");
  }
}

TEST_F(CatalogCompilerTest, DumpGoesRoundInEveryPageAndByteOrder) {
  const char* source = "1 A\\n\xE6\x97\xA5 1\xE6\x9C\xAC\\016\\101\n2 \\033[0m\n3 \\016\\017\\016\n9 \xEF\xBD\xB1\n";
  for (const char* page : {"UTF-8", "IBM930", "MS932"}) {
    for (const char* order : {"little", "big"}) {
      ASSERT_EQ(catalog(source, std::string("--byte-order ") + order, page).exit_code, 0);
      std::string compiled = content(work("out.cat"));
      EXPECT_EQ(compiled[11], *order == 'b' ? 1 : 0);
      ASSERT_EQ(catalog(dump(), std::string("--byte-order ") + order, page).exit_code, 0);
      EXPECT_TRUE(content(work("out.cat")) == compiled) << page << dump();
      EXPECT_EQ(lexaroc("check " + quoted(work("out.cat"))).exit_code, 0);
    }
  }
}

TEST_F(CatalogCompilerTest, MergesEncodesAndNames) {
  ASSERT_EQ(catalog("$set 1\n1 a\n2 b\n$set 2\n1 c\n$set 4\n1 d\n").exit_code, 0);
  fs::copy(work("out.cat"), work("old.cat"));
  std::string merge = "--merge " + quoted(work("old.cat"));
  ASSERT_EQ(catalog("$set 1\n2 B\n3 C\n$delset 2\n$set 3\n1 e\n$set 4\n1\n2 f\n", merge).exit_code, 0);
  EXPECT_EQ(messages(), "$set 1\n1 \"a\"\n2 \"B\"\n3 \"C\"\n$set 3\n1 \"e\"\n$set 4\n2 \"f\"\n");
  Outcome other = catalog("1 x\n", merge, "IBM037");
  EXPECT_EQ(other.exit_code, 1);
  EXPECT_NE(other.output.find("has another code page"), std::string::npos) << other.output;

  ASSERT_EQ(catalog("1 \x93\xFA\x96\x7B\n", "--encoding MS932", "IBM930").exit_code, 0);
  EXPECT_EQ(messages(), "$set 1\n1 \"\xE6\x97\xA5\xE6\x9C\xAC\"\n");
  EXPECT_EQ(content(work("out.cat")).substr(152 + 28 + 12), "\x0E\x45\x62\x45\x66\x0F");

  std::string header = "--header " + quoted(work("names.h"));
  ASSERT_EQ(catalog("$set 1 Errors\n$ @NotFound\n3 x\n4 y\n$set 2 two words\n$ @Last\n1 z\n", header).exit_code, 0);
  EXPECT_EQ(content(work("names.h")), "#pragma once\n\n#define Errors 1\n#define NotFound 3\n#define Last 1\n");
}

TEST_F(CatalogCompilerTest, FaultsHaveTheirPlaces) {
  struct {
    const char *source, *message, *options = "", *page = "UTF-8";
  } const cases[] = {
      {"$set 2\n$set 2\n", ":2:6: set numbers must ascend"},
      {"$sat 1\n", ":1:2: an unknown directive"},
      {"2 a\n2 b\n", ":2:1: message numbers must ascend"},
      {"2147483648 a\n", ":1:1: the number is larger than 2147483647"},
      {"hello\n", ":1:1: expected a directive or the number of a message"},
      {"1 a\\", ":1:4: the line is continued, but none follows"},
      {"1 a\\400\n", ":1:4: a byte is at most \\377"},
      {"$quote \"\n1 \"a\n", ":2:5: the closing quote is missing"},
      {"1 a\n2 \xE6\x97\xA5\xFF\n", ":2:4: bytes that are not UTF-8"},
      {"1 a\\\n\xC3\xA9\xE6\x97\xA5\n", ":2:2: U+65E5 is not in the catalog's code page", "", "IBM037"},
      {"1 a\xF0\x9F\x98\x80\n", ":1:4: U+1F600 is not in the catalog's code page", "", "MS932"},
      {"1 a\n2 b\x81\n", ":2:4: this is no character of the source's encoding", "--encoding MS932"},
      {"$ @1x\n1 a\n", ":1:4: a name is letters, digits and \"_\""},
      {"$set 1 A\n$ @A\n1 a\n", ":2:3: the name A is given twice", "--header /dev/null"},
      {"$ nothing\n", ": the catalog would have no sets"},
  };
  for (const auto& each : cases) {
    Outcome outcome = catalog(each.source, each.options, each.page);
    EXPECT_EQ(outcome.exit_code, 1) << each.source;
    EXPECT_NE(outcome.output.find(each.message), std::string::npos) << each.message << "\n" << outcome.output;
    EXPECT_FALSE(fs::exists(work("out.cat")));
  }
}

TEST_F(CatalogCompilerTest, DamagedCatalogsAreNamedNotRead) {
  ASSERT_EQ(catalog("$set 1\n1 one\n2 two\n$set 7\n1 seven\n").exit_code, 0);
  const std::string sound = content(work("out.cat"));
  std::vector<std::string> damaged;
  for (size_t i = 0; i < sound.size(); i += 3) {
    damaged.push_back(sound);
    damaged.back()[i] = static_cast<char>(damaged.back()[i] ^ 0xFF);
    damaged.push_back(sound.substr(0, i));
  }
  expect_harmless("bad.cat", damaged);
}

}  // namespace
