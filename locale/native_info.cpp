// SPDX-License-Identifier: Apache-2.0
// What the operating system knows of the user's locale. All of it goes through the process-wide system locale.
#include <climits>
#include <clocale>
#include <cstdio>
#include <cstring>

#include "frame/call.hpp"
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "native_info", 0};

constexpr int32_t kLocaleNameRoom = 132;
constexpr size_t kMaxGroupingText = 31;

const char* non_null(const char* text) { return text != nullptr ? text : ""; }

bool available(char value) { return value != CHAR_MAX; }

void set_flag(LXLocale& locale, uint16_t flag, char value) {
  if (!available(value)) return;
  unsigned rest = locale.flags & ~unsigned{flag};
  locale.flags = static_cast<uint16_t>(value != 0 ? rest | flag : rest);
}

void set_number(uint16_t& own, char value) {
  if (available(value)) own = static_cast<uint16_t>(static_cast<unsigned char>(value));
}

void set_position(uint8_t& own, char value) {
  if (available(value)) own = static_cast<uint8_t>(value);
}

void take_numbers(LXLocale& locale, const lconv& system) {
  set_number(locale.currency_digits, system.frac_digits);
  set_number(locale.currency_intl_digits, system.int_frac_digits);
  set_flag(locale, kLocalePositivePrecedes, system.p_cs_precedes);
  set_flag(locale, kLocalePositiveSpaced, system.p_sep_by_space);
  set_flag(locale, kLocaleNegativePrecedes, system.n_cs_precedes);
  set_flag(locale, kLocaleNegativeSpaced, system.n_sep_by_space);
  set_position(locale.positive_sign_position, system.p_sign_posn);
  set_position(locale.negative_sign_position, system.n_sign_posn);
}

// Group sizes as the locale spells them: "3;0", in the digits of its code page.
void take_grouping(LXLocale& locale, LocaleText which, const char* sizes) {
  if (*sizes == '\0') return;
  char text[kMaxGroupingText + 8];
  size_t length = 0;
  for (; *sizes != '\0' && available(*sizes); ++sizes) {
    int added = std::snprintf(text + length, sizeof text - length, "%u;", static_cast<unsigned char>(*sizes));
    if (length + static_cast<size_t>(added) + 1 > kMaxGroupingText) break;
    length += static_cast<size_t>(added);
  }
  text[length++] = '0';
  const CodePage& page = code_page_of(*locale.code_page);
  for (size_t i = 0; i < length; ++i) text[i] = static_cast<char>(page.byte_of_latin1[static_cast<uint8_t>(text[i])]);
  store_text(locale, which, text, length);
}

// Separators of one byte are taken as they are: the system vouches for them.
void take_separator(LXLocale& locale, unsigned index, const char* text) {
  if (std::strlen(text) != 1) return;
  locale.separators[index] = *text;
  locale.ucs2_separators[index] = code_page_of(*locale.code_page).to_unicode[static_cast<uint8_t>(*text)];
}

void take_text(LXLocale& locale, LocaleText which, const char* text) {
  if (*text != '\0') store_text(locale, which, text, std::strlen(text));
}

void take_texts(LXLocale& locale, const lconv& system) {
  take_separator(locale, 0, system.decimal_point);
  take_separator(locale, 1, system.thousands_sep);
  take_separator(locale, 3, system.mon_decimal_point);
  take_separator(locale, 4, system.mon_thousands_sep);
  take_text(locale, LocaleText::currency, system.currency_symbol);
  take_text(locale, LocaleText::positive_sign, system.positive_sign);
  take_text(locale, LocaleText::negative_sign, system.negative_sign);
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

void map_native_info(const char* native_name, LXLocale& locale) {
  SavedSystemLocale saved;
  if (!saved.saved()) return;
  const char* system_name = std::setlocale(LC_ALL, native_name);
  if (system_name == nullptr) return;
  const lconv& system = *std::localeconv();
  take_numbers(locale, system);
  take_grouping(locale, LocaleText::grouping, system.grouping);
  take_grouping(locale, LocaleText::monetary_grouping, system.mon_grouping);
  if (same_code_page(*native_name != '\0' ? native_name : system_name, locale)) take_texts(locale, system);
}

}  // namespace lx

using namespace lx;

extern "C" int32_t LXGetUserLocale(char* buffer, int32_t buffer_size) noexcept {
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
