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

/* The service object's word 27 is an object whose slot 32 folds a character:
 * (charObject, character, options) -> the folded character (the character
 * itself when it has no folding). Options: bit 1 folds with the default
 * rules, bit 2 with the Turkic rules for dotted and dotless i; with neither
 * bit the character comes back unchanged. */
#define NLSHOST_SERVICE_WORD_CHAR_OBJECT 27
#define NLSHOST_SLOT_FOLD_CHAR 32
#define NLSHOST_FOLD_DEFAULT 0x1u
#define NLSHOST_FOLD_TURKIC 0x2u
typedef uint32_t (*NLSHostFoldCharFn)(void *charObject, uint32_t character, int64_t options);

/* ---- Host statuses -----------------------------------------------------------
 * Host operations return 0 or one of these. Where a meaning is shared with the
 * module the module's value is used, so a caller sees one code for it. */
#define NLSHOST_OK 0x0u
#define NLSHOST_E_NO_MEMORY 0x803fc002u       /* allocation or fault injection */
#define NLSHOST_E_TOO_SMALL 0x803fe807u       /* destination too small: whole characters written */
#define NLSHOST_E_ILL_FORMED 0x803fe808u      /* source not valid in its encoding */
#define NLSHOST_E_NO_ENCODING 0x803fe809u     /* number unknown, or no converter for it */
#define NLSHOST_E_NUMBER_FIELD 0x803fe80eu    /* number does not fit; field filled with '*' */
#define NLSHOST_E_NOT_A_NUMBER 0x803fe810u    /* no number where one was expected */
#define NLSHOST_E_TRUNCATED 0x803fe814u       /* source ends inside a character */
#define NLSHOST_E_NULL 0x803fe82au            /* required pointer missing */
#define NLSHOST_E_BAD_OPTIONS 0x803fe82eu     /* unknown option bits, negative width */
#define NLSHOST_E_NOT_A_CHARACTER 0x804f0001u /* character query: value above 0x10FFFF */

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
 * create slot. Converters it hands out convert a whole text per call (state
 * is reset and flushed each time); characters the destination lacks become
 * its substitution character, ill-formed source stops the conversion with
 * NLSHOST_E_ILL_FORMED or NLSHOST_E_TRUNCATED, and a short destination gets
 * NLSHOST_E_TOO_SMALL after the whole characters that fit.
 * Slots the module calls: */
#define NLSHOST_SLOT_NLS_CONVERSION_NEEDED 11 /* (nls, encA, encB, 0) -> bool */
/* (nls, encoding, &record) -> status; the record lives as long as the host.
 * An unknown number, or one without a converter, gives NLSHOST_E_NO_ENCODING. */
#define NLSHOST_SLOT_NLS_DESCRIBE 13
#define NLSHOST_SLOT_NLS_CONVERTER_BETWEEN 14 /* (nls, from, to, 0, 0) -> converter */
#define NLSHOST_SLOT_NLS_CONVERTER_FROM 15    /* (nls, encoding, 0, 0): encoding -> host chars */
#define NLSHOST_SLOT_NLS_CONVERTER_TO 16      /* (nls, encoding, 0, 0): host chars -> encoding */
/* (nls, from, to, source, sourceBytes, &size) -> status: the byte size of the
 * source converted from encoding `from` into encoding `to`. */
#define NLSHOST_SLOT_NLS_CONVERSION_SIZE 17
/* Six transcoders, each (nls, source, sourceBytes, destination, capacity,
 * &producedBytes, 0, 0) -> status. The intermediate form is UTF-16 in the
 * host's byte order (one character: 2 or 4 bytes); code points are 32-bit
 * values in the host's byte order. */
#define NLSHOST_SLOT_NLS_INTERMEDIATE_TO_CODE_POINT 24
#define NLSHOST_SLOT_NLS_CODE_POINT_TO_INTERMEDIATE 25
#define NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTF8 26
#define NLSHOST_SLOT_NLS_UTF8_TO_INTERMEDIATE 27
#define NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTFE 28
#define NLSHOST_SLOT_NLS_UTFE_TO_INTERMEDIATE 29
/* (nls, character, &info) -> status: fills an NLSHostCharInfo. */
#define NLSHOST_SLOT_NLS_CHAR_INFO 30
#define NLSHOST_SLOT_NLS_LOCALE 33 /* (nls, name as 32-bit chars, length) -> locale */
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
typedef int64_t (*NLSHostConversionSizeFn)(void *nls, int64_t from, int64_t to, const void *source,
                                           uint64_t sourceBytes, uint64_t *size);
