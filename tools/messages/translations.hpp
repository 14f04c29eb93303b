// SPDX-License-Identifier: Apache-2.0
// The texts of the message catalogs for the user's language, by the English ones.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace lx::tool {

struct Translation {
  std::string utf8;
  std::string terminal;  // in its encoding
};

// Null: the user reads English, or there is no translation that the terminal can show.
const Translation* find_translation(std::string_view english);
bool has_translations();

inline constexpr std::size_t kPartSize = 3;
// The number of the part that stands here as "{0}" to "{9}"; otherwise one that no message has.
std::size_t part_at(std::string_view text, std::size_t at);

}  // namespace lx::tool
