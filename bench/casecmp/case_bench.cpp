// Upper-casing fields: NLSStringUpperS on EBCDIC 037 and Latin-1 against the
// plain table loop, memcpy of the same bytes and ICU doing the same job
// (convert to UTF-16, u_strToUpper, convert back); NLSStringUpperS on UTF-8
// against ucasemap_utf8ToUpper. Each at 64 KiB and 64 MiB.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <unicode/ucasemap.h>
#include <unicode/ucnv.h>
#include <unicode/ustring.h>

#include <cstring>
#include <nlssm/reference_host.hpp>
#include <random>
#include <string>
#include <vector>

#include "casecmp/table_map.hpp"

namespace {

using UpperS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t);

const NLSSMHandle *handle(int encoding) {
  static auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  return host->create_handle(encoding, &h) == 0 ? h : nullptr;
}

// Mixed-case words with an accented letter now and then, in UTF-8.
std::string sample_utf8(size_t bytes) {
  static const char *const kWords[] = {"Customer", "name",  "Straße", "Köln",   "ADDRESS", "city",
                                       "Zürich",   "crème", "brûlée", "Ørsted", "account", "Ñandú"};
  std::mt19937 rng(7);
  std::string out;
  while (out.size() < bytes) {
    out += kWords[rng() % std::size(kWords)];
    out += ' ';
  }
  while (out.size() > bytes || (static_cast<uint8_t>(out.back()) & 0xC0) == 0x80) out.pop_back();
  out.resize(bytes, ' ');
  return out;
}

// The sample converted into a single-byte code page (every character fits).
std::vector<uint8_t> sample_sbcs(const char *converter, size_t bytes) {
  const std::string utf8 = sample_utf8(bytes * 2);
  UErrorCode err = U_ZERO_ERROR;
  std::vector<char> out(utf8.size());
  const int32_t n = ucnv_convert(converter, "UTF-8", out.data(), static_cast<int32_t>(out.size()),
                                 utf8.data(), static_cast<int32_t>(utf8.size()), &err);
  out.resize(static_cast<size_t>(n));
  out.resize(bytes);
  return {out.begin(), out.end()};
}

struct Case {
  int encoding;
  const char *icu;
};
const Case kEbcdic037{78, "ibm-37"};
const Case kLatin1{29, "ISO-8859-1"};

void set_bytes(benchmark::State &state) {
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) * state.range(0));
}

// Upper-cases the sample in place with `run` (handle, bytes, length).
template <typename Run>
void in_place(benchmark::State &state, Case c, Run run) {
  const NLSSMHandle *h = handle(c.encoding);
  std::vector<uint8_t> text = sample_sbcs(c.icu, static_cast<size_t>(state.range(0)));
  for (auto _ : state) {
    run(h, text.data(), static_cast<int64_t>(text.size()));
    benchmark::ClobberMemory();
  }
  set_bytes(state);
}

void Module(benchmark::State &state, Case c) {
  in_place(state, c, [](const NLSSMHandle *h, uint8_t *p, int64_t n) {
    reinterpret_cast<UpperS>(h->NLSStringUpperS)(h, p, n, 0);
  });
}

void TableLoop(benchmark::State &state, Case c) {
  in_place(state, c, [](const NLSSMHandle *h, uint8_t *p, int64_t n) {
    nlssm::casecmp::map_bytes_scalar(h->upperTable, p, p, n);
  });
}

// The AVX2 kernel on its own, for processors without AVX-512 byte permutes.
void Avx2(benchmark::State &state, Case c) {
  in_place(state, c, [](const NLSSMHandle *h, uint8_t *p, int64_t n) {
    nlssm::casecmp::map_bytes(nlssm::casecmp::MapIsa::kAvx2, h->upperTable, p, p, n);
  });
}

void Memcpy(benchmark::State &state) {
  std::vector<uint8_t> from(static_cast<size_t>(state.range(0)), 'a'), to(from.size(), 0);
  for (auto _ : state) {
    std::memcpy(to.data(), from.data(), from.size());
    benchmark::ClobberMemory();
  }
  set_bytes(state);
}

