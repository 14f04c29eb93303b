// SPDX-License-Identifier: Apache-2.0
// Object files: good ones, what stands in for bad ones, and the older layout of code pages.
#include <gtest/gtest.h>

#include <tuple>

#include "support/counting_allocator.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

Bytes with(Bytes file, size_t at, uint8_t value) {
  file[at] = value;
  return file;
}
Bytes cut(Bytes file, size_t size) {
  file.resize(size);
  return file;
}
// A byte of section 1.
Bytes with1(const Bytes& file, size_t at, uint8_t value) { return with(file, 76 + at, value); }

TEST(Loading, FileThatIsBroken) {
  const Bytes language = language_file({1, 1, 0, {{'a', 0, 'b', 0}}, {{'c', 0, 'd', 0}}});
  const Bytes territory = territory_file();
  const Bytes single = single_byte_page_file();
  const Bytes multi = multibyte_page_file();
  const Bytes old = multibyte_page_file(true);
  const Bytes old_single = single_byte_page_file(true);
  const Bytes mixed = mixed_page_file();
  constexpr size_t kOffsets = 4366;
  struct Spoilt {
    const char* what;
    uint8_t type;
    Bytes file;
    uint32_t rc;
  };
  const Spoilt cases[] = {
      {"empty", LX_LANGUAGE, {}, LX_E_FILE},
      {"five sections", LX_LANGUAGE, with(language, 9, 5), LX_E_HEADER},
      {"second section beyond the end", LX_LANGUAGE, with(with(language, 9, 2), 17, 1), LX_OK},
      {"second section far beyond the end", LX_LANGUAGE, with(with(with(language, 9, 2), 16, 99), 20, 99), LX_E_FILE},
      {"section 1 of size 0", LX_LANGUAGE, with(with(language, 10, 0), 11, 0), LX_E_HEADER},
      {"cut", LX_TERRITORY, cut(territory, territory.size() - 1), LX_E_FILE},
      {"language special count", LX_LANGUAGE, with1(language, 6, 0x40), LX_E_HEADER},
      {"language text offset", LX_LANGUAGE, with1(language, 10, 0x40), LX_E_HEADER},
      {"territory too small", LX_TERRITORY, with(with(territory, 10, 0), 11, 43), LX_E_HEADER},
      {"sort too small", LX_SORT, territory, LX_E_HEADER},
      {"page too small", LX_CODEPAGE, with(single, 11, 0x17), LX_E_HEADER},
      {"longest character 5", LX_CODEPAGE, with1(multi, 5, 5), LX_E_HEADER},
      {"length above the longest", LX_CODEPAGE, with1(single, 10 + 'a', 2), LX_E_HEADER},
      {"kind of a wider page", LX_CODEPAGE, with1(single, 2316, 1), LX_E_HEADER},
      {"unknown kind", LX_CODEPAGE, with1(single, 2316, 5), LX_OK},
      {"values beyond section 3", LX_CODEPAGE, with1(single, 2316 + 4, 1), LX_E_HEADER},
      {"high parts beyond section 4", LX_CODEPAGE, with1(multi, 2316 + 8 * 0x4E + 6, 1), LX_E_HEADER},
      {"multibyte without states", LX_CODEPAGE, with1(single, 5, 2), LX_E_HEADER},
      {"array offset", LX_CODEPAGE, with1(multi, kOffsets + 8, 0xF0), LX_E_HEADER},
      {"type states beyond the end", LX_CODEPAGE, with1(multi, kOffsets + 4, 0xF0), LX_E_HEADER},
      {"no types", LX_CODEPAGE, with1(with1(multi, kOffsets + 4, 0), kOffsets + 5, 0), LX_OK},
      {"full-width table beyond the end", LX_CODEPAGE, with1(multi, kOffsets, 0xF0), LX_E_HEADER},
      {"pairs beyond the end", LX_CODEPAGE, with1(multi, kOffsets + 2, 0xF0), LX_E_HEADER},
      {"too many pairs", LX_CODEPAGE, with1(multi, 6, 0xF0), LX_E_HEADER},
      {"states in a circle", LX_CODEPAGE, with(multi, 76 + (unsigned{multi[10]} << 8 | multi[11]) + 6 * 18, 0),
       LX_E_HEADER},
      {"no enter byte", LX_CODEPAGE, with1(mixed, 8, 0), LX_E_HEADER},
      {"shift bytes alike", LX_CODEPAGE, with1(mixed, 9, 0x0E), LX_E_HEADER},
      {"three bytes between shift bytes", LX_CODEPAGE, with1(mixed, 5, 3), LX_E_HEADER},
      {"older layout too small", LX_CODEPAGE, with(with(old_single, 10, 0x11), 11, 0x09), LX_E_HEADER},
      {"older layout, table before the variable part", LX_CODEPAGE, with1(old, 4364, 0), LX_E_HEADER},
      {"older layout, odd array offset", LX_CODEPAGE, with1(old, 4371, 85), LX_E_HEADER},
      {"older layout, array offset", LX_CODEPAGE, with1(old, 4370, 0xF0), LX_E_HEADER},
      {"unknown layout is read as the current one", LX_CODEPAGE, with(single, 4, 0x70), LX_OK},
      {"format of other types is not looked at", LX_TERRITORY, with(territory, 4, 0x10), LX_OK},
  };
  for (const Spoilt& one : cases) {
    SCOPED_TRACE(one.what);
    for (uint32_t options : {0u, LX_INIT_NO_DEFAULTS}) {
      DataDirectory directory;
      directory.write_control({{one.type, 1, "Subject"}});
      directory.write_object(one.type, 1, one.file);
      uint32_t rc = 99;
      LXObjMgr* manager = LXInitObjManager(directory.path(), options, &rc);
      const LXObjEntry* entry = LXGetObjFromID(manager, one.type, 1, 0, &rc);
      EXPECT_EQ(rc, one.rc);
      const bool has_stand_in = options == 0 && one.type != LX_SORT;
      EXPECT_EQ(entry != nullptr, one.rc == LX_OK || has_stand_in);
      LXGetObjFromID(manager, one.type, 1, 0, &rc);
      EXPECT_EQ(rc, has_stand_in ? LX_OK : one.rc) << "the next lookup finds what stands in";
      EXPECT_EQ(LXTermObjManager(manager), LX_OK);
    }
  }
}

