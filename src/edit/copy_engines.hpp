// Shared machinery of the copying edits (transliterate, tranword, squeeze,
// remove-delimiters): whole characters of every encoding class, a writer
// that never splits a character and keeps modal shift sequences balanced,
// and the front-end steps every member shares (source and destination
// ranges, the overlap work buffer, the destination update rule).
#pragma once

#include <nlssm/nlssm.h>

#include <cstdint>
#include <cstring>

#include "cursor/char_model.hpp"
#include "edit/character_walk.hpp"
#include "edit/statuses.hpp"
#include "module/literal.hpp"
#include "module/out_value.hpp"
#include "module/work_buffer.hpp"

namespace nlssm::edit {

// Bytes a work buffer for an overlapping destination may use on the stack.
inline constexpr uint64_t kOverlapStack = 2048;

// One character: its bytes and, in modal text, whether it is double-byte.
struct Char {
  const uint8_t *p = nullptr;
  int64_t size = 0;
  bool dbl = false;
};

inline bool same(const Char &a, const Char &b) {
  return a.size == b.size && a.dbl == b.dbl &&
         (a.size == 1 ? *a.p == *b.p : std::memcmp(a.p, b.p, static_cast<size_t>(a.size)) == 0);
}

// ---- Character rules per class ---------------------------------------------
// at(p, remaining, state): the character at p, never longer than remaining.
// skip(base, offset, end, state): steps over shift sequences (modal only).
// usable(length): the bytes of a text that hold whole code units.

struct NoShifts {
  static constexpr bool kModal = false;
  void skip(const uint8_t *, int64_t &, int64_t, uint32_t &) const {}
  static int64_t usable(int64_t length) { return length; }
};

struct SbcsChars : NoShifts {
  static constexpr bool kBytes = true;
  static constexpr bool kSelfSync = true;
  static bool starts_char(uint8_t) { return true; }
  Char at(const uint8_t *p, int64_t, uint32_t) const { return {p, 1}; }
};

// UTF-8 or UTF-EBCDIC: a lead byte and the continuation bytes its form
// announces, as far as they are there; a stray continuation byte or an
// unused lead is a character of its own (as the counting members see it).
template <bool kUtfe>
struct UtfChars : NoShifts {
  static constexpr bool kBytes = false;
  static constexpr bool kSelfSync = true;  // every non-trailing byte starts a character
  static bool starts_char(uint8_t b) {
    return !(kUtfe ? cursor::utfe_trailing(b) : cursor::utf8_continuation(b));
  }
  // A byte that is a whole character by itself.
  static bool single_char(uint8_t b) { return kUtfe ? cursor::kSkipUtfe[b] == 1 : b < 0x80; }
  Char at(const uint8_t *p, int64_t remaining, uint32_t) const {
    const uint8_t b = *p;
    const bool trailing = kUtfe ? cursor::utfe_trailing(b) : cursor::utf8_continuation(b);
    const int64_t form = kUtfe ? cursor::kSkipUtfe[b] : cursor::kUtf8FormLength[b];
    int64_t size = 1;
    if (!trailing)
      while (size < form && size < remaining &&
             (kUtfe ? cursor::utfe_trailing(p[size]) : cursor::utf8_continuation(p[size])))
        ++size;
    return {p, size};
  }
};

// Two-byte units; a surrogate pair is one character.
template <bool kBig>
struct Wcs2Chars : NoShifts {
  static constexpr bool kBytes = false;
  static constexpr bool kSelfSync = false;
  static int64_t usable(int64_t length) { return length & ~int64_t{1}; }
  Char at(const uint8_t *p, int64_t remaining, uint32_t) const {
    return {p, cursor::Wcs2Model<kBig>().step(p, remaining, 0)};
  }
};

// Four-byte units, compared as four bytes in memory order.
struct Wcs4Chars : NoShifts {
  static constexpr bool kBytes = false;
  static constexpr bool kSelfSync = false;
  static int64_t usable(int64_t length) { return length & ~int64_t{3}; }
  Char at(const uint8_t *p, int64_t, uint32_t) const { return {p, 4}; }
};

// Double-byte code pages, EUC-JP, EUC-TW and GB18030: the counting view of
// the class's model (a lead byte without its trail bytes is one byte).
template <class Model>
struct NonModalChars : NoShifts {
  static constexpr bool kBytes = false;
  static constexpr bool kSelfSync = false;
  Model model;
  explicit NonModalChars(const NLSSMHandle *h) : model(h) {}
  Char at(const uint8_t *p, int64_t remaining, uint32_t) const {
    return {p, model.unit(p, remaining, 0).size};
  }
};

// Shift-out/shift-in text: shift sequences set the width of what follows.
struct ModalChars {
  static constexpr bool kModal = true;
  static constexpr bool kBytes = false;
  static constexpr bool kSelfSync = false;
  cursor::ModalModel model;
  explicit ModalChars(const NLSSMHandle *h) : model(h) {}
  static int64_t usable(int64_t length) { return length; }
  void skip(const uint8_t *base, int64_t &offset, int64_t end, uint32_t &state) const {
    model.skip_shifts(base, offset, end, state);
  }
  Char at(const uint8_t *p, int64_t remaining, uint32_t state) const {
    return {p, model.unit(p, remaining, state).size, cursor::modal_double(state)};
  }
};

// The rules of a class, chosen once per call by the handle's encoding
// (class-1 and class-5 members serve several encodings).
struct SbcsClass {
  template <class Fn>
  static auto visit(const NLSSMHandle *, Fn &&fn) {
    return fn(SbcsChars{});
  }
};
struct UtfClass {
  template <class Fn>
  static auto visit(const NLSSMHandle *h, Fn &&fn) {
    return h->encodingNumber == NLSSM_ENC_UTF8 ? fn(UtfChars<false>{}) : fn(UtfChars<true>{});
  }
};
struct Wcs2Class {
  template <class Fn>
  static auto visit(const NLSSMHandle *h, Fn &&fn) {
    return h->encodingNumber == NLSSM_ENC_WCS2_BE ? fn(Wcs2Chars<true>{}) : fn(Wcs2Chars<false>{});
  }
};
struct Wcs4Class {
  template <class Fn>
  static auto visit(const NLSSMHandle *, Fn &&fn) {
    return fn(Wcs4Chars{});
  }
};
struct DbcsClass {
  template <class Fn>
  static auto visit(const NLSSMHandle *h, Fn &&fn) {
    return cursor::with_nonmodal_model(
        h, [&](auto model) { return fn(NonModalChars<decltype(model)>(h)); });
  }
};
struct ModalClass {
  template <class Fn>
  static auto visit(const NLSSMHandle *h, Fn &&fn) {
    return fn(ModalChars(h));
  }
};

// ---- Texts -----------------------------------------------------------------

// A stretch of text: bytes from p to p + length, and the modal shift state
// at its start.
struct Span {
  const uint8_t *p = nullptr;
  int64_t length = 0;
  uint32_t state = cursor::kModalSingle;
};

// The text of a descriptor from its current character to its end (empty
// when it has no current character), in the shift state of that character.
inline Span span_of(const NLSString &s) {
  const auto length = static_cast<int64_t>(s.length);
  if (s.buffer == nullptr || s.curOffset < 0 || s.curOffset >= length) return {};
  return {s.buffer + s.curOffset, length - s.curOffset,
          cursor::modal_double(s.charKind) ? cursor::kModalDouble : cursor::kModalSingle};
}

inline Span span_of(const uint8_t *p, int64_t length) {
  return p == nullptr || length <= 0 ? Span{} : Span{p, length};
}

// Reads a span character by character.
template <class C>
struct Reader {
  const C *chars;
  const uint8_t *p;
  int64_t end;
  int64_t off = 0;
  uint32_t state;

