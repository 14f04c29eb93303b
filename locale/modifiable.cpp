// SPDX-License-Identifier: Apache-2.0
// A locale's own copies of its territory's values.
#include "codepage/text/text_kinds.hpp"
#include "frame/call.hpp"
#include "frame/memory.hpp"
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "modifiable", 0};

struct NumberItem {
  uint32_t set_bit;
  uint16_t LXLocale::*own;
  BeU16 TerritoryHeader::*given;
};
constexpr NumberItem kNumbers[] = {
    {kSetFractionDigits, &LXLocale::fraction_digits, &TerritoryHeader::fraction_digits},
    {kSetCurrencyDigits, &LXLocale::currency_digits, &TerritoryHeader::currency_digits},
    {kSetCurrencyIntlDigits, &LXLocale::currency_intl_digits, &TerritoryHeader::currency_intl_digits},
};

struct PositionItem {
  uint32_t set_bit;
  uint8_t LXLocale::*own;
  uint8_t TerritoryHeader::*given;
};
constexpr PositionItem kPositions[] = {
    {kSetPositiveSignPosition, &LXLocale::positive_sign_position, &TerritoryHeader::positive_sign_position},
    {kSetNegativeSignPosition, &LXLocale::negative_sign_position, &TerritoryHeader::negative_sign_position},
};

struct YesNoItem {
  uint32_t set_bit;
  uint16_t own;
  uint16_t given;
};
constexpr YesNoItem kYesNos[] = {
    {kSetYesNo[0], kLocalePositivePrecedes, kPositiveSymbolPrecedes},
    {kSetYesNo[1], kLocalePositiveSpaced, kPositiveSymbolSpaced},
    {kSetYesNo[2], kLocaleNegativePrecedes, kNegativeSymbolPrecedes},
    {kSetYesNo[3], kLocaleNegativeSpaced, kNegativeSymbolSpaced},
    {kSetYesNo[4], kLocaleYesNo82, kYesNo82},
    {kSetYesNo[5], kLocaleYesNo83, kYesNo83},
};

// Where the territory has the text of each of the locale's strings.
constexpr TerritoryText kTexts[kLocaleStrings] = {
    TerritoryText::grouping,      TerritoryText::currency,      TerritoryText::monetary_grouping,
    TerritoryText::positive_sign, TerritoryText::negative_sign, TerritoryText::time_format,
    TerritoryText::short_date,    TerritoryText::long_date,
};

// A separator has one byte in the locale. What needs more, or is not in the page, is replaced there; its UCS-2 value
// stays true.
char separator_byte(const LXObjEntry& code_page, uint16_t character) {
  char bytes[kMaxCharacterLength];
  if (LXCpUnicodeToChar(&code_page, character, bytes) == 1) return bytes[0];
  return static_cast<char>(code_page_of(code_page).substitution);
}

void fill_numbers(LXLocale& locale, const TerritoryHeader& territory) {
  for (const NumberItem& item : kNumbers) {
    if ((locale.set_mask & item.set_bit) == 0) locale.*item.own = territory.*item.given;
  }
  for (const PositionItem& item : kPositions) {
    if ((locale.set_mask & item.set_bit) == 0) locale.*item.own = territory.*item.given;
  }
  for (const YesNoItem& item : kYesNos) {
    if ((locale.set_mask & item.set_bit) != 0) continue;
    unsigned rest = locale.flags & ~unsigned{item.own};
    locale.flags = static_cast<uint16_t>((territory.flags & item.given) != 0 ? rest | item.own : rest);
  }
}

void fill_separators(LXLocale& locale, const TerritoryHeader& territory) {
  for (unsigned i = 0; i < kLocaleSeparators; ++i) {
    if ((locale.set_mask & kSetFirstSeparator << i) != 0) continue;
    locale.ucs2_separators[i] = territory.separators[i];
    locale.separators[i] = separator_byte(*locale.code_page, territory.separators[i]);
  }
}

uint32_t fill_text(LXLocale& locale, unsigned index) {
  const BeU16* text = territory_text(*locale.territory, kTexts[index]);
  size_t room = measured_length(text) + 1;
  size_t width = code_page_of(*locale.code_page).max_length;
  auto copy = Owned<char>::array(room * width);
  if (!copy) {
    LX_TRACE(TRC1_LEVEL_ERROR, "Unable to allocate %d bytes, (%d * %d)", static_cast<int>(room * width),
             static_cast<int>(room), static_cast<int>(width));
    return LX_E_MEMORY;
  }
  char* at = copy.get();
  for (; *text != 0; ++text) at += LXCpUnicodeToChar(locale.code_page, *text, at);
  *at = '\0';
  if (index == static_cast<unsigned>(LocaleText::currency)) {
    LX_TRACE(TRC1_LEVEL_DETAIL, "Setting currency for locale %p to %p", static_cast<void*>(&locale),
             static_cast<void*>(copy.get()));
  }
  if (locale.strings[index] != nullptr) release(locale.strings[index]);
  locale.strings[index] = copy.give_up();
  return LX_OK;
}

uint32_t refill(LXLocale& locale) {
  const TerritoryHeader& territory = territory_of(*locale.territory);
  fill_numbers(locale, territory);
  fill_separators(locale, territory);
  for (unsigned i = 0; i < kLocaleStrings; ++i) {
    if ((locale.set_mask & kSetFirstText << i) != 0) continue;
    uint32_t status = fill_text(locale, i);
    if (status != LX_OK) return status;
  }
  return LX_OK;
}

}  // namespace

void note_code_page(LXLocale& locale) {
  const CodePage& page = code_page_of(*locale.code_page);
  unsigned flags = locale.flags & ~unsigned{kLocaleSingleByte | kLocaleShiftSensitive};
  if (page.max_length == 1) flags |= kLocaleSingleByte;
  if (page.shift_sensitive) flags |= kLocaleShiftSensitive;
  locale.flags = static_cast<uint16_t>(flags);
}

uint32_t store_text(LXLocale& locale, LocaleText which, const char* text, size_t length) {
  auto index = static_cast<unsigned>(which);
  const CodePage& page = code_page_of(*locale.code_page);
  size_t whole = 0;
  size_t characters = 0;
  for (; whole < length; ++characters) {
    size_t next = page.char_length[static_cast<uint8_t>(text[whole])];
    if (next > length - whole) break;
    whole += next;
  }
  auto copy = Owned<char>::array(whole + 1);
  auto mirror = Owned<LXUChar>::array(characters + 1);
  if (!copy || !mirror) return LX_E_MEMORY;
  std::memcpy(copy.get(), text, whole);
  copy[whole] = '\0';
  mirror[0] = 0;
  LXCpStrToUnicode(locale.code_page, mirror.get(), static_cast<int32_t>(characters + 1), copy.get(),
                   static_cast<int32_t>(whole), LX_OPT_TERMINATE);
  Owned<char>(std::exchange(locale.strings[index], copy.give_up()));
  Owned<LXUChar>(std::exchange(locale.ucs2_strings[index], mirror.give_up()));
  locale.set_mask |= kSetFirstText << index;
  locale.mirror_bits = static_cast<uint16_t>(locale.mirror_bits | kMirrorFirstText << index);
  return LX_OK;
}

}  // namespace lx

using namespace lx;

extern "C" uint32_t LXLocaleSetModifiable(LXLocale* locale) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (locale == nullptr) locale = lxglocale;
    if (locale == nullptr) return LX_E_ARGUMENT;
    return locale->last_error = refill(*locale);
  });
}
