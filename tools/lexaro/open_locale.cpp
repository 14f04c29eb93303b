// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/open_locale.hpp"

#include <cstdlib>

#include "tools/lexaro/code_page_names.hpp"
#include "tools/lexaro/environment_locale.hpp"
#include "tools/lexaro/failure.hpp"
#include "tools/lexaro/locale_items.hpp"
#include "tools/lexaro/native_locale.hpp"
#include "tools/lexaro/near_names.hpp"
#include "tools/lexaro/object_names.hpp"

namespace lx::tool {
namespace {

bool is_unknown_part(uint32_t status) {
  return status == LX_E_LANGUAGE || status == LX_E_TERRITORY || status == LX_E_CODEPAGE || status == LX_E_SORT;
}

Failure unusable(const std::string& name, uint32_t status) {
  const Message why =
      status == LX_E_MANAGER ? message("a part of its data is missing or damaged") : describe_status(status);
  return {ExitStatus::kCodePage, message("locale {0}: {1}", display_name(name), why)};
}

// The part of a locale name that follows one delimiter (0: the first part) and ends at others.
std::string part_of(const std::string& name, char before, const char* after) {
  const std::size_t begin = before == 0 ? 0 : name.find(before) + 1;
  return name.substr(begin, name.find_first_of(after, begin) - begin);
}

Failure unknown_part(uint8_t type, const Message& what, const char* list, const std::string& wanted) {
  NearNames names(wanted);
  for (const std::string& name : object_names(type)) names.offer(name.c_str(), name.c_str());
  return {ExitStatus::kCodePage,
          what + names.question() + "\n" + message("\"lexaro list {0}\" shows all names.", list)};
}

Failure unknown_locale(const std::string& name, uint32_t status) {
  const auto unknown = [](const char* text, uint8_t type, const char* list, const std::string& wanted) {
    return unknown_part(type, message(text, display_name(wanted)), list, wanted);
  };
  switch (status) {
    case LX_E_LANGUAGE:
      return unknown("unknown locale or language \"{0}\"", LX_LANGUAGE, "languages", part_of(name, 0, "_.@"));
    case LX_E_TERRITORY:
      return unknown("unknown territory \"{0}\"", LX_TERRITORY, "territories", part_of(name, '_', ".@"));
    case LX_E_CODEPAGE:
      return unknown_code_page(part_of(name, '.', "@"));
    case LX_E_SORT:
      return unknown("unknown sort \"{0}\"", LX_SORT, "sorts", part_of(name, '@', ""));
    default:
      return unusable(name, status);
  }
}

LocalePtr open_existing(const std::string& name) {
  uint32_t rc = LX_OK;
  LocalePtr locale(LXGetLocale(name.c_str(), 0, &rc));
  if (!locale) throw unusable(name, rc);
  return locale;
}

void tell_taken(const std::string& name, LXLocale* locale, const std::vector<Message>& missed) {
  Message parts;
  for (const Message& part : missed) parts += (parts.empty() ? "" : ", ") + part;
  const std::string taken = read_text(locale, LX_ITEM_LOCALE_NAME);
  complain(missed.empty() ? message("{0} is taken as {1}", display_name(name), taken)
                          : message("{0} is taken as {1} (not found: {2})", display_name(name), taken, parts));
}

LocalePtr open_native(const std::string& name) {
  const auto native = find_native_locale(name);
  if (!native) return nullptr;
  LocalePtr locale = open_existing(native->locale_name);
  if (!native->exact()) tell_taken(name, locale.get(), native->missed);
  return locale;
}

}  // namespace

LocalePtr open_locale(const std::string& name) {
  uint32_t rc = LX_OK;
  LocalePtr locale(LXGetLocale(name.c_str(), 0, &rc));
  if (!locale && rc == LX_E_LANGUAGE) locale = open_native(name);
  if (!locale) throw unknown_locale(name, rc);
  return locale;
}

LocalePtr open_user_locale() {
  uint32_t rc = LX_OK;
  if (LocalePtr locale{LXGetLocale(nullptr, LX_GET_USER, &rc)}) return locale;
  const char* chosen = std::getenv("LX_LANG");
  const std::string name = chosen ? chosen : environment_locale();
  if (!is_unknown_part(rc)) throw unusable(name, rc);
  if (LocalePtr locale = open_native(name)) return locale;
  const uint32_t reason = rc;
  LocalePtr locale(LXGetLocale(name.c_str(), LX_GET_SUBSTITUTE, &rc));
  if (!locale) throw unusable(name, rc);
  complain(message("the locale \"{0}\" of {1} is not known ({2}); {3} serves instead", display_name(name),
                   chosen ? Message("LX_LANG") : message("the system"), describe_status(reason),
                   read_text(locale.get(), LX_ITEM_LOCALE_NAME)));
  return locale;
}

}  // namespace lx::tool
