// SPDX-License-Identifier: Apache-2.0
// What the tools tell people: in English at the place of use, in the user's language from a message catalog. The
// English text is the key, so there are no numbers in the code; catalogs are opened when the first message is made.
#pragma once

#include <concepts>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace lx::tool {

// A text in the forms that it is needed in.
struct Message {
  Message() = default;
  Message(std::string text) : english(text), utf8(text), shown(std::move(text)) {}
  Message(const char* text) : Message(std::string(text)) {}

  bool empty() const { return english.empty(); }
  Message& operator+=(const Message& more);

  std::string english;  // for reports, which other programs read
  std::string utf8;     // in the user's language, for text that is encoded later
  std::string shown;    // in the user's language and the encoding of the terminal
};
inline Message operator+(Message first, const Message& second) { return std::move(first += second); }

inline Message message_part(const Message& part) { return part; }
template <std::integral Number>
Message message_part(Number number) {
  return std::to_string(number);
}
Message make_message(std::string_view english, const std::vector<Message>& parts);

// "{0}", "{1}" ... in the text stand for the arguments: texts, numbers and messages.
template <class... Parts>
Message message(std::string_view english, const Parts&... parts) {
  return make_message(english, {message_part(parts)...});
}

// Text in UTF-8 as a part of messages. It stays as it is where those are English.
Message quoted_text(const std::string& utf8);

// Of the C library, which has English only.
Message system_error_text(int error_number);

}  // namespace lx::tool
