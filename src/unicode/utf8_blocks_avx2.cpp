// UTF-8 to UTF-32, 32 source bytes per step with AVX2: the bulk loop of the
// decoding driver for text that is not all ASCII.
//
// A step classifies the 32 bytes of a block by their top bits and finds the
// characters whose bytes are exactly what their lead bytes announce: a lead
// of length n followed by n - 1 continuation bytes, then the next lead. Over
// those characters the one-character decoder would take the same bytes and
// build the same values, so the step decodes them all at once.
//
// While whole blocks are that clean, they follow each other at a fixed
// stride (the next load never waits for this block's classes), and every
// eight bytes build the value of a character at each byte and pack the
// values at the starts. The first block that is not goes the careful way:
// start offsets become gather indices, and the step stops before the first
// character that is cut by the block's end, does not look as announced, or
// has an invalid lead; the caller decodes that one alone.
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

// For every 8-bit mask of 16-bit lanes, the byte shuffle that packs the
// marked lanes to the front, in order.
constexpr std::array<std::array<uint8_t, 16>, 256> make_pack16() {
  std::array<std::array<uint8_t, 16>, 256> t{};
  for (int m = 0; m < 256; ++m) {
    int n = 0;
    for (int lane = 0; lane < 8; ++lane) {
      if (m >> lane & 1) {
        t[m][2 * n] = static_cast<uint8_t>(2 * lane);
        t[m][2 * n + 1] = static_cast<uint8_t>(2 * lane + 1);
        ++n;
      }
    }
    for (int b = 2 * n; b < 16; ++b) t[m][b] = 0x80;
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

// Sixteen two-byte characters from 32 bytes.
inline void decode_two16(const uint8_t *p, uint8_t *d, bool big_endian) {
  const __m256i v = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(p));
  const __m256i c =
      _mm256_or_si256(_mm256_slli_epi16(_mm256_and_si256(v, _mm256_set1_epi16(0x1F)), 6),
                      _mm256_and_si256(_mm256_srli_epi16(v, 8), _mm256_set1_epi16(0x3F)));
  store8(d, _mm256_cvtepu16_epi32(_mm256_castsi256_si128(c)), 8, big_endian);
  store8(d + 32, _mm256_cvtepu16_epi32(_mm256_extracti128_si256(c, 1)), 8, big_endian);
}

// One- and two-byte characters starting in 16 bytes (a last lead may take
// the 17th): the value at every byte as if a character started there, then
// the values at the characters' starts packed together.
inline int decode_one_two(const uint8_t *p, uint32_t starts, uint8_t *d, bool big_endian) {
  const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(p));
  const __m128i next = _mm_loadu_si128(reinterpret_cast<const __m128i *>(p + 1));
  int written = 0;
  for (int half = 0; half < 2; ++half) {
    const __m128i v = half == 0 ? _mm_unpacklo_epi8(x, next) : _mm_unpackhi_epi8(x, next);
    const __m128i one = _mm_and_si128(v, _mm_set1_epi16(0xFF));
    const __m128i two = _mm_or_si128(_mm_slli_epi16(_mm_and_si128(v, _mm_set1_epi16(0x1F)), 6),
                                     _mm_and_si128(_mm_srli_epi16(v, 8), _mm_set1_epi16(0x3F)));
    const __m128i is_two =
        _mm_cmpeq_epi16(_mm_and_si128(v, _mm_set1_epi16(0xE0)), _mm_set1_epi16(0xC0));
    const __m128i c = _mm_blendv_epi8(one, two, is_two);
    const unsigned mask = (starts >> (8 * half)) & 0xFF;
    const __m128i packed = _mm_shuffle_epi8(
        c, _mm_load_si128(reinterpret_cast<const __m128i *>(kPack16[mask].data())));
    const int n = __builtin_popcount(mask);
    store8(d + 4 * written, _mm256_cvtepu16_epi32(packed), n, big_endian);
    written += n;
  }
  return written;
}

}  // namespace

namespace {

// ASCII: every one of the 32 bytes is a character.
inline void widen_ascii32(const uint8_t *p, uint8_t *d, bool big_endian) {
  for (int q = 0; q < 4; ++q) {
    const __m256i c =
        _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i *>(p + 8 * q)));
    store8(d + 32 * q, c, 8, big_endian);
  }
}

