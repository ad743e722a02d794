// UTF-8 to UTF-32, 64 source bytes per step with AVX-512 (VBMI and VBMI2):
// the bulk loop of the decoding driver on processors that have them.
//
// A step finds, from masks of the block's byte classes, the characters whose
// bytes are exactly what their lead bytes announce, as the AVX2 step does.
// Their start offsets are packed into one vector (a byte compress); each
// group of sixteen then fetches the four bytes from its start into a 32-bit
// lane (a byte permute), most significant first. A lane keeps the payload
// bits of its lead and continuation bytes, chosen by the lead's top nibble,
// merges the four 6-bit fields with two multiply-adds, and shifts away the
// fields past the character's length. The bytes a lane fetches past its
// character are dropped by that shift, so they may be anything.
#include <immintrin.h>

#include <bit>
#include <cstdint>

#include "kernel/cpu.hpp"
#include "unicode/utf8_blocks.hpp"

namespace nlssm::unicode {

NLSSM_TARGET_AVX512VBMI2_BEGIN

namespace {

// By the top nibble of a character's first byte: the payload bits of its
// four bytes (first byte highest), and how far the merged fields shift down.
// Continuation nibbles (8 to B) never start a character here.
inline __m512i payload_masks() {
  return _mm512_setr_epi32(0x7F3F3F3F, 0x7F3F3F3F, 0x7F3F3F3F, 0x7F3F3F3F, 0x7F3F3F3F, 0x7F3F3F3F,
                           0x7F3F3F3F, 0x7F3F3F3F, 0, 0, 0, 0, 0x1F3F3F3F, 0x1F3F3F3F, 0x0F3F3F3F,
                           0x073F3F3F);
}
inline __m512i field_shifts() {
  return _mm512_setr_epi32(18, 18, 18, 18, 18, 18, 18, 18, 0, 0, 0, 0, 12, 12, 6, 0);
}

// Sixteen characters whose first bytes are at the byte offsets in `starts`
// (lanes `first` to `first` + 15) of `block`, whose last characters may
// take their last bytes from the start of `next`.
inline __m512i decode16(__m512i block, __m512i next, __m512i starts, int first) {
  // Byte 4j + b of the fetch index is start j + 3 - b, so each lane holds
  // its character's bytes from the first (high) down.
  const __m512i spread = _mm512_add_epi8(
      _mm512_set1_epi8(static_cast<char>(first)),
      _mm512_set_epi8(15, 15, 15, 15, 14, 14, 14, 14, 13, 13, 13, 13, 12, 12, 12, 12, 11, 11, 11,
                      11, 10, 10, 10, 10, 9, 9, 9, 9, 8, 8, 8, 8, 7, 7, 7, 7, 6, 6, 6, 6, 5, 5, 5,
                      5, 4, 4, 4, 4, 3, 3, 3, 3, 2, 2, 2, 2, 1, 1, 1, 1, 0, 0, 0, 0));
  const __m512i index =
      _mm512_add_epi8(_mm512_permutexvar_epi8(spread, starts), _mm512_set1_epi32(0x00010203));
  const __m512i bytes = _mm512_permutex2var_epi8(block, index, next);
  const __m512i nibble = _mm512_srli_epi32(bytes, 28);
  const __m512i payload =
      _mm512_and_si512(bytes, _mm512_permutexvar_epi32(nibble, payload_masks()));
  // Bytes 3, 2 (the first two) and 1, 0 merge into 12-bit halves, then the
  // halves into 24 bits: first << 18 | second << 12 | third << 6 | fourth.
  const __m512i halves = _mm512_maddubs_epi16(payload, _mm512_set1_epi16(0x4001));
  const __m512i merged = _mm512_madd_epi16(halves, _mm512_set1_epi32(0x10000001));
  return _mm512_srlv_epi32(merged, _mm512_permutexvar_epi32(nibble, field_shifts()));
}

inline uint64_t at_least(__m512i x, uint8_t bound) {
  return _mm512_cmpge_epu8_mask(x, _mm512_set1_epi8(static_cast<char>(bound)));
}

inline void store16(uint8_t *d, __m512i c, __mmask16 lanes, bool big_endian) {
  if (big_endian) {
    c = _mm512_shuffle_epi8(c, _mm512_broadcast_i32x4(_mm_setr_epi8(3, 2, 1, 0, 7, 6, 5, 4, 11, 10,
                                                                    9, 8, 15, 14, 13, 12)));
  }
  _mm512_mask_storeu_epi32(d, lanes, c);
}

}  // namespace

namespace {

inline BlockClasses classify(__m512i x, uint64_t high) {
  return classify_block<64>(high, at_least(x, 0xC0), at_least(x, 0xC2), at_least(x, 0xE0),
                            at_least(x, 0xF0), at_least(x, 0xF5));
}

// The characters whose first bytes are marked in `starts`, in order.
inline void decode_starts(__m512i x, __m512i next, uint64_t starts, int count, uint8_t *d,
                          bool big_endian) {
  const __m512i offsets = _mm512_set_epi8(
      63, 62, 61, 60, 59, 58, 57, 56, 55, 54, 53, 52, 51, 50, 49, 48, 47, 46, 45, 44, 43, 42, 41,
      40, 39, 38, 37, 36, 35, 34, 33, 32, 31, 30, 29, 28, 27, 26, 25, 24, 23, 22, 21, 20, 19, 18,
      17, 16, 15, 14, 13, 12, 11, 10, 9, 8, 7, 6, 5, 4, 3, 2, 1, 0);
  const __m512i packed = _mm512_maskz_compress_epi8(starts, offsets);
  for (int g = 0; g < count; g += 16) {
    const int m = count - g;
    const __mmask16 lanes = m >= 16 ? 0xFFFF : static_cast<__mmask16>((1u << m) - 1);
    store16(d + 4 * g, decode16(x, next, packed, g), lanes, big_endian);
  }
}

// A 64-byte block; a clean one takes the last bytes of its last character
// from the three bytes after it.
struct Avx512Block {
  static constexpr int kWidth = 64, kCleanBytes = 67, kCarefulBytes = 64;
  const uint8_t *p;
  __m512i x;
  uint64_t high;
  explicit Avx512Block(const uint8_t *at)
      : p(at), x(_mm512_loadu_si512(at)), high(_mm512_movepi8_mask(x)) {}
  BlockClasses classes() const { return classify(x, high); }
  void widen_ascii(uint8_t *d, bool big_endian) const {
    for (int q = 0; q < 4; ++q) {
      const __m512i c =
          _mm512_cvtepu8_epi32(_mm_loadu_si128(reinterpret_cast<const __m128i *>(p + 16 * q)));
      store16(d + 64 * q, c, 0xFFFF, big_endian);
    }
  }
  int decode_clean(uint64_t starts, uint8_t *d, bool big_endian) const {
    const int count = std::popcount(starts);
    decode_starts(x, _mm512_maskz_loadu_epi8(0x7, p + 64), starts, count, d, big_endian);
    return count;
  }
  void decode(uint64_t starts, int count, uint8_t *d, bool big_endian) const {
    decode_starts(x, _mm512_setzero_si512(), starts, count, d, big_endian);
  }
};

#include "unicode/utf8_blocks_loop.inc"

}  // namespace

void utf8_blocks_avx512(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit, bool big_endian,
                        int64_t &consumed, int64_t &chars) {
  decode_blocks<Avx512Block>(s, n, d, limit, big_endian, consumed, chars);
}

NLSSM_TARGET_AVX512VBMI2_END

}  // namespace nlssm::unicode
