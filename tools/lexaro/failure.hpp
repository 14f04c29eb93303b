// SPDX-License-Identifier: Apache-2.0
// How the program ends and how it complains.
#pragma once

#include <stdexcept>
#include <string>
#include <string_view>

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
  Failure(ExitStatus status, const std::string& message, bool quiet = false)
      : std::runtime_error(message), status_(status), quiet_(quiet) {}
  ExitStatus status() const { return status_; }
  bool quiet() const { return quiet_; }

 private:
  ExitStatus status_;
  bool quiet_;
};

Failure usage_failure(const std::string& message);
// "subject: text of the error number".
Failure system_failure(const std::string& subject, int error_number);

// Writes "lexaro: text" to standard error.
void complain(std::string_view text);

// A file name as messages show it: no control bytes reach the terminal, and "-" reads "standard input".
std::string display_name(const std::string& path);

}  // namespace lx::tool
