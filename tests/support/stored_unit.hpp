// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <string>

namespace lx::test {

// A unit of `size` bytes as the machine keeps it in memory.
inline std::string stored_unit(uint32_t unit, size_t size) {
  const char* bytes = reinterpret_cast<const char*>(&unit);
  return {bytes + (std::endian::native == std::endian::big ? sizeof unit - size : 0), size};
}

}  // namespace lx::test
