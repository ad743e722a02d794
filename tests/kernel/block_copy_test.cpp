// The block copies of every vector variant the processor runs, and the
// exported copies and fills that choose among them, against a byte-by-byte
// move: every length 0..300, every alignment of source and destination,
// overlaps in both directions, blocks beyond the caches; the bytes around
// the destination must stay intact. Also the cache sizes they are chosen by.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <fstream>
#include <random>
#include <string>
#include <vector>

#include "kernel/cpu.hpp"
#include "kernel/hot.hpp"
#include "kernel/scalar.hpp"
#include "nlssm/nlssm.h"

namespace {

using CopyFn = void (*)(uint8_t *destination, const uint8_t *source, int64_t length);

struct CopyPath {
  std::string name;
  CopyFn up, down, stream;
};

void PrintTo(const CopyPath &path, std::ostream *out) {
  *out << path.name;
}

std::vector<CopyPath> copy_paths() {
  std::vector<CopyPath> out;
  for (const auto &variant : kernel::hot_ops.variants())
    if (kernel::cpu::supports(variant.isa))
      out.push_back({kernel::cpu::name(variant.isa), variant.table->copy_up,
                     variant.table->copy_down, variant.table->copy_stream});
  CopyFn moves = [](uint8_t *d, const uint8_t *s, int64_t n) { skMemSCpy(s, d, n); };
  out.push_back({"exported", moves, moves,
                 [](uint8_t *d, const uint8_t *s, int64_t n) { skMemCpy(s, d, n); }});
  return out;
}

constexpr int64_t kMaxLength = 300;

// An arena of random bytes and its expected state after a move within it.
class Arena {
 public:
  explicit Arena(int64_t size) : size_(size), bytes_(size + 64), expected_(size + 64) {}

  // Runs copy from offset `from` to offset `to` (from the arena's 64-byte
  // aligned start) and compares the whole arena with a byte-by-byte move.
  void check(CopyFn copy, int64_t from, int64_t to, int64_t n) {
    uint8_t *bytes = base(bytes_), *expected = base(expected_);
    for (int64_t i = 0; i < size_; ++i) bytes[i] = static_cast<uint8_t>(rng_());
    std::memcpy(expected, bytes, static_cast<size_t>(size_));
    kernel::scalar::mem_move(expected + from, expected + to, n);
    copy(bytes + to, bytes + from, n);
    ASSERT_EQ(std::memcmp(bytes, expected, static_cast<size_t>(size_)), 0)
        << "from " << from << " to " << to << " length " << n;
  }

