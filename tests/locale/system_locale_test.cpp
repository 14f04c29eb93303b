// SPDX-License-Identifier: Apache-2.0
// Values that the operating system defines for its locales. Some of these are made here, under the names that the
// library knows, with the system's own tool.
#include <gtest/gtest.h>

#include <climits>
#include <clocale>

#include "support/environment.hpp"
#include "support/locale_model.hpp"
#include "support/session.hpp"
#include "support/system_locales.hpp"
#include "support/trace_capture.hpp"

namespace lx::test {
namespace {

const struct {
  SystemLocale system;
  const char *language, *territory, *page;
} kLocales[] = {
    {{"de_CH", "de_CH", "ISO-8859-1"}, "German", "German-Switzerland", "Latin1"},
    {{"de", "de_DE", "ISO-8859-1"}, "German", "Germany", "Latin1"},
    {{"ru", "ru_RU", "ISO-8859-5"}, "Russian", "Russia", "ISO-8859-5"},
    {{"ja", "ja_JP", "EUC-JP"}, "Japanese", "Japan", "JapanEUC"},
};

std::string grouping_text(const char* sizes) {
  std::string text;
  for (; *sizes != '\0' && *sizes != CHAR_MAX; ++sizes) text += std::to_string(int{*sizes}) + ";";
  return text + "0";
}

// What the system says goes over what the territory says. Texts only when the locale has the system's code page;
// separators only of one byte.
void take_system_values(LocaleModel& model, const char* native, bool same_page) {
  const std::string before = std::setlocale(LC_ALL, nullptr);
  ASSERT_NE(std::setlocale(LC_ALL, native), nullptr);
  const lconv& system = *std::localeconv();
  const std::pair<uint32_t, char> numbers[] = {
      {69, system.frac_digits},   {70, system.int_frac_digits}, {73, system.p_cs_precedes}, {74, system.p_sep_by_space},
      {75, system.n_cs_precedes}, {76, system.n_sep_by_space},  {77, system.p_sign_posn},   {78, system.n_sign_posn}};
  for (auto [item, value] : numbers) {
    if (value != CHAR_MAX) model.numbers[item] = item >= 73 && item <= 76 ? value != 0 : value;
  }
  const std::pair<uint32_t, const char*> groupings[] = {{62, system.grouping}, {68, system.mon_grouping}};
  for (auto [item, sizes] : groupings) {
    if (*sizes != '\0') model.texts[item] = utf16(grouping_text(sizes));
  }
  const std::pair<uint32_t, std::string_view> texts[] = {{59, system.decimal_point},     {60, system.thousands_sep},
                                                         {66, system.mon_decimal_point}, {67, system.mon_thousands_sep},
                                                         {64, system.currency_symbol},   {71, system.positive_sign},
                                                         {72, system.negative_sign}};
  for (auto [item, bytes] : texts) {
    if (!same_page || bytes.empty() || (is_separator(item) && bytes.size() != 1)) continue;
    std::u16string text;
    for (; !bytes.empty(); bytes.remove_prefix(model.page->length_of(static_cast<uint8_t>(bytes[0])))) {
      size_t length = model.page->length_of(static_cast<uint8_t>(bytes[0]));
      text += static_cast<char16_t>(model.page->decode(bytes.substr(0, length)));
    }
    model.texts[item] = text;
  }
  std::setlocale(LC_ALL, before.c_str());
}

// The models know no sorts.
void binary(Locale& locale) { EXPECT_EQ(LXSetLocaleNumInfo(locale.get(), LX_ITEM_SORT_ID, 0), 1); }

class SystemValues : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    std::vector<SystemLocale> wanted;
    for (const auto& one : kLocales) wanted.push_back(one.system);
    system_ = new SystemLocales(wanted);
  }
  static void TearDownTestSuite() { delete system_; }
  void SetUp() override {
    if (!system_->made()) GTEST_SKIP() << "localedef or the sources of the system's locales are missing";
  }
  void TearDown() override { std::setlocale(LC_ALL, "C"); }

