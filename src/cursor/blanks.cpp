// Blank padding and all-blank tests in every class.
#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstring>

#include "cursor/char_model.hpp"
#include "module/out_value.hpp"

namespace nlssm::cursor {
namespace {

using module::store;

// Fills `count` bytes with whole blanks of `width` bytes.
void fill_blanks(uint8_t *p, int64_t count, const uint8_t *blank, int64_t width) {
  if (width == 1) {
    std::memset(p, blank[0], static_cast<size_t>(count));
    return;
  }
  for (int64_t off = 0; off + width <= count; off += width)
    std::memcpy(p + off, blank, static_cast<size_t>(width));
}

bool all_blank(const uint8_t *p, int64_t n, const uint8_t *blank, int64_t width) {
  if (n % width != 0) return false;
  for (int64_t off = 0; off < n; off += width)
    if (std::memcmp(p + off, blank, static_cast<size_t>(width)) != 0) return false;
  return true;
}

// The byte-oriented pad of the descriptor forms: from the current character
// (or the end of the text), `byteCount` bytes or up to the capacity, in
// whole units of `unit` bytes.
struct PadPlan {
  int64_t from;
  int64_t count;
  int64_t status;
};

PadPlan plan_pad(const NLSString *s, int64_t byteCount, int64_t unit) {
  const int64_t from = s->curOffset >= 0 ? s->curOffset : static_cast<int64_t>(s->length);
  const int64_t room = std::max<int64_t>(0, static_cast<int64_t>(s->capacity) - from);
  int64_t count = room;
  int64_t status = 0;
  if (byteCount > 0) {
    count = std::min(byteCount, room);
    if (byteCount > room) status = kDestTooSmall;
  } else if (byteCount < 0) {
    count = 0;
  }
  count -= count % unit;
  if (count <= 0) return {from, 0, kDestTooSmall};
  return {from, count, status};
}

void finish_pad(NLSString *s, const PadPlan &plan, int64_t step) {
  s->length = std::max<uint64_t>(s->length, static_cast<uint64_t>(plan.from + plan.count));
  s->curOffset = plan.from;
  if (plan.count > step) s->nextOffset = plan.from + step;
}

// Shift state at `offset` of modal text: double-byte or not.
bool modal_double_at(const ModalModel &m, const uint8_t *p, int64_t offset) {
  uint32_t state = kModalSingle;
  int64_t off = 0;
  for (;;) {
    m.skip_shifts(p, off, offset, state);
    if (off >= offset) return modal_double(state);
    const int64_t size = m.step(p + off, offset - off, state);
    state = m.kind(size, state);
    off += size;
  }
}

// Every character of modal text is a blank: the blank byte, twice in
// double-byte state; shift sequences are not characters.
bool modal_all_blank(const ModalModel &m, const uint8_t *p, int64_t n, uint8_t blank,
                     uint32_t state) {
  int64_t off = 0;
  for (;;) {
    m.skip_shifts(p, off, n, state);
    if (off >= n) return true;
    const Unit u = m.unit(p + off, n - off, state);
    if (u.broken) return false;
    for (int64_t k = 0; k < u.size; ++k)
      if (p[off + k] != blank) return false;
    state = m.kind(u.size, state);
    off += u.size;
  }
}

}  // namespace
}  // namespace nlssm::cursor

using namespace nlssm::cursor;

// ---- NLSBlankPad ---------------------------------------------------------

extern "C" int64_t NLSBlankPad(const NLSSMHandle *h, int64_t byteCount, NLSString *s, int64_t,
                               int64_t *written) {
  store(written, 0);
  if (s == nullptr || s->buffer == nullptr) return kNullArgument;
  const PadPlan plan = plan_pad(s, byteCount, 1);
  if (plan.count == 0) return plan.status;
  std::memset(s->buffer + plan.from, h->blankChar[0], static_cast<size_t>(plan.count));
  store(written, plan.count);
  finish_pad(s, plan, 1);
  if (h->encodingClass == NLSSM_CLASS_MBCS_NONMODAL) {
    s->charKind = NLSSM_KIND_SINGLE;
    if (plan.count > 1) s->nextCharKind = NLSSM_KIND_SINGLE;
  }
  return plan.status;
}

