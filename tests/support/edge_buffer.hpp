// SPDX-License-Identifier: Apache-2.0
// One block before an unmapped page, used again and again: each text or room given out ends exactly at the edge.
#pragma once

#include <cstring>
#include <string_view>

#include "support/session.hpp"

namespace lx::test {

class EdgeBuffer {
 public:
  explicit EdgeBuffer(size_t size) : block_(size) {}

  template <class Unit = char>
  Unit* room(size_t count) {
    size_t size = count * sizeof(Unit);
    char* at = block_.data() + block_.size() - size;
    std::memset(at, '\x5A', size);
    return reinterpret_cast<Unit*>(at);
  }
  const char* text(std::string_view bytes) {
    char* at = room(bytes.size());
    if (!bytes.empty()) std::memcpy(at, bytes.data(), bytes.size());
    return at;
  }

 private:
  Guarded block_;
};

}  // namespace lx::test
