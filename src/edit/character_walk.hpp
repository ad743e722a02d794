// What the editing operations share: the character rule of the multi-byte
// non-modal members (chosen by encoding number), walks over whole
// characters, the range a descriptor's operation covers, and blank fills.
#pragma once

#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "cursor/char_model.hpp"
#include "edit/text_model.hpp"
#include "module/out_value.hpp"

namespace nlssm::edit {

inline constexpr int64_t kUnset = NLSSM_POS_NONE;

using cursor::UtfeStepModel;

// Calls fn with the character model of a multi-byte non-modal handle: UTF-8
// (encoding 20), UTF-EBCDIC (the rest of class 1), EUC-JP, EUC-TW, GB18030,
// and the lead-byte flags of every other double-byte set.
template <class Fn>
decltype(auto) with_multibyte_model(const NLSSMHandle *h, Fn &&fn) {
  switch (h->encodingNumber) {
    case NLSSM_ENC_UTF8:
      return fn(cursor::Utf8StepModel(h));
    default:
      if (h->encodingClass == NLSSM_CLASS_UTF8) return fn(UtfeStepModel(h));
      return cursor::with_nonmodal_model(h, fn);
  }
}

// Big-endian two-byte text is encoding 24; big-endian four-byte text is 26.
inline bool wide_big_endian(const NLSSMHandle *h) {
  return h->encodingNumber == (h->encodingClass == NLSSM_CLASS_WCS4 ? 26u : NLSSM_ENC_WCS2_BE);
}

// Bytes of the character at p, never more than remain.
template <class M>
int64_t whole_char(const M &m, const uint8_t *p, int64_t remaining) {
  return std::min(m.step(p, remaining, 0), remaining);
}

// Bytes taken by the first `limit` characters of p[0, length) (all of them
// when limit is 0 or less); their count through `chars`.
template <class M>
int64_t span_of(const M &m, const uint8_t *p, int64_t length, int64_t limit, int64_t *chars) {
  int64_t off = 0, count = 0;
  while (off < length && (limit <= 0 || count < limit)) {
    off += whole_char(m, p + off, length - off);
    ++count;
  }
  if (chars != nullptr) *chars = count;
  return off;
}

// The text a plain operation works on: from the current character to the
// end; empty when the descriptor is unset or its offset lies outside.
struct Remaining {
  uint8_t *text;
  int64_t bytes;
};

inline Remaining remaining_of(const NLSString *s) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return {nullptr, 0};
  const auto length = static_cast<int64_t>(s->length);
  if (s->curOffset >= length) return {s->buffer + length, 0};
  return {s->buffer + s->curOffset, length - s->curOffset};
}

// Fills `bytes` bytes with the handle's blank, whole blanks first; a tail
// shorter than a blank gets the blank's first bytes.
inline void fill_blanks(const NLSSMHandle *h, uint8_t *p, int64_t bytes) {
  if (bytes <= 0) return;
  const int64_t whole = pad_blanks(p, bytes, Blank(h));
  std::memcpy(p + whole, h->blankChar, static_cast<size_t>(bytes - whole));
}

using SetPosFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);

// A descriptor over text at its start: character 0 current, positioned
// through the handle's stringSetPos (except four-byte text, whose first
// character needs no walk).
inline void position_at_start(const NLSSMHandle *h, NLSString &d) {
  const auto length = static_cast<int64_t>(d.length);
  d.charIndex = 0;
  d.curOffset = length == 0 ? cursor::kNone : 0;
  if (h->encodingClass == NLSSM_CLASS_SBCS) return;
  d.nextOffset = static_cast<int64_t>(h->unitWidth) >= length ? cursor::kNone
                                                              : static_cast<int64_t>(h->unitWidth);
  d.prevOffset = cursor::kNoPrevious;
  d.charKind = d.nextCharKind = d.prevKind = 0;
  if (h->encodingClass != NLSSM_CLASS_WCS4 && length != 0 && h->stringSetPos != nullptr)
    reinterpret_cast<SetPosFn>(h->stringSetPos)(h, &d, 0, 0);
}

inline NLSString descriptor_over(const NLSSMHandle *h, const uint8_t *text, uint64_t length,
                                 uint64_t capacity) {
  NLSString d{};
  d.buffer = const_cast<uint8_t *>(text);
  d.length = length;
  d.capacity = capacity;
  position_at_start(h, d);
  return d;
}

using module::store;

}  // namespace nlssm::edit
