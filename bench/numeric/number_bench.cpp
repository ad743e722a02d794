// Integer parsing and formatting through the handle's slots against
// strtoll, std::from_chars, snprintf and std::to_chars on the same values.
#include <benchmark/benchmark.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <charconv>
#include <cinttypes>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>
#include <vector>

namespace {

using ToIntmaxFn = int64_t (*)(const NLSSMHandle *, void *, const void *, int64_t, uint32_t,
                               int64_t *, int32_t *);
using FromIntmaxFn = int64_t (*)(const NLSSMHandle *, void *, int64_t, int64_t, uint32_t, void *,
                                 int64_t, int32_t *);

const NLSSMHandle *handle(int encoding) {
  static auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  return host->create_handle(encoding, &h) == 0 ? h : nullptr;
}

// 4096 values of every magnitude, and their decimal texts.
struct Values {
  std::vector<int64_t> numbers;
  std::vector<std::string> texts;
  Values() {
    std::mt19937_64 rng(1);
    for (int i = 0; i < 4096; ++i) {
      const auto v = static_cast<int64_t>(rng() >> (rng() % 64));
      numbers.push_back(v);
      texts.push_back(std::to_string(v));
    }
  }
};
const Values &values() {
  static const Values v;
  return v;
}

// The texts in the handle's number form (ASCII, EBCDIC or host characters).
std::vector<std::string> encoded(const NLSSMHandle *h) {
  std::vector<std::string> out;
  for (const std::string &text : values().texts) {
    std::string e;
    for (char c : text) {
      if (h->encodingClass == NLSSM_CLASS_WCS4)
        e.append({c, 0, 0, 0});
      else if (h->encodingFlags & 1u)
        e.push_back(c);
      else
        e.push_back(static_cast<char>(c == '-' ? 0x60 : 0xF0 + (c - '0')));
    }
    out.push_back(e);
  }
  return out;
}

void module_parse(benchmark::State &state, int encoding) {
  const NLSSMHandle *h = handle(encoding);
  const auto texts = encoded(h);
  const auto parse = reinterpret_cast<ToIntmaxFn>(h->NLSStringToIntmax);
  size_t i = 0;
  for (auto _ : state) {
    const std::string &t = texts[i++ & 4095];
    int64_t value = 0;
    int32_t consumed = 0;
    benchmark::DoNotOptimize(parse(h, nullptr, t.data(), std::ssize(t), 0, &value, &consumed));
    benchmark::DoNotOptimize(value);
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK_CAPTURE(module_parse, ascii, 29);
BENCHMARK_CAPTURE(module_parse, ebcdic, 78);
BENCHMARK_CAPTURE(module_parse, host_chars, 27);

void strtoll_parse(benchmark::State &state) {
  const auto &texts = values().texts;
  size_t i = 0;
  for (auto _ : state)
    benchmark::DoNotOptimize(std::strtoll(texts[i++ & 4095].c_str(), nullptr, 10));
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(strtoll_parse);

void from_chars_parse(benchmark::State &state) {
  const auto &texts = values().texts;
  size_t i = 0;
  for (auto _ : state) {
    const std::string &t = texts[i++ & 4095];
    int64_t value = 0;
    benchmark::DoNotOptimize(std::from_chars(t.data(), t.data() + t.size(), value));
    benchmark::DoNotOptimize(value);
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(from_chars_parse);

void module_format(benchmark::State &state, int encoding) {
  const NLSSMHandle *h = handle(encoding);
  const auto format = reinterpret_cast<FromIntmaxFn>(h->NLSStringFromIntmax);
  const auto &numbers = values().numbers;
  char out[152];
  size_t i = 0;
  for (auto _ : state) {
    int32_t written = 0;
    benchmark::DoNotOptimize(format(h, nullptr, numbers[i++ & 4095], 0, 0, out, 80, &written));
    benchmark::ClobberMemory();
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK_CAPTURE(module_format, ascii, 29);
BENCHMARK_CAPTURE(module_format, ebcdic, 78);
BENCHMARK_CAPTURE(module_format, host_chars, 27);

void snprintf_format(benchmark::State &state) {
  const auto &numbers = values().numbers;
  char out[32];
  size_t i = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(std::snprintf(out, sizeof out, "%" PRId64, numbers[i++ & 4095]));
    benchmark::ClobberMemory();
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(snprintf_format);

void to_chars_format(benchmark::State &state) {
  const auto &numbers = values().numbers;
  char out[32];
  size_t i = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(std::to_chars(out, out + sizeof out, numbers[i++ & 4095]));
    benchmark::ClobberMemory();
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(to_chars_format);

}  // namespace

BENCHMARK_MAIN();