class OlderLayout : public testing::Test {
 protected:
  OlderLayout() { write_small_directory(directory_); }
  static LXObjEntry* loaded(const char* name) {
    uint32_t rc = 99;
    LXObjEntry* entry = LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, name, -1, 0, &rc);
    EXPECT_EQ(rc, LX_OK);
    return entry;
  }
  DataDirectory directory_;
};

// Its facts are compared with the sources of pages in tests/codepage; this page has characters of up to four bytes.
TEST_F(OlderLayout, ReadsLikeTheCurrentOne) {
  Session session(directory_.path());
  LXObjEntry* current = loaded("Small");
  LXObjEntry* older = loaded("OldSmall");
  for (LXWChar packed : {0x8140u, 0x8148u, 0x8EA0A0u, 0x8EA1A0u, 0x8FA1A1A0u}) {
    for (LXWChar end = packed + 8; packed < end; ++packed) {
      auto facts = [packed](const LXObjEntry* page) {
        const auto* types = LXGetMbCtypeW(page, packed);
        return std::tuple(types != nullptr ? types->flags : ~0u, LXCpMbToUnicodeW(page, packed),
                          LXCpMbCaseConvW(page, packed, LX_CT_LOWER), LXCpMbHalfToFullW(page, packed),
                          LXCpFullToHalfW(page, packed));
      };
      EXPECT_EQ(facts(older), facts(current)) << packed;
    }
  }
  for (unsigned number = 0; number < 65536; ++number) {
    const auto ucs2 = static_cast<LXUChar>(number);
    ASSERT_EQ(LXCpUnicodeToCharW(older, ucs2), LXCpUnicodeToCharW(current, ucs2)) << number;
  }
  EXPECT_EQ(LXCpMbToUnicodeW(older, 0x8FA1A1A7), 0x5007);
  EXPECT_EQ(LXCpUnicodeToCharW(older, 0x4E0F), 0x8EA1A7u);
  EXPECT_EQ(LXCpUnicodeToCharW(older, 0x3103), 0x8143u) << "one way only";
}

