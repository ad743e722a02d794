// The one-byte delete with 32-byte registers, for processors with AVX2.
#include <cstring>

#include "edit/delete_byte.hpp"
#include "kernel/simd.hpp"

NLSSM_TARGET_AVX2_BEGIN

namespace nlssm::edit::avx2 {

using V = kernel::simd::V256;

#include "edit/delete_byte.inc"

}  // namespace nlssm::edit::avx2

NLSSM_TARGET_AVX2_END
