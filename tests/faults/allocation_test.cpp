// SPDX-License-Identifier: Apache-2.0
// Calls that run out of memory at every place where they take some: they say so, leak nothing, and leave what the
// caller has as it was.
#include <gtest/gtest.h>

#include "faults/each_allocation.hpp"
#include "support/environment.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

constexpr char kName[] = "German_Germany.Small@BINARY";
const LXWChar kWideName[] = {'G', 'e', 'r', 'm', 'a', 'n', '.', 't', 'i', 'n', 'y', 0};
const LXUChar kUcs2Name[] = {'G', 'e', 'r', 'm', 'a', 'n', '_', 'G', 'e', 'r', 'm', 'a', 'n', 'y', 0};

LXLocale* g_locale;
LXConversion* g_conversion;
uint32_t g_rc;

void release_locale() { EXPECT_EQ(LXReleaseLocale(std::exchange(g_locale, nullptr), 0), LX_OK); }
uint32_t got_locale() { return (g_locale != nullptr) == (g_rc == LX_OK) ? g_rc : kFailed; }

TEST(Allocation, OfLocales) {
  auto check = [] {
    ASSERT_NE(g_locale, nullptr);
    EXPECT_EQ(LXGetObjId(LXGetLocaleObject(g_locale, LX_CODEPAGE)), 900);
    LXCodePageInfo info;
    EXPECT_EQ(LXGetCodePageInfo(LXGetLocaleObject(g_locale, LX_CODEPAGE), &info), LX_OK);
    EXPECT_EQ(info.max_length, 4);
    release_locale();
  };
  fail_each_allocation({"LXGetLocale", [] { return g_locale = LXGetLocale(kName, 0, &g_rc), got_locale(); }, check});
  fail_each_allocation({"LXGetLocale with substitution",
                        [] { return g_locale = LXGetLocale(kName, LX_GET_SUBSTITUTE, &g_rc), got_locale(); }, check});
  fail_each_allocation(
      {"LXGetLocaleW", [] { return g_locale = LXGetLocaleW(kWideName, 0, &g_rc), got_locale(); }, check});
}

// The name itself is converted with a code page; when that cannot be loaded the name counts as empty.
TEST(Allocation, OfLocalesWithUcs2Names) {
  auto load_ascii = [] { LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, 367, 0, &g_rc); };
  fail_each_allocation(
      {"LXGetLocaleU", [] { return g_locale = LXGetLocaleU(kUcs2Name, 0, &g_rc), got_locale(); }, release_locale},
      load_ascii);
}

TEST(Allocation, OfTheDefaultLocale) {
  fail_each_allocation({"LXSetLocale", [] { return LXSetLocale(kName, 0); },
                        [] { EXPECT_EQ(LXGetObjId(LXGetLocaleObject(nullptr, LX_TERRITORY)), 2); }, LX_E_MEMORY,
                        [] { EXPECT_EQ(LXGetObjId(LXGetLocaleObject(nullptr, LX_TERRITORY)), 1); }},
                       [] { ASSERT_EQ(LXSetLocale("English", 0), LX_OK); });
  fail_each_allocation({"LXSetLocaleW", [] { return LXSetLocaleW(kWideName, 0); }, [] {}, LX_E_MEMORY,
                        [] { EXPECT_EQ(lxglocale, nullptr); }});
}

// Objects of every type and layout, on their own. What was not loaded can still be.
TEST(Allocation, OfObjects) {
  for (const ObjectRecord& record : small_directory_records()) {
    fail_each_allocation({record.name.c_str(), [&] {
                            LXObjEntry* entry = LXGetObjFromID(LXGetObjManager(), record.type, record.id, 0, &g_rc);
                            return (entry != nullptr) == (g_rc == LX_OK) ? g_rc : kFailed;
                          }});
  }
  const LXWChar english[] = {'E', 'n', 'g', 'l', 'i', 's', 'h', 0};
  fail_each_allocation({"LXGetObjFromNameW", [&] {
                          LXObjEntry* entry = LXGetObjFromNameW(LXGetObjManager(), LX_LANGUAGE, english, -1, 1, &g_rc);
                          return (entry != nullptr) == (g_rc == LX_OK) ? g_rc : kFailed;
                        }});
}

