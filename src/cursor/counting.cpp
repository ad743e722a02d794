// Counting characters and bytes in every class: NLSNumChars and its S form,
// NLSStringLength, NLSStringNLength, NLSStringBLength, NLSStringByteLength
// and its C form, and the double-byte length helpers.
#include "cursor/counting.hpp"

#include <nlssm/nlssm.h>

#include <algorithm>
#include <climits>
#include <cstring>

#include "cursor/char_model.hpp"
#include "cursor/count_scalar.hpp"
#include "cursor/count_vector.hpp"
#include "module/out_value.hpp"

namespace nlssm::cursor {

using simd::Isa;
using simd::Prefix;

Isa active_isa() {
  static const Isa isa = simd::best_isa();
  return isa;
}

// Alternates the vector kernel (from a point where no sequence is open)
// with short stretches of the exact rule, so one bad byte does not send the
// rest of a long text down the slow path.
Counted count_utf8(Isa isa, const uint8_t *p, int64_t n, int64_t flags) {
  UtfCounter<false> counter(flags);
  int64_t pos = 0;
  while (pos < n) {
    if (isa != Isa::kScalar && counter.expect == 0) {
      const Prefix prefix = simd::utf8_prefix(isa, p + pos, n - pos, INT64_MAX);
      counter.chars += prefix.chars;
      pos += prefix.bytes;
      if (pos >= n) break;
    }
    const int64_t end = isa == Isa::kScalar ? n : std::min(n, pos + 64);
    counter.feed(p + pos, end - pos);
    pos = end;
    while (pos < n && counter.expect != 0) counter.feed(p + pos++, 1);
  }
  return counter.finish();
}

int64_t count_wcs2(Isa isa, const uint8_t *p, int64_t n, bool big_endian) {
  const Prefix prefix =
      isa == Isa::kScalar ? Prefix{0, 0} : simd::wcs2_prefix(isa, p, n, INT64_MAX, big_endian);
  const uint8_t *rest = p + prefix.bytes;
  const int64_t left = n - prefix.bytes;
  return prefix.chars +
         (big_endian ? count_wcs2_exact<true>(rest, left) : count_wcs2_exact<false>(rest, left));
}

namespace {

// The lead and trail byte sets of a handle as ranges for the kernel; false
// when they are too scattered for it.
bool dbcs_ranges(const NLSSMHandle *h, simd::ByteRanges &lead, simd::ByteRanges &trail) {
  return lead.from_flags(h->charClass, kLeadBit) && trail.from_flags(h->charClass, kTrailBit);
}

}  // namespace

Counted count_dbcs(Isa isa, const NLSSMHandle *h, const uint8_t *p, int64_t n, int64_t flags) {
  const DbcsModel model(h);
  simd::ByteRanges lead, trail;
  if (isa == Isa::kScalar || n < 128 || !dbcs_ranges(h, lead, trail))
    return count_model_exact(model, p, n, flags);
  Counted total{0, 0};
  int64_t pos = 0;
  while (pos < n) {
    const Prefix prefix = simd::dbcs_prefix(isa, p + pos, n - pos, INT64_MAX, lead, trail);
    total.chars += prefix.chars;
    pos += prefix.bytes;
    if (pos >= n) break;
    // A stretch by the exact rule, ending on a character start.
    const int64_t end = std::min(n, pos + 64);
    int64_t off = pos;
    while (off < end) {
      const Unit u = model.unit(p + off, n - off, 0);
      if (u.broken) {
        total.status = kBadCharacter;
        if ((flags & kSkipBroken) != 0) {
          off += 2;
          continue;
        }
        off += 1;
      } else {
        off += u.size;
      }
      ++total.chars;
    }
    pos = std::min(off, n);
  }
  return total;
}

int64_t bytes_of_utf8(Isa isa, const uint8_t *p, int64_t count) {
  int64_t off = 0;
  if (isa != Isa::kScalar && count > 256) {
    const Prefix prefix = simd::utf8_prefix(isa, p, INT64_MAX, count);
    off = prefix.bytes;
    count -= prefix.chars;
  }
  // Single ASCII bytes, then the toolkit for the rest.
  while (count > 0 && p[off] < 0x80) {
    ++off;
    --count;
  }
  return off + qvzsu8ByteLength(p + off, count);
}

int64_t bytes_of_wcs2(Isa isa, const uint8_t *p, int64_t count, bool big_endian) {
  int64_t off = 0;
  if (isa != Isa::kScalar) {
    const Prefix prefix = simd::wcs2_prefix(isa, p, INT64_MAX, count, big_endian);
    off = prefix.bytes;
    count -= prefix.chars;
  }
  for (; count > 0; --count) {
    off +=
        big_endian ? Wcs2Model<true>().step(p + off, 4, 0) : Wcs2Model<false>().step(p + off, 4, 0);
  }
  return off;
}

int64_t bytes_of_dbcs(Isa isa, const NLSSMHandle *h, const uint8_t *p, int64_t count) {
  int64_t off = 0;
  simd::ByteRanges lead, trail;
  if (isa != Isa::kScalar && dbcs_ranges(h, lead, trail)) {
    const Prefix prefix = simd::dbcs_prefix(isa, p, INT64_MAX, count, lead, trail);
    off = prefix.bytes;
    count -= prefix.chars;
  }
  const DbcsModel model(h);
  for (; count > 0; --count) off += model.unit(p + off, 2, 0).size;
  return off;
}

namespace {

constexpr int64_t kNoLimit = INT64_MAX;

uint32_t modal_state_of(const NLSString *s) {
  return modal_double(s->charKind) ? kModalDouble : kModalSingle;
}

// ---- Shared shapes of the members ----------------------------------------

using module::store;

// NLSNumChars: from the current character to the end, through the class's
// raw-buffer rule (`state`: the modal shift state at the current character).
template <typename CountS>
int64_t num_chars(const NLSString *s, int64_t *count, CountS count_s) {
  store(count, 0);
  if (s == nullptr || s->buffer == nullptr || count == nullptr) return kNullArgument;
  const auto length = static_cast<int64_t>(s->length);
  if (s->curOffset < 0 || s->curOffset >= length) return 0;
  return count_s(s->buffer + s->curOffset, length - s->curOffset, count);
}

template <typename Fn>
int64_t num_chars_s(const uint8_t *p, int64_t n, int64_t *count, Fn fn) {
  store(count, 0);
  if (p == nullptr || count == nullptr) return kNullArgument;
  if (n <= 0) return 0;
  const Counted c = fn(p, n);
  *count = c.chars;
  return c.status;
}

int64_t strlen8(const uint8_t *p) {
  return static_cast<int64_t>(std::strlen(reinterpret_cast<const char *>(p)));
}

int64_t units_to_zero(const uint8_t *p, int64_t width, int64_t limit) {
  static constexpr uint8_t kZero[4] = {0, 0, 0, 0};
  int64_t units = 0;
  while ((units + 1) * width <= limit &&
         std::memcmp(p + units * width, kZero, static_cast<size_t>(width)) != 0)
    ++units;
  return units;
}

// Walks whole characters of a model until a zero byte at a character start
// or `limit`; a broken character, or one that would cross the limit, stops
// the walk with the bad-character status.
template <class M>
int64_t walk_to_zero(const M &m, const uint8_t *p, int64_t limit, int64_t *chars_out,
                     int64_t *bytes_out) {
  int64_t chars = 0;
  int64_t off = 0;
  int64_t status = 0;
  uint32_t state = kModalSingle;
  for (;;) {
    int64_t at = off;
    m.skip_shifts(p, at, limit, state);
    if (at >= limit || p[at] == 0) {
      off = at;  // shift sequences before the end belong to the text
      break;
    }
    // The character's bytes up to a terminator or the limit.
    int64_t room = 1;
    while (room < 4 && at + room < limit && p[at + room] != 0) ++room;
    const Unit u = m.unit(p + at, room, state);
    if (u.broken) {
      status = kBadCharacter;
      break;
    }
    state = m.kind(u.size, state);
    off = at + u.size;
    ++chars;
  }
  store(chars_out, chars);
  store(bytes_out, off);
  return status;
}

// Trailing bytes of the last character when the text ends inside it (the
// announced length runs past the end), found by walking back over
// continuation bytes from the end to `from`.
template <typename IsTrailing, typename LengthOf>
int64_t incomplete_tail(const uint8_t *p, int64_t from, int64_t end, IsTrailing trailing,
                        LengthOf length_of) {
  int64_t k = end - 1;
  while (k > from && trailing(p[k])) --k;
  if (trailing(p[k])) return 0;
  const int64_t announced = length_of(p[k]);
  return announced > end - k ? end - k : 0;
}

// NLSStringByteLength for the UTF forms: with a limit, step over at most
// `limit` characters by their lead bytes, taking only continuation bytes;
// without one, the remaining bytes less an incomplete last character.
template <typename IsTrailing, typename LengthOf>
int64_t utf_byte_length(const NLSString *s, int64_t limit, IsTrailing trailing,
                        LengthOf length_of) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return 0;
  const auto length = static_cast<int64_t>(s->length);
  const int64_t start = s->curOffset;
  if (start >= length) return 0;
  const uint8_t *p = s->buffer;
  if (limit <= 0) {
    const uint8_t last = p[length - 1];
    if (!trailing(last) && length_of(last) == 1) return length - start;
    return length - start - incomplete_tail(p, start, length, trailing, length_of);
  }
  int64_t off = start;
  for (int64_t n = 0; n < limit && off < length; ++n) {
    const int64_t announced = std::max<int64_t>(1, length_of(p[off]));
    if (off + announced > length) break;
    const int64_t end = off + announced;
    ++off;
    while (off < end && trailing(p[off])) ++off;
  }
  return off - start;
}

// NLSStringByteLength for the modal and class-5 models: whole characters
// only; without a limit, the remaining bytes unless the text ends inside
// its last character.
template <class M>
int64_t model_byte_length(const M &m, const NLSString *s, int64_t limit) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return 0;
  const auto length = static_cast<int64_t>(s->length);
  const int64_t start = s->curOffset;
  if (start >= length) return 0;
  uint32_t state = modal_state_of(s);
  int64_t off = start;
  int64_t end_of_last = start;
  for (int64_t n = 0; limit <= 0 || n < limit; ++n) {
    m.skip_shifts(s->buffer, off, length, state);
    if (off >= length) break;
    const Unit u = m.unit(s->buffer + off, length - off, state);
    if (u.broken && off + 1 == length) return (limit <= 0 ? off : end_of_last) - start;
    state = m.kind(u.size, state);
    off += u.size;
    end_of_last = off;
  }
  if (limit > 0 && end_of_last > start) m.skip_shifts(s->buffer, end_of_last, length, state);
  return (limit <= 0 ? length : end_of_last) - start;
}

