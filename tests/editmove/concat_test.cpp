// Concatenate through the handle's slots.
#include "edit_fixture.hpp"

namespace editmove_test {
namespace {

using ConcatS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, int64_t *, const uint8_t *,
                            int64_t, uint32_t, int64_t, ...);
using Concat = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t *, const uint8_t *, int64_t,
                           uint32_t, int64_t, ...);

const uint8_t kComma[] = ",";

// Joins two pieces into a guarded destination of `size` bytes.
Result join2(const NLSSMHandle *h, const std::vector<uint8_t> &a, const std::vector<uint8_t> &b,
             int64_t size, int64_t length, uint32_t flags, bool separator = true) {
  Guarded dst(size);
  Result j{};
  j.status = slot<ConcatS>(h->NLSStringConcatS)(
      h, dst.data(), length, &j.count, kComma, separator ? 1 : 0, flags, int64_t{2}, a.data(),
      static_cast<int64_t>(a.size()), b.data(), static_cast<int64_t>(b.size()));
  j.out = dst.text(size);
  EXPECT_TRUE(dst.intact());
  return j;
}

// The worked examples, in every fixed-width class: AB and CD with a comma.
class Examples : public ::testing::TestWithParam<int> {};

TEST_P(Examples, RoomDecidesWhatIsCopied) {
  const int enc = GetParam();
  const NLSSMHandle *h = handle(enc);
  const int64_t w = static_cast<int64_t>(h->unitWidth);
  auto text = [enc](const char16_t *s) { return encode(enc, s); };
  const std::vector<uint8_t> ab = text(u"AB"), cd = text(u"CD");
  EXPECT_EQ(join2(h, ab, cd, 5 * w, 5 * w, 0), (Result{0, 5 * w, text(u"AB,CD")}));
  EXPECT_EQ(join2(h, ab, cd, 4 * w, 4 * w, NLSSM_EDIT_PAD),
            (Result{kShort, 3 * w, cat(text(u"AB,"), blanks(h, w))}));
  EXPECT_EQ(join2(h, ab, cd, 4 * w, 4 * w, 0), (Result{kShort, 4 * w, text(u"AB,C")}));
  EXPECT_EQ(join2(h, ab, cd, 3 * w, 3 * w, 0), (Result{kShort, 3 * w, text(u"AB,")}));
  // Terminated mode: -11 leaves 10 bytes of room (-17: 16) and closes with
  // one zero byte; what follows it is not touched.
  const int64_t term = w <= 2 ? 11 : 17;
  std::vector<uint8_t> want = cat(text(u"ABCD"), {0});
  want.resize(static_cast<size_t>(term), 0xAA);
  EXPECT_EQ(join2(h, ab, cd, term, -term, 0, false), (Result{0, 4 * w, want}));
}

INSTANTIATE_TEST_SUITE_P(Encodings, Examples, ::testing::Values(29, 78, 20, 24, 25, 27, 135));

TEST(Concat, MultiByteCutsStopAtWholeCharacters) {
  for (int enc : {20, 134, 205}) {
    const NLSSMHandle *h = handle(enc);
    const std::vector<uint8_t> a = encode(enc, u"a"), b = encode(enc, u"\u4e00\u4e8c");
    const std::vector<uint8_t> first = encode(enc, u"\u4e00");
    const auto n = static_cast<int64_t>(first.size());
    EXPECT_EQ(join2(h, a, b, 4, 4, 0, false),
              (Result{kShort, 1 + n, cat(cat(a, first), blanks(h, 3 - n))}));
  }
}

TEST(Concat, ModalPiecesLeaveTheTextInSingleByteWidth) {
  const NLSSMHandle *h = handle(130);
  const std::vector<uint8_t> run = {0x0E, 0x42, 0xC1, 0x42, 0xC2, 0x0F};
  EXPECT_EQ(join2(h, bytes("a"), run, 9, 9, 0, false),
            (Result{0, 7, cat(cat(bytes("a"), run), {0x40, 0x40})}));
  EXPECT_EQ(join2(h, bytes("a"), run, 6, 6, 0, false),
            (Result{kShort, 5, {'a', 0x0E, 0x42, 0xC1, 0x0F, 0x40}}));
  EXPECT_EQ(join2(h, bytes("a"), run, 6, 6, NLSSM_EDIT_PAD, false),
            (Result{kShort, 1, cat(bytes("a"), blanks(h, 5))}));

  // A destination whose text stops inside a double-byte run is closed first.
  std::vector<uint8_t> buf = {0x0E, 0x42, 0xC1, 0xAA, 0xAA, 0xAA}, x = bytes("xy");
  NLSString d = over(buf.data(), 3, 6, 3), piece = over(x.data(), 2, 2, 0);
  int64_t length = 0;
  EXPECT_EQ(slot<Concat>(h->NLSStringConcat)(h, &d, &length, nullptr, 0, 0, int64_t{1}, &piece), 0);
  EXPECT_EQ(buf, (std::vector<uint8_t>{0x0E, 0x42, 0xC1, 0x0F, 'x', 'y'}));
  EXPECT_EQ(length, 3);
  EXPECT_EQ(d.length, 6u);
}

TEST(Concat, DescriptorFormsWriteFromTheirOffsetAndStopAtAnUnsetPiece) {
  for (int enc : {29, 25}) {
    const NLSSMHandle *h = handle(enc);
    const int64_t w = static_cast<int64_t>(h->unitWidth);
    Guarded dst(6 * w);
    // Byte w is charIndex for the single-byte member, curOffset for the others.
    NLSString d = over(dst.data(), 0, 6 * w, w);
    std::vector<uint8_t> a = encode(enc, u"xyz");
    NLSString p = over(a.data(), 3 * w, 3 * w, w), unset = over(a.data(), 0, 0, NLSSM_POS_NONE);
    int64_t length = 0;  // all the room up to the capacity
    EXPECT_EQ(
        slot<Concat>(h->NLSStringConcat)(h, &d, &length, kComma, 1, 0, int64_t{3}, &p, &p, &unset),
        0);
    EXPECT_EQ(length, 5 * w);
    EXPECT_EQ(d.length, static_cast<uint64_t>(6 * w));
    EXPECT_EQ(dst.text(6 * w), cat(std::vector<uint8_t>(w, 0xAA), encode(enc, u"yz,yz")));
    EXPECT_TRUE(dst.intact());
  }
}

}  // namespace
}  // namespace editmove_test
