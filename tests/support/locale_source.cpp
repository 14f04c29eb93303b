// SPDX-License-Identifier: Apache-2.0
#include "support/locale_source.hpp"

#include <lexaro/lexaro.h>

#include <filesystem>
#include <fstream>
#include <sstream>

#include "support/page_source.hpp"

namespace lx::test {
namespace {

// A value as it is meant: without its quotes and escapes.
std::u16string unquoted(std::string_view value) {
  std::u16string text = utf16(value);
  if (text.size() > 1 && text.front() == u'"') text = text.substr(1, text.size() - 2);
  std::u16string plain;
  for (size_t i = 0; i < text.size(); ++i) {
    if (text[i] == u'\\' && text[++i] == u'u') {
      const std::string digits(text.begin() + static_cast<ptrdiff_t>(i) + 1,
                               text.begin() + static_cast<ptrdiff_t>(i) + 5);
      plain += static_cast<char16_t>(std::stoul(digits, nullptr, 16));
      i += 4;
    } else {
      plain += text[i];
    }
  }
  return plain;
}

struct Object {
  uint16_t id;
  std::string file;
};

// The objects of a type by their names, from the heads of the files: "id = 1" or "id 1".
const std::map<std::string, Object, std::less<>>& objects(uint8_t type) {
  static std::map<std::string, Object, std::less<>> all[4];
  if (!all[type].empty()) return all[type];
  const char* const folders[] = {"/language", "/territory", "/codepage", "/collation"};
  for (const auto& file : std::filesystem::directory_iterator(std::string(LEXARO_SOURCE_DATA) + folders[type])) {
    std::ifstream in(file.path());
    std::string name;
    uint16_t id = 0;
    for (std::string line; name.empty() && std::getline(in, line);) {
      std::istringstream words(line);
      std::string key, value;
      words >> key >> value;
      if (value == "=") words >> value;
      if (key == "id") id = static_cast<uint16_t>(std::stoi(value));
      if (key == "name") name = value;
    }
    all[type][name] = {id, file.path().string()};
  }
  return all[type];
}

std::string language_key(uint32_t item) {
  static const char* const kDays[] = {"sun", "mon", "tue", "wed", "thu", "fri", "sat"};
  if (item == 3) return "abbreviation";
  if (item == 4) return "own-name";
  if (item >= 16 && item <= 22) return std::string("day.") + kDays[item - 16];
  if (item >= 23 && item <= 29) return std::string("abday.") + kDays[item - 23];
  if (item >= 30 && item <= 42) return "month." + std::to_string(item - 29);
  if (item >= 43 && item <= 55) return "abmonth." + std::to_string(item - 42);
  return item == 56 ? "am" : item == 57 ? "pm" : "";
}

const std::map<uint32_t, std::string> kTerritoryTexts = {
    {7, "abbreviation"},   {8, "own-name"},       {59, "decimal"},      {60, "thousands"},
    {61, "list"},          {62, "grouping"},      {64, "currency"},     {65, "currency-intl"},
    {66, "mon-decimal"},   {67, "mon-thousands"}, {68, "mon-grouping"}, {71, "positive-sign"},
    {72, "negative-sign"}, {79, "time"},          {80, "short-date"},   {81, "long-date"}};
const std::map<uint32_t, std::string> kTerritoryNumbers = {{58, "item58"},
                                                           {63, "fraction-digits"},
                                                           {69, "mon-digits"},
                                                           {70, "mon-digits-intl"},
                                                           {73, "positive precedes"},
                                                           {74, "positive space"},
                                                           {75, "negative precedes"},
                                                           {76, "negative space"},
                                                           {77, "positive sign"},
                                                           {78, "negative sign"},
                                                           {82, "item82"},
                                                           {83, "item83"},
                                                           {84, "item84"}};

}  // namespace

const LocaleSource& LocaleSource::of(uint8_t type, std::string_view name) {
  static std::map<std::string, LocaleSource, std::less<>> read[2];
  auto found = read[type].find(name);
  if (found == read[type].end()) {
    const std::string key(name);
    found = read[type].emplace(key, LocaleSource(type, objects(type).at(key).file)).first;
  }
  return found->second;
}

uint16_t LocaleSource::id_of(uint8_t type, std::string_view name) { return objects(type).at(std::string(name)).id; }

std::string LocaleSource::name_of(uint8_t type, uint16_t id) {
  for (const auto& [name, object] : objects(type)) {
    if (object.id == id) return name;
  }
  return "";
}

LocaleSource::LocaleSource(uint8_t object_type, const std::string& file) : type(object_type) {
  std::ifstream in(file);
  for (std::string line; std::getline(in, line);) {
    size_t equals = line.find(" = ");
    if (line.empty() || line[0] == '#' || equals == std::string::npos) continue;
    std::string key = line.substr(0, equals);
    std::string value = line.substr(equals + 3);
    values_[key] = unquoted(value);
    std::istringstream words(value);  // "precedes 1 space 0 sign 3"
    std::string word, number;
    if (key == "positive" || key == "negative") {
      while (words >> word >> number) values_[key + " " + word] = utf16(number);
    }
  }
  id = static_cast<uint16_t>(number_of("id"));
  for (char16_t unit : values_.at("name")) name += static_cast<char>(unit);
}

int32_t LocaleSource::number_of(const std::string& key) const {
  const std::u16string& digits = values_.at(key);
  return std::stoi(std::string(digits.begin(), digits.end()));
}

std::optional<std::u16string> LocaleSource::text(uint32_t item) const {
  std::string key = type == LX_LANGUAGE              ? language_key(item)
                    : kTerritoryTexts.contains(item) ? kTerritoryTexts.at(item)
                                                     : "";
  if (key.empty()) return std::nullopt;
  if (item == 42 || item == 55) return values_.contains(key) ? values_.at(key) : u"";
  return values_.at(key);
}

std::optional<int32_t> LocaleSource::number(uint32_t item) const {
  if (type != LX_TERRITORY || !kTerritoryNumbers.contains(item)) return std::nullopt;
  return number_of(kTerritoryNumbers.at(item));
}

uint16_t LocaleSource::default_id(uint8_t of_type) const {
  const char* const keys[] = {"", "default-territory", "default-codepage", "default-sort"};
  return static_cast<uint16_t>(number_of(keys[of_type]));
}

std::u16string utf16(std::string_view utf8) {
  const PageSource& page = PageSource::of(LX_CP_UTF8);
  std::u16string text;
  while (!utf8.empty()) {
    size_t length = page.length_of(static_cast<uint8_t>(utf8[0]));
    text += static_cast<char16_t>(page.decode(utf8.substr(0, length)));
    utf8.remove_prefix(length);
  }
  return text;
}

}  // namespace lx::test
