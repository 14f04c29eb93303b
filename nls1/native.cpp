// SPDX-License-Identifier: Apache-2.0
// Bridges to the system's own locales.
#include <clocale>
#include <cstdio>
#include <utility>

#include "nls1/state.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "nls1_native", 0};

constexpr uint32_t kConvertOptions = LX_NATIVE_INFO | LX_GET_SUBSTITUTE;
constexpr uint32_t kGetOptions = LX_GET_USER | LX_GET_SUBSTITUTE;
constexpr int32_t kPartRoom = 32;
constexpr size_t kNativeRoom = 12;

// The locale's name, of its parts as the locale itself gives them.
struct FullName {
  char text[4 * kPartRoom];

  explicit FullName(LXLocale* locale) {
    static constexpr uint32_t kItems[] = {LX_ITEM_LANGUAGE_NAME, LX_ITEM_TERRITORY_NAME, LX_ITEM_CODEPAGE_NAME,
                                          LX_ITEM_SORT_NAME};
    char parts[4][kPartRoom] = {};
    for (unsigned i = 0; i < 4; ++i) LXGetLocaleTextInfo(locale, kItems[i], parts[i], kPartRoom, 0);
    std::snprintf(text, sizeof text, "%s_%s.%s@%s", parts[0], parts[1], parts[2], parts[3]);
  }
};

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

LXLocale* NLS1_ConvertNativeLocale(const char* native_name, uint32_t options, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXLocale* {
    if (!ready()) {
      set_status(rc, kNotInitialised);
      return nullptr;
    }
    uint32_t status = LX_OK;
    LXLocale* locale = LXConvertNativeLocale(native_name, options, &status);
    if (locale == nullptr) {
      LX_TRACE(TRC1_LEVEL_ERROR, "LXConvertNativeLocale failed for %s with rc %d",
               native_name != nullptr ? native_name : "", static_cast<int>(status));
    }
    set_status(rc, status);
    return locale;
  });
}

uint32_t NLS1_SetLocaleFromNative(const char* native_name, uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (!ready()) return LX_E_MANAGER;
    uint32_t rc = LX_OK;
    LXLocale* locale = NLS1_ConvertNativeLocale(native_name, options & kConvertOptions, &rc);
    if (locale == nullptr) return rc;
    rc = LXSetLocale(FullName(locale).text, options & kGetOptions);
    if (auto* place = static_cast<LXLocale**>(HSV1_ResolveThread(&qlgnlthr_HSV1__T, "qlgnls1"))) {
      LXReleaseLocale(std::exchange(*place, nullptr), 0);
    }
    LXReleaseLocale(locale, 0);
    return rc;
  });
}

uint32_t NLS1_SetNativeFromLocale(LXLocale* locale, int category, uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (!ready()) return LX_E_MANAGER;
    char name[kNativeRoom];
    if (LXConvertLocale(locale, name, options & kConvertOptions) == 0) {
      LX_TRACE(TRC1_LEVEL_ERROR, "NLS1_ConvertLocale failed with rc = %d",
               static_cast<int>(LXGetError(locale_or_default(locale))));
      return LX_E_NATIVE;
    }
    if (std::setlocale(category, name) != nullptr) return LX_OK;
    LX_TRACE(TRC1_LEVEL_ERROR, "setlocale failed to setlocale to %s", name);
    return LX_E_NATIVE;
  });
}

uint32_t NLS1_SetNativeLocale(int32_t language_territory, uint16_t codepage_id, int category,
                              uint32_t options) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (!ready()) return LX_E_MANAGER;
    uint32_t rc = LX_OK;
    LXLocale* locale = NLS1_GetLocale(language_territory, codepage_id, options & kGetOptions, &rc);
    if (locale == nullptr) return rc;
    rc = NLS1_SetNativeFromLocale(locale, category, options);
    LXReleaseLocale(locale, 0);
    return rc;
  });
}

}  // extern "C"
