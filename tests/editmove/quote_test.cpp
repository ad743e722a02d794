// Add quotes through the handle's slots, with the work buffer's pool use.
#include <string>

#include "edit_fixture.hpp"

namespace editmove_test {
namespace {

using AddQuotesS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                               int64_t *);
using AddQuotes = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, NLSString *,
                              int64_t *);

// Quotes into a guarded room; the text is what the result counts, or the
// whole room when it is negative.
Result quote(const NLSSMHandle *h, const std::vector<uint8_t> &src, int64_t room) {
  Guarded dst(room);
  Result o{};
  o.status = slot<AddQuotesS>(h->NLSStringAddQuotesS)(
      h, src.data(), static_cast<int64_t>(src.size()), dst.data(), room, &o.count);
  o.out = dst.text(o.count > 0 ? o.count : room);
  EXPECT_TRUE(dst.intact());
  return o;
}

class Quoting : public ::testing::TestWithParam<int> {};

TEST_P(Quoting, DoublesQuotesAndReportsTheLengthNeeded) {
  const int enc = GetParam();
  const NLSSMHandle *h = handle(enc);
  const int64_t q = static_cast<int64_t>(encode(enc, u"\"").size());
  const std::vector<uint8_t> src = encode(enc, u"a\"b");
  EXPECT_EQ(quote(h, src, 6 * q), (Result{0, 6 * q, encode(enc, u"\"a\"\"b\"")}));
  EXPECT_EQ(quote(h, src, 4 * q), (Result{kShort, -6 * q, encode(enc, u"\"a\"\"")}));
  // A quote and its double go together: no lone quote ends the text.
  EXPECT_EQ(quote(h, src, 3 * q),
            (Result{kShort, -6 * q, cat(encode(enc, u"\"a"), std::vector<uint8_t>(q, 0xAA))}));
  // Whole characters only.
  const std::vector<uint8_t> wide = encode(enc, u"\u00e9\u4e00"), e = encode(enc, u"\u00e9");
  const auto n = static_cast<int64_t>(e.size());
  EXPECT_EQ(quote(h, wide, q + n + 1), (Result{kShort, -(2 * q + static_cast<int64_t>(wide.size())),
                                               cat(cat(encode(enc, u"\""), e), {0xAA})}));
}

INSTANTIATE_TEST_SUITE_P(Encodings, Quoting,
                         ::testing::Values(20, 24, 25, 26, 27, 134, 135, 119, 205));

TEST(AddQuotes, SingleByteAndModalTextUseTheQuoteByte) {
  for (int enc : {29, 78, 130}) {
    const NLSSMHandle *h = handle(enc);
    EXPECT_EQ(quote(h, encode(enc, u"a\"b"), 6).out, encode(enc, u"\"a\"\"b\"")) << enc;
  }
  // A modal run cut short is closed with a shift-in; an empty one goes.
  const NLSSMHandle *h = handle(130);
  const std::vector<uint8_t> run = {'x', 0x0E, 0x42, 0xC1, 0x42, 0xC2, 0x0F};
  EXPECT_EQ(quote(h, run, 7), (Result{kShort, -9, {0x7F, 'x', 0x0E, 0x42, 0xC1, 0x0F, 0xAA}}));
  EXPECT_EQ(quote(h, run, 4), (Result{kShort, -9, {0x7F, 'x', 0xAA, 0xAA}}));
}

TEST(AddQuotes, DescriptorFormQuotesCharactersFromTheCursor) {
  const NLSSMHandle *h = handle(20);
  std::vector<uint8_t> src = encode(20, u"xa\u00e9\"z");
  NLSString s = over(src.data(), static_cast<int64_t>(src.size()), 0, 1);
  Guarded dst(16);
  NLSString d = over(dst.data(), 0, 16, 0);
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
