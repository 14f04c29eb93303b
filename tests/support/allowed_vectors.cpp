// SPDX-License-Identifier: Apache-2.0
// Linked into a test, this lets LEXARO_TEST_VECTORS choose the way that runs of characters take: 0 plain loops, 1
// blocks of 32 bytes, 2 lookups in tables. What the processor lacks is never taken.
#include <cstdlib>

#include "codepage/text/byte_runs.hpp"

namespace {

[[maybe_unused]] const bool applied = [] {
  if (const char* level = std::getenv("LEXARO_TEST_VECTORS")) {
    lx::allowed_vectors = static_cast<lx::Vectors>(std::atoi(level));
  }
  return true;
}();

}  // namespace
