// The LIKE matcher against an independent reference: the pattern rewritten
// as a regular expression over the decoded characters, on thousands of
// random texts and patterns per encoding.
#include <gtest/gtest.h>

#include <chrono>
#include <random>
#include <regex>

#include "text.hpp"

namespace search_test {
namespace {

struct Alphabet {
  int encoding;
  std::u32string letters;  // '%', '_' and '\\' are added
};

void PrintTo(const Alphabet &a, std::ostream *os) {
  *os << "encoding " << a.encoding;
}

// '%' -> any run, '_' -> one character, escape -> the next one literally.
bool reference_like(const std::u32string &text, const std::u32string &pattern, bool escape) {
  std::wstring re;
  for (size_t i = 0; i < pattern.size(); ++i) {
    char32_t c = pattern[i];
    if (escape && c == U'\\' && i + 1 < pattern.size()) {
      c = pattern[++i];
    } else if (c == U'%') {
      re += L"[\\s\\S]*";
      continue;
    } else if (c == U'_') {
      re += L"[\\s\\S]";
      continue;
    }
    if (std::wstring(L"\\^$.|?*+()[]{}/-").find(static_cast<wchar_t>(c)) != std::wstring::npos)
      re += L'\\';
    re += static_cast<wchar_t>(c);
  }
  return std::regex_match(std::wstring(text.begin(), text.end()), std::wregex(re));
}

class Like : public ::testing::TestWithParam<Alphabet> {
 protected:
  const NLSSMHandle *h = handle(GetParam().encoding);
  int64_t like(const std::u32string &text, const std::u32string &pattern, bool escape) {
    Bytes t = encode(GetParam().encoding, text), p = encode(GetParam().encoding, pattern);
    NLSString td = at(h, t), pd = at(h, p);
    return call(h->NLSStringLike, h, &td, &pd, int64_t{escape});
  }
};

TEST_P(Like, AgreesWithARegularExpressionOnTheDecodedCharacters) {
  std::mt19937 rng(GetParam().encoding);
  const std::u32string text_letters = GetParam().letters + U"%_\\";
  const std::u32string pattern_letters = text_letters + U"%%__";
  auto pick = [&](const std::u32string &from, int max) {
    std::u32string s(std::uniform_int_distribution<int>(0, max)(rng), U' ');
    for (char32_t &c : s) c = from[rng() % from.size()];
    return s;
  };
  int matched = 0;
  for (int round = 0; round < 2500; ++round) {
    const std::u32string text = pick(text_letters, 9);
    std::u32string pattern = pick(pattern_letters, 6);
    if (round % 3 == 0 && !text.empty()) pattern = text.substr(rng() % text.size()) + pattern;
    const bool escape = rng() % 2;
    const bool want = reference_like(text, pattern, escape);
    matched += want;
    ASSERT_EQ(like(text, pattern, escape), want ? 1 : 0) << "round " << round;
  }
  EXPECT_GT(matched, 100);  // the sample holds matches as well as misses
}

// A pattern that defeats naive backtracking finishes at once.
TEST_P(Like, ManyWildcardsStayPolynomial) {
  const std::u32string text(20000, U'a');
  const auto start = std::chrono::steady_clock::now();
  EXPECT_EQ(like(text, U"%a%a%a%a%b", false), 0);
  EXPECT_EQ(like(text, U"%a%a%a%a%", false), 1);
  EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(5));
}

INSTANTIATE_TEST_SUITE_P(
    Encodings, Like,
    ::testing::Values(Alphabet{20, U"ab\u00E9\u65E5\U0001F600"}, Alphabet{161, U"ab\u00E9\u65E5"},
                      Alphabet{78, U"ab\u00E9"}, Alphabet{135, U"ab\u65E5\u672C\u30A2"},
                      Alphabet{129, U"ab\u65E5\u672C"}, Alphabet{24, U"ab\u65E5\U0001F600"},
                      Alphabet{26, U"ab\u65E5"}, Alphabet{205, U"ab\u65E5\U0001F600"},
                      Alphabet{134, U"ab\u65E5"}),
    [](const auto &info) { return std::to_string(info.param.encoding); });

TEST(LikeArguments, NullDescriptorsAreReported) {
  const NLSSMHandle *h = handle(29);
  Bytes b = encode(29, U"a");
  NLSString d = at(h, b);
  EXPECT_EQ(call(h->NLSStringLike, h, static_cast<NLSString *>(nullptr), &d, int64_t{0}),
            int64_t{NLSSM_E_NULL_ARGUMENT});
  d.buffer = nullptr;
  EXPECT_EQ(call(h->NLSStringLike, h, &d, &d, int64_t{0}), int64_t{NLSSM_E_NULL_ARGUMENT});
}

}  // namespace
}  // namespace search_test
