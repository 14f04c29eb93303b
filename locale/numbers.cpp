// SPDX-License-Identifier: Apache-2.0
// The items of a locale that are numbers.
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "numbers", 0};

constexpr int32_t kLastSignPosition = 4;

int32_t get_number(LocaleCall& call, uint32_t number, bool own) {
  const LXLocale& locale = call.locale;
  const TerritoryHeader& territory = territory_of(*locale.territory);
  const Item& item = item_of(number);
  switch (item.kind) {
    case ItemKind::object_id: {
      const LXObjEntry* const objects[] = {locale.language, locale.territory, locale.code_page, locale.sort};
      return objects[item.index] != nullptr ? objects[item.index]->id : 0;
    }
    case ItemKind::number:
    case ItemKind::position:
      return own ? locale.numbers[item.index] : given_number(territory, item);
    case ItemKind::yes_no:
      return own ? own_flag(locale, item) : given_flag(territory, item);
    case ItemKind::territory_yes_no:
      return given_flag(territory, item);
    case ItemKind::territory_number:
      return given_number(territory, item);
    case ItemKind::page_max_length:
      return page_of(locale).max_length;
    case ItemKind::page_ascii_family:
      return page_of(locale).ascii_family;
    case ItemKind::page_shift_sensitive:
      return (locale.flags & kLocaleShiftSensitive) != 0;
    default:
      return call.fail(LX_E_ITEM, -1);
  }
}

uint32_t set_object_by_id(LXLocale& locale, uint8_t type, int32_t id) {
  if (id < 0 || id > UINT16_MAX) return LX_E_NOTFOUND;
  uint32_t rc = LX_OK;
  LXObjEntry* entry = LXGetObjFromID(LXGetObjManager(), type, static_cast<uint16_t>(id), 0, &rc);
  uint32_t status = lookup_status(entry, rc);
  return status == LX_OK ? take_object(locale, type, entry) : status;
}

uint32_t set_number(LXLocale& locale, uint32_t number, int32_t value) {
  const Item& item = item_of(number);
  switch (item.kind) {
    case ItemKind::object_id:
      return set_object_by_id(locale, item.index, value);
    case ItemKind::number:
      break;
    case ItemKind::position:
      if (value < 0 || value > kLastSignPosition) return LX_E_NOTFOUND;
      break;
    case ItemKind::yes_no:
      if (value != 0 && value != 1) return LX_E_NOTFOUND;
      set_own_flag(locale, item, value != 0);
      locale.set_mask |= item.set_bit;
      return LX_OK;
    default:
      return LX_E_ITEM;
  }
  locale.numbers[item.index] = static_cast<uint16_t>(value);
  locale.set_mask |= item.set_bit;
  return LX_OK;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

int32_t LXGetLocaleNumInfo(LXLocale* locale, uint32_t item, uint32_t source) noexcept {
  return locale_call(trace_unit, __func__, locale, source, 1, int32_t{-1},
                     [&](LocaleCall& call) { return get_number(call, item, source == 0); });
}

int32_t LXSetLocaleNumInfo(LXLocale* locale, uint32_t item, int32_t value) noexcept {
  return locale_call(trace_unit, __func__, locale, 0, 0, int32_t{0}, [&](LocaleCall& call) {
    call.status = set_number(call.locale, item, value);
    return call.status == LX_OK ? 1 : 0;
  });
}

}  // extern "C"
