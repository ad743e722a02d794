// Mapping bytes through a 256-byte table (the single-byte case tables) at
// near memory speed. A table is turned once into a plan that vector code can
// run without a per-byte memory lookup:
//   - pieces: the bytes whose entry differs from themselves form a few runs
//     of consecutive values that all move by the same amount (a-z -> A-Z is
//     one run moving by -32); each run costs a range test and an add;
//   - rows: for each 16-byte row of the table that maps any byte elsewhere,
//     a 16-entry shuffle table of the amounts (AVX2 only, where one byte
//     shuffle looks up 32 bytes).
// The plan takes whichever needs fewer steps. Processors with AVX-512 byte
// permutes need no plan: they look the whole table up, 64 bytes at a time. Plans of the catalogue's
// case tables are made on first use and kept; any other table gets a plan made for the call when
// the text is long enough to pay for it.
#pragma once

#include <cstdint>

namespace nlssm::casecmp {

struct MapPlan {
  static constexpr int kMaxPieces = 24;
  static constexpr int kMaxRows = 16;
  int pieces = 0;  // number of runs, or -1 when there are more than kMaxPieces
  int rows = 0;    // number of rows with a change
  uint8_t low[kMaxPieces] = {};
  uint8_t span[kMaxPieces] = {};  // last - low, at most 126
  uint8_t delta[kMaxPieces] = {};
  uint8_t row[kMaxRows] = {};                       // high nibble of each changed row
  alignas(16) uint8_t rowDelta[kMaxRows][16] = {};  // amount for each low nibble
};

// Builds the plan of a 256-byte table.
void make_plan(const uint8_t *table, MapPlan &plan);

enum class MapIsa : uint8_t { kScalar, kSse2, kAvx2, kAvx512 };

// The instruction set map_bytes uses on this processor.
MapIsa best_map_isa();

// dst[i] = table[src[i]] for i < n; dst may be src (in place) but must not
// otherwise overlap it. The plain table loop with kScalar.
void map_bytes(MapIsa isa, const uint8_t *table, const uint8_t *src, uint8_t *dst, int64_t n);

// The same on the best instruction set.
void map_bytes(const uint8_t *table, const uint8_t *src, uint8_t *dst, int64_t n);

// The reference: the table loop, two bytes per pass.
void map_bytes_scalar(const uint8_t *table, const uint8_t *src, uint8_t *dst, int64_t n);

namespace detail {
// Vector kernels: whole blocks only; answer the bytes done (a multiple of the
// register width), leaving the tail to the caller. The SSE2 kernel runs
// pieces only and answers 0 when the plan has none usable.
int64_t map_blocks_sse2(const MapPlan &plan, const uint8_t *src, uint8_t *dst, int64_t n);
int64_t map_blocks_avx2(const MapPlan &plan, const uint8_t *src, uint8_t *dst, int64_t n);
// Every byte (answers n).
int64_t map_bytes_avx512(const uint8_t *table, const uint8_t *src, uint8_t *dst, int64_t n);
}  // namespace detail

}  // namespace nlssm::casecmp
