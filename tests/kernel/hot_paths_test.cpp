// Every vector variant the processor runs, and the exported functions that
// dispatch to them, against the scalar rules: each misalignment of 0..31
// bytes, each length 0..300, with the bytes around the range left intact.
#include <gtest/gtest.h>

#include <array>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "kernel/hot.hpp"
#include "kernel/scalar.hpp"
#include "nlssm/nlssm.h"

namespace {

struct Path {
  std::string name;
  kernel::HotOps ops;
};

std::vector<Path> paths() {
  std::vector<Path> out;
  for (const auto &variant : kernel::hot_ops.variants())
    if (kernel::cpu::supports(variant.isa))
      out.push_back({kernel::cpu::name(variant.isa), *variant.table});
  // The exported fills serve both fill entries; the exported copies are
  // checked in block_copy_test.cpp.
  out.push_back({"exported",
                 {skStrUp, skStrLow, skMemSet, skMemTSet, skMemScan, skMemNScan, skMemTNScan,
                  kernel::scalar::mem_mismatch, skMemSet, skMemTSet, nullptr, nullptr, nullptr}});
  return out;
}

constexpr int64_t kMaxLength = 300;

// Calls body(region, length, expected) for every misalignment and length;
// region and expected lie in two copies of a 64-byte-aligned arena of
// random elements, and after body both copies must agree everywhere.
template <typename T, typename Body>
void sweep(Body &&body) {
  constexpr int64_t guard = 64 / sizeof(T), shifts = 32 / sizeof(T);
  alignas(64) std::array<T, 2 * guard + shifts + kMaxLength> arena, expected;
  std::mt19937 rng(12345);
  for (int64_t shift = 0; shift < shifts; ++shift) {
    for (int64_t length = 0; length <= kMaxLength; ++length) {
      for (auto &x : arena) x = static_cast<T>(rng());
      expected = arena;
      body(arena.data() + guard + shift, length, expected.data() + guard + shift);
      ASSERT_TRUE(arena == expected)
          << "misalignment " << shift * sizeof(T) << ", length " << length;
    }
  }
}

// A find over `length` elements of `fill` with `other` at `hit` and beyond,
// and `other` in the surrounding elements too, so reading outside the range
// gives a wrong answer.
template <typename T, typename Find>
void check_find(Find find, T fill, T other) {
  sweep<T>([&](T *region, int64_t length, T *expected) {
    for (int64_t hit :
         {length, int64_t{0}, length / 2, length - 1, (length * 7 + 3) % (length + 1)}) {
      if (hit < 0) continue;
      for (T *p : {region, expected}) {
        std::fill(p - 64 / sizeof(T), p + length + 64 / sizeof(T), other);
        std::fill(p, p + length, fill);
        if (hit < length) std::fill(p + hit, p + (hit + 3 < length ? hit + 3 : length), other);
      }
      ASSERT_EQ(find(region, length), hit < length ? hit : -1) << "hit at " << hit;
    }
  });
}

class HotPathTest : public testing::TestWithParam<Path> {};

TEST_P(HotPathTest, CaseMappingChangesAsciiLettersOnly) {
  const auto &ops = GetParam().ops;
  sweep<uint8_t>([&](uint8_t *p, int64_t n, uint8_t *e) {
    ops.str_up(p, n);
    kernel::scalar::str_up(e, n);
  });
  sweep<uint8_t>([&](uint8_t *p, int64_t n, uint8_t *e) {
    ops.str_low(p, n);
    kernel::scalar::str_low(e, n);
  });
}

TEST_P(HotPathTest, FillsWriteExactlyTheRange) {
  const auto &ops = GetParam().ops;
  // Through the caches and around them.
  for (auto [set, tset] :
       {std::pair{ops.mem_set, ops.mem_tset}, std::pair{ops.mem_stream_set, ops.mem_stream_tset}}) {
    sweep<uint8_t>([&](uint8_t *p, int64_t n, uint8_t *e) {
      set(p, 0x5a, n);
      kernel::scalar::mem_set(e, 0x5a, n);
    });
    sweep<uint32_t>([&](uint32_t *p, int64_t n, uint32_t *e) {
      tset(p, 0xdeadbeef, n);
      kernel::scalar::mem_tset(e, 0xdeadbeef, n);
    });
  }
}

TEST_P(HotPathTest, ScansFindTheFirstHitInsideTheRange) {
  const auto &ops = GetParam().ops;
  check_find<uint8_t>([&](const uint8_t *p, int64_t n) { return ops.mem_scan(p, n, 0x80); }, 0x00,
                      0x80);
  check_find<uint8_t>([&](const uint8_t *p, int64_t n) { return ops.mem_nscan(p, n, 0x20); }, 0x20,
                      0xa0);
  check_find<uint32_t>(
      [&](const uint32_t *p, int64_t n) { return ops.mem_tnscan(p, n, 0x00200020); }, 0x00200020,
      0x80200020);
}

// The first difference at every length and alignment, with differing bytes
// just outside the range so that reading past it gives a wrong answer.
TEST_P(HotPathTest, MismatchFindsTheFirstDifferenceInsideTheRange) {
  const auto &ops = GetParam().ops;
  alignas(64) std::array<uint8_t, 64 + kMaxLength + 64> a, b;
  std::mt19937 rng(77);
  for (int64_t n = 0; n <= kMaxLength; ++n) {
    for (int64_t shift = 0; shift < 64; ++shift) {
      for (auto &x : a) x = static_cast<uint8_t>(rng());
      for (auto &x : b) x = static_cast<uint8_t>(rng());
      uint8_t *pa = a.data() + shift, *pb = b.data() + 1 + (shift * 5 + n) % 63;
      std::copy(pa, pa + n, pb);
      pb[n] = static_cast<uint8_t>(pa[n] ^ 1);
      ASSERT_EQ(ops.mem_mismatch(pa, pb, n), n) << "length " << n << ", shift " << shift;
      if (n == 0) continue;
      for (int64_t at : {int64_t{0}, n - 1, n / 2, (n * 13 + shift) % n}) {
        pb[at] ^= 0x80;
        if (at + 1 < n) pb[at + 1] ^= 0x01;  // later differences do not count
        ASSERT_EQ(ops.mem_mismatch(pa, pb, n), at) << "length " << n << ", shift " << shift;
        pb[at] ^= 0x80;
        if (at + 1 < n) pb[at + 1] ^= 0x01;
      }
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Kernel, HotPathTest, testing::ValuesIn(paths()),
                         [](const auto &info) { return info.param.name; });

// skMemNot answers with the index of the first differing element, or -2
// when it claims a difference that is not there.
template <typename T, typename Not>
int64_t first_difference(Not not_fn, T value, const T *p, int64_t n) {
  if (not_fn(value, p, n)) return -1;
  const int64_t r = kernel::scalar::find<false>(p, n, value);
  return r >= 0 ? r : -2;
}

TEST(HotPaths, AllEqualTestsAgreeWithScans) {
  check_find<uint8_t>(
      [](const uint8_t *p, int64_t n) { return first_difference<uint8_t>(skMemNot, 0x41, p, n); },
      0x41, 0x42);
  check_find<uint32_t>(
      [](const uint32_t *p, int64_t n) { return first_difference<uint32_t>(skMemTNot, 9, p, n); },
      9, 0x109);
}

TEST(HotPaths, ExportedFunctionsRejectNullAndNegativeLengths) {
  uint8_t b[4] = {'a', 'b', 'c', 'd'};
  skStrUp(nullptr, 4);
  skStrUp(b, -1);
  skMemSet(nullptr, 1, 4);
  skMemSet(b, 1, -4);
  skMemTSet(nullptr, 1, 4);
  EXPECT_EQ(std::string(b, b + 4), "abcd");
  EXPECT_EQ(skMemScan(nullptr, 4, 0), -1);
  EXPECT_EQ(skMemScan(b, 0, 'a'), -1);
  EXPECT_EQ(skMemNScan(nullptr, 4, 0), -1);
  EXPECT_EQ(skMemTNScan(nullptr, 4, 0), -1);
  EXPECT_EQ(skMemNot(0, b, 0), 1);
  EXPECT_EQ(skMemNot(0, nullptr, 4), 0);
  EXPECT_EQ(skMemTNot(0, nullptr, 4), 0);
}

}  // namespace
