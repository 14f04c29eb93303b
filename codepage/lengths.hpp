// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "objects/code_page.hpp"

namespace lx {

// Bytes of the first `characters` characters, the shift bytes before and between them included, and after the last
// one the byte that ends its run. Nothing behind the last character is looked at unless a run has to end there.
size_t bytes_of_characters(const CodePage& page, const uint8_t* text, uint32_t state, size_t characters);

}  // namespace lx
