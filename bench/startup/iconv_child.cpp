// SPDX-License-Identifier: Apache-2.0
#include <iconv.h>

#include "bench/startup/child.hpp"

namespace lx::bench {
namespace {

bool convert() {
  iconv_t descriptor = iconv_open("UTF-8", "IBM037");
  if (descriptor == reinterpret_cast<iconv_t>(-1)) return false;
  char* in = const_cast<char*>(kText);
  size_t left = kTextLength;
  char text[64];
  char* out = text;
  size_t room = sizeof text;
  return iconv(descriptor, &in, &left, &out, &room) == 0 && out - text == kTextLength;
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) { return lx::bench::run_child(argc, argv, lx::bench::convert, nullptr); }
