// The block step of UTF-8 to UTF-32 decoding for processors with AVX2.
#pragma once

#include <cstdint>

namespace nlssm::unicode {

// Decodes whole characters from `s` + `consumed` into 32-bit slots at `d` +
// 4 x `chars` (big- or little-endian), 32 source bytes per step, while at
// least 35 source bytes remain and fewer than `limit` characters are stored.
// It takes only characters whose bytes are exactly what their leads announce
// and stops before any other (an invalid lead, a missing or stray
// continuation byte, a character cut by the block's end), which the
// one-character decoder then takes. The values are those the one-character
// decoder gives for the same bytes. Reads no byte at or past `n`.
void utf8_blocks_avx2(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit, bool big_endian,
                      int64_t &consumed, int64_t &chars);

}  // namespace nlssm::unicode
