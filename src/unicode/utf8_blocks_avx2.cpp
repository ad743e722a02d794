// UTF-8 to UTF-32, 32 source bytes per step with AVX2: the bulk loop of the
// decoding driver for text that is not all ASCII.
//
// A step classifies the 32 bytes of a block by their top bits and finds the
// characters whose bytes are exactly what their lead bytes announce: a lead
// of length n followed by n - 1 continuation bytes, then the next lead. Over
// those characters the one-character decoder would take the same bytes and
// build the same values, so the step decodes them all at once: their start
// offsets become gather indices, and each 32-bit lane assembles its
// character from its lead and continuation bytes. The step stops before the
// first character that is cut by the block's end, does not look as
// announced, or has an invalid lead; the caller decodes that one alone.
#include <immintrin.h>

#include <array>
#include <cstdint>
#include <cstring>

#include "kernel/cpu.hpp"
#include "unicode/utf8_blocks.hpp"

namespace nlssm::unicode {
namespace {

// For every byte value, the offsets of its set bits, in order.
struct BitOffsets {
  std::array<std::array<uint8_t, 8>, 256> offsets{};
  std::array<uint8_t, 256> count{};
};
constexpr BitOffsets make_bit_offsets() {
  BitOffsets t;
  for (int v = 0; v < 256; ++v) {
    int n = 0;
    for (int b = 0; b < 8; ++b)
      if (v >> b & 1) t.offsets[v][n++] = static_cast<uint8_t>(b);
    t.count[v] = static_cast<uint8_t>(n);
  }
  return t;
}
constexpr BitOffsets kBitOffsets = make_bit_offsets();

}  // namespace

NLSSM_TARGET_AVX2_BEGIN

namespace {

inline uint32_t at_least(__m256i x, uint8_t bound) {
  const __m256i b = _mm256_set1_epi8(static_cast<char>(bound));
  return static_cast<uint32_t>(_mm256_movemask_epi8(_mm256_cmpeq_epi8(_mm256_max_epu8(x, b), x)));
}

// Eight characters starting at `base` + offsets: each lane's four bytes
// (little-endian) become the character its lead announces.
inline __m256i decode8(const uint8_t *base, __m256i offsets) {
  const __m256i x = _mm256_i32gather_epi32(reinterpret_cast<const int *>(base), offsets, 1);
  const __m256i low6 = _mm256_set1_epi32(0x3F);
  const __m256i b0 = _mm256_and_si256(x, _mm256_set1_epi32(0xFF));
  const __m256i b1 = _mm256_and_si256(_mm256_srli_epi32(x, 8), low6);
  const __m256i b2 = _mm256_and_si256(_mm256_srli_epi32(x, 16), low6);
  const __m256i b3 = _mm256_and_si256(_mm256_srli_epi32(x, 24), low6);
  const __m256i two =
      _mm256_or_si256(_mm256_slli_epi32(_mm256_and_si256(b0, _mm256_set1_epi32(0x1F)), 6), b1);
  const __m256i three =
      _mm256_or_si256(_mm256_slli_epi32(_mm256_and_si256(b0, _mm256_set1_epi32(0x0F)), 12),
                      _mm256_or_si256(_mm256_slli_epi32(b1, 6), b2));
  const __m256i four = _mm256_or_si256(
      _mm256_slli_epi32(_mm256_and_si256(b0, _mm256_set1_epi32(0x07)), 18),
      _mm256_or_si256(_mm256_slli_epi32(b1, 12), _mm256_or_si256(_mm256_slli_epi32(b2, 6), b3)));
  __m256i c = b0;
  c = _mm256_blendv_epi8(c, two, _mm256_cmpgt_epi32(b0, _mm256_set1_epi32(0xBF)));
  c = _mm256_blendv_epi8(c, three, _mm256_cmpgt_epi32(b0, _mm256_set1_epi32(0xDF)));
  c = _mm256_blendv_epi8(c, four, _mm256_cmpgt_epi32(b0, _mm256_set1_epi32(0xEF)));
  return c;
}

inline void store8(uint8_t *d, __m256i c, int count, bool big_endian) {
  if (big_endian) {
    const __m256i swap = _mm256_setr_epi8(3, 2, 1, 0, 7, 6, 5, 4, 11, 10, 9, 8, 15, 14, 13, 12, 3,
                                          2, 1, 0, 7, 6, 5, 4, 11, 10, 9, 8, 15, 14, 13, 12);
    c = _mm256_shuffle_epi8(c, swap);
  }
  if (count == 8) {
    _mm256_storeu_si256(reinterpret_cast<__m256i *>(d), c);
    return;
  }
  const __m256i lane = _mm256_setr_epi32(0, 1, 2, 3, 4, 5, 6, 7);
  const __m256i mask = _mm256_cmpgt_epi32(_mm256_set1_epi32(count), lane);
  _mm256_maskstore_epi32(reinterpret_cast<int *>(d), mask, c);
}

}  // namespace

void utf8_blocks_avx2(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit, bool big_endian,
                      int64_t &consumed, int64_t &chars) {
  int64_t i = consumed, k = chars;
  // A gather reads four bytes at a character's start, so a block needs three
  // bytes after it.
  while (n - i >= 35 && k < limit) {
    const __m256i x = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + i));
    const uint32_t high = static_cast<uint32_t>(_mm256_movemask_epi8(x));
    if (high == 0 && limit - k >= 32) {
      // ASCII: every byte is a character.
      for (int q = 0; q < 4; ++q) {
        const __m256i c =
            _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i *>(s + i + 8 * q)));
        store8(d + 4 * (k + 8 * q), c, 8, big_endian);
      }
      i += 32;
      k += 32;
      continue;
    }
    const uint32_t ge_c0 = at_least(x, 0xC0), ge_c2 = at_least(x, 0xC2);
    const uint32_t ge_e0 = at_least(x, 0xE0), ge_f0 = at_least(x, 0xF0);
    const uint32_t ge_f5 = at_least(x, 0xF5);
    const uint32_t cont = high & ~ge_c0;
    const uint64_t lead2 = ge_c2 & ~ge_e0, lead3 = ge_e0 & ~ge_f0, lead4 = ge_f0 & ~ge_f5;
    const uint32_t invalid = (ge_c0 & ~ge_c2) | ge_f5;
    const uint64_t expected = (lead2 | lead3 | lead4) << 1 | (lead3 | lead4) << 2 | lead4 << 3;
    // Clean up to the first byte that is not what the leads announce, or
    // that is an invalid lead.
    const uint64_t wrong = ((expected ^ cont) & 0xFFFFFFFFu) | invalid | (uint64_t{1} << 32);
    const int clean = __builtin_ctzll(wrong);
    uint64_t starts = ~uint64_t{cont} & ((uint64_t{1} << clean) - 1);
    // The last character before a fault or cut by the block's end may be
    // incomplete: leave it to the one-character decoder.
    if (clean < 32 || (expected >> 32) != 0) {
      if (starts == 0) break;
      starts &= ~(uint64_t{1} << (63 - __builtin_clzll(starts)));
    }
    if (starts == 0) break;
    // Offsets of the characters, chunk by chunk of the start mask.
    alignas(32) uint8_t offsets[48];
    int count = 0;
    for (int chunk = 0; chunk < 4; ++chunk) {
      const uint8_t bits = static_cast<uint8_t>(starts >> (8 * chunk));
      uint64_t eight;
      std::memcpy(&eight, kBitOffsets.offsets[bits].data(), 8);
      eight += 0x0101010101010101ull * static_cast<uint64_t>(8 * chunk);
      std::memcpy(offsets + count, &eight, 8);
      count += kBitOffsets.count[bits];
    }
    if (count > limit - k) count = static_cast<int>(limit - k);
    for (int g = 0; g < count; g += 8) {
      const int m = count - g < 8 ? count - g : 8;
      const __m256i idx =
          _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i *>(offsets + g)));
      store8(d + 4 * (k + g), decode8(s + i, idx), m, big_endian);
    }
    // The next block starts at the character after the last one decoded.
    const int last = offsets[count - 1];
    const uint8_t lead = s[i + last];
    i += last + (lead < 0x80 ? 1 : lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : 4);
    k += count;
    if (clean < 32) break;  // the caller takes the faulty character alone
  }
  consumed = i;
  chars = k;
}

NLSSM_TARGET_AVX2_END

}  // namespace nlssm::unicode
