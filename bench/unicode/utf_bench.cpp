// UTF-8 -> UTF-32 with the module's driver and with ICU, on the same text,
// and the UTF-8 length of a UTF-32 array on each instruction-set path.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <unicode/ucnv.h>
#include <unicode/ustring.h>
#include <unicode/utf8.h>

#include <cstring>
#include <random>
#include <string>
#include <vector>

#include "unicode/codec.hpp"

namespace {

// Kinds of text: 0 ASCII, 1 European (about 1 in 12 characters non-ASCII),
// 2 mixed scripts (Cyrillic, CJK, an emoji now and then, ASCII spaces),
// 3 CJK (with a little ASCII punctuation), 4 emoji-mixed (ASCII words,
// emoji, Cyrillic and CJK).
std::vector<uint32_t> make_text(int kind, size_t chars) {
  std::mt19937 rng(12345);
  std::vector<uint32_t> text;
  text.reserve(chars);
  auto ascii = [&] { return rng() % 7 == 0 ? uint32_t{' '} : uint32_t('a' + rng() % 26); };
  while (text.size() < chars) {
    const unsigned r = rng() % 100;
    uint32_t c;
    if (kind == 3) {
      c = r < 5 ? uint32_t{','} : 0x4E00 + rng() % 0x5000;
    } else if (kind == 4) {
      c = r < 40   ? ascii()
          : r < 70 ? 0x1F300 + rng() % 0x300
          : r < 85 ? 0x410 + rng() % 64
                   : 0x4E00 + rng() % 0x5000;
    } else if (kind == 0 || (kind == 1 && r < 92) || (kind == 2 && r < 25)) {
      c = ascii();
    } else if (kind == 1 || r < 50) {
      c = kind == 1 ? 0xC0 + rng() % 64 : 0x410 + rng() % 64;
    } else if (r < 97) {
      c = 0x4E00 + rng() % 0x5000;
    } else {
      c = 0x1F600 + rng() % 64;
    }
    text.push_back(c);
  }
  return text;
}

std::string to_utf8(const std::vector<uint32_t> &text) {
  std::string out;
  for (uint32_t c : text) {
    char buf[4];
    int32_t n = 0;
    U8_APPEND_UNSAFE(buf, n, c);
    out.append(buf, n);
  }
  return out;
}

// 64 KiB of UTF-8, cut at a character boundary.
constexpr size_t kBytes = 64 << 10;

std::vector<uint32_t> make_corpus_text(int kind) {
  std::vector<uint32_t> text = make_text(kind, kBytes);
  size_t bytes = 0, chars = 0;
  while (chars < text.size()) {
    const size_t next = bytes + U8_LENGTH(text[chars]);
    if (next > kBytes) break;
    bytes = next;
    ++chars;
  }
  text.resize(chars);
  return text;
}

struct Corpus {
  std::vector<uint32_t> utf32;
  std::string utf8;
  explicit Corpus(int kind) : utf32(make_corpus_text(kind)), utf8(to_utf8(utf32)) {}
};

const Corpus &corpus(int kind) {
  static const Corpus corpora[5] = {Corpus(0), Corpus(1), Corpus(2), Corpus(3), Corpus(4)};
  return corpora[kind];
}

// The kind of text is argument `arg`; `suffix` follows its name.
void label(benchmark::State &state, const Corpus &c, int arg = 0, const std::string &suffix = {}) {
  static const char *names[] = {"ascii", "european", "mixed", "cjk", "emoji-mixed"};
  state.SetLabel(names[state.range(arg)] + suffix);
  state.SetBytesProcessed(state.iterations() * c.utf8.size());
  state.counters["chars/s"] =
      benchmark::Counter(double(state.iterations()) * c.utf32.size(), benchmark::Counter::kIsRate);
}

void BM_ConvertToUTF32(benchmark::State &state) {
  const Corpus &c = corpus(state.range(0));
  std::vector<uint32_t> out(c.utf32.size());
  for (auto _ : state) {
    int64_t written = 0;
    ConvertToUTF32(c.utf8.data(), c.utf8.size(), out.data(), out.size() * 4, &written, UTF8_UTF32,
                   COPY_UTF32_SWAP);
    benchmark::DoNotOptimize(written);
  }
  if (out != c.utf32) state.SkipWithError("wrong result");
  label(state, c);
}

// The driver with the block step of one instruction set (SSE2: none).
struct StepDecoder : nlssm::unicode::PolicyDecoder<nlssm::unicode::Utf8Decoder> {
  nlssm::unicode::Utf8BlockStep step;
  nlssm::unicode::Utf8BlockStep block_step() const { return step; }
};

void BM_ConvertToUTF32_isa(benchmark::State &state) {
  namespace u = nlssm::unicode;
  const auto isa = kernel::cpu::kAllIsas[state.range(0)];
  if (!kernel::cpu::supports(isa)) {
    state.SkipWithError("not on this processor");
    return;
  }
  const Corpus &c = corpus(state.range(1));
  std::vector<uint32_t> out(c.utf32.size());
  const StepDecoder decode{{}, u::utf8_block_step(isa)};
  for (auto _ : state) {
    int64_t written = 0;
    u::convert_to_utf32(reinterpret_cast<const uint8_t *>(c.utf8.data()), int64_t(c.utf8.size()),
                        reinterpret_cast<uint8_t *>(out.data()), int64_t(out.size() * 4), &written,
                        decode, u::PolicyEncoder<u::Utf32Encoder<u::Order::little>>{});
    benchmark::DoNotOptimize(written);
  }
  if (out != c.utf32) state.SkipWithError("wrong result");
  label(state, c, 1, std::string(" ") + kernel::cpu::name(isa));
}

// The same decoder behind a pointer the driver does not recognise.
int64_t utf8_via_pointer(const uint8_t *s, int64_t n, uint32_t *cp, int64_t *consumed) {
  return UTF8_UTF32(s, n, cp, consumed);
}

void BM_ConvertToUTF32_generic(benchmark::State &state) {
  const Corpus &c = corpus(state.range(0));
  std::vector<uint32_t> out(c.utf32.size());
  for (auto _ : state) {
    int64_t written = 0;
    ConvertToUTF32(c.utf8.data(), c.utf8.size(), out.data(), out.size() * 4, &written,
                   utf8_via_pointer, COPY_UTF32_SWAP);
    benchmark::DoNotOptimize(written);
  }
  if (out != c.utf32) state.SkipWithError("wrong result");
  label(state, c);
}

void BM_ICU_ucnv_convertEx(benchmark::State &state) {
  const Corpus &c = corpus(state.range(0));
  UErrorCode err = U_ZERO_ERROR;
  UConverter *from = ucnv_open("UTF-8", &err);
  UConverter *to = ucnv_open("UTF-32LE", &err);
  std::vector<uint32_t> out(c.utf32.size());
  std::vector<UChar> pivot(1024);
  for (auto _ : state) {
    char *target = reinterpret_cast<char *>(out.data());
    const char *source = c.utf8.data();
    UChar *pivot_source = pivot.data(), *pivot_target = pivot.data();
    ucnv_convertEx(to, from, &target, target + out.size() * 4, &source, source + c.utf8.size(),
                   pivot.data(), &pivot_source, &pivot_target, pivot.data() + pivot.size(), true,
                   true, &err);
    benchmark::DoNotOptimize(target);
  }
  if (U_FAILURE(err) || out != c.utf32) state.SkipWithError("ICU conversion failed");
  ucnv_close(from);
  ucnv_close(to);
  label(state, c);
}

void BM_ICU_u_strFromUTF8_ToUTF32(benchmark::State &state) {
  const Corpus &c = corpus(state.range(0));
  UErrorCode err = U_ZERO_ERROR;
  std::vector<UChar> utf16(c.utf32.size() * 2);
  std::vector<uint32_t> out(c.utf32.size());
  for (auto _ : state) {
    int32_t units = 0, chars = 0;
    u_strFromUTF8(utf16.data(), utf16.size(), &units, c.utf8.data(), c.utf8.size(), &err);
    u_strToUTF32(reinterpret_cast<UChar32 *>(out.data()), out.size(), &chars, utf16.data(), units,
                 &err);
    benchmark::DoNotOptimize(chars);
  }
  if (U_FAILURE(err) || out != c.utf32) state.SkipWithError("ICU conversion failed");
  label(state, c);
}

// UTF-32 -> UTF-8 (form 0) or UTF-16 little-endian (form 1).
std::vector<uint8_t> expected_from_utf32(const Corpus &c, int form) {
  if (form == 0) return std::vector<uint8_t>(c.utf8.begin(), c.utf8.end());
  std::vector<UChar> utf16(c.utf32.size() * 2);
  int32_t units = 0;
  UErrorCode err = U_ZERO_ERROR;
  u_strFromUTF32(utf16.data(), utf16.size(), &units,
                 reinterpret_cast<const UChar32 *>(c.utf32.data()), c.utf32.size(), &err);
  const auto *bytes = reinterpret_cast<const uint8_t *>(utf16.data());
  return std::vector<uint8_t>(bytes, bytes + 2 * units);
}

const char *form_name(int form) {
  return form == 0 ? " to utf8" : " to utf16";
}

template <typename Policy>
struct StepEncoder : nlssm::unicode::PolicyEncoder<Policy> {
  nlssm::unicode::Utf32BlockStep step;
  nlssm::unicode::Utf32BlockStep block_step() const { return step; }
};

template <typename Policy>
int64_t from_utf32_step(nlssm::unicode::Utf32BlockStep step, const Corpus &c, uint8_t *out,
                        int64_t capacity) {
  namespace u = nlssm::unicode;
  int64_t written = 0;
  u::convert_from_utf32(reinterpret_cast<const uint8_t *>(c.utf32.data()),
                        int64_t(c.utf32.size() * 4), out, capacity, &written,
                        StepEncoder<Policy>{{}, step},
                        u::PolicyDecoder<u::Utf32Decoder<u::Order::little>>{});
  return written;
}

// Arguments: instruction set, form, kind of text.
void BM_ConvertFromUTF32_isa(benchmark::State &state) {
  namespace u = nlssm::unicode;
  const auto isa = kernel::cpu::kAllIsas[state.range(0)];
  if (!kernel::cpu::supports(isa)) {
    state.SkipWithError("not on this processor");
    return;
  }
  const int form = static_cast<int>(state.range(1));
  const Corpus &c = corpus(state.range(2));
  std::vector<uint8_t> out(c.utf32.size() * 4);
  const auto step = u::utf32_block_step(isa);
  int64_t written = 0;
  for (auto _ : state) {
    written = form == 0 ? from_utf32_step<u::Utf8Encoder>(step, c, out.data(), out.size())
                        : from_utf32_step<u::Utf16Encoder<u::Order::little>>(step, c, out.data(),
                                                                             out.size());
    benchmark::DoNotOptimize(written);
  }
  out.resize(written);
  if (out != expected_from_utf32(c, form)) state.SkipWithError("wrong result");
  label(state, c, 2, std::string(form_name(form)) + " " + kernel::cpu::name(isa));
}

// ICU: u_strFromUTF32, then u_strToUTF8 for UTF-8. Arguments: form, kind.
void BM_ICU_FromUTF32(benchmark::State &state) {
  const int form = static_cast<int>(state.range(0));
  const Corpus &c = corpus(state.range(1));
  std::vector<UChar> utf16(c.utf32.size() * 2);
  std::vector<uint8_t> out(c.utf32.size() * 4);
  UErrorCode err = U_ZERO_ERROR;
  int32_t written = 0;
  for (auto _ : state) {
    int32_t units = 0;
    u_strFromUTF32(utf16.data(), utf16.size(), &units,
                   reinterpret_cast<const UChar32 *>(c.utf32.data()), c.utf32.size(), &err);
    if (form == 0)
      u_strToUTF8(reinterpret_cast<char *>(out.data()), out.size(), &written, utf16.data(), units,
                  &err);
    else
      written = 2 * units;
    benchmark::DoNotOptimize(written);
  }
  if (form == 1) std::memcpy(out.data(), utf16.data(), written);
  out.resize(written);
  if (U_FAILURE(err) || out != expected_from_utf32(c, form))
    state.SkipWithError("ICU conversion failed");
  label(state, c, 1, form_name(form));
}

template <int64_t (*Fn)(const uint32_t *, int64_t)>
void BM_Utf8Length(benchmark::State &state) {
  const Corpus &c = corpus(state.range(0));
  if (Fn == &nlssm::unicode::utf8_length_avx2 && !nlssm::unicode::avx2_usable()) {
    state.SkipWithError("no AVX2");
    return;
  }
  for (auto _ : state) benchmark::DoNotOptimize(Fn(c.utf32.data(), c.utf32.size()));
  if (Fn(c.utf32.data(), c.utf32.size()) != int64_t(c.utf8.size()))
    state.SkipWithError("wrong length");
  label(state, c);
}

int64_t icu_u8_length(const uint32_t *chars, int64_t count) {
  int64_t total = 0;
  for (int64_t i = 0; i < count; ++i) total += U8_LENGTH(chars[i]);
  return total;
}

}  // namespace

