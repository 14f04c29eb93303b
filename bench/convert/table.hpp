// SPDX-License-Identifier: Apache-2.0
// The results as a Markdown table, and what is wrong with them.
#pragma once

#include "bench/convert/contest.hpp"

namespace lx::bench {

struct Result {
  Row row;
  Speeds speeds;
};

void print_table(const Size& size, const std::vector<Result>& results);

// A line for each row that is slower than the faster peer; returns their number.
int print_slower(const Size& size, const std::vector<Result>& results);

}  // namespace lx::bench
