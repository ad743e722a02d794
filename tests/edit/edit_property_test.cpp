// Properties of substring, delete, reverse and strip on random well-formed
// text in one encoding of each class, read back through the handle's
// converters: guard bytes after every buffer stay untouched and the
// handle's pool is back to its start after every call.
#include <algorithm>

#include "edit_support.hpp"

namespace edit_test {
namespace {

class EditProperty : public ::testing::TestWithParam<int> {
 protected:
  void SetUp() override {
    h = handle(GetParam());
    ASSERT_NE(h, nullptr);
    chars = repertoire(h);
    ASSERT_GE(chars.size(), 5u);
  }
  Bytes with_guard(const Bytes &b, size_t extra = 0) {
    Bytes g(b);
    g.resize(b.size() + extra + 8, 0xEE);
    return g;
  }
  std::u32string text_of(const uint8_t *p, size_t n) {
    std::u32string t;
    EXPECT_TRUE(decode(h, p, n, t));
    return t;
  }
  // A start character for the plain forms. The cursor steps UTF-EBCDIC text
  // by the UTF-8 lead lengths, so there only the first character is used.
  size_t start_in(const std::u32string &t) {
    if (GetParam() == 161) return 0;
    return std::uniform_int_distribution<size_t>(0, t.size())(rng);
  }
  const NLSSMHandle *h = nullptr;
  std::u32string chars;
  std::mt19937 rng{20261122};
};

// Two-byte reverse swaps units, so only texts without surrogate pairs read
// back as the characters reversed.
TEST_P(EditProperty, ReversingTwiceGivesTheTextBack) {
  const bool pairs_turn = h->encodingClass == NLSSM_CLASS_WCS2;
  for (int round = 0; round < 200; ++round) {
    const std::u32string t = random_text(rng, chars, 40);
    const Bytes text = encode(h, t);
    Bytes b = with_guard(text);
    const auto n = static_cast<int64_t>(text.size());
    const PoolWatch pool{h};
    ASSERT_EQ(call<ReverseS>(h, h->NLSStringReverseS, b.data(), n), 0);
    std::u32string want(t.rbegin(), t.rend());
    const bool bmp_only = std::all_of(t.begin(), t.end(), [](char32_t c) { return c < 0x10000; });
    if (!pairs_turn || bmp_only) {
      EXPECT_EQ(text_of(b.data(), text.size()), want);
    }
    ASSERT_EQ(call<ReverseS>(h, h->NLSStringReverseS, b.data(), n), 0);
    EXPECT_TRUE(std::equal(text.begin(), text.end(), b.begin()));
    EXPECT_TRUE(guard_intact(b, text.size()) && pool.balanced());
    if (h->encodingClass == NLSSM_CLASS_MBCS_MODAL || pairs_turn) continue;
    // The plain form turns round n characters from the current one.
    const size_t from = start_in(t);
    const auto count = std::uniform_int_distribution<size_t>(0, t.size() - from + 1)(rng);
    NLSString s = at_char(h, b, text.size(), static_cast<int64_t>(from));
    ASSERT_EQ(call<Reverse>(h, h->NLSStringReverse, &s, static_cast<int64_t>(count)), 0);
    const size_t end = count == 0 ? t.size() : std::min(t.size(), from + count);
    std::u32string part = t;
    std::reverse(part.begin() + static_cast<ptrdiff_t>(from),
                 part.begin() + static_cast<ptrdiff_t>(end));
    EXPECT_EQ(text_of(b.data(), text.size()), part) << from << " " << count;
  }
}

TEST_P(EditProperty, DeleteLeavesNoListedCharacterAndKeepsTheLength) {
  const Bytes blank = encode(h, U" ");
  for (int round = 0; round < 200; ++round) {
    const std::u32string t = random_text(rng, chars, 80);
    const std::u32string list = random_text(rng, chars, 4);
    std::u32string kept;
    std::copy_if(t.begin(), t.end(), std::back_inserter(kept),
                 [&](char32_t c) { return list.find(c) == std::u32string::npos; });
    const Bytes text = encode(h, t), listBytes = encode(h, list);
    Bytes b = with_guard(text);
    const PoolWatch pool{h};
    const int64_t keptBytes =
        call<DeleteS>(h, h->NLSStringDeleteS, b.data(), static_cast<int64_t>(text.size()),
                      listBytes.data(), static_cast<int64_t>(listBytes.size()));
    ASSERT_GE(keptBytes, 0);
    EXPECT_EQ(text_of(b.data(), static_cast<size_t>(keptBytes)), kept);
    for (auto i = static_cast<size_t>(keptBytes); i < text.size(); ++i)
      ASSERT_EQ(b[i], blank[(i - static_cast<size_t>(keptBytes)) % blank.size()]) << i;
    EXPECT_TRUE(guard_intact(b, text.size()) && pool.balanced());
    // The plain form on the same text and list answers characters.
    Bytes p = with_guard(text), l = listBytes;
    NLSString target = at_char(h, p, text.size(), 0), ls = at_char(h, l, l.size(), 0);
    EXPECT_EQ(call<Delete>(h, h->NLSStringDelete, &target, int64_t{0}, &ls, int64_t{0}, int64_t{0}),
              static_cast<int64_t>(list.empty() ? t.size() : kept.size()));
    // (Modal text may keep a shift sequence that stood before the current
    // character, so the blanks are not compared.)
    auto trimmed = [&](const Bytes &x) {
      std::u32string r = text_of(x.data(), text.size());
      return r.substr(0, r.find_last_not_of(U' ') + 1);
    };
    EXPECT_EQ(trimmed(p), trimmed(b));
  }
}

// A substring decodes to a run of the source's characters from the start
// character: all that were asked for, or, when truncated, fewer.
TEST_P(EditProperty, SubstringCopiesWholeCharactersOfTheSource) {
  const bool moves_rest =
      h->encodingClass == NLSSM_CLASS_UTF8 || h->encodingClass >= NLSSM_CLASS_MBCS_MODAL;
  const Bytes blank = encode(h, U" ");
  for (int round = 0; round < 300; ++round) {
    const std::u32string t = random_text(rng, chars, 20);
    Bytes text = encode(h, t);
    const size_t from = start_in(t);
    const auto n = std::uniform_int_distribution<size_t>(moves_rest ? 1 : 0, t.size() + 2)(rng);
    const auto capacity = std::uniform_int_distribution<size_t>(0, text.size() + 8)(rng);
    const int64_t flags = round % 2;
    Bytes dst(capacity + 8, 0xEE);
    NLSString d{dst.data(), 0, capacity, 0, -9, -9, -1, 0, 0, 0};
    const NLSString s = at_char(h, text, text.size(), static_cast<int64_t>(from));
    int64_t copied = -1;
    const PoolWatch pool{h};
    const int64_t status =
        call<SubStr>(h, h->NLSStringSubStr, &s, &d, static_cast<int64_t>(n), &copied, flags);
    ASSERT_TRUE(status == 0 || status == NLSSM_E_DEST_TOO_SMALL) << std::hex << status;
    ASSERT_TRUE(guard_intact(dst, capacity) && pool.balanced()) << round;
    ASSERT_LE(copied, static_cast<int64_t>(capacity));
    const std::u32string got = text_of(dst.data(), static_cast<size_t>(copied));
    const std::u32string rest = t.substr(from, n == 0 ? std::u32string::npos : n);
    if (status == 0) {
      EXPECT_EQ(got, rest) << round;
    } else {
      EXPECT_TRUE(got.size() < rest.size() && rest.compare(0, got.size(), got) == 0) << round;
    }
    const bool unset_source = from == t.size();  // nothing is copied or padded
    EXPECT_EQ(d.length, status == 0 && flags && !unset_source
                            ? capacity / blank.size() * blank.size()
                            : static_cast<uint64_t>(copied));
    for (auto i = static_cast<size_t>(copied); i < d.length; ++i)
      ASSERT_EQ(dst[i], blank[(i - static_cast<size_t>(copied)) % blank.size()]);
  }
}

TEST_P(EditProperty, StripMeasuresTheTextWithoutItsTrailingBlanks) {
  for (int round = 0; round < 100; ++round) {
    const std::u32string t = random_text(rng, chars, 20);
    const size_t blanks = std::uniform_int_distribution<size_t>(0, 5)(rng);
    const Bytes bare = encode(h, t);
    Bytes text = encode(h, t + std::u32string(blanks, U' '));
    const auto n = static_cast<int64_t>(text.size());
    EXPECT_EQ(call<StripS>(h, h->NLSStringStripS, text.data(), n, int64_t{0}),
              static_cast<int64_t>(bare.size()));
    EXPECT_EQ(call<StripS>(h, h->NLSStringStripC, text.data(),
                           static_cast<int64_t>(t.size() + blanks), int64_t{0}),
              static_cast<int64_t>(t.size()));
    const NLSString s = at_char(h, text, text.size(), 0);
    EXPECT_EQ(call<Strip>(h, h->NLSStringStrip, &s, int64_t{0}, int64_t{0}),
              static_cast<int64_t>(t.size()));
  }
}

// Arbitrary bytes, broken characters and stray shift sequences included:
// every operation keeps to its buffers and gives the pool back.
TEST_P(EditProperty, ArbitraryBytesStayWithinTheirBuffers) {
  std::uniform_int_distribution<int> byte(0, 255);
  for (int round = 0; round < 300; ++round) {
    Bytes text(std::uniform_int_distribution<size_t>(0, 24)(rng));
    for (uint8_t &b : text)
      b = static_cast<uint8_t>(round % 3 == 0 ? 0x0E + byte(rng) % 3 : byte(rng));
    Bytes list(text.begin(), text.begin() + static_cast<ptrdiff_t>(text.size() / 3));
    const auto n = static_cast<int64_t>(text.size());
    const int64_t count = std::uniform_int_distribution<int64_t>(0, 6)(rng), flags = round % 2;
    const PoolWatch pool{h};
    Bytes b = with_guard(text), l = with_guard(list), dst(text.size() / 2 + 8, 0xEE);
    call<ReverseS>(h, h->NLSStringReverseS, b.data(), n);
    call<DeleteS>(h, h->NLSStringDeleteS, b.data(), n, l.data(), static_cast<int64_t>(list.size()));
    call<StripS>(h, h->NLSStringStripS, b.data(), n, flags);
    NLSString s = at_char(h, b, text.size(), count / 2), ls = at_char(h, l, list.size(), 0);
    NLSString d{dst.data(), 0, text.size() / 2, 0, -9, -9, -1, 0, 0, 0};
    if (round % 5 == 4) {  // offsets past the text and past the destination's room
      s.charIndex = s.curOffset = static_cast<int64_t>(text.size()) + 3;
      d.charIndex = d.curOffset = static_cast<int64_t>(d.capacity) + 3;
    }
    int64_t copied = 0;
    call<Reverse>(h, h->NLSStringReverse, &s, count);
    call<Delete>(h, h->NLSStringDelete, &s, count, &ls, count, flags);
    call<Strip>(h, h->NLSStringStrip, &s, count, flags);
    if (count != 0 || h->NLSStringMoveS != nullptr || h->encodingClass == NLSSM_CLASS_SBCS ||
        h->encodingClass == NLSSM_CLASS_WCS2 || h->encodingClass == NLSSM_CLASS_WCS4)
      call<SubStr>(h, h->NLSStringSubStr, &s, &d, count, &copied, flags);
    ASSERT_TRUE(guard_intact(b, text.size()) && guard_intact(l, list.size()) &&
                guard_intact(dst, text.size() / 2) && pool.balanced())
        << round;
    ASSERT_LE(d.length, text.size() / 2);
  }
}

INSTANTIATE_TEST_SUITE_P(Encodings, EditProperty, ::testing::ValuesIn(kEncodings), encoding_name);

}  // namespace
}  // namespace edit_test
