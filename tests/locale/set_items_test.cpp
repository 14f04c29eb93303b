// SPDX-License-Identifier: Apache-2.0
// Values that are set for one locale: what is taken, what is refused, and what the locale then reports.
#include <gtest/gtest.h>

#include <tuple>

#include "support/edge_buffer.hpp"
#include "support/locale_model.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

const char* const kPages[] = {"US-ASCII", "Latin1", "UTF-8", "MS932", "IBM037", "IBM930"};
constexpr uint32_t kSeparators[] = {59, 60, 61, 66, 67};
constexpr uint32_t kStrings[] = {62, 64, 68, 71, 72, 79, 80, 81};

// A locale and what it must report.
struct Pair {
  explicit Pair(const char* page)
      : model("German", "Germany", page), locale(LXGetLocale(model.name().c_str(), 0, nullptr)) {}
  LocaleModel model;
  Locale locale;
  uint32_t error() const { return LXGetError(locale.get()); }
};

class SetItems : public testing::TestWithParam<const char*> {
 protected:
  // The text, given in a form and perhaps terminated.
  void set(Pair& pair, const TextForm& form, uint32_t item, const Units& text, int32_t length, uint32_t options,
           uint32_t error) {
    const char* at = edge_.text(form.raw(text));
    EXPECT_EQ(form.set(pair.locale.get(), item, at, length, options), error == LX_OK ? 1 : 0) << form.name << item;
    EXPECT_EQ(pair.error(), error) << form.name << item;
  }
  Session session_;
  EdgeBuffer edge_{4096};
};
INSTANTIATE_TEST_SUITE_P(OnPages, SetItems, testing::ValuesIn(kPages));

// What comes of a text that is given in that form.
std::u16string arriving(const TextForm& form, const PageSource& own, std::u16string text) {
  const PageSource& page = form.page != nullptr ? *form.page : own;
  for (char16_t& c : text) c = form.kind == Form::ucs2 ? c : char16_t{page.decode(page.encode(c))};
  return text;
}

// ---- Numbers --------------------------------------------------------------------------------------------------------

TEST(SetItemsOf, Numbers) {
  const struct {
    std::vector<uint32_t> items;
    std::vector<int32_t> good, bad;
    uint32_t error;
  } cases[] = {
      {{63, 69, 70}, {1, 65535, 65536 + 9, -1}, {}, 0},
      {{73, 74, 75, 76, 82, 83}, {0, 1}, {-1, 2, 65537}, LX_E_NOTFOUND},
      {{77, 78}, {0, 4}, {-1, 5, 65536}, LX_E_NOTFOUND},
      {{1}, {11, 2}, {0, 3000, -1, 65536 + 1}, LX_E_NOTFOUND},
      {{5}, {392, 276}, {0, 3000, 65536 + 276}, LX_E_NOTFOUND},
      {{9}, {930, 819}, {0, 1200, 65536 + 819}, LX_E_NOTFOUND},
      {{11}, {0}, {9999, -1, 65536}, LX_E_NOTFOUND},
      {{0, 2, 58, 59, 62, 84, 85, 86, 87, 88, 89, 65536 + 63, 0xFFFFFFFF}, {}, {0, 1}, LX_E_ITEM},
  };
  Session session;
  Pair pair("Latin1");
  LXLocale* locale = pair.locale.get();
  for (const auto& one : cases) {
    for (uint32_t item : one.items) {
      for (int32_t value : one.good) {
        EXPECT_EQ(LXSetLocaleNumInfo(locale, item, value), 1) << item << " " << value;
        const auto kept = static_cast<uint16_t>(value);
        if (item >= 63) pair.model.numbers[item] = kept;
        if (item == 1) pair.model.language = &LocaleSource::of(LX_LANGUAGE, LocaleSource::name_of(LX_LANGUAGE, kept));
        if (item == 5) pair.model.set_territory(LocaleSource::name_of(LX_TERRITORY, kept));
        if (item == 9) pair.model.page = &PageSource::of(kept);
        EXPECT_EQ(pair.model.difference(locale), "") << item << " " << value;
      }
      for (int32_t value : one.bad) {
        EXPECT_EQ(LXSetLocaleNumInfo(locale, item, value), 0) << item << " " << value;
        EXPECT_EQ(pair.error(), one.error) << item << " " << value;
      }
      EXPECT_EQ(pair.model.difference(locale), "") << item;
    }
  }
}

