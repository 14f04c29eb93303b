// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <vector>

#include "lexaro/lexaro.h"

namespace lx::tool {

// The format with the locale's own formats put in place of %c, %x and %X. The library writes those at the start of its
// buffer; here they may stand anywhere.
std::vector<LXUChar> whole_format(LXLocale* locale, const std::vector<LXUChar>& format, bool territory);

}  // namespace lx::tool
