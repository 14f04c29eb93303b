// SPDX-License-Identifier: Apache-2.0
#include <lexaro/lexaro.h>

#include <initializer_list>

#include "bench/startup/child.hpp"

namespace lx::bench {
namespace {

bool convert() {
  if (LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS) != LX_OK) return false;
  LXLocale* host = LXGetLocale("English_UnitedStates.IBM037@BINARY", 0, nullptr);
  LXLocale* open = LXGetLocale("English_UnitedStates.UTF-8@BINARY", 0, nullptr);
  if (host == nullptr || open == nullptr) return false;
  char out[64];
  return LXConvertString(open, out, sizeof out, host, kText, kTextLength, 0) == kTextLength;
}

// In each a comparison and a number.
bool use_ten() {
  if (LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS) != LX_OK) return false;
  for (const char* name : {"English_UnitedStates.UTF-8", "German_Germany.UTF-8", "French_France.UTF-8",
                           "Spanish_Spain.UTF-8", "Swedish_Sweden.UTF-8", "Danish_Denmark.Latin1", "Czech.ISO-8859-2",
                           "Japanese_Japan.MS932", "Japanese_Japan.IBM-930", "Turkish_Turkey.UTF-8"}) {
    LXLocale* locale = LXGetLocale(name, 0, nullptr);
    if (locale == nullptr) return false;
    char text[64];
    const bool ordered = LXStrcoll(locale, "\x61", 1, "\x62", 1, 0) != 0;
    if (!ordered || LXDoubleToString(locale, 1234.5, text, sizeof text, 0) < 0) return false;
  }
  return true;
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) { return lx::bench::run_child(argc, argv, lx::bench::convert, lx::bench::use_ten); }
