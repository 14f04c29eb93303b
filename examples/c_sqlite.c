/* SPDX-License-Identifier: Apache-2.0 */
/*
 * Keeps names in a database in the order of a language, in two ways that agree:
 *  - a collation: SQLite asks the library whenever it compares two names;
 *  - sort keys in a column of their own with a plain index: the database compares bytes only, so that this works in any
 *    database, and programs without Lexaro can use the order too.
 *   c_sqlite LOCALE NAMES
 * LOCALE is one with UTF-8, such as Swedish.UTF-8; NAMES is a file with a name of up to 254 bytes on each line. The
 * locale data are where LX_LOCALEDIR says.
 *
 * Both orders hold for one version of the locale data: rebuild indexes and keys when that changes. Names that compare
 * equal need not be the same, so neither of the two should be UNIQUE.
 */
#include <lexaro/lexaro.h>
#include <sqlite3.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

static const char kSchema[] =
    "CREATE TABLE person (id INTEGER PRIMARY KEY, name TEXT NOT NULL COLLATE lexaro, sort_key BLOB NOT NULL);"
    "CREATE INDEX person_by_key ON person (sort_key);";

static int fail(const char* what, const char* why) {
  fprintf(stderr, "%s: %s\n", what, why);
  return 1;
}
static int fail_status(const char* what, LXLocale* locale) {
  fprintf(stderr, "%s: status %u\n", what, (unsigned)LXGetError(locale));
  return 1;
}

/*
 * The collation. SQLite's texts have no terminator; one connection, and so one thread at a time, uses the locale. Out
 * of memory, it answers "equal": there is no way to tell SQLite of failure.
 */
static int compare(void* locale, int length1, const void* text1, int length2, const void* text2) {
  return LXStrcollEx(locale, text1, length1, 0, text2, length2, 0, 0);
}

/* The key of a text in new memory, or null. Keys are short for short texts: two calls are needed for long ones only. */
static void* make_key(LXLocale* locale, const char* text, int32_t* key_length) {
  int32_t room = 256;
  for (;;) {
    void* key = malloc((size_t)room);
    if (key == NULL) return NULL;
    *key_length = LXStrxfrmEx(locale, key, room, text, (int32_t)strlen(text), 0, 0);
    if (*key_length >= 0 && *key_length <= room) return key;
    free(key);
    if (*key_length < 0) return NULL;
    room = *key_length;
  }
}

static int insert(sqlite3_stmt* statement, LXLocale* locale, const char* name) {
  int32_t key_length = 0;
  void* key = make_key(locale, name, &key_length);
  if (key == NULL) return fail_status("cannot make a sort key", locale);
  sqlite3_bind_text(statement, 1, name, -1, SQLITE_TRANSIENT);
  sqlite3_bind_blob(statement, 2, key, key_length, free);
  int done = sqlite3_step(statement) == SQLITE_DONE;
  sqlite3_reset(statement);
  return done ? 0 : fail("insert", sqlite3_errmsg(sqlite3_db_handle(statement)));
}

static int insert_all(sqlite3* database, LXLocale* locale, FILE* names) {
  sqlite3_stmt* statement = NULL;
  if (sqlite3_prepare_v2(database, "INSERT INTO person (name, sort_key) VALUES (?1, ?2)", -1, &statement, NULL) !=
      SQLITE_OK) {
    return fail("prepare", sqlite3_errmsg(database));
  }
  int failed = 0;
  char line[256];
  while (!failed && fgets(line, sizeof line, names) != NULL) {
    size_t length = strcspn(line, "\n");
    if (length == sizeof line - 1) {
      failed = fail("name too long", line);
    } else {
      line[length] = '\0';
      failed = insert(statement, locale, line);
    }
  }
  sqlite3_finalize(statement);
  return failed;
}

/* The names that a query gives, joined by line feeds, in new memory; null when it fails. */
static char* names_of(sqlite3* database, const char* query) {
  sqlite3_str* names = sqlite3_str_new(database);
  sqlite3_stmt* statement = NULL;
  int status = sqlite3_prepare_v2(database, query, -1, &statement, NULL);
  while (status == SQLITE_OK || status == SQLITE_ROW) {
    status = sqlite3_step(statement);
    if (status == SQLITE_ROW) sqlite3_str_appendf(names, "%s\n", (const char*)sqlite3_column_text(statement, 0));
  }
  sqlite3_finalize(statement);
  char* text = sqlite3_str_finish(names);
  if (status == SQLITE_DONE && text != NULL) return text;
  fail(query, sqlite3_errmsg(database));
  sqlite3_free(text);
  return NULL;
}

static int show_orders(sqlite3* database) {
  char* by_collation = names_of(database, "SELECT name FROM person ORDER BY name, id");
  char* by_key = names_of(database, "SELECT name FROM person ORDER BY sort_key, id");
  int failed = 1;
  if (by_collation != NULL && by_key != NULL) {
    failed = strcmp(by_collation, by_key) != 0;
    fputs(by_key, stdout);
    puts(failed ? "The collation gives another order." : "The collation gives the same order.");
  }
  sqlite3_free(by_collation);
  sqlite3_free(by_key);
  return failed;
}

static int run(sqlite3* database, LXLocale* locale, FILE* names) {
  if (LXGetLocaleNumInfo(locale, LX_ITEM_CODEPAGE_ID, 0) != (int32_t)LX_CP_UTF8) {
    return fail("LOCALE", "its code page must be UTF-8, as the database's is");
  }
  if (sqlite3_create_collation(database, "lexaro", SQLITE_UTF8, locale, compare) != SQLITE_OK ||
      sqlite3_exec(database, kSchema, NULL, NULL, NULL) != SQLITE_OK) {
    return fail("schema", sqlite3_errmsg(database));
  }
  return insert_all(database, locale, names) || show_orders(database);
}

int main(int argc, char** argv) {
  if (argc != 3) return fail("usage", "c_sqlite LOCALE NAMES");
  if (LXInit(NULL, NULL, NULL, NULL, LX_INIT_NO_DEFAULTS) != LX_OK) return fail("Lexaro", "no locale data");
  int failed = 1;
  uint32_t status = LX_OK;
  LXLocale* locale = LXGetLocale(argv[1], 0, &status);
  FILE* names = fopen(argv[2], "r");
  sqlite3* database = NULL;
  if (locale == NULL) {
    fprintf(stderr, "%s: status %u\n", argv[1], (unsigned)status);
  } else if (names == NULL) {
    perror(argv[2]);
  } else if (sqlite3_open(":memory:", &database) != SQLITE_OK) {
    fail("open", sqlite3_errmsg(database));
  } else {
    failed = run(database, locale, names);
  }
  sqlite3_close(database); /* before the locale, which the collation uses */
  if (names != NULL) fclose(names);
  LXReleaseLocale(locale, 0);
  LXTerm();
  return failed;
}
