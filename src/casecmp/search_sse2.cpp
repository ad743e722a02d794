// The byte-pattern search with 16-byte registers, and the scalar rule.
#include <immintrin.h>

#include <cstring>

#include "casecmp/search_vector.hpp"

namespace nlssm::casecmp::simd {

int64_t find_scalar(const uint8_t *text, int64_t n, const uint8_t *pattern, int64_t m, int64_t unit,
                    int64_t from) {
  for (int64_t q = from; q + m <= n; q += unit) {
    if (text[q] == pattern[0] && std::memcmp(text + q, pattern, static_cast<size_t>(m)) == 0)
      return q;
  }
  return -1;
}

namespace sse2 {

struct Regs {
  using Reg = __m128i;
  static constexpr int64_t kBytes = 16;
  static Reg load(const uint8_t *p) { return _mm_loadu_si128(reinterpret_cast<const Reg *>(p)); }
  static Reg splat(const uint8_t *p, int64_t unit) {
    if (unit == 1) return _mm_set1_epi8(static_cast<char>(*p));
    if (unit == 2) {
      uint16_t u;
      std::memcpy(&u, p, 2);
      return _mm_set1_epi16(static_cast<short>(u));
    }
    uint32_t u;
    std::memcpy(&u, p, 4);
    return _mm_set1_epi32(static_cast<int>(u));
  }
  static Reg eq(Reg a, Reg b, int64_t unit) {
    return unit == 1   ? _mm_cmpeq_epi8(a, b)
           : unit == 2 ? _mm_cmpeq_epi16(a, b)
                       : _mm_cmpeq_epi32(a, b);
  }
  static Reg both(Reg a, Reg b) { return _mm_and_si128(a, b); }
  static uint32_t movemask(Reg v) { return static_cast<uint32_t>(_mm_movemask_epi8(v)); }
};

#include "casecmp/search_kernel.inc"

}  // namespace sse2
}  // namespace nlssm::casecmp::simd
