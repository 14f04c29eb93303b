// SPDX-License-Identifier: Apache-2.0
// Ten to a whole power, as a table.
#include "format/powers_of_ten.hpp"

#include <iterator>
#include <limits>

namespace lx {
namespace {

// The compiler rounds each of them correctly.
#define UP(n) 1e##n##0, 1e##n##1, 1e##n##2, 1e##n##3, 1e##n##4, 1e##n##5, 1e##n##6, 1e##n##7, 1e##n##8, 1e##n##9
#define DOWN(n) \
  1e-##n##0, 1e-##n##1, 1e-##n##2, 1e-##n##3, 1e-##n##4, 1e-##n##5, 1e-##n##6, 1e-##n##7, 1e-##n##8, 1e-##n##9
#define HUNDRED(TEN, n) \
  TEN(n##0), TEN(n##1), TEN(n##2), TEN(n##3), TEN(n##4), TEN(n##5), TEN(n##6), TEN(n##7), TEN(n##8), TEN(n##9)

constexpr double kPositive[] = {HUNDRED(UP, ), HUNDRED(UP, 1), HUNDRED(UP, 2), 1e300, 1e301, 1e302,
                                1e303,         1e304,          1e305,          1e306, 1e307, 1e308};
constexpr double kNegative[] = {HUNDRED(DOWN, ), HUNDRED(DOWN, 1), HUNDRED(DOWN, 2), DOWN(30), DOWN(31),
                                1e-320,          1e-321,           1e-322,           1e-323};

static_assert(kPositive[10] == 1e10 && kPositive[308] == 1e308 && std::size(kPositive) == 309);
static_assert(kNegative[10] == 1e-10 && kNegative[323] == 1e-323 && std::size(kNegative) == 324);

}  // namespace

double power_of_ten(int32_t exponent) {
  const auto size = static_cast<uint32_t>(exponent < 0 ? std::size(kNegative) : std::size(kPositive));
  const uint32_t distance = exponent < 0 ? 0u - static_cast<uint32_t>(exponent) : static_cast<uint32_t>(exponent);
  if (distance >= size) return exponent < 0 ? 0.0 : std::numeric_limits<double>::infinity();
  return exponent < 0 ? kNegative[distance] : kPositive[distance];
}

}  // namespace lx
