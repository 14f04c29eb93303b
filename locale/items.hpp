// SPDX-License-Identifier: Apache-2.0
// Every item that a locale knows, once: what it is, where the territory and the locale have it, and the bits that say
// who set it. Reading, setting, refilling and changing objects all go by this table.
#pragma once

#include <cstddef>

#include "objects/entry.hpp"

namespace lx {

enum class ItemKind : uint8_t {
  none,
  object_id,         // of the locale's object of type `index`
  object_name,       // its name
  default_name,      // name of the language's default object of type `index`
  language_text,     // slot `index`
  territory_text,    // text `index`; the locale has no copy
  separator,         // number `index` of the separators
  string,            // number `index` of the strings; text `given` of the territory
  number,            // number `index` of the numbers; 16 bits of the territory, any value
  position,          // number `index` of the numbers; 8 bits of the territory, 0 to 4
  yes_no,            // flag 1 << `index` of the locale, flag `given` of the territory
  territory_yes_no,  // flag `given` of the territory; the locale has no copy
  territory_number,  // 16 bits of the territory; the locale has no copy
  page_max_length,
  page_ascii_family,
  page_shift_sensitive,
  full_name,
};

struct Item {
  ItemKind kind = ItemKind::none;
  uint8_t index = 0;
  uint16_t given = 0;       // numbers: offset in the territory's section; yes_no: its flag; strings: its text
  uint32_t set_bit = 0;     // in the locale's set mask; 0: the locale has no copy of its own
  uint16_t mirror_bit = 0;  // in its mirror bits: a text that the caller gave
};

struct ItemRow {
  uint8_t number;
  Item item;

  constexpr ItemRow(unsigned item_number, ItemKind kind, unsigned index = 0, size_t given = 0, uint32_t set_bit = 0,
                    unsigned mirror_bit = 0)
      : number(static_cast<uint8_t>(item_number)),
        item{kind, static_cast<uint8_t>(index), static_cast<uint16_t>(given), set_bit,
             static_cast<uint16_t>(mirror_bit)} {}
  constexpr ItemRow(unsigned item_number, ItemKind kind, TerritoryText text) : ItemRow(item_number, kind, at(text)) {}
  constexpr ItemRow(unsigned item_number, ItemKind kind, unsigned index, TerritoryText text, uint32_t set_bit,
                    unsigned mirror_bit)
      : ItemRow(item_number, kind, index, at(text), set_bit, mirror_bit) {}

