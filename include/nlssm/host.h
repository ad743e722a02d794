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

#endif /* NLSSM_HOST_H */