  Reader(const C &c, const Span &s) : chars(&c), p(s.p), end(C::usable(s.length)), state(s.state) {}

  bool next(Char &c) {
    chars->skip(p, off, end, state);
    if (off >= end) return false;
    c = chars->at(p + off, end - off, state);
    off += c.size;
    return true;
  }
  bool at_end() {
    chars->skip(p, off, end, state);
    return off >= end;
  }
};

// Characters in a span.
template <class C>
int64_t count_chars(const C &c, const Span &s) {
  Reader<C> r(c, s);
  Char ch;
  int64_t n = 0;
  while (r.next(ch)) ++n;
  return n;
}

// The first character of a span (size 0 when it has none).
template <class C>
Char first_char(const C &c, const Span &s) {
  Reader<C> r(c, s);
  Char ch;
  return r.next(ch) ? ch : Char{};
}

// ---- Writer ----------------------------------------------------------------

// Writes whole characters into `room` bytes. In modal text a shift-out or
// shift-in goes in front of a character whose width differs from the last
// one written, room for the closing shift-in is kept while a double-byte run
// is open, and finish() closes it.
template <class C>
class Writer {
 public:
  Writer(const C &c, uint8_t *out, int64_t room, bool dbl)
      : chars_(&c), out_(out), room_(room < 0 ? 0 : room), dbl_(dbl) {}

