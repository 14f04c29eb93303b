// SPDX-License-Identifier: Apache-2.0
// The texts of messages between their source, which is Unicode, and the code page of a catalog.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "report.hpp"
#include "tools/lexaro/library_session.hpp"

namespace lx::compiler {

// A character of a message, or a byte of the catalog that was given by its number.
struct MessagePart {
  char32_t value;
  bool is_byte;
  Spot spot;
};
using MessageParts = std::vector<MessagePart>;

std::u32string decode_utf8(std::string_view bytes, bool& valid);

class CatalogText {
 public:
  // Throws std::runtime_error when there is no such locale.
  explicit CatalogText(const std::string& locale_name);

  // With all its parts, under the names of the data directory.
  std::string locale_name() const;
  bool same_page(const CatalogText& other) const { return page() == other.page(); }
  // Throws SourceError at a character that the page lacks.
  std::string encode(const MessageParts& parts) const;
  // What encode() makes the same bytes of.
  MessageParts decode(std::string_view bytes) const;
  // All of a text in the page as UTF-8, with line feeds; throws SourceError at what is no character.
  std::string to_utf8(std::string_view bytes) const;

 private:
  const LXObjEntry* page() const { return LXGetLocaleObject(locale_.get(), LX_CODEPAGE); }
  size_t piece_length(std::string_view bytes) const;
  bool decode_piece(std::string_view bytes, MessageParts& parts) const;

  tool::LocalePtr locale_;
  tool::LocalePtr utf8_;
  LXCodePageInfo info_{};
};

}  // namespace lx::compiler
