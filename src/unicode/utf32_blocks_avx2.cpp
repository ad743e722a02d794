// UTF-32 to UTF-8 and UTF-16, sixteen units per step with AVX2: blocks of
// ASCII (to UTF-8) or of units below 0x10000 (to UTF-16) are narrowed with
// saturating packs. Any other block builds each unit's whole encoding in
// its 32-bit lane, packs the bytes in use with a byte shuffle per four
// lanes (chosen by the lanes' lengths) into a buffer, and copies exactly
// those bytes once the block is known to fit.
#include "kernel/simd.hpp"
#include "unicode/codec.hpp"
#include "unicode/utf32_blocks.hpp"

#include <immintrin.h>

#include <array>
#include <cstdint>

namespace nlssm::unicode {

namespace {

// For each 4-bit mask, the mask's bits spread to every second bit: lane j's
// bit at bit 2j.
constexpr std::array<uint8_t, 16> make_spread() {
  std::array<uint8_t, 16> t{};
  for (int m = 0; m < 16; ++m)
    for (int j = 0; j < 4; ++j) t[m] |= static_cast<uint8_t>((m >> j & 1) << (2 * j));
  return t;
}
constexpr std::array<uint8_t, 16> kSpread = make_spread();

// UTF-8 of four 32-bit lanes, each holding its bytes first to last: by the
// lanes' lengths less one (two bits a lane), the byte shuffle that packs
// the bytes in use, and their number.
struct Utf8Pack {
  std::array<std::array<uint8_t, 16>, 256> shuffle{};
  std::array<uint8_t, 256> length{};
};
constexpr Utf8Pack make_utf8_pack() {
  Utf8Pack t;
  for (int m = 0; m < 256; ++m) {
    int n = 0;
    for (int lane = 0; lane < 4; ++lane)
      for (int b = 0; b <= (m >> (2 * lane) & 3); ++b)
        t.shuffle[m][n++] = static_cast<uint8_t>(4 * lane + b);
    t.length[m] = static_cast<uint8_t>(n);
    for (int b = n; b < 16; ++b) t.shuffle[m][b] = 0x80;
  }
  return t;
}
alignas(16) constexpr Utf8Pack kUtf8Pack = make_utf8_pack();

// UTF-16 of four 32-bit lanes, each holding one unit or a surrogate pair: by
// the mask of the lanes with pairs, the byte shuffle that packs the units in
// use.
constexpr std::array<std::array<uint8_t, 16>, 16> make_utf16_pack() {
  std::array<std::array<uint8_t, 16>, 16> t{};
  for (int m = 0; m < 16; ++m) {
    int n = 0;
    for (int lane = 0; lane < 4; ++lane)
      for (int b = 0; b < (m >> lane & 1 ? 4 : 2); ++b)
        t[m][n++] = static_cast<uint8_t>(4 * lane + b);
    for (int b = n; b < 16; ++b) t[m][b] = 0x80;
  }
  return t;
}
alignas(16) constexpr std::array<std::array<uint8_t, 16>, 16> kUtf16Pack = make_utf16_pack();

}  // namespace

}  // namespace nlssm::unicode

NLSSM_TARGET_AVX2_BEGIN

#include "kernel/simd_loops.hpp"

