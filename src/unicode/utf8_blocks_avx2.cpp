// UTF-8 to UTF-32, 32 source bytes per step with AVX2: the bulk loop of the
// decoding driver for text that is not all ASCII.
//
// A step classifies the 32 bytes of a block by their top bits and finds the
// characters whose bytes are exactly what their lead bytes announce: a lead
// of length n followed by n - 1 continuation bytes, then the next lead. Over
// those characters the one-character decoder would take the same bytes and
// build the same values, so the step decodes them all at once: every eight
// bytes build the value of a character at each byte, and the values at the
// characters' starts are packed by a lane permutation. Eight ASCII bytes are
// simply widened, and a block of three-byte characters only takes two fixed
// shuffles.
//
// While whole blocks are that clean, they follow each other at a fixed
// stride, so the next load never waits for this block's classes. The first
// block that is not is decoded up to its fault, and the caller decodes the
// faulty character alone.
#include <immintrin.h>

#include <array>
#include <bit>
#include <cstdint>

#include "kernel/cpu.hpp"
#include "unicode/utf8_blocks.hpp"

namespace nlssm::unicode {
namespace {

// For every 8-bit mask of 32-bit lanes, the lane permutation that packs the
// marked lanes to the front, in order.
constexpr std::array<std::array<uint32_t, 8>, 256> make_pack32() {
  std::array<std::array<uint32_t, 8>, 256> t{};
  for (int m = 0; m < 256; ++m) {
    int n = 0;
    for (int lane = 0; lane < 8; ++lane)
      if (m >> lane & 1) t[m][n++] = static_cast<uint32_t>(lane);
  }
  return t;
}
alignas(32) constexpr std::array<std::array<uint32_t, 8>, 256> kPack32 = make_pack32();

// For every 8-bit mask of 16-bit lanes, the byte shuffle that packs the
// marked lanes to the front, in order.
constexpr std::array<std::array<uint8_t, 16>, 256> make_pack16() {
  std::array<std::array<uint8_t, 16>, 256> t{};
  for (int m = 0; m < 256; ++m) {
    int n = 0;
    for (int lane = 0; lane < 8; ++lane) {
      if (m >> lane & 1) {
        t[m][n++] = static_cast<uint8_t>(2 * lane);
        t[m][n++] = static_cast<uint8_t>(2 * lane + 1);
      }
    }
    for (int b = n; b < 16; ++b) t[m][b] = 0x80;
  }
  return t;
}
alignas(16) constexpr std::array<std::array<uint8_t, 16>, 256> kPack16 = make_pack16();

}  // namespace

NLSSM_TARGET_AVX2_BEGIN

namespace {

inline uint32_t at_least(__m256i x, uint8_t bound) {
  const __m256i b = _mm256_set1_epi8(static_cast<char>(bound));
  return static_cast<uint32_t>(_mm256_movemask_epi8(_mm256_cmpeq_epi8(_mm256_max_epu8(x, b), x)));
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

// Eight three-byte characters from 24 bytes: each 128-bit half gathers
// four characters' bytes into its lanes.
inline __m256i decode_three8(const uint8_t *p) {
  const __m256i x = _mm256_inserti128_si256(
      _mm256_castsi128_si256(_mm_loadu_si128(reinterpret_cast<const __m128i *>(p))),
      _mm_loadu_si128(reinterpret_cast<const __m128i *>(p + 12)), 1);
  const __m256i lanes = _mm256_shuffle_epi8(
      x, _mm256_setr_epi8(0, 1, 2, -1, 3, 4, 5, -1, 6, 7, 8, -1, 9, 10, 11, -1, 0, 1, 2, -1, 3, 4,
                          5, -1, 6, 7, 8, -1, 9, 10, 11, -1));
  const __m256i low6 = _mm256_set1_epi32(0x3F);
  const __m256i b0 = _mm256_and_si256(lanes, _mm256_set1_epi32(0x0F));
  const __m256i b1 = _mm256_and_si256(_mm256_srli_epi32(lanes, 8), low6);
  const __m256i b2 = _mm256_and_si256(_mm256_srli_epi32(lanes, 16), low6);
  return _mm256_or_si256(_mm256_slli_epi32(b0, 12), _mm256_or_si256(_mm256_slli_epi32(b1, 6), b2));
}

// The character that would start at each of the eight bytes from `p` on,
// read from the eleven bytes there: each lane takes four bytes, first byte
// highest, keeps their payload bits as the first byte's length says, merges
// the 6-bit fields and shifts away those past the character's end.
inline __m256i values8(const uint8_t *p) {
  const __m256i window =
      _mm256_broadcastsi128_si256(_mm_loadu_si128(reinterpret_cast<const __m128i *>(p)));
  const __m256i bytes = _mm256_shuffle_epi8(
      window, _mm256_setr_epi8(3, 2, 1, 0, 4, 3, 2, 1, 5, 4, 3, 2, 6, 5, 4, 3, 7, 6, 5, 4, 8, 7, 6,
                               5, 9, 8, 7, 6, 10, 9, 8, 7));
  const __m256i lead = _mm256_srli_epi32(bytes, 24);
  // -1 in a lane for each length the lead reaches beyond one.
  const __m256i two = _mm256_cmpgt_epi32(lead, _mm256_set1_epi32(0xBF));
  const __m256i three = _mm256_cmpgt_epi32(lead, _mm256_set1_epi32(0xDF));
  const __m256i four = _mm256_cmpgt_epi32(lead, _mm256_set1_epi32(0xEF));
  const __m256i longer = _mm256_add_epi32(_mm256_add_epi32(two, three), four);  // 1 - length
  // The lead keeps 0x7F >> (0, 2, 3, 4) bits.
  const __m256i cut = _mm256_sub_epi32(_mm256_setzero_si256(), _mm256_add_epi32(longer, two));
  const __m256i payload =
      _mm256_or_si256(_mm256_slli_epi32(_mm256_srlv_epi32(_mm256_set1_epi32(0x7F), cut), 24),
                      _mm256_set1_epi32(0x3F3F3F));
  const __m256i halves =
      _mm256_maddubs_epi16(_mm256_and_si256(bytes, payload), _mm256_set1_epi16(0x4001));
  const __m256i merged = _mm256_madd_epi16(halves, _mm256_set1_epi32(0x10000001));
  // Fields shift down by 18 - 6 x (length - 1).
  const __m256i shift = _mm256_add_epi32(
      _mm256_set1_epi32(18),
      _mm256_add_epi32(_mm256_slli_epi32(longer, 2), _mm256_slli_epi32(longer, 1)));
  return _mm256_srlv_epi32(merged, shift);
}

// ASCII: every one of the 32 bytes is a character.
inline void widen_ascii32(const uint8_t *p, uint8_t *d, bool big_endian) {
  for (int q = 0; q < 4; ++q) {
    const __m256i c =
        _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i *>(p + 8 * q)));
    store8(d + 32 * q, c, 8, big_endian);
  }
}

// The characters starting at the marked bytes of a 32-byte block, eight
// bytes at a time; returns how many.
inline int decode_starts(const uint8_t *p, uint32_t starts, uint32_t high, uint8_t *d,
                         bool big_endian) {
  int written = 0;
  for (int g = 0; g < 4; ++g) {
    const unsigned group = starts >> (8 * g) & 0xFF;
    if ((high >> (8 * g) & 0xFF) == 0 && group == 0xFF) {
      store8(d + 4 * written,
             _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i *>(p + 8 * g))), 8,
             big_endian);
      written += 8;
    } else if (group != 0) {
      const __m256i packed = _mm256_permutevar8x32_epi32(
          values8(p + 8 * g),
          _mm256_load_si256(reinterpret_cast<const __m256i *>(kPack32[group].data())));
      const int count = __builtin_popcount(group);
      store8(d + 4 * written, packed, count, big_endian);
      written += count;
    }
  }
  return written;
}

