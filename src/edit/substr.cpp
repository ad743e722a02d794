// Substring: up to n characters of a source string from its current
// character, copied into a destination string at the destination's current
// offset. Whole characters only: what does not fit is left out and reported
// as 0x803fe807, and a truncated copy is never blank-padded. Source and
// destination may share a buffer.
#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstring>

#include "edit/character_walk.hpp"
#include "edit/modal_text.hpp"

namespace nlssm::edit {
namespace {

using MoveSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                            int64_t *, int64_t);

struct Copy {
  int64_t offset;  // where the destination is written
  int64_t bytes;   // bytes written
  int64_t status;
};

int64_t room_at(const NLSString *dst, int64_t offset) {
  return std::max<int64_t>(0, static_cast<int64_t>(dst->capacity) - offset);
}

// The destination's length covers the copy; an untruncated copy with flag
// bit 0 blank-fills the rest of the buffer (in whole blanks of `unit`
// bytes) and takes its length to there.
void finish_copy(const NLSSMHandle *h, NLSString *dst, const Copy &c, int64_t flags, int64_t unit) {
  if (c.bytes > 0)
    dst->length = std::max<uint64_t>(dst->length, static_cast<uint64_t>(c.offset + c.bytes));
  if (c.status != 0 || (flags & NLSSM_EDIT_PAD) == 0) return;
  const auto length = static_cast<int64_t>(dst->length);
  int64_t fill = std::max<int64_t>(0, static_cast<int64_t>(dst->capacity) - length);
  fill -= fill % unit;
  fill_blanks(h, dst->buffer + length, fill);
  dst->length = static_cast<uint64_t>(length + fill);
}

// Up to n characters of src[0, remaining) that fit in `room` bytes (n of 0
// or less: all). A character that runs past the source's end is not
// copied; the status tells whether the room stopped the walk.
template <class M>
Copy fit_chars(const M &m, const uint8_t *src, int64_t remaining, int64_t room, int64_t n) {
  int64_t off = 0, chars = 0;
  while (off < remaining && (n <= 0 || chars < n)) {
    const int64_t size = m.step(src + off, remaining - off, 0);
    if (off + size > remaining) break;
    if (off + size > room) return {0, off, NLSSM_E_DEST_TOO_SMALL};
    off += size;
    ++chars;
  }
  return {0, off, NLSSM_OK};
}

// The next character's offset after the one at curOffset, or -9.
template <class M>
void set_next_offset(const M &m, NLSString *dst) {
  const auto length = static_cast<int64_t>(dst->length);
  if (dst->curOffset < 0 || dst->curOffset >= length) {
    dst->nextOffset = kUnset;
    return;
  }
  const int64_t next =
      dst->curOffset + m.step(dst->buffer + dst->curOffset, length - dst->curOffset, 0);
  dst->nextOffset = next < length ? next : kUnset;
}

// A destination without a current character that received text starts at
// its first character; the handle's stringSetPos then sets its neighbours
// and kinds.
void reposition(const NLSSMHandle *h, NLSString *dst, const Copy &c) {
  if (dst->curOffset < 0) {
    if (c.bytes == 0) return;
    dst->charIndex = 0;
    dst->curOffset = 0;
    dst->prevOffset = NLSSM_POS_NO_PREVIOUS;
    dst->charKind = dst->nextCharKind = dst->prevKind = 0;
  }
  if (h->stringSetPos != nullptr)
    reinterpret_cast<SetPosFn>(h->stringSetPos)(h, dst, dst->charIndex, 0);
}

int64_t reject(const NLSString *src, NLSString *dst, int64_t *count) {
  store(count, 0);
  if (src == nullptr || dst == nullptr || (dst->buffer == nullptr && dst->capacity != 0))
    return NLSSM_E_NULL_ARGUMENT;
  return NLSSM_OK;
}

bool unusable(const NLSString *src, const NLSString *dst) {
  return src == nullptr || dst == nullptr || src->curOffset < 0 || src->buffer == nullptr ||
         (dst->buffer == nullptr && dst->capacity != 0);
}

// ---- Single-byte and fixed-width text ---------------------------------------

// Single-byte strings take both offsets from charIndex (equal to the byte
// offset there); a destination without room fails at once.
int64_t substr_sbcs(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t n,
                    int64_t *count, int64_t flags) {
  if (unusable(src, dst)) return reject(src, dst, count);
  const auto srcLength = static_cast<int64_t>(src->length);
  const int64_t srcOff = std::clamp<int64_t>(src->charIndex, 0, srcLength);
  const int64_t dstOff = std::max<int64_t>(0, dst->charIndex);
  const int64_t remaining = srcLength - srcOff;
  const int64_t want = n <= 0 || n > remaining ? remaining : n;
  const int64_t room = room_at(dst, dstOff);
  if (room == 0) {
    store(count, 0);
    return NLSSM_E_DEST_TOO_SMALL;
  }
  const Copy c{dstOff, std::min(want, room), want > room ? NLSSM_E_DEST_TOO_SMALL : NLSSM_OK};
  if (c.bytes > 0)
    std::memmove(dst->buffer + dstOff, src->buffer + srcOff, static_cast<size_t>(c.bytes));
  finish_copy(h, dst, c, flags, 1);
  dst->curOffset = dstOff < static_cast<int64_t>(dst->length) ? dstOff : kUnset;
  set_next_offset(cursor::SbcsModel(h), dst);
  store(count, c.bytes);
  return c.status;
}

// Wide text reads at the source's curOffset and writes at the
// destination's (an unset destination is written from its start).
template <int kWidth, class M>
int64_t substr_wide(const NLSSMHandle *h, const M &m, const NLSString *src, NLSString *dst,
                    int64_t n, int64_t *count, int64_t flags) {
  if (unusable(src, dst)) return reject(src, dst, count);
  const Remaining r = remaining_of(src);
  const int64_t dstOff = std::max<int64_t>(0, dst->curOffset);
  const int64_t room = room_at(dst, dstOff) / kWidth * kWidth;
  Copy c = fit_chars(m, r.text, r.bytes, room, n);
  c.offset = dstOff;
  if (c.bytes > 0) std::memmove(dst->buffer + dstOff, r.text, static_cast<size_t>(c.bytes));
  finish_copy(h, dst, c, flags, kWidth);
  if (dst->curOffset < 0 && c.bytes > 0) dst->charIndex = dst->curOffset = 0;
  set_next_offset(m, dst);
  store(count, c.bytes);
  return c.status;
}

// ---- Multi-byte text ------------------------------------------------------------

// The whole remaining source goes through the handle's NLSStringMoveS with
// the padding flag.
int64_t move_rest(const NLSSMHandle *h, const Remaining &r, NLSString *dst, int64_t dstOff,
                  int64_t flags, Copy &c) {
  c = {dstOff, 0, NLSSM_E_UNSUPPORTED};
  if (h->NLSStringMoveS == nullptr) return c.status;
  c.status = reinterpret_cast<MoveSFn>(h->NLSStringMoveS)(h, r.text, r.bytes, dst->buffer + dstOff,
                                                          room_at(dst, dstOff), &c.bytes,
                                                          flags & NLSSM_EDIT_PAD);
  if (c.bytes > 0)
    dst->length = std::max<uint64_t>(dst->length, static_cast<uint64_t>(dstOff + c.bytes));
  if (c.status == 0 && (flags & NLSSM_EDIT_PAD) != 0) dst->length = dst->capacity;
  return c.status;
}

template <class M>
int64_t substr_multibyte(const NLSSMHandle *h, const M &m, const NLSString *src, NLSString *dst,
                         int64_t n, int64_t *count, int64_t flags) {
  const Remaining r = remaining_of(src);
  const int64_t dstOff = std::max<int64_t>(0, dst->curOffset);
  Copy c;
  if (n <= 0) {
    move_rest(h, r, dst, dstOff, flags, c);
  } else {
    c = fit_chars(m, r.text, r.bytes, room_at(dst, dstOff), n);
    c.offset = dstOff;
    if (c.bytes > 0) std::memmove(dst->buffer + dstOff, r.text, static_cast<size_t>(c.bytes));
    finish_copy(h, dst, c, flags, 1);
  }
  if (c.status != NLSSM_E_UNSUPPORTED) reposition(h, dst, c);
  store(count, c.bytes);
  return c.status;
}

// ---- Modal text -------------------------------------------------------------

// Copies whole characters of modal text, shift state balanced: a shift
// sequence at the join when the destination's width before the write
// offset differs from the width of the first character copied, and a
// shift-in after a copy that ends in double-byte width. When that shift-in
// does not fit, double-byte characters are given back first (2 bytes for
// shift sequences shorter than 3 bytes, else 4), never further than the
// start of the last double-byte run.
struct ModalCopy {
  Copy copy;
  int64_t join;
  int64_t chars;
  bool firstDbl;
};

// `srcDbl` and `dstDbl`: the shift states where the copy starts reading and
// writing.
ModalCopy copy_modal(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t dstOff,
                     int64_t n, bool srcDbl, bool dstDbl) {
  const ModalModel m(h);
  const int64_t room = room_at(dst, dstOff);
  const auto srcLength = static_cast<int64_t>(src->length);
  const int64_t from = std::min(src->curOffset, srcLength);
  ModalWalk walk(m, src->buffer, from, srcLength, srcDbl);
  ModalItem item;
  int64_t start = -1, end = 0, runStart = -1, join = 0, chars = 0;
  bool firstDbl = false, endDbl = false, truncated = false;
  while ((n <= 0 || chars < n) && walk.next(item)) {
    if (item.shift != 0) continue;
    if (item.size < (item.dbl ? 2 : 1)) break;
    if (start < 0) {
      start = item.offset;
      firstDbl = item.dbl;
      join = firstDbl != dstDbl ? m.length : 0;
    }
    if (join + item.offset + item.size - start > room) {
      truncated = true;
      break;
    }
    if (item.dbl && (chars == 0 || !endDbl || item.offset != end)) runStart = item.offset;
    end = item.offset + item.size;
    endDbl = item.dbl;
    ++chars;
  }
  if (chars == 0) return {{dstOff, 0, truncated ? NLSSM_E_DEST_TOO_SMALL : NLSSM_OK}, 0, 0, false};
  if (endDbl && join + end - start + m.length > room) {
    truncated = true;
    for (int64_t back = m.length < 3 ? 2 : 4; back > 0 && end > runStart; back -= 2) {
      end -= 2;
      --chars;
    }
    if (end == runStart && runStart == start) {
      endDbl = false;
      join = 0;
      chars = 0;
    } else if (end == runStart) {  // the run is gone: so is the shift-out before it
      end = runStart - m.length;
      endDbl = modal_double_at(m, src->buffer, end);
    }
  }
  uint8_t *out = dst->buffer + dstOff;
  std::memmove(out + join, src->buffer + start, static_cast<size_t>(end - start));
  if (join != 0) put_shift(m, out, firstDbl);
  int64_t bytes = join + end - start;
  if (endDbl) bytes += put_shift(m, out + bytes, false);
  return {{dstOff, bytes, truncated ? NLSSM_E_DEST_TOO_SMALL : NLSSM_OK}, join, chars, firstDbl};
}

int64_t substr_modal(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t n,
                     int64_t *count, int64_t flags) {
  if (unusable(src, dst)) return reject(src, dst, count);
  const ModalModel m(h);
  const int64_t dstOff = std::max<int64_t>(0, dst->curOffset);
  const Remaining r = remaining_of(src);
  // The whole rest goes to the move when both sides are in single-byte
  // width where they meet; otherwise it is copied character by character
  // so that the join gets its shift sequence.
  const bool srcDbl = modal_double_at(m, src->buffer, r.text - src->buffer);
  const bool dstDbl =
      modal_double_at(m, dst->buffer, std::min(dstOff, static_cast<int64_t>(dst->capacity)));
  if (n <= 0 && !srcDbl && !dstDbl) {
    Copy c;
    move_rest(h, r, dst, dstOff, flags, c);
    if (c.status == 0) position_at_start(h, *dst);  // read again from its start
    store(count, c.bytes);
    return c.status;
  }
  const ModalCopy mc = copy_modal(h, src, dst, dstOff, n, srcDbl, dstDbl);
  finish_copy(h, dst, mc.copy, flags, 1);
  if (n <= 0 && mc.copy.status == 0) {
    position_at_start(h, *dst);
  } else if (mc.chars > 0) {
    if (dst->curOffset < 0 && dstOff == 0) dst->charIndex = 0;
    dst->curOffset = dstOff + mc.join;
    dst->charKind = mc.firstDbl ? cursor::kModalDouble : cursor::kModalSingle;
    bool dbl = mc.firstDbl;
    const int64_t next = modal_span(m, dst->buffer, dst->curOffset,
                                    static_cast<int64_t>(dst->length), 1, dbl, nullptr);
    int64_t after = next;
    uint32_t state = dbl ? cursor::kModalDouble : cursor::kModalSingle;
    m.skip_shifts(dst->buffer, after, static_cast<int64_t>(dst->length), state);
    dst->nextOffset = after < static_cast<int64_t>(dst->length) ? after : kUnset;
  }
  store(count, mc.copy.bytes);
  return mc.copy.status;
}

}  // namespace
}  // namespace nlssm::edit

