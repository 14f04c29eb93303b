// SPDX-License-Identifier: Apache-2.0
// Where lines end, in text of any kind.
#pragma once

#include "codepage/text/kinds.hpp"

namespace lx {

inline constexpr uint32_t kLineEnds = LX_EOL_1 | LX_EOL_21 | LX_EOL_3 | LX_EOL_4;

// The characters that line ends are made of, in the order of their numbers.
struct LineCharacters {
  uint32_t code[4];
};

template <class Kind>
LineCharacters line_characters(const CodePage& page) {
  if constexpr (std::same_as<Kind, Ucs2Kind>) {
    return {{0x000A, 0x000D, 0x2028, 0x2029}};
  } else {
    const uint8_t* bytes = page.raw.header->line_bytes;
    return {{bytes[0], bytes[1], bytes[2], bytes[3]}};
  }
}

struct LineEnd {
  uint32_t type = LX_EOL_NONE;
  int32_t length = 0;
  size_t behind = 0;  // units from the start of the text to the position just behind it
};

// The first line end of the wanted kinds.
template <class Walker>
LineEnd find_line_end(Walker text, const LineCharacters& line, uint32_t wanted) {
  const Walker begin = text;
  auto found = [&](uint32_t type, int32_t length) {
    return LineEnd{type, length, static_cast<size_t>(text.at - begin.at)};
  };
  for (Character character; text.next(character);) {
    if (character.units != 1) continue;
    if (character.code == line.code[1] && (wanted & LX_EOL_21) != 0 && text.at != text.end &&
        *text.at == line.code[0]) {
      ++text.at;
      return found(LX_EOL_21, 2);
    }
    if (character.code == line.code[0] && (wanted & LX_EOL_1) != 0) return found(LX_EOL_1, 1);
    if (character.code == line.code[2] && (wanted & LX_EOL_3) != 0) return found(LX_EOL_3, 1);
    if (character.code == line.code[3] && (wanted & LX_EOL_4) != 0) return found(LX_EOL_4, 1);
  }
  return {};
}

}  // namespace lx
