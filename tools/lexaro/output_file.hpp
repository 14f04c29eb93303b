// SPDX-License-Identifier: Apache-2.0
// A file, pipe or terminal to write. A regular file appears, or replaces its former self, only when it is committed.
#pragma once

#include <sys/stat.h>

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "tools/lexaro/failure.hpp"
#include "tools/lexaro/file_descriptor.hpp"
#include "tools/lexaro/temporary_file.hpp"

namespace lx::tool {

class OutputFile {
 public:
  explicit OutputFile(const std::string& path);  // "-": standard output

  void write(std::string_view bytes);
  // Closes the file and puts it in place. Without it, a regular file stays as it was.
  void commit();

  Message name() const;
  // The regular file that writing goes into at once, without a temporary, is this one.
  bool writes_into(const struct stat& file) const;
  // The regular file that a commit replaces is, or will be, at this path; empty when there is none.
  const std::string& target() const { return target_; }

 private:
  Failure failure(int error_number) const;
  void open_temporary(const struct stat* existing);
  FileDescriptor& descriptor() { return temporary_ ? temporary_->descriptor() : direct_; }

  std::string path_;
  std::string target_;
  std::unique_ptr<TemporaryFile> temporary_;
  FileDescriptor direct_;
  uint64_t offset_ = 0;
};

// Writes a text to standard output.
void print(std::string_view text);

}  // namespace lx::tool
