// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <cstddef>
#include <cstdint>

#include "objects/code_page.hpp"

namespace lx {

struct SectionBytes {
  const uint8_t* data = nullptr;
  uint32_t size = 0;
};

// Proves that no reader of the page can leave a section, whatever text it is given. Allocates nothing. Null, or the
// name of the first field that is wrong.
const char* check_code_page(uint16_t id, const SectionBytes (&sections)[4], CheckedCodePage& checked);

// The same for what the version-1 converter relies on.
const char* check_code_page_v1(const SectionBytes& section1, const SectionBytes& section2);

}  // namespace lx
