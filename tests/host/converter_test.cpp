// Converters: every described encoding round-trips a sample of its repertoire
// through the host's character form, multi-byte characters respect the
// record's byte ranges, and the statuses of short or bad input.
#include <gtest/gtest.h>
#include <unicode/ucnv.h>
#include <unicode/uset.h>

#include "host_test_support.hpp"

using namespace hosttest;

namespace {

// An ICU converter for a registry converter name. The pages the host
// compiles in ("table:<page>[,swaplfnl]") open from the same mappings built
// by ICU's makeconv, an independent reading of them (without the swap).
UConverter *open_icu(const std::string &converter, UErrorCode &error) {
  const std::string prefix = "table:";
  if (converter.rfind(prefix, 0) != 0) return ucnv_open(converter.c_str(), &error);
  const std::string page = converter.substr(prefix.size(), converter.find(',') - prefix.size());
  return ucnv_openPackage(NLSSM_CATALOGUE_CNV_DIR "/", page.c_str(), &error);
}

// Up to `limit` code points spread over the converter's round-trip set.
std::u32string repertoire_sample(const char *converter, std::size_t limit) {
  std::u32string all;
  if (std::string(converter) == "builtin:utf-ebcdic") {
    for (char32_t c = 0; c <= 0x10FFFF; c += 97)
      if (c < 0xD800 || c > 0xDFFF) all.push_back(c);
  } else {
    UErrorCode error = U_ZERO_ERROR;
    UConverter *cnv = open_icu(converter, error);
    USet *set = uset_openEmpty();
    ucnv_getUnicodeSet(cnv, set, UCNV_ROUNDTRIP_SET, &error);
    for (int32_t r = 0; r < uset_getItemCount(set); ++r) {
      UChar32 start, end;
      if (uset_getItem(set, r, &start, &end, nullptr, 0, &error) == 0)
        for (UChar32 c = start; c <= end; ++c) all.push_back(static_cast<char32_t>(c));
    }
    uset_close(set);
    ucnv_close(cnv);
  }
  const std::size_t step = all.size() / limit + 1;
  std::u32string sample;
  for (std::size_t i = 0; i < all.size(); i += step) sample.push_back(all[i]);
  return sample;
}

bool in_ranges(const std::uint8_t *ranges, std::uint8_t byte) {
  for (; ranges[0] != 0; ranges += 2)
    if (byte >= ranges[0] && byte <= ranges[1]) return true;
  return false;
}

struct Converter {
  void *object;
  ~Converter() {
    if (object != nullptr) call<NLSHostConverterDestroyFn>(object, NLSHOST_SLOT_CONVERTER_DESTROY);
  }
  std::int64_t convert(const std::string &in, std::string &out, std::size_t capacity = 0) {
    out.assign(capacity ? capacity : in.size() * 4 + 16, '\0');
    std::uint64_t produced = 0;
    const auto status = call<NLSHostConverterConvertFn>(
        object, NLSHOST_SLOT_CONVERTER_CONVERT, static_cast<const void *>(in.data()),
        static_cast<std::uint64_t>(in.size()), static_cast<void *>(out.data()),
        static_cast<std::uint64_t>(out.size()), &produced, static_cast<void *>(nullptr));
    out.resize(produced);
    return status;
  }
};

Converter one_way(void *nls, int slot, std::int64_t number) {
  return {call<NLSHostConverterForFn>(nls, slot, number, static_cast<void *>(nullptr),
                                      static_cast<void *>(nullptr))};
}

Converter between(void *nls, std::int64_t from, std::int64_t to) {
  return {call<NLSHostConverterBetweenFn>(nls, NLSHOST_SLOT_NLS_CONVERTER_BETWEEN, from, to,
                                          static_cast<void *>(nullptr),
                                          static_cast<void *>(nullptr))};
}

}  // namespace

