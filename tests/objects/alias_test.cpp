// SPDX-License-Identifier: Apache-2.0
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

using namespace std::string_literals;

const std::string k32(32, 'n');
const std::string k33(33, 'n');
const std::string k64(64, 'a');
const std::string k65(65, 'a');
const std::string kUpper64(64, 'A');

int32_t note(void* context, const char* alias, const char* code_page) {
  *static_cast<std::string*>(context) += std::string(alias) + ">" + code_page + " ";
  return 1;
}

std::string aliases_of(LXObjMgr* manager) {
  std::string text;
  EXPECT_EQ(LXEnumAliases(manager, note, &text), 0);
  return text;
}

TEST(Aliases, OfAFile) {
  struct Case {
    const char* what;
    std::string text;
    std::string aliases;  // in their order
    uint32_t result;
  };
  const Case cases[] = {
      {"continuation", "Latin1 l1\n  iso x\n\ty\n", "L1>Latin1 ISO>Latin1 X>Latin1 Y>Latin1 ", 0},
      {"comments and blank lines between", "Latin1 l1\n# c\n \t\n\n  iso\n", "L1>Latin1 ISO>Latin1 ", 0},
      {"comment sign inside", "Latin1 l#1 #x\n", "L#1>Latin1 #X>Latin1 ", 0},
      {"line ends of other systems", "Latin1 l1\r\n iso\r\n\r\nGreek el\r\n", "L1>Latin1 ISO>Latin1 EL>Greek ", 0},
      {"no ASCII", "A \xE4\xC4z\nB \xE4\xC4z\n", "\xE4\xC4Z>A \xE4\xC4Z>B ", 0},
      {"many short ones", "A b c d e f g h i j k l", "B>A C>A D>A E>A F>A G>A H>A I>A J>A K>A L>A ", 0},
      {"longest name", k32 + " x\n", "X>" + k32 + " ", 0},
      {"longest alias", "A " + k64 + " x\n", kUpper64 + ">A X>A ", 0},
      {"name too long", "A x\n" + k33 + " y\nB z\n", "X>A ", 1},
      {"alias too long", "A x " + k65 + " y\nB z\n", "X>A ", 1},
      {"continuation of nothing", " x\nA y\n", "", 1},
      {"zero byte", "A x\nB \0y\nC z\n"s, "X>A ", 1},
      {"longest line", "A x" + std::string(32764, ' ') + "\nB y\n", "X>A Y>B ", 0},
      {"line too long", "A x\nB y" + std::string(32765, ' ') + "\nC z\n", "X>A ", 1},
  };
  for (const Case& one : cases) {
    SCOPED_TRACE(one.what);
    DataDirectory directory;
    directory.write_control({{LX_CODEPAGE, 1, "C"}});
    uint32_t rc = 99;
    LXObjMgr* manager = LXInitObjManager(directory.path(), LX_INIT_NO_DEFAULTS, &rc);
    directory.write("alias.txt", one.text);
    EXPECT_EQ(LXBuildAliasList(manager), one.result);
    EXPECT_EQ(aliases_of(manager), one.aliases);
    EXPECT_EQ(LXDestroyAliasList(manager), 0u);
    EXPECT_EQ(aliases_of(manager), "");
    LXTermObjManager(manager);

    manager = LXInitObjManager(directory.path(), LX_INIT_NO_DEFAULTS, &rc);
    EXPECT_EQ(rc, LX_OK) << "a bad alias file is no reason to stop";
    EXPECT_EQ(aliases_of(manager), one.aliases);
    directory.remove("alias.txt");
    EXPECT_EQ(LXBuildAliasList(manager), 1u) << "missing";
    ASSERT_EQ(mkdir(directory.file("alias.txt").c_str(), 0755), 0);
    EXPECT_EQ(LXBuildAliasList(manager), 1u) << "a directory";
    LXTermObjManager(manager);
  }
}

TEST(Aliases, AreFoundWithoutRegardToCase) {
  DataDirectory directory;
  write_small_directory(directory);
  directory.write("alias.txt", "Latin1 latin1 " + k64 + "\nOther latin1 x\n");
  Session session(directory.path());
  LXObjMgr* manager = LXGetObjManager();
  for (const char* name : {"LATIN1", "Latin1", "latin1"}) {
    EXPECT_STREQ(LXGetCodepageFromAlias(manager, name), "Latin1") << "the first one wins";
  }
  EXPECT_STREQ(LXGetCodepageFromAlias(manager, kUpper64.c_str()), "Latin1");
  for (const std::string& name : {"latin"s, "latin10"s, ""s, k65, "Other"s}) {
    EXPECT_EQ(LXGetCodepageFromAlias(manager, name.c_str()), nullptr) << name;
  }
  EXPECT_EQ(LXGetCodepageFromAlias(manager, nullptr), nullptr);
  EXPECT_EQ(LXGetCodepageFromAlias(nullptr, "latin1"), nullptr);
  int calls = 0;
  auto count = [](void* context, const char*, const char*) { return int32_t{++*static_cast<int*>(context) < 2}; };
  EXPECT_EQ(LXEnumAliases(manager, count, &calls), 0);
  EXPECT_EQ(calls, 2) << "it stops when told";
}

}  // namespace
}  // namespace lx::test