TEST(Allocation, OfConversions) {
  fail_each_allocation(
      {"LXOpenConversion",
       [] {
         g_conversion = LXOpenConversion(g_locale, g_locale, 0);
         EXPECT_EQ(g_conversion == nullptr, LXGetError(g_locale) == LX_E_MEMORY);
         return LXGetError(g_locale);
       },
       [] { EXPECT_EQ(LXCloseConversion(std::exchange(g_conversion, nullptr)), LX_OK); }},
      [] { g_locale = LXGetLocale(kName, 0, nullptr); }, release_locale);
}

TEST(Allocation, OfFiles) {
  static LXFile* file;
  static void* block;
  static const std::string path = small_directory().file("control.nls");
  auto open = [] { return file = LXOpenFile(1, path.c_str(), 0, 0, &g_rc), g_rc; };
  auto close = [] { EXPECT_EQ(LXCloseFile(file, 0), 0u); };
  fail_each_allocation({"LXOpenFile", open, close});
  fail_each_allocation(
      {"LXLoadFile", [] { return block = LXLoadFile(file, 0, 76, &g_rc), g_rc; }, [] { LXUnloadFile(block); }},
      [&] { open(); }, close);
}

TEST(Allocation, OfAliases) {
  fail_each_allocation({"LXBuildAliasList", [] { return LXBuildAliasList(LXGetObjManager()); },
                        [] { EXPECT_NE(LXGetCodepageFromAlias(LXGetObjManager(), "little"), nullptr); }, 1},
                       [] { LXDestroyAliasList(LXGetObjManager()); });
}

TEST(Allocation, OfConvertedSections) {
  const Bytes file = multibyte_page_file(true);
  const uint8_t* section1 = file.data() + 76;
  auto size1 = static_cast<uint16_t>(file[10] << 8 | file[11]);
  auto size2 = static_cast<uint16_t>(file[16] << 8 | file[17]);
  static uint8_t* made1;
  static uint8_t* made2;
  fail_each_allocation({"LXCpV1toV2",
                        [&] {
                          made1 = LXCpV1toV2(section1, size1, section1 + size1, size2, &made2);
                          EXPECT_EQ(made1 == nullptr, made2 == nullptr);
                          return made1 != nullptr ? LX_OK : kFailed;
                        },
                        [] {
                          LXUnloadFile(made1);
                          LXUnloadFile(made2);
                        },
                        kFailed});
}

// A second manager: its aliases may be incomplete, all else is told.
TEST(Allocation, OfManagers) {
  for (uint32_t options : {0u, LX_INIT_NO_DEFAULTS}) {
    bool failed = true;
    for (int n = 0; failed; ++n) {
      SCOPED_TRACE(n);
      CountingAllocator allocator;
      ASSERT_EQ(allocator.init("/does/not/exist"), LX_E_DEFAULTS);
      int before = allocator.live;
      allocator.arm(n, n % 2 == 1);
      LXObjMgr* manager = LXInitObjManager(small_directory().path(), options, &g_rc);
      failed = allocator.has_failed();
      allocator.disarm();
      EXPECT_EQ(manager == nullptr, n == 0) << "only the manager itself is missed so much";
      EXPECT_TRUE(g_rc == LX_OK || g_rc == LX_E_MEMORY) << g_rc;
      bool found = LXGetObjFromID(manager, LX_CODEPAGE, 900, 1, nullptr) != nullptr;
      EXPECT_EQ(found, g_rc == LX_OK);
      EXPECT_EQ(LXTermObjManager(manager), LX_OK);
      EXPECT_EQ(allocator.live, before);
      EXPECT_EQ(LXTerm(), LX_OK);
      EXPECT_EQ(allocator.live, 0);
    }
  }
}

