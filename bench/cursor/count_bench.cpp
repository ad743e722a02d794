// Character counting: NLSNumCharsS against ICU counting the same text, for
// UTF-8 (ASCII-heavy and CJK-heavy), UTF-16 and Shift-JIS at 64 KiB and
// 64 MiB.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <unicode/ucnv.h>
#include <unicode/uset.h>
#include <unicode/ustring.h>
#include <unicode/utf16.h>
#include <unicode/utf8.h>

#include <cstring>
#include <random>
#include <string>
#include <vector>

namespace {

constexpr int64_t kSmall = 64 << 10;
constexpr int64_t kLarge = 64 << 20;

// Japanese-looking text: characters that Shift-JIS (ibm-943) maps both
// ways, from U+3000 up, mixed with a share of ASCII.
std::u16string japanese_text(double ascii_share, size_t chars, unsigned seed) {
  UErrorCode e = U_ZERO_ERROR;
  UConverter *cnv = ucnv_open("ibm-943_P15A-2003", &e);
  USet *set = uset_openEmpty();
  ucnv_getUnicodeSet(cnv, set, UCNV_ROUNDTRIP_SET, &e);
  std::vector<UChar32> wide;
  for (int32_t i = 0; i < uset_getItemCount(set); ++i) {
    UChar32 a = 0, b = 0;
    e = U_ZERO_ERROR;
    if (uset_getItem(set, i, &a, &b, nullptr, 0, &e) != 0) continue;
    for (UChar32 c = std::max<UChar32>(a, 0x3000); c <= b && c <= 0xFFFF; ++c) wide.push_back(c);
  }
  uset_close(set);
  ucnv_close(cnv);
  std::mt19937 rng(seed);
  std::bernoulli_distribution ascii(ascii_share);
  std::u16string out;
  for (size_t i = 0; i < chars; ++i)
    out.push_back(ascii(rng) ? static_cast<char16_t>(0x20 + rng() % 0x5F)
                             : static_cast<char16_t>(wide[rng() % wide.size()]));
  return out;
}

std::vector<uint8_t> encode(const char *name, const std::u16string &text) {
  UErrorCode e = U_ZERO_ERROR;
  UConverter *cnv = ucnv_open(name, &e);
  std::vector<uint8_t> out(text.size() * 4 + 16);
  const int32_t n =
      ucnv_fromUChars(cnv, reinterpret_cast<char *>(out.data()), static_cast<int32_t>(out.size()),
                      text.data(), static_cast<int32_t>(text.size()), &e);
  ucnv_close(cnv);
  out.resize(static_cast<size_t>(n));
  return out;
}

// A block of about 8 KiB repeated up to the size wanted (whole blocks, so
// the text stays well formed).
std::vector<uint8_t> repeat_to(const std::vector<uint8_t> &block, int64_t size) {
  std::vector<uint8_t> out;
  out.reserve(static_cast<size_t>(size));
  while (static_cast<int64_t>(out.size() + block.size()) <= size)
    out.insert(out.end(), block.begin(), block.end());
  return out;
}

std::vector<uint8_t> block_for(const std::string &kind) {
  if (kind == "utf8_ascii") return encode("UTF-8", japanese_text(0.92, 7000, 1));
  if (kind == "utf8_cjk") return encode("UTF-8", japanese_text(0.15, 3000, 2));
  if (kind == "utf16") return encode("UTF-16LE", japanese_text(0.15, 4000, 3));
  return encode("ibm-943_P15A-2003", japanese_text(0.15, 4500, 4));
}

NLSSMHandle handle_for(const std::string &kind) {
  NLSSMHandle h{};
  h.unitWidth = 1;
  if (kind == "utf16") {
    h.encodingNumber = NLSSM_ENC_WCS2_LE;
    h.encodingClass = NLSSM_CLASS_WCS2;
    h.unitWidth = 2;
  } else if (kind == "sjis") {
    h.encodingNumber = 135;
    h.encodingClass = NLSSM_CLASS_MBCS_NONMODAL;
    for (int b = 0x81; b <= 0x9F; ++b) h.charClass[b] |= 0x44;
    for (int b = 0xE0; b <= 0xFC; ++b) h.charClass[b] |= 0x44;
    for (int b = 0x40; b <= 0x7E; ++b) h.charClass[b] |= 0x08;
    for (int b = 0x80; b <= 0xFC; ++b) h.charClass[b] |= 0x08;
  } else {
    h.encodingNumber = NLSSM_ENC_UTF8;
    h.encodingClass = NLSSM_CLASS_UTF8;
  }
  return h;
}

int64_t nlssm_count(const std::string &kind, const NLSSMHandle &h, const std::vector<uint8_t> &t) {
  int64_t count = 0;
  const auto n = static_cast<int64_t>(t.size());
  if (kind == "utf16") {
    NLSNumCharsS_WCS2(&h, t.data(), n, 0, &count);
  } else if (kind == "sjis") {
    NLSNumCharsS_MBCS_nonmodal(&h, t.data(), n, 0, &count);
  } else {
    NLSNumCharsS_UTF8(&h, t.data(), n, 0, &count);
  }
  return count;
}

int64_t icu_count(const std::string &kind, const std::vector<uint8_t> &t, std::vector<UChar> &work,
                  UConverter *sjis) {
  int64_t count = 0;
  if (kind == "utf16") {
    const auto *u = reinterpret_cast<const UChar *>(t.data());
    const auto n = static_cast<int32_t>(t.size() / 2);
    for (int32_t i = 0; i < n; ++count) {
      UChar32 c;
      U16_NEXT(u, i, n, c);
      benchmark::DoNotOptimize(c);
    }
  } else if (kind == "sjis") {
    UErrorCode e = U_ZERO_ERROR;
    const int32_t units =
        ucnv_toUChars(sjis, work.data(), static_cast<int32_t>(work.size()),
                      reinterpret_cast<const char *>(t.data()), static_cast<int32_t>(t.size()), &e);
    count = u_countChar32(work.data(), units);
  } else {
    const auto *s = t.data();
    const auto n = static_cast<int32_t>(t.size());
    for (int32_t i = 0; i < n; ++count) {
      UChar32 c;
      U8_NEXT(s, i, n, c);
      benchmark::DoNotOptimize(c);
    }
  }
  return count;
}

void register_all() {
  for (const std::string kind : {"utf8_ascii", "utf8_cjk", "utf16", "sjis"}) {
    const std::vector<uint8_t> block = block_for(kind);
    for (int64_t size : {kSmall, kLarge}) {
      auto text = std::make_shared<std::vector<uint8_t>>(repeat_to(block, size));
      const std::string label = kind + (size == kSmall ? "/64KiB" : "/64MiB");
      auto h = std::make_shared<NLSSMHandle>(handle_for(kind));
      benchmark::RegisterBenchmark(
          ("nlssm/" + label).c_str(), [kind, text, h](benchmark::State &st) {
            int64_t count = 0;
            for (auto _ : st) benchmark::DoNotOptimize(count = nlssm_count(kind, *h, *text));
            st.counters["chars"] = static_cast<double>(count);
            st.SetBytesProcessed(st.iterations() * static_cast<int64_t>(text->size()));
          });
      benchmark::RegisterBenchmark(("icu/" + label).c_str(), [kind, text](benchmark::State &st) {
        UErrorCode e = U_ZERO_ERROR;
        UConverter *sjis = ucnv_open("ibm-943_P15A-2003", &e);
        std::vector<UChar> work(kind == "sjis" ? text->size() + 16 : 0);
        int64_t count = 0;
        for (auto _ : st) benchmark::DoNotOptimize(count = icu_count(kind, *text, work, sjis));
        ucnv_close(sjis);
        st.counters["chars"] = static_cast<double>(count);
        st.SetBytesProcessed(st.iterations() * static_cast<int64_t>(text->size()));
      });
    }
  }
}

}  // namespace

int main(int argc, char **argv) {
  register_all();
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
