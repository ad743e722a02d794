// Move through the handle's slots, in every class, with guarded
// destinations.
#include <ostream>
#include <random>

#include "edit_fixture.hpp"

namespace editmove_test {
namespace {

using MoveS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                          int64_t *, uint32_t);
using MoveC = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                          int64_t *, int64_t *, uint32_t);

struct Moved {
  int64_t status, bytes, chars;
  std::vector<uint8_t> out;
  bool operator==(const Moved &) const = default;
};
void PrintTo(const Moved &m, std::ostream *os) {
  *os << std::hex << m.status << std::dec << " bytes " << m.bytes << " chars " << m.chars << " out "
      << ::testing::PrintToString(m.out);
}

// Moves through MoveC and MoveS, which must agree, into a guarded room.
Moved move(const NLSSMHandle *h, const std::vector<uint8_t> &src, int64_t srcLen, int64_t room,
           uint32_t flags) {
  Guarded dst(room);
  Moved m{};
  m.status = slot<MoveC>(h->NLSStringMoveC)(h, src.data(), srcLen, dst.data(), room, &m.bytes,
                                            &m.chars, flags);
  int64_t sBytes = -1;
  Guarded again(room);
  const int64_t sStatus =
      slot<MoveS>(h->NLSStringMoveS)(h, src.data(), srcLen, again.data(), room, &sBytes, flags);
  EXPECT_EQ(sStatus, m.status);
  EXPECT_EQ(sBytes, m.bytes);
  EXPECT_EQ(again.all, dst.all);
  m.out = dst.text(room);
  EXPECT_TRUE(dst.intact());
  return m;
}

// Fixed-width classes: whole units, padding in the handle's blank width.
class FixedMove : public ::testing::TestWithParam<int> {};

TEST_P(FixedMove, CopiesPadsAndTruncatesInWholeUnits) {
  const NLSSMHandle *h = handle(GetParam());
  const int64_t w = h->unitWidth;
  const std::vector<uint8_t> src = encode(GetParam(), u"abc");
  const std::vector<uint8_t> odd(w - 1, 0xAA), two(src.begin(), src.begin() + 2 * w);
  // Fits with room to spare: padded with blanks when asked; lengths are cut
  // to whole units.
  EXPECT_EQ(move(h, src, 3 * w + (w - 1), 6 * w + (w - 1), NLSSM_EDIT_PAD),
            (Moved{0, 3 * w, 3, cat(cat(src, blanks(h, 3 * w)), odd)}));
  EXPECT_EQ(move(h, src, 3, 3 * w, NLSSM_EDIT_SOURCE_IN_CHARS), (Moved{0, 3 * w, 3, src}));
  // Exactly full: nothing to pad. One unit short: truncated, not padded.
  EXPECT_EQ(move(h, src, 3 * w, 3 * w, NLSSM_EDIT_PAD), (Moved{0, 3 * w, 3, src}));
  EXPECT_EQ(move(h, src, 3 * w, 3 * w - 1, NLSSM_EDIT_PAD),
            (Moved{NLSSM_E_DEST_TOO_SMALL, 2 * w, 2, cat(two, odd)}));
}

INSTANTIATE_TEST_SUITE_P(Encodings, FixedMove, ::testing::Values(29, 78, 25, 24, 27, 26));

TEST(Move, Wcs2KeepsSurrogatePairsWhole) {
  for (int enc : {24, 25}) {
    const NLSSMHandle *h = handle(enc);
    const std::vector<uint8_t> src = encode(enc, u"a\U0001F600");
    EXPECT_EQ(move(h, src, 6, 4, 0).bytes, 2) << enc;
  }
}

// Variable-width classes stop before the first character that does not fit.
struct Case {
  int encoding;
  std::u16string text;
  int64_t room, bytes, chars;
};

class WholeCharacters : public ::testing::TestWithParam<Case> {};

TEST_P(WholeCharacters, StopBeforeTheCharacterThatDoesNotFit) {
  const Case &c = GetParam();
  const NLSSMHandle *h = handle(c.encoding);
  const std::vector<uint8_t> src = encode(c.encoding, c.text);
  const auto size = static_cast<int64_t>(src.size());
  EXPECT_EQ(move(h, src, size, c.room, NLSSM_EDIT_PAD),
            (Moved{NLSSM_E_DEST_TOO_SMALL, c.bytes, c.chars,
                   cat({src.begin(), src.begin() + c.bytes},
                       std::vector<uint8_t>(c.room - c.bytes, 0xAA))}));
  // The whole text with room to spare, in characters, is padded.
  const auto chars = std::count_if(c.text.begin(), c.text.end(),
                                   [](char16_t u) { return (u & 0xFC00) != 0xDC00; });
  EXPECT_EQ(move(h, src, chars, size + 2, NLSSM_EDIT_PAD | NLSSM_EDIT_SOURCE_IN_CHARS).out,
            cat(src, {0x20, 0x20}));
}

