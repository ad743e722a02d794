// sm_trantab rows, the fixed tables and the number and LIKE character tables.
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

TEST(Trantab, RowsWithoutTables) {
  // 19 is served as 25, so both rows must be the same.
  EXPECT_EQ(0, std::memcmp(&sm_trantab[19], &sm_trantab[25], sizeof(TrantabRow)));
  for (int n : {19, 20, 24, 25, 26, 27, 161}) {
    const TrantabRow &row = sm_trantab[n];
    EXPECT_TRUE(row.lower == nullptr && row.classes == nullptr && row.dbcs == nullptr) << n;
  }
  for (int n : {0, 77, 154, 171, 206, 249, 264, 265}) {  // class table only
    const TrantabRow &row = sm_trantab[n];
    EXPECT_TRUE(row.lower == nullptr && row.classes == zero_ccl && row.dbcs == nullptr) << n;
  }
}

TEST(Trantab, TellingRows) {
  EXPECT_EQ(sm_trantab[29].lower, lat1_lcs);
  EXPECT_EQ(sm_trantab[29].classes, lat1_ccl);
  EXPECT_EQ(sm_trantab[62].upper, wlt1_ucs);
  EXPECT_EQ(sm_trantab[78].classes, e037_ccl);
  EXPECT_EQ(sm_trantab[1].lower, jlat_lcs);
  EXPECT_EQ(sm_trantab[1].classes, zero_ccl);
  EXPECT_EQ(sm_trantab[134].lower, j895_lcs);
  EXPECT_EQ(sm_trantab[134].dbcs, jeuc_dbtab);
  for (int n : {119, 159}) EXPECT_EQ(sm_trantab[n].dbcs, yeuc_dbtab) << n;
  EXPECT_EQ(sm_trantab[205].lower, ypcs_lcs);
  EXPECT_EQ(sm_trantab[205].dbcsExt, zwin_xdttab);
  for (int n : {117, 237}) {
    EXPECT_EQ(sm_trantab[n].upper, e037_ucs) << n;
    EXPECT_EQ(sm_trantab[n].dbcs, yibm_dbtab) << n;
  }
  for (int n : {130, 234, 240, 241}) {
    const TrantabRow &row = sm_trantab[n];
    EXPECT_TRUE(row.lower == idty_tbl && row.upper == idty_tbl && row.classes == zero_ccl) << n;
    EXPECT_TRUE(row.dbcs == zero_dbtab && row.dbcsCount == 1 && row.dbcsExt == nullptr) << n;
  }
}

TEST(FixedTables, IdentityZeroAndEucRanges) {
  for (int b = 0; b < 256; ++b) {
    EXPECT_EQ(idty_tbl[b], b);
    EXPECT_EQ(zero_ccl[b], 0);
  }
  EXPECT_EQ(zero_dbtab[0].code | zero_dbtab[0].lower | zero_dbtab[0].upper, 0);
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

TEST(NumberTables, AsciiAndEbcdicCharacters) {
  EXPECT_EQ(0, std::memcmp(SM_ASCII_chars, "0123456789 -+.,\0Ee'*", 20));
  const uint8_t ebcdic[20] = {0xF0, 0xF1, 0xF2, 0xF3, 0xF4, 0xF5, 0xF6, 0xF7, 0xF8, 0xF9,
                              0x40, 0x60, 0x4E, 0x4B, 0x6B, 0x00, 0xC5, 0x85, 0x7D, 0x5C};
  EXPECT_EQ(0, std::memcmp(SM_EBCDIC_chars, ebcdic, 20));
  EXPECT_EQ(0, std::memcmp(LIKE_ASCII_chars, "%_\\", 4));
  const uint8_t likeEbcdic[4] = {0x6C, 0x6D, 0xE0, 0x00};
  EXPECT_EQ(0, std::memcmp(LIKE_EBCDIC_chars, likeEbcdic, 4));
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
