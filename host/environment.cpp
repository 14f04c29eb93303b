// SPDX-License-Identifier: Apache-2.0
// The default environment: that of the process.
#include <lexaro/host.h>

#include <cstdlib>

[[gnu::weak]] const char* HSV1_GetEnv(const char* name, uint32_t /*reserved*/) noexcept {
  return name == nullptr ? nullptr : std::getenv(name);
}
