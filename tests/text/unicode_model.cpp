// SPDX-License-Identifier: Apache-2.0
#include "support/session.hpp"
#include "text/text_functions.hpp"

namespace lx::test {

uint32_t type_model(uint32_t character) {
  static const std::vector<uint32_t> kTypes = [] {
    const Locale locale = locale_of("Latin1");
    std::vector<uint32_t> types;
    for (uint32_t c = 0; c < 0x10000; ++c) {
      auto bits = [&](uint32_t part) { return LXGetCharTypeU(locale.get(), static_cast<LXUChar>(c), part); };
      types.push_back(bits(LX_CTYPE_1) | bits(LX_CTYPE_2) << 10 | bits(LX_CTYPE_3) << 22);
    }
    return types;
  }();
  return kTypes[character];
}

uint16_t lower_model(uint32_t character) { return LXUnicodeToLower(nullptr, static_cast<LXUChar>(character)); }
uint16_t upper_model(uint32_t character) { return LXUnicodeToUpper(nullptr, static_cast<LXUChar>(character)); }
uint16_t full_model(uint32_t character) { return LXUnicodeToH2F(nullptr, static_cast<LXUChar>(character)); }
uint16_t half_model(uint32_t character) { return LXUnicodeToF2H(nullptr, static_cast<LXUChar>(character)); }

uint16_t digit_model(uint32_t character) {
  for (const auto& [digit, ascii] : LXDigits) {
    if (digit == character) return ascii;
  }
  return 0;
}

}  // namespace lx::test
