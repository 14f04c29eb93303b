// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "objects/code_page.hpp"

namespace lx {

// Bytes of the first `characters` characters, the shift bytes before and between them included. Nothing behind the last
// character is looked at, since the text may end there, unless the caller says that it does not: then a shift byte
// there counts too.
size_t bytes_of_characters(const CodePage& page, const uint8_t* text, uint32_t state, size_t characters,
                           bool look_behind = false);

}  // namespace lx
