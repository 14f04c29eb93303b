// SPDX-License-Identifier: Apache-2.0
// The default trace service: one line a message, switched on by environment variables.
#include <fcntl.h>
#include <lexaro/host.h>
#include <pthread.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>

namespace lx {
namespace {

struct TraceSettings {
  uint32_t levels;
  int file;
};

pthread_once_t g_once = PTHREAD_ONCE_INIT;
std::atomic<bool> g_ready{false};
TraceSettings g_settings{0, -1};  // written once, before g_ready

// A program that runs with more rights than its user must not write where the user's environment says.
bool environment_is_trusted() { return getuid() == geteuid() && getgid() == getegid(); }

int open_trace_file() {
  const char* name = std::getenv("TRC1_FILE");
  if (name == nullptr || *name == '\0') return STDERR_FILENO;
  const int file = open(name, O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0600);
  return file < 0 ? STDERR_FILENO : file;
}

void read_settings() {
  const char* word = std::getenv("TRC1_FLAGS");
  if (word != nullptr && environment_is_trusted()) {
    g_settings.levels = static_cast<uint32_t>(std::strtoul(word, nullptr, 16));
    if (g_settings.levels != 0) g_settings.file = open_trace_file();
  }
  g_ready.store(true, std::memory_order_release);
}

const TraceSettings& settings() {
  if (!g_ready.load(std::memory_order_acquire)) pthread_once(&g_once, read_settings);
  return g_settings;
}

// One line of output, at most as long as a pipe takes in one piece; what is longer is cut.
class TraceLine {
 public:
  TraceLine(const TRC1_Unit& unit, int32_t line) {
    append("%s %s(%d): ", unit.component, unit.module, static_cast<int>(line));
  }

  __attribute__((format(printf, 2, 3))) void append(const char* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    append_list(format, arguments);
    va_end(arguments);
  }

  __attribute__((format(printf, 2, 0))) void append_list(const char* format, va_list arguments) {
    const size_t room = sizeof text_ - used_;
    const int needed = std::vsnprintf(text_ + used_, room, format, arguments);
    if (needed < 0) return;
    const auto length = static_cast<size_t>(needed);
    used_ += length < room ? length : room - 1;
  }

  // Lines of several threads do not mix: the line goes out in one call.
  void write_to(int file) {
    while (used_ > 0 && text_[used_ - 1] == '\n') --used_;
    for (size_t i = 0; i < used_; ++i) {
      if (static_cast<unsigned char>(text_[i]) < ' ') text_[i] = ' ';
    }
    text_[used_++] = '\n';
    size_t done = 0;
    while (done < used_) {
      const ssize_t count = ::write(file, text_ + done, used_ - done);
      if (count > 0) done += static_cast<size_t>(count);
      if (count == 0 || (count < 0 && errno != EINTR)) return;
    }
  }

 private:
  char text_[4096];
  size_t used_ = 0;
};

// Tracing must not disturb what it watches.
class KeptErrno {
 public:
  KeptErrno() = default;
  ~KeptErrno() { errno = value_; }
  KeptErrno(const KeptErrno&) = delete;
  KeptErrno& operator=(const KeptErrno&) = delete;

 private:
  int value_ = errno;
};

constexpr size_t kDumpWidth = 16;

void append_dump_row(TraceLine& line, const unsigned char* bytes, size_t count) {
  for (size_t i = 0; i < kDumpWidth; ++i) {
    if (i < count) {
      line.append(" %02X", static_cast<unsigned>(bytes[i]));
    } else {
      line.append("   ");
    }
  }
  line.append("  |");
  for (size_t i = 0; i < count; ++i) line.append("%c", bytes[i] >= 0x20 && bytes[i] < 0x7F ? bytes[i] : '.');
  line.append("|");
}

}  // namespace
}  // namespace lx

[[gnu::weak]] void TRC1_Sync(TRC1_Unit* unit) noexcept {
  const uint32_t levels = lx::settings().levels;
  if (__atomic_load_n(&unit->flags, __ATOMIC_RELAXED) != levels)
    __atomic_store_n(&unit->flags, levels, __ATOMIC_RELAXED);
}

[[gnu::weak]] void TRC1_Event(TRC1_Unit* unit, int32_t line, uint32_t kind, const char* function,
                              intptr_t result) noexcept {
  const int file = lx::settings().file;
  if (file < 0) return;
  const lx::KeptErrno kept;
  lx::TraceLine out(*unit, line);
  switch (kind) {
    case TRC1_ENTRY:
      out.append("%s: entry", function);
      break;
    case TRC1_EXIT_RESULT:
      out.append("%s: exit, result %lld", function, static_cast<long long>(result));
      break;
    default:
      out.append("%s: exit", function);
      break;
  }
  out.write_to(file);
}

[[gnu::weak]] void TRC1_Printf(TRC1_Unit* unit, int32_t line, const char* format, ...) noexcept {
  const int file = lx::settings().file;
  if (file < 0) return;
  const lx::KeptErrno kept;
  lx::TraceLine out(*unit, line);
  va_list arguments;
  va_start(arguments, format);
  out.append_list(format, arguments);
  va_end(arguments);
  out.write_to(file);
}

[[gnu::weak]] void TRC1_Dump(TRC1_Unit* unit, int32_t line, const char* label, const void* data,
                             size_t length) noexcept {
  const int file = lx::settings().file;
  if (file < 0) return;
  const lx::KeptErrno kept;
  const auto* bytes = static_cast<const unsigned char*>(data);
  lx::TraceLine head(*unit, line);
  head.append("%s: %zu bytes", label, length);
  head.write_to(file);
  for (size_t offset = 0; offset < length; offset += lx::kDumpWidth) {
    const size_t rest = length - offset;
    lx::TraceLine row(*unit, line);
    row.append("%.64s %06zX:", label, offset);
    lx::append_dump_row(row, bytes + offset, rest < lx::kDumpWidth ? rest : lx::kDumpWidth);
    row.write_to(file);
  }
}
