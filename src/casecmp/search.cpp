// Searching: the first occurrence of a pattern (Index, Contains), of one
// character (FindChar), and the first character outside a set (Verify).
// Every search reports a position counted in characters from where the
// scan starts, and a match is always a run of whole characters of the
// text: it starts at a character start and ends at one.
#include <nlssm/nlssm.h>

#include <type_traits>

#include "casecmp/search_vector.hpp"
#include "casecmp/text_walk.hpp"
#include "cursor/count_vector.hpp"
#include "cursor/counting.hpp"
#include "module/literal.hpp"

namespace nlssm::casecmp {
namespace {

using cursor::DbcsModel;
using cursor::EucJpModel;
using cursor::EucTwModel;
using cursor::FixedModel;
using cursor::Gb18030Model;
using cursor::ModalModel;
using cursor::SbcsModel;
using cursor::Utf8StepModel;
using cursor::Wcs2Model;
using Utf8Model = Utf8StepModel;

template <class M>
inline constexpr bool kIsWcs2 =
    std::is_same_v<M, Wcs2Model<true>> || std::is_same_v<M, Wcs2Model<false>>;

// ---- Pattern search --------------------------------------------------------

// Character by character: the text's characters from each start compared
// with the pattern's. Modal text needs it (the same bytes mean different
// characters in single- and double-byte mode).
template <class M>
int64_t index_naive(const M &m, TextSpan s, TextSpan p) {
  Walk<M> w(m, s.p, s.n, 0, s.state);
  for (int64_t index = 0; !w.done(); w.next(), ++index) {
    Walk<M> a = w;
    Walk<M> b(m, p.p, p.n, 0, p.state);
    while (!a.done() && !b.done() && same_char(s.p, a.current(), p.p, b.current())) {
      a.next();
      b.next();
    }
    if (b.done()) return index;
    if (a.done()) return -1;
  }
  return -1;
}

// Moves the walk to the character start at or after `target`. Well-formed
// UTF-8 is crossed a register at a time.
template <class M>
void advance(Walk<M> &w, int64_t target, int64_t &index) {
  if constexpr (std::is_same_v<M, Utf8Model>) {
    const cursor::simd::Isa isa = cursor::active_isa();
    while (w.offset() < target && !w.done()) {
      if (target - w.offset() >= 64) {
        const auto prefix =
            cursor::simd::utf8_prefix(isa, w.base() + w.offset(), target - w.offset(), INT64_MAX);
        if (prefix.bytes > 0) {
          w.skip_bytes(prefix.bytes);
          index += prefix.chars;
          continue;
        }
      }
      w.next();
      ++index;
    }
  } else {
    w.advance_to(target, index);
  }
}

// True when the text's characters from the walk's position end exactly at
// `end` (the match does not stop inside a character).
template <class M>
bool ends_on_boundary(Walk<M> w, int64_t end) {
  while (w.offset() < end && !w.done()) w.next();
  return w.offset() == end;
}

// The character index of the first match of pattern p (at least one byte)
// in text s (at least one character), or -1. Candidates come from the
// vector byte search and are kept only on character boundaries.
template <class M>
int64_t index_in(const M &m, TextSpan s, TextSpan p) {
  if constexpr (M::kModal) {
    return index_naive(m, s, p);
  } else if constexpr (std::is_same_v<M, SbcsModel>) {
    return simd::find_bytes(s.p, s.n, p.p, p.n, 1, 0);
  } else if constexpr (std::is_same_v<M, FixedModel>) {
    if (p.n % m.width != 0) return index_naive(m, s, p);
    const int64_t q = simd::find_bytes(s.p, s.n, p.p, p.n, m.width, 0);
    return q < 0 ? -1 : q / m.width;
  } else if constexpr (kIsWcs2<M>) {
    if (p.n % 2 != 0) return index_naive(m, s, p);
    constexpr bool kBig = std::is_same_v<M, Wcs2Model<true>>;
    auto unit = [&](int64_t at) { return Wcs2Model<kBig>::unit_at(s.p + at); };
    for (int64_t from = 0;;) {
      const int64_t q = simd::find_bytes(s.p, s.n, p.p, p.n, 2, from);
      if (q < 0) return -1;
      const int64_t end = q + p.n;
      const bool splits_start = q >= 2 && M::high(unit(q - 2)) && M::low(unit(q));
      const bool splits_end = end + 2 <= s.n && M::high(unit(end - 2)) && M::low(unit(end));
      if (!splits_start && !splits_end)
        return cursor::count_wcs2(cursor::active_isa(), s.p, q, kBig);
      from = q + 2;
    }
  } else {
    Walk<M> w(m, s.p, s.n);
    int64_t index = 0;
    for (int64_t from = 0;;) {
      const int64_t q = simd::find_bytes(s.p, s.n, p.p, p.n, 1, from);
      if (q < 0) return -1;
      advance(w, q, index);
      if (w.offset() == q && ends_on_boundary(w, q + p.n)) return index;
      from = q + 1;
    }
  }
}

// Texts measured, with the rules every Index form shares: no text
// character gives -1, an empty pattern is found at the start.
template <class M>
int64_t index_spans(const M &m, TextSpan s, TextSpan p) {
  if (Walk<M>(m, s.p, s.n, 0, s.state).done()) return -1;
  if (p.n == 0) return 0;
  return index_in(m, s, p);
}

template <class M>
int64_t index_plain(const NLSSMHandle *h, const NLSString *s, const NLSString *p,
                    int64_t patternChars) {
  TextSpan ts = from_current(s);
  TextSpan ps = from_current(p);
  if (!ts.valid || !ps.valid) return -1;
  const M m(h);
  ps.n = span_of(m, ps.p, ps.n, patternChars, ps.state);
  return index_spans(m, ts, ps);
}

// Raw buffers: lengths in bytes, or (kChars) in characters.
template <class M, bool kChars>
int64_t index_raw(const NLSSMHandle *h, const uint8_t *s, int64_t sLength, const uint8_t *p,
                  int64_t pLength) {
  if (pLength == 0) return 0;
  if (sLength <= 0 || pLength < 0 || s == nullptr || p == nullptr) return -1;
  const M m(h);
  TextSpan ts{s, sLength, kModalSingle, true};
  TextSpan ps{p, pLength, kModalSingle, true};
  if constexpr (kChars) {
    ts.n = span_of(m, s, kUnbounded, sLength, kModalSingle);
    ps.n = span_of(m, p, kUnbounded, pLength, kModalSingle);
  }
  return index_spans(m, ts, ps);
}

// ---- Single characters ---------------------------------------------------------

// The first character of `literal` (its bytes as the encoding announces
// them, after any shift sequence), as a one-character pattern.
template <class M>
TextSpan first_char(const M &m, const uint8_t *literal, int64_t length) {
  if (literal == nullptr || length <= 0) return {};
  Walk<M> w(m, literal, length);
  if (w.done()) return {};
  const Char c = w.current();
  return {literal + c.offset, c.size, c.shifted ? cursor::kModalDouble : kModalSingle, true};
}

// How many bytes a literal in the text's encoding may take: one character,
// after a shift sequence in modal text.
template <class M>
constexpr int64_t kLiteralBytes = M::kModal ? 6 : 4;

// Finds one character in text s; `literal` is a byte of the host's
// literal set (converted when `convert`) or a character of the text's
// encoding.
template <class M>
int64_t find_char(const NLSSMHandle *h, const M &m, TextSpan s, const uint8_t *literal,
                  bool convert) {
  if (!s.valid || literal == nullptr) return -1;
  module::ConvertedLiteral<16> converted;
  TextSpan c;
  if (convert && h->charConverter != nullptr) {
    if (converted.convert(h, literal, 1) != module::LiteralOutcome::kConverted) return -1;
    c = first_char(m, converted.text(), static_cast<int64_t>(converted.length()));
  } else {
    c = first_char(m, literal, kLiteralBytes<M>);
  }
  if (!c.valid) return -1;
  return index_spans(m, s, c);
}

template <class M>
int64_t find_char_plain(const NLSSMHandle *h, NLSString *s, int64_t count, const uint8_t *literal) {
  TextSpan ts = from_current(s);
  if (!ts.valid) return -1;
  const M m(h);
  ts.n = span_of(m, ts.p, ts.n, count, ts.state);
  const int64_t r = find_char(h, m, ts, literal, true);
  if (r < 0) return r;
  if constexpr (std::is_same_v<M, UtfeModel>) {
    // The class's cursor steps UTF-EBCDIC by UTF-8 lead bytes and would
    // land elsewhere: the descriptor is placed on the character found.
    Walk<M> w(m, ts.p, static_cast<int64_t>(s->length) - s->curOffset);
    int64_t prev = NLSSM_POS_NO_PREVIOUS;
    for (int64_t i = 0; i < r; ++i, w.next()) prev = s->curOffset + w.offset();
    const Char c = w.current();
    w.next();
    if (r > 0) s->prevOffset = prev;
    s->nextOffset = w.done() ? NLSSM_POS_NONE : s->curOffset + w.offset();
    s->charIndex += r;
    s->curOffset += c.offset;
  } else if (h->stringSetPos != nullptr) {
    using SetPos = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);
    reinterpret_cast<SetPos>(h->stringSetPos)(h, s, s->charIndex + r, 0);
  }
  return r;
}

template <class M, bool kChars>
int64_t find_char_raw(const NLSSMHandle *h, const uint8_t *text, int64_t length,
                      const uint8_t *literal, bool convert) {
  if (text == nullptr || length <= 0) return -1;
  const M m(h);
  const int64_t bytes = kChars ? span_of(m, text, kUnbounded, length, kModalSingle) : length;
  return find_char(h, m, TextSpan{text, bytes, kModalSingle, true}, literal, convert);
}

// One byte of the single-byte search: the literal byte, converted when
// asked and the handle has a converter; false when conversion fails.
bool sbcs_literal(const NLSSMHandle *h, const uint8_t *literal, bool convert, uint8_t &out) {
  out = *literal;
  if (!convert || h->charConverter == nullptr) return true;
  module::ConvertedLiteral<16> converted;
  if (converted.convert(h, literal, 1) != module::LiteralOutcome::kConverted ||
      converted.length() == 0)
    return false;
  out = converted.text()[0];
  return true;
}

int64_t sbcs_find_raw(const NLSSMHandle *h, const uint8_t *text, int64_t length,
                      const uint8_t *literal, bool convert) {
  uint8_t c = 0;
  if (text == nullptr || literal == nullptr || length <= 0 || !sbcs_literal(h, literal, convert, c))
    return -1;
  return simd::find_bytes(text, length, &c, 1, 1, 0);
}

// ---- Verify ------------------------------------------------------------------

template <class M>
int64_t verify_in(const M &m, TextSpan s, int64_t count, TextSpan set, int64_t setCount) {
  if (!s.valid) return -1;
  Walk<M> w(m, s.p, s.n, 0, s.state);
  if (w.done()) return -1;
  const int64_t setBytes = set.valid ? span_of(m, set.p, set.n, setCount, set.state) : 0;
  for (int64_t index = 0; !w.done() && (count <= 0 || index < count); w.next(), ++index) {
    const Char c = w.current();
    bool found = false;
    for (Walk<M> v(m, set.p, setBytes, 0, set.state); !v.done() && !found; v.next())
      found = same_char(s.p, c, set.p, v.current());
    if (!found) return index;
  }
  return -1;
}

template <class M>
int64_t verify_plain(const NLSSMHandle *h, const NLSString *s, int64_t count, const NLSString *set,
                     int64_t setCount) {
  return verify_in(M(h), from_current(s), count, from_current(set), setCount);
}

template <class M>
int64_t verify_raw(const NLSSMHandle *h, const uint8_t *s, int64_t length, const uint8_t *set,
                   int64_t setLength) {
  if (s == nullptr || length <= 0) return -1;
  const TextSpan setSpan{set, set == nullptr ? 0 : std::max<int64_t>(setLength, 0), kModalSingle,
                         set != nullptr};
  return verify_in(M(h), TextSpan{s, length, kModalSingle, true}, 0, setSpan, 0);
}

// Single-byte: bytes [0, n) limited to `count` when that is given and not
// above the rest.
int64_t limit_bytes(int64_t n, int64_t count) {
  return count > 0 && count <= n ? count : n;
}

int64_t sbcs_verify(const uint8_t *s, int64_t n, const uint8_t *set, int64_t setN) {
  if (s == nullptr || n <= 0) return -1;
  bool member[256] = {};
  for (int64_t i = 0; set != nullptr && i < setN; ++i) member[set[i]] = true;
  for (int64_t i = 0; i < n; ++i)
    if (!member[s[i]]) return i;
  return -1;
}

}  // namespace
}  // namespace nlssm::casecmp

