// The block steps of UTF-32 to UTF-8 and UTF-16 encoding, one per vector
// instruction set.
#pragma once

#include <cstdint>

#include "kernel/cpu.hpp"

namespace nlssm::unicode {

// What a block step writes: the forms of the module's UTF-8 encoder and its
// UTF-16 encoder with surrogate pairs, in either unit order.
enum class Utf32BlockForm : uint8_t { none, utf8, utf16_little, utf16_big };

// A block step encodes the 32-bit units (big- or little-endian) of `s` from
// unit `unit` on into `d` + `total`, sixteen units at a time, while sixteen
// remain and the block's whole encoding fits below `capacity`; it advances
// `unit` and `total`. Every unit is written exactly as the one-unit encoder
// writes it with room to spare, so the caller goes on one unit at a time
// from where the step stopped. Writes nothing at or past `capacity`.
using Utf32BlockStep = void (*)(const uint8_t *s, int64_t units, bool big_endian,
                                Utf32BlockForm form, uint8_t *d, int64_t capacity, int64_t &unit,
                                int64_t &total);

void utf32_blocks_avx2(const uint8_t *s, int64_t units, bool big_endian, Utf32BlockForm form,
                       uint8_t *d, int64_t capacity, int64_t &unit, int64_t &total);
void utf32_blocks_avx512(const uint8_t *s, int64_t units, bool big_endian, Utf32BlockForm form,
                         uint8_t *d, int64_t capacity, int64_t &unit, int64_t &total);

// The block step built for `isa`, or null where there is none.
Utf32BlockStep utf32_block_step(kernel::cpu::Isa isa);
// The best block step for this processor, chosen once.
Utf32BlockStep utf32_best_block_step();

}  // namespace nlssm::unicode
