// The table-mapping kernel for processors with AVX-512 byte permutes: two
// two-register permutes look a byte up in each half of the table, and bit 7
// picks the half. Any table, any length, 64 bytes per step, no plan.
#include <immintrin.h>

#include <algorithm>

#include "casecmp/table_map.hpp"
#include "kernel/cpu.hpp"

NLSSM_TARGET_AVX512VBMI_BEGIN

namespace nlssm::casecmp::detail {

// Every byte: 64 bytes per step at 64-byte aligned destinations (a store
// that straddles two cache lines costs twice), with masked loads and stores
// for the bytes before the first boundary and after the last. Masks keep
// the head and the blocks apart, so mapping in place never reads a byte
// already mapped.
int64_t map_bytes_avx512(const uint8_t *table, const uint8_t *src, uint8_t *dst, int64_t n) {
  const __m512i t0 = _mm512_loadu_si512(table);
  const __m512i t1 = _mm512_loadu_si512(table + 64);
  const __m512i t2 = _mm512_loadu_si512(table + 128);
  const __m512i t3 = _mm512_loadu_si512(table + 192);
  auto map = [&](__m512i x) {
    const __m512i low = _mm512_permutex2var_epi8(t0, x, t1);
    const __m512i high = _mm512_permutex2var_epi8(t2, x, t3);
    return _mm512_mask_blend_epi8(_mm512_movepi8_mask(x), low, high);
  };
  auto first = [](int64_t count) {
    return count >= 64 ? ~__mmask64{0} : (__mmask64{1} << count) - 1;
  };
  const auto misaligned = static_cast<int64_t>(reinterpret_cast<uintptr_t>(dst) & 63);
  int64_t i = std::min<int64_t>(n, misaligned == 0 ? 0 : 64 - misaligned);
  if (i > 0) {
    const __mmask64 head = first(i);
    _mm512_mask_storeu_epi8(dst, head, map(_mm512_maskz_loadu_epi8(head, src)));
  }
  for (; i + 64 <= n; i += 64) _mm512_store_si512(dst + i, map(_mm512_loadu_si512(src + i)));
  if (i < n) {
    const __mmask64 tail = first(n - i);
    _mm512_mask_storeu_epi8(dst + i, tail, map(_mm512_maskz_loadu_epi8(tail, src + i)));
  }
  return n;
}

}  // namespace nlssm::casecmp::detail

NLSSM_TARGET_AVX512VBMI_END