using namespace nlssm::casecmp;

// ---- NLSStringIndex ----------------------------------------------------------------

extern "C" int64_t NLSStringIndex_SBCS(const NLSSMHandle *, const NLSString *s, const NLSString *p,
                                       int64_t patternLength) {
  if (s == nullptr || p == nullptr || s->buffer == nullptr || p->buffer == nullptr ||
      s->curOffset < 0 || p->curOffset < 0 || s->charIndex < 0 || p->charIndex < 0)
    return -1;
  const auto sEnd = static_cast<int64_t>(s->length);
  const auto pEnd = static_cast<int64_t>(p->length);
  if (s->charIndex >= sEnd) return -1;
  int64_t n = p->charIndex < pEnd ? pEnd - p->charIndex : 0;
  if (patternLength > 0 && patternLength < n) n = patternLength;
  // An empty pattern is searched as the byte at its start, when the buffer
  // holds one.
  if (n == 0 && p->charIndex >= static_cast<int64_t>(p->capacity)) return -1;
  return simd::find_bytes(s->buffer + s->charIndex, sEnd - s->charIndex, p->buffer + p->charIndex,
                          n < 2 ? 1 : n, 1, 0);
}

extern "C" int64_t NLSStringIndexS_SBCS(const NLSSMHandle *h, const uint8_t *s, int64_t sLength,
                                        const uint8_t *p, int64_t pLength) {
  return index_raw<SbcsModel, false>(h, s, sLength, p, pLength);
}

