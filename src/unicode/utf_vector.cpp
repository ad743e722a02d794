// Vector paths of the UTF kit: the UTF-8 length of an array of 32-bit
// characters (SSE2 and AVX2, chosen at run time) and the ASCII run widener
// of the UTF-8 decoding driver.
#include <emmintrin.h>
#include <immintrin.h>

#include <atomic>
#include <cstring>

#include "unicode/codec.hpp"

namespace nlssm::unicode {

int64_t utf8_length_scalar(const uint32_t *chars, int64_t count) {
  int64_t total = 0;
  for (int64_t i = 0; i < count; ++i) total += utf8_length_of(chars[i]);
  return total;
}

namespace {

// Lanes count in 32 bits; each pass adds at most 3 to a lane, so the lanes
// are folded into the 64-bit total after this many passes.
constexpr int64_t kPassesPerFold = int64_t{1} << 24;

// Each character contributes 1 plus one for every bound it exceeds. The
// comparisons are signed, so both sides are biased by 2^31 to compare as
// unsigned.
constexpr int32_t kBias = INT32_MIN;
constexpr int32_t biased(uint32_t bound) {
  return static_cast<int32_t>(bound ^ 0x80000000u);
}

}  // namespace

int64_t utf8_length_sse2(const uint32_t *chars, int64_t count) {
  if (chars == nullptr || count <= 0) return 0;
  int64_t i = 0;
  int64_t total = 0;
  // Scalar head up to the first 16-byte boundary.
  while (i < count && (reinterpret_cast<uintptr_t>(chars + i) & 15) != 0)
    total += utf8_length_of(chars[i++]);
  const __m128i bias = _mm_set1_epi32(kBias);
  const __m128i b1 = _mm_set1_epi32(biased(0x7F));
  const __m128i b2 = _mm_set1_epi32(biased(0x7FF));
  const __m128i b3 = _mm_set1_epi32(biased(0xFFFF));
  while (count - i >= 4) {
    const int64_t passes = std::min((count - i) / 4, kPassesPerFold);
    __m128i acc = _mm_setzero_si128();
    for (int64_t p = 0; p < passes; ++p, i += 4) {
      const __m128i v =
          _mm_xor_si128(_mm_load_si128(reinterpret_cast<const __m128i *>(chars + i)), bias);
      // Each true comparison is -1 in its lane.
      acc = _mm_sub_epi32(acc, _mm_cmpgt_epi32(v, b1));
      acc = _mm_sub_epi32(acc, _mm_cmpgt_epi32(v, b2));
      acc = _mm_sub_epi32(acc, _mm_cmpgt_epi32(v, b3));
    }
    uint32_t lanes[4];
    std::memcpy(lanes, &acc, sizeof lanes);
    total += 4 * passes + lanes[0] + lanes[1] + lanes[2] + lanes[3];
  }
  while (i < count) total += utf8_length_of(chars[i++]);
  return total;
}

__attribute__((target("avx2"))) int64_t utf8_length_avx2(const uint32_t *chars, int64_t count) {
  if (chars == nullptr || count <= 0) return 0;
  int64_t i = 0;
  int64_t total = 0;
  while (i < count && (reinterpret_cast<uintptr_t>(chars + i) & 31) != 0)
    total += utf8_length_of(chars[i++]);
  const __m256i bias = _mm256_set1_epi32(kBias);
  const __m256i b1 = _mm256_set1_epi32(biased(0x7F));
  const __m256i b2 = _mm256_set1_epi32(biased(0x7FF));
  const __m256i b3 = _mm256_set1_epi32(biased(0xFFFF));
  while (count - i >= 8) {
    const int64_t passes = std::min((count - i) / 8, kPassesPerFold);
    __m256i acc = _mm256_setzero_si256();
    for (int64_t p = 0; p < passes; ++p, i += 8) {
      const __m256i v =
          _mm256_xor_si256(_mm256_load_si256(reinterpret_cast<const __m256i *>(chars + i)), bias);
      acc = _mm256_sub_epi32(acc, _mm256_cmpgt_epi32(v, b1));
      acc = _mm256_sub_epi32(acc, _mm256_cmpgt_epi32(v, b2));
      acc = _mm256_sub_epi32(acc, _mm256_cmpgt_epi32(v, b3));
    }
    uint32_t lanes[8];
    std::memcpy(lanes, &acc, sizeof lanes);
    total += 8 * passes;
    for (uint32_t lane : lanes) total += lane;
  }
  while (i < count) total += utf8_length_of(chars[i++]);
  return total;
}

bool avx2_usable() {
  __builtin_cpu_init();
  return __builtin_cpu_supports("avx2");
}

int64_t utf8_length(const uint32_t *chars, int64_t count) {
  using Fn = int64_t (*)(const uint32_t *, int64_t);
  // Chosen on first use; racing threads store the same pointer.
  static std::atomic<Fn> chosen{nullptr};
  Fn fn = chosen.load(std::memory_order_relaxed);
  if (fn == nullptr) {
    fn = avx2_usable() ? &utf8_length_avx2 : &utf8_length_sse2;
    chosen.store(fn, std::memory_order_relaxed);
  }
  return fn(chars, count);
}

int64_t widen_ascii_runs(const uint8_t *s, uint8_t *d, int64_t max, bool big_endian) {
  const __m128i zero = _mm_setzero_si128();
  int64_t i = 0;
  for (; i + 16 <= max; i += 16) {
    const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + i));
    if (_mm_movemask_epi8(x) != 0) break;
    // Interleaving with zero bytes on the right side puts each byte at the
    // low or the high end of its 32-bit slot.
    __m128i lo = big_endian ? _mm_unpacklo_epi8(zero, x) : _mm_unpacklo_epi8(x, zero);
    __m128i hi = big_endian ? _mm_unpackhi_epi8(zero, x) : _mm_unpackhi_epi8(x, zero);
    __m128i out[4];
    if (big_endian) {
      out[0] = _mm_unpacklo_epi16(zero, lo);
      out[1] = _mm_unpackhi_epi16(zero, lo);
      out[2] = _mm_unpacklo_epi16(zero, hi);
      out[3] = _mm_unpackhi_epi16(zero, hi);
    } else {
      out[0] = _mm_unpacklo_epi16(lo, zero);
      out[1] = _mm_unpackhi_epi16(lo, zero);
      out[2] = _mm_unpacklo_epi16(hi, zero);
      out[3] = _mm_unpackhi_epi16(hi, zero);
    }
    for (int k = 0; k < 4; ++k)
      _mm_storeu_si128(reinterpret_cast<__m128i *>(d + 4 * i + 16 * k), out[k]);
  }
  for (; i < max && s[i] < 0x80; ++i) {
    const uint8_t b = s[i];
    uint8_t *slot = d + 4 * i;
    slot[0] = big_endian ? 0 : b;
    slot[1] = slot[2] = 0;
    slot[3] = big_endian ? b : 0;
  }
  return i;
}

}  // namespace nlssm::unicode
