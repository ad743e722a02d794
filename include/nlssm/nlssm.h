/* nlssm: national-language string operations on text in its own encoding.
 *
 * The C interface of the module: status codes, special positions, the NLSSM
 * handle and its operation table, the string descriptor, the module object,
 * the version record, and every exported function. Usable from C99 and C++.
 */
#ifndef NLSSM_NLSSM_H
#define NLSSM_NLSSM_H

#include <stddef.h>
#include <stdint.h>

#if defined(__cplusplus)
#define NLSSM_EXTERN_C extern "C"
#define NLSSM_DATA_EXTERN extern "C"
#define NLSSM_STATIC_ASSERT(cond, msg) static_assert(cond, msg)
#else
#define NLSSM_EXTERN_C
#define NLSSM_DATA_EXTERN extern
#define NLSSM_STATIC_ASSERT(cond, msg) _Static_assert(cond, msg)
#endif

#define NLSSM_API NLSSM_EXTERN_C __attribute__((visibility("default")))
#define NLSSM_DATA_API NLSSM_DATA_EXTERN __attribute__((visibility("default")))

/* ---- Results ----------------------------------------------------------
 * Transforming operations return a 32-bit status in a 64-bit result,
 * zero-extended: compare the result with these constants. */
#define NLSSM_OK 0x0u
#define NLSSM_E_NO_MEMORY 0x803fc002u          /* pool, allocation, locale, table, converter */
#define NLSSM_E_UNSUPPORTED 0x803fc004u        /* operation not supported */
#define NLSSM_E_DEST_TOO_SMALL 0x803fe807u     /* what fits was written, no padding */
#define NLSSM_E_ILL_FORMED 0x803fe808u         /* invalid UTF lead byte or lone surrogate */
#define NLSSM_E_ENCODING 0x803fe809u           /* encoding not supported */
#define NLSSM_E_NUMBER_DOES_NOT_FIT 0x803fe80eu /* field filled with '*' */
#define NLSSM_E_NOT_A_NUMBER 0x803fe810u
#define NLSSM_E_INT_OVERFLOW 0x803fe811u
#define NLSSM_E_TRUNCATED_SEQUENCE 0x803fe814u /* input ends inside a sequence */
#define NLSSM_E_NUMBER_TOO_LONG 0x803fe818u    /* over 152 bytes, or negative capacity */
#define NLSSM_E_NULL_ARGUMENT 0x803fe82au
#define NLSSM_E_BAD_CHARACTER 0x803fe82cu      /* malformed or truncated multi-byte character */
#define NLSSM_E_BAD_OPTIONS 0x803fe82eu
#define NLSSM_E_BAD_ARGUMENT 0x803fe82fu       /* non-null reserved argument to NLSSMCreate */
#define NLSSM_E_BAD_ALIGNMENT 0x803fe835u      /* justify alignment code */
/* Counting operations report a failed work-buffer allocation with this. */
#define NLSSM_COUNT_NO_MEMORY INT64_MIN

/* ---- Special positions -------------------------------------------------- */
#define NLSSM_POS_NONE (-9)         /* no current or next character */
#define NLSSM_POS_NO_PREVIOUS (-1)  /* no previous character */
#define NLSSM_POS_OUTSIDE (-99)     /* stringSetPos target outside the string */
#define NLSSM_POS_CURRENT (-999)    /* stringSetPos argument: the current character */
#define NLSSM_POS_LAST (-199)       /* stringSetPos argument: the last character */
#define NLSSM_SIZE_NONE (-10)       /* stringCurCharSize with no current character */

/* ---- Encoding classes and character kinds -------------------------------- */
#define NLSSM_CLASS_SBCS 0
#define NLSSM_CLASS_UTF8 1 /* UTF-8 and UTF-EBCDIC */
#define NLSSM_CLASS_WCS2 2
#define NLSSM_CLASS_WCS4 3
#define NLSSM_CLASS_MBCS_MODAL 4
#define NLSSM_CLASS_MBCS_NONMODAL 5

#define NLSSM_KIND_SINGLE 1u
#define NLSSM_KIND_DOUBLE 4u
#define NLSSM_KIND_THREE 12u
#define NLSSM_KIND_FOUR 13u

/* Encoding numbers with a fixed meaning. */
#define NLSSM_ENC_UTF8 20
#define NLSSM_ENC_WCS2_BE 24
#define NLSSM_ENC_WCS2_LE 25
#define NLSSM_ENC_WCS4_BE 26
#define NLSSM_ENC_HOST_CHARS 27 /* the host's own character form */
#define NLSSM_ENC_REFERENCE_SBCS 62
#define NLSSM_ENC_EUC_JP 134
#define NLSSM_ENC_GB18030 205
#define NLSSM_ENCODING_LIMIT 265

/* Option bits shared by the comparison and case families. */
#define NLSSM_OPT_PAD 0x1u
#define NLSSM_OPT_FOLD_LOWER 0x2u
#define NLSSM_OPT_FOLD_UPPER 0x4u
/* Editing flags. */
#define NLSSM_EDIT_PAD 0x1u
#define NLSSM_EDIT_SOURCE_IN_CHARS 0x200u

/* ---- String descriptor ----------------------------------------------------- */
typedef struct NLSString {
  uint8_t *buffer;     /* base of the byte buffer */
  uint64_t length;     /* used bytes: offset of the end of the text */
  uint64_t capacity;   /* buffer size in bytes */
  int64_t charIndex;   /* 0-based index of the current character */
  int64_t curOffset;   /* byte offset of the current character, or -9 */
  int64_t nextOffset;  /* byte offset of the next character, or -9 */
  int64_t prevOffset;  /* byte offset of the previous character, or -1 */
  uint32_t charKind;   /* multi-byte classes: 1, 4, 12 or 13 */
  uint32_t nextCharKind;
  uint32_t prevKind;
} NLSString;

/* One character with its own inline storage, built by NLSCharInit. */
typedef struct NLSChar {
  NLSString string;
  uint64_t charBytes;
  uint8_t bytes[4];
} NLSChar;

/* ---- The NLSSM handle -------------------------------------------------------
 * 177 64-bit words; per-encoding data and operation slots interleave. A slot
 * holds a function whose first argument is the handle; callers cast it to
 * the operation's prototype (declared below under the member names). */
typedef void (*NLSSlot)(void);

typedef struct NLSSMHandle {
  char magic[8]; /* "nevo" */
  const char *name; /* "QVNLSSM handle" */
  NLSSlot destroy; /* NLSSMDestroy */
  void *owner; /* host NLS object that built the handle */
  uint32_t encodingNumber; uint32_t unitWidth; /* 4 */
  uint32_t encodingClass; uint32_t reserved5; /* 5 */
  NLSSlot NLSNumChars; /* 6 */
  NLSSlot NLSBlankPad; /* 7 */
  NLSSlot NLSAllBlanks; /* 8 */
  NLSSlot NLSStringIndex; /* 9 */
  NLSSlot NLSStringEquals; /* 10 */
  NLSSlot NLSStringLower; /* 11 */
  NLSSlot NLSStringUpper; /* 12 */
  NLSSlot NLSStringNormalize; /* 13 */
  NLSSlot NLSStringInit; /* 14 */
  NLSSlot NLSCharInit; /* 15 */
  NLSSlot NLSStringClean; /* 16 */
  NLSSlot stringDupPos; /* 17 */
  NLSSlot stringGetPos; /* 18 */
  NLSSlot stringSetPos; /* 19 */
  NLSSlot stringNextChar; /* 20 */
  NLSSlot stringNextCharB; /* 21 */
  NLSSlot reserved22; /* 22 */
  NLSSlot NLSStringCompLit; /* 23 */
  NLSSlot NLSStringCompStr; /* 24 */
  NLSSlot NLSStringCompare; /* 25 */
  NLSSlot stringCurCharSize; /* 26 */
  NLSSlot NLSStringLike; /* 27 */
  NLSSlot NLSStringContains; /* 28 */
  NLSSlot NLSStringFromDouble; /* 29 */
  NLSSlot NLSStringFromIntmax; /* 30 */
  NLSSlot NLSStringToDouble; /* 31 */
  NLSSlot NLSStringToIntmax; /* 32 */
  NLSSlot NLSStringReverse; /* 33 */
  NLSSlot NLSStringDelete; /* 34 */
  NLSSlot NLSStringDeleteLit; /* 35 */
  NLSSlot NLSStringNotEqual; /* 36 */
  NLSSlot NLSStringNotEqualLit; /* 37 */
  NLSSlot NLSStringSubStr; /* 38 */
  NLSSlot NLSStringStrip; /* 39 */
  NLSSlot NLSStringByteLength; /* 40 */
  uint32_t shiftLength; uint32_t reserved41; /* 41 */
  NLSSlot NLSStringAddQuotes; /* 42 */
  NLSSlot NLSStringConcat; /* 43 */
  NLSSlot NLSStringFill; /* 44 */
  NLSSlot NLSStringFillLit; /* 45 */
  NLSSlot NLSStringFindCharLit; /* 46 */
  NLSSlot NLSStringJustify; /* 47 */
  NLSSlot NLSNumCharsS; /* 48 */
  NLSSlot NLSBlankPadS; /* 49 */
  NLSSlot NLSAllBlanksS; /* 50 */
  NLSSlot NLSStringIndexS; /* 51 */
  NLSSlot NLSStringEqualsS; /* 52 */
  NLSSlot NLSStringLowerS; /* 53 */
  NLSSlot NLSStringUpperS; /* 54 */
  NLSSlot NLSStringNormalizeS; /* 55 */
  NLSSlot NLSStringCompareS; /* 56 */
  NLSSlot NLSStringCompLitS; /* 57 */
  NLSSlot NLSStringReverseS; /* 58 */
  NLSSlot NLSStringDeleteS; /* 59 */
  NLSSlot NLSStringDeleteLitS; /* 60 */
  NLSSlot NLSStringNotEqualS; /* 61 */
  NLSSlot NLSStringNotEqualLitS; /* 62 */
  NLSSlot NLSStringMoveS; /* 63 */
  NLSSlot NLSStringStripS; /* 64 */
  NLSSlot NLSStringAddQuotesS; /* 65 */
  NLSSlot NLSStringConcatS; /* 66 */
  NLSSlot NLSStringFillS; /* 67 */
  NLSSlot NLSStringFillLitS; /* 68 */
  NLSSlot NLSStringFindCharLitS; /* 69 */
  NLSSlot NLSStringFindCharS; /* 70 */
  NLSSlot NLSStringJustifyS; /* 71 */
  NLSSlot NLSStringLength; /* 72 */
  NLSSlot NLSStringIs; /* 73 */
  NLSSlot NLSStringIsLower; /* 74 */
  NLSSlot NLSStringIsDigit; /* 75 */
  NLSSlot NLSStringIsSpace; /* 76 */
  NLSSlot NLSStringIsXDigit; /* 77 */
  NLSSlot NLSStringIsGraph; /* 78 */
  NLSSlot NLSGetBaseDirection; /* 79 */
  NLSSlot NLSVisualOrderFormat; /* 80 */
  NLSSlot NLSLogicalOrderFormat; /* 81 */
  void *reserved82[4]; /* 82 */
  NLSSlot NLSStringVerify; /* 86 */
  NLSSlot NLSStringVerifyS; /* 87 */
  uint32_t encodingFlags; uint32_t reserved88; /* bit 0: ASCII-based */
  NLSSlot NLSStringTransliterateLit; /* 89 */
  NLSSlot NLSStringTransliterateLitS; /* 90 */
  NLSSlot NLSStringTransliterate; /* 91 */
  NLSSlot NLSStringTransliterateS; /* 92 */
  NLSSlot NLSStringRemoveDelimiters; /* 93 */
  NLSSlot NLSStringRemoveDelimitersS; /* 94 */
  NLSSlot NLSStringTranword; /* 95 */
  NLSSlot NLSStringTranwordS; /* 96 */
  NLSSlot NLSStringSqueezeLit; /* 97 */
  NLSSlot NLSStringSqueezeLitS; /* 98 */
  NLSSlot NLSStringSqueeze; /* 99 */
  NLSSlot NLSStringSqueezeS; /* 100 */
  NLSSlot NLSStringNLength; /* 101 */
  NLSSlot NLSStringBLength; /* 102 */
  int64_t numberForm; /* 4: units stored byte-swapped */
  NLSSlot NLSStringIndexC; /* 104 */
  NLSSlot NLSStringEqualsC; /* 105 */
  NLSSlot NLSStringLowerC; /* 106 */
  NLSSlot NLSStringUpperC; /* 107 */
  NLSSlot NLSStringCompStrC; /* 108 */
  NLSSlot NLSStringCompLitC; /* 109 */
  NLSSlot NLSStringStripC; /* 110 */
  NLSSlot NLSStringFindCharLitC; /* 111 */
  NLSSlot NLSStringFindCharC; /* 112 */
  NLSSlot NLSStringJustifyC; /* 113 */
  NLSSlot NLSStringByteLengthC; /* 114 */
  NLSSlot NLSStringMoveC; /* 115 */
  void *fromConverter; /* host converter: this encoding -> host characters */
  void *toConverter; /* host converter: host characters -> this encoding */
  NLSSlot stringAnyNot; /* 118 */
  void *reserved119[2]; /* 119 */
  uint8_t blankChar[8]; /* 121 */
  uint64_t blankWidth; /* 122 */
  const uint8_t *charRanges; /* host record block: shift and lead/trail lists */
  const uint8_t *upperTable; /* 124 */
  const uint8_t *lowerTable; /* 125 */
  const uint8_t *foldTable; /* 126 */
  const void *dbcsTable; /* 127 */
  uint64_t dbcsTableCount; /* 128 */
  void *charConverter; /* owned: encoding 62 -> this encoding */
  void *pool; /* 130 */
  void *locale; /* owned "en_US" locale */
  void *ownFromConverter; /* 132 */
  void *ownToConverter; /* 133 */
  uint8_t quoteChar[8]; /* 134 */
  uint64_t quoteWidth; /* 135 */
  uint8_t charClass[256]; /* 0x44 lead byte, 0x08 trail byte */
  const uint8_t *classTable; /* 168 */
  const void *dbcsExtTable; /* 169 */
  uint64_t dbcsExtCount; /* 170 */
  void *reserved171[5]; /* 171 */
  const uint8_t *bidiTable; /* class 0 only */} NLSSMHandle;

#define NLSSM_HANDLE_WORDS 177
NLSSM_STATIC_ASSERT(sizeof(NLSSMHandle) == NLSSM_HANDLE_WORDS * 8, "handle is 177 words");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, unitWidth) == 4 * 8 + 4, "unitWidth in the high half of word 4");
NLSSM_STATIC_ASSERT(sizeof(NLSString) == 72, "descriptor is 7 words and 3 u32");
NLSSM_STATIC_ASSERT(offsetof(NLSString, charKind) == 56, "charKind after the seven words");
NLSSM_STATIC_ASSERT(offsetof(NLSChar, charBytes) == 72, "charBytes follows the descriptor");
NLSSM_STATIC_ASSERT(offsetof(NLSChar, bytes) == 80, "inline buffer follows charBytes");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, magic) == 0 * 8, "magic at word 0");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, name) == 1 * 8, "name at word 1");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, destroy) == 2 * 8, "destroy at word 2");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, owner) == 3 * 8, "owner at word 3");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, encodingNumber) == 4 * 8, "encodingNumber at word 4");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, encodingClass) == 5 * 8, "encodingClass at word 5");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSNumChars) == 6 * 8, "NLSNumChars at word 6");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSBlankPad) == 7 * 8, "NLSBlankPad at word 7");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSAllBlanks) == 8 * 8, "NLSAllBlanks at word 8");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringIndex) == 9 * 8, "NLSStringIndex at word 9");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringEquals) == 10 * 8, "NLSStringEquals at word 10");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringLower) == 11 * 8, "NLSStringLower at word 11");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringUpper) == 12 * 8, "NLSStringUpper at word 12");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringNormalize) == 13 * 8, "NLSStringNormalize at word 13");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringInit) == 14 * 8, "NLSStringInit at word 14");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSCharInit) == 15 * 8, "NLSCharInit at word 15");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringClean) == 16 * 8, "NLSStringClean at word 16");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, stringDupPos) == 17 * 8, "stringDupPos at word 17");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, stringGetPos) == 18 * 8, "stringGetPos at word 18");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, stringSetPos) == 19 * 8, "stringSetPos at word 19");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, stringNextChar) == 20 * 8, "stringNextChar at word 20");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, stringNextCharB) == 21 * 8, "stringNextCharB at word 21");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, reserved22) == 22 * 8, "reserved22 at word 22");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringCompLit) == 23 * 8, "NLSStringCompLit at word 23");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringCompStr) == 24 * 8, "NLSStringCompStr at word 24");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringCompare) == 25 * 8, "NLSStringCompare at word 25");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, stringCurCharSize) == 26 * 8, "stringCurCharSize at word 26");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringLike) == 27 * 8, "NLSStringLike at word 27");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringContains) == 28 * 8, "NLSStringContains at word 28");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFromDouble) == 29 * 8, "NLSStringFromDouble at word 29");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFromIntmax) == 30 * 8, "NLSStringFromIntmax at word 30");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringToDouble) == 31 * 8, "NLSStringToDouble at word 31");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringToIntmax) == 32 * 8, "NLSStringToIntmax at word 32");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringReverse) == 33 * 8, "NLSStringReverse at word 33");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringDelete) == 34 * 8, "NLSStringDelete at word 34");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringDeleteLit) == 35 * 8, "NLSStringDeleteLit at word 35");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringNotEqual) == 36 * 8, "NLSStringNotEqual at word 36");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringNotEqualLit) == 37 * 8, "NLSStringNotEqualLit at word 37");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringSubStr) == 38 * 8, "NLSStringSubStr at word 38");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringStrip) == 39 * 8, "NLSStringStrip at word 39");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringByteLength) == 40 * 8, "NLSStringByteLength at word 40");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, shiftLength) == 41 * 8, "shiftLength at word 41");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringAddQuotes) == 42 * 8, "NLSStringAddQuotes at word 42");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringConcat) == 43 * 8, "NLSStringConcat at word 43");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFill) == 44 * 8, "NLSStringFill at word 44");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFillLit) == 45 * 8, "NLSStringFillLit at word 45");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFindCharLit) == 46 * 8, "NLSStringFindCharLit at word 46");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringJustify) == 47 * 8, "NLSStringJustify at word 47");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSNumCharsS) == 48 * 8, "NLSNumCharsS at word 48");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSBlankPadS) == 49 * 8, "NLSBlankPadS at word 49");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSAllBlanksS) == 50 * 8, "NLSAllBlanksS at word 50");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringIndexS) == 51 * 8, "NLSStringIndexS at word 51");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringEqualsS) == 52 * 8, "NLSStringEqualsS at word 52");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringLowerS) == 53 * 8, "NLSStringLowerS at word 53");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringUpperS) == 54 * 8, "NLSStringUpperS at word 54");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringNormalizeS) == 55 * 8, "NLSStringNormalizeS at word 55");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringCompareS) == 56 * 8, "NLSStringCompareS at word 56");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringCompLitS) == 57 * 8, "NLSStringCompLitS at word 57");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringReverseS) == 58 * 8, "NLSStringReverseS at word 58");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringDeleteS) == 59 * 8, "NLSStringDeleteS at word 59");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringDeleteLitS) == 60 * 8, "NLSStringDeleteLitS at word 60");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringNotEqualS) == 61 * 8, "NLSStringNotEqualS at word 61");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringNotEqualLitS) == 62 * 8, "NLSStringNotEqualLitS at word 62");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringMoveS) == 63 * 8, "NLSStringMoveS at word 63");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringStripS) == 64 * 8, "NLSStringStripS at word 64");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringAddQuotesS) == 65 * 8, "NLSStringAddQuotesS at word 65");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringConcatS) == 66 * 8, "NLSStringConcatS at word 66");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFillS) == 67 * 8, "NLSStringFillS at word 67");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFillLitS) == 68 * 8, "NLSStringFillLitS at word 68");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFindCharLitS) == 69 * 8, "NLSStringFindCharLitS at word 69");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFindCharS) == 70 * 8, "NLSStringFindCharS at word 70");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringJustifyS) == 71 * 8, "NLSStringJustifyS at word 71");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringLength) == 72 * 8, "NLSStringLength at word 72");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringIs) == 73 * 8, "NLSStringIs at word 73");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringIsLower) == 74 * 8, "NLSStringIsLower at word 74");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringIsDigit) == 75 * 8, "NLSStringIsDigit at word 75");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringIsSpace) == 76 * 8, "NLSStringIsSpace at word 76");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringIsXDigit) == 77 * 8, "NLSStringIsXDigit at word 77");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringIsGraph) == 78 * 8, "NLSStringIsGraph at word 78");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSGetBaseDirection) == 79 * 8, "NLSGetBaseDirection at word 79");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSVisualOrderFormat) == 80 * 8, "NLSVisualOrderFormat at word 80");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSLogicalOrderFormat) == 81 * 8, "NLSLogicalOrderFormat at word 81");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, reserved82) == 82 * 8, "reserved82 at word 82");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringVerify) == 86 * 8, "NLSStringVerify at word 86");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringVerifyS) == 87 * 8, "NLSStringVerifyS at word 87");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, encodingFlags) == 88 * 8, "encodingFlags at word 88");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringTransliterateLit) == 89 * 8, "NLSStringTransliterateLit at word 89");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringTransliterateLitS) == 90 * 8, "NLSStringTransliterateLitS at word 90");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringTransliterate) == 91 * 8, "NLSStringTransliterate at word 91");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringTransliterateS) == 92 * 8, "NLSStringTransliterateS at word 92");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringRemoveDelimiters) == 93 * 8, "NLSStringRemoveDelimiters at word 93");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringRemoveDelimitersS) == 94 * 8, "NLSStringRemoveDelimitersS at word 94");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringTranword) == 95 * 8, "NLSStringTranword at word 95");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringTranwordS) == 96 * 8, "NLSStringTranwordS at word 96");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringSqueezeLit) == 97 * 8, "NLSStringSqueezeLit at word 97");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringSqueezeLitS) == 98 * 8, "NLSStringSqueezeLitS at word 98");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringSqueeze) == 99 * 8, "NLSStringSqueeze at word 99");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringSqueezeS) == 100 * 8, "NLSStringSqueezeS at word 100");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringNLength) == 101 * 8, "NLSStringNLength at word 101");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringBLength) == 102 * 8, "NLSStringBLength at word 102");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, numberForm) == 103 * 8, "numberForm at word 103");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringIndexC) == 104 * 8, "NLSStringIndexC at word 104");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringEqualsC) == 105 * 8, "NLSStringEqualsC at word 105");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringLowerC) == 106 * 8, "NLSStringLowerC at word 106");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringUpperC) == 107 * 8, "NLSStringUpperC at word 107");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringCompStrC) == 108 * 8, "NLSStringCompStrC at word 108");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringCompLitC) == 109 * 8, "NLSStringCompLitC at word 109");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringStripC) == 110 * 8, "NLSStringStripC at word 110");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFindCharLitC) == 111 * 8, "NLSStringFindCharLitC at word 111");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringFindCharC) == 112 * 8, "NLSStringFindCharC at word 112");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringJustifyC) == 113 * 8, "NLSStringJustifyC at word 113");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringByteLengthC) == 114 * 8, "NLSStringByteLengthC at word 114");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, NLSStringMoveC) == 115 * 8, "NLSStringMoveC at word 115");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, fromConverter) == 116 * 8, "fromConverter at word 116");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, toConverter) == 117 * 8, "toConverter at word 117");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, stringAnyNot) == 118 * 8, "stringAnyNot at word 118");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, reserved119) == 119 * 8, "reserved119 at word 119");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, blankChar) == 121 * 8, "blankChar at word 121");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, blankWidth) == 122 * 8, "blankWidth at word 122");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, charRanges) == 123 * 8, "charRanges at word 123");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, upperTable) == 124 * 8, "upperTable at word 124");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, lowerTable) == 125 * 8, "lowerTable at word 125");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, foldTable) == 126 * 8, "foldTable at word 126");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, dbcsTable) == 127 * 8, "dbcsTable at word 127");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, dbcsTableCount) == 128 * 8, "dbcsTableCount at word 128");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, charConverter) == 129 * 8, "charConverter at word 129");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, pool) == 130 * 8, "pool at word 130");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, locale) == 131 * 8, "locale at word 131");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, ownFromConverter) == 132 * 8, "ownFromConverter at word 132");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, ownToConverter) == 133 * 8, "ownToConverter at word 133");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, quoteChar) == 134 * 8, "quoteChar at word 134");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, quoteWidth) == 135 * 8, "quoteWidth at word 135");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, charClass) == 136 * 8, "charClass at word 136");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, classTable) == 168 * 8, "classTable at word 168");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, dbcsExtTable) == 169 * 8, "dbcsExtTable at word 169");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, dbcsExtCount) == 170 * 8, "dbcsExtCount at word 170");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, reserved171) == 171 * 8, "reserved171 at word 171");
NLSSM_STATIC_ASSERT(offsetof(NLSSMHandle, bidiTable) == 176 * 8, "bidiTable at word 176");
/* ---- Module object and version record ------------------------------------ */
typedef struct NLSSMModule {
  char magic[8]; /* "nevo" */
  void *reserved1[2];
  NLSSlot reqVersion;
  NLSSlot version;
  void *host;
  NLSSlot realDestroy;
  void *reserved7[2];
  void *pool;
  NLSSlot create;
  NLSSlot destroyCallback;
} NLSSMModule;