extern "C" int64_t NLSStringIndexC_SBCS(const NLSSMHandle *h, const uint8_t *s, int64_t sLength,
                                        const uint8_t *p, int64_t pLength) {
  return index_raw<SbcsModel, false>(h, s, sLength, p, pLength);
}

#define NLSSM_INDEX_PLAIN_AND_S(suffix, Model)                                           \
  extern "C" int64_t NLSStringIndex_##suffix(const NLSSMHandle *h, const NLSString *s,   \
                                             const NLSString *p, int64_t patternChars) { \
    return index_plain<Model>(h, s, p, patternChars);                                    \
  }                                                                                      \
  extern "C" int64_t NLSStringIndexS_##suffix(const NLSSMHandle *h, const uint8_t *s,    \
                                              int64_t sLength, const uint8_t *p,         \
                                              int64_t pLength) {                         \
    return index_raw<Model, false>(h, s, sLength, p, pLength);                           \
  }
#define NLSSM_INDEX_C(suffix, Model)                                                              \
  extern "C" int64_t NLSStringIndexC_##suffix(const NLSSMHandle *h, const uint8_t *s,             \
                                              int64_t sChars, const uint8_t *p, int64_t pChars) { \
    return index_raw<Model, true>(h, s, sChars, p, pChars);                                       \
  }

