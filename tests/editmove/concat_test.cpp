// Concatenate through the handle's slots.
#include "edit_fixture.hpp"

namespace editmove_test {
namespace {

using ConcatS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, int64_t *, const uint8_t *,
                            int64_t, uint32_t, int64_t, ...);
using Concat = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t *, const uint8_t *, int64_t,
                           uint32_t, int64_t, ...);

const uint8_t kComma[] = ",";

struct Joined {
  int64_t status, written;
  std::vector<uint8_t> out;
};

// Joins two pieces into a guarded destination of `size` bytes.
Joined join2(const NLSSMHandle *h, const std::vector<uint8_t> &a, const std::vector<uint8_t> &b,
             int64_t size, int64_t length, uint32_t flags, bool separator = true) {
  Guarded dst(size);
  Joined j{};
  j.status = slot<ConcatS>(h->NLSStringConcatS)(
      h, dst.data(), length, &j.written, kComma, separator ? 1 : 0, flags, int64_t{2}, a.data(),
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
  Joined j = join2(h, ab, cd, 5 * w, 5 * w, 0);
  EXPECT_EQ(j.status, 0);
  EXPECT_EQ(j.out, text(u"AB,CD"));
  j = join2(h, ab, cd, 4 * w, 4 * w, NLSSM_EDIT_PAD);
  EXPECT_EQ(j.status, NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(j.written, 3 * w);
  EXPECT_EQ(j.out, cat(text(u"AB,"), blanks(h, w)));
  j = join2(h, ab, cd, 4 * w, 4 * w, 0);
  EXPECT_EQ(j.status, NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(j.out, text(u"AB,C"));
  j = join2(h, ab, cd, 3 * w, 3 * w, 0);
  EXPECT_EQ(j.status, NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(j.written, 3 * w);
  EXPECT_EQ(j.out, text(u"AB,"));
  // Terminated mode: -11 leaves 10 bytes of room (-17: 16) and closes with
  // one zero byte; what follows it is not touched.
  const int64_t term = w <= 2 ? 11 : 17;
  j = join2(h, ab, cd, term, -term, 0, false);
  EXPECT_EQ(j.status, 0);
  EXPECT_EQ(j.written, 4 * w);
  std::vector<uint8_t> want = cat(text(u"ABCD"), {0});
  want.resize(static_cast<size_t>(term), 0xAA);
  EXPECT_EQ(j.out, want);
}

INSTANTIATE_TEST_SUITE_P(Encodings, Examples, ::testing::Values(29, 78, 20, 24, 25, 27, 135));

TEST(Concat, MultiByteCutsStopAtWholeCharacters) {
  for (int enc : {20, 134, 205}) {
    const NLSSMHandle *h = handle(enc);
    const std::vector<uint8_t> a = encode(enc, u"a"), b = encode(enc, u"\u4e00\u4e8c");
    const Joined j = join2(h, a, b, 4, 4, 0, false);
    EXPECT_EQ(j.status, NLSSM_E_DEST_TOO_SMALL);
    const int64_t first = static_cast<int64_t>(encode(enc, u"\u4e00").size());
    EXPECT_EQ(j.written, 1 + first) << enc;
    EXPECT_EQ(j.out, cat(cat(a, encode(enc, u"\u4e00")), blanks(h, 3 - first))) << enc;
  }
}

TEST(Concat, ModalPiecesLeaveTheTextInSingleByteWidth) {
  const NLSSMHandle *h = handle(130);
  const std::vector<uint8_t> run = {0x0E, 0x42, 0xC1, 0x42, 0xC2, 0x0F};
  Joined j = join2(h, bytes("a"), run, 9, 9, 0, false);
  EXPECT_EQ(j.status, 0);
  EXPECT_EQ(j.out, cat(cat(bytes("a"), run), {0x40, 0x40}));
  j = join2(h, bytes("a"), run, 6, 6, 0, false);
  EXPECT_EQ(j.status, NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(j.out, (std::vector<uint8_t>{'a', 0x0E, 0x42, 0xC1, 0x0F, 0x40}));
  j = join2(h, bytes("a"), run, 6, 6, NLSSM_EDIT_PAD, false);
  EXPECT_EQ(j.out, cat(bytes("a"), blanks(h, 5)));

  // A destination whose text stops inside a double-byte run is closed first.
  std::vector<uint8_t> buf = {0x0E, 0x42, 0xC1, 0xAA, 0xAA, 0xAA};
  NLSString d{};
  d.buffer = buf.data();
  d.length = 3;
  d.capacity = 6;
  d.curOffset = 3;
  NLSString piece{};
  std::vector<uint8_t> x = bytes("xy");
  piece.buffer = x.data();
  piece.length = 2;
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
    NLSString d{};
    d.buffer = dst.data();
    d.capacity = 6 * w;
    d.charIndex = w;  // the single-byte member writes here
    d.curOffset = w;  // the others here
    std::vector<uint8_t> a = encode(enc, u"xyz");
    NLSString p{}, unset{};
    p.buffer = a.data();
    p.length = a.size();
    p.curOffset = w;  // from "y"
    unset.curOffset = NLSSM_POS_NONE;
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