  // Bytes the character would take, shifts and the closing shift-in included.
  int64_t need(const Char &c, bool dbl) const {
    if constexpr (C::kModal) {
      const int64_t shift = chars_->model.length;
      return c.size + (c.dbl != dbl ? shift : 0) + (c.dbl ? shift : 0);
    } else {
      return c.size;
    }
  }
  bool fits(const Char &c) const { return need(c, dbl_) <= room_ - used_; }
  // Bytes the character adds to the output (the closing shift-in aside).
  int64_t consumed(const Char &c, bool dbl) const {
    if constexpr (C::kModal) return c.size + (c.dbl != dbl ? chars_->model.length : 0);
    return c.size;
  }

  bool put(const Char &c) {
    if (!fits(c)) return false;
    if constexpr (C::kModal) {
      if (c.dbl != dbl_) {
        shift(c.dbl);
        dbl_ = c.dbl;
      }
    }
    if (c.size == 1) {
      out_[used_++] = *c.p;
    } else {
      std::memcpy(out_ + used_, c.p, static_cast<size_t>(c.size));
      used_ += c.size;
    }
    return true;
  }

  // Whether every character of a span fits after what is written.
  bool fits_all(const Span &s) const {
    Reader<C> r(*chars_, s);
    int64_t used = used_;
    bool dbl = dbl_;
    Char c;
    while (r.next(c)) {
      if (used + need(c, dbl) > room_) return false;
      used += consumed(c, dbl);
      dbl = c.dbl;
    }
    return true;
  }

  // Raw bytes of a non-modal text (its characters are its bytes).
  void put_bytes(const uint8_t *p, int64_t n) {
    if (n == 0) return;
    std::memcpy(out_ + used_, p, static_cast<size_t>(n));
    used_ += n;
  }
  int64_t left() const { return room_ - used_; }
  // The next n bytes of room (no more than left()), to be filled by the caller.
  uint8_t *claim(int64_t n) {
    used_ += n;
    return out_ + used_ - n;
  }

  // Closes an open double-byte run; the bytes written.
  int64_t finish() {
    if constexpr (C::kModal) {
      if (dbl_ && room_ - used_ >= chars_->model.length) {
        shift(false);
        dbl_ = false;
      }
    }
    return used_;
  }

 private:
  void shift(bool out) {
    const auto &m = chars_->model;
    std::memcpy(out_ + used_, out ? m.shift_out : m.shift_in, static_cast<size_t>(m.length));
    used_ += m.length;
  }

