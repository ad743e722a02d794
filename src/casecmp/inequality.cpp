// NLSStringNotEqual: the position of the first character of a text that is
// not one of the characters of a set, or -1. Single-byte members answer byte
// offsets; the others walk characters with their class's model and answer
// character positions.
#include <nlssm/nlssm.h>

#include <bitset>

#include "casecmp/compare.hpp"
#include "module/literal.hpp"

namespace nlssm::casecmp {
namespace {

// Single-byte sets: one set byte is a vector scan for the first other byte;
// a longer set is a 256-entry membership table.
int64_t first_not_in_bytes(Span s, Span set) {
  if (set.n == 0) return s.n > 0 ? 0 : -1;
  if (set.n == 1) return s.n > 0 ? kernel::hot().mem_nscan(s.p, s.n, set.p[0]) : -1;
  std::bitset<256> in;
  for (int64_t k = 0; k < set.n; ++k) in.set(set.p[k]);
  for (int64_t i = 0; i < s.n; ++i)
    if (!in.test(s.p[i])) return i;
  return -1;
}

// The characters of a set: single-byte ones (outside double-byte mode) in a
// membership table, the others looked up by their bytes and mode.
template <class M>
struct CharSet {
  const M &model;
  Span set;
  uint32_t start;
  std::bitset<256> singles;
  bool multi = false;

  // Only modal text has a double-byte mode; the other models keep kinds.
  static bool double_mode(uint32_t state) { return M::kModal && cursor::modal_double(state); }

  CharSet(const M &m, Span s, uint32_t state) : model(m), set(s), start(state) {
    walk([&](const uint8_t *p, int64_t size, uint32_t mode) {
      if (size == 1 && !double_mode(mode))
        singles.set(*p);
      else
        multi = true;
      return false;
    });
  }
  // Calls fn(bytes, size, mode) for each character until it answers true.
  template <class Fn>
  bool walk(Fn fn) const {
    Walker<M> w(model, set.p, set.n, start);
    for (;;) {
      model.skip_shifts(set.p, w.off, set.n, w.state);
      if (w.off >= set.n) return false;
      const int64_t size = w.size_here();
      if (fn(set.p + w.off, size, w.state)) return true;
      w.state = model.kind(size, w.state);
      w.off += size;
    }
  }
  bool has(const uint8_t *p, int64_t size, uint32_t mode) const {
    const bool dbl = double_mode(mode);
    if (size == 1 && !dbl) return singles.test(*p);
    if (!multi) return false;
    return walk([&](const uint8_t *q, int64_t n, uint32_t m) {
      return n == size && double_mode(m) == dbl && std::memcmp(p, q, static_cast<size_t>(n)) == 0;
    });
  }
};

// Character position in s (from 0) of the first character outside the set,
// within `count` characters (0 = all); -1 when every one is in it. `counts`
// says which lead bytes count as characters (UTF-8: not the stray bytes).
template <class M, class Counts>
int64_t first_not_in_chars(const M &m, Span s, uint32_t state, int64_t count, const CharSet<M> &set,
                           Counts counts) {
  Walker<M> w(m, s.p, s.n, state);
  int64_t index = 0;
  for (;;) {
    m.skip_shifts(s.p, w.off, s.n, w.state);
    if (w.off >= s.n || (count > 0 && index >= count)) return -1;
    const int64_t size = w.size_here();
    if (!set.has(s.p + w.off, size, w.state)) return index;
    if (counts(s.p[w.off])) ++index;
    w.state = m.kind(size, w.state);
    w.off += size;
  }
}

constexpr auto kEveryChar = [](uint8_t) { return true; };

template <class M, class Counts = decltype(kEveryChar)>
int64_t not_equal_chars(const M &m, Span s, uint32_t state, int64_t count, Span set,
                        uint32_t setState, int64_t setChars, Counts counts = kEveryChar) {
  if (setChars > 0) set.n = bytes_of_chars(m, set.p, set.n, setChars, setState);
  const CharSet<M> chars(m, set, setState);
  return first_not_in_chars(m, s, state, count, chars, counts);
}

// Runs `fn(model, counts)` with the character model of a class: UTF-8 or
// UTF-EBCDIC for class 1, WCS2 in its byte order, or the non-modal sets.
template <class Fn>
int64_t with_class_model(const NLSSMHandle *h, Fn fn) {
  if (h->encodingClass == NLSSM_CLASS_UTF8) {
    if (h->encodingNumber == NLSSM_ENC_UTF8) return fn(UtfModel<Utf8Codec>(), &Utf8Codec::counts);
    return fn(UtfModel<UtfeCodec>(), &UtfeCodec::counts);
  }
  if (h->encodingClass == NLSSM_CLASS_WCS2) {
    if (h->encodingNumber == NLSSM_ENC_WCS2_BE) return fn(cursor::Wcs2Model<true>(h), kEveryChar);
    return fn(cursor::Wcs2Model<false>(h), kEveryChar);
  }
  if (h->encodingClass == NLSSM_CLASS_WCS4) return fn(cursor::FixedModel(h), kEveryChar);
  if (h->encodingClass == NLSSM_CLASS_MBCS_MODAL) return fn(cursor::ModalModel(h), kEveryChar);
  return with_nonmodal_model(h, [&](const auto &m) { return fn(m, kEveryChar); });
}

int64_t not_equal(const NLSSMHandle *h, const NLSString *s, int64_t count, const NLSString *set,
                  int64_t setLength) {
  Span a, b;
  if (!descriptor_spans(s, set, a, b)) return 0;
  return with_class_model(h, [&](const auto &m, auto counts) {
    return not_equal_chars(m, a, modal_start(s), count, b, modal_start(set), setLength, counts);
  });
}

int64_t not_equal_s(const NLSSMHandle *h, const uint8_t *s, int64_t n, const uint8_t *set,
                    int64_t setBytes) {
  Span a, b;
  if (!raw_span(s, n, a) || !raw_span(set, setBytes, b)) return 0;
  return with_class_model(h, [&](const auto &m, auto counts) {
    return not_equal_chars(m, a, cursor::kModalSingle, 0, b, cursor::kModalSingle, 0, counts);
  });
}

using NotEqualFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, const NLSString *,
                               int64_t);
using NotEqualSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                                int64_t);

