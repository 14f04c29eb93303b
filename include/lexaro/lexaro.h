/* SPDX-License-Identifier: Apache-2.0 */
/*
 * Lexaro: globalization for POSIX systems. The interface of the library, usable from C99 and C++17.
 *
 * Conventions that hold for every declaration below, unless its comment says otherwise:
 *  - A null LXLocale means the process default (lxglocale). With neither, a function returns its failure value.
 *  - Functions with a locale leave their status in the record (LXGetError); the others return it or store it through
 *    `rc`. Every `rc`, and every other pointer described as optional, may be null.
 *  - Lengths are signed; any negative length means "up to the terminator". A negative room counts as none.
 *  - Text never leaves the library cut inside a character, and no input makes it read or write outside the stated room.
 *  - Characters that a code page lacks are no errors: they become U+FFFD towards Unicode and the page's substitution
 *    byte away from it.
 */
#ifndef LEXARO_LEXARO_H
#define LEXARO_LEXARO_H

#include <stddef.h>
#include <stdint.h>
#include <time.h>

#if defined(__GNUC__)
#define LX_API __attribute__((visibility("default")))
#define LX_PRINTF(text, first) __attribute__((format(printf, text, first)))
#else
#define LX_API
#define LX_PRINTF(text, first)
#endif

#ifdef __cplusplus
#define LX_NOEXCEPT noexcept
extern "C" {
#else
#define LX_NOEXCEPT
#endif

/* ---- Types ---- */

typedef uint16_t LXUChar; /* U text: one UCS-2 unit, machine order */
typedef uint32_t LXWChar; /* W text: the bytes of one character of the locale's code page, packed big-endian */

typedef struct LXLocale LXLocale;         /* a locale; owned by its caller, used by one thread at a time */
typedef struct LXObjMgr LXObjMgr;         /* the object manager: the directory of locale data objects */
typedef struct LXObjEntry LXObjEntry;     /* one language, territory, code page or sort; owned by the manager */
typedef struct LXGlobals LXGlobals;       /* the global area */
typedef struct LXFile LXFile;             /* an open data file */
typedef struct LXConversion LXConversion; /* a resumable conversion; owned by its caller */
typedef struct LXStream LXStream;         /* an encoded stream; owned by its caller */
typedef struct LXCatalog LXCatalog;       /* an open message catalog; owned by its caller */
typedef struct tm LXTime;                 /* a time in its fields: the nine of the C standard count */

typedef struct LXCharType {
  uint32_t flags; /* LX_CT_ bits, bidirectional class and script bits */
  int32_t delta;  /* added to the character's packed value it gives the other case */
} LXCharType;

typedef struct LXSpecialWeight {
  uint16_t position;
  uint16_t weight;
} LXSpecialWeight;

typedef struct LXCatSet { /* a set of a catalog: in the file, or loaded (then with `index` and `text`) */
  uint32_t number;
  uint32_t next; /* offsets in the file */
  uint32_t messages;
  uint32_t index_offset;
  uint32_t text_offset;
  uint32_t text_size;
  void* index;
  char* text;
} LXCatSet;

typedef void* (*LXAllocFn)(void* context, size_t size); /* null: no memory */
typedef int (*LXFreeFn)(void* context, void* block);    /* non-zero: success */
/* Moves up to `count` bytes: the number moved, -1 on failure or at the end. */
typedef int32_t (*LXTransferFn)(void* context, void* buffer, int32_t count);
typedef int32_t (*LXEnumFn)(void* context, uint8_t type, const char* name); /* 0 stops the enumeration */
typedef int32_t (*LXEnumWFn)(void* context, uint8_t type, const LXWChar* name);
typedef int32_t (*LXEnumUFn)(void* context, uint8_t type, const LXUChar* name);

/* ---- Status codes ---- */

#define LX_OK 0u            /* success */
#define LX_E_OPEN 1u        /* a file could not be opened or closed */
#define LX_E_ARGUMENT 2u    /* invalid argument or option bits */
#define LX_E_DEFAULTS 10u   /* initialised, but running on the built-in objects */
#define LX_E_MANAGER 11u    /* the object manager could not be created, or a lookup failed */
#define LX_E_MEMORY 20u     /* out of memory */
#define LX_E_FREE 21u       /* the free callback reported failure */
#define LX_E_CODEPAGE 30u   /* code page not found */
#define LX_E_LANGUAGE 31u   /* language not found */
#define LX_E_NATIVE 32u     /* the locale has no native name */
#define LX_E_SORT 33u       /* sort not found */
#define LX_E_TERRITORY 34u  /* territory not found */
#define LX_E_ITEM 35u       /* unknown item number */
#define LX_E_NOTFOUND 37u   /* object not found, or a value out of range */
#define LX_E_BUFFER 40u     /* output buffer too small */
#define LX_E_BASE 50u       /* base of a number */
#define LX_E_FORMAT 51u     /* malformed format, or an unknown directive in it */
#define LX_E_FULL 52u       /* conversion: output full, input pending */
#define LX_E_PARTIAL 53u    /* conversion: the input ends inside a character */
#define LX_E_DIRECTION 60u  /* stream of the other direction */
#define LX_E_TRANSFER 61u   /* stream: the transfer failed inside a character */
#define LX_E_FLUSH 62u      /* stream: the transfer failed while flushing */
#define LX_E_HALF 63u       /* stream: part of a character came, which is kept */
#define LX_E_COUNT 64u      /* stream: the transfer gave a count that cannot be */
#define LX_E_REFUSED 65u    /* stream: output was refused and is kept */
#define LX_E_NOCATALOG 70u  /* null catalog */
#define LX_E_CATALOG 71u    /* catalog file damaged, or not of this machine */
#define LX_E_MESSAGE 72u    /* no such message */
#define LX_E_NOFILE 1000u   /* file not found */
#define LX_E_ACCESS 1001u   /* permission denied */
#define LX_E_READMODE 1002u /* read from a file opened for writing */
#define LX_E_FILE 1003u     /* file name too long, or seek or read failure */
#define LX_E_HEADER 2000u   /* data file corrupted */

/* ---- Object types, identifiers, option bits ---- */

#define LX_LANGUAGE 0u
#define LX_TERRITORY 1u
#define LX_CODEPAGE 2u
#define LX_SORT 3u

#define LX_CP_UCS2 1200u  /* UCS-2; has no object */
#define LX_CP_UTF8 57352u /* UTF-8 of the Basic Multilingual Plane */

#define LX_INIT_NO_DEFAULTS 0x80000001u /* LXInit: never stand in with the built-in objects */
#define LX_GET_USER 2u                  /* LXGetLocale: take the user's locale instead of the name */
#define LX_GET_SUBSTITUTE 4u            /* LXGetLocale: replace unknown parts by English and the language's defaults */
#define LX_NATIVE_INFO 1u               /* LXConvertNativeLocale: accepted; the values always come from the system */
#define LX_OPT_OBJECT 1u                /* read the territory's own text instead of the locale's */
#define LX_OPT_TERMINATE 8u             /* write and count a terminator */
#define LX_OPT_CHARS 0x4000u            /* lengths and results count characters */

#define LX_SEEK_SET 10u
#define LX_SEEK_CUR 11u
#define LX_SEEK_END 12u

/*
 * Items of a locale. N: a number (LXGetLocaleNumInfo); T: a text (LXGetLocaleTextInfo); s: can be set for one locale.
 * Setting an id or the name of an object swaps that object.
 */
#define LX_ITEM_LANGUAGE_ID 1u            /* N s */
#define LX_ITEM_LANGUAGE_NAME 2u          /* T s  name of the language object */
#define LX_ITEM_LANGUAGE_ABBREVIATION 3u  /* T    ISO 639, upper case */
#define LX_ITEM_LANGUAGE_OWN_NAME 4u      /* T    in the language itself */
#define LX_ITEM_TERRITORY_ID 5u           /* N s */
#define LX_ITEM_TERRITORY_NAME 6u         /* T s  name of the territory object */
#define LX_ITEM_TERRITORY_ABBREVIATION 7u /* T    ISO 3166, three letters */
#define LX_ITEM_TERRITORY_OWN_NAME 8u     /* T    in the territory's language */
#define LX_ITEM_CODEPAGE_ID 9u            /* N s */
#define LX_ITEM_CODEPAGE_NAME 10u         /* T s */
#define LX_ITEM_SORT_ID 11u               /* N s  0: binary */
#define LX_ITEM_SORT_NAME 12u             /* T s  "Binary" */
#define LX_ITEM_DEFAULT_TERRITORY 13u     /* T    names of the language's default objects */
#define LX_ITEM_DEFAULT_CODEPAGE 14u      /* T */
#define LX_ITEM_DEFAULT_SORT 15u          /* T */
#define LX_ITEM_DAY_1 16u                 /* T    16-22: days, Sunday first */
#define LX_ITEM_ABDAY_1 23u               /* T    23-29: abbreviated */
#define LX_ITEM_MON_1 30u                 /* T    30-42: months; the thirteenth is empty where there are twelve */
#define LX_ITEM_ABMON_1 43u               /* T    43-55: abbreviated */
#define LX_ITEM_AM 56u                    /* T */
#define LX_ITEM_PM 57u                    /* T */
#define LX_ITEM_TERRITORY_FLAG 58u        /* N    0 or 1 */
#define LX_ITEM_DECIMAL 59u               /* T s  one character, as the other separators */
#define LX_ITEM_THOUSANDS 60u             /* T s */
#define LX_ITEM_LIST 61u                  /* T s  third separator: between the elements of a list */
#define LX_ITEM_GROUPING 62u              /* T s  sizes of digit groups, "3;0" */
#define LX_ITEM_FRACTION_DIGITS 63u       /* N s */
#define LX_ITEM_CURRENCY 64u              /* T s */
#define LX_ITEM_CURRENCY_INTL 65u         /* T    ISO 4217 */
#define LX_ITEM_MON_DECIMAL 66u           /* T s */
#define LX_ITEM_MON_THOUSANDS 67u         /* T s */
#define LX_ITEM_MON_GROUPING 68u          /* T s */
#define LX_ITEM_CURRENCY_DIGITS 69u       /* N s  fraction digits that go with item 64 */
#define LX_ITEM_CURRENCY_INTL_DIGITS 70u  /* N s  and with item 65 */
#define LX_ITEM_POSITIVE_SIGN 71u         /* T s */
#define LX_ITEM_NEGATIVE_SIGN 72u         /* T s */
#define LX_ITEM_P_CS_PRECEDES 73u         /* N s  73-76: 0 or 1; as localeconv() names them */
#define LX_ITEM_P_SEP_BY_SPACE 74u        /* N s */
#define LX_ITEM_N_CS_PRECEDES 75u         /* N s */
#define LX_ITEM_N_SEP_BY_SPACE 76u        /* N s */
#define LX_ITEM_P_SIGN_POSN 77u           /* N s  0 parentheses, 1 first, 2 last, 3 before the symbol, 4 after it */
#define LX_ITEM_N_SIGN_POSN 78u           /* N s */
#define LX_ITEM_TIME_FORMAT 79u           /* T s */
#define LX_ITEM_SHORT_DATE 80u            /* T s */
#define LX_ITEM_LONG_DATE 81u             /* T s */
#define LX_ITEM_FLAG_82 82u               /* N s  0 or 1 */
#define LX_ITEM_FLAG_83 83u               /* N s  0 or 1 */
#define LX_ITEM_TERRITORY_VALUE 84u       /* N */
#define LX_ITEM_MAX_CHAR_LENGTH 85u       /* N    bytes of the code page's longest character */
#define LX_ITEM_ASCII_FAMILY 86u          /* N    1: ASCII; 0: EBCDIC */
#define LX_ITEM_SHIFT_SENSITIVE 87u       /* N    1: double-byte runs stand between shift bytes */
#define LX_ITEM_LOCALE_NAME 88u           /* T    Language_Territory.CodePage@Sort */

/* Forms of a text (LXLocaleGetTextItem). */
#define LX_FORM_UCS2 1u     /* LXUChar, terminated */
#define LX_FORM_CODEPAGE 2u /* bytes of the locale's code page */
#define LX_FORM_NAME 3u     /* ASCII */

/* Character type bits (LXCharType.flags). */
#define LX_CT_ALPHA 0x001u
#define LX_CT_UPPER 0x002u
#define LX_CT_LOWER 0x004u
#define LX_CT_DIGIT 0x008u
#define LX_CT_XDIGIT 0x010u
#define LX_CT_PUNCT 0x020u
#define LX_CT_SPACE 0x040u
#define LX_CT_BLANK 0x080u
#define LX_CT_CNTRL 0x100u
#define LX_CT_ASCII 0x200u

/* Classes of character types (LXGetCharType): the LX_CT_ bits, the bidirectional class, the script bits. */
#define LX_CTYPE_1 0x80000010u
#define LX_CTYPE_2 0x80000011u
#define LX_CTYPE_3 0x80000012u

/* Line ends: the code page's line bytes 1 to 4 (line feed; 2: carriage return and line feed), in U text U+000A,
   U+000D U+000A, U+2028 and U+2029. */
#define LX_EOL_1 0x100u
#define LX_EOL_21 0x200u
#define LX_EOL_3 0x400u
#define LX_EOL_4 0x800u
#define LX_EOL_DEFAULT 0x1000u  /* writing: line byte 1 */
#define LX_EOL_NONE 0x80000030u /* found: none */
#define LX_EOL_BAD 0x80000031u  /* bad flags */

#define LX_TRUNC_STRIP 0x800000u /* strip trailing blanks */

#define LX_MAP_H2F 0x80000021u /* half width to full width */
#define LX_MAP_F2H 0x80000022u
#define LX_MAP_COPY 0x80000023u
#define LX_MAP_LOWER 0x80000024u
#define LX_MAP_UPPER 0x80000025u
#define LX_MAP_PLAIN 0x2000u /* with the two before: without the language's special pairs */
#define LX_MAP_DIGITS 16u    /* digits of other scripts to ASCII */

#define LX_CMP_NOCASE 0x80000040u  /* without regard to case */
#define LX_CMP_NOWIDTH 0x80000041u /* without regard to half and full width */
#define LX_CMP_TRIM 0x200000u      /* ignore trailing blanks */
#define LX_STR_LAST 0x80000020u    /* the last occurrence */
#define LX_COLL_TRIM 1u            /* ignore trailing blanks (LXStrcoll, LXStrcollEx) */

#define LX_NUM_TEXTOPT 0x1u    /* the territory's own texts instead of the locale's */
#define LX_NUM_TERMINATE 0x8u  /* write and count a terminator */
#define LX_NUM_FULLWIDTH 0x10u /* full-width digits and signs are read too */
#define LX_NUM_MONETARY 0x20u  /* the separators and signs of money */
#define LX_NUM_INTLSYM 0x40u   /* the international currency symbol */
#define LX_NUM_UNSIGNED 0x80u  /* the value has no sign */
#define LX_NUM_CHARLEN 0x4000u /* lengths and results count characters */

#define LX_EOL_KEEP 0x8000u /* the line end stays in the result */
#define LX_STREAM_READ 0x80000050u
#define LX_STREAM_WRITE 0x80000051u

#define LX_CAT_ONEPASS 0x80000060u /* search with the locale's names only */
#define LX_CAT_LOAD 0x80000061u    /* read the whole catalog into memory; searches once too */

/* What LXStrGetDigit finds besides digits. */
#define LX_DIG_PLUS 40
#define LX_DIG_MINUS 41
#define LX_DIG_THOUSANDS 42
#define LX_DIG_DECIMAL 43
#define LX_DIG_SPACE 44

/* ---- Library state ---- */

/* Read-only for callers. lxglobals keeps its value after the last LXTerm, though the area is gone. */
extern LX_API LXGlobals* lxglobals;
extern LX_API LXLocale* lxglocale;
extern LX_API LXAllocFn lxalloc_cbk;
extern LX_API LXFreeFn lxfree_cbk;

/*
 * Initialises the library, or counts one more user of it. `directory` holds the locale data; null (or a directory
 * without control.nls) means the variable LX_LOCALEDIR, then the default directory. All memory is taken from
 * `alloc_cbk` and returned to `free_cbk` with `alloc_context` (null: the system allocator); only the first call's
 * callbacks count. `options`: LX_INIT_NO_DEFAULTS or 0. The first call of a process must not race with another.
 * Returns 0, LX_E_MANAGER, LX_E_MEMORY, or LX_E_DEFAULTS when the data could not be read: the library runs on built-in
 * English/UnitedStates/US-ASCII, or, with LX_INIT_NO_DEFAULTS or when memory ran out, finds no object at all.
 */
LX_API uint32_t LXInit(const char* directory, LXAllocFn alloc_cbk, LXFreeFn free_cbk, void* alloc_context,
                       uint32_t options) LX_NOEXCEPT;
/* Ends one use; the last one releases the default locale and every loaded object. Returns 0 or the first error. */
LX_API uint32_t LXTerm(void) LX_NOEXCEPT;
/* The status of the last operation on the locale; LX_E_ARGUMENT when there is neither locale nor default. */
LX_API uint32_t LXGetError(const LXLocale* locale) LX_NOEXCEPT;
/* The default allocation callbacks: malloc and free. */
LX_API void* LXDefAlloc(void* context, size_t size) LX_NOEXCEPT;
LX_API int LXDefFree(void* context, void* block) LX_NOEXCEPT;
/* Bytes that the variable's value needs with its terminator, 0 when it is not set; copied only when it fits. */
LX_API int32_t LXGetEnv(const char* name, char* buffer, int32_t buffer_size) LX_NOEXCEPT;
/* The data directory from LX_LOCALEDIR (use_default 0: length with terminator, 0 does not fit, -1 not set) or the
   built-in one (17 when 17 bytes fit, else 0). */
LX_API int32_t LXGetDataLocation(char* buffer, int32_t buffer_size, int32_t use_default) LX_NOEXCEPT;
/* "DIRECTORY/control.nls" in the buffer, or null when it does not fit. */
LX_API char* LXGetControlFileName(const char* directory, char* buffer, int32_t buffer_size) LX_NOEXCEPT;
/* "DIRECTORY/cp_00037.nls" and the like in the buffer, or null when it does not fit or the type is unknown. */
LX_API char* LXGetDataFileName(const char* directory, uint8_t object_type, uint16_t object_id, char* buffer,
                               int32_t buffer_size) LX_NOEXCEPT;
/* Compares bytes without regard to ASCII case; does not stop at a zero byte. */
LX_API int LXmemicmp(const void* a, const void* b, size_t count) LX_NOEXCEPT;

/* ---- Paths and files ---- */

/* Parts of a path, terminated; absent or too long parts are empty. Each returns the length copied. */
LX_API int32_t SplitDrive(const char* path, char* drive) LX_NOEXCEPT;      /* drive[4] */
LX_API int32_t SplitDir(const char* path, char* directory) LX_NOEXCEPT;    /* directory[256], with its last "/" */
LX_API int32_t SplitFile(const char* path, char* file) LX_NOEXCEPT;        /* file[15], without extension */
LX_API int32_t SplitExtent(const char* path, char* extension) LX_NOEXCEPT; /* extension[5], with its dot */
LX_API void SplitPath(const char* path, char* drive, char* directory, char* file, char* extension) LX_NOEXCEPT;
/* Joins the parts as they are: no separator or dot is added. `result` must have room for all of them. */
LX_API void MakePath(char* result, const char* drive, const char* directory, const char* file,
                     const char* extension) LX_NOEXCEPT;

/*
 * Opens a file: open_mode 0 reads, 1 creates or replaces, 2 reads and writes. Mode 1 on an existing file writes
 * beside it and replaces it when it is closed, unless no_temporary is set. access_mode is not interpreted.
 * Null with rc LX_E_MEMORY, LX_E_NOFILE, LX_E_ACCESS, LX_E_OPEN or LX_E_FILE. A mode-1 file that cannot be created
 * still yields a handle: its failure shows when it is closed.
 */
LX_API LXFile* LXOpenFile(uint32_t access_mode, const char* path, uint8_t open_mode, int32_t no_temporary,
                          uint32_t* rc) LX_NOEXCEPT;
/* Closes and frees the handle; `discard` drops the temporary. 1 on failure; a failed close keeps the handle. */
LX_API uint32_t LXCloseFile(LXFile* handle, int32_t discard) LX_NOEXCEPT;
/* Bytes read; 0 with rc 0 at the end of the file. */
LX_API uint32_t LXReadFile(LXFile* handle, void* buffer, uint32_t count, uint32_t* rc) LX_NOEXCEPT;
/* 0 or 1; origin is LX_SEEK_SET, LX_SEEK_CUR or LX_SEEK_END. */
LX_API uint32_t LXSeekFile(LXFile* handle, int32_t offset, uint32_t origin) LX_NOEXCEPT;
/* A new block with `size` bytes of the file, freed with LXUnloadFile; null for size 0 (rc 0) and on failure. */
LX_API void* LXLoadFile(LXFile* handle, uint32_t offset, uint32_t size, uint32_t* rc) LX_NOEXCEPT;
LX_API uint32_t LXUnloadFile(void* buffer) LX_NOEXCEPT; /* always 0 */
/* Size in bytes; -1 when unknown or above 2 GiB - 1. */
LX_API int32_t LXFileSize(LXFile* handle) LX_NOEXCEPT;

/* ---- Locale data objects ---- */

/* Images of section 1 (LXDefCP3: section 3) of the built-in objects, in file order (big-endian). */
extern LX_API const uint8_t LXDefaultLanguage[];
extern LX_API const uint8_t LXDefaultTerritory[];
extern LX_API const uint8_t LXDefaultCodePage[4376];
extern LX_API const uint8_t LXDefCP3[128];

/* Finds and reads the control file as LXInit does. rc: 0 or the last error; null only when nothing can be allocated. */
LX_API LXObjMgr* LXInitObjManager(const char* directory, uint32_t options, uint32_t* rc) LX_NOEXCEPT;
/* Unloads all objects and frees the manager: 0, or 1 or LX_E_FREE when a free callback failed. */
LX_API uint32_t LXTermObjManager(LXObjMgr* manager) LX_NOEXCEPT;
/*
 * The entry of that type and name (case is ignored; name_length may include the terminator; negative: strlen),
 * loaded unless no_load is 1. Null with rc LX_E_NOTFOUND, or rc 0 for the binary sort. An entry whose file cannot be
 * read is served with built-in data: the entry comes together with the error in rc. Of a sort, and with
 * LX_INIT_NO_DEFAULTS of anything, there are none: null with that error.
 */
LX_API LXObjEntry* LXGetObjFromName(LXObjMgr* manager, uint8_t type, const char* name, int32_t name_length,
                                    int32_t no_load, uint32_t* rc) LX_NOEXCEPT;
LX_API LXObjEntry* LXGetObjFromNameW(LXObjMgr* manager, uint8_t type, const LXWChar* name, int32_t name_length,
                                     int32_t no_load, uint32_t* rc) LX_NOEXCEPT;
LX_API LXObjEntry* LXGetObjFromID(LXObjMgr* manager, uint8_t type, uint16_t id, int32_t no_load,
                                  uint32_t* rc) LX_NOEXCEPT;
/* Loads an entry under the global lock; null when neither its file nor built-in data can serve. */
LX_API LXObjEntry* LXLoadObj(LXObjMgr* manager, LXObjEntry* entry, uint32_t* rc) LX_NOEXCEPT;
LX_API uint32_t LXUnloadObj(LXObjMgr* manager, LXObjEntry* entry) LX_NOEXCEPT;      /* 0 or LX_E_FREE */
LX_API uint32_t LXLoadDefaultObj(LXObjMgr* manager, LXObjEntry* entry) LX_NOEXCEPT; /* 0; 1: type without built-in */
/*
 * Makes the built-in objects the only ones that the manager finds: 1; 0: no memory. Entries that it gave out before
 * stay valid as long as it lives. No other thread uses the manager meanwhile.
 */
LX_API uint32_t LXLoadDefaults(LXObjMgr* manager) LX_NOEXCEPT;

/* The aliases of alias.txt: 0, or 1 when the file could not be used completely (what was read stays usable). */
LX_API uint32_t LXBuildAliasList(LXObjMgr* manager) LX_NOEXCEPT;
/* Name of the code page that has the alias (case is ignored; owned by the manager), or null. */
LX_API const char* LXGetCodepageFromAlias(LXObjMgr* manager, const char* name) LX_NOEXCEPT;
LX_API uint32_t LXDestroyAliasList(LXObjMgr* manager) LX_NOEXCEPT; /* 0 */
LX_API char* LXGetAliasFileName(const char* directory, char* buffer, int32_t buffer_size) LX_NOEXCEPT;
/*
 * Looks a pair of UCS-2 characters up in a language's upper-case (item 44) or lower-case (item 45) special list.
 * Returns 0 not found, 1 found with one value, 2 found with two.
 */
LX_API int32_t LXLangGetSpecial(const LXObjEntry* language, uint16_t key1, uint16_t key2, uint16_t* value1,
                                uint16_t* value2, uint32_t item) LX_NOEXCEPT;

/* ---- Locales ---- */

/*
 * A new locale from "Language_Territory.CodePage@Sort"; every part may be left out (English, and the
 * language's defaults, stand in), the code page may be an alias, the sort may be "BINARY". Null or empty: English.
 * options: LX_GET_USER, LX_GET_SUBSTITUTE. Null with rc LX_E_ARGUMENT, LX_E_MEMORY, LX_E_LANGUAGE, LX_E_TERRITORY,
 * LX_E_CODEPAGE, LX_E_SORT or LX_E_MANAGER. Free it with LXReleaseLocale.
 * With LX_GET_USER the process's setlocale state is switched and restored: for use while a program sets itself up.
 */
LX_API LXLocale* LXGetLocale(const char* name, uint32_t options, uint32_t* rc) LX_NOEXCEPT;
LX_API LXLocale* LXGetLocaleW(const LXWChar* name, uint32_t options, uint32_t* rc) LX_NOEXCEPT;
LX_API LXLocale* LXGetLocaleU(const LXUChar* name, uint32_t options, uint32_t* rc) LX_NOEXCEPT;
/* Frees the locale (null: nothing): 0, or 1 when a free callback failed. `reserved` is 0. */
LX_API uint32_t LXReleaseLocale(LXLocale* locale, uint32_t reserved) LX_NOEXCEPT;
/* Makes a new locale the process default and releases the former one: 0 or the status of LXGetLocale. */
LX_API uint32_t LXSetLocale(const char* name, uint32_t options) LX_NOEXCEPT;
LX_API uint32_t LXSetLocaleW(const LXWChar* name, uint32_t options) LX_NOEXCEPT;
LX_API uint32_t LXSetLocaleU(const LXUChar* name, uint32_t options) LX_NOEXCEPT;
/* Name of the user's locale: 1 from LX_LANG (cut, perhaps unterminated, when it does not fit), 2 from the system's
   locale, 0 on failure. Set-up time only, as LX_GET_USER. */
LX_API int32_t LXGetUserLocale(char* buffer, int32_t buffer_size) LX_NOEXCEPT;

/*
 * An item that is a number. source 0: as the locale has it; 1: as its territory defines it. -1 with LX_E_ARGUMENT
 * (source) or LX_E_ITEM.
 */
LX_API int32_t LXGetLocaleNumInfo(LXLocale* locale, uint32_t item, uint32_t source) LX_NOEXCEPT;
/*
 * Sets it for this locale; the value then survives a change of the territory. Digit counts (63, 69, 70) are taken
 * modulo 65536. 1, or 0 with LX_E_ITEM, LX_E_NOTFOUND (no such object, value out of range) or LX_E_MEMORY.
 */
LX_API int32_t LXSetLocaleNumInfo(LXLocale* locale, uint32_t item, int32_t value) LX_NOEXCEPT;

/*
 * Where the text of an item is, and its form. use_locale 0: the territory's own text. Separators of form 2 are one
 * byte, not terminated. Null and form 0: unknown item, or LX_ITEM_LOCALE_NAME, which is stored nowhere. Valid until the
 * item or the locale changes. `form` is optional.
 */
LX_API const void* LXLocaleGetTextItem(LXLocale* locale, uint32_t item, int32_t use_locale, uint32_t* form) LX_NOEXCEPT;
/* The same as UCS-2, always terminated. Names and separators stand in a buffer of the thread until its next call. */
LX_API const LXUChar* LXLocaleGetTextItemU(LXLocale* locale, uint32_t item, int32_t use_locale,
                                           uint32_t* form) LX_NOEXCEPT;
/*
 * Copies the text of an item, cut to whole characters, and terminates it. Returns the units written with the
 * terminator (size 0: 0); LX_OPT_CHARS: size and result count characters. options: LX_OPT_OBJECT, LX_OPT_CHARS.
 * -1 with LX_E_ARGUMENT, LX_E_ITEM, or LX_E_NOTFOUND (a default object that the directory lacks).
 */
LX_API int32_t LXGetLocaleTextInfo(LXLocale* locale, uint32_t item, char* buffer, int32_t size,
                                   uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXGetLocaleTextInfoW(LXLocale* locale, uint32_t item, LXWChar* buffer, int32_t size,
                                    uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXGetLocaleTextInfoU(LXLocale* locale, uint32_t item, LXUChar* buffer, int32_t size,
                                    uint32_t options) LX_NOEXCEPT;
/* In a code page of choice (null: the locale's), with shift bytes; begins and ends in the single-byte state. */
LX_API int32_t LXGetLocaleTextInfoEx(LXLocale* locale, uint32_t item, char* buffer, int32_t size,
                                     const LXObjEntry* code_page, uint32_t options) LX_NOEXCEPT;
/*
 * Sets the text of an item for this locale, or swaps the object of that name. options: 0 or LX_OPT_CHARS (length counts
 * characters). Length 0 and the empty text change nothing; an empty separator is set as one zero byte (60 and 67 only).
 * A separator is one byte, no digit, and differs from its partner (59 and 60, 66 and 67); a list separator (61) may be
 * a digit.
 * 1, or 0 with LX_E_ARGUMENT, LX_E_ITEM, LX_E_NOTFOUND (value refused, no such object) or LX_E_MEMORY.
 */
LX_API int32_t LXSetLocaleTextInfo(LXLocale* locale, uint32_t item, const char* text, int32_t length,
                                   uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXSetLocaleTextInfoW(LXLocale* locale, uint32_t item, const LXWChar* text, int32_t length,
                                    uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXSetLocaleTextInfoU(LXLocale* locale, uint32_t item, const LXUChar* text, int32_t length,
                                    uint32_t options) LX_NOEXCEPT;
/* The text is in a code page of choice (null: the locale's), with shift bytes. */
LX_API int32_t LXSetLocaleTextInfoEx(LXLocale* locale, uint32_t item, const char* text, int32_t length,
                                     const LXObjEntry* code_page, uint32_t options) LX_NOEXCEPT;
/* "Language_Territory.CodePage@Sort" in buffer[136]; returns its length without the terminator, -1 without a locale. */
LX_API int32_t LXLocaleGetLocaleString(LXLocale* locale, char* buffer) LX_NOEXCEPT;

/* Fills every value of the locale that was not set explicitly from its territory: 0 or LX_E_MEMORY. */
LX_API uint32_t LXLocaleSetModifiable(LXLocale* locale) LX_NOEXCEPT;
/* Another territory or code page for the locale; values set explicitly stay. 0, or LX_E_MEMORY for any failure, after
   which the locale is as before. The entry must be loaded. */
LX_API uint32_t LXLocaleChangeTerritory(LXLocale* locale, LXObjEntry* territory) LX_NOEXCEPT;
LX_API uint32_t LXLocaleChangeCodePage(LXLocale* locale, LXObjEntry* code_page) LX_NOEXCEPT;
/* Frees the texts of `drop` that are not shared with `keep`. */
LX_API void LXLocaleFreeOldText(const LXLocale* keep, LXLocale* drop) LX_NOEXCEPT;
/* A new copy of the text in another code page, freed with lxfree_cbk; null: no memory, or no such code page. */
LX_API char* LXLocaleCnvText(const LXObjEntry* from, const LXObjEntry* to, const char* text) LX_NOEXCEPT;

/* Locale name for a system locale name such as "de_CH"; unknown parts read "Unknown". Returns buffer. */
LX_API char* LXMapNativeLocale(const char* native_name, char* buffer, int32_t size) LX_NOEXCEPT;
/*
 * A new locale for a system locale name, with the values that the system defines for it. options: LX_NATIVE_INFO,
 * LX_GET_SUBSTITUTE. Null with rc LX_E_ARGUMENT or a status of LXGetLocale. Set-up time only, as LX_GET_USER.
 */
LX_API LXLocale* LXConvertNativeLocale(const char* native_name, uint32_t options, uint32_t* rc) LX_NOEXCEPT;
/*
 * The system's name of the locale in buffer[12]. options: LX_GET_SUBSTITUTE (the nearest name, where there is no
 * exact one), LX_NATIVE_INFO. 1, or 0 with LX_E_NATIVE or LX_E_ARGUMENT.
 */
LX_API int32_t LXConvertLocale(LXLocale* locale, char* buffer, uint32_t options) LX_NOEXCEPT;
/* Takes the values that the system defines for the named locale (empty: the user's) over into the locale; an unknown
   name changes nothing. `flag` is not consulted. Set-up time only, as LX_GET_USER. */
LX_API void LXMapNativeInfo(const char* native_name, LXLocale* locale, uint32_t flag) LX_NOEXCEPT;
/* Calls back for every object of the directory, in its order, until the callback returns 0. Returns 0. */
LX_API int32_t LXEnumLocales(LXEnumFn callback, void* context, uint32_t reserved) LX_NOEXCEPT;
LX_API int32_t LXEnumLocalesW(LXEnumWFn callback, void* context, uint32_t reserved) LX_NOEXCEPT;
LX_API int32_t LXEnumLocalesU(LXEnumUFn callback, void* context, uint32_t reserved) LX_NOEXCEPT;

/* ---- Characters of a code page ---- */
/*
 * Primitives for inner loops: the record must be a loaded code page, the bytes a whole character; nothing is checked
 * or traced. "Packed" is the character's bytes as one big-endian number.
 */

/* UCS-2 value of a multibyte character; 65533 when a byte fits no character. UTF-8: always two or three bytes. */
LX_API int32_t LXCpMbToUnicode(const LXObjEntry* record, const char* bytes) LX_NOEXCEPT;
LX_API int32_t LXCpMbToUnicodeW(const LXObjEntry* record, LXWChar packed) LX_NOEXCEPT;
/* Writes the character for a UCS-2 value (out[4]) and returns its length; the substitution byte when there is none. */
LX_API int32_t LXCpUnicodeToChar(const LXObjEntry* record, LXUChar ucs2, char* out) LX_NOEXCEPT;
LX_API LXWChar LXCpUnicodeToCharW(const LXObjEntry* record, LXUChar ucs2) LX_NOEXCEPT;
/* The other width of a character; 0 when there is none. */
LX_API LXWChar LXCpMbHalfToFullW(const LXObjEntry* record, LXWChar packed) LX_NOEXCEPT;
LX_API LXWChar LXCpFullToHalfW(const LXObjEntry* record, LXWChar packed) LX_NOEXCEPT;
/* Converts the older code page layout; both results come from the allocation callback. Null: no memory, or sections
   that are none of that layout. */
LX_API uint8_t* LXCpV1toV2(const uint8_t* v1_section1, uint16_t v1_section1_size, const uint8_t* v1_section2,
                           uint16_t v1_section2_size, uint8_t** out_section2) LX_NOEXCEPT;
LX_API LXWChar LXMbToW(const LXObjEntry* record, const char* bytes) LX_NOEXCEPT;
/* Packs the page's longest character (whole) or one byte. */
LX_API LXWChar LXMbToWS(const LXObjEntry* record, const char* bytes, uint32_t whole) LX_NOEXCEPT;
/* Unpacks into out[4] and returns the count. Zero middle bytes are skipped. */
LX_API uint16_t LXWToMb(char* out, LXWChar packed) LX_NOEXCEPT;
/* Type and case entry of a multibyte character; owned by the object. */
LX_API const LXCharType* LXGetMbCtype(const LXObjEntry* record, const char* bytes) LX_NOEXCEPT;
LX_API const LXCharType* LXGetMbCtypeW(const LXObjEntry* record, LXWChar packed) LX_NOEXCEPT;
/* The other case of a multibyte character whose type has a bit of `mask`, else a copy (dst[4]). */
LX_API void LXCpMbCaseConv(const LXObjEntry* record, const char* src, char* dst, uint32_t mask) LX_NOEXCEPT;
LX_API int32_t LXCpMbCaseConvS(const LXObjEntry* record, const char* src, char* dst, uint32_t mask) LX_NOEXCEPT;
LX_API LXWChar LXCpMbCaseConvW(const LXObjEntry* record, LXWChar packed, uint32_t mask) LX_NOEXCEPT;

/* ---- Conversion ---- */
/*
 * Plain text is bytes of the locale's code page, W text packed characters of it, U text UCS-2. The Ex forms read and
 * write shift bytes of mixed host pages: a shift state is 0 (single-byte) or 1 (double-byte), and output ends in state
 * 0 unless there is no room for a single unit or nothing to write. The plain forms write no shift bytes.
 * Flags: LX_OPT_TERMINATE, LX_OPT_CHARS; others give -1 with LX_E_ARGUMENT.
 * Results count the units written, with the terminator when one is written: with LX_OPT_TERMINATE, or when the length
 * was measured, all input was converted and there is room. A character cut off by the end of the input is dropped.
 */

/* A handle for text of any length from the source's into the target's code page; the locales must outlive it.
   Null: LX_E_MEMORY in the target locale. `reserved` is 0. */
LX_API LXConversion* LXOpenConversion(LXLocale* target_locale, LXLocale* source_locale, uint32_t reserved) LX_NOEXCEPT;
LX_API uint32_t LXCloseConversion(LXConversion* handle) LX_NOEXCEPT; /* 0 or LX_E_FREE */
/*
 * Converts from *in to *out and advances both pointers and both byte counts. Returns 0 when all input is consumed,
 * LX_E_FULL when the output is full (call again with room), LX_E_PARTIAL when the input ends inside a character
 * (call again with more). A few bytes of either side may wait inside the handle. A mixed host target is left in the
 * state of the last character: LXFinishConversion closes it.
 */
LX_API uint32_t LXConvertBuffer(LXConversion* handle, char** out, int32_t* out_room, const char** in, int32_t* in_left,
                                uint32_t reserved) LX_NOEXCEPT;
/* Most target bytes for one source byte of well-formed text, without changed line ends and the final shift byte. A byte
   of malformed text takes up to three in UTF-8. Between equal code pages it is 1, though one that has several codes
   for a character may write a longer one than it read. */
LX_API int32_t LXConversionRatio(LXLocale* target_locale, LXLocale* source_locale, uint32_t reserved) LX_NOEXCEPT;

/* From the source's code page into the target's; the status stands in the target locale. */
LX_API int32_t LXConvertString(LXLocale* target_locale, char* out, int32_t out_size, LXLocale* source_locale,
                               const char* in, int32_t in_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXConvertStringW(LXLocale* target_locale, LXWChar* out, int32_t out_size, LXLocale* source_locale,
                                const LXWChar* in, int32_t in_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXConvertStringEx(LXLocale* target_locale, char* out, uint32_t target_shift_state, int32_t out_size,
                                 LXLocale* source_locale, const char* in, uint32_t source_shift_state,
                                 int32_t in_length, uint32_t flags) LX_NOEXCEPT;

/* Bytes that `chars` characters occupy, and whole characters in `bytes` bytes; shift bytes are no characters. The first
   looks at the byte behind its last character, which may be a shift byte. */
LX_API int32_t LXCpStrCharToByteLen(const LXObjEntry* record, const char* string, uint32_t shift_state,
                                    int32_t chars) LX_NOEXCEPT;
LX_API int32_t LXCpStrByteToCharLen(const LXObjEntry* record, const char* string, uint32_t shift_state,
                                    int32_t bytes) LX_NOEXCEPT;

/* Between the locale's code page and UCS-2. */
LX_API int32_t LXStringToUnicode(LXLocale* locale, LXUChar* out, int32_t out_size, const char* in, int32_t in_length,
                                 uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStringToUnicodeW(LXLocale* locale, LXUChar* out, int32_t out_size, const LXWChar* in,
                                  int32_t in_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStringToUnicodeEx(LXLocale* locale, LXUChar* out, int32_t out_size, const char* in,
                                   uint32_t shift_state, int32_t in_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXUnicodeToString(LXLocale* locale, char* out, int32_t out_size, const LXUChar* in, int32_t in_length,
                                 uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXUnicodeToStringW(LXLocale* locale, LXWChar* out, int32_t out_size, const LXUChar* in,
                                  int32_t in_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXUnicodeToStringEx(LXLocale* locale, char* out, uint32_t shift_state, int32_t out_size,
                                   const LXUChar* in, int32_t in_length, uint32_t flags) LX_NOEXCEPT;
/* Packs characters. A measured length includes the terminator, which is then packed and counted like any character. */
LX_API int32_t LXMbToWide(LXLocale* locale, LXWChar* out, int32_t out_size, const char* in, int32_t in_length,
                          uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXMbToWideEx(LXLocale* locale, LXWChar* out, int32_t out_size, const char* in, uint32_t shift_state,
                            int32_t in_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXWideToMb(LXLocale* locale, char* out, int32_t out_size, const LXWChar* in, int32_t in_length,
                          uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXWideToMbEx(LXLocale* locale, char* out, uint32_t shift_state, int32_t out_size, const LXWChar* in,
                            int32_t in_length, uint32_t flags) LX_NOEXCEPT;
/* By code page record instead of locale; -1 for a null record or bad flags. */
LX_API int32_t LXCpStrToUnicode(const LXObjEntry* record, LXUChar* out, int32_t out_size, const char* in,
                                int32_t in_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXCpUnicodeToStr(const LXObjEntry* record, char* out, int32_t out_size, const LXUChar* in,
                                int32_t in_length, uint32_t flags) LX_NOEXCEPT;
/* Between ASCII (code page 367) and UCS-2: source bytes consumed, or bytes written; -1 when 367 is missing or the
   input is empty. */
LX_API int32_t LXComStrToUnicode(LXUChar* out, int32_t out_size, const char* in, int32_t in_length,
                                 uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXComUnicodeToStr(char* out, int32_t out_size, const LXUChar* in, int32_t in_length,
                                 uint32_t flags) LX_NOEXCEPT;

/* ---- Unicode tables ---- */

/*
 * What the library knows about UCS-2 characters, beginning with the character named behind each array. Characters
 * outside follow rules.
 */

/* Type words: LX_CT_ bits; from bit 10 one bit for the direction; from bit 22 bits for the form. Unassigned: 0x400. */
extern LX_API const uint32_t LX_UNICODE_Ctype1[1786]; /* U+0000 */
extern LX_API const uint32_t LX_UNICODE_Ctype2[1501]; /* U+0901 */
extern LX_API const uint32_t LX_UNICODE_Ctype3[346];  /* U+10A0 */
extern LX_API const uint32_t LX_UNICODE_Ctype4[1024]; /* U+1E00 */
extern LX_API const uint32_t LX_UNICODE_Ctype5[1229]; /* U+22F2 */
extern LX_API const uint32_t LX_UNICODE_Ctype6[1023]; /* U+3000 */
extern LX_API const uint32_t LX_UNICODE_Ctype7[211];  /* U+FB00 */
extern LX_API const uint32_t LX_UNICODE_Ctype8[706];  /* U+FD3E */
/* Lower case; the character itself where it has none. */
extern LX_API const uint16_t LX_UNICODE_Lower1[255]; /* U+0100 */
extern LX_API const uint16_t LX_UNICODE_Lower2[118]; /* U+0200 */
extern LX_API const uint16_t LX_UNICODE_Lower3[111]; /* U+0380 */
extern LX_API const uint16_t LX_UNICODE_Lower4[249]; /* U+0400 */
extern LX_API const uint16_t LX_UNICODE_Lower5[249]; /* U+1E00 */
extern LX_API const uint16_t LX_UNICODE_Lower6[253]; /* U+1F00 */
/* Upper case. */
extern LX_API const uint16_t LX_UNICODE_Upper1[256]; /* U+0100 */
extern LX_API const uint16_t LX_UNICODE_Upper2[147]; /* U+0200 */
extern LX_API const uint16_t LX_UNICODE_Upper3[82];  /* U+03A0 */
extern LX_API const uint16_t LX_UNICODE_Upper4[202]; /* U+0430 */
extern LX_API const uint16_t LX_UNICODE_Upper5[250]; /* U+1E00 */
extern LX_API const uint16_t LX_UNICODE_Upper6[244]; /* U+1F00 */
/* Full-width form. */
extern LX_API const uint16_t LX_UNICODE_H2F1[16];  /* U+00A0 */
extern LX_API const uint16_t LX_UNICODE_H2F2[143]; /* U+FF60 */
/* Half-width form. */
extern LX_API const uint16_t LX_UNICODE_F2H1[204]; /* U+2500 */
extern LX_API const uint16_t LX_UNICODE_F2H2[253]; /* U+3000 */
extern LX_API const uint16_t LX_UNICODE_F2H3[53];  /* U+3130 */
extern LX_API const uint16_t LX_UNICODE_F2H4[7];   /* U+FFE0 */
/* Digits in ascending order, each with the ASCII digit that it stands for. */
extern LX_API const uint16_t LXDigits[179][2];

/* ---- Characters of a text ---- */
/*
 * `s` points at a character of the locale's code page. The Ex forms follow shift states on shift-sensitive code pages
 * (0 single-byte, 1 double-byte) and equal the plain ones elsewhere. Nothing looks behind the character or text that is
 * given, except that LXNextCharEx and LXMoveStringPointerEx with LX_OPT_CHARS see whether a shift byte follows. Every
 * out pointer is optional. Failure values are null, -1 and 0, with LX_E_ARGUMENT for bad options.
 */

/* Entry of the code page's length table for the first byte; 0: it begins no character (walks then step by one). */
LX_API int32_t LXByteLength(LXLocale* locale, const char* s) LX_NOEXCEPT;
LX_API int32_t LXByteLengthEx(LXLocale* locale, const char* s, uint32_t state) LX_NOEXCEPT;
/* Bytes of a packed character, 1 to 4. */
LX_API int32_t LXByteLengthW(LXLocale* locale, LXWChar value) LX_NOEXCEPT;
/* The next character, and the one before `current` in the text that begins at `start`. */
LX_API char* LXNextChar(LXLocale* locale, const char* s) LX_NOEXCEPT;
LX_API char* LXNextCharEx(LXLocale* locale, const char* s, uint32_t state, uint32_t* new_state) LX_NOEXCEPT;
LX_API char* LXPrevChar(LXLocale* locale, const char* start, const char* current) LX_NOEXCEPT;
LX_API char* LXPrevCharEx(LXLocale* locale, const char* start, const char* current, uint32_t state,
                          uint32_t* new_state) LX_NOEXCEPT;
/* Whole characters; to the Ex form shift bytes are none. */
LX_API int32_t LXNumChars(LXLocale* locale, const char* s, int32_t byte_length) LX_NOEXCEPT;
LX_API int32_t LXNumCharsEx(LXLocale* locale, const char* s, uint32_t state, int32_t byte_length) LX_NOEXCEPT;
/* The last character start that is not more than `count` bytes (LX_OPT_CHARS: characters) away. */
LX_API char* LXMoveStringPointer(LXLocale* locale, const char* s, int32_t count, uint32_t flags) LX_NOEXCEPT;
LX_API char* LXMoveStringPointerEx(LXLocale* locale, const char* s, uint32_t state, int32_t count,
                                   uint32_t flags) LX_NOEXCEPT;
/* One character, packed. */
LX_API LXWChar LXGetChar(LXLocale* locale, const char* s) LX_NOEXCEPT;
LX_API LXWChar LXGetCharEx(LXLocale* locale, const char* s, uint32_t state) LX_NOEXCEPT;
LX_API void LXPutChar(LXLocale* locale, char* out, LXWChar packed) LX_NOEXCEPT;
LX_API void LXPutCharEx(LXLocale* locale, char* out, LXWChar packed, uint32_t state) LX_NOEXCEPT;
LX_API void LXInitState(LXLocale* locale, uint32_t* state) LX_NOEXCEPT;
/* Bytes of the character that are there before a terminator. */
LX_API int32_t LXValidChar(LXLocale* locale, const char* s) LX_NOEXCEPT;
LX_API int32_t LXValidCharEx(LXLocale* locale, const char* s, uint32_t state) LX_NOEXCEPT;
/* Type bits of a character in one of the classes LX_CTYPE_; another class gives LX_E_ARGUMENT and the bits of
   LX_CTYPE_1 all the same. */
LX_API uint32_t LXGetCharType(LXLocale* locale, const char* s, uint32_t class_id) LX_NOEXCEPT;
LX_API uint32_t LXGetCharTypeW(LXLocale* locale, LXWChar packed, uint32_t class_id) LX_NOEXCEPT;
LX_API uint32_t LXGetCharTypeU(LXLocale* locale, LXUChar ch, uint32_t class_id) LX_NOEXCEPT;
LX_API uint32_t LXGetCharTypeEx(LXLocale* locale, const char* s, uint32_t state, uint32_t class_id) LX_NOEXCEPT;
/*
 * The position behind the first line end of the kinds in `flags` (LX_EOL_1 to LX_EOL_4; 0: LX_EOL_1; LX_OPT_CHARS), its
 * kind and its length in units. Null with LX_EOL_NONE: there is none; null with LX_EOL_BAD: bad flags.
 */
LX_API char* LXGetEol(LXLocale* locale, const char* s, int32_t length, uint32_t* type, int32_t* eol_length,
                      uint32_t flags) LX_NOEXCEPT;
LX_API LXUChar* LXGetEolU(LXLocale* locale, const LXUChar* s, int32_t length, uint32_t* type, int32_t* eol_length,
                          uint32_t flags) LX_NOEXCEPT;
LX_API LXWChar* LXGetEolW(LXLocale* locale, const LXWChar* s, int32_t length, uint32_t* type, int32_t* eol_length,
                          uint32_t flags) LX_NOEXCEPT;
LX_API char* LXGetEolEx(LXLocale* locale, const char* s, uint32_t state, int32_t length, uint32_t* type,
                        int32_t* eol_length, uint32_t flags) LX_NOEXCEPT;
/* Writes line ends, of several flags in the order 4, 3, 1, 2; 0: LX_EOL_DEFAULT. Returns the position behind them. */
LX_API char* LXPutEol(LXLocale* locale, char* out, uint32_t flags) LX_NOEXCEPT;
LX_API LXUChar* LXPutEolU(LXLocale* locale, LXUChar* out, uint32_t flags) LX_NOEXCEPT;
LX_API LXWChar* LXPutEolW(LXLocale* locale, LXWChar* out, uint32_t flags) LX_NOEXCEPT;
LX_API char* LXPutEolEx(LXLocale* locale, char* out, uint32_t state, uint32_t flags) LX_NOEXCEPT;
/* Returns shift-sensitive output to the single-byte state, with LX_OPT_TERMINATE also terminates it: bytes written. */
LX_API int32_t LXTerminateStringEx(LXLocale* locale, char* out, uint32_t state, uint32_t flags) LX_NOEXCEPT;
/*
 * Cuts a string so that it fits in `size` bytes with its terminator, and strips trailing blanks (LX_TRUNC_STRIP; with
 * LX_CMP_NOWIDTH full-width ones too; LX_OPT_CHARS). Returns the size used, or 0 for a string that fits and was left
 * alone. On multibyte code pages a last single-byte character does not end a run of blanks: "Plan A" is stripped to
 * "Plan".
 */
LX_API int32_t LXTruncateString(LXLocale* locale, char* string, int32_t size, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXTruncateStringEx(LXLocale* locale, char* string, uint32_t state, int32_t size,
                                  uint32_t flags) LX_NOEXCEPT;

/* ---- Unicode character mapping ---- */

/* The other case; the character itself where it has none. */
LX_API LXUChar LXUnicodeToLower(LXLocale* locale, LXUChar ch) LX_NOEXCEPT;
LX_API LXUChar LXUnicodeToUpper(LXLocale* locale, LXUChar ch) LX_NOEXCEPT;
/* The full-width and the half-width form. */
LX_API LXUChar LXUnicodeToH2F(LXLocale* locale, LXUChar ch) LX_NOEXCEPT;
LX_API LXUChar LXUnicodeToF2H(LXLocale* locale, LXUChar ch) LX_NOEXCEPT;
/*
 * Maps a whole text: LX_MAP_, or 0 (copy), with LX_OPT_CHARS. Case mapping follows the special pairs of the language,
 * unless LX_MAP_PLAIN is set. A measured length includes the terminator. Returns the units (characters) written; what
 * does not fit is left out, without a status. With LX_OPT_CHARS no more than 512 bytes of output are made, and the Ex
 * form, where it copies, reads the shift byte behind characters that end inside a double-byte run.
 */
LX_API int32_t LXMapString(LXLocale* locale, char* out, int32_t out_size, const char* in, int32_t in_len,
                           uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXMapStringEx(LXLocale* locale, char* out, int32_t out_size, const char* in, uint32_t state,
                             int32_t in_len, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXMapStringW(LXLocale* locale, LXWChar* out, int32_t out_size, const LXWChar* in, int32_t in_len,
                            uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXMapStringU(LXLocale* locale, LXUChar* out, int32_t out_size, const LXUChar* in, int32_t in_len,
                            uint32_t flags) LX_NOEXCEPT;

/* ---- Strings ---- */
/*
 * No function here cuts a character. Lengths count units, with LX_OPT_CHARS characters; negative ones are measured,
 * with the terminator where the text is copied or searched, without it where it is spanned, joined or cut into tokens.
 * LXStrcpyEx, LXStrcatEx and, without a sort, LXStrxfrmEx read the byte behind counted characters that end inside a
 * double-byte run: the shift byte that closes the run belongs to the last of them.
 */

/*
 * Compares in code page order: less than, equal to or greater than 0. options: 0, LX_CMP_NOCASE or LX_CMP_NOWIDTH,
 * LX_CMP_TRIM (ignore trailing blanks), LX_OPT_CHARS. 0 with LX_E_ARGUMENT or LX_E_MEMORY on failure.
 */
LX_API int32_t LXStrcmp(LXLocale* locale, const char* str1, int32_t len1, const char* str2, int32_t len2,
                        uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcmpEx(LXLocale* locale, const char* str1, uint32_t state1, int32_t len1, const char* str2,
                          uint32_t state2, int32_t len2, uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXWcscmp(LXLocale* locale, const LXWChar* wstr1, int32_t len1, const LXWChar* wstr2, int32_t len2,
                        uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcmpU(LXLocale* locale, const LXUChar* ustr1, int32_t len1, const LXUChar* ustr2, int32_t len2,
                         uint32_t options) LX_NOEXCEPT;
/* Bytes of whole characters in `len` bytes of shift-sensitive text. */
LX_API int32_t AdjustLength(LXLocale* locale, const char* str, uint32_t state, int32_t len) LX_NOEXCEPT;
/* Copies whole characters, without adding a terminator: units (characters) copied. A copy that was cut may leave a
   double-byte run open: see LXTruncateStringEx. */
LX_API int32_t LXStrcpy(LXLocale* locale, char* dst, int32_t dst_size, const char* src, int32_t src_len,
                        uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcpyEx(LXLocale* locale, char* dst, int32_t dst_size, const char* src, uint32_t state,
                          int32_t src_len, uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXWcscpy(LXLocale* locale, LXWChar* dst, int32_t dst_size, const LXWChar* src, int32_t src_len,
                        uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcpyU(LXLocale* locale, LXUChar* dst, int32_t dst_size, const LXUChar* src, int32_t src_len,
                         uint32_t options) LX_NOEXCEPT;
/* Appends to a terminated text, which must have the room; LX_OPT_TERMINATE, or a measured length, terminates it.
   Returns the new length, with the terminator when one was written; for a src_len of 0, with the one that is there. */
LX_API int32_t LXStrcat(LXLocale* locale, char* dst, const char* src, int32_t src_len, uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcatEx(LXLocale* locale, char* dst, const char* src, uint32_t state, int32_t src_len,
                          uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXWcscat(LXLocale* locale, LXWChar* dst, const LXWChar* src, int32_t src_len,
                        uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcatU(LXLocale* locale, LXUChar* dst, const LXUChar* src, int32_t src_len,
                         uint32_t options) LX_NOEXCEPT;
/* The first (LX_STR_LAST: last) occurrence of a character. */
LX_API char* LXStrchr(LXLocale* locale, const char* str, int32_t len, const char* ch, uint32_t options) LX_NOEXCEPT;
LX_API char* LXStrchrEx(LXLocale* locale, const char* str, uint32_t state, int32_t len, const char* ch,
                        uint32_t ch_state, uint32_t* match_state, uint32_t options) LX_NOEXCEPT;
LX_API LXWChar* LXWcschr(LXLocale* locale, const LXWChar* wstr, int32_t len, LXWChar ch, uint32_t options) LX_NOEXCEPT;
LX_API LXUChar* LXStrchrU(LXLocale* locale, const LXUChar* ustr, int32_t len, LXUChar ch, uint32_t options) LX_NOEXCEPT;
/* The first occurrence of a text. options: 0, LX_CMP_NOCASE, LX_CMP_NOWIDTH, LX_OPT_CHARS. */
LX_API char* LXStrstr(LXLocale* locale, const char* str, int32_t len, const char* sub, int32_t sub_len,
                      uint32_t options) LX_NOEXCEPT;
LX_API char* LXStrstrEx(LXLocale* locale, const char* str, uint32_t state, int32_t len, const char* sub,
                        uint32_t sub_state, int32_t sub_len, uint32_t* match_state, uint32_t options) LX_NOEXCEPT;
LX_API LXWChar* LXWcsstr(LXLocale* locale, const LXWChar* wstr, int32_t len, const LXWChar* sub, int32_t sub_len,
                         uint32_t options) LX_NOEXCEPT;
LX_API LXUChar* LXStrstrU(LXLocale* locale, const LXUChar* ustr, int32_t len, const LXUChar* sub, int32_t sub_len,
                          uint32_t options) LX_NOEXCEPT;
/* Length of the beginning that consists of characters in the set (spn), or of characters that are not (cspn). */
LX_API int32_t LXStrspn(LXLocale* locale, const char* str, int32_t len, const char* set, int32_t set_len,
                        uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrspnEx(LXLocale* locale, const char* str, uint32_t state, int32_t len, const char* set,
                          uint32_t set_state, int32_t set_len, uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXWcsspn(LXLocale* locale, const LXWChar* wstr, int32_t len, const LXWChar* set, int32_t set_len,
                        uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrspnU(LXLocale* locale, const LXUChar* ustr, int32_t len, const LXUChar* set, int32_t set_len,
                         uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcspn(LXLocale* locale, const char* str, int32_t len, const char* set, int32_t set_len,
                         uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcspnEx(LXLocale* locale, const char* str, uint32_t state, int32_t len, const char* set,
                           uint32_t set_state, int32_t set_len, uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXWcscspn(LXLocale* locale, const LXWChar* wstr, int32_t len, const LXWChar* set, int32_t set_len,
                         uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcspnU(LXLocale* locale, const LXUChar* ustr, int32_t len, const LXUChar* set, int32_t set_len,
                          uint32_t options) LX_NOEXCEPT;
/*
 * The next token: skips delimiters, overwrites the one that ends the token with zeros, and leaves in *next and *len the
 * rest, for the next call. Null, with *next null, when there is none.
 */
LX_API char* LXStrtok(LXLocale* locale, char* str, int32_t* len, const char* delims, int32_t delims_len, char** next,
                      uint32_t options) LX_NOEXCEPT;
LX_API char* LXStrtokEx(LXLocale* locale, char* str, uint32_t* state, int32_t* len, const char* delims,
                        uint32_t delims_state, int32_t delims_len, char** next, uint32_t options) LX_NOEXCEPT;
LX_API LXWChar* LXWcstok(LXLocale* locale, LXWChar* wstr, int32_t* len, const LXWChar* delims, int32_t delims_len,
                         LXWChar** next, uint32_t options) LX_NOEXCEPT;
LX_API LXUChar* LXStrtokU(LXLocale* locale, LXUChar* ustr, int32_t* len, const LXUChar* delims, int32_t delims_len,
                          LXUChar** next, uint32_t options) LX_NOEXCEPT;
/* Bytes of a packed character, as LXByteLengthW. */
LX_API int32_t LXStrByteLength(LXLocale* locale, LXWChar value) LX_NOEXCEPT;
/* Units before the terminator. */
LX_API int32_t LXWcslen(LXLocale* locale, const LXWChar* wstr) LX_NOEXCEPT;
LX_API int32_t LXStrlenU(LXLocale* locale, const LXUChar* ustr) LX_NOEXCEPT;

/* ---- Collation ---- */

/*
 * Weights of a character, or of a pair that combines, in a sort object: 0 none, 1 one set, 2 two sets. A weight of 0
 * means nothing at that level; mask bits 8, 4, 2, 1: the weight of the primary, secondary, tertiary, special level
 * stands in text order. No argument is checked but a null sort (0).
 */
LX_API int32_t LXSortGetWeights(const LXObjEntry* sort, LXUChar ch, uint16_t* primary, uint8_t* secondary,
                                uint8_t* tertiary, uint16_t* special, uint16_t* primary2, uint8_t* secondary2,
                                uint8_t* tertiary2, uint16_t* special2, uint8_t* mask) LX_NOEXCEPT;
LX_API int32_t LXSortGetCombination(const LXObjEntry* sort, LXUChar ch1, LXUChar ch2, uint16_t* primary,
                                    uint8_t* secondary, uint8_t* tertiary, uint16_t* special,
                                    uint8_t* mask) LX_NOEXCEPT;
/*
 * Reads one character's weights and moves on. *remaining counts units, *position characters. *pending holds a character
 * that was looked at already, 0xFFFF: none; set it so, and *position to 0, before the first call. Call again while
 * *remaining is above 0 or *pending below 0xFFFF.
 */
LX_API int32_t LXStrGetNextWeight(LXLocale* locale, const char** text, int32_t* remaining, uint16_t* position,
                                  uint16_t* primary, uint8_t* secondary, uint8_t* tertiary, uint16_t* special,
                                  uint16_t* primary2, uint8_t* secondary2, uint8_t* tertiary2, uint16_t* special2,
                                  uint8_t* mask, uint16_t* pending) LX_NOEXCEPT;
LX_API int32_t LXStrGetNextWeightEx(LXLocale* locale, const char** text, int32_t* remaining, uint32_t* shift_state,
                                    uint16_t* position, uint16_t* primary, uint8_t* secondary, uint8_t* tertiary,
                                    uint16_t* special, uint16_t* primary2, uint8_t* secondary2, uint8_t* tertiary2,
                                    uint16_t* special2, uint8_t* mask, uint16_t* pending) LX_NOEXCEPT;
LX_API int32_t LXStrGetNextWeightW(LXLocale* locale, const LXWChar** text, int32_t* remaining, uint16_t* position,
                                   uint16_t* primary, uint8_t* secondary, uint8_t* tertiary, uint16_t* special,
                                   uint16_t* primary2, uint8_t* secondary2, uint8_t* tertiary2, uint16_t* special2,
                                   uint8_t* mask, uint16_t* pending) LX_NOEXCEPT;
LX_API int32_t LXStrGetNextWeightU(LXLocale* locale, const LXUChar** text, int32_t* remaining, uint16_t* position,
                                   uint16_t* primary, uint8_t* secondary, uint8_t* tertiary, uint16_t* special,
                                   uint16_t* primary2, uint8_t* secondary2, uint8_t* tertiary2, uint16_t* special2,
                                   uint8_t* mask, uint16_t* pending) LX_NOEXCEPT;

/*
 * Compares by the locale's sort object: less than, equal to or greater than 0. options: 0, LX_CMP_NOCASE,
 * LX_CMP_NOWIDTH; trailing blanks are ignored with LX_COLL_TRIM (plain and Ex; LX_CMP_NOWIDTH includes it) or
 * LX_CMP_TRIM (W and U); LX_OPT_CHARS. In the plain and Ex forms, trimming cuts the second text to the length of the
 * trimmed first one. 0 with LX_E_ARGUMENT or LX_E_MEMORY on failure, which LXGetError tells from equal. Without a sort
 * object as LXStrcmp. In LXStrcollEx a state stands behind its length, in LXStrcmpEx before it.
 */
LX_API int32_t LXStrcoll(LXLocale* locale, const char* str1, int32_t len1, const char* str2, int32_t len2,
                         uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcollEx(LXLocale* locale, const char* str1, int32_t len1, uint32_t state1, const char* str2,
                           int32_t len2, uint32_t state2, uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXWcscoll(LXLocale* locale, const LXWChar* wstr1, int32_t len1, const LXWChar* wstr2, int32_t len2,
                         uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrcollU(LXLocale* locale, const LXUChar* ustr1, int32_t len1, const LXUChar* ustr2, int32_t len2,
                          uint32_t options) LX_NOEXCEPT;
/*
 * A key whose bytes compare (memcmp, then length) as the texts do; but in sorts with pairs of letters that count as one
 * LXStrcoll may call texts equal, or order them otherwise, that are told apart by nothing but the places of their
 * punctuation (special weights). options: 0, LX_CMP_NOCASE, LX_CMP_NOWIDTH, LX_OPT_CHARS.
 * Returns the length of the whole key, -1 with LX_E_ARGUMENT or LX_E_MEMORY; a key longer than key_size was not written
 * (but for an empty text: as much of its three zero bytes as fits; 0 without room). The rest of a buffer that held the
 * work area (16 bytes a character) is zeroed.
 */
LX_API int32_t LXStrxfrm(LXLocale* locale, void* key, int32_t key_size, const char* str, int32_t len,
                         uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrxfrmEx(LXLocale* locale, void* key, int32_t key_size, const char* str, int32_t len, uint32_t state,
                           uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXWcsxfrm(LXLocale* locale, void* key, int32_t key_size, const LXWChar* wstr, int32_t len,
                         uint32_t options) LX_NOEXCEPT;
LX_API int32_t LXStrxfrmU(LXLocale* locale, void* key, int32_t key_size, const LXUChar* ustr, int32_t len,
                          uint32_t options) LX_NOEXCEPT;
/* The same from UCS-2. Always 3 for an empty text; -1 with LX_E_MEMORY, or without a sort object LX_E_ARGUMENT. */
LX_API int32_t LXStrGenSortKey(LXLocale* locale, void* key, int32_t key_size, const LXUChar* chars,
                               int32_t count) LX_NOEXCEPT;
/* Files one set of weights into the arrays of the four levels: each has an insertion point and an end. */
LX_API void LXStrInsertWeights(uint16_t primary, uint16_t** p_ins, uint16_t** p_end, uint8_t secondary, uint8_t** s_ins,
                               uint8_t** s_end, uint8_t tertiary, uint8_t** t_ins, uint8_t** t_end, uint16_t special,
                               LXSpecialWeight** x_ins, LXSpecialWeight** x_end, uint16_t position,
                               uint8_t mask) LX_NOEXCEPT;

/* ---- Numbers and money ---- */
/*
 * Values written as the locale writes them, and read back. Lengths count units, with LX_NUM_CHARLEN characters. Writing
 * returns what was written, with the terminator (LX_NUM_TERMINATE, which takes one unit of the room); -1 with
 * LX_E_ARGUMENT for other flags; 0 with LX_E_BUFFER for no room; a result that was cut leaves LX_E_BUFFER. Texts of the
 * locale are its own, with LX_NUM_TEXTOPT those of its territory. The Ex forms write no shift bytes around digits;
 * `state` is the shift state in which the output starts.
 */

/*
 * An integer, in groups of digits. With LX_NUM_CHARLEN the characters of the result are counted from behind it, as many
 * bytes as it has: on multibyte pages that depends on what stands there. flags: LX_NUM_TEXTOPT, LX_NUM_TERMINATE,
 * LX_NUM_UNSIGNED, LX_NUM_CHARLEN.
 */
LX_API int32_t LXLongToString(LXLocale* locale, int32_t value, char* buffer, int32_t length,
                              uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXLongToStringW(LXLocale* locale, int32_t value, LXWChar* buffer, int32_t length,
                               uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXLongToStringU(LXLocale* locale, int32_t value, LXUChar* buffer, int32_t length,
                               uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXLongToStringEx(LXLocale* locale, int32_t value, char* buffer, uint32_t state, int32_t length,
                                uint32_t flags) LX_NOEXCEPT;
/*
 * Reads an integer in base 2 to 36; 0 takes the base from a prefix "0x" or "0". Stops at the first character that does
 * not belong (*end, optional); 0 with *end there when there is no number. Out of range: the nearest value. flags:
 * LX_NUM_TEXTOPT, LX_NUM_FULLWIDTH, LX_NUM_MONETARY, LX_NUM_UNSIGNED (cast the result), LX_NUM_CHARLEN; others
 * LX_E_ARGUMENT. LX_E_BASE for another base. *end_state (optional): the shift state at *end, `state` behind the text.
 */
LX_API int32_t LXStringToLong(LXLocale* locale, const char* string, int32_t length, const char** end, int32_t base,
                              uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStringToLongW(LXLocale* locale, const LXWChar* string, int32_t length, const LXWChar** end,
                               int32_t base, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStringToLongU(LXLocale* locale, const LXUChar* string, int32_t length, const LXUChar** end,
                               int32_t base, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStringToLongEx(LXLocale* locale, const char* string, uint32_t state, int32_t length, const char** end,
                                uint32_t* end_state, int32_t base, uint32_t flags) LX_NOEXCEPT;
/*
 * Fixed point, with the locale's number of fraction digits (six are rounded; fewer are cut from these, more are one
 * less, with zeros) and always the decimal point. flags: LX_NUM_TEXTOPT, LX_NUM_TERMINATE, LX_NUM_CHARLEN.
 */
LX_API int32_t LXDoubleToString(LXLocale* locale, double value, char* buffer, int32_t length,
                                uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXDoubleToStringW(LXLocale* locale, double value, LXWChar* buffer, int32_t length,
                                 uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXDoubleToStringU(LXLocale* locale, double value, LXUChar* buffer, int32_t length,
                                 uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXDoubleToStringEx(LXLocale* locale, double value, char* buffer, uint32_t state, int32_t length,
                                  uint32_t flags) LX_NOEXCEPT;
/*
 * Reads a decimal number; an exponent only behind a decimal point. Stops as LXStringToLong does. flags: LX_NUM_TEXTOPT,
 * LX_NUM_FULLWIDTH, LX_NUM_MONETARY, LX_NUM_CHARLEN.
 */
LX_API double LXStringToDouble(LXLocale* locale, const char* string, int32_t length, const char** end,
                               uint32_t flags) LX_NOEXCEPT;
LX_API double LXStringToDoubleW(LXLocale* locale, const LXWChar* string, int32_t length, const LXWChar** end,
                                uint32_t flags) LX_NOEXCEPT;
LX_API double LXStringToDoubleU(LXLocale* locale, const LXUChar* string, int32_t length, const LXUChar** end,
                                uint32_t flags) LX_NOEXCEPT;
LX_API double LXStringToDoubleEx(LXLocale* locale, const char* string, uint32_t state, int32_t length, const char** end,
                                 uint32_t* end_state, uint32_t flags) LX_NOEXCEPT;
/*
 * An amount with the locale's currency symbol (LX_NUM_INTLSYM: the international one) and sign, of which three
 * characters count when it is negative. The decimal point always comes, also before no fraction digits. With
 * LX_NUM_CHARLEN the plain and the Ex form write at most 512 bytes. flags: LX_NUM_TEXTOPT, LX_NUM_TERMINATE,
 * LX_NUM_INTLSYM, LX_NUM_CHARLEN.
 */
LX_API int32_t LXCurrencyToString(LXLocale* locale, double amount, char* buffer, int32_t length,
                                  uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXCurrencyToStringW(LXLocale* locale, double amount, LXWChar* buffer, int32_t length,
                                   uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXCurrencyToStringU(LXLocale* locale, double amount, LXUChar* buffer, int32_t length,
                                   uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXCurrencyToStringEx(LXLocale* locale, double amount, char* buffer, uint32_t state, int32_t length,
                                    uint32_t flags) LX_NOEXCEPT;
/*
 * The next size of a terminated grouping string ("3;0"), and what follows it: null, nothing. *remaining goes down by
 * its digits. 0 repeats the size before it. -1: none, or not a grouping string.
 */
LX_API int32_t LXStrGroupingSize(LXLocale* locale, const char* grouping, int32_t* remaining,
                                 const char** next) LX_NOEXCEPT;
LX_API int32_t LXStrGroupingSizeW(LXLocale* locale, const LXWChar* grouping, int32_t* remaining,
                                  const LXWChar** next) LX_NOEXCEPT;
LX_API int32_t LXStrGroupingSizeU(LXLocale* locale, const LXUChar* grouping, int32_t* remaining,
                                  const LXUChar** next) LX_NOEXCEPT;
/*
 * What a text begins with: a digit's value (0 to 35) or an LX_DIG_ code, and *position behind it; -1, and *position at
 * the start, for anything else. Null separators and empty signs match nothing. flags: 0 or LX_NUM_FULLWIDTH.
 */
LX_API int32_t LXStrGetDigit(LXLocale* locale, const char* string, int32_t length, const char** position,
                             const char* thousands, const char* decimal, const char* positive, const char* negative,
                             int32_t ascii, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStrGetDigitW(LXLocale* locale, const LXWChar* string, int32_t length, const LXWChar** position,
                              LXWChar thousands, LXWChar decimal, const LXWChar* positive, const LXWChar* negative,
                              int32_t ascii, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStrGetDigitU(LXLocale* locale, const LXUChar* string, int32_t length, const LXUChar** position,
                              LXUChar thousands, LXUChar decimal, const LXUChar* positive, const LXUChar* negative,
                              uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStrGetDigitEx(LXLocale* locale, const char* string, uint32_t state, int32_t length,
                               const char** position, uint32_t* new_state, const char* thousands, const char* decimal,
                               const char* positive, const char* negative, int32_t ascii, uint32_t flags) LX_NOEXCEPT;
/* A step of the machine that reads decimal numbers: the state after an LX_DIG_ code or digit, -1 if it cannot follow.
 */
LX_API int32_t LXStrDoubleNextState(int32_t state, int32_t code, double* value, int32_t* mantissa_sign,
                                    int32_t* fraction_exponent, int32_t* exponent_sign, int32_t* exponent) LX_NOEXCEPT;
/* Values of digits and letters by their bytes, -1 for others: ASCII, EBCDIC, and EBCDIC with Katakana (code page 930).
 */
LX_API extern const int32_t LXAsciiToNum[256];
LX_API extern const int32_t LXEbcdicToNum[256];
LX_API extern const int32_t LXEbcdic930ToNum[256];

/* ---- Time ---- */
/*
 * Times written and read by a format of directives:
 *
 *   %a %A  day of the week, short and full     %p     AM or PM
 *   %b %B  month                               %S     seconds, 0 to 59
 *   %c     short date and time                 %U %W  week of the year from Sunday, Monday (writing only)
 *   %d     day of the month                    %w     day of the week, 0: Sunday
 *   %H %I  hour, of 24 and of 12               %x %X  the locale's short date, time
 *   %j     day of the year, from 000           %y %Y  year, of two and of four digits
 *   %m %M  month, minutes                      %%     a percent sign
 *
 * "#" behind the percent sign leaves leading zeros out, and makes %c and %x take the long date.
 */

/*
 * Returns the units written, with the terminator; with LX_NUM_CHARLEN characters, in which `length` and
 * `format_length` count then too. What was written is returned for every error but a bad flag (-1, LX_E_ARGUMENT):
 * LX_E_BUFFER, LX_E_NOTFOUND (a field out of range), LX_E_FORMAT. %x, %X and the date of %c are written at the start
 * of the buffer: use them first in a format. With LX_NUM_CHARLEN the plain and the Ex form write at most 512 bytes.
 * flags: LX_NUM_TEXTOPT, LX_NUM_TERMINATE, LX_NUM_CHARLEN.
 */
LX_API int32_t LXTimeToString(LXLocale* locale, const LXTime* time, char* buffer, int32_t length, const char* format,
                              int32_t format_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXTimeToStringW(LXLocale* locale, const LXTime* time, LXWChar* buffer, int32_t length,
                               const LXWChar* format, int32_t format_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXTimeToStringU(LXLocale* locale, const LXTime* time, LXUChar* buffer, int32_t length,
                               const LXUChar* format, int32_t format_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXTimeToStringEx(LXLocale* locale, const LXTime* time, char* buffer, uint32_t state, int32_t length,
                                const char* format, uint32_t format_state, int32_t format_length,
                                uint32_t flags) LX_NOEXCEPT;
/* Expands the directive at *format_position: 0, LX_E_NOTFOUND, LX_E_BUFFER or LX_E_FORMAT. The format is terminated. */
LX_API uint32_t LXStrExpandTime(LXLocale* locale, const LXTime* time, char* buffer, int32_t* position, int32_t length,
                                const char* format, int32_t* format_position, uint32_t text_option, int32_t ascii,
                                int32_t alternate, uint32_t flags) LX_NOEXCEPT;
LX_API uint32_t LXStrExpandTimeW(LXLocale* locale, const LXTime* time, LXWChar* buffer, int32_t* position,
                                 int32_t length, const LXWChar* format, int32_t* format_position, uint32_t text_option,
                                 int32_t ascii, int32_t alternate, uint32_t flags) LX_NOEXCEPT;
LX_API uint32_t LXStrExpandTimeU(LXLocale* locale, const LXTime* time, LXUChar* buffer, int32_t* position,
                                 int32_t length, const LXUChar* format, int32_t* format_position, uint32_t text_option,
                                 int32_t ascii, int32_t alternate, uint32_t flags) LX_NOEXCEPT;
LX_API uint32_t LXStrExpandTimeEx(LXLocale* locale, const LXTime* time, char* buffer, uint32_t* state,
                                  int32_t* position, int32_t length, const char* format, uint32_t* format_state,
                                  int32_t* format_position, uint32_t text_option, int32_t ascii, int32_t alternate,
                                  uint32_t flags) LX_NOEXCEPT;
/* Appends a text of the locale: 0 or LX_E_BUFFER. */
LX_API uint32_t LXStrWriteWord(LXLocale* locale, char* buffer, int32_t* position, int32_t length, uint32_t item,
                               uint32_t text_option) LX_NOEXCEPT;
LX_API uint32_t LXStrWriteWordW(LXLocale* locale, LXWChar* buffer, int32_t* position, int32_t length, uint32_t item,
                                uint32_t text_option) LX_NOEXCEPT;
LX_API uint32_t LXStrWriteWordU(LXLocale* locale, LXUChar* buffer, int32_t* position, int32_t length, uint32_t item,
                                uint32_t text_option) LX_NOEXCEPT;
LX_API uint32_t LXStrWriteWordEx(LXLocale* locale, char* buffer, uint32_t* state, int32_t* position, int32_t length,
                                 uint32_t item, uint32_t text_option) LX_NOEXCEPT;
/* Appends the low `width` digits of a value: 0, or LX_E_BUFFER, also when the output is full then. */
LX_API uint32_t LXStrWriteNumber(char* buffer, int32_t* position, int32_t length, int32_t value, int32_t width,
                                 int32_t ascii, int32_t alternate) LX_NOEXCEPT;
LX_API uint32_t LXStrWriteNumberW(LXWChar* buffer, int32_t* position, int32_t length, int32_t value, int32_t width,
                                  int32_t ascii, int32_t alternate) LX_NOEXCEPT;
LX_API uint32_t LXStrWriteNumberU(LXUChar* buffer, int32_t* position, int32_t length, int32_t value, int32_t width,
                                  int32_t ascii, int32_t alternate) LX_NOEXCEPT;
LX_API uint32_t LXStrWriteNumberEx(LXLocale* locale, char* buffer, uint32_t* state, int32_t* position, int32_t length,
                                   int32_t value, int32_t width, int32_t ascii, int32_t alternate) LX_NOEXCEPT;
/*
 * Fills the fields that the format names and returns the units (LX_NUM_CHARLEN: characters) read; text left over is no
 * error. -1 with LX_E_NOTFOUND (no match), LX_E_FORMAT or LX_E_ARGUMENT. %y counts from 1900. flags: LX_NUM_TEXTOPT,
 * LX_NUM_CHARLEN.
 */
LX_API int32_t LXStringToTime(LXLocale* locale, LXTime* time, const char* string, int32_t length, const char* format,
                              int32_t format_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStringToTimeW(LXLocale* locale, LXTime* time, const LXWChar* string, int32_t length,
                               const LXWChar* format, int32_t format_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStringToTimeU(LXLocale* locale, LXTime* time, const LXUChar* string, int32_t length,
                               const LXUChar* format, int32_t format_length, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXStringToTimeEx(LXLocale* locale, LXTime* time, const char* string, uint32_t state, int32_t length,
                                const char* format, uint32_t format_state, int32_t format_length,
                                uint32_t flags) LX_NOEXCEPT;
/* Reads one directive: 0, LX_E_NOTFOUND or LX_E_FORMAT. Positions move on success only. */
LX_API uint32_t LXStrExtractTime(LXLocale* locale, LXTime* time, const char* string, int32_t* position, int32_t length,
                                 const char* format, int32_t* format_position, int32_t format_length,
                                 int32_t* afternoon, int32_t ascii, uint32_t flags) LX_NOEXCEPT;
LX_API uint32_t LXStrExtractTimeW(LXLocale* locale, LXTime* time, const LXWChar* string, int32_t* position,
                                  int32_t length, const LXWChar* format, int32_t* format_position,
                                  int32_t format_length, int32_t* afternoon, int32_t ascii, uint32_t flags) LX_NOEXCEPT;
LX_API uint32_t LXStrExtractTimeU(LXLocale* locale, LXTime* time, const LXUChar* string, int32_t* position,
                                  int32_t length, const LXUChar* format, int32_t* format_position,
                                  int32_t format_length, int32_t* afternoon, int32_t ascii, uint32_t flags) LX_NOEXCEPT;
LX_API uint32_t LXStrExtractTimeEx(LXLocale* locale, LXTime* time, const char* string, uint32_t* state,
                                   int32_t* position, int32_t length, const char* format, uint32_t* format_state,
                                   int32_t* format_position, int32_t format_length, int32_t* afternoon, int32_t ascii,
                                   uint32_t flags) LX_NOEXCEPT;
/*
 * Reads a number of at most `max_digits`: -1 when there is none (0 at the end of the text); *error LX_E_NOTFOUND, also
 * above `max_value`.
 */
LX_API int32_t LXStrReadNumber(uint32_t* error, const char* string, int32_t* position, int32_t length,
                               int32_t max_digits, int32_t max_value, int32_t ascii) LX_NOEXCEPT;
LX_API int32_t LXStrReadNumberW(uint32_t* error, const LXWChar* string, int32_t* position, int32_t length,
                                int32_t max_digits, int32_t max_value, int32_t ascii) LX_NOEXCEPT;
LX_API int32_t LXStrReadNumberU(uint32_t* error, const LXUChar* string, int32_t* position, int32_t length,
                                int32_t max_digits, int32_t max_value, int32_t ascii) LX_NOEXCEPT;
LX_API int32_t LXStrReadNumberEx(LXLocale* locale, uint32_t* error, const char* string, uint32_t* state,
                                 int32_t* position, int32_t length, int32_t max_digits, int32_t max_value,
                                 int32_t ascii) LX_NOEXCEPT;
/* Reads the longest of `count` texts of the locale: its index, or -1 with *error LX_E_NOTFOUND. */
LX_API int32_t LXStrReadWord(LXLocale* locale, uint32_t* error, const char* string, int32_t* position, int32_t length,
                             uint32_t first_item, int32_t count, uint32_t text_option) LX_NOEXCEPT;
LX_API int32_t LXStrReadWordW(LXLocale* locale, uint32_t* error, const LXWChar* string, int32_t* position,
                              int32_t length, uint32_t first_item, int32_t count, uint32_t text_option) LX_NOEXCEPT;
LX_API int32_t LXStrReadWordU(LXLocale* locale, uint32_t* error, const LXUChar* string, int32_t* position,
                              int32_t length, uint32_t first_item, int32_t count, uint32_t text_option) LX_NOEXCEPT;
LX_API int32_t LXStrReadWordEx(LXLocale* locale, uint32_t* error, const char* string, uint32_t* state,
                               int32_t* position, int32_t length, uint32_t first_item, int32_t count,
                               uint32_t text_option) LX_NOEXCEPT;
/* Codes of the directive characters by their bytes, -1 for others: ASCII, EBCDIC, code page 930. */
LX_API extern const int32_t LXAsciiTMChar[256];
LX_API extern const int32_t LXEbcdicTMChar[256];
LX_API extern const int32_t LXEbcdic930TMChar[256];

/* ---- Streams ---- */
/*
 * Characters of the locale's code page, or UCS-2 units in machine order, read or written through a routine of the
 * caller. The stream keeps up to 80 bytes: a character that came in part, characters put back, output that was refused.
 * One thread at a time; `reserved` is 0. Functions that give 1 give 0 on failure, with the status in the locale.
 */

/* mode: LX_STREAM_READ or LX_STREAM_WRITE. The caller closes it; null with LX_E_ARGUMENT or LX_E_MEMORY. */
LX_API LXStream* LXOpenStream(LXLocale* locale, LXTransferFn routine, void* context, uint32_t mode) LX_NOEXCEPT;
/* Flushes output, ends it in the single-byte state and frees the stream: 1, or 0 with the first status met. */
LX_API int32_t LXCloseStream(LXStream* stream, LXLocale* locale, uint32_t reserved) LX_NOEXCEPT;
/* Writes what is kept: 1; 0 with LX_E_DIRECTION, LX_E_FLUSH (what was kept is gone) or LX_E_COUNT. */
LX_API int32_t LXFlushStream(LXStream* stream, LXLocale* locale, uint32_t reserved) LX_NOEXCEPT;
/*
 * The next character: a UCS-2 unit, or a packed value. 0xFFFF (U), 0xFFFFFFFF: the stream has ended (status 0), or
 * LX_E_DIRECTION, LX_E_TRANSFER, LX_E_HALF (what came is kept: call again), LX_E_COUNT (also, once, for a shift byte
 * inside a character, which comes next as it is), LX_E_MEMORY. *state (optional): the shift state of the character. No
 * more bytes are asked of the routine than the character needs.
 */
LX_API LXUChar LXReadCharU(LXStream* stream, LXLocale* locale, uint32_t reserved) LX_NOEXCEPT;
LX_API LXWChar LXReadCharW(LXStream* stream, LXLocale* locale, uint32_t reserved) LX_NOEXCEPT;
LX_API LXWChar LXReadChar(LXStream* stream, LXLocale* locale, uint32_t reserved) LX_NOEXCEPT;
LX_API LXWChar LXReadCharEx(LXStream* stream, LXLocale* locale, uint32_t* state, uint32_t reserved) LX_NOEXCEPT;
/*
 * A line: its units (LX_OPT_CHARS: characters; the size too), without its end. flags: LX_EOL_1 to LX_EOL_4 (none is
 * LX_EOL_1), LX_EOL_KEEP (the end stays), LX_OPT_TERMINATE (counted), LX_OPT_CHARS. Stops also before a character that
 * the buffer lacks room for; line ends need room in any case, and those of two characters come whole if it is more than
 * one. -1: the stream has ended; -2: failure, with the status in the locale. A failure behind the first character
 * leaves its status too, but the result is what came before it.
 */
LX_API int32_t LXReadString(LXStream* stream, LXLocale* locale, char* buffer, int32_t size, uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXReadStringU(LXStream* stream, LXLocale* locale, LXUChar* buffer, int32_t size,
                             uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXReadStringW(LXStream* stream, LXLocale* locale, LXWChar* buffer, int32_t size,
                             uint32_t flags) LX_NOEXCEPT;
LX_API int32_t LXReadStringEx(LXStream* stream, LXLocale* locale, char* buffer, int32_t size,
                              uint32_t flags) LX_NOEXCEPT;
/* Puts a character back, to be read next: 1; 0 with LX_E_DIRECTION, LX_E_ARGUMENT (null s) or LX_E_BUFFER (no room). */
LX_API int32_t LXUngetChar(LXStream* stream, LXLocale* locale, const char* s, uint32_t reserved) LX_NOEXCEPT;
LX_API int32_t LXUngetCharU(LXStream* stream, LXLocale* locale, LXUChar ch, uint32_t reserved) LX_NOEXCEPT;
LX_API int32_t LXUngetCharW(LXStream* stream, LXLocale* locale, LXWChar packed, uint32_t reserved) LX_NOEXCEPT;
LX_API int32_t LXUngetCharEx(LXStream* stream, LXLocale* locale, const char* s, uint32_t state,
                             uint32_t reserved) LX_NOEXCEPT;
/*
 * Writes a character, behind what is kept: 1; 0 with LX_E_DIRECTION, LX_E_ARGUMENT (null s), LX_E_REFUSED (kept, to be
 * flushed later) or LX_E_BUFFER (refused, and no room to keep it).
 */
LX_API int32_t LXWriteChar(LXStream* stream, LXLocale* locale, const char* s) LX_NOEXCEPT;
LX_API int32_t LXWriteCharU(LXStream* stream, LXLocale* locale, LXUChar ch) LX_NOEXCEPT;
LX_API int32_t LXWriteCharW(LXStream* stream, LXLocale* locale, LXWChar packed) LX_NOEXCEPT;
LX_API int32_t LXWriteCharEx(LXStream* stream, LXLocale* locale, const char* s, uint32_t state) LX_NOEXCEPT;

/* ---- Message catalogs ---- */
/*
 * Messages by set and number, in a file in one locale's code page. One thread at a time uses a catalog; its locale must
 * live as long.
 */

/*
 * Opens the first catalog found: `directory`, then the environment's LX_NLSPATH (27 bytes at most), then the name
 * itself, each a list of templates between semicolons: %N the name, %L language_TERRITORY, %l, %t, %%. What names a
 * directory is searched for the name. If there is none, the same with the default locale's language and territory,
 * whose catalog then comes before any default text (LX_CAT_ONEPASS: not). %L, %l and %t are the abbreviations in
 * capitals. flags: LX_CAT_LOAD reads all of it at once (and searches once); LX_CAT_ONEPASS searches once; 0. Null with
 * LX_E_ARGUMENT, LX_E_MEMORY, LX_E_CATALOG or the status of opening. The caller closes it.
 */
LX_API LXCatalog* LXOpenCatalog(LXLocale* locale, const char* directory, const char* name, uint32_t flags) LX_NOEXCEPT;
LX_API LXCatalog* LXOpenCatalogW(LXLocale* locale, const LXWChar* directory, const LXWChar* name,
                                 uint32_t flags) LX_NOEXCEPT;
LX_API LXCatalog* LXOpenCatalogU(LXLocale* locale, const LXUChar* directory, const LXUChar* name,
                                 uint32_t flags) LX_NOEXCEPT;
/*
 * Writes a message, converted and terminated, cut without a status where room ends; if there is none, the default text
 * (optional; not for a null catalog). Returns 0,
 * LX_E_NOCATALOG, LX_E_ARGUMENT, LX_E_MESSAGE (without a default), or LX_E_CATALOG and LX_E_MEMORY (with one too).
 * flags: LX_OPT_TERMINATE (always so), LX_OPT_CHARS (out_size counts characters).
 */
LX_API uint32_t LXGetMessage(LXCatalog* catalog, uint32_t set, int32_t message, char* out, int32_t out_size,
                             const char* default_text, uint32_t flags) LX_NOEXCEPT;
LX_API uint32_t LXGetMessageW(LXCatalog* catalog, uint32_t set, int32_t message, LXWChar* out, int32_t out_size,
                              const LXWChar* default_text, uint32_t flags) LX_NOEXCEPT;
LX_API uint32_t LXGetMessageU(LXCatalog* catalog, uint32_t set, int32_t message, LXUChar* out, int32_t out_size,
                              const LXUChar* default_text, uint32_t flags) LX_NOEXCEPT;
/* 0, or LX_E_NOCATALOG for null. */
LX_API uint32_t LXCloseCatalog(LXCatalog* catalog, uint32_t reserved) LX_NOEXCEPT;
/* Takes an open file, all of it with `loaded`; the file is the catalog's then. Null with *rc LX_E_CATALOG, LX_E_MEMORY.
 */
LX_API LXCatalog* LXMcLoadCat(LXLocale* locale, LXFile* file, int32_t loaded, uint32_t* rc) LX_NOEXCEPT;
/* Loads a set from a loaded catalog's file; it lives as long as the catalog. record: seven fields in machine order. */
LX_API uint32_t LXMcLoadSet(LXCatalog* catalog, const uint32_t* record, LXCatSet* set) LX_NOEXCEPT;
/* The set of a number, on disk read into *scratch. Null: none (*rc 0), LX_E_CATALOG or LX_E_MEMORY. */
LX_API LXCatSet* MCGetSet(LXCatalog* catalog, uint32_t set, LXCatSet* scratch, uint32_t* rc) LX_NOEXCEPT;
/* The text of a message; from disk terminated, to be freed with LXMcFree. Null as above. */
LX_API char* MCGetMsg(LXCatalog* catalog, LXCatSet* set, int32_t message, uint32_t* length, uint32_t* rc) LX_NOEXCEPT;
/* Of this machine: 1 big-endian, 2 little-endian. */
LX_API int32_t LXMcGetByteOrder(void) LX_NOEXCEPT;
/* Memory by the library's callbacks. LXMcRealloc copies and leaves the old block alone, except on failure: freed then.
 */
LX_API void* LXMcMalloc(size_t size) LX_NOEXCEPT;
LX_API int LXMcFree(void* block) LX_NOEXCEPT;
LX_API void* LXMcSetZero(void* block, size_t size) LX_NOEXCEPT;
LX_API void* LXMcMemcpy(void* dst, const void* src, size_t size) LX_NOEXCEPT;
LX_API void* LXMcRealloc(void* block, size_t new_size, size_t old_size) LX_NOEXCEPT;

/* ---- Extensions ---- */

LX_API const char* LXVersion(void) LX_NOEXCEPT; /* "1.0.0" */
/* The running library's object manager; null before LXInit and after the last LXTerm. */
LX_API LXObjMgr* LXGetObjManager(void) LX_NOEXCEPT;
/* The locale's object of a type; null for the binary sort and for a bad type. */
LX_API LXObjEntry* LXGetLocaleObject(LXLocale* locale, uint8_t type) LX_NOEXCEPT;
LX_API uint16_t LXGetObjId(const LXObjEntry* entry) LX_NOEXCEPT;
LX_API uint8_t LXGetObjType(const LXObjEntry* entry) LX_NOEXCEPT;
LX_API const char* LXGetObjName(const LXObjEntry* entry) LX_NOEXCEPT;
/* Calls back with every alias, in upper case, and its code page, in the order of alias.txt, until the callback
   returns 0. Returns 0. The alias stays valid until the callback returns, the code page as long as the manager. */
typedef int32_t (*LXEnumAliasFn)(void* context, const char* alias, const char* code_page);
LX_API int32_t LXEnumAliases(LXObjMgr* manager, LXEnumAliasFn callback, void* context) LX_NOEXCEPT;
/* Calls back with every native name that LXMapNativeLocale knows and the locale it means, until the callback returns 0.
   Returns 0. */
typedef int32_t (*LXEnumNativeFn)(void* context, const char* native_name, const char* locale_name);
LX_API int32_t LXEnumNativeNames(LXEnumNativeFn callback, void* context) LX_NOEXCEPT;

typedef struct LXCodePageInfo {
  uint16_t id;
  uint8_t max_length;      /* bytes of the longest character, without shift bytes */
  uint8_t substitution;    /* byte written for a character that the page lacks */
  uint8_t line_bytes[4];   /* line feed, carriage return, and two further line ends */
  uint8_t ascii_family;    /* 1: letters and digits are the ASCII bytes; 0: EBCDIC */
  uint8_t shift_sensitive; /* 1: double-byte runs stand between shift bytes */
  uint8_t enter_byte;      /* begins a double-byte run; 0 unless shift-sensitive */
  uint8_t leave_byte;      /* ends it */
} LXCodePageInfo;
/* 0, or LX_E_ARGUMENT when the entry is not a loaded code page. */
LX_API uint32_t LXGetCodePageInfo(const LXObjEntry* code_page, LXCodePageInfo* info) LX_NOEXCEPT;

/* How a conversion handle treats what has no exact counterpart. Set before the first LXConvertBuffer. */
#define LX_CONV_LINES_LF 0x01u   /* next line, line feed and carriage return + line feed all become a line feed */
#define LX_CONV_LINES_NEL 0x02u  /* ... a next line (X'15' in EBCDIC, X'85' in Latin1) */
#define LX_CONV_LINES_CRLF 0x03u /* ... carriage return + line feed */
#define LX_CONV_STRICT                                                                                          \
  0x10u                       /* source sequences that are not well-formed become one U+FFFD and end before the \
                                 first byte that does not belong to them; repeated shift bytes are not text */
#define LX_CONV_DISCARD 0x20u /* characters that the target lacks, and malformed ones, are left out */

#define LX_PROBLEM_SUBSTITUTED 1u /* the target lacks the character */
#define LX_PROBLEM_MALFORMED 2u   /* the source bytes are no character of the source page */
#define LX_PROBLEM_SHIFT 3u       /* a shift byte that changes nothing, or a double-byte run left open at the end */
#define LX_PROBLEM_CUT 4u         /* the input ended inside a character */

typedef struct LXConversionProblem {
  uint64_t offset;  /* of the character's first byte, counted from the first byte given to the handle */
  uint32_t kind;    /* LX_PROBLEM_ */
  uint32_t unicode; /* the character, where there is one; else 0xFFFD */
  uint8_t length;   /* of the source character; 0: the end of the text, where a run was left open */
  uint8_t bytes[5]; /* the source character */
} LXConversionProblem;
typedef void (*LXProblemFn)(void* context, const LXConversionProblem* problem);

typedef struct LXConversionCounts {
  uint64_t bytes_in;    /* consumed, held bytes included */
  uint64_t bytes_out;   /* delivered, pending bytes not included */
  uint64_t substituted; /* problems by kind */
  uint64_t malformed;
  uint64_t shifts;
  uint64_t cut;
} LXConversionCounts;

/* LX_CONV_ bits, and an optional callback for each problem as it is met: 0, or LX_E_ARGUMENT for other bits, a null
   handle, or a handle already in use. The callback must not use the handle. */
LX_API uint32_t LXSetConversionOptions(LXConversion* handle, uint32_t options, LXProblemFn callback,
                                       void* context) LX_NOEXCEPT;
/*
 * Ends a text: writes what is pending, turns an incomplete last character into one malformed character (problem
 * "cut"), and returns a mixed host target to the single-byte state. 0, or LX_E_FULL: call again with more room.
 * Afterwards the handle takes another text; its counts and options go on.
 */
LX_API uint32_t LXFinishConversion(LXConversion* handle, char** out, int32_t* out_room) LX_NOEXCEPT;
LX_API uint32_t LXGetConversionCounts(const LXConversion* handle, LXConversionCounts* counts) LX_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif
