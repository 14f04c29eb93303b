// SPDX-License-Identifier: Apache-2.0
// What the fuzz targets share: a data directory one of whose files is the input.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "support/object_builder.hpp"

namespace lx::fuzz {

// Says what went wrong and aborts, so that the fuzzer keeps the input. Null: nothing did.
void demand(const char* wrong);
void demand(bool holds, const char* what);

// A file that gets new contents for every input.
class InputFile {
 public:
  InputFile(const test::DataDirectory& directory, std::string_view name);
  ~InputFile();
  InputFile(const InputFile&) = delete;
  InputFile& operator=(const InputFile&) = delete;
  void write(const uint8_t* data, size_t size) const;

 private:
  int descriptor_;
};

// Takes an input apart. Behind its end there are zeros.
class InputBytes {
 public:
  InputBytes(const uint8_t* data, size_t size) : data_(data), size_(size) {}
  uint8_t byte() {
    if (size_ == 0) return 0;
    --size_;
    return *data_++;
  }
  std::string_view rest() const { return {reinterpret_cast<const char*>(data_), size_}; }
  const uint8_t* data() const { return data_; }
  size_t size() const { return size_; }

 private:
  const uint8_t* data_;
  size_t size_;
};

}  // namespace lx::fuzz
