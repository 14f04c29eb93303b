// SPDX-License-Identifier: Apache-2.0
// Code pages by the names that people use: control-file names, aliases and numbers.
#pragma once

#include <cstdint>
#include <string>

#include "tools/lexaro/failure.hpp"
#include "tools/lexaro/library_session.hpp"

namespace lx::tool {

// A loaded code page, with a locale to use it through.
struct CodePage {
  std::string name;
  uint16_t id = 0;
  LocalePtr locale;
};

// The directory's entry of a name, alias or number, not loaded; null when there is none.
LXObjEntry* find_code_page(const std::string& wanted);
Failure unknown_code_page(const std::string& wanted);

CodePage open_code_page(const std::string& wanted);

}  // namespace lx::tool
