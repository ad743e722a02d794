// UTF-8 toolkit: validation of 64 KiB of ASCII, European, CJK and
// emoji-mixed text by each instruction-set variant and the exported member,
// against ICU (U8_NEXT over the text, and a u_strFromUTF8 pass); counting
// characters and full case folding of the same texts.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <unicode/ustring.h>
#include <unicode/utf8.h>

#include <random>
#include <string>
#include <vector>

#include "kernel/u8/utf8.hpp"

namespace {

constexpr size_t kBytes = 64 << 10;

enum Kind { kAscii, kEuropean, kCjk, kEmoji };
const char *const kKindNames[] = {"ascii", "european", "cjk", "emoji"};

void append(std::string &s, UChar32 c) {
  char out[4];
  int32_t n = 0;
  U8_APPEND_UNSAFE(out, n, c);
  s.append(out, static_cast<size_t>(n));
}

// Words of letters and spaces: European words take accented Latin letters
// now and then, CJK text is mostly ideographs and kana with some ASCII,
// emoji-mixed text is ASCII words with emoji and a few accented letters.
// Cut to kBytes at a character boundary.
std::string make_text(Kind kind) {
  std::mt19937 rng(11 + kind);
  std::string s;
  while (s.size() < kBytes + 8) {
    const unsigned r = rng() % 100;
    UChar32 c = r < 15 ? ' ' : static_cast<UChar32>('a' + rng() % 26);
    switch (kind) {
      case kAscii:
        break;
      case kEuropean:
        if (r >= 90) c = static_cast<UChar32>(0xC0 + rng() % 0x40);
        if (c == 0xD7 || c == 0xF7) c = 'e';
        break;
      case kCjk:
        if (r >= 20)
          c = r < 35 ? static_cast<UChar32>(0x3041 + rng() % 0x56)
                     : static_cast<UChar32>(0x4E00 + rng() % 0x5000);
        break;
      case kEmoji:
        if (r >= 85) c = static_cast<UChar32>(0x1F600 + rng() % 0x50);
        if (r >= 80 && r < 85) c = static_cast<UChar32>(0xE0 + rng() % 0x1F);
        break;
    }
    append(s, c);
  }
  size_t end = kBytes;
  while ((static_cast<uint8_t>(s[end]) & 0xC0) == 0x80) --end;
  s.resize(end);
  return s;
}

const std::string &text(Kind kind) {
  static const std::string texts[] = {make_text(kAscii), make_text(kEuropean), make_text(kCjk),
                                      make_text(kEmoji)};
  return texts[kind];
}
const uint8_t *bytes(const std::string &s) {
  return reinterpret_cast<const uint8_t *>(s.data());
}

void finish(benchmark::State &state, const std::string &s) {
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * s.size()));
  state.SetLabel(kKindNames[state.range(0)]);
}

void BM_ValidateVariant(benchmark::State &state, kernel::cpu::Isa isa) {
  const std::string &s = text(static_cast<Kind>(state.range(0)));
  const kernel::u8::ValidateOps *ops = nullptr;
  for (const auto &v : kernel::u8::validate_ops.variants())
    if (v.isa == isa) ops = v.table;
  if (!kernel::cpu::supports(isa)) {
    state.SkipWithError("instruction set not supported here");
    return;
  }
  for (auto _ : state)
    benchmark::DoNotOptimize(ops->valid_prefix(bytes(s), static_cast<int64_t>(s.size())));
  finish(state, s);
}

void BM_Validate(benchmark::State &state) {
  const std::string &s = text(static_cast<Kind>(state.range(0)));
  for (auto _ : state)
    benchmark::DoNotOptimize(qvzsu8Validate(bytes(s), static_cast<int64_t>(s.size())));
  finish(state, s);
}

// ICU's validation by iteration: the offset of the first ill-formed
// character, as qvzsu8Validate gives it.
void BM_IcuU8Next(benchmark::State &state) {
  const std::string &s = text(static_cast<Kind>(state.range(0)));
  const int32_t n = static_cast<int32_t>(s.size());
  for (auto _ : state) {
    int32_t i = 0, bad = n;
    while (i < n) {
      const int32_t at = i;
      UChar32 c;
      U8_NEXT(bytes(s), i, n, c);
      if (c < 0) {
        bad = at;
        break;
      }
    }
    benchmark::DoNotOptimize(bad);
  }
  finish(state, s);
}

// ICU's validating conversion to UTF-16.
void BM_IcuStrFromUtf8(benchmark::State &state) {
  const std::string &s = text(static_cast<Kind>(state.range(0)));
  std::vector<UChar> out(s.size() + 16);
  for (auto _ : state) {
    UErrorCode ec = U_ZERO_ERROR;
    int32_t length = 0;
    u_strFromUTF8(out.data(), static_cast<int32_t>(out.size()), &length, s.data(),
                  static_cast<int32_t>(s.size()), &ec);
    benchmark::DoNotOptimize(length);
  }
  finish(state, s);
}

void BM_Length(benchmark::State &state) {
  const std::string &s = text(static_cast<Kind>(state.range(0)));
  for (auto _ : state)
    benchmark::DoNotOptimize(qvzsu8Length(bytes(s), static_cast<int64_t>(s.size())));
  finish(state, s);
}

void BM_FoldFull(benchmark::State &state) {
  const std::string &s = text(static_cast<Kind>(state.range(0)));
  std::vector<uint8_t> out(s.size() * 3);
  for (auto _ : state) {
    int64_t written = 0;
    qvzsu8Fold(out.data(), static_cast<int64_t>(out.size()), bytes(s),
               static_cast<int64_t>(s.size()), QVZSU8_FULL, &written, nullptr);
    benchmark::DoNotOptimize(written);
  }
  finish(state, s);
}

BENCHMARK_CAPTURE(BM_ValidateVariant, avx2, kernel::cpu::Isa::avx2)->DenseRange(0, 3);
BENCHMARK_CAPTURE(BM_ValidateVariant, scalar, kernel::cpu::Isa::sse2)->DenseRange(0, 3);
BENCHMARK(BM_Validate)->DenseRange(0, 3);
BENCHMARK(BM_IcuU8Next)->DenseRange(0, 3);
BENCHMARK(BM_IcuStrFromUtf8)->DenseRange(0, 3);
BENCHMARK(BM_Length)->DenseRange(0, 3);
BENCHMARK(BM_FoldFull)->DenseRange(0, 3);

}  // namespace

BENCHMARK_MAIN();