// Pads from the character index (one byte per character) and always runs
// to the capacity when no count is given.
extern "C" int64_t NLSBlankPad_SBCS(const NLSSMHandle *h, int64_t byteCount, NLSString *s, int64_t,
                                    int64_t *written) {
  store(written, 0);
  if (s == nullptr || s->buffer == nullptr) return kNullArgument;
  const int64_t from = std::max<int64_t>(0, s->charIndex);
  const int64_t room = std::max<int64_t>(0, static_cast<int64_t>(s->capacity) - from);
  int64_t count = byteCount;
  int64_t status = 0;
  if (byteCount == 0) {
    s->length = s->capacity;
    count = room;
    if (count == 0) return kDestTooSmall;
  } else if (byteCount > room) {
    count = room;
    s->length = s->capacity;
    status = kDestTooSmall;
  } else if (byteCount < 0) {
    count = 0;
  }
  if (count > 0) std::memset(s->buffer + from, h->blankChar[0], static_cast<size_t>(count));
  if (status == 0 && count > 0)
    s->length = std::max<uint64_t>(s->length, static_cast<uint64_t>(from + count));
  store(written, count);
  s->curOffset = from;
  return status;
}

extern "C" int64_t NLSBlankPad_WCS(const NLSSMHandle *h, int64_t byteCount, NLSString *s, int64_t,
                                   int64_t *written) {
  store(written, 0);
  if (s == nullptr || s->buffer == nullptr) return kNullArgument;
  const int64_t width = blank_width(h);
  const PadPlan plan = plan_pad(s, byteCount, width);
  if (plan.count == 0) return plan.status;
  fill_blanks(s->buffer + plan.from, plan.count, h->blankChar, width);
  store(written, plan.count);
  finish_pad(s, plan, width);
  return plan.status;
}

// Continues in the shift state the text is in where padding starts: single
// blanks, or double-byte blanks (the blank byte twice) in whole pairs.
extern "C" int64_t NLSBlankPad_MBCS_modal(const NLSSMHandle *h, int64_t byteCount, NLSString *s,
                                          int64_t, int64_t *written) {
  store(written, 0);
  if (s == nullptr || s->buffer == nullptr) return kNullArgument;
  const ModalModel model(h);
  const int64_t from = s->curOffset >= 0 ? s->curOffset : static_cast<int64_t>(s->length);
  const bool wide = modal_double_at(model, s->buffer, std::min<int64_t>(from, s->length));
  const int64_t width = wide ? 2 : 1;
  const PadPlan plan = plan_pad(s, byteCount, width);
  if (plan.count == 0) return plan.status;
  std::memset(s->buffer + plan.from, h->blankChar[0], static_cast<size_t>(plan.count));
  store(written, plan.count);
  finish_pad(s, plan, width);
  s->charKind = wide ? kModalDouble : kModalSingle;
  if (plan.count > width) s->nextCharKind = s->charKind;
  return plan.status;
}

// ---- NLSBlankPadS --------------------------------------------------------

// Fills byteCount bytes with the one-byte blank; `emptyStatus` answers a
// destination with no room, where the members differ.
static int64_t pad_single_byte_blanks(const NLSSMHandle *h, uint8_t *p, int64_t byteCount,
                                      int64_t *written, int64_t emptyStatus) {
  store(written, 0);
  if (byteCount <= 0) return emptyStatus;
  if (p == nullptr) return kNullArgument;
  std::memset(p, h->blankChar[0], static_cast<size_t>(byteCount));
  store(written, byteCount);
  return 0;
}

