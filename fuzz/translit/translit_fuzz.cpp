// Fuzzes transliterate, tranword, squeeze and remove-delimiters on handles
// of every class: nothing is written past the destination's room (guard
// bytes after it stay untouched), statuses come from the documented set,
// the bytes written stay inside the room, and transliterating with empty
// lists copies single-byte and UTF-8 text unchanged.
#include "fuzz_support.hpp"

using namespace fuzz_support;

namespace {

using TranslitFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, const NLSString *,
                               const NLSString *, int64_t, NLSString *, int64_t *, int64_t);
using TranslitSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                                int64_t, const uint8_t *, int64_t, int64_t, uint8_t *, int64_t,
                                int64_t *, int64_t);
using TranwordFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, const NLSString *,
                               int64_t, const NLSString *, int64_t, NLSString *, int64_t *,
                               int64_t);
using TranwordSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                                int64_t, const uint8_t *, int64_t, uint8_t *, int64_t, int64_t *,
                                int64_t);
using SqueezeFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, const NLSString *,
                              NLSString *, int64_t *);
using SqueezeSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                               int64_t, uint8_t *, int64_t, int64_t *);
using SqueezeLitSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                                  int64_t, uint8_t *, int64_t, int64_t *, int64_t *, int64_t);
using RemoveFn = int64_t (*)(const NLSSMHandle *, const NLSString *, NLSString *, int64_t *);
using RemoveSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                              int64_t *);

constexpr std::initializer_list<uint32_t> kStatuses = {NLSSM_OK, NLSSM_E_DEST_TOO_SMALL,
                                                       NLSSM_E_NO_MEMORY};

// One raw-buffer edit into a fresh guarded room.
template <typename Run>
void check_raw(int64_t room, const std::vector<uint8_t> &old, Run run) {
  Dest d(room, old);
  int64_t written = 0;
  FUZZ_CHECK(one_of(run(d.data(), &written), kStatuses) && d.intact());
  FUZZ_CHECK(written >= 0 && written <= room);
}

// One descriptor edit into a fresh guarded room, positioned at `at`.
template <typename Run>
void check_described(const NLSSMHandle *h, int64_t room, int64_t at,
                     const std::vector<uint8_t> &old, Run run) {
  Dest d(room, old);
  NLSString dst = over(h, d.data(), std::min<int64_t>(room, at + 1), room, at);
  const uint64_t start = dst.curOffset < 0 ? 0 : static_cast<uint64_t>(dst.curOffset);
  int64_t written = 0;
  FUZZ_CHECK(one_of(run(&dst, &written), kStatuses) && d.intact());
  FUZZ_CHECK(written >= 0 && static_cast<uint64_t>(written) <= room - start);
  FUZZ_CHECK(dst.length <= static_cast<uint64_t>(room));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider in(data, size);
  const NLSSMHandle *h = pick_handle(in);
  const int64_t room = in.ConsumeIntegralInRange<int64_t>(0, 80);
  const int64_t at = in.ConsumeIntegralInRange<int64_t>(-1, 4);
  const int64_t n = in.ConsumeIntegralInRange<int64_t>(-1, 12);
  const int64_t pairs = in.ConsumeIntegralInRange<int64_t>(-1, 6);
  const Text from = take_text(in, 8);
  const Text to = take_text(in, 8);
  const Text text = take_text(in, 96);
  const std::vector<uint8_t> old = in.ConsumeBytes<uint8_t>(room);
  {
    FaultWindow faults(in);
    const NLSString src = over(h, text, in);
    const NLSString f = over(h, from, in);
    const NLSString t = over(h, to, in);

    check_raw(room, old, [&](uint8_t *d, int64_t *w) {
      return slot<TranslitSFn>(h->NLSStringTransliterateS)(h, text.data(), text.size, to.data(),
                                                           to.size, from.data(), from.size, pairs,
                                                           d, room, w, 0);
    });
    check_raw(room, old, [&](uint8_t *d, int64_t *w) {
      return slot<TranwordSFn>(h->NLSStringTranwordS)(h, text.data(), text.size, to.data(), to.size,
                                                      from.data(), from.size, d, room, w, 0);
    });
    check_raw(room, old, [&](uint8_t *d, int64_t *w) {
      return slot<SqueezeSFn>(h->NLSStringSqueezeS)(h, text.data(), text.size, from.data(),
                                                    from.size, d, room, w);
    });
    check_raw(room, old, [&](uint8_t *d, int64_t *w) {
      int64_t characters = 0;
      return slot<SqueezeLitSFn>(h->NLSStringSqueezeLitS)(h, text.data(), text.size, from.data(),
                                                          from.size, d, room, w, &characters, 0);
    });
    check_raw(room, old, [&](uint8_t *d, int64_t *w) {
      const int64_t st =
          slot<RemoveSFn>(h->NLSStringRemoveDelimitersS)(h, text.data(), text.size, d, room, w);
      return st;
    });
    check_described(h, room, at, old, [&](NLSString *d, int64_t *w) {
      return slot<TranslitFn>(h->NLSStringTransliterate)(h, &src, n, &t, &f, pairs, d, w, 0);
    });
    check_described(h, room, at, old, [&](NLSString *d, int64_t *w) {
      return slot<TranwordFn>(h->NLSStringTranword)(h, &src, n, &t, n, &f, n, d, w, 0);
    });
    check_described(h, room, at, old, [&](NLSString *d, int64_t *w) {
      return slot<SqueezeFn>(h->NLSStringSqueeze)(h, &src, n, &f, d, w);
    });
    check_described(h, room, at, old, [&](NLSString *d, int64_t *w) {
      return slot<RemoveFn>(h->NLSStringRemoveDelimiters)(h, &src, d, w);
    });

    if (h->encodingClass == NLSSM_CLASS_SBCS || h->encodingClass == NLSSM_CLASS_UTF8) {
      Dest d(text.size, {});
      int64_t written = -1;
      const int64_t st = slot<TranslitSFn>(h->NLSStringTransliterateS)(
          h, text.data(), text.size, nullptr, 0, nullptr, 0, 0, d.data(), text.size, &written, 0);
      FUZZ_CHECK(st == NLSSM_OK && written == text.size);
      FUZZ_CHECK(text.size == 0 || std::memcmp(d.data(), text.data(), text.size) == 0);
    }
  }
  check_pools();
  return 0;
}
