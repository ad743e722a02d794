// The kernel's hot paths against the C library and a plain byte loop, on
// buffers that fit the first two cache levels (64 KiB), the last level
// (4 MiB), and ones that do not fit at all (64 MiB, 256 MiB: copies and
// fills; scans and case mapping at 64 MiB only).
#include <benchmark/benchmark.h>

#include <cstdlib>
#include <cstring>
#include <memory>

#include "nlssm/nlssm.h"

namespace {

struct Buffer {
  explicit Buffer(int64_t n, uint8_t fill)
      : bytes(static_cast<uint8_t *>(std::aligned_alloc(64, static_cast<size_t>(n))), &std::free) {
    std::memset(bytes.get(), fill, static_cast<size_t>(n));
  }
  std::unique_ptr<uint8_t, decltype(&std::free)> bytes;
};

// Scans the whole buffer: the byte sits in its last position.
template <bool Kernel>
void Scan(benchmark::State &state) {
  const int64_t n = state.range(0);
  Buffer b(n, 'x');
  b.bytes.get()[n - 1] = 'y';
  for (auto _ : state) {
    if constexpr (Kernel)
      benchmark::DoNotOptimize(skMemScan(b.bytes.get(), n, 'y'));
    else
      benchmark::DoNotOptimize(std::memchr(b.bytes.get(), 'y', static_cast<size_t>(n)));
  }
  state.SetBytesProcessed(state.iterations() * n);
}

void PlainUpper(uint8_t *p, int64_t n) {
  for (int64_t i = 0; i < n; ++i)
    if (p[i] >= 'a' && p[i] <= 'z') p[i] = static_cast<uint8_t>(p[i] - 32);
}

// Alternating upper and lower case, so every other byte changes; the buffer
// is lower-cased again outside the timing.
template <bool Kernel>
void Upper(benchmark::State &state) {
  const int64_t n = state.range(0);
  Buffer b(n, 0);
  for (int64_t i = 0; i < n; ++i) b.bytes.get()[i] = static_cast<uint8_t>("aBcD efG1"[i % 9]);
  for (auto _ : state) {
    if constexpr (Kernel)
      skStrUp(b.bytes.get(), n);
    else
      PlainUpper(b.bytes.get(), n);
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * n);
}

template <bool Kernel>
void Set(benchmark::State &state) {
  const int64_t n = state.range(0);
  Buffer b(n, 0);
  uint8_t value = 0;
  for (auto _ : state) {
    if constexpr (Kernel)
      skMemSet(b.bytes.get(), ++value, n);
    else
      std::memset(b.bytes.get(), ++value, static_cast<size_t>(n));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * n);
}

// Compares two equal buffers, so the whole length is read.
template <bool Kernel>
void Compare(benchmark::State &state) {
  const int64_t n = state.range(0);
  Buffer a(n, 'c'), b(n + 1, 'c');
  for (auto _ : state) {
    if constexpr (Kernel)
      benchmark::DoNotOptimize(skMemCmp(a.bytes.get(), b.bytes.get() + 1, n));
    else
      benchmark::DoNotOptimize(
          std::memcmp(a.bytes.get(), b.bytes.get() + 1, static_cast<size_t>(n)));
  }
  state.SetBytesProcessed(state.iterations() * n);
}

// Copies between two buffers.
template <bool Kernel>
void Copy(benchmark::State &state) {
  const int64_t n = state.range(0);
  Buffer from(n, 'a'), to(n, 'b');
  for (auto _ : state) {
    if constexpr (Kernel)
      skMemCpy(from.bytes.get(), to.bytes.get(), n);
    else
      std::memcpy(to.bytes.get(), from.bytes.get(), static_cast<size_t>(n));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * n);
}

// Moves within one buffer, 67 bytes up and back down in turn, as an insertion
// or a deletion in the middle of a text does.
template <bool Kernel>
void Move(benchmark::State &state) {
  const int64_t n = state.range(0);
  constexpr int64_t shift = 67;
  Buffer b(n + shift, 'm');
  uint8_t *low = b.bytes.get(), *high = low + shift;
  bool up = true;
  for (auto _ : state) {
    const uint8_t *from = up ? low : high;
    uint8_t *to = up ? high : low;
    if constexpr (Kernel)
      skMemSCpy(from, to, n);
    else
      std::memmove(to, from, static_cast<size_t>(n));
    up = !up;
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * n);
}

constexpr int64_t kSmall = 64 << 10, kLarge = 64 << 20;
constexpr int64_t kBlockSizes[] = {64 << 10, 4 << 20, 64 << 20, 256 << 20};

// Block operations at every size; the large ones run a fixed number of
// times so the run stays short.
template <typename Fn>
void block_pair(Fn kernel, Fn baseline, const char *kernel_name, const char *baseline_name) {
  for (int64_t n : kBlockSizes) {
    auto *k = benchmark::RegisterBenchmark(kernel_name, kernel)->Arg(n);
    auto *b = benchmark::RegisterBenchmark(baseline_name, baseline)->Arg(n);
    if (n > (4 << 20)) {
      k->Iterations(n > kLarge ? 4 : 16);
      b->Iterations(n > kLarge ? 4 : 16);
    }
  }
}

const bool kBlockBenchmarks = [] {
  block_pair(&Copy<true>, &Copy<false>, "skMemCpy", "memcpy");
  block_pair(&Move<true>, &Move<false>, "skMemSCpy_overlapping", "memmove");
  block_pair(&Set<true>, &Set<false>, "skMemSet", "memset");
  return true;
}();

#define NLSSM_BENCH_PAIR(name, kernel, baseline)                    \
  BENCHMARK(name<true>)->Name(kernel)->Arg(kSmall);                 \
  BENCHMARK(name<false>)->Name(baseline)->Arg(kSmall);              \
  BENCHMARK(name<true>)->Name(kernel)->Arg(kLarge)->Iterations(20); \
  BENCHMARK(name<false>)->Name(baseline)->Arg(kLarge)->Iterations(20)

NLSSM_BENCH_PAIR(Scan, "skMemScan", "memchr");
NLSSM_BENCH_PAIR(Upper, "skStrUp", "byte_loop_upper");
NLSSM_BENCH_PAIR(Compare, "skMemCmp", "memcmp");

}  // namespace

BENCHMARK_MAIN();
