// Transliterate: copy a source into a destination, replacing each character
// found in the from-list by the to-list's character at the same index (the
// first match wins). Single-byte text maps through a 256-entry table built
// once per call, by the byte mapper of the case tables; the other classes
// search the from-list per character, but only for characters whose first
// byte starts some from-list character.
#include <nlssm/nlssm.h>

#include <cstdint>

#include "casecmp/table_map.hpp"
#include "edit/copy_engines.hpp"

namespace nlssm::edit {
namespace {

struct TranslitArgs {
  Span src;
  int64_t n;  // characters; 0 or less: the whole source
  Span to;
  Span from;
  int64_t pairs;  // 0 or less: the shorter list's character count
};

// Pairs in effect: never more than either list holds.
template <class C>
int64_t pair_count(const C &c, const TranslitArgs &a) {
  const int64_t from = count_chars(c, a.from), to = count_chars(c, a.to);
  const int64_t lists = from < to ? from : to;
  return a.pairs > 0 && a.pairs < lists ? a.pairs : lists;
}

Result transliterate_bytes(const TranslitArgs &a, int64_t pairs, uint8_t *out, int64_t room) {
  uint8_t map[256];
  for (int b = 0; b < 256; ++b) map[b] = static_cast<uint8_t>(b);
  for (int64_t i = pairs - 1; i >= 0; --i) map[a.from.p[i]] = a.to.p[i];  // first match wins
  int64_t count = a.src.length;
  if (a.n > 0 && a.n < count) count = a.n;
  const int64_t done = count < room ? count : room;
  casecmp::map_bytes(map, a.src.p, out, done);
  return {count > room ? kTooSmall : kOk, done};
}

// The pairs in effect, the first kCached of them read once into arrays, the
// rest read from the lists when a character gets that far. For UTF text
// also a byte table of the single-byte characters: each maps to itself or
// to the single-byte character its first pair gives, and `runs` marks
// those that can be mapped byte by byte.
template <class C>
class Pairs {
 public:
  static constexpr int64_t kCached = 64;
  static constexpr bool kByteRuns = C::kSelfSync && !C::kBytes;

  Pairs(const C &c, const TranslitArgs &a, int64_t count) : c_(&c), a_(&a), count_(count) {
    bool paired[256] = {};
    for (int b = 0; b < 256; ++b) {
      bytes[b] = static_cast<uint8_t>(b);
      if constexpr (kByteRuns) runs[b] = C::single_char(static_cast<uint8_t>(b));
    }
    Reader<C> from(c, a.from), to(c, a.to);
    Char f, t;
    for (int64_t i = 0; i < count && from.next(f) && to.next(t); ++i) {
      if (i < kCached) {
        from_[i] = f;
        to_[i] = t;
        cached_ = i + 1;
      }
      starts_[*f.p] = true;
      if (f.size != 1 || paired[*f.p]) continue;
      paired[*f.p] = true;
      if (t.size == 1) {
        bytes[*f.p] = *t.p;
      } else {
        runs[*f.p] = false;
      }
    }
  }

  // The to-character of the first from-character equal to ch, or ch.
  Char map(const Char &ch) const {
    if (!starts_[*ch.p]) return ch;
    for (int64_t i = 0; i < cached_; ++i)
      if (same(from_[i], ch)) return to_[i];
    if (count_ <= cached_) return ch;
    Reader<C> from(*c_, a_->from), to(*c_, a_->to);
    Char f, t;
    for (int64_t i = 0; i < count_ && from.next(f) && to.next(t); ++i)
      if (i >= cached_ && same(f, ch)) return t;
    return ch;
  }

  uint8_t bytes[256];
  bool runs[256] = {};

 private:
  const C *c_;
  const TranslitArgs *a_;
  int64_t count_;
  int64_t cached_ = 0;
  bool starts_[256] = {};
  Char from_[kCached], to_[kCached];
};

// Shorter runs of single-byte characters map byte by byte: words between
// other characters are short, and setting a vector path up would cost more.
constexpr int64_t kVectorRun = 64;

template <class C>
Result transliterate(const C &c, const TranslitArgs &a, uint8_t *out, int64_t room, bool dbl) {
  const int64_t pairs = pair_count(c, a);
  if constexpr (C::kBytes) {
    return transliterate_bytes(a, pairs, out, room);
  } else {
    const Pairs<C> table(c, a, pairs);
    const casecmp::MapIsa isa = casecmp::best_map_isa();
    Reader<C> src(c, a.src);
    Writer<C> w(c, out, room, dbl);
    int64_t left = a.n > 0 ? a.n : -1;
    Char ch;
    while (left != 0 && src.off < src.end) {
      if constexpr (Pairs<C>::kByteRuns) {  // a run of single-byte characters at once
        const int64_t limit = left > 0 && left < src.end - src.off ? src.off + left : src.end;
        int64_t run = src.off;
        while (run < limit && table.runs[src.p[run]]) ++run;
        if (run > src.off) {
          const int64_t take = run - src.off < w.left() ? run - src.off : w.left();
          casecmp::map_bytes(take < kVectorRun ? casecmp::MapIsa::kScalar : isa, table.bytes,
                             src.p + src.off, w.claim(take), take);
          src.off += take;
          if (left > 0) left -= take;
          if (src.off < run) return {kTooSmall, w.finish()};
          continue;
        }
      }
      if (!src.next(ch)) break;
      if (!w.put(table.map(ch))) return {kTooSmall, w.finish()};
      if (left > 0) --left;
    }
    return {kOk, w.finish()};
  }
}

NLSSM_COPY_ENGINES_ALL(DO_TRANSLITERATE, TranslitArgs, transliterate)

int64_t transliterate_plain(const NLSSMHandle *h, const NLSString *source, int64_t n,
                            const NLSString *toList, const NLSString *fromList, int64_t pairs,
                            NLSString *dst, int64_t *written,
                            DescriptorEngine<TranslitArgs> engine) {
  store(written, 0);
  if (!usable(source) || !usable(toList) || !usable(fromList) || !usable_dst(dst))
    return kNullArgument;
  const TranslitArgs a{span_of(*source), n, span_of(*toList), span_of(*fromList), pairs};
  return run_plain(h, a, dst, written, engine);
}

int64_t transliterate_raw(const NLSSMHandle *h, const uint8_t *source, int64_t sourceLength,
                          const uint8_t *toList, int64_t toLength, const uint8_t *fromList,
                          int64_t fromLength, int64_t pairs, uint8_t *dst, int64_t dstLength,
                          int64_t *written, RawEngine<TranslitArgs> engine) {
  store(written, 0);
  if (!usable(source, sourceLength) || !usable(toList, toLength) || !usable(fromList, fromLength) ||
      !usable(dst, dstLength))
    return kNullArgument;
  const TranslitArgs a{span_of(source, sourceLength), 0, span_of(toList, toLength),
                       span_of(fromList, fromLength), pairs};
  return run_raw(h, a, dst, dstLength, written, engine);
}

}  // namespace
}  // namespace nlssm::edit

