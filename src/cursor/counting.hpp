// Counting with the vector kernels in front of the exact rules, for the
// hot paths (UTF-8, two-byte units, double-byte code pages). Isa::kScalar
// runs the exact rules alone; tests compare every instruction set with it.
#pragma once

#include <nlssm/nlssm.h>

#include <cstdint>

#include "cursor/count_scalar.hpp"
#include "cursor/count_vector.hpp"

namespace nlssm::cursor {

// The instruction set the exported members use.
simd::Isa active_isa();

Counted count_utf8(simd::Isa isa, const uint8_t *p, int64_t n, int64_t flags);
int64_t count_wcs2(simd::Isa isa, const uint8_t *p, int64_t n, bool big_endian);
Counted count_dbcs(simd::Isa isa, const NLSSMHandle *h, const uint8_t *p, int64_t n, int64_t flags);

// Bytes of the first `count` characters (count >= 0); the text must hold
// them.
int64_t bytes_of_utf8(simd::Isa isa, const uint8_t *p, int64_t count);
int64_t bytes_of_wcs2(simd::Isa isa, const uint8_t *p, int64_t count, bool big_endian);
int64_t bytes_of_dbcs(simd::Isa isa, const NLSSMHandle *h, const uint8_t *p, int64_t count);

}  // namespace nlssm::cursor
