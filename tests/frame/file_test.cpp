// SPDX-License-Identifier: Apache-2.0
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <fstream>
#include <iterator>
#include <map>

#include "support/descriptors.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

class FileTest : public testing::Test {
 protected:
  std::string text_of(std::string_view name) {
    std::ifstream in(directory_.file(name), std::ios::binary);
    return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
  }
  bool exists(std::string_view name) { return access(directory_.file(name).c_str(), F_OK) == 0; }
  LXFile* open(std::string_view name, uint8_t mode, int32_t no_temporary = 0) {
    return LXOpenFile(1, directory_.file(name).c_str(), mode, no_temporary, &rc_);
  }

  // The library only reads, so what a file is to hold is written through its descriptor, which a handle begins with.
  static void put(LXFile* file, std::string_view text) {
    int32_t descriptor = 0;
    std::memcpy(&descriptor, file, sizeof descriptor);
    ASSERT_EQ(::write(descriptor, text.data(), text.size()), static_cast<ssize_t>(text.size()));
  }

  void expect_unreadable(LXFile* file) {
    char byte;
    EXPECT_EQ(LXReadFile(file, &byte, 1, &rc_), 0u);
    EXPECT_EQ(rc_, LX_E_READMODE);
    EXPECT_EQ(LXLoadFile(file, 0, 1, &rc_), nullptr);
    EXPECT_EQ(rc_, LX_E_READMODE);
  }

  DataDirectory directory_;
  uint32_t rc_ = 99;
};

TEST_F(FileTest, ReadsSeeksAndLoads) {
  directory_.write("data", "0123456789");
  LXFile* file = open("data", 0);
  ASSERT_NE(file, nullptr);
  EXPECT_EQ(rc_, LX_OK);
  EXPECT_EQ(LXFileSize(file), 10);
  Guarded buffer(4);
  for (auto [offset, origin, text] : {std::tuple(0, LX_SEEK_CUR, "0123"),
                                      {2, LX_SEEK_CUR, "6789"},
                                      {3, LX_SEEK_SET, "3456"},
                                      {-2, LX_SEEK_END, "89"},
                                      {100, LX_SEEK_SET, ""}}) {
    ASSERT_EQ(LXSeekFile(file, offset, origin), 0u) << offset;
    uint32_t got = LXReadFile(file, buffer.data(), 4, &rc_);
    EXPECT_EQ(std::string_view(buffer.data(), got), text) << offset;
    EXPECT_EQ(rc_, LX_OK);
  }
  EXPECT_EQ(LXSeekFile(file, -1, LX_SEEK_SET), 1u);
  EXPECT_EQ(LXSeekFile(file, 0, 9), 1u);
  for (auto [offset, size, rc, text] : {std::tuple(0u, 10u, LX_OK, "0123456789"),
                                        {8u, 2u, LX_OK, "89"},
                                        {500u, 0u, LX_OK, ""},
                                        {8u, 3u, LX_E_FILE, ""},
                                        {0xFFFFFFFF, 1u, LX_E_FILE, ""}}) {
    auto* block = static_cast<char*>(LXLoadFile(file, offset, size, &rc_));
    EXPECT_EQ(rc_, rc) << offset;
    EXPECT_EQ(block != nullptr, *text != '\0') << offset;
    EXPECT_EQ(std::string_view(block, block != nullptr ? size : 0), text);
    EXPECT_EQ(LXUnloadFile(block), 0u);
  }
  EXPECT_EQ(LXCloseFile(file, 0), 0u);
}

TEST_F(FileTest, TellsWhyItCannotOpen) {
  directory_.write("file", "x");
  const long before = open_descriptors();
  for (auto [name, mode, rc] : {std::tuple("missing", 0, LX_E_NOFILE),
                                {"missing", 2, LX_E_NOFILE},
                                {"file/below", 0, LX_E_OPEN},
                                {".", 2, LX_E_OPEN}}) {
    EXPECT_EQ(open(name, static_cast<uint8_t>(mode)), nullptr) << name;
    EXPECT_EQ(rc_, rc) << name;
  }
  EXPECT_EQ(LXOpenFile(1, nullptr, 0, 0, &rc_), nullptr);
  EXPECT_EQ(open_descriptors(), before);
}

