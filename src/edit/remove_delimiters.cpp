// Remove delimiters: the inverse of add-quotes. The source's first character
// is the delimiter, its last character the closing one; the text between is
// copied with every doubled delimiter undoubled. A full destination simply
// ends the copy; only a source without a closing delimiter is an error.
#include <nlssm/nlssm.h>

#include <cstdint>

#include "edit/copy_engines.hpp"

namespace nlssm::edit {
namespace {

struct DelimiterArgs {
  Span src;
};

template <class C>
Result remove_delimiters(const C &c, const DelimiterArgs &a, uint8_t *out, int64_t room, bool dbl) {
  Reader<C> src(c, a.src);
  Char delimiter, ch;
  if (!src.next(delimiter)) return {kTooSmall, 0};
  int64_t last = -1;
  for (Reader<C> scan = src; scan.next(ch);) last = ch.p - a.src.p;
  if (last < 0) return {kTooSmall, 0};
  src.end = last;  // the closing delimiter is dropped
  Writer<C> w(c, out, room, dbl);
  while (src.next(ch)) {
    if (same(ch, delimiter)) {
      Reader<C> peek = src;
      Char next;
      if (peek.next(next) && same(next, delimiter)) src = peek;
    }
    if (!w.put(ch)) break;
  }
  return {kOk, w.finish()};
}

NLSSM_COPY_ENGINES_ALL(DO_RemoveDelimiters, DelimiterArgs, remove_delimiters)

}  // namespace
}  // namespace nlssm::edit

using namespace nlssm::edit;

#define NLSSM_REMOVE_DELIMITERS_MEMBERS(suffix)                                                  \
  extern "C" int64_t NLSStringRemoveDelimiters_##suffix(                                         \
      const NLSSMHandle *h, const NLSString *source, NLSString *destination, int64_t *written) { \
    store(written, 0);                                                                           \
    if (!usable(source) || !usable_dst(destination)) return kNullArgument;                       \
    return run_plain(h, DelimiterArgs{span_of(*source)}, destination, written,                   \
                     &DO_RemoveDelimiters_##suffix);                                             \
  }                                                                                              \
  extern "C" int64_t NLSStringRemoveDelimitersS_##suffix(                                        \
      const NLSSMHandle *h, const uint8_t *source, int64_t sourceLength, uint8_t *destination,   \
      int64_t destinationLength, int64_t *written) {                                             \
    store(written, 0);                                                                           \
    if (!usable(source, sourceLength) || !usable(destination, destinationLength))                \
      return kNullArgument;                                                                      \
    return run_raw(h, DelimiterArgs{span_of(source, sourceLength)}, destination,                 \
                   destinationLength, written, &DO_RemoveDelimiters_##suffix##S);                \
  }

NLSSM_REMOVE_DELIMITERS_MEMBERS(SBCS)
NLSSM_REMOVE_DELIMITERS_MEMBERS(UTF8)
NLSSM_REMOVE_DELIMITERS_MEMBERS(WCS2)
NLSSM_REMOVE_DELIMITERS_MEMBERS(WCS4)
NLSSM_REMOVE_DELIMITERS_MEMBERS(DBCS)
NLSSM_REMOVE_DELIMITERS_MEMBERS(DBCSM)
