// SPDX-License-Identifier: Apache-2.0
// Texts without their trailing blanks, for comparison.
#pragma once

#include <algorithm>

#include "codepage/truncate.hpp"

namespace lx {

// A text of bytes ends at a terminator in it. It is not written, so it needs no room for a shift byte at its end; the
// result is the length that it would have with one.
template <class Kind>
size_t trim(TRC1_Unit& trace_unit, const CodePage& page, Text<char>& text, bool full_width) {
  if (text.length == 0) return 0;
  size_t length = static_cast<size_t>(std::find(text.at, text.at + text.length, '\0') - text.at);
  text.length = length;
  Cut cut = find_cut(trace_unit, page, text, Kind::kShifted, length + 2, blanks_of(page, full_width));
  text.length = cut.at;
  return cut.at + (cut.double_byte && cut.at != length ? 1 : 0);
}

template <class Kind, class Unit>
void trim(TRC1_Unit&, const CodePage& page, Text<Unit>& text, bool full_width) {
  Blanks blanks = {0x0020, full_width ? 0x3000u : 0};
  if constexpr (std::same_as<Unit, LXWChar>) blanks = blanks_of(page, full_width);
  auto blank = [&](Unit unit) { return unit == blanks.narrow || (unit == blanks.full_width && unit != 0); };
  while (text.length != 0 && blank(text.at[text.length - 1])) --text.length;
}

}  // namespace lx
