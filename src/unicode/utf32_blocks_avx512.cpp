// UTF-32 to UTF-8 and UTF-16, sixteen units per step with AVX-512 (VBMI and
// VBMI2): the bulk loop of the encoding driver on processors that have them.
//
// UTF-8: each 32-bit lane builds the four-byte form of its unit (a byte
// multishift takes the 6-bit fields, a mask and a marker make the bytes),
// and the shorter forms are that lane shifted down with their lead markers
// completed. A byte compress then keeps the first one to four bytes of every
// lane, in order. UTF-16: a lane holds its unit, or the two units of its
// surrogate pair, and a word compress keeps the units that are used.
#include <immintrin.h>

#include <cstdint>

#include "kernel/cpu.hpp"
#include "unicode/utf32_blocks.hpp"

namespace nlssm::unicode {

NLSSM_TARGET_AVX512VBMI2_BEGIN

namespace {

inline __m512i load_units(const uint8_t *p, bool big_endian) {
  const __m512i v = _mm512_loadu_si512(p);
  if (!big_endian) return v;
  return _mm512_shuffle_epi8(v, _mm512_broadcast_i32x4(_mm_setr_epi8(3, 2, 1, 0, 7, 6, 5, 4, 11, 10,
                                                                     9, 8, 15, 14, 13, 12)));
}

// Sixteen units as UTF-8, packed; returns the bytes written, or -1 (nothing
// written) when they do not fit in `room`.
inline int encode_utf8(__m512i c, uint8_t *d, int64_t room) {
  const __mmask16 two = _mm512_cmpge_epu32_mask(c, _mm512_set1_epi32(0x80));
  if (two == 0) {
    if (room < 16) return -1;
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d), _mm512_cvtepi32_epi8(c));
    return 16;
  }
  const __mmask16 three = _mm512_cmpge_epu32_mask(c, _mm512_set1_epi32(0x800));
  const __mmask16 four = _mm512_cmpge_epu32_mask(c, _mm512_set1_epi32(0x10000));
  // Bytes (first to last) c >> 18, c >> 12, c >> 6, c: the lead keeps all
  // eight bits and takes 0xF0 added (wrapping, as the one-unit encoder's
  // byte store does), the others keep six and take the marker 0x80.
  const __m512i fields = _mm512_multishift_epi64_epi8(_mm512_set1_epi64(0x20262C3200060C12), c);
  const __m512i long_form =
      _mm512_add_epi8(_mm512_ternarylogic_epi32(fields, _mm512_set1_epi32(0x3F3F3FFF),
                                                _mm512_set1_epi32(0x80808000),
                                                0xEA),  // (fields & mask) | marker
                      _mm512_set1_epi32(0xF0));
  // Dropping one or two leading bytes leaves 0x80 + c >> 12 or 0x80 + c >> 6
  // as the lead, which the three- and two-byte markers complete.
  __m512i bytes =
      _mm512_mask_or_epi32(c, two, _mm512_srli_epi32(long_form, 16), _mm512_set1_epi32(0x40));
  bytes =
      _mm512_mask_or_epi32(bytes, three, _mm512_srli_epi32(long_form, 8), _mm512_set1_epi32(0x60));
  bytes = _mm512_mask_mov_epi32(bytes, four, long_form);
  __m512i used = _mm512_set1_epi32(0x000000FF);
  used = _mm512_mask_mov_epi32(used, two, _mm512_set1_epi32(0x0000FFFF));
  used = _mm512_mask_mov_epi32(used, three, _mm512_set1_epi32(0x00FFFFFF));
  used = _mm512_mask_mov_epi32(used, four, _mm512_set1_epi32(-1));
  const uint64_t keep = _mm512_movepi8_mask(used);
  const int count = static_cast<int>(_mm_popcnt_u64(keep));
  if (room < count) return -1;
  _mm512_mask_storeu_epi8(d, _bzhi_u64(~uint64_t{0}, count),
                          _mm512_maskz_compress_epi8(keep, bytes));
  return count;
}

// Sixteen units as UTF-16 (surrogate pairs from 0x10000 up); returns the
// bytes written, or -1 (nothing written) when they do not fit in `room`.
inline int encode_utf16(__m512i c, uint8_t *d, int64_t room, bool big_endian) {
  const __m512i swap16 =
      _mm512_broadcast_i32x4(_mm_setr_epi8(1, 0, 3, 2, 5, 4, 7, 6, 9, 8, 11, 10, 13, 12, 15, 14));
  const __mmask16 pairs = _mm512_cmpge_epu32_mask(c, _mm512_set1_epi32(0x10000));
  if (pairs == 0) {
    if (room < 32) return -1;
    __m256i units = _mm512_cvtepi32_epi16(c);
    if (big_endian) units = _mm256_shuffle_epi8(units, _mm512_castsi512_si256(swap16));
    _mm256_storeu_si256(reinterpret_cast<__m256i *>(d), units);
    return 32;
  }
  const int count = 16 + static_cast<int>(_mm_popcnt_u32(pairs));
  if (room < 2 * count) return -1;
  // High surrogate in the low half of the lane (written first), low in the
  // high half.
  const __m512i high = _mm512_or_si512(
      _mm512_srli_epi32(_mm512_and_si512(_mm512_sub_epi32(c, _mm512_set1_epi32(0x10000)),
                                         _mm512_set1_epi32(0xFFC00)),
                        10),
      _mm512_set1_epi32(0xD800));
  const __m512i low =
      _mm512_or_si512(_mm512_and_si512(c, _mm512_set1_epi32(0x3FF)), _mm512_set1_epi32(0xDC00));
  const __m512i lanes = _mm512_mask_or_epi32(c, pairs, high, _mm512_slli_epi32(low, 16));
  const uint32_t keep = 0x55555555u | _pdep_u32(pairs, 0xAAAAAAAAu);
  __m512i units = _mm512_maskz_compress_epi16(keep, lanes);
  if (big_endian) units = _mm512_shuffle_epi8(units, swap16);
  _mm512_mask_storeu_epi16(d, _bzhi_u32(~0u, count), units);
  return 2 * count;
}

}  // namespace

void utf32_blocks_avx512(const uint8_t *s, int64_t units, bool big_endian, Utf32BlockForm form,
                         uint8_t *d, int64_t capacity, int64_t &unit, int64_t &total) {
  int64_t i = unit, t = total;
  while (units - i >= 16) {
    const __m512i c = load_units(s + 4 * i, big_endian);
    const int written =
        form == Utf32BlockForm::utf8
            ? encode_utf8(c, d + t, capacity - t)
            : encode_utf16(c, d + t, capacity - t, form == Utf32BlockForm::utf16_big);
    if (written < 0) break;
    i += 16;
    t += written;
  }
  unit = i;
  total = t;
}

NLSSM_TARGET_AVX512VBMI2_END

}  // namespace nlssm::unicode
