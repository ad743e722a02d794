// The byte-pattern search with 32-byte registers, for processors with AVX2.
#include <immintrin.h>

#include <cstring>

#include "casecmp/search_vector.hpp"

NLSSM_TARGET_AVX2_BEGIN

namespace nlssm::casecmp::simd::avx2 {

struct Regs {
  using Reg = __m256i;
  static constexpr int64_t kBytes = 32;
  static Reg load(const uint8_t *p) { return _mm256_loadu_si256(reinterpret_cast<const Reg *>(p)); }
  static Reg splat(const uint8_t *p, int64_t unit) {
    if (unit == 1) return _mm256_set1_epi8(static_cast<char>(*p));
    if (unit == 2) {
      uint16_t u;
      std::memcpy(&u, p, 2);
      return _mm256_set1_epi16(static_cast<short>(u));
    }
    uint32_t u;
    std::memcpy(&u, p, 4);
    return _mm256_set1_epi32(static_cast<int>(u));
  }
  static Reg eq(Reg a, Reg b, int64_t unit) {
    return unit == 1   ? _mm256_cmpeq_epi8(a, b)
           : unit == 2 ? _mm256_cmpeq_epi16(a, b)
                       : _mm256_cmpeq_epi32(a, b);
  }
  static Reg both(Reg a, Reg b) { return _mm256_and_si256(a, b); }
  static uint32_t movemask(Reg v) { return static_cast<uint32_t>(_mm256_movemask_epi8(v)); }
};

#include "casecmp/search_kernel.inc"

}  // namespace nlssm::casecmp::simd::avx2

NLSSM_TARGET_AVX2_END
