// sm_trantab rows, the fixed tables and the substitute characters for numbers.
#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "catalogue/tables.hpp"

namespace nlssm::catalogue {
namespace {

const DbcsSet *find_dbcs(const DbcsRecord *records) {
  for (const DbcsSet &set : dbcs_sets) {
    if (set.records == records) return &set;
  }
  return nullptr;
}

TEST(Trantab, EveryRowIsConsistent) {
  for (int n = 0; n < kTrantabRows; ++n) {
    SCOPED_TRACE(n);
    const TrantabRow &row = sm_trantab[n];
    EXPECT_EQ(row.fold, row.lower);
    EXPECT_EQ(row.lower == nullptr, row.upper == nullptr);
    EXPECT_EQ(row.dbcs == nullptr, row.dbcsCount == 0);
    EXPECT_EQ(row.dbcsExt == nullptr, row.dbcsExtCount == 0);
    if (row.dbcsExt != nullptr) {
      const DbcsSet *set = find_dbcs(row.dbcs);
      ASSERT_NE(set, nullptr);
      EXPECT_EQ(row.dbcsCount, set->count);
      EXPECT_EQ(row.dbcsExt, set->ranges);
      EXPECT_EQ(row.dbcsExtCount, kDbcsRangeCount);
    }
  }
}

TEST(Trantab, AliasRowsMatch) {
  // 19 is served as 25, so both rows must be the same.
  EXPECT_EQ(0, std::memcmp(&sm_trantab[19], &sm_trantab[25], sizeof(TrantabRow)));
}

TEST(FixedTables, EucRanges) {
  const uint8_t first[] = {0x8E, 0x8E, 0xA1, 0xFE, 0, 0}, second[] = {0xA1, 0xFE, 0, 0};
  EXPECT_EQ(0, std::memcmp(euc_db1st, first, sizeof first));
  EXPECT_EQ(0, std::memcmp(euc_db2nd, second, sizeof second));
}

TEST(FixedTables, Utf8LeadLength) {
  for (int b = 0; b < 256; ++b) {
    const int expected = b == 0     ? 0
                         : b < 0x80 ? 1
                         : b < 0xC2 ? 0
                         : b < 0xE0 ? 2
                         : b < 0xF0 ? 3
                         : b < 0xF5 ? 4
                                    : 0;
    EXPECT_EQ(lead_utf8_len[b], expected) << b;
  }
}

TEST(NumberTables, SpecialCharacterSubstitutes) {
  struct Case {
    int number;
    std::string noBreakSpace;
    uint8_t apostrophe;
  };
  const Case cases[] = {
      {29, "\xA0", 0x27},      // Latin-1 has its own no-break space
      {78, "\x41", 0x7D},      // so has EBCDIC 037
      {20, "\xC2\xA0", 0x27},  // UTF-8 writes it in two bytes
      {161, "\x40", 0x7D},     // UTF-EBCDIC: a blank
      {134, " ", 0x27},        // EUC-JP's single-byte set has none: a blank
      {28, " ", 0x27},         // US-ASCII
      {265, " ", 0x27},
  };
  for (const Case &c : cases) {
    const NumSpecialChars &row = NLSNumSpecialChars[c.number];
    EXPECT_EQ(std::string(reinterpret_cast<const char *>(row.noBreakSpace), row.noBreakSpaceLength),
              c.noBreakSpace)
        << c.number;
    EXPECT_EQ(row.apostrophe, c.apostrophe) << c.number;
  }
}

}  // namespace
}  // namespace nlssm::catalogue
