// SPDX-License-Identifier: Apache-2.0
// The directory of objects: how it is found, and what is made of good and bad ones.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "support/counting_allocator.hpp"
#include "support/descriptors.hpp"
#include "support/environment.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

// What a manager is asked: the first object of each type, and how many there are.
std::string contents_of(LXObjMgr* manager) {
  std::string text;
  for (uint8_t type = 0; type < 4; ++type) {
    int count = 0;
    uint32_t rc = 0;
    for (unsigned id = type == LX_SORT ? 1 : 0; id < 65536; ++id) {
      if (LXGetObjFromID(manager, type, static_cast<uint16_t>(id), 1, &rc) != nullptr) ++count;
    }
    text += std::to_string(count) + (type < 3 ? " " : "");
  }
  return text;
}

struct Managed {
  explicit Managed(const char* directory, uint32_t options = 0) : manager(LXInitObjManager(directory, options, &rc)) {}
  ~Managed() { LXTermObjManager(manager); }
  Managed(const Managed&) = delete;
  Managed& operator=(const Managed&) = delete;
  uint32_t rc = 99;
  LXObjMgr* manager;
};

TEST(ControlFile, TypesMayBeMissing) {
  struct Case {
    std::vector<ObjectRecord> records;
    const char* contents;
  };
  const ObjectRecord la{LX_LANGUAGE, 1, "L"}, la2{LX_LANGUAGE, 9, "L2"}, te{LX_TERRITORY, 2, "T"},
      cp{LX_CODEPAGE, 3, "C"}, cp2{LX_CODEPAGE, 4, "C2"}, so{LX_SORT, 5, "S"};
  const Case cases[] = {
      {{la, la2, te, cp, cp2, so}, "2 1 2 1"}, {{cp, cp2}, "0 0 2 0"}, {{te, so}, "0 1 0 1"}, {{}, "0 0 0 0"}};
  for (const Case& one : cases) {
    DataDirectory directory;
    directory.write_control(one.records);
    Managed managed(directory.path(), LX_INIT_NO_DEFAULTS);
    EXPECT_EQ(managed.rc, LX_OK) << one.contents;
    EXPECT_EQ(contents_of(managed.manager), one.contents);
  }
}

TEST(ControlFile, OddRecordsAreHarmless) {
  DataDirectory directory;
  directory.write_control({{LX_TERRITORY, 1, std::string(34, 'n'), 0xFF},  // foreign flags and a name without an end
                           {LX_CODEPAGE, 9, "Nine"},
                           {LX_CODEPAGE, 3, "Three"},
                           {LX_CODEPAGE, 9, "Nine2"}});
  directory.write_object(LX_TERRITORY, 1, territory_file());
  Managed managed(directory.path(), LX_INIT_NO_DEFAULTS);
  EXPECT_EQ(managed.rc, LX_OK);
  uint32_t rc = 0;
  for (const char* name : {"Nine", "Three", "Nine2"}) {
    EXPECT_NE(LXGetObjFromName(managed.manager, LX_CODEPAGE, name, -1, 1, &rc), nullptr) << name;
  }
  contents_of(managed.manager);
  LXObjEntry* entry = LXGetObjFromName(managed.manager, LX_TERRITORY, std::string(33, 'N').c_str(), -1, 0, &rc);
  ASSERT_NE(entry, nullptr);
  EXPECT_EQ(rc, LX_OK);
  EXPECT_EQ(std::string(LXGetObjName(entry)), std::string(33, 'n'));
}

TEST(ControlFile, BadOnesAreRefused) {
  const Bytes good = control_file(small_directory_records());
  struct Case {
    const char* what;
    Bytes (*spoil)(Bytes);
    uint32_t rc;
  };
  const Case cases[] = {{"good", [](Bytes b) { return b; }, LX_OK},
                        {"empty", [](Bytes) { return Bytes(); }, LX_E_FILE},
                        {"magic", [](Bytes b) { return b[3] ^= 1, b; }, LX_E_HEADER},
                        {"no section", [](Bytes b) { return b[9] = 0, b; }, LX_E_HEADER},
                        {"many sections", [](Bytes b) { return b[8] = 9, b; }, LX_OK},
                        {"directory too long", [](Bytes b) { return b[10] = 0xFF, b; }, LX_E_FILE},
                        {"directory one byte longer", [](Bytes b) { return b[11]++, b.push_back(0), b; }, LX_OK},
                        {"directory elsewhere", [](Bytes b) { return b[15]++, b; }, LX_E_FILE},
                        {"directory far away", [](Bytes b) { return b[12] = 0xFF, b; }, LX_E_FILE},
                        {"cut", [](Bytes b) { return b.pop_back(), b; }, LX_E_FILE},
                        {"unknown type", [](Bytes b) { return b[76 + 38 * 8 + 2] = 4, b; }, LX_E_HEADER},
                        {"types out of order", [](Bytes b) { return b[76 + 2] = LX_CODEPAGE, b; }, LX_E_HEADER}};
  long before = open_descriptors();
  for (const Case& one : cases) {
    SCOPED_TRACE(one.what);
    DataDirectory directory;
    directory.write("control.nls", one.spoil(good));
    {
      Managed managed(directory.path(), LX_INIT_NO_DEFAULTS);
      EXPECT_EQ(managed.rc, one.rc);
      ASSERT_NE(managed.manager, nullptr);
      EXPECT_EQ(contents_of(managed.manager), one.rc == LX_OK ? "2 2 5 0" : "0 0 0 0");
    }
    Managed managed(directory.path());
    EXPECT_EQ(managed.rc, one.rc) << "built-in objects stand in, and the error is still told";
    EXPECT_EQ(contents_of(managed.manager), one.rc == LX_OK ? "2 2 5 0" : "1 1 1 0");
  }
  EXPECT_EQ(open_descriptors(), before);
}

