// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/lists.hpp"

#include <string>
#include <vector>

#include "tools/lexaro/json_output.hpp"
#include "tools/lexaro/library_session.hpp"
#include "tools/lexaro/locale_items.hpp"
#include "tools/lexaro/native_locale.hpp"
#include "tools/lexaro/native_names.hpp"
#include "tools/lexaro/object_names.hpp"
#include "tools/lexaro/terminal_text.hpp"

namespace lx::tool {
namespace {

struct Column {
  const char* heading;
  const char* key;  // in JSON
};

// Cells are strings, numbers, or null where there is nothing.
using Cells = std::vector<Json>;

std::string cell_text(const Json& cell) {
  if (cell.is_null()) return "-";
  return cell.is_string() ? cell.get<std::string>() : cell.dump();
}

void print_list(const std::vector<Column>& columns, const std::vector<Cells>& rows, bool as_json) {
  Json list = Json::array();
  TextTable::Row headings;
  for (const Column& column : columns) {
    headings.push_back(as_json ? column.heading : message(column.heading).utf8);
  }
  TextTable table(std::move(headings));
  for (const Cells& cells : rows) {
    Json object;
    TextTable::Row texts;
    for (std::size_t i = 0; i < columns.size(); ++i) {
      object[columns[i].key] = cells[i];
      texts.push_back(cell_text(cells[i]));
    }
    list.push_back(std::move(object));
    table.add(std::move(texts));
  }
  as_json ? print_json(list) : print_text(table.text());
}

Json text_or_null(const std::string& text) { return text.empty() ? Json() : Json(text); }

// Lists objects of a type by the items of a locale that has them. One that cannot be used is listed by its name alone,
// and told.
ExitStatus list_by_items(uint8_t type, const std::string& name_prefix, const std::vector<Column>& columns,
                         const std::vector<LocaleItem>& items, bool json) {
  ExitStatus status = ExitStatus::kExact;
  std::vector<Cells> rows;
  for (const std::string& name : object_names(type)) {
    uint32_t rc = LX_OK;
    LXObjEntry* entry = LXGetObjFromName(LXGetObjManager(), type, name.c_str(), -1, 1, &rc);
    Cells cells = {LXGetObjId(entry), name};
    LXLoadObj(LXGetObjManager(), entry, &rc);
    const LocalePtr locale(rc == LX_OK ? LXGetLocale((name_prefix + name).c_str(), 0, &rc) : nullptr);
    for (const LocaleItem& item : items) {
      cells.push_back(locale ? text_or_null(read_item(locale.get(), item, ValueSource::kTerritory).text) : Json());
    }
    if (!locale) {
      complain(name + ": " + describe_status(rc));
      status = ExitStatus::kCodePage;
    }
    rows.push_back(std::move(cells));
  }
  print_list(columns, rows, json);
  return status;
}

int32_t collect_alias(void* context, const char* alias, const char* page) {
  static_cast<std::vector<Cells>*>(context)->push_back({alias, page});
  return 1;
}

}  // namespace

ExitStatus list_aliases(const CommonOptions& common, bool json) {
  const LibrarySession session(common.locale_directory);
  std::vector<Cells> rows;
  LXEnumAliases(LXGetObjManager(), collect_alias, &rows);
  print_list({{"ALIAS", "alias"}, {"CODE PAGE", "codepage"}}, rows, json);
  return ExitStatus::kExact;
}

ExitStatus list_languages(const CommonOptions& common, bool json) {
  const LibrarySession session(common.locale_directory);
  return list_by_items(
      LX_LANGUAGE, "",
      {{"ID", "id"},
       {"NAME", "name"},
       {"ABBR", "abbreviation"},
       {"OWN NAME", "own_name"},
       {"TERRITORY", "default_territory"},
       {"CODE PAGE", "default_codepage"},
       {"SORT", "default_sort"}},
      {text_item(LX_ITEM_LANGUAGE_ABBREVIATION), text_item(LX_ITEM_LANGUAGE_OWN_NAME),
       text_item(LX_ITEM_DEFAULT_TERRITORY), text_item(LX_ITEM_DEFAULT_CODEPAGE), text_item(LX_ITEM_DEFAULT_SORT)},
      json);
}

ExitStatus list_territories(const CommonOptions& common, bool json) {
  const LibrarySession session(common.locale_directory);
  // Any language completes the name of a locale.
  const std::vector<std::string> languages = object_names(LX_LANGUAGE);
  return list_by_items(LX_TERRITORY, (languages.empty() ? "" : languages.front()) + "_",
                       {{"ID", "id"},
                        {"NAME", "name"},
                        {"ABBR", "abbreviation"},
                        {"OWN NAME", "own_name"},
                        {"CURRENCY", "currency"},
                        {"ISO", "currency_intl"}},
                       {text_item(LX_ITEM_TERRITORY_ABBREVIATION), text_item(LX_ITEM_TERRITORY_OWN_NAME),
                        text_item(LX_ITEM_CURRENCY), text_item(LX_ITEM_CURRENCY_INTL)},
                       json);
}

ExitStatus list_sorts(const CommonOptions& common, bool json) {
  const LibrarySession session(common.locale_directory);
  std::vector<Cells> rows = {{0, "Binary"}};
  for (const std::string& name : object_names(LX_SORT)) {
    uint32_t rc = LX_OK;
    rows.push_back({LXGetObjId(LXGetObjFromName(LXGetObjManager(), LX_SORT, name.c_str(), -1, 1, &rc)), name});
  }
  print_list({{"ID", "id"}, {"NAME", "name"}}, rows, json);
  if (rows.size() == 1) complain(message("the locale data hold no sort orders; the binary one is part of the library"));
  return ExitStatus::kExact;
}

ExitStatus list_native_names(const CommonOptions& common, bool json) {
  const LibrarySession session(common.locale_directory);
  std::vector<Cells> rows;
  for (const NativeRow& row : known_native_names()) {
    NativeNames back;
    if (const auto native = find_native_locale(row.native)) {
      uint32_t rc = LX_OK;
      const LocalePtr locale(LXGetLocale(native->locale_name.c_str(), 0, &rc));
      if (locale) back = native_names_of(locale.get());
    }
    rows.push_back({row.native, row.locale, text_or_null(back.exact), text_or_null(back.nearest)});
  }
  print_list({{"NATIVE", "native"}, {"LOCALE", "locale"}, {"BACK", "back"}, {"NEAREST", "nearest"}}, rows, json);
  return ExitStatus::kExact;
}

}  // namespace lx::tool
