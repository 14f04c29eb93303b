// SPDX-License-Identifier: Apache-2.0
#include "files.hpp"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <utility>

namespace lx::compiler {

namespace {

[[noreturn]] void fail(const fs::path& path, const char* what, int error) {
  throw IoError(path.string() + ": " + tool::message(what) + ": " + tool::system_error_text(error));
}

class Descriptor {
 public:
  explicit Descriptor(int number) : number_(number) {}
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  ~Descriptor() {
    if (number_ >= 0) ::close(number_);
  }
  int get() const { return number_; }
  int close() { return ::close(std::exchange(number_, -1)); }

 private:
  int number_;
};

void write_all(int descriptor, std::string_view bytes, const fs::path& path) {
  while (!bytes.empty()) {
    ssize_t written = ::write(descriptor, bytes.data(), bytes.size());
    if (written < 0) {
      if (errno == EINTR) continue;
      fail(path, "cannot write", errno);
    }
    bytes.remove_prefix(static_cast<size_t>(written));
  }
}

}  // namespace

std::string read_file(const fs::path& path) {
  Descriptor file(::open(path.c_str(), O_RDONLY | O_CLOEXEC));
  if (file.get() < 0) fail(path, "cannot open", errno);
  std::string bytes;
  char block[65536];
  for (;;) {
    ssize_t count = ::read(file.get(), block, sizeof block);
    if (count == 0) return bytes;
    if (count > 0) {
      bytes.append(block, static_cast<size_t>(count));
    } else if (errno != EINTR) {
      fail(path, "cannot read", errno);
    }
  }
}

void write_file(const fs::path& path, std::string_view bytes) {
  std::string temporary = path.string() + ".XXXXXX";
  Descriptor file(::mkstemp(temporary.data()));
  if (file.get() < 0) fail(path, "cannot create", errno);
  try {
    write_all(file.get(), bytes, path);
    mode_t mask = ::umask(0);
    ::umask(mask);
    if (::fchmod(file.get(), 0666 & ~mask) != 0) fail(path, "cannot set the mode", errno);
    if (file.close() != 0) fail(path, "cannot write", errno);
    if (::rename(temporary.c_str(), path.c_str()) != 0) fail(path, "cannot replace", errno);
  } catch (...) {
    ::unlink(temporary.c_str());
    throw;
  }
}

void make_directory(const fs::path& path) {
  std::error_code error;
  fs::create_directories(path, error);
  if (error) fail(path, "cannot create", error.value());
}

std::vector<fs::path> list_files(const fs::path& directory, std::string_view extension) {
  std::vector<fs::path> files;
  std::error_code error;
  for (fs::directory_iterator entry(directory, error), end; !error && entry != end; entry.increment(error)) {
    if (entry->path().extension() == extension && entry->is_regular_file()) files.push_back(entry->path());
  }
  if (error && error != std::errc::no_such_file_or_directory) fail(directory, "cannot list", error.value());
  std::sort(files.begin(), files.end());
  return files;
}

}  // namespace lx::compiler
