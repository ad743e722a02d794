// Fuzzes the base direction and line reordering on handles of every class
// and on single-byte right-to-left pages: statuses come from the documented
// set, directions are 0 or 1, reordering never writes past its capacity
// (guard bytes after it stay untouched) and gives single-byte text back at
// its own length.
#include "fuzz_support.hpp"

using namespace fuzz_support;

namespace {

using BaseFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *);
using OrderFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                            int64_t *, uint8_t *);

// The first two single-byte pages with a bidirectional table.
struct RightToLeft {
  const NLSSMHandle *handles[2] = {};
  RightToLeft() {
    int found = 0;
    for (int e = 0; e < NLSSM_ENCODING_LIMIT && found < 2; ++e)
      if (NLSGetBIDICategorySBCSTab(e) != nullptr) handles[found++] = extra_handle(e);
  }
};

const NLSSMHandle *pick(FuzzedDataProvider &in) {
  static const RightToLeft rtl;
  const int which = in.ConsumeIntegralInRange<int>(0, 3);
  if (which >= 2 || rtl.handles[which] == nullptr) return pick_handle(in);
  current_encoding = static_cast<int>(rtl.handles[which]->encodingNumber);
  return rtl.handles[which];
}

// How far past the stated length the base direction may read: UTF-8 one
// byte, UTF-16 the unit after a high surrogate.
size_t base_padding(const NLSSMHandle *h) {
  return h->encodingClass == NLSSM_CLASS_UTF8 ? 1 : h->encodingClass == NLSSM_CLASS_WCS2 ? 2 : 0;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider in(data, size);
  const NLSSMHandle *h = pick(in);
  const int64_t capacity = in.ConsumeIntegralInRange<int64_t>(0, 160);
  const uint8_t direction_in = in.ConsumeIntegralInRange<uint8_t>(0, 2);
  const std::vector<uint8_t> bytes = in.ConsumeBytes<uint8_t>(in.ConsumeIntegralInRange(0, 96));
  {
    FaultWindow faults(in);
    const Text padded(bytes, base_padding(h));
    uint8_t direction = 7;
    const int64_t bs =
        slot<BaseFn>(h->NLSGetBaseDirection)(h, padded.data(), padded.size, &direction);
    FUZZ_CHECK(one_of(bs, {NLSSM_OK, NLSSM_E_BAD_CHARACTER}) && direction <= 1);

    const Text text(bytes);
    for (NLSSlot order : {h->NLSVisualOrderFormat, h->NLSLogicalOrderFormat}) {
      if (order == nullptr) continue;  // multi-byte classes do not reorder
      Dest d(capacity);
      int64_t written = -1;
      uint8_t dir = direction_in;
      const int64_t st =
          slot<OrderFn>(order)(h, text.data(), text.size, d.data(), capacity, &written, &dir);
      FUZZ_CHECK(one_of(st, {NLSSM_OK, NLSSM_E_ILL_FORMED, NLSSM_E_TRUNCATED_SEQUENCE,
                             NLSSM_E_DEST_TOO_SMALL, NLSSM_E_NO_MEMORY}));
      FUZZ_CHECK(d.intact() && written >= 0 && written <= capacity);
      if (st != NLSSM_E_NO_MEMORY) FUZZ_CHECK(dir <= 1);
      if (h->encodingClass == NLSSM_CLASS_SBCS && st == NLSSM_OK) FUZZ_CHECK(written == text.size);
    }
  }
  check_pools();
  return 0;
}