  static constexpr unsigned at(TerritoryText text) { return static_cast<unsigned>(text); }
};

// The names of days, months and designators, items 16 to 57, follow by rule.
inline constexpr ItemRow kItemRows[] = {
    {LX_ITEM_LANGUAGE_ID, ItemKind::object_id, LX_LANGUAGE},
    {LX_ITEM_LANGUAGE_NAME, ItemKind::object_name, LX_LANGUAGE},
    {LX_ITEM_LANGUAGE_ABBREVIATION, ItemKind::language_text, 0},
    {LX_ITEM_LANGUAGE_OWN_NAME, ItemKind::language_text, 1},
    {LX_ITEM_TERRITORY_ID, ItemKind::object_id, LX_TERRITORY},
    {LX_ITEM_TERRITORY_NAME, ItemKind::object_name, LX_TERRITORY},
    {LX_ITEM_TERRITORY_ABBREVIATION, ItemKind::territory_text, TerritoryText::abbreviation},
    {LX_ITEM_TERRITORY_OWN_NAME, ItemKind::territory_text, TerritoryText::own_name},
    {LX_ITEM_CODEPAGE_ID, ItemKind::object_id, LX_CODEPAGE},
    {LX_ITEM_CODEPAGE_NAME, ItemKind::object_name, LX_CODEPAGE},
    {LX_ITEM_SORT_ID, ItemKind::object_id, LX_SORT},
    {LX_ITEM_SORT_NAME, ItemKind::object_name, LX_SORT},
    {LX_ITEM_DEFAULT_TERRITORY, ItemKind::default_name, LX_TERRITORY},
    {LX_ITEM_DEFAULT_CODEPAGE, ItemKind::default_name, LX_CODEPAGE},
    {LX_ITEM_DEFAULT_SORT, ItemKind::default_name, LX_SORT},
    // and where the territory has the value, and its bits in the set mask and the mirror bits
    {LX_ITEM_TERRITORY_FLAG, ItemKind::territory_yes_no, 0, kTerritoryYesNo},
    {LX_ITEM_DECIMAL, ItemKind::separator, 0, 0, 0x800, 0x1},
    {LX_ITEM_THOUSANDS, ItemKind::separator, 1, 0, 0x1000, 0x2},
    {LX_ITEM_LIST, ItemKind::separator, 2, 0, 0x2000, 0x4},
    {LX_ITEM_MON_DECIMAL, ItemKind::separator, 3, 0, 0x4000, 0x8},
    {LX_ITEM_MON_THOUSANDS, ItemKind::separator, 4, 0, 0x8000, 0x10},
    {LX_ITEM_GROUPING, ItemKind::string, 0, TerritoryText::grouping, 0x10000, 0x20},
    {LX_ITEM_CURRENCY, ItemKind::string, 1, TerritoryText::currency, 0x20000, 0x40},
    {LX_ITEM_CURRENCY_INTL, ItemKind::territory_text, TerritoryText::currency_intl},
    {LX_ITEM_MON_GROUPING, ItemKind::string, 2, TerritoryText::monetary_grouping, 0x40000, 0x80},
    {LX_ITEM_POSITIVE_SIGN, ItemKind::string, 3, TerritoryText::positive_sign, 0x80000, 0x100},
    {LX_ITEM_NEGATIVE_SIGN, ItemKind::string, 4, TerritoryText::negative_sign, 0x100000, 0x200},
    {LX_ITEM_TIME_FORMAT, ItemKind::string, 5, TerritoryText::time_format, 0x200000, 0x400},
    {LX_ITEM_SHORT_DATE, ItemKind::string, 6, TerritoryText::short_date, 0x400000, 0x800},
    {LX_ITEM_LONG_DATE, ItemKind::string, 7, TerritoryText::long_date, 0x800000, 0x1000},
    {LX_ITEM_FRACTION_DIGITS, ItemKind::number, 0, offsetof(TerritoryHeader, fraction_digits), 0x001},
    {LX_ITEM_CURRENCY_DIGITS, ItemKind::number, 1, offsetof(TerritoryHeader, currency_digits), 0x002},
    {LX_ITEM_CURRENCY_INTL_DIGITS, ItemKind::number, 2, offsetof(TerritoryHeader, currency_intl_digits), 0x004},
    {LX_ITEM_P_SIGN_POSN, ItemKind::position, 3, offsetof(TerritoryHeader, positive_sign_position), 0x200},
    {LX_ITEM_N_SIGN_POSN, ItemKind::position, 4, offsetof(TerritoryHeader, negative_sign_position), 0x400},
    {LX_ITEM_P_CS_PRECEDES, ItemKind::yes_no, 0, kPositiveSymbolPrecedes, 0x008},
    {LX_ITEM_P_SEP_BY_SPACE, ItemKind::yes_no, 1, kPositiveSymbolSpaced, 0x010},
    {LX_ITEM_N_CS_PRECEDES, ItemKind::yes_no, 2, kNegativeSymbolPrecedes, 0x020},
    {LX_ITEM_N_SEP_BY_SPACE, ItemKind::yes_no, 3, kNegativeSymbolSpaced, 0x040},
    {LX_ITEM_FLAG_82, ItemKind::yes_no, 4, kYesNo82, 0x080},
    {LX_ITEM_FLAG_83, ItemKind::yes_no, 5, kYesNo83, 0x100},
    {LX_ITEM_TERRITORY_VALUE, ItemKind::territory_number, 0, offsetof(TerritoryHeader, value84)},
    {LX_ITEM_MAX_CHAR_LENGTH, ItemKind::page_max_length},
    {LX_ITEM_ASCII_FAMILY, ItemKind::page_ascii_family},
    {LX_ITEM_SHIFT_SENSITIVE, ItemKind::page_shift_sensitive},
    {LX_ITEM_LOCALE_NAME, ItemKind::full_name},
};

inline constexpr unsigned kItems = LX_ITEM_LOCALE_NAME + 1;
inline constexpr unsigned kFirstNameSlot = 2;  // of a language's texts; those before it are no names of days or months

struct ItemTable {
  Item items[kItems] = {};

  constexpr ItemTable() {
    for (const ItemRow& row : kItemRows) items[row.number] = row.item;
    for (unsigned i = LX_ITEM_DAY_1; i <= LX_ITEM_PM; ++i) {
      items[i] = {ItemKind::language_text, static_cast<uint8_t>(i - LX_ITEM_DAY_1 + kFirstNameSlot), 0, 0, 0};
    }
  }
};
inline constexpr ItemTable kItemTable;

inline const Item& item_of(uint32_t number) {
  static constexpr Item kUnknown;
  return number < kItems ? kItemTable.items[number] : kUnknown;
}

// 16 or 8 bits, as the kind of the item says.
inline uint16_t given_number(const TerritoryHeader& territory, const Item& item) {
  const uint8_t* at = reinterpret_cast<const uint8_t*>(&territory) + item.given;
  return item.kind == ItemKind::position ? *at : uint16_t{*reinterpret_cast<const BeU16*>(at)};
}

inline bool given_flag(const TerritoryHeader& territory, const Item& item) {
  return (territory.flags & item.given) != 0;
}

inline bool own_flag(const LXLocale& locale, const Item& item) { return (locale.flags >> item.index & 1) != 0; }

inline void set_own_flag(LXLocale& locale, const Item& item, bool value) {
  unsigned flag = 1u << item.index;
  locale.flags = static_cast<uint16_t>(value ? locale.flags | flag : locale.flags & ~flag);
}

inline bool is_set(const LXLocale& locale, const Item& item) { return (locale.set_mask & item.set_bit) != 0; }

}  // namespace lx
