// The single-byte case and class tables: worked examples, and every set
// against ICU's simple case mapping through its code page.
#include <gtest/gtest.h>
#include <unicode/uchar.h>

#include <string>

#include "catalogue/tables.hpp"
#include "catalogue_test_support.hpp"

namespace nlssm::catalogue {
namespace {

const SbcsSet &set_named(const std::string &name) {
  for (const SbcsSet &set : sbcs_sets) {
    if (name == set.name) return set;
  }
  throw std::runtime_error("no set " + name);
}

TEST(SbcsTables, ClassExamples) {
  struct Case {
    const uint8_t *table;
    int byte;
    uint8_t bits;
  };
  const Case cases[] = {
      {lat1_ccl, ' ', 0x28},  {lat1_ccl, '\t', 0x48}, {lat1_ccl, 0x00, 0x40},
      {lat1_ccl, 'A', 0x81},  {lat1_ccl, 'G', 0x01},  {lat1_ccl, 'f', 0x82},
      {lat1_ccl, 'z', 0x02},  {lat1_ccl, '0', 0x84},  {lat1_ccl, '!', 0x10},
      {lat1_ccl, 0x7F, 0x40}, {lat1_ccl, 0x85, 0x48}, {lat1_ccl, 0x9F, 0x40},
      {lat1_ccl, 0xA0, 0x20}, {lat1_ccl, 0xAD, 0x40}, {lat1_ccl, 0xAA, 0x02},
      {lat1_ccl, 0xB5, 0x02}, {lat1_ccl, 0xBA, 0x02}, {lat1_ccl, 0xC0, 0x01},
      {lat1_ccl, 0xD7, 0x10}, {lat1_ccl, 0xDF, 0x03}, {lat1_ccl, 0xFF, 0x02},
      {e037_ccl, 0x40, 0x28}, {e037_ccl, 0xC1, 0x81}, {e037_ccl, 0x81, 0x82},
      {e037_ccl, 0xF0, 0x84}, {e037_ccl, 0x05, 0x48}, {e037_ccl, 0x41, 0x20},
  };
  for (const Case &c : cases) EXPECT_EQ(c.table[c.byte], c.bits) << std::hex << c.byte;
}

TEST(SbcsTables, IndexMatchesTheSetList) {
  const auto sets = catalogue_test::load_sets(false);
  EXPECT_EQ(std::size(sbcs_sets), sets.size());
  for (const SbcsSet &set : sbcs_sets) EXPECT_EQ(sets.count(set.name), 1u) << set.name;
}

// For every set and byte: the case maps follow ICU's simple case mapping of
// the byte's character whenever the mapped character is a byte of the page,
// and the class bits agree with the case maps and with ICU's properties.
TEST(SbcsTables, AgreeWithIcuThroughEveryCodePage) {
  for (const auto &[name, info] : catalogue_test::load_sets(false)) {
    SCOPED_TRACE(name + " " + info.converter);
    const SbcsSet &set = set_named(name);
    const auto page = catalogue_test::open_page(info.converter);
    for (int b = 0; b < 256; ++b) {
      const UChar32 c = page->decode_byte(uint8_t(b));
      const uint8_t bits = set.classes[b];
      if (c < 0) {
        EXPECT_TRUE(set.lower[b] == b && set.upper[b] == b && bits == 0) << b;
        continue;
      }
      const int lower = u_tolower(c) == c ? b : page->encode_byte(u_tolower(c));
      const int upper = u_toupper(c) == c ? b : page->encode_byte(u_toupper(c));
      EXPECT_EQ(set.lower[b], lower < 0 ? b : lower) << b;
      EXPECT_EQ(set.upper[b], upper < 0 ? b : upper) << b;
      // A byte that case-maps is a letter of the case it maps from.
      EXPECT_TRUE(set.lower[b] == b || (bits & kClassUpper)) << b;
      EXPECT_TRUE(set.upper[b] == b || (bits & kClassLower)) << b;
      EXPECT_EQ(bool(bits & kClassDigit), u_charType(c) == U_DECIMAL_DIGIT_NUMBER) << b;
      EXPECT_EQ(bool(bits & kClassBlank), u_charType(c) == U_SPACE_SEPARATOR) << b;
      EXPECT_EQ(bool(bits & kClassXDigit), c < 0x80 && u_isxdigit(c)) << b;
      EXPECT_FALSE((bits & kClassPunct) && (bits & (kClassControl | kClassDigit | kClassSpace)))
          << b;
    }
  }
}

}  // namespace
}  // namespace nlssm::catalogue
