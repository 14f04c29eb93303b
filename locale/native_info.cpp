// SPDX-License-Identifier: Apache-2.0
// What the operating system knows of the user's locale. All of it goes through the process-wide system locale.
#include <climits>
#include <clocale>
#include <cstdio>
#include <cstring>

#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "native_info", 0};

constexpr size_t kMaxGroupingText = 31;

const char* non_null(const char* text) { return text != nullptr ? text : ""; }

bool available(char value) { return value != CHAR_MAX; }

void take_number(LXLocale& locale, uint32_t number, char value) {
  if (!available(value)) return;
  const Item& item = item_of(number);
  if (item.kind == ItemKind::yes_no) {
    set_own_flag(locale, item, value != 0);
  } else {
    locale.numbers[item.index] = static_cast<uint8_t>(value);
  }
}

void take_numbers(LXLocale& locale, const lconv& system) {
  take_number(locale, LX_ITEM_CURRENCY_DIGITS, system.frac_digits);
  take_number(locale, LX_ITEM_CURRENCY_INTL_DIGITS, system.int_frac_digits);
  take_number(locale, LX_ITEM_P_CS_PRECEDES, system.p_cs_precedes);
  take_number(locale, LX_ITEM_P_SEP_BY_SPACE, system.p_sep_by_space);
  take_number(locale, LX_ITEM_N_CS_PRECEDES, system.n_cs_precedes);
  take_number(locale, LX_ITEM_N_SEP_BY_SPACE, system.n_sep_by_space);
  take_number(locale, LX_ITEM_P_SIGN_POSN, system.p_sign_posn);
  take_number(locale, LX_ITEM_N_SIGN_POSN, system.n_sign_posn);
}

// Group sizes as the locale spells them: "3;0", in the digits of its code page.
uint32_t take_grouping(LXLocale& locale, uint32_t number, const char* sizes) {
  if (*sizes == '\0') return LX_OK;
  char text[kMaxGroupingText + 8];
  size_t length = 0;
  for (; *sizes != '\0' && available(*sizes); ++sizes) {
    int added = std::snprintf(text + length, sizeof text - length, "%u;", static_cast<unsigned char>(*sizes));
    if (length + static_cast<size_t>(added) + 1 > kMaxGroupingText) break;
    length += static_cast<size_t>(added);
  }
  text[length++] = '0';
  const CodePage& page = page_of(locale);
  for (size_t i = 0; i < length; ++i) text[i] = separator_byte(page, static_cast<uint8_t>(text[i]));
  return store_string(locale, item_of(number), {text, length});
}

// Separators of one byte are taken as they are: the system vouches for them.
void take_separator(LXLocale& locale, uint32_t number, const char* text) {
  if (std::strlen(text) != 1) return;
  unsigned index = item_of(number).index;
  locale.separators[index] = *text;
  locale.ucs2_separators[index] = page_of(locale).to_unicode[static_cast<uint8_t>(*text)];
}

uint32_t take_text(LXLocale& locale, uint32_t number, const char* text) {
  return *text != '\0' ? store_string(locale, item_of(number), {text, std::strlen(text)}) : LX_OK;
}

uint32_t take_texts(LXLocale& locale, const lconv& system) {
  take_separator(locale, LX_ITEM_DECIMAL, system.decimal_point);
  take_separator(locale, LX_ITEM_THOUSANDS, system.thousands_sep);
  take_separator(locale, LX_ITEM_MON_DECIMAL, system.mon_decimal_point);
  take_separator(locale, LX_ITEM_MON_THOUSANDS, system.mon_thousands_sep);
  // Either runs out of memory or not: what came before stays.
  return take_text(locale, LX_ITEM_CURRENCY, system.currency_symbol) |
         take_text(locale, LX_ITEM_POSITIVE_SIGN, system.positive_sign) |
         take_text(locale, LX_ITEM_NEGATIVE_SIGN, system.negative_sign);
}

