// Fuzzes move, fill, concatenate, justify and add-quotes on handles of
// every class: nothing is written past a destination's room (guard bytes
// after it stay untouched), statuses come from the documented set, counts
// and positions stay inside the room, and a quoted text that did not fit
// reports a need larger than the room.
#include "fuzz_support.hpp"

using namespace fuzz_support;

namespace {

using MoveSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                            int64_t *, uint32_t);
using MoveCFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                            int64_t *, int64_t *, uint32_t);
using FillFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const NLSString *, int64_t *);
using FillSFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t,
                            int64_t *);
using ConcatFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t *, const uint8_t *, int64_t,
                             uint32_t, int64_t, ...);
using ConcatSFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, int64_t *, const uint8_t *,
                              int64_t, uint32_t, int64_t, ...);
using JustifySFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t, int64_t *,
                               int64_t *);
using JustifyCFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t, int64_t *,
                               int64_t *, int64_t *, int64_t *);
using QuotesFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, NLSString *,
                             int64_t *);
using QuotesSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                              int64_t *);

constexpr std::initializer_list<uint32_t> kCopyStatuses = {
    NLSSM_OK, NLSSM_E_DEST_TOO_SMALL, NLSSM_E_NULL_ARGUMENT, NLSSM_E_NO_MEMORY};

void check_written(int64_t written, int64_t room) {
  FUZZ_CHECK(written >= 0 && written <= room);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider in(data, size);
  const NLSSMHandle *h = pick_handle(in);
  const int64_t room = in.ConsumeIntegralInRange<int64_t>(0, 80);
  const uint32_t flags = in.ConsumeBool() ? NLSSM_EDIT_PAD : 0;
  const int64_t n = in.ConsumeIntegralInRange<int64_t>(-1, 12);
  static constexpr char kAlign[] = {'L', 'R', 'C', 'N', 'l', 'c', 'x'};
  const uint32_t align = static_cast<uint8_t>(kAlign[in.ConsumeIntegralInRange<int>(0, 6)]);
  const Text fill = take_text(in, 6);
  const Text text = take_text(in, 96);
  const std::vector<uint8_t> old = in.ConsumeBytes<uint8_t>(room);
  {
    FaultWindow faults(in);
    int64_t written = -1, chars_written = -1;

    Dest m(room, old);
    const int64_t ms = slot<MoveSFn>(h->NLSStringMoveS)(h, text.data(), text.size, m.data(), room,
                                                        &written, flags);
    FUZZ_CHECK(one_of(ms, kCopyStatuses) && m.intact());
    check_written(written, room);
    if (const int64_t whole = whole_chars(h, text.data(), text.size); whole >= 0) {
      const Text c = for_c_form(text);
      Dest mc(room, old);
      written = -1;
      const int64_t mcs =
          slot<MoveCFn>(h->NLSStringMoveC)(h, c.data(), whole, mc.data(), room, &written,
                                           &chars_written, flags | NLSSM_EDIT_SOURCE_IN_CHARS);
      FUZZ_CHECK(one_of(mcs, kCopyStatuses) && mc.intact());
      check_written(written, room);
      FUZZ_CHECK(chars_written >= 0 && chars_written <= std::max(whole, room));
    }
    Dest f(room, old);
    written = -1;
    const int64_t fs =
        slot<FillSFn>(h->NLSStringFillS)(h, f.data(), room, fill.data(), fill.size, &written);
    FUZZ_CHECK(one_of(fs, kCopyStatuses) && f.intact());
    if (fs != NLSSM_E_NULL_ARGUMENT) check_written(written, room);
    Dest fd(room, old);
    NLSString fdst = over(h, fd.data(), std::min<int64_t>(room, n + 1), room, n);
    const NLSString fchar = over(h, fill, in);
    slot<FillFn>(h->NLSStringFill)(h, &fdst, n, &fchar, &written);
    FUZZ_CHECK(fd.intact() && fdst.length <= static_cast<uint64_t>(room));

    Dest c(room, old);
    written = -1;
    // Terminated mode (negative) writes a zero byte after at most -length - 1 bytes.
    const int64_t length = in.ConsumeBool() ? room : -room;
    const int64_t cs = slot<ConcatSFn>(h->NLSStringConcatS)(
        h, c.data(), length, &written, fill.data(), fill.size, flags, 2, text.data(), text.size,
        fill.data(), fill.size);
    FUZZ_CHECK(one_of(cs, kCopyStatuses) && c.intact());
    check_written(written, room);
    Dest cd(room, old);
    NLSString cdst = over(h, cd.data(), 0, room, -1);
    const NLSString piece = over(h, text, in);
    int64_t clength = in.ConsumeIntegralInRange<int64_t>(-room - 1, room);
    const int64_t cds = slot<ConcatFn>(h->NLSStringConcat)(h, &cdst, &clength, fill.data(),
                                                           fill.size, flags, 2, &piece, &fchar);
    FUZZ_CHECK(one_of(cds, kCopyStatuses) && cd.intact());
    FUZZ_CHECK(cdst.length <= static_cast<uint64_t>(room));

    std::vector<uint8_t> field(text.data(), text.data() + text.size);
    Dest j(text.size, field);
    int64_t text_length = -1, start = -1;
    const int64_t js =
        slot<JustifySFn>(h->NLSStringJustifyS)(h, j.data(), text.size, align, &text_length, &start);
    FUZZ_CHECK(one_of(js, {NLSSM_OK, NLSSM_E_BAD_ALIGNMENT}) && j.intact());
    if (js == NLSSM_OK)
      FUZZ_CHECK(text_length >= 0 && start >= 0 && start + text_length <= text.size);
    if (const int64_t whole = whole_chars(h, text.data(), text.size); whole >= 0) {
      Dest jc(text.size, field);
      int64_t bytes = -1, cchars = -1, start_bytes = -1, start_chars = -1;
      const int64_t jcs = slot<JustifyCFn>(h->NLSStringJustifyC)(
          h, jc.data(), whole, align, &bytes, &cchars, &start_bytes, &start_chars);
      FUZZ_CHECK(one_of(jcs, {NLSSM_OK, NLSSM_E_BAD_ALIGNMENT}) && jc.intact());
      if (jcs == NLSSM_OK)
        FUZZ_CHECK(bytes >= 0 && start_bytes >= 0 && start_bytes + bytes <= text.size &&
                   cchars >= 0 && start_chars >= 0 && start_chars + cchars <= whole);
    }
    Dest q(room, old);
    int64_t result = 0;
    const int64_t qs =
        slot<QuotesSFn>(h->NLSStringAddQuotesS)(h, text.data(), text.size, q.data(), room, &result);
    FUZZ_CHECK(one_of(qs, {NLSSM_OK, NLSSM_E_DEST_TOO_SMALL}) && q.intact());
    FUZZ_CHECK(qs == NLSSM_OK ? result >= 0 && result <= room : result < -room);
    Dest qd(room, old);
    NLSString qdst = over(h, qd.data(), 0, room, -1);
    result = 0;
    const int64_t qds = slot<QuotesFn>(h->NLSStringAddQuotes)(h, &piece, n, &qdst, &result);
    FUZZ_CHECK(one_of(qds, {NLSSM_OK, NLSSM_E_DEST_TOO_SMALL}) && qd.intact());
    FUZZ_CHECK(qds == NLSSM_OK ? result >= 0 && result <= room : result < -room);
    FUZZ_CHECK(qdst.length <= static_cast<uint64_t>(room));
  }
  check_pools();
  return 0;
}
