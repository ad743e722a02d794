// The stepping, counting and blank rules of each class on small texts.
#include <gtest/gtest.h>

#include <vector>

#include "handle_fixture.hpp"

namespace cursor_test {
namespace {

using Bytes = std::vector<uint8_t>;
constexpr int64_t kBad = NLSSM_E_BAD_CHARACTER;

// Three characters in each encoding, with the offset of each.
struct Sample {
  Enc enc;
  Bytes bytes;
  std::vector<int64_t> starts;
};

std::vector<Sample> three_char_samples() {
  return {
      {Enc::kSbcs, {0xC1, 0x40, 0xC2}, {0, 1, 2}},
      {Enc::kUtf8, {'a', 0xC3, 0xA9, 0xF0, 0x9F, 0x98, 0x80}, {0, 1, 3}},
      {Enc::kUtfe, {0xC1, 0x81, 0x82}, {0, 1, 2}},  // stepped by the UTF-8 rules
      {Enc::kWcs2Le, {'a', 0, 0x3D, 0xD8, 0x00, 0xDE, 'b', 0}, {0, 2, 6}},
      {Enc::kWcs2Be, {0, 'a', 0xD8, 0x3D, 0xDE, 0x00, 0, 'b'}, {0, 2, 6}},
      {Enc::kWcs4Le, {'a', 0, 0, 0, 'b', 0, 0, 0, 'c', 0, 0, 0}, {0, 4, 8}},
      {Enc::kModal, {0xC1, 0x0E, 0x45, 0x41, 0x45, 0x42, 0x0F}, {0, 2, 4}},
      {Enc::kDbcs, {'a', 0x82, 0xA0, 0x88, 0x9F}, {0, 1, 3}},
      {Enc::kEucJp, {'a', 0x8F, 0xA1, 0xA2, 0x8E, 0xB1}, {0, 1, 4}},
      {Enc::kEucTw, {0x8E, 0xA2, 0xA1, 0xA1, 0xC4, 0xA1, 'z'}, {0, 4, 6}},
      {Enc::kGb18030, {0x81, 0x30, 0x81, 0x30, 'a', 0xB0, 0xA1}, {0, 4, 5}},
  };
}

class EveryClass : public ::testing::TestWithParam<Sample> {};

// Stepping past the last character parks the cursor there; stepping again
// changes nothing.
TEST_P(EveryClass, SteppingOffTheLastCharacterParks) {
  Sample sample = GetParam();
  auto th = make_handle(sample.enc);
  NLSString s = descriptor(sample.bytes);
  ASSERT_EQ(set_pos(&th->h, &s, 2, 0), 2);
  EXPECT_EQ(stringNextCharB(&th->h, &s, 0), NLSSM_POS_NONE);
  EXPECT_EQ(s.charIndex, 3);
  if (sample.enc != Enc::kSbcs) {
    EXPECT_EQ(s.prevOffset, sample.starts[2]);
  }
  EXPECT_EQ(next_char(&th->h, &s), NLSSM_POS_NONE);
  EXPECT_EQ(s.charIndex, 3);
  EXPECT_EQ(stringGetPos(&th->h, &s), NLSSM_POS_NONE);
}

TEST_P(EveryClass, PositionsAndCounts) {
  Sample sample = GetParam();
  auto th = make_handle(sample.enc);
  NLSString s = descriptor(sample.bytes);
  ASSERT_EQ(set_pos(&th->h, &s, 0, 0), 0);
  EXPECT_EQ(set_pos(&th->h, &s, NLSSM_POS_CURRENT, -1), NLSSM_POS_OUTSIDE);
  EXPECT_EQ(s.charIndex, 0);
  EXPECT_EQ(set_pos(&th->h, &s, 1, 0), 1);
  int64_t count = -1;
  EXPECT_EQ(num_chars(&th->h, &s, 0, &count), 0);
  EXPECT_EQ(count, 2);
  EXPECT_EQ(byte_length(&th->h, &s, 1), sample.starts[2] - sample.starts[1]);
  EXPECT_EQ(byte_length(&th->h, &s, 0),
            static_cast<int64_t>(sample.bytes.size()) - sample.starts[1]);
  s.curOffset = NLSSM_POS_NONE;
  EXPECT_EQ(num_chars(&th->h, &s, 0, &count), 0);
  EXPECT_EQ(count, 0);
  EXPECT_EQ(num_chars(&th->h, nullptr, 0, &count), NLSSM_E_NULL_ARGUMENT);
  EXPECT_EQ(num_chars_s(&th->h, nullptr, 3, 0, &count), NLSSM_E_NULL_ARGUMENT);
  EXPECT_EQ(count, 0);
}

INSTANTIATE_TEST_SUITE_P(Classes, EveryClass, ::testing::ValuesIn(three_char_samples()),
                         [](const ::testing::TestParamInfo<Sample> &info) {
                           return enc_name(info.param.enc);
                         });

// Past the end: fixed-width and UTF-8 move only the index (single bytes also
// the offset), double-byte text parks, modal text stays where it is.
TEST(SetPosBeyondEnd, EachClassKeepsItsOwnConvention) {
  Bytes text = {'a', 'b', 'c'};
  auto sbcs = make_handle(Enc::kSbcs);
  NLSString s = descriptor(text);
  EXPECT_EQ(set_pos(&sbcs->h, &s, 7, 0), NLSSM_POS_OUTSIDE);
  EXPECT_EQ(s.charIndex, 7);
  EXPECT_EQ(s.curOffset, 7);
  s = descriptor(text);
  EXPECT_EQ(set_pos(&sbcs->h, &s, 3, 0), NLSSM_POS_OUTSIDE);
  EXPECT_EQ(s.charIndex, 3);
  EXPECT_EQ(s.curOffset, NLSSM_POS_NONE);
  EXPECT_EQ(s.prevOffset, 2);

  auto utf8 = make_handle(Enc::kUtf8);
  s = descriptor(text);
  EXPECT_EQ(set_pos(&utf8->h, &s, 7, 0), NLSSM_POS_OUTSIDE);
  EXPECT_EQ(s.charIndex, 7);
  EXPECT_EQ(s.curOffset, 0);

  auto dbcs = make_handle(Enc::kDbcs);
  s = descriptor(text);
  EXPECT_EQ(set_pos(&dbcs->h, &s, 7, 0), NLSSM_POS_OUTSIDE);
  EXPECT_EQ(s.charIndex, 3);
  EXPECT_EQ(s.curOffset, NLSSM_POS_NONE);
  EXPECT_EQ(s.charKind, 0u);

  auto modal = make_handle(Enc::kModal);
  s = descriptor(text);
  ASSERT_EQ(set_pos(&modal->h, &s, 1, 0), 1);
  EXPECT_EQ(set_pos(&modal->h, &s, 7, 0), NLSSM_POS_OUTSIDE);
  EXPECT_EQ(s.charIndex, 1);
  EXPECT_EQ(s.curOffset, 1);
  EXPECT_EQ(set_pos(&modal->h, &s, 3, 0), NLSSM_POS_OUTSIDE);
  EXPECT_EQ(s.charIndex, 3);
  EXPECT_EQ(s.prevOffset, 2);
  EXPECT_EQ(s.prevKind, 1u);
}

TEST(SizeRules, BoundaryCharacters) {
  auto le = make_handle(Enc::kWcs2Le);
  Bytes lone_high = {'a', 0, 0x3D, 0xD8};
  NLSString s = descriptor(lone_high);
  ASSERT_EQ(set_pos(&le->h, &s, 1, 0), 1);
  EXPECT_EQ(cur_char_size(&le->h, &s), 2);
  EXPECT_EQ(getMBCSCharSZ_UCS2L(&le->h, &s, 2, nullptr), 2);

  const uint8_t ss3[] = {0x8F, 0xA1};
  EXPECT_EQ(getMBCSCharSZ_EUC_JP(nullptr, nullptr, 2, ss3), 1);
  EXPECT_EQ(getMBCSCharSZ_EUC_JP(nullptr, nullptr, 0, ss3), 0);
  const uint8_t gb4[] = {0x81, 0x30, 0x81, 0x30};
  const uint8_t gb_short[] = {0x81, 0x30, 0x41, 0x30};
  EXPECT_EQ(getMBCSCharSZ_GB18030(nullptr, nullptr, 4, gb4), 4);
  EXPECT_EQ(getMBCSCharSZ_GB18030(nullptr, nullptr, 4, gb_short), 1);
  const uint8_t tw[] = {0x8E, 0xA2, 0xA1, 0xA1};
  EXPECT_EQ(getMBCSCharSZ_EUC_TW(nullptr, nullptr, 4, tw), 4);
  EXPECT_EQ(getMBCSCharSZ_EUC_TW(nullptr, nullptr, 3, tw), 1);

  auto dbcs = make_handle(Enc::kDbcs);
  const uint8_t lead_last[] = {'a', 0x82};
  EXPECT_EQ(getMBCSCharSZ_nonmodal(&dbcs->h, nullptr, 1, lead_last + 1), 1);
  const uint8_t pair[] = {0x82, 0xA0};
  EXPECT_EQ(getMBCSCharSZ_nonmodal(&dbcs->h, nullptr, 2, pair), 2);

  // UTF-EBCDIC: 0x80 leads a two-byte character (I8 0xC5), 0x41 trails.
  const uint8_t utfe[] = {0x80, 0x41};
  EXPECT_EQ(getMBCSCharSZ_UTFE(nullptr, nullptr, 2, utfe), 2);
  EXPECT_EQ(getMBCSCharSZ_UTFE(nullptr, nullptr, 2, utfe + 1), 1);

  // By the form of the byte, continuation bytes answer 6.
  auto utf8 = make_handle(Enc::kUtf8);
  Bytes forms = {0xBF, 0xFC, 0xF8};
  s = descriptor(forms);
  for (int64_t expect : {6, 6, 5}) {
    s.curOffset = s.charIndex;
    EXPECT_EQ(stringCurCharSize_UTF8(&utf8->h, &s), expect);
    ++s.charIndex;
  }
  s.curOffset = NLSSM_POS_NONE;
  EXPECT_EQ(cur_char_size(&utf8->h, &s), NLSSM_SIZE_NONE);
}

TEST(Modal, ShiftSequencesAreNotCharacters) {
  auto th = make_handle(Enc::kModal);
  Bytes text = {0x0E, 0x45, 0x41, 0x45, 0x42, 0x0F, 0xC1};
  int64_t count = 0;
  EXPECT_EQ(num_chars_s(&th->h, text.data(), 7, 0, &count), 0);
  EXPECT_EQ(count, 3);
  uint32_t state = 0;
  EXPECT_EQ(getDBCSPos_modal(&th->h, text.data(), 7, 2, 0, &state), 6);
  EXPECT_EQ(state, 1u);
  EXPECT_EQ(getDBCSPos_modal(&th->h, text.data(), 7, 1, 0, &state), 3);
  EXPECT_EQ(state, 4u);
  EXPECT_EQ(getDBCSPos_modal(&th->h, text.data(), 7, 3, 0, &state), NLSSM_POS_NONE);
  // A double-byte character cut by the end of the text.
  Bytes cut = {0x0E, 0x45, 0x41, 0x45};
  EXPECT_EQ(num_chars_s(&th->h, cut.data(), 4, 0, &count), kBad);
  EXPECT_EQ(count, 2);
  EXPECT_EQ(num_chars_s(&th->h, cut.data(), 4, 4, &count), kBad);
  EXPECT_EQ(count, 1);
  // Two-byte shift sequences from the range record.
  th->ranges[24] = 2;
  th->h.shiftLength = 2;
  th->ranges[26] = 0x0E;
  th->ranges[27] = 0x01;
  th->ranges[30] = 0x0F;
  th->ranges[31] = 0x01;
  Bytes wide = {0x0E, 0x01, 0x45, 0x41, 0x0F, 0x01, 0x0E, 0xC1};
  EXPECT_EQ(num_chars_s(&th->h, wide.data(), 8, 0, &count), 0);
  EXPECT_EQ(count, 3);
}

struct CountCase {
  Enc enc;
  Bytes bytes;
  int64_t flags, count, status;
};

class BrokenText : public ::testing::TestWithParam<CountCase> {};

TEST_P(BrokenText, CountsByTheFlag) {
  const CountCase &c = GetParam();
  auto th = make_handle(c.enc);
  int64_t count = -1;
  EXPECT_EQ(
      num_chars_s(&th->h, c.bytes.data(), static_cast<int64_t>(c.bytes.size()), c.flags, &count),
      c.status);
  EXPECT_EQ(count, c.count);
}

INSTANTIATE_TEST_SUITE_P(
    Cases, BrokenText,
    ::testing::Values(CountCase{Enc::kDbcs, {'a', 0x82}, 0, 2, kBad},
                      CountCase{Enc::kDbcs, {'a', 0x82}, 4, 1, kBad},
                      CountCase{Enc::kDbcs, {0x82, 0x20, 'b'}, 0, 3, kBad},
                      CountCase{Enc::kDbcs, {0x82, 0x20, 'b'}, 4, 1, kBad},
                      CountCase{Enc::kUtf8, {'a', 0x80, 'b'}, 0, 3, kBad},
                      CountCase{Enc::kUtf8, {'a', 0x80, 'b'}, 4, 2, kBad},
                      CountCase{Enc::kUtf8, {0xE2, 0x82, 'x', 0xC3, 0xA9}, 0, 3, kBad},
                      CountCase{Enc::kUtf8, {0xE2, 0x82, 'x', 0xC3, 0xA9}, 4, 2, kBad},
                      CountCase{Enc::kUtf8, {0xF8, 0x88, 0x80, 0x80, 0x80}, 0, 1, 0},
                      CountCase{Enc::kUtf8, {'a', 0xF0, 0x9F}, 4, 1, kBad},
                      CountCase{Enc::kUtfe, {0x80, 0x41, 0x41}, 0, 2, kBad},
                      CountCase{Enc::kUtfe, {0x80, 0x41, 0xC1}, 0, 2, 0},
                      CountCase{Enc::kWcs2Le, {0x00, 0xDC, 0x3D, 0xD8, 'a'}, 0, 2, 0},
                      CountCase{Enc::kEucJp, {0xA1, 'a', 0x8E}, 0, 3, kBad},
                      CountCase{Enc::kGb18030, {0x81, 0x30, 0x81, 0x30, 0x81}, 0, 2, kBad}));

// Found by fuzzing: the limited UTF-8 length stepped over the terminating
// zero when it fell inside a character the lead byte announced, and read on
// past the end of the text.
TEST(Lengths, LimitedUtf8LengthStopsAtAZeroInsideACharacter) {
  auto utf8 = make_handle(Enc::kUtf8);
  const uint8_t text[] = {'a', 0xE2, 0x82, 0, 'b', 'c', 0};
  int64_t chars = -1, bytes = -1;
  EXPECT_EQ(string_nlength(&utf8->h, text, 40, &chars, &bytes), kBad);
  EXPECT_EQ(chars, 1);
  EXPECT_EQ(bytes, 1);
}

TEST(Lengths, TerminatedAndLimitedText) {
  auto utf8 = make_handle(Enc::kUtf8);
  const uint8_t text[] = {'a', 0xC3, 0xA9, 0xE2, 0x82, 0xAC, 0};
  int64_t chars = -1, bytes = -1;
  EXPECT_EQ(string_nlength(&utf8->h, text, 4, &chars, &bytes), kBad);
  EXPECT_EQ(chars, 2);
  EXPECT_EQ(bytes, 3);
  const uint8_t cut[] = {'a', 0xE2, 0x82, 0};
  EXPECT_EQ(string_length(&utf8->h, cut, nullptr, &bytes, 1), kBad);
  EXPECT_EQ(bytes, 1);
  const uint8_t rejected[] = {'a', 0xC0, 0xAF, 0};
  EXPECT_EQ(string_length(&utf8->h, rejected, &chars, &bytes), kBad);
  EXPECT_EQ(chars, 1);
  EXPECT_EQ(bytes, 3);

  auto dbcs = make_handle(Enc::kDbcs);
  const uint8_t broken[] = {'a', 0x82, 0x20, 0};
  EXPECT_EQ(string_length(&dbcs->h, broken, &chars, &bytes), kBad);
  EXPECT_EQ(chars, 1);
  auto wcs4 = make_handle(Enc::kWcs4Le);
  const uint8_t wide[] = {'a', 0, 0, 0, 'b', 0, 0, 0, 0, 0, 0, 0};
  EXPECT_EQ(string_nlength(&wcs4->h, wide, 7, &chars, &bytes), 0);
  EXPECT_EQ(chars, 1);

  // Byte lengths of leading characters; negative: up to the terminator.
  EXPECT_EQ(string_blength(&utf8->h, text, -1), 6);
  EXPECT_EQ(qvzsu8ByteLength(cut, -1), 3);
  const uint8_t sjis[] = {0x82, 0xA0, 'x', 0x82};
  EXPECT_EQ(getDBCSStringLen_MBCS_nonmodal(&dbcs->h, sjis, 4, 9), 4);
  EXPECT_EQ(getDBCSStringLen_MBCS_nonmodal(&dbcs->h, sjis, 4, 1), 2);
}

TEST(ByteLength, LimitsAndIncompleteTails) {
  auto wcs4 = make_handle(Enc::kWcs4Le);
  Bytes eight(8, 'a');
  NLSString s = descriptor(eight);
  EXPECT_EQ(byte_length(&wcs4->h, &s, 3), 8);
  EXPECT_EQ(byte_length(&wcs4->h, &s, 1), 4);

  auto utf8 = make_handle(Enc::kUtf8);
  Bytes tail = {'a', 0xC3, 0xA9, 0xE2, 0x82};
  s = descriptor(tail);
  EXPECT_EQ(byte_length(&utf8->h, &s, 0), 3);
  EXPECT_EQ(byte_length(&utf8->h, &s, 9), 3);
  Bytes short_seq = {0xE2, 'a', 'b'};  // a lead followed by too few continuations
  s = descriptor(short_seq);
  EXPECT_EQ(byte_length(&utf8->h, &s, 1), 1);
  EXPECT_EQ(byte_length(&utf8->h, &s, 2), 2);

  auto sbcs = make_handle(Enc::kSbcs);
  const uint8_t padded[] = {0xC1, 0x40, 0xC2, 0x40, 0x40};
  EXPECT_EQ(byte_length_c(&sbcs->h, padded, 5, 0), 5);
  EXPECT_EQ(byte_length_c(&sbcs->h, padded, 5, 1), 3);
  EXPECT_EQ(byte_length_c(&sbcs->h, padded + 3, 2, 2), 0);
  auto modal = make_handle(Enc::kModal);
  const uint8_t modal_text[] = {0x0E, 0x45, 0x41, 0x40, 0x40, 0x0F, 0x40};
  EXPECT_EQ(byte_length_c(&modal->h, modal_text, 7, 1), 3);
}

TEST(Blanks, PaddingAndTests) {
  auto utf8 = make_handle(Enc::kUtf8);
  uint8_t raw[4] = {'x', 'x', 'x', 'x'};
  int64_t written = -1;
  EXPECT_EQ(NLSBlankPadS(&utf8->h, raw, 0, 0, &written), NLSSM_E_DEST_TOO_SMALL);
  auto sbcs = make_handle(Enc::kSbcs);
  EXPECT_EQ(NLSBlankPadS_SBCS(&sbcs->h, raw, 0, 0, &written), 0);
  EXPECT_EQ(NLSAllBlanksS(&utf8->h, raw, 0), 0);
  EXPECT_EQ(NLSBlankPadS(&utf8->h, raw, 3, 0, &written), 0);
  EXPECT_EQ(NLSAllBlanksS(&utf8->h, raw, 3), 1);
  EXPECT_EQ(NLSAllBlanksS(&utf8->h, raw, 4), 0);

  // Descriptor pad: from the current character, capped at the capacity.
  Bytes buffer = {'a', 'b', 0, 0, 0};
  NLSString s = descriptor(buffer);
  s.length = 2;
  s.curOffset = 1;
  EXPECT_EQ(NLSBlankPad(&utf8->h, 9, &s, 0, &written), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(written, 4);
  EXPECT_EQ(s.length, 5u);
  EXPECT_EQ(s.nextOffset, 2);
  EXPECT_EQ(NLSAllBlanks(&utf8->h, &s), 1);
  s.curOffset = 5;
  EXPECT_EQ(NLSAllBlanks(&utf8->h, &s), 0);
  EXPECT_EQ(NLSBlankPad(&utf8->h, 0, &s, 0, &written), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(written, 0);

  // Single bytes pad from the character index; nothing left is all blank.
  Bytes line = {'a', 'b', 'c', 'd'};
  s = descriptor(line);
  s.length = 2;
  s.charIndex = 1;
  EXPECT_EQ(NLSBlankPad_SBCS(&sbcs->h, 0, &s, 0, &written), 0);
  EXPECT_EQ(written, 3);
  EXPECT_EQ(line, (Bytes{'a', 0x40, 0x40, 0x40}));
  EXPECT_EQ(s.length, 4u);
  s.curOffset = 4;
  EXPECT_EQ(NLSAllBlanks_SBCS(&sbcs->h, &s), 1);

  // Wide blanks are whole units.
  auto be = make_handle(Enc::kWcs2Be);
  uint8_t wide[5] = {1, 1, 1, 1, 1};
  EXPECT_EQ(NLSBlankPadS_WCS(&be->h, wide, 5, 0, &written), 0);
  EXPECT_EQ(written, 4);
  EXPECT_EQ(wide[1], 0x20);
  EXPECT_EQ(wide[4], 1);
  EXPECT_EQ(NLSAllBlanksS_WCS(&be->h, wide, 4), 1);

  // Modal text pads in its shift state: double-byte blanks after shift-out.
  auto modal = make_handle(Enc::kModal);
  Bytes dbcs = {0x0E, 0x45, 0x41, 0, 0, 0};
  s = descriptor(dbcs);
  s.length = 3;
  s.curOffset = NLSSM_POS_NONE;
  EXPECT_EQ(NLSBlankPad_MBCS_modal(&modal->h, 3, &s, 0, &written), 0);
  EXPECT_EQ(written, 2);
  EXPECT_EQ(s.charKind, 4u);
  EXPECT_EQ(NLSAllBlanks_MBCS_modal(&modal->h, &s), 1);
  EXPECT_EQ(NLSAllBlanksS_MBCS_modal(&modal->h, dbcs.data(), 5), 0);
}

}  // namespace
}  // namespace cursor_test