  const C *chars_;
  uint8_t *out_;
  int64_t room_;
  int64_t used_ = 0;
  bool dbl_;
};

// ---- Front-end steps ---------------------------------------------------------

struct Result {
  int64_t status;
  int64_t written;
};

inline bool overlaps(const uint8_t *a, uint64_t an, const uint8_t *b, uint64_t bn) {
  if (an == 0 || bn == 0 || a == nullptr || b == nullptr) return false;
  const auto x = reinterpret_cast<uintptr_t>(a), y = reinterpret_cast<uintptr_t>(b);
  return x < y + bn && y < x + an;
}

using module::store;

// Runs `write(span, out, room, dbl) -> Result` into a descriptor: from its
// current character (its start when unset), then the destination update:
// an unset destination that got text becomes positioned at 0 with `length`
// the count; otherwise `length` ends at the written text. `nextOffset` is
// the position plus one either way.
template <class Write>
int64_t into_descriptor(NLSString *dst, int64_t *written, Write &&write) {
  const int64_t pos = dst->curOffset < 0 ? 0 : dst->curOffset;
  const auto capacity = static_cast<int64_t>(dst->capacity);
  const int64_t room = capacity > pos ? capacity - pos : 0;
  const bool dbl = dst->curOffset >= 0 && cursor::modal_double(dst->charKind);
  const Result r = write(dst->buffer + (room > 0 ? pos : 0), room, dbl);
  if (dst->curOffset < 0 && r.written != 0) {
    dst->curOffset = 0;
    dst->length = static_cast<uint64_t>(r.written);
  } else {
    dst->length = static_cast<uint64_t>(pos + r.written);
  }
  dst->nextOffset = (dst->curOffset < 0 ? 0 : dst->curOffset) + 1;
  store(written, r.written);
  return r.status;
}

// Plain front end: when the destination's buffer overlaps the source text,
// the engine writes into a copy of the destination (a buffer of its room:
// on the stack up to 2048 bytes, from the handle's pool beyond that, and
// 2048 bytes on the stack with the room cut to that when the pool refuses),
// which is copied back and re-positioned at its start afterwards.
template <class Engine>
int64_t plain_front(const NLSSMHandle *h, const Span &source, NLSString *dst, int64_t *written,
                    Engine &&engine) {
  if (!overlaps(dst->buffer, dst->capacity, source.p, static_cast<uint64_t>(source.length)))
    return engine(dst, written);
  module::WorkBuffer<kOverlapStack> work;
  uint64_t room = dst->capacity;
  if (!work.reserve(h, room)) {
    work.use_stack();
    room = kOverlapStack;
  }
  const uint64_t keep = dst->length < room ? dst->length : room;
  std::memcpy(work.data(), dst->buffer, keep);
  NLSString temp = descriptor_over(h, work.data(), keep, room);
  const int64_t status = engine(&temp, written);
  std::memcpy(dst->buffer, work.data(), temp.length);
  dst->length = temp.length;
  position_at_start(h, *dst);
  return status;
}

// Raw-buffer front end: the same overlap rule for a destination buffer.
template <class Engine>
int64_t raw_front(const NLSSMHandle *h, const Span &source, uint8_t *dst, int64_t dstLength,
                  int64_t *written, Engine &&engine) {
  const int64_t room = dstLength < 0 ? 0 : dstLength;
  if (!overlaps(dst, static_cast<uint64_t>(room), source.p, static_cast<uint64_t>(source.length)))
    return engine(dst, room, written);
  module::WorkBuffer<kOverlapStack> work;
  int64_t cut = room;
  if (!work.reserve(h, static_cast<uint64_t>(room))) {
    work.use_stack();
    cut = static_cast<int64_t>(kOverlapStack);
  }
  int64_t count = 0;
  const int64_t status = engine(work.data(), cut, &count);
  std::memcpy(dst, work.data(), static_cast<size_t>(count));
  store(written, count);
  return status;
}

// Argument checks shared by the members: descriptors and buffers that are
// needed must be there (a buffer may be null only when it holds nothing).
inline bool usable(const NLSString *s) {
  return s != nullptr && (s->buffer != nullptr || s->length == 0);
}
inline bool usable_dst(const NLSString *s) {
  return s != nullptr && (s->buffer != nullptr || s->capacity == 0);
}
inline bool usable(const void *p, int64_t length) {
  return p != nullptr || length <= 0;
}

// A literal argument converted into the handle's encoding, and a descriptor
// over it for the plain forms.
class LiteralText {
 public:
  // 0, or the status of a failed conversion (0x803fc002 when the buffer for
  // it could not be had).
  int64_t convert(const NLSSMHandle *h, const void *literal, int64_t length) {
    switch (literal_.convert(h, literal, length < 0 ? 0 : static_cast<uint64_t>(length))) {
      case module::LiteralOutcome::kNoMemory:
        return kNoMemory;
      case module::LiteralOutcome::kFailed:
        return literal_.status();
      default:
        return kOk;
    }
  }
  const uint8_t *text() const { return literal_.text(); }
  int64_t length() const { return static_cast<int64_t>(literal_.length()); }
  NLSString descriptor(const NLSSMHandle *h) const {
    return descriptor_over(h, text(), literal_.length(), literal_.length());
  }

