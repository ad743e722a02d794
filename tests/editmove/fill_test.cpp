// Fill through the handle's slots: descriptor, raw and literal forms.
#include "edit_fixture.hpp"

namespace editmove_test {
namespace {

using Fill = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const NLSString *, int64_t *);
using FillS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t,
                          int64_t *);
using FillLit = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const uint8_t *, int64_t,
                            int64_t *);

NLSString over(uint8_t *p, int64_t length, int64_t capacity, int64_t at) {
  NLSString s{};
  s.buffer = p;
  s.length = static_cast<uint64_t>(length);
  s.capacity = static_cast<uint64_t>(capacity);
  s.charIndex = at;
  s.curOffset = at;
  s.nextOffset = NLSSM_POS_NONE;
  s.prevOffset = NLSSM_POS_NO_PREVIOUS;
  return s;
}

struct Filled {
  int64_t status, written;
  std::vector<uint8_t> out;
  uint64_t length;
};

// Fills a destination of `room` bytes holding `used` bytes, from `at`.
Filled fill(const NLSSMHandle *h, std::vector<uint8_t> ch, int64_t chAt, int64_t room, int64_t at,
            int64_t length) {
  Guarded dst(room);
  NLSString d = over(dst.data(), at, room, at);
  NLSString c =
      over(ch.data(), static_cast<int64_t>(ch.size()), static_cast<int64_t>(ch.size()), chAt);
  Filled f{};
  f.written = -1;
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
  Filled f = fill(h, bytes("x"), 0, 6, 2, 3);
  EXPECT_EQ(f.status, 0);
  EXPECT_EQ(f.written, 3);
  EXPECT_EQ(f.out, bytes("\xAA\xAAxxx\xAA"));
  EXPECT_EQ(f.length, 5u);
  f = fill(h, bytes("x"), 0, 6, 2, 0);
  EXPECT_EQ(f.out, bytes("\xAA\xAAxxxx"));
  f = fill(h, bytes("x"), 0, 6, 2, 9);
  EXPECT_EQ(f.status, NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(f.written, 4);
  // An unset fill character does nothing.
  f = fill(h, bytes("x"), NLSSM_POS_NONE, 6, 2, 3);
  EXPECT_EQ(f.status, 0);
  EXPECT_EQ(f.written, -1);
}

TEST(Fill, WideUnitsFollowTheFourByteRule) {
  const NLSSMHandle *h = handle(26);
  const std::vector<uint8_t> star = {0, 0, 0, '*'};
  const std::vector<uint8_t> aa = {0xAA, 0xAA};
  struct {
    int64_t room, length, status, written;
    std::vector<uint8_t> out;
  } cases[] = {
      {12, 8, 0, 2, times(star, 2, {0xAA, 0xAA, 0xAA, 0xAA})},
      {12, 2, 0, 3, times(star, 3)},  // a length under one unit fills the room
      {10, 0, NLSSM_E_DEST_TOO_SMALL, 2, times(star, 2, aa)},
      {12, 16, NLSSM_E_DEST_TOO_SMALL, 3, times(star, 3)},
  };
  for (const auto &c : cases) {
    const Filled f = fill(h, star, 0, c.room, 0, c.length);
    EXPECT_EQ(f.status, c.status) << c.length;
    EXPECT_EQ(f.written, c.written) << c.length;
    EXPECT_EQ(f.out, c.out) << c.length;
  }
  // Two-byte units with a surrogate pair as the fill character.
  const NLSSMHandle *w2 = handle(25);
  const std::vector<uint8_t> pair = encode(25, u"\U0001F600");
  const Filled f = fill(w2, cat({'a', 0}, pair), 2, 10, 0, 0);
  EXPECT_EQ(f.status, NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(f.out, times(pair, 2, aa));
}

TEST(Fill, ModalWrapsDoubleByteCharactersInShifts) {
  const NLSSMHandle *h = handle(130);
  const std::vector<uint8_t> run = {'a', 0x0E, 0x42, 0xC1, 0x0F};
  Filled f = fill(h, run, 2, 8, 0, 0);
  EXPECT_EQ(f.status, 0);
  EXPECT_EQ(f.written, 3);
  EXPECT_EQ(f.out, (std::vector<uint8_t>{0x0E, 0x42, 0xC1, 0x42, 0xC1, 0x42, 0xC1, 0x0F}));
  f = fill(h, run, 2, 8, 0, 6);
  EXPECT_EQ(f.written, 2);
  EXPECT_EQ(f.length, 6u);
  f = fill(h, run, 0, 3, 0, 0);  // a single-byte character is a byte fill
  EXPECT_EQ(f.out, bytes("aaa"));
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

TEST(FillLit, ConvertsTheLiteralsFirstCharacter) {
  for (int enc : {29, 78, 20, 161, 24, 26, 130, 135, 205}) {
    const NLSSMHandle *h = handle(enc);
    const std::vector<uint8_t> star = enc == 161 ? std::vector<uint8_t>{0x5C} : encode(enc, u"*");
    const int64_t room = 3 * static_cast<int64_t>(star.size());
    Guarded raw(room), plain(room);
    int64_t written = 0;
    EXPECT_EQ(slot<FillS>(h->NLSStringFillLitS)(
                  h, raw.data(), room, reinterpret_cast<const uint8_t *>("*#"), 2, &written),
              0)
        << enc;
    EXPECT_EQ(raw.text(room), times(star, 3)) << enc;
    NLSString d = over(plain.data(), 0, room, 0);
    EXPECT_EQ(slot<FillLit>(h->NLSStringFillLit)(h, &d, 0, reinterpret_cast<const uint8_t *>("*"),
                                                 1, &written),
              0);
    EXPECT_EQ(written, 3) << enc;
    EXPECT_EQ(plain.text(room), times(star, 3)) << enc;
  }
}

}  // namespace
}  // namespace editmove_test

namespace editmove_test {
namespace {

// The converted fill character and separator live in a small stack buffer:
// a pool that refuses every allocation changes nothing, and nothing stays
// allocated.
TEST(FillLit, ConvertedCharactersNeedNoPool) {
  using ConcatS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, int64_t *, const uint8_t *,
                              int64_t, uint32_t, int64_t, ...);
  auto &pools = host().pools();
  for (int enc : {29, 20, 161, 24, 26, 130, 135, 134, 119, 205}) {
    const NLSSMHandle *h = handle(enc);
    const auto before = nlssm::refhost::PoolRegistry::counts_of(h->pool);
    pools.fail_all_allocations(true);
    uint8_t out[16];
    int64_t written = 0;
    const int64_t fill = slot<FillS>(h->NLSStringFillLitS)(
        h, out, 8, reinterpret_cast<const uint8_t *>("*"), 1, &written);
    const uint8_t piece[] = {'a', 0, 0, 0};
    const int64_t join = slot<ConcatS>(h->NLSStringConcatS)(
        h, out, 16, &written, reinterpret_cast<const uint8_t *>(","), 1, 0, int64_t{2}, piece,
        int64_t{0}, piece, int64_t{0});
    pools.fail_all_allocations(false);
    EXPECT_EQ(fill, 0) << enc;
    EXPECT_EQ(join, 0) << enc;
    EXPECT_EQ(nlssm::refhost::PoolRegistry::counts_of(h->pool).allocations, before.allocations);
  }
}

}  // namespace
}  // namespace editmove_test
