// SPDX-License-Identifier: Apache-2.0
// The characters whose other case depends on the language.
#include "objects/special_pairs.hpp"

#include "frame/call.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "special_pairs", 0};

}  // namespace

SpecialPairs::SpecialPairs(const LXObjEntry* language, uint32_t slot) {
  if (language == nullptr || language->type != LX_LANGUAGE || !language->loaded()) return;
  const LanguageHeader& header = language_of(*language);
  if (slot == kUpperSpecialSlot) count_ = header.upper_special_count;
  if (slot == kLowerSpecialSlot) count_ = header.lower_special_count;
  if (count_ == 0) return;
  // The slot stands behind the fixed ones; the check of the object has proved it and the rows.
  const auto* section = reinterpret_cast<const uint8_t*>(&header);
  uint32_t offset = (reinterpret_cast<const BeU16*>(section + offsetof(LanguageHeader, text_offsets)))[slot];
  pairs_ = reinterpret_cast<const SpecialPair*>(section + offset);
  for (uint32_t i = 0; i < count_; ++i) beginnings_ |= uint64_t{1} << (pairs_[i].key1 & 63);
}

}  // namespace lx

using namespace lx;

extern "C" int32_t LXLangGetSpecial(const LXObjEntry* language, uint16_t key1, uint16_t key2, uint16_t* value1,
                                    uint16_t* value2, uint32_t item) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    const SpecialPair* pair = SpecialPairs(language, item).find(key1, key2);
    if (pair == nullptr) return 0;
    if (value1 != nullptr) *value1 = pair->value1;
    if (value2 != nullptr) *value2 = pair->value2;
    return pair->value2 != 0 ? 2 : 1;
  });
}
