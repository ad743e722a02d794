// UTF-8 validation 32 bytes at a time with AVX2.
//
// Each byte is judged together with the up to three bytes before it. Three
// table lookups, on the high and low halves of the previous byte and the
// high half of the current one, each give a set of error kinds that the
// pair could show; a pair is bad when all three agree on a kind. Sequences
// of three and four bytes add one more rule: the second and third byte
// after such a lead must be continuation bytes, which is exactly when the
// pair check flags "two continuation bytes in a row", so the two cancel.
// A block that finds an error, and the tail shorter than a block, go to the
// scalar rule from the last character boundary, which gives the offset.
#include <immintrin.h>

#include "kernel/u8/utf8.hpp"

NLSSM_TARGET_AVX2_BEGIN

namespace kernel::u8::avx2 {
namespace {

// Error kinds of a byte pair (previous, current).
constexpr uint8_t kTooShort = 1 << 0;   // lead, then no continuation byte
constexpr uint8_t kTooLong = 1 << 1;    // ASCII, then a continuation byte
constexpr uint8_t kOverlong3 = 1 << 2;  // E0 80..9F
constexpr uint8_t kTooLarge = 1 << 3;   // F4 90..BF, F5..FF 90..BF
constexpr uint8_t kSurrogate = 1 << 4;  // ED A0..BF
constexpr uint8_t kOverlong2 = 1 << 5;  // C0..C1 80..BF
constexpr uint8_t kLarge1000 = 1 << 6;  // F5..FF 80..8F
constexpr uint8_t kOverlong4 = 1 << 6;  // F0 80..8F
constexpr uint8_t kTwoConts = 1 << 7;   // continuation, then continuation
constexpr uint8_t kCarry = kTooShort | kTooLong | kTwoConts;

__m256i table(uint8_t v0, uint8_t v1, uint8_t v2, uint8_t v3, uint8_t v4, uint8_t v5, uint8_t v6,
              uint8_t v7, uint8_t v8, uint8_t v9, uint8_t v10, uint8_t v11, uint8_t v12,
              uint8_t v13, uint8_t v14, uint8_t v15) {
  const __m128i half = _mm_setr_epi8(
      static_cast<char>(v0), static_cast<char>(v1), static_cast<char>(v2), static_cast<char>(v3),
      static_cast<char>(v4), static_cast<char>(v5), static_cast<char>(v6), static_cast<char>(v7),
      static_cast<char>(v8), static_cast<char>(v9), static_cast<char>(v10), static_cast<char>(v11),
      static_cast<char>(v12), static_cast<char>(v13), static_cast<char>(v14),
      static_cast<char>(v15));
  return _mm256_broadcastsi128_si256(half);
}

// The bytes of `cur` moved up by N, with the last N bytes of `last` in front.
template <int N>
[[gnu::always_inline]] inline __m256i before(__m256i cur, __m256i last) {
  return _mm256_alignr_epi8(cur, _mm256_permute2x128_si256(last, cur, 0x21), 16 - N);
}

[[gnu::always_inline]] inline __m256i high_half(__m256i v) {
  return _mm256_and_si256(_mm256_srli_epi16(v, 4), _mm256_set1_epi8(0x0F));
}

struct Tables {
  __m256i prevHigh, prevLow, curHigh, incomplete;
};

Tables make_tables() {
  Tables t;
  t.prevHigh =
      table(kTooLong, kTooLong, kTooLong, kTooLong, kTooLong, kTooLong, kTooLong, kTooLong,
            kTwoConts, kTwoConts, kTwoConts, kTwoConts, kTooShort | kOverlong2, kTooShort,
            kTooShort | kOverlong3 | kSurrogate, kTooShort | kTooLarge | kLarge1000 | kOverlong4);
  constexpr uint8_t kAbove = kCarry | kTooLarge | kLarge1000;
  t.prevLow = table(kCarry | kOverlong3 | kOverlong2 | kOverlong4, kCarry | kOverlong2, kCarry,
                    kCarry, kCarry | kTooLarge, kAbove, kAbove, kAbove, kAbove, kAbove, kAbove,
                    kAbove, kAbove, kAbove | kSurrogate, kAbove, kAbove);
  constexpr uint8_t kCont = kTooLong | kOverlong2 | kTwoConts;
  t.curHigh = table(kTooShort, kTooShort, kTooShort, kTooShort, kTooShort, kTooShort, kTooShort,
                    kTooShort, kCont | kOverlong3 | kLarge1000 | kOverlong4,
                    kCont | kOverlong3 | kTooLarge, kCont | kSurrogate | kTooLarge,
                    kCont | kSurrogate | kTooLarge, kTooShort, kTooShort, kTooShort, kTooShort);
  // A block ends inside a character when its last byte is a lead, its
  // second-to-last a lead of three or four bytes, or its third-to-last a
  // lead of four: those bytes exceed these limits.
  alignas(32) uint8_t limits[32];
  for (int i = 0; i < 32; ++i) limits[i] = 0xFF;
  limits[29] = 0xEF;
  limits[30] = 0xDF;
  limits[31] = 0xBF;
  t.incomplete = _mm256_load_si256(reinterpret_cast<const __m256i *>(limits));
  return t;
}

[[gnu::always_inline]] inline __m256i block_errors(const Tables &t, __m256i cur, __m256i last) {
  const __m256i prev1 = before<1>(cur, last);
  const __m256i pairs = _mm256_and_si256(
      _mm256_and_si256(
          _mm256_shuffle_epi8(t.prevHigh, high_half(prev1)),
          _mm256_shuffle_epi8(t.prevLow, _mm256_and_si256(prev1, _mm256_set1_epi8(0x0F)))),
      _mm256_shuffle_epi8(t.curHigh, high_half(cur)));
  // Bytes two after a lead of E0..FF or three after one of F0..FF must be
  // continuation bytes: saturating subtraction leaves the top bit set
  // exactly for those leads.
  const __m256i third = _mm256_subs_epu8(before<2>(cur, last), _mm256_set1_epi8(0x60));
  const __m256i fourth = _mm256_subs_epu8(before<3>(cur, last), _mm256_set1_epi8(0x70));
  const __m256i needed =
      _mm256_and_si256(_mm256_or_si256(third, fourth), _mm256_set1_epi8(static_cast<char>(0x80)));
  return _mm256_xor_si256(pairs, needed);
}

int64_t valid_prefix(const uint8_t *p, int64_t n) {
  const Tables t = make_tables();
  __m256i last = _mm256_setzero_si256();
  __m256i pending = _mm256_setzero_si256();  // nonzero: the last block ended inside a character
  int64_t i = 0;
  for (; i + 32 <= n; i += 32) {
    const __m256i cur = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(p + i));
    if (_mm256_movemask_epi8(cur) == 0) {
      if (!_mm256_testz_si256(pending, pending)) break;
    } else {
      const __m256i errors = block_errors(t, cur, last);
      if (!_mm256_testz_si256(errors, errors)) break;
    }
    pending = _mm256_subs_epu8(cur, t.incomplete);
    last = cur;
  }
  // Everything before i is well formed but for a character that may run on
  // past i: restart the scalar rule at that character's first byte.
  int64_t start = i;
  while (start > 0 && i - start < 3 && (p[start - 1] & 0xC0) == 0x80) --start;
  if (start > 0 && p[start - 1] >= 0xC0) --start;
  return start + valid_prefix_scalar(p + start, n - start);
}

}  // namespace

const ValidateOps kValidateOps{&valid_prefix};

}  // namespace kernel::u8::avx2

NLSSM_TARGET_AVX2_END
