// SPDX-License-Identifier: Apache-2.0
// The characters whose other case depends on the language.
#include "frame/call.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "special_pairs", 0};

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" int32_t LXLangGetSpecial(const LXObjEntry* language, uint16_t key1, uint16_t key2, uint16_t* value1,
                                    uint16_t* value2, uint32_t item) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    if (language == nullptr || language->type != LX_LANGUAGE || !language->loaded()) return 0;
    const LanguageHeader& header = language_of(*language);
    uint32_t count = item == kUpperSpecialSlot   ? uint32_t{header.upper_special_count}
                     : item == kLowerSpecialSlot ? uint32_t{header.lower_special_count}
                                                 : 0;
    if (count == 0) return 0;
    // The slot stands behind the fixed ones; the check of the object has proved it and the rows.
    const auto* section = reinterpret_cast<const uint8_t*>(&header);
    uint32_t offset = (reinterpret_cast<const BeU16*>(section + offsetof(LanguageHeader, text_offsets)))[item];
    const auto* rows = reinterpret_cast<const SpecialPair*>(section + offset);
    for (uint32_t i = 0; i < count; ++i) {
      if (rows[i].key1 != key1 || rows[i].key2 != key2) continue;
      if (value1 != nullptr) *value1 = rows[i].value1;
      if (value2 != nullptr) *value2 = rows[i].value2;
      return rows[i].value2 != 0 ? 2 : 1;
    }
    return 0;
  });
}
