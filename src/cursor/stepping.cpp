// Character stepping and positioning: stringNextChar, stringSetPos,
// stringCurCharSize, the one-character size probes and the forward position
// scanners of every class.
#include <nlssm/nlssm.h>

#include "cursor/char_model.hpp"
#include "cursor/cursor.hpp"

namespace nlssm::cursor {
namespace {

using SetPosFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);

// Steps forward over the cached next offset and sizes the new current
// character (WCS4, WCS2, UTF-8).
template <class M>
int64_t next_char_cached(const NLSSMHandle *h, NLSString *s) {
  if (s->curOffset < 0) return kNone;
  const auto length = static_cast<int64_t>(s->length);
  if (s->nextOffset < 0 || s->nextOffset >= length) {
    ++s->charIndex;
    s->prevOffset = s->curOffset;
    s->curOffset = kNone;
    s->nextOffset = kNone;
    return kNone;
  }
  s->prevOffset = s->curOffset;
  s->curOffset = s->nextOffset;
  ++s->charIndex;
  const int64_t next = s->curOffset + M(h).step(s->buffer + s->curOffset, length - s->curOffset, 0);
  s->nextOffset = next >= length ? kNone : next;
  return s->charIndex;
}

// The step off the last character of a multi-byte text: the last character
// becomes the previous one and no character is current.
int64_t park_past_end(NLSString *s) {
  s->prevOffset = s->curOffset;
  s->prevKind = s->charKind;
  ++s->charIndex;
  s->charKind = 0;
  s->nextCharKind = 0;
  s->curOffset = kNone;
  s->nextOffset = kNone;
  return kNone;
}

// Modal, EUC-JP, EUC-TW, GB18030: a step is a relative move by one through
// the handle's stringSetPos; the step off the last character parks here.
int64_t next_char_through_set_pos(const NLSSMHandle *h, NLSString *s) {
  if (s->curOffset < 0) return kNone;
  if (s->nextOffset != kNone) return reinterpret_cast<SetPosFn>(h->stringSetPos)(h, s, kCurrent, 1);
  return park_past_end(s);
}

// Fixed-width classes position by arithmetic.
int64_t set_pos_fixed(NLSString *s, int64_t pos, int64_t delta, int64_t width, bool sbcs) {
  const auto length = static_cast<int64_t>(s->length);
  const int64_t count = length / width;
  if (pos == kCurrent) {
    pos = s->charIndex;
  } else if (pos == kLast) {
    pos = count - 1;
  }
  const int64_t target = pos + delta;
  if (target < 0) return kOutside;
  if (target < count) {
    const int64_t off = target * width;
    s->charIndex = target;
    s->curOffset = off;
    s->prevOffset = target == 0 ? kNoPrevious : off - width;
    s->nextOffset = target + 1 >= count ? kNone : off + width;
    return target;
  }
  if (delta == 1 || target == count) {
    s->charIndex = count;
    s->curOffset = kNone;
    s->nextOffset = kNone;
    s->prevOffset = count == 0 ? kNoPrevious : (count - 1) * width;
    return kOutside;
  }
  // Any other target past the end only moves the index (and, for single
  // bytes, the offset with it); the cursor is not parked.
  s->charIndex = target;
  if (sbcs) s->curOffset = target;
  return kOutside;
}

// Class-5 positioning; a one-byte text that holds only a lead byte has no
// character to stand on.
template <class M>
int64_t set_pos_nonmodal(const NLSSMHandle *h, NLSString *s, int64_t pos, int64_t delta,
                         CountFn count) {
  if (pos == 0 && delta == 0 && s->length == 1 && M(h).step(s->buffer, 1, 0) > 1) return kOutside;
  return set_pos<M, Beyond::kParkAlways, true>(h, s, pos, delta, count);
}

template <class M>
int64_t probe(const NLSSMHandle *h, const NLSString *s, int64_t remaining, const uint8_t *base) {
  if (remaining <= 0) return 0;
  const uint8_t *p = base != nullptr ? base : (s != nullptr ? s->buffer + s->curOffset : nullptr);
  if (p == nullptr) return 0;
  const int64_t n = M(h).unit(p, remaining, 0).size;
  return n > remaining ? 1 : n;
}

int64_t probe_table(const std::array<uint8_t, 256> &table, const NLSString *s, int64_t remaining,
                    const uint8_t *base) {
  if (remaining <= 0) return 0;
  const uint8_t *p = base != nullptr ? base : (s != nullptr ? s->buffer + s->curOffset : nullptr);
  if (p == nullptr) return 0;
  const int64_t n = table[*p];
  return n == 0 || n > remaining ? 1 : n;
}

// Forward scanner: the offset of character `n` (0-based) from `start`, or
// -9 when the text ends first. `state` carries the shift state in (modal
// text) and the kind of the character found out.
template <class M>
int64_t scan_position(const NLSSMHandle *h, const uint8_t *buffer, int64_t length, int64_t n,
                      int64_t start, uint32_t *state) {
  uint32_t in = state != nullptr && *state != 0 ? *state : kModalSingle;
  if (buffer == nullptr || n < 0 || start < 0 || start >= length) {
    if (state != nullptr) *state = 0;
    return kNone;
  }
  const Located r = locate(M(h), buffer, length, Anchor{0, start, in, kNoPrevious, 0}, n);
  if (state != nullptr) *state = r.found ? r.curKind : 0;
  return r.found ? r.cur : kNone;
}

}  // namespace
}  // namespace nlssm::cursor

