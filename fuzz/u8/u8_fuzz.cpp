// Fuzzes the UTF-8 toolkit: validation, counting and offsets agree with one
// another, case mappings keep to their capacity (guard bytes after it stay
// untouched) and report what the whole mapping needs, folding is idempotent
// under the caseless comparison, ordering is antisymmetric, and a found
// pattern is really at the offset reported.
#include "fuzz_support.hpp"

using namespace fuzz_support;

namespace {

using MapFn = int64_t (*)(uint8_t *, int64_t, const uint8_t *, int64_t, uint32_t, int64_t *,
                          int64_t *);

int sign(int64_t v) {
  return (v > 0) - (v < 0);
}

// Maps `t` into `capacity` bytes; answers the bytes the whole mapping needs.
int64_t check_map(MapFn map, const Text &t, int64_t capacity, uint32_t options, bool valid) {
  Dest d(capacity);
  int64_t written = -1, needed = -1;
  const int64_t st = map(d.data(), capacity, t.data(), t.size, options, &written, &needed);
  FUZZ_CHECK(one_of(st, {NLSSM_OK, NLSSM_E_DEST_TOO_SMALL, NLSSM_E_ILL_FORMED}) && d.intact());
  FUZZ_CHECK(written >= 0 && written <= capacity && written <= needed);
  FUZZ_CHECK((st == NLSSM_E_DEST_TOO_SMALL) == (needed > capacity));
  if (st != NLSSM_E_DEST_TOO_SMALL) FUZZ_CHECK(written == needed);
  if (st != NLSSM_E_DEST_TOO_SMALL) FUZZ_CHECK((st == NLSSM_OK) == valid);
  return needed;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider in(data, size);
  const uint32_t options = in.ConsumeBool() ? QVZSU8_FULL : 0;
  const int64_t capacity = in.ConsumeIntegralInRange<int64_t>(0, 200);
  const Text b = take_text(in, 16);
  const Text a = take_text(in, 160);

  const int64_t valid_to = qvzsu8Validate(a.data(), a.size);
  FUZZ_CHECK(valid_to >= 0 && valid_to <= a.size);
  const bool valid = valid_to == a.size;
  const int64_t chars = qvzsu8Length(a.data(), a.size);
  FUZZ_CHECK(chars >= 0 && chars <= a.size);
  FUZZ_CHECK(qvzsu8Offset(a.data(), a.size, chars) == a.size);
  FUZZ_CHECK(qvzsu8Offset(a.data(), a.size, chars + 1) == -1);
  for (int64_t i = 0, last = -1; i < chars; ++i) {
    const int64_t at = qvzsu8Offset(a.data(), a.size, i);
    FUZZ_CHECK(at > last && at < a.size);
    last = at;
  }

  for (MapFn map : {qvzsu8Upper, qvzsu8Lower, qvzsu8Fold}) {
    const int64_t needed = check_map(map, a, capacity, options, valid);
    check_map(map, a, needed, options, valid);
  }
  if (valid) {
    std::vector<uint8_t> folded(static_cast<size_t>(3 * a.size + 1));
    int64_t written = 0;
    FUZZ_CHECK(qvzsu8Fold(folded.data(), static_cast<int64_t>(folded.size()), a.data(), a.size,
                          QVZSU8_FULL, &written, nullptr) == NLSSM_OK);
    FUZZ_CHECK(qvzsu8CaseCompare(a.data(), a.size, folded.data(), written) == 0);
  }

  const int64_t ab = qvzsu8Compare(a.data(), a.size, b.data(), b.size);
  FUZZ_CHECK(ab >= -1 && ab <= 1 && ab == -qvzsu8Compare(b.data(), b.size, a.data(), a.size));
  FUZZ_CHECK(qvzsu8Compare(a.data(), a.size, a.data(), a.size) == 0);
  const int64_t cab = qvzsu8CaseCompare(a.data(), a.size, b.data(), b.size);
  FUZZ_CHECK(sign(cab) == -sign(qvzsu8CaseCompare(b.data(), b.size, a.data(), a.size)));

  const int64_t found = qvzsu8Find(a.data(), a.size, b.data(), b.size);
  FUZZ_CHECK(found == -1 || (found >= 0 && found <= a.size - b.size));
  if (found >= 0 && b.size > 0) FUZZ_CHECK(std::memcmp(a.data() + found, b.data(), b.size) == 0);
  FUZZ_CHECK(qvzsu8Find(a.data(), a.size, a.data(), a.size) == 0);
  return 0;
}
