// Reference-host handles and calls through their case slots, for the case
// mapping tests.
#pragma once

#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>
#include "reference_handles.hpp"

#include <cstdint>
#include <vector>

namespace case_test {

using Bytes = std::vector<uint8_t>;

using test_support::handle;

// A descriptor over `text`, positioned at byte `offset` with kind `kind`.
inline NLSString over(Bytes &text, int64_t offset = 0, uint32_t kind = NLSSM_KIND_SINGLE) {
  NLSString s{};
  s.buffer = text.data();
  s.length = text.size();
  s.capacity = text.size();
  s.curOffset = offset;
  s.nextOffset = NLSSM_POS_NONE;
  s.prevOffset = NLSSM_POS_NO_PREVIOUS;
  s.charKind = kind;
  return s;
}

template <typename Fn, typename... Args>
int64_t call(const NLSSMHandle *h, NLSSlot slot, Args... args) {
  return reinterpret_cast<Fn>(slot)(h, args...);
}

using PlainFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, uint32_t);
using BytesFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t);
using NormalizeFn = int64_t (*)(const NLSSMHandle *, const NLSString *, NLSString *, int64_t,
                                uint32_t);
using NormalizeSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                                 int64_t *, uint32_t);

inline int64_t upper(const NLSSMHandle *h, NLSString &s, int64_t count, uint32_t options = 0) {
  return call<PlainFn>(h, h->NLSStringUpper, &s, count, options);
}
inline int64_t lower(const NLSSMHandle *h, NLSString &s, int64_t count, uint32_t options = 0) {
  return call<PlainFn>(h, h->NLSStringLower, &s, count, options);
}
// The S form (whole buffer) or the C form (count characters).
inline int64_t upper_s(const NLSSMHandle *h, Bytes &b, uint32_t options = 0) {
  return call<BytesFn>(h, h->NLSStringUpperS, b.data(), static_cast<int64_t>(b.size()), options);
}
inline int64_t lower_s(const NLSSMHandle *h, Bytes &b, uint32_t options = 0) {
  return call<BytesFn>(h, h->NLSStringLowerS, b.data(), static_cast<int64_t>(b.size()), options);
}
inline int64_t upper_c(const NLSSMHandle *h, Bytes &b, int64_t count, uint32_t options = 0) {
  return call<BytesFn>(h, h->NLSStringUpperC, b.data(), count, options);
}
inline int64_t normalize(const NLSSMHandle *h, NLSString &src, NLSString &dst, int64_t count,
                         uint32_t options) {
  return call<NormalizeFn>(h, h->NLSStringNormalize, &src, &dst, count, options);
}
inline int64_t normalize_s(const NLSSMHandle *h, const Bytes &src, Bytes &dst, int64_t *written,
                           uint32_t options) {
  return call<NormalizeSFn>(h, h->NLSStringNormalizeS, src.data(), static_cast<int64_t>(src.size()),
                            dst.data(), static_cast<int64_t>(dst.size()), written, options);
}

}  // namespace case_test