TEST(Allocation, OfTheLibrary) {
  Variable location("LX_LOCALEDIR", nullptr);
  for (const char* directory : {small_directory().path(), "/does/not/exist"}) {
    for (bool all_after : {false, true}) {
      bool failed = true;
      for (int n = 0; failed; ++n) {
        SCOPED_TRACE(std::string(directory) + " " + std::to_string(n));
        CountingAllocator allocator;
        allocator.arm(n, all_after);
        uint32_t status = allocator.init(directory);
        failed = allocator.has_failed();
        allocator.disarm();
        if (status == LX_E_MEMORY || status == LX_E_MANAGER) {
          EXPECT_EQ(LXGetObjManager(), nullptr);
          EXPECT_EQ(LXTerm(), LX_OK);
          status = allocator.init(directory);
        }
        ASSERT_TRUE(status == LX_OK || status == LX_E_DEFAULTS) << status;
        Locale locale(LXGetLocale("English", 0, nullptr));  // there is none when there was no memory for the directory
        locale.reset();
        EXPECT_EQ(LXTerm(), LX_OK);
        ASSERT_EQ(allocator.live, 0);
      }
    }
  }
}

// An object that does not fit into memory is served by built-in data where that is allowed, as any that cannot be read.
TEST(Allocation, OfObjectsThatHaveStandIns) {
  bool failed = true;
  for (int n = 0; failed; ++n) {
    SCOPED_TRACE(n);
    CountingAllocator allocator;
    ASSERT_EQ(allocator.init(small_directory().path()), LX_OK);
    allocator.arm(n, false);
    g_locale = LXGetLocale(kName, 0, &g_rc);
    failed = allocator.has_failed();
    allocator.disarm();
    EXPECT_EQ(got_locale(), g_locale != nullptr ? LX_OK : LX_E_MEMORY);
    if (g_locale != nullptr) {
      char out[16];
      EXPECT_EQ(LXConvertString(g_locale, out, 16, g_locale, "abc", 3, 0), 3);
    }
    release_locale();
    EXPECT_EQ(LXTerm(), LX_OK);
    ASSERT_EQ(allocator.live, 0);
  }
}

// Nothing on the way of text takes memory.
TEST(Allocation, NoneForText) {
  CountingAllocator allocator;
  ASSERT_EQ(allocator.init(small_directory().path()), LX_OK);
  Locale small(LXGetLocale("English.Small", 0, nullptr));
  Locale mixed(LXGetLocale("English.Mixed", 0, nullptr));
  Conversion handle(LXOpenConversion(small.get(), mixed.get(), 0));
  allocator.arm(0, true);
  const std::string text(2000, 'x');
  std::vector<char> bytes(5000);
  std::vector<LXUChar> units(5000);
  std::vector<LXWChar> wide(5000);
  for (auto [target, source] : {std::pair(small.get(), mixed.get()), {mixed.get(), small.get()}}) {
    EXPECT_EQ(LXConvertString(target, bytes.data(), 5000, source, text.data(), 2000, 0), 2000);
    EXPECT_EQ(LXConvertStringEx(target, bytes.data(), 0, 5000, source, text.data(), 0, 2000, 0), 2000);
    EXPECT_EQ(LXStringToUnicode(source, units.data(), 5000, text.data(), 2000, 0), 2000);
    EXPECT_EQ(LXUnicodeToString(target, bytes.data(), 5000, units.data(), 2000, 0), 2000);
    EXPECT_EQ(LXMbToWide(source, wide.data(), 5000, text.data(), 2000, 0), 2000);
    EXPECT_EQ(LXWideToMb(source, bytes.data(), 5000, wide.data(), 2000, 0), 2000);
  }
  const char* in = text.data();
  char* out = bytes.data();
  int32_t left = 2000, room = 5000;
  EXPECT_EQ(LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0), LX_OK);
  EXPECT_EQ(LXFinishConversion(handle.get(), &out, &room), LX_OK);
  EXPECT_EQ(allocator.calls, 0);
  allocator.disarm();
  handle.reset();
  small.reset();
  mixed.reset();
  EXPECT_EQ(LXTerm(), LX_OK);
  EXPECT_EQ(allocator.live, 0);
}

}  // namespace
}  // namespace lx::test
