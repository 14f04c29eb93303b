/* SPDX-License-Identifier: Apache-2.0 */
/*
 * The host services that the library calls. Each has a POSIX implementation built in as a weak symbol: a program that
 * defines a function of the same name replaces it. Usable from C99 and C++17.
 */
#ifndef LEXARO_HOST_H
#define LEXARO_HOST_H

#include <lexaro/lexaro.h>

#ifdef __cplusplus
extern "C" {
#endif

/* ---- Trace ---- */

#define TRC1_LEVEL_RESULT 0x04u
#define TRC1_LEVEL_PARAMETER 0x08u
#define TRC1_LEVEL_DETAIL 0x10u
#define TRC1_LEVEL_FLOW 0x40u /* entry and exit of exported functions */
#define TRC1_LEVEL_ERROR 0x80u
#define TRC1_LEVEL_INIT 0x100u /* start and end of processes and threads */

#define TRC1_ENTRY 0u       /* kinds of TRC1_Event: entry, */
#define TRC1_EXIT_RESULT 1u /* exit with a result, */
#define TRC1_EXIT 2u        /* exit without one */

/* One per module of the library. `flags` is the union of the levels switched on; TRC1_Sync keeps it current. */
typedef struct TRC1_Unit {
  const char* component; /* "Lexaro" */
  const char* module;
  uint32_t flags;
} TRC1_Unit;

/*
 * The default services trace nothing unless the variable TRC1_FLAGS holds a non-zero hexadecimal word of levels when
 * the first unit is synchronised; they append to the file named by TRC1_FILE, else write to standard error.
 */
LX_API void TRC1_Sync(TRC1_Unit* unit) LX_NOEXCEPT; /* any thread, at any time: stores flags atomically */
LX_API void TRC1_Event(TRC1_Unit* unit, int32_t line, uint32_t kind, const char* function, intptr_t result) LX_NOEXCEPT;
LX_API void TRC1_Printf(TRC1_Unit* unit, int32_t line, const char* format, ...) LX_NOEXCEPT LX_PRINTF(3, 4);
LX_API void TRC1_Dump(TRC1_Unit* unit, int32_t line, const char* label, const void* data, size_t length) LX_NOEXCEPT;

/* ---- Locks, environment, process and thread storage ---- */

typedef struct HSV1_Lock {
  void* opaque[8];
} HSV1_Lock;

/* Non-recursive. Each returns 0, or non-zero on failure. */
LX_API int32_t HSV1_InitializeLock(HSV1_Lock* lock) LX_NOEXCEPT;
LX_API int32_t HSV1_GetLock(HSV1_Lock* lock) LX_NOEXCEPT;
LX_API int32_t HSV1_ReleaseLock(HSV1_Lock* lock) LX_NOEXCEPT;
LX_API int32_t HSV1_DestroyLock(HSV1_Lock* lock) LX_NOEXCEPT;

/* The value of an environment variable, or null. `reserved` is 0. */
LX_API const char* HSV1_GetEnv(const char* name, uint32_t reserved) LX_NOEXCEPT;

/* A block of storage that a process or thread gets once. */
typedef struct HSV1_Descriptor {
  size_t size;                /* of the block, which starts zero-filled */
  void* (*init)(void* block); /* runs once, before the block is handed out; may be null */
  void* (*term)(void* block); /* runs when the thread ends; may be null. Process blocks live as long as the process. */
  void* host;                 /* the host's own; starts null */
} HSV1_Descriptor;

/* The block of this process or of the calling thread, made and initialised on first use; null: no memory.
   `source` names the caller for traces. */
LX_API void* HSV1_ResolveProcess(HSV1_Descriptor* descriptor, const char* source) LX_NOEXCEPT;
LX_API void* HSV1_ResolveThread(HSV1_Descriptor* descriptor, const char* source) LX_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif
