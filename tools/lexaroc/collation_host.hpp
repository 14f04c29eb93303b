// SPDX-License-Identifier: Apache-2.0
// The order of a host: that of the bytes of one of its code pages.
#pragma once

#include "code_page.hpp"
#include "sort_object.hpp"
#include "source_text.hpp"

namespace lx::compiler {

// Pages whose characters follow their code points, all together at one place of the host's order, since the format has
// no room for tables of all pages.
struct HostBlock {
  Code place = 0;  // they come before the character with these bytes
  std::vector<unsigned> pages;
  Spot spot;
};

// Single bytes come before double bytes. Characters that the code page lacks come last, by code point. Throws
// SourceError at the block, or at `spot`.
SortObject order_of_code_page(const CodePage& page, const std::vector<HostBlock>& blocks, Spot spot);

}  // namespace lx::compiler
