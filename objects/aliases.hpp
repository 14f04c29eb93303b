// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <cstdint>

namespace lx {

inline constexpr int kMaxCodePageName = 32;
inline constexpr int kMaxAlias = 64;

// One further name of a code page, in the order of the file.
struct Alias {
  Alias* next;
  char code_page[kMaxCodePageName + 1];  // as written
  char alias[kMaxAlias + 1];             // in upper case
  uint8_t alias_length;
};

}  // namespace lx
