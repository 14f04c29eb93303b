/* SPDX-License-Identifier: Apache-2.0 */
/*
 * Translates a host file of fixed-length records into lines of text, and tells every place where something was lost.
 *   c_records FROM TO LENGTH INPUT OUTPUT
 * FROM is the host's code page, TO one of the ASCII family; LENGTH counts the bytes of a record. The locale data are
 * where LX_LOCALEDIR says. The report goes to standard output.
 */
#include <lexaro/lexaro.h>
#include <stdio.h>
#include <stdlib.h>

/* A character becomes at most three bytes, and there are at most as many characters as bytes. */
enum { kMaxLength = 32000, kRoom = 3 * kMaxLength };

/* Where the conversion stands: the library counts bytes from the first one of the file on. */
typedef struct Place {
  unsigned long record; /* from 1 */
  uint64_t start;       /* offset of its first byte */
} Place;

static int fail(const char* what, uint32_t status) {
  fprintf(stderr, "%s: status %u\n", what, (unsigned)status);
  return 1;
}

/* Called by the library for each character that cannot be carried over. */
static void report_problem(void* context, const LXConversionProblem* problem) {
  const Place* place = context;
  printf("record %lu, column %lu: ", place->record, (unsigned long)(problem->offset - place->start + 1));
  for (int i = 0; i < problem->length; ++i) printf("%02X", problem->bytes[i]);
  switch (problem->kind) {
    case LX_PROBLEM_SUBSTITUTED:
      printf(" is U+%04lX, which the target lacks\n", (unsigned long)problem->unicode);
      break;
    case LX_PROBLEM_MALFORMED:
      printf(" is no character\n");
      break;
    case LX_PROBLEM_SHIFT:
      puts(problem->length > 0 ? " is a shift byte that changes nothing" : "the shift byte that ends a run is missing");
      break;
    default:
      printf(" is only a part of a character\n");
      break;
  }
}

/* A record is a text of its own: whatever is open at its end is closed, and the next one starts afresh. */
static uint32_t translate(LXConversion* conversion, const char* record, int32_t length, char* line, int32_t* written) {
  char* out = line;
  int32_t room = kRoom;
  uint32_t status = LXConvertBuffer(conversion, &out, &room, &record, &length, 0);
  if (status == LX_OK || status == LX_E_PARTIAL) status = LXFinishConversion(conversion, &out, &room);
  *written = (int32_t)(out - line);
  return status;
}

static int translate_file(LXConversion* conversion, Place* place, FILE* input, FILE* output, size_t length) {
  static char record[kMaxLength];
  static char line[kRoom];
  size_t got;
  while ((got = fread(record, 1, length, input)) > 0) {
    ++place->record;
    if (got < length) printf("record %lu: only %lu bytes\n", place->record, (unsigned long)got);
    int32_t written = 0;
    uint32_t status = translate(conversion, record, (int32_t)got, line, &written);
    if (status != LX_OK) return fail("cannot convert", status);
    while (written > 0 && line[written - 1] == ' ') --written; /* what filled the record up */
    fwrite(line, 1, (size_t)written, output);
    putc('\n', output);
    place->start += got;
  }
  return ferror(input) || ferror(output) ? fail("cannot read or write", LX_E_FILE) : 0;
}

static int run(LXLocale* from, LXLocale* to, size_t length, FILE* input, FILE* output) {
  if (LXGetLocaleNumInfo(to, LX_ITEM_ASCII_FAMILY, 0) != 1)
    return fail("TO must be of the ASCII family", LX_E_ARGUMENT);
  LXConversion* conversion = LXOpenConversion(to, from, 0);
  if (conversion == NULL) return fail("cannot open a conversion", LXGetError(to));

  Place place = {0, 0};
  /* Strict: what is malformed or unbalanced is told, not let through. */
  uint32_t status = LXSetConversionOptions(conversion, LX_CONV_STRICT, report_problem, &place);
  int failed =
      status == LX_OK ? translate_file(conversion, &place, input, output, length) : fail("cannot set options", status);
  LXConversionCounts counts;
  if (!failed && LXGetConversionCounts(conversion, &counts) == LX_OK) {
    printf("%lu records, %lu bytes in, %lu bytes out: %lu substituted, %lu malformed, %lu shift bytes, %lu cut\n",
           place.record, (unsigned long)counts.bytes_in, (unsigned long)counts.bytes_out,
           (unsigned long)counts.substituted, (unsigned long)counts.malformed, (unsigned long)counts.shifts,
           (unsigned long)counts.cut);
  }
  LXCloseConversion(conversion);
  return failed;
}

/* A locale for its code page only. */
static LXLocale* page(const char* name) {
  char full_name[128];
  uint32_t status = LX_E_ARGUMENT;
  LXLocale* locale = NULL;
  if (snprintf(full_name, sizeof full_name, "English.%s", name) < (int)sizeof full_name) {
    locale = LXGetLocale(full_name, 0, &status);
  }
  if (locale == NULL) fail(name, status);
  return locale;
}

int main(int argc, char** argv) {
  long length = argc == 6 ? strtol(argv[3], NULL, 10) : 0;
  if (length < 1 || length > kMaxLength) {
    fprintf(stderr, "usage: c_records FROM TO LENGTH INPUT OUTPUT (LENGTH up to %d)\n", kMaxLength);
    return 1;
  }
  uint32_t status = LXInit(NULL, NULL, NULL, NULL, LX_INIT_NO_DEFAULTS);
  if (status != LX_OK) return fail("cannot start Lexaro", status);

  int failed = 1;
  LXLocale* from = page(argv[1]);
  LXLocale* to = page(argv[2]);
  FILE* input = fopen(argv[4], "rb");
  FILE* output = input != NULL ? fopen(argv[5], "wb") : NULL;
  if (output == NULL) {
    perror(input == NULL ? argv[4] : argv[5]);
  } else if (from != NULL && to != NULL) {
    failed = run(from, to, (size_t)length, input, output);
  }
  if (input != NULL) fclose(input);
  if (output != NULL && fclose(output) != 0) failed = 1;
  LXReleaseLocale(to, 0);
  LXReleaseLocale(from, 0);
  LXTerm();
  return failed;
}
