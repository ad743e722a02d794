// The kernel primitives one element at a time: the rules the tuned versions
// must reproduce, and the heads and tails of the vector loops.
//
// Lengths and counts that are zero or negative mean an empty range. The
// vector variants take the same arguments but leave null and negative
// arguments to the exported functions.
#pragma once

#include <cstdint>

namespace kernel::scalar {

inline int64_t str_len(const uint8_t *s) {
  if (s == nullptr) return 0;
  int64_t n = 0;
  while (s[n] != 0) ++n;
  return n;
}

inline int64_t str_tlen(const uint32_t *s) {
  if (s == nullptr) return 0;
  int64_t n = 0;
  while (s[n] != 0) ++n;
  return n;
}

template <typename T>
inline void str_copy(const T *source, T *destination) {
  if (destination == nullptr) return;
  if (source == nullptr) {
    destination[0] = 0;
    return;
  }
  int64_t i = 0;
  do destination[i] = source[i];
  while (source[i++] != 0);
}

// Adds 32 to bytes in [lo, lo + 25] when lo is 'A', subtracts it when lo is
// 'a': flipping bit 0x20 does both.
inline void flip_case(uint8_t *p, int64_t n, uint8_t lo) {
  for (int64_t i = 0; i < n; ++i)
    if (static_cast<uint8_t>(p[i] - lo) < 26) p[i] ^= 0x20;
}
inline void str_up(uint8_t *p, int64_t n) {
  flip_case(p, n, 'a');
}
inline void str_low(uint8_t *p, int64_t n) {
  flip_case(p, n, 'A');
}

template <typename T>
inline void mem_fill(T *p, T value, int64_t n) {
  for (int64_t i = 0; i < n; ++i) p[i] = value;
}
inline void mem_set(uint8_t *p, uint8_t value, int64_t n) {
  mem_fill(p, value, n);
}
inline void mem_tset(uint32_t *p, uint32_t value, int64_t n) {
  mem_fill(p, value, n);
}

// Index of the first element that equals `value` (Equal) or differs from it.
template <bool Equal, typename T>
inline int64_t find(const T *p, int64_t n, T value) {
  if (p == nullptr) return -1;
  for (int64_t i = 0; i < n; ++i)
    if ((p[i] == value) == Equal) return i;
  return -1;
}
inline int64_t mem_scan(const uint8_t *p, int64_t n, uint8_t b) {
  return find<true>(p, n, b);
}
inline int64_t mem_nscan(const uint8_t *p, int64_t n, uint8_t b) {
  return find<false>(p, n, b);
}
inline int64_t mem_tnscan(const uint32_t *p, int64_t n, uint32_t v) {
  return find<false>(p, n, v);
}

// 1 when every element equals the value; a null buffer holds no elements to
// compare and so gives 0 unless the range is empty.
template <typename T>
inline int64_t mem_not(T value, const T *p, int64_t n) {
  if (n <= 0) return 1;
  if (p == nullptr) return 0;
  return find<false>(p, n, value) < 0 ? 1 : 0;
}

// A null operand orders before any buffer; two null operands are equal.
inline int64_t null_order(const void *a, const void *b) {
  if (a == b) return 0;
  return a == nullptr ? -1 : (b == nullptr ? 1 : 2);
}

inline int64_t mem_cmp(const uint8_t *a, const uint8_t *b, int64_t n) {
  if (n <= 0) return 0;
  if (int64_t order = null_order(a, b); order != 2) return order;
  for (int64_t i = 0; i < n; ++i)
    if (a[i] != b[i]) return a[i] > b[i] ? 1 : -1;
  return 0;
}

// Ordered by the sign of the wrapped 32-bit difference.
inline int64_t wmem_cmp(const uint32_t *a, const uint32_t *b, int64_t n) {
  if (n <= 0) return 0;
  if (int64_t order = null_order(a, b); order != 2) return order;
  for (int64_t i = 0; i < n; ++i)
    if (a[i] != b[i]) return static_cast<int32_t>(a[i] - b[i]) > 0 ? 1 : -1;
  return 0;
}

// Offset of the first byte at which the ranges differ, or n when they agree
// (0 for an empty or negative range).
inline int64_t mem_mismatch(const uint8_t *a, const uint8_t *b, int64_t n) {
  int64_t i = 0;
  while (i < n && a[i] == b[i]) ++i;
  return i;
}

// Copies as if through an intermediate buffer, whatever the overlap.
inline void *mem_move(const void *source, void *destination, int64_t n) {
  if (n <= 0 || source == nullptr || destination == nullptr) return destination;
  const auto *s = static_cast<const uint8_t *>(source);
  auto *d = static_cast<uint8_t *>(destination);
  if (reinterpret_cast<uintptr_t>(d) < reinterpret_cast<uintptr_t>(s))
    for (int64_t i = 0; i < n; ++i) d[i] = s[i];
  else
    for (int64_t i = n; i-- > 0;) d[i] = s[i];
  return destination;
}

inline int64_t miss_array(const double *values, int64_t n) {
  if (values == nullptr) return 0;
  for (int64_t i = 0; i < n; ++i)
    if (__builtin_isnan(values[i])) return 1;
  return 0;
}

}  // namespace kernel::scalar