namespace nlssm::unicode {

namespace {

inline __m256i load8(const uint8_t *p, bool big_endian) {
  const __m256i v = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(p));
  if (!big_endian) return v;
  return _mm256_shuffle_epi8(
      v, _mm256_setr_epi8(3, 2, 1, 0, 7, 6, 5, 4, 11, 10, 9, 8, 15, 14, 13, 12, 3, 2, 1, 0, 7, 6, 5,
                          4, 11, 10, 9, 8, 15, 14, 13, 12));
}

// Every lane of `a` and `b` below `bound` (unsigned).
inline bool all_below(__m256i a, __m256i b, uint32_t bound) {
  const __m256i top = _mm256_set1_epi32(static_cast<int>(bound - 1));
  const __m256i most = _mm256_max_epu32(_mm256_max_epu32(a, b), top);
  return _mm256_movemask_epi8(_mm256_cmpeq_epi32(most, top)) == -1;
}

// Sixteen units, in order, narrowed to 16 bits (each below 0x10000).
inline __m256i narrow16(__m256i a, __m256i b) {
  return _mm256_permute4x64_epi64(_mm256_packus_epi32(a, b), 0xD8);
}

// Lanes above `bound` (unsigned): all ones.
inline __m256i above(__m256i c, uint32_t bound) {
  const __m256i bias = _mm256_set1_epi32(INT32_MIN);
  return _mm256_cmpgt_epi32(_mm256_xor_si256(c, bias),
                            _mm256_set1_epi32(static_cast<int>(bound ^ 0x80000000u)));
}

inline unsigned lane_bits(__m256i mask) {
  return static_cast<unsigned>(_mm256_movemask_ps(_mm256_castsi256_ps(mask)));
}

// Writes the packed bytes of both 128-bit halves of `v` at `buf` + t.
inline int put_halves(uint8_t *buf, int t, __m256i v, const uint8_t *shuffle_low,
                      const uint8_t *shuffle_high, int low, int high) {
  const __m256i packed =
      _mm256_shuffle_epi8(v, _mm256_loadu2_m128i(reinterpret_cast<const __m128i *>(shuffle_high),
                                                 reinterpret_cast<const __m128i *>(shuffle_low)));
  _mm_storeu_si128(reinterpret_cast<__m128i *>(buf + t), _mm256_castsi256_si128(packed));
  _mm_storeu_si128(reinterpret_cast<__m128i *>(buf + t + low), _mm256_extracti128_si256(packed, 1));
  return t + low + high;
}

// Eight units as UTF-8 at `buf` + t: each lane builds its four-byte form
// (lead 0xF0 + c >> 18, wrapping as the one-unit encoder's byte store does)
// and the shorter forms are that shifted down with their lead markers
// completed; the lanes' bytes in use are then packed.
inline int put_utf8(uint8_t *buf, int t, __m256i c) {
  const __m256i low6 = _mm256_set1_epi32(0x3F), marker = _mm256_set1_epi32(0x80);
  auto field = [&](int shift) {
    return _mm256_or_si256(_mm256_and_si256(_mm256_srli_epi32(c, shift), low6), marker);
  };
  const __m256i lead = _mm256_and_si256(
      _mm256_add_epi32(_mm256_srli_epi32(c, 18), _mm256_set1_epi32(0xF0)), _mm256_set1_epi32(0xFF));
  const __m256i four = _mm256_or_si256(
      _mm256_or_si256(lead, _mm256_slli_epi32(field(12), 8)),
      _mm256_or_si256(_mm256_slli_epi32(field(6), 16), _mm256_slli_epi32(field(0), 24)));
  const __m256i two = above(c, 0x7F), three = above(c, 0x7FF), fours = above(c, 0xFFFF);
  __m256i bytes = _mm256_blendv_epi8(
      c, _mm256_or_si256(_mm256_srli_epi32(four, 16), _mm256_set1_epi32(0x40)), two);
  bytes = _mm256_blendv_epi8(
      bytes, _mm256_or_si256(_mm256_srli_epi32(four, 8), _mm256_set1_epi32(0x60)), three);
  bytes = _mm256_blendv_epi8(bytes, four, fours);
  const unsigned m2 = lane_bits(two), m3 = lane_bits(three), m4 = lane_bits(fours);
  const unsigned low = kSpread[m2 & 15] + kSpread[m3 & 15] + kSpread[m4 & 15];
  const unsigned high = kSpread[m2 >> 4] + kSpread[m3 >> 4] + kSpread[m4 >> 4];
  return put_halves(buf, t, bytes, kUtf8Pack.shuffle[low].data(), kUtf8Pack.shuffle[high].data(),
                    kUtf8Pack.length[low], kUtf8Pack.length[high]);
}

// Eight units as UTF-16 at `buf` + t: a lane holds its unit, or its
// surrogate pair (high surrogate first), and the units in use are packed.
template <Order Out>
int put_utf16(uint8_t *buf, int t, __m256i c) {
  const __m256i pairs = above(c, 0xFFFF);
  const __m256i high = _mm256_or_si256(
      _mm256_srli_epi32(_mm256_and_si256(_mm256_sub_epi32(c, _mm256_set1_epi32(0x10000)),
                                         _mm256_set1_epi32(0xFFC00)),
                        10),
      _mm256_set1_epi32(0xD800));
  const __m256i low =
      _mm256_or_si256(_mm256_and_si256(c, _mm256_set1_epi32(0x3FF)), _mm256_set1_epi32(0xDC00));
  __m256i units = _mm256_blendv_epi8(c, _mm256_or_si256(high, _mm256_slli_epi32(low, 16)), pairs);
  if constexpr (Out == Order::big)
    units = _mm256_shuffle_epi8(
        units, _mm256_setr_epi8(1, 0, 3, 2, 5, 4, 7, 6, 9, 8, 11, 10, 13, 12, 15, 14, 1, 0, 3, 2, 5,
                                4, 7, 6, 9, 8, 11, 10, 13, 12, 15, 14));
  const unsigned m = lane_bits(pairs);
  return put_halves(buf, t, units, kUtf16Pack[m & 15].data(), kUtf16Pack[m >> 4].data(),
                    8 + 2 * __builtin_popcount(m & 15), 8 + 2 * __builtin_popcount(m >> 4));
}

// One block of sixteen units; -1 when its encoding does not fit in `room`.
template <Order In, Utf32BlockForm Form>
int64_t encode_block(const uint8_t *p, uint8_t *d, int64_t room) {
  const __m256i a = load8(p, In == Order::big), b = load8(p + 32, In == Order::big);
  if constexpr (Form == Utf32BlockForm::utf8) {
    if (room >= 16 && all_below(a, b, 0x80)) {
      const __m256i units = narrow16(a, b);
      _mm_storeu_si128(
          reinterpret_cast<__m128i *>(d),
          _mm_packus_epi16(_mm256_castsi256_si128(units), _mm256_extracti128_si256(units, 1)));
      return 16;
    }
    // Sixteen units take at most 64 bytes; the last half's shuffle may
    // write 16 more past its bytes.
    alignas(32) uint8_t buf[80];
    const int n = put_utf8(buf, put_utf8(buf, 0, a), b);
    if (n > room) return -1;
    // Exactly the bytes in use: no byte past them is written.
    ::kernel::simd::copy_short<::kernel::simd::V256>(d, buf, n);
    return n;
  } else {
    constexpr Order Out = Form == Utf32BlockForm::utf16_big ? Order::big : Order::little;
    if (room >= 32 && all_below(a, b, 0x10000)) {
      __m256i units = narrow16(a, b);
      if constexpr (Out == Order::big)
        units = _mm256_shuffle_epi8(
            units, _mm256_setr_epi8(1, 0, 3, 2, 5, 4, 7, 6, 9, 8, 11, 10, 13, 12, 15, 14, 1, 0, 3,
                                    2, 5, 4, 7, 6, 9, 8, 11, 10, 13, 12, 15, 14));
      _mm256_storeu_si256(reinterpret_cast<__m256i *>(d), units);
      return 32;
    }
    alignas(32) uint8_t buf[80];
    const int n = put_utf16<Out>(buf, put_utf16<Out>(buf, 0, a), b);
    if (n > room) return -1;
    ::kernel::simd::copy_short<::kernel::simd::V256>(d, buf, n);
    return n;
  }
}

template <Order In, Utf32BlockForm Form>
void blocks(const uint8_t *s, int64_t units, uint8_t *d, int64_t capacity, int64_t &unit,
            int64_t &total) {
  int64_t i = unit, t = total;
  while (units - i >= 16) {
    const int64_t written = encode_block<In, Form>(s + 4 * i, d + t, capacity - t);
    if (written < 0) break;
    i += 16;
    t += written;
  }
  unit = i;
  total = t;
}

template <Order In>
void blocks_from(const uint8_t *s, int64_t units, Utf32BlockForm form, uint8_t *d, int64_t capacity,
                 int64_t &unit, int64_t &total) {
  switch (form) {
    case Utf32BlockForm::utf8:
      return blocks<In, Utf32BlockForm::utf8>(s, units, d, capacity, unit, total);
    case Utf32BlockForm::utf16_little:
      return blocks<In, Utf32BlockForm::utf16_little>(s, units, d, capacity, unit, total);
    case Utf32BlockForm::utf16_big:
      return blocks<In, Utf32BlockForm::utf16_big>(s, units, d, capacity, unit, total);
    case Utf32BlockForm::none:
      return;
  }
}

}  // namespace

void utf32_blocks_avx2(const uint8_t *s, int64_t units, bool big_endian, Utf32BlockForm form,
                       uint8_t *d, int64_t capacity, int64_t &unit, int64_t &total) {
  if (big_endian)
    blocks_from<Order::big>(s, units, form, d, capacity, unit, total);
  else
    blocks_from<Order::little>(s, units, form, d, capacity, unit, total);
}

}  // namespace nlssm::unicode

NLSSM_TARGET_AVX2_END
