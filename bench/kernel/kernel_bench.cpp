// The kernel's hot paths against the C library and a plain byte loop, on a
// buffer that fits the caches (64 KiB) and one that does not (64 MiB).
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

constexpr int64_t kSmall = 64 << 10, kLarge = 64 << 20;

#define NLSSM_BENCH_PAIR(name, kernel, baseline)                    \
  BENCHMARK(name<true>)->Name(kernel)->Arg(kSmall);                 \
  BENCHMARK(name<false>)->Name(baseline)->Arg(kSmall);              \
  BENCHMARK(name<true>)->Name(kernel)->Arg(kLarge)->Iterations(20); \
  BENCHMARK(name<false>)->Name(baseline)->Arg(kLarge)->Iterations(20)

NLSSM_BENCH_PAIR(Scan, "skMemScan", "memchr");
NLSSM_BENCH_PAIR(Upper, "skStrUp", "byte_loop_upper");
NLSSM_BENCH_PAIR(Set, "skMemSet", "memset");

}  // namespace

BENCHMARK_MAIN();
