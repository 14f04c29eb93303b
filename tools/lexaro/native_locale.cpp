// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/native_locale.hpp"

#include <algorithm>
#include <iterator>
#include <sstream>

#include "tools/lexaro/code_page_names.hpp"
#include "tools/lexaro/environment_locale.hpp"
#include "tools/lexaro/library_session.hpp"
#include "tools/lexaro/locale_items.hpp"
#include "tools/lexaro/native_names.hpp"
#include "tools/lexaro/object_names.hpp"

namespace lx::tool {
namespace {

// ISO 3166 codes: system names have two letters, territories three. ("UK" stands in old system names.)
struct Country {
  const char* two_letters;
  const char* three_letters;
};
constexpr Country kCountries[] = {
    {"AR", "ARG"}, {"AT", "AUT"}, {"AU", "AUS"}, {"BE", "BEL"}, {"BO", "BOL"}, {"BR", "BRA"}, {"CA", "CAN"},
    {"CH", "CHE"}, {"CL", "CHL"}, {"CN", "CHN"}, {"CO", "COL"}, {"CR", "CRI"}, {"CZ", "CZE"}, {"DE", "DEU"},
    {"DK", "DNK"}, {"EC", "ECU"}, {"EE", "EST"}, {"ES", "ESP"}, {"FI", "FIN"}, {"FR", "FRA"}, {"GB", "GBR"},
    {"GR", "GRC"}, {"GT", "GTM"}, {"HU", "HUN"}, {"IE", "IRL"}, {"IT", "ITA"}, {"JP", "JPN"}, {"KR", "KOR"},
    {"LT", "LTU"}, {"LV", "LVA"}, {"MX", "MEX"}, {"NI", "NIC"}, {"NL", "NLD"}, {"NO", "NOR"}, {"NZ", "NZL"},
    {"PA", "PAN"}, {"PE", "PER"}, {"PL", "POL"}, {"PT", "PRT"}, {"PY", "PRY"}, {"RU", "RUS"}, {"SE", "SWE"},
    {"SV", "SLV"}, {"TR", "TUR"}, {"TW", "TWN"}, {"UK", "GBR"}, {"US", "USA"}, {"UY", "URY"}, {"VE", "VEN"}};

struct Parts {
  std::string language;
  std::string territory;
  std::string code_page;
  std::string sort;
};

// The row of the library's table.
std::optional<Parts> table_row(const std::string& native_name) {
  std::istringstream stream(mapped_native_name(native_name));
  Parts parts;
  std::getline(stream, parts.language, '_');
  std::getline(stream, parts.territory, '.');
  std::getline(stream, parts.code_page, '@');
  std::getline(stream, parts.sort);
  if (parts.sort.empty()) return std::nullopt;
  return parts;
}

// An object by the abbreviation in its item, in a locale that is completed by `prefix` and defaults.
std::string find_by_abbreviation(uint8_t type, uint32_t item, const std::string& prefix, const std::string& wanted) {
  for (const std::string& name : object_names(type)) {
    uint32_t rc = 0;
    const LocalePtr locale(LXGetLocale((prefix + name).c_str(), 0, &rc));
    if (!locale) continue;
    const std::string own = read_text(locale.get(), item, ValueSource::kTerritory);
    if (own.size() == wanted.size() && LXmemicmp(own.data(), wanted.data(), own.size()) == 0) return name;
  }
  return "";
}

std::string language_of_code(const std::string& code) {
  const bool norwegian = code == "nb" || code == "nn";  // written forms of one language
  return find_by_abbreviation(LX_LANGUAGE, LX_ITEM_LANGUAGE_ABBREVIATION, "", norwegian ? "no" : code);
}

std::string territory_of_code(const std::string& language, const std::string& code) {
  const auto* country = std::find_if(std::begin(kCountries), std::end(kCountries),
                                     [&](const Country& c) { return c.two_letters == code; });
  if (country == std::end(kCountries)) return "";
  return find_by_abbreviation(LX_TERRITORY, LX_ITEM_TERRITORY_ABBREVIATION, language + "_", country->three_letters);
}

struct Reading {
  Parts parts;
  bool listed = true;
  std::vector<Message> missed;
};

// Language and territory of a name without code set and modifier.
std::optional<Parts> read_stem(const std::string& stem, std::vector<Message>& missed) {
  if (auto row = table_row(stem)) return row;
  const std::size_t cut = std::min(stem.find('_'), stem.size());
  const std::string language = stem.substr(0, cut);
  Parts parts = table_row(language).value_or(Parts{});
  if (parts.language.empty()) parts.language = language_of_code(language);
  if (parts.language.empty()) return std::nullopt;
  if (cut == stem.size()) return parts;
  const std::string territory = stem.substr(cut + 1);
  if (std::string found = territory_of_code(parts.language, territory); !found.empty()) {
    parts.territory = found;
  } else {
    missed.push_back(message("territory {0}", plain_name(territory)));
  }
  return parts;
}

// One name, not a composite one.
std::optional<Reading> read_name(const std::string& name) {
  if (auto row = table_row(name)) return Reading{*row, true, {}};
  const std::size_t end = std::min(name.find('@'), name.size());
  Reading reading;
  reading.listed = false;
  if (end < name.size()) reading.missed.push_back(message("modifier {0}", plain_name(name.substr(end + 1))));
  if (auto row = table_row(name.substr(0, end))) {
    reading.parts = *row;
    return reading;
  }
  auto parts = read_stem(name.substr(0, std::min(end, name.find('.'))), reading.missed);
  if (!parts) return std::nullopt;
  reading.parts = *parts;
  if (const std::string code_set = code_set_of(name); !code_set.empty()) {
    if (const LXObjEntry* page = find_code_page(code_set)) {
      reading.parts.code_page = LXGetObjName(page);
    } else {
      reading.missed.push_back(message("code set {0}", plain_name(code_set)));
    }
  }
  return reading;
}

// A name for each of code page, territory, language and sort.
std::optional<Reading> read_composite(const std::string& names) {
  Reading whole;
  std::istringstream stream(names.substr(1));
  for (std::string Parts::*part : {&Parts::code_page, &Parts::territory, &Parts::language, &Parts::sort}) {
    std::string name;
    std::getline(stream, name, '/');
    const auto reading = read_name(name);
    if (reading) {
      whole.parts.*part = reading->parts.*part;
      whole.listed = whole.listed && reading->listed;
      whole.missed.insert(whole.missed.end(), reading->missed.begin(), reading->missed.end());
    } else {
      whole.missed.push_back(message("system locale \"{0}\"", plain_name(name)));
    }
  }
  return whole;
}

// A part that the locale data lack is left to the language's default.
void keep_existing(uint8_t type, const char* title, std::string& part, std::vector<Message>& missed) {
  if (part.empty() || object_exists(type, part)) return;
  missed.push_back(message(title, plain_name(part)));
  part.clear();
}

}  // namespace

std::optional<NativeLocale> find_native_locale(const std::string& native_name) {
  auto reading = native_name.starts_with('/') ? read_composite(native_name) : read_name(native_name);
  if (!reading || reading->parts.language.empty()) return std::nullopt;
  Parts& parts = reading->parts;
  if (!object_exists(LX_LANGUAGE, parts.language)) return std::nullopt;
  NativeLocale result{"", reading->listed, std::move(reading->missed)};
  keep_existing(LX_TERRITORY, "territory {0}", parts.territory, result.missed);
  keep_existing(LX_CODEPAGE, "code page {0}", parts.code_page, result.missed);
  // Only who gave a name of the table can know that a sort belongs to it.
  std::vector<Message> unasked;
  keep_existing(LX_SORT, "sort {0}", parts.sort, result.listed ? result.missed : unasked);
  const auto less = [](const Message& a, const Message& b) { return a.english < b.english; };
  const auto equal = [](const Message& a, const Message& b) { return a.english == b.english; };
  std::sort(result.missed.begin(), result.missed.end(), less);
  result.missed.erase(std::unique(result.missed.begin(), result.missed.end(), equal), result.missed.end());
  result.locale_name = parts.language + "_" + parts.territory + "." + parts.code_page + "@" + parts.sort;
  return result;
}

}  // namespace lx::tool
