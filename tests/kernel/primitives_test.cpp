// The primitives without vector variants: comparisons, copies, strings.
#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

#include "kernel/scalar.hpp"
#include "nlssm/host.h"
#include "nlssm/nlssm.h"

namespace {

constexpr int64_t kMaxLength = 300;

TEST(Primitives, MemCmpFindsTheFirstDifferenceAtEveryOffset) {
  alignas(64) std::array<uint8_t, 32 + kMaxLength> a, b;
  std::mt19937 rng(99);
  for (int64_t shift = 0; shift < 32; ++shift) {
    for (int64_t n = 0; n <= kMaxLength; ++n) {
      for (auto &x : a) x = static_cast<uint8_t>(rng());
      b = a;
      uint8_t *pa = a.data() + shift, *pb = b.data() + (shift * 5) % 32;
      std::copy(pa, pa + n, pb);
      ASSERT_EQ(skMemCmp(pa, pb, n), 0);
      if (n == 0) continue;
      const int64_t at = (n * 13 + shift) % n;
      pb[at] ^= static_cast<uint8_t>(1 + rng() % 255);
      if (at + 1 < n) pb[at + 1] ^= 0x80;  // later differences do not count
      ASSERT_EQ(skMemCmp(pa, pb, n), kernel::scalar::mem_cmp(pa, pb, n)) << n << " " << at;
      ASSERT_EQ(skMemCmp(pb, pa, n), -skMemCmp(pa, pb, n));
    }
  }
}

TEST(Primitives, ComparisonRules) {
  const uint8_t hi[] = {1, 0x80}, lo[] = {1, 0x7f};
  EXPECT_EQ(skMemCmp(hi, lo, 2), 1);  // unsigned bytes
  EXPECT_EQ(skMemCmp(lo, hi, 2), -1);
  EXPECT_EQ(skMemCmp(nullptr, nullptr, 5), 0);
  EXPECT_EQ(skMemCmp(nullptr, hi, 2), -1);
  EXPECT_EQ(skMemCmp(hi, nullptr, 2), 1);
  EXPECT_EQ(skMemCmp(nullptr, hi, 0), 0);

  // Wide units order by the sign of their wrapped difference.
  const uint32_t big[] = {5, 0x80000000u}, one[] = {5, 1}, top[] = {5, 0xffffffffu};
  EXPECT_EQ(skWMemCmp(big, one, 2), 1);
  EXPECT_EQ(skWMemCmp(one, big, 2), -1);
  EXPECT_EQ(skWMemCmp(top, one, 2), -1);  // unsigned order would give 1
  EXPECT_EQ(skWMemCmp(big, one, 1), 0);
  EXPECT_EQ(skWMemCmp(nullptr, one, 2), -1);
}

// The copies themselves are swept in block_copy_test.cpp; here what they
// answer: the destination, and nothing written for a missing argument.
TEST(Primitives, CopiesAnswerTheDestination) {
  uint8_t a[4] = {1, 2, 3, 4}, b[4] = {};
  EXPECT_EQ(skMemCpy(a, b, 3), b);
  EXPECT_EQ(skMemSCpy(a + 1, a, 3), a);
  EXPECT_EQ(std::vector<uint8_t>(a, a + 4), (std::vector<uint8_t>{2, 3, 4, 4}));
  EXPECT_EQ(b[2], 3);
  EXPECT_EQ(skMemCpy(nullptr, b, 2), b);
  EXPECT_EQ(skMemSCpy(b, nullptr, 2), nullptr);
  EXPECT_EQ(b[0], 1);
}

struct CountingAllocator {
  void *slots[5] = {};
  uint64_t size = 0;
  uint32_t flags = 1;
  bool fail = false;
  static void *allocate(void *object, uint64_t size, uint32_t flags) {
    auto *self = static_cast<CountingAllocator *>(object);
    self->size = size;
    self->flags = flags;
    return self->fail ? nullptr : std::malloc(size + 1);
  }
  CountingAllocator() { slots[NLSHOST_SLOT_POOL_ALLOCATE] = reinterpret_cast<void *>(allocate); }
};

TEST(Primitives, MemDupAllocatesThroughTheObject) {
  CountingAllocator pool;
  const char text[] = "duplicate me";
  void *copy = skMemDup(text, 12, &pool);
  ASSERT_NE(copy, nullptr);
  EXPECT_EQ(pool.size, 12u);
  EXPECT_EQ(pool.flags, 0u);
  EXPECT_EQ(std::memcmp(copy, text, 12), 0);
  std::free(copy);
  EXPECT_EQ(skMemDup(nullptr, 12, &pool), nullptr);
  EXPECT_EQ(skMemDup(text, 12, nullptr), nullptr);
  pool.fail = true;
  EXPECT_EQ(skMemDup(text, 12, &pool), nullptr);
}

TEST(Primitives, StringsAndSingles) {
  const uint8_t text[] = "abc";
  const uint32_t wide[] = {0x10000, 'x', 0};
  EXPECT_EQ(skStrLen(text), 3);
  EXPECT_EQ(skStrLen(nullptr), 0);
  EXPECT_EQ(skStrTLen(wide), 2);
  EXPECT_EQ(skStrTLen(nullptr), 0);

  uint8_t dest[6] = {9, 9, 9, 9, 9, 9};
  skStrCpy(text, dest);
  EXPECT_EQ(std::memcmp(dest, "abc\0\x09", 5), 0);
  skStrCpy(nullptr, dest);
  EXPECT_EQ(dest[0], 0);
  EXPECT_EQ(dest[1], 'b');
  skStrCpy(text, nullptr);
  uint32_t wdest[4] = {7, 7, 7, 7};
  skStrTCpy(wide, wdest);
  EXPECT_EQ(std::vector<uint32_t>(wdest, wdest + 4), (std::vector<uint32_t>{0x10000, 'x', 0, 7}));
  skStrTCpy(nullptr, wdest);
  EXPECT_EQ(wdest[0], 0u);

  EXPECT_EQ(skUnsup(), int64_t{NLSSM_E_UNSUPPORTED});

  std::vector<double> values(9, 1.5);
  EXPECT_EQ(skMissArray(values.data(), 9), 0);
  EXPECT_EQ(skMissArray(nullptr, 9), 0);
  for (size_t i = 0; i < values.size(); ++i) {
    values.assign(9, -0.0);
    values[i] = std::nan("");
    EXPECT_EQ(skMissArray(values.data(), 9), 1) << i;
    EXPECT_EQ(skMissArray(values.data(), static_cast<int64_t>(i)), 0) << i;
  }
  values[0] = INFINITY;
  EXPECT_EQ(skMissArray(values.data(), 8), 0);
}

}  // namespace
