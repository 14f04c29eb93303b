// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/input_file.hpp"

#include <fcntl.h>

#include <algorithm>
#include <vector>

#include "tools/lexaro/failure.hpp"

namespace lx::tool {

InputFile::InputFile(const std::string& path) : path_(path), fd_(STDIN_FILENO) {
  if (path != "-") {
    owned_ = FileDescriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY));
    if (!owned_) throw failure(errno);
    fd_ = owned_.get();
  }
  if (::fstat(fd_, &status_) != 0) throw failure(errno);
  if (S_ISDIR(status_.st_mode)) throw failure(EISDIR);
}

Message InputFile::name() const { return display_name(path_); }

Failure InputFile::failure(int error_number) const { return system_failure(name(), error_number); }

std::size_t InputFile::read(std::span<char> buffer) {
  const ssize_t count = persist(fd_, POLLIN, [&] { return ::read(fd_, buffer.data(), buffer.size()); });
  if (count < 0) {
    const int error_number = errno;
    throw system_failure(message("{0}: read error at byte {1}", name(), offset_), error_number);
  }
  offset_ += static_cast<uint64_t>(count);
  return static_cast<std::size_t>(count);
}

uint64_t InputFile::skip(uint64_t wanted) {
  if (S_ISREG(status_.st_mode)) {
    const off_t at = ::lseek(fd_, 0, SEEK_CUR);
    if (at < 0) throw failure(errno);
    const uint64_t left = status_.st_size > at ? static_cast<uint64_t>(status_.st_size - at) : 0;
    const uint64_t skipped = std::min(wanted, left);
    if (::lseek(fd_, static_cast<off_t>(skipped), SEEK_CUR) < 0) throw failure(errno);
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
