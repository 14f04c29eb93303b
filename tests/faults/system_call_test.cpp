// SPDX-License-Identifier: Apache-2.0
// Data files whose opening, reading, seeking or closing fails, at every place where it can.
#include <gtest/gtest.h>

#include <cerrno>
#include <functional>

#include "failing_calls.hpp"
#include "support/counting_allocator.hpp"
#include "support/descriptors.hpp"
#include "support/environment.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

struct Fault {
  const char* name;
  Call call;
  int error;
  uint32_t rc;  // of the object that is concerned
};
const Fault kFaults[] = {
    {"open, not found", Call::open, ENOENT, LX_E_NOFILE},
    {"open, not allowed", Call::open, EACCES, LX_E_ACCESS},
    {"open, no descriptor", Call::open, EMFILE, LX_E_OPEN},
    {"read", Call::read, EIO, LX_E_FILE},
    {"seek", Call::seek, EINVAL, LX_E_FILE},
    {"close", Call::close, EIO, LX_OK},
};

class SystemCallTest : public testing::Test {
 protected:
  SystemCallTest() { write_small_directory(directory_); }

  // Runs the body with the n-th call failing, until that many are not made any more. Returns how many were.
  static int for_each_place(const Fault& fault, const std::function<bool(CountingAllocator&, int)>& body) {
    for (int n = 0;; ++n) {
      SCOPED_TRACE(std::string(fault.name) + ", call " + std::to_string(n));
      CountingAllocator allocator;
      long before = open_descriptors();
      bool happened = body(allocator, n);
      EXPECT_EQ(LXTerm(), LX_OK);
      EXPECT_EQ(allocator.live, 0);
      EXPECT_EQ(open_descriptors(), before);
      if (!happened || HasFailure()) return n;
    }
  }

  Variable location_{"LX_LOCALEDIR", nullptr};
  DataDirectory directory_;
};

TEST_F(SystemCallTest, WhileTheLibraryStarts) {
  for (const Fault& fault : kFaults) {
    int places = for_each_place(fault, [&](CountingAllocator& allocator, int n) {
      FailingCall failing(fault.call, n, fault.error);
      uint32_t status = allocator.init(directory_.path());
      EXPECT_TRUE(status == LX_OK || status == LX_E_DEFAULTS) << status;
      EXPECT_TRUE(status == LX_OK || fault.call != Call::close);
      uint32_t rc = 0;
      bool data = LXGetObjFromName(LXGetObjManager(), LX_LANGUAGE, "German", -1, 1, &rc) != nullptr;
      EXPECT_EQ(data, status == LX_OK);
      return failing.happened();
    });
    EXPECT_GE(places, 2) << fault.name << ": the control file, and the aliases";
  }
}

TEST_F(SystemCallTest, WhileAnObjectIsLoaded) {
  for (const Fault& fault : kFaults) {
    for (const ObjectRecord& record : small_directory_records()) {
      for (uint32_t options : {0u, LX_INIT_NO_DEFAULTS}) {
        int places = for_each_place(fault, [&](CountingAllocator& allocator, int n) {
          EXPECT_EQ(allocator.init(directory_.path(), options), LX_OK);
          LXObjEntry* entry = nullptr;
          uint32_t rc = 99;
          bool happened = false;
          {
            FailingCall failing(fault.call, n, fault.error);
            entry = LXGetObjFromID(LXGetObjManager(), record.type, record.id, 0, &rc);
            happened = failing.happened();
          }
          EXPECT_EQ(rc, happened ? fault.rc : LX_OK);
          EXPECT_EQ(entry != nullptr, rc == LX_OK || options == 0);
          if (options != 0) {  // what failed once can be loaded later
            EXPECT_NE(LXGetObjFromID(LXGetObjManager(), record.type, record.id, 0, &rc), nullptr);
            EXPECT_EQ(rc, LX_OK);
          }
          return happened;
        });
        EXPECT_GE(places, 1) << fault.name;
      }
    }
  }
}

TEST_F(SystemCallTest, WhileALocaleIsMade) {
  for (const Fault& fault : kFaults) {
    int places = for_each_place(fault, [&](CountingAllocator& allocator, int n) {
      EXPECT_EQ(allocator.init(directory_.path(), LX_INIT_NO_DEFAULTS), LX_OK);
      FailingCall failing(fault.call, n, fault.error);
      uint32_t rc = 99;
      LXLocale* locale = LXGetLocale("German_UnitedStates.OldSmall", 0, &rc);
      bool fatal = failing.happened() && fault.call != Call::close;
      EXPECT_EQ(rc, fatal ? LX_E_MANAGER : LX_OK);
      EXPECT_EQ(locale == nullptr, fatal);
      LXReleaseLocale(locale, 0);
      return failing.happened();
    });
    EXPECT_GE(places, 3) << fault.name << ": once for each part";
  }
}

TEST_F(SystemCallTest, SlowFilesAreReadCompletely) {
  for (size_t piece : {1u, 7u, 100u}) {
    read_in_pieces(piece);
    Session session(directory_.path());
    EXPECT_EQ(session.status, LX_OK);
    for (const ObjectRecord& record : small_directory_records()) {
      uint32_t rc = 99;
      EXPECT_NE(LXGetObjFromID(LXGetObjManager(), record.type, record.id, 0, &rc), nullptr);
      EXPECT_EQ(rc, LX_OK) << record.name;
    }
    EXPECT_STREQ(LXGetCodepageFromAlias(LXGetObjManager(), "little"), "Small");
  }
  read_in_pieces(0);
}

TEST_F(SystemCallTest, SizeThatIsUnknown) {
  FailingCall failing(Call::status, 0, EIO);
  Session session(directory_.path());
  EXPECT_EQ(session.status, LX_OK);
  EXPECT_EQ(LXGetCodepageFromAlias(LXGetObjManager(), "little"), nullptr) << "aliases need the size of their file";
}

uint32_t without(Call call, const std::function<uint32_t()>& use) {
  FailingCall failing(call, 0, EIO);
  return use();
}

// A failed close keeps the handle; a replacement that could not be closed does not replace anything.
TEST_F(SystemCallTest, FilesOfCallers) {
  const std::string path = directory_.file("control.nls");
  for (bool write : {false, true}) {
    uint32_t rc = 99;
    char buffer[8];
    LXFile* file = LXOpenFile(1, path.c_str(), write, 0, &rc);
    ASSERT_NE(file, nullptr);
    if (!write) {
      EXPECT_EQ(without(Call::read, [&] { return LXReadFile(file, buffer, 8, &rc); }), 0u);
      EXPECT_EQ(rc, LX_E_FILE);
      EXPECT_EQ(without(Call::seek, [&] { return LXSeekFile(file, 0, LX_SEEK_SET); }), 1u);
      EXPECT_EQ(LXReadFile(file, buffer, 8, &rc), 8u);
    }
    EXPECT_EQ(without(Call::close, [&] { return LXCloseFile(file, 0); }), 1u);
    LXDefFree(nullptr, file);
  }
  EXPECT_EQ(Session(directory_.path()).status, LX_OK);
}

}  // namespace
}  // namespace lx::test
