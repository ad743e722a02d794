// Shift-out/shift-in text for the editing operations: the shift state at an
// offset, a walk that yields shift sequences and characters one by one, and
// the writing of shift sequences.
#pragma once

#include <nlssm/nlssm.h>

#include <cstdint>
#include <cstring>

#include "cursor/char_model.hpp"

namespace nlssm::edit {

using cursor::ModalModel;

// One item of modal text: a shift sequence (shift +1 out, -1 in) or a
// character of `size` bytes in the width the state gives it.
struct ModalItem {
  int64_t offset;
  int64_t size;
  int shift;
  bool dbl;  // the state after the item: double-byte width
};

class ModalWalk {
 public:
  ModalWalk(const ModalModel &m, const uint8_t *text, int64_t from, int64_t end, bool dbl)
      : m_(m), text_(text), off_(from), end_(end), dbl_(dbl) {}

  bool next(ModalItem &item) {
    if (off_ >= end_) return false;
    const int shift = m_.shift_at(text_ + off_, end_ - off_);
    if (shift != 0) {
      dbl_ = shift > 0;
      item = {off_, m_.length, shift, dbl_};
    } else {
      int64_t size = dbl_ ? 2 : 1;
      if (size > end_ - off_) size = end_ - off_;
      item = {off_, size, 0, dbl_};
    }
    off_ += item.size;
    return true;
  }
  int64_t offset() const { return off_; }
  bool dbl() const { return dbl_; }

 private:
  const ModalModel &m_;
  const uint8_t *text_;
  int64_t off_, end_;
  bool dbl_;
};

// The shift state in force at `offset`: the text is read from its start in
// single-byte width.
inline bool modal_double_at(const ModalModel &m, const uint8_t *text, int64_t offset) {
  ModalWalk walk(m, text, 0, offset, false);
  ModalItem item;
  while (walk.next(item)) {
  }
  return walk.dbl();
}

// Writes the shift-out (dbl) or shift-in sequence at p; its length.
inline int64_t put_shift(const ModalModel &m, uint8_t *p, bool dbl) {
  std::memcpy(p, dbl ? m.shift_out : m.shift_in, static_cast<size_t>(m.length));
  return m.length;
}

// Offset past the first `limit` characters from `from` (all when limit is 0
// or less), shift sequences included; their count through `chars` and the
// state at the end through `dbl`.
inline int64_t modal_span(const ModalModel &m, const uint8_t *text, int64_t from, int64_t end,
                          int64_t limit, bool &dbl, int64_t *chars) {
  ModalWalk walk(m, text, from, end, dbl);
  ModalItem item;
  int64_t count = 0, stop = from;
  while ((limit <= 0 || count < limit) && walk.next(item)) {
    stop = walk.offset();
    dbl = item.dbl;
    if (item.shift == 0) ++count;
  }
  if (chars != nullptr) *chars = count;
  return stop;
}

}  // namespace nlssm::edit
