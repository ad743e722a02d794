// The hot paths with 32-byte registers, for processors with AVX2.
#include "kernel/hot.hpp"
#include "kernel/scalar.hpp"
#include "kernel/simd.hpp"

NLSSM_TARGET_AVX2_BEGIN

#include "kernel/simd_loops.hpp"

namespace kernel::avx2 {

using V = simd::V256;

void str_up(uint8_t *p, int64_t n) {
  simd::flip_case<V>(p, n, 'a');
}
void str_low(uint8_t *p, int64_t n) {
  simd::flip_case<V>(p, n, 'A');
}
void mem_set(uint8_t *p, uint8_t v, int64_t n) {
  simd::fill<V>(p, v, n);
}
void mem_tset(uint32_t *p, uint32_t v, int64_t n) {
  simd::fill<V>(p, v, n);
}
int64_t mem_scan(const uint8_t *p, int64_t n, uint8_t b) {
  return simd::find<V, true>(p, n, b);
}
int64_t mem_nscan(const uint8_t *p, int64_t n, uint8_t b) {
  return simd::find<V, false>(p, n, b);
}
int64_t mem_tnscan(const uint32_t *p, int64_t n, uint32_t v) {
  return simd::find<V, false>(p, n, v);
}

const HotOps kHotOps{str_up, str_low, mem_set, mem_tset, mem_scan, mem_nscan, mem_tnscan};

}  // namespace kernel::avx2

NLSSM_TARGET_AVX2_END
