// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <lexaro/lexaro.h>

#include <string>

#include "bench/support/program.hpp"

namespace lx::bench {

// The library from here to the end of the block.
class Library {
 public:
  explicit Library(const Options& options) {
    if (LXInit(options.data, nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS) != LX_OK)
      throw Failure(std::string("no locale data in ") + options.data);
  }
  ~Library() { LXTerm(); }
  Library(const Library&) = delete;
  Library& operator=(const Library&) = delete;
};

}  // namespace lx::bench
