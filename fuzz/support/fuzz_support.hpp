// Shared pieces of the per-family fuzz targets: one reference host with a
// handle for an encoding of every class (and every non-modal variant), exact
// heap copies of the fuzzed text so that AddressSanitizer reports any read
// past it, destinations followed by guard bytes, and the checks every target
// makes after every input (statuses from a documented set, every pool
// allocation given back).
#pragma once

#include <fuzzer/FuzzedDataProvider.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <initializer_list>
#include <memory>
#include <vector>

namespace fuzz_support {

// The encoding of the input being run, for the failure message.
inline int current_encoding = -1;

// Abort with a line saying what failed; libFuzzer keeps the input.
#define FUZZ_CHECK(cond)                                                                  \
  do {                                                                                    \
    if (!(cond)) {                                                                        \
      std::fprintf(stderr, "%s:%d: check failed (encoding %d): %s\n", __FILE__, __LINE__, \
                   fuzz_support::current_encoding, #cond);                                \
      std::abort();                                                                       \
    }                                                                                     \
  } while (0)

// Latin-1, EBCDIC 37, UTF-8, UTF-EBCDIC, UTF-16 LE and BE, UTF-32 BE, the
// host's own characters, modal EBCDIC Japanese, a double-byte PC page,
// EUC-JP, EUC-TW and GB18030.
inline constexpr int kEncodings[] = {29, 78, 20, 161, 25, 24, 26, 27, 129, 135, 134, 119, 205};
inline constexpr size_t kEncodingCount = sizeof kEncodings / sizeof kEncodings[0];

struct Host {
  std::unique_ptr<nlssm::refhost::ReferenceHost> host;
  const NLSSMHandle *handles[kEncodingCount] = {};
  int64_t allocations = 0;  // live pool allocations once every handle exists
};

inline Host &host() {
  static Host *h = [] {
    auto *made = new Host;
    made->host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
    for (size_t i = 0; i < kEncodingCount; ++i) {
      NLSSMHandle *handle = nullptr;
      FUZZ_CHECK(made->host->create_handle(kEncodings[i], &handle) == 0 && handle);
      made->handles[i] = handle;
    }
    made->allocations = made->host->pools().counts().allocations;
    return made;
  }();
  return *h;
}

// A handle for one more encoding, made before any input runs; the pool
// accounting starts again from it.
inline const NLSSMHandle *extra_handle(int encoding) {
  NLSSMHandle *handle = nullptr;
  FUZZ_CHECK(host().host->create_handle(encoding, &handle) == 0 && handle);
  host().allocations = host().host->pools().counts().allocations;
  return handle;
}

inline const NLSSMHandle *pick_handle(FuzzedDataProvider &in) {
  const size_t i = in.ConsumeIntegralInRange<size_t>(0, kEncodingCount - 1);
  current_encoding = kEncodings[i];
  return host().handles[i];
}

// Sometimes makes one of the next few pool allocations fail, so that the
// paths that give work buffers back after a refusal are fuzzed too.
struct FaultWindow {
  explicit FaultWindow(FuzzedDataProvider &in) {
    const int nth = in.ConsumeIntegralInRange<int>(0, 7);
    if (nth <= 3) host().host->pools().fail_allocation_after(nth);
  }
  ~FaultWindow() { host().host->pools().fail_allocation_after(0); }
};

// Every pool allocation an operation made has been given back.
inline void check_pools() {
  FUZZ_CHECK(host().host->pools().counts().allocations == host().allocations);
}

template <typename Fn>
Fn slot(NLSSlot s) {
  return reinterpret_cast<Fn>(s);
}

inline bool one_of(int64_t status, std::initializer_list<uint32_t> allowed) {
  return std::any_of(allowed.begin(), allowed.end(),
                     [&](uint32_t s) { return status == static_cast<int64_t>(s); });
}

// Fuzzed bytes in a heap block of exactly their size plus `pad` bytes that
// a member is documented to read past its stated length.
struct Text {
  std::unique_ptr<uint8_t[]> bytes;
  int64_t size = 0;
  Text() = default;
  Text(const std::vector<uint8_t> &from, size_t pad = 0)
      : bytes(new uint8_t[from.size() + pad]()), size(static_cast<int64_t>(from.size())) {
    std::copy(from.begin(), from.end(), bytes.get());
  }
  uint8_t *data() const { return bytes.get(); }
};

inline Text take_text(FuzzedDataProvider &in, size_t max = 64, size_t pad = 0) {
  return Text(in.ConsumeBytes<uint8_t>(in.ConsumeIntegralInRange<size_t>(0, max)), pad);
}

// A destination of `capacity` bytes (filled with fuzzed or fill bytes) and
// guard bytes after it.
struct Dest {
  static constexpr size_t kGuard = 32;
  static constexpr uint8_t kGuardByte = 0xE7;
  std::unique_ptr<uint8_t[]> bytes;
  int64_t capacity;
  explicit Dest(int64_t cap, const std::vector<uint8_t> &fill = {})
      : bytes(new uint8_t[static_cast<size_t>(cap) + kGuard]), capacity(cap) {
    std::memset(bytes.get(), 0x40, static_cast<size_t>(cap));
    std::copy_n(fill.begin(), std::min<size_t>(fill.size(), static_cast<size_t>(cap)), bytes.get());
    std::memset(bytes.get() + cap, kGuardByte, kGuard);
  }
  uint8_t *data() const { return bytes.get(); }
  bool intact() const {
    return std::all_of(bytes.get() + capacity, bytes.get() + capacity + kGuard,
                       [](uint8_t b) { return b == kGuardByte; });
  }
};

using SetPosFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);
using NumCharsSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t, int64_t *);

