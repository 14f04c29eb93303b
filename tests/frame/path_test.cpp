// SPDX-License-Identifier: Apache-2.0
#include <gtest/gtest.h>
#include <lexaro/lexaro.h>

#include <cstring>
#include <string>

namespace {

const std::string k14(14, 'f');
const std::string k15(15, 'f');
const std::string k254(254, 'd');
const std::string k255(255, 'd');

struct Case {
  std::string path, drive, directory, file, extension;
};

TEST(Path, IsCutIntoItsParts) {
  const Case cases[] = {
      {"/Vantrel/locale/control.nls", "", "/Vantrel/locale/", "control", ".nls"},
      {"", "", "", "", ""},
      {"/", "", "/", "", ""},
      {"name", "", "", "name", ""},
      {"a/..", "", "a/..", "", "."},
      {"a/.", "", "a/.", "", "."},
      {"..", "", "", "", "."},
      {".", "", "", "", "."},
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
      {"a.b.c", "", "", "a.b", ".c"},
      {"name.", "", "", "name", "."},
      {"name.txt", "", "", "name", ".txt"},
      {"name.text", "", "", "name", ""},
      {k14 + ".nls", "", "", k14, ".nls"},
      {k15 + ".nls", "", "", "", ".nls"},
      {k254 + "/f", "", k254 + "/", "f", ""},
      {k255 + "/f", "", "", "f", ""},
  };
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

TEST(Path, IsJoinedAsItIs) {
  const Case cases[] = {
      {"c:/x/y.z", "c:", "/x/", "y", ".z"},
      {"", "", "", "", ""},
      {"/x/controltmp", "", "/x/", "control", "tmp"},
      {"xy", "", "x", "y", ""},
  };
  for (const Case& one : cases) {
    char result[64] = "?";
    MakePath(result, one.drive.c_str(), one.directory.c_str(), one.file.c_str(), one.extension.c_str());
    EXPECT_EQ(result, one.path);
  }
}

}  // namespace
