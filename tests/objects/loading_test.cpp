// SPDX-License-Identifier: Apache-2.0
// Object files: good ones, what stands in for bad ones, and the older layout of code pages.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "support/counting_allocator.hpp"
#include "support/descriptors.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

constexpr uint16_t kSubject = 1;

// One object of a type, and how it loads.
class LoadingTest : public testing::Test {
 protected:
  uint32_t load(uint8_t type, const Bytes* file, uint32_t options) {
    DataDirectory directory;
    directory.write_control({{type, kSubject, "Subject"}});
    if (file != nullptr) directory.write_object(type, kSubject, *file);
    manager_ = LXInitObjManager(directory.path(), options, &rc_);
    entry_ = LXGetObjFromID(manager_, type, kSubject, 0, &rc_);
    uint32_t again = 99;
    again_ = LXGetObjFromID(manager_, type, kSubject, 0, &again) == entry_ ? again : 99;
    return rc_;
  }
  void unload() { EXPECT_EQ(LXTermObjManager(std::exchange(manager_, nullptr)), LX_OK); }
  void TearDown() override { LXTermObjManager(manager_); }

  LXObjMgr* manager_ = nullptr;
  LXObjEntry* entry_ = nullptr;
  uint32_t rc_ = 99;
  uint32_t again_ = 99;
};

TEST_F(LoadingTest, FileThatIsMissing) {
  for (uint8_t type : {uint8_t{LX_LANGUAGE}, uint8_t{LX_TERRITORY}, uint8_t{LX_CODEPAGE}}) {
    EXPECT_EQ(load(type, nullptr, 0), LX_E_NOFILE);
    EXPECT_NE(entry_, nullptr) << "served with built-in data";
    EXPECT_EQ(again_, LX_OK) << "the next lookup finds it loaded";
    unload();
    EXPECT_EQ(load(type, nullptr, LX_INIT_NO_DEFAULTS), LX_E_NOFILE);
    EXPECT_EQ(entry_, nullptr);
    EXPECT_EQ(again_, LX_E_NOFILE);
    unload();
  }
  EXPECT_EQ(load(LX_SORT, nullptr, 0), LX_E_NOFILE);
  EXPECT_EQ(entry_, nullptr) << "there is no built-in sort";
}

struct Spoilt {
  const char* what;
  uint8_t type;
  Bytes file;
  uint32_t rc;
};

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

