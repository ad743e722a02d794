// The double-byte case tables and hexadecimal-digit ranges.
#include <gtest/gtest.h>
#include <unicode/uchar.h>

#include <string>

#include "catalogue/tables.hpp"
#include "catalogue_test_support.hpp"

namespace nlssm::catalogue {
namespace {

// The character of a double-byte code in a page of the given form.
UChar32 decode_code(const catgen::CodePage &page, const std::string &form, uint16_t code) {
  std::string bytes{char(code >> 8), char(code & 0xFF)};
  if (form == "modal") bytes = "\x0E" + bytes + "\x0F";
  return page.decode(bytes);
}

TEST(DbcsTables, RecordsFollowIcuCaseMapping) {
  const auto sets = catalogue_test::load_sets(true);
  EXPECT_EQ(std::size(dbcs_sets), sets.size());
  for (const DbcsSet &set : dbcs_sets) {
    SCOPED_TRACE(set.name);
    const catalogue_test::PageInfo &info = sets.at(set.name);
    const auto page = catalogue_test::open_page(info.converter);
    ASSERT_GT(set.count, 0u);
    for (uint64_t i = 0; i < set.count; ++i) {
      const DbcsRecord &r = set.records[i];
      if (i > 0) {
        EXPECT_LT(set.records[i - 1].code, r.code);
      }
      EXPECT_TRUE(r.code == r.lower || r.code == r.upper);
      EXPECT_NE(r.lower, r.upper);
      const UChar32 c = decode_code(*page, info.family, r.code);
      ASSERT_GE(c, 0) << std::hex << r.code;
      if (r.lower != r.code) {
        EXPECT_EQ(decode_code(*page, info.family, r.lower), u_tolower(c));
      }
      if (r.upper != r.code) {
        EXPECT_EQ(decode_code(*page, info.family, r.upper), u_toupper(c));
      }
      EXPECT_EQ(dbcs_find(set.records, set.count, r.code), &r);
    }
    // Full-width 0-9, then full-width A-F.
    const UChar32 firsts[2] = {0xFF10, 0xFF21};
    for (int k = 0; k < 2; ++k) {
      const DbcsRange &range = set.ranges[k];
      EXPECT_EQ(range.high - range.low + 1, k == 0 ? 10 : 6);
      for (uint16_t code = range.low; code <= range.high; ++code) {
        EXPECT_EQ(decode_code(*page, info.family, code), firsts[k] + (code - range.low));
      }
    }
  }
}

TEST(DbcsTables, WorkedExamples) {
  // EBCDIC: 0x4141 is a lower-case letter whose upper case is 0x4161.
  const DbcsRecord *ebcdic = dbcs_find(jibm_dbtab, std::size(jibm_dbtab), 0x4141);
  ASSERT_NE(ebcdic, nullptr);
  EXPECT_EQ(ebcdic->lower, 0x4141);
  EXPECT_EQ(ebcdic->upper, 0x4161);
  // EUC-TW: the full-width A at 0xA4C1 lower-cases to 0xA4DB.
  const DbcsRecord *euc = dbcs_find(yeuc_dbtab, std::size(yeuc_dbtab), 0xA4C1);
  ASSERT_NE(euc, nullptr);
  EXPECT_EQ(euc->lower, 0xA4DB);
  EXPECT_EQ(euc->upper, 0xA4C1);
}

TEST(DbcsTables, FindAndRanges) {
  const DbcsRecord table[] = {{0x8260, 0x8281, 0x8260}, {0x8262, 0x8283, 0x8262}};
  EXPECT_EQ(dbcs_find(table, 2, 0x8262), &table[1]);
  EXPECT_EQ(dbcs_find(table, 2, 0x8261), nullptr);  // inside the range, absent
  EXPECT_EQ(dbcs_find(table, 2, 0x825F), nullptr);
  EXPECT_EQ(dbcs_find(table, 2, 0x8263), nullptr);
  EXPECT_EQ(dbcs_find(nullptr, 0, 0x8260), nullptr);
  EXPECT_TRUE(dbcs_in_ranges(jwin_xdttab, kDbcsRangeCount, 0x824F));  // full-width 0
  EXPECT_TRUE(dbcs_in_ranges(jwin_xdttab, kDbcsRangeCount, 0x8265));  // full-width F
  EXPECT_FALSE(dbcs_in_ranges(jwin_xdttab, kDbcsRangeCount, 0x8266));
  EXPECT_FALSE(dbcs_in_ranges(nullptr, 0, 0x824F));
}

}  // namespace
}  // namespace nlssm::catalogue
