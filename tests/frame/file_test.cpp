// SPDX-License-Identifier: Apache-2.0
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <fstream>
#include <iterator>

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

  DataDirectory directory_;
  uint32_t rc_ = 99;
};

TEST_F(FileTest, ReadsAndSeeks) {
  directory_.write("data", "0123456789");
  LXFile* file = open("data", 0);
  ASSERT_NE(file, nullptr);
  EXPECT_EQ(rc_, LX_OK);
  EXPECT_EQ(LXFileSize(file), 10);
  Guarded buffer(4);
  struct Step {
    int32_t offset;
    uint32_t origin;
    const char* text;
  };
  const Step steps[] = {
      {0, LX_SEEK_CUR, "0123"}, {2, LX_SEEK_CUR, "6789"}, {3, LX_SEEK_SET, "3456"},
      {-2, LX_SEEK_END, "89"},  {0, LX_SEEK_END, ""},     {100, LX_SEEK_SET, ""},
  };
  for (const Step& step : steps) {
    ASSERT_EQ(LXSeekFile(file, step.offset, step.origin), 0u) << step.offset;
    uint32_t got = LXReadFile(file, buffer.data(), 4, &rc_);
    EXPECT_EQ(std::string_view(buffer.data(), got), step.text) << step.offset;
    EXPECT_EQ(rc_, LX_OK);
  }
  EXPECT_EQ(LXSeekFile(file, -1, LX_SEEK_SET), 1u);
  EXPECT_EQ(LXSeekFile(file, 0, 9), 1u);
  EXPECT_EQ(LXSeekFile(file, 0, 13), 1u);
  EXPECT_EQ(LXReadFile(file, nullptr, 0, nullptr), 0u);
  EXPECT_EQ(LXCloseFile(file, 0), 0u);
}

TEST_F(FileTest, LoadsBlocks) {
  directory_.write("data", "0123456789");
  LXFile* file = open("data", 2);
  ASSERT_NE(file, nullptr);
  struct Case {
    uint32_t offset, size, rc;
    const char* text;  // null: no block
  };
  const Case cases[] = {
      {0, 10, LX_OK, "0123456789"}, {8, 2, LX_OK, "89"},         {0, 0, LX_OK, nullptr},
      {8, 3, LX_E_FILE, nullptr},   {10, 1, LX_E_FILE, nullptr}, {0xFFFFFFFF, 1, LX_E_FILE, nullptr},
      {500, 0, LX_OK, nullptr},
  };
  for (const Case& one : cases) {
    auto* block = static_cast<char*>(LXLoadFile(file, one.offset, one.size, &rc_));
    EXPECT_EQ(rc_, one.rc) << one.offset;
    ASSERT_EQ(block != nullptr, one.text != nullptr) << one.offset;
    if (block != nullptr) {
      EXPECT_EQ(std::string_view(block, one.size), one.text);
    }
    EXPECT_EQ(LXUnloadFile(block), 0u);
  }
  EXPECT_EQ(LXCloseFile(file, 0), 0u);
}

TEST_F(FileTest, TellsWhyItCannotOpen) {
  struct Case {
    const char* name;
    uint8_t mode;
    uint32_t rc;
  };
  directory_.write("file", "x");
  const Case cases[] = {
      {"missing", 0, LX_E_NOFILE},
      {"missing", 2, LX_E_NOFILE},
      {"file/below", 0, LX_E_OPEN},
      {".", 2, LX_E_OPEN},
  };
  long before = open_descriptors();
  for (const Case& one : cases) {
    EXPECT_EQ(open(one.name, one.mode), nullptr) << one.name;
    EXPECT_EQ(rc_, one.rc) << one.name;
  }
  if (geteuid() != 0) {
    chmod(directory_.file("file").c_str(), 0);
    EXPECT_EQ(open("file", 0), nullptr);
    EXPECT_EQ(rc_, LX_E_ACCESS);
  }
  EXPECT_EQ(LXOpenFile(1, nullptr, 0, 0, &rc_), nullptr);
  EXPECT_EQ(LXOpenFile(1, nullptr, 0, 0, nullptr), nullptr);
  EXPECT_EQ(open_descriptors(), before);
}

