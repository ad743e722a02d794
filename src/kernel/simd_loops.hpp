// The kernel's vector loops, written once over a vector policy V (simd.hpp):
// a scalar head up to the first V-aligned address, aligned whole registers,
// a scalar tail. Every template here depends on V, so each instantiation
// belongs to one instruction set; an instruction-set translation unit
// includes this header after all others and inside its target region.
#pragma once

#include <cstdint>

#include "kernel/scalar.hpp"
#include "kernel/simd.hpp"

namespace kernel::simd {

// Elements before the first V-aligned element, at most n. A pointer that is
// not aligned to its element size never reaches alignment: all scalar.
template <class V, typename T>
inline int64_t head_elements(const T *p, int64_t n) {
  const auto misalign = static_cast<int64_t>(reinterpret_cast<uintptr_t>(p) & (V::kBytes - 1));
  if (misalign % static_cast<int64_t>(sizeof(T)) != 0) return n;
  const int64_t head = misalign == 0 ? 0 : (V::kBytes - misalign) / static_cast<int64_t>(sizeof(T));
  return head < n ? head : n;
}

template <class V>
void flip_case(uint8_t *p, int64_t n, uint8_t lo) {
  int64_t i = head_elements<V>(p, n);
  scalar::flip_case(p, i, lo);
  for (; i + 2 * V::kBytes <= n; i += 2 * V::kBytes) {
    const auto a = V::load(p + i), b = V::load(p + i + V::kBytes);
    V::store(p + i, V::flip_case(a, lo));
    V::store(p + i + V::kBytes, V::flip_case(b, lo));
  }
  if (i + V::kBytes <= n) {
    V::store(p + i, V::flip_case(V::load(p + i), lo));
    i += V::kBytes;
  }
  scalar::flip_case(p + i, n - i, lo);
}

// Fills the range, with non-temporal stores when Stream (for ranges far
// larger than the last-level cache).
template <class V, bool Stream, typename T>
void fill(T *p, T value, int64_t n) {
  constexpr int64_t step = V::kBytes / sizeof(T);
  int64_t i = head_elements<V>(p, n);
  scalar::mem_fill(p, value, i);
  const auto v = V::template splat<T>(value);
  if constexpr (Stream) {
    for (; i + step <= n; i += step) V::stream(p + i, v);
    V::stream_fence();
  }
  for (; i + 4 * step <= n; i += 4 * step) {
    V::store(p + i, v);
    V::store(p + i + step, v);
    V::store(p + i + 2 * step, v);
    V::store(p + i + 3 * step, v);
  }
  for (; i + step <= n; i += step) V::store(p + i, v);
  scalar::mem_fill(p + i, value, n - i);
}

// Copies of at most 2 * V::kBytes bytes: the first and the last piece of the
// largest power of two that fits are loaded before either is stored, so the
// two may overlap each other and the ranges may overlap in any direction.
template <class V>
void copy_short(uint8_t *d, const uint8_t *s, int64_t n) {
  if (n >= V::kBytes) {
    const auto first = V::loadu(s), last = V::loadu(s + n - V::kBytes);
    V::storeu(d, first);
    V::storeu(d + n - V::kBytes, last);
    return;
  }
  if constexpr (V::kBytes > 16) {
    if (n >= 16) {
      using Half = simd::V128;
      const auto first = Half::loadu(s), last = Half::loadu(s + n - 16);
      Half::storeu(d, first);
      Half::storeu(d + n - 16, last);
      return;
    }
  }
  auto pieces = [&]<typename Word>(Word) {
    Word first, last;
    __builtin_memcpy(&first, s, sizeof(Word));
    __builtin_memcpy(&last, s + n - sizeof(Word), sizeof(Word));
    __builtin_memcpy(d, &first, sizeof(Word));
    __builtin_memcpy(d + n - sizeof(Word), &last, sizeof(Word));
  };
  if (n >= 8)
    pieces(uint64_t{});
  else if (n >= 4)
    pieces(uint32_t{});
  else if (n >= 2)
    pieces(uint16_t{});
  else if (n == 1)
    d[0] = s[0];
}

// Copies upwards: for disjoint ranges and for a destination below its
// source. The first and last registers of the source are loaded before any
// store and stored after the loop; in between, every aligned destination
// register is written after its source bytes are read, and with the
// destination below the source no store reaches a source byte still unread.
// Stream (disjoint ranges only) writes the aligned registers around the
// caches.
template <class V, bool Stream>
void copy_up(uint8_t *d, const uint8_t *s, int64_t n) {
  constexpr int64_t step = V::kBytes;
  if (n <= 2 * step) return copy_short<V>(d, s, n);
  const auto first = V::loadu(s), last = V::loadu(s + n - step);
  auto put = [d](int64_t at, typename V::Reg v) {
    if constexpr (Stream)
      V::stream(d + at, v);
    else
      V::store(d + at, v);
  };
  int64_t i = step - static_cast<int64_t>(reinterpret_cast<uintptr_t>(d) & (step - 1));
  for (; i + 4 * step <= n; i += 4 * step) {
    const auto r0 = V::loadu(s + i), r1 = V::loadu(s + i + step);
    const auto r2 = V::loadu(s + i + 2 * step), r3 = V::loadu(s + i + 3 * step);
    put(i, r0);
    put(i + step, r1);
    put(i + 2 * step, r2);
    put(i + 3 * step, r3);
  }
  for (; i + step <= n; i += step) put(i, V::loadu(s + i));
  if constexpr (Stream) V::stream_fence();
  V::storeu(d + n - step, last);
  V::storeu(d, first);
}

// Copies downwards, for a destination above its source: the mirror image of
// copy_up, from the last aligned destination register to the first.
template <class V>
void copy_down(uint8_t *d, const uint8_t *s, int64_t n) {
  constexpr int64_t step = V::kBytes;
  if (n <= 2 * step) return copy_short<V>(d, s, n);
  const auto first = V::loadu(s), last = V::loadu(s + n - step);
  int64_t e = n - static_cast<int64_t>(reinterpret_cast<uintptr_t>(d + n) & (step - 1));
  for (; e >= 4 * step; e -= 4 * step) {
    const auto r3 = V::loadu(s + e - step), r2 = V::loadu(s + e - 2 * step);
    const auto r1 = V::loadu(s + e - 3 * step), r0 = V::loadu(s + e - 4 * step);
    V::store(d + e - step, r3);
    V::store(d + e - 2 * step, r2);
    V::store(d + e - 3 * step, r1);
    V::store(d + e - 4 * step, r0);
  }
  for (; e >= step; e -= step) V::store(d + e - step, V::loadu(s + e - step));
  V::storeu(d, first);
  V::storeu(d + n - step, last);
}

// Index of the first element equal to (Equal) or different from the value.
template <class V, bool Equal, typename T>
int64_t find(const T *p, int64_t n, T value) {
  constexpr int64_t step = V::kBytes / sizeof(T);
  constexpr typename V::Mask none = Equal ? 0 : V::kAllBytes;
  int64_t i = head_elements<V>(p, n);
  if (const int64_t r = scalar::find<Equal>(p, i, value); r >= 0) return r;
  const auto key = V::template splat<T>(value);
  // Four registers per test while nothing is found; the hit itself is
  // located by the one-register loop below.
  for (; i + 4 * step <= n; i += 4 * step) {
    const auto e0 = V::template eq<T>(V::load(p + i), key);
    const auto e1 = V::template eq<T>(V::load(p + i + step), key);
    const auto e2 = V::template eq<T>(V::load(p + i + 2 * step), key);
    const auto e3 = V::template eq<T>(V::load(p + i + 3 * step), key);
    const auto all = Equal ? V::either(V::either(e0, e1), V::either(e2, e3))
                           : V::both(V::both(e0, e1), V::both(e2, e3));
    if (V::mask(all) != none) break;
  }
  for (; i + step <= n; i += step) {
    const typename V::Mask hits = V::mask(V::template eq<T>(V::load(p + i), key)) ^ none;
    if (hits != 0) return i + __builtin_ctz(hits) / static_cast<int>(sizeof(T));
  }
  if (const int64_t r = scalar::find<Equal>(p + i, n - i, value); r >= 0) return i + r;
  return -1;
}

// Offset of the first differing byte of two ranges, or n. The two ranges
// rarely share an alignment, so `a` is aligned and `b` read unaligned; four
// registers are tested at a time while they agree, which keeps long equal
// ranges at the speed of a plain block compare. The bytes before a's first
// aligned address and after its last are covered by one unaligned register
// each, overlapping the aligned ones.
template <class V>
int64_t mismatch(const uint8_t *a, const uint8_t *b, int64_t n) {
  constexpr int64_t step = V::kBytes;
  if (n < step) return scalar::mem_mismatch(a, b, n);
  // Bits of the bytes that differ in the register at `at`.
  auto differ = [a, b](int64_t at) {
    return V::mask(V::template eq<uint8_t>(V::loadu(a + at), V::loadu(b + at))) ^ V::kAllBytes;
  };
  if (const auto d = differ(0); d != 0) return __builtin_ctz(d);
  int64_t i = head_elements<V>(a, n);
  for (; i + 4 * step <= n; i += 4 * step) {
    const auto e0 = V::template eq<uint8_t>(V::load(a + i), V::loadu(b + i));
    const auto e1 = V::template eq<uint8_t>(V::load(a + i + step), V::loadu(b + i + step));
    const auto e2 = V::template eq<uint8_t>(V::load(a + i + 2 * step), V::loadu(b + i + 2 * step));
    const auto e3 = V::template eq<uint8_t>(V::load(a + i + 3 * step), V::loadu(b + i + 3 * step));
    if (V::mask(V::both(V::both(e0, e1), V::both(e2, e3))) != V::kAllBytes) break;
  }
  for (; i + step <= n; i += step)
    if (const auto d = differ(i); d != 0) return i + __builtin_ctz(d);
  if (i < n)
    if (const auto d = differ(n - step); d != 0) return n - step + __builtin_ctz(d);
  return n;
}

}  // namespace kernel::simd
