// SPDX-License-Identifier: Apache-2.0
// How the program ends and how it complains.
#pragma once

#include <stdexcept>
#include <string>
#include <string_view>
#include <system_error>

#include "tools/messages/message.hpp"

namespace lx::tool {

// The program's exit codes; scripts rely on them.
enum class ExitStatus : int {
  kExact = 0,
  kDataProblem = 1,  // the output exists, but not every character came through unchanged
  kUsage = 2,
  kInputOutput = 3,
  kCodePage = 4,  // unknown code page, or locale data that is missing or damaged
};

// Ends the command. A quiet failure is told by the exit code alone.
class Failure : public std::runtime_error {
 public:
  Failure(ExitStatus status, const Message& text, bool quiet = false)
      : std::runtime_error(text.english), status_(status), text_(text), quiet_(quiet) {}
  const Message& text() const { return text_; }
  ExitStatus status() const { return status_; }
  bool quiet() const { return quiet_; }

 private:
  ExitStatus status_;
  Message text_;
  bool quiet_;
};

Failure usage_failure(const Message& text);
// "subject: text of the error number".
Failure system_failure(const Message& subject, int error_number);
// ... of an error that the standard library met; its subject is the file, if there is one.
Failure system_failure(const std::system_error& error);

// Writes "lexaro: text" to standard error.
void complain(const Message& text);

// A file name as messages show it: no control bytes reach the terminal, and "-" reads "standard input".
Message display_name(const std::string& path);
// ... as reports do: in English.
std::string plain_name(const std::string& path);

}  // namespace lx::tool
