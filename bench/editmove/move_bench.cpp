// NLSStringMoveS and NLSStringConcatS of 64 KiB of single-byte and UTF-8
// text against memcpy of the same bytes, through reference-host handles.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <cstring>
#include <string>
#include <vector>

namespace {

constexpr size_t kSize = 64 << 10;

using MoveS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                          int64_t *, uint32_t);
using ConcatS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, int64_t *, const uint8_t *,
                            int64_t, uint32_t, int64_t, ...);

const NLSSMHandle *handle(int encoding) {
  static auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  host->create_handle(encoding, &h);
  return h;
}

// 64 KiB of whole characters: Latin-1 letters, or UTF-8 mixing one-, two-
// and three-byte characters.
std::vector<uint8_t> text(int encoding) {
  const std::string unit = encoding == 20 ? "Gr\xC3\xBC\xC3\x9F"
                                            "e \xE6\x97\xA5\xE6\x9C\xAC "
                                          : "Gr\xFC\xDF"
                                            "e aus Z\xFCrich, ";
  std::string out;
  while (out.size() + unit.size() <= kSize) out += unit;
  out.resize(kSize, ' ');
  return {out.begin(), out.end()};
}

void BM_Memcpy(benchmark::State &state) {
  const std::vector<uint8_t> src = text(29);
  std::vector<uint8_t> dst(kSize);
  for (auto _ : state) {
    std::memcpy(dst.data(), src.data(), kSize);
    benchmark::DoNotOptimize(dst.data());
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * kSize));
}

// range(0): encoding; range(1): 1 when the room is one byte short (the
// whole-character cut walks the text).
void BM_MoveS(benchmark::State &state) {
  const NLSSMHandle *h = handle(static_cast<int>(state.range(0)));
  const std::vector<uint8_t> src = text(static_cast<int>(state.range(0)));
  std::vector<uint8_t> dst(kSize);
  const auto move = reinterpret_cast<MoveS>(h->NLSStringMoveS);
  const int64_t room = static_cast<int64_t>(kSize) - state.range(1);
  for (auto _ : state) {
    int64_t n = 0;
    benchmark::DoNotOptimize(move(h, src.data(), kSize, dst.data(), room, &n, 0));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * kSize));
}

// Two 32 KiB pieces with a separator into 64 KiB plus one byte.
void BM_ConcatS(benchmark::State &state) {
  const NLSSMHandle *h = handle(static_cast<int>(state.range(0)));
  const std::vector<uint8_t> src = text(static_cast<int>(state.range(0)));
  std::vector<uint8_t> dst(kSize + 1);
  const auto concat = reinterpret_cast<ConcatS>(h->NLSStringConcatS);
  const auto half = static_cast<int64_t>(kSize / 2);
  for (auto _ : state) {
    int64_t n = 0;
    benchmark::DoNotOptimize(concat(h, dst.data(), static_cast<int64_t>(kSize + 1), &n,
                                    reinterpret_cast<const uint8_t *>(","), 1, 0, int64_t{2},
                                    src.data(), half, src.data() + half, half));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * kSize));
}

BENCHMARK(BM_Memcpy);
BENCHMARK(BM_MoveS)->ArgNames({"enc", "short"})->Args({29, 0})->Args({20, 0})->Args({20, 1});
BENCHMARK(BM_ConcatS)->ArgName("enc")->Arg(29)->Arg(20);

}  // namespace

BENCHMARK_MAIN();
