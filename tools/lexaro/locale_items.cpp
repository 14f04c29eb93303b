// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/locale_items.hpp"

#include "tools/lexaro/terminal_text.hpp"

namespace lx::tool {
namespace {

LocaleItem number(uint32_t item, const char* name) { return {item, name, true}; }
LocaleItem text(uint32_t item, const char* name) { return {item, name, false}; }

// Items of consecutive numbers: "day.sunday", "day.monday" ...
ItemGroup days(const char* title, const std::string& prefix, uint32_t first) {
  ItemGroup group{title, {}};
  for (const char* day : {"sunday", "monday", "tuesday", "wednesday", "thursday", "friday", "saturday"}) {
    group.items.push_back({first++, prefix + day, false});
  }
  return group;
}

ItemGroup months(const char* title, const std::string& prefix, uint32_t first) {
  ItemGroup group{title, {}};
  for (uint32_t i = 0; i < 13; ++i) group.items.push_back({first + i, prefix + std::to_string(i + 1), false});
  return group;
}

std::vector<ItemGroup> make_groups() {
  return {
      {"Locale", {text(LX_ITEM_LOCALE_NAME, "locale")}},
      {"Language",
       {number(LX_ITEM_LANGUAGE_ID, "language.id"), text(LX_ITEM_LANGUAGE_NAME, "language.name"),
        text(LX_ITEM_LANGUAGE_ABBREVIATION, "language.abbreviation"),
        text(LX_ITEM_LANGUAGE_OWN_NAME, "language.own_name"), text(LX_ITEM_DEFAULT_TERRITORY, "default.territory"),
        text(LX_ITEM_DEFAULT_CODEPAGE, "default.codepage"), text(LX_ITEM_DEFAULT_SORT, "default.sort")}},
      {"Territory",
       {number(LX_ITEM_TERRITORY_ID, "territory.id"), text(LX_ITEM_TERRITORY_NAME, "territory.name"),
        text(LX_ITEM_TERRITORY_ABBREVIATION, "territory.abbreviation"),
        text(LX_ITEM_TERRITORY_OWN_NAME, "territory.own_name"), number(LX_ITEM_TERRITORY_FLAG, "territory.flag"),
        number(LX_ITEM_TERRITORY_VALUE, "territory.value")}},
      {"Code page",
       {number(LX_ITEM_CODEPAGE_ID, "codepage.id"), text(LX_ITEM_CODEPAGE_NAME, "codepage.name"),
        number(LX_ITEM_MAX_CHAR_LENGTH, "codepage.max_length"), number(LX_ITEM_ASCII_FAMILY, "codepage.ascii_family"),
        number(LX_ITEM_SHIFT_SENSITIVE, "codepage.shift_sensitive")}},
      {"Sort", {number(LX_ITEM_SORT_ID, "sort.id"), text(LX_ITEM_SORT_NAME, "sort.name")}},
      days("Days", "day.", LX_ITEM_DAY_1),
      days("Days, abbreviated", "abday.", LX_ITEM_ABDAY_1),
      months("Months", "month.", LX_ITEM_MON_1),
      months("Months, abbreviated", "abmonth.", LX_ITEM_ABMON_1),
      {"Time and date",
       {text(LX_ITEM_AM, "am"), text(LX_ITEM_PM, "pm"), text(LX_ITEM_TIME_FORMAT, "time"),
        text(LX_ITEM_SHORT_DATE, "short_date"), text(LX_ITEM_LONG_DATE, "long_date")}},
      {"Numbers",
       {text(LX_ITEM_DECIMAL, "decimal"), text(LX_ITEM_THOUSANDS, "thousands"), text(LX_ITEM_LIST, "list"),
        text(LX_ITEM_GROUPING, "grouping"), number(LX_ITEM_FRACTION_DIGITS, "fraction_digits"),
        number(LX_ITEM_FLAG_82, "flag.82"), number(LX_ITEM_FLAG_83, "flag.83")}},
      {"Currency",
       {text(LX_ITEM_CURRENCY, "currency"), text(LX_ITEM_CURRENCY_INTL, "currency_intl"),
        text(LX_ITEM_MON_DECIMAL, "mon_decimal"), text(LX_ITEM_MON_THOUSANDS, "mon_thousands"),
        text(LX_ITEM_MON_GROUPING, "mon_grouping"), number(LX_ITEM_CURRENCY_DIGITS, "currency_digits"),
        number(LX_ITEM_CURRENCY_INTL_DIGITS, "currency_intl_digits"), text(LX_ITEM_POSITIVE_SIGN, "positive_sign"),
        text(LX_ITEM_NEGATIVE_SIGN, "negative_sign"), number(LX_ITEM_P_CS_PRECEDES, "p_cs_precedes"),
        number(LX_ITEM_P_SEP_BY_SPACE, "p_sep_by_space"), number(LX_ITEM_N_CS_PRECEDES, "n_cs_precedes"),
        number(LX_ITEM_N_SEP_BY_SPACE, "n_sep_by_space"), number(LX_ITEM_P_SIGN_POSN, "p_sign_posn"),
        number(LX_ITEM_N_SIGN_POSN, "n_sign_posn")}},
  };
}

constexpr std::size_t kMostUnits = 65536;

}  // namespace

const std::vector<ItemGroup>& item_groups() {
  static const std::vector<ItemGroup> groups = make_groups();
  return groups;
}

const LocaleItem* find_item(const std::string& wanted) {
  for (const ItemGroup& group : item_groups()) {
    for (const LocaleItem& item : group.items) {
      if (item.name == wanted || std::to_string(item.number) == wanted) return &item;
    }
  }
  return nullptr;
}

ItemValue read_item(LXLocale* locale, const LocaleItem& item, ValueSource source) {
  ItemValue value;
  if (item.is_number) {
    value.number = LXGetLocaleNumInfo(locale, item.number, source == ValueSource::kTerritory ? 1 : 0);
    value.status = LXGetError(locale);
    return value;
  }
  // Text is cut to the room without a word, so there must be room to spare.
  std::vector<LXUChar> units(64);
  for (;;) {
    const auto room = static_cast<int32_t>(units.size());
    const int32_t count = LXGetLocaleTextInfoU(locale, item.number, units.data(), room,
                                               source == ValueSource::kTerritory ? LX_OPT_OBJECT : 0);
    if (count < 0) {
      value.status = LXGetError(locale);
      return value;
    }
    if (count < room || units.size() >= kMostUnits) {
      units.resize(count == 0 ? 0 : static_cast<std::size_t>(count) - 1);
      value.text = utf8_of(units);
      return value;
    }
    units.resize(units.size() * 4);
  }
}

std::string read_text(LXLocale* locale, uint32_t number, ValueSource source) {
  return read_item(locale, text_item(number), source).text;
}

}  // namespace lx::tool
