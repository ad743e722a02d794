// Fill through the handle's slots: descriptor, raw and literal forms.
#include <ostream>

#include "edit_fixture.hpp"

namespace editmove_test {
namespace {

using Fill = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const NLSString *, int64_t *);
using FillS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t,
                          int64_t *);
using FillLit = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const uint8_t *, int64_t,
                            int64_t *);

struct Filled {
  int64_t status, written;
  std::vector<uint8_t> out;
  uint64_t length;  // the destination's, after
  bool operator==(const Filled &) const = default;
};
void PrintTo(const Filled &f, std::ostream *os) {
  *os << std::hex << f.status << std::dec << " written " << f.written << " length " << f.length
      << " out " << ::testing::PrintToString(f.out);
}

// Fills a guarded destination of `room` bytes, holding `at` bytes and
// positioned there, with the character of `ch` at `chAt`.
Filled fill(const NLSSMHandle *h, std::vector<uint8_t> ch, int64_t chAt, int64_t room, int64_t at,
            int64_t length) {
  Guarded dst(room);
  NLSString d = over(dst.data(), at, room, at);
  const auto n = static_cast<int64_t>(ch.size());
  NLSString c = over(ch.data(), n, n, chAt);
  Filled f{0, -1, {}, 0};
  f.status = slot<Fill>(h->NLSStringFill)(h, &d, length, &c, &f.written);
  f.out = dst.text(room);
  f.length = d.length;
  EXPECT_TRUE(dst.intact());
  return f;
}

std::vector<uint8_t> times(std::vector<uint8_t> unit, int n, std::vector<uint8_t> tail = {}) {
  std::vector<uint8_t> out;
  for (int i = 0; i < n; ++i) out = cat(out, unit);
  return cat(out, tail);
}

TEST(Fill, SingleByteWritesFromCharIndexUpToTheRoom) {
  const NLSSMHandle *h = handle(29);
  const auto x = bytes("x");
  EXPECT_EQ(fill(h, x, 0, 6, 2, 3), (Filled{0, 3, bytes("\xAA\xAAxxx\xAA"), 5}));
  EXPECT_EQ(fill(h, x, 0, 6, 2, 0), (Filled{0, 4, bytes("\xAA\xAAxxxx"), 6}));
  EXPECT_EQ(fill(h, x, 0, 6, 2, 9), (Filled{kShort, 4, bytes("\xAA\xAAxxxx"), 6}));
  // An unset fill character does nothing.
  EXPECT_EQ(fill(h, x, NLSSM_POS_NONE, 6, 2, 3),
            (Filled{0, -1, bytes("\xAA\xAA\xAA\xAA\xAA\xAA"), 2}));
}

TEST(Fill, WideUnitsFillWholeCharacters) {
  const NLSSMHandle *h = handle(26);
  const std::vector<uint8_t> star = {0, 0, 0, '*'}, aa = {0xAA, 0xAA};
  EXPECT_EQ(fill(h, star, 0, 12, 0, 8), (Filled{0, 2, times(star, 2, cat(aa, aa)), 8}));
  // A length under one unit fills the room, as 0 does.
  EXPECT_EQ(fill(h, star, 0, 12, 0, 2), (Filled{0, 3, times(star, 3), 12}));
  EXPECT_EQ(fill(h, star, 0, 10, 0, 0), (Filled{kShort, 2, times(star, 2, aa), 8}));
  EXPECT_EQ(fill(h, star, 0, 12, 0, 16), (Filled{kShort, 3, times(star, 3), 12}));
  // Two-byte units with a surrogate pair as the fill character.
  const std::vector<uint8_t> pair = encode(25, u"\U0001F600");
  EXPECT_EQ(fill(handle(25), cat({'a', 0}, pair), 2, 10, 0, 0),
            (Filled{kShort, 2, times(pair, 2, aa), 8}));
}

