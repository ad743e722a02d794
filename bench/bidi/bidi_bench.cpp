// Reordering 64 KiB of mixed Hebrew, Arabic, Latin and digit text for
// display: the module's UTF-16 and UTF-8 members on reference-host handles,
// and ICU's ubidi_setPara + ubidi_writeReordered on the same UTF-16 text.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <unicode/ubidi.h>
#include <unicode/utf8.h>
#include <nlssm/reference_host.hpp>

#include <random>
#include <string>
#include <vector>

namespace {

constexpr size_t kBytes = 64 * 1024;

// Words of Hebrew, Arabic or Latin letters, numbers, blanks, punctuation
// and brackets, as running text mixes them.
std::u16string make_text(size_t units) {
  std::mt19937 rng(9);
  std::u16string text;
  while (text.size() < units) {
    const unsigned kind = rng() % 10;
    const size_t length = 2 + rng() % 7;
    for (size_t k = 0; k < length; ++k) {
      if (kind < 3)
        text += char16_t(0x05D0 + rng() % 27);
      else if (kind < 5)
        text += char16_t(0x0627 + rng() % 20);
      else if (kind < 8)
        text += char16_t('a' + rng() % 26);
      else
        text += char16_t('0' + rng() % 10);
    }
    const unsigned p = rng() % 12;
    text += p == 0 ? u", " : p == 1 ? u". " : p == 2 ? u" (" : p == 3 ? u") " : u" ";
  }
  text.resize(units);
  return text;
}

const NLSSMHandle *handle(int encoding) {
  static auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  host->create_handle(encoding, &h);
  return h;
}

// Host-order (little-endian) UTF-16 bytes, and UTF-8 of the same characters
// cut to 64 KiB.
struct Corpus {
  std::u16string utf16 = make_text(kBytes / 2);
  std::string utf8;
  Corpus() {
    for (char16_t u : utf16) {
      char buf[4];
      int32_t n = 0;
      U8_APPEND_UNSAFE(buf, n, u);
      if (utf8.size() + static_cast<size_t>(n) > kBytes) break;
      utf8.append(buf, static_cast<size_t>(n));
    }
  }
};
const Corpus &corpus() {
  static const Corpus c;
  return c;
}

void run_member(benchmark::State &state, int encoding, const uint8_t *text, int64_t bytes) {
  const NLSSMHandle *h = handle(encoding);
  const auto fn =
      reinterpret_cast<int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *,
                                   int64_t, int64_t *, uint8_t *)>(h->NLSVisualOrderFormat);
  std::vector<uint8_t> out(static_cast<size_t>(bytes) * 2);
  for (auto _ : state) {
    int64_t written = 0;
    uint8_t direction = 2;
    const int64_t status =
        fn(h, text, bytes, out.data(), static_cast<int64_t>(out.size()), &written, &direction);
    if (status != 0) state.SkipWithError("reordering failed");
    benchmark::DoNotOptimize(out.data());
  }
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) * bytes);
}

void BM_ModuleUtf16(benchmark::State &state) {
  const std::u16string &text = corpus().utf16;
  run_member(state, 25, reinterpret_cast<const uint8_t *>(text.data()),
             static_cast<int64_t>(text.size() * 2));
}
void BM_ModuleUtf8(benchmark::State &state) {
  const std::string &text = corpus().utf8;
  run_member(state, 20, reinterpret_cast<const uint8_t *>(text.data()),
             static_cast<int64_t>(text.size()));
}

void BM_IcuUtf16(benchmark::State &state) {
  const std::u16string &text = corpus().utf16;
  std::u16string out(text.size() * 2, u'\0');
  UBiDi *bidi = ubidi_open();
  for (auto _ : state) {
    UErrorCode error = U_ZERO_ERROR;
    ubidi_setPara(bidi, text.data(), static_cast<int32_t>(text.size()), UBIDI_DEFAULT_LTR, nullptr,
                  &error);
    ubidi_writeReordered(bidi, out.data(), static_cast<int32_t>(out.size()), UBIDI_DO_MIRRORING,
                         &error);
    if (U_FAILURE(error)) state.SkipWithError(u_errorName(error));
    benchmark::DoNotOptimize(out.data());
  }
  ubidi_close(bidi);
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * text.size() * 2));
}

BENCHMARK(BM_ModuleUtf16);
BENCHMARK(BM_ModuleUtf8);
BENCHMARK(BM_IcuUtf16);

}  // namespace

BENCHMARK_MAIN();
