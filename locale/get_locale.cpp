// SPDX-License-Identifier: Apache-2.0
// A locale from its name, and the process default.
#include <cstring>

#include "codepage/text/text_kinds.hpp"
#include "frame/library.hpp"
#include "locale/locale.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "locale", 0};

constexpr char kEnglish[] = "English";
constexpr uint32_t kOptions = LX_GET_USER | LX_GET_SUBSTITUTE;

// A part of a locale name, of either kind of text.
template <class Unit>
struct Part {
  const Unit* text;
  size_t length;
  bool empty() const { return length == 0; }
};

// Cuts a name at its delimiters.
template <class Unit>
class NameParts {
 public:
  explicit NameParts(const Unit* name) : at_(name) {}

  Part<Unit> language() { return take('_', '.', '@'); }
  Part<Unit> territory() { return after('_') ? take('.', '@', '@') : Part<Unit>{at_, 0}; }
  Part<Unit> code_page() { return after('.') ? take('@', '@', '@') : Part<Unit>{at_, 0}; }
  Part<Unit> sort() { return after('@') ? take('\0', '\0', '\0') : Part<Unit>{at_, 0}; }

 private:
  static bool is(Unit unit, char delimiter) { return unit == static_cast<Unit>(delimiter); }
  bool after(char delimiter) {
    if (!is(*at_, delimiter)) return false;
    ++at_;
    return true;
  }
  Part<Unit> take(char first, char second, char third) {
    const Unit* begin = at_;
    while (*at_ != 0 && !is(*at_, first) && !is(*at_, second) && !is(*at_, third)) ++at_;
    return {begin, static_cast<size_t>(at_ - begin)};
  }

  const Unit* at_;
};

int32_t part_length(size_t length) { return length > INT32_MAX ? INT32_MAX : static_cast<int32_t>(length); }

LXObjEntry* look_up(uint8_t type, const Part<char>& part, uint32_t& rc) {
  return LXGetObjFromName(LXGetObjManager(), type, part.text, part_length(part.length), 0, &rc);
}
LXObjEntry* look_up(uint8_t type, const Part<LXWChar>& part, uint32_t& rc) {
  return LXGetObjFromNameW(LXGetObjManager(), type, part.text, part_length(part.length), 0, &rc);
}

// Code pages are known by their aliases too; object names come first.
template <class Unit>
LXObjEntry* look_up_by_alias(const Part<Unit>& part, uint32_t& rc) {
  char alias[65];
  if (part.length >= sizeof alias) return nullptr;
  for (size_t i = 0; i < part.length; ++i) alias[i] = static_cast<char>(part.text[i] & 0xFF);
  alias[part.length] = '\0';
  const char* name = LXGetCodepageFromAlias(LXGetObjManager(), alias);
  return name != nullptr ? LXGetObjFromName(LXGetObjManager(), LX_CODEPAGE, name, -1, 0, &rc) : nullptr;
}

// What a failed lookup of a part means for the whole name.
uint32_t failure_of(uint32_t rc, uint32_t not_found) {
  if (rc == LX_E_NOTFOUND) return not_found;
  return rc == LX_E_MEMORY ? LX_E_MEMORY : LX_E_MANAGER;
}

// The parts of a name: what they are called in messages, and the status when one is not found.
struct PartKind {
  uint8_t type;
  const char* title;
  uint32_t not_found;
};
constexpr PartKind kLanguagePart = {LX_LANGUAGE, "language", LX_E_LANGUAGE};
constexpr PartKind kTerritoryPart = {LX_TERRITORY, "territory", LX_E_TERRITORY};
constexpr PartKind kCodePagePart = {LX_CODEPAGE, "code page", LX_E_CODEPAGE};
constexpr PartKind kSortPart = {LX_SORT, "sort", LX_E_SORT};

auto by_id(uint8_t type, uint16_t id) {
  return [=](uint32_t& rc) { return LXGetObjFromID(LXGetObjManager(), type, id, 0, &rc); };
}

class LocaleBuilder {
 public:
  LocaleBuilder(LXLocale& locale, bool substitute) : locale_(locale), substitute_(substitute) {}

  template <class Unit>
  uint32_t build(const Unit* name) {
    NameParts<Unit> parts(name);
    auto english = [](uint32_t& rc) { return look_up(LX_LANGUAGE, Part<char>{kEnglish, sizeof kEnglish - 1}, rc); };
    uint32_t status = find(kLanguagePart, parts.language(), locale_.language, english);
    if (status != LX_OK) return status;

    // The language has the defaults of the rest.
    const LanguageHeader& language = language_of(*locale_.language);
    status =
        find(kTerritoryPart, parts.territory(), locale_.territory, by_id(LX_TERRITORY, language.default_territory));
    if (status == LX_OK) {
      status =
          find(kCodePagePart, parts.code_page(), locale_.code_page, by_id(LX_CODEPAGE, language.default_code_page));
    }
    if (status == LX_OK) status = find(kSortPart, parts.sort(), locale_.sort, by_id(LX_SORT, language.default_sort));
    return status == LX_OK ? set_values() : status;
  }

