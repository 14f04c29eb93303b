// SPDX-License-Identifier: Apache-2.0
// An array that many tables share: where their elements agree, they lie over each other.
#pragma once

#include <cstddef>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

#include "tools/lexaroc/report.hpp"

namespace lx::compiler {

// A page has more characters than its file format can hold.
class PackError : public Fault {
  using Fault::Fault;
};

inline constexpr size_t kLargestSection = 65535;

class Pool {
 public:
  static constexpr uint64_t kFree = ~uint64_t{0};  // nobody cares what stands here

  // The first position not below `least`, a multiple of `step` away from it, where the row fits without a conflict.
  size_t place(const std::vector<uint64_t>& row, size_t least, size_t step = 1);

  size_t size() const { return elements_.size(); }
  // The elements; those that are still free get this value.
  std::vector<uint64_t> take(uint64_t filler);

 private:
  bool fits(const std::vector<uint64_t>& row, size_t position) const;

  std::vector<uint64_t> elements_;
};

// The narrowest mask under which the bytes low to high stay distinct and in order.
uint8_t narrowest_mask(uint8_t low, uint8_t high);

}  // namespace lx::compiler