// One block the way that copes with anything: decoded up to its first
// fault, the end of the room, or its last character when that one may be
// cut, with the next block starting there. False when the caller must take
// the next character alone. A gather reads four bytes at a character's
// start, so a block needs three bytes after it.
bool careful_step(const uint8_t *s, uint8_t *d, int64_t limit, bool big_endian, int64_t &i,
                  int64_t &k) {
  const __m256i x = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + i));
  const uint32_t high = static_cast<uint32_t>(_mm256_movemask_epi8(x));
  if (high == 0 && limit - k >= 32) {
    widen_ascii32(s + i, d + 4 * k, big_endian);
    i += 32;
    k += 32;
    return true;
  }
  const uint32_t ge_c0 = at_least(x, 0xC0), ge_c2 = at_least(x, 0xC2);
  const uint32_t ge_e0 = at_least(x, 0xE0), ge_f0 = at_least(x, 0xF0);
  const uint32_t ge_f5 = at_least(x, 0xF5);
  const uint32_t cont = high & ~ge_c0;
  const uint64_t lead2 = ge_c2 & ~ge_e0, lead3 = ge_e0 & ~ge_f0, lead4 = ge_f0 & ~ge_f5;
  const uint32_t invalid = (ge_c0 & ~ge_c2) | ge_f5;
  if (limit - k >= 16) {
    // Runs of one shape: eight three-byte characters (CJK), sixteen
    // two-byte ones (Cyrillic, Greek, Hebrew, Arabic), or one- and
    // two-byte characters mixed (Latin scripts).
    // The three-byte characters that open the block, up to eight; a run
    // of four or more goes this way.
    const uint64_t off_three = ((lead3 ^ 0x249249) | (cont ^ 0xDB6DB6)) & 0xFFFFFF;
    const int threes = (off_three == 0 ? 24 : __builtin_ctzll(off_three)) / 3;
    if (threes >= 4) {
      store8(d + 4 * k, decode_three8(s + i), threes, big_endian);
      i += 3 * threes;
      k += threes;
      return true;
    }
    if (lead2 == 0x55555555u && cont == 0xAAAAAAAAu) {
      decode_two16(s + i, d + 4 * k, big_endian);
      i += 32;
      k += 16;
      return true;
    }
    const uint32_t low = 0xFFFF;
    if (((lead3 | lead4 | invalid) & low) == 0 && (cont & 1) == 0 &&
        (cont & low) == ((lead2 << 1) & low) && (~lead2 >> 15 & 1 || cont >> 16 & 1)) {
      const uint32_t starts = ~cont & low;
      k += decode_one_two(s + i, starts, d + 4 * k, big_endian);
      i += 16 + (lead2 >> 15 & 1);
      return true;
    }
  }
  const uint64_t expected = (lead2 | lead3 | lead4) << 1 | (lead3 | lead4) << 2 | lead4 << 3;
  // Clean up to the first byte that is not what the leads announce, or
  // that is an invalid lead.
  const uint64_t wrong = ((expected ^ cont) & 0xFFFFFFFFu) | invalid | (uint64_t{1} << 32);
  const int clean = __builtin_ctzll(wrong);
  uint64_t starts = ~uint64_t{cont} & ((uint64_t{1} << clean) - 1);
  // Where the next block starts, found from the masks alone so that the
  // next step need not wait for this one's decoding: after the block when
  // its last character ends with it, else at the last character, which may
  // be incomplete or faulty and is left to the next step or the caller.
  int advance = 32;
  if (clean < 32 || (expected >> 32) != 0) {
    if (starts == 0) return false;
    advance = 63 - __builtin_clzll(starts);
    starts &= ~(uint64_t{1} << advance);
    if (starts == 0) return false;
  }
  int count = __builtin_popcountll(starts);
  if (count > limit - k) {
    // Room for fewer characters: keep the first ones, go on at the next.
    count = static_cast<int>(limit - k);
    uint64_t kept = 0, rest = starts;
    for (int q = 0; q < count; ++q) {
      kept |= rest & (~rest + 1);
      rest &= rest - 1;
    }
    starts = kept;
    advance = __builtin_ctzll(rest);
  }
  // Offsets of the characters, chunk by chunk of the start mask.
  // Entries past the last character stay zero: a gather loads all eight
  // lanes, so each must point inside the block.
  alignas(32) uint8_t offsets[48] = {};
  int filled = 0;
  for (int chunk = 0; chunk < 4; ++chunk) {
    const uint8_t bits = static_cast<uint8_t>(starts >> (8 * chunk));
    uint64_t eight;
    std::memcpy(&eight, kBitOffsets.offsets[bits].data(), 8);
    eight += 0x0101010101010101ull * static_cast<uint64_t>(8 * chunk);
    std::memcpy(offsets + filled, &eight, 8);
    filled += kBitOffsets.count[bits];
  }
  for (int g = 0; g < count; g += 8) {
    const int m = count - g < 8 ? count - g : 8;
    const __m256i idx =
        _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i *>(offsets + g)));
    store8(d + 4 * (k + g), decode8(s + i, idx), m, big_endian);
  }
  i += advance;
  k += count;
  return clean == 32;  // else the caller takes the faulty character alone
}

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

}  // namespace

