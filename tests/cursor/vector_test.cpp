// Every vector path against the exact rules, over lengths 0..300, every
// misalignment of a vector, and texts with and without damage.
#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "cursor/counting.hpp"
#include "handle_fixture.hpp"

namespace cursor_test {
namespace {

using nlssm::cursor::Counted;
using nlssm::cursor::simd::Isa;

std::vector<Isa> vector_isas() {
  std::vector<Isa> isas = {Isa::kSse2};
  if (nlssm::cursor::simd::best_isa() == Isa::kAvx2) isas.push_back(Isa::kAvx2);
  return isas;
}

void append_utf8(std::vector<uint8_t> &out, std::mt19937 &rng) {
  const uint32_t kind = rng() % 8;
  const uint32_t cp = kind < 4   ? rng() % 0x80
                      : kind < 5 ? 0x80 + rng() % 0x780
                      : kind < 7 ? 0x800 + rng() % 0xF800
                                 : 0x10000 + rng() % 0x100000;
  if (cp < 0x80) {
    out.push_back(static_cast<uint8_t>(cp));
  } else if (cp < 0x800) {
    out.insert(out.end(),
               {static_cast<uint8_t>(0xC0 | cp >> 6), static_cast<uint8_t>(0x80 | (cp & 0x3F))});
  } else if (cp < 0x10000) {
    out.insert(out.end(), {static_cast<uint8_t>(0xE0 | cp >> 12),
                           static_cast<uint8_t>(0x80 | (cp >> 6 & 0x3F)),
                           static_cast<uint8_t>(0x80 | (cp & 0x3F))});
  } else {
    out.insert(
        out.end(),
        {static_cast<uint8_t>(0xF0 | cp >> 18), static_cast<uint8_t>(0x80 | (cp >> 12 & 0x3F)),
         static_cast<uint8_t>(0x80 | (cp >> 6 & 0x3F)), static_cast<uint8_t>(0x80 | (cp & 0x3F))});
  }
}

// Text of `n` bytes in the shape of the encoding; `damage` random bytes
// are then overwritten.
std::vector<uint8_t> make_text(Enc enc, size_t n, int damage, std::mt19937 &rng) {
  std::vector<uint8_t> out;
  while (out.size() < n) {
    switch (enc) {
      case Enc::kUtf8:
        append_utf8(out, rng);
        break;
      case Enc::kWcs2Le: {
        const uint32_t r = rng() % 10;
        const uint16_t u = r < 2   ? 0xD800 + rng() % 0x400
                           : r < 4 ? 0xDC00 + rng() % 0x400
                                   : rng() % 0x10000;
        out.insert(out.end(), {static_cast<uint8_t>(u), static_cast<uint8_t>(u >> 8)});
        break;
      }
      default: {  // Shift-JIS: ASCII, half-width kana, or a lead-trail pair
        const uint32_t r = rng() % 4;
        if (r == 0) {
          out.push_back(static_cast<uint8_t>(0x20 + rng() % 0x5F));
        } else if (r == 1) {
          out.push_back(static_cast<uint8_t>(0xA1 + rng() % 0x3F));
        } else {
          const uint8_t lead = rng() % 2 ? 0x81 + rng() % 0x1F : 0xE0 + rng() % 0x1D;
          const uint8_t trail = rng() % 2 ? 0x40 + rng() % 0x3F : 0x80 + rng() % 0x7D;
          out.insert(out.end(), {lead, trail});
        }
      }
    }
  }
  out.resize(n);
  for (int k = 0; k < damage && n > 0; ++k) out[rng() % n] = static_cast<uint8_t>(rng());
  return out;
}

class VectorPaths : public ::testing::TestWithParam<Enc> {};

TEST_P(VectorPaths, AgreeWithTheExactRules) {
  const Enc enc = GetParam();
  auto th = make_handle(Enc::kDbcs);
  std::mt19937 rng(77u + static_cast<unsigned>(enc));
  for (size_t n = 0; n <= 300; ++n) {
    for (size_t shift = 0; shift < 32; shift += (n < 200 ? 1 : 7)) {
      const int damage = (n + shift) % 3 == 0 ? 1 + static_cast<int>(rng() % 3) : 0;
      const std::vector<uint8_t> text = make_text(enc, n, damage, rng);
      // The text ends where its allocation ends, so any read past it trips
      // the address sanitizer.
      std::vector<uint8_t> storage(shift + n);
      uint8_t *p = storage.data() + shift;
      std::copy(text.begin(), text.end(), p);
      const auto len = static_cast<int64_t>(n);
      for (int64_t flags : {int64_t{0}, int64_t{4}}) {
        Counted want{0, 0};
        if (enc == Enc::kUtf8) want = nlssm::cursor::count_utf8(Isa::kScalar, p, len, flags);
        if (enc == Enc::kWcs2Le)
          want.chars = nlssm::cursor::count_wcs2(Isa::kScalar, p, len, false);
        if (enc == Enc::kDbcs)
          want = nlssm::cursor::count_dbcs(Isa::kScalar, &th->h, p, len, flags);
        for (Isa isa : vector_isas()) {
          SCOPED_TRACE(::testing::Message() << "n " << n << " shift " << shift << " isa "
                                            << static_cast<int>(isa) << " flags " << flags);
          Counted got{0, 0};
          if (enc == Enc::kUtf8) got = nlssm::cursor::count_utf8(isa, p, len, flags);
          if (enc == Enc::kWcs2Le) got.chars = nlssm::cursor::count_wcs2(isa, p, len, false);
          if (enc == Enc::kDbcs) got = nlssm::cursor::count_dbcs(isa, &th->h, p, len, flags);
          ASSERT_EQ(got.chars, want.chars);
          ASSERT_EQ(got.status, want.status);
          // Byte lengths of leading characters of the whole text. A last
          // character that may pair with what follows is measured by
          // reading on, so this text is terminated.
          if (damage == 0 && flags == 0) {
            std::vector<uint8_t> terminated(shift + n + 2, 0);
            std::copy(text.begin(), text.end(), terminated.begin() + static_cast<ptrdiff_t>(shift));
            const uint8_t *p = terminated.data() + shift;
            for (int64_t k : {want.chars / 3, want.chars - 1, want.chars}) {
              if (k < 0) continue;
              int64_t a = 0, b = 0;
              if (enc == Enc::kUtf8) {
                a = nlssm::cursor::bytes_of_utf8(isa, p, k);
                b = nlssm::cursor::bytes_of_utf8(Isa::kScalar, p, k);
              } else if (enc == Enc::kWcs2Le) {
                a = nlssm::cursor::bytes_of_wcs2(isa, p, k, false);
                b = nlssm::cursor::bytes_of_wcs2(Isa::kScalar, p, k, false);
              } else {
                a = nlssm::cursor::bytes_of_dbcs(isa, &th->h, p, k);
                b = nlssm::cursor::bytes_of_dbcs(Isa::kScalar, &th->h, p, k);
              }
              ASSERT_EQ(a, b) << "first " << k;
            }
          }
        }
      }
    }
  }
}

// Clean long texts are measured by the vector kernels nearly to their end,
// not handed to the exact rule early.
TEST_P(VectorPaths, CleanLongTextsStayOnTheVectorPath) {
  const Enc enc = GetParam();
  auto th = make_handle(Enc::kDbcs);
  std::mt19937 rng(99u + static_cast<unsigned>(enc));
  const std::vector<uint8_t> text = make_text(enc, 70001, 0, rng);
  const auto len = static_cast<int64_t>(text.size());
  nlssm::cursor::simd::ByteRanges lead, trail;
  lead.from_flags(th->h.charClass, 0x04);
  trail.from_flags(th->h.charClass, 0x08);
  for (Isa isa : vector_isas()) {
    const int64_t vouched =
        enc == Enc::kUtf8 ? nlssm::cursor::simd::utf8_prefix(isa, text.data(), len, INT64_MAX).bytes
        : enc == Enc::kWcs2Le
            ? nlssm::cursor::simd::wcs2_prefix(isa, text.data(), len, INT64_MAX, false).bytes
            : nlssm::cursor::simd::dbcs_prefix(isa, text.data(), len, INT64_MAX, lead, trail).bytes;
    EXPECT_GT(vouched, len - 300);
  }
}

INSTANTIATE_TEST_SUITE_P(Encodings, VectorPaths,
                         ::testing::Values(Enc::kUtf8, Enc::kWcs2Le, Enc::kDbcs),
                         [](const ::testing::TestParamInfo<Enc> &info) {
                           return enc_name(info.param);
                         });

}  // namespace
}  // namespace cursor_test
