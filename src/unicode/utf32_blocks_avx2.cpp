// UTF-32 to UTF-8 and UTF-16, sixteen units per step with AVX2: blocks of
// ASCII (to UTF-8) or of units below 0x10000 (to UTF-16) are narrowed with
// saturating packs; any other block goes through the one-unit encoder, once
// its whole encoding is known to fit.
#include "unicode/codec.hpp"
#include "unicode/utf32_blocks.hpp"

#include <immintrin.h>

#include <cstdint>

namespace nlssm::unicode {

NLSSM_TARGET_AVX2_BEGIN

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

int64_t utf8_length_of_unit(uint32_t c) {
  return utf8_length_of(c);
}
int64_t utf16_length_of_unit(uint32_t c) {
  return c < 0x10000 ? 2 : 4;
}

// A block the packs do not take: the one-unit encoder, unit by unit, once
// the whole block is known to fit; -1 when it does not.
template <typename Encoder, Order In>
int64_t encode_by_unit(const uint8_t *s, uint8_t *d, int64_t room, int64_t (*length)(uint32_t)) {
  // Sixteen units take at most 64 bytes in either form.
  if (room < 64) {
    int64_t need = 0;
    for (int j = 0; j < 16; ++j) need += length(load32<In>(s + 4 * j));
    if (need > room) return -1;
  }
  int64_t t = 0;
  for (int j = 0; j < 16; ++j) {
    int64_t out = 0;
    Encoder::encode(load32<In>(s + 4 * j), d + t, room - t, &out);
    t += out;
  }
  return t;
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
    return encode_by_unit<Utf8Encoder, In>(p, d, room, &utf8_length_of_unit);
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
    return encode_by_unit<Utf16Encoder<Out>, In>(p, d, room, &utf16_length_of_unit);
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

NLSSM_TARGET_AVX2_END

}  // namespace nlssm::unicode
