// Number members on reference-host handles of every class: the integer
// reader's rules, the limits, the module's own integer field, narrowing of
// the locale's characters, and the double members around the locale.
#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <vector>

#include "numeric_support.hpp"

using namespace numtest;

namespace {

class EveryEncoding : public ::testing::TestWithParam<int> {
 protected:
  const NLSSMHandle *h = handle(GetParam());
  void SetUp() override { ASSERT_NE(h, nullptr); }
};

struct IntCase {
  const char *text;
  size_t length;  // with embedded NULs
  uint32_t flags;
  uint32_t status;
  int64_t value;
  int32_t consumedChars;
};

constexpr uint32_t kStrict = NLSSM_NUMBER_STRICT_TAIL;
constexpr uint32_t kNaN = NLSSM_E_NOT_A_NUMBER;
constexpr uint32_t kOverflow = NLSSM_E_INT_OVERFLOW;
#define T(s) s, sizeof(s) - 1

const IntCase kIntCases[] = {
    {T("+9223372036854775807 "), kStrict, 0, INT64_MAX, 21},
    {T("9223372036854775808"), 0, kOverflow, 0, 19},
    {T("-9223372036854775809"), 0, kOverflow, 0, 20},
    {T("12 ab"), kStrict, kNaN, 12, 2},
    {T("-12ab"), kStrict, kNaN, -12, 3},
    {T("12   "), kStrict, 0, 12, 5},
    {T("12  \0zz"), kStrict, 0, 12, 4},
    {T("7\0 x"), 0, 0, 7, 1},
    {T(""), 0, 0, 0, 0},
    {T("   "), 0, 0, 0, 3},
    {T("-  5"), 0, 0, -5, 4},
    {T("+"), 0, kNaN, 0, 1},
    {T("-   "), kStrict, kNaN, 0, 4},
    {T("--5"), 0, kNaN, 0, 1},
    {T(" x"), 0, kNaN, 0, 1},
};
#undef T

TEST_P(EveryEncoding, IntegerReaderRules) {
  const int64_t unit = unit_bytes(h);
  for (const IntCase &c : kIntCases) {
    const std::string text = encode(h, std::string(c.text, c.length));
    int64_t value = 99;
    int32_t consumed = -1;
    EXPECT_EQ(to_intmax(h, text, c.flags, value, consumed), c.status) << c.text;
    EXPECT_EQ(value, c.value) << c.text;
    EXPECT_EQ(consumed, c.consumedChars * unit) << c.text;
  }
}

TEST_P(EveryEncoding, LimitsComeBeforeAnythingIsRead) {
  const std::string longText(153, '1');
  int64_t value = 0;
  int32_t n = -1;
  double real = 0;
  char out[160];
  auto toInt = reinterpret_cast<ToIntmax>(h->NLSStringToIntmax);
  auto toDouble = reinterpret_cast<ToDouble>(h->NLSStringToDouble);
  auto fromInt = reinterpret_cast<FromIntmax>(h->NLSStringFromIntmax);
  auto fromDouble = reinterpret_cast<FromDouble>(h->NLSStringFromDouble);
  for (const char *text : {longText.data(), static_cast<const char *>(nullptr)}) {
    const uint32_t tooLong = NLSSM_E_NUMBER_TOO_LONG, null = NLSSM_E_NULL_ARGUMENT;
    EXPECT_EQ(toInt(h, nullptr, text, 153, 0, &value, &n), tooLong);
    EXPECT_EQ(toDouble(h, nullptr, text, 153, 0, 0, &real, &n), tooLong);
    EXPECT_EQ(toInt(h, nullptr, text, 152, 0, &value, text ? nullptr : &n), null);
    EXPECT_EQ(toDouble(h, nullptr, text, 152, 0, 0, &real, text ? nullptr : &n), null);
    for (int64_t capacity : {int64_t{153}, int64_t{-1}}) {
      EXPECT_EQ(fromInt(h, nullptr, 1, 1, 0, out, capacity, &n), tooLong);
      EXPECT_EQ(fromDouble(h, nullptr, 1, 1, 0, 0, out, capacity, &n), tooLong);
    }
    EXPECT_EQ(fromInt(h, nullptr, 1, 1, 0, text ? nullptr : out, 8, text ? &n : nullptr), null);
    EXPECT_EQ(fromDouble(h, nullptr, 1, 1, 0, 0, text ? nullptr : out, 8, text ? &n : nullptr),
              null);
  }
  EXPECT_EQ(n, -1) << "nothing written";
}

struct FormatCase {
  int64_t value;
  int64_t width;
  uint32_t flags;
  int64_t capacityChars;
  const char *text;
  uint32_t status;
};

const FormatCase kFormatCases[] = {
    {0, 3, NLSHOST_NUMBER_SIGN, 8, "  0", 0},  // the module's field: no sign
    {123456789, 0, 0, 8, "********", NLSSM_E_NUMBER_DOES_NOT_FIT},
    {42, 9, 0, 8, "********", NLSSM_E_NUMBER_DOES_NOT_FIT},
    {-1234567, 12, NLSHOST_NUMBER_GROUPING, 12, "  -1,234,567", 0},
    {5, 3, NLSHOST_NUMBER_SIGN | NLSHOST_NUMBER_LEFT, 8, "+5 ", 0},
};

TEST_P(EveryEncoding, IntegerFields) {
  for (const FormatCase &c : kFormatCases) {
    std::string out;
    EXPECT_EQ(from_intmax(h, c.value, c.width, c.flags, out, c.capacityChars * unit_bytes(h)),
              c.status)
        << c.text;
    EXPECT_EQ(out, encode(h, c.text)) << c.text;
  }
}

TEST_P(EveryEncoding, DoublesThroughTheLocale) {
  std::string out;
  EXPECT_EQ(from_double(h, -1234.5, 10, 2, NLSHOST_NUMBER_GROUPING, out, 12 * unit_bytes(h)), 0);
  EXPECT_EQ(out, encode(h, " -1,234.50"));
  EXPECT_EQ(from_double(h, 6.5e-9, 0, NLSHOST_DECIMALS_SHORTEST, 0, out, 8 * unit_bytes(h)), 0);
  EXPECT_EQ(out, encode(h, "6.5E-9"));
  EXPECT_EQ(from_double(h, 1e300, 4, 2, 0, out, 8 * unit_bytes(h)), NLSSM_E_NUMBER_DOES_NOT_FIT);
  EXPECT_EQ(out, encode(h, "****"));
  double value = 0;
  int32_t consumed = -1;
  EXPECT_EQ(to_double(h, encode(h, " -1,234.5e1 x"), value, consumed), 0);
  EXPECT_EQ(value, -12345.0);
  EXPECT_EQ(consumed, 12 * unit_bytes(h));
  EXPECT_EQ(to_double(h, encode(h, "1.5 x"), value, consumed, NLSHOST_PARSE_STRICT_TAIL), kNaN);
  EXPECT_EQ(consumed, 12 * unit_bytes(h)) << "not written on failure";
}

INSTANTIATE_TEST_SUITE_P(Numbers, EveryEncoding, ::testing::ValuesIn(kEncodings),
                         [](const auto &info) { return std::to_string(info.param); });

// ---- Narrowing, with a locale whose formatter writes chosen characters -------------

std::u32string g_localeOutput;

int64_t fixed_output(const std::u32string &text, uint32_t *buffer, int64_t capacity,
                     int32_t *count) {
  const auto n = std::min<int64_t>(std::ssize(text), capacity);
  std::copy_n(text.begin(), n, buffer);
  *count = static_cast<int32_t>(n);
  return 0;
}
int64_t fixed_integer(void *, int64_t, int64_t, int64_t, uint32_t, uint32_t *buffer,
                      int64_t capacity, int32_t *count) {
  return fixed_output(g_localeOutput, buffer, capacity, count);
}
int64_t fixed_double(void *, double, int64_t, int64_t, uint32_t, uint32_t *buffer, int64_t capacity,
                     int32_t *count) {
  return fixed_output(g_localeOutput, buffer, capacity, count);
}

struct FixedLocale {
  void *slots[10] = {};
  FixedLocale() {
    slots[NLSHOST_SLOT_LOCALE_FORMAT_INTEGER_CHARS] = reinterpret_cast<void *>(&fixed_integer);
    slots[NLSHOST_SLOT_LOCALE_FORMAT_DOUBLE_CHARS] = reinterpret_cast<void *>(&fixed_double);
  }
};

struct NarrowCase {
  int encoding;
  bool isDouble;
  int64_t capacity;
  const char *bytes;
  uint32_t status;
};

TEST(Narrowing, KeepsNumberCharactersAndSubstitutesTheRest) {
  // Digits, apostrophe, no-break space, exponent marks and a letter.
  g_localeOutput = U"1'2\u00A03Ee\u00E9";
  const NarrowCase cases[] = {
      {29, false, 16, "1'2\xA0\x33??\?", 0},  // Latin-1: E and e only for doubles
      {29, true, 16, "1'2\xA0\x33\x45\x65?", 0},
      {78, true, 16, "\xF1\x7D\xF2\x41\xF3\xC5\x85\x6F", 0},    // EBCDIC 037 substitutes
      {78, false, 3, "\xF1\x7D\xF2", 0},                        // stops at the capacity
      {20, false, 16, "1'2\xC2\xA0\x33??\?", 0},                // UTF-8: substitute copied whole
      {20, false, 4, "1'2*", NLSSM_E_DEST_TOO_SMALL},           // ... or '*' when it does not fit
      {161, false, 16, "\xF1\x7D\xF2\x40\xF3\xC5\x85\x6F", 0},  // UTF-EBCDIC: a blank
  };
  FixedLocale locale;
  for (const NarrowCase &c : cases) {
    const NLSSMHandle *h = handle(c.encoding);
    std::string out;
    const int64_t status = c.isDouble ? from_double(h, 1, 0, 0, 0, out, c.capacity, locale.slots)
                                      : from_intmax(h, 1, 0, 1, out, c.capacity, locale.slots);
    EXPECT_EQ(status, c.status) << c.encoding;
    EXPECT_EQ(out, c.bytes) << c.encoding << (c.isDouble ? " double" : " integer");
  }
}

TEST(Narrowing, NoBreakSpaceGroupingOfARealLocale) {
  void *nls = host().nls();
  const std::u32string name = U"pl_PL";
  void *polish = reinterpret_cast<NLSHostLocaleFn>(NLSSM_HOST_SLOT(nls, NLSHOST_SLOT_NLS_LOCALE))(
      nls, reinterpret_cast<const uint32_t *>(name.data()), 5);
  ASSERT_NE(polish, nullptr);
  std::string out;
  EXPECT_EQ(from_intmax(handle(78), -1234567, 0, NLSHOST_NUMBER_GROUPING, out, 20, polish), 0);
  EXPECT_EQ(out, "\x60\xF1\x41\xF2\xF3\xF4\x41\xF5\xF6\xF7");
  EXPECT_EQ(from_double(handle(20), 0.5, 0, 1, 0, out, 20, polish), 0);
  EXPECT_EQ(out, "0,5");
  reinterpret_cast<NLSHostLocaleDestroyFn>(NLSSM_HOST_SLOT(polish, NLSHOST_SLOT_LOCALE_DESTROY))(
      polish);
}

// The members that only a host with other wide encodings places in the
// slots, called directly on a UTF-32BE handle (its converters are UTF-32BE).
TEST(ConvertingMembers, WideTextThroughTheHandlesConverters) {
  const NLSSMHandle *h = handle(26);
  const std::string text = encode(h, " -42 ");
  int64_t value = 0;
  int32_t consumed = 0;
  EXPECT_EQ(NLSStringToIntmax_toQVChar(h, nullptr, text.data(), std::ssize(text),
                                       NLSSM_NUMBER_STRICT_TAIL, &value, &consumed),
            0);
  EXPECT_EQ(value, -42);
  EXPECT_EQ(consumed, 20);
  double real = 0;
  EXPECT_EQ(
      NLSStringToDouble_toQVChar(h, nullptr, text.data(), std::ssize(text), 0, 0, &real, &consumed),
      0);
  EXPECT_EQ(real, -42.0);
  char out[32];
  int32_t written = 0;
  EXPECT_EQ(NLSStringFromIntmax_fromQVChar(h, nullptr, -42, 4, 0, out, 32, &written), 0);
  EXPECT_EQ(std::string(out, written), encode(h, " -42"));
  EXPECT_EQ(NLSStringFromDouble_fromQVChar(h, nullptr, 2.5, 0, 1, 0, out, 32, &written), 0);
  EXPECT_EQ(std::string(out, written), encode(h, "2.5"));
  // Three bytes are too few for a UTF-32 character.
  EXPECT_EQ(NLSStringToIntmax_toQVChar(h, nullptr, text.data(), 3, 0, &value, &consumed),
            NLSHOST_E_TRUNCATED);
}

// UTF-16 number text holds one character per 4-byte unit: on this
// little-endian host, big-endian text reads as each character followed by
// U+0000.
TEST(WideLayout, Utf16BigEndianNumberText) {
  std::string out;
  EXPECT_EQ(from_intmax(handle(24), -5, 2, 0, out, 8), 0);
  EXPECT_EQ(out, std::string("\0-\0\0\0\x35\0\0", 8));
  int64_t value = 0;
  int32_t consumed = 0;
  EXPECT_EQ(to_intmax(handle(24), std::string("\0\x37\0\0\0\x38", 6), 0, value, consumed), 0);
  EXPECT_EQ(value, 7) << "bytes / 4 units: the trailing half unit is not read";
  EXPECT_EQ(consumed, 4);
}

}  // namespace
