// The case-mapping and normalization rules of each class, through the slots
// of reference-host handles.
#include <gtest/gtest.h>

#include "case_support.hpp"
#include "catalogue/dbcs_records.hpp"

namespace {

using namespace case_test;
using nlssm::catalogue::DbcsRecord;

constexpr uint32_t kDouble = NLSSM_OPT_FOLD_UPPER;   // option 4
constexpr uint32_t kToUpper = NLSSM_OPT_FOLD_LOWER;  // Normalize option 2

// The first double-byte record that `pick` maps to another code.
const DbcsRecord &record(const NLSSMHandle *h, uint16_t DbcsRecord::*pick) {
  const auto *r = static_cast<const DbcsRecord *>(h->dbcsTable);
  for (uint64_t i = 0; i < h->dbcsTableCount; ++i)
    if (r[i].*pick != 0 && r[i].*pick != r[i].code) return r[i];
  ADD_FAILURE() << "no double-byte record with a mapping";
  return r[0];
}
uint8_t hi(uint16_t v) {
  return static_cast<uint8_t>(v >> 8);
}
uint8_t lo(uint16_t v) {
  return static_cast<uint8_t>(v);
}

// ---- Single byte ---------------------------------------------------------------

TEST(SingleByte, FormsMapTheirSpan) {
  const NLSSMHandle *h = handle(78);  // EBCDIC 037: a-f 0x81-0x86, A-F 0xC1-0xC6
  Bytes t{0x81, 0x82, 0x83, 0x84, 0x85, 0x86};
  NLSString s = over(t, 1);
  EXPECT_EQ(upper(h, s, 3), 0);
  EXPECT_EQ(t, (Bytes{0x81, 0xC2, 0xC3, 0xC4, 0x85, 0x86}));
  EXPECT_EQ(upper(h, s, 99), 0);  // a count past the end stops at the end
  EXPECT_EQ(t, (Bytes{0x81, 0xC2, 0xC3, 0xC4, 0xC5, 0xC6}));
  s.curOffset = NLSSM_POS_NONE;
  EXPECT_EQ(lower(h, s, 0), 0);
  EXPECT_EQ(t[1], 0xC2);
  EXPECT_EQ(upper_c(h, t, 0), 0);  // C form: 0 characters
  Bytes all{0xC1, 0xC2, 0x81};
  EXPECT_EQ(lower_s(h, all), 0);
  EXPECT_EQ(all, (Bytes{0x81, 0x82, 0x81}));
  EXPECT_EQ(call<PlainFn>(h, h->NLSStringUpper, static_cast<NLSString *>(nullptr), 0, 0u),
            NLSSM_E_NULL_ARGUMENT);
}

TEST(SingleByte, NormalizeCutsToTheRoomAndGrowsTheDestination) {
  const NLSSMHandle *h = handle(29);  // Latin-1
  Bytes src{'a', 'B', 'c', 'd'}, dst{'x', 'y', 'z'};
  NLSString from = over(src), to = over(dst, 1);
  to.length = 1;
  EXPECT_EQ(normalize(h, from, to, 0, kToUpper), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(dst, (Bytes{'x', 'A', 'B'}));
  EXPECT_EQ(to.length, 3u);
  to.curOffset = -5;                           // clamped to the start
  EXPECT_EQ(normalize(h, from, to, 2, 3), 0);  // bits 1 and 2 together are fine here
  EXPECT_EQ(dst, (Bytes{'A', 'B', 'B'}));
  to.curOffset = 9;  // past the capacity: nothing written, the length stays
  EXPECT_EQ(normalize(h, from, to, 0, 0), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(to.length, 3u);
  to.capacity = 0;
  EXPECT_EQ(normalize(h, from, to, 0, 0), NLSSM_E_DEST_TOO_SMALL);
  int64_t written = -1;
  EXPECT_EQ(normalize_s(h, src, dst, &written, 0), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(dst, (Bytes{'a', 'b', 'c'}));
  EXPECT_EQ(written, 3);
}

// ---- UTF-8 and UTF-EBCDIC -----------------------------------------------------------

TEST(Utf8, TextKeepsItsByteLength) {
  const NLSSMHandle *h = handle(20);
  Bytes t{0xC5, 0xBF, 'x'};  // long s: upper case is 'S'
  NLSString s = over(t);
  EXPECT_EQ(upper(h, s, 0), 0);
  EXPECT_EQ(t, (Bytes{'S', 'X', ' '}));
  Bytes c{0xC5, 0xBF, 'x'};
  EXPECT_EQ(upper_c(h, c, 2), 0);  // C form: no blank fill
  EXPECT_EQ(c, (Bytes{'S', 'X', 'x'}));
  Bytes bad{'a', 0xFF, 'b', 0xC3};
  EXPECT_EQ(upper_s(h, bad), 0);  // stops at the byte that does not decode
  EXPECT_EQ(bad, (Bytes{'A', 0xFF, 'b', 0xC3}));
  // U+023A lower-cases to a three-byte character: no room at the end.
  Bytes longer{'A', 0xC8, 0xBA, 0xEE};
  NLSString l = over(longer);
  l.length = 3;
  EXPECT_EQ(lower(h, l, 0), 0);
  EXPECT_EQ(longer, (Bytes{'a', 0xC8, 0xBA, 0xEE}));
}

TEST(UtfEbcdic, UpperWalksToTheEndLowerStopsAtTheCount) {
  const NLSSMHandle *h = handle(161);
  Bytes t(8);
  int64_t n = 0;
  for (uint32_t cp : {0x61u, 0xE9u, 0x62u}) n += ToUTFE(h, cp, t.data() + n);
  t.resize(static_cast<size_t>(n));
  const Bytes original = t;
  NLSString s = over(t);
  EXPECT_EQ(upper(h, s, 1), 0);
  uint32_t cp[3] = {};
  int64_t off = 0;
  for (uint32_t &c : cp) off += FromUTFE(h, t.data() + off, &c);
  EXPECT_EQ((std::vector<uint32_t>{cp[0], cp[1], cp[2]}), (std::vector<uint32_t>{'A', 0xC9, 'B'}));
  EXPECT_EQ(lower(h, s, 2), 0);
  off = 0;
  for (uint32_t &c : cp) off += FromUTFE(h, t.data() + off, &c);
  EXPECT_EQ((std::vector<uint32_t>{cp[0], cp[1], cp[2]}), (std::vector<uint32_t>{'a', 0xE9, 'B'}));
  EXPECT_EQ(upper(h, s, 0, 8), NLSSM_E_BAD_OPTIONS);
  EXPECT_EQ(lower_s(h, t, 8), NLSSM_E_BAD_OPTIONS);
}

// ---- 16- and 32-bit units --------------------------------------------------------------

class Wcs2 : public testing::TestWithParam<int> {
 protected:
  Bytes units(std::initializer_list<uint16_t> us) const {
    Bytes b;
    const bool big = GetParam() == NLSSM_ENC_WCS2_BE;
    for (uint16_t u : us) {
      b.push_back(big ? hi(u) : lo(u));
      b.push_back(big ? lo(u) : hi(u));
    }
    return b;
  }
};

TEST_P(Wcs2, PairsAreSkippedWholeAndCountOnce) {
  const NLSSMHandle *h = handle(GetParam());
  Bytes t = units({0xD801, 0xDC00, 'a', 'b'});  // U+10400 has a lower-case form
  NLSString s = over(t);
  EXPECT_EQ(upper(h, s, 2), 0);
  EXPECT_EQ(t, units({0xD801, 0xDC00, 'A', 'b'}));
  EXPECT_EQ(lower(h, s, 0), 0);
  EXPECT_EQ(t, units({0xD801, 0xDC00, 'a', 'b'}));
  Bytes lone = units({'a', 0xD800});
  EXPECT_EQ(upper_s(h, lone), 0);
  EXPECT_EQ(lone, units({'A', 0xD800}));
  Bytes c = units({'x', 0x3B1, 'y'});  // alpha
  EXPECT_EQ(upper_c(h, c, 2), 0);
  EXPECT_EQ(c, units({'X', 0x391, 'y'}));
}
INSTANTIATE_TEST_SUITE_P(BothOrders, Wcs2, testing::Values(NLSSM_ENC_WCS2_BE, NLSSM_ENC_WCS2_LE));

TEST(Wcs4, CountCoversUnits) {
  for (int e : {NLSSM_ENC_WCS4_BE, NLSSM_ENC_HOST_CHARS}) {
    const NLSSMHandle *h = handle(e);
    const bool big = e == NLSSM_ENC_WCS4_BE;
    auto text = [big](std::initializer_list<uint8_t> cs) {
      Bytes b;
      for (uint8_t c : cs)
        for (int k = 0; k < 4; ++k) b.push_back(k == (big ? 3 : 0) ? c : 0);
      return b;
    };
    Bytes t = text({'a', 'b', 'c'});
    NLSString s = over(t, 4);
    EXPECT_EQ(upper(h, s, 1), 0);
    EXPECT_EQ(t, text({'a', 'B', 'c'})) << e;
    EXPECT_EQ(upper_c(h, t, 1), 0);
    EXPECT_EQ(t, text({'A', 'B', 'c'})) << e;
  }
}

// ---- Multi-byte ------------------------------------------------------------------------

TEST(Modal, ShiftSequencesStayAndDoNotCount) {
  const NLSSMHandle *h = handle(129);  // EBCDIC 939
  const DbcsRecord &r = record(h, &DbcsRecord::upper);
  const Bytes text{0x81, 0x0E, hi(r.code), lo(r.code), 0x0F, 0x82};
  Bytes t = text;
  NLSString s = over(t);
  EXPECT_EQ(upper(h, s, 2, kDouble), 0);
  EXPECT_EQ(t, (Bytes{0xC1, 0x0E, hi(r.upper), lo(r.upper), 0x0F, 0x82}));
  t = text;
  EXPECT_EQ(upper(h, s, 0), 0);  // without option 4 double bytes stay
  EXPECT_EQ(t, (Bytes{0xC1, 0x0E, hi(r.code), lo(r.code), 0x0F, 0xC2}));
  Bytes d{0x81, 0x82};
  NLSString ds = over(d, 0, 0);  // kind not 1: the text starts double-byte
  EXPECT_EQ(upper(h, ds, 0, kDouble), 0);
  EXPECT_EQ(d, (Bytes{0x81, 0x82}));
  EXPECT_EQ(upper_s(h, d), 0);  // S form: single-byte
  EXPECT_EQ(d, (Bytes{0xC1, 0xC2}));
}

class DoubleByte : public testing::TestWithParam<int> {};

// Shift-JIS and EUC-JP: tables that hold the codes their text carries.
TEST_P(DoubleByte, DoubleBytesMapOnlyWithOption4) {
  const NLSSMHandle *h = handle(GetParam());
  const DbcsRecord &r = record(h, &DbcsRecord::lower);
  const Bytes text{'A', hi(r.code), lo(r.code), 'B'};
  Bytes t = text;
  NLSString s = over(t);
  EXPECT_EQ(lower(h, s, 0), 0);
  EXPECT_EQ(t, (Bytes{'a', hi(r.code), lo(r.code), 'b'}));
  t = text;
  EXPECT_EQ(lower(h, s, 2, kDouble), 0);
  EXPECT_EQ(t, (Bytes{'a', hi(r.lower), lo(r.lower), 'B'}));
  Bytes cut{'A', hi(r.code)};  // a lead byte in the last position
  EXPECT_EQ(lower_s(h, cut, kDouble), 0);
  EXPECT_EQ(cut, (Bytes{'a', hi(r.code)}));
}
INSTANTIATE_TEST_SUITE_P(Sets, DoubleByte, testing::Values(135, NLSSM_ENC_EUC_JP));

TEST(NonModal, FixedLengthRules) {
  Bytes jp{0x8F, 'A', 'B', 'C'};  // EUC-JP: 0x8F and two bytes, untouched
  EXPECT_EQ(lower_s(handle(NLSSM_ENC_EUC_JP), jp, 8), 0);
  EXPECT_EQ(jp, (Bytes{0x8F, 'A', 'B', 'c'}));
  // EUC-TW steps over 0x8E and two bytes, so 0xC1 'A' is read as a pair.
  Bytes tw{0x8E, 0xA2, 0xA4, 0xC1, 'A', 'B'};
  EXPECT_EQ(lower_s(handle(119), tw), 0);
  EXPECT_EQ(tw, (Bytes{0x8E, 0xA2, 0xA4, 0xC1, 'A', 'b'}));
  Bytes gb{0x81, 0x30, 0x81, 0x30, 'A', 0x81, 'B', 'C'};
  EXPECT_EQ(lower_s(handle(NLSSM_ENC_GB18030), gb), 0);
  EXPECT_EQ(gb, (Bytes{0x81, 0x30, 0x81, 0x30, 'a', 0x81, 'B', 'c'}));
  for (int e : {119, NLSSM_ENC_GB18030}) {
    EXPECT_EQ(lower_s(handle(e), gb, 8), NLSSM_E_BAD_OPTIONS);
    EXPECT_EQ(upper_c(handle(e), gb, 1, 8), NLSSM_E_BAD_OPTIONS);
  }
}

// ---- Normalize -----------------------------------------------------------------------

TEST(Normalize, ModalBringsTheDestinationIntoTheSourceMode) {
  const NLSSMHandle *h = handle(129);
  Bytes src{0x81, 0x82}, dst{0x0E, 0x42, 0x42, 0, 0, 0, 0};
  NLSString from = over(src), to = over(dst, 3, NLSSM_KIND_DOUBLE);
  to.length = 3;
  EXPECT_EQ(normalize(h, from, to, 0, kToUpper), 0);
  EXPECT_EQ(dst, (Bytes{0x0E, 0x42, 0x42, 0x0F, 0xC1, 0xC2, 0}));
  EXPECT_EQ(to.length, 6u);
  Bytes empty{'x'};
  NLSString e = over(empty, 0);
  e.length = 0;
  EXPECT_EQ(normalize(h, from, e, 0, kToUpper), 0);
  EXPECT_EQ(empty[0], 'x');
  // The S form drops the shift sequences.
  const DbcsRecord &r = record(h, &DbcsRecord::upper);
  Bytes out(6, 0);
  EXPECT_EQ(normalize_s(h, {0x81, 0x0E, hi(r.code), lo(r.code), 0x0F, 0x82}, out, nullptr,
                        kToUpper | kDouble),
            0);
  EXPECT_EQ(out, (Bytes{0xC1, hi(r.upper), lo(r.upper), 0xC2, 0, 0}));
}

TEST(Normalize, GenericMembersCopyThenMapThroughTheHandle) {
  const NLSSMHandle *h = handle(NLSSM_ENC_WCS2_BE);
  Bytes src{0, 'a', 0, 'b', 0, 'c'}, dst(4, 0);
  NLSString from = over(src), to = over(dst, 0, 0);
  to.length = 0;
  EXPECT_EQ(normalize(h, from, to, 0, kToUpper), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(dst, (Bytes{0, 'A', 0, 'B'}));
  EXPECT_EQ(to.length, 4u);
  NLSString atEnd = over(src, 6);  // nothing left to copy, whatever the count
  EXPECT_EQ(normalize(h, atEnd, to, 1, 0), 0);
  EXPECT_EQ(to.length, 4u);
  EXPECT_EQ(normalize(h, from, to, 0, 3), NLSSM_E_BAD_OPTIONS);
  EXPECT_EQ(normalize(h, from, to, 0, 9), NLSSM_E_BAD_OPTIONS);
  int64_t written = 0;
  EXPECT_EQ(normalize_s(h, src, dst, &written, 0), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(written, 4);
  // EUC-JP refuses every option bit, so it only lower-cases.
  const NLSSMHandle *jp = handle(NLSSM_ENC_EUC_JP);
  Bytes jsrc{'A', 'B'}, jdst(2, 0);
  NLSString jf = over(jsrc), jt = over(jdst);
  for (uint32_t o : {1u, 2u, 4u})
    EXPECT_EQ(
        call<NormalizeFn>(jp, reinterpret_cast<NLSSlot>(&NLSStringNormalize_MBCS_nonmodal_EUC_JP),
                          &jf, &jt, 0, o),
        NLSSM_E_BAD_OPTIONS);
  EXPECT_EQ(
      NLSStringNormalizeS_MBCS_nonmodal_EUC_JP(jp, jsrc.data(), 2, jdst.data(), 2, nullptr, 0), 0);
  EXPECT_EQ(jdst, (Bytes{'a', 'b'}));
}

TEST(Normalize, NonModalNeverReportsTruncationAndUtf8CopiesNothing) {
  const NLSSMHandle *sjis = handle(135);
  Bytes src{'A', 'B', 'C'}, dst{'x', 'y'};
  NLSString from = over(src), to = over(dst);
  to.length = 1;
  EXPECT_EQ(normalize(sjis, from, to, 0, 0), 0);
  EXPECT_EQ(dst, (Bytes{'a', 'b'}));
  EXPECT_EQ(to.length, 1u);
  const NLSSMHandle *utf8 = handle(NLSSM_ENC_UTF8);
  NLSString u = over(dst);
  EXPECT_EQ(normalize(utf8, from, u, 0, kToUpper), 0);
  EXPECT_EQ(dst, (Bytes{'A', 'B'}));
  int64_t written = 0;
  EXPECT_EQ(normalize_s(utf8, {'q', 'r', 's'}, dst, &written, 0), 0);
  EXPECT_EQ(dst, (Bytes{'a', 'b'}));
  EXPECT_EQ(written, 3);
}

}  // namespace
