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
#include <nlohmann/json.hpp>
#include <sstream>
#include <thread>

namespace lx::test {
namespace {

namespace fs = std::filesystem;

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
  int in[2], out[2], errors[2];
  for (int* ends : {in, out, errors}) {
    if (::pipe2(ends, O_CLOEXEC) != 0) std::abort();
  }
  if (input.output_pipe_closed) ::close(std::exchange(out[0], -1));
  const pid_t pid = ::fork();
  if (pid == 0) {
    ::dup2(in[0], STDIN_FILENO);
    ::dup2(out[1], STDOUT_FILENO);
    ::dup2(errors[1], STDERR_FILENO);
    std::signal(SIGPIPE, SIG_DFL);
    execute(arguments, input);
  }
  for (const int end : {in[0], out[1], errors[1]}) ::close(end);

  ToolResult result;
  uint64_t errors_size = 0;
  std::thread feeder([&] {
    feed(in[1], input);
    if (input.signal != 0) ::kill(pid, input.signal);
    ::close(in[1]);
  });
  std::thread listener([&] { collect(errors[0], &result.errors, errors_size); });
  collect(out[0], input.keep_output ? &result.output : nullptr, result.output_size);
  int status = 0;
  rusage usage{};
  while (::wait4(pid, &status, 0, &usage) < 0 && errno == EINTR) {
  }
  feeder.join();
  listener.join();
  for (const int end : {out[0], errors[0]}) ::close(end);
  if (WIFEXITED(status)) result.status = WEXITSTATUS(status);
  if (WIFSIGNALED(status)) result.signal = WTERMSIG(status);
  result.peak_kib = usage.ru_maxrss;
  return result;
}

ToolInput repeated(const std::string& piece, int times) {
  ToolInput input;
  input.keep_output = false;
  input.next = [piece, times](std::string& next) mutable {
    next = piece;
    return times-- > 0;
  };
  return input;
}

ToolResult run_tool(const Arguments& arguments, const std::string& text) {
  ToolInput input;
  input.text = text;
  return run_tool(arguments, input);
}

ToolResult run_in_shell(const std::string& command, ToolInput input) {
  input.program = "/bin/sh";
  return run_tool({"-c", command, LEXARO_TOOL}, input);
}

Arguments::Arguments(const char* words) {
  std::istringstream in(words);
  for (std::string word; in >> word;) push_back(word);
}

void expect_told(const ToolResult& result, const std::string& text) {
  EXPECT_NE(result.errors.find(text), std::string::npos) << "missing: " << text << "\nin: " << result.errors;
}

Arguments operator+(Arguments all, const Arguments& more) {
  all.insert(all.end(), more.begin(), more.end());
  return all;
}

void check_runs(const Arguments& command, const std::vector<Run>& runs) {
  for (const Run& run : runs) {
    ToolInput input;
    input.text = run.input;
    input.environment = run.environment;
    const Arguments arguments = command + run.arguments;
    const ToolResult result = run_tool(arguments, input);
    SCOPED_TRACE(testing::PrintToString(arguments) + " " + run.input + "\n" + result.errors);
    EXPECT_EQ(result.output, run.output);
    EXPECT_EQ(result.status, run.status);
    EXPECT_EQ(result.errors.substr(0, 8), run.error.empty() ? "" : "lexaro: ");
    expect_told(result, run.error);
  }
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

std::vector<std::string> lines_of(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream in(text);
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
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

void expect_json(const std::string& document, const std::string& part) {
  using Json = nlohmann::json;
  const Json wanted = Json::parse(part), whole = Json::parse(document, nullptr, false);
  const std::function<bool(const Json&, const Json&)> has = [&](const Json& json, const Json& wants) {
    if (!wants.is_structured()) return json == wants;
    bool all = json.type() == wants.type() && (wants.is_object() || wants.size() == json.size());
    for (const auto& [name, value] : wants.items()) {
      all = all && (wants.is_array() || json.contains(name)) &&
            has(wants.is_array() ? json[std::stoul(name)] : json[name], value);
    }
    return all;
  };
  EXPECT_TRUE(has(whole, wanted)) << "missing: " << wanted << "\nin: " << document;
}

std::vector<std::pair<std::string, std::string>> json_items(const std::string& document) {
  const auto json = nlohmann::ordered_json::parse(document, nullptr, false);
  std::vector<std::pair<std::string, std::string>> items;
  for (const auto& [name, value] : json.items()) {
    items.emplace_back(name, value.is_string() ? value.get<std::string>() : value.dump());
  }
  return items;
}

}  // namespace lx::test
