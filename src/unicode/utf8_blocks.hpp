// The block steps of UTF-8 to UTF-32 decoding, one per vector instruction set.
#pragma once

#include <cstdint>

#include "kernel/cpu.hpp"

namespace nlssm::unicode {

// A block step decodes whole characters from `s` + `consumed` into 32-bit
// slots at `d` + 4 x `chars` (big- or little-endian), one block of source
// bytes per step, while a whole block remains before `n` and fewer than
// `limit` characters are stored. It takes only characters whose bytes are
// exactly what their leads announce and stops before any other (an invalid
// lead, a missing or stray continuation byte, a character cut by the
// block's end), which the one-character decoder then takes. The values are
// those the one-character decoder gives for the same bytes. Reads no byte at
// or past `n`.
using Utf8BlockStep = void (*)(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit,
                               bool big_endian, int64_t &consumed, int64_t &chars);

// 32-byte blocks; reads three bytes past a block, so needs 35 bytes.
void utf8_blocks_avx2(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit, bool big_endian,
                      int64_t &consumed, int64_t &chars);
// 64-byte blocks.
void utf8_blocks_avx512(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit, bool big_endian,
                        int64_t &consumed, int64_t &chars);

// The block step built for `isa`, or null where there is none (SSE2: the
// bulk loop then runs alone).
Utf8BlockStep utf8_block_step(kernel::cpu::Isa isa);

// The best block step for this processor, chosen once.
Utf8BlockStep utf8_best_block_step();

// The UTF-8 decoder and a 4-byte encoder in one pass: converts characters
// from `s` + `consumed` into 32-bit slots at `d` + 4 x `chars` (big- or
// little-endian) while at least 4 source bytes remain, fewer than `limit`
// characters are stored and each lead byte is valid; advances `consumed` and
// `chars`. It gives exactly what the one-character UTF-8 decoder and UTF-32
// encoder give one by one there (a fixed-width encoder cannot fail within
// the limit), and leaves the last bytes and any invalid lead to them. Runs
// `step` (null for none) wherever a block remains.
void utf8_to_utf32_bulk(Utf8BlockStep step, const uint8_t *s, int64_t n, uint8_t *d, int64_t limit,
                        bool big_endian, int64_t &consumed, int64_t &chars);

}  // namespace nlssm::unicode