// Byte length without trailing blank characters, walking forward (the
// multi-byte classes, whose bytes cannot be read backwards). Shift
// sequences right after the last kept character stay with it.
template <class M>
int64_t trimmed_forward(const M &m, const NLSSMHandle *h, const uint8_t *p, int64_t n) {
  const uint8_t blank = h->blankChar[0];
  uint32_t state = kModalSingle;
  int64_t off = 0;
  int64_t keep = 0;
  for (;;) {
    const int64_t before = off;
    m.skip_shifts(p, off, n, state);
    if (off > before && keep == before) keep = off;
    if (off >= n) break;
    const Unit u = m.unit(p + off, n - off, state);
    bool is_blank = p[off] == blank;
    for (int64_t k = 1; k < u.size; ++k) is_blank = is_blank && p[off + k] == blank;
    state = m.kind(u.size, state);
    off += u.size;
    if (!is_blank) keep = off;
  }
  return keep;
}

int64_t trimmed_backward(const uint8_t *p, int64_t n, const uint8_t *blank, int64_t width) {
  int64_t end = n - n % width;
  if (end != n) return n;
  while (end >= width && std::memcmp(p + end - width, blank, static_cast<size_t>(width)) == 0)
    end -= width;
  return end;
}

template <class M>
int64_t dbcs_string_len(const M &m, const uint8_t *p, int64_t n, int64_t chars) {
  if (p == nullptr || n <= 0 || chars <= 0) return 0;
  int64_t off = 0;
  for (int64_t k = 0; k < chars && off < n; ++k) off += m.unit(p + off, n - off, 0).size;
  return off;
}

