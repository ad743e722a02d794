// Locale objects: parsing doubles from bytes and characters, formatting
// doubles and integers into characters and UTF-8.
#include <gtest/gtest.h>

#include "host_test_support.hpp"

using namespace hosttest;

namespace {

struct Locale {
  std::unique_ptr<nlssm::refhost::ReferenceHost> host = standalone();
  void *object = nullptr;

  explicit Locale(std::u32string name = U"en_US") { object = open(name); }
  ~Locale() {
    if (object != nullptr) call<NLSHostLocaleDestroyFn>(object, NLSHOST_SLOT_LOCALE_DESTROY);
  }
  void *open(const std::u32string &name) {
    return call<NLSHostLocaleFn>(host->nls(), NLSHOST_SLOT_NLS_LOCALE,
                                 reinterpret_cast<const std::uint32_t *>(name.data()),
                                 static_cast<std::int64_t>(name.size()));
  }
  std::int64_t parse(int slot, const std::string &text, std::uint32_t options, double &value,
                     std::int32_t &consumed) {
    return call<NLSHostParseDoubleBytesFn>(
        object, slot, reinterpret_cast<const std::uint8_t *>(text.data()),
        static_cast<std::int64_t>(text.size()), static_cast<void *>(nullptr), options, &value,
        &consumed);
  }
  std::int64_t format(double value, std::int64_t width, std::int64_t decimals, std::uint32_t flags,
                      std::string &out, std::int64_t capacity = 40) {
    std::uint32_t buffer[64];
    std::int32_t count = 0;
    const auto status =
        call<NLSHostFormatDoubleCharsFn>(object, NLSHOST_SLOT_LOCALE_FORMAT_DOUBLE_CHARS, value,
                                         width, decimals, flags, buffer, capacity, &count);
    out.assign(buffer, buffer + count);  // ASCII output in these cases
    return status;
  }
};

struct ParseCase {
  const char *text;
  std::uint32_t options;
  std::int64_t status;
  double value;
  std::int32_t consumed;
};

class ParseAscii : public ::testing::TestWithParam<ParseCase> {};

TEST_P(ParseAscii, AsTheLocaleReadsIt) {
  const ParseCase &c = GetParam();
  Locale locale;
  for (int slot : {NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_ASCII, NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_UTF8}) {
    double value = -1;
    std::int32_t consumed = -1;
    EXPECT_EQ(locale.parse(slot, c.text, c.options, value, consumed), c.status);
    EXPECT_EQ(value, c.value);
    EXPECT_EQ(consumed, c.consumed);
  }
}

INSTANTIATE_TEST_SUITE_P(
    Host, ParseAscii,
    ::testing::Values(ParseCase{"  1,234.5  ", 0, 0, 1234.5, 11}, ParseCase{"+2.5", 0, 0, 2.5, 4},
                      ParseCase{"1e3", 0, 0, 1000, 3}, ParseCase{"12abc", 0, 0, 12, 2},
                      ParseCase{"12abc", NLSHOST_PARSE_STRICT_TAIL, NLSHOST_E_NOT_A_NUMBER, 12, 2},
                      ParseCase{"12  ", NLSHOST_PARSE_STRICT_TAIL, 0, 12, 4},
                      ParseCase{"   ", 0, 0, 0, 3},
                      ParseCase{" abc", 0, NLSHOST_E_NOT_A_NUMBER, 0, 1},
                      ParseCase{"7", 0x1, NLSHOST_E_BAD_OPTIONS, -1, -1}));

}  // namespace

TEST(Locale, OnlyLocalesIcuKnows) {
  Locale locale;
  EXPECT_NE(locale.object, nullptr);
  EXPECT_EQ(locale.open(U"xx_YY"), nullptr);
  EXPECT_EQ(locale.open(U"en US"), nullptr);
  EXPECT_EQ(locale.host->object_counts().locales, 1);
}