 private:
  module::ConvertedLiteral<256> literal_;
};

// ---- Engines and front ends ------------------------------------------------
// Each operation has, per class, a raw-buffer engine
//   Result DO_<Operation>_<class>S(handle, args, out, room, dbl)
// that writes into `room` bytes (`dbl`: the output starts inside a modal
// double-byte run), and a descriptor engine DO_<Operation>_<class> that runs
// it at the destination's position and applies the destination update.

template <class Args>
using RawEngine = Result (*)(const NLSSMHandle *, const Args &, uint8_t *, int64_t, bool);
template <class Args>
using DescriptorEngine = int64_t (*)(const NLSSMHandle *, const Args &, NLSString *, int64_t *);

template <class Args>
int64_t descriptor_engine(const NLSSMHandle *h, RawEngine<Args> raw, const Args &a, NLSString *dst,
                          int64_t *written) {
  return into_descriptor(dst, written, [&](uint8_t *out, int64_t room, bool dbl) {
    return raw(h, a, out, room, dbl);
  });
}

template <class Args>
int64_t run_plain(const NLSSMHandle *h, const Args &a, NLSString *dst, int64_t *written,
                  DescriptorEngine<Args> engine) {
  return plain_front(h, a.src, dst, written,
                     [&](NLSString *d, int64_t *count) { return engine(h, a, d, count); });
}

template <class Args>
int64_t run_raw(const NLSSMHandle *h, const Args &a, uint8_t *dst, int64_t dstLength,
                int64_t *written, RawEngine<Args> engine) {
  return raw_front(h, a.src, dst, dstLength, written,
                   [&](uint8_t *out, int64_t room, int64_t *count) {
                     const Result r = engine(h, a, out, room, false);
                     *count = r.written;
                     return r.status;
                   });
}

// The two engines of one operation for one class: `core(chars, args, out,
// room, dbl)` is the operation's rule over the class's characters.
#define NLSSM_COPY_ENGINES(DO, suffix, Class, Args, core)                                        \
  Result DO##_##suffix##S(const NLSSMHandle *h, const Args &a, uint8_t *out, int64_t room,       \
                          bool dbl) {                                                            \
    return Class::visit(h, [&](const auto &chars) { return core(chars, a, out, room, dbl); });   \
  }                                                                                              \
  int64_t DO##_##suffix(const NLSSMHandle *h, const Args &a, NLSString *dst, int64_t *written) { \
    return descriptor_engine<Args>(h, &DO##_##suffix##S, a, dst, written);                       \
  }

// Both engines for every class.
#define NLSSM_COPY_ENGINES_ALL(DO, Args, core)        \
  NLSSM_COPY_ENGINES(DO, SBCS, SbcsClass, Args, core) \
  NLSSM_COPY_ENGINES(DO, UTF8, UtfClass, Args, core)  \
  NLSSM_COPY_ENGINES(DO, WCS2, Wcs2Class, Args, core) \
  NLSSM_COPY_ENGINES(DO, WCS4, Wcs4Class, Args, core) \
  NLSSM_COPY_ENGINES(DO, DBCS, DbcsClass, Args, core) \
  NLSSM_COPY_ENGINES(DO, DBCSM, ModalClass, Args, core)

}  // namespace nlssm::edit
