// NLSStringCompareS on long equal texts (single-byte, UTF-8, UTF-16) against
// memcmp, and with case folding against ICU's u_strCaseCompare on the same
// text in UTF-16: once on identical texts, once with the second upper-cased.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <unicode/uchar.h>
#include <unicode/ustring.h>
#include <nlssm/reference_host.hpp>

#include <cstring>
#include <random>
#include <vector>

namespace {

using CompareS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                             int64_t, uint32_t);

const NLSSMHandle *handle(int encoding) {
  static auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  host->create_handle(encoding, &h);
  return h;
}

// Latin text with about one non-ASCII letter in twelve, `bytes` long in the
// given encoding (29 Latin-1, 20 UTF-8, 25 UTF-16LE).
std::vector<uint8_t> text(int encoding, size_t bytes, bool upper = false) {
  std::mt19937 rng(4711);
  std::vector<uint8_t> out;
  while (out.size() < bytes) {
    const unsigned r = rng() % 100;
    UChar32 c = r % 7 == 0 ? ' ' : r < 92 ? 'a' + rng() % 26 : 0xE0 + rng() % 30;
    if (c == 0xF7) c = 0xE9;
    if (upper) c = u_toupper(c);
    if (encoding == 29) {
      out.push_back(static_cast<uint8_t>(c));
    } else if (encoding == 20) {
      uint8_t buf[4];
      int32_t n = 0;
      U8_APPEND_UNSAFE(buf, n, c);
      out.insert(out.end(), buf, buf + n);
    } else {
      out.push_back(static_cast<uint8_t>(c));
      out.push_back(static_cast<uint8_t>(c >> 8));
    }
  }
  out.resize(bytes - (encoding == 25 ? bytes % 2 : 0));
  if (encoding == 20)
    while (!out.empty() && (out.back() & 0xC0) != 0x00 && (out.back() & 0x80)) out.pop_back();
  return out;
}

void BM_CompareS(benchmark::State &state) {
  const int encoding = static_cast<int>(state.range(0));
  const auto bytes = static_cast<size_t>(state.range(1));
  const auto options = static_cast<uint32_t>(state.range(2));
  const NLSSMHandle *h = handle(encoding);
  const auto a = text(encoding, bytes), b = a;
  const auto compare = reinterpret_cast<CompareS>(h->NLSStringCompareS);
  for (auto _ : state)
    benchmark::DoNotOptimize(compare(h, a.data(), static_cast<int64_t>(a.size()), b.data(),
                                     static_cast<int64_t>(b.size()), options));
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * a.size()));
}

void BM_memcmp(benchmark::State &state) {
  const auto a = text(29, static_cast<size_t>(state.range(0))), b = a;
  for (auto _ : state) benchmark::DoNotOptimize(std::memcmp(a.data(), b.data(), a.size()));
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * a.size()));
}

// UTF-16 with folding: range(1) 0 compares identical texts, 1 the text
// against its upper-cased copy.
void BM_CompareS_UTF16_fold(benchmark::State &state) {
  const NLSSMHandle *h = handle(25);
  const auto a = text(25, static_cast<size_t>(state.range(0)));
  const auto b = text(25, a.size(), state.range(1) != 0);
  const auto compare = reinterpret_cast<CompareS>(h->NLSStringCompareS);
  for (auto _ : state)
    benchmark::DoNotOptimize(compare(h, a.data(), static_cast<int64_t>(a.size()), b.data(),
                                     static_cast<int64_t>(b.size()), NLSSM_OPT_FOLD_LOWER));
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * a.size()));
}

void BM_u_strCaseCompare(benchmark::State &state) {
  const auto a = text(25, static_cast<size_t>(state.range(0)));
  const auto b = text(25, a.size(), state.range(1) != 0);
  const auto *ua = reinterpret_cast<const UChar *>(a.data());
  const auto *ub = reinterpret_cast<const UChar *>(b.data());
  const auto n = static_cast<int32_t>(a.size() / 2);
  for (auto _ : state) {
    UErrorCode err = U_ZERO_ERROR;
    benchmark::DoNotOptimize(u_strCaseCompare(ua, n, ub, n, U_FOLD_CASE_DEFAULT, &err));
  }
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * a.size()));
}

constexpr int64_t k64K = 64 << 10, k4M = 4 << 20;

BENCHMARK(BM_memcmp)->Arg(k64K)->Arg(k4M);
BENCHMARK(BM_CompareS)->ArgsProduct({{29, 20, 25}, {k64K, k4M}, {0}});
BENCHMARK(BM_CompareS_UTF16_fold)->ArgsProduct({{k64K, k4M}, {0, 1}});
BENCHMARK(BM_u_strCaseCompare)->ArgsProduct({{k64K, k4M}, {0, 1}});

}  // namespace

BENCHMARK_MAIN();
