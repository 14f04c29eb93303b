// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/code_page_names.hpp"

#include <charconv>

#include "tools/lexaro/failure.hpp"
#include "tools/lexaro/near_names.hpp"

namespace lx::tool {
namespace {

LXObjEntry* find_by_number(const std::string& digits) {
  uint16_t id = 0;
  const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), id);
  if (error != std::errc() || end != digits.data() + digits.size()) return nullptr;
  uint32_t rc = 0;
  return LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, id, 1, &rc);
}

int32_t offer_page(void* context, uint8_t type, const char* name) {
  if (type == LX_CODEPAGE) static_cast<NearNames*>(context)->offer(name, name);
  return 1;
}

int32_t offer_alias(void* context, const char* alias, const char* page) {
  static_cast<NearNames*>(context)->offer(alias, page);
  return 1;
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

}  // namespace

LXObjEntry* find_code_page(const std::string& wanted) {
  LXObjMgr* manager = LXGetObjManager();
  uint32_t rc = 0;
  if (auto* entry = LXGetObjFromName(manager, LX_CODEPAGE, wanted.c_str(), -1, 1, &rc)) return entry;
  if (const char* name = LXGetCodepageFromAlias(manager, wanted.c_str())) {
    if (auto* entry = LXGetObjFromName(manager, LX_CODEPAGE, name, -1, 1, &rc)) return entry;
  }
  return find_by_number(wanted);
}

Failure unknown_code_page(const std::string& wanted) {
  const Message shown = display_name(wanted);
  if (is_wide_encoding(wanted)) {
    return {ExitStatus::kCodePage, message("{0} is not a code page: texts of two or four byte units are not converted; "
                                           "the Unicode page is UTF-8",
                                           shown)};
  }
  NearNames names(wanted);
  LXEnumLocales(offer_page, &names, 0);
  LXEnumAliases(LXGetObjManager(), offer_alias, &names);
  return {ExitStatus::kCodePage, message("unknown code page \"{0}\"", shown) + names.question() + "\n" +
                                     message("\"lexaro list codepages --aliases\" shows all names.")};
}

CodePage open_code_page(const std::string& wanted) {
  // "@" would end the code page's part of a locale name.
  LXObjEntry* entry = wanted.empty() || wanted.find('@') != std::string::npos ? nullptr : find_code_page(wanted);
  if (!entry) throw unknown_code_page(wanted);

  CodePage page;
  page.name = LXGetObjName(entry);
  page.id = LXGetObjId(entry);
  uint32_t rc = 0;
  if (!LXLoadObj(LXGetObjManager(), entry, &rc) || rc != LX_OK) {
    throw Failure(ExitStatus::kCodePage, message("code page {0}: {1}", page.name, describe_status(rc)));
  }
  page.locale.reset(LXGetLocale(("English_UnitedStates." + page.name + "@BINARY").c_str(), 0, &rc));
  if (!page.locale || LXGetLocaleObject(page.locale.get(), LX_CODEPAGE) != entry) {
    throw Failure(ExitStatus::kCodePage,
                  message("code page {0}: no locale with it ({1})", page.name, describe_status(rc)));
  }
  return page;
}

}  // namespace lx::tool
