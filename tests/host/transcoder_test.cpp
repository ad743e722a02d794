// The NLS object's six UTF transcoders: every code point through each pair,
// known byte forms, and the statuses of bad or short input.
#include <gtest/gtest.h>
#include <unicode/ustring.h>

#include "host_test_support.hpp"

using namespace hosttest;

namespace {

std::int64_t transcode(void *nls, int slot, const std::string &in, std::string &out,
                       std::size_t capacity = 64) {
  out.assign(capacity, '\0');
  std::uint64_t produced = 0;
  const auto status = call<NLSHostTranscodeFn>(
      nls, slot, static_cast<const void *>(in.data()), static_cast<std::uint64_t>(in.size()),
      static_cast<void *>(out.data()), static_cast<std::uint64_t>(capacity), &produced,
      static_cast<void *>(nullptr), static_cast<void *>(nullptr));
  out.resize(produced);
  return status;
}

std::string utf16(std::u16string text) {
  return {reinterpret_cast<const char *>(text.data()), text.size() * 2};
}

}  // namespace

TEST(UtfTranscoders, EveryCodePointRoundTrips) {
  auto host = standalone();
  void *nls = host->nls();
  std::uint64_t failures = 0;
  for (char32_t c = 0; c <= 0x10FFFF; ++c) {
    if (c >= 0xD800 && c <= 0xDFFF) continue;
    std::string intermediate, utf8, utfe, back;
    bool ok =
        transcode(nls, NLSHOST_SLOT_NLS_CODE_POINT_TO_INTERMEDIATE,
                  host_chars(std::u32string(1, c)), intermediate) == 0 &&
        transcode(nls, NLSHOST_SLOT_NLS_INTERMEDIATE_TO_CODE_POINT, intermediate, back) == 0 &&
        back == host_chars(std::u32string(1, c));
    ok = ok && transcode(nls, NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTF8, intermediate, utf8) == 0 &&
         transcode(nls, NLSHOST_SLOT_NLS_UTF8_TO_INTERMEDIATE, utf8, back) == 0 &&
         back == intermediate;
    ok = ok && transcode(nls, NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTFE, intermediate, utfe) == 0 &&
         transcode(nls, NLSHOST_SLOT_NLS_UTFE_TO_INTERMEDIATE, utfe, back) == 0 &&
         back == intermediate;
    // The UTF-8 form is ICU's.
    char expected[4];
    int32_t n = 0;
    UErrorCode error = U_ZERO_ERROR;
    u_strToUTF8(expected, 4, &n, reinterpret_cast<const UChar *>(intermediate.data()),
                static_cast<int32_t>(intermediate.size() / 2), &error);
    ok = ok && utf8 == std::string(expected, static_cast<std::size_t>(n));
    if (!ok && ++failures < 10) ADD_FAILURE() << "U+" << std::hex << static_cast<std::uint32_t>(c);
  }
  EXPECT_EQ(failures, 0u);
}

TEST(UtfTranscoders, KnownUtfEbcdicForms) {
  auto host = standalone();
  std::string out;
  ASSERT_EQ(transcode(host->nls(), NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTFE,
                      utf16(u"A\u00A0\uFEFF\n\u0085"), out),
            0);
  // Line feed is 0x15 and next line 0x25, as in the module's own tables.
  EXPECT_EQ(out, "\xC1\x80\x41\xDD\x73\x66\x73\x15\x25");
}

TEST(UtfTranscoders, BadAndShortInput) {
  auto host = standalone();
  const struct {
    int slot;
    std::string in;
    std::size_t capacity;
    std::int64_t status;
    std::string out;
  } cases[] = {
      {NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTF8, utf16(u"a\xD800"), 64, NLSHOST_E_TRUNCATED, "a"},
      {NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTF8, utf16(u"a\xDC00z"), 64, NLSHOST_E_ILL_FORMED, "a"},
      {NLSHOST_SLOT_NLS_UTF8_TO_INTERMEDIATE, "\xE4\xB8", 64, NLSHOST_E_TRUNCATED, ""},
      {NLSHOST_SLOT_NLS_UTF8_TO_INTERMEDIATE, "\xC0\x80", 64, NLSHOST_E_ILL_FORMED, ""},
      {NLSHOST_SLOT_NLS_UTF8_TO_INTERMEDIATE, "\xED\xA0\x80", 64, NLSHOST_E_ILL_FORMED, ""},
      {NLSHOST_SLOT_NLS_CODE_POINT_TO_INTERMEDIATE, host_chars(U"\x110000"), 64,
       NLSHOST_E_ILL_FORMED, ""},
      // A trailing byte alone.
      {NLSHOST_SLOT_NLS_UTFE_TO_INTERMEDIATE, "\x41", 64, NLSHOST_E_ILL_FORMED, ""},
      // Whole characters only: a and the supplementary character need 5 bytes, not 4.
      {NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTF8, utf16(u"a\U0001F600"), 4, NLSHOST_E_TOO_SMALL, "a"},
  };
  for (const auto &c : cases) {
    std::string out;
    EXPECT_EQ(transcode(host->nls(), c.slot, c.in, out, c.capacity), c.status) << c.slot;
    EXPECT_EQ(out, c.out) << c.slot;
  }
}