inline BlockClasses classify(__m256i x, uint32_t high) {
  return classify_block<32>(high, at_least(x, 0xC0), at_least(x, 0xC2), at_least(x, 0xE0),
                            at_least(x, 0xF0), at_least(x, 0xF5));
}

// The characters of up to three bytes starting at the marked bytes of 16
// bytes from `p` (reading two more): the 16-bit value of a character at
// every byte, then the values at the starts packed, eight bytes at a time.
inline int decode_short16(const uint8_t *p, uint32_t starts, uint8_t *d, bool big_endian) {
  auto bytes_from = [&](int at) {
    return _mm256_cvtepu8_epi16(_mm_loadu_si128(reinterpret_cast<const __m128i *>(p + at)));
  };
  const __m256i b0 = bytes_from(0), b1 = bytes_from(1), b2 = bytes_from(2);
  const __m256i low6 = _mm256_set1_epi16(0x3F);
  const __m256i second = _mm256_and_si256(b1, low6);
  const __m256i two =
      _mm256_or_si256(_mm256_slli_epi16(_mm256_and_si256(b0, _mm256_set1_epi16(0x1F)), 6), second);
  const __m256i three =
      _mm256_or_si256(_mm256_slli_epi16(b0, 12),
                      _mm256_or_si256(_mm256_slli_epi16(second, 6), _mm256_and_si256(b2, low6)));
  __m256i v = _mm256_blendv_epi8(b0, two, _mm256_cmpgt_epi16(b0, _mm256_set1_epi16(0xBF)));
  v = _mm256_blendv_epi8(v, three, _mm256_cmpgt_epi16(b0, _mm256_set1_epi16(0xDF)));
  const unsigned low = starts & 0xFF, high = starts >> 8 & 0xFF;
  const __m256i packed = _mm256_shuffle_epi8(
      v, _mm256_loadu2_m128i(reinterpret_cast<const __m128i *>(kPack16[high].data()),
                             reinterpret_cast<const __m128i *>(kPack16[low].data())));
  const int first = std::popcount(low), second_count = std::popcount(high);
  store8(d, _mm256_cvtepu16_epi32(_mm256_castsi256_si128(packed)), first, big_endian);
  store8(d + 4 * first, _mm256_cvtepu16_epi32(_mm256_extracti128_si256(packed, 1)), second_count,
         big_endian);
  return first + second_count;
}

// A 32-byte block. A group reads eleven bytes from its first, and a run of
// three-byte characters sixteen from its ninth, so a block reads sixteen
// bytes after it.
struct Avx2Block {
  static constexpr int kWidth = 32, kCleanBytes = 48, kCarefulBytes = 48;
  const uint8_t *p;
  __m256i x;
  uint32_t high;
  explicit Avx2Block(const uint8_t *at)
      : p(at),
        x(_mm256_loadu_si256(reinterpret_cast<const __m256i *>(at))),
        high(static_cast<uint32_t>(_mm256_movemask_epi8(x))) {}
  BlockClasses classes() const { return classify(x, high); }
  void widen_ascii(uint8_t *d, bool big_endian) const { widen_ascii32(p, d, big_endian); }
  int decode_clean(uint64_t starts, uint8_t *d, bool big_endian) const {
    if (starts == (at_least(x, 0xE0) & ~at_least(x, 0xF0))) {
      // Three-byte characters only (CJK): two fixed shuffles.
      const int first = std::countr_zero(starts), count = std::popcount(starts);
      store8(d, decode_three8(p + first), 8, big_endian);
      store8(d + 32, decode_three8(p + first + 24), count - 8, big_endian);
      return count;
    }
    if (at_least(x, 0xF0) == 0) {
      // No four-byte character: 16-bit values, sixteen bytes at a time.
      const int first = decode_short16(p, static_cast<uint32_t>(starts), d, big_endian);
      return first +
             decode_short16(p + 16, static_cast<uint32_t>(starts >> 16), d + 4 * first, big_endian);
    }
    return decode_starts(p, static_cast<uint32_t>(starts), high, d, big_endian);
  }
  void decode(uint64_t starts, int, uint8_t *d, bool big_endian) const {
    decode_starts(p, static_cast<uint32_t>(starts), high, d, big_endian);
  }
};

#include "unicode/utf8_blocks_loop.inc"

}  // namespace

void utf8_blocks_avx2(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit, bool big_endian,
                      int64_t &consumed, int64_t &chars) {
  decode_blocks<Avx2Block>(s, n, d, limit, big_endian, consumed, chars);
}

NLSSM_TARGET_AVX2_END

}  // namespace nlssm::unicode