using namespace nlssm::edit;

extern "C" {

int64_t NLSStringSubStr_SBCS(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t n,
                             int64_t *count, int64_t flags) {
  return substr_sbcs(h, src, dst, n, count, flags);
}

// Two-byte text: n counts characters, a surrogate pair being one.
int64_t NLSStringSubStr_WCS2(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t n,
                             int64_t *count, int64_t flags) {
  if (wide_big_endian(h))
    return substr_wide<2>(h, nlssm::cursor::Wcs2Model<true>(h), src, dst, n, count, flags);
  return substr_wide<2>(h, nlssm::cursor::Wcs2Model<false>(h), src, dst, n, count, flags);
}

int64_t NLSStringSubStr_WCS4(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t n,
                             int64_t *count, int64_t flags) {
  return substr_wide<4>(h, nlssm::cursor::FixedModel(h), src, dst, n, count, flags);
}

// UTF-8 and UTF-EBCDIC, and the multi-byte non-modal sets: one rule chosen
// by encoding number.
int64_t NLSStringSubStr_MBCS_UTF8(const NLSSMHandle *h, const NLSString *src, NLSString *dst,
                                  int64_t n, int64_t *count, int64_t flags) {
  if (unusable(src, dst)) return reject(src, dst, count);
  return with_multibyte_model(
      h, [&](const auto &m) { return substr_multibyte(h, m, src, dst, n, count, flags); });
}

int64_t NLSStringSubStr_MBCS(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t n,
                             int64_t *count, int64_t flags) {
  return NLSStringSubStr_MBCS_UTF8(h, src, dst, n, count, flags);
}

int64_t NLSStringSubStr_MBCS_modal(const NLSSMHandle *h, const NLSString *src, NLSString *dst,
                                   int64_t n, int64_t *count, int64_t flags) {
  return substr_modal(h, src, dst, n, count, flags);
}

}  // extern "C"
