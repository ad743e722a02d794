// The hot paths with 16-byte registers (every x86-64 processor).
#include "kernel/hot.hpp"
#include "kernel/simd.hpp"
#include "kernel/simd_loops.hpp"

namespace kernel::sse2 {

using V = simd::V128;

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

}  // namespace kernel::sse2
