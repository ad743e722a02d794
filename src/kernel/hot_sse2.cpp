// The hot paths with 16-byte registers (every x86-64 processor).
#include "kernel/hot.hpp"
#include "kernel/simd.hpp"
#include "kernel/simd_loops.hpp"

namespace kernel::sse2 {

using V = simd::V128;

#include "kernel/hot_ops.inc"

}  // namespace kernel::sse2
