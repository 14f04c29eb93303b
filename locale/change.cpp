// SPDX-License-Identifier: Apache-2.0
// Another territory or code page for a locale: all of it, or nothing.
#include "codepage/text/text_kinds.hpp"
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "change", 0};

// Runs the change on the locale with those texts taken away that it will make anew. When it fails, the locale becomes
// what it was; when it succeeds, the texts that it replaced are freed.
template <class Anew, class Change>
uint32_t transact(LXLocale& locale, Anew anew, Change change) {
  LXLocale before = locale;
  for (const ItemRow& row : kItemRows) {
    if (row.item.kind == ItemKind::string && anew(row.item)) locale.strings[row.item.index] = nullptr;
  }
  if (change() == LX_OK) {
    LXLocaleFreeOldText(&locale, &before);
    return locale.last_error = LX_OK;
  }
  LXLocaleFreeOldText(&before, &locale);
  locale = before;
  return locale.last_error = LX_E_MEMORY;
}

bool usable(const LXObjEntry* entry, uint8_t type) {
  return entry != nullptr && entry->type == type && entry->loaded();
}

// A string that was set comes from its UCS-2 copy; the others may have characters that only the territory's text has.
uint32_t carry_string(LXLocale& locale, const Item& item, const LXObjEntry& old_page, const char* old_text) {
  if (!is_set(locale, item)) return fill_string(locale, item);
  Owned<char> text = (locale.mirror_bits & item.mirror_bit) != 0
                         ? text_in_page(page_of(locale), locale.ucs2_strings[item.index])
                         : Owned<char>(LXLocaleCnvText(&old_page, locale.code_page, old_text));
  locale.strings[item.index] = text.give_up();
  return locale.strings[item.index] != nullptr ? LX_OK : LX_E_MEMORY;
}

uint32_t change_code_page(LXLocale& locale, LXObjEntry& code_page) {
  const LXLocale before = locale;
  return transact(
      locale, [](const Item&) { return true; },
      [&]() -> uint32_t {
        locale.code_page = &code_page;
        note_code_page(locale);
        for (const ItemRow& row : kItemRows) {
          unsigned i = row.item.index;
          if (row.item.kind == ItemKind::separator) {
            locale.separators[i] = separator_byte(code_page_of(code_page), locale.ucs2_separators[i]);
          } else if (row.item.kind == ItemKind::string) {
            uint32_t status = carry_string(locale, row.item, *before.code_page, before.strings[i]);
            if (status != LX_OK) return status;
          }
        }
        return LX_OK;
      });
}

template <class Body>
uint32_t change_call(const char* function, LXLocale* locale, const LXObjEntry* entry, uint8_t type, Body body) {
  return exported(trace_unit, function, [&]() -> uint32_t {
    locale = locale_or_default(locale);
    if (locale == nullptr) return LX_E_MEMORY;
    if (!usable(entry, type)) return locale->last_error = LX_E_MEMORY;
    return body(*locale);
  });
}

}  // namespace

uint32_t take_object(LXLocale& locale, uint8_t type, LXObjEntry* entry) {
  switch (type) {
    case LX_LANGUAGE:
      locale.language = entry;
      return LX_OK;
    case LX_TERRITORY:
      return LXLocaleChangeTerritory(&locale, entry);
    case LX_CODEPAGE:
      return entry != locale.code_page ? LXLocaleChangeCodePage(&locale, entry) : LX_OK;
    default:
      locale.sort = entry;
      locale.flags = static_cast<uint16_t>(entry == nullptr ? locale.flags | kLocaleBinarySort
                                                            : locale.flags & ~unsigned{kLocaleBinarySort});
      return LX_OK;
  }
}

}  // namespace lx

using namespace lx;

extern "C" {

uint32_t LXLocaleChangeTerritory(LXLocale* locale, LXObjEntry* territory) noexcept {
  return change_call(__func__, locale, territory, LX_TERRITORY, [&](LXLocale& changed) {
    return transact(
        changed, [&](const Item& item) { return !is_set(changed, item); },
        [&] {
          changed.territory = territory;
          return LXLocaleSetModifiable(&changed);
        });
  });
}

uint32_t LXLocaleChangeCodePage(LXLocale* locale, LXObjEntry* code_page) noexcept {
  return change_call(__func__, locale, code_page, LX_CODEPAGE,
                     [&](LXLocale& changed) { return change_code_page(changed, *code_page); });
}

void LXLocaleFreeOldText(const LXLocale* keep, LXLocale* drop) noexcept {
  exported(trace_unit, __func__, [&] {
    if (keep == nullptr || drop == nullptr) return;
    for (unsigned i = 0; i < kLocaleStrings; ++i) {
      if (drop->strings[i] != keep->strings[i]) Owned<char>(std::exchange(drop->strings[i], nullptr));
    }
  });
}

char* LXLocaleCnvText(const LXObjEntry* from, const LXObjEntry* to, const char* text) noexcept {
  return exported(trace_unit, __func__, [&]() -> char* {
    if (!is_loaded_code_page(from) || !is_loaded_code_page(to) || text == nullptr) return nullptr;
    size_t length = std::strlen(text);
    if (length >= INT32_MAX) return nullptr;
    auto ucs2 = Owned<LXUChar>::array(length + 1);
    if (!ucs2) return nullptr;
    ucs2[0] = 0;
    LXCpStrToUnicode(from, ucs2.get(), static_cast<int32_t>(length + 1), text, static_cast<int32_t>(length),
                     LX_OPT_TERMINATE);
    return text_in_page(code_page_of(*to), ucs2.get()).give_up();
  });
}

}  // extern "C"