NLSSM_INDEX_PLAIN_AND_S(UTF8, Utf8Model)
NLSSM_INDEX_PLAIN_AND_S(UTFE, UtfeModel)
NLSSM_INDEX_PLAIN_AND_S(WCS4, FixedModel)
NLSSM_INDEX_PLAIN_AND_S(MBCS_modal, ModalModel)
NLSSM_INDEX_PLAIN_AND_S(MBCS_nonmodal, DbcsModel)
NLSSM_INDEX_PLAIN_AND_S(MBCS_nonmodal_EUC_JP, EucJpModel)
NLSSM_INDEX_PLAIN_AND_S(MBCS_nonmodal_EUC_TW, EucTwModel)
NLSSM_INDEX_PLAIN_AND_S(MBCS_nonmodal_GB18030, Gb18030Model)
NLSSM_INDEX_C(WCS4, FixedModel)
NLSSM_INDEX_C(MBCS_modal, ModalModel)
NLSSM_INDEX_C(MBCS_nonmodal, DbcsModel)
NLSSM_INDEX_C(MBCS_nonmodal_EUC_JP, EucJpModel)
NLSSM_INDEX_C(MBCS_nonmodal_EUC_TW, EucTwModel)
NLSSM_INDEX_C(MBCS_nonmodal_GB18030, Gb18030Model)
#undef NLSSM_INDEX_PLAIN_AND_S
#undef NLSSM_INDEX_C

