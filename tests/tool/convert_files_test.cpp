// SPDX-License-Identifier: Apache-2.0
// Where the output goes, and that nothing is lost on the way.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <filesystem>
#include <thread>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

namespace fs = std::filesystem;
using ConvertFiles = ToolTest;

mode_t mode_of(const std::string& path) {
  struct stat status {};
  EXPECT_EQ(::stat(path.c_str(), &status), 0);
  return status.st_mode & 07777;
}

TEST_F(ConvertFiles, OutputOntoItsInput) {
  const std::string file = write("text", bytes("C1 C2"));
  ::chmod(file.c_str(), 0640);
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", file, file}).status, 0);
  EXPECT_EQ(read("text"), "AB");
  EXPECT_EQ(mode_of(file), 0640U);
  EXPECT_EQ(files(), (std::vector<std::string>{"text"}));
}

TEST_F(ConvertFiles, NewOutputHasTheUsualMode) {
  const mode_t mask = ::umask(027);
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", path("out")}, bytes("C1")).status, 0);
  ::umask(mask);
  EXPECT_EQ(mode_of(path("out")), 0640U);
  EXPECT_EQ(read("out"), "A");
}

TEST_F(ConvertFiles, LinksStayLinks) {
  fs::create_directories(path("elsewhere"));
  write("elsewhere/text", bytes("C1"));
  fs::create_symlink("elsewhere/text", path("link"));
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", path("link"), path("link")}).status, 0);
  EXPECT_TRUE(fs::is_symlink(path("link")));
  EXPECT_EQ(read("elsewhere/text"), "A");

  fs::create_symlink("elsewhere/new", path("dangling"));
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", path("dangling")}, bytes("C2")).status, 0);
  EXPECT_TRUE(fs::is_symlink(path("dangling")));
  EXPECT_EQ(read("elsewhere/new"), "B");
  EXPECT_EQ(files(), (std::vector<std::string>{"dangling", "elsewhere", "link"}));
}

// A failure in the middle leaves the former output as it was, and no other file.
TEST_F(ConvertFiles, FailureLeavesTheOutputAlone) {
  const std::string good = write("good", bytes("C1"));
  const std::string out = write("out", "former");
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", out, good, path("missing"), good}).status, 3);
  EXPECT_EQ(read("out"), "former");
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", path("new"), good, path("missing")}).status, 3);
  EXPECT_EQ(run_tool({"convert", "-f", "klingon", "-o", out, good}).status, 4);
  EXPECT_EQ(read("out"), "former");
  EXPECT_EQ(files(), (std::vector<std::string>{"good", "out"}));
}

TEST_F(ConvertFiles, DataProblemsStillGiveOutput) {
  EXPECT_EQ(run_tool({"convert", "-t", "37", "-o", path("out")}, std::string("a\xFF")).status, 1);
  EXPECT_EQ(read("out"), bytes("81 3F"));
}

TEST_F(ConvertFiles, SpecialFilesAreWrittenDirectly) {
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", "/dev/null"}, bytes("C1")).status, 0);
  EXPECT_TRUE(fs::is_character_file("/dev/null"));
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", "/dev/stdout"}, bytes("C1")).output, "A");
  ToolInput full;
  full.text = bytes("C1");
  full.output_path = "/dev/full";
  const ToolResult result = run_tool({"convert", "-f", "37"}, full);
  EXPECT_EQ(result.status, 3);
  EXPECT_NE(result.errors.find("standard output: write error at byte 0: No space left"), std::string::npos)
      << result.errors;

  ASSERT_EQ(::mkfifo(path("fifo").c_str(), 0600), 0);
  std::string received;
  std::thread reader([&] { received = read("fifo"); });
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", path("fifo")}, bytes("C1 C2")).status, 0);
  reader.join();
  EXPECT_EQ(received, "AB");
  EXPECT_TRUE(fs::is_fifo(path("fifo")));
}

