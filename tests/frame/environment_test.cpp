// SPDX-License-Identifier: Apache-2.0
// Variables, the names of data files, and the comparison without case.
#include <gtest/gtest.h>

#include "support/environment.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

TEST(Environment, ValueIsCopiedWhenItFits) {
  Variable variable("LX_TEST_VALUE", "abc");
  char buffer[] = "????";
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", buffer, 3), 4);
  EXPECT_STREQ(buffer, "????") << "nothing is copied in part";
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", buffer, 4), 4);
  EXPECT_STREQ(buffer, "abc");
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", nullptr, 100), 4);
  variable.set("");
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", buffer, 1), 1);
  EXPECT_STREQ(buffer, "");
  variable.set(nullptr);
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", buffer, 1), 0);
}

TEST(Environment, DataLocation) {
  Variable variable("LX_LOCALEDIR", nullptr);
  char buffer[32];
  EXPECT_EQ(LXGetDataLocation(buffer, sizeof buffer, 0), -1);
  variable.set("/somewhere");
  EXPECT_EQ(LXGetDataLocation(buffer, 11, 0), 11);
  EXPECT_STREQ(buffer, "/somewhere");
  EXPECT_EQ(LXGetDataLocation(buffer, 10, 0), 0) << "set, but too long";
  EXPECT_EQ(LXGetDataLocation(buffer, 17, 1), 17);
  EXPECT_STREQ(buffer, "/Vantrel/locale");
  EXPECT_EQ(LXGetDataLocation(buffer, 16, 1), 0);
}

TEST(Environment, NamesOfFiles) {
  auto territory = [](const char* directory, char* buffer, int32_t size) {
    return LXGetDataFileName(directory, LX_TERRITORY, 840, buffer, size);
  };
  const struct {
    char* (*get)(const char* directory, char* buffer, int32_t size);
    std::string name;
  } cases[] = {
      {LXGetControlFileName, "/d/control.nls"}, {LXGetAliasFileName, "/d/alias.txt"}, {territory, "/d/te_00840.nls"}};
  for (const auto& [get, name] : cases) {
    const auto exact = static_cast<int32_t>(name.size()) + 1;
    char buffer[32] = "before";
    for (int32_t size : {-1, 0, exact - 1}) EXPECT_EQ(get("/d", buffer, size), nullptr) << name << size;
    EXPECT_STREQ(buffer, "before");
    EXPECT_STREQ(get("/d", buffer, exact), name.c_str());
    EXPECT_EQ(get("/d", nullptr, exact), nullptr) << name;
    EXPECT_EQ(get(nullptr, buffer, exact), nullptr) << name;
  }
  char buffer[32];
  EXPECT_EQ(LXGetDataFileName("/d", 4, 1, buffer, sizeof buffer), nullptr);
}

TEST(Environment, NameThatDoesNotFitIsExplained) {
  char buffer[32];
  testing::internal::CaptureStderr();
  EXPECT_EQ(LXGetDataFileName("/direct", LX_CODEPAGE, 37, buffer, 20), nullptr);
  EXPECT_EQ(LXGetAliasFileName("/direct", buffer, -1), nullptr);
  EXPECT_EQ(testing::internal::GetCapturedStderr(),
            "Buffer provided = 20, needed = 21\n"
            "Buffer provided = -1, needed = 18\n");
}

TEST(Memicmp, IgnoresAsciiCaseOnly) {
  using namespace std::string_view_literals;
  const struct {
    std::string_view a, b;
    int difference;
  } cases[] = {
      {"BINARY", "binary", 0}, {"ab", "AC", -1},         {"", "", 0},
      {"\xC4", "\xE4", -32},   {"[", "{", -32},          {"Z", "[", 'z' - '['},
      {"@", "`", -32},         {"\xFF", "a", 255 - 'a'}, {"a\0x"sv, "a\0Y"sv, -1},
  };
  for (const auto& one : cases) {
    EXPECT_EQ(LXmemicmp(one.a.data(), one.b.data(), one.a.size()), one.difference) << one.a << " " << one.b;
  }
}

TEST(Path, IsCutIntoItsParts) {
  const std::string k14(14, 'f'), k15(15, 'f'), k254(254, 'd'), k255(255, 'd');
  const struct {
    std::string path, drive, directory, file, extension;
  } cases[] = {{"/Vantrel/locale/control.nls", "", "/Vantrel/locale/", "control", ".nls"},
               {"", "", "", "", ""},
               {"a/..", "", "a/..", "", "."},
               {"a/.", "", "a/.", "", "."},
               {"a/.hidden", "", "a/", "", ""},
               {"c:/x/y.z", "c:", "/x/", "y", ".z"},
               {"ab:name", "ab:", "", "name", ""},
               {"abc:name", "", "", "name", ""},
               {"a:b:c/d", "a:", "b:c/", "d", ""},
               {"d.x/f", "", "d.x/", "f", ".x/f"},
               {"name.", "", "", "name", "."},
               {k14 + ".nls", "", "", k14, ".nls"},
               {k15 + ".nlss", "", "", "", ""},
               {k254 + "/f", "", k254 + "/", "f", ""},
               {k255 + "/f", "", "", "f", ""}};
  for (const auto& one : cases) {
    SCOPED_TRACE(one.path);
    char drive[4], directory[256], file[15], extension[5];
    SplitPath(one.path.c_str(), drive, directory, file, extension);
    EXPECT_EQ(drive, one.drive);
    EXPECT_EQ(directory, one.directory);
    EXPECT_EQ(file, one.file);
    EXPECT_EQ(extension, one.extension);
    EXPECT_EQ(SplitDir(one.path.c_str(), directory), static_cast<int32_t>(one.directory.size()));
  }
}

}  // namespace
}  // namespace lx::test
