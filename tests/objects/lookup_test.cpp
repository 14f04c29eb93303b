// SPDX-License-Identifier: Apache-2.0
// Objects by name and by number.
#include <gtest/gtest.h>

#include <optional>
#include <set>

#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

class LookupTest : public testing::Test {
 protected:
  LookupTest() {
    write_small_directory(directory_);
    std::vector<ObjectRecord> records = small_directory_records();
    records.push_back({LX_SORT, 7, "Sorted"});
    directory_.write_control(records);
    session_.emplace(directory_.path());
    manager_ = LXGetObjManager();
  }

  // Unloaded, so that only the lookup is seen.
  void expect(LXObjEntry* entry, uint8_t type, uint16_t id, uint32_t rc) {
    EXPECT_TRUE(entry == nullptr || LXGetObjType(entry) == type);
    EXPECT_EQ(LXGetObjId(entry), id);
    EXPECT_EQ(rc_, rc);
  }

  DataDirectory directory_;
  std::optional<Session> session_;
  LXObjMgr* manager_ = nullptr;
  uint32_t rc_ = 99;
};

// As bytes and as wide characters, of which only the low bytes count. The binary sort is found, though it has no
// object.
TEST_F(LookupTest, ByName) {
  using namespace std::string_view_literals;
  struct Case {
    uint8_t type;
    std::string_view name;
    int32_t length;
    uint16_t id;  // 0: none
    uint32_t rc;
  };
  const Case cases[] = {{LX_LANGUAGE, "English", -1, 1, LX_OK},
                        {LX_LANGUAGE, "eNGLISH", 7, 1, LX_OK},
                        {LX_LANGUAGE, "English\0"sv, 8, 1, LX_OK},
                        {LX_LANGUAGE, "EnglishX", 7, 1, LX_OK},
                        {LX_LANGUAGE, "English\0\0"sv, 9, 0, LX_E_NOTFOUND},
                        {LX_LANGUAGE, "English", 3, 0, LX_E_NOTFOUND},
                        {LX_LANGUAGE, "", -1, 0, LX_E_NOTFOUND},
                        {LX_TERRITORY, "English", -1, 0, LX_E_NOTFOUND},
                        {LX_CODEPAGE, "ascii", -1, 0, LX_E_NOTFOUND},  // an alias is no name
                        {LX_SORT, "sorted", -1, 7, LX_OK},
                        {255, "English", -1, 0, LX_E_NOTFOUND},
                        {LX_SORT, "Binary\0"sv, 7, 0, LX_OK},
                        {LX_SORT, "BINARYX", 6, 0, LX_OK},
                        {LX_SORT, "BINAR", 5, 0, LX_E_NOTFOUND},
                        {LX_SORT, "BINARY\0\0"sv, 8, 0, LX_E_NOTFOUND},
                        {LX_SORT, "BINARYX", 7, 0, LX_E_NOTFOUND},
                        {LX_LANGUAGE, "BINARY", -1, 0, LX_E_NOTFOUND}};
  for (const Case& one : cases) {
    SCOPED_TRACE(std::string(one.name) + " " + std::to_string(one.length));
    expect(LXGetObjFromName(manager_, one.type, one.name.data(), one.length, 1, &rc_), one.type, one.id, one.rc);
    std::vector<LXWChar> wide;
    for (char c : one.name) wide.push_back(c == 0 ? 0 : 0xAB004100 | static_cast<unsigned char>(c));
    wide.push_back(0);
    expect(LXGetObjFromNameW(manager_, one.type, wide.data(), one.length, 1, &rc_), one.type, one.id, one.rc);
  }
  expect(LXGetObjFromName(nullptr, LX_LANGUAGE, "English", 3, 1, &rc_), 0, 0, LX_E_NOTFOUND);
  expect(LXGetObjFromNameW(manager_, LX_LANGUAGE, nullptr, -1, 1, &rc_), 0, 0, LX_E_NOTFOUND);
}

TEST_F(LookupTest, ByNumber) {
  const std::set<uint32_t> wanted = {
      0x00001, 0x00002, 0x10001, 0x10002, 0x2016F, 0x20384,
      0x20385, 0x20386, 0x20387, 0x30000, 0x30007};  // the type, the number; 0x30000: the binary sort
  for (uint32_t both = 0; both < 0x50000 && !HasFailure(); ++both) {
    const auto type = static_cast<uint8_t>(both >> 16);
    const auto id = static_cast<uint16_t>(both);
    LXObjEntry* entry = LXGetObjFromID(manager_, type, id, 1, &rc_);
    const bool found = wanted.contains(both);
    expect(entry, type, found ? id : 0, found ? LX_OK : LX_E_NOTFOUND);
  }
  expect(LXGetObjFromID(nullptr, LX_LANGUAGE, 1, 1, &rc_), 0, 0, LX_E_NOTFOUND);
}

TEST_F(LookupTest, LoadsUnlessToldNotTo) {
  LXObjEntry* entry = LXGetObjFromName(manager_, LX_CODEPAGE, "Small", -1, 1, &rc_);
  LXCodePageInfo info;
  EXPECT_EQ(LXGetCodePageInfo(entry, &info), LX_E_ARGUMENT);
  EXPECT_EQ(LXGetObjFromName(manager_, LX_CODEPAGE, "Small", -1, 2, &rc_), entry) << "only 1 means no loading";
  EXPECT_EQ(LXGetCodePageInfo(entry, &info), LX_OK);
  EXPECT_EQ(info.max_length, 4);
  EXPECT_EQ(LXGetObjFromID(manager_, LX_CODEPAGE, 900, 0, &rc_), entry);
  EXPECT_STREQ(LXGetObjName(entry), "Small");
  EXPECT_EQ(LXGetObjName(nullptr), nullptr);
}

}  // namespace
}  // namespace lx::test
