// SPDX-License-Identifier: Apache-2.0
// Names and ids of locales, and the locales that a test begins with.
#pragma once

#include <lexaro/nls1.h>

#include "support/session.hpp"

namespace lx::test {

inline std::string full_name(LXLocale* locale) {
  char name[136];
  return locale != nullptr && LXLocaleGetLocaleString(locale, name) > 0 ? name : "-";
}
// The name that a locale of that name has: what it leaves out comes from the language's defaults.
inline std::string complete(const char* name) { return full_name(Locale(LXGetLocale(name, 0, nullptr)).get()); }

inline int32_t both(uint32_t language, uint32_t territory) { return static_cast<int32_t>(territory << 16 | language); }

class FrenchProcess : public testing::Test {
 protected:
  void SetUp() override { ASSERT_EQ(NLS1_SetLocale(both(3, 250), 819, NLS1_THREAD | NLS1_PROCESS), LX_OK); }
};

}  // namespace lx::test
