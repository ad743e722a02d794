// The block steps of UTF-8 to UTF-32 decoding, one per vector instruction set.
#pragma once

#include <bit>
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

// No block step does anything with fewer source bytes than this left.
inline constexpr int64_t kUtf8BlockStepMinBytes = 48;

// 32-byte blocks, reading sixteen bytes past a block.
void utf8_blocks_avx2(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit, bool big_endian,
                      int64_t &consumed, int64_t &chars);
// 64-byte blocks, reading three bytes past a clean block.
void utf8_blocks_avx512(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit, bool big_endian,
                        int64_t &consumed, int64_t &chars);

// The byte classes of a block of W bytes (32 or 64), one bit per byte, from
// the masks of its bytes with the top bit set and of those at least 0xC0,
// 0xC2, 0xE0, 0xF0 and 0xF5.
struct BlockClasses {
  uint64_t cont;      // continuation bytes
  uint64_t invalid;   // bytes that can never start a character
  uint64_t expected;  // bytes the block's leads announce as continuations
  uint64_t spill;     // the same for the three bytes after the block
};

template <int W>
constexpr BlockClasses classify_block(uint64_t high, uint64_t ge_c0, uint64_t ge_c2, uint64_t ge_e0,
                                      uint64_t ge_f0, uint64_t ge_f5) {
  constexpr uint64_t all = W == 64 ? ~uint64_t{0} : (uint64_t{1} << W) - 1;
  const uint64_t multi = ge_c2 & ~ge_f5, long3 = ge_e0 & ~ge_f5, lead4 = ge_f0 & ~ge_f5;
  return {high & ~ge_c0, (ge_c0 & ~ge_c2) | ge_f5, (multi << 1 | long3 << 2 | lead4 << 3) & all,
          multi >> (W - 1) | long3 >> (W - 2) | lead4 >> (W - 3)};
}

// What a step takes from a block that is not clean throughout: the
// characters before its first fault, without the last one when that one may
// be cut by the block's end or be the faulty one, and at most `room`. The
// next block starts at `advance`, found from the masks alone so that it
// need not wait for this one's decoding. A count of 0: the caller takes the
// next character alone. `clean`: the block had no fault.
struct CarefulPlan {
  uint64_t starts = 0;
  int count = 0;
  int advance = 0;
  bool clean = false;
};

template <int W>
constexpr CarefulPlan plan_careful(const BlockClasses &c, int64_t room) {
  const uint64_t wrong = (c.expected ^ c.cont) | c.invalid;
  const int clean = wrong == 0 ? W : std::countr_zero(wrong);
  uint64_t starts = ~c.cont & (clean == 64 ? ~uint64_t{0} : (uint64_t{1} << clean) - 1);
  int advance = W;
  if (clean < W || c.spill != 0) {
    if (starts == 0) return {};
    advance = 63 - std::countl_zero(starts);
    starts &= ~(uint64_t{1} << advance);
    if (starts == 0) return {};
  }
  int count = std::popcount(starts);
  if (count > room) {
    // Room for fewer characters: keep the first ones, go on at the next.
    count = static_cast<int>(room);
    uint64_t kept = 0, rest = starts;
    for (int q = 0; q < count; ++q) {
      kept |= rest & (~rest + 1);
      rest &= rest - 1;
    }
    starts = kept;
    advance = std::countr_zero(rest);
  }
  return {starts, count, advance, clean == W};
}

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
