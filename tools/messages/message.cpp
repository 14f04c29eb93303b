// SPDX-License-Identifier: Apache-2.0
#include "tools/messages/message.hpp"

#include <system_error>

#include "tools/lexaro/terminal_text.hpp"
#include "tools/messages/translations.hpp"

namespace lx::tool {
namespace {

using Form = std::string Message::*;

std::string filled(std::string_view text, const std::vector<Message>& parts, Form form) {
  std::string result;
  for (std::size_t at = 0; at < text.size();) {
    const std::size_t part = part_at(text, at);
    if (part < parts.size()) {
      result += parts[part].*form;
      at += kPartSize;
    } else {
      result += text[at++];
    }
  }
  return result;
}

}  // namespace

Message& Message::operator+=(const Message& more) {
  english += more.english;
  utf8 += more.utf8;
  shown += more.shown;
  return *this;
}

Message make_message(std::string_view english, const std::vector<Message>& parts) {
  const Translation* translation = find_translation(english);
  Message result;
  result.english = filled(english, parts, &Message::english);
  result.utf8 = filled(translation ? translation->utf8 : english, parts, &Message::utf8);
  result.shown = filled(translation ? translation->terminal : english, parts, &Message::shown);
  return result;
}

Message quoted_text(const std::string& utf8) {
  Message text(utf8);
  if (has_translations()) text.shown = terminal_text(utf8);
  return text;
}

Message system_error_text(int error_number) { return message(std::generic_category().message(error_number)); }

}  // namespace lx::tool
