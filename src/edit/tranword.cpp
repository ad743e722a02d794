// Tranword: copy a source into a destination, replacing every occurrence of
// a word by another. Matches do not overlap and replaced text is never
// searched again. `n` limits the work: each copied character counts it down
// by one, each replacement by the find count.
#include <nlssm/nlssm.h>

#include <cstdint>
#include <cstring>

#include "edit/copy_engines.hpp"

namespace nlssm::edit {
namespace {

struct TranwordArgs {
  Span src;
  int64_t n;  // characters; less than 0: no limit
  Span replacement;
  Span find;
  int64_t findCount;  // count-down per replacement; less than 0: the find word's characters
};

constexpr int64_t kNoLimit = INT64_MAX;

// Single-byte text: the find word's first byte is looked for with memchr and
// the text between matches is copied in blocks.
Result tranword_bytes(const TranwordArgs &a, int64_t findCount, uint8_t *out, int64_t room) {
  const uint8_t *s = a.src.p, *f = a.find.p, *r = a.replacement.p;
  const int64_t length = a.src.length, fl = a.find.length, rl = a.replacement.length;
  int64_t i = 0, used = 0, left = a.n < 0 ? kNoLimit : a.n;
  while (left > 0 && i < length) {
    const int64_t limit = left < length - i ? i + left : length;
    int64_t hit = limit;
    for (const uint8_t *p = s + i; fl != 0 && p < s + limit; ++p) {
      p = static_cast<const uint8_t *>(std::memchr(p, f[0], static_cast<size_t>(s + limit - p)));
      if (p == nullptr) break;
      if (fl <= s + length - p && std::memcmp(p, f, static_cast<size_t>(fl)) == 0) {
        hit = p - s;
        break;
      }
    }
    const int64_t copy = hit - i;
    if (copy > room - used) {
      std::memcpy(out + used, s + i, static_cast<size_t>(room - used));
      return {kDestTooSmall, room};
    }
    std::memcpy(out + used, s + i, static_cast<size_t>(copy));
    used += copy;
    left -= copy;
    i = hit;
    if (hit == limit) continue;
    if (rl > room - used) {  // copy on as far as the source fits
      int64_t rest = room - used;
      if (rest > length - i) rest = length - i;
      if (rest > left) rest = left;
      std::memcpy(out + used, s + i, static_cast<size_t>(rest));
      return {kDestTooSmall, used + rest};
    }
    if (rl != 0) std::memcpy(out + used, r, static_cast<size_t>(rl));
    used += rl;
    i += fl;
    left = left > findCount ? left - findCount : 0;
  }
  return {kOk, used};
}

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

template <class C>
Result tranword(const C &c, const TranwordArgs &a, uint8_t *out, int64_t room, bool dbl) {
  const int64_t findCount = a.findCount < 0 ? count_chars(c, a.find) : a.findCount;
  if constexpr (C::kBytes) {
    return tranword_bytes(a, findCount, out, room);
  } else {
    const Char first = first_char(c, a.find);
    Reader<C> src(c, a.src);
    Writer<C> w(c, out, room, dbl);
    int64_t left = a.n < 0 ? kNoLimit : a.n;
    Char ch;
    while (left > 0) {
      const Reader<C> at = src;
      if (!src.next(ch)) break;
      if (first.size != 0 && same(ch, first) && rest_matches(c, a.find, src)) {
        if (!w.fits_all(a.replacement)) {  // copy on as far as the source fits
          src = at;
          while (left > 0 && src.next(ch) && w.put(ch)) --left;
          return {kDestTooSmall, w.finish()};
        }
        Reader<C> word(c, a.replacement);
        while (word.next(ch)) w.put(ch);
        left = left > findCount ? left - findCount : 0;
        continue;
      }
      if (!w.put(ch)) return {kDestTooSmall, w.finish()};
      --left;
    }
    return {kOk, w.finish()};
  }
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
  if (n <= 0 || replacementLength <= 0 || findLength <= 0) {
    int64_t count = 0;
    reinterpret_cast<NumCharsFn>(h->NLSNumChars)(h, source, 0, &count);
    if (n <= 0) n = count;
    if (findLength <= 0) findLength = count;
  }
  const TranwordArgs a{span_of(*source), n, span_of(*replacement), span_of(*find), findLength};
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
                       span_of(find, findLength), -1};
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
