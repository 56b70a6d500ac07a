/*
 * Base services library: memory pools, settings, notifications, the object
 * registry, logging, threads and locks, lists, file and string helpers, and
 * the Lua support used by script bindings.
 *
 * Every call accepts null handles and answers with its failure value
 * (0, null or -1) instead of crashing.  Unless a call says otherwise, texts
 * handed in are copied and texts handed out stay owned by the library.
 * printf-style formats also accept the 64-bit size prefix "I64" ("%I64d"),
 * read as "ll".
 */
#ifndef BLBASE_H
#define BLBASE_H

#include <stdarg.h>
#include <stddef.h>
#include <stdint.h>

#if defined(BL_BUILDING_LIBRARY)
#define BL_API __attribute__((visibility("default")))
#else
#define BL_API
#endif

#if defined(__GNUC__)
#define BL_PRINTF(fmt, args) __attribute__((format(printf, fmt, args)))
#else
#define BL_PRINTF(fmt, args)
#endif

#ifdef __cplusplus
extern "C" {
#endif

/* ---- Start-up --------------------------------------------------------- */

/* Nested start-ups are counted; the last finalize releases every service. */
BL_API int  BLCORE_Initialize(void);
BL_API void BLCORE_Finalize(void);
BL_API int  BLCORE_IsInitialized(void);

/* Records a component's version (again: replaces it); BLVERSION_String
 * writes "name a.b.c.d" cut to the buffer, and answers 0 for an unknown name. */
BL_API int  BLVERSION_Register(const char *name, int major, int minor, int release, int build);
BL_API int  BLVERSION_String(const char *name, char *buffer, int size);

/* ---- Memory pools ----------------------------------------------------- */

typedef struct BLMemPool *BLMEM;

/* Pool flags. */
#define BLMEM_FLAG_THREADSAFE 0x8 /* the pool may be used from several threads */

/* Larger block requests fail (null) instead of exhausting the machine. */
#define BLMEM_MAX_BLOCK_SIZE ((size_t)1 << 32)

/* A pool owns every block taken from it and frees them all when disposed.
 * Blocks are zero-filled, each is its own heap allocation.  Only the pool a
 * block came from can delete it (Delete answers 0 for any other pointer).
 * A pool is used by one thread at a time unless made with the thread-safe
 * flag.  initial_size is only a hint: blocks are allocated one by one. */
BL_API BLMEM   BLMEM_CreateMemDescrEx(const char *name, size_t initial_size, int flags);
BL_API int     BLMEM_DisposeMemDescr(BLMEM pool);
BL_API void   *BLMEM_New(BLMEM pool, size_t size);
BL_API int     BLMEM_Delete(BLMEM pool, void *block);
/* Frees every block but keeps the pool. */
BL_API int     BLMEM_ResetMemSpace(BLMEM pool);
/* Returns spare memory kept for reuse to the system. */
BL_API int     BLMEM_FreeUnusedMemory(BLMEM pool);
/* Bytes held by the pool's live blocks; -1 for a null pool. */
BL_API int64_t BLMEM_SizeInMemory(BLMEM pool);
BL_API const char *BLMEM_Name(BLMEM pool);
/* memmove with a null check; returns dst. */
BL_API void   *BLMEM_OverlapMemCopy(void *dst, const void *src, size_t size);

/* ---- Settings --------------------------------------------------------- */

/* A null BLSETTINGS is the process-wide registry.  Keys are dotted names,
 * compared without regard to case; every key text is printf-style.  A key
 * holds a value (set by the user) and a default (registered by the program);
 * reads prefer the value.  Keys may not contain '[', ']', '=' or control
 * characters, and a dotted part may not start or end with a space.
 *
 * Ini files: a key's first dotted part is its section, the rest its name, so
 * "libvelm.draw.hovertime=500" is written as "draw.hovertime=500" under
 * "[libvelm]"; keys without a dot come first, before any section.  Lines
 * starting with ';' or '#' are comments.  In values a backslash, the line
 * breaks and a leading '{' are written as \\, \n, \r and \{; secret values
 * are written obscured as "{obscured}" and hex digits.  Only values are
 * written, never defaults. */
typedef struct BLSettings *BLSETTINGS;

/* Larger ini files are refused rather than read. */
#define BLSETTINGS_MAX_FILE_SIZE (16 * 1024 * 1024)

BL_API BLSETTINGS BLSETTINGS_Create(void);
BL_API int        BLSETTINGS_Destroy(BLSETTINGS settings);
/* Puts a settings object in front of the process-wide registry in the lookup
 * chain of every read through the null handle (the last inserted first;
 * inserting again brings it to the front); Remove takes it out again.  Both
 * count as a change of the process-wide registry. */
BL_API int        BLSETTINGS_Insert(BLSETTINGS settings);
BL_API int        BLSETTINGS_Remove(BLSETTINGS settings);
/* Backs a settings object with a file ("ini" is the only kind).  Values in
 * the file are loaded at once (over values already held); every later
 * change of a value rewrites the file through a temporary file and a rename,
 * so the file is never left cut.  Reading never rewrites the file.  Lines
 * that cannot be read are skipped and reported through the log; the next
 * write then keeps the old file as path + ".bak".  A missing file is created
 * at the first change.  Answers 0 for an unreadable or oversized file. */
BL_API int        BLSETTINGS_SetConfigFileEx(BLSETTINGS settings, const char *path, const char *kind);

/* "key=value": sets a value.  Returns 1 when the value changed, 0 when it
 * already was that value or the text is malformed. */
BL_API int BLSETTINGS_ChangeEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);
/* The same, kept obscured in files. */
BL_API int BLSETTINGS_ChangeSecretEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);
/* "key=value": sets the default; a value the user set is never overridden.
 * Returns 1, or 0 for a malformed text. */
