// SPDX-License-Identifier: Apache-2.0
// Texts compared character by character, in the order of their code page.
#pragma once

#include "codepage/text/characters.hpp"
#include "collate/arguments.hpp"

namespace lx {

inline constexpr uint32_t kCompareOptions = LX_CMP_NOWIDTH | LX_CMP_NOCASE | LX_CMP_TRIM | LX_OPT_CHARS;

// How characters are made alike before they are compared.
enum class Fold : uint8_t { none, upper, half_width };

inline Fold fold_of(uint32_t options) {
  uint32_t fold = options & LX_CMP_NOWIDTH;
  if (fold == LX_CMP_NOWIDTH) return Fold::half_width;
  return (options & (LX_CMP_NOWIDTH | LX_CMP_NOCASE)) != 0 ? Fold::upper : Fold::none;
}

// Below, equal to or above 0. The options hold no lengths any more. The status: LX_OK or LX_E_MEMORY.
template <class Kind>
int32_t compare_texts(LocaleCall& call, Text<typename Kind::Unit> a, Text<typename Kind::Unit> b, uint32_t options);

}  // namespace lx
