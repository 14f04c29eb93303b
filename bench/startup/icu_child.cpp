// SPDX-License-Identifier: Apache-2.0
#include <unicode/ucnv.h>
#include <unicode/ucol.h>
#include <unicode/unum.h>

#include <initializer_list>

#include "bench/startup/child.hpp"

namespace lx::bench {
namespace {

bool convert() {
  UErrorCode error = U_ZERO_ERROR;
  UConverter* host = ucnv_open("ibm-37_P100-1995", &error);
  UConverter* open = ucnv_open("UTF-8", &error);
  if (U_FAILURE(error)) return false;
  UChar pivot[64];
  UChar* pivot_in = pivot;
  UChar* pivot_out = pivot;
  char text[64];
  char* out = text;
  const char* in = kText;
  ucnv_convertEx(open, host, &out, text + sizeof text, &in, kText + kTextLength, pivot, &pivot_in, &pivot_out,
                 pivot + 64, true, true, &error);
  return U_SUCCESS(error) && out - text == kTextLength;
}

// In each a comparison and a number.
bool use_ten() {
  for (const char* name : {"en_US", "de_DE", "fr_FR", "es_ES", "sv_SE", "da_DK", "cs_CZ", "ja_JP", "ja_JP", "tr_TR"}) {
    UErrorCode error = U_ZERO_ERROR;
    UCollator* order = ucol_open(name, &error);
    UNumberFormat* number = unum_open(UNUM_DECIMAL, nullptr, 0, name, nullptr, &error);
    if (U_FAILURE(error) || ucol_strcoll(order, u"a", 1, u"b", 1) == UCOL_EQUAL) return false;
    UChar text[64];
    unum_formatDouble(number, 1234.5, text, 64, nullptr, &error);
    if (U_FAILURE(error)) return false;
  }
  return true;
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) { return lx::bench::run_child(argc, argv, lx::bench::convert, lx::bench::use_ten); }