typedef int64_t (*NLSHostTranscodeFn)(void *nls, const void *source, uint64_t sourceBytes,
                                      void *destination, uint64_t destinationSize,
                                      uint64_t *producedBytes, void *reserved1, void *reserved2);

/* Character information, filled by slot 30. Property word: one bit per general
 * category (NLSHOST_GC_*); bidirectional category numbered L = 0 ... ON = 18
 * in the order of the bidirectional algorithm's class table, then LRI 19,
 * RLI 20, FSI 21, PDI 22. Case mappings are simple (one character), 0 when
 * the character maps to itself. */
typedef struct NLSHostCharInfo {
  uint32_t character;      /* 0: the character asked about */
  uint32_t properties;     /* 4: NLSHOST_GC_* bit of its general category */
  uint32_t bidiCategory;   /* 8 */
  uint32_t categoryIndex;  /* 12: bit number of the properties bit */
  uint32_t upper;          /* 16: upper-case mapping or 0 */
  uint32_t lower;          /* 20: lower-case mapping or 0 */
  uint32_t title;          /* 24: title-case mapping or 0 */
  uint32_t combiningClass; /* 28: canonical combining class */
} NLSHostCharInfo;
typedef int64_t (*NLSHostCharInfoFn)(void *nls, uint32_t character, NLSHostCharInfo *info);

#define NLSHOST_GC_LU (1u << 0)
#define NLSHOST_GC_LL (1u << 1)
#define NLSHOST_GC_LT (1u << 2)
#define NLSHOST_GC_MN (1u << 3)
#define NLSHOST_GC_MC (1u << 4)
#define NLSHOST_GC_ME (1u << 5)
#define NLSHOST_GC_ND (1u << 6)
#define NLSHOST_GC_NL (1u << 7)
#define NLSHOST_GC_NO (1u << 8)
#define NLSHOST_GC_ZS (1u << 9)
#define NLSHOST_GC_ZL (1u << 10)
#define NLSHOST_GC_ZP (1u << 11)
#define NLSHOST_GC_CC (1u << 12)
#define NLSHOST_GC_CF (1u << 13)
#define NLSHOST_GC_CS (1u << 14)
#define NLSHOST_GC_CO (1u << 15)
#define NLSHOST_GC_CN (1u << 16)
#define NLSHOST_GC_LM (1u << 17)
#define NLSHOST_GC_LO (1u << 18)
#define NLSHOST_GC_PC (1u << 19)
#define NLSHOST_GC_PD (1u << 20)
#define NLSHOST_GC_PS (1u << 21)
#define NLSHOST_GC_PE (1u << 22)
#define NLSHOST_GC_PI (1u << 23)
#define NLSHOST_GC_PF (1u << 24)
#define NLSHOST_GC_PO (1u << 25)
#define NLSHOST_GC_SM (1u << 26)
#define NLSHOST_GC_SC (1u << 27)
#define NLSHOST_GC_SK (1u << 28)
#define NLSHOST_GC_SO (1u << 29)

#define NLSHOST_BIDI_L 0u
#define NLSHOST_BIDI_LRE 1u
#define NLSHOST_BIDI_LRO 2u
#define NLSHOST_BIDI_R 3u
#define NLSHOST_BIDI_AL 4u
#define NLSHOST_BIDI_RLE 5u
#define NLSHOST_BIDI_RLO 6u
#define NLSHOST_BIDI_PDF 7u
#define NLSHOST_BIDI_EN 8u
#define NLSHOST_BIDI_ES 9u
#define NLSHOST_BIDI_ET 10u
#define NLSHOST_BIDI_AN 11u
#define NLSHOST_BIDI_CS 12u
#define NLSHOST_BIDI_NSM 13u
#define NLSHOST_BIDI_BN 14u
#define NLSHOST_BIDI_B 15u
#define NLSHOST_BIDI_S 16u
#define NLSHOST_BIDI_WS 17u
#define NLSHOST_BIDI_ON 18u
#define NLSHOST_BIDI_LRI 19u
#define NLSHOST_BIDI_RLI 20u
#define NLSHOST_BIDI_FSI 21u
#define NLSHOST_BIDI_PDI 22u

