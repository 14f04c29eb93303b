// SPDX-License-Identifier: Apache-2.0
// The keys of lines: bytes that compare as the lines do in the order of a locale.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "tools/lexaro/code_page_names.hpp"
#include "tools/lexaro/conversion.hpp"

namespace lx::tool {

struct SortOrder {
  LocalePtr locale;      // with the code page of the text
  CodePage page;         // the same page
  uint32_t options = 0;  // 0, LX_CMP_NOCASE or LX_CMP_NOWIDTH
};

class KeyMaker {
 public:
  KeyMaker(const SortOrder& order, const CodePage& utf8);

  // The key stands until the next call. Characters that the order does not know are all alike to it; lines with them
  // stand by their bytes among those of the same key, so that lines of equal keys are equal.
  std::string_view key_of(std::string_view line);

  // Such characters so far.
  uint64_t unknown() const { return unknown_; }

 private:
  std::size_t transform(std::string_view line);

  const SortOrder& order_;
  bool plain_bytes_;  // keys are the lines themselves
  uint64_t unknown_ = 0;
  Conversion decoder_;
  std::string key_;
};

}  // namespace lx::tool