// The system's texts are usable only when they are in the locale's code page.
bool same_code_page(const char* native_name, const LXLocale& locale) {
  char name[kLocaleNameRoom];
  LXMapNativeLocale(native_name, name, kLocaleNameRoom);
  const char* code_page = name;
  if (char* at = std::strchr(name, '@')) {
    *at = '\0';
    if (const char* dot = std::strrchr(name, '.')) code_page = dot + 1;
  }
  return std::strcmp(code_page, locale.code_page->name) == 0;
}

// The name of the locale that the environment asks for.
const char* environment_locale() {
  if (const char* name = std::setlocale(LC_ALL, "")) return name;
  if (const char* name = HSV1_GetEnv("LC_ALL", 0)) return name;
  return non_null(HSV1_GetEnv("LANG", 0));
}

uint32_t map_native_info(const char* native_name, LXLocale& locale) {
  SavedSystemLocale saved;
  if (!saved.saved()) return LX_OK;
  const char* system_name = std::setlocale(LC_ALL, native_name);
  if (system_name == nullptr) {
    saved.forget();  // nothing was switched
    return LX_OK;
  }
  const lconv& system = *std::localeconv();
  take_numbers(locale, system);
  uint32_t status = take_grouping(locale, LX_ITEM_GROUPING, system.grouping) |
                    take_grouping(locale, LX_ITEM_MON_GROUPING, system.mon_grouping);
  if (!same_code_page(*native_name != '\0' ? native_name : system_name, locale)) return status;
  return status | take_texts(locale, system);
}

}  // namespace

SavedSystemLocale::SavedSystemLocale() {
  const char* current = non_null(std::setlocale(LC_ALL, nullptr));
  size_t length = std::strlen(current);
  if (length >= kRoom) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Unable to save current locale to restore. len %d > %d '%s'", static_cast<int>(length),
             kRoom, current);
    return;
  }
  std::memcpy(name_, current, length + 1);
  saved_ = true;
}

SavedSystemLocale::~SavedSystemLocale() {
  if (!saved_) return;
  std::setlocale(LC_ALL, name_);
  LX_TRACE(TRC1_LEVEL_DETAIL, "Restored locale: [%d/%d] %s", static_cast<int>(std::strlen(name_)), kRoom, name_);
}

}  // namespace lx

using namespace lx;

extern "C" {

void LXMapNativeInfo(const char* native_name, LXLocale* locale, uint32_t /*flag*/) noexcept {
  exported(trace_unit, __func__, [&] {
    locale = locale_or_default(locale);
    if (locale == nullptr || native_name == nullptr) return;
    locale->last_error = map_native_info(native_name, *locale);
  });
}

LXLocale* LXConvertNativeLocale(const char* native_name, uint32_t options, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXLocale* {
    if (native_name == nullptr || (options & ~(LX_NATIVE_INFO | LX_GET_SUBSTITUTE)) != 0) {
      set_status(rc, LX_E_ARGUMENT);
      return nullptr;
    }
    char name[kLocaleNameRoom];
    LXMapNativeLocale(native_name, name, kLocaleNameRoom);
    LXLocale* locale = LXGetLocale(name, options & LX_GET_SUBSTITUTE, rc);
    if (locale != nullptr) LXMapNativeInfo(native_name, locale, options & LX_NATIVE_INFO);
    return locale;
  });
}

int32_t LXGetUserLocale(char* buffer, int32_t buffer_size) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (buffer == nullptr || buffer_size < 1) return 0;
    if (const char* name = HSV1_GetEnv("LX_LANG", 0)) {
      size_t room = static_cast<size_t>(buffer_size);
      size_t length = std::strlen(name) + 1;
      std::memcpy(buffer, name, length < room ? length : room);
      return 1;
    }
    {
      SavedSystemLocale saved;
      if (!saved.saved()) return 0;
      LXMapNativeLocale(environment_locale(), buffer, buffer_size);
    }
    LX_TRACE(TRC1_LEVEL_DETAIL, "User locale: %s", buffer);
    return 2;
  });
}

}  // extern "C"