using namespace nlssm::cursor;

// ---- stringNextChar ------------------------------------------------------

extern "C" int64_t stringNextChar_SBCS(const NLSSMHandle *, NLSString *s) {
  if (s->curOffset < 0) return kNone;
  ++s->charIndex;
  if (s->curOffset + 1 < static_cast<int64_t>(s->length)) {
    ++s->curOffset;
    return s->charIndex;
  }
  s->curOffset = kNone;
  return kNone;
}

extern "C" int64_t stringNextChar_WCS4(const NLSSMHandle *h, NLSString *s) {
  return next_char_cached<FixedModel>(h, s);
}

extern "C" int64_t stringNextChar_WCS2(const NLSSMHandle *h, NLSString *s) {
  return h->encodingNumber == NLSSM_ENC_WCS2_BE ? next_char_cached<Wcs2Model<true>>(h, s)
                                                : next_char_cached<Wcs2Model<false>>(h, s);
}

extern "C" int64_t stringNextChar_UTF8(const NLSSMHandle *h, NLSString *s) {
  return next_char_cached<Utf8StepModel>(h, s);
}

// Decides the next character's kind by its lead flag alone; whether a trail
// byte follows is the size probe's business.
extern "C" int64_t stringNextChar_MBCS_nonmodal(const NLSSMHandle *h, NLSString *s) {
  if (s->curOffset < 0) return kNone;
  const auto length = static_cast<int64_t>(s->length);
  if (s->nextOffset < 0 || s->nextOffset >= length) {
    return park_past_end(s);
  }
  s->prevOffset = s->curOffset;
  s->curOffset = s->nextOffset;
  s->prevKind = s->charKind;
  s->charKind = s->nextCharKind;
  const int64_t next = s->curOffset + (s->charKind == NLSSM_KIND_DOUBLE ? 2 : 1);
  if (next >= length) {
    s->nextOffset = kNone;
    s->nextCharKind = 0;
  } else {
    s->nextOffset = next;
    s->nextCharKind = DbcsModel(h).lead(s->buffer[next]) ? NLSSM_KIND_DOUBLE : NLSSM_KIND_SINGLE;
  }
  return ++s->charIndex;
}

extern "C" int64_t stringNextChar_MBCS_modal(const NLSSMHandle *h, NLSString *s) {
  return next_char_through_set_pos(h, s);
}
extern "C" int64_t stringNextChar_MBCS_nonmodal_EUC_JP(const NLSSMHandle *h, NLSString *s) {
  return next_char_through_set_pos(h, s);
}
extern "C" int64_t stringNextChar_MBCS_nonmodal_EUC_TW(const NLSSMHandle *h, NLSString *s) {
  return next_char_through_set_pos(h, s);
}
extern "C" int64_t stringNextChar_MBCS_nonmodal_GB18030(const NLSSMHandle *h, NLSString *s) {
  return next_char_through_set_pos(h, s);
}

// ---- stringSetPos --------------------------------------------------------

extern "C" int64_t stringSetPos_SBCS(const NLSSMHandle *, NLSString *s, int64_t pos,
                                     int64_t delta) {
  return set_pos_fixed(s, pos, delta, 1, true);
}

extern "C" int64_t stringSetPos_WCS4(const NLSSMHandle *h, NLSString *s, int64_t pos,
                                     int64_t delta) {
  return set_pos_fixed(s, pos, delta, h->unitWidth == 0 ? 4 : h->unitWidth, false);
}