TEST(Fill, ModalWrapsDoubleByteCharactersInShifts) {
  const NLSSMHandle *h = handle(130);
  const std::vector<uint8_t> run = {'a', 0x0E, 0x42, 0xC1, 0x0F}, ab = {0x42, 0xC1};
  EXPECT_EQ(fill(h, run, 2, 8, 0, 0), (Filled{0, 3, cat(cat({0x0E}, times(ab, 3)), {0x0F}), 8}));
  EXPECT_EQ(fill(h, run, 2, 8, 0, 6).length, 6u);
  EXPECT_EQ(fill(h, run, 0, 3, 0, 0).out, bytes("aaa"));  // a single-byte character
}

TEST(FillS, RepeatsTheWholeCharacter) {
  struct {
    int encoding;
    std::vector<uint8_t> ch;
    int64_t length, status;
    std::vector<uint8_t> out;
  } cases[] = {
      {20, {0xC3, 0xA9}, 5, NLSSM_E_DEST_TOO_SMALL, {0xC3, 0xA9, 0xC3, 0xA9, 0xAA}},
      {135, {0x82, 0xA0}, 4, 0, {0x82, 0xA0, 0x82, 0xA0}},
      {29, {'-'}, 3, 0, bytes("---")},
      {27, {'*', 0, 0, 0, 'x'}, 9, NLSSM_E_DEST_TOO_SMALL, {'*', 0, 0, 0, '*', 0, 0, 0, 0xAA}},
      {130, {0x0E, 0x42, 0xC1, 0x0F}, 5, NLSSM_E_DEST_TOO_SMALL, {0x0E, 0x42, 0xC1, 0x0F, 0xAA}},
  };
  for (const auto &c : cases) {
    const NLSSMHandle *h = handle(c.encoding);
    Guarded dst(c.length);
    int64_t written = -1;
    EXPECT_EQ(slot<FillS>(h->NLSStringFillS)(h, dst.data(), c.length, c.ch.data(),
                                             static_cast<int64_t>(c.ch.size()), &written),
              c.status)
        << c.encoding;
    EXPECT_EQ(dst.text(c.length), c.out) << c.encoding;
    EXPECT_EQ(written, static_cast<int64_t>(c.out.size()) - (c.status == 0 ? 0 : 1));
    EXPECT_TRUE(dst.intact());
    EXPECT_EQ(slot<FillS>(h->NLSStringFillS)(h, dst.data(), c.length, c.ch.data(), 0, &written),
              NLSSM_E_NULL_ARGUMENT);
  }
}

// The converted character lives on the stack: a pool that refuses every
// allocation changes nothing.
TEST(FillLit, ConvertsTheLiteralsFirstCharacter) {
  for (int enc : {29, 78, 20, 161, 24, 26, 130, 135, 205}) {
    const NLSSMHandle *h = handle(enc);
    const std::vector<uint8_t> star = enc == 161 ? std::vector<uint8_t>{0x5C} : encode(enc, u"*");
    const int64_t room = 3 * static_cast<int64_t>(star.size());
    Guarded raw(room), plain(room);
    NLSString d = over(plain.data(), 0, room, 0);
    int64_t written = 0;
    const auto *lit = reinterpret_cast<const uint8_t *>("*#");
    host().pools().fail_all_allocations(true);
    EXPECT_EQ(slot<FillS>(h->NLSStringFillLitS)(h, raw.data(), room, lit, 2, &written), 0) << enc;
    EXPECT_EQ(slot<FillLit>(h->NLSStringFillLit)(h, &d, 0, lit, 1, &written), 0);
    host().pools().fail_all_allocations(false);
    EXPECT_EQ(written, 3) << enc;
    EXPECT_EQ(raw.text(room), times(star, 3)) << enc;
    EXPECT_EQ(plain.text(room), times(star, 3)) << enc;
  }
}

}  // namespace
}  // namespace editmove_test