TEST_F(LoadingTest, FileThatIsBroken) {
  const Bytes language = language_file({1, 1, 0, {{'a', 0, 'b', 0}}, {{'c', 0, 'd', 0}}});
  const Bytes territory = territory_file();
  const Bytes single = single_byte_page_file();
  const Bytes multi = multibyte_page_file();
  const Bytes old = multibyte_page_file(true);
  const Bytes old_single = single_byte_page_file(true);
  const Bytes mixed = mixed_page_file();
  constexpr size_t kOffsets = 4366;
  const Spoilt cases[] = {
      {"empty", LX_LANGUAGE, {}, LX_E_FILE},
      {"half a header", LX_TERRITORY, cut(territory, 75), LX_E_FILE},
      {"magic", LX_LANGUAGE, with(language, 0, 0), LX_E_HEADER},
      {"no sections", LX_LANGUAGE, with(language, 9, 0), LX_E_HEADER},
      {"five sections", LX_LANGUAGE, with(language, 9, 5), LX_E_HEADER},
      {"second section of size 0", LX_LANGUAGE, with(language, 9, 2), LX_OK},
      {"four sections, three of size 0", LX_TERRITORY, with(territory, 9, 4), LX_OK},
      {"second section beyond the end", LX_LANGUAGE, with(with(language, 9, 2), 17, 1), LX_OK},
      {"second section far beyond the end", LX_LANGUAGE, with(with(with(language, 9, 2), 16, 99), 20, 99), LX_E_FILE},
      {"section 1 of size 0", LX_LANGUAGE, with(with(language, 10, 0), 11, 0), LX_E_HEADER},
      {"cut", LX_TERRITORY, cut(territory, territory.size() - 1), LX_E_FILE},
      {"language too small", LX_LANGUAGE, with(with(language, 10, 0), 11, 97), LX_E_HEADER},
      {"language text offset", LX_LANGUAGE, with1(language, 10, 0x40), LX_E_HEADER},
      {"language special list", LX_LANGUAGE, with1(language, 98, 0x40), LX_E_HEADER},
      {"language special count", LX_LANGUAGE, with1(language, 6, 0x40), LX_E_HEADER},
      {"territory too small", LX_TERRITORY, with(with(territory, 10, 0), 11, 43), LX_E_HEADER},
      {"territory text offset", LX_TERRITORY, with1(territory, 22, 0x40), LX_E_HEADER},
      {"any territory values", LX_TERRITORY, with1(with1(territory, 16, 255), 10, 255), LX_OK},
      {"sort too small", LX_SORT, territory, LX_E_HEADER},
      {"page too small", LX_CODEPAGE, with(single, 11, 0x17), LX_E_HEADER},
      {"longest character 0", LX_CODEPAGE, with1(single, 5, 0), LX_E_HEADER},
      {"longest character 5", LX_CODEPAGE, with1(multi, 5, 5), LX_E_HEADER},
      {"length above the longest", LX_CODEPAGE, with1(single, 10 + 'a', 2), LX_E_HEADER},
      {"length 0", LX_CODEPAGE, with1(single, 10 + 'a', 0), LX_OK},
      {"kind of a wider page", LX_CODEPAGE, with1(single, 2316, 1), LX_E_HEADER},
      {"unknown kind", LX_CODEPAGE, with1(single, 2316, 5), LX_OK},
      {"values beyond section 3", LX_CODEPAGE, with1(single, 2316 + 4, 1), LX_E_HEADER},
      {"high parts beyond section 4", LX_CODEPAGE, with1(multi, 2316 + 8 * 0x4E + 6, 1), LX_E_HEADER},
      {"multibyte without states", LX_CODEPAGE, with1(single, 5, 2), LX_E_HEADER},
      {"array offset", LX_CODEPAGE, with1(multi, kOffsets + 8, 0xF0), LX_E_HEADER},
      {"type states beyond the end", LX_CODEPAGE, with1(multi, kOffsets + 4, 0xF0), LX_E_HEADER},
      {"type entries beyond the end", LX_CODEPAGE, with1(multi, kOffsets + 6, 0xF0), LX_E_HEADER},
      {"no types", LX_CODEPAGE, with1(with1(multi, kOffsets + 4, 0), kOffsets + 5, 0), LX_OK},
      {"full-width table beyond the end", LX_CODEPAGE, with1(multi, kOffsets, 0xF0), LX_E_HEADER},
      {"pairs beyond the end", LX_CODEPAGE, with1(multi, kOffsets + 2, 0xF0), LX_E_HEADER},
      {"too many pairs", LX_CODEPAGE, with1(multi, 6, 0xF0), LX_E_HEADER},
      {"pairs without a table", LX_CODEPAGE, with1(single, 6, 0xF0), LX_OK},
      {"states in a circle", LX_CODEPAGE, with(multi, 76 + (unsigned{multi[10]} << 8 | multi[11]) + 6 * 18, 0),
       LX_E_HEADER},
      {"no enter byte", LX_CODEPAGE, with1(mixed, 8, 0), LX_E_HEADER},
      {"no leave byte", LX_CODEPAGE, with1(mixed, 9, 0), LX_E_HEADER},
      {"shift bytes alike", LX_CODEPAGE, with1(mixed, 9, 0x0E), LX_E_HEADER},
      {"three bytes between shift bytes", LX_CODEPAGE, with1(mixed, 5, 3), LX_E_HEADER},
      {"older layout too small", LX_CODEPAGE, with(with(old_single, 10, 0x11), 11, 0x09), LX_E_HEADER},
      {"older layout, table before the variable part", LX_CODEPAGE, with1(old, 4364, 0), LX_E_HEADER},
      {"older layout without types", LX_CODEPAGE, with1(with1(old, 4366, 0), 4367, 0), LX_OK},
      {"older layout, odd array offset", LX_CODEPAGE, with1(old, 4371, 85), LX_E_HEADER},
      {"older layout, array offset", LX_CODEPAGE, with1(old, 4370, 0xF0), LX_E_HEADER},
      {"unknown layout is read as the current one", LX_CODEPAGE, with(single, 4, 0x70), LX_OK},
      {"format of other types is not looked at", LX_TERRITORY, with(territory, 4, 0x10), LX_OK},
  };
  for (const Spoilt& one : cases) {
    SCOPED_TRACE(one.what);
    EXPECT_EQ(load(one.type, &one.file, LX_INIT_NO_DEFAULTS), one.rc);
    EXPECT_EQ(entry_ != nullptr, one.rc == LX_OK);
    unload();
    EXPECT_EQ(load(one.type, &one.file, 0), one.rc);
    EXPECT_EQ(entry_ != nullptr, one.rc == LX_OK || one.type != LX_SORT);
    unload();
  }
}