// ICU: the field to UTF-16, upper-cased, and back.
void Icu(benchmark::State &state, Case c) {
  std::vector<uint8_t> text = sample_sbcs(c.icu, static_cast<size_t>(state.range(0)));
  UErrorCode err = U_ZERO_ERROR;
  UConverter *cnv = ucnv_open(c.icu, &err);
  // Upper case may lengthen (sharp s becomes SS): room for twice the text.
  std::vector<UChar> wide(text.size()), upper(2 * text.size() + 64);
  std::vector<char> back(2 * text.size() + 64);
  for (auto _ : state) {
    err = U_ZERO_ERROR;
    const int32_t n = ucnv_toUChars(cnv, wide.data(), static_cast<int32_t>(wide.size()),
                                    reinterpret_cast<const char *>(text.data()),
                                    static_cast<int32_t>(text.size()), &err);
    const int32_t m =
        u_strToUpper(upper.data(), static_cast<int32_t>(upper.size()), wide.data(), n, "", &err);
    ucnv_fromUChars(cnv, back.data(), static_cast<int32_t>(back.size()), upper.data(), m, &err);
    benchmark::ClobberMemory();
  }
  ucnv_close(cnv);
  if (U_FAILURE(err) && err != U_STRING_NOT_TERMINATED_WARNING)
    state.SkipWithError(u_errorName(err));
  set_bytes(state);
}

void ModuleUtf8(benchmark::State &state) {
  const NLSSMHandle *h = handle(NLSSM_ENC_UTF8);
  std::string text = sample_utf8(static_cast<size_t>(state.range(0)));
  const auto upper = reinterpret_cast<UpperS>(h->NLSStringUpperS);
  const std::string original = text;
  for (auto _ : state) {
    state.PauseTiming();
    text = original;  // upper case shortens some characters; start over
    state.ResumeTiming();
    upper(h, reinterpret_cast<uint8_t *>(text.data()), static_cast<int64_t>(text.size()), 0);
    benchmark::ClobberMemory();
  }
  set_bytes(state);
}

void IcuUtf8(benchmark::State &state) {
  const std::string text = sample_utf8(static_cast<size_t>(state.range(0)));
  UErrorCode err = U_ZERO_ERROR;
  UCaseMap *map = ucasemap_open("", 0, &err);
  std::string out(text.size() + 64, '\0');
  for (auto _ : state) {
    err = U_ZERO_ERROR;
    ucasemap_utf8ToUpper(map, out.data(), static_cast<int32_t>(out.size()), text.data(),
                         static_cast<int32_t>(text.size()), &err);
    benchmark::ClobberMemory();
  }
  ucasemap_close(map);
  set_bytes(state);
}

#define SIZES ->Arg(64 << 10)->Arg(64 << 20)->Unit(benchmark::kMicrosecond)
BENCHMARK_CAPTURE(Module, ebcdic037, kEbcdic037) SIZES;
BENCHMARK_CAPTURE(Avx2, ebcdic037, kEbcdic037) SIZES;
BENCHMARK_CAPTURE(TableLoop, ebcdic037, kEbcdic037) SIZES;
BENCHMARK_CAPTURE(Icu, ebcdic037, kEbcdic037) SIZES;
BENCHMARK_CAPTURE(Module, latin1, kLatin1) SIZES;
BENCHMARK_CAPTURE(Avx2, latin1, kLatin1) SIZES;
BENCHMARK_CAPTURE(TableLoop, latin1, kLatin1) SIZES;
BENCHMARK_CAPTURE(Icu, latin1, kLatin1) SIZES;
BENCHMARK(Memcpy) SIZES;
BENCHMARK(ModuleUtf8) SIZES;
BENCHMARK(IcuUtf8) SIZES;

}  // namespace

BENCHMARK_MAIN();
