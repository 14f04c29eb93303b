// SPDX-License-Identifier: Apache-2.0
// Objects by name and by number.
#include <gtest/gtest.h>

#include <optional>

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
  uint16_t id_of(uint8_t type, std::string_view name, int32_t length) {
    LXObjEntry* entry = LXGetObjFromName(manager_, type, name.data(), length, 1, &rc_);
    EXPECT_TRUE(entry == nullptr || LXGetObjType(entry) == type);
    return LXGetObjId(entry);
  }

  DataDirectory directory_;
  std::optional<Session> session_;
  LXObjMgr* manager_ = nullptr;
  uint32_t rc_ = 99;
};

struct NameCase {
  uint8_t type;
  std::string_view name;
  int32_t length;
  uint16_t id;  // 0: none
  uint32_t rc;
};

TEST_F(LookupTest, ByName) {
  using namespace std::string_view_literals;
  const NameCase cases[] = {
      {LX_LANGUAGE, "English", -1, 1, LX_OK},
      {LX_LANGUAGE, "eNGLISH", 7, 1, LX_OK},
      {LX_LANGUAGE, "English\0"sv, 8, 1, LX_OK},
      {LX_LANGUAGE, "EnglishX", 7, 1, LX_OK},
      {LX_LANGUAGE, "EnglishX", 8, 0, LX_E_NOTFOUND},
      {LX_LANGUAGE, "English\0\0"sv, 9, 0, LX_E_NOTFOUND},
      {LX_LANGUAGE, "Eng", 3, 0, LX_E_NOTFOUND},
      {LX_LANGUAGE, "English", 3, 0, LX_E_NOTFOUND},
      {LX_LANGUAGE, "English", 0, 0, LX_E_NOTFOUND},
      {LX_LANGUAGE, "", -1, 0, LX_E_NOTFOUND},
      {LX_TERRITORY, "English", -1, 0, LX_E_NOTFOUND},
      {LX_CODEPAGE, "us-ascii", -1, 367, LX_OK},
      {LX_CODEPAGE, "ascii", -1, 0, LX_E_NOTFOUND},  // an alias is no name
      {LX_SORT, "sorted", -1, 7, LX_OK},
      {4, "English", -1, 0, LX_E_NOTFOUND},
      {255, "English", -1, 0, LX_E_NOTFOUND},
  };
  for (const NameCase& one : cases) {
    EXPECT_EQ(id_of(one.type, one.name, one.length), one.id) << one.name << " " << one.length;
    EXPECT_EQ(rc_, one.rc) << one.name << " " << one.length;
  }
  EXPECT_EQ(LXGetObjFromName(manager_, LX_LANGUAGE, nullptr, 3, 1, &rc_), nullptr);
  EXPECT_EQ(rc_, LX_E_NOTFOUND);
  EXPECT_EQ(LXGetObjFromName(nullptr, LX_LANGUAGE, "English", -1, 1, &rc_), nullptr);
  EXPECT_EQ(rc_, LX_E_NOTFOUND);
  EXPECT_NE(LXGetObjFromName(manager_, LX_LANGUAGE, "English", -1, 1, nullptr), nullptr);
}

// Without an object and without an error: the sort that needs none.
TEST_F(LookupTest, BinarySort) {
  using namespace std::string_view_literals;
  const NameCase cases[] = {
      {LX_SORT, "BINARY", -1, 0, LX_OK},
      {LX_SORT, "binary", 6, 0, LX_OK},
      {LX_SORT, "Binary\0"sv, 7, 0, LX_OK},
      {LX_SORT, "BINARYX", 6, 0, LX_OK},
      {LX_SORT, "BINAR", 5, 0, LX_E_NOTFOUND},
      {LX_SORT, "BINARY\0\0"sv, 8, 0, LX_E_NOTFOUND},
      {LX_SORT, "BINARYX", 7, 0, LX_E_NOTFOUND},
      {LX_SORT, "BINARYX", -1, 0, LX_E_NOTFOUND},
      {LX_LANGUAGE, "BINARY", -1, 0, LX_E_NOTFOUND},
  };
  for (const NameCase& one : cases) {
    EXPECT_EQ(id_of(one.type, one.name, one.length), 0) << one.name;
    EXPECT_EQ(rc_, one.rc) << one.name << " " << one.length;
  }
  EXPECT_EQ(LXGetObjFromID(manager_, LX_SORT, 0, 0, &rc_), nullptr);
  EXPECT_EQ(rc_, LX_OK);
}

TEST_F(LookupTest, ByWideName) {
  const LXWChar english[] = {'E', 'n', 'g', 'L', 'I', 's', 'h', 0, 'x'};
  const LXWChar high[] = {0xAB000045, 'n', 0x4100 | 'g', 'l', 'i', 's', 'h', 0};
  const LXWChar binary[] = {'b', 'i', 'n', 'a', 'r', 'y', 0};
  struct Case {
    uint8_t type;
    const LXWChar* name;
    int32_t length;
    uint16_t id;
    uint32_t rc;
  };
  const Case cases[] = {
      {LX_LANGUAGE, english, -1, 1, LX_OK},
      {LX_LANGUAGE, english, 7, 1, LX_OK},
      {LX_LANGUAGE, english, 8, 1, LX_OK},
      {LX_LANGUAGE, english, 9, 0, LX_E_NOTFOUND},
      {LX_LANGUAGE, high, -1, 1, LX_OK},  // only the low bytes count
      {LX_LANGUAGE, english, 0, 0, LX_E_NOTFOUND},
      {LX_LANGUAGE, nullptr, -1, 0, LX_E_NOTFOUND},
      {LX_SORT, binary, -1, 0, LX_OK},
      {LX_SORT, binary, 7, 0, LX_OK},
  };
  for (const Case& one : cases) {
    EXPECT_EQ(LXGetObjId(LXGetObjFromNameW(manager_, one.type, one.name, one.length, 1, &rc_)), one.id) << one.length;
    EXPECT_EQ(rc_, one.rc) << one.length;
  }
}

TEST_F(LookupTest, ByNumber) {
  struct Case {
    uint8_t type;
    uint16_t id;
    bool found;
  };
  const Case cases[] = {
      {LX_LANGUAGE, 1, true},      {LX_LANGUAGE, 2, true},
      {LX_LANGUAGE, 0, false},     {LX_LANGUAGE, 3, false},
      {LX_TERRITORY, 2, true},     {LX_CODEPAGE, 366, false},
      {LX_CODEPAGE, 367, true},    {LX_CODEPAGE, 900, true},
      {LX_CODEPAGE, 903, true},    {LX_CODEPAGE, 904, false},
      {LX_CODEPAGE, 65535, false}, {LX_SORT, 7, true},
      {LX_SORT, 8, false},         {4, 1, false},
  };
  for (const Case& one : cases) {
    LXObjEntry* entry = LXGetObjFromID(manager_, one.type, one.id, 1, &rc_);
    EXPECT_EQ(entry != nullptr, one.found) << one.id;
    EXPECT_EQ(rc_, one.found ? LX_OK : LX_E_NOTFOUND) << one.id;
    if (entry != nullptr) {
      EXPECT_EQ(LXGetObjId(entry), one.id);
    }
  }
  EXPECT_EQ(LXGetObjFromID(nullptr, LX_LANGUAGE, 1, 1, &rc_), nullptr);
  EXPECT_EQ(rc_, LX_E_NOTFOUND);
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
