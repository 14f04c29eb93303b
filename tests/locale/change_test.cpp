// SPDX-License-Identifier: Apache-2.0
// Locales that get another territory or code page.
#include <gtest/gtest.h>

#include "support/locale_model.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

LXObjEntry* entry(uint8_t type, std::string_view name) {
  return LXGetObjFromName(LXGetObjManager(), type, name.data(), static_cast<int32_t>(name.size()), 0, nullptr);
}

// The ways to the same change: by id, by name in the current page, by the object.
enum class Way { id, name, object };

class Changing {
 public:
  explicit Changing(const LocaleModel& start) : model(start), locale(LXGetLocale(start.name().c_str(), 0, nullptr)) {}

  void set_text(uint32_t item, std::u16string_view text) {
    LXUChar units[64] = {};
    std::copy(text.begin(), text.end(), units);
    EXPECT_EQ(LXSetLocaleTextInfoU(locale.get(), item, units, static_cast<int32_t>(text.size()), 0), 1) << item;
    model.texts[item] = model.through_page(text);
  }
  void set_number(uint32_t item, int32_t value) {
    EXPECT_EQ(LXSetLocaleNumInfo(locale.get(), item, value), 1) << item;
    model.numbers[item] = value;
  }
  void change(uint8_t type, const std::string& name) {
    SCOPED_TRACE(model.name() + " to " + name);
    const bool territory = type == LX_TERRITORY;
    switch (way_) {
      case Way::id:
        EXPECT_EQ(LXSetLocaleNumInfo(locale.get(), territory ? 5 : 9, LocaleSource::id_of(type, name)), 1);
        break;
      case Way::name: {
        static const std::vector<TextForm> forms = text_forms(false);
        const TextForm& form = forms[++names_ % forms.size()];
        Units units = form.spell(*model.page, std::u16string(name.begin(), name.end()));
        units.push_back(0);
        EXPECT_EQ(form.set(locale.get(), territory ? 6 : 10, form.raw(units).data(), -1, 0), 1) << form.name;
        break;
      }
      case Way::object:
        EXPECT_EQ(territory ? LXLocaleChangeTerritory(locale.get(), entry(type, name))
                            : LXLocaleChangeCodePage(locale.get(), entry(type, name)),
                  LX_OK);
    }
    EXPECT_EQ(LXGetError(locale.get()), LX_OK);
    way_ = static_cast<Way>((static_cast<int>(way_) + 1) % 3);
    territory ? model.set_territory(name) : model.set_page(name);
    ASSERT_EQ(model.difference(locale.get()), "");
  }

  LocaleModel model;
  Locale locale;

 private:
  Way way_ = Way::id;
  size_t names_ = 0;
};

constexpr uint32_t kNumbers[] = {63, 69, 70, 73, 74, 75, 76, 77, 78, 82, 83};
constexpr uint32_t kStrings[] = {62, 64, 68, 71, 72, 79, 80, 81};

void set_some(Changing& one) {
  for (auto [item, text] : {std::pair(59u, u"\u00B7"), {67u, u" "}, {64u, u"\u00E9t\u00E9 \u00A3"}, {81u, u"%Y"}}) {
    one.set_text(item, text);
  }
  for (auto [item, value] : {std::pair(63u, 5), {73u, 1}, {78u, 2}}) one.set_number(item, value);
}

void set_all(Changing& one) {
  const char16_t* separators[] = {u"'", u"/", u"+", u"!", u" "};
  for (uint32_t i = 0; i < 5; ++i) one.set_text(i < 3 ? 59 + i : 63 + i, separators[i]);
  for (uint32_t item : kStrings) one.set_text(item, u"text " + std::u16string(item % 7, u'*'));
  for (uint32_t item : kNumbers) one.set_number(item, item == 77 ? 4 : item < 73 ? 9 : 1);
}

// Texts and numbers that were set stay, all others come from the new territory in the new page.
TEST(Change, ThroughPagesAndTerritories) {
  Session session;
  for (auto* set : {+[](Changing&) {}, +set_some, +set_all}) {
    Changing one(LocaleModel("German", "Germany", "Latin1"));
    set(one);
    ASSERT_EQ(one.model.difference(one.locale.get()), "");
    for (const char* page : {"UTF-8", "IBM037", "MS932", "IBM930", "US-ASCII", "JapanEUC", "Latin1"}) {
      one.change(LX_CODEPAGE, page);
      for (const char* territory : {"Japan", "Russia", "German-Switzerland", "Germany"}) {
        one.change(LX_TERRITORY, territory);
        if (HasFatalFailure()) return;
      }
    }
  }
}

// Another language, a refill and calls that are refused leave what was set.
TEST(Change, LeavesTheRest) {
  Session session;
  Changing one(LocaleModel("German", "Germany", "IBM930"));
  LXLocale* locale = one.locale.get();
  set_some(one);
  one.model.language = &LocaleSource::of(LX_LANGUAGE, "Japanese");
  EXPECT_EQ(LXSetLocaleNumInfo(locale, LX_ITEM_LANGUAGE_ID, 11), 1);
  for (int i = 0; i < 2; ++i) EXPECT_EQ(LXLocaleSetModifiable(locale), LX_OK);
  EXPECT_NE(LXLocaleChangeTerritory(locale, entry(LX_CODEPAGE, "UTF-8")), LX_OK);
  EXPECT_NE(LXLocaleChangeCodePage(locale, entry(LX_TERRITORY, "Japan")), LX_OK);
  EXPECT_NE(LXLocaleChangeCodePage(locale, nullptr), LX_OK);
  LXLocaleFreeOldText(locale, locale);
  LXLocaleFreeOldText(locale, nullptr);
  EXPECT_EQ(one.model.difference(locale), "");
}

TEST(Change, TextBetweenPages) {
  Session session;
  const char* const cases[][4] = {
      // from, to, text, result
      {"Latin1", "IBM037", "a1", "\x81\xF1"}, {"UTF-8", "US-ASCII", "\xE5\x86\x86z", "\x1Az"},
      {"US-ASCII", "US-ASCII", "", ""},       {"US-ASCII", "none", "x", nullptr},
      {"none", "US-ASCII", "x", nullptr},     {"US-ASCII", "US-ASCII", nullptr, nullptr},
  };
  for (const auto& [from, to, given, result] : cases) {
    char* text = LXLocaleCnvText(entry(LX_CODEPAGE, from), entry(LX_CODEPAGE, to), given);
    EXPECT_STREQ(text, result);
    LXUnloadFile(text);
  }
  EXPECT_EQ(LXLocaleCnvText(entry(LX_CODEPAGE, "Latin1"), entry(LX_TERRITORY, "Japan"), "x"), nullptr);
}

}  // namespace
}  // namespace lx::test
