// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/environment_locale.hpp"

#include <algorithm>
#include <cstdlib>
#include <string_view>
#include <vector>

namespace lx::tool {

std::string environment_locale(const char* category) {
  for (const char* variable : {"LC_ALL", category, "LANG"}) {
    if (const char* value = std::getenv(variable); value && *value) return value;
  }
  return "C";
}

std::string environment_locale() {
  std::vector<std::string> names;
  std::string all;
  for (const char* category : {"LC_CTYPE", "LC_NUMERIC", "LC_TIME", "LC_COLLATE"}) {
    names.push_back(environment_locale(category));
    all += "/" + names.back();
  }
  return std::count(names.begin(), names.end(), names.front()) == std::ssize(names) ? names.front() : all;
}

std::string code_set_of(const std::string& native_name) {
  const std::string_view stem = std::string_view(native_name).substr(0, native_name.find('@'));
  const std::size_t dot = stem.find('.');
  return dot == std::string_view::npos ? "" : std::string(stem.substr(dot + 1));
}

}  // namespace lx::tool
