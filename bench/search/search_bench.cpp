// Index against the C library's memmem and std::string_view::find on
// single-byte text, against ICU's u_strFindFirst on the same text in
// UTF-16 for UTF-8, and the LIKE matcher's cost on many wildcards.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <unicode/ucnv.h>
#include <unicode/ustring.h>

#include <cstring>
#include <nlssm/reference_host.hpp>
#include <random>
#include <string>
#include <string_view>
#include <vector>

namespace {

const NLSSMHandle *handle(int encoding) {
  static auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  return host->create_handle(encoding, &h) == 0 ? h : nullptr;
}

using IndexS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *, int64_t);

constexpr size_t kText = 64 * 1024;

// 64 KiB of letters with the pattern only at the very end.
struct Latin {
  std::string text, pattern = "qzxjvkwq";
  Latin() {
    std::mt19937 rng(7);
    text.resize(kText - pattern.size());
    for (char &c : text) c = static_cast<char>('a' + rng() % 26);
    text += pattern;
  }
};
const Latin &latin() {
  static const Latin l;
  return l;
}

void BM_IndexS_SBCS(benchmark::State &state) {
  const NLSSMHandle *h = handle(29);
  const auto &l = latin();
  const auto *t = reinterpret_cast<const uint8_t *>(l.text.data());
  const auto *p = reinterpret_cast<const uint8_t *>(l.pattern.data());
  for (auto _ : state)
    benchmark::DoNotOptimize(reinterpret_cast<IndexS>(h->NLSStringIndexS)(
        h, t, int64_t(l.text.size()), p, int64_t(l.pattern.size())));
  state.SetBytesProcessed(int64_t(state.iterations()) * int64_t(l.text.size()));
}
BENCHMARK(BM_IndexS_SBCS);

void BM_memmem(benchmark::State &state) {
  const auto &l = latin();
  for (auto _ : state)
    benchmark::DoNotOptimize(
        memmem(l.text.data(), l.text.size(), l.pattern.data(), l.pattern.size()));
  state.SetBytesProcessed(int64_t(state.iterations()) * int64_t(l.text.size()));
}
BENCHMARK(BM_memmem);

void BM_string_view_find(benchmark::State &state) {
  const auto &l = latin();
  const std::string_view text(l.text);
  for (auto _ : state) benchmark::DoNotOptimize(text.find(l.pattern));
  state.SetBytesProcessed(int64_t(state.iterations()) * int64_t(l.text.size()));
}
BENCHMARK(BM_string_view_find);

// Mixed Japanese and ASCII, in UTF-8 and in UTF-16, the pattern at the end.
struct Mixed {
  std::string utf8, pattern8;
  std::u16string utf16, pattern16;
  Mixed() {
    std::mt19937 rng(9);
    const char16_t pool[] = u"abcdefgh 日本語の文字列検索テスト";
    while (utf16.size() < kText / 2) utf16.push_back(pool[rng() % (std::size(pool) - 1)]);
    pattern16 = u"検索テストxyz";
    utf16 += pattern16;
    auto to8 = [](const std::u16string &s) {
      std::string out(s.size() * 3, '\0');
      int32_t n = 0;
      UErrorCode e = U_ZERO_ERROR;
      u_strToUTF8(out.data(), int32_t(out.size()), &n, s.data(), int32_t(s.size()), &e);
      out.resize(size_t(n));
      return out;
    };
    utf8 = to8(utf16);
    pattern8 = to8(pattern16);
  }
};
const Mixed &mixed() {
  static const Mixed m;
  return m;
}

void BM_IndexS_UTF8(benchmark::State &state) {
  const NLSSMHandle *h = handle(20);
  const auto &m = mixed();
  const auto *t = reinterpret_cast<const uint8_t *>(m.utf8.data());
  const auto *p = reinterpret_cast<const uint8_t *>(m.pattern8.data());
  for (auto _ : state)
    benchmark::DoNotOptimize(reinterpret_cast<IndexS>(h->NLSStringIndexS)(
        h, t, int64_t(m.utf8.size()), p, int64_t(m.pattern8.size())));
  state.SetBytesProcessed(int64_t(state.iterations()) * int64_t(m.utf8.size()));
}
BENCHMARK(BM_IndexS_UTF8);

void BM_icu_u_strFindFirst(benchmark::State &state) {
  const auto &m = mixed();
  for (auto _ : state)
    benchmark::DoNotOptimize(u_strFindFirst(m.utf16.data(), int32_t(m.utf16.size()),
                                            m.pattern16.data(), int32_t(m.pattern16.size())));
  // Same characters: report the UTF-8 bytes so the rates compare.
  state.SetBytesProcessed(int64_t(state.iterations()) * int64_t(m.utf8.size()));
}
BENCHMARK(BM_icu_u_strFindFirst);

// %a%a%a%a%b against a run of 'a': cost grows linearly with the text.
void BM_Like_Wildcards(benchmark::State &state) {
  const NLSSMHandle *h = handle(29);
  std::vector<uint8_t> text(size_t(state.range(0)), 'a');
  std::string pattern = "%a%a%a%a%b";
  NLSString t{}, p{};
  t.buffer = text.data();
  t.length = t.capacity = text.size();
  p.buffer = reinterpret_cast<uint8_t *>(pattern.data());
  p.length = p.capacity = pattern.size();
  using Like = int64_t (*)(const NLSSMHandle *, const NLSString *, const NLSString *, int64_t);
  for (auto _ : state)
    benchmark::DoNotOptimize(reinterpret_cast<Like>(h->NLSStringLike)(h, &t, &p, 0));
  state.SetComplexityN(state.range(0));
  state.SetBytesProcessed(int64_t(state.iterations()) * state.range(0));
}
BENCHMARK(BM_Like_Wildcards)->RangeMultiplier(2)->Range(8 << 10, 64 << 10)->Complexity();

}  // namespace

BENCHMARK_MAIN();