BL_API int BLSETTINGS_SetDefaultEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);
/* 1 when the key has a value or a default in this object (not the chain). */
BL_API int BLSETTINGS_ExistsEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);
/* Removes a key's value (its default stays); 0 when it had none. */
BL_API int BLSETTINGS_DeleteEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);

/* Reads "key" or "key=[default]": the value, else the registered default,
 * else the default given in brackets (a key is missing only when it has
 * neither value nor registered default), else 0 / false / "".  Through the
 * null handle the inserted objects are asked before the process-wide
 * registry, for values and then for defaults.  A text that does not read as
 * the wanted type gives way to the next one.  Numbers are read without
 * regard to the locale ("0x" hex words too); Bool accepts 1/0, true/false,
 * yes/no and on/off. */
BL_API int         BLSETTINGS_GetIntEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);
BL_API double      BLSETTINGS_GetFloatEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);
BL_API int         BLSETTINGS_GetBoolEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);
/* Returned texts are interned: they stay valid until BLCORE_Finalize.  A
 * secret value reads in its obscured form here and plain through
 * GetSecretStringEx. */
BL_API const char *BLSETTINGS_GetStringEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);
BL_API const char *BLSETTINGS_GetSecretStringEx(BLSETTINGS settings, const char *format, ...) BL_PRINTF(2, 3);
/* Grows on every change; for the null handle, on every change of the
 * process-wide registry or of an inserted object. */
BL_API uint64_t    BLSETTINGS_GetTimeStampEx(BLSETTINGS settings);

/* ---- Notifications ---------------------------------------------------- */

typedef struct BLNotifyDispatcher *BLNOTIFY; /* null: the global dispatcher */

typedef struct BLNotifyEvent {
    uint32_t event;     /* event code */
    void    *data1;     /* sender's first data word */
    void    *data2;     /* sender's second data word */
    BLNOTIFY dispatcher;
    void    *owner;     /* the dispatcher's owner (null for the global one) */
} BLNotifyEvent;

/* A handler answers 1 to agree, anything else to refuse. */
typedef int (*BLNOTIFY_Handler)(const BLNotifyEvent *event, void *user);

