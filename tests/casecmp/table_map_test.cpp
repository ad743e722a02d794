// The vector table mapping against the table loop: every single-byte case
// table of the catalogue, every instruction set this processor runs, lengths
// 0..300 at every start alignment 0..31 and 64 KiB, guard bytes after the
// destination; and tables outside the catalogue, which get plans of their own.
#include <gtest/gtest.h>

#include <array>
#include <random>
#include <string>
#include <vector>

#include "casecmp/table_map.hpp"
#include "catalogue/tables.hpp"
#include "kernel/cpu.hpp"

namespace {

namespace cm = nlssm::casecmp;
namespace cat = nlssm::catalogue;

constexpr uint8_t kGuard = 0xA5;
constexpr int64_t kGuardBytes = 64;
constexpr int64_t kLongText = 64 * 1024;

std::vector<cm::MapIsa> vector_isas() {
  std::vector<cm::MapIsa> isas{cm::MapIsa::kSse2};
  if (kernel::cpu::supports(kernel::cpu::Isa::avx2)) isas.push_back(cm::MapIsa::kAvx2);
  if (kernel::cpu::supports(kernel::cpu::Isa::avx512vbmi)) isas.push_back(cm::MapIsa::kAvx512);
  return isas;
}

// Maps `n` bytes (every byte value, shifted by `seed`) at alignment `align`
// in place and into a second buffer, on `isa`, and compares both with the
// table loop. Answers a description of the first difference, or "".
std::string check(cm::MapIsa isa, const uint8_t *table, int64_t n, int align, unsigned seed) {
  std::vector<uint8_t> source(static_cast<size_t>(n + 64)), want(source.size());
  for (int64_t i = 0; i < n; ++i) source[align + i] = static_cast<uint8_t>(i * 7 + seed);
  cm::map_bytes_scalar(table, source.data() + align, want.data(), n);
  for (const bool inPlace : {true, false}) {
    std::vector<uint8_t> out(static_cast<size_t>(align + n + kGuardBytes), kGuard);
    const uint8_t *from = source.data() + align;
    if (inPlace) {
      std::copy(from, from + n, out.begin() + align);
      from = out.data() + align;
    }
    cm::map_bytes(isa, table, from, out.data() + align, n);
    for (int64_t i = 0; i < n; ++i)
      if (out[align + i] != want[i])
        return "byte " + std::to_string(i) + (inPlace ? " in place" : " copied");
    for (int64_t i = align + n; i < static_cast<int64_t>(out.size()); ++i)
      if (out[i] != kGuard) return "guard byte " + std::to_string(i - align - n) + " written";
  }
  return "";
}

void sweep(const uint8_t *table, const std::string &name) {
  for (const cm::MapIsa isa : vector_isas()) {
    int failures = 0;
    for (int align = 0; align < 32 && failures < 5; ++align) {
      for (int64_t n = 0; n <= 300 && failures < 5; ++n) {
        const std::string d = check(isa, table, n, align, static_cast<unsigned>(n + align));
        if (!d.empty()) {
          ++failures;
          ADD_FAILURE() << name << " isa " << int(isa) << " n " << n << " align " << align << ": "
                        << d;
        }
      }
      const std::string d = check(isa, table, kLongText, align, 3);
      if (!d.empty()) ADD_FAILURE() << name << " 64 KiB align " << align << ": " << d;
    }
  }
}

class EverySet : public testing::TestWithParam<cat::SbcsSet> {};

TEST_P(EverySet, VectorPathsEqualTheTableLoop) {
  sweep(GetParam().lower, std::string(GetParam().name) + " lower");
  sweep(GetParam().upper, std::string(GetParam().name) + " upper");
}

INSTANTIATE_TEST_SUITE_P(Catalogue, EverySet, testing::ValuesIn(cat::sbcs_sets),
                         [](const auto &info) { return std::string(info.param.name); });

// Copies of catalogue tables are not in the plan index, and random tables
// have more runs than a plan keeps; long texts through them take plans made
// for the call.
TEST(OwnPlans, TablesOutsideTheCatalogue) {
  std::mt19937 rng(11);
  std::vector<std::array<uint8_t, 256>> tables;
  for (const auto &set : {cat::sbcs_sets[0], cat::sbcs_sets[60]}) {
    std::array<uint8_t, 256> copy;
    std::copy(set.upper, set.upper + 256, copy.begin());
    tables.push_back(copy);
  }
  for (int changed : {0, 5, 40, 256}) {
    std::array<uint8_t, 256> t;
    for (int b = 0; b < 256; ++b) t[b] = static_cast<uint8_t>(b);
    for (int k = 0; k < changed; ++k) t[rng() % 256] = static_cast<uint8_t>(rng());
    tables.push_back(t);
  }
  for (const auto &t : tables)
    for (const cm::MapIsa isa : vector_isas())
      for (int align : {0, 1, 17, 31})
        for (int64_t n : {int64_t{5000}, kLongText + 13})
          EXPECT_EQ(check(isa, t.data(), n, align, 9), "") << "isa " << int(isa);
}

}  // namespace
