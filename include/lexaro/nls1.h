/* SPDX-License-Identifier: Apache-2.0 */
/*
 * The interface by number: languages, territories and code pages are named by their ids, and the library keeps a locale
 * for the process and one for each thread. Usable from C99 and C++17.
 *
 * The library is initialised by the first call, with the data directory of NLS1_LOCALEDIR, else as LXInit finds it; the
 * user's locale becomes the process locale. When that failed, every function answers so, without another try.
 *
 * language_territory: the language id in the low 16 bits, the territory id in the high ones; 0 in either half: none
 * given.
 */
#ifndef LEXARO_NLS1_H
#define LEXARO_NLS1_H

#include <lexaro/host.h>

#ifdef __cplusplus
extern "C" {
#endif

/* ---- State ---- */

/* 0 before the initialisation, 1 after it, -1 when it failed. Read-only for callers. */
extern LX_API int32_t qlginflg;
/* Storage of the process (the result of the initialisation, uint32_t) and of each thread (its locale, LXLocale*). */
extern LX_API HSV1_Descriptor qlgnlprc_HSV1__P;
extern LX_API HSV1_Descriptor qlgnlthr_HSV1__T;

/* What the host services call for these blocks; each returns the block. */
LX_API void* InitProcess(void* block) LX_NOEXCEPT;
LX_API void* TermProcess(void* block) LX_NOEXCEPT; /* ends the use of the library; later calls fail */
LX_API void* InitThread(void* block) LX_NOEXCEPT;
LX_API void* TermThread(void* block) LX_NOEXCEPT;

LX_API uint32_t NLS1_PrivateFunction_GetProcessLocale(void) LX_NOEXCEPT; /* makes sure of the process block: 0 */
LX_API LXLocale* NLS1_PrivateFunction_GetThreadLocale(void) LX_NOEXCEPT; /* the calling thread's locale, or null */

/* ---- Locales ---- */

#define NLS1_THREAD 0x40000000u  /* NLS1_SetLocale: the calling thread's locale */
#define NLS1_PROCESS 0x80000000u /* the process locale; also when neither is given */

/*
 * A new locale; what is not given comes from the language's defaults. options as LXGetLocale. Release it with
 * LXReleaseLocale. Null with rc 1 (not initialised), LX_E_LANGUAGE, LX_E_TERRITORY, LX_E_CODEPAGE or a status of
 * LXGetLocale.
 */
LX_API LXLocale* NLS1_GetLocale(int32_t language_territory, uint16_t codepage_id, uint32_t options,
                                uint32_t* rc) LX_NOEXCEPT;
/* Sets the locale of the thread, of the process, or both. 0, LX_E_MANAGER (not initialised) or as NLS1_GetLocale. */
LX_API uint32_t NLS1_SetLocale(int32_t language_territory, uint16_t codepage_id, uint32_t options) LX_NOEXCEPT;

/* As the LX functions of these names (a null locale is the process locale); -1 or 0 when not initialised. */
LX_API int32_t NLS1_GetLocaleNumInfo(LXLocale* locale, uint32_t item, uint32_t source) LX_NOEXCEPT;
LX_API int32_t NLS1_SetLocaleNumInfo(LXLocale* locale, uint32_t item, int32_t value) LX_NOEXCEPT;
/* In a code page of choice, with shift bytes (0: the locale's, without); LX_E_CODEPAGE: there is no such page. */
LX_API int32_t NLS1_GetLocaleTextInfo(LXLocale* locale, uint32_t item, char* buffer, int32_t size, uint16_t codepage_id,
                                      uint32_t options) LX_NOEXCEPT;
LX_API int32_t NLS1_SetLocaleTextInfo(LXLocale* locale, uint32_t item, const char* text, int32_t length,
                                      uint16_t codepage_id, uint32_t options) LX_NOEXCEPT;

/* ---- The system's locales (set-up time only: they use setlocale) ---- */

/* Makes the locale of that system name the process locale and releases the calling thread's. 0 or a status. */
LX_API uint32_t NLS1_SetLocaleFromNative(const char* native_name, uint32_t options) LX_NOEXCEPT;
/* Switches a category (LC_ALL, ...) of the system's locale to the one that fits. 0, LX_E_MANAGER, LX_E_NATIVE, or a
   status of NLS1_GetLocale. */
LX_API uint32_t NLS1_SetNativeLocale(int32_t language_territory, uint16_t codepage_id, int category,
                                     uint32_t options) LX_NOEXCEPT;
LX_API uint32_t NLS1_SetNativeFromLocale(LXLocale* locale, int category, uint32_t options) LX_NOEXCEPT;
/* As LXConvertNativeLocale; rc 1: not initialised. */
LX_API LXLocale* NLS1_ConvertNativeLocale(const char* native_name, uint32_t options, uint32_t* rc) LX_NOEXCEPT;

/* ---- Ids and names ---- */

/* Ids by name, whatever its case; the code page may be an alias. 0 with rc LX_E_NOTFOUND, or LX_E_MANAGER when not
   initialised; the binary sort is 0 with rc 0. */
LX_API uint32_t NLS1_GetCodepageId(const char* name, uint32_t* rc) LX_NOEXCEPT;
LX_API uint32_t NLS1_GetLanguageId(const char* name, uint32_t* rc) LX_NOEXCEPT;
LX_API uint32_t NLS1_GetTerritoryId(const char* name, uint32_t* rc) LX_NOEXCEPT;
LX_API uint32_t NLS1_GetSortId(const char* name, uint32_t* rc) LX_NOEXCEPT;
/* The name with its terminator. 0, LX_E_NOTFOUND, LX_E_BUFFER or LX_E_MANAGER; sort id 0 gives 0 and writes nothing. */
LX_API uint32_t NLS1_GetObjectName(uint16_t id, char* buffer, int32_t size, uint8_t type) LX_NOEXCEPT;
LX_API uint32_t NLS1_GetLanguageName(int32_t language_territory, char* buffer, int32_t size) LX_NOEXCEPT;
LX_API uint32_t NLS1_GetTerritoryName(int32_t language_territory, char* buffer, int32_t size) LX_NOEXCEPT;
LX_API uint32_t NLS1_GetCodepageName(uint16_t id, char* buffer, int32_t size) LX_NOEXCEPT;
LX_API uint32_t NLS1_GetSortName(uint16_t id, char* buffer, int32_t size) LX_NOEXCEPT;

/* ---- Translation of host fields ---- */

#define NLS1_XLT_PAD 0x400000u    /* fill the output with the target's blank */
#define NLS1_XLT_BLANKS 0x800000u /* source blanks that do not fit are no error */

/*
 * Translates a field from one code page into another; LX_CP_UCS2 stands for UCS-2 in machine order, aligned as LXUChar.
 * flags: LX_OPT_TERMINATE, LX_OPT_CHARS (sizes and results count characters; the buffer must have the bytes that they
 * need), NLS1_XLT_PAD, NLS1_XLT_BLANKS. A negative length means up to the terminator. The text of a shift-sensitive
 * page begins and ends in the single-byte state. Returns the bytes (characters) written, the terminator included;
 * *consumed receives the input bytes that were used (with LX_OPT_CHARS: the characters written). -1 with *error
 * LX_E_ARGUMENT, LX_E_CODEPAGE, LX_E_BUFFER (no room for one unit), LX_E_MANAGER (not initialised) or a status of the
 * lookup. *error LX_E_BUFFER beside a count: the rest did not fit.
 * UCS-2 to UCS-2 is copied whatever out_size says; UCS-2 to a single-byte page uses at most half of the output.
 */
LX_API int32_t NLS1_TranslateString(uint16_t target_code_page, void* out, int32_t out_size, uint16_t source_code_page,
                                    const void* in, int32_t in_length, int32_t* consumed, uint32_t flags,
                                    uint32_t* error) LX_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif
