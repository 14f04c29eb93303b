// SPDX-License-Identifier: Apache-2.0
#include <gtest/gtest.h>

#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

constexpr uint32_t kUpper = 44;
constexpr uint32_t kLower = 45;

TEST(SpecialPairs, AreFoundInTheirList) {
  DataDirectory directory;
  write_small_directory(directory);
  LanguageParts parts;
  parts.upper = {{0xDF, 0, 'S', 'S'}, {'i', 0x307, 0x130, 0}, {0xDF, 0, 'X', 'X'}};
  parts.lower = {{'S', 'S', 0xDF, 0}};
  directory.write_object(LX_LANGUAGE, 2, language_file(parts));
  Session session(directory.path());
  uint32_t rc = 0;
  LXObjEntry* language = LXGetObjFromName(LXGetObjManager(), LX_LANGUAGE, "German", -1, 0, &rc);
  ASSERT_EQ(rc, LX_OK);
  struct Case {
    uint16_t key1, key2;
    uint32_t item;
    int32_t result;
    uint16_t value1, value2;
  };
  const Case cases[] = {
      {0xDF, 0, kUpper, 2, 'S', 'S'}, {'i', 0x307, kUpper, 1, 0x130, 0},
      {'i', 0, kUpper, 0, 9, 9},      {'S', 'S', kUpper, 0, 9, 9},
      {'S', 'S', kLower, 1, 0xDF, 0}, {0xDF, 0, kLower, 0, 9, 9},
      {0xDF, 0, 43, 0, 9, 9},         {0xDF, 0, 46, 0, 9, 9},
      {0xDF, 0, 0xFFFFFFFF, 0, 9, 9},
  };
  for (const Case& one : cases) {
    uint16_t value1 = 9, value2 = 9;
    EXPECT_EQ(LXLangGetSpecial(language, one.key1, one.key2, &value1, &value2, one.item), one.result) << one.key1;
    EXPECT_EQ(value1, one.value1) << one.key1;
    EXPECT_EQ(value2, one.value2) << one.key1;
  }
  EXPECT_EQ(LXLangGetSpecial(language, 0xDF, 0, nullptr, nullptr, kUpper), 2);
}

TEST(SpecialPairs, NeedALoadedLanguage) {
  DataDirectory directory;
  write_small_directory(directory);
  Session session(directory.path());
  uint32_t rc = 0;
  LXObjEntry* unloaded = LXGetObjFromName(LXGetObjManager(), LX_LANGUAGE, "German", -1, 1, &rc);
  LXObjEntry* territory = LXGetObjFromName(LXGetObjManager(), LX_TERRITORY, "Germany", -1, 0, &rc);
  LXObjEntry* without = LXGetObjFromName(LXGetObjManager(), LX_LANGUAGE, "English", -1, 0, &rc);
  for (const LXObjEntry* entry : {unloaded, territory, without, static_cast<LXObjEntry*>(nullptr)}) {
    EXPECT_EQ(LXLangGetSpecial(entry, 0xDF, 0, nullptr, nullptr, kUpper), 0);
    EXPECT_EQ(LXLangGetSpecial(entry, 0xDF, 0, nullptr, nullptr, kLower), 0);
  }
}

}  // namespace
}  // namespace lx::test
