// Transliterate and tranword on 64 KiB of single-byte (ISO-8859-1) and
// UTF-8 text, through the handle's raw-buffer slots, against a plain
// std::string implementation of the same rule.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <random>
#include <string>
#include <vector>

namespace {

constexpr size_t kBytes = 64 << 10;

const NLSSMHandle *handle(int encoding) {
  static auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  host->create_handle(encoding, &h);
  return h;
}

// Words of lower-case letters separated by blanks; in UTF-8 one word in
// eight is Japanese and one letter in sixteen accented.
std::string text(bool utf8) {
  std::mt19937 rng(15);
  const char *const kJapanese[] = {"日本", "東京", "漢字"};
  std::string out;
  while (out.size() < kBytes) {
    if (utf8 && rng() % 8 == 0) {
      out += kJapanese[rng() % 3];
    } else if (rng() % 10 == 0) {
      out += "the";
    } else {
      for (unsigned n = 2 + rng() % 6; n > 0; --n) {
        if (rng() % 16 == 0)
          out += utf8 ? "\xC3\xA9" : "\xE9";
        else
          out += static_cast<char>('a' + rng() % 26);
      }
    }
    out += ' ';
  }
  while (out.size() > kBytes) out.pop_back();
  if (utf8)  // do not end inside a character
    while ((static_cast<uint8_t>(out.back()) & 0xC0) == 0x80 ||
           static_cast<uint8_t>(out.back()) >= 0xC0)
      out.pop_back();
  return out;
}

// Characters of a UTF-8 or single-byte text, each as a string.
std::vector<std::string> split(const std::string &s, bool utf8) {
  std::vector<std::string> out;
  for (size_t i = 0; i < s.size();) {
    size_t n = 1;
    if (utf8)
      while (i + n < s.size() && (static_cast<uint8_t>(s[i + n]) & 0xC0) == 0x80) ++n;
    out.push_back(s.substr(i, n));
    i += n;
  }
  return out;
}

// The same rules written plainly on std::string.
std::string string_transliterate(const std::string &s, const std::string &from,
                                 const std::string &to, bool utf8) {
  const auto f = split(from, utf8), t = split(to, utf8);
  std::string out;
  out.reserve(s.size());
  for (size_t i = 0; i < s.size();) {
    size_t n = 1;
    if (utf8)
      while (i + n < s.size() && (static_cast<uint8_t>(s[i + n]) & 0xC0) == 0x80) ++n;
    const std::string_view c(s.data() + i, n);
    size_t k = 0;
    while (k < f.size() && k < t.size() && f[k] != c) ++k;
    if (k < f.size() && k < t.size())
      out += t[k];
    else
      out += c;
    i += n;
  }
  return out;
}

std::string string_tranword(const std::string &s, const std::string &find,
                            const std::string &repl) {
  std::string out;
  out.reserve(s.size());
  size_t i = 0;
  for (size_t at; (at = s.find(find, i)) != std::string::npos; i = at + find.size()) {
    out.append(s, i, at - i);
    out += repl;
  }
  out.append(s, i, std::string::npos);
  return out;
}

using TranslitS = decltype(&NLSStringTransliterateS_SBCS);
using TranwordS = decltype(&NLSStringTranwordS_SBCS);

const uint8_t *u(const std::string &s) {
  return reinterpret_cast<const uint8_t *>(s.data());
}
int64_t n(const std::string &s) {
  return static_cast<int64_t>(s.size());
}

struct Setting {
  int encoding;
  bool utf8;
  std::string from, to;
};

Setting setting(int64_t utf8) {
  return utf8 ? Setting{20, true, "aeiou\xC3\xA9日", "AEIOUe本"}
              : Setting{29, false, "aeiou\xE9", "AEIOUe"};
}

void BM_Transliterate_Module(benchmark::State &state) {
  const Setting set = setting(state.range(0));
  const NLSSMHandle *h = handle(set.encoding);
  const std::string src = text(set.utf8);
  std::vector<uint8_t> out(src.size() + 64);
  const auto fn = reinterpret_cast<TranslitS>(h->NLSStringTransliterateS);
  const std::string expect = string_transliterate(src, set.from, set.to, set.utf8);
  int64_t written = 0;
  for (auto _ : state) {
    fn(h, u(src), n(src), u(set.to), n(set.to), u(set.from), n(set.from), 0, out.data(),
       n(src) + 64, &written, 0);
    benchmark::DoNotOptimize(out.data());
  }
  if (std::string(out.begin(), out.begin() + written) != expect) state.SkipWithError("differs");
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) * n(src));
}

// The same text as 80-byte records, one call each (as `nlsstr translit
// --records 80` runs it): the per-call set-up counts here.
void BM_Transliterate_Records(benchmark::State &state) {
  const Setting set = setting(0);
  const NLSSMHandle *h = handle(set.encoding);
  const std::string src = text(false);
  std::vector<uint8_t> out(src.size() + 64);
  const auto fn = reinterpret_cast<TranslitS>(h->NLSStringTransliterateS);
  constexpr int64_t kRecord = 80;
  for (auto _ : state) {
    for (int64_t at = 0; at + kRecord <= n(src); at += kRecord) {
      int64_t written = 0;
      fn(h, u(src) + at, kRecord, u(set.to), n(set.to), u(set.from), n(set.from), 0,
         out.data() + at, kRecord, &written, 0);
    }
    benchmark::DoNotOptimize(out.data());
  }
  const int64_t whole = n(src) / kRecord * kRecord;
  const std::string expect = string_transliterate(src.substr(0, whole), set.from, set.to, false);
  if (std::string(out.begin(), out.begin() + whole) != expect) state.SkipWithError("differs");
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) * whole);
}

void BM_Transliterate_String(benchmark::State &state) {
  const Setting set = setting(state.range(0));
  const std::string src = text(set.utf8);
  for (auto _ : state)
    benchmark::DoNotOptimize(string_transliterate(src, set.from, set.to, set.utf8));
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) * n(src));
}

void BM_Tranword_Module(benchmark::State &state) {
  const Setting set = setting(state.range(0));
  const NLSSMHandle *h = handle(set.encoding);
  const std::string src = text(set.utf8), find = "the", repl = "a";
  std::vector<uint8_t> out(src.size() + 64);
  const auto fn = reinterpret_cast<TranwordS>(h->NLSStringTranwordS);
  int64_t written = 0;
  for (auto _ : state) {
    fn(h, u(src), n(src), u(repl), n(repl), u(find), n(find), out.data(), n(src) + 64, &written, 0);
    benchmark::DoNotOptimize(out.data());
  }
  if (std::string(out.begin(), out.begin() + written) != string_tranword(src, find, repl))
    state.SkipWithError("differs");
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) * n(src));
}

void BM_Tranword_String(benchmark::State &state) {
  const Setting set = setting(state.range(0));
  const std::string src = text(set.utf8);
  for (auto _ : state) benchmark::DoNotOptimize(string_tranword(src, "the", "a"));
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations()) * n(src));
}

// Argument: 0 single-byte, 1 UTF-8.
BENCHMARK(BM_Transliterate_Module)->Arg(0)->Arg(1);
BENCHMARK(BM_Transliterate_String)->Arg(0)->Arg(1);
BENCHMARK(BM_Transliterate_Records);
BENCHMARK(BM_Tranword_Module)->Arg(0)->Arg(1);
BENCHMARK(BM_Tranword_String)->Arg(0)->Arg(1);

}  // namespace

BENCHMARK_MAIN();