// Surrogate pairs make two-byte text variable-width: it is walked.
extern "C" int64_t stringSetPos_WCS2(const NLSSMHandle *h, NLSString *s, int64_t pos,
                                     int64_t delta) {
  if (h->encodingNumber == NLSSM_ENC_WCS2_BE)
    return set_pos<Wcs2Model<true>, Beyond::kParkOnStep, false>(h, s, pos, delta,
                                                                &NLSNumCharsS_WCS2);
  return set_pos<Wcs2Model<false>, Beyond::kParkOnStep, false>(h, s, pos, delta,
                                                               &NLSNumCharsS_WCS2);
}

extern "C" int64_t stringSetPos_UTF8(const NLSSMHandle *h, NLSString *s, int64_t pos,
                                     int64_t delta) {
  return set_pos<Utf8StepModel, Beyond::kParkOnStep, false>(h, s, pos, delta, &NLSNumCharsS_UTF8);
}

extern "C" int64_t stringSetPos_MBCS_modal(const NLSSMHandle *h, NLSString *s, int64_t pos,
                                           int64_t delta) {
  return set_pos<ModalModel, Beyond::kParkOnStepKeep, true>(h, s, pos, delta,
                                                            &NLSNumCharsS_MBCS_modal);
}

extern "C" int64_t stringSetPos_MBCS_nonmodal(const NLSSMHandle *h, NLSString *s, int64_t pos,
                                              int64_t delta) {
  return set_pos_nonmodal<DbcsModel>(h, s, pos, delta, &NLSNumCharsS_MBCS_nonmodal);
}
extern "C" int64_t stringSetPos_MBCS_nonmodal_EUC_JP(const NLSSMHandle *h, NLSString *s,
                                                     int64_t pos, int64_t delta) {
  return set_pos_nonmodal<EucJpModel>(h, s, pos, delta, &NLSNumCharsS_MBCS_EUC_JP);
}
extern "C" int64_t stringSetPos_MBCS_nonmodal_EUC_TW(const NLSSMHandle *h, NLSString *s,
                                                     int64_t pos, int64_t delta) {
  return set_pos_nonmodal<EucTwModel>(h, s, pos, delta, &NLSNumCharsS_MBCS_EUC_TW);
}
extern "C" int64_t stringSetPos_MBCS_nonmodal_GB18030(const NLSSMHandle *h, NLSString *s,
                                                      int64_t pos, int64_t delta) {
  return set_pos_nonmodal<Gb18030Model>(h, s, pos, delta, &NLSNumCharsS_MBCS_GB18030);
}

// ---- stringCurCharSize ---------------------------------------------------

extern "C" int64_t stringCurCharSize_FixedSize(const NLSSMHandle *h, const NLSString *s) {
  return s->curOffset < 0 ? kNoSize : h->unitWidth;
}

// By the form of the lead byte; continuation and 0xFC-0xFF bytes answer 6.
extern "C" int64_t stringCurCharSize_UTF8(const NLSSMHandle *, const NLSString *s) {
  if (s->curOffset < 0) return kNoSize;
  const uint8_t b = s->buffer[s->curOffset];
  return b < 0x80             ? 1
         : (b & 0xE0) == 0xC0 ? 2
         : (b & 0xF0) == 0xE0 ? 3
         : (b & 0xF8) == 0xF0 ? 4
         : (b & 0xFC) == 0xF8 ? 5
                              : 6;
}

extern "C" int64_t stringCurCharSize_WCS2(const NLSSMHandle *h, const NLSString *s) {
  if (s->curOffset < 0) return kNoSize;
  const uint8_t *p = s->buffer + s->curOffset;
  const int64_t remaining = static_cast<int64_t>(s->length) - s->curOffset;
  return h->encodingNumber == NLSSM_ENC_WCS2_BE ? Wcs2Model<true>().step(p, remaining, 0)
                                                : Wcs2Model<false>().step(p, remaining, 0);
}

extern "C" int64_t stringCurCharSize_MBCS_modal(const NLSSMHandle *, const NLSString *s) {
  if (s->curOffset < 0) return kNoSize;
  return s->charKind == NLSSM_KIND_DOUBLE ? 2 : 1;
}

extern "C" int64_t stringCurCharSize_MBCS_nonmodal(const NLSSMHandle *, const NLSString *s) {
  if (s->curOffset < 0) return kNoSize;
  switch (s->charKind) {
    case NLSSM_KIND_DOUBLE:
      return 2;
    case NLSSM_KIND_THREE:
      return 3;
    case NLSSM_KIND_FOUR:
      return 4;
    default:
      return 1;
  }
}

