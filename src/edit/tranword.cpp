// Tranword: copy a source into a destination, replacing every occurrence of
// a word by another. Matches do not overlap and replaced text is never
// searched again. `n` limits the work: each copied character counts it down
// by one, each replacement by the find count.
#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstdint>

#include "casecmp/search_vector.hpp"
#include "edit/copy_engines.hpp"

namespace nlssm::edit {
namespace {

struct TranwordArgs {
  Span src;
  int64_t n;  // characters; less than 0: no limit
  Span replacement;
  Span find;
  int64_t findCount;  // count-down per replacement; less than 0: the find word's characters
  bool nIsCount;      // n is the source's character count
};

constexpr int64_t kNoLimit = INT64_MAX;

// Whether the find word continues at `after` (its first character matched
// just before it); on a match `after` moves behind the word.
template <class C>
bool rest_matches(const C &c, const Span &find, Reader<C> &after) {
  Reader<C> word(c, find), probe = after;
  Char w, t;
  word.next(w);
  while (word.next(w))
    if (!probe.next(t) || !same(w, t)) return false;
  after = probe;
  return true;
}

// A match at `at`, the source behind it: writes the replacement and counts
// n down, or, when the replacement does not fit, copies the source on from
// the match as far as it fits and answers false.
template <class C>
bool replace(const C &c, const TranwordArgs &a, int64_t findCount, Reader<C> &src,
             const Reader<C> &at, Writer<C> &w, int64_t &left) {
  Char ch;
  const bool fits = C::kModal ? w.fits_all(a.replacement) : a.replacement.length <= w.left();
  if (!fits) {
    src = at;
    while (left > 0 && src.next(ch) && w.put(ch)) --left;
    return false;
  }
  if constexpr (C::kModal) {
    for (Reader<C> word(c, a.replacement); word.next(ch);) w.put(ch);
  } else {
    w.put_bytes(a.replacement.p, a.replacement.length);
  }
  left = left > findCount ? left - findCount : 0;
  return true;
}

// Character by character, for every class.
template <class C>
int64_t tranword_walk(const C &c, const TranwordArgs &a, int64_t findCount, Writer<C> &w) {
  const Char first = first_char(c, a.find);
  Reader<C> src(c, a.src);
  int64_t left = a.n < 0 ? kNoLimit : a.n;
  Char ch;
  while (left > 0) {
    const Reader<C> at = src;
    if (!src.next(ch)) break;
    if (first.size != 0 && same(ch, first) && rest_matches(c, a.find, src)) {
      if (!replace(c, a, findCount, src, at, w, left)) return kTooSmall;
      continue;
    }
    if (!w.put(ch)) return kTooSmall;
    --left;
  }
  return kOk;
}

// Classes in which every byte the find word can start with starts a
// character (single-byte, and UTF text when the word starts with a lead
// byte): the word's bytes are found by the vector search under Index, and
// the text between matches is copied in blocks. In single-byte text n counts the bytes; UTF
// text comes here only when n cannot run out.
template <class C>
int64_t tranword_scan(const C &c, const TranwordArgs &a, int64_t findCount, Writer<C> &w) {
  struct {
    int64_t offset = 0, size = 0;
  } last;  // the find word's last character
  Char ch;
  for (Reader<C> word(c, a.find); word.next(ch);) last = {ch.p - a.find.p, ch.size};
  Reader<C> src(c, a.src);
  const uint8_t *p = src.p;
  const int64_t end = src.end, fl = a.find.length;
  int64_t left = a.n < 0 ? kNoLimit : a.n;
  int64_t start = 0, pos = 0;  // the text not yet copied begins at start
  // Copies the text from start to `to`, or as many whole characters of it
  // as the room takes.
  auto flush = [&](int64_t to) {
    if (to - start > w.left()) {
      src.off = start;
      while (src.next(ch) && w.put(ch)) {
      }
      return false;
    }
    w.put_bytes(p + start, to - start);
    if constexpr (C::kBytes) left -= to - start;
    start = to;
    return true;
  };
  while (left > 0 && start < end) {
    const int64_t stop = C::kBytes && left < end - start ? start + left : end;
    // The next place the word's bytes stand, starting before stop.
    const int64_t h =
        fl == 0 || pos >= stop
            ? -1
            : casecmp::simd::find_bytes(p, std::min(end, stop + fl - 1), a.find.p, fl, 1, pos);
    if (h < 0) {
      if (!flush(stop)) return kTooSmall;
      break;
    }
    pos = h + 1;
    // Equal bytes are equal characters, unless the word's last character is
    // cut short where the text's goes on.
    if (c.at(p + h + last.offset, end - h - last.offset, 0).size != last.size) continue;
    Reader<C> at = src;
    at.off = h;
    src.off = h + fl;
    if (!flush(h)) return kTooSmall;
    if (!replace(c, a, findCount, src, at, w, left)) return kTooSmall;
    start = pos = src.off;
  }
  return kOk;
}

template <class C>
Result tranword(const C &c, const TranwordArgs &a, uint8_t *out, int64_t room, bool dbl) {
  const int64_t findChars = count_chars(c, a.find);
  const int64_t findCount = a.findCount < 0 ? findChars : a.findCount;
  Writer<C> w(c, out, room, dbl);
  int64_t status;
  if constexpr (C::kSelfSync) {
    // n cannot run out when it covers the source and no replacement counts
    // it down by more than the characters it consumes.
    const bool unlimited =
        a.n < 0 || ((a.nIsCount || a.n >= a.src.length) && findCount <= findChars);
    const bool scan = (C::kBytes || unlimited) && (a.find.length == 0 || C::starts_char(*a.find.p));
    status = scan ? tranword_scan(c, a, findCount, w) : tranword_walk(c, a, findCount, w);
  } else {
    status = tranword_walk(c, a, findCount, w);
  }
  return {status, w.finish()};
}

NLSSM_COPY_ENGINES_ALL(DO_Tranword, TranwordArgs, tranword)

using NumCharsFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int64_t *);

// The plain front end: n, the replacement length and the find length that
// are 0 each become the source's character count. The engine takes the
// words from their descriptors and uses the find length only to count n
// down per replacement, so a find length of 0 ends the copy at the first
// replacement.
int64_t tranword_plain(const NLSSMHandle *h, const NLSString *source, int64_t n,
                       const NLSString *replacement, int64_t replacementLength,
                       const NLSString *find, int64_t findLength, NLSString *dst, int64_t *written,
                       DescriptorEngine<TranwordArgs> engine) {
  store(written, 0);
  if (!usable(source) || !usable(replacement) || !usable(find) || !usable_dst(dst))
    return kNullArgument;
  const bool whole = n <= 0;
  if (whole || replacementLength <= 0 || findLength <= 0) {
    int64_t count = 0;
    reinterpret_cast<NumCharsFn>(h->NLSNumChars)(h, source, 0, &count);
    if (whole) n = count;
    if (findLength <= 0) findLength = count;
  }
  const TranwordArgs a{span_of(*source), n,          span_of(*replacement),
                       span_of(*find),   findLength, whole};
  return run_plain(h, a, dst, written, engine);
}

int64_t tranword_raw(const NLSSMHandle *h, const uint8_t *source, int64_t sourceLength,
                     const uint8_t *replacement, int64_t replacementLength, const uint8_t *find,
                     int64_t findLength, uint8_t *dst, int64_t dstLength, int64_t *written,
                     RawEngine<TranwordArgs> engine) {
  store(written, 0);
  if (!usable(source, sourceLength) || !usable(replacement, replacementLength) ||
      !usable(find, findLength) || !usable(dst, dstLength))
    return kNullArgument;
  const TranwordArgs a{span_of(source, sourceLength), -1, span_of(replacement, replacementLength),
                       span_of(find, findLength),     -1, false};
  return run_raw(h, a, dst, dstLength, written, engine);
}

}  // namespace
}  // namespace nlssm::edit