TEST(Loading, LeavesNoDescriptorOpen) {
  long before = open_descriptors();
  for (int cycle = 0; cycle < 2; ++cycle) {
    Session session;
    ASSERT_EQ(session.status, LX_OK);
    for (uint8_t type = 0; type < 4; ++type) {
      for (unsigned id = 0; id < 65536; ++id) {
        uint32_t rc = 0;
        LXGetObjFromID(LXGetObjManager(), type, static_cast<uint16_t>(id), 0, &rc);
        ASSERT_TRUE(rc == LX_OK || rc == LX_E_NOTFOUND) << unsigned{type} << " " << id << ": " << rc;
      }
    }
    EXPECT_EQ(open_descriptors(), before);
  }
  EXPECT_EQ(open_descriptors(), before);
}

TEST(Loading, StandInsAreUsable) {
  DataDirectory directory;
  directory.write_control({{LX_LANGUAGE, 5, "L"}, {LX_TERRITORY, 6, "T"}, {LX_CODEPAGE, 7, "C"}});
  Session session(directory.path());
  uint32_t rc = 99;
  Locale locale(LXGetLocale("L_T.C@BINARY", 0, &rc));
  ASSERT_NE(locale, nullptr);
  EXPECT_EQ(rc, LX_OK);
  EXPECT_EQ(LXGetObjId(LXGetLocaleObject(locale.get(), LX_CODEPAGE)), 7);
  LXUChar out[4] = {};
  EXPECT_EQ(LXStringToUnicode(locale.get(), out, 4, "a\xE4", 2, 0), 2);
  EXPECT_EQ(out[0], 'a');
  EXPECT_EQ(out[1], 0xFFFD);
}

// ---- The older layout of code pages
// ----------------------------------------------------------------------------------

std::vector<std::string> characters_of_the_multibyte_page() {
  std::vector<std::string> all;
  for (int byte = 0; byte < 128; ++byte) all.emplace_back(1, static_cast<char>(byte));
  for (int i = 0; i < 16; ++i) all.push_back({'\x81', static_cast<char>(0x40 + i)});
  for (int i = 0; i < 16; ++i)
    all.push_back({'\x8E', static_cast<char>(0xA0 + i / 8), static_cast<char>(0xA0 + i % 8)});
  for (int i = 0; i < 8; ++i) all.push_back({'\x8F', '\xA1', '\xA1', static_cast<char>(0xA0 + i)});
  return all;
}

TEST(OlderLayout, ReadsLikeTheCurrentOne) {
  DataDirectory directory;
  write_small_directory(directory);
  Session session(directory.path());
  uint32_t rc = 0;
  LXObjEntry* current = LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, "Small", -1, 0, &rc);
  ASSERT_EQ(rc, LX_OK);
  LXObjEntry* older = LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, "OldSmall", -1, 0, &rc);
  ASSERT_EQ(rc, LX_OK);
  for (const std::string& character : characters_of_the_multibyte_page()) {
    char bytes[4] = {};
    character.copy(bytes, 4);
    LXWChar packed = LXMbToW(current, bytes);
    EXPECT_EQ(LXMbToW(older, bytes), packed);
    if (character.size() == 1) continue;
    EXPECT_EQ(LXCpMbToUnicode(older, bytes), LXCpMbToUnicode(current, bytes)) << packed;
    EXPECT_NE(LXCpMbToUnicode(current, bytes), 0xFFFD) << packed;
    EXPECT_EQ(LXGetMbCtype(older, bytes)->flags, LXGetMbCtype(current, bytes)->flags);
    EXPECT_EQ(LXCpMbCaseConvW(older, packed, LX_CT_LOWER), LXCpMbCaseConvW(current, packed, LX_CT_LOWER));
    EXPECT_EQ(LXCpMbHalfToFullW(older, packed), LXCpMbHalfToFullW(current, packed));
    EXPECT_EQ(LXCpFullToHalfW(older, packed), LXCpFullToHalfW(current, packed));
  }
  for (unsigned ucs2 = 0; ucs2 < 65536; ++ucs2) {
    ASSERT_EQ(LXCpUnicodeToCharW(older, static_cast<LXUChar>(ucs2)),
              LXCpUnicodeToCharW(current, static_cast<LXUChar>(ucs2)))
        << ucs2;
  }
  LXCodePageInfo info;
  ASSERT_EQ(LXGetCodePageInfo(older, &info), LX_OK);
  EXPECT_EQ(info.max_length, 4);
  EXPECT_EQ(info.substitution, 0x1A);
  EXPECT_EQ(info.ascii_family, 1);
  EXPECT_EQ(info.shift_sensitive, 0);
}

