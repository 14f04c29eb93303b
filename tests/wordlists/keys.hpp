// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <algorithm>

#include "support/session.hpp"

namespace lx::test {

inline std::string key_of(LXLocale* locale, const std::string& text) {
  std::string key(text.size() * 8 + 3, '\0');
  const int32_t length = LXStrxfrm(locale, key.data(), static_cast<int32_t>(key.size()), text.data(),
                                   static_cast<int32_t>(text.size()), 0);
  key.resize(static_cast<size_t>(std::max(length, 0)));
  return key;
}

inline int sign(int value) { return (value > 0) - (value < 0); }

// Of two texts, compared directly.
inline int order_of(LXLocale* locale, const std::string& a, const std::string& b) {
  return sign(LXStrcoll(locale, a.data(), static_cast<int32_t>(a.size()), b.data(), static_cast<int32_t>(b.size()), 0));
}

}  // namespace lx::test
