// SPDX-License-Identifier: Apache-2.0
// The items of a locale by number and name.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "lexaro/lexaro.h"

namespace lx::tool {

struct LocaleItem {
  uint32_t number;
  std::string name;  // scripts rely on it
  bool is_number;
};

inline LocaleItem text_item(uint32_t number) { return {number, "", false}; }

struct ItemGroup {
  const char* title;
  std::vector<LocaleItem> items;
};

// All items, in an order to read them in.
const std::vector<ItemGroup>& item_groups();

// By number ("59") or name ("decimal"), else null.
const LocaleItem* find_item(const std::string& wanted);

struct ItemValue {
  uint32_t status = LX_OK;  // why there is no value
  int32_t number = 0;
  std::string text;  // UTF-8
};

enum class ValueSource { kLocale, kTerritory };

ItemValue read_item(LXLocale* locale, const LocaleItem& item, ValueSource source = ValueSource::kLocale);
// The text of an item; empty when there is none.
std::string read_text(LXLocale* locale, uint32_t number, ValueSource source = ValueSource::kLocale);

}  // namespace lx::tool
