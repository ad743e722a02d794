/* nlssm: the host interfaces.
 *
 * Every host object the module talks to is a flat record of 64-bit words;
 * "slot N" is word N and holds a function pointer whose first argument is
 * the object itself. The module reads these records through the slot
 * numbers below and never through any other knowledge of the host.
 * Usable from C99 and C++.
 */
#ifndef NLSSM_HOST_H
#define NLSSM_HOST_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/* Reads slot N of a host object as a function of type T. */
#define NLSSM_HOST_SLOT(object, n) (((void *const *)(object))[n])

/* ---- Pool creation ---------------------------------------------------------
 * The host object handed to qvnlssm and the exported service object kept in
 * Exported_QVHandle both create pools through slot 6. */
#define NLSHOST_SLOT_CREATE_POOL 6
/* options: a 24-byte record whose first 32-bit word holds flags. */
typedef struct NLSHostPoolOptions {
  uint32_t flags;
  uint32_t reserved0;
  uint64_t reserved[2];
} NLSHostPoolOptions;
#define NLSHOST_POOL_MODULE_FLAGS 0x800000u
typedef void *(*NLSHostCreatePoolFn)(void *host, const NLSHostPoolOptions *options, void *journal,
                                     const char *name);

/* The service object's word 27 is an object whose slot 32 folds a character. */
#define NLSHOST_SERVICE_WORD_CHAR_OBJECT 27
#define NLSHOST_SLOT_FOLD_CHAR 32

/* ---- Pool ------------------------------------------------------------------- */
#define NLSHOST_SLOT_POOL_DESTROY 2
#define NLSHOST_SLOT_POOL_ALLOCATE 3
#define NLSHOST_SLOT_POOL_FREE 4
#define NLSHOST_ALLOC_ZERO_FILL 0x80000000u
typedef void (*NLSHostPoolDestroyFn)(void *pool);
typedef void *(*NLSHostPoolAllocateFn)(void *pool, uint64_t size, uint32_t flags);
typedef void (*NLSHostPoolFreeFn)(void *pool, void *memory);

/* ---- Converter -------------------------------------------------------------- */
#define NLSHOST_SLOT_CONVERTER_DESTROY 2
#define NLSHOST_SLOT_CONVERTER_CONVERT 4
typedef void (*NLSHostConverterDestroyFn)(void *converter);
/* Returns a status; the produced byte count goes through producedBytes. */
typedef int64_t (*NLSHostConverterConvertFn)(void *converter, const void *source,
                                             uint64_t sourceBytes, void *destination,
                                             uint64_t destinationSize, uint64_t *producedBytes,
                                             void *reserved);

/* ---- NLS object ---------------------------------------------------------------
 * The host object that owns the handle table and calls the module object's
 * create slot. Slots the module calls: */
#define NLSHOST_SLOT_NLS_CONVERSION_NEEDED 11 /* (nls, encA, encB, 0) -> bool */
#define NLSHOST_SLOT_NLS_DESCRIBE 13          /* (nls, encoding, &record) -> status */
#define NLSHOST_SLOT_NLS_CONVERTER_BETWEEN 14 /* (nls, from, to, 0, 0) -> converter */
#define NLSHOST_SLOT_NLS_CONVERTER_FROM 15    /* (nls, encoding, 0, 0): encoding -> host chars */
#define NLSHOST_SLOT_NLS_CONVERTER_TO 16      /* (nls, encoding, 0, 0): host chars -> encoding */
#define NLSHOST_SLOT_NLS_LOCALE 33            /* (nls, name as 32-bit chars, length) -> locale */
/* Where the NLS object keeps its handle table and the table lock (object
 * pointers, not functions): words chosen clear of every named slot. */
#define NLSHOST_WORD_NLS_HANDLE_TABLE 40
#define NLSHOST_WORD_NLS_TABLE_LOCK 41

typedef struct NLSHostEncodingRecord NLSHostEncodingRecord;
typedef int (*NLSHostConversionNeededFn)(void *nls, int64_t encodingA, int64_t encodingB,
                                         void *reserved);
typedef int64_t (*NLSHostDescribeEncodingFn)(void *nls, int64_t encoding,
                                             const NLSHostEncodingRecord **record);
typedef void *(*NLSHostConverterBetweenFn)(void *nls, int64_t from, int64_t to, void *reserved1,
                                           void *reserved2);
typedef void *(*NLSHostConverterForFn)(void *nls, int64_t encoding, void *reserved1,
                                       void *reserved2);
typedef void *(*NLSHostLocaleFn)(void *nls, const uint32_t *name, int64_t nameLength);

