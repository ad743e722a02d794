// Concatenate: join pieces into a bounded destination, optionally with a
// one-character separator between them. Each piece is moved by the rules of
// the handle's class (whole characters; modal pieces leave the text in
// single-byte width). What is left of the room is blank-filled, even after
// a truncation; in terminated mode one zero byte follows the text instead.
#include <cstdarg>

#include "edit/literal_char.hpp"
#include "edit/move.hpp"

namespace nlssm::edit {
namespace {

struct Piece {
  const uint8_t *text;
  int64_t length;
  bool present;
};

// Where the text goes: `room` bytes at `dst`, and whether a zero byte closes
// it (the byte after the room is the caller's).
struct Target {
  uint8_t *dst;
  int64_t room;
  bool terminated;
};

// Signed destination lengths: negative selects terminated mode with the
// one's complement as the room.
Target target(uint8_t *dst, int64_t length) {
  if (length < 0) return {dst, -(length + 1), true};
  return {dst, length, false};
}

template <class NextPiece>
int64_t concat(const NLSSMHandle *h, const Target &t, int64_t start, const uint8_t *sep,
               int64_t sepLength, uint32_t flags, int64_t count, NextPiece next, int64_t *written) {
  LiteralChar separator;
  if (sep != nullptr && sepLength > 0) {
    if (const int64_t status = convert_first_char(h, separator, sep); status != kOk) return status;
  }
  const MoveKind kind = move_kind(h);
  const int64_t room = t.room;
  int64_t off = std::min(start, room);
  int64_t status = kOk;
  for (int64_t i = 0; i < count; ++i) {
    const Piece piece = next();
    if (!piece.present) break;
    if (i > 0 && separator.length() > 0) {
      const auto n = static_cast<int64_t>(separator.length());
      if (room - off < n) {
        status = kTooSmall;
        break;
      }
      copy_bytes(separator.text(), t.dst + off, n);
      off += n;
      if (off == room) {  // the separator took the last byte; a piece remains
        status = kTooSmall;
        break;
      }
    }
    const int64_t left = room - off;
    const bool fits = piece.length <= left;
    if (!fits && (flags & NLSSM_EDIT_PAD)) {
      status = kTooSmall;
      break;
    }
    const MoveResult r = move_text(h, kind, piece.text, piece.length, t.dst + off, left, 0, false);
    const bool truncated = !fits || r.status != kOk;
    if (truncated && (flags & NLSSM_EDIT_PAD)) {
      status = kTooSmall;  // a piece is copied whole or not at all
      break;
    }
    off += r.bytes;
    if (truncated) {
      status = kTooSmall;
      break;
    }
  }
  if (t.terminated) {
    t.dst[off] = 0;
  } else {
    pad_blanks(t.dst + off, room - off, Blank(h));
  }
  store(written, off);
  return status;
}

// The modal members start a join in single-byte width: a destination whose
// text before the write offset ends inside a double-byte run is closed first.
int64_t open_join(const NLSSMHandle *h, const Target &t, const uint8_t *base, int64_t at) {
  if (h->encodingClass != NLSSM_CLASS_MBCS_MODAL || at <= 0) return 0;
  const ModalText text(h);
  if (!double_at(text, base, at) || t.room < text.shift_length()) return 0;
  std::memcpy(t.dst, text.model.shift_in, static_cast<size_t>(text.shift_length()));
  return text.shift_length();
}

int64_t concat_plain(const NLSSMHandle *h, bool atCharIndex, NLSString *dst, int64_t *length,
                     const uint8_t *sep, int64_t sepLength, uint32_t flags, int64_t count,
                     va_list pieces) {
  if (dst == nullptr || length == nullptr) return kNullArgument;
  const int64_t at = std::max<int64_t>(atCharIndex ? dst->charIndex : dst->curOffset, 0);
  const int64_t capacity = std::max<int64_t>(static_cast<int64_t>(dst->capacity) - at, 0);
  if (dst->buffer == nullptr && capacity > 0) return kNullArgument;
  Target t = target(dst->buffer + at, *length == 0 ? capacity : *length);
  // Never past the capacity: in terminated mode the zero byte needs one.
  t.room = std::min(t.room, t.terminated ? capacity - 1 : capacity);
  if (t.room < 0) return kTooSmall;
  const int64_t start = open_join(h, t, dst->buffer, at);
  int64_t written = 0;
  const int64_t status = concat(
      h, t, start, sep, sepLength, flags, count,
      [&]() -> Piece {
        const NLSString *s = va_arg(pieces, const NLSString *);
        if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return {nullptr, 0, false};
        const int64_t n = static_cast<int64_t>(s->length) - s->curOffset;
        return {s->buffer + s->curOffset, std::max<int64_t>(n, 0), true};
      },
      &written);
  *length = written;
  dst->length = static_cast<uint64_t>(at + written);
  return status;
}

int64_t concat_raw(const NLSSMHandle *h, uint8_t *dst, int64_t length, int64_t *written,
                   const uint8_t *sep, int64_t sepLength, uint32_t flags, int64_t count,
                   va_list pieces) {
  if (dst == nullptr && length != 0) return kNullArgument;
  const Target t = target(dst, length);
  return concat(
      h, t, 0, sep, sepLength, flags, count,
      [&]() -> Piece {
        const auto *p = va_arg(pieces, const uint8_t *);
        const int64_t n = va_arg(pieces, int64_t);
        if (p == nullptr && n > 0) return {nullptr, 0, false};
        return {p, std::max<int64_t>(n, 0), true};
      },
      written);
}

}  // namespace
}  // namespace nlssm::edit

#define NLSSM_CONCAT_MEMBERS(NAME, NAME_S, AT_CHAR_INDEX)                                         \
  extern "C" int64_t NAME(const NLSSMHandle *h, NLSString *destination, int64_t *length,          \
                          const uint8_t *separator, int64_t separatorLength, uint32_t flags,      \
                          int64_t count, ...) {                                                   \
    va_list pieces;                                                                               \
    va_start(pieces, count);                                                                      \
    const int64_t status = nlssm::edit::concat_plain(                                             \
        h, AT_CHAR_INDEX, destination, length, separator, separatorLength, flags, count, pieces); \
    va_end(pieces);                                                                               \
    return status;                                                                                \
  }                                                                                               \
  extern "C" int64_t NAME_S(const NLSSMHandle *h, uint8_t *destination, int64_t length,           \
                            int64_t *written, const uint8_t *separator, int64_t separatorLength,  \
                            uint32_t flags, int64_t count, ...) {                                 \
    va_list pieces;                                                                               \
    va_start(pieces, count);                                                                      \
    const int64_t status = nlssm::edit::concat_raw(h, destination, length, written, separator,    \
                                                   separatorLength, flags, count, pieces);        \
    va_end(pieces);                                                                               \
    return status;                                                                                \
  }

// The single-byte and UTF-8 member writes at the byte offset given by the
// destination's charIndex; the others at its curOffset.
NLSSM_CONCAT_MEMBERS(NLSStringConcat, NLSStringConcatS, true)
NLSSM_CONCAT_MEMBERS(NLSStringConcat_WCS2, NLSStringConcatS_WCS2, false)
NLSSM_CONCAT_MEMBERS(NLSStringConcat_WCS4, NLSStringConcatS_WCS4, false)
NLSSM_CONCAT_MEMBERS(NLSStringConcat_MBCS_modal, NLSStringConcatS_MBCS_modal, false)
NLSSM_CONCAT_MEMBERS(NLSStringConcat_MBCS, NLSStringConcatS_MBCS, false)
