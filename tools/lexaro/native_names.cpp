// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/native_names.hpp"

namespace lx::tool {
namespace {

std::string native_name(LXLocale* locale, uint32_t options) {
  char name[12];
  return LXConvertLocale(locale, name, options) == 1 ? name : "";
}

int32_t collect(void* context, const char* native, const char* locale) {
  static_cast<std::vector<NativeRow>*>(context)->push_back({native, locale});
  return 1;
}

}  // namespace

NativeNames native_names_of(LXLocale* locale) {
  return {native_name(locale, 0), native_name(locale, LX_GET_SUBSTITUTE)};
}

std::string mapped_native_name(const std::string& native_name) {
  char name[160];
  const std::string mapped = LXMapNativeLocale(native_name.c_str(), name, sizeof name);
  return mapped == "Unknown" ? "" : mapped;
}

std::vector<NativeRow> known_native_names() {
  std::vector<NativeRow> rows;
  LXEnumNativeNames(collect, &rows);
  return rows;
}

}  // namespace lx::tool
