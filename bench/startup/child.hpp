// SPDX-License-Identifier: Apache-2.0
// A process that converts one string, or that ends at once when its argument says so.
#pragma once

#include <cstring>

namespace lx::bench {

inline constexpr char kEmpty[] = "empty";

// "NAME, TOWN 12345" in EBCDIC.
inline constexpr char kText[] = "\xD5\xC1\xD4\xC5\x6B\x40\xE3\xD6\xE6\xD5\x40\xF1\xF2\xF3\xF4\xF5";
inline constexpr int kTextLength = 16;

inline bool wants_nothing(int count, char** arguments) { return count > 1 && std::strcmp(arguments[1], kEmpty) == 0; }

}  // namespace lx::bench
