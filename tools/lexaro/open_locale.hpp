// SPDX-License-Identifier: Apache-2.0
// Locales by the names that users give them. What is taken instead of the exact locale is told on standard error.
#pragma once

#include <string>

#include "tools/lexaro/library_session.hpp"

namespace lx::tool {

// By the library's name or a system's name of it.
LocalePtr open_locale(const std::string& name);

// The user's: from LX_LANG, else from the system; English when all else fails.
LocalePtr open_user_locale();

}  // namespace lx::tool
