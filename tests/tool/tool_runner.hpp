// SPDX-License-Identifier: Apache-2.0
// Runs the program as a user would, with its standard streams in hand.
#pragma once

#include <gtest/gtest.h>

#include <functional>
#include <map>
#include <string>
#include <vector>

namespace lx::test {

// The words of a command line: a list of them, or a text with blanks between them.
struct Arguments : std::vector<std::string> {
  using vector::vector;
  Arguments(const char* words);
};
using Environment = std::map<std::string, std::string>;

Arguments operator+(Arguments all, const Arguments& more);

struct ToolResult {
  int status = -1;  // exit code; -1 when a signal ended the program
  int signal = 0;
  std::string output;
  std::string errors;
  uint64_t output_size = 0;
  long peak_kib = 0;  // most memory that was resident
};

struct ToolInput {
  std::string text;                              // what standard input gives
  std::function<bool(std::string& piece)> next;  // ... or piece by piece, until it returns false
  bool wait_for_reader = false;                  // hand over the next piece when the last one was taken
  bool keep_output = true;                       // false: only count its bytes
  bool output_pipe_closed = false;               // nobody reads standard output
  int signal = 0;                                // sent when all input was handed over
  bool unprivileged = false;                     // not as the superuser, whom permissions do not bind
  Environment environment = {};                  // beside PATH
  std::string program = LEXARO_TOOL;
};

// A text over and over, and output that nobody keeps.
ToolInput repeated(const std::string& piece, int times);

ToolResult run_tool(const Arguments& arguments, const ToolInput& input = {});
ToolResult run_tool(const Arguments& arguments, const std::string& text);
// The shell's command, in which "$0" is the program.
ToolResult run_in_shell(const std::string& command, ToolInput input = {});
void expect_told(const ToolResult& result, const std::string& text);

// One call of the program, and what it must do.
struct Run {
  Arguments arguments;
  std::string input = "";
  std::string output = "";
  int status = 0;
  std::string error = "";  // part of what standard error says; empty: nothing at all
  Environment environment = {{"LC_ALL", "C.UTF-8"}};
};
void check_runs(const Arguments& command, const std::vector<Run>& runs);

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

std::vector<std::string> lines_of(const std::string& text);

// "C1 0E4481" as bytes; blanks are ignored.
std::string bytes(const std::string& hexadecimal);

// The JSON document has all that the part says: its objects may have more fields, all else is equal.
void expect_json(const std::string& document, const std::string& part);
// What a JSON object or array has, by names or numbers, in its order: texts as they are, all else as JSON.
std::vector<std::pair<std::string, std::string>> json_items(const std::string& document);

}  // namespace lx::test