TEST_F(ConvertFiles, OutputThatNobodyTakes) {
  ToolInput input;
  input.text = std::string(1 << 20, '\xC1');
  input.output_pipe_closed = true;
  for (const Arguments& arguments : {Arguments{"convert", "-f", "37"}, {"list", "codepages"}, {"--help"}}) {
    const ToolResult result = run_tool(arguments, input);
    EXPECT_EQ(result.status, 3);
    EXPECT_EQ(result.signal, 0);
    EXPECT_EQ(result.errors, "");
  }
  // Without a standard output, the input file must not be opened in its place.
  const std::string file = write("text", bytes("C1"));
  ToolInput closed;
  closed.output_closed = true;
  EXPECT_EQ(run_tool({"convert", "-f", "37", file}, closed).status, 3);
  EXPECT_EQ(read("text"), bytes("C1"));
}

TEST_F(ConvertFiles, InputThatIsAlsoStandardOutput) {
  const std::string file = write("text", bytes("C1 C2"));
  ToolInput input;
  input.output_path = file;
  input.output_flags = O_APPEND;
  const ToolResult result = run_tool({"convert", "-f", "37", file}, input);
  EXPECT_EQ(result.status, 3);
  EXPECT_NE(result.errors.find("both input and output"), std::string::npos) << result.errors;
  EXPECT_EQ(read("text"), bytes("C1 C2"));
}

TEST_F(ConvertFiles, UnwritableAndUnreadableFiles) {
  fs::permissions(path(""), fs::perms::all);
  ToolInput input;
  input.unprivileged = true;
  if (run_tool({"--version"}, input).status != 0) GTEST_SKIP() << "the program lies where only its builder may go";
  const std::string file = write("text", bytes("C1"));
  ::chmod(file.c_str(), 0444);
  const ToolResult unwritable = run_tool({"convert", "-f", "37", "-o", file, file}, input);
  EXPECT_EQ(unwritable.status, 3);
  EXPECT_NE(unwritable.errors.find("Permission denied"), std::string::npos) << unwritable.errors;
  ::chmod(file.c_str(), 0);
  const ToolResult unreadable = run_tool({"convert", "-f", "37", file}, input);
  EXPECT_EQ(unreadable.status, 3);
  EXPECT_NE(unreadable.errors.find("Permission denied"), std::string::npos) << unreadable.errors;
  EXPECT_EQ(read("text"), ::geteuid() == 0 ? bytes("C1") : "");
  EXPECT_EQ(files(), (std::vector<std::string>{"text"}));
}

TEST_F(ConvertFiles, InterruptLeavesNothingBehind) {
  write("out", "former");
  for (int signal_number : {SIGINT, SIGTERM, SIGHUP}) {
    RunningTool tool({"convert", "-f", "37", "-o", path("out"), "--report", path("report")});
    tool.send(std::string(1000, '\xC1'));
    for (int tries = 0; tries < 2000 && files().size() < 3; ++tries) {
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    EXPECT_EQ(files().size(), 3U);  // the former output and two temporary files
    EXPECT_EQ(tool.kill(signal_number), signal_number);
    EXPECT_EQ(files(), (std::vector<std::string>{"out"}));
    EXPECT_EQ(read("out"), "former");
  }
}

TEST_F(ConvertFiles, ReportNeverReplacesTheText) {
  const std::string file = write("text", bytes("C1"));
  fs::create_hard_link(file, path("same"));
  for (const Arguments& arguments : {Arguments{"convert", "-f", "37", "--report", file, file},
                                     {"convert", "-f", "37", "--report", path("same"), file},
                                     {"convert", "-f", "37", "-o", path("out"), "--report", path("out"), file}}) {
    EXPECT_EQ(run_tool(arguments).status, 2);
    EXPECT_EQ(read("text"), bytes("C1"));
    EXPECT_EQ(files(), (std::vector<std::string>{"same", "text"}));
  }
}

}  // namespace
}  // namespace lx::test
