/* SPDX-License-Identifier: Apache-2.0 */
/*
 * Converts an EBCDIC string with double-byte text to UTF-8 and prints it.
 *   c_convert [DIRECTORY]     DIRECTORY holds the locale data; else LX_LOCALEDIR, else the library's default
 */
#include <lexaro/lexaro.h>
#include <stdio.h>

/* "Lexaro " and two kanji, as IBM-930 has it: X'0E' and X'0F' enclose the double-byte characters. */
static const char kHostText[] = "\xD3\x66\xB7\x62\x9B\x77\x40\x0E\x45\x62\x45\x66\x0F";

static int print_converted(LXLocale* utf8, LXLocale* host) {
  char text[64];
  int32_t length = LXConvertStringEx(utf8, text, 0, (int32_t)sizeof text, host, kHostText, 0,
                                     (int32_t)sizeof kHostText - 1, LX_OPT_TERMINATE);
  if (length < 0) {
    fprintf(stderr, "cannot convert: status %u\n", (unsigned)LXGetError(utf8));
    return 1;
  }
  printf("%s\n", text);
  return 0;
}

int main(int argc, char** argv) {
  uint32_t status = LXInit(argc > 1 ? argv[1] : NULL, NULL, NULL, NULL, LX_INIT_NO_DEFAULTS);
  if (status != LX_OK) {
    fprintf(stderr, "cannot start Lexaro: status %u\n", (unsigned)status);
    return 1;
  }
  int failed = 1;
  LXLocale* host = LXGetLocale("Japanese.IBM-930", 0, &status);
  LXLocale* utf8 = host != NULL ? LXGetLocale("Japanese.UTF-8", 0, &status) : NULL;
  if (utf8 != NULL) {
    failed = print_converted(utf8, host);
  } else {
    fprintf(stderr, "cannot open a locale: status %u\n", (unsigned)status);
  }
  LXReleaseLocale(utf8, 0);
  LXReleaseLocale(host, 0);
  LXTerm();
  return failed;
}