// The builder's page says what the library reads, so both layouts are also compared with plain facts.
TEST(OlderLayout, KnownCharacters) {
  DataDirectory directory;
  write_small_directory(directory);
  Session session(directory.path());
  struct Fact {
    LXUChar ucs2;
    LXWChar packed;
    bool round_trip;
  };
  const Fact facts[] = {
      {'A', 'A', true},           {0x3040, 0x8140, true},     {0x304F, 0x814F, true},   {0x3050, 0x1A, false},
      {0x3100, 0x8140, false},    {0x3103, 0x8143, false},    {0x4E00, 0x8EA0A0, true}, {0x4E0F, 0x8EA1A7, true},
      {0x5000, 0x8FA1A1A0, true}, {0x5007, 0x8FA1A1A7, true}, {0x5008, 0x1A, false},
  };
  for (const char* name : {"Small", "OldSmall"}) {
    uint32_t rc = 0;
    LXObjEntry* page = LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, name, -1, 0, &rc);
    ASSERT_EQ(rc, LX_OK);
    for (const Fact& fact : facts) {
      EXPECT_EQ(LXCpUnicodeToCharW(page, fact.ucs2), fact.packed) << name << " " << fact.ucs2;
      if (fact.round_trip && fact.packed > 0xFF) {
        EXPECT_EQ(LXCpMbToUnicodeW(page, fact.packed), fact.ucs2) << name;
      }
    }
    EXPECT_EQ(LXCpFullToHalfW(page, 0x8140), LXWChar{' '}) << "the single byte comes first";
    EXPECT_EQ(LXCpFullToHalfW(page, 0x8EA0A1), 0x8143u);
    EXPECT_EQ(LXCpMbHalfToFullW(page, 0x8142), 0x8EA0A0u);
    EXPECT_EQ(LXCpMbHalfToFullW(page, 0x8144), 0u);
    EXPECT_EQ(LXCpMbCaseConvW(page, 0x8141, LX_CT_LOWER), 0x8140u);
    EXPECT_EQ(LXCpMbCaseConvW(page, 0x8140, LX_CT_LOWER), 0x8140u);
    EXPECT_EQ(LXGetMbCtypeW(page, 0x8EA0A0)->flags, 1024u);
  }
}

TEST(OlderLayout, SingleBytePage) {
  DataDirectory directory;
  write_small_directory(directory);
  Session session(directory.path());
  Locale locale(LXGetLocale("English.OldSingle", 0, nullptr));
  ASSERT_NE(locale, nullptr);
  std::string all;
  for (int byte = 0; byte < 256; ++byte) all += static_cast<char>(byte);
  LXUChar units[256];
  ASSERT_EQ(LXStringToUnicode(locale.get(), units, 256, all.data(), 256, 0), 256);
  for (unsigned byte = 0; byte < 256; ++byte) EXPECT_EQ(units[byte], byte);
}

// A mixed page of the older layout has nowhere to name its shift bytes: they are those of the hosts.
TEST(OlderLayout, ShiftBytes) {
  Bytes file = multibyte_page_file(true);
  const size_t size1 = size_t{file[10]} << 8 | file[11];
  const size_t size2 = size_t{file[16]} << 8 | file[17];
  for (bool mixed : {false, true}) {
    file[76 + 4361] = mixed ? 1 | 2 : 1;
    uint8_t* made2 = nullptr;
    uint8_t* made1 =
        LXCpV1toV2(&file[76], static_cast<uint16_t>(size1), &file[76 + size1], static_cast<uint16_t>(size2), &made2);
    ASSERT_NE(made1, nullptr);
    EXPECT_EQ(made1[8], mixed ? 0x0E : 0);
    EXPECT_EQ(made1[9], mixed ? 0x0F : 0);
    lxfree_cbk(nullptr, made1);
    lxfree_cbk(nullptr, made2);
  }
}