  static inline SystemLocales* system_;
  Variable lx_lang_{"LX_LANG", nullptr};
  Variable lc_all_{"LC_ALL", nullptr};
  Session session_;
};

TEST_F(SystemValues, GiveTheirValues) {
  ASSERT_NE(std::setlocale(LC_ALL, "ja"), nullptr);
  for (const auto& one : kLocales) {
    SCOPED_TRACE(one.system.native);
    LocaleModel model(one.language, one.territory, one.page);
    take_system_values(model, one.system.native, true);
    lc_all_.set(one.system.native);
    for (bool user : {false, true}) {
      Locale locale(user ? LXGetLocale("", LX_GET_USER | LX_GET_SUBSTITUTE, nullptr)
                         : LXConvertNativeLocale(one.system.native, LX_GET_SUBSTITUTE, nullptr));
      binary(locale);
      EXPECT_EQ(model.difference(locale.get()), "");
      EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "ja");
    }
  }
}

// What cannot be restored is not touched.
TEST_F(SystemValues, NameTooLongToBeSaved) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  const std::string name(100, 'x');
  system_->add_name("de", name);
  ASSERT_NE(std::setlocale(LC_ALL, name.c_str()), nullptr);
  ASSERT_NE(std::setlocale(LC_MONETARY, "ru"), nullptr);
  const std::string before = std::setlocale(LC_ALL, nullptr);
  ASSERT_GE(before.size(), 1024u);
  TraceCapture trace;
  Locale converted(LXConvertNativeLocale("ja", LX_GET_SUBSTITUTE, nullptr));
  EXPECT_TRUE(trace.has("Unable to save current locale to restore. len " + std::to_string(before.size()) + " > 1024 '" +
                        before + "'"));
  EXPECT_EQ(LocaleModel("Japanese", "Japan", "JapanEUC").difference(converted.get()), "");
  Locale of_user(LXGetLocale("German", LX_GET_USER, nullptr));
  binary(of_user);
  EXPECT_EQ(LocaleModel("English", "UnitedStates", "Latin1").difference(of_user.get()), "");
  EXPECT_EQ(std::setlocale(LC_ALL, nullptr), before);
}

// In another code page numbers and groupings are still good; those of the host code pages have their own digits.
TEST_F(SystemValues, OnOtherPages) {
  for (const char* page : {"UTF-8", "IBM037", "IBM930", "JapanEUC"}) {
    for (const auto& one : kLocales) {
      LocaleModel model("English", "UnitedStates", page);
      Locale locale(LXGetLocale(model.name().c_str(), 0, nullptr));
      take_system_values(model, one.system.native, std::string_view(page) == one.page);
      LXMapNativeInfo(one.system.native, locale.get(), 0);
      EXPECT_EQ(model.difference(locale.get()), "") << one.system.native;
      LXMapNativeInfo("xx_YY", locale.get(), 1);
      LXMapNativeInfo(nullptr, locale.get(), 0);
      EXPECT_EQ(model.difference(locale.get()), "") << "unknown names change nothing";
    }
  }
}

// Texts are set as by the caller; separators and numbers are not, and go with the territory.
TEST_F(SystemValues, ChangeOfTheTerritory) {
  if (!kSystemHasLocales) GTEST_SKIP() << kOneLocale;
  Locale locale(LXConvertNativeLocale("ru", LX_GET_SUBSTITUTE, nullptr));
  binary(locale);
  LocaleModel model("Russian", "Russia", "ISO-8859-5");
  take_system_values(model, "ru", true);
  ASSERT_TRUE(model.texts.contains(60) && model.texts.contains(64) && model.texts.contains(72));
  for (uint32_t item : {59u, 60u, 66u, 67u}) model.texts.erase(item);
  model.numbers.clear();
  model.set_territory("German-Switzerland");
  EXPECT_EQ(LXSetLocaleNumInfo(locale.get(), LX_ITEM_TERRITORY_ID, 756), 1);
  EXPECT_EQ(model.difference(locale.get()), "");
}

}  // namespace
}  // namespace lx::test
