// Positioning over a character model: find the n-th character from a known
// character start, with its neighbours and kinds, and the descriptor
// updates of stringSetPos and stringNextChar that every class shares.
#pragma once

#include <nlssm/nlssm.h>

#include "cursor/char_model.hpp"

namespace nlssm::cursor {

// A character start whose index and shift state are known.
struct Anchor {
  int64_t index;
  int64_t offset;
  uint32_t state;  // modal: kind of the character there (its shift state)
  int64_t prev;    // offset of the character before it, or -1
  uint32_t prevKind;
};

struct Located {
  bool found;
  int64_t count;  // not found: the number of characters in the text
  int64_t cur, prev, next;
  uint32_t curKind, prevKind, nextKind;
};

// Walks from `from` to character `target` (an index not below the
// anchor's). Shift sequences are skipped; a character whose size runs past
// the end is still a character (it is the last one).
template <class M>
Located locate(const M &m, const uint8_t *b, int64_t length, Anchor from, int64_t target) {
  int64_t index = from.index;
  int64_t off = from.offset;
  uint32_t state = from.state;
  int64_t prev = from.prev;
  uint32_t prevKind = from.prevKind;
  for (;;) {
    m.skip_shifts(b, off, length, state);
    if (off >= length) return {false, index, kNone, prev, kNone, 0, prevKind, 0};
    const int64_t size = m.step(b + off, length - off, state);
    const uint32_t kind = m.kind(size, state);
    if (index == target) {
      int64_t next = off + size;
      uint32_t nextState = kind;
      uint32_t nextKind = 0;
      if (next < length) m.skip_shifts(b, next, length, nextState);
      if (next >= length) {
        next = kNone;
      } else {
        nextKind = m.kind(m.step(b + next, length - next, nextState), nextState);
      }
      return {true, 0, off, prev, next, kind, prevKind, nextKind};
    }
    prev = off;
    prevKind = kind;
    state = kind;
    off += size;
    ++index;
  }
}

// The start of the text: index 0, single-byte shift state.
inline Anchor text_start() {
  return {0, 0, kModalSingle, kNoPrevious, 0};
}

// The best known character start at or before `target - 1` (so that the
// walk meets the previous character), from the descriptor's cached cursor;
// the text start otherwise. Cached offsets are trusted only when they are
// ordered and, in modal text, carry a shift state.
template <class M>
Anchor choose_anchor(const NLSString &s, int64_t target) {
  const auto length = static_cast<int64_t>(s.length);
  if (s.curOffset < 0 || s.curOffset >= length || s.charIndex < 0) return text_start();
  auto known_state = [](uint32_t kind) {
    return !M::kModal || kind == kModalSingle || kind == kModalDouble;
  };
  const bool at_start = s.charIndex == 0 && s.curOffset == 0;
  if (s.charIndex < target && (at_start || known_state(s.charKind)))
    return {s.charIndex, s.curOffset, at_start && s.charKind == 0 ? kModalSingle : s.charKind,
            kNoPrevious, 0};
  const bool prev_known = s.charIndex >= 1 && s.prevOffset >= 0 && s.prevOffset < s.curOffset &&
                          known_state(s.prevKind);
  if (prev_known && s.charIndex == target)
    return {s.charIndex - 1, s.prevOffset, s.prevKind, kNoPrevious, 0};
  return text_start();
}

// What a target past the end does to the descriptor.
enum class Beyond {
  kParkOnStep,      // park on a single step or at the count, else only charIndex = t
  kParkAlways,      // always park
  kParkOnStepKeep,  // park on a single step or at the count, else leave it
};

using CountFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t, int64_t *);

// The character count of the whole text, through the handle's NLSNumCharsS
// slot (so UTF-EBCDIC handles count by their own rule), or `fn` when the
// slot is empty.
inline int64_t count_with(CountFn fn, const NLSSMHandle *h, const NLSString &s) {
  int64_t count = 0;
  if (h->NLSNumCharsS != nullptr) fn = reinterpret_cast<CountFn>(h->NLSNumCharsS);
  fn(h, s.buffer, static_cast<int64_t>(s.length), 0, &count);
  return count;
}

// stringSetPos over a variable-width model. kKinds: the class keeps kinds
// (or modal shift states) in the descriptor.
template <class M, Beyond kBeyond, bool kKinds>
int64_t set_pos(const NLSSMHandle *h, NLSString *s, int64_t pos, int64_t delta, CountFn count_fn) {
  if (pos == kCurrent) {
    pos = s->charIndex;
  } else if (pos == kLast) {
    pos = count_with(count_fn, h, *s) - 1;
  }
  const int64_t target = pos + delta;
  if (target < 0) return kOutside;
  const M model(h);
  const auto length = static_cast<int64_t>(s->length);
  const Located r = locate(model, s->buffer, length, choose_anchor<M>(*s, target), target);
  if (r.found) {
    s->charIndex = target;
    s->curOffset = r.cur;
    s->prevOffset = r.prev;
    s->nextOffset = r.next;
    if constexpr (kKinds) {
      s->charKind = r.curKind;
      s->nextCharKind = r.nextKind;
      s->prevKind = r.prevKind;
    }
    return target;
  }
  const bool park = kBeyond == Beyond::kParkAlways || delta == 1 || target == r.count;
  if (!park) {
    if constexpr (kBeyond == Beyond::kParkOnStep) s->charIndex = target;
    return kOutside;
  }
  if (kBeyond != Beyond::kParkOnStepKeep || s->curOffset >= 0) s->charIndex = r.count;
  s->curOffset = kNone;
  s->nextOffset = kNone;
  s->prevOffset = r.prev;
  if constexpr (kKinds) {
    s->charKind = 0;
    s->nextCharKind = 0;
    s->prevKind = kBeyond == Beyond::kParkOnStepKeep ? r.prevKind : 0;
  }
  return kOutside;
}

}  // namespace nlssm::cursor
