// The table-mapping kernel for processors with AVX-512 byte permutes: two
// two-register permutes look a byte up in each half of the table, and bit 7
// picks the half. Any table, 64 bytes per step, no plan.
#include <immintrin.h>

#include "casecmp/table_map.hpp"
#include "kernel/cpu.hpp"

NLSSM_TARGET_AVX512VBMI_BEGIN

namespace nlssm::casecmp::detail {

// Starts at the first 64-byte boundary of the destination (the bytes before
// it, and the tail, are left to the caller's table loop): a store that
// straddles two cache lines costs twice.
int64_t map_blocks_avx512(const uint8_t *table, const uint8_t *src, uint8_t *dst, int64_t n) {
  const __m512i t0 = _mm512_loadu_si512(table);
  const __m512i t1 = _mm512_loadu_si512(table + 64);
  const __m512i t2 = _mm512_loadu_si512(table + 128);
  const __m512i t3 = _mm512_loadu_si512(table + 192);
  int64_t i = 0;
  for (; i + 64 <= n; i += 64) {
    const __m512i x = _mm512_loadu_si512(src + i);
    const __m512i low = _mm512_permutex2var_epi8(t0, x, t1);
    const __m512i high = _mm512_permutex2var_epi8(t2, x, t3);
    _mm512_store_si512(dst + i, _mm512_mask_blend_epi8(_mm512_movepi8_mask(x), low, high));
  }
  return i;
}

}  // namespace nlssm::casecmp::detail

NLSSM_TARGET_AVX512VBMI_END