/* ---- Handle table and its lock ------------------------------------------------ */
#define NLSHOST_SLOT_TABLE_FIND 5
#define NLSHOST_SLOT_TABLE_INSERT 6
#define NLSHOST_SLOT_TABLE_RELEASE_ENTRY 18
#define NLSHOST_TABLE_FIND_FLAGS 0x2000000u
#define NLSHOST_TABLE_INSERT_FLAGS 0x4000000u
/* An entry's third word is the stored handle. Find and insert return the
 * entry with a reference held for the caller, which gives it back through
 * release entry; the entry stays in the table until the NLS object is
 * destroyed, which passes every entry to the module's destroy callback.
 * Insert under a key already present fails with NLSHOST_E_KEY_EXISTS. */
#define NLSHOST_ENTRY_WORD_HANDLE 2
#define NLSHOST_E_KEY_EXISTS 0x804f0002u
typedef struct NLSHostTableEntry {
  void *table;         /* 0: the table holding the entry */
  uint64_t references; /* 1: references held by callers */
  void *handle;        /* 2: the stored handle */
  uint64_t keyLength;  /* 3 */
  uint8_t key[64];     /* 4: the key bytes (longer keys are refused) */
} NLSHostTableEntry;
#define NLSHOST_TABLE_KEY_MAX 64
typedef void *(*NLSHostTableFindFn)(void *table, uint32_t flags, void *reserved, const void *key,
                                    uint64_t keyLength);
typedef void *(*NLSHostTableInsertFn)(void *table, uint32_t flags, void *reserved, void *handle,
                                      void *reserved2, const void *key, uint64_t keyLength,
                                      int64_t *status);
typedef void (*NLSHostTableReleaseEntryFn)(void *table, void *entry);

/* The table lock: acquire (lock, 1, 1) waits for exclusive ownership;
 * the reference host's lock is one mutex and always takes it exclusively
 * and waiting. */
#define NLSHOST_SLOT_LOCK_ACQUIRE 3
#define NLSHOST_SLOT_LOCK_RELEASE 4
typedef void (*NLSHostLockAcquireFn)(void *lock, int64_t exclusive, int64_t wait);
typedef void (*NLSHostLockReleaseFn)(void *lock);

/* ---- Locale object ----------------------------------------------------------------
 * Number operations. Texts are numbers in the locale's notation; blanks
 * before and after a number are skipped. Parsers report the units consumed
 * (bytes, or characters for 32-bit text), including skipped blanks; a text
 * that is empty or all blank gives 0.0 with status 0. The byte parsers take
 * an optional converter from host characters into the text's encoding, used
 * to find the locale's decimal and grouping separators when they are not
 * ASCII (for example a no-break space). Formatters write a field of `width`
 * characters (0: as wide as the number), right-aligned with blanks unless
 * NLSHOST_NUMBER_LEFT; a number wider than the field, or a field wider than
 * the destination, fills what there is with '*' and gives
 * NLSHOST_E_NUMBER_FIELD. Decimals: digits after the decimal separator
 * (0 to 16), or for doubles NLSHOST_DECIMALS_SHORTEST: the shortest text
 * that reads back as the same double, with fewer digits when the width is
 * too small for it. */
