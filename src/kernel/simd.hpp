// Vector policies: the few register operations the kernel loops need, for
// 16-byte (SSE2) and 32-byte (AVX2) registers. A loop written once over a
// policy V (see simd_loops.hpp) becomes the variant for each instruction set.
#pragma once

#include <immintrin.h>

#include <cstdint>

#include "kernel/cpu.hpp"

namespace kernel::simd {

#define NLSSM_VEC_FN [[gnu::always_inline]] static inline

// 16 bytes per register: the x86-64 baseline.
struct V128 {
  using Reg = __m128i;
  using Mask = uint32_t;  // one bit per byte
  static constexpr int64_t kBytes = 16;
  static constexpr Mask kAllBytes = 0xFFFFu;

  NLSSM_VEC_FN Reg load(const void *p) { return _mm_load_si128(static_cast<const Reg *>(p)); }
  NLSSM_VEC_FN Reg loadu(const void *p) { return _mm_loadu_si128(static_cast<const Reg *>(p)); }
  NLSSM_VEC_FN void store(void *p, Reg v) { _mm_store_si128(static_cast<Reg *>(p), v); }
  NLSSM_VEC_FN void storeu(void *p, Reg v) { _mm_storeu_si128(static_cast<Reg *>(p), v); }
  // Bypasses the caches: for blocks much larger than they are.
  NLSSM_VEC_FN void stream(void *p, Reg v) { _mm_stream_si128(static_cast<Reg *>(p), v); }
  NLSSM_VEC_FN void stream_fence() { _mm_sfence(); }
  template <typename T>
  NLSSM_VEC_FN Reg splat(T v) {
    if constexpr (sizeof(T) == 1)
      return _mm_set1_epi8(static_cast<char>(v));
    else
      return _mm_set1_epi32(static_cast<int>(v));
  }
  // All-ones lanes where the elements of the given size are equal.
  template <typename T>
  NLSSM_VEC_FN Reg eq(Reg a, Reg b) {
    if constexpr (sizeof(T) == 1)
      return _mm_cmpeq_epi8(a, b);
    else
      return _mm_cmpeq_epi32(a, b);
  }
  NLSSM_VEC_FN Reg both(Reg a, Reg b) { return _mm_and_si128(a, b); }
  NLSSM_VEC_FN Reg either(Reg a, Reg b) { return _mm_or_si128(a, b); }
  NLSSM_VEC_FN Mask mask(Reg v) { return static_cast<Mask>(_mm_movemask_epi8(v)); }
  // Flips bit 0x20 of bytes in [lo, lo + 25]: shifted so that range becomes
  // the 26 smallest signed values, it takes one signed comparison.
  NLSSM_VEC_FN Reg flip_case(Reg v, uint8_t lo) {
    const Reg shifted = _mm_add_epi8(v, splat<uint8_t>(static_cast<uint8_t>(0x80 - lo)));
    const Reg in_range = _mm_cmplt_epi8(shifted, splat<uint8_t>(0x80 + 26));
    return _mm_xor_si128(v, _mm_and_si128(in_range, splat<uint8_t>(0x20)));
  }
};

NLSSM_TARGET_AVX2_BEGIN

// 32 bytes per register; only run where cpu::supports(Isa::avx2).
struct V256 {
  using Reg = __m256i;
  using Mask = uint32_t;
  static constexpr int64_t kBytes = 32;
  static constexpr Mask kAllBytes = 0xFFFFFFFFu;

  NLSSM_VEC_FN Reg load(const void *p) { return _mm256_load_si256(static_cast<const Reg *>(p)); }
  NLSSM_VEC_FN Reg loadu(const void *p) { return _mm256_loadu_si256(static_cast<const Reg *>(p)); }
  NLSSM_VEC_FN void store(void *p, Reg v) { _mm256_store_si256(static_cast<Reg *>(p), v); }
  NLSSM_VEC_FN void storeu(void *p, Reg v) { _mm256_storeu_si256(static_cast<Reg *>(p), v); }
  NLSSM_VEC_FN void stream(void *p, Reg v) { _mm256_stream_si256(static_cast<Reg *>(p), v); }
  NLSSM_VEC_FN void stream_fence() { _mm_sfence(); }
  template <typename T>
  NLSSM_VEC_FN Reg splat(T v) {
    if constexpr (sizeof(T) == 1)
      return _mm256_set1_epi8(static_cast<char>(v));
    else
      return _mm256_set1_epi32(static_cast<int>(v));
  }
  template <typename T>
  NLSSM_VEC_FN Reg eq(Reg a, Reg b) {
    if constexpr (sizeof(T) == 1)
      return _mm256_cmpeq_epi8(a, b);
    else
      return _mm256_cmpeq_epi32(a, b);
  }
  NLSSM_VEC_FN Reg both(Reg a, Reg b) { return _mm256_and_si256(a, b); }
  NLSSM_VEC_FN Reg either(Reg a, Reg b) { return _mm256_or_si256(a, b); }
  NLSSM_VEC_FN Mask mask(Reg v) { return static_cast<Mask>(_mm256_movemask_epi8(v)); }
  NLSSM_VEC_FN Reg flip_case(Reg v, uint8_t lo) {
    const Reg shifted = _mm256_add_epi8(v, splat<uint8_t>(static_cast<uint8_t>(0x80 - lo)));
    const Reg in_range = _mm256_cmpgt_epi8(splat<uint8_t>(0x80 + 26), shifted);
    return _mm256_xor_si256(v, _mm256_and_si256(in_range, splat<uint8_t>(0x20)));
  }
};

NLSSM_TARGET_AVX2_END

#undef NLSSM_VEC_FN

}  // namespace kernel::simd
