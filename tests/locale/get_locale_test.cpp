// SPDX-License-Identifier: Apache-2.0
// Locales from their names.
#include <gtest/gtest.h>

#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

constexpr char kEnglish[] = "English UnitedStates Latin1 Default";

// The objects of a locale: "language territory code-page sort".
std::string parts_of(LXLocale* locale) {
  std::string text;
  for (uint8_t type = 0; type < 4; ++type) {
    const char* name = LXGetObjName(LXGetLocaleObject(locale, type));
    text += (type == 0 ? "" : " ") + std::string(name != nullptr ? name : "-");
  }
  return text;
}

// What a name gives in all kinds of text: its objects, or the status.
std::string get(std::string_view name, uint32_t options = 0) {
  uint32_t rc[3] = {99, 99, 99};
  std::vector<LXWChar> wide(name.begin(), name.end());
  std::vector<LXUChar> ucs2(name.begin(), name.end());
  wide.push_back(0);
  ucs2.push_back(0);
  const Locale locales[] = {Locale(LXGetLocale(std::string(name).c_str(), options, &rc[0])),
                            Locale(LXGetLocaleW(wide.data(), options, &rc[1])),
                            Locale(LXGetLocaleU(ucs2.data(), options, &rc[2]))};
  std::string results[3];
  for (size_t i = 0; i < 3; ++i) {
    EXPECT_EQ(locales[i] != nullptr, rc[i] == LX_OK);
    results[i] = locales[i] != nullptr ? parts_of(locales[i].get()) : std::to_string(rc[i]);
    EXPECT_EQ(results[i], results[0]) << i;
  }
  return results[0];
}

TEST(GetLocale, ByName) {
  const struct {
    const char *name, *plain, *substituted;
  } cases[] = {
      {"", kEnglish, kEnglish},
      {"eNGLISH_uNITEDsTATES.uS-aSCII@bINARY", "English UnitedStates US-ASCII -", "English UnitedStates US-ASCII -"},
      {"_Germany", "English Germany Latin1 Default", "English Germany Latin1 Default"},
      {"German_.@", "German Germany Latin1 Default", "German Germany Latin1 Default"},
      {"Klingon_Germany.UTF-8", "31", "English Germany UTF-8 Default"},
      {"English@BINARY.UTF-8", "33", kEnglish},
      {"German_Atlantis.NoSuchPage@None", "34", "German Germany Latin1 Default"},
      {"English_UnitedStates.ISO_8859-1:1987", kEnglish, kEnglish},  // a further name of the code page
  };
  Session session;
  for (const auto& one : cases) {
    EXPECT_EQ(get(one.name), one.plain) << one.name;
    EXPECT_EQ(get(one.name, LX_GET_SUBSTITUTE), one.substituted) << one.name;
  }
  for (size_t length : {33u, 64u, 65u, 70000u}) {
    const std::string part(length, 'x');
    EXPECT_EQ(get(part), "31");
    EXPECT_EQ(get("English." + part), "30");
  }
  EXPECT_EQ(parts_of(Locale(LXGetLocale(nullptr, 0, nullptr)).get()), kEnglish);
  EXPECT_EQ(parts_of(Locale(LXGetLocaleW(nullptr, 0, nullptr)).get()), kEnglish);
  EXPECT_EQ(parts_of(Locale(LXGetLocaleU(nullptr, 0, nullptr)).get()), kEnglish);
  EXPECT_EQ(get("English", 1), "2");
  EXPECT_EQ(LXSetLocale("English", 0x80000000), LX_E_ARGUMENT);
  LXTerm();
  EXPECT_EQ(get("English"), "31") << "without the library";
}

// ---- Directories of our own -----------------------------------------------------------------------------------------

class SmallDirectory : public testing::Test {
 protected:
  SmallDirectory() { write_small_directory(directory_); }
  DataDirectory directory_;
};

TEST_F(SmallDirectory, ObjectNamesGoBeforeAliases) {
  directory_.write("alias.txt", "Small us-ascii one.two_three@x one.two_three\nNowhere lost\nSmall lost\n");
  Session session(directory_.path());
  EXPECT_EQ(get("English.US-ASCII"), "English UnitedStates US-ASCII -");
  EXPECT_EQ(get("English.One.Two_Three"), "English UnitedStates Small -");
  EXPECT_EQ(get("English.one.two_three@x"), "33") << "the sort begins at the first @";
  EXPECT_EQ(get("English.lost"), "30") << "the first alias counts, and its page is missing";
}