// WCS2: one member for both byte orders.
extern "C" int64_t NLSStringIndex_WCS2(const NLSSMHandle *h, const NLSString *s, const NLSString *p,
                                       int64_t patternChars) {
  return with_wcs2_model(
      h, [&](auto m) { return index_plain<NLSSM_MODEL_OF(m)>(h, s, p, patternChars); });
}

extern "C" int64_t NLSStringIndexS_WCS2(const NLSSMHandle *h, const uint8_t *s, int64_t sLength,
                                        const uint8_t *p, int64_t pLength) {
  return with_wcs2_model(
      h, [&](auto m) { return index_raw<NLSSM_MODEL_OF(m), false>(h, s, sLength, p, pLength); });
}

extern "C" int64_t NLSStringIndexC_WCS2(const NLSSMHandle *h, const uint8_t *s, int64_t sChars,
                                        const uint8_t *p, int64_t pChars) {
  return with_wcs2_model(
      h, [&](auto m) { return index_raw<NLSSM_MODEL_OF(m), true>(h, s, sChars, p, pChars); });
}

// The class's one C form: UTF-8 or UTF-EBCDIC by the handle.
extern "C" int64_t NLSStringIndexC_UTF8(const NLSSMHandle *h, const uint8_t *s, int64_t sChars,
                                        const uint8_t *p, int64_t pChars) {
  return with_utf_model(
      h, [&](auto m) { return index_raw<NLSSM_MODEL_OF(m), true>(h, s, sChars, p, pChars); });
}

// ---- NLSStringContains -------------------------------------------------------------

extern "C" int64_t NLSStringContains(const NLSSMHandle *h, const uint8_t *s, int64_t sLength,
                                     const uint8_t *p, int64_t pLength, int64_t) {
  if (h == nullptr || s == nullptr || p == nullptr || h->NLSStringIndex == nullptr) return -1;
  using SetPos = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);
  using Index = int64_t (*)(const NLSSMHandle *, const NLSString *, const NLSString *, int64_t);
  auto over = [h](const uint8_t *buffer, int64_t length) {
    NLSString d{};
    d.buffer = const_cast<uint8_t *>(buffer);
    d.length = d.capacity = static_cast<uint64_t>(std::max<int64_t>(length, 0));
    d.curOffset = length > 0 ? 0 : NLSSM_POS_NONE;
    d.nextOffset = NLSSM_POS_NONE;
    d.prevOffset = NLSSM_POS_NO_PREVIOUS;
    const bool positioned = h->encodingClass == NLSSM_CLASS_SBCS ||
                            h->encodingClass == NLSSM_CLASS_WCS4 || h->stringSetPos == nullptr;
    if (length > 0 && !positioned) reinterpret_cast<SetPos>(h->stringSetPos)(h, &d, 0, 0);
    return d;
  };
  const NLSString text = over(s, sLength);
  const NLSString pattern = over(p, pLength);
  return reinterpret_cast<Index>(h->NLSStringIndex)(h, &text, &pattern, 0);
}

// ---- NLSStringFindCharLit ----------------------------------------------------------

extern "C" int64_t NLSStringFindCharLit_SBCS(const NLSSMHandle *h, NLSString *s, int64_t count,
                                             const uint8_t *literal) {
  if (s == nullptr || s->buffer == nullptr || s->charIndex < 0) return -1;
  const auto end = static_cast<int64_t>(s->length);
  const int64_t start = s->charIndex;
  if (start >= end) return -1;
  // EBCDIC sets take the literal through the converter; ASCII-based sets
  // use the byte as it is.
  const bool convert = (h->encodingFlags & 1u) == 0;
  const int64_t r =
      sbcs_find_raw(h, s->buffer + start, limit_bytes(end - start, count), literal, convert);
  if (r >= 0) s->charIndex = s->curOffset = start + r;
  return r;
}

