// SPDX-License-Identifier: Apache-2.0
// The system's names of the library's locales.
#pragma once

#include <string>
#include <vector>

#include "lexaro/lexaro.h"

namespace lx::tool {

struct NativeNames {
  std::string exact;  // empty when there is none
  std::string nearest;
};
NativeNames native_names_of(LXLocale* locale);

// The library's name for a system name, as its table has it; empty when it has none.
std::string mapped_native_name(const std::string& native_name);

struct NativeRow {
  std::string native;
  std::string locale;
};
std::vector<NativeRow> known_native_names();

}  // namespace lx::tool
