// Justify through the handle's slots, in every class.
#include <ostream>

#include "edit_fixture.hpp"

namespace editmove_test {
namespace {

using JustifyS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t, int64_t *,
                             int64_t *);
using JustifyC = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t, int64_t *,
                             int64_t *, int64_t *, int64_t *);
using Justify = int64_t (*)(const NLSSMHandle *, NLSString *, uint32_t, int64_t *, int64_t *);

// A field of `lead` blanks, `text`, then `trail` blanks, in the handle's
// encoding.
std::vector<uint8_t> field(int enc, int lead, const std::u16string &text, int trail) {
  return encode(enc, std::u16string(lead, u' ') + text + std::u16string(trail, u' '));
}

struct Out {
  int64_t status, length, start;
  std::vector<uint8_t> text;
  bool operator==(const Out &) const = default;
};
void PrintTo(const Out &o, std::ostream *os) {
  *os << std::hex << o.status << std::dec << " length " << o.length << " start " << o.start
      << " text " << ::testing::PrintToString(o.text);
}

Out justify_s(const NLSSMHandle *h, std::vector<uint8_t> f, uint32_t align) {
  Out o{0, -1, -1, {}};
  o.status = slot<JustifyS>(h->NLSStringJustifyS)(h, f.data(), static_cast<int64_t>(f.size()),
                                                  align, &o.length, &o.start);
  o.text = f;
  return o;
}

class Justification : public ::testing::TestWithParam<int> {};

TEST_P(Justification, MovesTheTextAndBlanksWhatItLeft) {
  const int enc = GetParam();
  const NLSSMHandle *h = handle(enc);
  const std::u16string ab = u"a\u4e00";  // one multi-byte character where there are any
  const std::u16string text = h->encodingClass == 0 ? u"ab" : ab;
  const auto t = static_cast<int64_t>(encode(enc, text).size());
  const int64_t bw = h->encodingClass == 2 || h->encodingClass == 3 ? h->unitWidth : 1;
  struct {
    uint32_t align;
    int lead, trail;  // the result
  } cases[] = {{'C', 2, 3}, {'c', 2, 3}, {'L', 0, 5}, {'r', 5, 0}, {'N', 1, 4}};
  for (const auto &c : cases) {
    EXPECT_EQ(justify_s(h, field(enc, 1, text, 4), c.align),
              (Out{0, t, c.lead * bw, field(enc, c.lead, text, c.trail)}))
        << char(c.align);
  }
  // A letter that is not an alignment moves nothing but still measures.
  EXPECT_EQ(justify_s(h, field(enc, 1, text, 4), 'x' | 0x4300),
            (Out{NLSSM_E_BAD_ALIGNMENT, t, bw, field(enc, 1, text, 4)}));
  // All blank: zeros, whatever the letter.
  EXPECT_EQ(justify_s(h, field(enc, 3, u"", 0), 'x'), (Out{0, 0, 0, field(enc, 3, u"", 0)}));
  // The character form counts characters.
  std::vector<uint8_t> f = field(enc, 3, text, 2);
  int64_t bytes = 0, chars = 0, start = 0, startChars = 0;
  EXPECT_EQ(slot<JustifyC>(h->NLSStringJustifyC)(h, f.data(), 7, 'R', &bytes, &chars, &start,
                                                 &startChars),
            0);
  EXPECT_EQ(f, field(enc, 5, text, 0));
  EXPECT_EQ(chars, 2);
  EXPECT_EQ(startChars, 5);
  EXPECT_EQ(start, 5 * bw);
}

INSTANTIATE_TEST_SUITE_P(Encodings, Justification,
                         ::testing::Values(29, 78, 20, 24, 25, 26, 27, 135, 134, 119, 205));

TEST(Justify, ModalRunsMoveWholeWithTheirShifts) {
  const NLSSMHandle *h = handle(130);
  // A double-byte blank (40 40) inside the run is text, not a blank.
  const std::vector<uint8_t> run = {0x0E, 0x40, 0x40, 0x42, 0xC1, 0x0F};
  std::vector<uint8_t> f = cat(cat({0x40}, run), {0x40, 0x40, 0x40});
  int64_t bytes = 0, chars = 0, start = 0, startChars = 0;
  EXPECT_EQ(slot<JustifyC>(h->NLSStringJustifyC)(h, f.data(), 6, 'R', &bytes, &chars, &start,
                                                 &startChars),
            0);
  EXPECT_EQ(f, cat({0x40, 0x40, 0x40, 0x40}, run));
  EXPECT_EQ(bytes, 6);
  EXPECT_EQ(chars, 2);
  EXPECT_EQ(start, 4);
}

TEST(Justify, DescriptorFormStartsFromTheFirstCharacter) {
  const NLSSMHandle *h = handle(29);
  std::vector<uint8_t> f = bytes("  ab  ##");
  NLSString s = over(f.data(), 6, 8, 3);
  int64_t length = 0, start = 0;
  EXPECT_EQ(slot<Justify>(h->NLSStringJustify)(h, &s, 'L', &length, &start), 0);
  EXPECT_EQ(f, bytes("ab    ##"));
  EXPECT_EQ(s.charIndex + s.curOffset, 0);
  EXPECT_EQ(length, 2);
  EXPECT_EQ(start, 0);
}

}  // namespace
}  // namespace editmove_test