BL_API BLNOTIFY BLNOTIFY_CreateDispatcher(void *owner);
BL_API int      BLNOTIFY_DestroyDispatcher(BLNOTIFY dispatcher);
BL_API int      BLNOTIFY_AddHandler(BLNOTIFY dispatcher, BLNOTIFY_Handler handler, void *user);
BL_API int      BLNOTIFY_DelHandler(BLNOTIFY dispatcher, BLNOTIFY_Handler handler, void *user);
/* Default handlers see the events of every dispatcher, the global one included. */
BL_API int      BLNOTIFY_AddDefaultHandler(BLNOTIFY_Handler handler, void *user);
BL_API int      BLNOTIFY_DelDefaultHandler(BLNOTIFY_Handler handler, void *user);
/* Calls the dispatcher's handlers, then the default handlers, synchronously
 * in the calling thread, each in the order added.  Every handler sees the
 * event; returns 1 when no handler answered otherwise, else the first answer
 * that was not 1 (0 for a destroyed dispatcher).  Handlers may add and remove
 * handlers or destroy the dispatcher meanwhile: a handler removed before its
 * turn is skipped, one added is called from the next event on.  A pair of
 * handler and user value is registered once.  sender and flags are reserved
 * (pass 0). */
BL_API int      BLNOTIFY_SendEvent(BLNOTIFY dispatcher, void *sender, int flags,
                                   uint32_t event, void *data1, void *data2);

/* ---- Object registry -------------------------------------------------- */

typedef int (*BLOBJECT_Disposer)(void *object);

/* An object is registered once (0 the second time); kind is informative.
 * The disposer (may be null) is called without any lock held. */
BL_API int RegisterObject(void *object, int kind, BLOBJECT_Disposer disposer);
BL_API int UnRegisterObject(void *object);
BL_API int IsRegisteredObject(void *object);
/* Objects still registered at the last BLCORE_Finalize are disposed then. */
BL_API int CountRegisteredObjects(void);

/* ---- Logging ---------------------------------------------------------- */

/* Levels: messages at or below the threshold are kept.  -1 marks messages
 * that matter (errors, size reports); 0 is ordinary information. */
#define BLDEBUG_LEVEL_NONE  (-2)
#define BLDEBUG_LEVEL_ERROR (-1)
#define BLDEBUG_LEVEL_INFO  0
#define BLDEBUG_LEVEL_ALL   10

typedef void (*BLDEBUG_Sink)(int kind, int level, const char *message, void *user);
#define BLDEBUG_KIND_LOG      0
#define BLDEBUG_KIND_WARNING  1
#define BLDEBUG_KIND_ERROR    2
#define BLDEBUG_KIND_TERMINAL 3

BL_API void BLDEBUG_Log(int level, const char *format, ...) BL_PRINTF(2, 3);
BL_API void BLDEBUG_Warning(int code, const char *format, ...) BL_PRINTF(2, 3);
BL_API void BLDEBUG_Error(int code, const char *format, ...) BL_PRINTF(2, 3);
BL_API void BLDEBUG_TerminalError(int code, const char *format, ...) BL_PRINTF(2, 3);
/* Nothing is printed until a destination is chosen.  Level threshold
 * (default BLDEBUG_LEVEL_INFO; warnings and errors have level -1), a file
 * opened for appending ("-" for standard error, null to stop), and a
 * callback sink (null to stop) called in the logging thread.  One line per
 * message; a trailing line break of the message is dropped. */
BL_API void BLDEBUG_SetLevel(int level);
BL_API int  BLDEBUG_GetLevel(void);
BL_API int  BLDEBUG_SetLogFile(const char *path);
BL_API void BLDEBUG_SetSink(BLDEBUG_Sink sink, void *user);

/* ---- Threads and locks ------------------------------------------------ */

typedef struct BLThread *BLTHREAD;
typedef void *(*BLTHREAD_Body)(void *arguments);

/* Starts body(arguments) on a new thread; flags are reserved (pass 0). */
BL_API BLTHREAD BLTHREAD_AddThread(BLTHREAD_Body body, void *arguments, int flags);
/* wait = 1 joins the thread; 0 lets it finish alone (nothing waits for it,
 * so it must not touch anything its caller frees next).  A worker ending its
 * own handle is never joined.  Frees the handle. */
