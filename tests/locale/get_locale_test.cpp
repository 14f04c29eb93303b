// SPDX-License-Identifier: Apache-2.0
// Locales from their names.
#include <gtest/gtest.h>

#include "frame/records.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

// The objects of a locale: "language territory code-page sort".
std::string parts_of(LXLocale* locale) {
  std::string text;
  for (uint8_t type = 0; type < 4; ++type) {
    const char* name = LXGetObjName(LXGetLocaleObject(locale, type));
    text += (type == 0 ? "" : " ") + std::string(name != nullptr ? name : "-");
  }
  return text;
}

// What a name gives: its objects, or the status.
std::string get(const char* name, uint32_t options = 0) {
  uint32_t rc = 99;
  Locale locale(LXGetLocale(name, options, &rc));
  EXPECT_EQ(locale != nullptr, rc == LX_OK);
  return locale != nullptr ? parts_of(locale.get()) : std::to_string(rc);
}

struct Case {
  const char* name;
  const char* plain;
  const char* substituted;  // with LX_GET_SUBSTITUTE; null: the same
};

constexpr char kEnglish[] = "English UnitedStates Latin1 Default";

const Case kCases[] = {
    {nullptr, kEnglish, nullptr},
    {"", kEnglish, nullptr},
    {"English", kEnglish, nullptr},
    {"eNGLISH_uNITEDsTATES.uS-aSCII@bINARY", "English UnitedStates US-ASCII -", nullptr},
    {"German", "German Germany Latin1 Default", nullptr},
    {"German_Austria", "German Austria Latin1 Default", nullptr},
    {"German_German-Switzerland", "German German-Switzerland Latin1 Default", nullptr},
    {"German_Austria.UTF-8", "German Austria UTF-8 Default", nullptr},
    {"German.UTF-8", "German Germany UTF-8 Default", nullptr},
    {"German@BINARY", "German Germany Latin1 -", nullptr},
    {"German_Austria@BINARY", "German Austria Latin1 -", nullptr},
    {"German.UTF-8@Binary", "German Germany UTF-8 -", nullptr},
    {"_Germany", "English Germany Latin1 Default", nullptr},
    {".UTF-8", "English UnitedStates UTF-8 Default", nullptr},
    {"@BINARY", "English UnitedStates Latin1 -", nullptr},
    {"German_.@", "German Germany Latin1 Default", nullptr},
    {"German_", "German Germany Latin1 Default", nullptr},
    {"German_Austria.", "German Austria Latin1 Default", nullptr},
    {"German_Austria.UTF-8@", "German Austria UTF-8 Default", nullptr},
    // Not found.
    {"Klingon", "31", kEnglish},
    {"Klingon_Germany.UTF-8", "31", "English Germany UTF-8 Default"},
    {"Germa", "31", kEnglish},
    {"English ", "31", kEnglish},
    {"English_Atlantis", "34", kEnglish},
    {"English_English", "34", kEnglish},
    {"English_US_A", "34", kEnglish},
    {"English.NoSuchPage", "30", kEnglish},
    {"English.UTF-8.UTF-8", "30", kEnglish},
    {"English.UTF-8_Germany", "30", kEnglish},
    {"English@NoSuchSort", "33", kEnglish},
    {"English@BINARYX", "33", kEnglish},
    {"English@BINARY@", "33", kEnglish},
    {"English@BINARY.UTF-8", "33", kEnglish},
    {"German_Atlantis.NoSuchPage@None", "34", "German Germany Latin1 Default"},
    // Code pages by their further names.
    {"English.ascii", "English UnitedStates US-ASCII Default", nullptr},
    {"English.iso8859_1", kEnglish, nullptr},
    {"English_UnitedStates.ISO_8859-1:1987", kEnglish, nullptr},
    {"English.ISO_646.IRV:1991@BINARY", "English UnitedStates US-ASCII -", nullptr},
    {"English.367", "English UnitedStates US-ASCII Default", nullptr},
    {"English_ascii", "34", kEnglish},
};

TEST(GetLocale, ByName) {
  Session session;
  for (const Case& one : kCases) {
    EXPECT_EQ(get(one.name), one.plain) << one.name;
    EXPECT_EQ(get(one.name, LX_GET_SUBSTITUTE), one.substituted != nullptr ? one.substituted : one.plain) << one.name;
  }
}

