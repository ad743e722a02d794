// The stated rules of substring, delete, reverse and strip on small texts,
// and the work-buffer failures driven by the reference host's fault
// injection.
#include <algorithm>

#include "edit/delete_byte.hpp"
#include "edit_support.hpp"

namespace edit_test {
namespace {

constexpr uint8_t SO = 0x0E, SI = 0x0F;
constexpr int kModal = 130, kLatin1 = 29, kEbcdic = 78, kUtf8 = 20;

Bytes reverse_s(const NLSSMHandle *h, Bytes b) {
  EXPECT_EQ(call<ReverseS>(h, h->NLSStringReverseS, b.data(), static_cast<int64_t>(b.size())), 0);
  return b;
}

TEST(EditRules, ModalReverseTurnsShiftSequencesRoundAndLosesWhatAnOpeningShiftPushesOut) {
  const NLSSMHandle *h = handle(kModal);
  EXPECT_EQ(reverse_s(h, {SO, 0x44, 0x81, 0x44, 0x82, SI, 0xC3}),
            (Bytes{0xC3, SO, 0x44, 0x82, 0x44, 0x81, SI}));
  EXPECT_EQ(reverse_s(h, {0xC1, SO, 0x44, 0x81, 0x44, 0x82}),
            (Bytes{SO, 0x44, 0x82, 0x44, 0x81, SI}));
}

TEST(EditRules, WorkBuffersBeyondTheStackComeFromThePoolAndFailCleanly) {
  const NLSSMHandle *h = handle(kModal);
  Bytes text(300, 0xC1), list(300, 0xC1);
  const Bytes before = text;
  const PoolWatch pool{h};
  host().pools().fail_allocation_after(1);
  EXPECT_EQ(call<ReverseS>(h, h->NLSStringReverseS, text.data(), int64_t{300}), NLSSM_E_NO_MEMORY);
  host().pools().fail_allocation_after(1);
  EXPECT_EQ(
      call<DeleteS>(h, h->NLSStringDeleteS, text.data(), int64_t{300}, list.data(), int64_t{300}),
      NLSSM_COUNT_NO_MEMORY);
  host().pools().fail_allocation_after(1);
  const std::string literal(300, 'B');
  EXPECT_EQ(
      call<DeleteLitS>(h, h->NLSStringDeleteLitS, text.data(), int64_t{300},
                       reinterpret_cast<const uint8_t *>(literal.data()), int64_t{300}, int64_t{0}),
      NLSSM_COUNT_NO_MEMORY);
  host().pools().fail_allocation_after(0);
  EXPECT_EQ(text, before);
  // With the pool willing, the same calls succeed and give everything back.
  EXPECT_EQ(call<ReverseS>(h, h->NLSStringReverseS, text.data(), int64_t{300}), 0);
  EXPECT_EQ(
      call<DeleteLitS>(h, h->NLSStringDeleteLitS, text.data(), int64_t{300},
                       reinterpret_cast<const uint8_t *>(literal.data()), int64_t{300}, int64_t{0}),
      300);
  EXPECT_EQ(
      call<DeleteS>(h, h->NLSStringDeleteS, text.data(), int64_t{300}, list.data(), int64_t{300}),
      0);
  EXPECT_EQ(text, Bytes(300, 0x40));
  EXPECT_TRUE(pool.balanced());
}

TEST(EditRules, ModalDeleteRewritesShiftSequencesAroundTheCharactersKept) {
  const NLSSMHandle *h = handle(kModal);
  Bytes text{SO, 0x44, 0x81, SI, 0xC2, SO, 0x44, 0x83, SI, 0xC4};
  const Bytes list{0xC2, 0xC4};
  EXPECT_EQ(
      call<DeleteS>(h, h->NLSStringDeleteS, text.data(), int64_t{10}, list.data(), int64_t{2}), 6);
  EXPECT_EQ(text, (Bytes{SO, 0x44, 0x81, 0x44, 0x83, SI, 0x40, 0x40, 0x40, 0x40}));
  // Deleting inside a double-byte run that more text follows keeps the
  // width for that text: the blanks go before the run.
  Bytes run{0xC1, SO, 0x44, 0x81, 0x44, 0x82, 0x44, 0x83, SI};
  Bytes one{SO, 0x44, 0x81, SI};
  NLSString t = at_char(h, run, run.size(), 0), l = at_char(h, one, one.size(), 0);
  EXPECT_EQ(call<Delete>(h, h->NLSStringDelete, &t, int64_t{3}, &l, int64_t{0}, int64_t{0}), 2);
  EXPECT_EQ(run, (Bytes{0xC1, 0x40, 0x40, SO, 0x44, 0x82, 0x44, 0x83, SI}));
}

TEST(EditRules, DeleteWithAnUnsetListCountsTheRangeAndChangesNothing) {
  for (int enc : kEncodings) {
    const NLSSMHandle *h = handle(enc);
    const Bytes abc = encode(h, U"ABC");
    Bytes text = abc, list = abc;
    NLSString t = at_char(h, text, text.size(), 0), unset = at_char(h, list, 0, 0);
    EXPECT_EQ(call<Delete>(h, h->NLSStringDelete, &t, int64_t{2}, &unset, int64_t{0}, int64_t{0}),
              2);
    EXPECT_EQ(call<Delete>(h, h->NLSStringDelete, &t, int64_t{9}, &unset, int64_t{0}, int64_t{0}),
              3);
    EXPECT_EQ(text, abc) << enc;
  }
}

TEST(EditRules, SingleByteSubstringFailsAtOnceWithoutRoomAndNeverPadsATruncatedCopy) {
  const NLSSMHandle *h = handle(kLatin1);
  Bytes src{'a', 'b', 'c', 'd'}, dst(6, 0xEE);
  NLSString s = at_char(h, src, 4, 1), d{dst.data(), 0, 3, 3, -9, -9, -1, 0, 0, 0};
  int64_t copied = -1;
  EXPECT_EQ(call<SubStr>(h, h->NLSStringSubStr, &s, &d, int64_t{0}, &copied, int64_t{1}),
            NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(copied, 0);
  d.charIndex = 1;
  EXPECT_EQ(call<SubStr>(h, h->NLSStringSubStr, &s, &d, int64_t{0}, &copied, int64_t{1}),
            NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(copied, 2);
  EXPECT_EQ(d.length, 3u);
  EXPECT_EQ(dst, (Bytes{0xEE, 'b', 'c', 0xEE, 0xEE, 0xEE}));
  // Within one buffer the copy is a move, whichever way the ranges overlap.
  NLSString same = at_char(h, src, 4, 0);
  same.charIndex = 1;
  EXPECT_EQ(call<SubStr>(h, h->NLSStringSubStr, &s, &same, int64_t{3}, &copied, int64_t{0}), 0);
  EXPECT_EQ(src, (Bytes{'a', 'b', 'c', 'd'}));
  same.charIndex = 2;
  NLSString first = at_char(h, src, 4, 0);
  EXPECT_EQ(call<SubStr>(h, h->NLSStringSubStr, &first, &same, int64_t{2}, &copied, int64_t{0}), 0);
  EXPECT_EQ(src, (Bytes{'a', 'b', 'a', 'b'}));
}

TEST(EditRules, ModalSubstringBalancesShiftsAtTheJoinAndGivesBackACharacterForTheShiftIn) {
  const NLSSMHandle *h = handle(kModal);
  Bytes src{SO, 0x44, 0x81, 0x44, 0x82, 0x44, 0x83, SI};
  Bytes dst(8, 0xEE);
  NLSString s = at_char(h, src, src.size(), 0), d{dst.data(), 0, 6, 0, -9, -9, -1, 0, 0, 0};
  int64_t copied = -1;
  // Room 6: SO, two characters and SI would need 6 with three characters
  // asked for, so the third is left out.
  EXPECT_EQ(call<SubStr>(h, h->NLSStringSubStr, &s, &d, int64_t{3}, &copied, int64_t{0}),
            NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(Bytes(dst.begin(), dst.begin() + copied), (Bytes{SO, 0x44, 0x81, 0x44, 0x82, SI}));
  EXPECT_EQ(d.curOffset, 1);
  EXPECT_EQ(d.charKind, 4u);
  // Room 5 fits SO, both characters, but no shift-in: one is given back.
  d = {dst.data(), 0, 5, 0, -9, -9, -1, 0, 0, 0};
  EXPECT_EQ(call<SubStr>(h, h->NLSStringSubStr, &s, &d, int64_t{2}, &copied, int64_t{0}),
            NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(Bytes(dst.begin(), dst.begin() + copied), (Bytes{SO, 0x44, 0x81, SI}));
  // A single-byte source written where the destination is in double-byte
  // width is preceded by a shift-in.
  Bytes tail{0xC1, 0xC2}, into{SO, 0x44, 0x81, 0x44, 0x82, SI, 0xEE, 0xEE};
  NLSString t = at_char(h, tail, 2, 0), d2 = at_char(h, into, 6, 1);
  EXPECT_EQ(call<SubStr>(h, h->NLSStringSubStr, &t, &d2, int64_t{2}, &copied, int64_t{0}), 0);
  EXPECT_EQ(into, (Bytes{SO, 0x44, 0x81, SI, 0xC1, 0xC2, 0xEE, 0xEE}));
  EXPECT_EQ(d2.curOffset, 4);
}

TEST(EditRules, SubstringOfAllThatRemainsGoesThroughTheMove) {
  const NLSSMHandle *h = handle(kUtf8);
  if (h->NLSStringMoveS == nullptr) GTEST_SKIP() << "the handle's NLSStringMoveS slot is empty";
  Bytes src = encode(h, U"x\u00E9\u3042z"), dst(10, 0xEE);
  NLSString s = at_char(h, src, src.size(), 1), d{dst.data(), 0, 8, 0, -9, -9, -1, 0, 0, 0};
  int64_t copied = -1;
  EXPECT_EQ(call<SubStr>(h, h->NLSStringSubStr, &s, &d, int64_t{0}, &copied, int64_t{1}), 0);
  EXPECT_EQ(copied, 6);
  EXPECT_EQ(d.length, 8u);
  EXPECT_EQ(Bytes(dst.begin(), dst.begin() + 8), encode(h, U"\u00E9\u3042z  "));
  EXPECT_TRUE(guard_intact(dst, 8));
}

// Found by fuzzing: modal strip took a double-byte pair for one character
// only when its bytes carried the lead and trail flags, so the C form could
// answer more characters than it was given.
TEST(EditRules, ModalStripCountsEveryDoubleBytePairAsOneCharacter) {
  const NLSSMHandle *h = handle(kModal);
  Bytes text{0xC1, SO, 0x3E, 0x3E, 0x01, 0x08, SI, 0x40};  // A, two pairs, a blank
  EXPECT_EQ(call<StripS>(h, h->NLSStringStripC, text.data(), int64_t{4}, int64_t{0}), 3);
  const NLSString s = at_char(h, text, text.size(), 0);
  EXPECT_EQ(call<Strip>(h, h->NLSStringStrip, &s, int64_t{0}, int64_t{0}), 3);
  EXPECT_EQ(call<StripS>(h, h->NLSStringStripS, text.data(), int64_t(text.size()), int64_t{0}), 7);
}

TEST(EditRules, StripKnowsOnlyTheEncodingsBlankAndTheseWhiteSpaceSequences) {
  const NLSSMHandle *e = handle(kEbcdic), *u = handle(kUtf8);
  const Bytes ebcdic{0xC1, 0x20, 0x40, 0x40};
  EXPECT_EQ(call<StripS>(e, e->NLSStringStripS, ebcdic.data(), int64_t{4}, int64_t{0}), 2);
  EXPECT_EQ(call<StripS>(e, e->NLSStringStripS, ebcdic.data() + 2, int64_t{2}, int64_t{0}), 0);
  auto strip_all = [&](const std::string &s) {
    return call<StripS>(u, u->NLSStringStripS, reinterpret_cast<const uint8_t *>(s.data()),
                        static_cast<int64_t>(s.size()), int64_t{1});
  };
  EXPECT_EQ(strip_all("a\xE3\x80\x80\t"), 1);
  EXPECT_EQ(strip_all("a\xE1\x9A\x80"), 4);  // U+1680 itself stays
  EXPECT_EQ(strip_all("a\xE1\x81\xA8\xC2\xA0\xE2\x80\x8A"), 1);
  // The single-byte member looks at the first n bytes only; UTF-8 strips
  // the whole text and then counts at most n characters, or with bit 0
  // counts them all.
  Bytes latin{'a', ' ', 'b', ' '};
  const NLSString l = at_char(handle(kLatin1), latin, 4, 0);
  EXPECT_EQ(
      call<Strip>(handle(kLatin1), handle(kLatin1)->NLSStringStrip, &l, int64_t{2}, int64_t{0}), 1);
  Bytes text{'a', 'b', 'c', ' ', ' '};
  const NLSString s = at_char(u, text, 5, 0);
  EXPECT_EQ(call<Strip>(u, u->NLSStringStrip, &s, int64_t{2}, int64_t{0}), 2);
  EXPECT_EQ(call<Strip>(u, u->NLSStringStrip, &s, int64_t{2}, int64_t{1}), 3);
}

// Each vector variant of the one-byte delete that this processor runs
// against the scalar rule, over bytes that hold the byte rarely to often
// and lengths around the register sizes.
TEST(EditRules, VectorByteDeleteAgreesWithTheScalarRule) {
  std::mt19937 rng(5);
  for (const auto &variant : nlssm::edit::delete_byte_ops.variants()) {
    if (!kernel::cpu::supports(variant.isa)) continue;
    for (int round = 0; round < 2000; ++round) {
      Bytes text(std::uniform_int_distribution<size_t>(0, 100)(rng));
      const int spread = 1 << (round % 8);
      for (uint8_t &b : text) b = static_cast<uint8_t>(rng() % spread);
      Bytes want = text, got = text;
      const int64_t n = static_cast<int64_t>(text.size());
      const int64_t kept = nlssm::edit::drop_byte_scalar(want.data(), n, 0);
      ASSERT_EQ(variant.table->drop(got.data(), n, 0), kept) << kernel::cpu::name(variant.isa);
      ASSERT_TRUE(std::equal(want.begin(), want.begin() + kept, got.begin()));
    }
  }
}

}  // namespace
}  // namespace edit_test
