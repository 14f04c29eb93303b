// SPDX-License-Identifier: Apache-2.0
// Parts of a text. Unlike the standard ones these cannot throw, which keeps the C++ run-time library out of ours.
#pragma once

#include <string_view>

namespace lx {

// The first `count` characters, or all when there are not so many.
constexpr std::string_view head(std::string_view text, size_t count) {
  return {text.data(), count < text.size() ? count : text.size()};
}

// What is left behind the first `count` characters.
constexpr std::string_view tail(std::string_view text, size_t count) {
  text.remove_prefix(count < text.size() ? count : text.size());
  return text;
}

}  // namespace lx
