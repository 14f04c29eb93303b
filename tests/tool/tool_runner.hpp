// SPDX-License-Identifier: Apache-2.0
// Runs the program as a user would, with its standard streams in hand.
#pragma once

#include <gtest/gtest.h>
#include <sys/types.h>

#include <functional>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace lx::test {

using Arguments = std::vector<std::string>;

struct ToolResult {
  int status = -1;  // exit code; -1 when a signal ended the program
  int signal = 0;
  std::string output;
  std::string errors;
  uint64_t output_size = 0;
  long peak_kib = 0;  // most memory that was resident
};

struct ToolInput {
  std::string text;                                     // what standard input gives
  std::function<bool(std::string& piece)> next;         // ... or piece by piece, until it returns false
  bool wait_for_reader = false;                         // hand over the next piece when the last one was taken
  bool keep_output = true;                              // false: only count its bytes
  std::optional<std::string> output_path;               // standard output goes to this file
  int output_flags = 0;                                 // how it is opened
  bool output_pipe_closed = false;                      // nobody reads standard output
  bool output_closed = false;                           // there is no standard output
  bool unprivileged = false;                            // not as the superuser, whom permissions do not bind
  std::map<std::string, std::string> environment = {};  // beside PATH
  std::string program = LEXARO_TOOL;
};

ToolResult run_tool(const Arguments& arguments, const ToolInput& input = {});
ToolResult run_tool(const Arguments& arguments, const std::string& text);

// A program left running with its standard input open and silent.
class RunningTool {
 public:
  explicit RunningTool(const Arguments& arguments);
  ~RunningTool();
  void send(const std::string& text) const;
  // Signals it, and returns the signal that ended it (0: it exited).
  int kill(int signal_number);

 private:
  pid_t pid_ = -1;
  int input_ = -1;
};

// A directory of its own for each test.
class ToolTest : public testing::Test {
 protected:
  ToolTest();
  ~ToolTest() override;

  std::string path(const std::string& name) const { return directory_ + "/" + name; }
  std::string write(const std::string& name, const std::string& bytes) const;  // returns its path
  std::string read(const std::string& name) const;
  std::vector<std::string> files() const;  // their names, sorted

 private:
  std::string directory_;
};

// "C1 0E4481" as bytes; blanks are ignored.
std::string bytes(const std::string& hexadecimal);

}  // namespace lx::test
