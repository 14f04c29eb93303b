// SPDX-License-Identifier: Apache-2.0
#include "codepage/text/readers.hpp"

namespace lx {

ByteMap::ByteMap(const CodePage& from, const CodePage& to) : exact(true) {
  for (unsigned byte = 0; byte < 256; ++byte) {
    uint16_t character = from.to_unicode[byte];
    uint32_t packed = to.packed(character);
    value[byte] = static_cast<uint8_t>(packed);
    inexact[byte] = character == kUnassigned || to.stands_in(packed, character);
    exact = exact && !inexact[byte];
  }
}

}  // namespace lx
