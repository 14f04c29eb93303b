// SPDX-License-Identifier: Apache-2.0
// Integers as the data files store them: most significant byte first, at any address.
#pragma once

#include <bit>
#include <cstdint>
#include <type_traits>

namespace lx {

template <class T>
class Be {
 public:
  constexpr Be() = default;
  constexpr Be(T value) { store(value); }  // NOLINT: a field is assigned like a number

  constexpr operator T() const {  // NOLINT: and read like one
    auto value = std::bit_cast<std::make_unsigned_t<T>>(bytes_);
    if constexpr (std::endian::native == std::endian::little) value = swapped(value);
    return static_cast<T>(value);
  }
  constexpr Be& operator=(T value) {
    store(value);
    return *this;
  }

 private:
  static constexpr uint16_t swapped(uint16_t value) { return __builtin_bswap16(value); }
  static constexpr uint32_t swapped(uint32_t value) { return __builtin_bswap32(value); }
  constexpr void store(T value) {
    auto rest = static_cast<uint64_t>(value);
    for (unsigned i = sizeof(T); i-- > 0; rest >>= 8) bytes_[i] = static_cast<uint8_t>(rest);
  }
  uint8_t bytes_[sizeof(T)] = {};
};

using BeU16 = Be<uint16_t>;
using BeU32 = Be<uint32_t>;
using BeI32 = Be<int32_t>;

static_assert(sizeof(BeU16) == 2 && alignof(BeU16) == 1 && sizeof(BeU32) == 4 && alignof(BeU32) == 1);

}  // namespace lx
