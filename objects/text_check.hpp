// SPDX-License-Identifier: Apache-2.0
// Checks of language and territory sections. Null, or the name of the first field that is wrong.
#pragma once

#include "objects/code_page_check.hpp"
#include "objects/text_format.hpp"

namespace lx {

const char* check_language(const SectionBytes& section);
const char* check_territory(const SectionBytes& section);

}  // namespace lx
