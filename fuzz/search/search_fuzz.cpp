// Fuzzes searching, verification, classification and LIKE on handles of
// every class: every answer is "not found" or a position inside the text,
// a text is found in itself at its start, classification and LIKE answer
// 0 or 1, and a moved descriptor stays inside its text.
#include "fuzz_support.hpp"

using namespace fuzz_support;

namespace {

using IndexFn = int64_t (*)(const NLSSMHandle *, const NLSString *, const NLSString *, int64_t);
using IndexSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                             int64_t);
using ContainsFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                               int64_t, int64_t);
using FindLitFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const uint8_t *);
using FindLitSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                               int64_t, int64_t, uint8_t);
using VerifyFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, const NLSString *,
                             int64_t);
using IsFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int32_t);
using IsSpaceFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int32_t);
using LikeFn = int64_t (*)(const NLSSMHandle *, const NLSString *, const NLSString *, int64_t);
using AnyNotFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int32_t);

// A position answer: not found, or a character (single-byte sets: byte) of
// the text.
void check_position(int64_t r, int64_t units) {
  FUZZ_CHECK(r == -1 || (r >= 0 && r < std::max<int64_t>(units, 1)));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider in(data, size);
  const NLSSMHandle *h = pick_handle(in);
  const bool sbcs = h->encodingClass == NLSSM_CLASS_SBCS;
  const int64_t count = in.ConsumeIntegralInRange<int64_t>(-1, 20);
  const int32_t mask = in.ConsumeIntegral<uint8_t>();
  const uint8_t literal = in.ConsumeIntegral<uint8_t>();
  const Text pattern = take_text(in, 12);
  const Text text = take_text(in, 200);
  {
    FaultWindow faults(in);
    const int64_t units = sbcs ? text.size : positions_in(h, text.data(), text.size);
    FUZZ_CHECK(units >= 0);

    const int64_t s =
        slot<IndexSFn>(h->NLSStringIndexS)(h, text.data(), text.size, pattern.data(), pattern.size);
    check_position(s, units);
    if (units > 0 && well_formed(h, text.data(), text.size))
      FUZZ_CHECK(slot<IndexSFn>(h->NLSStringIndexS)(h, text.data(), text.size, text.data(),
                                                    text.size) == 0);
    const int64_t c = slot<ContainsFn>(h->NLSStringContains)(h, text.data(), text.size,
                                                             pattern.data(), pattern.size, 0);
    check_position(c, units);

    const NLSString st = over(h, text, in);
    const NLSString pt = over(h, pattern, in);
    check_position(slot<IndexFn>(h->NLSStringIndex)(h, &st, &pt, count), units);
    check_position(slot<VerifyFn>(h->NLSStringVerify)(h, &st, count, &pt, count), units);
    check_position(slot<IndexSFn>(h->NLSStringVerifyS)(h, text.data(), text.size, pattern.data(),
                                                       pattern.size),
                   units);

    NLSString moving = st;
    const int64_t f = slot<FindLitFn>(h->NLSStringFindCharLit)(h, &moving, count, &literal);
    check_position(f, units);
    if (f >= 0) FUZZ_CHECK(moving.curOffset >= 0 && moving.curOffset < text.size);
    check_position(
        slot<FindLitSFn>(h->NLSStringFindCharLitS)(h, text.data(), text.size, &literal, 0, 0, 1),
        units);

    for (NLSSlot is : {h->NLSStringIs, h->NLSStringIsLower, h->NLSStringIsDigit,
                       h->NLSStringIsXDigit, h->NLSStringIsGraph, h->NLSStringIsSpace}) {
      const int64_t r = slot<IsFn>(is)(h, &st, count, mask);
      FUZZ_CHECK(r == 0 || r == 1);
    }
    const int64_t any = slot<AnyNotFn>(h->stringAnyNot)(h, &st, count, mask);
    FUZZ_CHECK(any == 0 || any == 1);
    const int64_t like = slot<LikeFn>(h->NLSStringLike)(h, &st, &pt, literal & 1);
    FUZZ_CHECK(like == 0 || like == 1);
  }
  check_pools();
  return 0;
}