// Called directly, it believes the sizes that it is given, and no table of the page.
TEST(OlderLayout, SectionsThatAreTooSmall) {
  const Bytes file = multibyte_page_file(true);
  size_t whole1 = size_t{file[10]} << 8 | file[11];
  size_t whole2 = size_t{file[16]} << 8 | file[17];
  for (size_t size1 = 0; size1 <= whole1; size1 += size1 < 4360 ? 109 : 1) {
    for (size_t size2 : {size_t{0}, size_t{83}, size_t{84}, whole2}) {
      const Bytes section1(file.begin() + 76, file.begin() + 76 + static_cast<long>(size1));
      const Bytes section2(file.begin() + 76 + static_cast<long>(whole1),
                           file.begin() + 76 + static_cast<long>(whole1 + size2));
      uint8_t* made2 = nullptr;
      uint8_t* made1 = LXCpV1toV2(section1.data(), static_cast<uint16_t>(size1), section2.data(),
                                  static_cast<uint16_t>(size2), &made2);
      EXPECT_TRUE(made1 != nullptr || made2 == nullptr);
      if (size1 < 4372) {
        EXPECT_EQ(made1, nullptr) << size1;
      }
      LXUnloadFile(made1);
      LXUnloadFile(made2);
    }
  }
}

TEST(OlderLayout, ConvertedSectionsAreFreed) {
  DataDirectory directory;
  write_small_directory(directory);
  CountingAllocator allocator;
  ASSERT_EQ(allocator.init(directory.path()), LX_OK);
  uint32_t rc = 0;
  for (const char* name : {"OldSmall", "OldSingle", "Small"}) {
    LXObjEntry* page = LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, name, -1, 1, &rc);
    int before = allocator.live;
    for (int i = 0; i < 3; ++i) {
      ASSERT_EQ(LXLoadObj(LXGetObjManager(), page, &rc), page);
      EXPECT_GT(allocator.live, before);
      EXPECT_EQ(LXUnloadObj(LXGetObjManager(), page), LX_OK);
      EXPECT_EQ(allocator.live, before);
    }
    ASSERT_EQ(LXLoadObj(LXGetObjManager(), page, &rc), page);
  }
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(allocator.live, 0);
}

// ---- Ends and odd calls
// -----------------------------------------------------------------------------------------------

TEST(Unloading, ReportsTheFreeCallback) {
  DataDirectory directory;
  write_small_directory(directory);
  CountingAllocator allocator;
  ASSERT_EQ(allocator.init(directory.path()), LX_OK);
  uint32_t rc = 0;
  auto loaded = [&](const char* name) { return LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, name, -1, 0, &rc); };
  LXObjEntry* old = loaded("OldSmall");
  LXObjEntry* territory = LXGetObjFromName(LXGetObjManager(), LX_TERRITORY, "Germany", -1, 0, &rc);
  allocator.free_fails = true;
  EXPECT_EQ(LXUnloadObj(LXGetObjManager(), old), LX_E_FREE);
  EXPECT_EQ(LXUnloadObj(LXGetObjManager(), territory), LX_OK) << "what was read is given back without a look";
  LXObjMgr* second = LXInitObjManager(directory.path(), 0, &rc);
  EXPECT_EQ(LXTermObjManager(second), 1u);
  allocator.free_fails = false;
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(allocator.live, 0);
}

TEST(Unloading, NullsAndBuiltIns) {
  Session session("/does/not/exist");
  uint32_t rc = 99;
  EXPECT_EQ(LXLoadObj(nullptr, nullptr, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_ARGUMENT);
  EXPECT_EQ(LXLoadObj(LXGetObjManager(), nullptr, nullptr), nullptr);
  EXPECT_EQ(LXUnloadObj(LXGetObjManager(), nullptr), LX_OK);
  EXPECT_EQ(LXLoadDefaultObj(LXGetObjManager(), nullptr), 1u);
  EXPECT_EQ(LXLoadDefaults(nullptr), 0u);
  EXPECT_EQ(LXTermObjManager(nullptr), LX_OK);
  LXObjEntry* built_in = LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, 1, 0, &rc);
  EXPECT_EQ(LXUnloadObj(LXGetObjManager(), built_in), LX_OK);
  LXCodePageInfo info;
  EXPECT_EQ(LXGetCodePageInfo(built_in, &info), LX_OK) << "it stays";
  EXPECT_EQ(LXLoadObj(LXGetObjManager(), built_in, &rc), built_in);
  EXPECT_EQ(rc, LX_OK);
}

}  // namespace
}  // namespace lx::test
