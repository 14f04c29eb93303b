// SPDX-License-Identifier: Apache-2.0
// A data file open for reading, closed when its owner ends.
#pragma once

#include "frame/library.hpp"
#include "frame/memory.hpp"

namespace lx {

class DataFile {
 public:
  DataFile(const char* name, uint32_t& rc) {
    const LXGlobals* area = live_globals();
    file_ = LXOpenFile(area != nullptr ? area->file_access_mode : 0, name, 0, 0, &rc);
  }
  // A close that fails keeps the handle for the caller to see, who has no use for it here.
  ~DataFile() {
    if (file_ != nullptr && LXCloseFile(file_, 0) != 0) release(file_);
  }
  DataFile(const DataFile&) = delete;
  DataFile& operator=(const DataFile&) = delete;

  explicit operator bool() const { return file_ != nullptr; }
  LXFile* get() const { return file_; }

 private:
  LXFile* file_;
};

}  // namespace lx
