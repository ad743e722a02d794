// Move: copy text into a fixed-size destination. What fits is copied in
// whole characters; a destination too small gives 0x803fe807 and is not
// padded; a move that fits pads the rest of the destination with blanks when
// flag bit 0 asks for it.
#include "edit/move.hpp"

#include <limits>

namespace nlssm::edit {
namespace {

constexpr int64_t kUnbounded = std::numeric_limits<int64_t>::max() / 8;

// Source bytes of a fixed-width move: with the character flag the length
// counts units, otherwise it is cut to whole units.
int64_t unit_bytes(int64_t length, int64_t width, uint32_t flags) {
  if (length <= 0) return 0;
  if (flags & NLSSM_EDIT_SOURCE_IN_CHARS) return std::min(length, kUnbounded) * width;
  return length - length % width;
}

template <int kWidth, class T>
MoveResult move_units(const NLSSMHandle *h, const T &text, const uint8_t *src, int64_t srcLen,
                      uint8_t *dst, int64_t dstLen, uint32_t flags) {
  const int64_t want = unit_bytes(srcLen, kWidth, flags);
  const int64_t room = dstLen > 0 ? dstLen - dstLen % kWidth : 0;
  int64_t n = std::min(want, room);
  if constexpr (kWidth == 2) {
    // A surrogate pair cut by the end of the room is left out whole.
    if (n < want && n >= 2 && text.item(src + n - 2, 4, false).size == 4) n -= 2;
  }
  copy_bytes(src, dst, n);
  const bool truncated = n < want;
  if (!truncated && (flags & NLSSM_EDIT_PAD)) pad_blanks(dst + n, room - n, Blank(h));
  return {truncated ? kTooSmall : kOk, n, n / kWidth};
}

// The variable-width non-modal classes. Double-byte members (kDbcs) pad with
// the byte 0x20 whatever the encoding's blank, and report a short
// destination only when something was copied.
template <bool kDbcs, class T>
MoveResult move_chars(const NLSSMHandle *h, const T &text, const uint8_t *src, int64_t srcLen,
                      uint8_t *dst, int64_t dstLen, uint32_t flags, bool wantChars) {
  const int64_t want = flags & NLSSM_EDIT_SOURCE_IN_CHARS
                           ? bytes_of_chars(text, src, std::max<int64_t>(srcLen, 0), kUnbounded)
                           : std::max<int64_t>(srcLen, 0);
  const int64_t room = std::max<int64_t>(dstLen, 0);
  int64_t n = 0, chars = 0;
  if (want <= room && !wantChars) {
    n = want;  // everything fits: no character can be split
  } else {
    const int64_t limit = std::min(want, room);
    if (!wantChars) n = text.boundary_before(src, limit);
    while (n < want) {
      const int64_t size = text.item(src + n, want - n, false).size;
      if (n + size > limit) break;
      n += size;
      ++chars;
    }
  }
  copy_bytes(src, dst, n);
  const bool truncated = n < want;
  int64_t status = truncated ? kTooSmall : kOk;
  if (kDbcs && n == 0) status = kOk;
  if (!truncated && (flags & NLSSM_EDIT_PAD))
    pad_blanks(dst + n, room - n, kDbcs ? Blank(uint8_t{0x20}) : Blank(h));
  return {status, n, chars};
}

MoveResult move_modal(const NLSSMHandle *h, const uint8_t *src, int64_t srcLen, uint8_t *dst,
                      int64_t dstLen, uint32_t flags) {
  const ModalText text(h);
  const int64_t shift = text.shift_length();
  const int64_t want = flags & NLSSM_EDIT_SOURCE_IN_CHARS
                           ? bytes_of_chars(text, src, std::max<int64_t>(srcLen, 0), kUnbounded)
                           : std::max<int64_t>(srcLen, 0);
  const int64_t room = std::max<int64_t>(dstLen, 0);
  const int64_t scan = std::min(want, room);
  int64_t status = want > room ? kTooSmall : kOk;

  // Walk whole items of the scanned length, following the shift state.
  int64_t start = 0, end = 0, runStart = 0, chars = 0;
  bool dbl = false;
  if (scan > 0 && text.item(src, scan, false).shift < 0) start = end = shift;  // leading shift-in
  while (end < scan) {
    const Item it = text.item(src + end, scan - end, dbl);
    if (it.shift == 0 && dbl && scan - end < 2) break;  // half a double-byte character
    if (it.shift != 0) {
      dbl = it.shift > 0;
      if (dbl) runStart = end + it.size;
    } else {
      ++chars;
    }
    end += it.size;
  }
  if (src == dst && !(flags & NLSSM_EDIT_PAD) && !dbl) return {status, end, chars};

  if (dbl) {
    // Give back double-byte characters until the closing shift-in fits; a
    // shift-out left with nothing behind it goes too.
    while (end > runStart && end + shift > room) {
      end -= 2;
      --chars;
      status = kTooSmall;
    }
    if (end == runStart) {
      end -= shift;
      dbl = false;
    }
  }
  copy_bytes(src + start, dst, end - start);
  int64_t bytes = end - start;
  if (dbl) {
    std::memcpy(dst + bytes, text.model.shift_in, static_cast<size_t>(shift));
    bytes += shift;
  }
  if (status == kOk && (flags & NLSSM_EDIT_PAD)) pad_blanks(dst + bytes, room - bytes, Blank(h));
  return {status, bytes, chars};
}

// Arguments shared by every member; null buffers with something to move are
// caller errors.
bool bad_buffers(const uint8_t *src, int64_t srcLen, const uint8_t *dst, int64_t dstLen) {
  return (src == nullptr && srcLen > 0) || (dst == nullptr && dstLen > 0);
}

int64_t finish(const MoveResult &r, int64_t *bytesWritten, int64_t *charsWritten) {
  store(bytesWritten, r.bytes);
  store(charsWritten, r.chars);
  return r.status;
}

}  // namespace

MoveResult move_text(const NLSSMHandle *h, MoveKind kind, const uint8_t *src, int64_t srcLen,
                     uint8_t *dst, int64_t dstLen, uint32_t flags, bool wantChars) {
  switch (kind) {
    case MoveKind::kSbcs:
      return move_units<1>(h, SbcsText(h), src, srcLen, dst, dstLen, flags);
    case MoveKind::kWcs2:
      return h->encodingNumber == NLSSM_ENC_WCS2_BE
                 ? move_units<2>(h, Wcs2Text<true>(h), src, srcLen, dst, dstLen, flags)
                 : move_units<2>(h, Wcs2Text<false>(h), src, srcLen, dst, dstLen, flags);
    case MoveKind::kWcs4:
      return move_units<4>(h, Wcs4Text(h), src, srcLen, dst, dstLen, flags);
    case MoveKind::kUtf:
      return h->encodingNumber == NLSSM_ENC_UTF8
                 ? move_chars<false>(h, Utf8Text(h), src, srcLen, dst, dstLen, flags, wantChars)
                 : move_chars<false>(h, UtfeText(h), src, srcLen, dst, dstLen, flags, wantChars);
    case MoveKind::kModal:
      return move_modal(h, src, srcLen, dst, dstLen, flags);
    case MoveKind::kDbcs:
      return move_chars<true>(h, DbcsText(h), src, srcLen, dst, dstLen, flags, wantChars);
    case MoveKind::kEucJp:
      return move_chars<true>(h, EucJpText(h), src, srcLen, dst, dstLen, flags, wantChars);
    case MoveKind::kEucTw:
      return move_chars<true>(h, EucTwText(h), src, srcLen, dst, dstLen, flags, wantChars);
    case MoveKind::kGb18030:
      return move_chars<true>(h, Gb18030Text(h), src, srcLen, dst, dstLen, flags, wantChars);
  }
  return {};
}

MoveKind move_kind(const NLSSMHandle *h) {
  const uint32_t number = h->encodingNumber;
  switch (h->encodingClass) {
    case NLSSM_CLASS_SBCS:
      return MoveKind::kSbcs;
    case NLSSM_CLASS_UTF8:
      return MoveKind::kUtf;
    case NLSSM_CLASS_WCS2:
      return MoveKind::kWcs2;
    case NLSSM_CLASS_WCS4:
      return MoveKind::kWcs4;
    case NLSSM_CLASS_MBCS_MODAL:
      return MoveKind::kModal;
    default:
      if (number == NLSSM_ENC_EUC_JP) return MoveKind::kEucJp;
      if (number == 119 || number == 120 || number == 159) return MoveKind::kEucTw;
      if (number == NLSSM_ENC_GB18030) return MoveKind::kGb18030;
      return MoveKind::kDbcs;
  }
}

namespace {

int64_t move_s(const NLSSMHandle *h, MoveKind kind, const uint8_t *src, int64_t srcLen,
               uint8_t *dst, int64_t dstLen, int64_t *bytesWritten, uint32_t flags) {
  if (bad_buffers(src, srcLen, dst, dstLen)) return kNullArgument;
  return finish(move_text(h, kind, src, srcLen, dst, dstLen, flags, false), bytesWritten, nullptr);
}

int64_t move_c(const NLSSMHandle *h, MoveKind kind, const uint8_t *src, int64_t srcLen,
               uint8_t *dst, int64_t dstLen, int64_t *bytesWritten, int64_t *charsWritten,
               uint32_t flags) {
  if (bad_buffers(src, srcLen, dst, dstLen)) return kNullArgument;
  return finish(move_text(h, kind, src, srcLen, dst, dstLen, flags, true), bytesWritten,
                charsWritten);
}

}  // namespace
}  // namespace nlssm::edit

