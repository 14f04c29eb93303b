// SPDX-License-Identifier: Apache-2.0
// The doors between text as a call gives it and the readers and writers: here the kind is chosen, once a call.
//
//   plain   bytes of a code page          SingleByteReader, MultibyteReader, Utf8Reader
//   Ex      bytes with shift states       ShiftedReader on shift-sensitive pages, else as plain
//   W       packed characters             WideReader
//   U       UCS-2                         Ucs2Reader
#pragma once

#include "codepage/text/readers.hpp"
#include "codepage/text/writers.hpp"

namespace lx {

// Whether shift bytes are followed, and from which state on. Plain calls leave them alone.
struct Shifts {
  bool followed = false;
  uint32_t state = 0;
};

template <class Use>
auto with_reader(const CodePage& page, Shifts shifts, const uint8_t* text, size_t length, Use use) {
  if (shifts.followed && page.shift_sensitive) return use(ShiftedReader(page, text, length, shifts.state));
  switch (page.kind) {
    case PageKind::single:
      return use(SingleByteReader(page, text, length));
    case PageKind::utf8:
      return use(Utf8Reader(page, text, length));
    default:
      return use(MultibyteReader(page, text, length));
  }
}

template <class Use>
auto with_writer(const CodePage& page, Shifts shifts, uint8_t* out, size_t size, Use use) {
  if (shifts.followed && page.shift_sensitive) return use(ShiftedWriter(page, out, size, shifts.state));
  if (page.kind == PageKind::utf8) return use(Utf8Writer(page, out, size));
  if (page.max_length == 1) return use(SingleByteWriter(page, out, size));
  return use(MultibyteWriter(page, out, size));
}

inline const uint8_t* bytes_of(const char* text) { return reinterpret_cast<const uint8_t*>(text); }
inline uint8_t* bytes_of(char* text) { return reinterpret_cast<uint8_t*>(text); }

// Units up to the terminator.
template <class Unit>
size_t measured_length(const Unit* text) {
  size_t length = 0;
  while (text[length] != 0) ++length;
  return length;
}

}  // namespace lx