// NLSStringBLength of a model walked character by character; a negative
// count means the whole text up to its terminating zero byte. With count 0
// a leading shift sequence is not taken.
template <class M>
int64_t model_blength(const M &m, const uint8_t *p, int64_t count) {
  if (p == nullptr) return 0;
  if (count < 0) {
    int64_t bytes = 0;
    walk_to_zero(m, p, kNoLimit, nullptr, &bytes);
    return bytes;
  }
  uint32_t state = kModalSingle;
  int64_t off = 0;
  for (int64_t k = 0; k < count; ++k) {
    m.skip_shifts(p, off, kNoLimit, state);
    const Unit u = m.unit(p + off, 4, state);
    state = m.kind(u.size, state);
    off += u.size;
  }
  // Shift sequences after the last character go with it, so the answer is
  // where the next character starts.
  if (count > 0 && M::kModal && p[off] != 0) m.skip_shifts(p, off, kNoLimit, state);
  return off;
}

template <class M>
Counted model_counter(const NLSSMHandle *h, const uint8_t *p, int64_t n, int64_t flags,
                      uint32_t state = kModalSingle) {
  return count_model_exact(M(h), p, n, flags, state);
}

bool big_wcs2(const NLSSMHandle *h) {
  return h->encodingNumber == NLSSM_ENC_WCS2_BE;
}

}  // namespace
}  // namespace nlssm::cursor

