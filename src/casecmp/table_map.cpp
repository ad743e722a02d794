// Table mapping: plans, the plans of the catalogue's case tables, the table
// loop, the SSE2 kernel and the choice between the instruction sets.
#include "casecmp/table_map.hpp"

#include <emmintrin.h>

#include <algorithm>
#include <cstring>

#include "catalogue/catalogue.hpp"
#include "kernel/cpu.hpp"

namespace nlssm::casecmp {
namespace {

// Shorter texts go through the table loop: a plan lookup and the vector
// set-up cost more than they save.
constexpr int64_t kVectorBytes = 64;
// A table outside the catalogue gets a plan of its own from this length.
constexpr int64_t kOwnPlanBytes = 4096;
// Each range test spans at most 127 values, so that it fits one signed
// comparison.
constexpr int kMaxSpan = 126;

// The plans of every case table of the catalogue, by table address.
struct CatalogueIndex {
  static constexpr int kMax = 2 * catalogue::kTrantabRows;
  int count = 0;
  const uint8_t *key[kMax] = {};
  MapPlan plan[kMax];
};

const CatalogueIndex &catalogue_index() {
  static CatalogueIndex index;
  static const bool built = [] {
    const uint8_t *tables[CatalogueIndex::kMax];
    int n = 0;
    for (const catalogue::TrantabRow &row : catalogue::sm_trantab) {
      if (row.lower != nullptr) tables[n++] = row.lower;
      if (row.upper != nullptr) tables[n++] = row.upper;
    }
    std::sort(tables, tables + n);
    n = static_cast<int>(std::unique(tables, tables + n) - tables);
    for (int i = 0; i < n; ++i) {
      index.key[i] = tables[i];
      make_plan(tables[i], index.plan[i]);
    }
    index.count = n;
    return true;
  }();
  (void)built;
  return index;
}

const MapPlan *catalogue_plan(const uint8_t *table) {
  const CatalogueIndex &index = catalogue_index();
  const uint8_t *const *end = index.key + index.count;
  const uint8_t *const *at = std::lower_bound(index.key, end, table);
  return at != end && *at == table ? &index.plan[at - index.key] : nullptr;
}

}  // namespace

void make_plan(const uint8_t *table, MapPlan &plan) {
  plan = MapPlan{};
  int b = 0;
  while (b < 256) {
    const auto d = static_cast<uint8_t>(table[b] - b);
    if (d == 0) {
      ++b;
      continue;
    }
    int last = b;
    while (last + 1 < 256 && last - b < kMaxSpan &&
           static_cast<uint8_t>(table[last + 1] - (last + 1)) == d)
      ++last;
    if (plan.pieces >= 0) {
      if (plan.pieces == MapPlan::kMaxPieces) {
        plan.pieces = -1;
      } else {
        plan.low[plan.pieces] = static_cast<uint8_t>(b);
        plan.span[plan.pieces] = static_cast<uint8_t>(last - b);
        plan.delta[plan.pieces] = d;
        ++plan.pieces;
      }
    }
    b = last + 1;
  }
  for (int h = 0; h < 16; ++h) {
    bool changed = false;
    for (int l = 0; l < 16; ++l) {
      const int v = h * 16 + l;
      plan.rowDelta[plan.rows][l] = static_cast<uint8_t>(table[v] - v);
      changed = changed || table[v] != v;
    }
    if (changed) plan.row[plan.rows++] = static_cast<uint8_t>(h);
  }
  if (plan.rows < MapPlan::kMaxRows) std::memset(plan.rowDelta[plan.rows], 0, 16);
}

void map_bytes_scalar(const uint8_t *table, const uint8_t *src, uint8_t *dst, int64_t n) {
  int64_t i = 0;
  for (; i + 2 <= n; i += 2) {
    const uint8_t a = table[src[i]];
    const uint8_t b = table[src[i + 1]];
    dst[i] = a;
    dst[i + 1] = b;
  }
  if (i < n) dst[i] = table[src[i]];
}

namespace detail {

// Sixteen bytes at a time: each run adds its amount where the byte lies in
// it. The byte is shifted so that the run starts at -128; then "inside" is
// one signed comparison.
int64_t map_blocks_sse2(const MapPlan &plan, const uint8_t *src, uint8_t *dst, int64_t n) {
  constexpr int kMaxUsefulPieces = 8;  // beyond this the table loop is faster
  if (plan.pieces < 0 || plan.pieces > kMaxUsefulPieces) return 0;
  __m128i shift[kMaxUsefulPieces], bound[kMaxUsefulPieces], amount[kMaxUsefulPieces];
  for (int k = 0; k < plan.pieces; ++k) {
    shift[k] = _mm_set1_epi8(static_cast<char>(0x80 - plan.low[k]));
    bound[k] = _mm_set1_epi8(static_cast<char>(-128 + plan.span[k] + 1));
    amount[k] = _mm_set1_epi8(static_cast<char>(plan.delta[k]));
  }
  int64_t i = 0;
  for (; i + 16 <= n; i += 16) {
    const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(src + i));
    __m128i r = x;
    for (int k = 0; k < plan.pieces; ++k) {
      const __m128i inside = _mm_cmplt_epi8(_mm_add_epi8(x, shift[k]), bound[k]);
      r = _mm_add_epi8(r, _mm_and_si128(inside, amount[k]));
    }
    _mm_storeu_si128(reinterpret_cast<__m128i *>(dst + i), r);
  }
  return i;
}

}  // namespace detail

MapIsa best_map_isa() {
  using kernel::cpu::Isa;
  static const MapIsa isa = kernel::cpu::supports(Isa::avx512vbmi) ? MapIsa::kAvx512
                            : kernel::cpu::supports(Isa::avx2)     ? MapIsa::kAvx2
                                                                   : MapIsa::kSse2;
  return isa;
}

void map_bytes(MapIsa isa, const uint8_t *table, const uint8_t *src, uint8_t *dst, int64_t n) {
  if (n <= 0) return;
  int64_t done = 0;
  if (isa == MapIsa::kAvx512) {
    done = detail::map_bytes_avx512(table, src, dst, n);
  } else if (isa != MapIsa::kScalar && n >= kVectorBytes) {
    MapPlan own;
    const MapPlan *plan = catalogue_plan(table);
    if (plan == nullptr && n >= kOwnPlanBytes) {
      make_plan(table, own);
      plan = &own;
    }
    if (plan != nullptr && plan->pieces == 0) {  // the identity
      if (dst != src) std::memcpy(dst, src, static_cast<size_t>(n));
      return;
    }
    if (plan != nullptr)
      done = isa == MapIsa::kAvx2 ? detail::map_blocks_avx2(*plan, src, dst, n)
                                  : detail::map_blocks_sse2(*plan, src, dst, n);
  }
  map_bytes_scalar(table, src + done, dst + done, n - done);
}

void map_bytes(const uint8_t *table, const uint8_t *src, uint8_t *dst, int64_t n) {
  map_bytes(best_map_isa(), table, src, dst, n);
}

}  // namespace nlssm::casecmp