using nlssm::edit::MoveKind;

#define NLSSM_MOVE_MEMBERS(SUFFIX, KIND)                                                         \
  extern "C" int64_t NLSStringMoveS_##SUFFIX(                                                    \
      const NLSSMHandle *h, const uint8_t *source, int64_t sourceLength, uint8_t *destination,   \
      int64_t destinationLength, int64_t *bytesWritten, uint32_t flags) {                        \
    return nlssm::edit::move_s(h, KIND, source, sourceLength, destination, destinationLength,    \
                               bytesWritten, flags);                                             \
  }                                                                                              \
  extern "C" int64_t NLSStringMoveC_##SUFFIX(                                                    \
      const NLSSMHandle *h, const uint8_t *source, int64_t sourceLength, uint8_t *destination,   \
      int64_t destinationLength, int64_t *bytesWritten, int64_t *charsWritten, uint32_t flags) { \
    return nlssm::edit::move_c(h, KIND, source, sourceLength, destination, destinationLength,    \
                               bytesWritten, charsWritten, flags);                               \
  }

NLSSM_MOVE_MEMBERS(SBCS, MoveKind::kSbcs)
NLSSM_MOVE_MEMBERS(MBCS_UTF8, MoveKind::kUtf)
NLSSM_MOVE_MEMBERS(WCS2, MoveKind::kWcs2)
NLSSM_MOVE_MEMBERS(WCS4, MoveKind::kWcs4)
NLSSM_MOVE_MEMBERS(MBCS_modal, MoveKind::kModal)
NLSSM_MOVE_MEMBERS(MBCS_nonmodal, MoveKind::kDbcs)
NLSSM_MOVE_MEMBERS(MBCS_nonmodal_EUC_JP, MoveKind::kEucJp)
NLSSM_MOVE_MEMBERS(MBCS_nonmodal_EUC_TW, MoveKind::kEucTw)
NLSSM_MOVE_MEMBERS(MBCS_nonmodal_GB18030, MoveKind::kGb18030)