using namespace nlssm::cursor;

// ---- NLSNumCharsS --------------------------------------------------------

extern "C" int64_t NLSNumCharsS_SBCS(const NLSSMHandle *, const uint8_t *p, int64_t n, int64_t,
                                     int64_t *count) {
  return num_chars_s(p, n, count, [](const uint8_t *, int64_t bytes) { return Counted{bytes, 0}; });
}

extern "C" int64_t NLSNumCharsS_WCS4(const NLSSMHandle *h, const uint8_t *p, int64_t n, int64_t,
                                     int64_t *count) {
  const int64_t width = h->unitWidth == 0 ? 4 : h->unitWidth;
  return num_chars_s(p, n, count, [width](const uint8_t *, int64_t bytes) {
    return Counted{bytes / width, 0};
  });
}

extern "C" int64_t NLSNumCharsS_WCS2(const NLSSMHandle *h, const uint8_t *p, int64_t n, int64_t,
                                     int64_t *count) {
  const bool big = big_wcs2(h);
  return num_chars_s(p, n, count, [big](const uint8_t *q, int64_t bytes) {
    return Counted{count_wcs2(active_isa(), q, bytes, big), 0};
  });
}

extern "C" int64_t NLSNumCharsS_UTF8(const NLSSMHandle *, const uint8_t *p, int64_t n,
                                     int64_t flags, int64_t *count) {
  return num_chars_s(p, n, count, [flags](const uint8_t *q, int64_t bytes) {
    return count_utf8(active_isa(), q, bytes, flags);
  });
}

extern "C" int64_t NLSNumCharsS_UTFE(const NLSSMHandle *, const uint8_t *p, int64_t n,
                                     int64_t flags, int64_t *count) {
  return num_chars_s(p, n, count, [flags](const uint8_t *q, int64_t bytes) {
    return count_utf_exact<true>(q, bytes, flags);
  });
}

extern "C" int64_t NLSNumCharsS_MBCS_modal(const NLSSMHandle *h, const uint8_t *p, int64_t n,
                                           int64_t flags, int64_t *count) {
  return num_chars_s(p, n, count, [h, flags](const uint8_t *q, int64_t bytes) {
    return model_counter<ModalModel>(h, q, bytes, flags);
  });
}

extern "C" int64_t NLSNumCharsS_MBCS_nonmodal(const NLSSMHandle *h, const uint8_t *p, int64_t n,
                                              int64_t flags, int64_t *count) {
  return num_chars_s(p, n, count, [h, flags](const uint8_t *q, int64_t bytes) {
    return count_dbcs(active_isa(), h, q, bytes, flags);
  });
}

extern "C" int64_t NLSNumCharsS_MBCS_EUC_JP(const NLSSMHandle *h, const uint8_t *p, int64_t n,
                                            int64_t flags, int64_t *count) {
  return num_chars_s(p, n, count, [h, flags](const uint8_t *q, int64_t bytes) {
    return model_counter<EucJpModel>(h, q, bytes, flags);
  });
}

extern "C" int64_t NLSNumCharsS_MBCS_EUC_TW(const NLSSMHandle *h, const uint8_t *p, int64_t n,
                                            int64_t flags, int64_t *count) {
  return num_chars_s(p, n, count, [h, flags](const uint8_t *q, int64_t bytes) {
    return model_counter<EucTwModel>(h, q, bytes, flags);
  });
}

extern "C" int64_t NLSNumCharsS_MBCS_GB18030(const NLSSMHandle *h, const uint8_t *p, int64_t n,
                                             int64_t flags, int64_t *count) {
  return num_chars_s(p, n, count, [h, flags](const uint8_t *q, int64_t bytes) {
    return model_counter<Gb18030Model>(h, q, bytes, flags);
  });
}

// ---- NLSNumChars ---------------------------------------------------------

#define NLSSM_NUM_CHARS_FROM_S(suffix)                                                             \
  extern "C" int64_t NLSNumChars_##suffix(const NLSSMHandle *h, const NLSString *s, int64_t flags, \
                                          int64_t *count) {                                        \
    return num_chars(s, count, [h, flags](const uint8_t *p, int64_t n, int64_t *out) {             \
      return NLSNumCharsS_##suffix(h, p, n, flags, out);                                           \
    });                                                                                            \
  }

