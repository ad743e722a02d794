// Byte mapping through a 256-entry table. A transliteration table usually
// changes few bytes, so the vector paths work on what changes:
// - SSE2 compares every byte with each changed value and blends in its
//   replacement, which pays while few values change;
// - AVX2 splits bytes into high and low nibbles and, for each group of 16
//   values (one high nibble) with a change, looks the low nibble up in that
//   group's 16 bytes of the table and blends the result in where the high
//   nibble matches; at most 16 groups, so it always beats the scalar loop.
// The scalar loop handles the tail and the texts too short for a vector.
#include "edit/byte_map.hpp"

#include <emmintrin.h>
#include <immintrin.h>

#include <cstring>

#include "kernel/cpu.hpp"

namespace nlssm::edit {
namespace {

void map_scalar(const uint8_t *map, const uint8_t *in, uint8_t *out, int64_t n) {
  int64_t i = 0;
  for (; i + 4 <= n; i += 4) {
    const uint8_t a = map[in[i]], b = map[in[i + 1]], c = map[in[i + 2]], d = map[in[i + 3]];
    out[i] = a, out[i + 1] = b, out[i + 2] = c, out[i + 3] = d;
  }
  for (; i < n; ++i) out[i] = map[in[i]];
}

int64_t map_sse2(int changes, const uint8_t *from, const uint8_t *to, const uint8_t *in,
                 uint8_t *out, int64_t n) {
  __m128i f[ByteMap::kSse2MaxChanges], t[ByteMap::kSse2MaxChanges];
  for (int k = 0; k < changes; ++k) {
    f[k] = _mm_set1_epi8(static_cast<char>(from[k]));
    t[k] = _mm_set1_epi8(static_cast<char>(to[k]));
  }
  int64_t i = 0;
  for (; i + 16 <= n; i += 16) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i *>(in + i));
    __m128i r = v;
    for (int k = 0; k < changes; ++k) {
      const __m128i m = _mm_cmpeq_epi8(v, f[k]);
      r = _mm_or_si128(_mm_and_si128(m, t[k]), _mm_andnot_si128(m, r));
    }
    _mm_storeu_si128(reinterpret_cast<__m128i *>(out + i), r);
  }
  return i;
}

}  // namespace

NLSSM_TARGET_AVX2_BEGIN
namespace {

int64_t map_avx2(int groups, const uint8_t *group, const uint8_t (*tables)[16], const uint8_t *in,
                 uint8_t *out, int64_t n) {
  __m256i table[16], id[16];
  for (int k = 0; k < groups; ++k) {
    table[k] =
        _mm256_broadcastsi128_si256(_mm_load_si128(reinterpret_cast<const __m128i *>(tables[k])));
    id[k] = _mm256_set1_epi8(static_cast<char>(group[k]));
  }
  const __m256i low4 = _mm256_set1_epi8(0x0F);
  int64_t i = 0;
  for (; i + 32 <= n; i += 32) {
    const __m256i v = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(in + i));
    const __m256i hi = _mm256_and_si256(_mm256_srli_epi16(v, 4), low4);
    const __m256i lo = _mm256_and_si256(v, low4);
    __m256i r = v;
    for (int k = 0; k < groups; ++k)
      r = _mm256_blendv_epi8(r, _mm256_shuffle_epi8(table[k], lo), _mm256_cmpeq_epi8(hi, id[k]));
    _mm256_storeu_si256(reinterpret_cast<__m256i *>(out + i), r);
  }
  return i;
}

}  // namespace
NLSSM_TARGET_AVX2_END

MapIsa best_map_isa() {
  return kernel::cpu::supports(kernel::cpu::Isa::avx2) ? MapIsa::kAvx2 : MapIsa::kSse2;
}

ByteMap::ByteMap(const uint8_t *table, MapIsa isa) : isa_(isa) {
  std::memcpy(table_, table, 256);
  if (isa_ == MapIsa::kScalar) return;  // the table alone
  if (isa_ == MapIsa::kAvx2 && !kernel::cpu::supports(kernel::cpu::Isa::avx2)) isa_ = MapIsa::kSse2;
  for (int b = 0; b < 256; ++b) {
    if (table[b] == b) continue;
    if (changes_ < kSse2MaxChanges) {
      from_[changes_] = static_cast<uint8_t>(b);
      to_[changes_] = table[b];
    }
    ++changes_;
  }
  for (int g = 0; g < 16; ++g) {
    bool changed = false;
    for (int l = 0; l < 16; ++l) changed |= table[g * 16 + l] != g * 16 + l;
    if (!changed) continue;
    std::memcpy(group_table_[groups_], table + g * 16, 16);
    group_[groups_++] = static_cast<uint8_t>(g);
  }
}

void ByteMap::apply(const uint8_t *in, uint8_t *out, int64_t n) const {
  if (n <= 0) return;
  if (changes_ == 0 && isa_ != MapIsa::kScalar) {
    if (in != out) std::memcpy(out, in, static_cast<size_t>(n));
    return;
  }
  int64_t done = 0;
  if (isa_ == MapIsa::kAvx2) {
    done = map_avx2(groups_, group_, group_table_, in, out, n);
  } else if (isa_ == MapIsa::kSse2 && changes_ <= kSse2MaxChanges) {
    done = map_sse2(changes_, from_, to_, in, out, n);
  }
  map_scalar(table_, in + done, out + done, n - done);
}

}  // namespace nlssm::edit