// The literal set in the handle's encoding, handed to `run`; the sign-bit
// value when it cannot be had.
template <class Run>
int64_t with_set(const NLSSMHandle *h, const uint8_t *literal, int64_t length, Run run) {
  module::ConvertedLiteral<256> set;
  const auto outcome = set.convert(h, literal, static_cast<uint64_t>(std::max<int64_t>(length, 0)));
  if (outcome == module::LiteralOutcome::kNoMemory || outcome == module::LiteralOutcome::kFailed)
    return NLSSM_COUNT_NO_MEMORY;
  return run(set.text(), static_cast<int64_t>(set.length()));
}

}  // namespace
}  // namespace nlssm::casecmp

namespace cc = nlssm::casecmp;

int64_t NLSStringNotEqual_SBCS(const NLSSMHandle *h, const NLSString *s, int64_t count,
                               const NLSString *set, int64_t setLength) {
  (void)h;
  cc::Span a, b;
  if (!cc::descriptor_spans(s, set, a, b)) return 0;
  if (count > 0 && count <= a.n) a.n = count;
  if (setLength > 0 && setLength <= b.n) b.n = setLength;
  return cc::first_not_in_bytes(a, b);
}
int64_t NLSStringNotEqualS_SBCS(const NLSSMHandle *h, const uint8_t *s, int64_t n,
                                const uint8_t *set, int64_t setBytes) {
  (void)h;
  cc::Span a, b;
  if (setBytes <= 0 || !cc::raw_span(s, n, a) || !cc::raw_span(set, setBytes, b)) return 0;
  return cc::first_not_in_bytes(a, b);
}

#define NLSSM_NOT_EQUAL_MEMBERS(SUFFIX)                                                      \
  int64_t NLSStringNotEqual##SUFFIX(const NLSSMHandle *h, const NLSString *s, int64_t count, \
                                    const NLSString *set, int64_t setLength) {               \
    return cc::not_equal(h, s, count, set, setLength);                                       \
  }                                                                                          \
  int64_t NLSStringNotEqualS##SUFFIX(const NLSSMHandle *h, const uint8_t *s, int64_t n,      \
                                     const uint8_t *set, int64_t setBytes) {                 \
    return cc::not_equal_s(h, s, n, set, setBytes);                                          \
  }

NLSSM_NOT_EQUAL_MEMBERS(_UTF8)
NLSSM_NOT_EQUAL_MEMBERS(_MBCS)
NLSSM_NOT_EQUAL_MEMBERS(_WCS4)
NLSSM_NOT_EQUAL_MEMBERS(_MBCS_modal)
#undef NLSSM_NOT_EQUAL_MEMBERS

int64_t NLSStringNotEqualLit(const NLSSMHandle *h, const NLSString *s, int64_t count,
                             const uint8_t *literal, int64_t length, uint32_t options) {
  (void)options;
  const auto notEqual = reinterpret_cast<cc::NotEqualFn>(h->NLSStringNotEqual);
  if (notEqual == nullptr) return 0;
  return cc::with_set(h, literal, length, [&](const uint8_t *text, int64_t bytes) {
    const NLSString set = cc::text_descriptor(text, bytes);
    return notEqual(h, s, count, &set, 0);
  });
}
int64_t NLSStringNotEqualLitS(const NLSSMHandle *h, const uint8_t *s, int64_t n,
                              const uint8_t *literal, int64_t length, uint32_t options) {
  (void)options;
  const auto notEqualS = reinterpret_cast<cc::NotEqualSFn>(h->NLSStringNotEqualS);
  if (notEqualS == nullptr) return 0;
  return cc::with_set(h, literal, length, [&](const uint8_t *text, int64_t bytes) {
    return notEqualS(h, s, n, text, bytes);
  });
}