NLSSM_NUM_CHARS_FROM_S(SBCS)
NLSSM_NUM_CHARS_FROM_S(UTF8)
NLSSM_NUM_CHARS_FROM_S(UTFE)
NLSSM_NUM_CHARS_FROM_S(WCS2)
NLSSM_NUM_CHARS_FROM_S(WCS4)
NLSSM_NUM_CHARS_FROM_S(MBCS_nonmodal)
NLSSM_NUM_CHARS_FROM_S(MBCS_EUC_JP)
NLSSM_NUM_CHARS_FROM_S(MBCS_EUC_TW)
NLSSM_NUM_CHARS_FROM_S(MBCS_GB18030)
#undef NLSSM_NUM_CHARS_FROM_S

// Counts from the current character in the shift state it was reached in.
extern "C" int64_t NLSNumChars_MBCS_modal(const NLSSMHandle *h, const NLSString *s, int64_t flags,
                                          int64_t *count) {
  return num_chars(s, count, [h, s, flags](const uint8_t *p, int64_t n, int64_t *out) {
    const Counted c = model_counter<ModalModel>(h, p, n, flags, modal_state_of(s));
    *out = c.chars;
    return c.status;
  });
}

// ---- NLSStringLength -----------------------------------------------------

extern "C" int64_t NLSStringLength_SBCS(const NLSSMHandle *, const uint8_t *text,
                                        int64_t *charCount, int64_t *byteCount, int64_t) {
  store(charCount, 0);
  store(byteCount, 0);
  if (text == nullptr) return kNullArgument;
  const int64_t n = strlen8(text);
  store(charCount, n);
  store(byteCount, n);
  return 0;
}

extern "C" int64_t NLSStringLength_WCS4(const NLSSMHandle *, const uint8_t *text,
                                        int64_t *charCount, int64_t *byteCount, int64_t) {
  store(charCount, 0);
  store(byteCount, 0);
  if (text == nullptr) return kNullArgument;
  const int64_t units = units_to_zero(text, 4, kNoLimit);
  store(charCount, units);
  store(byteCount, units * 4);
  return 0;
}

// WCS2 text up to its zero unit or the byte limit: surrogate pairs count once.
static int64_t wcs2_length(const NLSSMHandle *h, const uint8_t *text, int64_t byteLimit,
                           int64_t *charCount, int64_t *byteCount) {
  store(charCount, 0);
  store(byteCount, 0);
  if (text == nullptr) return kNullArgument;
  const int64_t bytes = units_to_zero(text, 2, byteLimit) * 2;
  store(charCount, count_wcs2(active_isa(), text, bytes, big_wcs2(h)));
  store(byteCount, bytes);
  return 0;
}

extern "C" int64_t NLSStringLength_WCS2(const NLSSMHandle *h, const uint8_t *text,
                                        int64_t *charCount, int64_t *byteCount, int64_t) {
  return wcs2_length(h, text, kNoLimit, charCount, byteCount);
}

// Counts the characters of n bytes by a lead-byte length table (0 = cannot
// start a character); a bad or cut-off character ends the count.
template <typename Table>
static int64_t count_by_lead_table(const uint8_t *text, int64_t n, const Table &lengths,
                                   int64_t *charCount) {
  int64_t chars = 0;
  int64_t status = 0;
  for (int64_t off = 0; off < n; ++chars) {
    const int64_t size = lengths[text[off]];
    if (size == 0 || off + size > n) {
      status = kBadCharacter;
      break;
    }
    off += size;
  }
  store(charCount, chars);
  return status;
}

// The byte length runs to the first zero byte; the characters are walked by
// the lead-length table. With flags and no character count wanted, only
// the tail is checked: an incomplete last character is left out of the
// byte count.
extern "C" int64_t NLSStringLength_UTF8(const NLSSMHandle *, const uint8_t *text,
                                        int64_t *charCount, int64_t *byteCount, int64_t flags) {
  store(charCount, 0);
  store(byteCount, 0);
  if (text == nullptr) return kNullArgument;
  const int64_t n = strlen8(text);
  if (flags != 0 && charCount == nullptr) {
    if (n == 0) return 0;
    int64_t k = n - 1;
    while (k > 0 && utf8_continuation(text[k])) --k;
    if (utf8_continuation(text[k])) return kBadCharacter;
    if (kUtf8FormLength[text[k]] > n - k) {
      store(byteCount, k);
      return kBadCharacter;
    }
    store(byteCount, n);
    return 0;
  }
  store(byteCount, n);
  return count_by_lead_table(text, n, kUtf8LeadLength, charCount);
}

extern "C" int64_t NLSStringLength_UTFE(const NLSSMHandle *, const uint8_t *text,
                                        int64_t *charCount, int64_t *byteCount, int64_t) {
  store(charCount, 0);
  store(byteCount, 0);
  if (text == nullptr) return kNullArgument;
  const int64_t n = strlen8(text);
  store(byteCount, n);
  return count_by_lead_table(text, n, kSkipUtfe, charCount);
}