// Where it is looked for: in the directory given, that of the variable, the default one. A file that is bad or a name
// that is too long ends the search.
TEST(ControlFile, IsSearchedFor) {
  if (access("/Vantrel/locale/control.nls", F_OK) == 0) GTEST_SKIP() << "this system has a default directory";
  DataDirectory given, variable, empty, bad, folder;
  given.write_control({{LX_LANGUAGE, 1, "Given"}});
  variable.write_control({{LX_LANGUAGE, 1, "Variable"}});
  bad.write("control.nls", Bytes(100));
  ASSERT_EQ(mkdir(folder.file("control.nls").c_str(), 0755), 0);
  const std::string fits(242, 'x'), too_long = fits + "x", longest(100000, 'x');
  struct Case {
    const char *directory, *location, *found;
    uint32_t rc;
  };
  const Case cases[] = {{given.path(), variable.path(), "Given", LX_OK},
                        {nullptr, variable.path(), "Variable", LX_OK},
                        {empty.path(), variable.path(), "Variable", LX_OK},
                        {empty.path(), empty.path(), "English", LX_E_NOFILE},
                        {empty.path(), nullptr, "English", LX_E_NOFILE},
                        {nullptr, "", "English", LX_E_NOFILE},
                        {bad.path(), variable.path(), "English", LX_E_HEADER},
                        {folder.path(), nullptr, "English", LX_E_FILE},
                        {too_long.c_str(), variable.path(), "English", LX_E_FILE},
                        {longest.c_str(), variable.path(), "English", LX_E_FILE},
                        {nullptr, too_long.c_str(), "English", LX_E_FILE},
                        {nullptr, longest.c_str(), "English", LX_E_FILE},
                        {fits.c_str(), too_long.c_str(), "English", LX_E_FILE},
                        {fits.c_str(), nullptr, "English", LX_E_NOFILE}};
  for (const Case& one : cases) {
    Variable location("LX_LOCALEDIR", one.location);
    Managed managed(one.directory);
    EXPECT_EQ(managed.rc, one.rc);
    uint32_t rc = 0;
    EXPECT_STREQ(LXGetObjName(LXGetObjFromID(managed.manager, LX_LANGUAGE, 1, 1, &rc)), one.found);
    Session session(one.directory);
    EXPECT_EQ(session.status, one.rc == LX_OK ? LX_OK : LX_E_DEFAULTS);
  }
}

// The longest directory that can hold a control file also serves its objects.
TEST(ControlFile, LongestDirectory) {
  DataDirectory base;
  const std::string name(242 - base.file("").size(), 'd');
  ASSERT_EQ(mkdir(base.file(name).c_str(), 0755), 0);
  base.write(name + "/control.nls", control_file({{LX_TERRITORY, 1, "T"}}));
  base.write(name + "/te_00001.nls", territory_file());
  Managed managed(base.file(name).c_str(), LX_INIT_NO_DEFAULTS);
  EXPECT_EQ(managed.rc, LX_OK);
  uint32_t rc = 0;
  EXPECT_NE(LXGetObjFromID(managed.manager, LX_TERRITORY, 1, 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_OK);
}

// What was given out before stays as it is, to the manager's end.
TEST(ControlFile, BuiltInObjectsTakeThePlaceOfOthers) {
  DataDirectory directory;
  write_small_directory(directory);
  static CountingAllocator memory;  // managers that need no LXInit go on using it
  ASSERT_EQ(memory.init(directory.path()), LX_OK);
  LXObjMgr* manager = LXGetObjManager();
  uint32_t rc = 99;
  LXObjEntry* entry = LXGetObjFromName(manager, LX_CODEPAGE, "Small", -1, 0, &rc);
  memory.arm(0, true);
  EXPECT_EQ(LXLoadDefaults(manager), 0u);
  EXPECT_EQ(contents_of(manager), "2 2 5 0");
  memory.disarm();
  for (int i = 0; i < 2; ++i) {
    EXPECT_EQ(LXLoadDefaults(manager), 1u);
    EXPECT_EQ(contents_of(manager), "1 1 1 0");
    LXCodePageInfo info;
    EXPECT_EQ(LXGetCodePageInfo(entry, &info), LX_OK);
    EXPECT_EQ(info.max_length, 4);
  }
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(memory.live, 0);
}

}  // namespace
}  // namespace lx::test