TEST_F(FileTest, NewFileIsWrittenInPlace) {
  LXFile* file = open("new.nls", 1);
  ASSERT_NE(file, nullptr);
  put(file, "text");
  EXPECT_TRUE(exists("new.nls"));
  expect_unreadable(file);
  EXPECT_EQ(LXCloseFile(file, 1), 0u) << "there is no temporary to discard";
  EXPECT_EQ(text_of("new.nls"), "text");
  struct stat status;
  ASSERT_EQ(stat(directory_.file("new.nls").c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0133, 0u);
}

TEST_F(FileTest, ExistingFileIsReplacedWhenItIsClosed) {
  directory_.write("control.nls", "old");
  struct Case {
    int32_t no_temporary, discard;
    const char *text, *result;
  };
  for (const Case& one : {Case{0, 0, "new", "new"}, {0, 1, "newer", "new"}, {1, 0, "now", "now"}}) {
    LXFile* file = open("control.nls", 1, one.no_temporary);
    ASSERT_NE(file, nullptr);
    const std::string before = text_of("control.nls");
    put(file, one.text);
    EXPECT_EQ(exists("controltmp"), one.no_temporary == 0);
    EXPECT_EQ(text_of("control.nls"), one.no_temporary == 0 ? before : one.text);
    EXPECT_EQ(LXCloseFile(file, one.discard), 0u);
    EXPECT_EQ(text_of("control.nls"), one.result);
    EXPECT_FALSE(exists("controltmp"));
  }
}

TEST_F(FileTest, TargetThatVanishedIsNotReplaced) {
  directory_.write("control.nls", "old");
  LXFile* file = open("control.nls", 1);
  ASSERT_NE(file, nullptr);
  directory_.remove("control.nls");
  EXPECT_EQ(LXCloseFile(file, 0), 1u);
  EXPECT_FALSE(exists("control.nls"));
  directory_.write("control.nls", "old");
  file = open("control.nls", 1);
  directory_.remove("controltmp");
  EXPECT_EQ(LXCloseFile(file, 1), 1u) << "the temporary is gone";
}

// Closing must not rename over another file than the one that was opened, so names that do not fit are refused.
TEST_F(FileTest, NamesWithinTheLimitsOfTheirParts) {
  const std::string full(249 - directory_.file("").size(), 'm'), longer = full + "m";
  for (const std::string& folder : {std::string("d.x"), full, longer}) {
    ASSERT_EQ(mkdir(directory_.file(folder).c_str(), 0755), 0);
  }
  for (const auto& [name, good] : std::map<std::string, bool>{{"fourteen_lette.nls", true},
                                                              {"fifteen_letters.nls", false},
                                                              {"file.extension", false},
                                                              {"a:file", false},
                                                              {"d.x/f", false},
                                                              {full + "/12345.nls", true},
                                                              {longer + "/12345.nls", false}}) {
    SCOPED_TRACE(name);
    directory_.write(name, "old");
    LXFile* file = open(name, 1);
    ASSERT_EQ(file != nullptr, good);
    EXPECT_EQ(rc_, good ? LX_OK : LX_E_FILE);
    EXPECT_EQ(LXCloseFile(file, 0), good ? 0u : 1u);
    file = open(name, 1, 1);
    ASSERT_NE(file, nullptr) << "without a temporary there is no limit";
    EXPECT_EQ(LXCloseFile(file, 0), 0u);
  }
  EXPECT_FALSE(exists("tmp"));
}

// A file that cannot be created is noticed by its first use; an unknown mode opens nothing.
TEST_F(FileTest, FailedCreationShowsAtTheEnd) {
  for (auto [name, mode] : {std::pair("no/such/directory", 1), {"anything", 3}}) {
    LXFile* file = open(name, static_cast<uint8_t>(mode));
    ASSERT_NE(file, nullptr);
    EXPECT_EQ(rc_, LX_OK);
    if (mode == 1) expect_unreadable(file);
    EXPECT_FALSE(exists(name));
    EXPECT_EQ(LXFileSize(file), -1);
    EXPECT_EQ(LXSeekFile(file, 0, LX_SEEK_SET), 1u);
    EXPECT_EQ(LXCloseFile(file, 0), 1u);
    LXDefFree(nullptr, file);  // a failed close keeps the handle
  }
}

}  // namespace
}  // namespace lx::test
