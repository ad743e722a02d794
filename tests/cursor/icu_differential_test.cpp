// Random well-formed text from ICU's converters: stepping, positioning and
// counting must find exactly the character boundaries ICU finds.
#include <gtest/gtest.h>
#include <unicode/ucnv.h>
#include <unicode/uset.h>

#include <algorithm>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "handle_fixture.hpp"

namespace cursor_test {
namespace {

struct Page {
  const char *icu;
  Enc enc;
};

// Code points the converter maps both ways, split into ASCII and the rest
// so that texts mix single-byte and wider characters.
struct Repertoire {
  std::vector<UChar32> ascii, wide;
};

Repertoire repertoire(UConverter *cnv) {
  UErrorCode e = U_ZERO_ERROR;
  USet *set = uset_openEmpty();
  ucnv_getUnicodeSet(cnv, set, UCNV_ROUNDTRIP_SET, &e);
  Repertoire r;
  const int32_t ranges = uset_getItemCount(set);
  for (int32_t i = 0; i < ranges; ++i) {
    UChar32 start = 0, end = 0;
    e = U_ZERO_ERROR;
    if (uset_getItem(set, i, &start, &end, nullptr, 0, &e) != 0) continue;
    for (UChar32 c = start; c <= end; ++c) {
      if (c == 0 || (c >= 0xD800 && c <= 0xDFFF)) continue;
      (c < 0x80 ? r.ascii : r.wide).push_back(c);
    }
  }
  uset_close(set);
  return r;
}

struct Sample {
  std::vector<uint8_t> bytes;
  std::vector<int64_t> starts;  // byte offset of every character, from ICU
};

Sample make_sample(UConverter *cnv, const Repertoire &rep, std::mt19937 &rng, int chars) {
  std::u16string text;
  std::bernoulli_distribution ascii(rep.wide.empty() ? 1.0 : 0.35);
  for (int i = 0; i < chars; ++i) {
    const auto &pool = (ascii(rng) && !rep.ascii.empty()) ? rep.ascii : rep.wide;
    const UChar32 c = pool[std::uniform_int_distribution<size_t>(0, pool.size() - 1)(rng)];
    if (c > 0xFFFF) {
      text.push_back(static_cast<char16_t>(0xD7C0 + (c >> 10)));
      text.push_back(static_cast<char16_t>(0xDC00 | (c & 0x3FF)));
    } else {
      text.push_back(static_cast<char16_t>(c));
    }
  }
  Sample s;
  UErrorCode e = U_ZERO_ERROR;
  ucnv_resetFromUnicode(cnv);
  s.bytes.resize(text.size() * 4 + 16);
  const int32_t n = ucnv_fromUChars(cnv, reinterpret_cast<char *>(s.bytes.data()),
                                    static_cast<int32_t>(s.bytes.size()), text.data(),
                                    static_cast<int32_t>(text.size()), &e);
  EXPECT_TRUE(U_SUCCESS(e)) << u_errorName(e);
  s.bytes.resize(static_cast<size_t>(n));
  // Back to UTF-16 with source offsets: each character's first unit names
  // the byte where it starts.
  ucnv_resetToUnicode(cnv);
  std::vector<UChar> units(text.size() + 8);
  std::vector<int32_t> offsets(units.size());
  UChar *target = units.data();
  const char *source = reinterpret_cast<const char *>(s.bytes.data());
  e = U_ZERO_ERROR;
  ucnv_toUnicode(cnv, &target, units.data() + units.size(), &source, source + s.bytes.size(),
                 offsets.data(), true, &e);
  EXPECT_TRUE(U_SUCCESS(e)) << u_errorName(e);
  const auto produced = static_cast<size_t>(target - units.data());
  for (size_t i = 0; i < produced; ++i)
    if (s.starts.empty() || offsets[i] != s.starts.back()) s.starts.push_back(offsets[i]);
  return s;
}

// Lead and trail flags of a double-byte code page, probed through ICU: a
// lead byte is one that starts some two-byte character, a trail byte one
// that ends one.
std::vector<uint8_t> probe_flags(UConverter *cnv) {
  std::vector<uint8_t> flags(256, 0);
  for (int lead = 0; lead < 256; ++lead) {
    for (int trail = 0; trail < 256; ++trail) {
      const char pair[2] = {static_cast<char>(lead), static_cast<char>(trail)};
      UChar out[4];
      UErrorCode e = U_ZERO_ERROR;
      ucnv_reset(cnv);
      ucnv_setToUCallBack(cnv, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &e);
      const int32_t n = ucnv_toUChars(cnv, out, 4, pair, 2, &e);
      if (U_SUCCESS(e) && n == 1 && out[0] != 0xFFFD) {
        // One character from two bytes: unless the lead byte alone is one.
        UErrorCode e1 = U_ZERO_ERROR;
        ucnv_reset(cnv);
        ucnv_toUChars(cnv, out, 4, pair, 1, &e1);
        if (U_FAILURE(e1)) {
          flags[lead] |= 0x44;
          flags[trail] |= 0x08;
        }
      }
    }
  }
  ucnv_reset(cnv);
  return flags;
}

class IcuDifferential : public ::testing::TestWithParam<Page> {};

TEST_P(IcuDifferential, CursorAndCountsFollowIcuBoundaries) {
  const Page page = GetParam();
  UErrorCode error = U_ZERO_ERROR;
  const std::unique_ptr<UConverter, decltype(&ucnv_close)> conv(ucnv_open(page.icu, &error),
                                                                &ucnv_close);
  ASSERT_TRUE(U_SUCCESS(error)) << page.icu << " " << u_errorName(error);
  std::vector<uint8_t> flags;
  if (page.enc == Enc::kDbcs) flags = probe_flags(conv.get());
  auto th = make_handle(page.enc, flags.empty() ? nullptr : flags.data());
  const NLSSMHandle *h = &th->h;
  const Repertoire rep = repertoire(conv.get());
  std::mt19937 rng(20240611u ^ static_cast<unsigned>(page.enc));

  for (int round = 0; round < 120; ++round) {
    const int wanted = round < 5 ? round : std::uniform_int_distribution<int>(5, 160)(rng);
    Sample sample = make_sample(conv.get(), rep, rng, wanted);
    const auto count = static_cast<int64_t>(sample.starts.size());
    const auto length = static_cast<int64_t>(sample.bytes.size());
    SCOPED_TRACE(::testing::Message() << page.icu << " round " << round << " chars " << count);

    int64_t counted = -1;
    EXPECT_EQ(num_chars_s(h, sample.bytes.data(), length, 0, &counted), 0);
    EXPECT_EQ(counted, count);

    // Step from the first character to the end.
    NLSString s = descriptor(sample.bytes);
    ASSERT_EQ(set_pos(h, &s, 0, 0), count == 0 ? NLSSM_POS_OUTSIDE : 0);
    for (int64_t i = 0; i < count; ++i) {
      ASSERT_EQ(s.curOffset, sample.starts[i]) << "character " << i;
      ASSERT_EQ(s.charIndex, i);
      const int64_t size = (i + 1 < count ? sample.starts[i + 1] : length) - sample.starts[i];
      if (page.enc != Enc::kModal) {
        EXPECT_EQ(cur_char_size(h, &s), size);
      }
      EXPECT_EQ(next_char(h, &s), i + 1 < count ? i + 1 : NLSSM_POS_NONE);
    }
    EXPECT_EQ(s.curOffset, NLSSM_POS_NONE);
    if (count > 0) {
      EXPECT_EQ(s.charIndex, count);
    }

    // Position to characters in random order, absolutely and relatively.
    s = descriptor(sample.bytes);
    for (int probe = 0; probe < 24 && count > 0; ++probe) {
      const int64_t t = std::uniform_int_distribution<int64_t>(0, count - 1)(rng);
      int64_t got;
      if (probe % 3 == 2 && s.curOffset >= 0) {
        const int64_t delta = std::clamp<int64_t>(t - s.charIndex, -2, 2);
        const int64_t expect = s.charIndex + delta;
        got = set_pos(h, &s, NLSSM_POS_CURRENT, delta);
        if (expect < 0 || expect >= count) continue;
        ASSERT_EQ(got, expect);
      } else {
        got = set_pos(h, &s, t, 0);
        ASSERT_EQ(got, t);
      }
      ASSERT_EQ(s.curOffset, sample.starts[got]);
      EXPECT_EQ(s.prevOffset, got > 0 ? sample.starts[got - 1] : NLSSM_POS_NO_PREVIOUS);
      EXPECT_EQ(s.nextOffset, got + 1 < count ? sample.starts[got + 1] : NLSSM_POS_NONE);
      int64_t rest = -1;
      EXPECT_EQ(num_chars(h, &s, 0, &rest), 0);
      EXPECT_EQ(rest, count - got);
    }
    if (count > 0) {
      EXPECT_EQ(set_pos(h, &s, NLSSM_POS_LAST, 0), count - 1);
    }

    // Byte lengths of leading characters, and of the terminated text.
    std::vector<uint8_t> terminated = sample.bytes;
    terminated.insert(terminated.end(), 4, 0);
    for (int64_t k : {int64_t{0}, count / 2, count}) {
      const int64_t bytes = k == 0 ? 0 : k < count ? sample.starts[k] : length;
      EXPECT_EQ(string_blength(h, terminated.data(), k), bytes) << "first " << k;
    }
    int64_t chars = -1, bytes = -1;
    EXPECT_EQ(string_length(h, terminated.data(), &chars, &bytes), 0);
    EXPECT_EQ(chars, count);
    EXPECT_EQ(bytes, length);
    EXPECT_EQ(string_nlength(h, terminated.data(), length, &chars, &bytes), 0);
    EXPECT_EQ(chars, count);
  }
}

INSTANTIATE_TEST_SUITE_P(
    Pages, IcuDifferential,
    ::testing::Values(Page{"UTF-8", Enc::kUtf8}, Page{"UTF-16LE", Enc::kWcs2Le},
                      Page{"UTF-16BE", Enc::kWcs2Be}, Page{"UTF-32LE", Enc::kWcs4Le},
                      Page{"UTF-32BE", Enc::kWcs4Be}, Page{"ibm-930", Enc::kModal},
                      Page{"ibm-939", Enc::kModal}, Page{"EUC-JP", Enc::kEucJp},
                      Page{"ibm-964", Enc::kEucTw}, Page{"gb18030", Enc::kGb18030},
                      Page{"ibm-943_P15A-2003", Enc::kDbcs}, Page{"windows-950", Enc::kDbcs},
                      Page{"ibm-037", Enc::kSbcs}),
    [](const ::testing::TestParamInfo<Page> &info) {
      std::string name = info.param.icu;
      for (char &c : name)
        if (!std::isalnum(static_cast<unsigned char>(c))) c = '_';
      return name;
    });

}  // namespace
}  // namespace cursor_test
