// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <iterator>
#include <map>
#include <sstream>
#include <string_view>

#include "lint.hpp"

namespace lx::compiler {

namespace {

constexpr size_t kLongestText = 31;  // bytes, in the buffers of a locale
constexpr size_t kLongestSign = 3;   // bytes, of the negative sign
constexpr const char* kNegativeSignKey = "negative-sign";

// The combinations that have a name among the locales of the operating system. These objects must exist, and the texts
// must be representable in these code pages.
struct Home {
  const char* language;
  const char* code_pages;
  const char* territories;
};
constexpr Home kHomes[] = {
    {"English", "US-ASCII UTF-8", "UnitedStates"},
    {"English", "Latin1", "Australia Canada Ireland NewZealand UnitedKingdom UnitedStates"},
    {"German", "Latin1", "Austria German-Switzerland Germany"},
    {"French", "Latin1", "France French-Belgium French-Switzerland"},
    {"Spanish", "Latin1",
     "Argentina Bolivia Chile Columbia CostaRica Ecuador ElSalvador Guatemala Mexico Nicaragua Panama Paraguay Peru "
     "Spain Uruguay Venezuela"},
    {"Italian", "Latin1", "Italy"},
    {"Portuguese", "Latin1", "Brazil Portugal"},
    {"Norwegian", "Latin1", "Norway"},
    {"Swedish", "Latin1", "Sweden"},
    {"Danish", "Latin1", "Denmark"},
    {"Finnish", "Latin1", "Finland"},
    {"Japanese", "JapanEUC MS932", "Japan"},
    {"CanadianFrench", "Latin1", "French-Canada"},
    {"TraditionalChinese", "EUC-TW MS950", "Taiwan"},
    {"SimplifiedChinese", "MS936", "China"},
    {"Czech", "ISO-8859-2", "CzechRepublic"},
    {"Dutch", "Latin1", "Dutch-Belgium Netherlands"},
    {"Estonian", "ISO-8859-2 Latin1", "Estonia"},
    {"Greek", "ISO-8859-7", "Greece"},
    {"Hungarian", "ISO-8859-2", "Hungary"},
    {"Korean", "MS949 UTF-8", "Korea"},
    {"Latvian", "ISO-8859-4", "Latvia"},
    {"Lithuanian", "ISO-8859-4", "Lithuania"},
    {"Polish", "ISO-8859-2", "Poland"},
    {"Russian", "ISO-8859-5", "Russia"},
    {"Turkish", "ISO-8859-9", "Turkey"},
};

// Where a host page of the country, or of a language it shares, has "#" at another byte, which the formatting code
// would not recognise.
constexpr uint16_t kMovedNumberSign[] = {32,  57,  68,  125, 152, 170, 188, 208, 218, 222, 233, 246, 250, 320,
                                         380, 484, 558, 578, 591, 600, 604, 724, 752, 757, 792, 858, 862};

std::vector<std::string> words(const char* text) {
  std::istringstream stream(text);
  return {std::istream_iterator<std::string>(stream), {}};
}

template <class T>
const T* find_named(const std::vector<T>& objects, const std::string& name) {
  auto found = std::find_if(objects.begin(), objects.end(), [&](const T& object) { return object.name == name; });
  return found == objects.end() ? nullptr : &*found;
}

bool has_id(const std::vector<DirectoryEntry>& entries, ObjectType type, uint16_t id) {
  return std::any_of(entries.begin(), entries.end(),
                     [&](const DirectoryEntry& entry) { return entry.type == type && entry.id == id; });
}

// The first character of the text that the page lacks; 0 when it has them all.
char16_t lacking(const CodePage& page, const std::u16string& text) {
  auto found = std::find_if(text.begin(), text.end(), [&](char16_t c) { return page.from_unicode[c] == kNoCode; });
  return found == text.end() ? u'\0' : *found;
}

// With the shift bytes of a mixed page.
size_t encoded_length(const CodePage& page, const std::u16string& text) {
  size_t length = 0;
  bool double_byte = false;
  for (char16_t c : text) {
    unsigned count = code_length(page.from_unicode[c]);
    if (page.mixed() && double_byte != (count == 2)) {
      double_byte = !double_byte;
      ++length;
    }
    length += count;
  }
  return length + double_byte;
}

struct NamedText {
  const char* key;
  const std::u16string* text;
};

std::vector<NamedText> texts_of(const Language& language) {
  std::vector<NamedText> texts;
  for (unsigned slot = 0; slot < kLanguageTexts; ++slot) {
    texts.push_back({language_text_keys()[slot].c_str(), &language.texts[slot]});
  }
  return texts;
}

std::vector<NamedText> texts_of(const Territory& territory) {
  std::vector<NamedText> texts;
  for (unsigned i = 0; i < kTerritoryTexts; ++i) texts.push_back({kTerritoryTextKeys[i], &territory.texts[i]});
  return texts;
}

template <class T>
Spot spot_of(const T& object, const std::string& key) {
  auto found = object.spots.find(key);
  return found == object.spots.end() ? Spot{} : found->second;
}

// Formats consist of characters and the directives that the time functions know.
tool::Message format_fault(const std::u16string& format, bool number_sign_allowed) {
  constexpr std::u16string_view kDirectives = u"aAbBcdHIjmMpSUwWxXyY%", kFormatsThemselves = u"cxX";
  if (format.empty()) return tool::message("a format is needed");
  for (size_t i = 0; i < format.size(); ++i) {
    if (format[i] != u'%') continue;
    bool number_sign = ++i < format.size() && format[i] == u'#';
    if (number_sign) ++i;
    if (i == format.size() || kDirectives.find(format[i]) == std::u16string_view::npos)
      return tool::message("an unknown directive");
    if (kFormatsThemselves.find(format[i]) != std::u16string_view::npos)
      return tool::message("%c, %x and %X stand for these formats and cannot be part of one");
    if (number_sign && !number_sign_allowed)
      return tool::message("\"#\" cannot be used: the host page of this territory moves it");
  }
  return {};
}

// Group sizes with ";" between them, the last one 0.
bool is_grouping(const std::u16string& text) {
  size_t at = 0;
  for (;;) {
    size_t start = at;
    while (at < text.size() && text[at] >= u'0' && text[at] <= u'9') ++at;
    if (at == start || at - start > 2) return false;
    if (at == text.size()) return text[start] == u'0' && at - start == 1;
    if (text[start] == u'0' || text[at++] != u';') return false;
  }
}

bool is_capitals(const std::u16string& text, size_t length) {
  return text.size() == length &&
         std::all_of(text.begin(), text.end(), [](char16_t c) { return c >= u'A' && c <= u'Z'; });
}

}  // namespace

void lint_territory(const Territory& territory, Report& report) {
  auto error = [&](const std::string& key, const tool::Message& message) {
    report.error(territory.file, spot_of(territory, key), message);
  };
  for (unsigned i = 0; i < kSeparators; ++i) {
    char16_t c = territory.separators[i];
    if (c > 0x7E) error(kSeparatorKeys[i], "a separator must be an ASCII character: a locale keeps it in one byte");
    if (c != 0 && c < u' ') error(kSeparatorKeys[i], "a separator cannot be a control character");
    if (c >= u'0' && c <= u'9') error(kSeparatorKeys[i], "a separator cannot be a digit");
  }
  auto pair = [&](unsigned decimal, unsigned thousands) {
    if (territory.separators[decimal] == 0) error(kSeparatorKeys[decimal], "a decimal separator is needed");
    if (territory.separators[decimal] == territory.separators[thousands]) {
      error(kSeparatorKeys[thousands], "the same character as the decimal separator");
    }
  };
  pair(0, 1);
  pair(3, 4);
  bool number_sign =
      std::find(std::begin(kMovedNumberSign), std::end(kMovedNumberSign), territory.id) == std::end(kMovedNumberSign);
  for (TerritoryText which : {TerritoryText::time_format, TerritoryText::short_date, TerritoryText::long_date}) {
    tool::Message fault = format_fault(territory.text(which), number_sign);
    if (!fault.empty()) error(kTerritoryTextKeys[static_cast<unsigned>(which)], fault);
  }
  for (TerritoryText which : {TerritoryText::grouping, TerritoryText::monetary_grouping}) {
    if (!is_grouping(territory.text(which))) {
      error(kTerritoryTextKeys[static_cast<unsigned>(which)], "expected group sizes that end in 0, such as 3;0");
    }
  }
  for (TerritoryText which : {TerritoryText::abbreviation, TerritoryText::currency_intl}) {
    if (!is_capitals(territory.text(which), 3))
      error(kTerritoryTextKeys[static_cast<unsigned>(which)], "expected three capitals");
  }
  for (TerritoryText which : {TerritoryText::own_name, TerritoryText::currency}) {
    if (territory.text(which).empty()) error(kTerritoryTextKeys[static_cast<unsigned>(which)], "a text is needed");
  }
  // A negative amount without a sign, and not in parentheses either, would read as a positive one.
  const std::u16string& sign = territory.text(TerritoryText::negative_sign);
  if (sign.empty() && territory.negative.sign_position != 0) error(kNegativeSignKey, "a sign is needed");
  if (sign.size() > kLongestSign) error(kNegativeSignKey, "the sign is longer than 3 characters");
}

namespace {

class TreeLint {
 public:
  TreeLint(const SourceTree& tree, Report& report) : tree_(tree), report_(report), entries_(tree.entries()) {}

