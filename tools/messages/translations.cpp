// SPDX-License-Identifier: Apache-2.0
#include "tools/messages/translations.hpp"

#include <algorithm>
#include <array>
#include <cctype>
#include <cstdlib>
#include <exception>
#include <memory>
#include <unordered_map>
#include <vector>

#include "tools/lexaro/data_directory.hpp"
#include "tools/lexaro/environment_locale.hpp"
#include "tools/lexaro/library_session.hpp"
#include "tools/lexaro/locale_items.hpp"
#include "tools/lexaro/native_locale.hpp"
#include "tools/lexaro/terminal_text.hpp"

namespace lx::tool {
namespace {

constexpr char kCatalogName[] = "lexaro";
constexpr std::size_t kMostUnits = 8192;  // of a message
constexpr std::size_t kNoPart = 10;

using Translations = std::unordered_map<std::string, Translation>;

struct CatalogDeleter {
  void operator()(LXCatalog* catalog) const { LXCloseCatalog(catalog, 0); }
};
using CatalogPtr = std::unique_ptr<LXCatalog, CatalogDeleter>;

// The library runs while this lives, on the data of the command if that has begun, else on those of the installation.
class Library {
 public:
  Library() {
    const std::string directory = usual_data_directory();
    status_ = LXInit(directory.c_str(), nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS);
  }
  Library(const Library&) = delete;
  Library& operator=(const Library&) = delete;
  ~Library() {
    if (status_ == LX_OK || status_ == LX_E_DEFAULTS) LXTerm();
  }
  bool usable() const { return status_ == LX_OK; }

 private:
  uint32_t status_;
};

bool is_set(const char* variable) {
  const char* value = std::getenv(variable);
  return value && *value;
}

// Most users need not wait for any catalog.
bool may_read_other_texts() {
  const std::string locale = environment_locale("LC_MESSAGES");
  const std::string stem = locale.substr(0, locale.find_first_of(".@"));
  if (stem == "C" || stem == "POSIX") return false;
  return is_set("LX_LANG") || is_set("LX_NLSPATH") || (stem != "en" && !stem.starts_with("en_"));
}

LocalePtr open_user_language() {
  const std::string name = is_set("LX_LANG") ? std::getenv("LX_LANG") : environment_locale("LC_MESSAGES");
  uint32_t rc = LX_OK;
  if (is_set("LX_LANG")) {
    if (LocalePtr locale{LXGetLocale(name.c_str(), 0, &rc)}) return locale;
  }
  const auto native = find_native_locale(name);
  return LocalePtr(native ? LXGetLocale(native->locale_name.c_str(), 0, &rc) : nullptr);
}

CatalogPtr load_file(LXLocale* locale, const std::string& path) {
  uint32_t rc = LX_OK;
  LXFile* file = LXOpenFile(0, path.c_str(), 0, 0, &rc);
  if (!file) return nullptr;
  CatalogPtr catalog(LXMcLoadCat(locale, file, 1, &rc));
  if (!catalog) LXCloseFile(file, 1);
  return catalog;
}

// The installation's catalog of a language by its two letters.
CatalogPtr load_own(LXLocale* locale, std::string language) {
  for (char& c : language) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  for (const std::string& directory : program_share_directories()) {
    if (CatalogPtr catalog = load_file(locale, directory + "/messages/" + kCatalogName + "." + language + ".cat")) {
      return catalog;
    }
  }
  return nullptr;
}

std::vector<LXUChar> text_of(LXCatalog* catalog, uint32_t set, int32_t number) {
  std::vector<LXUChar> text(kMostUnits);
  if (LXGetMessageU(catalog, set, number, text.data(), kMostUnits, nullptr, 0) != LX_OK) return {};
  text.erase(std::find(text.begin(), text.end(), LXUChar{0}), text.end());
  return text;
}

bool same_parts(std::string_view a, std::string_view b) {
  const auto used = [](std::string_view text) {
    std::array<bool, kNoPart + 1> found{};
    for (std::size_t at = 0; at < text.size(); ++at) found[part_at(text, at)] = true;
    found[kNoPart] = true;
    return found;
  };
  return used(a) == used(b);
}

// A text that the terminal cannot show, or that lacks a part of the message, is worse than the English one.
void add(Translations& all, const std::string& english, const std::vector<LXUChar>& text, const Terminal& terminal) {
  Translation translation{utf8_of(text), ""};
  if (text.empty() || !same_parts(english, translation.utf8)) return;
  translation.terminal = terminal.encode(translation.utf8);
  const auto marks = [](const std::string& bytes) { return std::count(bytes.begin(), bytes.end(), '?'); };
  if (marks(translation.terminal) == marks(translation.utf8)) all[english] = std::move(translation);
}

Translations read_catalogs() {
  Translations all;
  const Library library;
  const LocalePtr locale(library.usable() ? open_user_language() : nullptr);
  const CatalogPtr english(locale ? load_own(locale.get(), "en") : nullptr);
  if (!english) return all;
  // What the user names goes before what is installed.
  std::vector<CatalogPtr> catalogs;
  catalogs.push_back(load_own(locale.get(), read_text(locale.get(), LX_ITEM_LANGUAGE_ABBREVIATION)));
  if (is_set("LX_NLSPATH")) catalogs.emplace_back(LXOpenCatalog(locale.get(), "", kCatalogName, LX_CAT_LOAD));

  const Terminal terminal;
  uint32_t set = 0;
  for (bool more = true; more;) {
    ++set;
    more = false;
    for (int32_t number = 1;; ++number) {
      const std::string key = utf8_of(text_of(english.get(), set, number));
      if (key.empty()) break;
      more = true;
      for (const CatalogPtr& catalog : catalogs) {
        if (catalog) add(all, key, text_of(catalog.get(), set, number), terminal);
      }
    }
  }
  return all;
}

// Those who read the catalogs may have something to tell themselves: in English.
const Translations& translations() {
  static Translations all;
  static bool begun = false;
  if (begun) return all;
  begun = true;
  if (!may_read_other_texts()) return all;
  try {
    all = read_catalogs();
  } catch (const std::exception&) {
    all.clear();
  }
  return all;
}

}  // namespace

const Translation* find_translation(std::string_view english) {
  const Translations& all = translations();
  if (all.empty()) return nullptr;
  const auto found = all.find(std::string(english));
  return found == all.end() ? nullptr : &found->second;
}

bool has_translations() { return !translations().empty(); }

std::size_t part_at(std::string_view text, std::size_t at) {
  const std::string_view field = text.substr(at, kPartSize);
  const bool is_one = field.size() == kPartSize && field[0] == '{' && field[2] == '}' &&
                      std::isdigit(static_cast<unsigned char>(field[1])) != 0;
  return is_one ? static_cast<std::size_t>(field[1] - '0') : kNoPart;
}

}  // namespace lx::tool
