// SPDX-License-Identifier: Apache-2.0
// Translation of host fields: what fits is written, the rest of the field may be filled with blanks, and the caller
// learns how far the input went.
#pragma once

#include "codepage/text/readers.hpp"
#include "objects/code_page.hpp"

namespace lx {

struct Translation {
  const CodePage* target;  // null: UCS-2
  const CodePage* source;
  const ByteMap* map;  // from page to page, when both are single-byte; optional
  void* out;
  size_t out_size;  // bytes, or characters
  const void* in;
  size_t in_length;  // bytes
  bool measured;     // the input was terminated
  bool characters;   // lengths and results count characters
  bool terminate;
  bool pad;
  bool drop_blanks;  // source blanks that do not fit are no error
};

struct Translated {
  int32_t count = 0;     // bytes or characters written, the terminator included; -1: there was no room at all
  int32_t consumed = 0;  // input bytes; when characters are counted, characters written
  uint32_t status = LX_OK;
};

Translated translate(const Translation& wanted);

}  // namespace lx
