// SPDX-License-Identifier: Apache-2.0
// Locales by number.
#include <cstdio>
#include <utility>

#include "nls1/state.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "nls1_locales", 0};

constexpr uint32_t kScopes = NLS1_THREAD | NLS1_PROCESS;
constexpr uint32_t kGetOptions = LX_GET_USER | LX_GET_SUBSTITUTE;

// The locale name for ids; what is 0 is left out.
class NameFromIds {
 public:
  NameFromIds(int32_t language_territory, uint16_t code_page) {
    auto both = static_cast<uint32_t>(language_territory);
    add("", LX_LANGUAGE, static_cast<uint16_t>(both), LX_E_LANGUAGE, "Invalid Language %d");
    add("_", LX_TERRITORY, static_cast<uint16_t>(both >> 16), LX_E_TERRITORY, "Invalid Territory %d");
    add(".", LX_CODEPAGE, code_page, LX_E_CODEPAGE, "Invalid Codepage %d");
  }
  uint32_t status() const { return status_; }
  const char* name() const { return name_; }

 private:
  void add(const char* before, uint8_t type, uint16_t id, uint32_t unknown, const char* message) {
    if (status_ != LX_OK || id == 0) return;
    uint32_t rc = LX_OK;
    const LXObjEntry* entry = object_by_id(type, id, true, rc);
    if (entry == nullptr) {
      status_ = unknown;
      if (traces(trace_unit, TRC1_LEVEL_DETAIL)) TRC1_Printf(&trace_unit, __LINE__, message, id);
      return;
    }
    length_ += static_cast<size_t>(
        std::snprintf(name_ + length_, sizeof name_ - length_, "%s%s", before, LXGetObjName(entry)));
  }

  char name_[3 * sizeof LXObjEntry::name] = {};
  size_t length_ = 0;
  uint32_t status_ = LX_OK;
};

uint32_t set_thread_locale(LXLocale* locale) {
  auto* place = static_cast<LXLocale**>(HSV1_ResolveThread(&qlgnlthr_HSV1__T, "qlgnls1"));
  if (place == nullptr) {
    LXReleaseLocale(locale, 0);
    return LX_E_MEMORY;
  }
  LXReleaseLocale(std::exchange(*place, locale), 0);
  return LX_OK;
}

// The record of a code page for the functions of texts; false: there is none. 0: null, the locale's own.
bool find_code_page(LXLocale* locale, uint16_t id, const LXObjEntry*& page) {
  uint32_t rc = LX_OK;
  page = id != 0 ? object_by_id(LX_CODEPAGE, id, true, rc) : nullptr;
  if (id == 0 || page != nullptr) return true;
  LX_TRACE(TRC1_LEVEL_DETAIL, "Invalid Codepage %d", id);
  if (LXLocale* meant = locale_or_default(locale)) meant->last_error = LX_E_CODEPAGE;
  return false;
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

LXLocale* NLS1_GetLocale(int32_t language_territory, uint16_t codepage_id, uint32_t options, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXLocale* {
    if (!ready()) {
      set_status(rc, kNotInitialised);
      return nullptr;
    }
    NameFromIds wanted(language_territory, codepage_id);
    set_status(rc, wanted.status());
    return wanted.status() == LX_OK ? LXGetLocale(wanted.name(), options & ~kScopes, rc) : nullptr;
  });
}

uint32_t NLS1_SetLocale(int32_t language_territory, uint16_t codepage_id, uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (!ready()) return LX_E_MANAGER;
    uint32_t rc = LX_OK;
    if ((options & NLS1_THREAD) != 0) {
      LXLocale* locale = NLS1_GetLocale(language_territory, codepage_id, options, &rc);
      if (locale != nullptr) rc = set_thread_locale(locale);
      if ((options & NLS1_PROCESS) == 0) return rc;
    }
    NameFromIds wanted(language_territory, codepage_id);
    return wanted.status() == LX_OK ? LXSetLocale(wanted.name(), options & kGetOptions) : wanted.status();
  });
}

int32_t NLS1_GetLocaleNumInfo(LXLocale* locale, uint32_t item, uint32_t source) noexcept {
  return exported(trace_unit, __func__, [&] { return ready() ? LXGetLocaleNumInfo(locale, item, source) : -1; });
}

int32_t NLS1_SetLocaleNumInfo(LXLocale* locale, uint32_t item, int32_t value) noexcept {
  return exported(trace_unit, __func__, [&] { return ready() ? LXSetLocaleNumInfo(locale, item, value) : 0; });
}

int32_t NLS1_GetLocaleTextInfo(LXLocale* locale, uint32_t item, char* buffer, int32_t size, uint16_t codepage_id,
                               uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    const LXObjEntry* page = nullptr;
    if (!ready() || !find_code_page(locale, codepage_id, page)) return -1;
    return page != nullptr ? LXGetLocaleTextInfoEx(locale, item, buffer, size, page, options)
                           : LXGetLocaleTextInfo(locale, item, buffer, size, options);
  });
}

int32_t NLS1_SetLocaleTextInfo(LXLocale* locale, uint32_t item, const char* text, int32_t length, uint16_t codepage_id,
                               uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    const LXObjEntry* page = nullptr;
    if (!ready() || !find_code_page(locale, codepage_id, page)) return 0;
    return page != nullptr ? LXSetLocaleTextInfoEx(locale, item, text, length, page, options)
                           : LXSetLocaleTextInfo(locale, item, text, length, options);
  });
}

}  // extern "C"
