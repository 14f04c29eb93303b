// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/input_file.hpp"

#include <fcntl.h>

#include <algorithm>
#include <vector>

#include "tools/lexaro/failure.hpp"

namespace lx::tool {

InputFile::InputFile(const std::string& path) : name_(display_name(path)), fd_(STDIN_FILENO) {
  if (path != "-") {
    owned_ = FileDescriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY));
    if (!owned_) throw system_failure(name_, errno);
    fd_ = owned_.get();
  }
  if (::fstat(fd_, &status_) != 0) throw system_failure(name_, errno);
  if (S_ISDIR(status_.st_mode)) throw system_failure(name_, EISDIR);
}

std::size_t InputFile::read(std::span<char> buffer) {
  const ssize_t count = persist(fd_, POLLIN, [&] { return ::read(fd_, buffer.data(), buffer.size()); });
  if (count < 0) throw system_failure(name_ + ": read error at byte " + std::to_string(offset_), errno);
  offset_ += static_cast<uint64_t>(count);
  return static_cast<std::size_t>(count);
}

uint64_t InputFile::skip(uint64_t wanted) {
  if (S_ISREG(status_.st_mode)) {
    const off_t at = ::lseek(fd_, 0, SEEK_CUR);
    if (at < 0) throw system_failure(name_, errno);
    const uint64_t left = status_.st_size > at ? static_cast<uint64_t>(status_.st_size - at) : 0;
    const uint64_t skipped = std::min(wanted, left);
    if (::lseek(fd_, static_cast<off_t>(skipped), SEEK_CUR) < 0) throw system_failure(name_, errno);
    offset_ += skipped;
    return skipped;
  }
  std::vector<char> passed(64 * 1024);
  uint64_t skipped = 0;
  while (skipped < wanted) {
    const std::size_t count = read(std::span(passed).first(std::min<uint64_t>(passed.size(), wanted - skipped)));
    if (count == 0) break;
    skipped += count;
  }
  return skipped;
}

std::optional<uint64_t> total_size(std::span<const std::string> paths) {
  uint64_t total = 0;
  for (const std::string& path : paths) {
    struct stat status {};
    const bool standard_input = path == "-";
    const int failed = standard_input ? ::fstat(STDIN_FILENO, &status) : ::stat(path.c_str(), &status);
    if (failed != 0 || !S_ISREG(status.st_mode)) return std::nullopt;
    const off_t start = standard_input ? ::lseek(STDIN_FILENO, 0, SEEK_CUR) : 0;
    if (start >= 0 && status.st_size > start) total += static_cast<uint64_t>(status.st_size - start);
  }
  return total;
}

}  // namespace lx::tool
