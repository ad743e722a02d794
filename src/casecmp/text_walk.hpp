// Walking text character by character for the search, LIKE and
// classification families: a character is its bytes plus, in modal text,
// whether it stands in double-byte mode; shift sequences are not
// characters. The character models are those of the cursor, so a search
// sees exactly the characters the cursor steps over.
#pragma once

#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <type_traits>

#include "cursor/char_model.hpp"

namespace nlssm::casecmp {

using cursor::kModalSingle;

using UtfeModel = cursor::UtfeStepModel;

// One character: where it starts, its bytes (never past the end of the
// text) and, in modal text, whether it is a double-byte character.
struct Char {
  int64_t offset;
  int64_t size;
  bool shifted;
};

inline bool same_char(const uint8_t *a, Char ca, const uint8_t *b, Char cb) {
  return ca.size == cb.size && ca.shifted == cb.shifted &&
         std::memcmp(a + ca.offset, b + cb.offset, static_cast<size_t>(ca.size)) == 0;
}

// A forward cursor over text [0, end) of `base`, always on a character
// start (shift sequences already passed) or at the end.
template <class M>
class Walk {
 public:
  Walk(const M &model, const uint8_t *base, int64_t end, int64_t offset = 0,
       uint32_t state = kModalSingle)
      : m_(&model), base_(base), end_(end), off_(offset), state_(state) {
    settle();
  }

  bool done() const { return off_ >= end_; }
  int64_t offset() const { return off_; }
  uint32_t state() const { return state_; }
  const uint8_t *base() const { return base_; }
  Char current() const {
    const int64_t size = m_->step(base_ + off_, end_ - off_, state_);
    return {off_, std::min(size, end_ - off_), M::kModal && cursor::modal_double(state_)};
  }
  void next() {
    const Char c = current();
    if constexpr (M::kModal) state_ = m_->kind(c.size, state_);
    off_ += c.size;
    settle();
  }
  // Moves over `bytes` known to hold whole characters (stateless text).
  void skip_bytes(int64_t bytes) { off_ += bytes; }
  // Moves to the character start at or after `target`; counts the
  // characters passed into `index`.
  void advance_to(int64_t target, int64_t &index) {
    while (off_ < target && !done()) {
      next();
      ++index;
    }
  }

 private:
  void settle() {
    if constexpr (M::kModal) m_->skip_shifts(base_, off_, end_, state_);
  }

  const M *m_;
  const uint8_t *base_;
  int64_t end_;
  int64_t off_;
  uint32_t state_;
};

// Bytes taken by the first `chars` characters of text [0, end) (all of
// them when chars <= 0), up to the end of the last one; their count goes to
// `count` when given.
template <class M>
int64_t span_of(const M &m, const uint8_t *base, int64_t end, int64_t chars, uint32_t state,
                int64_t *count = nullptr) {
  Walk<M> w(m, base, end, 0, state);
  int64_t n = 0;
  int64_t last_end = 0;
  while (!w.done() && (chars <= 0 || n < chars)) {
    const Char c = w.current();
    last_end = c.offset + c.size;
    w.next();
    ++n;
  }
  if (count != nullptr) *count = n;
  return last_end;
}

// A length for raw buffers whose length counts characters: the walk may go
// as far as the characters reach.
inline constexpr int64_t kUnbounded = INT64_MAX / 4;

// The shift state a descriptor's current character stands in (modal text
// keeps it in charKind); single-byte otherwise.
inline uint32_t descriptor_state(const NLSString &s) {
  return cursor::modal_double(s.charKind) ? cursor::kModalDouble : kModalSingle;
}

// Calls fn(model) with the character model of the handle's encoding, for
// the members that serve several encodings and choose by the handle's
// fields: UTF-8 or UTF-EBCDIC (encoding 20 is UTF-8); WCS2 in either byte
// order (encoding 24 is big-endian); the double-byte pages, EUC-JP, EUC-TW
// or GB18030.
template <class Fn>
decltype(auto) with_utf_model(const NLSSMHandle *h, Fn &&fn) {
  if (h->encodingNumber == NLSSM_ENC_UTF8) return fn(cursor::Utf8StepModel(h));
  return fn(UtfeModel(h));
}

template <class Fn>
decltype(auto) with_wcs2_model(const NLSSMHandle *h, Fn &&fn) {
  if (h->encodingNumber == NLSSM_ENC_WCS2_BE) return fn(cursor::Wcs2Model<true>(h));
  return fn(cursor::Wcs2Model<false>(h));
}

// The model type a dispatcher hands to its function.
#define NLSSM_MODEL_OF(m) std::remove_cvref_t<decltype(m)>

// The text of a descriptor from its current character: none when the
// descriptor has no current character.
struct TextSpan {
  const uint8_t *p = nullptr;
  int64_t n = 0;
  uint32_t state = kModalSingle;
  bool valid = false;
};

inline TextSpan from_current(const NLSString *s) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return {};
  const auto length = static_cast<int64_t>(s->length);
  const int64_t n = s->curOffset < length ? length - s->curOffset : 0;
  return {s->buffer + s->curOffset, n, descriptor_state(*s), true};
}

}  // namespace nlssm::casecmp
