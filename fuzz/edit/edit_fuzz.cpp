// Fuzzes substring, delete, reverse and strip on handles of every class: an
// in-place edit keeps to its text, a copy keeps to the destination's
// capacity (guard bytes after it stay untouched), statuses come from the
// documented set, counts stay within the text, and reversing single-byte
// text twice gives it back.
#include "fuzz_support.hpp"

using namespace fuzz_support;

namespace {

using ReverseFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t);
using ReverseSFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t);
using DeleteFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const NLSString *, int64_t,
                             int64_t);
using DeleteSFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t);
using DeleteLitSFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t,
                                 int64_t);
using SubStrFn = int64_t (*)(const NLSSMHandle *, const NLSString *, NLSString *, int64_t,
                             int64_t *, int64_t);
using StripFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int64_t);
using StripSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t);

// A writable copy of a text in a block of exactly its size.
Text copy_of(const Text &t) {
  return Text(std::vector<uint8_t>(t.data(), t.data() + t.size));
}

void check_count(int64_t kept, int64_t limit) {
  FUZZ_CHECK(kept == NLSSM_COUNT_NO_MEMORY || (kept >= 0 && kept <= limit));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider in(data, size);
  const NLSSMHandle *h = pick_handle(in);
  const int64_t n = in.ConsumeIntegralInRange<int64_t>(-1, 20);
  const int64_t flags = in.ConsumeIntegralInRange<int64_t>(0, 1);
  const int64_t capacity = in.ConsumeIntegralInRange<int64_t>(0, 96);
  const int64_t dest_at = in.ConsumeIntegralInRange<int64_t>(-1, 4);
  const Text list = take_text(in, 8);
  const Text text = take_text(in, 128);
  {
    FaultWindow faults(in);
    const int64_t chars = positions_in(h, text.data(), text.size);
    FUZZ_CHECK(chars >= 0);

    Text r = copy_of(text);
    const int64_t rs = slot<ReverseSFn>(h->NLSStringReverseS)(h, r.data(), r.size);
    FUZZ_CHECK(one_of(rs, {NLSSM_OK, NLSSM_E_NO_MEMORY}));
    if (h->encodingClass == NLSSM_CLASS_SBCS) {
      FUZZ_CHECK(slot<ReverseSFn>(h->NLSStringReverseS)(h, r.data(), r.size) == NLSSM_OK);
      FUZZ_CHECK(text.size == 0 || std::memcmp(r.data(), text.data(), text.size) == 0);
    }
    Text rd = copy_of(text);
    NLSString rdesc = over(h, rd, in);
    FUZZ_CHECK(
        one_of(slot<ReverseFn>(h->NLSStringReverse)(h, &rdesc, n), {NLSSM_OK, NLSSM_E_NO_MEMORY}));

    Text ds = copy_of(text);
    check_count(slot<DeleteSFn>(h->NLSStringDeleteS)(h, ds.data(), ds.size, list.data(), list.size),
                text.size);
    Text dl = copy_of(text);
    check_count(slot<DeleteLitSFn>(h->NLSStringDeleteLitS)(h, dl.data(), dl.size, list.data(),
                                                           list.size, 0),
                text.size);
    Text dd = copy_of(text);
    NLSString target = over(h, dd, in);
    const NLSString l = over(h, list, in);
    check_count(slot<DeleteFn>(h->NLSStringDelete)(h, &target, n, &l, n, 0), chars);

    Dest d(capacity, in.ConsumeBytes<uint8_t>(capacity));
    const NLSString src = over(h, text, in);
    NLSString dst = over(h, d.data(), std::min<int64_t>(capacity, dest_at + 1), capacity, dest_at);
    int64_t copied = -1;
    const int64_t ss = slot<SubStrFn>(h->NLSStringSubStr)(h, &src, &dst, n, &copied, flags);
    FUZZ_CHECK(
        one_of(ss, {NLSSM_OK, NLSSM_E_DEST_TOO_SMALL, NLSSM_E_UNSUPPORTED, NLSSM_E_NO_MEMORY}));
    FUZZ_CHECK(d.intact() && copied >= 0 && copied <= capacity);
    FUZZ_CHECK(dst.length <= static_cast<uint64_t>(capacity));

    const int64_t strip_s = slot<StripSFn>(h->NLSStringStripS)(h, text.data(), text.size, flags);
    FUZZ_CHECK(strip_s >= 0 && strip_s <= text.size);
    if (const int64_t whole = whole_chars(h, text.data(), text.size); whole >= 0) {
      const Text c = for_c_form(text);
      const int64_t strip_c = slot<StripSFn>(h->NLSStringStripC)(h, c.data(), whole, flags);
      FUZZ_CHECK(strip_c >= 0 && strip_c <= whole);
    }
    const int64_t strip = slot<StripFn>(h->NLSStringStrip)(h, &src, n, flags);
    FUZZ_CHECK(strip >= 0 && strip <= chars);
  }
  check_pools();
  return 0;
}
