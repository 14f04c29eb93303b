// SPDX-License-Identifier: Apache-2.0
// The values that a command works on, one after the other: its arguments, or else the lines of standard input.
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "lexaro/lexaro.h"
#include "tools/messages/message.hpp"

namespace lx::tool {

// Stands before an argument that begins with "-" and is no option; the parser of the command line does not know better.
inline constexpr char kValueMark = '\x01';
// "-5", "-.5", "-$1.50": what follows is no letter and no second "-".
bool is_negative_value(const std::string& argument);

struct Value {
  std::vector<LXUChar> text;
  const char* place;  // "line {0}: " with the number; null: it needs none
  uint64_t number;
};

// Arguments come in the encoding of the terminal, lines in the code page.
void for_each_value(const std::vector<std::string>& arguments, const std::string& code_page,
                    const std::function<void(const Value&)>& take);

// A value that could not be used: told at once, with a mark below the character that does not fit. The command goes on
// with the next one, and ends with ExitStatus::kDataProblem.
void complain_about(const Value& value, const Message& why, std::optional<std::size_t> position = {});

}  // namespace lx::tool
