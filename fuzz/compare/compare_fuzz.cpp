// Fuzzes equality, inequality and ordering on handles of every class: a
// text equals itself and orders equal to itself, ordering is antisymmetric
// and names an offset inside the operands, equality answers 0 or 1, and
// inequality answers "none" or a position inside the string.
#include "fuzz_support.hpp"

using namespace fuzz_support;

namespace {

using EqualsFn = int64_t (*)(const NLSSMHandle *, const NLSString *, const NLSString *, int64_t,
                             int32_t);
using EqualsSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                              int64_t, int32_t);
using NotEqualFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, const NLSString *,
                               int64_t);
using NotEqualSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                                int64_t);
using NotEqualLitSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                                   int64_t, uint32_t);
using CompStrFn = int64_t (*)(const NLSSMHandle *, const NLSString *, const NLSString *, int64_t,
                              uint32_t);
using CompareSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                               int64_t, uint32_t);
using CompLitSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                               int64_t, uint32_t);

int sign(int64_t v) {
  return (v > 0) - (v < 0);
}

// An ordering answer: 0, or the deciding offset plus one with the sign of
// the order, the offset no further than the longer operand's end.
void check_order(int64_t r, int64_t longer) {
  FUZZ_CHECK(r == 0 || (r > 0 ? r : -r) <= longer + 1);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider in(data, size);
  const NLSSMHandle *h = pick_handle(in);
  const int64_t count = in.ConsumeIntegralInRange<int64_t>(-1, 20);
  const uint32_t options = in.ConsumeIntegralInRange<uint32_t>(0, 7);
  const Text a = take_text(in, 80);
  const Text b = take_text(in, 80);
  {
    FaultWindow faults(in);
    const int64_t longer = std::max(a.size, b.size);
    const int64_t units =
        h->encodingClass == NLSSM_CLASS_SBCS ? a.size : positions_in(h, a.data(), a.size);

    // UTF-EBCDIC handles have no plain or S equality member.
    const auto eq_s = slot<EqualsSFn>(h->NLSStringEqualsS);
    const bool equality = h->NLSStringEqualsS != nullptr && h->NLSStringEquals != nullptr;
    const NLSString da = over(h, a, in);
    const NLSString db = over(h, b, in);
    if (equality) {
      const int64_t eq = eq_s(h, a.data(), a.size, b.data(), b.size, static_cast<int32_t>(options));
      FUZZ_CHECK(eq == 0 || eq == 1);
      const int64_t eqd =
          slot<EqualsFn>(h->NLSStringEquals)(h, &da, &db, count, static_cast<int32_t>(options));
      FUZZ_CHECK(eqd == 0 || eqd == 1);
    }
    if (const int64_t whole = whole_chars(h, a.data(), a.size); whole >= 0) {
      const Text c = for_c_form(a);
      const int64_t eqc =
          slot<EqualsSFn>(h->NLSStringEqualsC)(h, c.data(), whole, c.data(), whole, 0);
      FUZZ_CHECK(eqc == 0 || eqc == 1);
    }

    const auto cmp_s = slot<CompareSFn>(h->NLSStringCompareS);
    const int64_t ab = cmp_s(h, a.data(), a.size, b.data(), b.size, options);
    const int64_t ba = cmp_s(h, b.data(), b.size, a.data(), a.size, options);
    check_order(ab, longer);
    check_order(ba, longer);
    FUZZ_CHECK(sign(ab) == -sign(ba));
    FUZZ_CHECK(cmp_s(h, a.data(), a.size, a.data(), a.size, options) == 0);
    check_order(slot<CompStrFn>(h->NLSStringCompStr)(h, &da, &db, count, options), longer);
    check_order(slot<CompStrFn>(h->NLSStringCompare)(h, &da, &db, count, options), longer);
    const int64_t lit =
        slot<CompLitSFn>(h->NLSStringCompLitS)(h, a.data(), a.size, b.data(), b.size, options);
    // The literal is converted first: up to four bytes for each of its bytes.
    FUZZ_CHECK(lit == NLSSM_COUNT_NO_MEMORY || (lit > 0 ? lit : -lit) <= 4 * longer + 1);

    const int64_t ne =
        slot<NotEqualSFn>(h->NLSStringNotEqualS)(h, a.data(), a.size, b.data(), b.size);
    FUZZ_CHECK(ne >= -1 && ne < std::max<int64_t>(units, 1));
    const int64_t ned = slot<NotEqualFn>(h->NLSStringNotEqual)(h, &da, count, &db, count);
    FUZZ_CHECK(ned >= -1 && ned < std::max<int64_t>(units, 1));
    const int64_t nel =
        slot<NotEqualLitSFn>(h->NLSStringNotEqualLitS)(h, a.data(), a.size, b.data(), b.size, 0);
    // A set that cannot be converted answers the no-memory count.
    FUZZ_CHECK(nel == NLSSM_COUNT_NO_MEMORY || (nel >= -1 && nel < std::max<int64_t>(units, 1)));
    if (a.size > 0 && well_formed(h, a.data(), a.size)) {
      if (equality) FUZZ_CHECK(eq_s(h, a.data(), a.size, a.data(), a.size, 0) == 1);
      FUZZ_CHECK(slot<NotEqualSFn>(h->NLSStringNotEqualS)(h, a.data(), a.size, a.data(), a.size) ==
                 -1);
    }
  }
  check_pools();
  return 0;
}
