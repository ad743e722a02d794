// The class-independent operations, on hand-built handles.
#include <gtest/gtest.h>
#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <cstring>

namespace {

NLSString descriptor(uint8_t *buffer, uint64_t length, int64_t index, int64_t offset) {
  NLSString s{};
  s.buffer = buffer;
  s.length = length;
  s.capacity = length;
  s.charIndex = index;
  s.curOffset = offset;
  s.nextOffset = NLSSM_POS_NONE;
  s.prevOffset = NLSSM_POS_NO_PREVIOUS;
  return s;
}

int steps = 0;
int64_t fake_next_char(const NLSSMHandle *, NLSString *s, int64_t) {
  ++steps;
  s->prevOffset = s->curOffset;
  s->curOffset = s->curOffset + 1 < static_cast<int64_t>(s->length) ? s->curOffset + 1 : -9;
  return ++s->charIndex;
}

TEST(CommonOperations, GetPosAnswersNoneOnceSteppedPastTheEnd) {
  uint8_t text[] = "ab";
  NLSString s = descriptor(text, 2, 1, 1);
  EXPECT_EQ(stringGetPos(nullptr, &s), 1);
  s.charIndex = 2;
  s.curOffset = NLSSM_POS_NONE;
  EXPECT_EQ(stringGetPos(nullptr, &s), NLSSM_POS_NONE);
}

TEST(CommonOperations, NextCharBStepsThroughTheHandleUnlessEmpty) {
  NLSSMHandle handle{};
  handle.stringNextChar = reinterpret_cast<NLSSlot>(&fake_next_char);
  uint8_t text[] = "ab";
  steps = 0;
  NLSString empty = descriptor(text, 0, 0, 7);
  EXPECT_EQ(stringNextCharB(&handle, &empty, 0), 7);
  EXPECT_EQ(steps, 0);

  NLSString s = descriptor(text, 2, 0, 0);
  EXPECT_EQ(stringNextCharB(&handle, &s, 0), 1);
  EXPECT_EQ(stringNextCharB(&handle, &s, 0), NLSSM_POS_NONE);
  EXPECT_EQ(steps, 2);
}

TEST(CommonOperations, CleanForgetsOnlyTheBuffer) {
  uint8_t text[] = "abc";
  NLSString s = descriptor(text, 3, 2, 2);
  EXPECT_EQ(NLSStringClean(nullptr, &s), 0);
  EXPECT_EQ(s.buffer, nullptr);
  EXPECT_EQ(s.length, 3u);
  EXPECT_EQ(s.curOffset, 2);
  EXPECT_EQ(NLSStringInit(nullptr, &s), 0);
  EXPECT_EQ(stringDupPos(nullptr, &s, &s), 0);
}

class CharInit : public ::testing::TestWithParam<uint32_t> {};

TEST_P(CharInit, BuildsOneCharacterRecord) {
  const uint32_t encodingClass = GetParam();
  const bool multiByte =
      encodingClass == NLSSM_CLASS_MBCS_MODAL || encodingClass == NLSSM_CLASS_MBCS_NONMODAL;
  const uint8_t quote = 0x22;

  NLSSMHandle plain{};
  plain.encodingClass = encodingClass;
  plain.unitWidth = 1;
  NLSChar record;
  std::memset(&record, 0xCC, sizeof record);
  EXPECT_EQ(NLSCharInit(&plain, &quote, 0, &record), 0);
  EXPECT_EQ(record.string.buffer, record.bytes);
  EXPECT_EQ(record.string.length, 1u);
  EXPECT_EQ(record.bytes[0], 0x22);
  EXPECT_EQ(record.string.capacity, 4u);
  EXPECT_EQ(record.string.charIndex, 0);
  EXPECT_EQ(record.string.curOffset, 0);
  EXPECT_EQ(record.string.nextOffset, NLSSM_POS_NONE);
  EXPECT_EQ(record.string.prevOffset, NLSSM_POS_NO_PREVIOUS);
  EXPECT_EQ(record.string.charKind, multiByte ? NLSSM_KIND_SINGLE : 0u);
  EXPECT_EQ(record.string.nextCharKind, 0u);
  EXPECT_EQ(record.string.prevKind, 0u);

  // The SBCS member never marks the kind.
  std::memset(&record, 0xCC, sizeof record);
  EXPECT_EQ(NLSCharInit_SBCS(&plain, &quote, 0, &record), 0);
  EXPECT_EQ(record.string.charKind, 0u);
  EXPECT_EQ(record.string.length, 1u);
}

INSTANTIATE_TEST_SUITE_P(EveryClass, CharInit, ::testing::Range(0u, 6u));

}  // namespace