  void run() {
    for (const Language& language : tree_.languages) {
      default_ids(language);
      names(language);
    }
    for (const Home& home : kHomes) home_locale(home);
    for (const Language& language : tree_.languages) lengths(language);
    for (const Territory& territory : tree_.territories) lengths(territory);
    aliases();
  }

 private:
  void default_ids(const Language& language) {
    auto need = [&](const char* key, ObjectType type, uint16_t id) {
      if (!has_id(entries_, type, id)) {
        report_.error(language.file, spot_of(language, key), tool::message("there is no such {0}", type_name(type)));
      }
    };
    need("default-territory", ObjectType::territory, language.default_territory);
    need("default-codepage", ObjectType::code_page, language.default_code_page);
    if (language.default_sort != 0) need("default-sort", ObjectType::sort, language.default_sort);
  }

  // Programs show the names, and find the day or month in a date by the name that stands there.
  void names(const Language& language) {
    auto error = [&](const std::string& key, const tool::Message& message) {
      report_.error(language.file, spot_of(language, key), message);
    };
    std::map<std::pair<std::string, std::u16string>, std::string> keys;  // by kind of name ("day") and name
    for (const NamedText& named : texts_of(language)) {
      std::string key = named.key;
      size_t dot = key.find('.');
      if (language.spots.count(key) == 0) continue;  // no calendar here has a thirteenth month
      if (named.text->empty()) {
        error(key, "a text is needed");
      } else if (dot != std::string::npos) {
        auto [same, added] = keys.emplace(std::pair(key.substr(0, dot), *named.text), key);
        if (!added) error(key, tool::message("the same name as {0}", same->second));
      }
    }
    if (!is_capitals(language.texts[0], 2)) error("abbreviation", "expected two capitals");
  }

