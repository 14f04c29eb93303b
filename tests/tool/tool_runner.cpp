// SPDX-License-Identifier: Apache-2.0
#include "tests/tool/tool_runner.hpp"

#include <fcntl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <thread>

namespace lx::test {
namespace {

namespace fs = std::filesystem;

struct Pipe {
  Pipe() {
    int ends[2] = {-1, -1};
    if (::pipe2(ends, O_CLOEXEC) != 0) std::abort();
    reader = ends[0];
    writer = ends[1];
  }
  Pipe(const Pipe&) = delete;
  Pipe& operator=(const Pipe&) = delete;
  ~Pipe() {
    close_reader();
    close_writer();
  }
  void close_reader() { drop(reader); }
  void close_writer() { drop(writer); }
  static void drop(int& fd) {
    if (fd >= 0) ::close(fd);
    fd = -1;
  }
  int reader;
  int writer;
};

[[noreturn]] void execute(const Arguments& arguments, const ToolInput& input) {
  constexpr uid_t kNobody = 65534;
  if (input.unprivileged && ::geteuid() == 0 && (::setgid(kNobody) != 0 || ::setuid(kNobody) != 0)) ::_exit(126);
  std::vector<std::string> words = {input.program};
  words.insert(words.end(), arguments.begin(), arguments.end());
  std::vector<char*> argv;
  for (std::string& word : words) argv.push_back(word.data());
  argv.push_back(nullptr);

  std::vector<std::string> settings = {"PATH=/usr/bin:/bin"};
  for (const auto& [name, value] : input.environment) settings.push_back(name + "=" + value);
  for (const char* name : {"ASAN_OPTIONS", "UBSAN_OPTIONS", "TSAN_OPTIONS", "LSAN_OPTIONS"}) {
    const char* value = std::getenv(name);
    const std::string given = value ? std::string(value) + ":" : "";
    settings.push_back(std::string(name) + "=" + given + "exitcode=99");  // no exit code of the program's own
  }
  std::vector<char*> envp;
  for (std::string& setting : settings) envp.push_back(setting.data());
  envp.push_back(nullptr);
  ::execve(argv[0], argv.data(), envp.data());
  ::_exit(127);
}

int open_output(const ToolInput& input, int pipe_writer) {
  if (!input.output_path) return pipe_writer;
  return ::open(input.output_path->c_str(), O_WRONLY | O_CREAT | input.output_flags, 0644);
}

void feed(int fd, const ToolInput& input) {
  std::string piece = input.text;
  bool once = true;
  while (input.next ? input.next(piece) : std::exchange(once, false)) {
    std::size_t done = 0;
    while (done < piece.size()) {
      const ssize_t count = ::write(fd, piece.data() + done, piece.size() - done);
      if (count <= 0) return;  // the program stopped reading
      done += static_cast<std::size_t>(count);
    }
    int unread = 1;
    while (input.wait_for_reader && ::ioctl(fd, FIONREAD, &unread) == 0 && unread > 0) {
      pollfd gone{fd, 0, 0};
      if (::poll(&gone, 1, 0) > 0) return;
      std::this_thread::yield();
    }
  }
}

void collect(int fd, std::string* text, uint64_t& size) {
  std::array<char, 65536> buffer;
  for (;;) {
    const ssize_t count = ::read(fd, buffer.data(), buffer.size());
    if (count <= 0) return;
    if (text) text->append(buffer.data(), static_cast<std::size_t>(count));
    size += static_cast<uint64_t>(count);
  }
}

}  // namespace

ToolResult run_tool(const Arguments& arguments, const ToolInput& input) {
  std::signal(SIGPIPE, SIG_IGN);
  Pipe in;
  Pipe out;
  Pipe errors;
  const int output = open_output(input, out.writer);
  if (input.output_pipe_closed) out.close_reader();
  const pid_t pid = ::fork();
  if (pid == 0) {
    ::dup2(in.reader, STDIN_FILENO);
    ::dup2(errors.writer, STDERR_FILENO);
    if (input.output_closed) {
      ::close(STDOUT_FILENO);
    } else {
      ::dup2(output, STDOUT_FILENO);
    }
    std::signal(SIGPIPE, SIG_DFL);
    execute(arguments, input);
  }
  if (input.output_path) ::close(output);
  in.close_reader();
  out.close_writer();
  errors.close_writer();

  ToolResult result;
  uint64_t errors_size = 0;
  std::thread feeder([&] {
    feed(in.writer, input);
    in.close_writer();
  });
  std::thread listener([&] { collect(errors.reader, &result.errors, errors_size); });
  collect(out.reader, input.keep_output ? &result.output : nullptr, result.output_size);
  int status = 0;
  rusage usage{};
  while (::wait4(pid, &status, 0, &usage) < 0 && errno == EINTR) {
  }
  feeder.join();
  listener.join();
  if (WIFEXITED(status)) result.status = WEXITSTATUS(status);
  if (WIFSIGNALED(status)) result.signal = WTERMSIG(status);
  result.peak_kib = usage.ru_maxrss;
  return result;
}

ToolResult run_tool(const Arguments& arguments, const std::string& text) {
  ToolInput input;
  input.text = text;
  return run_tool(arguments, input);
}

RunningTool::RunningTool(const Arguments& arguments) {
  Pipe in;
  pid_ = ::fork();
  if (pid_ == 0) {
    ::dup2(in.reader, STDIN_FILENO);
    execute(arguments, {});
  }
  input_ = std::exchange(in.writer, -1);
}

RunningTool::~RunningTool() {
  ::close(input_);
  if (pid_ > 0) kill(SIGKILL);
}

void RunningTool::send(const std::string& text) const {
  EXPECT_EQ(::write(input_, text.data(), text.size()), static_cast<ssize_t>(text.size()));
}

int RunningTool::kill(int signal_number) {
  ::kill(pid_, signal_number);
  int status = 0;
  while (::waitpid(pid_, &status, 0) < 0 && errno == EINTR) {
  }
  pid_ = -1;
  return WIFSIGNALED(status) ? WTERMSIG(status) : 0;
}

ToolTest::ToolTest() {
  std::string name = (fs::temp_directory_path() / "lexaro-test-XXXXXX").string();
  if (::mkdtemp(name.data()) == nullptr) std::abort();
  directory_ = name;
}

ToolTest::~ToolTest() { fs::remove_all(directory_); }

std::string ToolTest::write(const std::string& name, const std::string& content) const {
  std::ofstream(path(name), std::ios::binary) << content;
  return path(name);
}

std::string ToolTest::read(const std::string& name) const {
  std::ostringstream content;
  content << std::ifstream(path(name), std::ios::binary).rdbuf();
  return content.str();
}

std::vector<std::string> ToolTest::files() const {
  std::vector<std::string> names;
  for (const auto& entry : fs::directory_iterator(directory_)) names.push_back(entry.path().filename().string());
  std::sort(names.begin(), names.end());
  return names;
}

std::string bytes(const std::string& hexadecimal) {
  std::string digits;
  std::remove_copy(hexadecimal.begin(), hexadecimal.end(), std::back_inserter(digits), ' ');
  std::string text;
  for (std::size_t i = 0; i + 1 < digits.size(); i += 2) {
    text.push_back(static_cast<char>(std::stoi(digits.substr(i, 2), nullptr, 16)));
  }
  return text;
}

}  // namespace lx::test