NLSSM_STATIC_ASSERT(sizeof(NLSSMModule) == 12 * 8, "module object is 12 words");
NLSSM_STATIC_ASSERT(offsetof(NLSSMModule, reqVersion) == 3 * 8, "reqVersion at word 3");
NLSSM_STATIC_ASSERT(offsetof(NLSSMModule, version) == 4 * 8, "version at word 4");
NLSSM_STATIC_ASSERT(offsetof(NLSSMModule, host) == 5 * 8, "host at word 5");
NLSSM_STATIC_ASSERT(offsetof(NLSSMModule, realDestroy) == 6 * 8, "realDestroy at word 6");
NLSSM_STATIC_ASSERT(offsetof(NLSSMModule, pool) == 9 * 8, "pool at word 9");
NLSSM_STATIC_ASSERT(offsetof(NLSSMModule, create) == 10 * 8, "create at word 10");
NLSSM_STATIC_ASSERT(offsetof(NLSSMModule, destroyCallback) == 11 * 8, "destroyCallback at word 11");

/* The version record: 26 words, mostly pointers to constant text. */
typedef struct NLSSMVersionInfo {
  const char *version;          /* "V.03.01M0P09072016" */
  const char *buildId;          /* 13 characters: build host and branch */
  const char *empty2;
  int64_t buildTime;            /* seconds since 1970-01-01 UTC */
  const char *nlsExtension;     /* "qvnls" */
  const char *nlsSignature;     /* 7 letters and digits */
  const char *loaderExtension;  /* "qvext" */
  const char *loaderSignature;  /* 18 letters, digits and '-' */
  const char *empty8;
  const char *versionKey;       /* "version" */
  const char *separator;        /* "::" */
  const char *empty11;
  const char *hotfixLabel;      /* "KAL_VERSION_HOTFIX_NUMBER=" blank-padded to 65 */
  const char *hotfixSignature;  /* 13 letters and digits */
  const char *imageLabel;       /* "VERCON_IMAGE_DESCRIPTION=" blank-padded to 65 */
  const char *imageName;        /* "hdlno" */
  const char *buildDate;        /* "Wed Sep  7 22:26:00 EDT 2016" */
  uint64_t reserved[9];
} NLSSMVersionInfo;

NLSSM_STATIC_ASSERT(sizeof(NLSSMVersionInfo) == 26 * 8, "version record is 26 words");
NLSSM_STATIC_ASSERT(offsetof(NLSSMVersionInfo, buildDate) == 16 * 8, "build date at word 16");

/* ---- Module entry ---------------------------------------------------------- */
/* Copies the 208-byte version record (the pointers, not the texts). */
NLSSM_API void qvvercn1(void *destination);
/* Builds the module object in a pool of its own; null on failure. */
NLSSM_API NLSSMModule *qvnlssm(void *host, void *journal);
/* The host version the module requires: 6.1.1. */
NLSSM_API int64_t reqVersion(NLSSMModule *module, int64_t *major, int64_t *minor, int64_t *patch);
/* The module's own interface version: 6.0.0. */
NLSSM_API int64_t version(NLSSMModule *module, int64_t *major, int64_t *minor, int64_t *patch);
NLSSM_API int64_t NLSSMRealDestroy(NLSSMModule *module);

/* ---- Handle creation and release ------------------------------------------ */
NLSSM_API int64_t NLSSMCreate(void *nlsObject, int64_t encodingNumber, void *reserved,
                              NLSSMHandle **outHandle);
NLSSM_API int64_t NLSSMDestroy(NLSSMHandle *handle);
NLSSM_API int64_t NLSSMDestroyCallback(void *entry);

