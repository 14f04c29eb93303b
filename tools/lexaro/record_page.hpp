// SPDX-License-Identifier: Apache-2.0
// What records need to know about a code page.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "tools/lexaro/code_page_names.hpp"

namespace lx::tool {

struct RecordPage {
  explicit RecordPage(const CodePage& code_page);

  // A text of UTF-8 in the page; nothing when the page lacks a character of it.
  std::optional<std::string> encode(std::string_view utf8) const;

  const CodePage& page;
  LXCodePageInfo info{};
  char blank;
  std::string wide_blank;  // the full-width blank without shift bytes; empty where the page has none
  std::string line_ends;   // bytes that end a line of a file
};

}  // namespace lx::tool
