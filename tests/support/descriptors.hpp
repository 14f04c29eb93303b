// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <filesystem>

namespace lx::test {

// Open descriptors of this process.
inline long open_descriptors() {
  return std::distance(std::filesystem::directory_iterator("/proc/self/fd"), std::filesystem::directory_iterator());
}

}  // namespace lx::test
