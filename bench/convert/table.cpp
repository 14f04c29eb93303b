// SPDX-License-Identifier: Apache-2.0
#include "bench/convert/table.hpp"

#include <cstdio>

namespace lx::bench {

void print_table(const Size& size, const std::vector<Result>& results) {
  std::printf("\n### %s texts\n\n", size.name);
  std::printf("| Conversion | Lexaro MB/s | iconv MB/s | ICU MB/s | Times the faster peer | Aim |\n");
  std::printf("| --- | ---: | ---: | ---: | ---: | ---: |\n");
  for (const Result& result : results) {
    const Speeds& speeds = result.speeds;
    std::printf("| %s | %.0f | %.0f | %.0f | %.2f%s | %.0f |\n", result.row.name().c_str(), speeds.lexaro, speeds.iconv,
                speeds.icu, speeds.ratio(), speeds.ratio() < result.row.aim ? " (below)" : "", result.row.aim);
  }
}

int print_slower(const Size& size, const std::vector<Result>& results) {
  int slower = 0;
  for (const Result& result : results) {
    if (result.speeds.ratio() >= 1) continue;
    std::printf("SLOWER than the faster peer: %s, %s texts: %.2f times\n", result.row.name().c_str(), size.name,
                result.speeds.ratio());
    ++slower;
  }
  return slower;
}

}  // namespace lx::bench
