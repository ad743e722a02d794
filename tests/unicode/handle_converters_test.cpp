// The handle-bound converters on reference-host handles: every code point
// through UTF-8 (ICU's bytes) and UTF-EBCDIC, bad input, and GetNumBytes
// against character boundaries from ICU's converters.
#include <gtest/gtest.h>
#include <nlssm/nlssm.h>
#include <unicode/ucnv.h>
#include <unicode/utf16.h>
#include <unicode/utf8.h>
#include <nlssm/reference_host.hpp>
#include "reference_handles.hpp"

#include <algorithm>
#include <cstring>
#include <string>
#include <vector>

#include "unicode/tables.hpp"

namespace {

namespace u = nlssm::unicode;
using SetPos = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);

using test_support::handle;

bool untouched(const uint8_t *p, int64_t from, int64_t to = 8) {
  return std::all_of(p + from, p + to, [](uint8_t b) { return b == 0xEE; });
}

// The UTF-EBCDIC bytes the host writes must also play the role (lead or
// trailing byte) that the module's tables give them.
TEST(HandleConverters, EveryCodePointRoundTripsWithinItsLength) {
  const NLSSMHandle *utf8 = handle(20), *utfe = handle(161);
  ASSERT_TRUE(utf8 && utfe);
  int failures = 0;
  for (uint32_t c = 0; c <= 0x10FFFF; ++c) {
    uint8_t want[4], out[8], oute[8];
    int32_t n = 0;
    U8_APPEND_UNSAFE(want, n, c);
    std::memset(out, 0xEE, 8), std::memset(oute, 0xEE, 8);
    uint32_t back = 0, backe = 0;
    const int64_t ne = ToUTFE(utfe, c, oute);
    const bool trailing = std::all_of(oute + 1, oute + ne, [](uint8_t b) {
      return u::utfe_i8s[b] >= 0xA0 && u::utfe_i8s[b] < 0xC0;
    });
    const bool ok =
        U_IS_SURROGATE(c)  // the host refuses them: nothing is written
            ? ToUTF8(utf8, c, out) == 3 && ne == 4 && untouched(out, 0) && untouched(oute, 0)
            : ToUTF8(utf8, c, out) == n && std::memcmp(out, want, n) == 0 && untouched(out, n) &&
                  FromUTF8(utf8, out, &back) == n && back == c && ne == u::utfe_length(c) &&
                  untouched(oute, ne) && trailing && FromUTFE(utfe, oute, &backe) == ne &&
                  backe == c;
    if (!ok && ++failures < 10) ADD_FAILURE() << "U+" << std::hex << c;
  }
  EXPECT_EQ(failures, 0);
}

TEST(HandleConverters, BadInputAnswersZeroAndWritesNothing) {
  const NLSSMHandle *utf8 = handle(20), *utfe = handle(161);
  auto rejects = [](auto from, const NLSSMHandle *h, const std::string &bytes) {
    uint32_t cp = 0xAAAAAAAA;
    return from(h, reinterpret_cast<const uint8_t *>(bytes.data()), &cp) == 0 && cp == 0xAAAAAAAA;
  };
  for (const char *bad : {"\xC3\x28", "\x80", "\xC0\x80", "\xE0\x80\x80", "\xED\xA0\x80",
                          "\xF4\x90\x80\x80", "\xF5\x80\x80\x80", "\xFC\x84\x80\x80\x80\x80"})
    EXPECT_TRUE(rejects(FromUTF8, utf8, bad)) << bad;
  for (int b = 0; b < 256; ++b)  // trailing bytes and unused leads
    EXPECT_TRUE(u::bytesFromI8S[u::utfe_i8s[b]] >= 0 || rejects(FromUTFE, utfe, {char(b)})) << b;
  EXPECT_TRUE(rejects(FromUTFE, utfe, {char(u::i8s_utfe[0xC5]), '\xC1'}));  // a lead, then 'A'
  uint8_t out[8];
  std::memset(out, 0xEE, 8);
  EXPECT_EQ(ToUTF8(utf8, 0x110000, out) + ToUTFE(utfe, 0x7FFFFFFF, out), 4 + 5);
  EXPECT_TRUE(untouched(out, 0));
}

// Sample characters of `encoding` converted one by one (modal text shifts
// around each double-byte character), and where each starts for the cursor.
std::string sample(int encoding, std::vector<int64_t> &starts) {
  const auto *info = nlssm::refhost::ReferenceHost::registry().find(encoding);
  std::string text;
  for (char32_t c : std::u32string_view(U"Ab 9\u00E9\u00C4\u3042\u6F22\uFF76\u20AC\U0001F600z")) {
    char piece[16];
    UChar units[2];
    int32_t k = 0;
    U16_APPEND_UNSAFE(units, k, c);
    UErrorCode err = U_ZERO_ERROR;
    UConverter *cnv = ucnv_open(info->converter.c_str(), &err);
    ucnv_setFromUCallBack(cnv, UCNV_FROM_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &err);
    const int32_t n = ucnv_fromUChars(cnv, piece, sizeof piece, units, k, &err);
    ucnv_close(cnv);
    if (U_FAILURE(err)) continue;  // not in this encoding
    starts.push_back(static_cast<int64_t>(text.size()) +
                     (info->encodingClass == 4 && *piece == 14));
    text.append(piece, static_cast<size_t>(n));
  }
  return text;
}

TEST(HandleConverters, GetNumBytesMeasuresCharactersInEveryClass) {
  for (int encoding : {20, 24, 25, 26, 78, 130, 135}) {
    const NLSSMHandle *h = handle(encoding);
    ASSERT_NE(h, nullptr);
    std::vector<int64_t> starts;
    std::string text = sample(encoding, starts);
    const auto count = static_cast<int64_t>(starts.size());
    ASSERT_GE(count, 6) << encoding;
    auto *p = reinterpret_cast<uint8_t *>(text.data());
    const uint64_t length = text.size();
    const auto set_pos = reinterpret_cast<SetPos>(h->stringSetPos);
    auto at = [&](int64_t i) {
      NLSString s{p, length, length, 0, 0, -9, -1, 0, 0, 0};
      set_pos(h, &s, 0, 0);
      EXPECT_EQ(set_pos(h, &s, 0, i), i);
      return s;
    };
    for (int64_t i = 0; i < count; ++i)
      for (int64_t n = 0; i + n <= count + 1; ++n) {
        const NLSString s = at(i);
        int64_t bytes = -1;
        uint32_t state = 0xAAAA;
        const bool inside = n == 0 || i + n < count;
        EXPECT_EQ(GetNumBytes(h, &s, n, 0, &bytes, &state),
                  inside ? NLSSM_OK : NLSSM_GETNUMBYTES_OUTSIDE);
        EXPECT_EQ(bytes,
                  (n > 0 && inside ? starts[i + n] : static_cast<int64_t>(length)) - starts[i]);
        EXPECT_EQ(state, !inside ? 0xAAAA : at(i + n).charKind) << encoding << " " << i << "+" << n;
      }
  }
  int64_t bytes = 0;
  EXPECT_EQ(GetNumBytes(handle(20), nullptr, 1, 0, &bytes, nullptr), NLSSM_E_NULL_ARGUMENT);
}

}  // namespace