TEST_F(SmallDirectory, MissingDefaults) {
  const struct {
    LanguageParts parts;
    const char *name, *result;
  } cases[] = {
      {{9, 367, 0}, "English", "34"},
      {{9, 367, 0}, "English_Germany", "English Germany US-ASCII -"},
      {{1, 9, 0}, "English", "30"},
      {{1, 367, 9}, "English", "33"},
  };
  for (const auto& one : cases) {
    directory_.write_object(LX_LANGUAGE, 1, language_file(one.parts));
    Session session(directory_.path());
    for (uint32_t options : {0u, LX_GET_SUBSTITUTE}) EXPECT_EQ(get(one.name, options), one.result) << one.name;
  }
}

// An object whose file cannot be read is no error where a built-in one can serve; for a sort there is none. The
// built-in language has the numbers of the built-in directory, which a real one need not have.
TEST_F(SmallDirectory, MissingFiles) {
  std::vector<ObjectRecord> records = small_directory_records();
  records.push_back({LX_SORT, 7, "Sorted"});
  const struct {
    const char *file, *name, *result;
  } cases[] = {{"none", "English@Sorted", "11"},
               {"te_00001.nls", "English", "English UnitedStates US-ASCII -"},
               {"cp_00367.nls", "English_Germany", "English Germany US-ASCII -"},
               {"la_00002.nls", "German_Germany.Small", "German Germany Small -"},
               {"la_00002.nls", "German", "30"}};
  for (const auto& one : cases) {
    SCOPED_TRACE(std::string(one.file) + " " + one.name);
    write_small_directory(directory_);
    directory_.write_control(records);
    directory_.remove(one.file);
    for (uint32_t options : {0u, LX_INIT_NO_DEFAULTS}) {
      ASSERT_EQ(LXInit(directory_.path(), nullptr, nullptr, nullptr, options), LX_OK);
      EXPECT_EQ(get(one.name), options == 0 ? one.result : "11");
      LXTerm();
    }
  }
}

// Names in UCS-2 need code page 367, which the built-in objects do not have: the name counts as empty.
TEST(GetLocale, OnBuiltInObjectsAlone) {
  Session session("/does/not/exist");
  EXPECT_EQ(get("German_Germany.Latin1@x", LX_GET_SUBSTITUTE), "English UnitedStates US-ASCII -");
  uint32_t rc = 99;
  EXPECT_EQ(LXGetLocale("English.ascii", 0, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_CODEPAGE) << "aliases come with the data";
  const LXUChar german[] = {'G', 'e', 'r', 'm', 'a', 'n', 0};
  Locale locale(LXGetLocaleU(german, 0, nullptr));
  EXPECT_EQ(parts_of(locale.get()), "English UnitedStates US-ASCII -");
  EXPECT_EQ(LXGetLocaleObject(locale.get(), 4), nullptr);
}

// ---- All of them ----------------------------------------------------------------------------------------------------

template <class Unit>
int32_t note(void* context, uint8_t type, const Unit* name) {
  auto& [left, text] = *static_cast<std::pair<int, std::string>*>(context);
  text += std::to_string(type) + ":";
  for (; *name != 0; ++name) text += static_cast<char>(*name);
  text += " ";
  return --left > 0 ? 1 : 0;
}

// In all kinds of text, at most so many.
std::string listed(int most) {
  std::pair<int, std::string> plain(most, ""), wide = plain, ucs2 = plain;
  EXPECT_EQ(LXEnumLocales(note<char>, &plain, 0), 0);
  EXPECT_EQ(LXEnumLocalesW(note<LXWChar>, &wide, 0), 0);
  EXPECT_EQ(LXEnumLocalesU(note<LXUChar>, &ucs2, 0), 0);
  EXPECT_EQ(wide.second, plain.second);
  EXPECT_EQ(ucs2.second, plain.second);
  return plain.second;
}

TEST_F(SmallDirectory, EnumeratedInItsOrder) {
  EXPECT_EQ(listed(1), "") << "before the start";
  Session session(directory_.path());
  EXPECT_EQ(listed(99),
            "0:English 0:German 1:UnitedStates 1:Germany 2:US-ASCII 2:Small 2:Mixed 2:OldSmall 2:OldSingle ");
  EXPECT_EQ(listed(3), "0:English 0:German 1:UnitedStates ");
  EXPECT_EQ(LXEnumLocales(nullptr, nullptr, 0), 0);
}

}  // namespace
}  // namespace lx::test