#define NLSSM_LENGTH_BY_MODEL(suffix, Model)                                                     \
  extern "C" int64_t NLSStringLength_##suffix(const NLSSMHandle *h, const uint8_t *text,         \
                                              int64_t *charCount, int64_t *byteCount, int64_t) { \
    store(charCount, 0);                                                                         \
    store(byteCount, 0);                                                                         \
    if (text == nullptr) return kNullArgument;                                                   \
    return walk_to_zero(Model(h), text, kNoLimit, charCount, byteCount);                         \
  }                                                                                              \
  extern "C" int64_t NLSStringNLength_##suffix(const NLSSMHandle *h, const uint8_t *text,        \
                                               int64_t byteLimit, int64_t *charCount,            \
                                               int64_t *byteCount) {                             \
    store(charCount, 0);                                                                         \
    store(byteCount, 0);                                                                         \
    if (text == nullptr) return kNullArgument;                                                   \
    return walk_to_zero(Model(h), text, std::max<int64_t>(byteLimit, 0), charCount, byteCount);  \
  }

NLSSM_LENGTH_BY_MODEL(MBCS_modal, ModalModel)
NLSSM_LENGTH_BY_MODEL(MBCS_nonmodal, DbcsModel)
NLSSM_LENGTH_BY_MODEL(MBCS_EUC_JP, EucJpModel)
NLSSM_LENGTH_BY_MODEL(MBCS_EUC_TW, EucTwModel)
NLSSM_LENGTH_BY_MODEL(MBCS_GB18030, Gb18030Model)
#undef NLSSM_LENGTH_BY_MODEL

// ---- NLSStringNLength ----------------------------------------------------

extern "C" int64_t NLSStringNLength_SBCS(const NLSSMHandle *, const uint8_t *text,
                                         int64_t byteLimit, int64_t *charCount,
                                         int64_t *byteCount) {
  store(charCount, 0);
  store(byteCount, 0);
  if (text == nullptr) return kNullArgument;
  int64_t n = 0;
  while (n < byteLimit && text[n] != 0) ++n;
  store(charCount, n);
  store(byteCount, n);
  return 0;
}

extern "C" int64_t NLSStringNLength_WCS4(const NLSSMHandle *, const uint8_t *text,
                                         int64_t byteLimit, int64_t *charCount,
                                         int64_t *byteCount) {
  store(charCount, 0);
  store(byteCount, 0);
  if (text == nullptr) return kNullArgument;
  const int64_t units = units_to_zero(text, 4, byteLimit);
  store(charCount, units);
  store(byteCount, units * 4);
  return 0;
}

extern "C" int64_t NLSStringNLength_WCS2(const NLSSMHandle *h, const uint8_t *text,
                                         int64_t byteLimit, int64_t *charCount,
                                         int64_t *byteCount) {
  return wcs2_length(h, text, byteLimit, charCount, byteCount);
}

// A character counts only when its last byte lies inside the limit and
// before the terminating zero byte; no byte after that zero is read.
extern "C" int64_t NLSStringNLength_UTF8(const NLSSMHandle *, const uint8_t *text,
                                         int64_t byteLimit, int64_t *charCount,
                                         int64_t *byteCount) {
  store(charCount, 0);
  store(byteCount, 0);
  if (text == nullptr) return kNullArgument;
  int64_t off = 0;
  int64_t chars = 0;
  int64_t status = 0;
  while (off < byteLimit && text[off] != 0) {
    const int64_t size = kUtf8LeadLength[text[off]];
    int64_t whole = 1;
    while (whole < size && off + whole < byteLimit && text[off + whole] != 0) ++whole;
    if (size == 0 || whole < size) {
      status = kBadCharacter;
      break;
    }
    off += size;
    ++chars;
  }
  store(charCount, chars);
  store(byteCount, off);
  return status;
}

// ---- NLSStringBLength ----------------------------------------------------
// A negative count measures the whole text up to its terminating zero unit.

extern "C" int64_t NLSStringBLength_SBCS(const NLSSMHandle *, const uint8_t *text,
                                         int64_t charCount) {
  if (charCount >= 0) return charCount;
  return text == nullptr ? 0 : strlen8(text);
}

extern "C" int64_t NLSStringBLength_WCS4(const NLSSMHandle *, const uint8_t *text,
                                         int64_t charCount) {
  if (charCount >= 0) return charCount * 4;
  return text == nullptr ? 0 : units_to_zero(text, 4, kNoLimit) * 4;
}

