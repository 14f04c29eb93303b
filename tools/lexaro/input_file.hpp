// SPDX-License-Identifier: Apache-2.0
// A file, pipe or terminal to read.
#pragma once

#include <sys/stat.h>

#include <cstdint>
#include <optional>
#include <span>
#include <string>

#include "tools/lexaro/failure.hpp"
#include "tools/lexaro/file_descriptor.hpp"

namespace lx::tool {

class InputFile {
 public:
  explicit InputFile(const std::string& path);  // "-": standard input

  // Bytes read, 0 at the end. Short reads are handed on as they come.
  std::size_t read(std::span<char> buffer);
  // Bytes passed over, fewer than wanted when the file ends. A regular file is not read for it.
  uint64_t skip(uint64_t wanted);

  const std::string& path() const { return path_; }
  Message name() const;
  const struct stat& status() const { return status_; }

 private:
  Failure failure(int error_number) const;
  std::string path_;
  FileDescriptor owned_;
  int fd_;
  struct stat status_ {};
  uint64_t offset_ = 0;
};

// Bytes that reading these files will give, when all of them are regular files.
std::optional<uint64_t> total_size(std::span<const std::string> paths);

}  // namespace lx::tool