extern "C" int64_t NLSStringFindCharLitS_SBCS(const NLSSMHandle *h, const uint8_t *text,
                                              int64_t length, const uint8_t *literal, int64_t,
                                              int64_t, uint8_t convert) {
  return sbcs_find_raw(h, text, length, literal, convert != 0);
}

extern "C" int64_t NLSStringFindCharLitC_SBCS(const NLSSMHandle *h, const uint8_t *text,
                                              int64_t length, const uint8_t *literal, int64_t,
                                              int64_t, uint8_t convert) {
  return sbcs_find_raw(h, text, length, literal, convert != 0);
}

#define NLSSM_FIND_CHAR(suffix, Model)                                                         \
  extern "C" int64_t NLSStringFindCharLit_##suffix(const NLSSMHandle *h, NLSString *s,         \
                                                   int64_t count, const uint8_t *literal) {    \
    return find_char_plain<Model>(h, s, count, literal);                                       \
  }                                                                                            \
  extern "C" int64_t NLSStringFindCharLitS_##suffix(const NLSSMHandle *h, const uint8_t *text, \
                                                    int64_t length, const uint8_t *literal,    \
                                                    int64_t, int64_t, uint8_t convert) {       \
    return find_char_raw<Model, false>(h, text, length, literal, convert != 0);                \
  }                                                                                            \
  extern "C" int64_t NLSStringFindCharLitC_##suffix(const NLSSMHandle *h, const uint8_t *text, \
                                                    int64_t length, const uint8_t *literal,    \
                                                    int64_t, int64_t, uint8_t convert) {       \
    return find_char_raw<Model, true>(h, text, length, literal, convert != 0);                 \
  }

NLSSM_FIND_CHAR(WCS4, FixedModel)
NLSSM_FIND_CHAR(MBCS_modal, ModalModel)
NLSSM_FIND_CHAR(MBCS_nonmodal, DbcsModel)
NLSSM_FIND_CHAR(MBCS_EUC_JP, EucJpModel)
NLSSM_FIND_CHAR(MBCS_EUC_TW, EucTwModel)
NLSSM_FIND_CHAR(MBCS_GB18030, Gb18030Model)
#undef NLSSM_FIND_CHAR

#define NLSSM_FIND_CHAR_BY(suffix, with)                                                           \
  extern "C" int64_t NLSStringFindCharLit_##suffix(const NLSSMHandle *h, NLSString *s,             \
                                                   int64_t count, const uint8_t *literal) {        \
    return with(h,                                                                                 \
                [&](auto m) { return find_char_plain<NLSSM_MODEL_OF(m)>(h, s, count, literal); }); \
  }                                                                                                \
  extern "C" int64_t NLSStringFindCharLitS_##suffix(const NLSSMHandle *h, const uint8_t *text,     \
                                                    int64_t length, const uint8_t *literal,        \
                                                    int64_t, int64_t, uint8_t convert) {           \
    return with(h, [&](auto m) {                                                                   \
      return find_char_raw<NLSSM_MODEL_OF(m), false>(h, text, length, literal, convert != 0);      \
    });                                                                                            \
  }                                                                                                \
  extern "C" int64_t NLSStringFindCharLitC_##suffix(const NLSSMHandle *h, const uint8_t *text,     \
                                                    int64_t length, const uint8_t *literal,        \
                                                    int64_t, int64_t, uint8_t convert) {           \
    return with(h, [&](auto m) {                                                                   \
      return find_char_raw<NLSSM_MODEL_OF(m), true>(h, text, length, literal, convert != 0);       \
    });                                                                                            \
  }

// UTF-8 and UTF-EBCDIC share these members; WCS2 serves both byte orders.
NLSSM_FIND_CHAR_BY(UTF8, with_utf_model)
NLSSM_FIND_CHAR_BY(WCS2, with_wcs2_model)
#undef NLSSM_FIND_CHAR_BY

