// Classification of the current character in each class, and stringAnyNot.
#include <gtest/gtest.h>

#include "text.hpp"

namespace search_test {
namespace {

// The answer of the member in `slot` for character `index` of `text`.
int64_t is(int encoding, NLSSlot NLSSMHandle::*slot, const std::u32string &text, int32_t mask,
           int64_t index = 0) {
  const NLSSMHandle *h = handle(encoding);
  Bytes b = encode(encoding, text);
  NLSString s = at(h, b, index);
  return call(h->*slot, h, &s, int64_t{0}, mask);
}

int64_t is_bytes(int encoding, NLSSlot NLSSMHandle::*slot, Bytes b, int32_t mask) {
  const NLSSMHandle *h = handle(encoding);
  NLSString s = at(h, b);
  return call(h->*slot, h, &s, int64_t{0}, mask);
}

TEST(Classify, SingleByteSetsAnswerFromTheClassTable) {
  for (char32_t c : U"0Ff") EXPECT_EQ(is(29, &NLSSMHandle::NLSStringIs, {c}, 0x80), c != 0);
  EXPECT_EQ(is(29, &NLSSMHandle::NLSStringIsXDigit, U"G", 0x80), 0);
  EXPECT_EQ(is(78, &NLSSMHandle::NLSStringIs, U"a", 0x02), 1);  // EBCDIC 0x81
  EXPECT_EQ(is(78, &NLSSMHandle::NLSStringIsLower, U"A", 0x02), 0);
  // Space: the fixed control range of the family, whatever the mask.
  EXPECT_EQ(is_bytes(29, &NLSSMHandle::NLSStringIsSpace, {0x09}, 0), 1);
  EXPECT_EQ(is_bytes(78, &NLSSMHandle::NLSStringIsSpace, {0x0B}, 0), 1);
  EXPECT_EQ(is_bytes(78, &NLSSMHandle::NLSStringIsSpace, {0x09}, 0), 0);
  EXPECT_EQ(is_bytes(78, &NLSSMHandle::NLSStringIsSpace, {0x40}, 0x08), 1);
  Bytes none;
  EXPECT_EQ(is_bytes(29, &NLSSMHandle::NLSStringIs, none, 0xFF), 0);
}

class MultiByte : public ::testing::TestWithParam<int> {};

// Shift-JIS, EUC-JP and modal 939: double-byte characters by their rules.
TEST_P(MultiByte, DoubleByteCharactersFollowTheDoubleByteTables) {
  const int e = GetParam();
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"日", 0x01), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"日", 0x10), 0);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"x日", 0x10, 1), 0);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"日A", 0x01, 1), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsDigit, U"日", 0x04), 0);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsDigit, U"5", 0x04), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsLower, U"ａ", 0x02), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsLower, U"Ａ", 0x02), 0);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsLower, U"Ａ", 0x01), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsLower, U"日", 0x01), 0);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsXDigit, U"０", 0x80), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsXDigit, U"Ｇ", 0x80), 0);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsSpace, U"\u3000", 0), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsSpace, U"日", 0x08), 0);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsGraph, U"日", 0), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsGraph, U"\u3000", 0), 0);
}

INSTANTIATE_TEST_SUITE_P(Pages, MultiByte, ::testing::Values(135, 134, 129));

TEST(Classify, SingleBytesOfMultiByteText) {
  EXPECT_EQ(is_bytes(135, &NLSSMHandle::NLSStringIs, {0x80}, 0xFF), 0);
  EXPECT_EQ(is_bytes(135, &NLSSMHandle::NLSStringIsSpace, {0x0B}, 0), 1);
  EXPECT_EQ(is_bytes(129, &NLSSMHandle::NLSStringIsSpace, {0x25}, 0), 1);
  EXPECT_EQ(is_bytes(129, &NLSSMHandle::NLSStringIsSpace, {0x09}, 0), 0);
}

class Unicode : public ::testing::TestWithParam<int> {};

TEST_P(Unicode, CategoriesComeFromTheHostQuery) {
  const int e = GetParam();
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"A", 0x01), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"a", 0x01), 0);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"É", 0x01), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"ǅ", 0x01), 0);  // title case
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"ǅ", 0x03), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"\u0663", 0x04), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"\U0001D400", 0x01), 1);  // mathematical A
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIs, U"!", 0x10), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsXDigit, U"\uFF21", 0), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsXDigit, U"g", 0), 0);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsXDigit, U"\u0663", 0), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsGraph, U"a", 0), 1);
  EXPECT_EQ(is(e, &NLSSMHandle::NLSStringIsGraph, U"\u3000", 0), 0);
  const NLSSMHandle *h = handle(e);
  auto space = [&](char32_t c, int64_t strict) {
    Bytes b = encode(e, {c});
    NLSString s = at(h, b);
    return call(h->NLSStringIsSpace, h, &s, strict);
  };
  EXPECT_EQ(space(0x85, 0), 1);
  EXPECT_EQ(space(0x85, 1), 0);
  EXPECT_EQ(space(0x3000, 1), 1);
  EXPECT_EQ(space(0x3001, 0), 0);
  EXPECT_EQ(space(0x2009, 1), 1);
}

INSTANTIATE_TEST_SUITE_P(Forms, Unicode, ::testing::Values(20, 161, 24, 25, 26));

TEST(Classify, ALoneHighSurrogateIsInNoClass) {
  for (int32_t mask : {0x01, 0x10, 0x40, 0xFF}) {
    EXPECT_EQ(is_bytes(24, &NLSSMHandle::NLSStringIs, {0xD8, 0x00, 0x00, 0x41}, mask), 0);
    EXPECT_EQ(is_bytes(25, &NLSSMHandle::NLSStringIs, {0x00, 0xD8}, mask), 0);
  }
  EXPECT_EQ(is_bytes(24, &NLSSMHandle::NLSStringIsGraph, {0xD8, 0x00}, 0), 0);
}

TEST(Classify, AnyNotAsksEveryCharacterUpToTheCount) {
  auto any_not = [](int e, const std::u32string &text, int64_t count, int32_t mask) {
    const NLSSMHandle *h = handle(e);
    Bytes b = encode(e, text);
    NLSString s = at(h, b);
    const NLSString before = s;
    const int64_t r = call(h->stringAnyNot, h, &s, count, mask);
    EXPECT_EQ(s.curOffset, before.curOffset);
    return r;
  };
  for (int e : {29, 20, 25, 135, 129}) {
    EXPECT_EQ(any_not(e, U"123", 0, 0x04), 0) << e;
    EXPECT_EQ(any_not(e, U"12a", 0, 0x04), 1) << e;
    EXPECT_EQ(any_not(e, U"12a", 2, 0x04), 0) << e;
    EXPECT_EQ(any_not(e, U"", 0, 0x04), 0) << e;
  }
  EXPECT_EQ(any_not(135, U"日本A", 0, 0x01), 0);
}

}  // namespace
}  // namespace search_test
