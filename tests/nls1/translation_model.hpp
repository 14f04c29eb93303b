// SPDX-License-Identifier: Apache-2.0
// Translation of a field done slowly, one character after the other. It works on the readable sources of the code pages
// and shares no code with the library.
#pragma once

#include <lexaro/nls1.h>

#include <string>

#include "support/page_source.hpp"

namespace lx::test {

struct FieldCall {
  const PageSource* to;  // null: UCS-2
  const PageSource* from;
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

// The whole characters of the text, and where the last one ends.
struct Counted {
  int32_t characters;
  size_t bytes;
};
Counted count_characters(const PageSource* page, const std::string& text);

const PageSource* page_of(uint16_t id);  // null: UCS-2
// Text of the page, or UCS-2; mixed pages have their shift bytes.
std::string spelled(const PageSource* page, std::u16string_view text);
std::string ucs2_bytes(std::u16string_view text);

}  // namespace lx::test