// ---- Strings --------------------------------------------------------------------------------------------------------

// Each text once in each form, with a length and terminated; what the locale reports is read in all forms.
TEST_P(SetItems, Strings) {
  const std::u16string texts[] = {
      u"7;0", u"Fr.", u"x", u"%H\u00E9\u00A3%M", u"\u5186\u30AB\u30CA ab\u6708z", std::u16string(60, u'y'), u"-"};
  Pair pair(GetParam());
  for (const TextForm& form : text_forms()) {
    const PageSource& own = *pair.model.page;
    for (size_t i = 0; i < std::size(kStrings) * std::size(texts); ++i) {
      const uint32_t item = kStrings[i % std::size(kStrings)];
      const std::u16string& text = texts[i % std::size(texts)];
      Units units = form.spell(own, text);
      if (form.kind == Form::plain && own.mixed() && units.size() != text.size()) continue;
      const bool characters = i % 3 == 1, terminated = i % 3 == 2;
      if (terminated) units.push_back(0);
      const auto given = terminated ? -1 : static_cast<int32_t>(characters ? text.size() : units.size());
      set(pair, form, item, units, given, characters ? LX_OPT_CHARS : 0, LX_OK);
      pair.model.texts[item] = pair.model.through_page(arriving(form, own, text));
      ASSERT_EQ(pair.model.text_difference(pair.locale.get(), item, text.size() < 20 && i % 2 == 0), "")
          << "set through " << form.name;
    }
    ASSERT_EQ(pair.model.difference(pair.locale.get()), "") << "set through " << form.name;
  }
}

TEST(SetItemsOf, LengthInsideACharacter) {
  Session session;
  EdgeBuffer edge(16);
  for (auto [page, bytes, kept] :
       {std::tuple("MS932", "A\x89", "A"), {"UTF-8", "\xE5\x86\x86\xE5\x86", "\xE5\x86\x86"}, {"MS932", "\x89", ""}}) {
    Locale locale = locale_of(page);
    const auto length = static_cast<int32_t>(std::strlen(bytes));
    EXPECT_EQ(LXSetLocaleTextInfo(locale.get(), 64, edge.text(bytes), length, 0), 1);
    char text[8];
    EXPECT_GT(LXGetLocaleTextInfo(locale.get(), 64, text, sizeof text, 0), 0);
    EXPECT_STREQ(text, kept);
  }
}

// ---- Separators -----------------------------------------------------------------------------------------------------

// The rules, byte for byte. The partner of a separator is the one of the same kind of number.
bool takes(const LocaleModel& model, uint32_t item, uint8_t byte) {
  const PageSource& page = *model.page;
  if (page.lengths[byte] != 1) return false;
  if (item == 61) return true;
  const uint8_t zero = page.ascii_family ? 0x30 : 0xF0;
  if (byte >= zero && byte <= zero + 9) return false;
  if (byte == 0) return item == 60 || item == 67;
  const uint32_t partner = item == 59 ? 60 : item == 60 ? 59 : item == 66 ? 67 : 66;
  const std::u16string other = *model.text(partner);
  return other.empty() || page.encode(other[0]) != std::string(1, static_cast<char>(byte));
}

TEST_P(SetItems, SeparatorsOfAllBytes) {
  Pair pair(GetParam());
  const PageSource& page = *pair.model.page;
  const std::vector<TextForm> forms = text_forms(false);
  for (uint32_t item : kSeparators) {
    for (unsigned byte = 0; byte < 256; ++byte) {
      const uint16_t unicode = page.decode(std::string(1, static_cast<char>(byte)));
      if (unicode == kNoCharacter && page.lengths[byte] == 1) continue;  // nothing reads it back
      if (page.mixed() && (byte == page.enter || byte == page.leave)) continue;
      const bool taken = takes(pair.model, item, static_cast<uint8_t>(byte));
      set(pair, forms[byte % 2], item, {byte}, 1, 0, taken ? LX_OK : LX_E_NOTFOUND);
      if (taken) pair.model.texts[item] = unicode == 0 ? u"" : std::u16string(1, unicode);
      ASSERT_EQ(pair.model.text_difference(pair.locale.get(), item, byte == 0), "") << item << " byte " << byte;
    }
    ASSERT_EQ(pair.model.difference(pair.locale.get()), "") << item;
  }
}

