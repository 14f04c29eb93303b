// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/code_page_names.hpp"

#include <algorithm>
#include <charconv>
#include <map>
#include <numeric>
#include <utility>
#include <vector>

#include "tools/lexaro/failure.hpp"

namespace lx::tool {
namespace {

LXObjEntry* find_by_number(const std::string& digits) {
  uint16_t id = 0;
  const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), id);
  if (error != std::errc() || end != digits.data() + digits.size()) return nullptr;
  uint32_t rc = 0;
  return LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, id, 1, &rc);
}

LXObjEntry* find_entry(const std::string& wanted) {
  LXObjMgr* manager = LXGetObjManager();
  uint32_t rc = 0;
  if (auto* entry = LXGetObjFromName(manager, LX_CODEPAGE, wanted.c_str(), -1, 1, &rc)) return entry;
  if (const char* name = LXGetCodepageFromAlias(manager, wanted.c_str())) {
    if (auto* entry = LXGetObjFromName(manager, LX_CODEPAGE, name, -1, 1, &rc)) return entry;
  }
  return find_by_number(wanted);
}

// Letters and digits in lower case: "IBM_930", "ibm-930" and "Ibm 930" look alike to whoever mistypes them.
std::string plain_letters(const std::string& name) {
  std::string plain;
  for (char c : name) {
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    if ((c >= 'a' && c <= 'z') || (c >= '0' && c <= '9')) plain.push_back(c);
  }
  return plain;
}

// Insertions, deletions and replacements that turn one name into the other.
std::size_t edit_distance(const std::string& a, const std::string& b) {
  std::vector<std::size_t> row(b.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (std::size_t i = 0; i < a.size(); ++i) {
    std::size_t diagonal = std::exchange(row[0], i + 1);
    for (std::size_t j = 0; j < b.size(); ++j) {
      const std::size_t replaced = diagonal + (a[i] != b[j]);
      diagonal = row[j + 1];
      row[j + 1] = std::min({replaced, diagonal + 1, row[j] + 1});
    }
  }
  return row[b.size()];
}

// Collects the pages whose name or alias is close to a wanted one.
struct NearNames {
  explicit NearNames(const std::string& name) : wanted(plain_letters(name)), limit(1 + wanted.size() / 4) {}

  void offer(const char* name, const char* page) {
    const std::size_t distance = edit_distance(wanted, plain_letters(name));
    if (distance > limit || distance >= wanted.size()) return;
    const auto [known, fresh] = distances.try_emplace(page, distance);
    if (!fresh) known->second = std::min(known->second, distance);
  }

  std::vector<std::string> best() const {
    std::vector<std::pair<std::size_t, std::string>> ranked;
    for (const auto& [page, distance] : distances) ranked.emplace_back(distance, page);
    std::sort(ranked.begin(), ranked.end());
    std::vector<std::string> pages;
    for (const auto& [distance, page] : ranked) {
      if (distance > ranked.front().first || pages.size() == 4) break;
      pages.push_back(page);
    }
    return pages;
  }

  std::string wanted;
  std::size_t limit;
  std::map<std::string, std::size_t> distances;
};

int32_t offer_page(void* context, uint8_t type, const char* name) {
  if (type == LX_CODEPAGE) static_cast<NearNames*>(context)->offer(name, name);
  return 1;
}

int32_t offer_alias(void* context, const char* alias, const char* page) {
  static_cast<NearNames*>(context)->offer(alias, page);
  return 1;
}

std::string near_names(const std::string& wanted) {
  NearNames names(wanted);
  LXEnumLocales(offer_page, &names, 0);
  LXEnumAliases(LXGetObjManager(), offer_alias, &names);
  const std::vector<std::string> pages = names.best();
  std::string text;
  for (std::size_t i = 0; i < pages.size(); ++i) {
    if (i != 0) text += i + 1 == pages.size() ? " or " : ", ";
    text += pages[i];
  }
  return text;
}

// Encodings of two and four byte units have no code page, which deserves a better answer than "unknown".
bool is_wide_encoding(const std::string& wanted) {
  const std::string plain = plain_letters(wanted);
  for (const char* prefix : {"ucs2", "ucs4", "utf16", "utf32", "iso10646", "csucs", "csunicode", "unicodelittle",
                             "unicodebig", "unicodefffe"}) {
    if (plain.starts_with(prefix)) return true;
  }
  return plain == "1200" || plain == "1201" || plain == "unicode" || plain == "wchart";
}

Failure unknown_code_page(const std::string& wanted) {
  const std::string shown = display_name(wanted);
  if (is_wide_encoding(wanted)) {
    return {ExitStatus::kCodePage, shown +
                                       " is not a code page: texts of two or four byte units are not converted; "
                                       "the Unicode page is UTF-8"};
  }
  std::string message = "unknown code page \"" + shown + "\"";
  if (const std::string names = near_names(wanted); !names.empty()) message += "; did you mean " + names + "?";
  return {ExitStatus::kCodePage, message + "\n\"lexaro list codepages --aliases\" shows all names."};
}

}  // namespace

CodePage open_code_page(const std::string& wanted) {
  // "@" would end the code page's part of a locale name.
  LXObjEntry* entry = wanted.empty() || wanted.find('@') != std::string::npos ? nullptr : find_entry(wanted);
  if (!entry) throw unknown_code_page(wanted);

  CodePage page;
  page.name = LXGetObjName(entry);
  page.id = LXGetObjId(entry);
  uint32_t rc = 0;
  if (!LXLoadObj(LXGetObjManager(), entry, &rc) || rc != LX_OK) {
    throw Failure(ExitStatus::kCodePage, "code page " + page.name + ": " + describe_status(rc));
  }
  page.locale.reset(LXGetLocale(("English_UnitedStates." + page.name + "@BINARY").c_str(), 0, &rc));
  if (!page.locale || LXGetLocaleObject(page.locale.get(), LX_CODEPAGE) != entry) {
    throw Failure(ExitStatus::kCodePage,
                  "code page " + page.name + ": no locale with it (" + describe_status(rc) + ")");
  }
  return page;
}

}  // namespace lx::tool
