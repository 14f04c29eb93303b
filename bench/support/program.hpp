// SPDX-License-Identifier: Apache-2.0
// What the programs that measure share: their options, and how they end.
#pragma once

#include <stdexcept>

namespace lx::bench {

// It cannot be measured, or the contenders disagree.
struct Failure : std::runtime_error {
  using std::runtime_error::runtime_error;
};

struct Options {
  bool quick = false;              // --quick: few repetitions
  const char* only = "";           // --only TEXT: rows with it in their names
  const char* data = LEXARO_DATA;  // --data DIRECTORY: locale data

  bool wants(const char* row) const;
};

// Exit status: 0; 1: `run` found a row slower than the fastest peer and gave 1; 2: nothing could be measured.
int run_program(const char* name, int argc, char** argv, int (*run)(const Options&));

}  // namespace lx::bench
