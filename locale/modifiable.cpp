// SPDX-License-Identifier: Apache-2.0
// A locale's own copies of its territory's values.
#include "codepage/text/text_kinds.hpp"
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "modifiable", 0};

uint32_t fill_item(LXLocale& locale, const TerritoryHeader& territory, const Item& item) {
  switch (item.kind) {
    case ItemKind::number:
    case ItemKind::position:
      locale.numbers[item.index] = given_number(territory, item);
      return LX_OK;
    case ItemKind::yes_no:
      set_own_flag(locale, item, given_flag(territory, item));
      return LX_OK;
    case ItemKind::separator:
      locale.ucs2_separators[item.index] = territory.separators[item.index];
      locale.separators[item.index] = separator_byte(page_of(locale), territory.separators[item.index]);
      return LX_OK;
    case ItemKind::string:
      return fill_string(locale, item);
    default:
      return LX_OK;
  }
}

uint32_t refill(LXLocale& locale) {
  const TerritoryHeader& territory = territory_of(*locale.territory);
  for (const ItemRow& row : kItemRows) {
    if (is_set(locale, row.item)) continue;
    uint32_t status = fill_item(locale, territory, row.item);
    if (status != LX_OK) return status;
  }
  return LX_OK;
}

}  // namespace

char separator_byte(const CodePage& page, LXUChar character) {
  uint32_t packed = WideWriter(page, nullptr, 0).code(character);
  return static_cast<char>(packed <= 0xFF ? packed : page.substitution);
}

Owned<char> text_in_page(const CodePage& page, const LXUChar* text) {
  size_t characters = measured_length(text) + 1;
  size_t width = page.max_length;
  auto block = Owned<char>::array(characters * width);
  if (!block) {
    TRC1_Sync(&trace_unit);
    LX_TRACE(TRC1_LEVEL_ERROR, "Unable to allocate %d bytes, (%d * %d)", static_cast<int>(characters * width),
             static_cast<int>(characters), static_cast<int>(width));
    return block;
  }
  uint8_t* at = with_writer(page, {}, bytes_of(block.get()), characters * width - 1, [&](auto out) {
    for (; *text != 0; ++text) out.put(out.code(*text));
    return out.at;
  });
  *at = 0;
  return block;
}

uint32_t fill_string(LXLocale& locale, const Item& item) {
  const LXUChar* text = territory_text(*locale.territory, static_cast<TerritoryText>(item.given));
  Owned<char> copy = text_in_page(page_of(locale), text);
  if (!copy) return LX_E_MEMORY;
  TRC1_Sync(&trace_unit);
  if (item.index == item_of(LX_ITEM_CURRENCY).index) {
    LX_TRACE(TRC1_LEVEL_DETAIL, "Setting currency for locale %p to %p", static_cast<void*>(&locale),
             static_cast<void*>(copy.get()));
  }
  Owned<char>(std::exchange(locale.strings[item.index], copy.give_up()));
  return LX_OK;
}

void note_code_page(LXLocale& locale) {
  const CodePage& page = page_of(locale);
  unsigned flags = locale.flags & ~unsigned{kLocaleSingleByte | kLocaleShiftSensitive};
  if (page.max_length == 1) flags |= kLocaleSingleByte;
  if (page.shift_sensitive) flags |= kLocaleShiftSensitive;
  locale.flags = static_cast<uint16_t>(flags);
}

}  // namespace lx

using namespace lx;

extern "C" uint32_t LXLocaleSetModifiable(LXLocale* locale) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    locale = locale_or_default(locale);
    if (locale == nullptr) return LX_E_ARGUMENT;
    return locale->last_error = refill(*locale);
  });
}