TEST(Locale, ParseEbcdicAndCharacters) {
  Locale locale;
  double value = 0;
  std::int32_t consumed = 0;
  EXPECT_EQ(locale.parse(NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_EBCDIC, "\x40\x60\xF1\xF2\x4B\xF5", 0,
                         value, consumed),
            0);
  EXPECT_EQ(value, -12.5);
  EXPECT_EQ(consumed, 6);
  const std::u32string text = U" 3.25";
  EXPECT_EQ(call<NLSHostParseDoubleCharsFn>(locale.object, NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_CHARS,
                                            reinterpret_cast<const std::uint32_t *>(text.data()),
                                            std::int64_t{5}, std::uint32_t{0}, &value, &consumed),
            0);
  EXPECT_EQ(value, 3.25);
  EXPECT_EQ(consumed, 5);
}

TEST(Locale, FormatDoubles) {
  Locale locale;
  const std::int64_t shortest = NLSHOST_DECIMALS_SHORTEST;
  const struct {
    double value;
    std::int64_t width, decimals;
    std::uint32_t flags;
    std::int64_t capacity, status;
    const char *text;
  } cases[] = {
      {1234.5, 10, 2, NLSHOST_NUMBER_GROUPING, 40, 0, "  1,234.50"},
      // Rounded from the binary value: 1234.5 is a tie (to even), 2.675 lies below.
      {1234.5, 0, 0, 0, 40, 0, "1234"},
      {2.675, 0, 2, 0, 40, 0, "2.67"},
      {12345, 0, 2, NLSHOST_NUMBER_SCIENTIFIC, 40, 0, "1.23E4"},
      {5, 4, 0, NLSHOST_NUMBER_SIGN | NLSHOST_NUMBER_LEFT, 40, 0, "+5  "},
      {1234.5, 3, 1, 0, 40, NLSHOST_E_NUMBER_FIELD, "***"},
      {1.5, 8, 1, 0, 4, NLSHOST_E_NUMBER_FIELD, "****"},
      // The shortest form that reads back, shrunk to the width.
      {0.1, 0, shortest, 0, 40, 0, "0.1"},
      {1234567.25, 0, shortest, NLSHOST_NUMBER_GROUPING, 40, 0, "1,234,567.25"},
      {1234.5678, 6, shortest, 0, 40, 0, "1234.6"},
      {-1e300, 0, shortest, 0, 40, 0, "-1E300"},
      {1.0 / 3, 7, shortest, 0, 40, 0, "0.33333"},
      {6.02214076e23, 9, shortest, 0, 40, 0, "6.0221E23"},
      {2.5e-7, 0, shortest, NLSHOST_NUMBER_SCIENTIFIC, 40, 0, "2.5E-7"},
      {-1e300, 3, shortest, 0, 40, NLSHOST_E_NUMBER_FIELD, "***"},
  };
  std::string out;
  for (const auto &c : cases) {
    EXPECT_EQ(locale.format(c.value, c.width, c.decimals, c.flags, out, c.capacity), c.status)
        << c.text;
    EXPECT_EQ(out, c.text);
  }
  EXPECT_EQ(locale.format(1, 0, 0, 0x100, out), NLSHOST_E_BAD_OPTIONS);
  EXPECT_EQ(locale.format(1, 0, 17, 0, out), NLSHOST_E_BAD_OPTIONS);
}

TEST(Locale, FormatIntegersAndUtf8) {
  Locale locale;
  std::uint32_t chars[32];
  std::int32_t count = 0;
  EXPECT_EQ(
      call<NLSHostFormatIntegerCharsFn>(locale.object, NLSHOST_SLOT_LOCALE_FORMAT_INTEGER_CHARS,
                                        std::int64_t{-1234567}, std::int64_t{12}, std::int64_t{0},
                                        NLSHOST_NUMBER_GROUPING, chars, std::int64_t{32}, &count),
      0);
  EXPECT_EQ(std::string(chars, chars + count), "  -1,234,567");
  std::uint8_t bytes[32];
  EXPECT_EQ(call<NLSHostFormatDoubleUtf8Fn>(locale.object, NLSHOST_SLOT_LOCALE_FORMAT_DOUBLE_UTF8,
                                            -0.125, std::int64_t{7}, std::int64_t{3},
                                            std::uint32_t{0}, bytes, std::int64_t{32}, &count),
            0);
  EXPECT_EQ(std::string(bytes, bytes + count), " -0.125");
}
