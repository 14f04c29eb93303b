// SPDX-License-Identifier: Apache-2.0
// What the fuzz targets share: the library and its locales, a file that is the input, texts that end where their
// memory does.
#pragma once

#include <lexaro/lexaro.h>

#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

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
  void write(std::string_view bytes) const;

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
  size_t size() const { return size_; }

 private:
  const uint8_t* data_;
  size_t size_;
};

// What one program tries its inputs on, with the library as long as it lives.
class Target {
 public:
  virtual ~Target();
  Target(const Target&) = delete;
  Target& operator=(const Target&) = delete;
  virtual void run(InputBytes input) = 0;

 protected:
  Target() = default;
  // Starts the library, and makes locales of names between those two.
  void start(const char* directory, const std::string& before = "", const std::vector<std::string>& names = {},
             const std::string& after = "");

  std::vector<LXLocale*> locales_;
};
std::unique_ptr<Target> make_target();

// A text in a block of its own size.
template <class U>
struct Text {
  explicit Text(std::string_view bytes, bool terminated = false)
      : units(bytes.size() / sizeof(U)), length(static_cast<int32_t>(units)), block(new U[units + terminated]) {
    if (units != 0) std::memcpy(block.get(), bytes.data(), units * sizeof(U));
    if (terminated) block[units] = 0;
  }
  U* at() const { return block.get(); }

  size_t units;    // without terminator
  int32_t length;  // as calls are told it
  uint32_t shift_state = 0;
  std::unique_ptr<U[]> block;
};

}  // namespace lx::fuzz