template <class Unit>
std::vector<Unit> widened(const char* text) {
  std::vector<Unit> units;
  for (const char* at = text; *at != '\0'; ++at) units.push_back(static_cast<unsigned char>(*at));
  units.push_back(0);
  return units;
}

TEST(GetLocale, OtherKindsOfText) {
  Session session;
  for (const Case& one : kCases) {
    uint32_t rc = 99;
    const std::vector<LXWChar> wide = widened<LXWChar>(one.name != nullptr ? one.name : "");
    Locale from_wide(LXGetLocaleW(one.name != nullptr ? wide.data() : nullptr, 0, &rc));
    EXPECT_EQ(from_wide != nullptr ? parts_of(from_wide.get()) : std::to_string(rc), one.plain) << one.name;
    const std::vector<LXUChar> ucs2 = widened<LXUChar>(one.name != nullptr ? one.name : "");
    Locale from_ucs2(LXGetLocaleU(one.name != nullptr ? ucs2.data() : nullptr, 0, &rc));
    EXPECT_EQ(from_ucs2 != nullptr ? parts_of(from_ucs2.get()) : std::to_string(rc), one.plain) << one.name;
  }
}

TEST(GetLocale, LongNames) {
  Session session;
  for (size_t length : {32u, 33u, 34u, 64u, 65u, 200u, 70000u}) {
    std::string part(length, 'x');
    EXPECT_EQ(get(part.c_str()), "31");
    EXPECT_EQ(get(("English_" + part).c_str()), "34");
    EXPECT_EQ(get(("English." + part).c_str()), "30");
    EXPECT_EQ(get(("English@" + part).c_str()), "33");
    uint32_t rc = 99;
    EXPECT_EQ(LXGetLocaleU(widened<LXUChar>(part.c_str()).data(), 0, &rc), nullptr);
    EXPECT_EQ(rc, LX_E_LANGUAGE);
  }
}

TEST(GetLocale, OnlyTwoOptions) {
  Session session;
  for (uint32_t options : {1u, 8u, 0x10u, 0x80000000u, 1u | LX_GET_SUBSTITUTE, 9u | LX_GET_USER}) {
    uint32_t rc = 99;
    EXPECT_EQ(LXGetLocale("English", options, &rc), nullptr);
    EXPECT_EQ(rc, LX_E_ARGUMENT) << options;
    EXPECT_EQ(LXSetLocale("English", options), LX_E_ARGUMENT);
  }
  EXPECT_EQ(LXGetLocale("English", 1, nullptr), nullptr);
}

