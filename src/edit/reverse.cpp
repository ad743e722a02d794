// Reverse: the order of the characters of a string, in place. Fixed-width
// text swaps whole units; multi-byte text keeps each character's bytes in
// order; modal text is rebuilt backwards through a work buffer, shift
// sequences turned round.
#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstring>

#include "edit/character_walk.hpp"
#include "edit/modal_text.hpp"
#include "module/work_buffer.hpp"

namespace nlssm::edit {
namespace {

// Swaps whole units of `width` bytes end for end; the bytes inside a unit
// keep their order.
template <int kWidth>
void reverse_units(uint8_t *p, int64_t bytes) {
  int64_t lo = 0, hi = bytes / kWidth * kWidth - kWidth;
  uint8_t t[kWidth];
  for (; lo < hi; lo += kWidth, hi -= kWidth) {
    std::memcpy(t, p + lo, kWidth);
    std::memcpy(p + lo, p + hi, kWidth);
    std::memcpy(p + hi, t, kWidth);
  }
}

template <>
void reverse_units<1>(uint8_t *p, int64_t bytes) {
  std::reverse(p, p + bytes);
}

// Each character's bytes are turned round first, then the whole range: the
// characters change places and their bytes come back into order.
template <class M>
void reverse_characters(const M &m, uint8_t *p, int64_t bytes) {
  for (int64_t off = 0; off < bytes;) {
    const int64_t size = whole_char(m, p + off, bytes - off);
    std::reverse(p + off, p + off + size);
    off += size;
  }
  std::reverse(p, p + bytes);
}

// Modal text is written from the end of a work buffer backwards: a
// shift-out in the input becomes a shift-in in the output and the reverse.
// When the input ends in another width than it starts, the output opens
// with the shift into that width; it is then one shift sequence longer than
// the input and only its first `bytes` bytes are copied back, so its last
// bytes are lost.
int64_t reverse_modal(const NLSSMHandle *h, uint8_t *p, int64_t bytes, bool startDbl) {
  const ModalModel m(h);
  module::WorkBuffer<256> work;
  if (!work.reserve(h, static_cast<uint64_t>(bytes + m.length))) return NLSSM_E_NO_MEMORY;
  uint8_t *out = work.data();
  int64_t w = bytes + m.length;
  ModalWalk walk(m, p, 0, bytes, startDbl);
  ModalItem item;
  while (walk.next(item)) {
    w -= item.size;
    if (item.shift != 0)
      put_shift(m, out + w, item.shift < 0);
    else
      std::memcpy(out + w, p + item.offset, static_cast<size_t>(item.size));
  }
  if (walk.dbl() != startDbl) {
    w -= m.length;
    put_shift(m, out + w, walk.dbl());
  }
  std::memcpy(p, out + w, static_cast<size_t>(bytes));
  return NLSSM_OK;
}

int64_t check_buffer(const uint8_t *p, int64_t bytes) {
  return p == nullptr && bytes > 0 ? NLSSM_E_NULL_ARGUMENT : NLSSM_OK;
}

template <int kWidth>
int64_t reverse_buffer(uint8_t *p, int64_t bytes) {
  if (check_buffer(p, bytes) != 0 || bytes <= 0) return check_buffer(p, bytes);
  reverse_units<kWidth>(p, bytes);
  return NLSSM_OK;
}

// The first n characters (all when n is 0 or more than remain) from the
// current character, measured by the class's model.
template <class M>
Remaining first_chars(const M &m, const NLSString *s, int64_t n) {
  Remaining r = remaining_of(s);
  r.bytes = span_of(m, r.text, r.bytes, n, nullptr);
  return r;
}

template <int kWidth, class M>
int64_t reverse_plain(const M &m, NLSString *s, int64_t n) {
  if (s == nullptr) return NLSSM_E_NULL_ARGUMENT;
  const Remaining r = first_chars(m, s, n);
  reverse_units<kWidth>(r.text, r.bytes);
  return NLSSM_OK;
}

}  // namespace
}  // namespace nlssm::edit

using namespace nlssm::edit;
using nlssm::cursor::FixedModel;
using nlssm::cursor::SbcsModel;
using nlssm::cursor::Wcs2Model;

extern "C" {

int64_t NLSStringReverse_SBCS(const NLSSMHandle *h, NLSString *s, int64_t n) {
  return reverse_plain<1>(SbcsModel(h), s, n);
}
int64_t NLSStringReverseS_SBCS(const NLSSMHandle *, uint8_t *p, int64_t bytes) {
  return reverse_buffer<1>(p, bytes);
}

// Two-byte text swaps units; n counts characters (a surrogate pair is one).
int64_t NLSStringReverse_WCS2(const NLSSMHandle *h, NLSString *s, int64_t n) {
  return wide_big_endian(h) ? reverse_plain<2>(Wcs2Model<true>(h), s, n)
                            : reverse_plain<2>(Wcs2Model<false>(h), s, n);
}
int64_t NLSStringReverseS_WCS2(const NLSSMHandle *, uint8_t *p, int64_t bytes) {
  return reverse_buffer<2>(p, bytes);
}

int64_t NLSStringReverse_WCS4(const NLSSMHandle *h, NLSString *s, int64_t n) {
  return reverse_plain<4>(FixedModel(h), s, n);
}
int64_t NLSStringReverseS_WCS4(const NLSSMHandle *, uint8_t *p, int64_t bytes) {
  return reverse_buffer<4>(p, bytes);
}

int64_t NLSStringReverse_MBCS(const NLSSMHandle *h, NLSString *s, int64_t n) {
  if (s == nullptr) return NLSSM_E_NULL_ARGUMENT;
  return with_multibyte_model(h, [&](const auto &m) {
    const Remaining r = first_chars(m, s, n);
    reverse_characters(m, r.text, r.bytes);
    return int64_t{NLSSM_OK};
  });
}
int64_t NLSStringReverseS_MBCS(const NLSSMHandle *h, uint8_t *p, int64_t bytes) {
  if (check_buffer(p, bytes) != 0 || bytes <= 0) return check_buffer(p, bytes);
  return with_multibyte_model(h, [&](const auto &m) {
    reverse_characters(m, p, bytes);
    return int64_t{NLSSM_OK};
  });
}

// The plain form reverses the first n characters from the current one,
// starting in the shift state in force there.
int64_t NLSStringReverse_MBCS_modal(const NLSSMHandle *h, NLSString *s, int64_t n) {
  if (s == nullptr) return NLSSM_E_NULL_ARGUMENT;
  const Remaining r = remaining_of(s);
  if (r.bytes == 0) return NLSSM_OK;
  const ModalModel m(h);
  const bool startDbl = modal_double_at(m, s->buffer, s->curOffset);
  bool dbl = startDbl;
  const int64_t bytes = modal_span(m, r.text, 0, r.bytes, n, dbl, nullptr);
  return reverse_modal(h, r.text, bytes, startDbl);
}
int64_t NLSStringReverseS_MBCS_modal(const NLSSMHandle *h, uint8_t *p, int64_t bytes) {
  if (check_buffer(p, bytes) != 0 || bytes <= 0) return check_buffer(p, bytes);
  return reverse_modal(h, p, bytes, false);
}

}  // extern "C"