/* ---- Handle table and its lock ------------------------------------------------ */
#define NLSHOST_SLOT_TABLE_FIND 5
#define NLSHOST_SLOT_TABLE_INSERT 6
#define NLSHOST_SLOT_TABLE_RELEASE_ENTRY 18
#define NLSHOST_TABLE_FIND_FLAGS 0x2000000u
#define NLSHOST_TABLE_INSERT_FLAGS 0x4000000u
/* An entry's third word is the stored handle. */
#define NLSHOST_ENTRY_WORD_HANDLE 2
typedef void *(*NLSHostTableFindFn)(void *table, uint32_t flags, void *reserved, const void *key,
                                    uint64_t keyLength);
typedef void *(*NLSHostTableInsertFn)(void *table, uint32_t flags, void *reserved, void *handle,
                                      void *reserved2, const void *key, uint64_t keyLength,
                                      int64_t *status);
typedef void (*NLSHostTableReleaseEntryFn)(void *table, void *entry);

#define NLSHOST_SLOT_LOCK_ACQUIRE 3
#define NLSHOST_SLOT_LOCK_RELEASE 4
typedef void (*NLSHostLockAcquireFn)(void *lock, int64_t exclusive, int64_t wait);
typedef void (*NLSHostLockReleaseFn)(void *lock);

/* ---- Locale object ---------------------------------------------------------------- */
#define NLSHOST_SLOT_LOCALE_DESTROY 2
typedef void (*NLSHostLocaleDestroyFn)(void *locale);

/* ---- Encoding record ---------------------------------------------------------------
 * Returned by the describe service; owned by the host, read only. */
typedef struct NLSHostCharRanges {
  uint8_t reserved0[24];
  uint16_t shiftLength;    /* +24: bytes in the shift-out and shift-in sequences */
  uint8_t shiftOut[4];     /* +26 */
  uint8_t shiftIn[4];      /* +30 */
  uint8_t reserved34[2];
  uint8_t leadRanges[8];   /* +36: (low, high) pairs ended by a pair whose low byte is 0 */
  uint8_t trailRanges[8];  /* +44: the same for trail bytes */
} NLSHostCharRanges;

struct NLSHostEncodingRecord {
  uint32_t reserved0;
  uint32_t encodingClass;   /* 4 */
  uint32_t encodingFlags;   /* 8: bit 0 ASCII-based */
  uint32_t blankValue;      /* 12: blank bytes, low byte first */
  uint32_t reserved16;
  int8_t numberForm;        /* 20: 4 = units stored byte-swapped */
  uint8_t reserved21[35];
  uint32_t name[14];        /* 56: host characters */
  uint64_t nameLength;      /* 112 */
  uint8_t reserved120[736];
  NLSHostCharRanges charRanges; /* 856 */
};

/* ---- Journal and message object ---------------------------------------------
 * The object given to the message forwarders (and the journal given to
 * qvnlssm). Its operations stand in this order; the slot numbers are the
 * reference host's choice. */
#define NLSHOST_SLOT_MESSAGE_TO_BUF 2
#define NLSHOST_SLOT_MESSAGE_TO_JNL 3
#define NLSHOST_SLOT_STATUS_TO_BUF 4
#define NLSHOST_SLOT_STATUS_TO_JNL 5
#define NLSHOST_SLOT_GET_LOCALE 7
/* Level used by the module entry when it journals an allocation failure. */
#define NLSHOST_JOURNAL_LEVEL_ERROR 4
#ifdef __cplusplus
}
#include <cstdarg>
extern "C" {
#else
#include <stdarg.h>
#endif
typedef int64_t (*NLSHostMessageToBufFn)(void *object, void *a1, void *a2, void *a3, void *a4,
                                         void *a5, va_list args);
typedef int64_t (*NLSHostMessageToJnlFn)(void *object, uint32_t messageNumber, void *a1, void *a2,
                                         va_list args);
typedef int64_t (*NLSHostStatusToBufFn)(void *object, uint32_t status, void *a1, void *a2,
                                        void *a3, va_list args);
typedef int64_t (*NLSHostStatusToJnlFn)(void *object, uint32_t messageNumber, uint32_t status,
                                        va_list args);
typedef int64_t (*NLSHostGetLocaleFn)(void *object, va_list args);

#ifdef __cplusplus
}
#endif

#ifdef __cplusplus
#include <cstddef>
#define NLSHOST_STATIC_ASSERT static_assert
#else
#include <stddef.h>
#define NLSHOST_STATIC_ASSERT _Static_assert
#endif
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, encodingClass) == 4, "class at 4");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, encodingFlags) == 8, "flags at 8");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, blankValue) == 12, "blank at 12");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, numberForm) == 20, "number form at 20");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, name) == 56, "name at 56");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, nameLength) == 112, "name length at 112");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, charRanges) == 856, "ranges at 856");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, charRanges.shiftLength) == 880, "880");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, charRanges.shiftOut) == 882, "882");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, charRanges.shiftIn) == 886, "886");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, charRanges.leadRanges) == 892, "892");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, charRanges.trailRanges) == 900, "900");

#endif /* NLSSM_HOST_H */