void utf8_blocks_avx2(const uint8_t *s, int64_t n, uint8_t *d, int64_t limit, bool big_endian,
                      int64_t &consumed, int64_t &chars) {
  int64_t i = consumed, k = chars;
  while (n - i >= 35 && k < limit) {
    // As in the AVX-512 step: blocks at a fixed stride, a character that
    // runs into the next block decoded with the block of its lead, and its
    // last bytes expected by the next (`carry`). Eight bytes at a time, the
    // value at every start is built and the starts' values packed; eight
    // ASCII bytes are simply widened. A group reads eleven bytes from its
    // first, and a run of three-byte characters sixteen from its ninth, so
    // a block needs sixteen bytes after it.
    uint32_t carry = 0;
    while (n - i >= 48 && limit - k >= 32) {
      const __m256i x = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + i));
      const uint32_t high = static_cast<uint32_t>(_mm256_movemask_epi8(x));
      if ((high | carry) == 0) {
        widen_ascii32(s + i, d + 4 * k, big_endian);
        i += 32;
        k += 32;
        continue;
      }
      const uint32_t ge_c0 = at_least(x, 0xC0), ge_c2 = at_least(x, 0xC2);
      const uint32_t ge_e0 = at_least(x, 0xE0), ge_f0 = at_least(x, 0xF0);
      const uint32_t ge_f5 = at_least(x, 0xF5);
      const uint32_t cont = high & ~ge_c0;
      const uint64_t multi = ge_c2 & ~ge_f5, long3 = ge_e0 & ~ge_f5, lead4 = ge_f0 & ~ge_f5;
      const uint64_t expected = multi << 1 | long3 << 2 | lead4 << 3;
      if (((static_cast<uint32_t>(expected) | carry) ^ cont) != 0 ||
          ((ge_c0 & ~ge_c2) | ge_f5) != 0)
        break;
      const uint32_t starts = ~cont;
      if (starts == (long3 & ~lead4)) {
        // Three-byte characters only (CJK): two fixed shuffles.
        const int first = __builtin_ctz(starts), count = __builtin_popcount(starts);
        store8(d + 4 * k, decode_three8(s + i + first), 8, big_endian);
        store8(d + 4 * (k + 8), decode_three8(s + i + first + 24), count - 8, big_endian);
        k += count;
        i += 32;
        carry = static_cast<uint32_t>(expected >> 32);
        continue;
      }
      for (int g = 0; g < 4; ++g) {
        const uint8_t *p = s + i + 8 * g;
        const unsigned group = starts >> (8 * g) & 0xFF;
        if ((high >> (8 * g) & 0xFF) == 0) {
          store8(d + 4 * k,
                 _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i *>(p))), 8,
                 big_endian);
          k += 8;
        } else if (group != 0) {
          const __m256i packed = _mm256_permutevar8x32_epi32(
              values8(p),
              _mm256_load_si256(reinterpret_cast<const __m256i *>(kPack32[group].data())));
          const int count = __builtin_popcount(group);
          store8(d + 4 * k, packed, count, big_endian);
          k += count;
        }
      }
      i += 32;
      carry = static_cast<uint32_t>(expected >> 32);
    }
    // The continuation bytes carried in belong to a character already taken.
    i += __builtin_popcount(carry);
    if (n - i < 35 || k >= limit) break;
    if (!careful_step(s, d, limit, big_endian, i, k)) break;
  }
  consumed = i;
  chars = k;
}

NLSSM_TARGET_AVX2_END

}  // namespace nlssm::unicode
