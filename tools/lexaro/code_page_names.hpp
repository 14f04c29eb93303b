// SPDX-License-Identifier: Apache-2.0
// Code pages by the names that people use: control-file names, aliases and numbers.
#pragma once

#include <cstdint>
#include <string>

#include "tools/lexaro/library_session.hpp"

namespace lx::tool {

// A loaded code page, with a locale to use it through.
struct CodePage {
  std::string name;
  uint16_t id = 0;
  LocalePtr locale;
};

CodePage open_code_page(const std::string& wanted);

}  // namespace lx::tool
