// Reverse, delete and substring on 64 KiB of text in Latin-1, UTF-8,
// Shift-JIS and IBM-930 (modal), through the handles of the reference host.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <cstring>
#include <random>
#include <vector>

namespace {

using Bytes = std::vector<uint8_t>;
using ReverseS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t);
using DeleteS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t);
using SubStr = int64_t (*)(const NLSSMHandle *, const NLSString *, NLSString *, int64_t, int64_t *,
                           int64_t);
constexpr size_t kSize = 64 << 10;

const NLSSMHandle *handle(int encoding) {
  static auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  host->create_handle(encoding, &h);
  return h;
}

// Host characters (UTF-32LE) converted through the handle.
Bytes text_for(const NLSSMHandle *h) {
  std::mt19937 rng(7);
  const char32_t mix[] = {U'a', U'b', U'e', U'x', U'0', U'.', U'\u00E9', U'\u3042', U'\u6F22'};
  Bytes units;
  while (units.size() / 4 < kSize / 2) {
    const char32_t c = mix[rng() % 9];
    for (int k = 0; k < 4; ++k) units.push_back(static_cast<uint8_t>(c >> (8 * k)));
  }
  Bytes out(units.size() * 2);
  uint64_t produced = 0;
  auto convert = reinterpret_cast<NLSHostConverterConvertFn>(
      NLSSM_HOST_SLOT(h->toConverter, NLSHOST_SLOT_CONVERTER_CONVERT));
  convert(h->toConverter, units.data(), units.size(), out.data(), out.size(), &produced, nullptr);
  out.resize(produced);
  return out;
}

void BM_ReverseS(benchmark::State &state) {
  const NLSSMHandle *h = handle(static_cast<int>(state.range(0)));
  Bytes text = text_for(h);
  for (auto _ : state) {
    reinterpret_cast<ReverseS>(h->NLSStringReverseS)(h, text.data(),
                                                     static_cast<int64_t>(text.size()));
    benchmark::DoNotOptimize(text.data());
  }
  state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
}

// Deletes from a fresh copy each pass; the list is one character of the
// text, three, or (0) one byte the text does not hold.
void BM_DeleteS(benchmark::State &state) {
  const NLSSMHandle *h = handle(static_cast<int>(state.range(0)));
  const Bytes text = text_for(h);
  const Bytes list = state.range(1) == 0   ? Bytes{'~'}
                     : state.range(1) == 1 ? Bytes{text[1]}
                                           : Bytes{text[0], text[1], text[2]};
  Bytes work(text.size());
  for (auto _ : state) {
    std::memcpy(work.data(), text.data(), text.size());
    benchmark::DoNotOptimize(reinterpret_cast<DeleteS>(h->NLSStringDeleteS)(
        h, work.data(), static_cast<int64_t>(work.size()), list.data(),
        static_cast<int64_t>(list.size())));
  }
  state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
}

// Half the characters, from the first, into a destination as large as the text.
void BM_SubStr(benchmark::State &state) {
  const NLSSMHandle *h = handle(static_cast<int>(state.range(0)));
  Bytes text = text_for(h), out(text.size());
  NLSString src{text.data(), text.size(), text.size(), 0, 0, -9, -1, 0, 0, 0};
  reinterpret_cast<int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t)>(
      h->stringSetPos)(h, &src, 0, 0);
  for (auto _ : state) {
    NLSString dst{out.data(), 0, out.size(), 0, -9, -9, -1, 0, 0, 0};
    int64_t copied = 0;
    benchmark::DoNotOptimize(reinterpret_cast<SubStr>(h->NLSStringSubStr)(
        h, &src, &dst, static_cast<int64_t>(kSize / 4), &copied, 0));
  }
  state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()) / 2);
}

// Latin-1 (29), UTF-8 (20), Shift_JIS (135), IBM-930 modal (130).
BENCHMARK(BM_ReverseS)->Arg(29)->Arg(20)->Arg(135)->Arg(130);
BENCHMARK(BM_DeleteS)
    ->Args({29, 0})
    ->Args({29, 1})
    ->Args({29, 3})
    ->Args({20, 1})
    ->Args({135, 3})
    ->Args({130, 3});
BENCHMARK(BM_SubStr)->Arg(29)->Arg(20)->Arg(135)->Arg(130);

}  // namespace

BENCHMARK_MAIN();
