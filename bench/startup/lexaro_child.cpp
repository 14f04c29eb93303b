// SPDX-License-Identifier: Apache-2.0
#include <lexaro/lexaro.h>

#include "bench/startup/child.hpp"

int main(int argc, char** argv) {
  using namespace lx::bench;
  if (wants_nothing(argc, argv)) return 0;
  if (LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS) != LX_OK) return 1;
  LXLocale* host = LXGetLocale("English_UnitedStates.IBM037@BINARY", 0, nullptr);
  LXLocale* open = LXGetLocale("English_UnitedStates.UTF-8@BINARY", 0, nullptr);
  if (host == nullptr || open == nullptr) return 1;
  char out[64];
  return LXConvertString(open, out, sizeof out, host, kText, kTextLength, 0) == kTextLength ? 0 : 1;
}
