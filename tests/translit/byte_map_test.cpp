// The vector paths of the single-byte map against the table itself.
#include <gtest/gtest.h>

#include <cstdint>
#include <numeric>
#include <random>
#include <vector>

#include "edit/byte_map.hpp"

namespace {

using nlssm::edit::MapIsa;

TEST(ByteMap, EveryPathMapsLikeTheTable) {
  std::mt19937 rng(15);
  for (int changes : {0, 1, 2, 6, 7, 16, 40, 256}) {
    uint8_t map[256];
    std::iota(map, map + 256, 0);
    for (int k = 0; k < changes; ++k) map[rng() % 256] = static_cast<uint8_t>(rng());
    for (int64_t n : {0, 1, 15, 16, 31, 33, 64, 1000}) {
      std::vector<uint8_t> in(static_cast<size_t>(n) + 1);
      for (auto &b : in) b = static_cast<uint8_t>(rng());
      for (MapIsa isa : {MapIsa::kScalar, MapIsa::kSse2, MapIsa::kAvx2}) {
        std::vector<uint8_t> out(in.size() + 8, 0xEE);
        nlssm::edit::ByteMap(map, isa).apply(in.data() + 1, out.data(), n);
        for (int64_t i = 0; i < n; ++i)
          ASSERT_EQ(out[i], map[in[i + 1]]) << changes << " changes, n " << n << " at " << i;
        EXPECT_EQ(out[n], 0xEE);
      }
    }
  }
}

}  // namespace
