// Index, Contains, FindChar and Verify through the slots of real handles,
// in every class; the vector candidate scan against its scalar rule.
#include <gtest/gtest.h>

#include <random>

#include "casecmp/search_vector.hpp"
#include "text.hpp"

namespace search_test {
namespace {

// Encodings of every class: Latin-1, EBCDIC 037, UTF-8, UTF-16 BE/LE,
// UTF-32 BE, UTF-EBCDIC, modal 939, Shift-JIS, EUC-JP, GB18030.
const int kEncodings[] = {29, 78, 20, 24, 25, 26, 161, 129, 135, 134, 205};

class Search : public ::testing::TestWithParam<int> {
 protected:
  const NLSSMHandle *h = handle(GetParam());
  bool wide() const { return h->encodingClass != NLSSM_CLASS_SBCS; }
  // Index of `p` in `s` through the plain, S, C and Contains slots, which
  // must agree (positions in characters).
  int64_t index(const std::u32string &s, const std::u32string &p) {
    Bytes sb = encode(GetParam(), s), pb = encode(GetParam(), p);
    NLSString sd = at(h, sb), pd = at(h, pb);
    const int64_t plain = call(h->NLSStringIndex, h, &sd, &pd, int64_t{0});
    const auto sn = static_cast<int64_t>(sb.size()), pn = static_cast<int64_t>(pb.size());
    EXPECT_EQ(call(h->NLSStringIndexS, h, sb.data(), sn, pb.data(), pn), plain);
    EXPECT_EQ(
        call(h->NLSStringIndexC, h, sb.data(), int64_t(s.size()), pb.data(), int64_t(p.size())),
        plain);
    EXPECT_EQ(call(h->NLSStringContains, h, sb.data(), sn, pb.data(), pn, int64_t{0}), plain);
    return plain;
  }
};

TEST_P(Search, PatternLengthLimitsThePatternAndAnEmptyTextHasNoMatch) {
  Bytes sb = encode(GetParam(), U"xxabdx"), pb = encode(GetParam(), U"abc"), empty;
  NLSString sd = at(h, sb), pd = at(h, pb), ed = at(h, empty);
  const int64_t two = wide() ? 2 : static_cast<int64_t>(encode(GetParam(), U"ab").size());
  EXPECT_EQ(call(h->NLSStringIndex, h, &sd, &pd, two), 2);
  EXPECT_EQ(call(h->NLSStringIndex, h, &ed, &pd, int64_t{0}), -1);
  EXPECT_EQ(call(h->NLSStringIndexS, h, sb.data(), int64_t(sb.size()), pb.data(), int64_t{0}), 0);
  EXPECT_EQ(call(h->NLSStringIndexS, h, sb.data(), int64_t{0}, pb.data(), int64_t(pb.size())), -1);
  // The search starts at the current character and counts from there.
  NLSString from3 = at(h, sb, 3);
  Bytes xb = encode(GetParam(), U"x");
  NLSString xd = at(h, xb);
  EXPECT_EQ(call(h->NLSStringIndex, h, &from3, &xd, int64_t{0}), 2);
}

TEST_P(Search, FindCharMovesTheDescriptorOnlyOnAHit) {
  Bytes sb = encode(GetParam(), wide() ? U"日本xab" : U"yzxab");
  NLSString sd = at(h, sb);
  const uint8_t a = 'a', q = 'q';  // bytes of encoding 62
  EXPECT_EQ(call(h->NLSStringFindCharLit, h, &sd, int64_t{0}, &a), 3);
  EXPECT_EQ(sd.charIndex, 3);
  EXPECT_EQ(sd.curOffset,
            static_cast<int64_t>(encode(GetParam(), wide() ? U"日本x" : U"yzx").size()));
  const NLSString before = sd;
  EXPECT_EQ(call(h->NLSStringFindCharLit, h, &sd, int64_t{0}, &q), -1);
  EXPECT_EQ(sd.curOffset, before.curOffset);
  NLSString again = at(h, sb);
  EXPECT_EQ(call(h->NLSStringFindCharLit, h, &again, int64_t{3}, &a), -1);  // past the count
  // Raw forms: converted when asked; the C form counts characters.
  const auto n = static_cast<int64_t>(sb.size());
  EXPECT_EQ(call(h->NLSStringFindCharLitS, h, sb.data(), n, &a, int64_t{0}, int64_t{0}, uint8_t{1}),
            3);
  EXPECT_EQ(call(h->NLSStringFindCharLitC, h, sb.data(), int64_t{5}, &a, int64_t{0}, int64_t{0},
                 uint8_t{1}),
            3);
  Bytes lit = encode(GetParam(), U"b");
  EXPECT_EQ(
      call(h->NLSStringFindCharS, h, sb.data(), n, lit.data(), int64_t{0}, int64_t{0}, uint8_t{0}),
      4);
}

// Long random texts (so the vector scans and the skip over well-formed
// text run) against positions found on the code points themselves.
TEST_P(Search, RandomTextsAgreeWithSearchingTheCodePoints) {
  const std::u32string letters =
      wide() ? U"ab\u65E5\u672C" : (GetParam() == 78 ? U"ab\u00E9" : U"ab\u00E9\u00FF");
  std::mt19937 rng(GetParam());
  auto pick = [&](int low, int high) {
    std::u32string s(std::uniform_int_distribution<int>(low, high)(rng), U' ');
    for (char32_t &c : s) c = letters[rng() % letters.size()];
    return s;
  };
  for (int round = 0; round < 300; ++round) {
    const std::u32string text = pick(0, 300), pattern = pick(1, 8);
    const size_t want = text.find(pattern);
    ASSERT_EQ(index(text, pattern), want == std::u32string::npos ? -1 : int64_t(want))
        << "round " << round;
    const size_t outside = text.find_first_not_of(pattern);
    Bytes sb = encode(GetParam(), text), setb = encode(GetParam(), pattern);
    NLSString sd = at(h, sb), setd = at(h, setb);
    const int64_t verified = call(h->NLSStringVerify, h, &sd, int64_t{0}, &setd, int64_t{0});
    ASSERT_EQ(verified, outside == std::u32string::npos ? -1 : int64_t(outside));
    ASSERT_EQ(call(h->NLSStringVerifyS, h, sb.data(), int64_t(sb.size()), setb.data(),
                   int64_t(setb.size())),
              verified);
  }
  Bytes aab = encode(GetParam(), U"aab"), none;
  NLSString aabd = at(h, aab), noned = at(h, none);
  EXPECT_EQ(call(h->NLSStringVerify, h, &aabd, int64_t{0}, &noned, int64_t{0}), 0);  // empty set
}

INSTANTIATE_TEST_SUITE_P(Classes, Search, ::testing::ValuesIn(kEncodings));

// Bytes that match inside a character are never a match.
TEST(SearchBoundaries, NoMatchStartsOrEndsInsideACharacter) {
  struct Case {
    int encoding;
    Bytes text, pattern;
    int64_t want;
  };
  const Case cases[] = {
      {135, {0x83, 0x41, 0x41}, {0x41}, 1},               // Shift-JIS trail byte 'A'
      {135, {0x83, 0x41, 0x83, 0x42}, {0x41, 0x83}, -1},  // across two characters
      {134, {0xA4, 0xA2, 0xA4, 0xA4}, {0xA2, 0xA4}, -1},  // EUC-JP: a valid pair straddling
      {134, {0xA4, 0xA2, 0xA4, 0xA4}, {0xA4, 0xA4}, 1},
      {205, {0x81, 0x30, 0x81, 0x30, 0x30}, {0x30}, 1},  // GB18030 four-byte, then '0'
      {20, {0xC3, 0xA9, 0xA9}, {0xA9}, 1},               // stray continuation byte
      {20, {0xE6, 0x97, 0xA5}, {0xE6, 0x97}, -1},        // a match ending inside
      {129, {0x0E, 0x42, 0xC1, 0x0F, 0xC1}, {0xC1}, 1},  // 939: C1 in double-byte mode
      {129, {0xC1, 0x0E, 0x42, 0xC1, 0x0F}, {0x0E, 0x42, 0xC1, 0x0F}, 1},
      {24, {0xD8, 0x3D, 0xDE, 0x00, 0xDE, 0x00}, {0xDE, 0x00}, 1},  // low half of a pair
      {24, {0xD8, 0x3D, 0xDE, 0x00}, {0xD8, 0x3D}, -1},             // high half of a pair
  };
  for (const Case &c : cases) {
    const NLSSMHandle *h = handle(c.encoding);
    EXPECT_EQ(call(h->NLSStringIndexS, h, c.text.data(), int64_t(c.text.size()), c.pattern.data(),
                   int64_t(c.pattern.size())),
              c.want)
        << c.encoding;
  }
}

TEST(SearchKernel, EveryVariantAgreesWithTheScalarRule) {
  std::mt19937 rng(12);
  for (const auto &variant : nlssm::casecmp::simd::search_ops.variants()) {
    if (!kernel::cpu::supports(variant.isa)) continue;
    for (int round = 0; round < 3000; ++round) {
      const int64_t unit = int64_t{1} << (round % 3);
      Bytes text(std::uniform_int_distribution<size_t>(0, 150)(rng));
      for (auto &b : text) b = "ab\0"[rng() % 3];
      const int64_t m = unit * std::uniform_int_distribution<int64_t>(1, 4)(rng);
      Bytes pat(m);
      for (auto &b : pat) b = "ab\0"[rng() % 3];
      if (rng() % 2 && text.size() >= size_t(m)) {  // plant one
        const size_t at = rng() % (text.size() - m + 1);
        std::copy(pat.begin(), pat.end(), text.begin() + at);
      }
      const int64_t n = static_cast<int64_t>(text.size());
      const int64_t from = unit * std::uniform_int_distribution<int64_t>(0, 3)(rng);
      ASSERT_EQ(variant.table->find(text.data(), n, pat.data(), m, unit, from),
                nlssm::casecmp::simd::find_scalar(text.data(), n, pat.data(), m, unit, from))
          << kernel::cpu::name(variant.isa) << " round " << round;
    }
  }
}

}  // namespace
}  // namespace search_test
