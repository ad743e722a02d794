// The byte-pattern search under every Index member: candidate positions
// where the pattern's first and last units both match, found a register
// at a time (16 bytes with SSE2, 32 with AVX2), then confirmed by a full
// compare. Matches are reported only at multiples of the unit width, so
// wide text is searched unit by unit.
#pragma once

#include <cstdint>

#include "kernel/cpu.hpp"

namespace nlssm::casecmp::simd {

// The first offset q >= from, q a multiple of `unit` (1, 2 or 4), with
// text[q, q + m) == pattern[0, m); -1 when there is none. `from` is a
// multiple of `unit`; m > 0 and a multiple of `unit`.
using FindFn = int64_t (*)(const uint8_t *text, int64_t n, const uint8_t *pattern, int64_t m,
                           int64_t unit, int64_t from);

struct SearchOps {
  FindFn find;
};

// The rule itself, one position at a time.
int64_t find_scalar(const uint8_t *text, int64_t n, const uint8_t *pattern, int64_t m, int64_t unit,
                    int64_t from);

namespace sse2 {
extern const SearchOps kSearchOps;
}
namespace avx2 {
extern const SearchOps kSearchOps;
}

inline constinit kernel::cpu::Dispatch<SearchOps, 2> search_ops{std::array{
    kernel::cpu::Variant<SearchOps>{kernel::cpu::Isa::avx2, &avx2::kSearchOps},
    kernel::cpu::Variant<SearchOps>{kernel::cpu::Isa::sse2, &sse2::kSearchOps},
}};

inline int64_t find_bytes(const uint8_t *text, int64_t n, const uint8_t *pattern, int64_t m,
                          int64_t unit, int64_t from) {
  return search_ops.get().find(text, n, pattern, m, unit, from);
}

}  // namespace nlssm::casecmp::simd
