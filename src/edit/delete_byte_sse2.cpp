// The one-byte delete with 16-byte registers (the x86-64 baseline).
#include <cstring>

#include "edit/delete_byte.hpp"
#include "kernel/simd.hpp"

namespace nlssm::edit::sse2 {

using V = kernel::simd::V128;

#include "edit/delete_byte.inc"

}  // namespace nlssm::edit::sse2
