// Fuzzes character stepping, positioning and counting on handles of every
// class: a walk with stringNextChar visits strictly increasing offsets inside
// the text, and as many characters as the counting slot reports; positions
// and lengths stay inside the text; blank padding stays inside its room.
#include "fuzz_support.hpp"

using namespace fuzz_support;

namespace {

constexpr uint32_t kUtfEbcdic = 161;

using NextFn = int64_t (*)(const NLSSMHandle *, NLSString *);
using SizeFn = int64_t (*)(const NLSSMHandle *, const NLSString *);
using NumCharsFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int64_t *);
using ByteLengthFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t);
using ByteLengthCFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t);
using LengthFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t *, int64_t *, int64_t);
using NLengthFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t *, int64_t *);
using BLengthFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t);
using BlankPadSFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, int64_t, int64_t *);
using AllBlanksSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t);

// Walks the whole text from its first character; answers the characters seen.
int64_t walk(const NLSSMHandle *h, const Text &t) {
  NLSString s = over(h, t.data(), t.size, t.size, 0);
  if (t.size == 0) return 0;
  int64_t seen = 0, last = -1;
  while (s.curOffset != NLSSM_POS_NONE) {
    FUZZ_CHECK(s.curOffset > last && s.curOffset < t.size);
    FUZZ_CHECK(s.charIndex == seen);
    const int64_t size = slot<SizeFn>(h->stringCurCharSize)(h, &s);
    // The size a lead byte announces (UTF-8 and UTF-EBCDIC: up to six).
    FUZZ_CHECK(size >= 1 && size <= 6);
    last = s.curOffset;
    ++seen;
    FUZZ_CHECK(seen <= t.size);
    const int64_t next = slot<NextFn>(h->stringNextChar)(h, &s);
    FUZZ_CHECK(next == NLSSM_POS_NONE || next == seen);
    if (next == NLSSM_POS_NONE) break;
  }
  return seen;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider in(data, size);
  const NLSSMHandle *h = pick_handle(in);
  const int64_t pos = in.ConsumeIntegralInRange<int64_t>(-2, 40);
  const int64_t pad = in.ConsumeIntegralInRange<int64_t>(0, 80);
  const Text t = take_text(in, 256);
  {
    FaultWindow faults(in);
    int64_t count = -1;
    const int64_t st = slot<NumCharsSFn>(h->NLSNumCharsS)(h, t.data(), t.size, 0, &count);
    FUZZ_CHECK(one_of(st, {NLSSM_OK, NLSSM_E_BAD_CHARACTER}));
    FUZZ_CHECK(count >= 0 && count <= t.size);
    // On whole characters a walk meets as many as are counted. Class 1 steps
    // UTF-EBCDIC text by the UTF-8 lead lengths, while counting follows
    // UTF-EBCDIC's own rule, so the two agree only for UTF-8.
    const int64_t walked = walk(h, t);
    if (well_formed(h, t.data(), t.size) && h->encodingNumber != kUtfEbcdic)
      FUZZ_CHECK(walked == count);

    NLSString s = over(h, t.data(), t.size, t.size, 0);
    int64_t described = -1;
    if (s.curOffset == 0 && slot<NumCharsFn>(h->NLSNumChars)(h, &s, 0, &described) == NLSSM_OK)
      FUZZ_CHECK(described == count);
    const int64_t bytes = slot<ByteLengthFn>(h->NLSStringByteLength)(h, &s, pos);
    FUZZ_CHECK(bytes >= 0 && bytes <= t.size);
    const int64_t at = slot<SetPosFn>(h->stringSetPos)(h, &s, pos, 0);
    FUZZ_CHECK(at == pos || at == NLSSM_POS_OUTSIDE);
    if (at == pos && pos >= 0) FUZZ_CHECK(s.curOffset >= 0 && s.curOffset < t.size);
    const int64_t c_bytes = slot<ByteLengthCFn>(h->NLSStringByteLengthC)(h, t.data(), t.size, 0);
    FUZZ_CHECK(c_bytes >= 0 && c_bytes <= t.size);

    // Zero-terminated forms: the text, its last unit completed with zero
    // bytes, and one zero unit; nothing may be read past it.
    const int64_t width = std::max<int64_t>(h->unitWidth, 1);
    const int64_t kZeros = (width - t.size % width) % width + width;
    std::vector<uint8_t> z(t.data(), t.data() + t.size);
    z.insert(z.end(), static_cast<size_t>(kZeros), 0);
    const Text zt(z);
    int64_t zchars = -1, zbytes = -1;
    slot<LengthFn>(h->NLSStringLength)(h, zt.data(), &zchars, &zbytes, 0);
    FUZZ_CHECK(zbytes >= 0 && zbytes <= t.size + kZeros && zchars >= 0 && zchars <= zbytes);
    int64_t nchars = -1, nbytes = -1;
    slot<NLengthFn>(h->NLSStringNLength)(h, zt.data(), pos, &nchars, &nbytes);
    // The limited length keeps within its limit and the terminated text.
    FUZZ_CHECK(nbytes >= 0 && nbytes <= std::max<int64_t>(pos, 0) && nbytes <= t.size + kZeros);
    // (UTF-EBCDIC handles measure the limited length by the UTF-8 leads.)
    FUZZ_CHECK(nchars >= 0 && nchars <= nbytes &&
               (nchars <= zchars || h->encodingNumber == kUtfEbcdic));
    const int64_t whole = slot<BLengthFn>(h->NLSStringBLength)(h, zt.data(), -1);
    FUZZ_CHECK(whole >= 0 && whole <= t.size + kZeros);

    Dest d(pad, std::vector<uint8_t>(t.data(), t.data() + t.size));
    int64_t padded = -1;
    const int64_t pst = slot<BlankPadSFn>(h->NLSBlankPadS)(h, d.data(), pad, 0, &padded);
    FUZZ_CHECK(one_of(pst, {NLSSM_OK, NLSSM_E_DEST_TOO_SMALL}) && d.intact());
    FUZZ_CHECK(padded >= 0 && padded <= pad);
    const int64_t blank = slot<AllBlanksSFn>(h->NLSAllBlanksS)(h, t.data(), t.size);
    FUZZ_CHECK(blank == 0 || blank == 1);
  }
  check_pools();
  return 0;
}
