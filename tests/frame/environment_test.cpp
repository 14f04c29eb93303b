// SPDX-License-Identifier: Apache-2.0
// Variables, the names of data files, and the comparison without case.
#include <gtest/gtest.h>

#include <functional>

#include "support/environment.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

TEST(Environment, ValueIsCopiedWhenItFits) {
  Variable variable("LX_TEST_VALUE", "abc");
  for (int32_t size : {-1, 0, 3, 4, 5}) {
    Guarded buffer(size > 0 ? static_cast<size_t>(size) : 0);
    EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", buffer.data(), size), 4) << size;
    if (size >= 4) {
      EXPECT_STREQ(buffer.data(), "abc");
    } else if (size > 0) {
      EXPECT_EQ(buffer.data()[0], 'Z') << "nothing is copied in part";
    }
  }
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", nullptr, 100), 4);
  variable.set("");
  char one[1] = {'x'};
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", one, 1), 1);
  EXPECT_EQ(one[0], '\0');
  variable.set(nullptr);
  EXPECT_EQ(LXGetEnv("LX_TEST_VALUE", one, 1), 0);
}

TEST(Environment, DataLocation) {
  Variable variable("LX_LOCALEDIR", nullptr);
  char buffer[32];
  EXPECT_EQ(LXGetDataLocation(buffer, sizeof buffer, 0), -1);
  variable.set("/somewhere");
  EXPECT_EQ(LXGetDataLocation(buffer, sizeof buffer, 0), 11);
  EXPECT_STREQ(buffer, "/somewhere");
  EXPECT_EQ(LXGetDataLocation(buffer, 11, 0), 11);
  EXPECT_EQ(LXGetDataLocation(buffer, 10, 0), 0) << "set, but too long";
  EXPECT_EQ(LXGetDataLocation(buffer, 17, 1), 17);
  EXPECT_STREQ(buffer, "/Vantrel/locale");
  EXPECT_EQ(LXGetDataLocation(buffer, 16, 1), 0);
}

TEST(Environment, NamesOfFiles) {
  struct Case {
    std::function<char*(char* buffer, int32_t size)> get;
    std::string name;
  };
  auto data_file = [](const char* directory, uint8_t type, uint16_t id) {
    return [=](char* buffer, int32_t size) { return LXGetDataFileName(directory, type, id, buffer, size); };
  };
  const Case cases[] = {
      {[](char* buffer, int32_t size) { return LXGetControlFileName("/d", buffer, size); }, "/d/control.nls"},
      {[](char* buffer, int32_t size) { return LXGetControlFileName("", buffer, size); }, "/control.nls"},
      {[](char* buffer, int32_t size) { return LXGetAliasFileName("/d", buffer, size); }, "/d/alias.txt"},
      {data_file("/Vantrel/locale", LX_LANGUAGE, 1), "/Vantrel/locale/la_00001.nls"},
      {data_file("/d", LX_TERRITORY, 840), "/d/te_00840.nls"},
      {data_file("/d", LX_CODEPAGE, 367), "/d/cp_00367.nls"},
      {data_file("", LX_SORT, 65535), "/so_65535.nls"},
  };
  for (const Case& one : cases) {
    const auto exact = static_cast<int32_t>(one.name.size()) + 1;
    for (int32_t size : {-1, 0, 1, 2, exact - 1, exact, exact + 9}) {
      Guarded buffer(size > 0 ? static_cast<size_t>(size) : 0);
      char* name = one.get(buffer.data(), size);
      ASSERT_EQ(name, size >= exact ? buffer.data() : nullptr) << one.name << size;
      if (name != nullptr) {
        EXPECT_EQ(name, one.name);
      }
    }
    EXPECT_EQ(one.get(nullptr, 100), nullptr) << one.name;
  }
  char buffer[32];
  EXPECT_EQ(LXGetDataFileName("/d", 4, 1, buffer, sizeof buffer), nullptr);
  EXPECT_EQ(LXGetControlFileName(nullptr, buffer, sizeof buffer), nullptr);
}