 private:
  template <class Unit, class Default>
  uint32_t find(const PartKind& kind, const Part<Unit>& part, LXObjEntry*& entry, Default find_default) {
    uint32_t rc = LX_E_NOTFOUND;
    entry = part.empty() ? nullptr : look_up(kind.type, part, rc);
    if (rc == LX_E_NOTFOUND && kind.type == LX_CODEPAGE && !part.empty()) entry = look_up_by_alias(part, rc);
    if (part.empty() || (rc == LX_E_NOTFOUND && substitute_)) entry = find_default(rc);
    // No sort object and no error either: that is the binary sort.
    if (entry != nullptr || rc == LX_OK) return LX_OK;
    LX_TRACE(TRC1_LEVEL_ERROR, "Unable to locate %s, rc = %d", kind.title, static_cast<int>(rc));
    return failure_of(rc, kind.not_found);
  }

  uint32_t set_values() {
    note_code_page(locale_);
    if (locale_.sort == nullptr) locale_.flags |= kLocaleBinarySort;
    locale_.set_mask = 0;
    uint32_t status = LXLocaleSetModifiable(&locale_);
    if (status != LX_OK) {
      LX_TRACE(TRC1_LEVEL_ERROR, "Unable to set modifiable values, err = %d", static_cast<int>(status));
    }
    return status;
  }

  LXLocale& locale_;
  bool substitute_;
};

template <class Unit>
LXLocale* build_locale(const Unit* name, bool substitute, uint32_t& rc) {
  auto record = Owned<LXLocale>::zeroed();
  if (!record) {
    rc = LX_E_MEMORY;
    return nullptr;
  }
  LXLocale* locale = record.give_up();
  rc = LocaleBuilder(*locale, substitute).build(name);
  if (rc == LX_OK) return locale;
  LXReleaseLocale(locale, 0);
  return nullptr;
}

LXLocale* build_user_locale(bool substitute, uint32_t& rc) {
  char name[kLocaleNameRoom + 1] = {};
  int32_t origin = LXGetUserLocale(name, kLocaleNameRoom);
  LXLocale* locale = build_locale(name, substitute, rc);
  if (locale != nullptr && origin == 2) LXMapNativeInfo("", locale, 0);
  return locale;
}

// Installs first: nobody may find a default that is gone.
uint32_t install_default(LXLocale* locale, uint32_t rc) {
  if (locale == nullptr) return rc;
  LXReleaseLocale(std::exchange(lxglocale, locale), 0);
  return LX_OK;
}

template <class Unit>
LXLocale* get_locale(const Unit* name, uint32_t options, uint32_t* rc) {
  static constexpr Unit kNoName[1] = {};
  uint32_t status = LX_E_ARGUMENT;
  LXLocale* locale = nullptr;
  if ((options & ~kOptions) == 0) {
    bool substitute = (options & LX_GET_SUBSTITUTE) != 0;
    locale = (options & LX_GET_USER) != 0 ? build_user_locale(substitute, status)
                                          : build_locale(name != nullptr ? name : kNoName, substitute, status);
  }
  set_status(rc, status);
  return locale;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

LXLocale* LXGetLocale(const char* name, uint32_t options, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&] { return get_locale(name, options, rc); });
}

LXLocale* LXGetLocaleW(const LXWChar* name, uint32_t options, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&] { return get_locale(name, options, rc); });
}

LXLocale* LXGetLocaleU(const LXUChar* name, uint32_t options, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXLocale* {
    size_t room = name != nullptr ? measured_length(name) + 1 : 1;
    auto narrow = Owned<char>::zeroed(room);
    if (!narrow || room > INT32_MAX) {
      set_status(rc, LX_E_MEMORY);
      return nullptr;
    }
    // A name that cannot be converted counts as empty.
    if (LXComUnicodeToStr(narrow.get(), static_cast<int32_t>(room), name, -1, LX_OPT_TERMINATE) < 0) narrow[0] = '\0';
    return LXGetLocale(narrow.get(), options, rc);
  });
}

uint32_t LXReleaseLocale(LXLocale* locale, uint32_t /*reserved*/) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (locale == nullptr) return LX_OK;
    if (locale == lxglocale) lxglocale = nullptr;
    uint32_t result = LX_OK;
    for (unsigned i = 0; i < kLocaleStrings; ++i) {
      if (locale->strings[i] != nullptr && !release(locale->strings[i])) result = 1;
      if (locale->ucs2_strings[i] != nullptr && !release(locale->ucs2_strings[i])) result = 1;
    }
    if (!release(locale)) result = 1;
    return result;
  });
}

uint32_t LXSetLocale(const char* name, uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    uint32_t rc = LX_OK;
    LXLocale* locale = LXGetLocale(name, options, &rc);
    return install_default(locale, rc);
  });
}

uint32_t LXSetLocaleW(const LXWChar* name, uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    uint32_t rc = LX_OK;
    LXLocale* locale = LXGetLocaleW(name, options, &rc);
    return install_default(locale, rc);
  });
}

uint32_t LXSetLocaleU(const LXUChar* name, uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    uint32_t rc = LX_OK;
    LXLocale* locale = LXGetLocaleU(name, options, &rc);
    return install_default(locale, rc);
  });
}

LXObjEntry* LXGetLocaleObject(LXLocale* locale, uint8_t type) noexcept {
  locale = locale_or_default(locale);
  if (locale == nullptr) return nullptr;
  LXObjEntry* const objects[] = {locale->language, locale->territory, locale->code_page, locale->sort};
  return type < kObjectTypes ? objects[type] : nullptr;
}

}  // extern "C"
