// Mapping single-byte text through a 256-entry table: the transliterate
// engine of single-byte encodings builds the table once per call and maps
// the whole text through it, with vector paths chosen at run time.
#pragma once

#include <cstdint>

namespace nlssm::edit {

enum class MapIsa : int { kScalar = 0, kSse2 = 1, kAvx2 = 2 };

// The widest path this processor runs.
MapIsa best_map_isa();

// out[i] = map[in[i]] for i < n. `in` and `out` are equal or do not overlap.
// Every path gives the same bytes; a path the processor cannot run falls
// back to the scalar loop.
void map_bytes(MapIsa isa, const uint8_t *map, const uint8_t *in, uint8_t *out, int64_t n);

}  // namespace nlssm::edit
