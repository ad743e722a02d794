// UTF-8, UTF-16 and UTF-32 (both byte orders) against ICU's simple case
// mapping, for every code point whose mapping keeps its encoded length.
// Surrogate pairs of UTF-16 text are never mapped.
#include <gtest/gtest.h>
#include <unicode/uchar.h>
#include <unicode/utf16.h>
#include <unicode/utf8.h>

#include <string>

#include "case_support.hpp"

namespace {

using namespace case_test;

enum class Form { kUtf8, kUtf16Be, kUtf16Le, kUtf32Be, kUtf32Le };

struct Encoding {
  const char *name;
  int number;
  Form form;
};

void append(Form form, UChar32 c, Bytes &out) {
  switch (form) {
    case Form::kUtf8: {
      uint8_t b[4];
      int32_t n = 0;
      U8_APPEND_UNSAFE(b, n, c);
      out.insert(out.end(), b, b + n);
      return;
    }
    case Form::kUtf16Be:
    case Form::kUtf16Le: {
      UChar u[2];
      int32_t n = 0;
      U16_APPEND_UNSAFE(u, n, c);
      for (int32_t i = 0; i < n; ++i) {
        const uint8_t hi = static_cast<uint8_t>(u[i] >> 8), lo = static_cast<uint8_t>(u[i]);
        out.insert(out.end(), form == Form::kUtf16Be ? std::initializer_list<uint8_t>{hi, lo}
                                                     : std::initializer_list<uint8_t>{lo, hi});
      }
      return;
    }
    case Form::kUtf32Be:
    case Form::kUtf32Le:
      for (int k = 0; k < 4; ++k)
        out.push_back(static_cast<uint8_t>(c >> (8 * (form == Form::kUtf32Be ? 3 - k : k))));
      return;
  }
}

bool keeps_length(Form form, UChar32 c, UChar32 m) {
  if (form == Form::kUtf8) return U8_LENGTH(c) == U8_LENGTH(m);
  return form != Form::kUtf16Be && form != Form::kUtf16Le ? true : U16_LENGTH(c) == U16_LENGTH(m);
}

class IcuCase : public testing::TestWithParam<Encoding> {};

TEST_P(IcuCase, EveryCodePointMapsAsIcuSays) {
  const Encoding &e = GetParam();
  const NLSSMHandle *h = handle(e.number);
  ASSERT_NE(h, nullptr);
  const bool utf16 = e.form == Form::kUtf16Be || e.form == Form::kUtf16Le;
  for (const bool toUpper : {true, false}) {
    Bytes text, want;
    std::vector<std::pair<size_t, UChar32>> starts;
    int64_t characters = 0;
    for (UChar32 c = 0; c <= 0x10FFFF; ++c) {
      if (U_IS_SURROGATE(c)) continue;
      const UChar32 m = toUpper ? u_toupper(c) : u_tolower(c);
      if (!keeps_length(e.form, c, m)) continue;
      starts.emplace_back(text.size(), c);
      append(e.form, c, text);
      append(e.form, utf16 && c > 0xFFFF ? c : m, want);
      ++characters;
    }
    Bytes viaS = text, viaC = text;
    EXPECT_EQ(toUpper ? upper_s(h, viaS) : lower_s(h, viaS), 0);
    const NLSSlot cSlot = toUpper ? h->NLSStringUpperC : h->NLSStringLowerC;
    EXPECT_EQ(call<BytesFn>(h, cSlot, viaC.data(), characters, 0u), 0);
    for (const Bytes *got : {&viaS, &viaC}) {
      const auto diff = std::mismatch(got->begin(), got->end(), want.begin());
      if (diff.first == got->end()) continue;
      const size_t at = static_cast<size_t>(diff.first - got->begin());
      const auto cp = std::prev(
          std::upper_bound(starts.begin(), starts.end(), std::make_pair(at, UChar32{0x7FFFFFFF})));
      ADD_FAILURE() << e.name << (toUpper ? " upper" : " lower") << (got == &viaS ? " S" : " C")
                    << " form differs at U+" << std::hex << cp->second;
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Unicode, IcuCase,
                         testing::Values(Encoding{"UTF8", NLSSM_ENC_UTF8, Form::kUtf8},
                                         Encoding{"UTF16BE", NLSSM_ENC_WCS2_BE, Form::kUtf16Be},
                                         Encoding{"UTF16LE", NLSSM_ENC_WCS2_LE, Form::kUtf16Le},
                                         Encoding{"UTF32BE", NLSSM_ENC_WCS4_BE, Form::kUtf32Be},
                                         Encoding{"UTF32LE", NLSSM_ENC_HOST_CHARS, Form::kUtf32Le}),
                         [](const auto &info) { return std::string(info.param.name); });

}  // namespace