extern "C" int64_t NLSStringBLength_WCS2(const NLSSMHandle *h, const uint8_t *text,
                                         int64_t charCount) {
  if (text == nullptr) return 0;
  if (charCount < 0) return units_to_zero(text, 2, kNoLimit) * 2;
  return bytes_of_wcs2(active_isa(), text, charCount, big_wcs2(h));
}

extern "C" int64_t NLSStringBLength_UTF8(const NLSSMHandle *, const uint8_t *text,
                                         int64_t charCount) {
  if (text == nullptr) return 0;
  if (charCount < 0) return qvzsu8ByteLength(text, charCount);
  return bytes_of_utf8(active_isa(), text, charCount);
}

extern "C" int64_t NLSStringBLength_MBCS_modal(const NLSSMHandle *h, const uint8_t *text,
                                               int64_t charCount) {
  return model_blength(ModalModel(h), text, charCount);
}

extern "C" int64_t NLSStringBLength_MBCS_nonmodal(const NLSSMHandle *h, const uint8_t *text,
                                                  int64_t charCount) {
  if (text == nullptr) return 0;
  if (charCount < 0) return model_blength(DbcsModel(h), text, charCount);
  return bytes_of_dbcs(active_isa(), h, text, charCount);
}

extern "C" int64_t NLSStringBLength_MBCS_EUC_JP(const NLSSMHandle *h, const uint8_t *text,
                                                int64_t charCount) {
  return model_blength(EucJpModel(h), text, charCount);
}

extern "C" int64_t NLSStringBLength_MBCS_EUC_TW(const NLSSMHandle *h, const uint8_t *text,
                                                int64_t charCount) {
  return model_blength(EucTwModel(h), text, charCount);
}

extern "C" int64_t NLSStringBLength_MBCS_GB18030(const NLSSMHandle *h, const uint8_t *text,
                                                 int64_t charCount) {
  return model_blength(Gb18030Model(h), text, charCount);
}

// ---- NLSStringByteLength -------------------------------------------------

extern "C" int64_t NLSStringByteLength_SBCS(const NLSSMHandle *, const NLSString *s,
                                            int64_t charLimit) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return 0;
  const int64_t remaining = std::max<int64_t>(0, static_cast<int64_t>(s->length) - s->curOffset);
  return charLimit <= 0 || charLimit >= remaining ? remaining : charLimit;
}

extern "C" int64_t NLSStringByteLength_WCS4(const NLSSMHandle *, const NLSString *s,
                                            int64_t charLimit) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return 0;
  const int64_t remaining = std::max<int64_t>(0, static_cast<int64_t>(s->length) - s->curOffset);
  if (charLimit <= 0) return remaining;
  return charLimit < remaining / 4 ? charLimit * 4 : remaining;
}

extern "C" int64_t NLSStringByteLength_WCS2(const NLSSMHandle *h, const NLSString *s,
                                            int64_t charLimit) {
  if (s == nullptr || s->buffer == nullptr || s->curOffset < 0) return 0;
  const auto length = static_cast<int64_t>(s->length);
  const uint8_t *p = s->buffer;
  const bool big = big_wcs2(h);
  int64_t off = s->curOffset;
  for (int64_t n = 0; (charLimit <= 0 || n < charLimit) && off + 2 <= length; ++n)
    off += big ? Wcs2Model<true>().step(p + off, length - off, 0)
               : Wcs2Model<false>().step(p + off, length - off, 0);
  return std::max<int64_t>(0, off - s->curOffset);
}

extern "C" int64_t NLSStringByteLength_UTF8(const NLSSMHandle *, const NLSString *s,
                                            int64_t charLimit) {
  return utf_byte_length(
      s, charLimit, [](uint8_t b) { return utf8_continuation(b); },
      [](uint8_t b) { return int64_t{kUtf8FormLength[b]}; });
}

extern "C" int64_t NLSStringByteLength_UTFE(const NLSSMHandle *, const NLSString *s,
                                            int64_t charLimit) {
  return utf_byte_length(
      s, charLimit, [](uint8_t b) { return utfe_trailing(b); },
      [](uint8_t b) { return int64_t{kSkipUtfe[b]}; });
}

