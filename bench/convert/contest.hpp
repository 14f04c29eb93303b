// SPDX-License-Identifier: Apache-2.0
// One row of the table: the same texts through every contender, in turn.
#pragma once

#include <string>
#include <vector>

#include "bench/convert/page.hpp"

namespace lx::bench {

struct Row {
  Page from;
  Page to;
  Script script;
  double aim;  // times the faster peer
  std::string name() const { return std::string(from.name) + " to " + to.name; }
};

struct Size {
  const char* name;
  size_t bytes;
  size_t texts;  // different ones, so that no contender learns one text by heart
};

// Input in MB (10^6 bytes) per second.
struct Speeds {
  double lexaro;
  double iconv;
  double icu;
  double ratio() const { return lexaro / (iconv > icu ? iconv : icu); }
};

struct Effort {
  int repetitions;
  double batch_seconds;  // of one contender within one repetition
};

// Checks that all contenders give the same result (throws Failure otherwise), then measures them.
Speeds measure(const Row& row, const Size& size, const Effort& effort);

}  // namespace lx::bench
