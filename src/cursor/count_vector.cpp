// The vector counting kernels, compiled once for SSE2 (the x86-64
// baseline) and once for AVX2, and the dispatch between them.
#include "cursor/count_vector.hpp"

#include <immintrin.h>

#include "cursor/char_model.hpp"
#include "kernel/cpu.hpp"

namespace nlssm::cursor::simd {

bool ByteRanges::from_flags(const uint8_t *flags, uint8_t bit) {
  count = 0;
  for (unsigned b = 0; b < 256;) {
    if ((flags[b] & bit) == 0) {
      ++b;
      continue;
    }
    unsigned e = b;
    while (e + 1 < 256 && (flags[e + 1] & bit) != 0) ++e;
    if (count == 4) return false;
    low[count] = static_cast<uint8_t>(b);
    span[count] = static_cast<uint8_t>(e - b);
    ++count;
    b = e + 1;
  }
  return true;
}

namespace sse2 {

struct V {
  using Vec = __m128i;
  static constexpr int64_t kWidth = 16;
  static Vec load(const uint8_t *p) {
    return _mm_loadu_si128(reinterpret_cast<const __m128i *>(p));
  }
  static Vec zero() { return _mm_setzero_si128(); }
  static Vec splat(uint8_t b) { return _mm_set1_epi8(static_cast<char>(b)); }
  static Vec splat16(uint16_t u) { return _mm_set1_epi16(static_cast<short>(u)); }
  static Vec bit_or(Vec a, Vec b) { return _mm_or_si128(a, b); }
  static Vec bit_and(Vec a, Vec b) { return _mm_and_si128(a, b); }
  static Vec bit_xor(Vec a, Vec b) { return _mm_xor_si128(a, b); }
  // 0x80..0xBF are the signed bytes below -64.
  static Vec continuation(Vec v) { return _mm_cmplt_epi8(v, _mm_set1_epi8(-64)); }
  static Vec at_least(Vec v, Vec bound) { return _mm_cmpeq_epi8(_mm_max_epu8(v, bound), v); }
  static Vec in_range(Vec v, Vec low, Vec span) {
    const Vec d = _mm_sub_epi8(v, low);
    return _mm_cmpeq_epi8(_mm_min_epu8(d, span), d);
  }
  static Vec sub8(Vec a, Vec b) { return _mm_sub_epi8(a, b); }
  static Vec sub16(Vec a, Vec b) { return _mm_sub_epi16(a, b); }
  static Vec eq16(Vec a, Vec b) { return _mm_cmpeq_epi16(a, b); }
  static Vec swap16(Vec v) { return _mm_or_si128(_mm_slli_epi16(v, 8), _mm_srli_epi16(v, 8)); }
  static bool any(Vec v) { return _mm_movemask_epi8(v) != 0; }
  static uint32_t movemask(Vec v) { return static_cast<uint32_t>(_mm_movemask_epi8(v)); }
  static int64_t sum_bytes(Vec v) {
    const Vec s = _mm_sad_epu8(v, _mm_setzero_si128());
    return _mm_cvtsi128_si64(s) + _mm_cvtsi128_si64(_mm_unpackhi_epi64(s, s));
  }
  static int64_t sum16(Vec v) {
    const Vec s = _mm_madd_epi16(v, _mm_set1_epi16(1));
    alignas(16) int32_t lanes[4];
    _mm_store_si128(reinterpret_cast<__m128i *>(lanes), s);
    return int64_t{lanes[0]} + lanes[1] + lanes[2] + lanes[3];
  }
};

#include "cursor/count_kernels.inc"

}  // namespace sse2

#if defined(__clang__)
#pragma clang attribute push(__attribute__((target("avx2,popcnt"))), apply_to = function)
#else
#pragma GCC push_options
#pragma GCC target("avx2,popcnt")
#endif

namespace avx2 {

struct V {
  using Vec = __m256i;
  static constexpr int64_t kWidth = 32;
  static Vec load(const uint8_t *p) {
    return _mm256_loadu_si256(reinterpret_cast<const __m256i *>(p));
  }
  static Vec zero() { return _mm256_setzero_si256(); }
  static Vec splat(uint8_t b) { return _mm256_set1_epi8(static_cast<char>(b)); }
  static Vec splat16(uint16_t u) { return _mm256_set1_epi16(static_cast<short>(u)); }
  static Vec bit_or(Vec a, Vec b) { return _mm256_or_si256(a, b); }
  static Vec bit_and(Vec a, Vec b) { return _mm256_and_si256(a, b); }
  static Vec bit_xor(Vec a, Vec b) { return _mm256_xor_si256(a, b); }
  static Vec continuation(Vec v) { return _mm256_cmpgt_epi8(_mm256_set1_epi8(-64), v); }
  static Vec at_least(Vec v, Vec bound) { return _mm256_cmpeq_epi8(_mm256_max_epu8(v, bound), v); }
  static Vec in_range(Vec v, Vec low, Vec span) {
    const Vec d = _mm256_sub_epi8(v, low);
    return _mm256_cmpeq_epi8(_mm256_min_epu8(d, span), d);
  }
  static Vec sub8(Vec a, Vec b) { return _mm256_sub_epi8(a, b); }
  static Vec sub16(Vec a, Vec b) { return _mm256_sub_epi16(a, b); }
  static Vec eq16(Vec a, Vec b) { return _mm256_cmpeq_epi16(a, b); }
  static Vec swap16(Vec v) {
    return _mm256_or_si256(_mm256_slli_epi16(v, 8), _mm256_srli_epi16(v, 8));
  }
  static bool any(Vec v) { return !_mm256_testz_si256(v, v); }
  static uint32_t movemask(Vec v) { return static_cast<uint32_t>(_mm256_movemask_epi8(v)); }
  static int64_t sum_bytes(Vec v) {
    const Vec s = _mm256_sad_epu8(v, _mm256_setzero_si256());
    alignas(32) int64_t lanes[4];
    _mm256_store_si256(reinterpret_cast<__m256i *>(lanes), s);
    return lanes[0] + lanes[1] + lanes[2] + lanes[3];
  }
  static int64_t sum16(Vec v) {
    const Vec s = _mm256_madd_epi16(v, _mm256_set1_epi16(1));
    alignas(32) int32_t lanes[8];
    _mm256_store_si256(reinterpret_cast<__m256i *>(lanes), s);
    int64_t total = 0;
    for (int32_t lane : lanes) total += lane;
    return total;
  }
};

#include "cursor/count_kernels.inc"

}  // namespace avx2

#if defined(__clang__)
#pragma clang attribute pop
#else
#pragma GCC pop_options
#endif

Isa best_isa() {
  return kernel::cpu::supports(kernel::cpu::Isa::avx2) ? Isa::kAvx2 : Isa::kSse2;
}

Prefix utf8_prefix(Isa isa, const uint8_t *p, int64_t n, int64_t limit) {
  switch (isa) {
    case Isa::kAvx2:
      return avx2::utf8_kernel(p, n, limit);
    case Isa::kSse2:
      return sse2::utf8_kernel(p, n, limit);
    default:
      return {0, 0};
  }
}

Prefix wcs2_prefix(Isa isa, const uint8_t *p, int64_t n, int64_t limit, bool big_endian) {
  switch (isa) {
    case Isa::kAvx2:
      return avx2::wcs2_kernel(p, n, limit, big_endian);
    case Isa::kSse2:
      return sse2::wcs2_kernel(p, n, limit, big_endian);
    default:
      return {0, 0};
  }
}

Prefix dbcs_prefix(Isa isa, const uint8_t *p, int64_t n, int64_t limit, const ByteRanges &lead,
                   const ByteRanges &trail) {
  switch (isa) {
    case Isa::kAvx2:
      return avx2::dbcs_kernel(p, n, limit, lead, trail);
    case Isa::kSse2:
      return sse2::dbcs_kernel(p, n, limit, lead, trail);
    default:
      return {0, 0};
  }
}

}  // namespace nlssm::cursor::simd
