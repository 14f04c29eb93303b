// SPDX-License-Identifier: Apache-2.0
// Sort keys, and comparison by the locale's sort object.
#pragma once

#include "collate/compare.hpp"
#include "collate/weights.hpp"
#include "frame/memory.hpp"

namespace lx {

inline constexpr uint32_t kTransformOptions = LX_CMP_NOCASE | LX_CMP_NOWIDTH;  // one of these values, or 0

inline bool is_transform(uint32_t options) {
  return options == 0 || options == LX_CMP_NOCASE || options == LX_CMP_NOWIDTH;
}

// A block for short work on the stack, for longer work from the allocation callback.
class WorkArea {
 public:
  // False: no memory.
  bool reserve(size_t size) {
    if (size > kOnStack) {
      block_ = Owned<uint8_t>::array(size);
      at_ = block_.get();
    }
    return at_ != nullptr;
  }
  uint8_t* get() const { return at_; }

 private:
  static constexpr size_t kOnStack = 256;

  alignas(8) uint8_t here_[kOnStack];
  uint8_t* at_ = here_;
  Owned<uint8_t> block_;
};

// The key of a text, of which no more than `size` bytes are written: its whole length, or -1 with the status in the
// call. The options are those of a transform.
template <class Kind>
int32_t transform_text(LocaleCall& call, uint8_t* key, size_t size, const Text<typename Kind::Unit>& text,
                       uint32_t options);

// Of UCS-2 characters; -1: no memory, or a key that is too long for the result.
int32_t make_key(const SortTables& sort, uint8_t* key, size_t size, const LXUChar* characters, size_t count);

// Two texts by the locale's sort object, or in the order of their code page when it has none. Options as in the calls,
// without a unit of length.
template <class Kind>
int32_t collate_texts(LocaleCall& call, const Text<typename Kind::Unit>& a, const Text<typename Kind::Unit>& b,
                      uint32_t options);

inline const SortTables* sort_of(const LXLocale& locale) {
  return locale.sort != nullptr ? locale.sort->sort : nullptr;
}

}  // namespace lx