  template <class T>
  void representable(const T& object, const CodePage& page) {
    for (const NamedText& named : texts_of(object)) {
      if (char16_t c = lacking(page, *named.text)) {
        report_.error(object.file, spot_of(object, named.key),
                      tool::message("{0} does not exist in {1}", unicode_name(c), page.name));
      }
    }
  }

  template <class T>
  const T* need_named(ObjectType type, const std::vector<T>& objects, const std::string& name) {
    const T* object = find_named(objects, name);
    // There is no line to name, only the place where the object is missing.
    if (object == nullptr) report_.error(tree_.folder(type), tool::message("no object has the name \"{0}\"", name));
    return object;
  }

  void home_locale(const Home& home) {
    const Language* language = need_named(ObjectType::language, tree_.languages, home.language);
    std::vector<const Territory*> territories;
    for (const std::string& name : words(home.territories)) {
      if (const Territory* territory = need_named(ObjectType::territory, tree_.territories, name))
        territories.push_back(territory);
    }
    for (const std::string& name : words(home.code_pages)) {
      const CodePage* page = need_named(ObjectType::code_page, tree_.code_pages, name);
      if (page == nullptr) continue;
      if (language != nullptr) representable(*language, *page);
      for (const Territory* territory : territories) representable(*territory, *page);
    }
  }

  template <class T>
  void lengths(const T& object) {
    for (const NamedText& named : texts_of(object)) {
      size_t longest = named.key == std::string_view(kNegativeSignKey) ? kLongestSign : kLongestText;
      for (const CodePage& page : tree_.code_pages) {
        if (lacking(page, *named.text) != 0 || encoded_length(page, *named.text) <= longest) continue;
        report_.error(object.file, spot_of(object, named.key),
                      tool::message("longer than {0} bytes in {1}", longest, page.name));
        break;
      }
    }
  }

  void aliases() {
    for (const Alias& alias : tree_.aliases) {
      auto error = [&](const tool::Message& message) { report_.error(tree_.alias_file, alias.spot, message); };
      const CodePage* page = find_named(tree_.code_pages, alias.code_page);
      if (page == nullptr) {
        error(tool::message("there is no code page \"{0}\"", alias.code_page));
        continue;
      }
      for (const CodePage& other : tree_.code_pages) {
        if (&other == page) continue;
        if (folded(other.name) == folded(alias.alias))
          error(tool::message("\"{0}\" is the name of another code page", alias.alias));
        if (std::to_string(other.id) == alias.alias) {
          error(tool::message("{0} is the number of another code page", alias.alias));
        }
      }
    }
  }

  const SourceTree& tree_;
  Report& report_;
  std::vector<DirectoryEntry> entries_;
};

}  // namespace

void lint_tree(const SourceTree& tree, Report& report) { TreeLint(tree, report).run(); }

}  // namespace lx::compiler