extern "C" int64_t NLSBlankPadS(const NLSSMHandle *h, uint8_t *p, int64_t byteCount, int64_t,
                                int64_t *written) {
  return pad_single_byte_blanks(h, p, byteCount, written, kDestTooSmall);
}

// An empty destination is nothing to pad, and no error, for single-byte text.
extern "C" int64_t NLSBlankPadS_SBCS(const NLSSMHandle *h, uint8_t *p, int64_t byteCount, int64_t,
                                     int64_t *written) {
  return pad_single_byte_blanks(h, p, byteCount, written, 0);
}

extern "C" int64_t NLSBlankPadS_WCS(const NLSSMHandle *h, uint8_t *p, int64_t byteCount, int64_t,
                                    int64_t *written) {
  store(written, 0);
  const int64_t width = blank_width(h);
  const int64_t count = byteCount > 0 ? byteCount - byteCount % width : 0;
  if (count <= 0) return kDestTooSmall;
  if (p == nullptr) return kNullArgument;
  fill_blanks(p, count, h->blankChar, width);
  store(written, count);
  return 0;
}

// ---- NLSAllBlanks --------------------------------------------------------

extern "C" int64_t NLSAllBlanks(const NLSSMHandle *h, const NLSString *s) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return 0;
  const int64_t n = static_cast<int64_t>(s->length) - s->curOffset;
  if (n <= 0) return 0;
  return all_blank(s->buffer + s->curOffset, n, h->blankChar, 1) ? 1 : 0;
}

// Nothing left after the current character counts as all blanks here.
extern "C" int64_t NLSAllBlanks_SBCS(const NLSSMHandle *h, const NLSString *s) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return 0;
  const int64_t n = static_cast<int64_t>(s->length) - s->curOffset;
  if (n <= 0) return 1;
  return all_blank(s->buffer + s->curOffset, n, h->blankChar, 1) ? 1 : 0;
}

extern "C" int64_t NLSAllBlanks_WCS(const NLSSMHandle *h, const NLSString *s) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return 0;
  const int64_t n = static_cast<int64_t>(s->length) - s->curOffset;
  if (n <= 0) return 0;
  return all_blank(s->buffer + s->curOffset, n, h->blankChar, blank_width(h)) ? 1 : 0;
}

extern "C" int64_t NLSAllBlanks_MBCS_modal(const NLSSMHandle *h, const NLSString *s) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return 0;
  const int64_t n = static_cast<int64_t>(s->length) - s->curOffset;
  if (n <= 0) return 0;
  const uint32_t state = modal_double(s->charKind) ? kModalDouble : kModalSingle;
  return modal_all_blank(ModalModel(h), s->buffer + s->curOffset, n, h->blankChar[0], state) ? 1
                                                                                             : 0;
}

// ---- NLSAllBlanksS -------------------------------------------------------

extern "C" int64_t NLSAllBlanksS(const NLSSMHandle *h, const uint8_t *p, int64_t n) {
  if (p == nullptr || n <= 0) return 0;
  return all_blank(p, n, h->blankChar, 1) ? 1 : 0;
}

extern "C" int64_t NLSAllBlanksS_SBCS(const NLSSMHandle *h, const uint8_t *p, int64_t n) {
  if (p == nullptr || n < 0) return 0;
  return all_blank(p, n, h->blankChar, 1) ? 1 : 0;
}

extern "C" int64_t NLSAllBlanksS_WCS(const NLSSMHandle *h, const uint8_t *p, int64_t n) {
  if (p == nullptr || n <= 0) return 0;
  return all_blank(p, n, h->blankChar, blank_width(h)) ? 1 : 0;
}

extern "C" int64_t NLSAllBlanksS_MBCS_modal(const NLSSMHandle *h, const uint8_t *p, int64_t n) {
  if (p == nullptr || n <= 0) return 0;
  return modal_all_blank(ModalModel(h), p, n, h->blankChar[0], kModalSingle) ? 1 : 0;
}
