// SPDX-License-Identifier: Apache-2.0
#include "support/page_object.hpp"

#include <fstream>
#include <iterator>
#include <stdexcept>

namespace lx::test {
namespace {

uint32_t number(const std::string& file, size_t at, size_t size) {
  uint32_t value = 0;
  for (size_t i = 0; i < size; ++i) value = value << 8 | static_cast<uint8_t>(file.at(at + i));
  return value;
}

}  // namespace

PageObject::PageObject(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  std::string file{std::istreambuf_iterator<char>(in), {}};
  if (file.size() < 76) throw std::runtime_error("cannot read " + path);
  section_ = file.substr(number(file, 12, 4), number(file, 10, 2));
  if (byte(5) == 1) return;  // no multibyte characters
  // A one-byte half-width form wins over the pairs, an earlier pair over a later one.
  size_t table = u16(4366);
  for (uint32_t half = 0; table != 0 && half < 256; ++half) {
    if (u32(table + 4 * half) != 0) half_.emplace(u32(table + 4 * half), half);
  }
  size_t pairs = u16(4368);
  for (size_t i = 0; pairs != 0 && i < u16(6); ++i) {
    full_.emplace(u32(pairs + 8 * i), u32(pairs + 8 * i + 4));
    half_.emplace(u32(pairs + 8 * i + 4), u32(pairs + 8 * i));
  }
}

std::pair<uint32_t, int32_t> PageObject::type(std::string_view bytes) const {
  size_t state = 0;
  size_t used = 0;
  for (;;) {
    size_t at = u16(4370) + 4 * state;
    uint8_t here = used < bytes.size() ? static_cast<uint8_t>(bytes[used]) : uint8_t{0};
    size_t next = static_cast<size_t>(u16(at + 2)) + (here & byte(at + 1));
    if (byte(at) != 0) {
      size_t entry = u16(4372) + 8 * next;
      return {u32(entry), static_cast<int32_t>(u32(entry + 4))};
    }
    state = next;
    ++used;
  }
}

uint32_t PageObject::full_width(uint32_t half) const {
  auto found = full_.find(half);
  return found == full_.end() ? 0 : found->second;
}

uint32_t PageObject::half_width(uint32_t full) const {
  auto found = half_.find(full);
  return found == half_.end() ? 0 : found->second;
}

}  // namespace lx::test
