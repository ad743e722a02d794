// The table-mapping kernel with 32-byte registers, for processors with AVX2:
// runs of equal amounts as in the SSE2 kernel, or, when fewer steps, one
// byte shuffle per changed row of the table.
#include <immintrin.h>

#include "casecmp/table_map.hpp"
#include "kernel/cpu.hpp"

NLSSM_TARGET_AVX2_BEGIN

namespace nlssm::casecmp::detail {
namespace {

constexpr int kUnroll = 2;  // two registers per pass keep the adders busy

// Runs `steps` steps over each pair of 32-byte blocks: step(k, x, r) adds
// step k's amount for the source bytes x to the result r.
template <class Step>
int64_t each_block(const uint8_t *src, uint8_t *dst, int64_t n, int steps, Step step) {
  int64_t i = 0;
  for (; i + 32 * kUnroll <= n; i += 32 * kUnroll) {
    __m256i x[kUnroll], r[kUnroll];
    for (int u = 0; u < kUnroll; ++u) {
      x[u] = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(src + i + 32 * u));
      r[u] = x[u];
    }
    for (int k = 0; k < steps; ++k)
      for (int u = 0; u < kUnroll; ++u) r[u] = step(k, x[u], r[u]);
    for (int u = 0; u < kUnroll; ++u)
      _mm256_storeu_si256(reinterpret_cast<__m256i *>(dst + i + 32 * u), r[u]);
  }
  return i;
}

// A run: the byte shifted so that the run starts at -128 lies in it when it
// is below -128 + span + 1.
int64_t run_pieces(const MapPlan &plan, const uint8_t *src, uint8_t *dst, int64_t n) {
  __m256i shift[MapPlan::kMaxRows], bound[MapPlan::kMaxRows], amount[MapPlan::kMaxRows];
  for (int k = 0; k < plan.pieces; ++k) {
    shift[k] = _mm256_set1_epi8(static_cast<char>(0x80 - plan.low[k]));
    bound[k] = _mm256_set1_epi8(static_cast<char>(-128 + plan.span[k] + 1));
    amount[k] = _mm256_set1_epi8(static_cast<char>(plan.delta[k]));
  }
  return each_block(src, dst, n, plan.pieces, [&](int k, __m256i x, __m256i r) {
    const __m256i inside = _mm256_cmpgt_epi8(bound[k], _mm256_add_epi8(x, shift[k]));
    return _mm256_add_epi8(r, _mm256_and_si256(inside, amount[k]));
  });
}

// A byte of row h becomes its low nibble after x ^ 16h, every other byte 16
// or more; adding 0x70 with saturation sets bit 7 for those others, and the
// shuffle answers 0 for a byte with bit 7 set.
int64_t run_rows(const MapPlan &plan, const uint8_t *src, uint8_t *dst, int64_t n) {
  __m256i select[MapPlan::kMaxRows], amounts[MapPlan::kMaxRows];
  for (int k = 0; k < plan.rows; ++k) {
    select[k] = _mm256_set1_epi8(static_cast<char>(plan.row[k] << 4));
    amounts[k] = _mm256_broadcastsi128_si256(
        _mm_load_si128(reinterpret_cast<const __m128i *>(plan.rowDelta[k])));
  }
  const __m256i saturate = _mm256_set1_epi8(0x70);
  return each_block(src, dst, n, plan.rows, [&](int k, __m256i x, __m256i r) {
    const __m256i index = _mm256_adds_epu8(_mm256_xor_si256(x, select[k]), saturate);
    return _mm256_add_epi8(r, _mm256_shuffle_epi8(amounts[k], index));
  });
}

}  // namespace

int64_t map_blocks_avx2(const MapPlan &plan, const uint8_t *src, uint8_t *dst, int64_t n) {
  if (plan.pieces >= 0 && plan.pieces <= plan.rows) return run_pieces(plan, src, dst, n);
  return run_rows(plan, src, dst, n);
}

}  // namespace nlssm::casecmp::detail

NLSSM_TARGET_AVX2_END