// A mixed page of the older layout has nowhere to name its shift bytes: they are those of the hosts. Called directly,
// the conversion believes the sizes that it is given, and no table of the page.
TEST_F(OlderLayout, ConvertedDirectly) {
  Bytes file = multibyte_page_file(true);
  const size_t whole1 = size_t{file[10]} << 8 | file[11];
  const size_t whole2 = size_t{file[16]} << 8 | file[17];
  auto convert = [&](size_t size1, size_t size2, auto check) {
    const uint8_t* start = file.data() + 76;
    const Bytes section1(start, start + size1), section2(start + whole1, start + whole1 + size2);
    uint8_t* made2 = nullptr;
    uint8_t* made1 = LXCpV1toV2(section1.data(), static_cast<uint16_t>(size1), section2.data(),
                                static_cast<uint16_t>(size2), &made2);
    check(made1, made2);
    LXUnloadFile(made1);
    LXUnloadFile(made2);
  };
  for (bool mixed : {false, true}) {
    file[76 + 4361] = mixed ? 1 | 2 : 1;
    convert(whole1, whole2, [&](const uint8_t* made1, const uint8_t*) {
      ASSERT_NE(made1, nullptr);
      EXPECT_EQ(made1[8], mixed ? 0x0E : 0);
      EXPECT_EQ(made1[9], mixed ? 0x0F : 0);
    });
  }
  for (size_t size1 = 0; size1 <= whole1; size1 += size1 < 4360 ? 109 : 1) {
    for (size_t size2 : {size_t{0}, size_t{83}, size_t{84}, whole2}) {
      convert(size1, size2, [&](const uint8_t* made1, const uint8_t* made2) {
        EXPECT_TRUE(made1 != nullptr || made2 == nullptr);
        EXPECT_TRUE(made1 == nullptr || size1 >= 4372) << size1;
      });
    }
  }
}

TEST_F(OlderLayout, UnloadingReportsTheFreeCallback) {
  CountingAllocator allocator;
  ASSERT_EQ(allocator.init(directory_.path()), LX_OK);
  uint32_t rc = 0;
  LXObjEntry* territory = LXGetObjFromName(LXGetObjManager(), LX_TERRITORY, "Germany", -1, 0, &rc);
  const int before = allocator.live;
  LXObjEntry* old = loaded("OldSmall");
  allocator.free_fails = true;
  EXPECT_EQ(LXUnloadObj(LXGetObjManager(), old), LX_E_FREE);
  EXPECT_EQ(allocator.live, before);
  EXPECT_EQ(LXUnloadObj(LXGetObjManager(), territory), LX_OK) << "what was read is given back without a look";
  LXObjMgr* second = LXInitObjManager(directory_.path(), 0, &rc);
  EXPECT_EQ(LXTermObjManager(second), 1u);
  allocator.free_fails = false;
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(allocator.live, 0);

  Session session("/does/not/exist");
  LXObjEntry* built_in = loaded("US-ASCII");
  EXPECT_EQ(LXUnloadObj(LXGetObjManager(), built_in), LX_OK);
  LXCodePageInfo info;
  EXPECT_EQ(LXGetCodePageInfo(built_in, &info), LX_OK) << "built-in objects stay";
}

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
      {0xDF, 0, kUpper, 2, 'S', 'S'}, {'i', 0x307, kUpper, 1, 0x130, 0}, {'i', 0, kUpper, 0, 9, 9},
      {'S', 'S', kUpper, 0, 9, 9},    {'S', 'S', kLower, 1, 0xDF, 0},    {0xDF, 0, 46, 0, 9, 9},
  };
  for (const Case& one : cases) {
    uint16_t value1 = 9, value2 = 9;
    EXPECT_EQ(LXLangGetSpecial(language, one.key1, one.key2, &value1, &value2, one.item), one.result) << one.key1;
    EXPECT_EQ(value1, one.value1) << one.key1;
    EXPECT_EQ(value2, one.value2) << one.key1;
  }
  EXPECT_EQ(LXLangGetSpecial(language, 0xDF, 0, nullptr, nullptr, kUpper), 2);
  EXPECT_EQ(LXUnloadObj(LXGetObjManager(), language), LX_OK);
  for (const LXObjEntry* entry : {language, LXGetObjFromID(LXGetObjManager(), LX_TERRITORY, 2, 0, &rc),
                                  LXGetObjFromID(LXGetObjManager(), LX_LANGUAGE, 1, 0, &rc)}) {
    EXPECT_EQ(LXLangGetSpecial(entry, 0xDF, 0, nullptr, nullptr, kUpper), 0);
  }
}

}  // namespace
}  // namespace lx::test
