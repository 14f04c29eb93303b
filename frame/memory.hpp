// SPDX-License-Identifier: Apache-2.0
// All memory of the library comes from the allocation callbacks; ownership is a value, failure is a null.
#pragma once

#include <cstddef>
#include <cstring>
#include <type_traits>
#include <utility>

#include <lexaro/lexaro.h>

namespace lx {

void set_allocator(LXAllocFn alloc, LXFreeFn free, void* context);

void* allocate(size_t size);
bool release(const void* block);  // false: the free callback reported failure

// A block of `count` trivial elements that is freed with its owner.
template <class T>
class Owned {
  static_assert(std::is_trivially_destructible_v<T>);

 public:
  Owned() = default;
  explicit Owned(T* block) : block_(block) {}
  Owned(Owned&& other) noexcept : block_(std::exchange(other.block_, nullptr)) {}
  Owned& operator=(Owned&& other) noexcept {
    if (this != &other) reset(std::exchange(other.block_, nullptr));
    return *this;
  }
  ~Owned() { reset(); }

  // Uninitialised; null when there is no memory.
  static Owned array(size_t count) { return Owned(static_cast<T*>(allocate(count * sizeof(T)))); }
  static Owned zeroed(size_t count = 1) {
    Owned owned = array(count);
    if (owned) std::memset(static_cast<void*>(owned.block_), 0, count * sizeof(T));
    return owned;
  }

  explicit operator bool() const { return block_ != nullptr; }
  T* get() const { return block_; }
  T* operator->() const { return block_; }
  T& operator*() const { return *block_; }
  T& operator[](size_t index) const { return block_[index]; }
  [[nodiscard]] T* give_up() { return std::exchange(block_, nullptr); }
  void reset(T* block = nullptr) {
    if (T* old = std::exchange(block_, block)) release(old);
  }

 private:
  T* block_ = nullptr;
};

}  // namespace lx