INSTANTIATE_TEST_SUITE_P(
    Encodings, WholeCharacters,
    ::testing::Values(Case{20, u"a\u00e9\u20ac", 5, 3, 2}, Case{20, u"\U0001F600b", 3, 0, 0},
                      Case{135, u"a\u3042\u3044", 4, 3, 2}, Case{134, u"\u3042\uff71", 3, 2, 1},
                      Case{119, u"a\u4e00", 2, 1, 1}, Case{205, u"a\u00a5\u4e00", 6, 5, 2},
                      Case{205, u"\u4e00\u00a5", 5, 2, 1}));

// The raw form finds its cut near the end of the room; the character form
// walks the whole text. Random bytes, rich in lead bytes, must agree.
TEST(Move, CutNearTheRoomAgreesWithAFullWalk) {
  std::mt19937 rng(7);
  const uint8_t pool[] = {'a',  0x30, 0x8E, 0x8F, 0xA1, 0xA2, 0xC3,
                          0xE3, 0xF0, 0x81, 0x82, 0x9F, 0xFE, 0x80};
  for (int enc : {20, 161, 135, 134, 119, 205}) {
    const NLSSMHandle *h = handle(enc);
    for (int round = 0; round < 40; ++round) {
      std::vector<uint8_t> src(90);
      for (auto &b : src) b = pool[rng() % sizeof pool];
      for (int64_t room = 0; room <= 90; room += 7) {
        SCOPED_TRACE(enc);
        move(h, src, 90, room, 0);  // compares the two forms
      }
    }
  }
}

TEST(Move, DoubleByteMembersPadWithTheByte20AndStayQuietWhenNothingFits) {
  NLSSMHandle h = *handle(135);
  h.blankChar[0] = 0x40;
  const std::vector<uint8_t> src = encode(135, u"\u3042");
  EXPECT_EQ(move(&h, src, 2, 4, NLSSM_EDIT_PAD).out, cat(src, {0x20, 0x20}));
  EXPECT_EQ(move(&h, src, 2, 1, NLSSM_EDIT_PAD), (Moved{0, 0, 0, {0xAA}}));
  // UTF-8 pads with the handle's blank.
  h = *handle(20);
  h.blankChar[0] = 0x40;
  EXPECT_EQ(move(&h, bytes("ab"), 2, 3, NLSSM_EDIT_PAD).out, bytes("ab@"));
}

// Modal text: 0E opens a double-byte run, 0F closes it.
TEST(ModalMove, KeepsShiftSequencesBalanced) {
  const NLSSMHandle *h = handle(130);
  const std::vector<uint8_t> run = {0x0E, 0x42, 0xC1, 0x42, 0xC2, 0x0F};  // SO A B SI
  struct {
    std::vector<uint8_t> src;
    int64_t room;
    int64_t status;
    std::vector<uint8_t> out;
    int64_t chars;
  } cases[] = {
      {run, 6, 0, run, 2},
      {cat({0x0F}, bytes("xy")), 3, 0, bytes("xy"), 2},                    // leading SI
      {cat(bytes("ab"), run), 3, NLSSM_E_DEST_TOO_SMALL, bytes("ab"), 2},  // SO cut off
      {cat(bytes("a"), run), 5, NLSSM_E_DEST_TOO_SMALL, {'a', 0x0E, 0x42, 0xC1, 0x0F}, 2},
      {cat(bytes("a"), run), 4, NLSSM_E_DEST_TOO_SMALL, bytes("a"), 1},
      {{0x0E, 0x42, 0xC1}, 4, 0, {0x0E, 0x42, 0xC1, 0x0F}, 1},  // unclosed run
      {{0x0E, 0x42, 0xC1}, 3, NLSSM_E_DEST_TOO_SMALL, {}, 0},
  };
  for (const auto &c : cases) {
    const auto n = static_cast<int64_t>(c.out.size());
    EXPECT_EQ(move(h, c.src, static_cast<int64_t>(c.src.size()), c.room, NLSSM_EDIT_PAD),
              (Moved{c.status, n, c.chars,
                     cat(c.out, c.status == 0 ? blanks(h, c.room - n)
                                              : std::vector<uint8_t>(c.room - n, 0xAA))}));
  }
}

TEST(ModalMove, SameBufferWithoutPaddingIsOnlyMeasured) {
  const NLSSMHandle *h = handle(130);
  std::vector<uint8_t> text = {0x0F, 'a', 'b'};
  int64_t n = 0;
  EXPECT_EQ(slot<MoveS>(h->NLSStringMoveS)(h, text.data(), 3, text.data(), 3, &n, 0), 0);
  EXPECT_EQ(n, 3);
  EXPECT_EQ(text, (std::vector<uint8_t>{0x0F, 'a', 'b'}));
}

}  // namespace
}  // namespace editmove_test
