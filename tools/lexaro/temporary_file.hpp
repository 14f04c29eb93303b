// SPDX-License-Identifier: Apache-2.0
// A file under construction, which no failure and no interrupt leaves behind.
#pragma once

#include <string>

#include "tools/lexaro/file_descriptor.hpp"

namespace lx::tool {

class TemporaryFile {
 public:
  // In the directory of `target`, so that a rename puts it in place at once.
  explicit TemporaryFile(std::string target);
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;
  ~TemporaryFile();

  FileDescriptor& descriptor() { return descriptor_; }
  // Replaces the target; false with errno.
  bool rename_to_target();

 private:
  std::string target_;
  std::string path_;
  FileDescriptor descriptor_;
  int slot_ = -1;
};

// Lets SIGHUP, SIGINT and SIGTERM remove unfinished temporary files before they end the process as usual, and turns
// a closed pipe or a reached file size limit into an error of the write.
void install_signal_handling();

}  // namespace lx::tool
