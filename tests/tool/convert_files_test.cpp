// SPDX-License-Identifier: Apache-2.0
// Where the output goes, and that nothing is lost on the way.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>

#include "tests/tool/tool_runner.hpp"

namespace lx::test {
namespace {

namespace fs = std::filesystem;
using ConvertFiles = ToolTest;

TEST_F(ConvertFiles, OutputKeepsItsModeOrHasTheUsualOne) {
  const std::string file = write("text", bytes("C1 C2"));
  ::chmod(file.c_str(), 0604);
  const mode_t mask = ::umask(027);
  check_runs("convert -f 37", {{{"-o", file, file}}, {{"-o", path("new")}, bytes("C1")}});
  ::umask(mask);
  EXPECT_EQ(read("text"), "AB");
  EXPECT_EQ(fs::status(file).permissions(), fs::perms{0604});
  EXPECT_EQ(read("new"), "A");
  EXPECT_EQ(fs::status(path("new")).permissions(), fs::perms{0640});
  EXPECT_EQ(files(), (std::vector<std::string>{"new", "text"}));
}

TEST_F(ConvertFiles, LinksStayLinks) {
  fs::create_directories(path("elsewhere"));
  write("elsewhere/text", bytes("C1"));
  for (const char* name : {"text", "new"}) fs::create_symlink(std::string("elsewhere/") + name, path(name));
  check_runs("convert -f 37", {{{"-o", path("text"), path("text")}}, {{"-o", path("new")}, bytes("C2")}});
  EXPECT_EQ(read("elsewhere/text") + read("elsewhere/new"), "AB");
  EXPECT_TRUE(fs::is_symlink(path("text")) && fs::is_symlink(path("new")));
  EXPECT_EQ(files(), (std::vector<std::string>{"elsewhere", "new", "text"}));
}

// A failure in the middle leaves the former output as it was, and no other file.
TEST_F(ConvertFiles, FailureLeavesTheOutputAlone) {
  const std::string good = write("good", bytes("C1"));
  const std::string out = write("out", "former");
  check_runs("convert", {{{"-f", "37", "-o", out, good, path("missing"), good}, "", "", 3, "missing"},
                         {{"-f", "37", "-o", path("new"), good, path("missing")}, "", "", 3, "missing"},
                         {{"-f", "klingon", "-o", out, good}, "", "", 4, "klingon"}});
  EXPECT_EQ(read("out"), "former");
  EXPECT_EQ(files(), (std::vector<std::string>{"good", "out"}));
  // Faults in the text are no failure.
  EXPECT_EQ(run_tool({"convert", "-t", "37", "-o", out}, std::string("a\xFF")).status, 1);
  EXPECT_EQ(read("out"), bytes("81 3F"));
}

TEST_F(ConvertFiles, SpecialFilesAreWrittenDirectly) {
  check_runs("convert -f 37", {{"-o /dev/null", bytes("C1")}, {"-o /dev/stdout", bytes("C1"), "A"}});
  EXPECT_TRUE(fs::is_character_file("/dev/null"));
  const ToolResult full = run_in_shell("echo A | \"$0\" convert -f 37 > /dev/full");
  EXPECT_EQ(full.status, 3);
  expect_told(full, "standard output: write error at byte 0: No space left");

  ASSERT_EQ(::mkfifo(path("fifo").c_str(), 0600), 0);
  const int reader = ::open(path("fifo").c_str(), O_RDWR | O_NONBLOCK | O_CLOEXEC);  // nobody waits for the other side
  EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", path("fifo")}, bytes("C1 C2")).status, 0);
  char received[8];
  EXPECT_EQ(std::string(received, static_cast<size_t>(::read(reader, received, sizeof received))), "AB");
  ::close(reader);
  EXPECT_TRUE(fs::is_fifo(path("fifo")));
}

TEST_F(ConvertFiles, OutputThatIsNone) {
  ToolInput input;
  input.text = std::string(1 << 20, '\xC1');
  input.output_pipe_closed = true;
  for (const char* arguments : {"convert -f 37", "list codepages", "--help"}) {
    const ToolResult result = run_tool(arguments, input);
    EXPECT_EQ(result.status, 3);
    EXPECT_EQ(result.signal, 0);
    EXPECT_EQ(result.errors, "");
  }
  // Nor may an input file become the output, being opened in its place or being both.
  const std::string file = write("text", bytes("C1 C2"));
  EXPECT_EQ(run_in_shell("exec \"$0\" convert -f 37 " + file + " >&-").status, 3);
  const ToolResult appended = run_in_shell("exec \"$0\" convert -f 37 " + file + " >> " + file);
  EXPECT_EQ(appended.status, 3);
  expect_told(appended, "both input and output");
  EXPECT_EQ(read("text"), bytes("C1 C2"));
}

TEST_F(ConvertFiles, UnwritableAndUnreadableFiles) {
  fs::permissions(path(""), fs::perms::all);
  ToolInput input;
  input.unprivileged = true;
  if (run_tool("--version", input).status != 0) GTEST_SKIP() << "the program lies where only its builder may go";
  const std::string file = write("text", bytes("C1"));
  ::chmod(file.c_str(), 0444);
  const ToolResult unwritable = run_tool({"convert", "-f", "37", "-o", file, file}, input);
  ::chmod(file.c_str(), 0);
  const ToolResult unreadable = run_tool({"convert", "-f", "37", file}, input);
  for (const ToolResult& result : {unwritable, unreadable}) {
    EXPECT_EQ(result.status, 3);
    expect_told(result, "Permission denied");
  }
  EXPECT_EQ(files(), (std::vector<std::string>{"text"}));
}

TEST_F(ConvertFiles, InterruptLeavesNothingBehind) {
  write("out", "former");
  for (int signal : {SIGINT, SIGTERM, SIGHUP}) {
    ToolInput input;
    input.signal = signal;
    input.next = [&, open = false](std::string& piece) mutable {
      piece.assign(1000, '\xC1');
      // The former output and two temporary files are there.
      for (int tries = 0; tries < 2000 && open && files().size() < 3; ++tries) ::usleep(5000);
      EXPECT_TRUE(!open || files().size() == 3);
      return !std::exchange(open, true);
    };
    EXPECT_EQ(run_tool({"convert", "-f", "37", "-o", path("out"), "--report", path("report")}, input).signal, signal);
    EXPECT_EQ(files(), (std::vector<std::string>{"out"}));
    EXPECT_EQ(read("out"), "former");
  }
}

TEST_F(ConvertFiles, ReportNeverReplacesTheText) {
  const std::string file = write("text", bytes("C1"));
  fs::create_hard_link(file, path("same"));
  check_runs("convert -f 37", {{{"--report", file, file}, "", "", 2, "--report"},
                               {{"--report", path("same"), file}, "", "", 2, "--report"},
                               {{"-o", path("out"), "--report", path("out"), file}, "", "", 2, "--report"}});
  EXPECT_EQ(read("text"), bytes("C1"));
  EXPECT_EQ(files(), (std::vector<std::string>{"same", "text"}));
}

}  // namespace
}  // namespace lx::test