// ---- One-character size probes -------------------------------------------

extern "C" int64_t getMBCSCharSZ_UCS2L(const NLSSMHandle *h, const NLSString *s, int64_t remaining,
                                       const uint8_t *base) {
  if (remaining > 0 && remaining < 2) return remaining;
  return probe<Wcs2Model<false>>(h, s, remaining, base);
}
extern "C" int64_t getMBCSCharSZ_UCS2B(const NLSSMHandle *h, const NLSString *s, int64_t remaining,
                                       const uint8_t *base) {
  if (remaining > 0 && remaining < 2) return remaining;
  return probe<Wcs2Model<true>>(h, s, remaining, base);
}
extern "C" int64_t getMBCSCharSZ_UTF8(const NLSSMHandle *, const NLSString *s, int64_t remaining,
                                      const uint8_t *base) {
  return probe_table(kUtf8LeadLength, s, remaining, base);
}
extern "C" int64_t getMBCSCharSZ_UTFE(const NLSSMHandle *, const NLSString *s, int64_t remaining,
                                      const uint8_t *base) {
  return probe_table(kSkipUtfe, s, remaining, base);
}
extern "C" int64_t getMBCSCharSZ_EUC_JP(const NLSSMHandle *h, const NLSString *s, int64_t remaining,
                                        const uint8_t *base) {
  return probe<EucJpModel>(h, s, remaining, base);
}
extern "C" int64_t getMBCSCharSZ_EUC_TW(const NLSSMHandle *h, const NLSString *s, int64_t remaining,
                                        const uint8_t *base) {
  return probe<EucTwModel>(h, s, remaining, base);
}
extern "C" int64_t getMBCSCharSZ_GB18030(const NLSSMHandle *h, const NLSString *s,
                                         int64_t remaining, const uint8_t *base) {
  return probe<Gb18030Model>(h, s, remaining, base);
}
extern "C" int64_t getMBCSCharSZ_nonmodal(const NLSSMHandle *h, const NLSString *s,
                                          int64_t remaining, const uint8_t *base) {
  return probe<DbcsModel>(h, s, remaining, base);
}

// A shift sequence measures its own length; a character is two bytes while
// the descriptor's current kind is double-byte.
extern "C" int64_t getMBCSCharSZ_modal(const NLSSMHandle *h, const NLSString *s, int64_t remaining,
                                       const uint8_t *base) {
  if (remaining <= 0) return 0;
  const uint8_t *p = base != nullptr ? base : (s != nullptr ? s->buffer + s->curOffset : nullptr);
  if (p == nullptr) return 0;
  const ModalModel model(h);
  if (model.shift_at(p, remaining) != 0) return model.length;
  const uint32_t state = s != nullptr ? s->charKind : kModalSingle;
  return model.unit(p, remaining, state).size;
}

// ---- Forward position scanners -------------------------------------------

extern "C" int64_t getDBCSPos_modal(const NLSSMHandle *h, const uint8_t *buffer, int64_t length,
                                    int64_t nChars, int64_t startOffset, uint32_t *state) {
  return scan_position<ModalModel>(h, buffer, length, nChars, startOffset, state);
}
extern "C" int64_t getDBCSPos_nonmodal(const NLSSMHandle *h, const uint8_t *buffer, int64_t length,
                                       int64_t nChars, int64_t startOffset, uint32_t *state) {
  return scan_position<DbcsModel>(h, buffer, length, nChars, startOffset, state);
}
extern "C" int64_t getDBCSPos_nonmodal_EUC_JP(const NLSSMHandle *h, const uint8_t *buffer,
                                              int64_t length, int64_t nChars, int64_t startOffset,
                                              uint32_t *state) {
  return scan_position<EucJpModel>(h, buffer, length, nChars, startOffset, state);
}
extern "C" int64_t getDBCSPos_nonmodal_EUC_TW(const NLSSMHandle *h, const uint8_t *buffer,
                                              int64_t length, int64_t nChars, int64_t startOffset,
                                              uint32_t *state) {
  return scan_position<EucTwModel>(h, buffer, length, nChars, startOffset, state);
}
extern "C" int64_t getDBCSPos_nonmodal_GB18030(const NLSSMHandle *h, const uint8_t *buffer,
                                               int64_t length, int64_t nChars, int64_t startOffset,
                                               uint32_t *state) {
  return scan_position<Gb18030Model>(h, buffer, length, nChars, startOffset, state);
}