/* ---- Operations common to every class ------------------------------------- */
NLSSM_API int64_t NLSStringInit(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t NLSStringClean(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t stringDupPos(const NLSSMHandle *handle, const NLSString *from, NLSString *to);
NLSSM_API int64_t stringGetPos(const NLSSMHandle *handle, const NLSString *string);
NLSSM_API int64_t stringNextCharB(const NLSSMHandle *handle, NLSString *string, int64_t flag);
/* Builds a one-character record from one byte of encoding 62. */
NLSSM_API int64_t NLSCharInit(const NLSSMHandle *handle, const uint8_t *source, int64_t ignored,
                              NLSChar *record);
NLSSM_API int64_t NLSCharInit_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                   int64_t ignored, NLSChar *record);

/* ---- Kernel primitives -------------------------------------------------------
 * Several take the source before the destination. */
NLSSM_API int64_t skUnsup(void);
NLSSM_API int64_t skStrLen(const uint8_t *string);
NLSSM_API int64_t skStrTLen(const uint32_t *string);
NLSSM_API void skStrCpy(const uint8_t *source, uint8_t *destination);
NLSSM_API void skStrTCpy(const uint32_t *source, uint32_t *destination);
NLSSM_API void skStrUp(uint8_t *bytes, int64_t length);
NLSSM_API void skStrLow(uint8_t *bytes, int64_t length);
NLSSM_API int64_t skMemNot(uint8_t value, const uint8_t *buffer, int64_t length);
NLSSM_API int64_t skMemTNot(uint32_t value, const uint32_t *buffer, int64_t length);
NLSSM_API void skMemSet(uint8_t *buffer, uint8_t value, int64_t length);
NLSSM_API void skMemTSet(uint32_t *buffer, uint32_t value, int64_t length);
NLSSM_API int64_t skMemCmp(const uint8_t *a, const uint8_t *b, int64_t length);
NLSSM_API int64_t skWMemCmp(const uint32_t *a, const uint32_t *b, int64_t length);
NLSSM_API void *skMemCpy(const void *source, void *destination, int64_t length);
NLSSM_API void *skMemSCpy(const void *source, void *destination, int64_t length);
/* allocator: a host object whose slot 3 allocates (object, size, flags). */
NLSSM_API void *skMemDup(const void *source, int64_t length, void *allocator);
NLSSM_API int64_t skMemScan(const uint8_t *buffer, int64_t length, uint8_t byte);
NLSSM_API int64_t skMemNScan(const uint8_t *buffer, int64_t length, uint8_t byte);
NLSSM_API int64_t skMemTNScan(const uint32_t *buffer, int64_t count, uint32_t value);
NLSSM_API int64_t skMissArray(const double *values, int64_t count);

/* ---- Extension version and message forwarders ----------------------------- */
/* The host's service object, kept by qvextent. */
NLSSM_DATA_API void *Exported_QVHandle;
NLSSM_API int64_t qvextver(void *hostHandle, int64_t *major, int64_t *minor);
NLSSM_API int64_t qvextent(void *hostHandle);
NLSSM_API int64_t qvlMessageToBuf(void *messageObject, void *a1, void *a2, void *a3, void *a4,
                                  void *a5, ...);
NLSSM_API int64_t qvlMessageToJnl(void *hostObject, uint32_t messageNumber, void *a1, void *a2,
                                  ...);
NLSSM_API int64_t qvlStatusToBuf(void *hostObject, uint32_t status, void *a1, void *a2, void *a3,
                                 ...);
NLSSM_API int64_t qvlStatusToJnl(void *hostObject, uint32_t messageNumber, uint32_t status, ...);
NLSSM_API int64_t qvlGetLocale(void *hostObject, ...);

/* ---- Character stepping, positioning and counting ------------------------
 * Cursor members (slots 19, 20, 26) move a descriptor's current character:
 * stringNextChar answers the new charIndex or -9, stringSetPos the target
 * index or -99 (pos may be NLSSM_POS_CURRENT or NLSSM_POS_LAST),
 * stringCurCharSize the current character's bytes or -10. */
NLSSM_API int64_t stringNextChar_SBCS(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t stringNextChar_UTF8(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t stringNextChar_WCS2(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t stringNextChar_WCS4(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t stringNextChar_MBCS_modal(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t stringNextChar_MBCS_nonmodal(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t stringNextChar_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t stringNextChar_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, NLSString *string);
NLSSM_API int64_t stringNextChar_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                       NLSString *string);

NLSSM_API int64_t stringSetPos_SBCS(const NLSSMHandle *handle, NLSString *string, int64_t pos,
                                    int64_t delta);
NLSSM_API int64_t stringSetPos_UTF8(const NLSSMHandle *handle, NLSString *string, int64_t pos,
                                    int64_t delta);
NLSSM_API int64_t stringSetPos_WCS2(const NLSSMHandle *handle, NLSString *string, int64_t pos,
                                    int64_t delta);
NLSSM_API int64_t stringSetPos_WCS4(const NLSSMHandle *handle, NLSString *string, int64_t pos,
                                    int64_t delta);
NLSSM_API int64_t stringSetPos_MBCS_modal(const NLSSMHandle *handle, NLSString *string, int64_t pos,
                                          int64_t delta);
NLSSM_API int64_t stringSetPos_MBCS_nonmodal(const NLSSMHandle *handle, NLSString *string,
                                             int64_t pos, int64_t delta);
NLSSM_API int64_t stringSetPos_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, NLSString *string,
                                                    int64_t pos, int64_t delta);
NLSSM_API int64_t stringSetPos_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, NLSString *string,
                                                    int64_t pos, int64_t delta);
NLSSM_API int64_t stringSetPos_MBCS_nonmodal_GB18030(const NLSSMHandle *handle, NLSString *string,
                                                     int64_t pos, int64_t delta);

NLSSM_API int64_t stringCurCharSize_FixedSize(const NLSSMHandle *handle, const NLSString *string);
NLSSM_API int64_t stringCurCharSize_UTF8(const NLSSMHandle *handle, const NLSString *string);
NLSSM_API int64_t stringCurCharSize_WCS2(const NLSSMHandle *handle, const NLSString *string);
NLSSM_API int64_t stringCurCharSize_MBCS_modal(const NLSSMHandle *handle, const NLSString *string);
NLSSM_API int64_t stringCurCharSize_MBCS_nonmodal(const NLSSMHandle *handle,
                                                  const NLSString *string);

/* Size of one character, reading at most `remaining` bytes: at `base`, or
 * at the descriptor's current offset when base is null. 0 when remaining is
 * 0; a malformed character measures 1. The modal probe measures a shift
 * sequence as its own length and a character by the descriptor's kind. */
NLSSM_API int64_t getMBCSCharSZ_UCS2L(const NLSSMHandle *handle, const NLSString *string,
                                      int64_t remaining, const uint8_t *base);
NLSSM_API int64_t getMBCSCharSZ_UCS2B(const NLSSMHandle *handle, const NLSString *string,
                                      int64_t remaining, const uint8_t *base);
NLSSM_API int64_t getMBCSCharSZ_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                     int64_t remaining, const uint8_t *base);
NLSSM_API int64_t getMBCSCharSZ_UTFE(const NLSSMHandle *handle, const NLSString *string,
                                     int64_t remaining, const uint8_t *base);
NLSSM_API int64_t getMBCSCharSZ_EUC_JP(const NLSSMHandle *handle, const NLSString *string,
                                       int64_t remaining, const uint8_t *base);
NLSSM_API int64_t getMBCSCharSZ_EUC_TW(const NLSSMHandle *handle, const NLSString *string,
                                       int64_t remaining, const uint8_t *base);
NLSSM_API int64_t getMBCSCharSZ_GB18030(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t remaining, const uint8_t *base);
NLSSM_API int64_t getMBCSCharSZ_nonmodal(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t remaining, const uint8_t *base);
NLSSM_API int64_t getMBCSCharSZ_modal(const NLSSMHandle *handle, const NLSString *string,
                                      int64_t remaining, const uint8_t *base);

/* Byte offset of character `nChars` (0-based) counted from `startOffset`,
 * or -9 when the text ends first. `state` (may be null) gives the modal
 * shift state at startOffset (0 = single-byte) and receives the kind of the
 * character found (0 when none). */
NLSSM_API int64_t getDBCSPos_modal(const NLSSMHandle *handle, const uint8_t *buffer, int64_t length,
                                   int64_t nChars, int64_t startOffset, uint32_t *state);
NLSSM_API int64_t getDBCSPos_nonmodal(const NLSSMHandle *handle, const uint8_t *buffer,
                                      int64_t length, int64_t nChars, int64_t startOffset,
                                      uint32_t *state);
NLSSM_API int64_t getDBCSPos_nonmodal_EUC_JP(const NLSSMHandle *handle, const uint8_t *buffer,
                                             int64_t length, int64_t nChars, int64_t startOffset,
                                             uint32_t *state);
NLSSM_API int64_t getDBCSPos_nonmodal_EUC_TW(const NLSSMHandle *handle, const uint8_t *buffer,
                                             int64_t length, int64_t nChars, int64_t startOffset,
                                             uint32_t *state);
NLSSM_API int64_t getDBCSPos_nonmodal_GB18030(const NLSSMHandle *handle, const uint8_t *buffer,
                                              int64_t length, int64_t nChars, int64_t startOffset,
                                              uint32_t *state);

/* Character counts (slots 6, 48): status result, count through `count`
 * (partial on 0x803fe82c). Flag bit 4: broken sequences are not counted. */
NLSSM_API int64_t NLSNumChars_SBCS(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_SBCS(const NLSSMHandle *handle, const uint8_t *buffer,
                                    int64_t byteLength, int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumChars_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_UTF8(const NLSSMHandle *handle, const uint8_t *buffer,
                                    int64_t byteLength, int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumChars_UTFE(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_UTFE(const NLSSMHandle *handle, const uint8_t *buffer,
                                    int64_t byteLength, int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumChars_WCS2(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_WCS2(const NLSSMHandle *handle, const uint8_t *buffer,
                                    int64_t byteLength, int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumChars_WCS4(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_WCS4(const NLSSMHandle *handle, const uint8_t *buffer,
                                    int64_t byteLength, int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumChars_MBCS_modal(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *buffer,
                                          int64_t byteLength, int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumChars_MBCS_nonmodal(const NLSSMHandle *handle, const NLSString *string,
                                            int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *buffer,
                                             int64_t byteLength, int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumChars_MBCS_EUC_JP(const NLSSMHandle *handle, const NLSString *string,
                                          int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_MBCS_EUC_JP(const NLSSMHandle *handle, const uint8_t *buffer,
                                           int64_t byteLength, int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumChars_MBCS_EUC_TW(const NLSSMHandle *handle, const NLSString *string,
                                          int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_MBCS_EUC_TW(const NLSSMHandle *handle, const uint8_t *buffer,
                                           int64_t byteLength, int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumChars_MBCS_GB18030(const NLSSMHandle *handle, const NLSString *string,
                                           int64_t flags, int64_t *count);
NLSSM_API int64_t NLSNumCharsS_MBCS_GB18030(const NLSSMHandle *handle, const uint8_t *buffer,
                                            int64_t byteLength, int64_t flags, int64_t *count);

/* Lengths of zero-terminated text (slots 72, 101), in characters and bytes
 * (either output may be null); the byte lengths of characters (slots 102,
 * 40, 114). NLSStringBLength: bytes of the first charCount characters (the
 * text must hold them; a last character that could pair with the next unit
 * reads that unit), or with a negative count of the whole text up to its
 * terminating zero unit. */
NLSSM_API int64_t NLSStringLength_SBCS(const NLSSMHandle *handle, const uint8_t *text,
                                       int64_t *charCount, int64_t *byteCount, int64_t flags);
NLSSM_API int64_t NLSStringByteLength_SBCS(const NLSSMHandle *handle, const NLSString *string,
                                           int64_t charLimit);
NLSSM_API int64_t NLSStringLength_UTF8(const NLSSMHandle *handle, const uint8_t *text,
                                       int64_t *charCount, int64_t *byteCount, int64_t flags);
NLSSM_API int64_t NLSStringByteLength_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                           int64_t charLimit);
NLSSM_API int64_t NLSStringLength_UTFE(const NLSSMHandle *handle, const uint8_t *text,
                                       int64_t *charCount, int64_t *byteCount, int64_t flags);
NLSSM_API int64_t NLSStringByteLength_UTFE(const NLSSMHandle *handle, const NLSString *string,
                                           int64_t charLimit);
NLSSM_API int64_t NLSStringLength_WCS2(const NLSSMHandle *handle, const uint8_t *text,
                                       int64_t *charCount, int64_t *byteCount, int64_t flags);
NLSSM_API int64_t NLSStringByteLength_WCS2(const NLSSMHandle *handle, const NLSString *string,
                                           int64_t charLimit);
NLSSM_API int64_t NLSStringLength_WCS4(const NLSSMHandle *handle, const uint8_t *text,
                                       int64_t *charCount, int64_t *byteCount, int64_t flags);
NLSSM_API int64_t NLSStringByteLength_WCS4(const NLSSMHandle *handle, const NLSString *string,
                                           int64_t charLimit);
NLSSM_API int64_t NLSStringLength_MBCS_modal(const NLSSMHandle *handle, const uint8_t *text,
                                             int64_t *charCount, int64_t *byteCount, int64_t flags);
NLSSM_API int64_t NLSStringByteLength_MBCS_modal(const NLSSMHandle *handle, const NLSString *string,
                                                 int64_t charLimit);
NLSSM_API int64_t NLSStringLength_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *text,
                                                int64_t *charCount, int64_t *byteCount,
                                                int64_t flags);
NLSSM_API int64_t NLSStringByteLength_MBCS_nonmodal(const NLSSMHandle *handle,
                                                    const NLSString *string, int64_t charLimit);
NLSSM_API int64_t NLSStringLength_MBCS_EUC_JP(const NLSSMHandle *handle, const uint8_t *text,
                                              int64_t *charCount, int64_t *byteCount,
                                              int64_t flags);
NLSSM_API int64_t NLSStringByteLength_MBCS_EUC_JP(const NLSSMHandle *handle,
                                                  const NLSString *string, int64_t charLimit);
NLSSM_API int64_t NLSStringLength_MBCS_EUC_TW(const NLSSMHandle *handle, const uint8_t *text,
                                              int64_t *charCount, int64_t *byteCount,
                                              int64_t flags);
NLSSM_API int64_t NLSStringByteLength_MBCS_EUC_TW(const NLSSMHandle *handle,
                                                  const NLSString *string, int64_t charLimit);
NLSSM_API int64_t NLSStringLength_MBCS_GB18030(const NLSSMHandle *handle, const uint8_t *text,
                                               int64_t *charCount, int64_t *byteCount,
                                               int64_t flags);
NLSSM_API int64_t NLSStringByteLength_MBCS_GB18030(const NLSSMHandle *handle,
                                                   const NLSString *string, int64_t charLimit);
NLSSM_API int64_t NLSStringNLength_SBCS(const NLSSMHandle *handle, const uint8_t *text,
                                        int64_t byteLimit, int64_t *charCount, int64_t *byteCount);
NLSSM_API int64_t NLSStringBLength_SBCS(const NLSSMHandle *handle, const uint8_t *text,
                                        int64_t charCount);
NLSSM_API int64_t NLSStringByteLengthC_SBCS(const NLSSMHandle *handle, const uint8_t *buffer,
                                            int64_t byteLength, int64_t flags);
NLSSM_API int64_t NLSStringNLength_UTF8(const NLSSMHandle *handle, const uint8_t *text,
                                        int64_t byteLimit, int64_t *charCount, int64_t *byteCount);
NLSSM_API int64_t NLSStringBLength_UTF8(const NLSSMHandle *handle, const uint8_t *text,
                                        int64_t charCount);
NLSSM_API int64_t NLSStringByteLengthC_UTF8(const NLSSMHandle *handle, const uint8_t *buffer,
                                            int64_t byteLength, int64_t flags);
NLSSM_API int64_t NLSStringNLength_WCS2(const NLSSMHandle *handle, const uint8_t *text,
                                        int64_t byteLimit, int64_t *charCount, int64_t *byteCount);
NLSSM_API int64_t NLSStringBLength_WCS2(const NLSSMHandle *handle, const uint8_t *text,
                                        int64_t charCount);
NLSSM_API int64_t NLSStringByteLengthC_WCS2(const NLSSMHandle *handle, const uint8_t *buffer,
                                            int64_t byteLength, int64_t flags);
NLSSM_API int64_t NLSStringNLength_WCS4(const NLSSMHandle *handle, const uint8_t *text,
                                        int64_t byteLimit, int64_t *charCount, int64_t *byteCount);
NLSSM_API int64_t NLSStringBLength_WCS4(const NLSSMHandle *handle, const uint8_t *text,
                                        int64_t charCount);
NLSSM_API int64_t NLSStringByteLengthC_WCS4(const NLSSMHandle *handle, const uint8_t *buffer,
                                            int64_t byteLength, int64_t flags);
NLSSM_API int64_t NLSStringNLength_MBCS_modal(const NLSSMHandle *handle, const uint8_t *text,
                                              int64_t byteLimit, int64_t *charCount,
                                              int64_t *byteCount);
NLSSM_API int64_t NLSStringBLength_MBCS_modal(const NLSSMHandle *handle, const uint8_t *text,
                                              int64_t charCount);
NLSSM_API int64_t NLSStringByteLengthC_MBCS_modal(const NLSSMHandle *handle, const uint8_t *buffer,
                                                  int64_t byteLength, int64_t flags);
NLSSM_API int64_t NLSStringNLength_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *text,
                                                 int64_t byteLimit, int64_t *charCount,
                                                 int64_t *byteCount);
NLSSM_API int64_t NLSStringBLength_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *text,
                                                 int64_t charCount);
NLSSM_API int64_t NLSStringByteLengthC_MBCS_nonmodal(const NLSSMHandle *handle,
                                                     const uint8_t *buffer, int64_t byteLength,
                                                     int64_t flags);
NLSSM_API int64_t NLSStringNLength_MBCS_EUC_JP(const NLSSMHandle *handle, const uint8_t *text,
                                               int64_t byteLimit, int64_t *charCount,
                                               int64_t *byteCount);
NLSSM_API int64_t NLSStringBLength_MBCS_EUC_JP(const NLSSMHandle *handle, const uint8_t *text,
                                               int64_t charCount);
NLSSM_API int64_t NLSStringByteLengthC_MBCS_EUC_JP(const NLSSMHandle *handle, const uint8_t *buffer,
                                                   int64_t byteLength, int64_t flags);
NLSSM_API int64_t NLSStringNLength_MBCS_EUC_TW(const NLSSMHandle *handle, const uint8_t *text,
                                               int64_t byteLimit, int64_t *charCount,
                                               int64_t *byteCount);
NLSSM_API int64_t NLSStringBLength_MBCS_EUC_TW(const NLSSMHandle *handle, const uint8_t *text,
                                               int64_t charCount);
NLSSM_API int64_t NLSStringByteLengthC_MBCS_EUC_TW(const NLSSMHandle *handle, const uint8_t *buffer,
                                                   int64_t byteLength, int64_t flags);
NLSSM_API int64_t NLSStringNLength_MBCS_GB18030(const NLSSMHandle *handle, const uint8_t *text,
                                                int64_t byteLimit, int64_t *charCount,
                                                int64_t *byteCount);
NLSSM_API int64_t NLSStringBLength_MBCS_GB18030(const NLSSMHandle *handle, const uint8_t *text,
                                                int64_t charCount);
NLSSM_API int64_t NLSStringByteLengthC_MBCS_GB18030(const NLSSMHandle *handle,
                                                    const uint8_t *buffer, int64_t byteLength,
                                                    int64_t flags);

/* Bytes of the first `chars` characters of a raw buffer, never past
 * byteLength. */
NLSSM_API int64_t getDBCSStringLen_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *buffer,
                                                 int64_t byteLength, int64_t chars);
NLSSM_API int64_t getDBCSStringLen_MBCS_EUC_JP(const NLSSMHandle *handle, const uint8_t *buffer,
                                               int64_t byteLength, int64_t chars);
NLSSM_API int64_t getDBCSStringLen_MBCS_EUC_TW(const NLSSMHandle *handle, const uint8_t *buffer,
                                               int64_t byteLength, int64_t chars);
NLSSM_API int64_t getDBCSStringLen_MBCS_GB18030(const NLSSMHandle *handle, const uint8_t *buffer,
                                                int64_t byteLength, int64_t chars);

/* Blank padding (slots 7, 49) and all-blank tests (slots 8, 50). */
NLSSM_API int64_t NLSBlankPad(const NLSSMHandle *handle, int64_t byteCount, NLSString *string,
                              int64_t ignored, int64_t *written);
NLSSM_API int64_t NLSBlankPad_SBCS(const NLSSMHandle *handle, int64_t byteCount, NLSString *string,
                                   int64_t ignored, int64_t *written);
NLSSM_API int64_t NLSBlankPad_WCS(const NLSSMHandle *handle, int64_t byteCount, NLSString *string,
                                  int64_t ignored, int64_t *written);
NLSSM_API int64_t NLSBlankPad_MBCS_modal(const NLSSMHandle *handle, int64_t byteCount,
                                         NLSString *string, int64_t ignored, int64_t *written);
NLSSM_API int64_t NLSBlankPadS(const NLSSMHandle *handle, uint8_t *buffer, int64_t byteCount,
                               int64_t ignored, int64_t *written);
NLSSM_API int64_t NLSBlankPadS_SBCS(const NLSSMHandle *handle, uint8_t *buffer, int64_t byteCount,
                                    int64_t ignored, int64_t *written);
NLSSM_API int64_t NLSBlankPadS_WCS(const NLSSMHandle *handle, uint8_t *buffer, int64_t byteCount,
                                   int64_t ignored, int64_t *written);
NLSSM_API int64_t NLSAllBlanks(const NLSSMHandle *handle, const NLSString *string);
NLSSM_API int64_t NLSAllBlanks_SBCS(const NLSSMHandle *handle, const NLSString *string);
NLSSM_API int64_t NLSAllBlanks_WCS(const NLSSMHandle *handle, const NLSString *string);
NLSSM_API int64_t NLSAllBlanks_MBCS_modal(const NLSSMHandle *handle, const NLSString *string);
NLSSM_API int64_t NLSAllBlanksS(const NLSSMHandle *handle, const uint8_t *buffer,
                                int64_t byteLength);
NLSSM_API int64_t NLSAllBlanksS_SBCS(const NLSSMHandle *handle, const uint8_t *buffer,
                                     int64_t byteLength);
NLSSM_API int64_t NLSAllBlanksS_WCS(const NLSSMHandle *handle, const uint8_t *buffer,
                                    int64_t byteLength);
NLSSM_API int64_t NLSAllBlanksS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *buffer,
                                           int64_t byteLength);

/* UTF-8 toolkit lengths: the sequence length announced by each first byte
 * (continuation bytes 1), and the bytes of the first charCount characters
 * (negative: up to the terminating zero byte). */
NLSSM_DATA_API const uint8_t u8Length[256];
NLSSM_API int64_t qvzsu8ByteLength(const uint8_t *text, int64_t charCount);

/* ---- Catalogue tables ------------------------------------------------------ */
/* The bidirectional table of a single-byte right-to-left encoding (2064 bytes:
 * 256 u32 categories, the page's ( ) [ ] { } < > and their mirrors, 256 u32
 * categories for reordering), or null for any other encoding number. */
NLSSM_API const uint8_t *NLSGetBIDICategorySBCSTab(int32_t encodingNumber);

/* ---- UTF conversions -------------------------------------------------------
 * One-character codecs between UTF-8, UTF-16 and UTF-32, two buffer drivers,
 * a UTF-8 legality test and a UTF-8 length counter. Statuses come back
 * zero-extended in the int64_t result. Out pointers may be null (not written).
 * The decoder and encoder tables they use are internal to the module.
 *
 * Reads past the stated length: some decoders read a fixed number of bytes
 * whatever remains. Each says below how far past `remaining` it may read
 * (counted from source + remaining, for remaining >= 1); a caller that cannot
 * guarantee those bytes are readable pads its buffer by that many bytes.
 * Encoders that write "without a capacity check" may write that many bytes
 * into a smaller destination. */

/* (source, bytes remaining, out code point, out bytes consumed) -> status */
typedef int64_t (*NLSUTFDecoder)(const uint8_t *source, int64_t remaining, uint32_t *codePoint,
                                 int64_t *consumed);
/* (code point, destination, capacity in bytes, out bytes written) -> status */
typedef int64_t (*NLSUTFEncoder)(uint32_t codePoint, uint8_t *destination, int64_t capacity,
                                 int64_t *written);

/* UTF-8 -> code point. Judges the lead byte only: a valid lead (00-7F, C2-F4)
 * takes the continuation bytes it announces unchecked (so overlong E0 80..9F
 * and surrogates ED A0..BF decode); with too few bytes remaining: U+FFFD,
 * consumed = remaining, NLSSM_E_TRUNCATED_SEQUENCE. An invalid lead gives
 * U+FFFD and NLSSM_E_ILL_FORMED and skips the continuation bytes after it, up
 * to the length the lead announces (2 for C0-C1, 4 for F5-F7, 5 for F8-FB, 6
 * for FC-FF) regardless of `remaining`.
 * Reads up to 5 bytes past `remaining` (6 when remaining <= 0). */
NLSSM_API int64_t UTF8_UTF32(const uint8_t *source, int64_t remaining, uint32_t *codePoint,
                             int64_t *consumed);
/* Big-endian UTF-16 -> code point. A lone low surrogate: U+FFFD, consumed 2,
 * NLSSM_E_ILL_FORMED. A high surrogate with remaining < 2: U+FFFD, consumed 1,
 * NLSSM_E_TRUNCATED_SEQUENCE; with remaining 2 or 3 the next unit is read
 * anyway. A high surrogate not followed by a low one: U+FFFD, consumed 4,
 * NLSSM_E_ILL_FORMED. Reads up to 2 bytes past `remaining`. */
NLSSM_API int64_t UTF16_UTF32(const uint8_t *source, int64_t remaining, uint32_t *codePoint,
                              int64_t *consumed);
/* As UTF16_UTF32 with little-endian units. Reads up to 2 bytes past. */
NLSSM_API int64_t UTF16_UTF32_SWAP(const uint8_t *source, int64_t remaining, uint32_t *codePoint,
                                   int64_t *consumed);
/* One big-endian 32-bit unit; consumed 4; never fails. Reads 4 bytes: up to
 * 3 past `remaining`. */
NLSSM_API int64_t COPY_UTF32b(const uint8_t *source, int64_t remaining, uint32_t *codePoint,
                              int64_t *consumed);
/* One 32-bit unit in the machine's order; otherwise as COPY_UTF32b. */
NLSSM_API int64_t COPY_UTF32b_SWAP(const uint8_t *source, int64_t remaining,
                                   uint32_t *codePoint, int64_t *consumed);
/* One UTF-8 character (decoded as UTF8_UTF32) -> one or two UTF-16 units of
 * the machine's order in units[0..1]. Any failure stores the single unit
 * 0xFFFD and returns NLSSM_E_ILL_FORMED. Reads as UTF8_UTF32. */
NLSSM_API int64_t UTF8_UTF16(const uint8_t *source, int64_t remaining, uint16_t *units,
                             int64_t *consumed);

/* Code point -> UTF-8, 1 to 4 bytes. Below 0x80 one byte is written without
 * a capacity check; otherwise a capacity below the length gives written 0 and
 * NLSSM_E_DEST_TOO_SMALL. Values from 0x10000 up (also above 0x10FFFF) take
 * the four-byte form. */
NLSSM_API int64_t UTF32_UTF8(uint32_t codePoint, uint8_t *destination, int64_t capacity,
                             int64_t *written);
/* The low 16 bits as one UTF-16 unit -> UTF-8 as UTF32_UTF8; a surrogate
 * unit becomes its own three-byte sequence. */
NLSSM_API int64_t UTF16_UTF8(uint32_t unit, uint8_t *destination, int64_t capacity,
                             int64_t *written);
/* Big-endian 32-bit unit; capacity < 4: written 0, NLSSM_E_DEST_TOO_SMALL. */
NLSSM_API int64_t COPY_UTF32(uint32_t codePoint, uint8_t *destination, int64_t capacity,
                             int64_t *written);
/* Little-endian 32-bit unit; same check. */
NLSSM_API int64_t COPY_UTF32_SWAP(uint32_t codePoint, uint8_t *destination, int64_t capacity,
                                  int64_t *written);
/* The low 16 bits as one little-endian unit; written 2 without a capacity
 * check. */
NLSSM_API int64_t UTF32_UTF16(uint32_t codePoint, uint8_t *destination, int64_t capacity,
                              int64_t *written);
/* The low 16 bits as one big-endian unit; written 2 without a capacity check. */
NLSSM_API int64_t UTF32_UTF16_SWAP(uint32_t codePoint, uint8_t *destination, int64_t capacity,
                                   int64_t *written);
/* Code point -> little-endian UTF-16. Below 0x10000 one unit, written 2
 * without a capacity check; otherwise a surrogate pair (written 4) or, with
 * capacity < 4, NLSSM_E_DEST_TOO_SMALL and `written` left untouched. */
NLSSM_API int64_t UTF32_UTF16s(uint32_t codePoint, uint8_t *destination, int64_t capacity,
                               int64_t *written);
/* As UTF32_UTF16s with big-endian units. */
NLSSM_API int64_t UTF32_UTF16s_SWAP(uint32_t codePoint, uint8_t *destination, int64_t capacity,
                                    int64_t *written);

/* Copies min(sourceBytes, capacity) bytes; NLSSM_E_DEST_TOO_SMALL when the
 * source is longer than the capacity (the part that fits is still copied). */
NLSSM_API int64_t COPY_UTF(const uint8_t *source, int64_t sourceBytes, uint8_t *destination,
                           int64_t capacity, int64_t *written);

/* Assemble 16 or 32 bits from bytes: Byte2Word and Byte2DWord little-endian,
 * their _swap forms big-endian; BYTE_UTF16_UTF32 big-endian 16 bits, its
 * _SWAP form little-endian. Read exactly 2 or 4 bytes. */
NLSSM_API uint16_t Byte2Word(const uint8_t *bytes);
NLSSM_API uint16_t Byte2Word_swap(const uint8_t *bytes);
NLSSM_API uint32_t Byte2DWord(const uint8_t *bytes);
NLSSM_API uint32_t Byte2DWord_swap(const uint8_t *bytes);
NLSSM_API uint32_t BYTE_UTF16_UTF32(const uint8_t *bytes);
NLSSM_API uint32_t BYTE_UTF16_UTF32_SWAP(const uint8_t *bytes);

/* Decodes `source` with `decoder` and stores each code point with `encoder`
 * in a 4-byte slot of `destination`: at most capacity / 4 characters. Stops at
 * the first decoder or encoder failure and returns that status (the failing
 * character is not stored), else 0. `written` = 4 x characters stored. Reads
 * past sourceBytes as far as the decoder does (UTF8_UTF32: 5, UTF16_UTF32: 2,
 * COPY_UTF32b: 3). Writes stay inside the capacity with the encoders above. */
NLSSM_API int64_t ConvertToUTF32(const void *source, int64_t sourceBytes, void *destination,
                                 int64_t capacity, int64_t *written, NLSUTFDecoder decoder,
                                 NLSUTFEncoder encoder);
/* Encodes sourceBytes / 4 units of `source` (read with `decoder`, whose
 * status is ignored) with `encoder` until the capacity is used up. Note the
 * argument order: encoder first. Every step hands the encoder the destination
 * itself at the running offset, with the capacity that remains. Returns the
 * encoder's failing status, else 0; `written` = total bytes written. When less
 * room remains than one of the module's encoders writes without a capacity
 * check (UTF32_UTF8 and UTF16_UTF8: 1 byte, the UTF-16 encoders: 2), the loop
 * stops with NLSSM_E_DEST_TOO_SMALL before calling it; any other encoder is
 * trusted to keep within the capacity it is given. Reads no byte past
 * sourceBytes rounded down to whole units. */
NLSSM_API int64_t ConvertFromUTF32(const void *source, int64_t sourceBytes, void *destination,
                                   int64_t capacity, int64_t *written, NLSUTFEncoder encoder,
                                   NLSUTFDecoder decoder);

/* 1 when the `length` bytes (the length the lead byte announces) are one
 * well-formed UTF-8 character, else 0. Lengths other than 1-4 are legal
 * without reading. Continuation bytes 3, 2, 1 are checked in that order, the
 * failing one stored in `badIndex` (else `length`); then byte 1 against the
 * lead (E0 needs >= A0, ED <= 9F, F0 >= 90; no upper bound after F4), then the
 * lead itself. Reads exactly `length` bytes. */
NLSSM_API int64_t isLegalUTF8(const uint8_t *bytes, int64_t length, int64_t *badIndex);

/* Total UTF-8 bytes of `count` 32-bit characters: 1 up to 0x7F, 2 up to
 * 0x7FF, 3 below 0x10000, else 4. Null or count <= 0 gives 0. Reads exactly
 * `count` units. */
NLSSM_API int64_t GET_UTF8_LEN_FROM_QVCHAR(const uint32_t *chars, int64_t count);

/* Handle-bound converters: one character of a UTF-8 or UTF-EBCDIC handle's
 * text to a 32-bit code point (the machine's order) and back, through the
 * UTF transcoders of the host NLS object in the handle's `owner`. These take
 * no length: the lead byte alone says how many bytes are read, so a caller
 * whose text may end inside a character pads it as stated. */

/* UTF-8 -> code point. Hands the lead byte and the 0-5 bytes it announces
 * (C0-DF 1, E0-EF 2, F0-F7 3, F8-FB 4, FC-FF 5) to the host; answers that
 * byte count, or 0 when the host rejects them (bad continuation, overlong,
 * surrogate, above U+10FFFF, a stray continuation byte). Reads up to 6 bytes:
 * up to 5 past the lead, whatever the text's length. A null source or
 * destination answers 0. */
NLSSM_API int64_t FromUTF8(const NLSSMHandle *handle, const uint8_t *source, uint32_t *codePoint);
/* UTF-EBCDIC -> code point, as FromUTF8: the lead byte announces 0-4 more
 * bytes (reads up to 5 bytes: up to 4 past the lead). A trailing byte or an
 * unused lead answers 0 and leaves the destination unwritten. */
NLSSM_API int64_t FromUTFE(const NLSSMHandle *handle, const uint8_t *source, uint32_t *codePoint);
/* Code point -> UTF-8. Answers the length of the code point's form, 1 (below
 * 0x80), 2, 3 (below 0x10000), 4 (below 0x200000), 5 (below 0x4000000) or 6,
 * and lets the host write at most that many bytes; a value the host cannot
 * encode (a surrogate, above U+10FFFF) leaves the destination unwritten and
 * still answers its length. The destination takes up to 6 bytes. A null
 * destination answers 0. */
NLSSM_API int64_t ToUTF8(const NLSSMHandle *handle, uint32_t codePoint, uint8_t *destination);
/* Code point -> UTF-EBCDIC, as ToUTF8 with lengths 1 (below 0xA0), 2 (below
 * 0x400), 3 (below 0x4000), 4 (below 0x40000) or 5; up to 5 bytes. */
NLSSM_API int64_t ToUTFE(const NLSSMHandle *handle, uint32_t codePoint, uint8_t *destination);

/* GetNumBytes: the target of `count` characters lies outside the text. */
#define NLSSM_GETNUMBYTES_OUTSIDE 0xFFFFFF9Du
/* Bytes from the descriptor's current character to the start of the
 * character `count` characters on, found by moving a copy of the descriptor
 * through the handle's stringSetPos (any class). `state` (may be null)
 * receives that character's charKind (modal text: its shift state). Count 0:
 * the bytes up to `length`, and the descriptor's own charKind. When the
 * target lies past the text (including exactly one past its last character)
 * `byteCount` gets the bytes up to `length`, `state` is not written and the
 * result is NLSSM_GETNUMBYTES_OUTSIDE. The fourth argument is ignored. Null
 * handle, descriptor or byteCount: NLSSM_E_NULL_ARGUMENT. Reads the text as
 * the handle's stringSetPos does. */
NLSSM_API int64_t GetNumBytes(const NLSSMHandle *handle, const NLSString *string, int64_t count,
                              int64_t reserved, int64_t *byteCount, uint32_t *state);

/* ---- UTF-8 toolkit ---- */
/* Standalone UTF-8 string functions over (text, byteLength) pairs; a text
 * may be null only when its length is 0. Text is judged by Unicode's rule
 * for well-formed UTF-8 (no overlong forms, surrogates or code points above
 * U+10FFFF). An ill-formed stretch counts as one character: its maximal
 * subpart, the longest start of a well-formed sequence that it is, or a
 * single byte when its first byte starts none (the bytes a decoder replaces
 * by one U+FFFD). u8Length and qvzsu8ByteLength (above, with the counting
 * members) instead trust each first byte. */

/* The length of the longest well-formed start of the text: byteLength when
 * the whole text is well formed, else the offset of the first byte of the
 * first ill-formed sequence (a sequence cut short by the end of the text is
 * ill formed). -1 for a negative length, or a null text that has bytes. */
NLSSM_API int64_t qvzsu8Validate(const uint8_t *text, int64_t byteLength);
/* The number of characters in the text. -1 for bad arguments. */
NLSSM_API int64_t qvzsu8Length(const uint8_t *text, int64_t byteLength);
/* The byte offset of character charIndex (0-based); byteLength when
 * charIndex is the number of characters; -1 when it is more, negative, or
 * the arguments are bad. */
NLSSM_API int64_t qvzsu8Offset(const uint8_t *text, int64_t byteLength, int64_t charIndex);

/* Options of the case mappings: the full mappings (one character to up to
 * three: U+00DF to "SS" in upper case and "ss" folded, U+0130 to "i" and
 * U+0307 in lower case), rather than the simple one-to-one mappings. */
#define QVZSU8_FULL 1u
/* Upper case, lower case and case folding of src into dst. Mappings are
 * those of the Unicode character database without language or context
 * (final sigma is not treated apart). The destination must not overlap the
 * source. A character's mapping is stored whole or not at all; once one
 * does not fit, nothing more is stored. *written (if not null) gets the
 * bytes stored; *needed (if not null) the bytes the whole mapping takes, so
 * *needed - byteLength is the change in length, and dst may be null with
 * capacity 0 to ask for it. Ill-formed stretches are copied unchanged.
 * Returns 0; 0x803fe807 when the mapping did not fit; 0x803fe808 when it
 * fitted but the source holds ill-formed UTF-8; 0x803fe818 for a negative
 * capacity or length; 0x803fe82a for a null src or dst that has bytes;
 * 0x803fe82e for options other than QVZSU8_FULL. */
NLSSM_API int64_t qvzsu8Upper(uint8_t *dst, int64_t capacity, const uint8_t *src,
                              int64_t byteLength, uint32_t options, int64_t *written,
                              int64_t *needed);
NLSSM_API int64_t qvzsu8Lower(uint8_t *dst, int64_t capacity, const uint8_t *src,
                              int64_t byteLength, uint32_t options, int64_t *written,
                              int64_t *needed);
NLSSM_API int64_t qvzsu8Fold(uint8_t *dst, int64_t capacity, const uint8_t *src, int64_t byteLength,
                             uint32_t options, int64_t *written, int64_t *needed);
/* The simple upper-case, lower-case and folded form of one code point;
 * code points without one (and values that are not code points) map to
 * themselves. */
NLSSM_API uint32_t qvzsu8UpperChar(uint32_t codePoint);
NLSSM_API uint32_t qvzsu8LowerChar(uint32_t codePoint);
NLSSM_API uint32_t qvzsu8FoldChar(uint32_t codePoint);

/* Order of two texts: -1, 0 or 1. qvzsu8Compare orders the bytes, which for
 * well-formed UTF-8 is code point order, and a text before any longer text
 * it begins. qvzsu8CaseCompare orders the texts' full case foldings the
 * same way, so "STRASSE", "strasse" and "stra" U+00DF "e" are equal; ill-formed
 * stretches compare as their bytes. A null text or a negative length counts
 * as empty. */
NLSSM_API int64_t qvzsu8Compare(const uint8_t *a, int64_t aLength, const uint8_t *b,
                                int64_t bLength);
NLSSM_API int64_t qvzsu8CaseCompare(const uint8_t *a, int64_t aLength, const uint8_t *b,
                                    int64_t bLength);
/* The byte offset of the first occurrence of pattern in text, 0 for an
 * empty pattern, -1 when there is none or the arguments are bad. Matching
 * is binary; a well-formed pattern only matches at character boundaries of
 * well-formed text. */
NLSSM_API int64_t qvzsu8Find(const uint8_t *text, int64_t byteLength, const uint8_t *pattern,
                             int64_t patternLength);

/* ---- Case mapping and normalization --------------------------------------- */
/* NLSStringLower and NLSStringUpper map text to lower or upper case in place
 * and return a status: 0 (also when there is nothing to do) or one of:
 * NLSSM_E_BAD_OPTIONS (options above 7: UTF-EBCDIC, EUC-TW and GB18030
 * members), NLSSM_E_NULL_ARGUMENT (null descriptor, or null buffer with a
 * non-zero length). Options: bit 4 also maps double-byte characters through
 * the handle's double-byte case table (multi-byte members); the other bits do
 * nothing here.
 * - plain form: from the descriptor's current character, at most `count`
 *   characters (0 or negative: to `length`); nothing for an empty text or
 *   no current character;
 * - S form: the whole buffer of `byteLength` bytes (0 or negative: nothing);
 * - C form: exactly `count` characters from the start of the buffer (0 or
 *   negative: nothing); no byte limit is checked, so the caller vouches for
 *   the characters (single byte: `count` bytes).
 * Single-byte text goes through the case table; byte-table multi-byte text
 * through it for single bytes; Unicode text through the host's
 * character-information query. UTF-8 members keep the text's byte length: a
 * shorter mapping moves the rest down and blanks (0x20) the freed bytes at
 * the end (not in the C form); a longer one moves it up, and a character
 * whose mapping would run past the end of the text ends the walk. A byte
 * sequence that does not decode ends the walk with status 0. UTF-EBCDIC
 * members map in place, the new form's length being the step; a mapping
 * that would run past the end leaves its character; NLSStringUpper_UTFE
 * ignores the count. */
NLSSM_API int64_t NLSStringLower_SBCS(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                      uint32_t options);
NLSSM_API int64_t NLSStringLowerS_SBCS(const NLSSMHandle *handle, uint8_t *buffer,
                                       int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_SBCS(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringLower_MBCS_nonmodal(const NLSSMHandle *handle, NLSString *string,
                                               int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLowerS_MBCS_nonmodal(const NLSSMHandle *handle, uint8_t *buffer,
                                                int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_MBCS_nonmodal(const NLSSMHandle *handle, uint8_t *buffer,
                                                int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLower_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, NLSString *string,
                                                      int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLowerS_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, uint8_t *buffer,
                                                       int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, uint8_t *buffer,
                                                       int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLower_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, NLSString *string,
                                                      int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLowerS_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, uint8_t *buffer,
                                                       int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, uint8_t *buffer,
                                                       int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLower_MBCS_nonmodal_GB18030(const NLSSMHandle *handle, NLSString *string,
                                                       int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLowerS_MBCS_nonmodal_GB18030(const NLSSMHandle *handle, uint8_t *buffer,
                                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_MBCS_nonmodal_GB18030(const NLSSMHandle *handle, uint8_t *buffer,
                                                        int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLower_MBCS_modal(const NLSSMHandle *handle, NLSString *string,
                                            int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLowerS_MBCS_modal(const NLSSMHandle *handle, uint8_t *buffer,
                                             int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_MBCS_modal(const NLSSMHandle *handle, uint8_t *buffer,
                                             int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringLower_WCS2L(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringLowerS_WCS2L(const NLSSMHandle *handle, uint8_t *buffer,
                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_WCS2L(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                        uint32_t options);
NLSSM_API int64_t NLSStringLower_WCS2B(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringLowerS_WCS2B(const NLSSMHandle *handle, uint8_t *buffer,
                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_WCS2B(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                        uint32_t options);
NLSSM_API int64_t NLSStringLower_WCS4L(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringLowerS_WCS4L(const NLSSMHandle *handle, uint8_t *buffer,
                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_WCS4L(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                        uint32_t options);
NLSSM_API int64_t NLSStringLower_WCS4B(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringLowerS_WCS4B(const NLSSMHandle *handle, uint8_t *buffer,
                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_WCS4B(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                        uint32_t options);
NLSSM_API int64_t NLSStringLower_UTF8(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                      uint32_t options);
NLSSM_API int64_t NLSStringLowerS_UTF8(const NLSSMHandle *handle, uint8_t *buffer,
                                       int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringLowerC_UTF8(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringLower_UTFE(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                      uint32_t options);
NLSSM_API int64_t NLSStringLowerS_UTFE(const NLSSMHandle *handle, uint8_t *buffer,
                                       int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpper_SBCS(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                      uint32_t options);
NLSSM_API int64_t NLSStringUpperS_SBCS(const NLSSMHandle *handle, uint8_t *buffer,
                                       int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_SBCS(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringUpper_MBCS_nonmodal(const NLSSMHandle *handle, NLSString *string,
                                               int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpperS_MBCS_nonmodal(const NLSSMHandle *handle, uint8_t *buffer,
                                                int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_MBCS_nonmodal(const NLSSMHandle *handle, uint8_t *buffer,
                                                int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpper_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, NLSString *string,
                                                      int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpperS_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, uint8_t *buffer,
                                                       int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, uint8_t *buffer,
                                                       int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpper_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, NLSString *string,
                                                      int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpperS_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, uint8_t *buffer,
                                                       int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, uint8_t *buffer,
                                                       int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpper_MBCS_nonmodal_GB18030(const NLSSMHandle *handle, NLSString *string,
                                                       int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpperS_MBCS_nonmodal_GB18030(const NLSSMHandle *handle, uint8_t *buffer,
                                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_MBCS_nonmodal_GB18030(const NLSSMHandle *handle, uint8_t *buffer,
                                                        int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpper_MBCS_modal(const NLSSMHandle *handle, NLSString *string,
                                            int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpperS_MBCS_modal(const NLSSMHandle *handle, uint8_t *buffer,
                                             int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_MBCS_modal(const NLSSMHandle *handle, uint8_t *buffer,
                                             int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringUpper_WCS2L(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringUpperS_WCS2L(const NLSSMHandle *handle, uint8_t *buffer,
                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_WCS2L(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                        uint32_t options);
NLSSM_API int64_t NLSStringUpper_WCS2B(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringUpperS_WCS2B(const NLSSMHandle *handle, uint8_t *buffer,
                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_WCS2B(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                        uint32_t options);
NLSSM_API int64_t NLSStringUpper_WCS4L(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringUpperS_WCS4L(const NLSSMHandle *handle, uint8_t *buffer,
                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_WCS4L(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                        uint32_t options);
NLSSM_API int64_t NLSStringUpper_WCS4B(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringUpperS_WCS4B(const NLSSMHandle *handle, uint8_t *buffer,
                                        int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_WCS4B(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                        uint32_t options);
NLSSM_API int64_t NLSStringUpper_UTF8(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                      uint32_t options);
NLSSM_API int64_t NLSStringUpperS_UTF8(const NLSSMHandle *handle, uint8_t *buffer,
                                       int64_t byteLength, uint32_t options);
NLSSM_API int64_t NLSStringUpperC_UTF8(const NLSSMHandle *handle, uint8_t *buffer, int64_t count,
                                       uint32_t options);
NLSSM_API int64_t NLSStringUpper_UTFE(const NLSSMHandle *handle, NLSString *string, int64_t count,
                                      uint32_t options);
NLSSM_API int64_t NLSStringUpperS_UTFE(const NLSSMHandle *handle, uint8_t *buffer,
                                       int64_t byteLength, uint32_t options);

/* NLSStringNormalize copies the source (from its current character, at most
 * `count` characters, 0 = all) into the destination at its current offset
 * (clamped to 0), mapped to upper case with option bit 2, else to lower case;
 * option bit 4 maps double-byte characters too. Statuses: NLSSM_E_DEST_TOO_SMALL
 * (capacity 0, or the copy was cut to the room: the part that fits is
 * written and mapped), NLSSM_E_BAD_OPTIONS, NLSSM_E_NULL_ARGUMENT (null
 * descriptor or buffer). Member differences:
 * - _SBCS: grows the destination's length to cover the copy;
 * - _MBCS_nonmodal: character by character while they fit; never reports
 *   truncation and leaves the destination's length;
 * - _MBCS_modal: nothing for an empty source or destination (length 0); first
 *   brings the destination into the source's shift mode, copies the shift
 *   sequences through, and sets the destination's length to the end of the
 *   copy;
 * - _WCS2L/B, _WCS4L/B, _UTFE, _MBCS_nonmodal_EUC_JP/_EUC_TW/_GB18030: refuse
 *   options above 7 or with bits 1 and 2 both set (EUC-JP: any of bits 1, 2
 *   and 4); copy, reposition the destination on its current character, then
 *   run the handle's NLSStringUpper or NLSStringLower on it;
 * - _UTF8: checks the options and runs the handle's NLSStringUpper or
 *   NLSStringLower on the destination; the source is not read. */
NLSSM_API int64_t NLSStringNormalize_SBCS(const NLSSMHandle *handle, const NLSString *source,
                                          NLSString *destination, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringNormalize_MBCS_nonmodal(const NLSSMHandle *handle,
                                                   const NLSString *source, NLSString *destination,
                                                   int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringNormalize_MBCS_modal(const NLSSMHandle *handle, const NLSString *source,
                                                NLSString *destination, int64_t count,
                                                uint32_t options);
NLSSM_API int64_t NLSStringNormalize_WCS2L(const NLSSMHandle *handle, const NLSString *source,
                                           NLSString *destination, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringNormalize_WCS2B(const NLSSMHandle *handle, const NLSString *source,
                                           NLSString *destination, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringNormalize_WCS4L(const NLSSMHandle *handle, const NLSString *source,
                                           NLSString *destination, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringNormalize_WCS4B(const NLSSMHandle *handle, const NLSString *source,
                                           NLSString *destination, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringNormalize_UTFE(const NLSSMHandle *handle, const NLSString *source,
                                          NLSString *destination, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringNormalize_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                          const NLSString *source,
                                                          NLSString *destination, int64_t count,
                                                          uint32_t options);
NLSSM_API int64_t NLSStringNormalize_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                          const NLSString *source,
                                                          NLSString *destination, int64_t count,
                                                          uint32_t options);
NLSSM_API int64_t NLSStringNormalize_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                           const NLSString *source,
                                                           NLSString *destination, int64_t count,
                                                           uint32_t options);
NLSSM_API int64_t NLSStringNormalize_UTF8(const NLSSMHandle *handle, const NLSString *source,
                                          NLSString *destination, int64_t count, uint32_t options);
/* NLSStringNormalizeS maps n = min(sourceBytes, capacity) bytes of the source
 * into the destination (they must not overlap unless equal) and stores n
 * through `written` (may be null); NLSSM_E_DEST_TOO_SMALL when the capacity is
 * below the source length. _MBCS_modal starts single-byte, follows the
 * source's shift sequences without copying them and stores nothing; a
 * non-modal lead byte in the last position is copied unchanged. The generic
 * members check options as above, copy, then run the handle's
 * NLSStringUpperS or NLSStringLowerS on the n destination bytes. _UTF8 runs
 * NLSStringUpperS or NLSStringLowerS on the destination over the source
 * length (kept within the capacity), without copying, and stores the source
 * length. */
NLSSM_API int64_t NLSStringNormalizeS_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceBytes, uint8_t *destination,
                                           int64_t capacity, int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_MBCS_nonmodal(const NLSSMHandle *handle,
                                                    const uint8_t *source, int64_t sourceBytes,
                                                    uint8_t *destination, int64_t capacity,
                                                    int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *source,
                                                 int64_t sourceBytes, uint8_t *destination,
                                                 int64_t capacity, int64_t *written,
                                                 uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_WCS2L(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceBytes, uint8_t *destination,
                                            int64_t capacity, int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_WCS2B(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceBytes, uint8_t *destination,
                                            int64_t capacity, int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_WCS4L(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceBytes, uint8_t *destination,
                                            int64_t capacity, int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_WCS4B(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceBytes, uint8_t *destination,
                                            int64_t capacity, int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_UTFE(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceBytes, uint8_t *destination,
                                           int64_t capacity, int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                           const uint8_t *source,
                                                           int64_t sourceBytes,
                                                           uint8_t *destination, int64_t capacity,
                                                           int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                           const uint8_t *source,
                                                           int64_t sourceBytes,
                                                           uint8_t *destination, int64_t capacity,
                                                           int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                            const uint8_t *source,
                                                            int64_t sourceBytes,
                                                            uint8_t *destination, int64_t capacity,
                                                            int64_t *written, uint32_t options);
NLSSM_API int64_t NLSStringNormalizeS_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceBytes, uint8_t *destination,
                                           int64_t capacity, int64_t *written, uint32_t options);


/* ---- Equality, inequality and ordering comparison ------------------------- */
/* Equality (slots 10, 52, 105). 1 when equal, else 0; every failure (a null
 * or unpositioned operand, bad options, no work buffer) answers 0. Plain forms
 * compare each operand from its current character to its length; S forms
 * take byte lengths; C forms take lengths in characters (no byte limit is
 * checked; the SBCS C member is the S member).
 * Options: 0 folds through lowerTable and needs equal lengths; bit 1 folds
 * through lowerTable and lets the longer operand carry trailing blanks; bit 2
 * (bit 1 clear) folds through upperTable; any other value answers 0.
 * SBCS, modal and non-modal members: a positive count limits both operands
 * to count bytes when it does not exceed the shorter one. Bytes that differ
 * at the start of a character are folded as single bytes; a character whose
 * first bytes agree must agree whole (in modal text nothing in double-byte
 * mode is folded). With bit 1 the longer operand's bytes from twice the
 * common length on must be the blank byte (the bytes right after the common
 * part are not tested). Non-modal character lengths follow the handle's
 * lead/trail flags, or the EUC-JP (134), EUC-TW (119, 120, 159) and GB18030
 * (205) rules. Modal descriptors start in the shift state of their charKind
 * and must start in the same one.
 * UTF-8 members (the C member reads UTF-EBCDIC on UTF-EBCDIC handles): fold
 * through the host's default case folding, read only option bit 1, and take
 * a positive count as a number of characters of each operand; with bit 1 the
 * rest of the longer operand must be blank bytes. A malformed sequence equals
 * only identical bytes.
 * Generic members (WCS2, WCS4): copy both operands into work buffers (1024
 * bytes each on the stack, else the handle's pool) and lower-case them there
 * through the owner's character query; count in bytes; two empty operands are
 * not equal; with bit 1 the rest of the longer operand must be whole blank
 * units. */
NLSSM_API int64_t NLSStringEquals_SBCS(const NLSSMHandle *handle, const NLSString *a,
                                       const NLSString *b, int64_t count, int32_t options);
NLSSM_API int64_t NLSStringEqualsS_SBCS(const NLSSMHandle *handle, const uint8_t *a,
                                        int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                        int32_t options);
NLSSM_API int64_t NLSStringEqualsC_SBCS(const NLSSMHandle *handle, const uint8_t *a,
                                        int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                        int32_t options);
NLSSM_API int64_t NLSStringEquals_UTF8(const NLSSMHandle *handle, const NLSString *a,
                                       const NLSString *b, int64_t count, int32_t options);
NLSSM_API int64_t NLSStringEqualsS_UTF8(const NLSSMHandle *handle, const uint8_t *a,
                                        int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                        int32_t options);
NLSSM_API int64_t NLSStringEqualsC_UTF8(const NLSSMHandle *handle, const uint8_t *a,
                                        int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                        int32_t options);
NLSSM_API int64_t NLSStringEquals(const NLSSMHandle *handle, const NLSString *a, const NLSString *b,
                                  int64_t count, int32_t options);
NLSSM_API int64_t NLSStringEqualsS(const NLSSMHandle *handle, const uint8_t *a, int64_t lengthA,
                                   const uint8_t *b, int64_t lengthB, int32_t options);
NLSSM_API int64_t NLSStringEqualsC(const NLSSMHandle *handle, const uint8_t *a, int64_t lengthA,
                                   const uint8_t *b, int64_t lengthB, int32_t options);
NLSSM_API int64_t NLSStringEquals_MBCS_modal(const NLSSMHandle *handle, const NLSString *a,
                                             const NLSString *b, int64_t count, int32_t options);
NLSSM_API int64_t NLSStringEqualsS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *a,
                                              int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                              int32_t options);
NLSSM_API int64_t NLSStringEqualsC_MBCS_modal(const NLSSMHandle *handle, const uint8_t *a,
                                              int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                              int32_t options);
NLSSM_API int64_t NLSStringEquals_MBCS_nonmodal(const NLSSMHandle *handle, const NLSString *a,
                                                const NLSString *b, int64_t count, int32_t options);
NLSSM_API int64_t NLSStringEqualsS_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *a,
                                                 int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                                 int32_t options);
NLSSM_API int64_t NLSStringEqualsC_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *a,
                                                 int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                                 int32_t options);

/* Inequality (slots 36, 61, 37, 62): the position of the first character of
 * the string that is not one of the characters of the set, or -1 when there
 * is none (an empty string gives -1). A null or unpositioned operand gives 0.
 * Plain forms: the string from its current character, limited to `count`
 * characters when positive; the set from its current character, limited to
 * `setLength` characters when positive. S forms take byte lengths.
 * SBCS: byte offsets; an empty set gives 0 for a non-empty string, and the S
 * member gives 0 for a set length of 0. The other members walk characters of
 * their class (UTF-8 on UTF-8 handles and UTF-EBCDIC on UTF-EBCDIC handles,
 * WCS2 surrogate pairs, modal shift states, non-modal lead bytes as Equals)
 * and answer character positions; a character is in the set when the set
 * holds the same bytes in the same shift mode. UTF-8 positions count the
 * bytes that can start a character (00-7F, C2-F4).
 * Lit forms: the set is a literal in encoding 62, converted through the
 * handle's charConverter and passed whole to the handle's NotEqual or
 * NotEqualS slot; `options` is reserved and ignored. When the converted set
 * cannot be had (no work buffer, conversion failure) the result is
 * NLSSM_COUNT_NO_MEMORY. */
NLSSM_API int64_t NLSStringNotEqual_SBCS(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t count, const NLSString *set, int64_t setLength);
NLSSM_API int64_t NLSStringNotEqualS_SBCS(const NLSSMHandle *handle, const uint8_t *string,
                                          int64_t length, const uint8_t *set, int64_t setLength);
NLSSM_API int64_t NLSStringNotEqual_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t count, const NLSString *set, int64_t setLength);
NLSSM_API int64_t NLSStringNotEqualS_UTF8(const NLSSMHandle *handle, const uint8_t *string,
                                          int64_t length, const uint8_t *set, int64_t setLength);
NLSSM_API int64_t NLSStringNotEqual_MBCS(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t count, const NLSString *set, int64_t setLength);
NLSSM_API int64_t NLSStringNotEqualS_MBCS(const NLSSMHandle *handle, const uint8_t *string,
                                          int64_t length, const uint8_t *set, int64_t setLength);
NLSSM_API int64_t NLSStringNotEqual_WCS4(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t count, const NLSString *set, int64_t setLength);
NLSSM_API int64_t NLSStringNotEqualS_WCS4(const NLSSMHandle *handle, const uint8_t *string,
                                          int64_t length, const uint8_t *set, int64_t setLength);
NLSSM_API int64_t NLSStringNotEqual_MBCS_modal(const NLSSMHandle *handle, const NLSString *string,
                                               int64_t count, const NLSString *set,
                                               int64_t setLength);
NLSSM_API int64_t NLSStringNotEqualS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *string,
                                                int64_t length, const uint8_t *set,
                                                int64_t setLength);
NLSSM_API int64_t NLSStringNotEqualLit(const NLSSMHandle *handle, const NLSString *string,
                                       int64_t count, const uint8_t *literal, int64_t literalLength,
                                       uint32_t options);
NLSSM_API int64_t NLSStringNotEqualLitS(const NLSSMHandle *handle, const uint8_t *string,
                                        int64_t length, const uint8_t *literal,
                                        int64_t literalLength, uint32_t options);

/* Ordering (slots 24, 25, 56, 108, 23, 57, 109). A binary comparison of
 * bytes or code units, optionally folded to one case. Result: 0 when equal,
 * k + 1 when the first operand is greater, -(k + 1) when it is smaller; k is
 * the byte offset from each operand's start at which the order was decided:
 * the first differing byte, the start of the deciding unit (WCS) or, when
 * folding UTF-8/UTF-EBCDIC, of the deciding character; where one operand ends,
 * its length. A null or unpositioned operand gives 0 (with pad an operand
 * without current character is empty).
 * Options: bit 1 pads the shorter operand with blanks (the rest of the
 * longer one decides at its first non-blank, against the blank); bit 2 folds
 * through lowerTable (Unicode members: the owner's lower-case mapping); bit 4
 * through upperTable (upper-case mapping) when bit 2 is clear.
 * SBCS: a positive count limits both operands to count bytes when it does not
 * exceed the shorter one; at a folded difference the raw bytes decide.
 * NLSStringCompare_SBCS starts at each operand's charIndex; without folding
 * and with pad its blank is 0x20 (ASCII sets) or 0x40 (EBCDIC), and in EBCDIC
 * a difference in the common part gives just 1 or -1.
 * Other classes: a positive count takes the first count characters of each
 * operand. Multi-byte sets fold single-byte characters only (the bytes
 * decide); modal descriptors start in the shift state of their charKind and
 * shift sequences are passed over in the blank tail. UTF-8 and UTF-EBCDIC
 * compare bytes (ASCII folded by its letters, other characters through the
 * owner's query; folded values decide). WCS members compare unsigned units in
 * their byte order; a WCS2 high surrogate equal in both is taken with the
 * unit after it (joined, high unit above), and folded values decide.
 * C forms take lengths in characters (no byte limit is checked); null
 * buffers give 0. The class-1 C member reads UTF-EBCDIC on UTF-EBCDIC handles.
 * Lit forms: the literal (encoding 62) is converted through charConverter
 * (2048 bytes on the stack, else the handle's pool) and compared through the
 * CompStr, CompareS or CompStrC member with the literal length as the count
 * (plain form) or the character length (C form), so a plain-form literal is
 * compared with as many characters of A. A null or empty literal gives 0; no
 * work buffer or a failed conversion gives NLSSM_COUNT_NO_MEMORY. */
NLSSM_API int64_t NLSStringCompStr_SBCS(const NLSSMHandle *handle, const NLSString *a,
                                        const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_SBCS(const NLSSMHandle *handle, const NLSString *a,
                                        const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_SBCS(const NLSSMHandle *handle, const uint8_t *a,
                                         int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                         uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_SBCS(const NLSSMHandle *handle, const uint8_t *a,
                                         int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                         uint32_t options);
NLSSM_API int64_t NLSStringCompStr_UTF8(const NLSSMHandle *handle, const NLSString *a,
                                        const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_UTF8(const NLSSMHandle *handle, const NLSString *a,
                                        const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_UTF8(const NLSSMHandle *handle, const uint8_t *a,
                                         int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                         uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_UTF8(const NLSSMHandle *handle, const uint8_t *a,
                                         int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                         uint32_t options);
NLSSM_API int64_t NLSStringCompStr_UTFE(const NLSSMHandle *handle, const NLSString *a,
                                        const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_UTFE(const NLSSMHandle *handle, const NLSString *a,
                                        const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_UTFE(const NLSSMHandle *handle, const uint8_t *a,
                                         int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                         uint32_t options);
NLSSM_API int64_t NLSStringCompStr_WCS2L(const NLSSMHandle *handle, const NLSString *a,
                                         const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_WCS2L(const NLSSMHandle *handle, const NLSString *a,
                                         const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_WCS2L(const NLSSMHandle *handle, const uint8_t *a,
                                          int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                          uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_WCS2L(const NLSSMHandle *handle, const uint8_t *a,
                                          int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                          uint32_t options);
NLSSM_API int64_t NLSStringCompStr_WCS2B(const NLSSMHandle *handle, const NLSString *a,
                                         const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_WCS2B(const NLSSMHandle *handle, const NLSString *a,
                                         const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_WCS2B(const NLSSMHandle *handle, const uint8_t *a,
                                          int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                          uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_WCS2B(const NLSSMHandle *handle, const uint8_t *a,
                                          int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                          uint32_t options);
NLSSM_API int64_t NLSStringCompStr_WCS4L(const NLSSMHandle *handle, const NLSString *a,
                                         const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_WCS4L(const NLSSMHandle *handle, const NLSString *a,
                                         const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_WCS4L(const NLSSMHandle *handle, const uint8_t *a,
                                          int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                          uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_WCS4L(const NLSSMHandle *handle, const uint8_t *a,
                                          int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                          uint32_t options);
NLSSM_API int64_t NLSStringCompStr_WCS4B(const NLSSMHandle *handle, const NLSString *a,
                                         const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_WCS4B(const NLSSMHandle *handle, const NLSString *a,
                                         const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_WCS4B(const NLSSMHandle *handle, const uint8_t *a,
                                          int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                          uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_WCS4B(const NLSSMHandle *handle, const uint8_t *a,
                                          int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                          uint32_t options);
NLSSM_API int64_t NLSStringCompStr_MBCS_modal(const NLSSMHandle *handle, const NLSString *a,
                                              const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_MBCS_modal(const NLSSMHandle *handle, const NLSString *a,
                                              const NLSString *b, int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *a,
                                               int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                               uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_MBCS_modal(const NLSSMHandle *handle, const uint8_t *a,
                                               int64_t lengthA, const uint8_t *b, int64_t lengthB,
                                               uint32_t options);
NLSSM_API int64_t NLSStringCompStr_MBCS_nonmodal(const NLSSMHandle *handle, const NLSString *a,
                                                 const NLSString *b, int64_t count,
                                                 uint32_t options);
NLSSM_API int64_t NLSStringCompare_MBCS_nonmodal(const NLSSMHandle *handle, const NLSString *a,
                                                 const NLSString *b, int64_t count,
                                                 uint32_t options);
NLSSM_API int64_t NLSStringCompareS_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *a,
                                                  int64_t lengthA, const uint8_t *b,
                                                  int64_t lengthB, uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *a,
                                                  int64_t lengthA, const uint8_t *b,
                                                  int64_t lengthB, uint32_t options);
NLSSM_API int64_t NLSStringCompStr_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                        const NLSString *a, const NLSString *b,
                                                        int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                        const NLSString *a, const NLSString *b,
                                                        int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                         const uint8_t *a, int64_t lengthA,
                                                         const uint8_t *b, int64_t lengthB,
                                                         uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                         const uint8_t *a, int64_t lengthA,
                                                         const uint8_t *b, int64_t lengthB,
                                                         uint32_t options);
NLSSM_API int64_t NLSStringCompStr_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                        const NLSString *a, const NLSString *b,
                                                        int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                        const NLSString *a, const NLSString *b,
                                                        int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                         const uint8_t *a, int64_t lengthA,
                                                         const uint8_t *b, int64_t lengthB,
                                                         uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                         const uint8_t *a, int64_t lengthA,
                                                         const uint8_t *b, int64_t lengthB,
                                                         uint32_t options);
NLSSM_API int64_t NLSStringCompStr_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                         const NLSString *a, const NLSString *b,
                                                         int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompare_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                         const NLSString *a, const NLSString *b,
                                                         int64_t count, uint32_t options);
NLSSM_API int64_t NLSStringCompareS_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                          const uint8_t *a, int64_t lengthA,
                                                          const uint8_t *b, int64_t lengthB,
                                                          uint32_t options);
NLSSM_API int64_t NLSStringCompStrC_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                          const uint8_t *a, int64_t lengthA,
                                                          const uint8_t *b, int64_t lengthB,
                                                          uint32_t options);
NLSSM_API int64_t NLSStringCompLit(const NLSSMHandle *handle, const NLSString *a,
                                   const uint8_t *literal, int64_t literalLength, uint32_t options);
NLSSM_API int64_t NLSStringCompLitS(const NLSSMHandle *handle, const uint8_t *a, int64_t lengthA,
                                    const uint8_t *literal, int64_t literalLength,
                                    uint32_t options);
NLSSM_API int64_t NLSStringCompLitC(const NLSSMHandle *handle, const uint8_t *a, int64_t lengthA,
                                    const uint8_t *literal, int64_t literalLength,
                                    uint32_t options);
NLSSM_API int64_t NLSStringCompLit_SBCS(const NLSSMHandle *handle, const NLSString *a,
                                        const uint8_t *literal, int64_t literalLength,
                                        uint32_t options);
NLSSM_API int64_t NLSStringCompLitS_SBCS(const NLSSMHandle *handle, const uint8_t *a,
                                         int64_t lengthA, const uint8_t *literal,
                                         int64_t literalLength, uint32_t options);
NLSSM_API int64_t NLSStringCompLitC_SBCS(const NLSSMHandle *handle, const uint8_t *a,
                                         int64_t lengthA, const uint8_t *literal,
                                         int64_t literalLength, uint32_t options);
NLSSM_API int64_t NLSStringCompLit_MBCS_modal(const NLSSMHandle *handle, const NLSString *a,
                                              const uint8_t *literal, int64_t literalLength,
                                              uint32_t options);
NLSSM_API int64_t NLSStringCompLitS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *a,
                                               int64_t lengthA, const uint8_t *literal,
                                               int64_t literalLength, uint32_t options);
NLSSM_API int64_t NLSStringCompLitC_MBCS_modal(const NLSSMHandle *handle, const uint8_t *a,
                                               int64_t lengthA, const uint8_t *literal,
                                               int64_t literalLength, uint32_t options);


/* ---- Searching, classification and LIKE ----------------------------------- */
/* Searches. Positions are 0-based and count characters from where the
 * scan starts (for single-byte sets, bytes); -1 means not found. A match is
 * always a run of whole characters: it starts and ends at character
 * boundaries of the text, so a byte match inside a multi-byte character is
 * never reported. Shift sequences of modal text are not characters: the
 * same bytes in single- and double-byte mode are different characters.
 *
 * NLSStringIndex (slot 9): the first occurrence of pattern P (from its
 * current character) in S (from its current character; single-byte sets:
 * from charIndex). patternLength limits P (0, negative or above P's size:
 * all of P); it counts bytes for single-byte sets and characters for every
 * other class. -1 when either descriptor has no current character or S is
 * empty. Single-byte sets search an empty pattern as the byte at its start
 * (when the buffer holds one); the other classes find it at 0. */
NLSSM_API int64_t NLSStringIndex_SBCS(const NLSSMHandle *handle, const NLSString *string,
                                      const NLSString *pattern, int64_t patternLength);
NLSSM_API int64_t NLSStringIndex_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                      const NLSString *pattern, int64_t patternChars);
NLSSM_API int64_t NLSStringIndex_UTFE(const NLSSMHandle *handle, const NLSString *string,
                                      const NLSString *pattern, int64_t patternChars);
NLSSM_API int64_t NLSStringIndex_WCS2(const NLSSMHandle *handle, const NLSString *string,
                                      const NLSString *pattern, int64_t patternChars);
NLSSM_API int64_t NLSStringIndex_WCS4(const NLSSMHandle *handle, const NLSString *string,
                                      const NLSString *pattern, int64_t patternChars);
NLSSM_API int64_t NLSStringIndex_MBCS_modal(const NLSSMHandle *handle, const NLSString *string,
                                            const NLSString *pattern, int64_t patternChars);
NLSSM_API int64_t NLSStringIndex_MBCS_nonmodal(const NLSSMHandle *handle, const NLSString *string,
                                               const NLSString *pattern, int64_t patternChars);
NLSSM_API int64_t NLSStringIndex_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                      const NLSString *string,
                                                      const NLSString *pattern,
                                                      int64_t patternChars);
NLSSM_API int64_t NLSStringIndex_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                      const NLSString *string,
                                                      const NLSString *pattern,
                                                      int64_t patternChars);
NLSSM_API int64_t NLSStringIndex_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                       const NLSString *string,
                                                       const NLSString *pattern,
                                                       int64_t patternChars);
/* NLSStringIndexS (slot 51): raw buffers, lengths in bytes. A pattern
 * length of 0 gives 0; then a text length of 0 (or a null buffer) gives
 * -1. */
NLSSM_API int64_t NLSStringIndexS_SBCS(const NLSSMHandle *handle, const uint8_t *string,
                                       int64_t stringLength, const uint8_t *pattern,
                                       int64_t patternLength);
NLSSM_API int64_t NLSStringIndexS_UTF8(const NLSSMHandle *handle, const uint8_t *string,
                                       int64_t stringLength, const uint8_t *pattern,
                                       int64_t patternLength);
NLSSM_API int64_t NLSStringIndexS_UTFE(const NLSSMHandle *handle, const uint8_t *string,
                                       int64_t stringLength, const uint8_t *pattern,
                                       int64_t patternLength);
NLSSM_API int64_t NLSStringIndexS_WCS2(const NLSSMHandle *handle, const uint8_t *string,
                                       int64_t stringLength, const uint8_t *pattern,
                                       int64_t patternLength);
NLSSM_API int64_t NLSStringIndexS_WCS4(const NLSSMHandle *handle, const uint8_t *string,
                                       int64_t stringLength, const uint8_t *pattern,
                                       int64_t patternLength);
NLSSM_API int64_t NLSStringIndexS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t stringLength, const uint8_t *pattern,
                                             int64_t patternLength);
NLSSM_API int64_t NLSStringIndexS_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *string,
                                                int64_t stringLength, const uint8_t *pattern,
                                                int64_t patternLength);
NLSSM_API int64_t NLSStringIndexS_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                       const uint8_t *string, int64_t stringLength,
                                                       const uint8_t *pattern,
                                                       int64_t patternLength);
NLSSM_API int64_t NLSStringIndexS_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                       const uint8_t *string, int64_t stringLength,
                                                       const uint8_t *pattern,
                                                       int64_t patternLength);
NLSSM_API int64_t NLSStringIndexS_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                        const uint8_t *string, int64_t stringLength,
                                                        const uint8_t *pattern,
                                                        int64_t patternLength);
/* NLSStringIndexC (slot 104): as IndexS with lengths in characters (single-
 * byte sets: bytes). The buffers must hold that many characters. The UTF-8
 * member serves UTF-EBCDIC handles too, stepping by the handle's encoding;
 * the WCS2 members serve both byte orders (encoding 24 is big-endian). */
NLSSM_API int64_t NLSStringIndexC_SBCS(const NLSSMHandle *handle, const uint8_t *string,
                                       int64_t stringChars, const uint8_t *pattern,
                                       int64_t patternChars);
NLSSM_API int64_t NLSStringIndexC_UTF8(const NLSSMHandle *handle, const uint8_t *string,
                                       int64_t stringChars, const uint8_t *pattern,
                                       int64_t patternChars);
NLSSM_API int64_t NLSStringIndexC_WCS2(const NLSSMHandle *handle, const uint8_t *string,
                                       int64_t stringChars, const uint8_t *pattern,
                                       int64_t patternChars);
NLSSM_API int64_t NLSStringIndexC_WCS4(const NLSSMHandle *handle, const uint8_t *string,
                                       int64_t stringChars, const uint8_t *pattern,
                                       int64_t patternChars);
NLSSM_API int64_t NLSStringIndexC_MBCS_modal(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t stringChars, const uint8_t *pattern,
                                             int64_t patternChars);
NLSSM_API int64_t NLSStringIndexC_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *string,
                                                int64_t stringChars, const uint8_t *pattern,
                                                int64_t patternChars);
NLSSM_API int64_t NLSStringIndexC_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                       const uint8_t *string, int64_t stringChars,
                                                       const uint8_t *pattern,
                                                       int64_t patternChars);
NLSSM_API int64_t NLSStringIndexC_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                       const uint8_t *string, int64_t stringChars,
                                                       const uint8_t *pattern,
                                                       int64_t patternChars);
NLSSM_API int64_t NLSStringIndexC_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                        const uint8_t *string, int64_t stringChars,
                                                        const uint8_t *pattern,
                                                        int64_t patternChars);
/* NLSStringContains (slot 28): Index through the handle's NLSStringIndex
 * slot on descriptors built over the two buffers (lengths in bytes); an
 * empty pattern or text, or a null buffer, gives -1. The options word is
 * not read. */
NLSSM_API int64_t NLSStringContains(const NLSSMHandle *handle, const uint8_t *string,
                                    int64_t stringLength, const uint8_t *pattern,
                                    int64_t patternLength, int64_t options);
/* NLSStringFindCharLit (slot 46): the first occurrence of one character,
 * given as a byte of the host's literal set (encoding 62), in `count`
 * characters from the current one (0 or above the rest: to the end; single-
 * byte sets: bytes from charIndex). The literal is converted through the
 * handle's charConverter when it has one (single-byte sets: only EBCDIC-
 * based ones); a failed conversion gives -1. On a match the descriptor moves
 * to the character found (single-byte sets: charIndex and curOffset become
 * its byte offset; UTF-EBCDIC sets charIndex, curOffset, prevOffset and
 * nextOffset by its own sequences; the other classes position it through
 * stringSetPos); a miss leaves it as it was. */
NLSSM_API int64_t NLSStringFindCharLit_SBCS(const NLSSMHandle *handle, NLSString *string,
                                            int64_t count, const uint8_t *literal);
NLSSM_API int64_t NLSStringFindCharLit_UTF8(const NLSSMHandle *handle, NLSString *string,
                                            int64_t count, const uint8_t *literal);
NLSSM_API int64_t NLSStringFindCharLit_WCS2(const NLSSMHandle *handle, NLSString *string,
                                            int64_t count, const uint8_t *literal);
NLSSM_API int64_t NLSStringFindCharLit_WCS4(const NLSSMHandle *handle, NLSString *string,
                                            int64_t count, const uint8_t *literal);
NLSSM_API int64_t NLSStringFindCharLit_MBCS_modal(const NLSSMHandle *handle, NLSString *string,
                                                  int64_t count, const uint8_t *literal);
NLSSM_API int64_t NLSStringFindCharLit_MBCS_nonmodal(const NLSSMHandle *handle, NLSString *string,
                                                     int64_t count, const uint8_t *literal);
NLSSM_API int64_t NLSStringFindCharLit_MBCS_EUC_JP(const NLSSMHandle *handle, NLSString *string,
                                                   int64_t count, const uint8_t *literal);
NLSSM_API int64_t NLSStringFindCharLit_MBCS_EUC_TW(const NLSSMHandle *handle, NLSString *string,
                                                   int64_t count, const uint8_t *literal);
NLSSM_API int64_t NLSStringFindCharLit_MBCS_GB18030(const NLSSMHandle *handle, NLSString *string,
                                                    int64_t count, const uint8_t *literal);
/* NLSStringFindCharLitS (slots 69, 70) and NLSStringFindCharLitC (slots 111,
 * 112): raw buffers, length in bytes (S) or characters (C). The literal is
 * converted from encoding 62 only when `convert` is non-zero and the handle
 * has a converter; otherwise it is one character of the text's encoding,
 * read as far as its first byte announces (modal text: after an optional
 * shift sequence). reserved1 and reserved2 are not read. Nothing moves. */
NLSSM_API int64_t NLSStringFindCharLitS_SBCS(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t length, const uint8_t *literal,
                                             int64_t reserved1, int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitS_UTF8(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t length, const uint8_t *literal,
                                             int64_t reserved1, int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitS_WCS2(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t length, const uint8_t *literal,
                                             int64_t reserved1, int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitS_WCS4(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t length, const uint8_t *literal,
                                             int64_t reserved1, int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *string,
                                                   int64_t length, const uint8_t *literal,
                                                   int64_t reserved1, int64_t reserved2,
                                                   uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitS_MBCS_nonmodal(const NLSSMHandle *handle,
                                                      const uint8_t *string, int64_t length,
                                                      const uint8_t *literal, int64_t reserved1,
                                                      int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitS_MBCS_EUC_JP(const NLSSMHandle *handle,
                                                    const uint8_t *string, int64_t length,
                                                    const uint8_t *literal, int64_t reserved1,
                                                    int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitS_MBCS_EUC_TW(const NLSSMHandle *handle,
                                                    const uint8_t *string, int64_t length,
                                                    const uint8_t *literal, int64_t reserved1,
                                                    int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitS_MBCS_GB18030(const NLSSMHandle *handle,
                                                     const uint8_t *string, int64_t length,
                                                     const uint8_t *literal, int64_t reserved1,
                                                     int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitC_SBCS(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t length, const uint8_t *literal,
                                             int64_t reserved1, int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitC_UTF8(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t length, const uint8_t *literal,
                                             int64_t reserved1, int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitC_WCS2(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t length, const uint8_t *literal,
                                             int64_t reserved1, int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitC_WCS4(const NLSSMHandle *handle, const uint8_t *string,
                                             int64_t length, const uint8_t *literal,
                                             int64_t reserved1, int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitC_MBCS_modal(const NLSSMHandle *handle, const uint8_t *string,
                                                   int64_t length, const uint8_t *literal,
                                                   int64_t reserved1, int64_t reserved2,
                                                   uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitC_MBCS_nonmodal(const NLSSMHandle *handle,
                                                      const uint8_t *string, int64_t length,
                                                      const uint8_t *literal, int64_t reserved1,
                                                      int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitC_MBCS_EUC_JP(const NLSSMHandle *handle,
                                                    const uint8_t *string, int64_t length,
                                                    const uint8_t *literal, int64_t reserved1,
                                                    int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitC_MBCS_EUC_TW(const NLSSMHandle *handle,
                                                    const uint8_t *string, int64_t length,
                                                    const uint8_t *literal, int64_t reserved1,
                                                    int64_t reserved2, uint8_t convert);
NLSSM_API int64_t NLSStringFindCharLitC_MBCS_GB18030(const NLSSMHandle *handle,
                                                     const uint8_t *string, int64_t length,
                                                     const uint8_t *literal, int64_t reserved1,
                                                     int64_t reserved2, uint8_t convert);
/* Modal text, a character already in the text's encoding (never
 * converted): slot 70 (S) and the C form. */
NLSSM_API int64_t NLSStringFindCharS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *string,
                                                int64_t length, const uint8_t *character,
                                                int64_t reserved1, int64_t reserved2,
                                                uint8_t ignored);
NLSSM_API int64_t NLSStringFindCharC_MBCS_modal(const NLSSMHandle *handle, const uint8_t *string,
                                                int64_t length, const uint8_t *character,
                                                int64_t reserved1, int64_t reserved2,
                                                uint8_t ignored);
/* NLSStringVerify (slot 86): the first character of S (from its current
 * character, `count` characters; 0 or above the rest: all) that is not one
 * of the characters of `set` (from its current character, `setCount`
 * likewise); -1 when every character is in the set or S is empty; 0 for an
 * empty set and a non-empty S. Single-byte sets count bytes. The UTF-8
 * member serves UTF-EBCDIC handles, the non-modal member every double-byte
 * page, EUC-JP, EUC-TW and GB18030 (stepping by the handle's encoding).
 * NLSStringVerifyS (slot 87): raw buffers, lengths in bytes. */
NLSSM_API int64_t NLSStringVerify_SBCS(const NLSSMHandle *handle, const NLSString *string,
                                       int64_t count, const NLSString *set, int64_t setCount);
NLSSM_API int64_t NLSStringVerify_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                       int64_t count, const NLSString *set, int64_t setCount);
NLSSM_API int64_t NLSStringVerify_WCS2L(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t count, const NLSString *set, int64_t setCount);
NLSSM_API int64_t NLSStringVerify_WCS2B(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t count, const NLSString *set, int64_t setCount);
NLSSM_API int64_t NLSStringVerify_WCS4(const NLSSMHandle *handle, const NLSString *string,
                                       int64_t count, const NLSString *set, int64_t setCount);
NLSSM_API int64_t NLSStringVerify_MBCS_modal(const NLSSMHandle *handle, const NLSString *string,
                                             int64_t count, const NLSString *set, int64_t setCount);
NLSSM_API int64_t NLSStringVerify_MBCS_nonmodal(const NLSSMHandle *handle, const NLSString *string,
                                                int64_t count, const NLSString *set,
                                                int64_t setCount);
NLSSM_API int64_t NLSStringVerifyS_SBCS(const NLSSMHandle *handle, const uint8_t *string,
                                        int64_t length, const uint8_t *set, int64_t setLength);
NLSSM_API int64_t NLSStringVerifyS_UTF8(const NLSSMHandle *handle, const uint8_t *string,
                                        int64_t length, const uint8_t *set, int64_t setLength);
NLSSM_API int64_t NLSStringVerifyS_WCS2L(const NLSSMHandle *handle, const uint8_t *string,
                                         int64_t length, const uint8_t *set, int64_t setLength);
NLSSM_API int64_t NLSStringVerifyS_WCS2B(const NLSSMHandle *handle, const uint8_t *string,
                                         int64_t length, const uint8_t *set, int64_t setLength);
NLSSM_API int64_t NLSStringVerifyS_WCS4(const NLSSMHandle *handle, const uint8_t *string,
                                        int64_t length, const uint8_t *set, int64_t setLength);
NLSSM_API int64_t NLSStringVerifyS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *string,
                                              int64_t length, const uint8_t *set,
                                              int64_t setLength);
NLSSM_API int64_t NLSStringVerifyS_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *string,
                                                 int64_t length, const uint8_t *set,
                                                 int64_t setLength);

/* Classification (slots 73-78): 1 when the current character is in a
 * class of `mask` (the class-table bits: 0x01 upper, 0x02 lower, 0x04
 * digit, 0x08 space, 0x10 punctuation, 0x20 blank, 0x40 control, 0x80
 * hexadecimal digit), else 0; 0 when there is no current character. The
 * count word is not read.
 * Single-byte sets: the class table. IsSpace also takes 0x09-0x0D (ASCII)
 * or 0x0B-0x0D (EBCDIC) as space.
 * Multi-byte classes read the descriptor's charKind (0: no character): a
 * single-byte character uses the class table (NLSStringIs_MBCS: byte 0x80
 * in no class); NLSStringIs_MBCS counts any wider character in every class
 * but punctuation (mask 0x10); IsDigit answers 0 for it; IsLower looks the
 * double-byte code up in the double-byte case table (with mask bit 0x02:
 * its lower form is itself, without: its upper form is); IsXDigit takes
 * the double-byte hexadecimal ranges; IsSpace the encoding's double-byte
 * space (and ASCII 0x09-0x0D, or EBCDIC 0x05, 0x0B-0x0D, 0x25); IsGraph
 * counts every double-byte character but the double-byte space.
 * Unicode (UTF-8, which also serves UTF-EBCDIC handles, WCS2, WCS4): the
 * decoded character's general category from the host's character-
 * information query; a high surrogate without its low one, an undecodable
 * sequence or a failed query give 0. IsSpace takes a strict flag instead
 * of the count and mask: U+0020, U+00A0, U+1680, U+2000-U+200A, U+2028,
 * U+2029, U+202F, U+205F, U+3000, and unless strict also U+0009-U+000D and
 * U+0085. IsXDigit: A-F, a-f, their full-width forms and decimal digits
 * (mask not read). IsGraph: not a separator, control, format, surrogate or
 * unassigned character (mask not read). */
NLSSM_API int64_t NLSStringIs_SBCS(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsSpace_ASCII(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsSpace_EBCDIC(const NLSSMHandle *handle, const NLSString *string,
                                          int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIs_MBCS(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsLower_MBCS(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsDigit_MBCS(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsXDigit_MBCS(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsGraph_MBCS(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsSpace_MBCS_ASCII(const NLSSMHandle *handle, const NLSString *string,
                                              int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsSpace_MBCS_EBCDIC(const NLSSMHandle *handle, const NLSString *string,
                                               int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIs_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsSpace_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t strict);
NLSSM_API int64_t NLSStringIsXDigit_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsGraph_UTF8(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIs_WCS2(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsSpace_WCS2(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t strict);
NLSSM_API int64_t NLSStringIsXDigit_WCS2(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsGraph_WCS2(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIs_WCS4(const NLSSMHandle *handle, const NLSString *string,
                                   int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsSpace_WCS4(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t strict);
NLSSM_API int64_t NLSStringIsXDigit_WCS4(const NLSSMHandle *handle, const NLSString *string,
                                         int64_t ignored, int32_t mask);
NLSSM_API int64_t NLSStringIsGraph_WCS4(const NLSSMHandle *handle, const NLSString *string,
                                        int64_t ignored, int32_t mask);
/* stringAnyNot (slot 118, every class): 1 when any of `count` characters
 * from the current one (0 or negative: all of them) is not in a class of
 * `mask`, as the handle's NLSStringIs slot answers character by character
 * (stepping with its stringNextChar slot); 0 when all are, or there is no
 * character. The descriptor does not move. */
NLSSM_API int64_t stringAnyNot(const NLSSMHandle *handle, const NLSString *string, int64_t count,
                               int32_t mask);

/* LIKE (slot 27): 1 when the whole text (from its current character)
 * matches the pattern (from its current character), 0 when not, or
 * NLSSM_E_NULL_ARGUMENT for a null handle or descriptor, or a null buffer
 * under a non-empty descriptor. A descriptor without a current character
 * holds the empty string. Matching is by whole characters: '%' matches any
 * run of characters (also none), '_' exactly one character; with `escape`
 * non-zero the escape character (backslash) makes the pattern character after it
 * literal (an escape at the end of the pattern stands for itself). The
 * three pattern characters are those of the encoding's family (ASCII % _ and
 * backslash, EBCDIC 0x6C 0x6D 0xE0; UTF-EBCDIC uses the EBCDIC ones, wide text the
 * units of the ASCII values), and in modal text only single-byte
 * characters act as them. Time grows at worst with text length times
 * pattern length. NLSStringLike_MBCS_nonmodal serves UTF-8, UTF-EBCDIC,
 * WCS2 and WCS4 handles; the nonmodal2 members every double-byte page,
 * EUC-JP, EUC-TW and GB18030; the modal member takes the family from the
 * handle. */
NLSSM_API int64_t NLSStringLike_SBCS_ASCII(const NLSSMHandle *handle, const NLSString *text,
                                           const NLSString *pattern, int64_t escape);
NLSSM_API int64_t NLSStringLike_SBCS_EBCDIC(const NLSSMHandle *handle, const NLSString *text,
                                            const NLSString *pattern, int64_t escape);
NLSSM_API int64_t NLSStringLike_MBCS_nonmodal(const NLSSMHandle *handle, const NLSString *text,
                                              const NLSString *pattern, int64_t escape);
NLSSM_API int64_t NLSStringLike_MBCS_modal(const NLSSMHandle *handle, const NLSString *text,
                                           const NLSString *pattern, int64_t escape);
NLSSM_API int64_t NLSStringLike_MBCS_nonmodal2_ASCII(const NLSSMHandle *handle,
                                                     const NLSString *text,
                                                     const NLSString *pattern, int64_t escape);
NLSSM_API int64_t NLSStringLike_MBCS_nonmodal2_EBCDIC(const NLSSMHandle *handle,
                                                      const NLSString *text,
                                                      const NLSString *pattern, int64_t escape);

/* ---- Substring, delete, reverse and strip --------------------------------- */
/* Reverse (slots 33, 58): the order of the first n characters from the
 * current one (0 or more than remain: all; S forms: the whole buffer), in
 * place. Single-byte, two-byte and four-byte text swap whole units (two-byte
 * text counts n in characters but swaps units, so a surrogate pair is turned
 * round); multi-byte text keeps the bytes of each character in order. Modal
 * text turns shift sequences round; a text that ends in another width than
 * it starts gets the shift into that width in front and loses its last
 * bytes to it. Answers 0, NLSSM_E_NO_MEMORY when the modal work buffer could
 * not be had (the text is then unchanged), or NLSSM_E_NULL_ARGUMENT. */
NLSSM_API int64_t NLSStringReverse_SBCS(const NLSSMHandle *handle, NLSString *string, int64_t n);
NLSSM_API int64_t NLSStringReverseS_SBCS(const NLSSMHandle *handle, uint8_t *buffer, int64_t bytes);
NLSSM_API int64_t NLSStringReverse_WCS2(const NLSSMHandle *handle, NLSString *string, int64_t n);
NLSSM_API int64_t NLSStringReverseS_WCS2(const NLSSMHandle *handle, uint8_t *buffer, int64_t bytes);
NLSSM_API int64_t NLSStringReverse_WCS4(const NLSSMHandle *handle, NLSString *string, int64_t n);
NLSSM_API int64_t NLSStringReverseS_WCS4(const NLSSMHandle *handle, uint8_t *buffer, int64_t bytes);
NLSSM_API int64_t NLSStringReverse_MBCS(const NLSSMHandle *handle, NLSString *string, int64_t n);
NLSSM_API int64_t NLSStringReverseS_MBCS(const NLSSMHandle *handle, uint8_t *buffer, int64_t bytes);
NLSSM_API int64_t NLSStringReverse_MBCS_modal(const NLSSMHandle *handle, NLSString *string,
                                              int64_t n);
NLSSM_API int64_t NLSStringReverseS_MBCS_modal(const NLSSMHandle *handle, uint8_t *buffer,
                                               int64_t bytes);

/* Delete (slots 34, 59, 35, 60): every character of the target's first n
 * characters from its current one (0 or more than remain: all) that occurs
 * in the list's first m characters is taken out; the kept characters close
 * up and the freed bytes at the end of the range become blanks. Answers the
 * characters kept (S forms: the bytes kept), 0 for an unset target, the
 * range's character count for an unset or empty list, and
 * NLSSM_COUNT_NO_MEMORY when a work buffer could not be had (the target is
 * then unchanged). Flags are not used. Modal text: shift sequences are
 * rewritten around the characters kept; a range followed by more text ends
 * in the width it ended in before (blanks go where the width is single, or
 * as pairs of blank bytes where it is double). The literal forms convert the
 * literal from encoding 62 and call the handle's NLSStringDelete or
 * NLSStringDeleteS; a literal that cannot be converted deletes nothing. */
NLSSM_API int64_t NLSStringDelete_SBCS(const NLSSMHandle *handle, NLSString *target, int64_t n,
                                       const NLSString *list, int64_t m, int64_t flags);
NLSSM_API int64_t NLSStringDeleteS_SBCS(const NLSSMHandle *handle, uint8_t *target,
                                        int64_t targetBytes, const uint8_t *list,
                                        int64_t listBytes);
NLSSM_API int64_t NLSStringDelete_WCS2L(const NLSSMHandle *handle, NLSString *target, int64_t n,
                                        const NLSString *list, int64_t m, int64_t flags);
NLSSM_API int64_t NLSStringDeleteS_WCS2L(const NLSSMHandle *handle, uint8_t *target,
                                         int64_t targetBytes, const uint8_t *list,
                                         int64_t listBytes);
NLSSM_API int64_t NLSStringDelete_WCS2B(const NLSSMHandle *handle, NLSString *target, int64_t n,
                                        const NLSString *list, int64_t m, int64_t flags);
NLSSM_API int64_t NLSStringDeleteS_WCS2B(const NLSSMHandle *handle, uint8_t *target,
                                         int64_t targetBytes, const uint8_t *list,
                                         int64_t listBytes);
NLSSM_API int64_t NLSStringDelete_WCS4(const NLSSMHandle *handle, NLSString *target, int64_t n,
                                       const NLSString *list, int64_t m, int64_t flags);
NLSSM_API int64_t NLSStringDeleteS_WCS4(const NLSSMHandle *handle, uint8_t *target,
                                        int64_t targetBytes, const uint8_t *list,
                                        int64_t listBytes);
NLSSM_API int64_t NLSStringDelete_MBCS(const NLSSMHandle *handle, NLSString *target, int64_t n,
                                       const NLSString *list, int64_t m, int64_t flags);
NLSSM_API int64_t NLSStringDeleteS_MBCS(const NLSSMHandle *handle, uint8_t *target,
                                        int64_t targetBytes, const uint8_t *list,
                                        int64_t listBytes);
NLSSM_API int64_t NLSStringDelete_MBCS_modal(const NLSSMHandle *handle, NLSString *target,
                                             int64_t n, const NLSString *list, int64_t m,
                                             int64_t flags);
NLSSM_API int64_t NLSStringDeleteS_MBCS_modal(const NLSSMHandle *handle, uint8_t *target,
                                              int64_t targetBytes, const uint8_t *list,
                                              int64_t listBytes);
NLSSM_API int64_t NLSStringDeleteLit(const NLSSMHandle *handle, NLSString *target, int64_t n,
                                     const uint8_t *literal, int64_t literalBytes, int64_t flags);
NLSSM_API int64_t NLSStringDeleteLitS(const NLSSMHandle *handle, uint8_t *target,
                                      int64_t targetBytes, const uint8_t *literal,
                                      int64_t literalBytes, int64_t flags);

/* Substring (slot 38): up to n characters (0 or more than remain: all) of
 * the source from its current character, copied into the destination at its
 * current offset (single-byte: at the charIndex of both; an unset wide or
 * multi-byte destination is written from its start). Whole characters only:
 * what does not fit is left out with NLSSM_E_DEST_TOO_SMALL and no padding.
 * Flag bit 0 (NLSSM_EDIT_PAD) blank-fills the rest of an untruncated
 * destination and takes its length to the capacity (wide text: to the last
 * whole unit). The destination's length becomes at least the end of the
 * copy. bytesCopied (may be null) receives the bytes written, shift
 * sequences included. An unset source copies nothing and answers 0; a null
 * descriptor answers NLSSM_E_NULL_ARGUMENT.
 * Multi-byte members (UTF-8, UTF-EBCDIC, double-byte, EUC, GB18030, modal)
 * with n of 0 hand the rest of the source to the handle's NLSStringMoveS
 * (NLSSM_E_UNSUPPORTED when that slot is empty); afterwards the destination
 * is positioned again through stringSetPos. Modal text keeps its shift state
 * balanced: a shift sequence at the join when the widths differ, a closing
 * shift-in (double-byte characters are given back to make room for it), and
 * the rest of a source in double-byte width, or into a destination in
 * double-byte width at the write offset, is copied character by character
 * rather than moved. */
NLSSM_API int64_t NLSStringSubStr_SBCS(const NLSSMHandle *handle, const NLSString *source,
                                       NLSString *destination, int64_t n, int64_t *bytesCopied,
                                       int64_t flags);
NLSSM_API int64_t NLSStringSubStr_WCS2(const NLSSMHandle *handle, const NLSString *source,
                                       NLSString *destination, int64_t n, int64_t *bytesCopied,
                                       int64_t flags);
NLSSM_API int64_t NLSStringSubStr_WCS4(const NLSSMHandle *handle, const NLSString *source,
                                       NLSString *destination, int64_t n, int64_t *bytesCopied,
                                       int64_t flags);
NLSSM_API int64_t NLSStringSubStr_MBCS_UTF8(const NLSSMHandle *handle, const NLSString *source,
                                            NLSString *destination, int64_t n, int64_t *bytesCopied,
                                            int64_t flags);
NLSSM_API int64_t NLSStringSubStr_MBCS(const NLSSMHandle *handle, const NLSString *source,
                                       NLSString *destination, int64_t n, int64_t *bytesCopied,
                                       int64_t flags);
NLSSM_API int64_t NLSStringSubStr_MBCS_modal(const NLSSMHandle *handle, const NLSString *source,
                                             NLSString *destination, int64_t n,
                                             int64_t *bytesCopied, int64_t flags);

/* Strip (slots 39, 64, 110): the length of the text up to its last
 * character that is not a blank; nothing is moved. Flag bit 0 strips every
 * white-space character (U+0009-000D, 0020, 0085, 00A0, 1680, 2000-200A,
 * 2028, 2029, 202F, 205F, 3000): single-byte text by the class table's
 * white-space bit, double-byte non-modal text the blank and the bytes 9-13,
 * modal text the trailing bytes 0x40, 0x0E and 0x0F; UTF-8 recognises the
 * sequences of those characters at the end (and E1 81 A8 and E1 82 8E in
 * place of U+1680 and U+180E). Plain forms answer characters from the
 * current one: single-byte, wide and non-modal text look at the first n
 * characters only; UTF-8 and UTF-EBCDIC strip the whole rest and count at
 * most n characters, or, with bit 0, all that remain; modal text stops after
 * n characters, or with bit 0 ignores n. S forms answer bytes; C forms take
 * and answer characters (NLSStringStripC_UTF8 serves UTF-EBCDIC handles by
 * their own rule). Unset descriptors and null buffers answer 0. */
NLSSM_API int64_t NLSStringStrip_SBCS(const NLSSMHandle *handle, const NLSString *string, int64_t n,
                                      int64_t flags);
NLSSM_API int64_t NLSStringStripS_SBCS(const NLSSMHandle *handle, const uint8_t *buffer,
                                       int64_t bytes, int64_t flags);
NLSSM_API int64_t NLSStringStrip_UTF8(const NLSSMHandle *handle, const NLSString *string, int64_t n,
                                      int64_t flags);
NLSSM_API int64_t NLSStringStripS_UTF8(const NLSSMHandle *handle, const uint8_t *buffer,
                                       int64_t bytes, int64_t flags);
NLSSM_API int64_t NLSStringStrip_UTFE(const NLSSMHandle *handle, const NLSString *string, int64_t n,
                                      int64_t flags);
NLSSM_API int64_t NLSStringStripS_UTFE(const NLSSMHandle *handle, const uint8_t *buffer,
                                       int64_t bytes, int64_t flags);
NLSSM_API int64_t NLSStringStrip_WCS2(const NLSSMHandle *handle, const NLSString *string, int64_t n,
                                      int64_t flags);
NLSSM_API int64_t NLSStringStripS_WCS2(const NLSSMHandle *handle, const uint8_t *buffer,
                                       int64_t bytes, int64_t flags);
NLSSM_API int64_t NLSStringStrip_WCS4(const NLSSMHandle *handle, const NLSString *string, int64_t n,
                                      int64_t flags);
NLSSM_API int64_t NLSStringStripS_WCS4(const NLSSMHandle *handle, const uint8_t *buffer,
                                       int64_t bytes, int64_t flags);
NLSSM_API int64_t NLSStringStrip_MBCS_modal(const NLSSMHandle *handle, const NLSString *string,
                                            int64_t n, int64_t flags);
NLSSM_API int64_t NLSStringStripS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *buffer,
                                             int64_t bytes, int64_t flags);
NLSSM_API int64_t NLSStringStrip_MBCS_nonmodal(const NLSSMHandle *handle, const NLSString *string,
                                               int64_t n, int64_t flags);
NLSSM_API int64_t NLSStringStripS_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *buffer,
                                                int64_t bytes, int64_t flags);
NLSSM_API int64_t NLSStringStripC_SBCS(const NLSSMHandle *handle, const uint8_t *buffer,
                                       int64_t chars, int64_t flags);
NLSSM_API int64_t NLSStringStripC_UTF8(const NLSSMHandle *handle, const uint8_t *buffer,
                                       int64_t chars, int64_t flags);
NLSSM_API int64_t NLSStringStripC_WCS2(const NLSSMHandle *handle, const uint8_t *buffer,
                                       int64_t chars, int64_t flags);
NLSSM_API int64_t NLSStringStripC_WCS4(const NLSSMHandle *handle, const uint8_t *buffer,
                                       int64_t chars, int64_t flags);
NLSSM_API int64_t NLSStringStripC_MBCS_modal(const NLSSMHandle *handle, const uint8_t *buffer,
                                             int64_t chars, int64_t flags);
NLSSM_API int64_t NLSStringStripC_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *buffer,
                                                int64_t chars, int64_t flags);


/* ---- Move, fill, concatenate, justify and add quotes ---------------------- */
/* Move (slots 63, 115): copies sourceLength bytes of source (characters
 * with flag NLSSM_EDIT_SOURCE_IN_CHARS; the fixed-width members count units,
 * the others whole characters, which the source must hold) into the
 * destinationLength bytes at destination, in whole characters. Too little
 * room: what fits is copied, 0x803fe807, no padding. Otherwise flag
 * NLSSM_EDIT_PAD blank-pads the rest of the room. Source and destination may
 * overlap. The double-byte non-modal members pad with the byte 0x20 and
 * report 0x803fe807 only when something was copied. The modal member keeps
 * shift sequences balanced: a leading shift-in and a trailing shift-out are
 * dropped, a copy ending in a double-byte run is closed with a shift-in
 * (double-byte characters are given back to make room for it, with
 * 0x803fe807); the same buffer as source and destination, without padding
 * and ending in single-byte width, is only measured. The UTF-8 member sizes
 * UTF-EBCDIC text by its own rule. Counts (may be null): bytes written,
 * padding excluded; characters written (units for the fixed-width members).
 * Null buffers with a non-zero length: 0x803fe82a. */
NLSSM_API int64_t NLSStringMoveS_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                      int64_t sourceLength, uint8_t *destination,
                                      int64_t destinationLength, int64_t *bytesWritten,
                                      uint32_t flags);
NLSSM_API int64_t NLSStringMoveC_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                      int64_t sourceLength, uint8_t *destination,
                                      int64_t destinationLength, int64_t *bytesWritten,
                                      int64_t *charsWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveS_MBCS_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceLength, uint8_t *destination,
                                           int64_t destinationLength, int64_t *bytesWritten,
                                           uint32_t flags);
NLSSM_API int64_t NLSStringMoveC_MBCS_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceLength, uint8_t *destination,
                                           int64_t destinationLength, int64_t *bytesWritten,
                                           int64_t *charsWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveS_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                      int64_t sourceLength, uint8_t *destination,
                                      int64_t destinationLength, int64_t *bytesWritten,
                                      uint32_t flags);
NLSSM_API int64_t NLSStringMoveC_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                      int64_t sourceLength, uint8_t *destination,
                                      int64_t destinationLength, int64_t *bytesWritten,
                                      int64_t *charsWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveS_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                      int64_t sourceLength, uint8_t *destination,
                                      int64_t destinationLength, int64_t *bytesWritten,
                                      uint32_t flags);
NLSSM_API int64_t NLSStringMoveC_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                      int64_t sourceLength, uint8_t *destination,
                                      int64_t destinationLength, int64_t *bytesWritten,
                                      int64_t *charsWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceLength, uint8_t *destination,
                                            int64_t destinationLength, int64_t *bytesWritten,
                                            uint32_t flags);
NLSSM_API int64_t NLSStringMoveC_MBCS_modal(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceLength, uint8_t *destination,
                                            int64_t destinationLength, int64_t *bytesWritten,
                                            int64_t *charsWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveS_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *source,
                                               int64_t sourceLength, uint8_t *destination,
                                               int64_t destinationLength, int64_t *bytesWritten,
                                               uint32_t flags);
NLSSM_API int64_t NLSStringMoveC_MBCS_nonmodal(const NLSSMHandle *handle, const uint8_t *source,
                                               int64_t sourceLength, uint8_t *destination,
                                               int64_t destinationLength, int64_t *bytesWritten,
                                               int64_t *charsWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveS_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                      const uint8_t *source, int64_t sourceLength,
                                                      uint8_t *destination,
                                                      int64_t destinationLength,
                                                      int64_t *bytesWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveC_MBCS_nonmodal_EUC_JP(
    const NLSSMHandle *handle, const uint8_t *source, int64_t sourceLength, uint8_t *destination,
    int64_t destinationLength, int64_t *bytesWritten, int64_t *charsWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveS_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                      const uint8_t *source, int64_t sourceLength,
                                                      uint8_t *destination,
                                                      int64_t destinationLength,
                                                      int64_t *bytesWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveC_MBCS_nonmodal_EUC_TW(
    const NLSSMHandle *handle, const uint8_t *source, int64_t sourceLength, uint8_t *destination,
    int64_t destinationLength, int64_t *bytesWritten, int64_t *charsWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveS_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                       const uint8_t *source, int64_t sourceLength,
                                                       uint8_t *destination,
                                                       int64_t destinationLength,
                                                       int64_t *bytesWritten, uint32_t flags);
NLSSM_API int64_t NLSStringMoveC_MBCS_nonmodal_GB18030(
    const NLSSMHandle *handle, const uint8_t *source, int64_t sourceLength, uint8_t *destination,
    int64_t destinationLength, int64_t *bytesWritten, int64_t *charsWritten, uint32_t flags);

/* Fill (slots 44, 67, 45, 68): repeats one character, in whole characters.
 * Descriptor forms take the character at fillChar's curOffset (an unset
 * fillChar: nothing is done, 0) and count `written` in characters. The SBCS
 * member writes from the byte offset charIndex: length bytes (0 = all the
 * room up to capacity; more than the room fills the room, 0x803fe807). The
 * others write from curOffset (the end of the text when unset): lengths of
 * at least one character give the smaller of the characters asked and the
 * characters that fit (0x803fe807 when fewer than asked); shorter lengths,
 * 0 included, fill all whole characters of the room (0x803fe807 when bytes
 * are left over). The modal member writes a double-byte character as a
 * shift-out, the characters and a shift-in (whose bytes count in length
 * and room). The destination's length grows to the end of the fill.
 * Raw forms repeat the whole fillChar buffer (modal: its first character;
 * four-byte units: at most 4 bytes) over length bytes from the start,
 * `written` in bytes; 0x803fe807 when bytes are left over; a fill character
 * of length 0 is 0x803fe82a. Literal forms convert the literal's first byte
 * (encoding 62) through charConverter and call the handle's NLSStringFill
 * or NLSStringFillS; an empty literal is 0x803fe82a. */
NLSSM_API int64_t NLSStringFill_SBCS(const NLSSMHandle *handle, NLSString *destination,
                                     int64_t length, const NLSString *fillChar, int64_t *written);
NLSSM_API int64_t NLSStringFillS_SBCS(const NLSSMHandle *handle, uint8_t *destination,
                                      int64_t length, const uint8_t *fillChar, int64_t fillLength,
                                      int64_t *written);
NLSSM_API int64_t NLSStringFill_MBCS(const NLSSMHandle *handle, NLSString *destination,
                                     int64_t length, const NLSString *fillChar, int64_t *written);
NLSSM_API int64_t NLSStringFillS_MBCS(const NLSSMHandle *handle, uint8_t *destination,
                                      int64_t length, const uint8_t *fillChar, int64_t fillLength,
                                      int64_t *written);
NLSSM_API int64_t NLSStringFill_WCS2(const NLSSMHandle *handle, NLSString *destination,
                                     int64_t length, const NLSString *fillChar, int64_t *written);
NLSSM_API int64_t NLSStringFillS_WCS2(const NLSSMHandle *handle, uint8_t *destination,
                                      int64_t length, const uint8_t *fillChar, int64_t fillLength,
                                      int64_t *written);
NLSSM_API int64_t NLSStringFill_WCS4(const NLSSMHandle *handle, NLSString *destination,
                                     int64_t length, const NLSString *fillChar, int64_t *written);
NLSSM_API int64_t NLSStringFillS_WCS4(const NLSSMHandle *handle, uint8_t *destination,
                                      int64_t length, const uint8_t *fillChar, int64_t fillLength,
                                      int64_t *written);
NLSSM_API int64_t NLSStringFill_MBCS_modal(const NLSSMHandle *handle, NLSString *destination,
                                           int64_t length, const NLSString *fillChar,
                                           int64_t *written);
NLSSM_API int64_t NLSStringFillS_MBCS_modal(const NLSSMHandle *handle, uint8_t *destination,
                                            int64_t length, const uint8_t *fillChar,
                                            int64_t fillLength, int64_t *written);
NLSSM_API int64_t NLSStringFillLit(const NLSSMHandle *handle, NLSString *destination,
                                   int64_t length, const uint8_t *literal, int64_t literalLength,
                                   int64_t *written);
NLSSM_API int64_t NLSStringFillLitS(const NLSSMHandle *handle, uint8_t *destination, int64_t length,
                                    const uint8_t *literal, int64_t literalLength,
                                    int64_t *written);

/* Concatenate (slots 43, 66): joins `count` pieces (variable arguments:
 * NLSString pointers for the descriptor forms, from each one's curOffset to
 * its length, a null or unset one ending the list; (const uint8_t *, int64_t
 * bytes) pairs for the raw forms) into the destination, with the separator
 * literal's first byte (encoding 62, converted through charConverter) between
 * pieces when separatorLength is not 0. Room: *length (descriptor forms; 0 =
 * up to capacity) or length bytes; a negative length is terminated mode,
 * room -length - 1 and a zero byte after the text instead of blank padding.
 * The descriptor forms never write past capacity and write from the byte
 * offset charIndex (NLSStringConcat, single-byte and UTF-8) or from curOffset
 * (the others; negative counts as 0). A piece longer than the room left
 * ends the join with 0x803fe807 after copying what fits in whole characters,
 * or nothing of it with flag NLSSM_EDIT_PAD; a separator taking the last
 * byte of room before a piece also gives 0x803fe807. The rest of the room is
 * blank-filled in normal mode, truncated or not. Modal pieces are moved as
 * by the modal move (each left in single-byte width), and a destination whose
 * text ends in a double-byte run at the write offset gets a shift-in first.
 * The bytes written (separators included, padding excluded) go to *length or
 * *written (may be null); the descriptor's length becomes the end of the text. */
NLSSM_API int64_t NLSStringConcat(const NLSSMHandle *handle, NLSString *destination,
                                  int64_t *length, const uint8_t *separator,
                                  int64_t separatorLength, uint32_t flags, int64_t count, ...);
NLSSM_API int64_t NLSStringConcatS(const NLSSMHandle *handle, uint8_t *destination, int64_t length,
                                   int64_t *written, const uint8_t *separator,
                                   int64_t separatorLength, uint32_t flags, int64_t count, ...);
NLSSM_API int64_t NLSStringConcat_WCS2(const NLSSMHandle *handle, NLSString *destination,
                                       int64_t *length, const uint8_t *separator,
                                       int64_t separatorLength, uint32_t flags, int64_t count, ...);
NLSSM_API int64_t NLSStringConcatS_WCS2(const NLSSMHandle *handle, uint8_t *destination,
                                        int64_t length, int64_t *written, const uint8_t *separator,
                                        int64_t separatorLength, uint32_t flags, int64_t count,
                                        ...);
NLSSM_API int64_t NLSStringConcat_WCS4(const NLSSMHandle *handle, NLSString *destination,
                                       int64_t *length, const uint8_t *separator,
                                       int64_t separatorLength, uint32_t flags, int64_t count, ...);
NLSSM_API int64_t NLSStringConcatS_WCS4(const NLSSMHandle *handle, uint8_t *destination,
                                        int64_t length, int64_t *written, const uint8_t *separator,
                                        int64_t separatorLength, uint32_t flags, int64_t count,
                                        ...);
NLSSM_API int64_t NLSStringConcat_MBCS_modal(const NLSSMHandle *handle, NLSString *destination,
                                             int64_t *length, const uint8_t *separator,
                                             int64_t separatorLength, uint32_t flags, int64_t count,
                                             ...);
NLSSM_API int64_t NLSStringConcatS_MBCS_modal(const NLSSMHandle *handle, uint8_t *destination,
                                              int64_t length, int64_t *written,
                                              const uint8_t *separator, int64_t separatorLength,
                                              uint32_t flags, int64_t count, ...);
NLSSM_API int64_t NLSStringConcat_MBCS(const NLSSMHandle *handle, NLSString *destination,
                                       int64_t *length, const uint8_t *separator,
                                       int64_t separatorLength, uint32_t flags, int64_t count, ...);
NLSSM_API int64_t NLSStringConcatS_MBCS(const NLSSMHandle *handle, uint8_t *destination,
                                        int64_t length, int64_t *written, const uint8_t *separator,
                                        int64_t separatorLength, uint32_t flags, int64_t count,
                                        ...);

/* Justify (slots 47, 71, 113): moves the text between a field's leading and
 * trailing blanks (whole blank characters of the handle; single-byte and
 * modal members: the first byte of blankChar, counted in single-byte width
 * only) to its left ('L'), right ('R') or centre ('C', an odd spare blank to
 * the right), or leaves it ('N'), in place, blanking the places it left.
 * The low byte of align is the letter, either case; another letter gives
 * 0x803fe835 with nothing moved. Results (each may be null): the text's
 * length and its new start in bytes, and in the C form also in characters.
 * An empty or all-blank field gives 0 in every result and status 0. The
 * descriptor form justifies from the buffer's start to length and first
 * moves a cursor that is not at character 0 there; the S form takes a byte
 * length, the C form a length in characters (the buffer must hold them); a
 * negative length is an empty field. NLSStringJustifyC_UTF8 serves UTF-8 and
 * UTF-EBCDIC, the WCS2 members both byte orders. */
NLSSM_API int64_t NLSStringJustify(const NLSSMHandle *handle, NLSString *string, uint32_t align,
                                   int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS(const NLSSMHandle *handle, uint8_t *buffer, int64_t length,
                                    uint32_t align, int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyC(const NLSSMHandle *handle, uint8_t *buffer, int64_t length,
                                    uint32_t align, int64_t *textBytes, int64_t *textChars,
                                    int64_t *startBytes, int64_t *startChars);
NLSSM_API int64_t NLSStringJustify_UTF8(const NLSSMHandle *handle, NLSString *string,
                                        uint32_t align, int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS_UTF8(const NLSSMHandle *handle, uint8_t *buffer, int64_t length,
                                         uint32_t align, int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustify_UTFE(const NLSSMHandle *handle, NLSString *string,
                                        uint32_t align, int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS_UTFE(const NLSSMHandle *handle, uint8_t *buffer, int64_t length,
                                         uint32_t align, int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyC_UTF8(const NLSSMHandle *handle, uint8_t *buffer, int64_t length,
                                         uint32_t align, int64_t *textBytes, int64_t *textChars,
                                         int64_t *startBytes, int64_t *startChars);
NLSSM_API int64_t NLSStringJustify_WCS2(const NLSSMHandle *handle, NLSString *string,
                                        uint32_t align, int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS_WCS2(const NLSSMHandle *handle, uint8_t *buffer, int64_t length,
                                         uint32_t align, int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyC_WCS2(const NLSSMHandle *handle, uint8_t *buffer, int64_t length,
                                         uint32_t align, int64_t *textBytes, int64_t *textChars,
                                         int64_t *startBytes, int64_t *startChars);
NLSSM_API int64_t NLSStringJustify_WCS4(const NLSSMHandle *handle, NLSString *string,
                                        uint32_t align, int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS_WCS4(const NLSSMHandle *handle, uint8_t *buffer, int64_t length,
                                         uint32_t align, int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyC_WCS4(const NLSSMHandle *handle, uint8_t *buffer, int64_t length,
                                         uint32_t align, int64_t *textBytes, int64_t *textChars,
                                         int64_t *startBytes, int64_t *startChars);
NLSSM_API int64_t NLSStringJustify_MBCS_modal(const NLSSMHandle *handle, NLSString *string,
                                              uint32_t align, int64_t *textLength,
                                              int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS_MBCS_modal(const NLSSMHandle *handle, uint8_t *buffer,
                                               int64_t length, uint32_t align, int64_t *textLength,
                                               int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyC_MBCS_modal(const NLSSMHandle *handle, uint8_t *buffer,
                                               int64_t length, uint32_t align, int64_t *textBytes,
                                               int64_t *textChars, int64_t *startBytes,
                                               int64_t *startChars);
NLSSM_API int64_t NLSStringJustify_MBCS_nonmodal(const NLSSMHandle *handle, NLSString *string,
                                                 uint32_t align, int64_t *textLength,
                                                 int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS_MBCS_nonmodal(const NLSSMHandle *handle, uint8_t *buffer,
                                                  int64_t length, uint32_t align,
                                                  int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyC_MBCS_nonmodal(const NLSSMHandle *handle, uint8_t *buffer,
                                                  int64_t length, uint32_t align,
                                                  int64_t *textBytes, int64_t *textChars,
                                                  int64_t *startBytes, int64_t *startChars);
NLSSM_API int64_t NLSStringJustify_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                        NLSString *string, uint32_t align,
                                                        int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, uint8_t *buffer,
                                                         int64_t length, uint32_t align,
                                                         int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyC_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle, uint8_t *buffer,
                                                         int64_t length, uint32_t align,
                                                         int64_t *textBytes, int64_t *textChars,
                                                         int64_t *startBytes, int64_t *startChars);
NLSSM_API int64_t NLSStringJustify_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                        NLSString *string, uint32_t align,
                                                        int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, uint8_t *buffer,
                                                         int64_t length, uint32_t align,
                                                         int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyC_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle, uint8_t *buffer,
                                                         int64_t length, uint32_t align,
                                                         int64_t *textBytes, int64_t *textChars,
                                                         int64_t *startBytes, int64_t *startChars);
NLSSM_API int64_t NLSStringJustify_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                         NLSString *string, uint32_t align,
                                                         int64_t *textLength, int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyS_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                          uint8_t *buffer, int64_t length,
                                                          uint32_t align, int64_t *textLength,
                                                          int64_t *textStart);
NLSSM_API int64_t NLSStringJustifyC_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                          uint8_t *buffer, int64_t length,
                                                          uint32_t align, int64_t *textBytes,
                                                          int64_t *textChars, int64_t *startBytes,
                                                          int64_t *startChars);

/* Add quotes (slots 42, 65): writes the quote character (quoteChar in
 * quoteWidth bytes; single-byte and modal members: its first byte), the
 * source with every quote character doubled, and a closing quote. The
 * descriptor form quotes n characters from the source's curOffset (0 or
 * more than there are: all; an unset source is empty text) into the
 * destination's capacity from its buffer's start, and sets the
 * destination's length to the bytes written. Characters are copied whole; a
 * quote and its double are written together or not at all; modal runs keep
 * room for the shift-in that closes them. Done: status 0 and *resultLength
 * the bytes written. Too little room: 0x803fe807, the destination holds
 * what fit, and *resultLength is minus the bytes the whole quoted text
 * needs. Overlapping source and destination are quoted through a work
 * buffer (2048 bytes on the stack, the handle's pool beyond; a pool that
 * refuses cuts the room to 2048 bytes). */
NLSSM_API int64_t NLSStringAddQuotes(const NLSSMHandle *handle, const NLSString *source, int64_t n,
                                     NLSString *destination, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS(const NLSSMHandle *handle, const uint8_t *source,
                                      int64_t sourceLength, uint8_t *destination,
                                      int64_t destinationLength, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotes_UTF8(const NLSSMHandle *handle, const NLSString *source,
                                          int64_t n, NLSString *destination, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceLength, uint8_t *destination,
                                           int64_t destinationLength, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotes_UTFE(const NLSSMHandle *handle, const NLSString *source,
                                          int64_t n, NLSString *destination, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS_UTFE(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceLength, uint8_t *destination,
                                           int64_t destinationLength, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotes_WCS2(const NLSSMHandle *handle, const NLSString *source,
                                          int64_t n, NLSString *destination, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceLength, uint8_t *destination,
                                           int64_t destinationLength, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotes_WCS4(const NLSSMHandle *handle, const NLSString *source,
                                          int64_t n, NLSString *destination, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceLength, uint8_t *destination,
                                           int64_t destinationLength, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotes_MBCS_modal(const NLSSMHandle *handle, const NLSString *source,
                                                int64_t n, NLSString *destination,
                                                int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS_MBCS_modal(const NLSSMHandle *handle, const uint8_t *source,
                                                 int64_t sourceLength, uint8_t *destination,
                                                 int64_t destinationLength, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotes_MBCS_nonmodal(const NLSSMHandle *handle,
                                                   const NLSString *source, int64_t n,
                                                   NLSString *destination, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS_MBCS_nonmodal(const NLSSMHandle *handle,
                                                    const uint8_t *source, int64_t sourceLength,
                                                    uint8_t *destination, int64_t destinationLength,
                                                    int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotes_MBCS_nonmodal_EUC_JP(const NLSSMHandle *handle,
                                                          const NLSString *source, int64_t n,
                                                          NLSString *destination,
                                                          int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS_MBCS_nonmodal_EUC_JP(
    const NLSSMHandle *handle, const uint8_t *source, int64_t sourceLength, uint8_t *destination,
    int64_t destinationLength, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotes_MBCS_nonmodal_EUC_TW(const NLSSMHandle *handle,
                                                          const NLSString *source, int64_t n,
                                                          NLSString *destination,
                                                          int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS_MBCS_nonmodal_EUC_TW(
    const NLSSMHandle *handle, const uint8_t *source, int64_t sourceLength, uint8_t *destination,
    int64_t destinationLength, int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotes_MBCS_nonmodal_GB18030(const NLSSMHandle *handle,
                                                           const NLSString *source, int64_t n,
                                                           NLSString *destination,
                                                           int64_t *resultLength);
NLSSM_API int64_t NLSStringAddQuotesS_MBCS_nonmodal_GB18030(
    const NLSSMHandle *handle, const uint8_t *source, int64_t sourceLength, uint8_t *destination,
    int64_t destinationLength, int64_t *resultLength);

/* ---- Transliterate, tranword, squeeze and remove-delimiters --------------- */
/* Four copying edits: each reads a source and writes the result into a
 * separate destination; results are statuses. Plain forms take descriptors
 * and read from the current character; S forms take buffers with byte
 * lengths and read the whole buffer. `written` (may be null) receives the
 * bytes written. Members: _SBCS, _UTF8 (UTF-8 and UTF-EBCDIC), _WCS2, _WCS4,
 * _DBCS (double-byte code pages, EUC-JP, EUC-TW, GB18030) and _DBCSM
 * (shift-out/shift-in text).
 *
 * Characters are compared and copied whole: one byte, a UTF-8 or UTF-EBCDIC
 * lead with its continuation bytes (a stray continuation byte or a
 * sequence cut short is a character of its own), a two-byte unit or a
 * surrogate pair, a four-byte unit (compared in memory order), or the
 * class's double-byte, EUC or GB18030 character (a lead byte without its
 * trail bytes is one byte). A trailing partial unit of wide text is ignored.
 * In shift-out/shift-in text shift sequences only set the width of the
 * characters after them: characters of different widths never compare
 * equal, and the output gets a shift-out or shift-in wherever the width
 * changes, keeps room for the closing shift-in while a double-byte run is
 * open, and closes it at the end. A character that does not fit is never
 * split.
 *
 * Destination (plain forms): writing starts at the destination's
 * curOffset (an unset one counts as 0; in modal text inside a double-byte
 * run when its charKind says so) and may use its capacity from there. After
 * writing `count` bytes: an unset destination that got text has curOffset
 * 0 and length count; otherwise length is the position plus count;
 * nextOffset is the position plus one. When the destination's buffer
 * overlaps the source text, the result is built in a work buffer of the
 * destination's capacity (on the stack up to 2048 bytes, beyond that from
 * the handle's pool, or, when the pool refuses, 2048 bytes on the stack with
 * the room cut to 2048), copied to the start of the destination, which is
 * then positioned at its first character. S forms apply the same overlap
 * rule to the destination buffer.
 *
 * Null descriptors, buffers with text or lists: NLSSM_E_NULL_ARGUMENT. The
 * trailing flags words are reserved; pass 0. */

/* Transliterate: each source character found among the first pairCount
 * characters of fromList is replaced by the toList character at the same
 * index (the first match wins); others are copied. pairCount 0 or less: the
 * shorter list's character count; a larger pairCount is cut to it. n: the
 * characters of the source to process, 0 or less for all. Status
 * NLSSM_E_DEST_TOO_SMALL when the characters do not all fit; what fits is
 * written. */

NLSSM_API int64_t NLSStringTransliterate_SBCS(const NLSSMHandle *handle, const NLSString *source,
                                              int64_t n, const NLSString *toList,
                                              const NLSString *fromList, int64_t pairCount,
                                              NLSString *destination, int64_t *written,
                                              int64_t flags);
NLSSM_API int64_t NLSStringTransliterate_UTF8(const NLSSMHandle *handle, const NLSString *source,
                                              int64_t n, const NLSString *toList,
                                              const NLSString *fromList, int64_t pairCount,
                                              NLSString *destination, int64_t *written,
                                              int64_t flags);
NLSSM_API int64_t NLSStringTransliterate_WCS2(const NLSSMHandle *handle, const NLSString *source,
                                              int64_t n, const NLSString *toList,
                                              const NLSString *fromList, int64_t pairCount,
                                              NLSString *destination, int64_t *written,
                                              int64_t flags);
NLSSM_API int64_t NLSStringTransliterate_WCS4(const NLSSMHandle *handle, const NLSString *source,
                                              int64_t n, const NLSString *toList,
                                              const NLSString *fromList, int64_t pairCount,
                                              NLSString *destination, int64_t *written,
                                              int64_t flags);
NLSSM_API int64_t NLSStringTransliterate_DBCS(const NLSSMHandle *handle, const NLSString *source,
                                              int64_t n, const NLSString *toList,
                                              const NLSString *fromList, int64_t pairCount,
                                              NLSString *destination, int64_t *written,
                                              int64_t flags);
NLSSM_API int64_t NLSStringTransliterate_DBCSM(const NLSSMHandle *handle, const NLSString *source,
                                               int64_t n, const NLSString *toList,
                                               const NLSString *fromList, int64_t pairCount,
                                               NLSString *destination, int64_t *written,
                                               int64_t flags);
NLSSM_API int64_t NLSStringTransliterateS_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                               int64_t sourceLength, const uint8_t *toList,
                                               int64_t toLength, const uint8_t *fromList,
                                               int64_t fromLength, int64_t pairCount,
                                               uint8_t *destination, int64_t destinationLength,
                                               int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTransliterateS_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                               int64_t sourceLength, const uint8_t *toList,
                                               int64_t toLength, const uint8_t *fromList,
                                               int64_t fromLength, int64_t pairCount,
                                               uint8_t *destination, int64_t destinationLength,
                                               int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTransliterateS_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                               int64_t sourceLength, const uint8_t *toList,
                                               int64_t toLength, const uint8_t *fromList,
                                               int64_t fromLength, int64_t pairCount,
                                               uint8_t *destination, int64_t destinationLength,
                                               int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTransliterateS_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                               int64_t sourceLength, const uint8_t *toList,
                                               int64_t toLength, const uint8_t *fromList,
                                               int64_t fromLength, int64_t pairCount,
                                               uint8_t *destination, int64_t destinationLength,
                                               int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTransliterateS_DBCS(const NLSSMHandle *handle, const uint8_t *source,
                                               int64_t sourceLength, const uint8_t *toList,
                                               int64_t toLength, const uint8_t *fromList,
                                               int64_t fromLength, int64_t pairCount,
                                               uint8_t *destination, int64_t destinationLength,
                                               int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTransliterateS_DBCSM(const NLSSMHandle *handle, const uint8_t *source,
                                                int64_t sourceLength, const uint8_t *toList,
                                                int64_t toLength, const uint8_t *fromList,
                                                int64_t fromLength, int64_t pairCount,
                                                uint8_t *destination, int64_t destinationLength,
                                                int64_t *written, int64_t flags);
/* The lists as literals in the host's literal encoding (62), converted
 * through the handle's charConverter, then the handle's NLSStringTransliterate
 * (or NLSStringTransliterateS) operation. A failed conversion returns its
 * status (NLSSM_E_NO_MEMORY when the buffer for it could not be had). */
NLSSM_API int64_t NLSStringTransliterateLit(const NLSSMHandle *handle, const NLSString *source,
                                            int64_t n, const uint8_t *toList, int64_t toLength,
                                            const uint8_t *fromList, int64_t fromLength,
                                            int64_t pairCount, NLSString *destination,
                                            int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTransliterateLitS(const NLSSMHandle *handle, const uint8_t *source,
                                             int64_t sourceLength, const uint8_t *toList,
                                             int64_t toLength, const uint8_t *fromList,
                                             int64_t fromLength, int64_t pairCount,
                                             uint8_t *destination, int64_t destinationLength,
                                             int64_t *written, int64_t flags);

/* Tranword: every occurrence of the word `find` in the source is replaced by
 * `replacement`; matches do not overlap and replaced text is not searched
 * again. Each character copied counts n down by one, each replacement by
 * findLength (not below 0); the copy stops when n reaches 0, at the end of
 * the source, or when the room is used up. Plain form: n, replacementLength
 * and findLength that are 0 (or less) are each taken as the source's
 * character count (NLSNumChars); the words themselves are their descriptors'
 * text from the current character, so with findLength 0 the first
 * replacement uses up n and the rest of the source is not copied.
 * replacementLength has no other effect. S form: n is the source's
 * character count, the words are the given buffers, and each replacement
 * counts n down by the find word's character count. An empty find word
 * matches nothing; an empty replacement deletes the word. Status
 * NLSSM_E_DEST_TOO_SMALL when the room ran out before n did, or a
 * replacement did not fit (the source is then copied on as far as it fits).
 * Words are matched character by character at character starts. */
NLSSM_API int64_t NLSStringTranword_SBCS(const NLSSMHandle *handle, const NLSString *source,
                                         int64_t n, const NLSString *replacement,
                                         int64_t replacementLength, const NLSString *find,
                                         int64_t findLength, NLSString *destination,
                                         int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTranword_UTF8(const NLSSMHandle *handle, const NLSString *source,
                                         int64_t n, const NLSString *replacement,
                                         int64_t replacementLength, const NLSString *find,
                                         int64_t findLength, NLSString *destination,
                                         int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTranword_WCS2(const NLSSMHandle *handle, const NLSString *source,
                                         int64_t n, const NLSString *replacement,
                                         int64_t replacementLength, const NLSString *find,
                                         int64_t findLength, NLSString *destination,
                                         int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTranword_WCS4(const NLSSMHandle *handle, const NLSString *source,
                                         int64_t n, const NLSString *replacement,
                                         int64_t replacementLength, const NLSString *find,
                                         int64_t findLength, NLSString *destination,
                                         int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTranword_DBCS(const NLSSMHandle *handle, const NLSString *source,
                                         int64_t n, const NLSString *replacement,
                                         int64_t replacementLength, const NLSString *find,
                                         int64_t findLength, NLSString *destination,
                                         int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTranword_DBCSM(const NLSSMHandle *handle, const NLSString *source,
                                          int64_t n, const NLSString *replacement,
                                          int64_t replacementLength, const NLSString *find,
                                          int64_t findLength, NLSString *destination,
                                          int64_t *written, int64_t flags);
NLSSM_API int64_t NLSStringTranwordS_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                          int64_t sourceLength, const uint8_t *replacement,
                                          int64_t replacementLength, const uint8_t *find,
                                          int64_t findLength, uint8_t *destination,
                                          int64_t destinationLength, int64_t *written,
                                          int64_t flags);
NLSSM_API int64_t NLSStringTranwordS_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                          int64_t sourceLength, const uint8_t *replacement,
                                          int64_t replacementLength, const uint8_t *find,
                                          int64_t findLength, uint8_t *destination,
                                          int64_t destinationLength, int64_t *written,
                                          int64_t flags);
NLSSM_API int64_t NLSStringTranwordS_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                          int64_t sourceLength, const uint8_t *replacement,
                                          int64_t replacementLength, const uint8_t *find,
                                          int64_t findLength, uint8_t *destination,
                                          int64_t destinationLength, int64_t *written,
                                          int64_t flags);
NLSSM_API int64_t NLSStringTranwordS_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                          int64_t sourceLength, const uint8_t *replacement,
                                          int64_t replacementLength, const uint8_t *find,
                                          int64_t findLength, uint8_t *destination,
                                          int64_t destinationLength, int64_t *written,
                                          int64_t flags);
NLSSM_API int64_t NLSStringTranwordS_DBCS(const NLSSMHandle *handle, const uint8_t *source,
                                          int64_t sourceLength, const uint8_t *replacement,
                                          int64_t replacementLength, const uint8_t *find,
                                          int64_t findLength, uint8_t *destination,
                                          int64_t destinationLength, int64_t *written,
                                          int64_t flags);
NLSSM_API int64_t NLSStringTranwordS_DBCSM(const NLSSMHandle *handle, const uint8_t *source,
                                           int64_t sourceLength, const uint8_t *replacement,
                                           int64_t replacementLength, const uint8_t *find,
                                           int64_t findLength, uint8_t *destination,
                                           int64_t destinationLength, int64_t *written,
                                           int64_t flags);

/* Squeeze: every run of the squeeze character among the first n characters
 * of the source (0 or less: all) is reduced to one; other characters are
 * copied. The squeeze character is the character at squeezeChar's current
 * position (plain) or the first character of the squeezeChar buffer (S);
 * when there is none, the source is copied unchanged. Status
 * NLSSM_E_DEST_TOO_SMALL when the destination is full before the source is
 * used up. */
NLSSM_API int64_t NLSStringSqueeze_SBCS(const NLSSMHandle *handle, const NLSString *source,
                                        int64_t n, const NLSString *squeezeChar,
                                        NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringSqueeze_UTF8(const NLSSMHandle *handle, const NLSString *source,
                                        int64_t n, const NLSString *squeezeChar,
                                        NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringSqueeze_WCS2(const NLSSMHandle *handle, const NLSString *source,
                                        int64_t n, const NLSString *squeezeChar,
                                        NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringSqueeze_WCS4(const NLSSMHandle *handle, const NLSString *source,
                                        int64_t n, const NLSString *squeezeChar,
                                        NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringSqueeze_DBCS(const NLSSMHandle *handle, const NLSString *source,
                                        int64_t n, const NLSString *squeezeChar,
                                        NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringSqueeze_DBCSM(const NLSSMHandle *handle, const NLSString *source,
                                         int64_t n, const NLSString *squeezeChar,
                                         NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringSqueezeS_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                         int64_t sourceLength, const uint8_t *squeezeChar,
                                         int64_t squeezeLength, uint8_t *destination,
                                         int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringSqueezeS_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                         int64_t sourceLength, const uint8_t *squeezeChar,
                                         int64_t squeezeLength, uint8_t *destination,
                                         int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringSqueezeS_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                         int64_t sourceLength, const uint8_t *squeezeChar,
                                         int64_t squeezeLength, uint8_t *destination,
                                         int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringSqueezeS_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                         int64_t sourceLength, const uint8_t *squeezeChar,
                                         int64_t squeezeLength, uint8_t *destination,
                                         int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringSqueezeS_DBCS(const NLSSMHandle *handle, const uint8_t *source,
                                         int64_t sourceLength, const uint8_t *squeezeChar,
                                         int64_t squeezeLength, uint8_t *destination,
                                         int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringSqueezeS_DBCSM(const NLSSMHandle *handle, const uint8_t *source,
                                          int64_t sourceLength, const uint8_t *squeezeChar,
                                          int64_t squeezeLength, uint8_t *destination,
                                          int64_t destinationLength, int64_t *written);
/* Squeeze with the first character of a literal in the host's literal
 * encoding (62), converted through the handle's charConverter, through the
 * handle's NLSStringSqueeze (or NLSStringSqueezeS) operation. An empty
 * literal (length 0 or less) squeezes the handle's blank character.
 * `characters` (may be null) receives the characters written, counted
 * through the handle's NLSNumCharsS, beside the bytes in `written`. The S
 * form takes the arguments of the plain one with buffers and byte lengths
 * for the source and destination and no n. NLSSM_E_NO_MEMORY when the
 * buffer for the converted literal could not be had from the handle's pool;
 * another failed conversion returns its status. */
NLSSM_API int64_t NLSStringSqueezeLit(const NLSSMHandle *handle, const NLSString *source, int64_t n,
                                      const uint8_t *literal, int64_t literalLength,
                                      NLSString *destination, int64_t *written, int64_t *characters,
                                      int64_t flags);
NLSSM_API int64_t NLSStringSqueezeLitS(const NLSSMHandle *handle, const uint8_t *source,
                                       int64_t sourceLength, const uint8_t *literal,
                                       int64_t literalLength, uint8_t *destination,
                                       int64_t destinationLength, int64_t *written,
                                       int64_t *characters, int64_t flags);

/* Remove delimiters: the source's first character is the delimiter and its
 * last character the closing one, which is dropped; the characters between
 * are copied, a doubled delimiter as one (the inverse of add-quotes). A
 * full destination ends the copy with status 0. NLSSM_E_DEST_TOO_SMALL only
 * when the source holds fewer than two characters (nothing is written). */
NLSSM_API int64_t NLSStringRemoveDelimiters_SBCS(const NLSSMHandle *handle, const NLSString *source,
                                                 NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimiters_UTF8(const NLSSMHandle *handle, const NLSString *source,
                                                 NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimiters_WCS2(const NLSSMHandle *handle, const NLSString *source,
                                                 NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimiters_WCS4(const NLSSMHandle *handle, const NLSString *source,
                                                 NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimiters_DBCS(const NLSSMHandle *handle, const NLSString *source,
                                                 NLSString *destination, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimiters_DBCSM(const NLSSMHandle *handle,
                                                  const NLSString *source, NLSString *destination,
                                                  int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimitersS_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                                  int64_t sourceLength, uint8_t *destination,
                                                  int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimitersS_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                                  int64_t sourceLength, uint8_t *destination,
                                                  int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimitersS_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                                  int64_t sourceLength, uint8_t *destination,
                                                  int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimitersS_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                                  int64_t sourceLength, uint8_t *destination,
                                                  int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimitersS_DBCS(const NLSSMHandle *handle, const uint8_t *source,
                                                  int64_t sourceLength, uint8_t *destination,
                                                  int64_t destinationLength, int64_t *written);
NLSSM_API int64_t NLSStringRemoveDelimitersS_DBCSM(const NLSSMHandle *handle, const uint8_t *source,
                                                   int64_t sourceLength, uint8_t *destination,
                                                   int64_t destinationLength, int64_t *written);

/* ---- Number parsing and formatting ---------------------------------------- */
/* Slots 29-32. Every member takes the handle, then a host locale object (null:
 * the handle's own "en_US" locale). Texts and destinations are at most 152
 * bytes: a longer text, or a capacity above 152 or below 0, gives
 * NLSSM_E_NUMBER_TOO_LONG before anything is read; a null text, destination
 * or out pointer gives NLSSM_E_NULL_ARGUMENT. Host statuses are returned
 * unchanged.
 *
 * Parse integer: blanks, an optional '+' or '-', blanks, digits. Empty or
 * all-blank text reads as 0 (status 0, all consumed); a sign without digits
 * is NLSSM_E_NOT_A_NUMBER. After the digits a blank or NUL ends the number;
 * any other character gives NLSSM_E_NOT_A_NUMBER with the value read so far
 * (neither is consumed). With flag NLSSM_NUMBER_STRICT_TAIL only blanks,
 * optionally ended by a NUL, may follow (the blanks are consumed). Overflow:
 * NLSSM_E_INT_OVERFLOW, value 0, every digit consumed. `consumed` counts
 * bytes: the 32-bit forms read bytes / 4 units of 4 bytes (the _swap2 form
 * too, after reversing the bytes of each 16-bit unit; _swap4 reverses each
 * 32-bit unit) and report units x 4; _toQVChar converts with the handle's
 * ownFromConverter and reports characters x unitWidth. */
#define NLSSM_NUMBER_STRICT_TAIL 0x1000u
NLSSM_API int64_t NLSStringToIntmax_ASCII(const NLSSMHandle *handle, void *locale, const void *text,
                                          int64_t textBytes, uint32_t flags, int64_t *value,
                                          int32_t *consumed);
NLSSM_API int64_t NLSStringToIntmax_EBCDIC(const NLSSMHandle *handle, void *locale,
                                           const void *text, int64_t textBytes, uint32_t flags,
                                           int64_t *value, int32_t *consumed);
NLSSM_API int64_t NLSStringToIntmax_QVChar(const NLSSMHandle *handle, void *locale,
                                           const void *text, int64_t textBytes, uint32_t flags,
                                           int64_t *value, int32_t *consumed);
NLSSM_API int64_t NLSStringToIntmax_swap2(const NLSSMHandle *handle, void *locale, const void *text,
                                          int64_t textBytes, uint32_t flags, int64_t *value,
                                          int32_t *consumed);
NLSSM_API int64_t NLSStringToIntmax_swap4(const NLSSMHandle *handle, void *locale, const void *text,
                                          int64_t textBytes, uint32_t flags, int64_t *value,
                                          int32_t *consumed);
NLSSM_API int64_t NLSStringToIntmax_toQVChar(const NLSSMHandle *handle, void *locale,
                                             const void *text, int64_t textBytes, uint32_t flags,
                                             int64_t *value, int32_t *consumed);

/* Parse double: the locale's parser reads the text (the UTF-8 entry for
 * encoding 20, the ASCII entry for other ASCII-based encodings, the EBCDIC
 * entry, or the 32-bit entry after the same unit handling as the integer
 * parsers); options go to it unchanged (NLSHOST_PARSE_STRICT_TAIL). The fifth
 * argument is ignored. On a non-zero status `consumed` is not written. */
NLSSM_API int64_t NLSStringToDouble_ASCII(const NLSSMHandle *handle, void *locale, const void *text,
                                          int64_t textBytes, int64_t reserved, uint32_t options,
                                          double *value, int32_t *consumed);
NLSSM_API int64_t NLSStringToDouble_EBCDIC(const NLSSMHandle *handle, void *locale,
                                           const void *text, int64_t textBytes, int64_t reserved,
                                           uint32_t options, double *value, int32_t *consumed);
NLSSM_API int64_t NLSStringToDouble_QVChar(const NLSSMHandle *handle, void *locale,
                                           const void *text, int64_t textBytes, int64_t reserved,
                                           uint32_t options, double *value, int32_t *consumed);
NLSSM_API int64_t NLSStringToDouble_swap2(const NLSSMHandle *handle, void *locale, const void *text,
                                          int64_t textBytes, int64_t reserved, uint32_t options,
                                          double *value, int32_t *consumed);
NLSSM_API int64_t NLSStringToDouble_swap4(const NLSSMHandle *handle, void *locale, const void *text,
                                          int64_t textBytes, int64_t reserved, uint32_t options,
                                          double *value, int32_t *consumed);
NLSSM_API int64_t NLSStringToDouble_toQVChar(const NLSSMHandle *handle, void *locale,
                                             const void *text, int64_t textBytes, int64_t reserved,
                                             uint32_t options, double *value, int32_t *consumed);

/* Format integer. A width above the capacity fills the capacity with '*'
 * (NLSSM_E_NUMBER_DOES_NOT_FIT). With flags (NLSHOST_NUMBER_*) and a value
 * other than 0 the locale formats; otherwise the module writes the number
 * right-aligned in `width` characters with blanks on the left, or the whole
 * field in '*' with NLSSM_E_NUMBER_DOES_NOT_FIT when it does not fit. A width
 * of 0 or less means the number's own width. The _ASCII and _EBCDIC forms
 * write one byte per character (digits, blank, apostrophe, '*', '+', ',',
 * '-', '.'; U+00A0 as the encoding's no-break-space substitute; EBCDIC
 * writes the apostrophe as its substitute too; anything else '?' or 0x6F);
 * the _MBCS forms copy a multi-byte substitute whole and, when it does not
 * fit, fill the rest with '*' and give NLSSM_E_DEST_TOO_SMALL. The 32-bit
 * forms write capacity / 4 characters as 4-byte units (_swap2 reversing the
 * bytes of each 16-bit unit, _swap4 of each 32-bit unit) and report
 * characters x 4; _fromQVChar converts with the handle's ownToConverter. */
NLSSM_API int64_t NLSStringFromIntmax_ASCII_SBCS(const NLSSMHandle *handle, void *locale,
                                                 int64_t value, int64_t width, uint32_t flags,
                                                 void *destination, int64_t capacity,
                                                 int32_t *written);
NLSSM_API int64_t NLSStringFromIntmax_EBCDIC_SBCS(const NLSSMHandle *handle, void *locale,
                                                  int64_t value, int64_t width, uint32_t flags,
                                                  void *destination, int64_t capacity,
                                                  int32_t *written);
NLSSM_API int64_t NLSStringFromIntmax_ASCII_MBCS(const NLSSMHandle *handle, void *locale,
                                                 int64_t value, int64_t width, uint32_t flags,
                                                 void *destination, int64_t capacity,
                                                 int32_t *written);
NLSSM_API int64_t NLSStringFromIntmax_EBCDIC_MBCS(const NLSSMHandle *handle, void *locale,
                                                  int64_t value, int64_t width, uint32_t flags,
                                                  void *destination, int64_t capacity,
                                                  int32_t *written);
NLSSM_API int64_t NLSStringFromIntmax_QVChar(const NLSSMHandle *handle, void *locale, int64_t value,
                                             int64_t width, uint32_t flags, void *destination,
                                             int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromIntmax_swap2(const NLSSMHandle *handle, void *locale, int64_t value,
                                            int64_t width, uint32_t flags, void *destination,
                                            int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromIntmax_swap4(const NLSSMHandle *handle, void *locale, int64_t value,
                                            int64_t width, uint32_t flags, void *destination,
                                            int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromIntmax_fromQVChar(const NLSSMHandle *handle, void *locale,
                                                 int64_t value, int64_t width, uint32_t flags,
                                                 void *destination, int64_t capacity,
                                                 int32_t *written);

/* Format double: always the locale's formatter (decimals 0-16, or
 * NLSHOST_DECIMALS_SHORTEST), then written as the integer forms write; 'E'
 * and 'e' are kept. The locale's status is returned even when output was
 * written. _UTF8 has the locale write UTF-8 straight into the destination. */
NLSSM_API int64_t NLSStringFromDouble_ASCII_SBCS(const NLSSMHandle *handle, void *locale,
                                                 double value, int64_t width, int64_t decimals,
                                                 uint32_t flags, void *destination,
                                                 int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromDouble_EBCDIC_SBCS(const NLSSMHandle *handle, void *locale,
                                                  double value, int64_t width, int64_t decimals,
                                                  uint32_t flags, void *destination,
                                                  int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromDouble_ASCII_MBCS(const NLSSMHandle *handle, void *locale,
                                                 double value, int64_t width, int64_t decimals,
                                                 uint32_t flags, void *destination,
                                                 int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromDouble_EBCDIC_MBCS(const NLSSMHandle *handle, void *locale,
                                                  double value, int64_t width, int64_t decimals,
                                                  uint32_t flags, void *destination,
                                                  int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromDouble_UTF8(const NLSSMHandle *handle, void *locale, double value,
                                           int64_t width, int64_t decimals, uint32_t flags,
                                           void *destination, int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromDouble_QVChar(const NLSSMHandle *handle, void *locale, double value,
                                             int64_t width, int64_t decimals, uint32_t flags,
                                             void *destination, int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromDouble_swap2(const NLSSMHandle *handle, void *locale, double value,
                                            int64_t width, int64_t decimals, uint32_t flags,
                                            void *destination, int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromDouble_swap4(const NLSSMHandle *handle, void *locale, double value,
                                            int64_t width, int64_t decimals, uint32_t flags,
                                            void *destination, int64_t capacity, int32_t *written);
NLSSM_API int64_t NLSStringFromDouble_fromQVChar(const NLSSMHandle *handle, void *locale,
                                                 double value, int64_t width, int64_t decimals,
                                                 uint32_t flags, void *destination,
                                                 int64_t capacity, int32_t *written);

/* ---- Bidirectional text --------------------------------------------------- */
/* Base direction: *direction is set to 0 (left-to-right) first and becomes 1
 * (right-to-left) when the first character of category L (0), R (3) or AL (4)
 * is R or AL; other categories, and characters the host has no category for,
 * are passed over. `length` is in bytes. A null `direction` gives
 * NLSSM_E_NULL_ARGUMENT; a null text with a positive length too.
 * SBCS: bytes through the handle's bidiTable (none: left-to-right).
 * UTF-8: every character takes the length the text's first byte announces
 * (00-7F 1, C0-DF 2, E0-EF 3, F0-F7 4, F8-FB 5, any other 6), its value built
 * from those bytes and asked of the host; a character that would reach more
 * than one byte past `length` gives NLSSM_E_BAD_CHARACTER, so up to one byte
 * past `length` is read. UTFE and MBCS: always left-to-right, status 0.
 * WCS2: 16-bit units, little-endian for encoding 25, else big-endian; a high
 * surrogate goes to the host with the unit after it as (high << 16) | low,
 * read even past `length` (2 bytes); a high surrogate without a low one, or
 * a lone low one, gives NLSSM_E_BAD_CHARACTER. An odd last byte is ignored.
 * WCS4: 32-bit units, little-endian for encoding 27, else big-endian; bytes
 * after the last whole unit are ignored. */
NLSSM_API int64_t NLSGetBaseDirection_SBCS(const NLSSMHandle *handle, const uint8_t *text,
                                           int64_t length, uint8_t *direction);
NLSSM_API int64_t NLSGetBaseDirection_UTF8(const NLSSMHandle *handle, const uint8_t *text,
                                           int64_t length, uint8_t *direction);
NLSSM_API int64_t NLSGetBaseDirection_UTFE(const NLSSMHandle *handle, const uint8_t *text,
                                           int64_t length, uint8_t *direction);
NLSSM_API int64_t NLSGetBaseDirection_WCS2(const NLSSMHandle *handle, const uint8_t *text,
                                           int64_t length, uint8_t *direction);
NLSSM_API int64_t NLSGetBaseDirection_WCS4(const NLSSMHandle *handle, const uint8_t *text,
                                           int64_t length, uint8_t *direction);
NLSSM_API int64_t NLSGetBaseDirection_MBCS(const NLSSMHandle *handle, const uint8_t *text,
                                           int64_t length, uint8_t *direction);

/* Reordering of one line, after the Unicode Bidirectional Algorithm (UAX #9:
 * paragraph level, explicit embeddings, overrides and isolates, weak and
 * neutral types, paired brackets, implicit levels, trailing white space,
 * reversal of levels, mirroring).
 *   NLSVisualOrderFormat: text in reading (logical) order -> display order,
 *     left to right; characters at right-to-left levels that have a mirror
 *     image are shown mirrored.
 *   NLSLogicalOrderFormat: a displayed line -> a reading order that
 *     displays as that line (with the same paragraph level). The first
 *     attempt is the line resolved as if it were in reading order with its
 *     runs reversed (and mirrored) back; while an attempt does not display as
 *     the line, the next undoes the display order it resolved to, up to 8
 *     attempts in all. When none does, the first attempt is the result (status
 *     0 all the same): a line may have no reading order that displays as it.
 *     Words of either direction with blanks between them come back exactly
 *     as they were written; in general a line can come from several reading
 *     orders, and this gives one of them.
 * (handle, source, source bytes, destination, capacity in bytes, out bytes
 * written (may be null), direction) -> status.
 * *direction in: 0 left-to-right, 1 right-to-left, any other value: from the
 * text's first strong character outside isolates (left-to-right when it has
 * none; for NLSLogicalOrderFormat the displayed line's first, from the
 * left). Out: the paragraph level used, 0 or 1 (of the first paragraph).
 * A paragraph separator ends a paragraph: each is resolved and reordered on
 * its own, in place. Embedding and override controls and boundary neutrals
 * stay in the text, placed with the character before them.
 * Characters: SBCS bytes with the categories of the reordering table of the
 * handle's bidiTable (a byte without a category counts as ON; the page's
 * ( ) [ ] { } are paired brackets, its eight bracket-like characters
 * mirror); without a table every byte is left-to-right and the text comes
 * back unchanged. UTF-8
 * (encoding 20) or UTF-EBCDIC (other class-1 encodings), UTF-16 (WCS2;
 * big-endian for encoding 24, else little-endian) and UTF-32 (WCS4;
 * big-endian for encoding 26, else little-endian) with the host's categories
 * and the Unicode paired brackets and mirror images. Ill-formed input (a bad
 * sequence, a lone surrogate, a value above U+10FFFF) becomes U+FFFD, class
 * ON, with NLSSM_E_ILL_FORMED; input ending inside a character likewise with
 * NLSSM_E_TRUNCATED_SEQUENCE; the rest is still reordered.
 * The output takes as many bytes as the input, save for replaced input and
 * mirror images of another length. When it does not fit, the characters that
 * fit (in output order, none split) are written and the result is
 * NLSSM_E_DEST_TOO_SMALL; nothing is written past `capacity`. Negative
 * lengths count as 0. Null handle or direction, or a null buffer with a
 * positive length: NLSSM_E_NULL_ARGUMENT. The work area (about 70 bytes per
 * character) comes from the handle's pool beyond 2 KiB: NLSSM_E_NO_MEMORY
 * when the pool refuses, and for a text of 2 GiB or more. The source and
 * destination must not overlap. */
NLSSM_API int64_t NLSVisualOrderFormat_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                            int64_t *written, uint8_t *direction);
NLSSM_API int64_t NLSVisualOrderFormat_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                            int64_t *written, uint8_t *direction);
NLSSM_API int64_t NLSVisualOrderFormat_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                            int64_t *written, uint8_t *direction);
NLSSM_API int64_t NLSVisualOrderFormat_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                            int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                            int64_t *written, uint8_t *direction);
NLSSM_API int64_t NLSLogicalOrderFormat_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                             int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                             int64_t *written, uint8_t *direction);
NLSSM_API int64_t NLSLogicalOrderFormat_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                             int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                             int64_t *written, uint8_t *direction);
NLSSM_API int64_t NLSLogicalOrderFormat_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                             int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                             int64_t *written, uint8_t *direction);
NLSSM_API int64_t NLSLogicalOrderFormat_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                             int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                             int64_t *written, uint8_t *direction);

#endif /* NLSSM_NLSSM_H */
