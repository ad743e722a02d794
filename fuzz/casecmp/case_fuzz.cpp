// Fuzzes the case-mapping and normalization members of every class through
// reference-host handles: arbitrary bytes, positions, counts and options on
// buffers of exactly the stated size, so AddressSanitizer reports any access
// outside them. The C forms are left out: they trust the caller's count.
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <cstdlib>
#include <cstring>
#include <memory>

namespace {

using PlainFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, uint32_t);
using BytesFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t);
using NormalizeFn = int64_t (*)(const NLSSMHandle *, const NLSString *, NLSString *, int64_t,
                                uint32_t);
using NormalizeSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                                 int64_t *, uint32_t);

constexpr int kEncodings[] = {78, 29, 20, 161, 24, 25, 26, 27, 129, 135, 134, 119, 205, 168};

const NLSSMHandle *handle(int encoding) {
  static auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  return host->create_handle(encoding, &h) == 0 ? h : nullptr;
}

bool known(int64_t s) {
  return s == NLSSM_OK || s == NLSSM_E_DEST_TOO_SMALL || s == NLSSM_E_BAD_OPTIONS ||
         s == NLSSM_E_NULL_ARGUMENT;
}
void check(bool ok) {
  if (!ok) std::abort();
}

// A descriptor over a fresh copy of the text, positioned by `offset`.
struct Text {
  std::unique_ptr<uint8_t[]> bytes;
  NLSString s{};
  Text(const uint8_t *data, size_t n, size_t capacity, int64_t offset, uint32_t kind)
      : bytes(new uint8_t[capacity == 0 ? 1 : capacity]) {
    std::memset(bytes.get(), 0x40, capacity);
    std::memcpy(bytes.get(), data, n);
    s.buffer = bytes.get();
    s.length = n;
    s.capacity = capacity;
    s.curOffset = offset;
    s.prevKind = kind >> 4;
    s.charKind = kind & 7;
  }
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  if (size < 4) return 0;
  const NLSSMHandle *h = handle(kEncodings[data[0] % std::size(kEncodings)]);
  if (h == nullptr) return 0;
  const uint32_t options = data[1] % 10;
  const int64_t count = data[2] % 8;
  const uint32_t kind = data[3];
  data += 4;
  size -= 4;
  const int64_t offset = size == 0 ? NLSSM_POS_NONE : static_cast<int64_t>(kind % (size + 1));
  for (NLSSlot slot : {h->NLSStringLower, h->NLSStringUpper}) {
    Text t(data, size, size, offset, kind);
    check(known(reinterpret_cast<PlainFn>(slot)(h, &t.s, count, options)));
  }
  for (NLSSlot slot : {h->NLSStringLowerS, h->NLSStringUpperS}) {
    std::unique_ptr<uint8_t[]> b(new uint8_t[size == 0 ? 1 : size]);
    std::memcpy(b.get(), data, size);
    check(known(reinterpret_cast<BytesFn>(slot)(h, b.get(), static_cast<int64_t>(size), options)));
  }
  // Destinations smaller and larger than the source.
  for (const size_t capacity : {size / 2, size + 3}) {
    Text src(data, size, size, offset, kind);
    Text dst(data, size / 3, capacity, static_cast<int64_t>(kind % 5), kind >> 2);
    check(known(
        reinterpret_cast<NormalizeFn>(h->NLSStringNormalize)(h, &src.s, &dst.s, count, options)));
    check(dst.s.length <= capacity);
    std::unique_ptr<uint8_t[]> out(new uint8_t[capacity == 0 ? 1 : capacity]);
    int64_t written = -1;
    check(known(reinterpret_cast<NormalizeSFn>(h->NLSStringNormalizeS)(
        h, data, static_cast<int64_t>(size), out.get(), static_cast<int64_t>(capacity), &written,
        options)));
    check(written <= static_cast<int64_t>(std::max(capacity, size)));
  }
  return 0;
}
