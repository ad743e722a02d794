// Mapping single-byte text through a 256-entry table: the transliterate
// engines build the table once per call and map text through it, with
// vector paths chosen at run time.
#pragma once

#include <cstdint>

namespace nlssm::edit {

enum class MapIsa : int { kScalar = 0, kSse2 = 1, kAvx2 = 2 };

// The widest path this processor runs.
MapIsa best_map_isa();

// A table prepared for one path: what the vector loops need is worked out
// once, so that many short texts can be mapped through it cheaply.
class ByteMap {
 public:
  // `table` (256 bytes) is copied. A path the processor cannot run falls
  // back to a narrower one; every path gives the same bytes.
  ByteMap(const uint8_t *table, MapIsa isa);

  // out[i] = table[in[i]] for i < n; `in` and `out` are equal or disjoint.
  void apply(const uint8_t *in, uint8_t *out, int64_t n) const;

  // At most this many changed bytes for the SSE2 compare-and-blend loop.
  static constexpr int kSse2MaxChanges = 6;

 private:
  MapIsa isa_;
  uint8_t table_[256];
  int changes_ = 0;  // bytes the table changes
  uint8_t from_[kSse2MaxChanges];
  uint8_t to_[kSse2MaxChanges];
  int groups_ = 0;  // groups of 16 bytes (one high nibble) with a change
  uint8_t group_[16];
  alignas(16) uint8_t group_table_[16][16];
};

}  // namespace nlssm::edit
