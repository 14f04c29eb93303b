// SPDX-License-Identifier: Apache-2.0
// Text as people keep it: prose for the open systems' pages, records of fields for the mixed host page.
#pragma once

#include <string>
#include <vector>

#include "bench/convert/page.hpp"

namespace lx::bench {

// Texts of (nearly) equal size that are converted one after the other.
struct Texts {
  std::string bytes;
  std::vector<size_t> begins;  // one more than there are texts
};

// `count` texts in `page`, of exactly `size` bytes each, whose characters are those of `script`. A text that has no
// room for the next character is filled up with blanks.
Texts compose(const Page& page, Script script, size_t size, size_t count);

}  // namespace lx::bench
