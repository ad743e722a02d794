// Differential checks against ICU: every Unicode scalar value through each
// well-formed path, the UTF-8 legality test over every short byte sequence,
// and the UTF-EBCDIC byte permutation.
#include <gtest/gtest.h>
#include <nlssm/nlssm.h>
#include <unicode/ucnv.h>
#include <unicode/utf16.h>
#include <unicode/utf8.h>

#include <string>
#include <vector>

#include "unicode/tables.hpp"

namespace {

const std::vector<uint32_t> &all_scalars() {
  static const std::vector<uint32_t> v = [] {
    std::vector<uint32_t> cps;
    for (uint32_t c = 0; c <= 0x10FFFF; ++c)
      if (c < 0xD800 || c > 0xDFFF) cps.push_back(c);
    return cps;
  }();
  return v;
}

// `text` (UTF-16) in the named ICU charset.
std::vector<uint8_t> icu_encode(const char *charset, const std::u16string &text) {
  UErrorCode err = U_ZERO_ERROR;
  UConverter *cnv = ucnv_open(charset, &err);
  EXPECT_TRUE(U_SUCCESS(err)) << charset;
  std::vector<uint8_t> out(text.size() * 4 + 16);
  const int32_t n = ucnv_fromUChars(cnv, reinterpret_cast<char *>(out.data()), out.size(),
                                    text.data(), text.size(), &err);
  EXPECT_TRUE(U_SUCCESS(err)) << charset << ": " << u_errorName(err);
  ucnv_close(cnv);
  out.resize(n);
  return out;
}

const std::u16string &all_scalars_utf16() {
  static const std::u16string s = [] {
    std::u16string out;
    for (uint32_t c : all_scalars()) {
      UChar units[2];
      int32_t n = 0;
      U16_APPEND_UNSAFE(units, n, c);
      out.append(reinterpret_cast<const char16_t *>(units), n);
    }
    return out;
  }();
  return s;
}

struct Form {
  const char *charset;
  NLSUTFDecoder decoder;
  NLSUTFEncoder encoder;
};

class IcuSweep : public testing::TestWithParam<Form> {};

TEST_P(IcuSweep, DecodesEveryScalarValue) {
  const Form &f = GetParam();
  const auto &cps = all_scalars();
  const std::vector<uint8_t> bytes = icu_encode(f.charset, all_scalars_utf16());
  std::vector<uint32_t> out(cps.size() + 1, 0);
  int64_t written = -1;
  EXPECT_EQ(ConvertToUTF32(bytes.data(), bytes.size(), out.data(), out.size() * 4, &written,
                           f.decoder, COPY_UTF32_SWAP),
            NLSSM_OK);
  ASSERT_EQ(written, static_cast<int64_t>(cps.size() * 4));
  out.pop_back();
  EXPECT_TRUE(out == cps);
}

TEST_P(IcuSweep, EncodesEveryScalarValue) {
  const Form &f = GetParam();
  const auto &cps = all_scalars();
  const std::vector<uint8_t> expected = icu_encode(f.charset, all_scalars_utf16());
  std::vector<uint8_t> out(expected.size() + 8, 0);
  int64_t written = -1;
  EXPECT_EQ(ConvertFromUTF32(cps.data(), cps.size() * 4, out.data(), out.size(), &written,
                             f.encoder, COPY_UTF32b_SWAP),
            NLSSM_OK);
  ASSERT_EQ(written, static_cast<int64_t>(expected.size()));
  out.resize(expected.size());
  EXPECT_TRUE(out == expected);
}

INSTANTIATE_TEST_SUITE_P(Forms, IcuSweep,
                         testing::Values(Form{"UTF-8", UTF8_UTF32, UTF32_UTF8},
                                         Form{"UTF-16BE", UTF16_UTF32, UTF32_UTF16s_SWAP},
                                         Form{"UTF-16LE", UTF16_UTF32_SWAP, UTF32_UTF16s},
                                         Form{"UTF-32BE", COPY_UTF32b, COPY_UTF32},
                                         Form{"UTF-32LE", COPY_UTF32b_SWAP, COPY_UTF32_SWAP}),
                         [](const auto &info) {
                           std::string name = info.param.charset;
                           std::erase(name, '-');
                           return name;
                         });

TEST(IcuSweepUtf8, LengthLegalityAndUtf16UnitsOfEveryScalarValue) {
  const auto &cps = all_scalars();
  const std::vector<uint8_t> utf8 = icu_encode("UTF-8", all_scalars_utf16());
  EXPECT_EQ(GET_UTF8_LEN_FROM_QVCHAR(cps.data(), cps.size()), static_cast<int64_t>(utf8.size()));
  const std::u16string &utf16 = all_scalars_utf16();
  size_t at = 0, unit = 0;
  for (uint32_t c : cps) {
    const int64_t n = U8_LENGTH(c);
    int64_t index = -1;
    ASSERT_EQ(isLegalUTF8(utf8.data() + at, n, &index), 1) << std::hex << c;
    uint16_t units[2] = {0, 0};
    int64_t consumed = 0;
    ASSERT_EQ(UTF8_UTF16(utf8.data() + at, utf8.size() - at, units, &consumed), NLSSM_OK);
    ASSERT_EQ(consumed, n);
    ASSERT_EQ(units[0], uint16_t{utf16[unit]}) << std::hex << c;
    if (c > 0xFFFF) {
      ASSERT_EQ(units[1], uint16_t{utf16[unit + 1]}) << std::hex << c;
    }
    at += n;
    unit += c > 0xFFFF ? 2 : 1;
  }
}

// True when ICU reads `s` as exactly one well-formed character.
bool icu_one_character(const uint8_t *s, int32_t n) {
  int32_t i = 0;
  UChar32 c = 0;
  U8_NEXT(s, i, n, c);
  return c >= 0 && i == n;
}

TEST(IcuIsLegalUtf8, AgreesOnEveryShortSequence) {
  // Every lead with its own length; all continuations up to three bytes,
  // a sample of them for four.
  const uint8_t samples[] = {0x00, 0x7F, 0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xBF, 0xC0, 0xFF};
  for (int lead = 0; lead < 0xF8; ++lead) {
    const int n = nlssm::unicode::kit::bytesFromUTF8[lead];
    const int width1 = n >= 2 ? 256 : 1;
    const int width2 = n == 3 ? 256 : n == 4 ? 10 : 1;
    const int width3 = n == 4 ? 10 : 1;
    for (int b1 = 0; b1 < width1; ++b1)
      for (int i2 = 0; i2 < width2; ++i2)
        for (int i3 = 0; i3 < width3; ++i3) {
          const uint8_t s[4] = {static_cast<uint8_t>(lead), static_cast<uint8_t>(b1),
                                static_cast<uint8_t>(n == 3 ? i2 : samples[i2]), samples[i3]};
          bool expected = icu_one_character(s, n);
          // No upper bound on the byte after F4 (F4 90..BF stays legal).
          if (lead == 0xF4 && b1 >= 0x90 && b1 <= 0xBF && s[2] >= 0x80 && s[2] <= 0xBF &&
              s[3] >= 0x80 && s[3] <= 0xBF)
            expected = true;
          int64_t first_bad = n;
          for (int k = n - 1; k >= 1; --k)
            if (s[k] < 0x80 || s[k] > 0xBF) first_bad = k;
          int64_t index = -1;
          ASSERT_EQ(isLegalUTF8(s, n, &index), expected ? 1 : 0)
              << std::hex << lead << ' ' << b1 << ' ' << int(s[2]) << ' ' << int(s[3]);
          ASSERT_EQ(index, first_bad);
        }
  }
}

TEST(IcuUtfEbcdic, SingleBytesSitWhereCodePage1047PutsThemAndTheRestAscend) {
  namespace u = nlssm::unicode;
  // EBCDIC 1047 with LF at 0x15 and NEL at 0x25.
  UErrorCode err = U_ZERO_ERROR;
  UConverter *cnv = ucnv_open("ibm-1047_P100-1995,swaplfnl", &err);
  ASSERT_TRUE(U_SUCCESS(err));
  for (int cp = 0; cp < 0xA0; ++cp) {
    const UChar c = static_cast<UChar>(cp);
    char byte = 0;
    ucnv_fromUChars(cnv, &byte, 1, &c, 1, &err);
    ASSERT_TRUE(U_SUCCESS(err) || err == U_STRING_NOT_TERMINATED_WARNING);
    err = U_ZERO_ERROR;
    const uint8_t e = static_cast<uint8_t>(byte);
    EXPECT_EQ(u::i8s_utfe[cp], e) << std::hex << cp;
    EXPECT_EQ(u::utfe_i8s[e], cp) << std::hex << cp;
  }
  ucnv_close(cnv);
  for (int i8 = 0xA1; i8 < 0x100; ++i8) EXPECT_LT(u::i8s_utfe[i8 - 1], u::i8s_utfe[i8]);
  EXPECT_EQ(u::bytesFromI8S[0x9F], 0);
  EXPECT_EQ(u::bytesFromI8S[0xBF], -1);
  EXPECT_EQ(u::bytesFromI8S[0xF9], 4);
  EXPECT_EQ(u::bytesFromI8S[0xFA], -1);
}

}  // namespace
