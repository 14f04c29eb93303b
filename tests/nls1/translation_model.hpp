// SPDX-License-Identifier: Apache-2.0
// Translation of a field done slowly, one character after the other.
#pragma once

#include <lexaro/nls1.h>

#include "support/text_model.hpp"

namespace lx::test {

// Of the page; UCS-2 for 1200.
Form form_of(uint16_t page);

struct FieldCall {
  Form to;
  Form from;
  std::string text;  // the whole input, bytes as they stand in memory
  bool measured;     // by its terminator, which is not part of the text
  size_t size;       // of the output: bytes, or characters
  uint32_t flags;

  bool has(uint32_t flag) const { return (flags & flag) != 0; }
};

struct FieldResult {
  int32_t count = 0;
  std::string written;
  int32_t consumed = 0;
  uint32_t error = 0;

  bool operator==(const FieldResult&) const = default;
};

FieldResult translate_model(const FieldCall& call);

// The elements of a text in memory; half a unit at the end is left out.
Units units_in(const Form& form, std::string_view bytes);
inline std::string spelled_bytes(uint16_t page, std::u16string_view text) {
  return raw(form_of(page), spelled(form_of(page), text));
}

}  // namespace lx::test