TEST_F(FileTest, NewFileIsWrittenInPlace) {
  LXFile* file = open("new.nls", 1);
  ASSERT_NE(file, nullptr);
  put(file, "text");
  EXPECT_TRUE(exists("new.nls"));
  char byte;
  EXPECT_EQ(LXReadFile(file, &byte, 1, &rc_), 0u);
  EXPECT_EQ(rc_, LX_E_READMODE);
  EXPECT_EQ(LXLoadFile(file, 0, 1, &rc_), nullptr);
  EXPECT_EQ(rc_, LX_E_READMODE);
  EXPECT_EQ(LXCloseFile(file, 1), 0u) << "there is no temporary to discard";
  EXPECT_EQ(text_of("new.nls"), "text");
  struct stat status;
  ASSERT_EQ(stat(directory_.file("new.nls").c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0133, 0u);
}

TEST_F(FileTest, ExistingFileIsReplacedWhenItIsClosed) {
  directory_.write("control.nls", "old");
  LXFile* file = open("control.nls", 1);
  ASSERT_NE(file, nullptr);
  put(file, "new");
  EXPECT_TRUE(exists("controltmp"));
  EXPECT_EQ(text_of("control.nls"), "old");
  EXPECT_EQ(LXCloseFile(file, 0), 0u);
  EXPECT_EQ(text_of("control.nls"), "new");
  EXPECT_FALSE(exists("controltmp"));

  file = open("control.nls", 1);
  ASSERT_NE(file, nullptr);
  put(file, "newer");
  EXPECT_EQ(LXCloseFile(file, 1), 0u);
  EXPECT_EQ(text_of("control.nls"), "new");
  EXPECT_FALSE(exists("controltmp"));

  file = open("control.nls", 1, 1);
  ASSERT_NE(file, nullptr);
  EXPECT_FALSE(exists("controltmp"));
  put(file, "now");
  EXPECT_EQ(LXCloseFile(file, 0), 0u);
  EXPECT_EQ(text_of("control.nls"), "now");
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

// Closing must not rename over another file than the one that was opened.
TEST_F(FileTest, NamesThatThePartsCannotHoldAreRefused) {
  const std::string deep(200, 'd');
  for (const std::string& name : {std::string("fifteen_letters.nls"), std::string("file.extension"),
                                  std::string("a:file"), deep + "x", std::string("d.x/f")}) {
    SCOPED_TRACE(name);
    mkdir(directory_.file("d.x").c_str(), 0755);
    directory_.write(name, "old");
    EXPECT_EQ(open(name, 1), nullptr);
    EXPECT_EQ(rc_, LX_E_FILE);
    LXFile* file = open(name, 1, 1);
    ASSERT_NE(file, nullptr) << "without a temporary there is no limit";
    EXPECT_EQ(LXCloseFile(file, 0), 0u);
  }
  EXPECT_FALSE(exists("tmp"));
}

TEST_F(FileTest, PathOfUpTo255BytesIsReplaced) {
  std::string parent(directory_.path());
  while (parent.size() + 30 < 250) {
    parent += "/" + std::string(20, 'd');
    ASSERT_EQ(mkdir(parent.c_str(), 0755), 0);
  }
  size_t used = parent.size();
  for (size_t base : {size_t{255}, size_t{256}}) {
    std::string middle = parent + "/" + std::string(base - used - 1 - 1 - 5, 'm');
    mkdir(middle.c_str(), 0755);
    std::string path = middle + "/" + "12345" + ".nls";
    std::ofstream(path) << "old";
    LXFile* file = LXOpenFile(1, path.c_str(), 1, 0, &rc_);
    if (base == 255) {
      ASSERT_NE(file, nullptr) << rc_;
      EXPECT_EQ(LXCloseFile(file, 0), 0u);
    } else {
      EXPECT_EQ(file, nullptr);
      EXPECT_EQ(rc_, LX_E_FILE);
    }
  }
}

// A file that cannot be created is noticed by its first use.
TEST_F(FileTest, FailedCreationShowsAtTheEnd) {
  LXFile* file = open("no/such/directory", 1);
  ASSERT_NE(file, nullptr);
  EXPECT_EQ(rc_, LX_OK);
  char byte;
  EXPECT_EQ(LXReadFile(file, &byte, 1, &rc_), 0u);
  EXPECT_EQ(rc_, LX_E_READMODE);
  EXPECT_EQ(LXFileSize(file), -1);
  EXPECT_EQ(LXSeekFile(file, 0, LX_SEEK_SET), 1u);
  EXPECT_EQ(LXCloseFile(file, 0), 1u);
  LXDefFree(nullptr, file);  // a failed close keeps the handle
}

TEST_F(FileTest, UnknownModeOpensNothing) {
  LXFile* file = open("anything", 3);
  ASSERT_NE(file, nullptr);
  EXPECT_EQ(rc_, LX_OK);
  EXPECT_FALSE(exists("anything"));
  EXPECT_EQ(LXCloseFile(file, 0), 1u);
  LXDefFree(nullptr, file);
}

TEST_F(FileTest, NullHandles) {
  char byte;
  EXPECT_EQ(LXCloseFile(nullptr, 0), 1u);
  EXPECT_EQ(LXReadFile(nullptr, &byte, 1, &rc_), 0u);
  EXPECT_EQ(rc_, LX_E_ARGUMENT);
  EXPECT_EQ(LXSeekFile(nullptr, 0, LX_SEEK_SET), 1u);
  EXPECT_EQ(LXLoadFile(nullptr, 0, 1, &rc_), nullptr);
  EXPECT_EQ(rc_, LX_E_ARGUMENT);
  EXPECT_EQ(LXLoadFile(nullptr, 0, 1, nullptr), nullptr);
  EXPECT_EQ(LXUnloadFile(nullptr), 0u);
  EXPECT_EQ(LXFileSize(nullptr), -1);
}

}  // namespace
}  // namespace lx::test
