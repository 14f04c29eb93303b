// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <algorithm>
#include <cstring>

#include "codepage/text/algorithms.hpp"
#include "codepage/text/kinds.hpp"

namespace lx {

// Copies the whole characters that the room has room for; returns their units, or their number when that is what the
// lengths count (`characters`). A measured text includes its terminator; none is added.
template <class Kind>
int32_t copy_text(const CodePage& page, typename Kind::Unit* out, int32_t out_size, const typename Kind::Unit* in,
                  uint32_t state, int32_t in_length, bool characters) {
  if (out == nullptr || out_size <= 0 || in == nullptr || in_length == 0) return 0;
  auto room = static_cast<size_t>(out_size);
  Text<typename Kind::Unit> text = {in, in_length < 0 ? measured_length(in) + 1 : static_cast<size_t>(in_length),
                                    state};
  if (!characters) {
    text.length = std::min(text.length, room);
  } else if (in_length > 0) {
    text.length = length_to_copy<Kind>(page, text, std::min(text.length, room));
  }
  return Kind::with_walker(page, text, [&](auto walker) {
    auto begin = walker;
    size_t count = skip_characters(walker, characters ? room : SIZE_MAX);
    if (count != 0) walker.finish();
    size_t length = passed(begin, walker);
    std::memmove(out, in, length * sizeof *out);
    return static_cast<int32_t>(characters ? count : length);
  });
}

}  // namespace lx
