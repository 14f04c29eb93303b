// SPDX-License-Identifier: Apache-2.0
// What the system's locale names mean here, and the system's names for locales.
#include <gtest/gtest.h>

#include <algorithm>
#include <set>

#include "locale/native_rows.hpp"
#include "support/locale_source.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

// ---- From names of the system ---------------------------------------------------------------------------------------

TEST(NativeNames, Mapped) {
  struct Case {
    const char* native;
    std::string name;
  };
  std::vector<Case> cases = {{"en_US.UTF-8", "Unknown"},  // though it is the system's name for that locale
                             {"", "Unknown"},
                             {"DE", "Unknown"},
                             {"de_", "Unknown"},
                             {"en_US.utf-8x", "Unknown"},
                             {"LC_CTYPE=C;LC_NUMERIC=de_CH", "Unknown"},
                             // A name for each category: code page, territory, language, sort.
                             {"/ja/C/de/C/C/C", "German_UnitedStates.JapanEUC@Binary"},
                             {"/en_US.utf-8/ja_JP.PCK/ko.UTF-8/et", "Korean_Japan.UTF-8@Czech"},
                             {"/ja/C/de", "German_UnitedStates.JapanEUC@Unknown"},
                             {"/ja", "Unknown_Unknown.JapanEUC@Unknown"},
                             {"//C//C", "Unknown_UnitedStates.Unknown@Binary"},
                             {"/japanesex/C/d/C", "Unknown_UnitedStates.Unknown@Binary"}};
  for (const NativeRow& row : kNativeRows) cases.push_back({row.native, row.locale_name()});
  for (const Case& one : cases) {
    for (size_t size = 1; size <= one.name.size() + 2; ++size) {
      Guarded buffer(size);
      EXPECT_EQ(LXMapNativeLocale(one.native, buffer.data(), static_cast<int32_t>(size)), buffer.data());
      EXPECT_EQ(std::string(buffer.data()), one.name.substr(0, size - 1)) << one.native;
    }
  }
  char kept[] = "kept";
  EXPECT_EQ(LXMapNativeLocale("C", kept, 0), kept);
  EXPECT_EQ(LXMapNativeLocale("C", kept, -1), kept);
  EXPECT_STREQ(kept, "kept");
}

TEST(NativeNames, Listed) {
  using Names = std::vector<std::string>;
  auto note = [](void* context, const char* native, const char* name) -> int32_t {
    auto& names = *static_cast<Names*>(context);
    names.push_back(std::string(native) + "=" + name);
    return names.size() != 2 && names.size() != 62;  // stops at two, and goes on from there
  };
  Names names, wanted;
  for (size_t count : {2u, 62u}) {
    EXPECT_EQ(LXEnumNativeNames(note, &names), 0);
    for (const NativeRow& row : kNativeRows) {
      if (wanted.size() < count) wanted.push_back(row.native + std::string("=") + row.locale_name());
    }
    EXPECT_EQ(names, wanted);
  }
}

// ---- To names of the system -----------------------------------------------------------------------------------------

struct IdRow {
  int32_t ids[4];  // language, territory, code page, sort
  const char* native;
};
constexpr IdRow kIdRows[] = {
    {{1, 840, 367, 0}, "C"},           {{1, 840, 819, 1}, "en_US"},  {{1, 840, 57352, 1}, "en_US.UTF-8"},
    {{1, 36, 819, 1}, "en_AU"},        {{1, 124, 819, 1}, "en_CA"},  {{1, 826, 819, 1}, "en_UK"},
    {{2, 40, 819, 1}, "de_AT"},        {{2, 276, 819, 1}, "de"},     {{2, 756, 819, 1}, "de_CH"},
    {{3, 57, 819, 1}, "fr_BE"},        {{3, 250, 819, 1}, "fr"},     {{3, 757, 819, 1}, "fr_CH"},
    {{4, 724, 819, 2}, "es"},          {{4, 32, 819, 2}, "es_AR"},   {{4, 152, 819, 2}, "es_CL"},
    {{4, 484, 819, 2}, "es_MX"},       {{5, 380, 819, 1}, "it"},     {{6, 76, 819, 1}, "pt_BR"},
    {{6, 620, 819, 1}, "pt"},          {{7, 578, 819, 4}, "no"},     {{8, 752, 819, 5}, "sv"},
    {{9, 208, 819, 4}, "da"},          {{10, 246, 819, 6}, "su"},    {{11, 392, 954, 0}, "ja"},
    {{11, 392, 932, 0}, "ja_JP.PCK"},  {{12, 125, 819, 1}, "fr_CA"}, {{13, 158, 964, 0}, "zh_TW"},
    {{13, 158, 949, 0}, "zh_TW.BIG5"}, {{14, 156, 936, 0}, "zh"},    {{21, 203, 912, 8}, "cz"},
    {{22, 56, 819, 1}, "nl_BE"},       {{22, 528, 819, 1}, "nl"},    {{23, 233, 819, 9}, "et"},
    {{25, 300, 813, 1}, "el"},         {{27, 348, 912, 10}, "hu"},   {{28, 410, 57352, 0}, "ko.UTF-8"},
    {{28, 410, 949, 0}, "ko"},         {{29, 428, 57346, 11}, "lv"}, {{30, 442, 57346, 12}, "lt"},
    {{33, 643, 915, 1}, "ru"},         {{39, 792, 920, 17}, "tr"},
};