// The compiled pages read every byte as ICU reads the same mapping (with
// line feed and next line exchanged in the swapped variants) and write
// every character they read back as its byte.
TEST(Converters, CompiledPagesAgreeWithTheirMappingsByteForByte) {
  auto host = standalone();
  void *nls = host->nls();
  int pages = 0;
  for (const auto &row : nlssm::refhost::Registry::instance().rows()) {
    if (!row.described || row.converter.rfind("table:", 0) != 0) continue;
    SCOPED_TRACE(row.number);
    ++pages;
    UErrorCode error = U_ZERO_ERROR;
    UConverter *icu = open_icu(row.converter, error);
    ASSERT_TRUE(U_SUCCESS(error));
    const bool swapped = row.converter.find(",swaplfnl") != std::string::npos;
    Converter from = one_way(nls, NLSHOST_SLOT_NLS_CONVERTER_FROM, row.number);
    Converter to = one_way(nls, NLSHOST_SLOT_NLS_CONVERTER_TO, row.number);
    for (int b = 0; b < 256; ++b) {
      const char byte = static_cast<char>(b);
      UChar units[4];
      error = U_ZERO_ERROR;
      ucnv_setToUCallBack(icu, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
      const int32_t n = ucnv_toUChars(icu, units, 4, &byte, 1, &error);
      std::string decoded;
      ASSERT_EQ(from.convert(std::string(1, byte), decoded), 0);
      if (U_FAILURE(error) || n != 1) continue;  // unassigned in the page
      char32_t expected = units[0];
      if (swapped && (expected == 0x0A || expected == 0x85)) expected ^= 0x0A ^ 0x85;
      EXPECT_EQ(decoded, host_chars(std::u32string(1, expected))) << b;
      std::string encoded;
      ASSERT_EQ(to.convert(decoded, encoded), 0);
      EXPECT_EQ(encoded, std::string(1, byte)) << b;
    }
    ucnv_close(icu);
  }
  EXPECT_EQ(pages, 19);  // 228 (ISCII) has no single-byte converter
}

TEST(Converters, EveryDescribedEncodingRoundTripsItsRepertoire) {
  auto host = standalone();
  void *nls = host->nls();
  for (const auto &row : nlssm::refhost::Registry::instance().rows()) {
    if (!row.described) continue;
    SCOPED_TRACE(row.number);
    const std::u32string sample = repertoire_sample(row.converter.c_str(), 1500);
    ASSERT_GT(sample.size(), 100u);
    Converter to = one_way(nls, NLSHOST_SLOT_NLS_CONVERTER_TO, row.number);
    Converter from = one_way(nls, NLSHOST_SLOT_NLS_CONVERTER_FROM, row.number);
    ASSERT_NE(to.object, nullptr);
    ASSERT_NE(from.object, nullptr);
    std::string encoded, decoded;
    ASSERT_EQ(to.convert(host_chars(sample), encoded), 0);
    ASSERT_EQ(from.convert(encoded, decoded), 0);
    EXPECT_EQ(decoded, host_chars(sample));

    // Each multi-byte character starts with a lead byte and goes on with a
    // trail byte of the record's lists (modal sets: between shifts).
    const NLSHostEncodingRecord &r = row.record;
    if (r.encodingClass != 4 && r.encodingClass != 5) continue;
    for (char32_t c : sample) {
      std::string one;
      ASSERT_EQ(to.convert(host_chars(std::u32string(1, c)), one), 0);
      const auto *b = reinterpret_cast<const std::uint8_t *>(one.data());
      if (r.encodingClass == 5 && one.size() >= 2) {
        EXPECT_TRUE(in_ranges(r.charRanges.leadRanges, b[0]))
            << std::hex << static_cast<std::uint32_t>(c);
        EXPECT_TRUE(in_ranges(r.charRanges.trailRanges, b[1]))
            << std::hex << static_cast<std::uint32_t>(c);
      } else if (r.encodingClass == 4 && one.size() == 4) {
        EXPECT_EQ(b[0], r.charRanges.shiftOut[0]);
        EXPECT_EQ(b[3], r.charRanges.shiftIn[0]);
        EXPECT_TRUE(in_ranges(r.charRanges.leadRanges, b[1]))
            << std::hex << static_cast<std::uint32_t>(c);
        EXPECT_TRUE(in_ranges(r.charRanges.trailRanges, b[2]))
            << std::hex << static_cast<std::uint32_t>(c);
      }
    }
  }
  EXPECT_EQ(host->object_counts().converters, 0);
}

TEST(Converters, BetweenTwoEncodingsAndStatuses) {
  auto host = standalone();
  void *nls = host->nls();
  const struct {
    std::int64_t from, to;
    std::string in;
    std::size_t capacity;
    std::int64_t status;
    std::string out;
  } cases[] = {
      {62, 78, "Az\xE9", 0, 0, "\xC1\xA9\x51"},  // windows-1252 to EBCDIC 037
      // Into a modal set: shift-out before the double-byte character, shift-in after.
      {20, 117, "A\xE4\xB8\x80", 0, 0, "\xC1\x0E\x4C\x41\x0F"},
      // A character the destination lacks becomes its substitution character.
      {20, 62, "\xE4\xB8\x80", 0, 0, "\x1A"},
      {62, 20, "a\xE9", 2, NLSHOST_E_TOO_SMALL, "a"},  // whole characters only
      {20, 62, "a\xFF", 0, NLSHOST_E_ILL_FORMED, "a"},
      {20, 62, "a\xC3", 0, NLSHOST_E_TRUNCATED, "a"},
      {161, 20, "\xC1\x80\x41", 0, 0, "A\xC2\xA0"},
  };
  for (const auto &c : cases) {
    std::string out;
    EXPECT_EQ(between(nls, c.from, c.to).convert(c.in, out, c.capacity), c.status) << c.from;
    EXPECT_EQ(out, c.out) << c.from << " to " << c.to;
  }
  // Unknown numbers get no converter.
  EXPECT_EQ(between(nls, 62, 0).object, nullptr);
  EXPECT_EQ(between(nls, 265, 62).object, nullptr);
}

TEST(Converters, ConversionNeededAndSize) {
  auto host = standalone();
  void *nls = host->nls();
  auto needed = [&](std::int64_t a, std::int64_t b) {
    return call<NLSHostConversionNeededFn>(nls, NLSHOST_SLOT_NLS_CONVERSION_NEEDED, a, b,
                                           static_cast<void *>(nullptr));
  };
  EXPECT_FALSE(needed(62, 62));
  EXPECT_FALSE(needed(19, 25));
  EXPECT_FALSE(needed(135, 136));  // the same converter under two names
  EXPECT_TRUE(needed(62, 29));
  EXPECT_TRUE(needed(62, 0));

  const char text[] = "a\xE9\x80";  // a, e-acute and the euro sign in windows-1252
  auto size_in = [&](std::int64_t to, std::uint64_t &size) {
    return call<NLSHostConversionSizeFn>(nls, NLSHOST_SLOT_NLS_CONVERSION_SIZE, std::int64_t{62},
                                         to, static_cast<const void *>(text), std::uint64_t{3},
                                         &size);
  };
  std::uint64_t size = 0;
  EXPECT_EQ(size_in(20, size), 0);
  EXPECT_EQ(size, 6u);
  EXPECT_EQ(size_in(27, size), 0);
  EXPECT_EQ(size, 12u);
  EXPECT_EQ(size_in(0, size), NLSHOST_E_NO_ENCODING);
}