TEST(GetLocale, NeedsTheLibrary) {
  uint32_t rc = 99;
  EXPECT_EQ(LXGetLocale("English", 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_LANGUAGE);
  EXPECT_EQ(LXGetLocaleU(nullptr, 0, &rc), nullptr);
  EXPECT_EQ(LXGetLocaleW(nullptr, LX_GET_SUBSTITUTE, nullptr), nullptr);
}

TEST(GetLocale, FlagsOfTheCodePage) {
  DataDirectory directory;
  write_small_directory(directory);
  Session session(directory.path());
  struct Flags {
    const char* name;
    uint16_t flags;
  };
  const Flags cases[] = {
      {"English.US-ASCII", kLocaleSingleByte | kLocaleBinarySort},
      {"English.Small", kLocaleBinarySort},
      {"English.Mixed", kLocaleShiftSensitive | kLocaleBinarySort},
  };
  for (const Flags& one : cases) {
    Locale locale(LXGetLocale(one.name, 0, nullptr));
    ASSERT_NE(locale, nullptr);
    EXPECT_EQ(locale->flags & (kLocaleSingleByte | kLocaleShiftSensitive | kLocaleBinarySort), one.flags) << one.name;
    EXPECT_EQ(locale->set_mask, 0u);
    EXPECT_EQ(locale->last_error, LX_OK);
  }
}

// ---- Directories of our own -----------------------------------------------------------------------------------------

TEST(GetLocale, ObjectNamesGoBeforeAliases) {
  DataDirectory directory;
  write_small_directory(directory);
  directory.write("alias.txt", "Small us-ascii one.two_three@x one.two_three\nNowhere lost\nSmall lost\n");
  Session session(directory.path());
  EXPECT_EQ(get("English.US-ASCII"), "English UnitedStates US-ASCII -");
  EXPECT_EQ(get("English.One.Two_Three"), "English UnitedStates Small -");
  EXPECT_EQ(get("English.one.two_three@x"), "33") << "the sort begins at the first @";
  EXPECT_EQ(get("English.lost"), "30") << "the first alias counts, and its page is missing";
}

TEST(GetLocale, MissingDefaults) {
  DataDirectory directory;
  write_small_directory(directory);
  struct Defaults {
    LanguageParts parts;
    const char* name;
    const char* result;
  };
  const Defaults cases[] = {
      {{1, 367, 0}, "English", "English UnitedStates US-ASCII -"},
      {{9, 367, 0}, "English", "34"},
      {{9, 367, 0}, "English_Germany", "English Germany US-ASCII -"},
      {{1, 9, 0}, "English", "30"},
      {{1, 367, 9}, "English", "33"},
      {{1, 367, 9}, "English@BINARY", "English UnitedStates US-ASCII -"},
      {{9, 9, 9}, "English_Nowhere.None@None", "34"},
  };
  for (const Defaults& one : cases) {
    directory.write_object(LX_LANGUAGE, 1, language_file(one.parts));
    Session session(directory.path());
    EXPECT_EQ(get(one.name), one.result) << one.name;
    EXPECT_EQ(get(one.name, LX_GET_SUBSTITUTE), one.result) << one.name;
  }
}

TEST(GetLocale, SortObject) {
  DataDirectory directory;
  write_small_directory(directory);
  std::vector<ObjectRecord> records = small_directory_records();
  records.push_back({LX_SORT, 7, "Sorted"});
  directory.write_control(records);
  Session session(directory.path());
  EXPECT_EQ(get("English@Sorted"), "11") << "its file is missing, and nothing can stand in";
  EXPECT_EQ(get("English@Sorted", LX_GET_SUBSTITUTE), "11");
}

// An object whose file cannot be read is no error here: the built-in one serves.
TEST(GetLocale, MissingFiles) {
  for (const char* missing : {"te_00001.nls", "cp_00367.nls"}) {
    DataDirectory directory;
    write_small_directory(directory);
    directory.remove(missing);
    {
      Session session(directory.path());
      for (int i = 0; i < 2; ++i) EXPECT_EQ(get("English"), "English UnitedStates US-ASCII -") << missing;
    }
    ASSERT_EQ(LXInit(directory.path(), nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS), LX_OK);
    EXPECT_EQ(get("English"), "11") << missing;
    EXPECT_EQ(get("English", LX_GET_SUBSTITUTE), "11") << missing;
    LXTerm();
  }
}

// The built-in language has the numbers of the built-in directory, which a real one need not have.
TEST(GetLocale, MissingLanguageFile) {
  DataDirectory directory;
  write_small_directory(directory);
  directory.remove("la_00002.nls");
  Session session(directory.path());
  EXPECT_EQ(get("German_Germany.Small"), "German Germany Small -");
  EXPECT_EQ(get("German"), "30") << "territory 1 is here, code page 1 is not";
}

TEST(GetLocale, OnBuiltInObjectsAlone) {
  Session session("/does/not/exist");
  ASSERT_EQ(session.status, LX_E_DEFAULTS);
  EXPECT_EQ(get(""), "English UnitedStates US-ASCII -");
  EXPECT_EQ(get("English_UnitedStates.US-ASCII@BINARY"), "English UnitedStates US-ASCII -");
  EXPECT_EQ(get("German"), "31");
  EXPECT_EQ(get("German_Germany.Latin1@x", LX_GET_SUBSTITUTE), "English UnitedStates US-ASCII -");
  EXPECT_EQ(get("English.ascii"), "30") << "aliases come with the data";
  Locale locale(LXGetLocale("", 0, nullptr));
  ASSERT_NE(locale, nullptr);
  LXUChar units[8];
  EXPECT_EQ(LXStringToUnicode(locale.get(), units, 8, "az", 2, 0), 2);
  EXPECT_STREQ(locale->strings[1], "$");
  // Names in UCS-2 need code page 367, which these objects do not have: the name counts as empty.
  Locale from_ucs2(LXGetLocaleU(widened<LXUChar>("German").data(), 0, nullptr));
  EXPECT_EQ(parts_of(from_ucs2.get()), "English UnitedStates US-ASCII -");
}

TEST(GetLocale, ObjectsOfNoLocale) {
  Session session;
  EXPECT_EQ(LXGetLocaleObject(nullptr, LX_LANGUAGE), nullptr);
  Locale locale = locale_of("UTF-8");
  EXPECT_EQ(LXGetLocaleObject(locale.get(), 4), nullptr);
}

}  // namespace
}  // namespace lx::test