class NativeLocales : public testing::Test {
 protected:
  Session session_;
};

std::string full_name(LXLocale* locale) {
  char name[136];
  return LXLocaleGetLocaleString(locale, name) > 0 ? name : "";
}

TEST_F(NativeLocales, FromAllNames) {
  for (const NativeRow& row : kNativeRows) {
    for (uint32_t options : {0u, LX_NATIVE_INFO, LX_GET_SUBSTITUTE, LX_NATIVE_INFO | LX_GET_SUBSTITUTE}) {
      uint32_t rc = 99;
      Locale locale(LXConvertNativeLocale(row.native, options, &rc));
      ASSERT_NE(locale, nullptr) << row.native << rc;
      EXPECT_EQ(rc, LX_OK);
      EXPECT_EQ(full_name(locale.get()), row.locale_name());
    }
  }
  const std::string english = "English_UnitedStates.Latin1@";
  for (const auto& [unknown, sort] : {std::pair("en_US.UTF-8", "Default"), {"", "Default"}, {"/xx/C/xx/C", "Binary"}}) {
    uint32_t rc = 99;
    EXPECT_EQ(LXConvertNativeLocale(unknown, 0, &rc), nullptr);
    EXPECT_EQ(rc, LX_E_LANGUAGE) << unknown;
    Locale locale(LXConvertNativeLocale(unknown, LX_GET_SUBSTITUTE, &rc));
    EXPECT_EQ(full_name(locale.get()), english + sort) << unknown;
  }
  uint32_t rc = 99;
  EXPECT_EQ(LXConvertNativeLocale("C", LX_GET_USER, &rc), nullptr);
  EXPECT_EQ(rc, LX_E_ARGUMENT);
}

// The row that a locale has, or with substitution the nearest: the first that agrees in as many parts, from the left.
const char* native_name(const int32_t (&ids)[4], bool substitute) {
  std::vector<const IdRow*> rows;
  for (const IdRow& row : kIdRows) rows.push_back(&row);
  for (size_t part = 0; part < 4; ++part) {
    const IdRow* first = rows[0];
    std::erase_if(rows, [&](const IdRow* row) { return row->ids[part] != ids[part]; });
    if (rows.empty()) return substitute ? first->native : nullptr;
  }
  return rows[0]->native;
}

std::string converted(LXLocale* locale, uint32_t options) {
  Guarded buffer(12);
  if (LXConvertLocale(locale, buffer.data(), options) == 1) {
    EXPECT_EQ(LXGetError(locale), LX_OK);
    return buffer.data();
  }
  return std::to_string(LXGetError(locale));
}

TEST_F(NativeLocales, ToNames) {
  std::set<int32_t> pages = {37}, sorts = {0};
  for (const IdRow& row : kIdRows) {
    pages.insert(row.ids[2]);
    sorts.insert(row.ids[3]);
  }
  Locale locale(LXGetLocale("English_UnitedStates.US-ASCII@BINARY", 0, nullptr));
  int32_t before = 0;
  for (const IdRow& row : kIdRows) {
    // All pages and sorts of the row, and once of each language a territory that it does not have.
    for (int32_t territory : {row.ids[1], row.ids[0] != before ? 372 : 0}) {
      for (int32_t page : pages) {
        for (int32_t sort : sorts) {
          if (territory == 0 || (page != row.ids[2] && sort > 1)) continue;
          const int32_t ids[4] = {row.ids[0], territory, page, sort};
          const uint32_t items[] = {1, 5, 9, 11};
          for (size_t i = 0; i < 4; ++i) ASSERT_EQ(LXSetLocaleNumInfo(locale.get(), items[i], ids[i]), 1) << ids[i];
          const char* exact = native_name(ids, false);
          for (uint32_t option : {0u, LX_NATIVE_INFO}) {
            EXPECT_EQ(converted(locale.get(), option), exact != nullptr ? exact : "32") << full_name(locale.get());
            EXPECT_EQ(converted(locale.get(), option | LX_GET_SUBSTITUTE), native_name(ids, true));
          }
        }
      }
    }
    before = row.ids[0];
  }
  EXPECT_EQ(LXSetLocaleNumInfo(locale.get(), LX_ITEM_LANGUAGE_ID, 31), 1);  // a language without any name
  EXPECT_EQ(converted(locale.get(), 0), "32");
  EXPECT_EQ(converted(locale.get(), LX_GET_SUBSTITUTE), "C");
  EXPECT_EQ(converted(locale.get(), LX_GET_USER), "2");
  ASSERT_EQ(LXSetLocale("English_UnitedStates.UTF-8@Default", 0), LX_OK);
  EXPECT_EQ(converted(nullptr, 0), "en_US.UTF-8");
}

}  // namespace
}  // namespace lx::test
