// The single-byte bidirectional tables and their selection by encoding number.
#include <gtest/gtest.h>

#include <climits>
#include <set>
#include <string>
#include <vector>

#include "catalogue/tables.hpp"
#include "nlssm/nlssm.h"

namespace nlssm::catalogue {
namespace {

const BidiTable *selected(int32_t number) {
  return reinterpret_cast<const BidiTable *>(NLSGetBIDICategorySBCSTab(number));
}

TEST(BidiTables, SelectionByEncodingNumber) {
  const std::set<int> numbers = {34, 36, 46,  47,  55,  65,  66,  70,  71,
                                 86, 87, 101, 102, 201, 202, 207, 208, 229};
  for (int32_t n = -1; n <= 300; ++n) {
    EXPECT_EQ(selected(n) != nullptr, numbers.count(n) == 1) << n;
  }
  EXPECT_EQ(selected(INT32_MIN), nullptr);
  std::set<const BidiTable *> tables;
  for (const BidiSelection &s : bidi_selection) tables.insert(s.table);
  EXPECT_EQ(tables.size(), 18u);
}

TEST(BidiTables, SharedClassesAndStructure) {
  const std::set<uint32_t> values = {0, 3, 4, 8, 10, 12, 17, 110, 112, kBidiNone};
  for (const BidiSelection &s : bidi_selection) {
    SCOPED_TRACE(s.name);
    const BidiTable &t = *s.table;
    const bool ebcdic = s.name[0] == 'e';
    // Runs of bytes with the class every table of the family carries.
    struct Run {
      int first, last;
      uint32_t category;
    };
    const std::vector<Run> stated =
        ebcdic
            ? std::vector<Run>{{0x40, 0x40, kBidiWS}, {0x0C, 0x0C, kBidiWS}, {0xF0, 0xF9, kBidiEN},
                               {0xC1, 0xC9, kBidiL},  {0xD1, 0xD9, kBidiL},  {0xE2, 0xE9, kBidiL},
                               {0x81, 0x89, kBidiL},  {0x91, 0x99, kBidiL},  {0xA2, 0xA9, kBidiL}}
            : std::vector<Run>{
                  {' ', ' ', kBidiWS},      {0x0C, 0x0C, kBidiWS},    {'0', '9', kBidiEN},
                  {'A', 'Z', kBidiL},       {'a', 'z', kBidiL},       {'#', '%', kBidiAsciiET},
                  {',', ',', kBidiAsciiCS}, {'.', '/', kBidiAsciiCS}, {':', ':', kBidiAsciiCS}};
    for (const Run &run : stated) {
      for (int b = run.first; b <= run.last; ++b) EXPECT_EQ(t.categories[b], run.category) << b;
    }
    int strongRightToLeft = 0;
    for (int b = 0; b < 256; ++b) {
      EXPECT_EQ(values.count(t.categories[b]), 1u) << b;
      // The second table is a reduced copy of the first.
      EXPECT_TRUE(t.reorder[b] == t.categories[b] || t.reorder[b] == kBidiNone) << b;
      strongRightToLeft += t.categories[b] == kBidiR || t.categories[b] == kBidiAL;
    }
    EXPECT_GE(strongRightToLeft, 22);  // the letters of the script
    for (int i = 0; i < 8; ++i) EXPECT_EQ(t.mirrors[i], t.brackets[i ^ 1]) << i;
  }
}

TEST(BidiTables, WorkedExamples) {
  // Hebrew letters of EBCDIC 424, in both of its tables.
  for (const BidiTable *t : {&bidi_e424, &bidi_eoiw}) {
    for (int b = 0x41; b <= 0x7F; ++b) {
      const bool letter = (b <= 0x49) || (b >= 0x51 && b <= 0x59) || (b >= 0x62 && b <= 0x69) ||
                          b == 0x71 || b == 0x78;
      EXPECT_EQ(t->categories[b] == kBidiR, letter) << b;
      if (letter) {
        EXPECT_EQ(t->reorder[b], kBidiR) << b;
      }
    }
  }
  EXPECT_EQ(bidi_e424.categories[0x81], kBidiL);  // lower-case a
  // ISO 8859-8: the reduced table drops the form feed and 0x7B-0xDF, and
  // keeps the letters, digits, blank and ASCII punctuation.
  EXPECT_EQ(bidi_hebr.categories[0xA0], kBidiCS);  // no-break space
  EXPECT_EQ(bidi_hebr.categories[0xB5], kBidiL);   // micro sign
  EXPECT_EQ(bidi_hebr.categories[0xB2], kBidiEN);  // superscript two
  EXPECT_EQ(bidi_hebr.reorder[0x0C], kBidiNone);
  for (int b = 0x7B; b <= 0xDF; ++b) EXPECT_EQ(bidi_hebr.reorder[b], kBidiNone) << b;
  for (int b = 0x20; b < 0x7B; ++b) EXPECT_EQ(bidi_hebr.reorder[b], bidi_hebr.categories[b]);
  for (int b = 0xE0; b <= 0xFA; ++b) EXPECT_EQ(bidi_hebr.reorder[b], kBidiR) << b;
  EXPECT_EQ(bidi_arab.categories[0xC7], kBidiAL);  // alef
  EXPECT_EQ(0,
            std::string(reinterpret_cast<const char *>(bidi_hebr.brackets), 8).compare("()[]{}<>"));
}

}  // namespace
}  // namespace nlssm::catalogue
