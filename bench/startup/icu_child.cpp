// SPDX-License-Identifier: Apache-2.0
#include <unicode/ucnv.h>

#include "bench/startup/child.hpp"

int main(int argc, char** argv) {
  using namespace lx::bench;
  if (wants_nothing(argc, argv)) return 0;
  UErrorCode error = U_ZERO_ERROR;
  UConverter* host = ucnv_open("ibm-37_P100-1995", &error);
  UConverter* open = ucnv_open("UTF-8", &error);
  if (U_FAILURE(error)) return 1;
  UChar pivot[64];
  UChar* pivot_in = pivot;
  UChar* pivot_out = pivot;
  char text[64];
  char* out = text;
  const char* in = kText;
  ucnv_convertEx(open, host, &out, text + sizeof text, &in, kText + kTextLength, pivot, &pivot_in, &pivot_out,
                 pivot + 64, true, true, &error);
  return U_SUCCESS(error) && out - text == kTextLength ? 0 : 1;
}