BENCHMARK(BM_ConvertToUTF32)->DenseRange(0, 4);
BENCHMARK(BM_ConvertToUTF32_generic)->DenseRange(0, 4);
BENCHMARK(BM_ConvertToUTF32_isa)->ArgsProduct({{0, 1, 3}, {0, 1, 2, 3, 4}});
BENCHMARK(BM_ICU_ucnv_convertEx)->DenseRange(0, 4);
BENCHMARK(BM_ICU_u_strFromUTF8_ToUTF32)->DenseRange(0, 4);
BENCHMARK(BM_ConvertFromUTF32_isa)->ArgsProduct({{0, 1, 3}, {0, 1}, {0, 1, 2, 3, 4}});
BENCHMARK(BM_ICU_FromUTF32)->ArgsProduct({{0, 1}, {0, 1, 2, 3, 4}});
BENCHMARK(BM_Utf8Length<GET_UTF8_LEN_FROM_QVCHAR>)->DenseRange(0, 2);
BENCHMARK(BM_Utf8Length<nlssm::unicode::utf8_length_scalar>)->DenseRange(0, 2);
BENCHMARK(BM_Utf8Length<nlssm::unicode::utf8_length_sse2>)->DenseRange(0, 2);
BENCHMARK(BM_Utf8Length<nlssm::unicode::utf8_length_avx2>)->DenseRange(0, 2);
BENCHMARK(BM_Utf8Length<icu_u8_length>)->DenseRange(0, 2);

BENCHMARK_MAIN();
