// The exported string and memory primitives. The hot ones check their
// arguments and run the vector variant chosen for this processor.
#include <cstring>

#include "kernel/hot.hpp"
#include "kernel/scalar.hpp"
#include "nlssm/host.h"
#include "nlssm/nlssm.h"

namespace {

// Longer copies between disjoint ranges go to the block copy; shorter ones
// cost less than its call.
constexpr int64_t kBlockCopyMin = 96;

// Shorter compares are done eight bytes per step before the vector loop
// would have been set up.
constexpr int64_t kVectorCompareMin = 64;

bool disjoint(const void *a, const void *b, int64_t n) {
  const auto x = reinterpret_cast<uintptr_t>(a), y = reinterpret_cast<uintptr_t>(b);
  const auto len = static_cast<uintptr_t>(n);
  return x + len <= y || y + len <= x;
}

// Two bytes per step, loaded before they are stored: with the destination
// below the source this is safe for any overlap.
void copy_pairs_up(const uint8_t *s, uint8_t *d, int64_t n) {
  int64_t i = 0;
  for (; i + 2 <= n; i += 2) {
    uint16_t pair;
    std::memcpy(&pair, s + i, 2);
    std::memcpy(d + i, &pair, 2);
  }
  if (i < n) d[i] = s[i];
}

// The same from the top down, for a destination above the source.
void copy_pairs_down(const uint8_t *s, uint8_t *d, int64_t n) {
  int64_t i = n;
  if (i & 1) {
    --i;
    d[i] = s[i];
  }
  for (; i >= 2; i -= 2) {
    uint16_t pair;
    std::memcpy(&pair, s + i - 2, 2);
    std::memcpy(d + i - 2, &pair, 2);
  }
}

}  // namespace

extern "C" {

int64_t skUnsup(void) {
  return NLSSM_E_UNSUPPORTED;
}

int64_t skStrLen(const uint8_t *string) {
  return kernel::scalar::str_len(string);
}
int64_t skStrTLen(const uint32_t *string) {
  return kernel::scalar::str_tlen(string);
}
void skStrCpy(const uint8_t *source, uint8_t *destination) {
  kernel::scalar::str_copy(source, destination);
}
void skStrTCpy(const uint32_t *source, uint32_t *destination) {
  kernel::scalar::str_copy(source, destination);
}

void skStrUp(uint8_t *bytes, int64_t length) {
  if (bytes != nullptr && length > 0) kernel::hot().str_up(bytes, length);
}
void skStrLow(uint8_t *bytes, int64_t length) {
  if (bytes != nullptr && length > 0) kernel::hot().str_low(bytes, length);
}

int64_t skMemNot(uint8_t value, const uint8_t *buffer, int64_t length) {
  if (length <= 0) return 1;
  if (buffer == nullptr) return 0;
  return kernel::hot().mem_nscan(buffer, length, value) < 0 ? 1 : 0;
}
int64_t skMemTNot(uint32_t value, const uint32_t *buffer, int64_t length) {
  if (length <= 0) return 1;
  if (buffer == nullptr) return 0;
  return kernel::hot().mem_tnscan(buffer, length, value) < 0 ? 1 : 0;
}

void skMemSet(uint8_t *buffer, uint8_t value, int64_t length) {
  if (buffer != nullptr && length > 0) kernel::fill_bytes(buffer, value, length);
}
void skMemTSet(uint32_t *buffer, uint32_t value, int64_t length) {
  if (buffer != nullptr && length > 0) kernel::fill_units(buffer, value, length);
}

int64_t skMemCmp(const uint8_t *a, const uint8_t *b, int64_t length) {
  if (length <= 0) return 0;
  if (int64_t order = kernel::scalar::null_order(a, b); order != 2) return order;
  if (length >= kVectorCompareMin) {
    const int64_t at = kernel::hot().mem_mismatch(a, b, length);
    return at == length ? 0 : a[at] > b[at] ? 1 : -1;
  }
  int64_t i = 0;
  // Eight bytes per step; the lowest differing byte of the little-endian
  // words is the first differing byte of the buffers.
  for (; i + 8 <= length; i += 8) {
    uint64_t x, y;
    std::memcpy(&x, a + i, 8);
    std::memcpy(&y, b + i, 8);
    if (x != y) {
      i += __builtin_ctzll(x ^ y) / 8;
      return a[i] > b[i] ? 1 : -1;
    }
  }
  return kernel::scalar::mem_cmp(a + i, b + i, length - i);
}

int64_t skWMemCmp(const uint32_t *a, const uint32_t *b, int64_t length) {
  return kernel::scalar::wmem_cmp(a, b, length);
}

void *skMemCpy(const void *source, void *destination, int64_t length) {
  if (source == nullptr || destination == nullptr || length <= 0) return destination;
  const auto *s = static_cast<const uint8_t *>(source);
  auto *d = static_cast<uint8_t *>(destination);
  if (length > kBlockCopyMin && disjoint(s, d, length))
    kernel::copy_disjoint(d, s, length);
  else
    copy_pairs_up(s, d, length);
  return destination;
}

void *skMemSCpy(const void *source, void *destination, int64_t length) {
  if (source == nullptr || destination == nullptr || length <= 0 || source == destination)
    return destination;
  const auto *s = static_cast<const uint8_t *>(source);
  auto *d = static_cast<uint8_t *>(destination);
  const bool upwards = reinterpret_cast<uintptr_t>(d) < reinterpret_cast<uintptr_t>(s);
  if (length > kBlockCopyMin) {
    if (disjoint(s, d, length))
      kernel::copy_disjoint(d, s, length);
    else
      (upwards ? kernel::hot().copy_up : kernel::hot().copy_down)(d, s, length);
  } else if (upwards) {
    copy_pairs_up(s, d, length);
  } else {
    copy_pairs_down(s, d, length);
  }
  return destination;
}

void *skMemDup(const void *source, int64_t length, void *allocator) {
  if (source == nullptr || allocator == nullptr || length < 0) return nullptr;
  auto allocate = reinterpret_cast<NLSHostPoolAllocateFn>(
      NLSSM_HOST_SLOT(allocator, NLSHOST_SLOT_POOL_ALLOCATE));
  if (allocate == nullptr) return nullptr;
  void *copy = allocate(allocator, static_cast<uint64_t>(length), 0);
  if (copy != nullptr) skMemCpy(source, copy, length);
  return copy;
}

int64_t skMemScan(const uint8_t *buffer, int64_t length, uint8_t byte) {
  if (buffer == nullptr || length <= 0) return -1;
  return kernel::hot().mem_scan(buffer, length, byte);
}
int64_t skMemNScan(const uint8_t *buffer, int64_t length, uint8_t byte) {
  if (buffer == nullptr || length <= 0) return -1;
  return kernel::hot().mem_nscan(buffer, length, byte);
}
int64_t skMemTNScan(const uint32_t *buffer, int64_t count, uint32_t value) {
  if (buffer == nullptr || count <= 0) return -1;
  return kernel::hot().mem_tnscan(buffer, count, value);
}

int64_t skMissArray(const double *values, int64_t count) {
  return kernel::scalar::miss_array(values, count);
}

}  // extern "C"
