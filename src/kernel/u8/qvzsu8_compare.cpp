// Comparison and search of UTF-8 text: binary order (which for UTF-8 is
// code point order), order after full case folding, and the first
// occurrence of one text in another.
#include <nlssm/nlssm.h>

#include <algorithm>

#include "kernel/hot.hpp"
#include "kernel/u8/case_map.hpp"

namespace {

int64_t sign(int64_t v) {
  return (v > 0) - (v < 0);
}

// The bytes of a text's full case folding, produced a character at a time.
class FoldedBytes {
 public:
  FoldedBytes(const uint8_t *p, int64_t n) : p_(p), end_(p + n) {}

  // The next byte, or -1 at the end.
  int next() {
    if (at_ < length_) return piece_[at_++];
    if (p_ == end_) return -1;
    if (*p_ < 0x80) return kernel::u8::ascii_case(kernel::u8::CaseKind::fold, *p_++);
    const kernel::u8::Mapped m =
        kernel::u8::map_char(kernel::u8::CaseKind::fold, true, p_, end_ - p_, piece_);
    p_ += m.consumed;
    length_ = m.length;
    at_ = 1;
    return piece_[0];
  }

 private:
  const uint8_t *p_;
  const uint8_t *end_;
  uint8_t piece_[kernel::u8::kCaseFullMax];
  int32_t length_ = 0;
  int32_t at_ = 0;
};

}  // namespace

int64_t qvzsu8Compare(const uint8_t *a, int64_t aLength, const uint8_t *b, int64_t bLength) {
  aLength = a == nullptr ? 0 : std::max<int64_t>(aLength, 0);
  bLength = b == nullptr ? 0 : std::max<int64_t>(bLength, 0);
  if (const int64_t order = skMemCmp(a, b, std::min(aLength, bLength)); order != 0)
    return sign(order);
  return sign(aLength - bLength);
}

int64_t qvzsu8CaseCompare(const uint8_t *a, int64_t aLength, const uint8_t *b, int64_t bLength) {
  aLength = a == nullptr ? 0 : std::max<int64_t>(aLength, 0);
  bLength = b == nullptr ? 0 : std::max<int64_t>(bLength, 0);
  // Equal bytes fold alike: skip the common start that is whole characters.
  int64_t same = kernel::hot().mem_mismatch(a, b, std::min(aLength, bLength));
  while (same > 0 && (a[same - 1] >= 0x80)) --same;
  FoldedBytes x(a + same, aLength - same), y(b + same, bLength - same);
  for (;;) {
    const int cx = x.next(), cy = y.next();
    if (cx != cy) return cx < cy ? -1 : 1;
    if (cx < 0) return 0;
  }
}

int64_t qvzsu8Find(const uint8_t *text, int64_t byteLength, const uint8_t *pattern,
                   int64_t patternLength) {
  if (byteLength < 0 || patternLength < 0 || (text == nullptr && byteLength > 0) ||
      (pattern == nullptr && patternLength > 0))
    return -1;
  if (patternLength == 0) return 0;
  const uint8_t first = pattern[0];
  for (int64_t at = 0; at + patternLength <= byteLength;) {
    const int64_t hit = skMemScan(text + at, byteLength - patternLength + 1 - at, first);
    if (hit < 0) return -1;
    at += hit;
    if (skMemCmp(text + at + 1, pattern + 1, patternLength - 1) == 0) return at;
    ++at;
  }
  return -1;
}
