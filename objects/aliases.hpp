// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <cstdint>

namespace lx {

inline constexpr int kMaxCodePageName = 32;
inline constexpr int kMaxAlias = 64;

// One further name of a code page, in the order of the file. The names stand in the text of the file, which the manager
// keeps, as written, with terminators in the place of the white space behind them.
struct Alias {
  uint32_t code_page;  // bytes from the beginning of the text
  uint32_t alias;      // likewise
  uint8_t alias_length;
};

}  // namespace lx