 private:
  static uint8_t *base(std::vector<uint8_t> &v) {
    return v.data() + (-reinterpret_cast<uintptr_t>(v.data()) & 63);
  }
  int64_t size_;
  std::vector<uint8_t> bytes_, expected_;
  std::mt19937 rng_{2024};
};

class BlockCopyTest : public testing::TestWithParam<CopyPath> {};

TEST_P(BlockCopyTest, DisjointCopiesAtEveryAlignment) {
  const CopyPath &path = GetParam();
  Arena arena(64 + kMaxLength + 128 + kMaxLength + 64);
  constexpr int64_t from = 64, to = 64 + kMaxLength + 128;
  for (CopyFn copy : {path.up, path.down, path.stream}) {
    // Every length with every source alignment, the destination's varying.
    for (int64_t n = 0; n <= kMaxLength; ++n)
      for (int64_t a = 0; a < 64; ++a) arena.check(copy, from + a, to + (a * 37 + n) % 64, n);
    // Every pair of alignments at lengths around the register sizes.
    for (int64_t n : {7, 33, 64, 97, 130, 257})
      for (int64_t a = 0; a < 64; ++a)
        for (int64_t b = 0; b < 64; ++b) arena.check(copy, to + b, from + a, n);
  }
}

TEST_P(BlockCopyTest, OverlappingMovesInBothDirections) {
  const CopyPath &path = GetParam();
  Arena arena(64 + 3 * kMaxLength);
  constexpr int64_t middle = 64 + kMaxLength;
  for (int64_t n = 0; n <= kMaxLength; ++n) {
    for (int64_t distance = 1; distance <= 80; ++distance) {
      const int64_t at = middle + (n + distance) % 64;
      arena.check(path.up, at, at - distance, n);
      arena.check(path.down, at, at + distance, n);
    }
    for (int64_t distance : {127, 128, 200, 299}) {
      arena.check(path.up, middle + 3, middle + 3 - distance, n);
      arena.check(path.down, middle + 5, middle + 5 + distance, n);
    }
  }
}

TEST_P(BlockCopyTest, LargeBlocks) {
  const CopyPath &path = GetParam();
  constexpr int64_t n = (int64_t{3} << 20) + 13;
  Arena arena(2 * n + 8192);
  arena.check(path.up, 5, n + 4100, n);
  arena.check(path.down, 7, n + 4099, n);
  arena.check(path.stream, n + 4096 + 3, 17, n);
  arena.check(path.up, 4096 + 11, 9, n);
  arena.check(path.down, 11, 4096 + 33, n);
}

INSTANTIATE_TEST_SUITE_P(Kernel, BlockCopyTest, testing::ValuesIn(copy_paths()),
                         [](const auto &info) { return info.param.name; });

// The exported copy and fills on both sides of every size at which they
// switch routine (string instructions, non-temporal stores).
TEST(BlockCopy, ExportedFunctionsAroundEverySwitch) {
  for (int64_t size : {kernel::cpu::string_copy_min(), kernel::cpu::string_fill_min(),
                       kernel::cpu::stream_copy_min(), kernel::cpu::stream_fill_min()}) {
    if (size > (int64_t{1} << 30)) continue;
    for (int64_t n : {size - 1, size + 4099}) {
      std::vector<uint8_t> source(n + 8), bytes(n + 8, 0xee), want(n + 8, 0xee);
      for (size_t i = 0; i < source.size(); ++i)
        source[i] = static_cast<uint8_t>(i * 131 + i / 4096);
      skMemCpy(source.data() + 3, bytes.data() + 1, n);
      std::copy_n(source.data() + 3, n, want.data() + 1);
      ASSERT_TRUE(bytes == want) << "copy of " << n;
      skMemSet(bytes.data() + 5, 0x3c, n - 4);
      std::fill_n(want.data() + 5, n - 4, 0x3c);
      ASSERT_TRUE(bytes == want) << "fill of " << n - 4;
      std::vector<uint32_t> units(n / 4 + 2, 7), want_units(n / 4 + 2, 7);
      skMemTSet(units.data() + 1, 0xfeedf00d, n / 4);
      std::fill_n(want_units.data() + 1, n / 4, 0xfeedf00d);
      ASSERT_TRUE(units == want_units) << "fill of " << n / 4 << " units";
    }
  }
}

// The operating system reads the same processor descriptors (sysfs gives
// sizes as "48K"), skipping instruction caches.
TEST(Caches, DetectedSizesMatchTheOperatingSystem) {
  int64_t l1d = 0, l2 = 0, llc = 0;
  for (int index = 0; index < 8; ++index) {
    const std::string dir = "/sys/devices/system/cpu/cpu0/cache/index" + std::to_string(index);
    std::ifstream level_in(dir + "/level"), type_in(dir + "/type"), size_in(dir + "/size");
    int level = 0;
    int64_t size = 0;
    std::string type;
    char unit = 0;
    if (!(level_in >> level && type_in >> type && size_in >> size >> unit)) continue;
    if (type == "Instruction") continue;
    size <<= unit == 'K' ? 10 : unit == 'M' ? 20 : 0;
    if (level == 1) l1d = size;
    if (level == 2) l2 = size;
    if (level >= 2) llc = std::max(llc, size);
  }
  if (l1d == 0) GTEST_SKIP() << "no cache descriptions from the operating system";
  const auto &caches = kernel::cpu::caches();
  EXPECT_EQ(caches.l1d, l1d);
  EXPECT_EQ(caches.l2, l2);
  EXPECT_EQ(caches.llc, llc);
  EXPECT_EQ(caches.line & (caches.line - 1), 0) << caches.line;
}

}  // namespace
