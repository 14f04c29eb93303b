// SPDX-License-Identifier: Apache-2.0
#include "pack_pool.hpp"

#include <algorithm>

namespace lx::compiler {

bool Pool::fits(const std::vector<uint64_t>& row, size_t position) const {
  size_t count = std::min(row.size(), elements_.size() - position);
  for (size_t i = 0; i < count; ++i) {
    uint64_t present = elements_[position + i];
    if (present != row[i] && present != kFree && row[i] != kFree) return false;
  }
  return true;
}

size_t Pool::place(const std::vector<uint64_t>& row, size_t least, size_t step) {
  size_t position = least;
  while (position < elements_.size() && !fits(row, position)) position += step;
  if (elements_.size() < position + row.size()) elements_.resize(position + row.size(), kFree);
  for (size_t i = 0; i < row.size(); ++i) {
    if (row[i] != kFree) elements_[position + i] = row[i];
  }
  return position;
}

std::vector<uint64_t> Pool::take(uint64_t filler) {
  std::replace(elements_.begin(), elements_.end(), kFree, filler);
  return std::move(elements_);
}

uint8_t narrowest_mask(uint8_t low, uint8_t high) {
  unsigned mask = 0xFF;
  while (mask != 0 && (low & mask >> 1) + (high - low) == (high & mask >> 1)) mask >>= 1;
  return static_cast<uint8_t>(mask);
}

}  // namespace lx::compiler