TEST(Environment, NameThatDoesNotFitIsExplained) {
  char buffer[32] = "before";
  testing::internal::CaptureStderr();
  EXPECT_EQ(LXGetDataFileName("/direct", LX_CODEPAGE, 37, buffer, 20), nullptr);
  EXPECT_EQ(LXGetDataFileName("/direct", LX_CODEPAGE, 37, buffer, -1), nullptr);
  EXPECT_EQ(LXGetAliasFileName("/direct", buffer, 16), nullptr);
  EXPECT_EQ(testing::internal::GetCapturedStderr(),
            "Buffer provided = 20, needed = 21\n"
            "Buffer provided = -1, needed = 21\n"
            "Buffer provided = 16, needed = 18\n");
  EXPECT_STREQ(buffer, "before");
}

int sign(int value) { return (value > 0) - (value < 0); }

TEST(Memicmp, IgnoresAsciiCaseOnly) {
  struct Case {
    std::string_view a, b;
    int sign;
  };
  using namespace std::string_view_literals;
  const Case cases[] = {
      {"BINARY", "binary", 0},  {"ab", "AC", -1},     {"AC", "ab", 1},         {"", "", 0},
      {"a\0b"sv, "A\0C"sv, -1}, {"\xC4", "\xE4", -1}, {"[", "{", -1},          {"Z", "[", 1},
      {"@", "`", -1},           {"\xFF", "a", 1},     {"a\0x"sv, "a\0X"sv, 0},
  };
  for (const Case& one : cases) {
    EXPECT_EQ(sign(LXmemicmp(one.a.data(), one.b.data(), one.a.size())), one.sign) << one.a << " " << one.b;
  }
  EXPECT_EQ(LXmemicmp("A", "c", 1), 'a' - 'c');
}

const std::string k14(14, 'f');
const std::string k15(15, 'f');
const std::string k254(254, 'd');
const std::string k255(255, 'd');

struct Case {
  std::string path, drive, directory, file, extension;
};

TEST(Path, IsCutIntoItsParts) {
  const Case cases[] = {{"/Vantrel/locale/control.nls", "", "/Vantrel/locale/", "control", ".nls"},
                        {"", "", "", "", ""},
                        {"/", "", "/", "", ""},
                        {"a/..", "", "a/..", "", "."},
                        {"..", "", "", "", "."},
                        {"a/...", "", "a/", "..", "."},
                        {"a/.hidden", "", "a/", "", ""},
                        {"a/.rc", "", "a/", "", ".rc"},
                        {"c:/x/y.z", "c:", "/x/", "y", ".z"},
                        {"ab:name", "ab:", "", "name", ""},
                        {"abc:name", "", "", "name", ""},
                        {":x", ":", "", "x", ""},
                        {"a:b:c/d", "a:", "b:c/", "d", ""},
                        {"d.x/f", "", "d.x/", "f", ".x/f"},
                        {"d.ext/f", "", "d.ext/", "f", ""},
                        {"name.", "", "", "name", "."},
                        {"name.text", "", "", "name", ""},
                        {k14 + ".nls", "", "", k14, ".nls"},
                        {k15 + ".nls", "", "", "", ".nls"},
                        {k254 + "/f", "", k254 + "/", "f", ""},
                        {k255 + "/f", "", "", "f", ""}};
  for (const Case& one : cases) {
    char drive[4], directory[256], file[15], extension[5];
    for (char* part : {drive, directory, file, extension}) part[0] = '?';
    SplitPath(one.path.c_str(), drive, directory, file, extension);
    EXPECT_EQ(drive, one.drive) << one.path;
    EXPECT_EQ(directory, one.directory) << one.path;
    EXPECT_EQ(file, one.file) << one.path;
    EXPECT_EQ(extension, one.extension) << one.path;
    EXPECT_EQ(SplitDrive(one.path.c_str(), drive), static_cast<int32_t>(one.drive.size())) << one.path;
    EXPECT_EQ(SplitDir(one.path.c_str(), directory), static_cast<int32_t>(one.directory.size())) << one.path;
    EXPECT_EQ(SplitFile(one.path.c_str(), file), static_cast<int32_t>(one.file.size())) << one.path;
    EXPECT_EQ(SplitExtent(one.path.c_str(), extension), static_cast<int32_t>(one.extension.size())) << one.path;
  }
}

}  // namespace
}  // namespace lx::test
