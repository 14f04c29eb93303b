// SPDX-License-Identifier: Apache-2.0
// What is known of Unicode characters, looked up slowly: the exported tables, and the rules for what is in none.
#pragma once

#include <cstdint>

namespace lx::test {

uint32_t type_model(uint32_t character);
uint16_t lower_model(uint32_t character);
uint16_t upper_model(uint32_t character);
uint16_t full_model(uint32_t character);
uint16_t half_model(uint32_t character);
// 0: no digit.
uint16_t digit_model(uint32_t character);

}  // namespace lx::test
