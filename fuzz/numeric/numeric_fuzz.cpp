// Fuzzes number parsing and formatting on handles of every class: parsers
// consume no more than the text and answer documented statuses, formatters
// keep to their capacity (guard bytes after it stay untouched), and an
// integer formatted in its own width parses back to itself.
#include "fuzz_support.hpp"

#include <cmath>

using namespace fuzz_support;

namespace {

using ToIntFn = int64_t (*)(const NLSSMHandle *, void *, const void *, int64_t, uint32_t, int64_t *,
                            int32_t *);
using ToDoubleFn = int64_t (*)(const NLSSMHandle *, void *, const void *, int64_t, int64_t,
                               uint32_t, double *, int32_t *);
using FromIntFn = int64_t (*)(const NLSSMHandle *, void *, int64_t, int64_t, uint32_t, void *,
                              int64_t, int32_t *);
using FromDoubleFn = int64_t (*)(const NLSSMHandle *, void *, double, int64_t, int64_t, uint32_t,
                                 void *, int64_t, int32_t *);

constexpr int64_t kLongest = 152;
constexpr std::initializer_list<uint32_t> kParse = {
    NLSSM_OK,           NLSSM_E_NOT_A_NUMBER,       NLSSM_E_INT_OVERFLOW, NLSSM_E_NUMBER_TOO_LONG,
    NLSSM_E_ILL_FORMED, NLSSM_E_TRUNCATED_SEQUENCE, NLSSM_E_NO_MEMORY,    NLSSM_E_BAD_OPTIONS};
constexpr std::initializer_list<uint32_t> kFormat = {
    NLSSM_OK,          NLSSM_E_NUMBER_DOES_NOT_FIT, NLSSM_E_DEST_TOO_SMALL, NLSSM_E_NUMBER_TOO_LONG,
    NLSSM_E_NO_MEMORY, NLSSM_E_BAD_OPTIONS,         NLSSM_E_ILL_FORMED};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider in(data, size);
  const NLSSMHandle *h = pick_handle(in);
  const uint32_t flags = in.ConsumeBool() ? NLSSM_NUMBER_STRICT_TAIL : 0;
  const uint32_t format_flags = in.ConsumeIntegralInRange<uint32_t>(0, 15);
  const int64_t value = in.ConsumeIntegral<int64_t>();
  const double real = in.ConsumeFloatingPoint<double>();
  const int64_t width = in.ConsumeIntegralInRange<int64_t>(-1, 40);
  const int64_t decimals = in.ConsumeIntegralInRange<int64_t>(-1, 16);
  const int64_t capacity = in.ConsumeIntegralInRange<int64_t>(-1, kLongest + 2);
  const Text text = take_text(in, kLongest + 4);
  {
    FaultWindow faults(in);
    int64_t parsed = 0;
    int32_t consumed = -1;
    const int64_t pi = slot<ToIntFn>(h->NLSStringToIntmax)(h, nullptr, text.data(), text.size,
                                                           flags, &parsed, &consumed);
    FUZZ_CHECK(one_of(pi, kParse));
    if (pi != NLSSM_E_NUMBER_TOO_LONG && pi != NLSSM_E_NO_MEMORY)
      FUZZ_CHECK(consumed >= 0 && consumed <= text.size);
    if (pi == NLSSM_E_INT_OVERFLOW) FUZZ_CHECK(parsed == 0);
    double parsed_real = 0;
    consumed = -1;
    const int64_t pd = slot<ToDoubleFn>(h->NLSStringToDouble)(h, nullptr, text.data(), text.size, 0,
                                                              flags, &parsed_real, &consumed);
    FUZZ_CHECK(one_of(pd, kParse));
    if (pd == NLSSM_OK) FUZZ_CHECK(consumed >= 0 && consumed <= text.size);

    const int64_t room = std::max<int64_t>(capacity, 0);
    Dest di(room);
    int32_t written = -1;
    const int64_t fi = slot<FromIntFn>(h->NLSStringFromIntmax)(
        h, nullptr, value, width, format_flags, di.data(), capacity, &written);
    FUZZ_CHECK(one_of(fi, kFormat) && di.intact());
    if (fi != NLSSM_E_NUMBER_TOO_LONG && fi != NLSSM_E_NO_MEMORY)
      FUZZ_CHECK(written >= 0 && written <= room);
    Dest dd(room);
    written = -1;
    const int64_t fd = slot<FromDoubleFn>(h->NLSStringFromDouble)(
        h, nullptr, real, width, decimals, format_flags & 0xB, dd.data(), capacity, &written);
    FUZZ_CHECK(one_of(fd, kFormat) && dd.intact());
    if (fd == NLSSM_OK) FUZZ_CHECK(written >= 0 && written <= room);

    // Round trip: the plain form in its own width reads back as the value.
    Dest own(kLongest);
    written = -1;
    if (slot<FromIntFn>(h->NLSStringFromIntmax)(h, nullptr, value, 0, 0, own.data(), kLongest,
                                                &written) == NLSSM_OK) {
      FUZZ_CHECK(written > 0 && written <= kLongest && own.intact());
      int64_t back = value ^ 1;
      consumed = -1;
      const int64_t st =
          slot<ToIntFn>(h->NLSStringToIntmax)(h, nullptr, own.data(), written, 0, &back, &consumed);
      FUZZ_CHECK(st == NLSSM_OK && back == value && consumed == written);
    }
  }
  check_pools();
  return 0;
}
