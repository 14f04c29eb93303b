// SPDX-License-Identifier: Apache-2.0
// The names of system locales that the environment holds, whether or not the system has those locales.
#pragma once

#include <string>

namespace lx::tool {

// For a category such as "LC_CTYPE": what LC_ALL, the category itself or LANG says, else "C".
std::string environment_locale(const char* category);

// For all categories: one name, or "/" before each of the names that choose code page, territory, language and sort.
std::string environment_locale();

// "UTF-8" of "de_CH.UTF-8@euro"; empty when the name has none.
std::string code_set_of(const std::string& native_name);

}  // namespace lx::tool