// A descriptor over `length` bytes of `p` (room `capacity`), positioned at
// character `at` through the handle's stringSetPos, or left unset when the
// text is empty or `at` is negative.
inline NLSString over(const NLSSMHandle *h, uint8_t *p, int64_t length, int64_t capacity,
                      int64_t at) {
  NLSString s{};
  s.buffer = p;
  s.length = static_cast<uint64_t>(length);
  s.capacity = static_cast<uint64_t>(capacity);
  s.curOffset = s.nextOffset = NLSSM_POS_NONE;
  s.prevOffset = NLSSM_POS_NO_PREVIOUS;
  if (length > 0 && at >= 0) {
    s.curOffset = 0;
    if (slot<SetPosFn>(h->stringSetPos)(h, &s, at, 0) != at) {
      // No such character: leave the descriptor unset rather than wherever
      // the failed move left it.
      s.charIndex = 0;
      s.curOffset = s.nextOffset = NLSSM_POS_NONE;
      s.prevOffset = NLSSM_POS_NO_PREVIOUS;
    }
  }
  return s;
}

// A descriptor over a text, at a fuzzed character (or unset).
inline NLSString over(const NLSSMHandle *h, const Text &t, FuzzedDataProvider &in) {
  return over(h, t.data(), t.size, t.size, in.ConsumeIntegralInRange<int64_t>(-1, 3));
}

// True when the text is whole characters of the handle's encoding: whole
// units, and nothing the counting slot calls broken.
inline bool well_formed(const NLSSMHandle *h, const uint8_t *p, int64_t n) {
  // Class 1 counts by the lead bytes alone; other members check the bytes
  // after them. UTF-8 is judged by Unicode's rule, UTF-EBCDIC only when empty.
  if (h->encodingClass == NLSSM_CLASS_UTF8)
    return n == 0 || (h->encodingNumber == NLSSM_ENC_UTF8 && qvzsu8Validate(p, n) == n);
  int64_t count = 0;
  return (h->unitWidth <= 1 || n % h->unitWidth == 0) &&
         slot<NumCharsSFn>(h->NLSNumCharsS)(h, p, n, 0, &count) == NLSSM_OK;
}

// Characters in a raw buffer by the handle's counting slot (broken sequences
// counted), or -1 when it fails.
inline int64_t chars_in(const NLSSMHandle *h, const uint8_t *p, int64_t n) {
  int64_t count = 0;
  const int64_t st = slot<NumCharsSFn>(h->NLSNumCharsS)(h, p, n, 0, &count);
  return st == NLSSM_OK || st == NLSSM_E_BAD_CHARACTER ? count : -1;
}

// The characters a character-count (C) form may be given for a text: all
// of them when the text is whole characters, else -1 (such a form reads
// whole characters with no byte limit, so a text cut inside one is not a
// valid argument).
inline int64_t whole_chars(const NLSSMHandle *h, const uint8_t *p, int64_t n) {
  return well_formed(h, p, n) ? chars_in(h, p, n) : -1;
}

// A copy of a text for the character-count forms: zero bytes after it, as
// modal text's forms look at the bytes after the last character for a
// shift-in that closes it.
inline Text for_c_form(const Text &t) {
  return Text(std::vector<uint8_t>(t.data(), t.data() + t.size), 4);
}

// Positions an answer may name in a raw buffer: its characters when it is
// whole characters; otherwise (operations differ in how they cut malformed
// text and trailing parts of units) at most one per byte.
inline int64_t positions_in(const NLSSMHandle *h, const uint8_t *p, int64_t n) {
  return well_formed(h, p, n) ? chars_in(h, p, n) : n;
}

}  // namespace fuzz_support