// Modal text: the character is already in the text's encoding.
extern "C" int64_t NLSStringFindCharS_MBCS_modal(const NLSSMHandle *h, const uint8_t *text,
                                                 int64_t length, const uint8_t *character, int64_t,
                                                 int64_t, uint8_t) {
  return find_char_raw<ModalModel, false>(h, text, length, character, false);
}

extern "C" int64_t NLSStringFindCharC_MBCS_modal(const NLSSMHandle *h, const uint8_t *text,
                                                 int64_t length, const uint8_t *character, int64_t,
                                                 int64_t, uint8_t) {
  return find_char_raw<ModalModel, true>(h, text, length, character, false);
}

// ---- NLSStringVerify -----------------------------------------------------------------

extern "C" int64_t NLSStringVerify_SBCS(const NLSSMHandle *, const NLSString *s, int64_t count,
                                        const NLSString *set, int64_t setCount) {
  const TextSpan ts = from_current(s);
  const TextSpan ss = from_current(set);
  if (!ts.valid) return -1;
  return sbcs_verify(ts.p, limit_bytes(ts.n, count), ss.p,
                     ss.valid ? limit_bytes(ss.n, setCount) : 0);
}

extern "C" int64_t NLSStringVerifyS_SBCS(const NLSSMHandle *, const uint8_t *s, int64_t length,
                                         const uint8_t *set, int64_t setLength) {
  return sbcs_verify(s, length, set, setLength);
}

#define NLSSM_VERIFY(suffix, Model)                                                     \
  extern "C" int64_t NLSStringVerify_##suffix(const NLSSMHandle *h, const NLSString *s, \
                                              int64_t count, const NLSString *set,      \
                                              int64_t setCount) {                       \
    return verify_plain<Model>(h, s, count, set, setCount);                             \
  }                                                                                     \
  extern "C" int64_t NLSStringVerifyS_##suffix(const NLSSMHandle *h, const uint8_t *s,  \
                                               int64_t length, const uint8_t *set,      \
                                               int64_t setLength) {                     \
    return verify_raw<Model>(h, s, length, set, setLength);                             \
  }

NLSSM_VERIFY(WCS2L, Wcs2Model<false>)
NLSSM_VERIFY(WCS2B, Wcs2Model<true>)
NLSSM_VERIFY(WCS4, FixedModel)
NLSSM_VERIFY(MBCS_modal, ModalModel)
#undef NLSSM_VERIFY

// Members that serve several encodings of their class step by the handle's
// encoding: UTF-8 or UTF-EBCDIC; the double-byte pages, EUC-JP, EUC-TW or
// GB18030.
extern "C" int64_t NLSStringVerify_UTF8(const NLSSMHandle *h, const NLSString *s, int64_t count,
                                        const NLSString *set, int64_t setCount) {
  return with_utf_model(
      h, [&](auto m) { return verify_plain<NLSSM_MODEL_OF(m)>(h, s, count, set, setCount); });
}

extern "C" int64_t NLSStringVerifyS_UTF8(const NLSSMHandle *h, const uint8_t *s, int64_t length,
                                         const uint8_t *set, int64_t setLength) {
  return with_utf_model(
      h, [&](auto m) { return verify_raw<NLSSM_MODEL_OF(m)>(h, s, length, set, setLength); });
}

extern "C" int64_t NLSStringVerify_MBCS_nonmodal(const NLSSMHandle *h, const NLSString *s,
                                                 int64_t count, const NLSString *set,
                                                 int64_t setCount) {
  return nlssm::cursor::with_nonmodal_model(
      h, [&](auto m) { return verify_plain<NLSSM_MODEL_OF(m)>(h, s, count, set, setCount); });
}

extern "C" int64_t NLSStringVerifyS_MBCS_nonmodal(const NLSSMHandle *h, const uint8_t *s,
                                                  int64_t length, const uint8_t *set,
                                                  int64_t setLength) {
  return nlssm::cursor::with_nonmodal_model(
      h, [&](auto m) { return verify_raw<NLSSM_MODEL_OF(m)>(h, s, length, set, setLength); });
}
