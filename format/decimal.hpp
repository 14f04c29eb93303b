// SPDX-License-Identifier: Apache-2.0
// Digits of integers, as ASCII, written backwards in pairs.
#pragma once

#include <cstdint>
#include <cstring>

namespace lx {

inline constexpr size_t kMaxDigits = 20;  // of 64 bits

struct DigitPairs {
  char text[200];

  constexpr DigitPairs() : text() {
    for (unsigned i = 0; i < 100; ++i) {
      text[2 * i] = static_cast<char>('0' + i / 10);
      text[2 * i + 1] = static_cast<char>('0' + i % 10);
    }
  }
};
inline constexpr DigitPairs kDigitPairs;

inline char* put_pair(char* to, unsigned value) {
  std::memcpy(to - 2, kDigitPairs.text + size_t{2} * value, 2);
  return to - 2;
}

// Both return where the digits begin.
template <class Value>
char* put_digits(char* to, Value value) {
  for (; value >= 100; value /= 100) to = put_pair(to, static_cast<unsigned>(value % 100));
  if (value >= 10) return put_pair(to, static_cast<unsigned>(value));
  *--to = static_cast<char>('0' + value);
  return to;
}

// With leading zeros.
inline char* put_digits(char* to, uint32_t value, unsigned count) {
  for (; count >= 2; count -= 2, value /= 100) to = put_pair(to, value % 100);
  if (count != 0) *--to = static_cast<char>('0' + value);
  return to;
}

}  // namespace lx
