/* SPDX-License-Identifier: Apache-2.0 */
/*
 * A program that speaks the user's language: its messages come from a catalog, or from the code where there is none.
 *   c_messages LOCALE CATALOGS FILE
 * counts the lines and bytes of FILE. CATALOGS holds a directory for each language, named as in ISO 639 in capitals,
 * with orders.cat in it; the catalogs are made of data/messages.LANGUAGE.msg by lexaroc catalog messages.de.msg -o
 * DE/messages.cat --locale German.UTF-8 and so is messages.h (--header). Messages are converted to the code page of
 * LOCALE. The locale data are where LX_LOCALEDIR says.
 */
#include <lexaro/lexaro.h>
#include <stdio.h>
#include <string.h>

#include "messages.h"

typedef struct Program {
  LXLocale* locale;
  LXCatalog* catalog; /* null: the texts in the code are used */
} Program;

/* The text of a message. It is cut when it is too long, but never inside a character. */
static const char* text_of(const Program* program, uint32_t set, int32_t message, const char* otherwise, char* buffer,
                           int32_t size) {
  if (program->catalog == NULL) return otherwise; /* LXGetMessage needs a catalog, even to give its default text */
  uint32_t status = LXGetMessage(program->catalog, set, message, buffer, size, otherwise, LX_OPT_TERMINATE);
  return status == LX_OK ? buffer : otherwise;
}

/*
 * Prints a message with {1} and {2} replaced. The places are numbered because languages put them in different order,
 * and they are not printf's, because a faulty catalog must not make printf read what is not there.
 */
static void say(const Program* program, uint32_t set, int32_t message, const char* otherwise, const char* first,
                const char* second) {
  char buffer[512];
  const char* text = text_of(program, set, message, otherwise, buffer, (int32_t)sizeof buffer);
  for (; *text != '\0'; ++text) {
    if (strncmp(text, "{1}", 3) == 0 || strncmp(text, "{2}", 3) == 0) {
      fputs(text[1] == '1' ? first : second, stdout);
      text += 2;
    } else {
      putchar(*text);
    }
  }
  putchar('\n');
}

/* A number as the locale writes it. */
static void format_number(LXLocale* locale, long value, char* buffer, int32_t size) {
  if (LXLongToStringEx(locale, (int32_t)value, buffer, 0, size, LX_NUM_TERMINATE) <= 0) {
    snprintf(buffer, (size_t)size, "%ld", value);
  }
}

static int count(const Program* program, const char* path) {
  FILE* file = fopen(path, "rb");
  if (file == NULL) {
    say(program, kErrors, kCannotRead, "{1} cannot be read.", path, "");
    return 1;
  }
  long lines = 0;
  long bytes = 0;
  for (int c; (c = getc(file)) != EOF; ++bytes) lines += c == '\n';
  fclose(file);

  char line_count[32];
  char byte_count[32];
  format_number(program->locale, lines, line_count, (int32_t)sizeof line_count);
  format_number(program->locale, bytes, byte_count, (int32_t)sizeof byte_count);
  say(program, kResults, kLines, "The file has {1} lines in {2} bytes.", line_count, byte_count);
  /* The German catalog has not caught up with this one: its text in the code stands in. */
  say(program, kResults, kDone, "Done.", "", "");
  return 0;
}

int main(int argc, char** argv) {
  if (argc != 4) {
    fprintf(stderr, "usage: c_messages LOCALE CATALOGS FILE\n");
    return 1;
  }
  uint32_t status = LXInit(NULL, NULL, NULL, NULL, LX_INIT_NO_DEFAULTS);
  if (status != LX_OK) {
    fprintf(stderr, "cannot start Lexaro: status %u\n", (unsigned)status);
    return 1;
  }
  int failed = 1;
  Program program = {LXGetLocale(argv[1], 0, &status), NULL};
  char directory[512];
  if (program.locale == NULL) {
    fprintf(stderr, "%s: status %u\n", argv[1], (unsigned)status);
  } else if (snprintf(directory, sizeof directory, "%s/%%l", argv[2]) < (int)sizeof directory) { /* %l: the language */
    /* One pass: without it, the catalog of the process's default locale would come before the texts in the code. */
    program.catalog = LXOpenCatalog(program.locale, directory, "messages.cat", LX_CAT_ONEPASS);
    failed = count(&program, argv[3]);
  }
  if (program.catalog != NULL) LXCloseCatalog(program.catalog, 0);
  LXReleaseLocale(program.locale, 0);
  LXTerm();
  return failed;
}
