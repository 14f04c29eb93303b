// SPDX-License-Identifier: Apache-2.0
// What a locale must report, from the readable sources, and what it does report, item by item in every form of text.
#pragma once

#include <lexaro/lexaro.h>

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "support/locale_source.hpp"
#include "support/page_source.hpp"
#include "support/text_model.hpp"

namespace lx::test {

inline constexpr uint32_t kLastItem = 88;

// A pair of functions that read and set texts.
struct TextForm {
  std::string name;
  Form::Kind kind;
  const PageSource* page;    // null: the locale's own
  const LXObjEntry* record;  // of the page

  size_t unit_size() const { return kind == Form::wide ? 4 : kind == Form::ucs2 ? 2 : 1; }
  int32_t get(LXLocale* locale, uint32_t item, void* buffer, int32_t size, uint32_t options) const;
  int32_t set(LXLocale* locale, uint32_t item, const void* text, int32_t length, uint32_t options) const;
  // The text in this form, of a locale with the page `own`; shift bytes are closed.
  Units spell(const PageSource& own, std::u16string_view text) const;
  std::string raw(const Units& units) const { return test::raw({kind, nullptr}, units); }
};

// Plain, W, U and Ex; with `pages` also Ex in UTF-8, IBM037 and IBM930.
std::vector<TextForm> text_forms(bool pages = true);

bool is_separator(uint32_t item);

class LocaleModel {
 public:
  LocaleModel(std::string_view language_name, std::string_view territory_name, std::string_view page_name);
  // English, with the ids of the built-in objects.
  static LocaleModel built_in();

  const LocaleSource* language;
  const LocaleSource* territory;
  const PageSource* page;
  std::map<uint32_t, std::u16string> texts;  // set by the caller
  std::map<uint32_t, int32_t> numbers;

  void set_page(std::string_view name) { page = &PageSource::of(LocaleSource::id_of(LX_CODEPAGE, name)); }
  void set_territory(std::string_view name) { territory = &LocaleSource::of(LX_TERRITORY, name); }
  std::string name() const;

  // None: no such item. `own`: as the locale has it, not as its territory defines it.
  std::optional<std::u16string> text(uint32_t item, bool own = true) const;
  std::optional<int32_t> number(uint32_t item, bool own = true) const;
  // What the page makes of a text that is brought into it.
  std::u16string through_page(std::u16string_view text) const;

  // The first thing that the locale reports otherwise; empty when there is none. `every_size`: with rooms of every
  // size.
  std::string difference(LXLocale* locale, bool every_size = false) const;
  std::string text_difference(LXLocale* locale, uint32_t item, bool every_size = false) const;

 private:
  Units spelled(const TextForm& form, uint32_t item, bool own, std::u16string_view text) const;
  std::string found_text_difference(LXLocale* locale, uint32_t item) const;
  uint16_t ids_[3];
};

}  // namespace lx::test
