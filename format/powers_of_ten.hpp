// SPDX-License-Identifier: Apache-2.0
// Ten to a whole power.
#pragma once

#include <cstdint>

namespace lx {

// The double nearest to it: 0 below the range of doubles, infinity above. Numbers are read by multiplying with these,
// so repeated products, each rounded, would not do; and pow() is not in the C library proper.
double power_of_ten(int32_t exponent);

}  // namespace lx