#define NLSHOST_SLOT_LOCALE_DESTROY 2
#define NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_UTF8 3   /* UTF-8 text (encoding 20) */
#define NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_ASCII 4  /* other ASCII-based encodings */
#define NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_EBCDIC 5 /* EBCDIC-based encodings */
#define NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_CHARS 6  /* 32-bit host characters */
#define NLSHOST_SLOT_LOCALE_FORMAT_DOUBLE_CHARS 7
#define NLSHOST_SLOT_LOCALE_FORMAT_INTEGER_CHARS 8
#define NLSHOST_SLOT_LOCALE_FORMAT_DOUBLE_UTF8 9
/* Parse options: only blanks may follow the number. */
#define NLSHOST_PARSE_STRICT_TAIL 0x1000u
/* Format flags. */
#define NLSHOST_NUMBER_GROUPING 0x1u   /* group digits with the locale's separator */
#define NLSHOST_NUMBER_SCIENTIFIC 0x2u /* mantissa and exponent (doubles only) */
#define NLSHOST_NUMBER_SIGN 0x4u       /* a sign on positive numbers too */
#define NLSHOST_NUMBER_LEFT 0x8u       /* left-align in the field */
#define NLSHOST_DECIMALS_SHORTEST (-1) /* decimals argument of the double formatters */
typedef void (*NLSHostLocaleDestroyFn)(void *locale);
typedef int64_t (*NLSHostParseDoubleBytesFn)(void *locale, const uint8_t *text, int64_t textBytes,
                                             void *toEncodingConverter, uint32_t options,
                                             double *value, int32_t *consumedBytes);
typedef int64_t (*NLSHostParseDoubleCharsFn)(void *locale, const uint32_t *text, int64_t count,
                                             uint32_t options, double *value,
                                             int32_t *consumedChars);
typedef int64_t (*NLSHostFormatDoubleCharsFn)(void *locale, double value, int64_t width,
                                              int64_t decimals, uint32_t flags, uint32_t *buffer,
                                              int64_t capacity, int32_t *count);
typedef int64_t (*NLSHostFormatIntegerCharsFn)(void *locale, int64_t value, int64_t width,
                                               int64_t decimals, uint32_t flags, uint32_t *buffer,
                                               int64_t capacity, int32_t *count);
typedef int64_t (*NLSHostFormatDoubleUtf8Fn)(void *locale, double value, int64_t width,
                                             int64_t decimals, uint32_t flags, uint8_t *destination,
                                             int64_t capacity, int32_t *countBytes);

/* ---- Encoding record ---------------------------------------------------------------
 * Returned by the describe service; owned by the host, read only. */
typedef struct NLSHostCharRanges {
  uint8_t dbcsSpace[2]; /* +0: the double-byte space in text order, zero when none */
  uint8_t reserved2[22];
  uint16_t shiftLength; /* +24: bytes in the shift-out and shift-in sequences */
  uint8_t shiftOut[4];  /* +26 */
  uint8_t shiftIn[4];   /* +30 */
  uint8_t reserved34[2];
  uint8_t leadRanges[8];   /* +36: (low, high) pairs ended by a pair whose low byte is 0 */
  uint8_t trailRanges[16]; /* +44: the same for trail bytes */
} NLSHostCharRanges;

#define NLSHOST_ENCODING_ASCII 0x1u /* encodingFlags bit 0 */
struct NLSHostEncodingRecord {
  uint32_t number;        /* 0: the encoding number described */
  uint32_t encodingClass; /* 4 */
  uint32_t encodingFlags; /* 8: bit 0 ASCII-based */
  uint32_t blankValue;    /* 12: blank bytes, low byte first */
  uint32_t maxCharBytes;  /* 16: longest character in bytes */
  int8_t numberForm;      /* 20: 4 = units stored byte-swapped */
  uint8_t reserved21[3];
  char converterName[32];       /* 24: the host's converter behind it, NUL-terminated */
  uint32_t name[14];            /* 56: host characters */
  uint64_t nameLength;          /* 112 */
  char aliases[256];            /* 120: other names, comma-separated, NUL-terminated */
  char title[480];              /* 376: a description, NUL-terminated */
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
typedef int64_t (*NLSHostStatusToBufFn)(void *object, uint32_t status, void *a1, void *a2, void *a3,
                                        va_list args);
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
NLSHOST_STATIC_ASSERT(offsetof(NLSHostEncodingRecord, charRanges.dbcsSpace) == 856, "856");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostCharInfo, properties) == 4, "properties at 4");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostCharInfo, bidiCategory) == 8, "bidi at 8");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostCharInfo, upper) == 16, "upper at 16");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostCharInfo, lower) == 20, "lower at 20");
NLSHOST_STATIC_ASSERT(offsetof(NLSHostTableEntry, handle) == 16, "handle in word 2");

#endif /* NLSSM_HOST_H */