extern "C" int64_t NLSStringByteLength_MBCS_modal(const NLSSMHandle *h, const NLSString *s,
                                                  int64_t charLimit) {
  return model_byte_length(ModalModel(h), s, charLimit);
}
extern "C" int64_t NLSStringByteLength_MBCS_nonmodal(const NLSSMHandle *h, const NLSString *s,
                                                     int64_t charLimit) {
  return model_byte_length(DbcsModel(h), s, charLimit);
}
extern "C" int64_t NLSStringByteLength_MBCS_EUC_JP(const NLSSMHandle *h, const NLSString *s,
                                                   int64_t charLimit) {
  return model_byte_length(EucJpModel(h), s, charLimit);
}
extern "C" int64_t NLSStringByteLength_MBCS_EUC_TW(const NLSSMHandle *h, const NLSString *s,
                                                   int64_t charLimit) {
  return model_byte_length(EucTwModel(h), s, charLimit);
}
extern "C" int64_t NLSStringByteLength_MBCS_GB18030(const NLSSMHandle *h, const NLSString *s,
                                                    int64_t charLimit) {
  return model_byte_length(Gb18030Model(h), s, charLimit);
}

// ---- NLSStringByteLengthC ------------------------------------------------
// Flag bits 0 and 1 ask for the length without trailing blanks.

extern "C" int64_t NLSStringByteLengthC_SBCS(const NLSSMHandle *h, const uint8_t *p,
                                             int64_t byteLength, int64_t flags) {
  if ((flags & 3) == 0 || p == nullptr || byteLength <= 0) return byteLength;
  return trimmed_backward(p, byteLength, h->blankChar, 1);
}

extern "C" int64_t NLSStringByteLengthC_UTF8(const NLSSMHandle *h, const uint8_t *p,
                                             int64_t byteLength, int64_t flags) {
  // The blank byte is never part of a longer character in UTF-8 or
  // UTF-EBCDIC, so blanks can be trimmed from the end.
  if ((flags & 3) == 0 || p == nullptr || byteLength <= 0) return byteLength;
  return trimmed_backward(p, byteLength, h->blankChar, 1);
}

extern "C" int64_t NLSStringByteLengthC_WCS2(const NLSSMHandle *h, const uint8_t *p,
                                             int64_t byteLength, int64_t flags) {
  if ((flags & 3) == 0 || p == nullptr || byteLength <= 0) return byteLength;
  return trimmed_backward(p, byteLength, h->blankChar, 2);
}

extern "C" int64_t NLSStringByteLengthC_WCS4(const NLSSMHandle *h, const uint8_t *p,
                                             int64_t byteLength, int64_t flags) {
  if ((flags & 3) == 0 || p == nullptr || byteLength <= 0) return byteLength;
  return trimmed_backward(p, byteLength, h->blankChar, 4);
}

#define NLSSM_BYTE_LENGTH_C_BY_MODEL(suffix, Model)                                        \
  extern "C" int64_t NLSStringByteLengthC_##suffix(const NLSSMHandle *h, const uint8_t *p, \
                                                   int64_t byteLength, int64_t flags) {    \
    if ((flags & 3) == 0 || p == nullptr || byteLength <= 0) return byteLength;            \
    return trimmed_forward(Model(h), h, p, byteLength);                                    \
  }

NLSSM_BYTE_LENGTH_C_BY_MODEL(MBCS_modal, ModalModel)
NLSSM_BYTE_LENGTH_C_BY_MODEL(MBCS_nonmodal, DbcsModel)
NLSSM_BYTE_LENGTH_C_BY_MODEL(MBCS_EUC_JP, EucJpModel)
NLSSM_BYTE_LENGTH_C_BY_MODEL(MBCS_EUC_TW, EucTwModel)
NLSSM_BYTE_LENGTH_C_BY_MODEL(MBCS_GB18030, Gb18030Model)
#undef NLSSM_BYTE_LENGTH_C_BY_MODEL

// ---- Double-byte length helpers -------------------------------------------
// Bytes of the first `chars` characters, never past `byteLength`.

extern "C" int64_t getDBCSStringLen_MBCS_nonmodal(const NLSSMHandle *h, const uint8_t *p,
                                                  int64_t byteLength, int64_t chars) {
  return dbcs_string_len(DbcsModel(h), p, byteLength, chars);
}
extern "C" int64_t getDBCSStringLen_MBCS_EUC_JP(const NLSSMHandle *h, const uint8_t *p,
                                                int64_t byteLength, int64_t chars) {
  return dbcs_string_len(EucJpModel(h), p, byteLength, chars);
}
extern "C" int64_t getDBCSStringLen_MBCS_EUC_TW(const NLSSMHandle *h, const uint8_t *p,
                                                int64_t byteLength, int64_t chars) {
  return dbcs_string_len(EucTwModel(h), p, byteLength, chars);
}
extern "C" int64_t getDBCSStringLen_MBCS_GB18030(const NLSSMHandle *h, const uint8_t *p,
                                                 int64_t byteLength, int64_t chars) {
  return dbcs_string_len(Gb18030Model(h), p, byteLength, chars);
}
