// SPDX-License-Identifier: Apache-2.0
// Memory for texts of unknown size. The system promises more than it has and ends a program that takes it at its word:
// so what is there is asked for first.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>
#include <vector>

namespace lx::tool {

class MemoryBudget {
 public:
  MemoryBudget();
  // Throws a Failure when the machine lacks that much.
  void take(uint64_t bytes);
  void give_back(uint64_t bytes) { taken_ -= bytes; }
  [[noreturn]] static void fail();

 private:
  uint64_t room_;
  uint64_t taken_ = 0;
};

// Byte strings that stay where they are until the store goes.
class ByteStore {
 public:
  explicit ByteStore(MemoryBudget& budget) : budget_(budget) {}
  const char* keep(std::string_view bytes);

 private:
  MemoryBudget& budget_;
  std::vector<std::unique_ptr<char[]>> blocks_;
  char* at_ = nullptr;
  std::size_t room_ = 0;
};

}  // namespace lx::tool
