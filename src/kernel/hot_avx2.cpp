// The hot paths with 32-byte registers, for processors with AVX2.
#include "kernel/hot.hpp"
#include "kernel/scalar.hpp"
#include "kernel/simd.hpp"

NLSSM_TARGET_AVX2_BEGIN

#include "kernel/simd_loops.hpp"

namespace kernel::avx2 {

using V = simd::V256;

#include "kernel/hot_ops.inc"

}  // namespace kernel::avx2

NLSSM_TARGET_AVX2_END