// A text in another encoding is first brought into the page; of several characters the first is taken.
TEST_P(SetItems, SeparatorsInOtherForms) {
  for (uint32_t item : kSeparators) {
    Pair pair(GetParam());
    const PageSource& own = *pair.model.page;
    for (const char16_t* text : {u"#\u6708", u" ", u"5", u"\uFF0C", u"\u00B7"}) {
      for (const TextForm& form : text_forms()) {
        const std::u16string first = arriving(form, own, {*text});
        const std::string code = own.encode(first[0]);
        if (own.mixed() && code.size() > 1) continue;  // there, each of its bytes is one
        const Units units = form.spell(own, text);
        const bool taken = code.size() == 1 && takes(pair.model, item, static_cast<uint8_t>(code[0]));
        set(pair, form, item, units, static_cast<int32_t>(units.size()), 0, taken ? LX_OK : LX_E_NOTFOUND);
        if (taken) pair.model.texts[item] = pair.model.through_page(first);
        ASSERT_EQ(pair.model.text_difference(pair.locale.get(), item), "") << item << form.name << code;
      }
    }
  }
}

// ---- Objects by name ------------------------------------------------------------------------------------------------

TEST_P(SetItems, Names) {
  const struct {
    uint32_t item;
    std::u16string name;
    const char* found;  // null: there is none
  } cases[] = {
      {2, u"gERMAN", "German"},
      {2, u"Germ", nullptr},
      {6, u"German-sWITZERLAND", "German-Switzerland"},
      {6, u"\u6708", nullptr},
      {6, std::u16string(300, u'x'), nullptr},
      {10, u"ascii", nullptr},  // aliases are for the names of locales
      {12, u"BINARY", ""},
      {12, u"NoSuchSort", nullptr},
      {10, u"mS932", "MS932"},
  };
  for (const TextForm& form : text_forms()) {
    Pair pair(GetParam());
    for (const auto& [item, name, found] : cases) {
      const Units units = form.spell(*pair.model.page, name);
      set(pair, form, item, units, static_cast<int32_t>(units.size()), 0, found != nullptr ? LX_OK : LX_E_NOTFOUND);
      if (found != nullptr && item == 2) pair.model.language = &LocaleSource::of(LX_LANGUAGE, found);
      if (found != nullptr && item == 6) pair.model.set_territory(found);
      if (found != nullptr && item == 10) pair.model.set_page(found);
      ASSERT_EQ(pair.model.text_difference(pair.locale.get(), LX_ITEM_LOCALE_NAME), "") << form.name << item;
    }
    EXPECT_EQ(pair.model.difference(pair.locale.get()), "") << form.name;
  }
}

// ---- Arguments ------------------------------------------------------------------------------------------------------

TEST_P(SetItems, RefusedArguments) {
  Pair pair(GetParam());
  LXLocale* locale = pair.locale.get();
  for (const TextForm& form : text_forms()) {
    const Units sign = form.spell(*pair.model.page, u"#");
    set(pair, form, 64, sign, 1, 0x4001, LX_E_ARGUMENT);
    for (uint32_t item : {0u, 1u, 16u, 58u, 63u, 73u, 88u, 89u, ~0u}) set(pair, form, item, sign, 1, 0, LX_E_ITEM);
    for (uint32_t item : {2u, 59u, 64u, 999u}) {  // nothing is nothing, whatever the item
      set(pair, form, item, Units{}, 0, LX_OPT_CHARS, LX_OK);
      set(pair, form, item, Units{0}, -1, 0, LX_OK);
    }
    EXPECT_EQ(form.set(locale, 64, nullptr, 1, 0), 0);
    EXPECT_EQ(form.set(nullptr, 64, form.raw(sign).data(), 1, 0), 0) << "no default locale";
  }
  EXPECT_EQ(LXSetLocaleTextInfoEx(locale, 64, "x", 1, LXGetLocaleObject(locale, LX_TERRITORY), 0), 0);
  EXPECT_EQ(pair.model.difference(locale), "");
}

}  // namespace
}  // namespace lx::test