using namespace nlssm::edit;

#define NLSSM_TRANWORD_MEMBERS(suffix)                                                             \
  extern "C" int64_t NLSStringTranword_##suffix(                                                   \
      const NLSSMHandle *h, const NLSString *source, int64_t n, const NLSString *replacement,      \
      int64_t replacementLength, const NLSString *find, int64_t findLength,                        \
      NLSString *destination, int64_t *written, int64_t) {                                         \
    return tranword_plain(h, source, n, replacement, replacementLength, find, findLength,          \
                          destination, written, &DO_Tranword_##suffix);                            \
  }                                                                                                \
  extern "C" int64_t NLSStringTranwordS_##suffix(                                                  \
      const NLSSMHandle *h, const uint8_t *source, int64_t sourceLength,                           \
      const uint8_t *replacement, int64_t replacementLength, const uint8_t *find,                  \
      int64_t findLength, uint8_t *destination, int64_t destinationLength, int64_t *written,       \
      int64_t) {                                                                                   \
    return tranword_raw(h, source, sourceLength, replacement, replacementLength, find, findLength, \
                        destination, destinationLength, written, &DO_Tranword_##suffix##S);        \
  }

NLSSM_TRANWORD_MEMBERS(SBCS)
NLSSM_TRANWORD_MEMBERS(UTF8)
NLSSM_TRANWORD_MEMBERS(WCS2)
NLSSM_TRANWORD_MEMBERS(WCS4)
NLSSM_TRANWORD_MEMBERS(DBCS)
NLSSM_TRANWORD_MEMBERS(DBCSM)
