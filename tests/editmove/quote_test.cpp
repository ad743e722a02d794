// Add quotes through the handle's slots, with the work buffer's pool use.
#include <string>

#include "edit_fixture.hpp"

namespace editmove_test {
namespace {

using AddQuotesS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                               int64_t *);
using AddQuotes = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, NLSString *,
                              int64_t *);

struct Out {
  int64_t status, result;
  std::vector<uint8_t> text;
};

Out quote(const NLSSMHandle *h, const std::vector<uint8_t> &src, int64_t room) {
  Guarded dst(room);
  Out o{0, 0, {}};
  o.status = slot<AddQuotesS>(h->NLSStringAddQuotesS)(
      h, src.data(), static_cast<int64_t>(src.size()), dst.data(), room, &o.result);
  o.text = dst.text(o.result > 0 ? o.result : room);
  EXPECT_TRUE(dst.intact());
  return o;
}

class Quoting : public ::testing::TestWithParam<int> {};

TEST_P(Quoting, DoublesQuotesAndReportsTheLengthNeeded) {
  const int enc = GetParam();
  const NLSSMHandle *h = handle(enc);
  const int64_t q = static_cast<int64_t>(encode(enc, u"\"").size());
  const std::vector<uint8_t> src = encode(enc, u"a\"b");
  Out o = quote(h, src, 6 * q);
  EXPECT_EQ(o.status, 0) << enc;
  EXPECT_EQ(o.result, 6 * q);
  EXPECT_EQ(o.text, encode(enc, u"\"a\"\"b\""));
  o = quote(h, src, 4 * q);
  EXPECT_EQ(o.status, NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(o.result, -6 * q);
  EXPECT_EQ(o.text, encode(enc, u"\"a\"\""));
  // A quote and its double go together: no lone quote ends the text.
  o = quote(h, src, 3 * q);
  EXPECT_EQ(o.result, -6 * q);
  EXPECT_EQ(o.text, cat(encode(enc, u"\"a"), std::vector<uint8_t>(q, 0xAA)));
  // Whole characters only.
  const std::vector<uint8_t> wide = encode(enc, u"\u00e9\u4e00");
  const int64_t first = static_cast<int64_t>(encode(enc, u"\u00e9").size());
  o = quote(h, wide, q + first + 1);
  EXPECT_EQ(o.status, NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(o.result, -(2 * q + static_cast<int64_t>(wide.size())));
  EXPECT_EQ(o.text, cat(cat(encode(enc, u"\""), encode(enc, u"\u00e9")), {0xAA}));
}

INSTANTIATE_TEST_SUITE_P(Encodings, Quoting,
                         ::testing::Values(20, 24, 25, 26, 27, 134, 135, 119, 205));

TEST(AddQuotes, SingleByteAndModalTextUseTheQuoteByte) {
  for (int enc : {29, 78, 130}) {
    const NLSSMHandle *h = handle(enc);
    const Out o = quote(h, encode(enc, u"a\"b"), 6);
    EXPECT_EQ(o.text, encode(enc, u"\"a\"\"b\"")) << enc;
  }
  // A modal run cut short is closed with a shift-in; an empty one goes.
  const NLSSMHandle *h = handle(130);
  const std::vector<uint8_t> run = {'x', 0x0E, 0x42, 0xC1, 0x42, 0xC2, 0x0F};
  Out o = quote(h, run, 7);
  EXPECT_EQ(o.result, -9);
  EXPECT_EQ(o.text, (std::vector<uint8_t>{0x7F, 'x', 0x0E, 0x42, 0xC1, 0x0F, 0xAA}));
  o = quote(h, run, 4);
  EXPECT_EQ(o.text, (std::vector<uint8_t>{0x7F, 'x', 0xAA, 0xAA}));
}

TEST(AddQuotes, DescriptorFormQuotesCharactersFromTheCursor) {
  const NLSSMHandle *h = handle(20);
  std::vector<uint8_t> src = encode(20, u"xa\u00e9\"z");
  NLSString s{};
  s.buffer = src.data();
  s.length = src.size();
  s.curOffset = s.charIndex = 1;
  Guarded dst(16);
  NLSString d{};
  d.buffer = dst.data();
  d.capacity = 16;
  int64_t result = 0;
  EXPECT_EQ(slot<AddQuotes>(h->NLSStringAddQuotes)(h, &s, 3, &d, &result), 0);
  EXPECT_EQ(result, 7);
  EXPECT_EQ(d.length, 7u);
  EXPECT_EQ(dst.text(7), encode(20, u"\"a\u00e9\"\"\""));
}

// Quoting a text onto itself goes through a work buffer: the stack up to
// 2048 bytes, the pool beyond, given back; a refusing pool cuts the room.
TEST(AddQuotes, OverlapUsesAWorkBufferAndGivesItBack) {
  const NLSSMHandle *h = handle(29);
  auto &pools = host().pools();
  for (int64_t size : {100, 3000}) {
    std::vector<uint8_t> buf(static_cast<size_t>(size + 2), 'q');
    buf[10] = '"';
    const auto before = nlssm::refhost::PoolRegistry::counts_of(h->pool);
    int64_t result = 0;
    EXPECT_EQ(slot<AddQuotesS>(h->NLSStringAddQuotesS)(h, buf.data(), size - 1, buf.data(),
                                                       size + 2, &result),
              0);
    EXPECT_EQ(result, size + 2);
    EXPECT_EQ(buf[0], '"');
    EXPECT_EQ(std::string(buf.begin() + 10, buf.begin() + 14), "q\"\"q");
    EXPECT_EQ(buf[static_cast<size_t>(size + 1)], '"');
    EXPECT_EQ(nlssm::refhost::PoolRegistry::counts_of(h->pool).allocations, before.allocations);
  }
  std::vector<uint8_t> buf(4000, 'q');
  pools.fail_all_allocations(true);
  int64_t result = 0;
  EXPECT_EQ(
      slot<AddQuotesS>(h->NLSStringAddQuotesS)(h, buf.data(), 3000, buf.data(), 4000, &result),
      NLSSM_E_DEST_TOO_SMALL);
  pools.fail_all_allocations(false);
  EXPECT_EQ(result, -3002);
  EXPECT_EQ(buf[0], '"');
  EXPECT_EQ(buf[2047], 'q');
}

}  // namespace
}  // namespace editmove_test
