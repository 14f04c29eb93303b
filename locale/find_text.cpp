// SPDX-License-Identifier: Apache-2.0
// Where the texts of a locale are.
#include <cstdio>

#include "codepage/text/text_kinds.hpp"
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "find_text", 0};

constexpr char kBinary[] = "Binary";

void take_ucs2(ItemText& text, const LXUChar* ucs2) {
  text.form = LX_FORM_UCS2;
  text.ucs2 = ucs2;
  text.units = measured_length(ucs2);
}

void take_name(ItemText& text, const char* name) {
  text.form = LX_FORM_NAME;
  text.bytes = name;
  text.length = std::strlen(name);
}

const char* name_of(const LXObjEntry* entry) { return entry != nullptr ? entry->name : kBinary; }

const char* object_name(const LXLocale& locale, uint8_t type) {
  const LXObjEntry* const objects[] = {locale.language, locale.territory, locale.code_page, locale.sort};
  return name_of(objects[type]);
}

// Null: the directory has no such object.
const char* default_name(const LXLocale& locale, uint8_t type) {
  const LanguageHeader& language = language_of(*locale.language);
  const uint16_t ids[] = {0, language.default_territory, language.default_code_page, language.default_sort};
  uint32_t rc = LX_OK;
  const LXObjEntry* entry = LXGetObjFromID(LXGetObjManager(), type, ids[type], 1, &rc);
  return entry != nullptr || rc == LX_OK ? name_of(entry) : nullptr;
}

void take_own_separator(ItemText& text, const LXLocale& locale, unsigned index) {
  text.form = LX_FORM_CODEPAGE;
  text.bytes = &locale.separators[index];
  text.length = locale.separators[index] != 0 ? 1 : 0;
  text.ucs2 = &locale.ucs2_separators[index];
  text.units = locale.ucs2_separators[index] != 0 ? 1 : 0;
}

void take_own_string(ItemText& text, const LXLocale& locale, const Item& item) {
  // A string that was not set reads as the territory has it, also what the code page lacks.
  bool mirrored = (locale.mirror_bits & item.mirror_bit) != 0;
  take_ucs2(text, mirrored ? locale.ucs2_strings[item.index]
                           : territory_text(*locale.territory, static_cast<TerritoryText>(item.given)));
  text.form = LX_FORM_CODEPAGE;
  text.bytes = locale.strings[item.index] != nullptr ? locale.strings[item.index] : "";
  text.length = std::strlen(text.bytes);
}

// What is not stored as a terminated UCS-2 text is made one here.
constexpr size_t kShortTextRoom = sizeof LXObjEntry::name;
[[gnu::tls_model("initial-exec")]] thread_local LXUChar short_text[kShortTextRoom];

template <class Body>
auto item_call(const char* function, LXLocale* locale, uint32_t item, int32_t use_locale, uint32_t* form, Body body) {
  using Result = decltype(body(ItemText()));
  if (form != nullptr) *form = 0;
  return locale_call(trace_unit, function, locale, 0, 0, Result{nullptr}, [&](LocaleCall& call) {
    ItemText text;
    call.status = find_text(call.locale, item, use_locale != 0, text);
    Result result = call.status == LX_OK ? body(text) : nullptr;
    if (form != nullptr) *form = text.form;
    return result;
  });
}

}  // namespace

uint32_t find_text(const LXLocale& locale, uint32_t number, bool own, ItemText& text) {
  const Item& item = item_of(number);
  switch (item.kind) {
    case ItemKind::object_name:
      take_name(text, object_name(locale, item.index));
      return LX_OK;
    case ItemKind::default_name: {
      const char* name = default_name(locale, item.index);
      if (name == nullptr) return LX_E_NOTFOUND;
      take_name(text, name);
      return LX_OK;
    }
    case ItemKind::language_text:
      take_ucs2(text, language_text(*locale.language, item.index));
      return LX_OK;
    case ItemKind::territory_text:
      take_ucs2(text, territory_text(*locale.territory, static_cast<TerritoryText>(item.index)));
      return LX_OK;
    case ItemKind::separator:
      own ? take_own_separator(text, locale, item.index)
          : take_ucs2(text, separator_text(*locale.territory, item.index));
      return LX_OK;
    case ItemKind::string:
      own ? take_own_string(text, locale, item)
          : take_ucs2(text, territory_text(*locale.territory, static_cast<TerritoryText>(item.given)));
      return LX_OK;
    default:
      return LX_E_ITEM;
  }
}

size_t write_full_name(const LXLocale& locale, char* buffer) {
  int length = std::snprintf(buffer, kFullNameRoom, "%s_%s.%s@%s", locale.language->name, locale.territory->name,
                             locale.code_page->name, name_of(locale.sort));
  return static_cast<size_t>(length);
}

const CodePage& ascii_code_page() {
  constexpr uint16_t kAscii = 367;
  uint32_t rc = LX_OK;
  const LXObjEntry* entry = LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, kAscii, 0, &rc);
  return entry != nullptr ? code_page_of(*entry) : built_in_code_page();
}

}  // namespace lx

using namespace lx;

extern "C" {

const void* LXLocaleGetTextItem(LXLocale* locale, uint32_t item, int32_t use_locale, uint32_t* form) noexcept {
  return item_call(__func__, locale, item, use_locale, form, [](const ItemText& text) -> const void* {
    if (text.form == LX_FORM_UCS2) return text.ucs2;
    return text.bytes;
  });
}

const LXUChar* LXLocaleGetTextItemU(LXLocale* locale, uint32_t item, int32_t use_locale, uint32_t* form) noexcept {
  const LXUChar* result =
      item_call(__func__, locale, item, use_locale, form, [&](const ItemText& text) -> const LXUChar* {
        bool name = text.form == LX_FORM_NAME;
        if (!name && item_of(item).kind != ItemKind::separator) return text.ucs2;
        size_t length = name ? text.length : text.units;
        if (length >= kShortTextRoom) length = kShortTextRoom - 1;
        const CodePage& ascii = ascii_code_page();
        for (size_t i = 0; i < length; ++i) {
          short_text[i] = name ? ascii.to_unicode[static_cast<uint8_t>(text.bytes[i])] : text.ucs2[i];
        }
        short_text[length] = 0;
        return short_text;
      });
  if (form != nullptr && result != nullptr) *form = LX_FORM_UCS2;
  return result;
}

int32_t LXLocaleGetLocaleString(LXLocale* locale, char* buffer) noexcept {
  return locale_call(trace_unit, __func__, locale, 0, 0, int32_t{-1}, [&](LocaleCall& call) -> int32_t {
    if (buffer == nullptr) return call.fail(LX_E_ARGUMENT, -1);
    return static_cast<int32_t>(write_full_name(call.locale, buffer));
  });
}

}  // extern "C"