BL_API int      BLTHREAD_EndThread(BLTHREAD thread, int wait);
/* Called by a worker just before it returns; marks the end in the log. */
BL_API void     ThreadChildNotifyExit(int code);

/* Locks are recursive: the owner may lock again and unlocks as often.  Only
 * the owner can unlock (others get 0); a held lock is not destroyed (0). */
typedef struct BLMutex *BLMUTEX;
BL_API BLMUTEX MutexInit(void);
BL_API int     MutexLock(BLMUTEX mutex);
BL_API int     MutexTryLock(BLMUTEX mutex);
BL_API int     MutexUnlock(BLMUTEX mutex);
BL_API int     MutexDestroy(BLMUTEX mutex);

/* ---- Lists ------------------------------------------------------------ */

/* An ordered list of non-null pointers, used by one thread at a time.
 * DLList_Next answers null at the end; an iterator survives changes of its
 * list (it walks by position). */
typedef struct DLList DLList;
typedef struct DLListIterator { const DLList *list; size_t index; } DLListIterator;

BL_API DLList *DLList_Create(void);
BL_API int     DLList_Destroy(DLList *list);
BL_API int     DLList_Append(DLList *list, void *item);
BL_API int     DLList_Insert(DLList *list, size_t index, void *item);
/* Removes the first occurrence. */
BL_API int     DLList_Remove(DLList *list, void *item);
BL_API size_t  DLList_Count(const DLList *list);
BL_API void   *DLList_Get(const DLList *list, size_t index);
BL_API int     DLList_StartIterator(const DLList *list, DLListIterator *it);
BL_API void   *DLList_Next(DLListIterator *it);

/* ---- Files, time, strings, display ------------------------------------ */

/* Absolute, normalised path; cut to the buffer.  Returns buffer or null. */
BL_API char   *BLIO_ExtractCanonicalFileName(const char *name, char *buffer, int size);
BL_API int     BLIO_FileExists(const char *name);
/* 1 ordinary local file, 2 directory, 3 other local object, 0 missing or not a path. */
BL_API int     BLIO_GetHFileKind(const char *name);
/* kind 0 creation (or status change), 1 last access, 2 last modification:
 * nanoseconds since the epoch; 0 when the file is missing. */
BL_API uint64_t BLUTIL_GetFileTime(const char *name, int kind);

/* Times and stamps are nanoseconds since the epoch (UTC): the current time,
 * and a time as a stamp.  Stamps keep the unit of times, so a stamp made from
 * a file time equals that file time read again while the file is unchanged. */
BL_API uint64_t BLgetgmtime(void);
BL_API uint64_t BLtimeToBLtimeStamp(uint64_t time);

/* Text forms "[a,b,c]" and "[[a,b],[c,d]]" (row by row), numbers in their
 * shortest exact form whatever the locale.  Return the text's length, or -1
 * when the buffer is too small (it then holds ""). */
BL_API int BLSTRING_SetDoubleVectorToString(const double *values, int count, char *buffer, int size);
BL_API int BLSTRING_SetDoubleMatrixToString(const double *values, int rows, int columns, char *buffer, int size);
/* Parse the same forms (spaces allowed); return the number of values read,
 * -1 on malformed text, ragged rows or more values than capacity.  With null
 * values they only count. */
BL_API int BLSTRING_GetDoubleVectorFromString(const char *text, double *values, int capacity);
BL_API int BLSTRING_GetDoubleMatrixFromString(const char *text, double *values, int capacity, int *rows, int *columns);

BL_API int  BLUTILS_GetDisplayWidth(void);
BL_API int  BLUTILS_GetDisplayHeight(void);
/* Hosts that know the screen size tell it here (no screen: 1920 x 1080). */
BL_API void BLUTILS_SetDisplaySize(int width, int height);
BL_API void BLUTILS_sleep_msec(int milliseconds);

#ifdef __cplusplus
}
#endif

#endif /* BLBASE_H */
