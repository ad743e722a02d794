// Squeeze: copy a source into a destination, reducing every run of one
// character to a single one. A character is dropped when it is the squeeze
// character and so is the next one within the first n characters.
#include <nlssm/nlssm.h>

#include <cstdint>

#include "edit/copy_engines.hpp"

namespace nlssm::edit {
namespace {

struct SqueezeArgs {
  Span src;
  int64_t n;     // characters; 0 or less: the whole source
  Span squeeze;  // its first character is squeezed; none: a plain copy
};

template <class C>
Result squeeze(const C &c, const SqueezeArgs &a, uint8_t *out, int64_t room, bool dbl) {
  const Char target = first_char(c, a.squeeze);
  Reader<C> src(c, a.src);
  Writer<C> w(c, out, room, dbl);
  int64_t left = a.n > 0 ? a.n : -1;
  Char ch;
  while (left != 0 && src.next(ch)) {
    if (left > 0) --left;
    if (target.size != 0 && left != 0 && same(ch, target)) {
      Reader<C> peek = src;
      Char next;
      if (peek.next(next) && same(next, target)) continue;
    }
    if (!w.put(ch)) return {kTooSmall, w.finish()};
  }
  return {kOk, w.finish()};
}

NLSSM_COPY_ENGINES_ALL(DO_Squeeze, SqueezeArgs, squeeze)

int64_t squeeze_plain(const NLSSMHandle *h, const NLSString *source, int64_t n,
                      const NLSString *squeezeChar, NLSString *dst, int64_t *written,
                      DescriptorEngine<SqueezeArgs> engine) {
  store(written, 0);
  if (!usable(source) || !usable(squeezeChar) || !usable_dst(dst)) return kNullArgument;
  return run_plain(h, SqueezeArgs{span_of(*source), n, span_of(*squeezeChar)}, dst, written,
                   engine);
}

int64_t squeeze_raw(const NLSSMHandle *h, const uint8_t *source, int64_t sourceLength,
                    const uint8_t *squeezeChar, int64_t squeezeLength, uint8_t *dst,
                    int64_t dstLength, int64_t *written, RawEngine<SqueezeArgs> engine) {
  store(written, 0);
  if (!usable(source, sourceLength) || !usable(squeezeChar, squeezeLength) ||
      !usable(dst, dstLength))
    return kNullArgument;
  const SqueezeArgs a{span_of(source, sourceLength), 0, span_of(squeezeChar, squeezeLength)};
  return run_raw(h, a, dst, dstLength, written, engine);
}

}  // namespace
}  // namespace nlssm::edit

using namespace nlssm::edit;

#define NLSSM_SQUEEZE_MEMBERS(suffix)                                                             \
  extern "C" int64_t NLSStringSqueeze_##suffix(const NLSSMHandle *h, const NLSString *source,     \
                                               int64_t n, const NLSString *squeezeChar,           \
                                               NLSString *destination, int64_t *written) {        \
    return squeeze_plain(h, source, n, squeezeChar, destination, written, &DO_Squeeze_##suffix);  \
  }                                                                                               \
  extern "C" int64_t NLSStringSqueezeS_##suffix(const NLSSMHandle *h, const uint8_t *source,      \
                                                int64_t sourceLength, const uint8_t *squeezeChar, \
                                                int64_t squeezeLength, uint8_t *destination,      \
                                                int64_t destinationLength, int64_t *written) {    \
    return squeeze_raw(h, source, sourceLength, squeezeChar, squeezeLength, destination,          \
                       destinationLength, written, &DO_Squeeze_##suffix##S);                      \
  }

NLSSM_SQUEEZE_MEMBERS(SBCS)
NLSSM_SQUEEZE_MEMBERS(UTF8)
NLSSM_SQUEEZE_MEMBERS(WCS2)
NLSSM_SQUEEZE_MEMBERS(WCS4)
NLSSM_SQUEEZE_MEMBERS(DBCS)
NLSSM_SQUEEZE_MEMBERS(DBCSM)

// ---- Squeeze with a literal ----------------------------------------------------

namespace {

using SqueezeFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, const NLSString *,
                              NLSString *, int64_t *);
using SqueezeSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                               int64_t, uint8_t *, int64_t, int64_t *);
using NumCharsSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t, int64_t *);

// The squeeze character of a literal: its converted text, or the handle's
// blank when the literal is empty.
struct SqueezeLiteral {
  LiteralText text;
  const uint8_t *p = nullptr;
  int64_t length = 0;

  int64_t convert(const NLSSMHandle *h, const uint8_t *literal, int64_t literalLength) {
    if (literalLength <= 0) {
      p = h->blankChar;
      length = static_cast<int64_t>(h->blankWidth);
      return kOk;
    }
    if (const int64_t status = text.convert(h, literal, literalLength); status != kOk)
      return status;
    p = text.text();
    length = text.length();
    return kOk;
  }
};

void count_written(const NLSSMHandle *h, const uint8_t *text, int64_t bytes, int64_t *characters) {
  if (characters == nullptr) return;
  *characters = 0;
  if (bytes > 0) reinterpret_cast<NumCharsSFn>(h->NLSNumCharsS)(h, text, bytes, 0, characters);
}

}  // namespace

extern "C" int64_t NLSStringSqueezeLit(const NLSSMHandle *h, const NLSString *source, int64_t n,
                                       const uint8_t *literal, int64_t literalLength,
                                       NLSString *destination, int64_t *written,
                                       int64_t *characters, int64_t) {
  store(written, 0);
  store(characters, 0);
  if (!usable(literal, literalLength) || !usable_dst(destination)) return kNullArgument;
  SqueezeLiteral lit;
  if (const int64_t status = lit.convert(h, literal, literalLength); status != kOk) return status;
  const NLSString squeezeChar = descriptor_over(h, lit.p, static_cast<uint64_t>(lit.length),
                                                static_cast<uint64_t>(lit.length));
  int64_t count = 0;
  const int64_t status = reinterpret_cast<SqueezeFn>(h->NLSStringSqueeze)(
      h, source, n, &squeezeChar, destination, &count);
  store(written, count);
  count_written(h, destination->buffer + (destination->length - static_cast<uint64_t>(count)),
                count, characters);
  return status;
}

extern "C" int64_t NLSStringSqueezeLitS(const NLSSMHandle *h, const uint8_t *source,
                                        int64_t sourceLength, const uint8_t *literal,
                                        int64_t literalLength, uint8_t *destination,
                                        int64_t destinationLength, int64_t *written,
                                        int64_t *characters, int64_t) {
  store(written, 0);
  store(characters, 0);
  if (!usable(literal, literalLength)) return kNullArgument;
  SqueezeLiteral lit;
  if (const int64_t status = lit.convert(h, literal, literalLength); status != kOk) return status;
  int64_t count = 0;
  const int64_t status = reinterpret_cast<SqueezeSFn>(h->NLSStringSqueezeS)(
      h, source, sourceLength, lit.p, lit.length, destination, destinationLength, &count);
  store(written, count);
  count_written(h, destination, count, characters);
  return status;
}