using namespace nlssm::edit;

#define NLSSM_TRANSLITERATE_MEMBERS(suffix)                                                     \
  extern "C" int64_t NLSStringTransliterate_##suffix(                                           \
      const NLSSMHandle *h, const NLSString *source, int64_t n, const NLSString *toList,        \
      const NLSString *fromList, int64_t pairCount, NLSString *destination, int64_t *written,   \
      int64_t) {                                                                                \
    return transliterate_plain(h, source, n, toList, fromList, pairCount, destination, written, \
                               &DO_TRANSLITERATE_##suffix);                                     \
  }                                                                                             \
  extern "C" int64_t NLSStringTransliterateS_##suffix(                                          \
      const NLSSMHandle *h, const uint8_t *source, int64_t sourceLength, const uint8_t *toList, \
      int64_t toLength, const uint8_t *fromList, int64_t fromLength, int64_t pairCount,         \
      uint8_t *destination, int64_t destinationLength, int64_t *written, int64_t) {             \
    return transliterate_raw(h, source, sourceLength, toList, toLength, fromList, fromLength,   \
                             pairCount, destination, destinationLength, written,                \
                             &DO_TRANSLITERATE_##suffix##S);                                    \
  }

NLSSM_TRANSLITERATE_MEMBERS(SBCS)
NLSSM_TRANSLITERATE_MEMBERS(UTF8)
NLSSM_TRANSLITERATE_MEMBERS(WCS2)
NLSSM_TRANSLITERATE_MEMBERS(WCS4)
NLSSM_TRANSLITERATE_MEMBERS(DBCS)
NLSSM_TRANSLITERATE_MEMBERS(DBCSM)

// ---- Literal lists -----------------------------------------------------------

using TranslitFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, const NLSString *,
                               const NLSString *, int64_t, NLSString *, int64_t *, int64_t);
using TranslitSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                                int64_t, const uint8_t *, int64_t, int64_t, uint8_t *, int64_t,
                                int64_t *, int64_t);

namespace {

// The two lists of a literal call in the handle's encoding.
struct LiteralLists {
  LiteralText to, from;

  // 0, or the status the call returns at once.
  int64_t convert(const NLSSMHandle *h, const uint8_t *toList, int64_t toLength,
                  const uint8_t *fromList, int64_t fromLength, int64_t *written) {
    store(written, 0);
    if (!usable(toList, toLength) || !usable(fromList, fromLength)) return kNullArgument;
    if (const int64_t status = to.convert(h, toList, toLength); status != kOk) return status;
    return from.convert(h, fromList, fromLength);
  }
};

}  // namespace

extern "C" int64_t NLSStringTransliterateLit(const NLSSMHandle *h, const NLSString *source,
                                             int64_t n, const uint8_t *toList, int64_t toLength,
                                             const uint8_t *fromList, int64_t fromLength,
                                             int64_t pairCount, NLSString *destination,
                                             int64_t *written, int64_t flags) {
  LiteralLists lists;
  if (const int64_t status = lists.convert(h, toList, toLength, fromList, fromLength, written);
      status != kOk)
    return status;
  const NLSString toText = lists.to.descriptor(h), fromText = lists.from.descriptor(h);
  return reinterpret_cast<TranslitFn>(h->NLSStringTransliterate)(
      h, source, n, &toText, &fromText, pairCount, destination, written, flags);
}

extern "C" int64_t NLSStringTransliterateLitS(const NLSSMHandle *h, const uint8_t *source,
                                              int64_t sourceLength, const uint8_t *toList,
                                              int64_t toLength, const uint8_t *fromList,
                                              int64_t fromLength, int64_t pairCount,
                                              uint8_t *destination, int64_t destinationLength,
                                              int64_t *written, int64_t flags) {
  LiteralLists lists;
  if (const int64_t status = lists.convert(h, toList, toLength, fromList, fromLength, written);
      status != kOk)
    return status;
  return reinterpret_cast<TranslitSFn>(h->NLSStringTransliterateS)(
      h, source, sourceLength, lists.to.text(), lists.to.length(), lists.from.text(),
      lists.from.length(), pairCount, destination, destinationLength, written, flags);
}
