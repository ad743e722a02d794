// Hot paths of the UTF kit: the UTF-8 length of an array of 32-bit
// characters (SSE2 and AVX2, chosen at run time) and the bulk UTF-8 to
// UTF-32 loop of the decoding driver (SSE2 for ASCII runs).
#include <emmintrin.h>
#include <immintrin.h>
#include "kernel/cpu.hpp"

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
  return kernel::cpu::supports(kernel::cpu::Isa::avx2);
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

namespace {

// Widens 16 ASCII bytes into 16 32-bit slots: interleaving with zero bytes
// on one side or the other puts each byte at the low or the high end of its
// slot.
template <Order O>
inline void widen16(__m128i x, uint8_t *d) {
  const __m128i zero = _mm_setzero_si128();
  auto *out = reinterpret_cast<__m128i *>(d);
  if constexpr (kIsBig<O>) {
    const __m128i lo = _mm_unpacklo_epi8(zero, x), hi = _mm_unpackhi_epi8(zero, x);
    _mm_storeu_si128(out, _mm_unpacklo_epi16(zero, lo));
    _mm_storeu_si128(out + 1, _mm_unpackhi_epi16(zero, lo));
    _mm_storeu_si128(out + 2, _mm_unpacklo_epi16(zero, hi));
    _mm_storeu_si128(out + 3, _mm_unpackhi_epi16(zero, hi));
  } else {
    const __m128i lo = _mm_unpacklo_epi8(x, zero), hi = _mm_unpackhi_epi8(x, zero);
    _mm_storeu_si128(out, _mm_unpacklo_epi16(lo, zero));
    _mm_storeu_si128(out + 1, _mm_unpackhi_epi16(lo, zero));
    _mm_storeu_si128(out + 2, _mm_unpacklo_epi16(hi, zero));
    _mm_storeu_si128(out + 3, _mm_unpackhi_epi16(hi, zero));
  }
}

template <Order O>
void bulk_to_utf32(Utf8BlockStep step, const uint8_t *s, int64_t n, uint8_t *d, int64_t limit,
                   int64_t &consumed, int64_t &chars) {
  int64_t i = consumed, k = chars;
  while (k < limit && n - i >= 4) {
    if (step != nullptr && n - i >= kUtf8BlockStepMinBytes) {
      const int64_t before = i;
      step(s, n, d, limit, kIsBig<O>, i, k);
      if (i != before) continue;
    }
    const uint32_t b = s[i];
    if (b < 0x80) {
      if (n - i >= 16 && limit - k >= 16) {
        const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + i));
        const int mask = _mm_movemask_epi8(x);
        if (mask == 0) {
          widen16<O>(x, d + 4 * k);
          i += 16;
          k += 16;
          continue;
        }
        // The ASCII bytes before the block's first byte >= 0x80.
        const int run = __builtin_ctz(static_cast<unsigned>(mask));
        for (int j = 0; j < run; ++j) store32<O>(d + 4 * (k + j), s[i + j]);
        i += run;
        k += run;
        continue;
      }
      store32<O>(d + 4 * k++, b);
      ++i;
      continue;
    }
    uint32_t c;
    if (b >= 0xC2 && b <= 0xDF) {
      c = (b & 0x1F) << 6 | (s[i + 1] & 0x3F);
      i += 2;
    } else if (b >= 0xE0 && b <= 0xEF) {
      c = (b & 0x0F) << 12 | (s[i + 1] & 0x3F) << 6 | (s[i + 2] & 0x3F);
      i += 3;
    } else if (b >= 0xF0 && b <= 0xF4) {
      c = (b & 0x07) << 18 | (s[i + 1] & 0x3F) << 12 | (s[i + 2] & 0x3F) << 6 | (s[i + 3] & 0x3F);
      i += 4;
    } else {
      break;  // an invalid lead: the one-character decoder reports it
    }
    store32<O>(d + 4 * k++, c);
  }
  consumed = i;
  chars = k;
}

}  // namespace

namespace {

// The block steps built for one instruction set.
struct BlockSteps {
  Utf8BlockStep utf8 = nullptr;
  Utf32BlockStep utf32 = nullptr;
};

BlockSteps block_steps(kernel::cpu::Isa isa) {
  switch (isa) {
    case kernel::cpu::Isa::avx512vbmi2:
      return {&utf8_blocks_avx512, &utf32_blocks_avx512};
    case kernel::cpu::Isa::avx512vbmi:
    case kernel::cpu::Isa::avx2:
      return {&utf8_blocks_avx2, &utf32_blocks_avx2};
    case kernel::cpu::Isa::sse2:
      break;
  }
  return {};
}

// The steps of the strongest instruction set this processor runs.
const BlockSteps &best_block_steps() {
  static const BlockSteps steps = [] {
    for (auto it = kernel::cpu::kAllIsas.rbegin(); it != kernel::cpu::kAllIsas.rend(); ++it)
      if (kernel::cpu::supports(*it)) return block_steps(*it);
    return BlockSteps{};
  }();
  return steps;
}

}  // namespace

Utf8BlockStep utf8_block_step(kernel::cpu::Isa isa) {
  return block_steps(isa).utf8;
}
Utf32BlockStep utf32_block_step(kernel::cpu::Isa isa) {
  return block_steps(isa).utf32;
}
Utf8BlockStep utf8_best_block_step() {
  return best_block_steps().utf8;
}
Utf32BlockStep utf32_best_block_step() {
  return best_block_steps().utf32;
}

void utf8_to_utf32_bulk(Utf8BlockStep step, const uint8_t *s, int64_t n, uint8_t *d, int64_t limit,
                        bool big_endian, int64_t &consumed, int64_t &chars) {
  if (big_endian)
    bulk_to_utf32<Order::big>(step, s, n, d, limit, consumed, chars);
  else
    bulk_to_utf32<Order::little>(step, s, n, d, limit, consumed, chars);
}

}  // namespace nlssm::unicode
