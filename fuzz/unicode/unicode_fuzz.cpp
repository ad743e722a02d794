// Fuzzes the UTF decoders, the decoding driver, the encoding driver and the
// UTF-8 legality test. Every buffer is allocated with exactly the padding the
// header promises a function may read past its stated length, so that
// AddressSanitizer reports any read further out.
#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <vector>

namespace {

void check(bool ok) {
  if (!ok) std::abort();
}

// `n` bytes of `data` followed by `pad` continuation bytes (which lengthen
// the skip after an invalid UTF-8 lead as far as it goes).
std::unique_ptr<uint8_t[]> padded(const uint8_t *data, size_t n, size_t pad) {
  std::unique_ptr<uint8_t[]> p(new uint8_t[n + pad]);
  if (n > 0) std::memcpy(p.get(), data, n);
  std::memset(p.get() + n, 0x80, pad);
  return p;
}

bool known_status(int64_t s) {
  return s == NLSSM_OK || s == NLSSM_E_ILL_FORMED || s == NLSSM_E_TRUNCATED_SEQUENCE;
}

// Not recognised by the driver: runs its generic loop.
int64_t utf8_via_pointer(const uint8_t *s, int64_t n, uint32_t *cp, int64_t *consumed) {
  return UTF8_UTF32(s, n, cp, consumed);
}

void fuzz_utf8(const uint8_t *data, int64_t n) {
  auto buf = padded(data, n, 5);
  const uint8_t *p = buf.get();
  std::vector<uint32_t> decoded;
  int64_t stop_status = NLSSM_OK;
  for (int64_t pos = 0; pos < n;) {
    uint32_t cp = 0;
    int64_t used = -1;
    const int64_t st = UTF8_UTF32(p + pos, n - pos, &cp, &used);
    check(known_status(st) && used >= 1 && used <= 6);
    if (st == NLSSM_OK) {
      static constexpr uint32_t kBound[5] = {0, 0x80, 0x800, 0x10000, 0x200000};
      check(used <= 4 && used <= n - pos && cp < kBound[used]);
      // A sequence isLegalUTF8 accepts is canonical: it re-encodes to itself.
      if (isLegalUTF8(p + pos, used, nullptr) == 1) {
        uint8_t again[4];
        int64_t w = 0;
        check(UTF32_UTF8(cp, again, 4, &w) == NLSSM_OK && w == used);
        check(std::memcmp(again, p + pos, used) == 0);
      }
    } else {
      check(cp == 0xFFFD);
    }
    if (st != NLSSM_OK && stop_status == NLSSM_OK) stop_status = st;
    if (stop_status == NLSSM_OK) decoded.push_back(cp);
    pos += used;
  }
  for (int64_t pos = 0; pos < n; ++pos)
    for (int64_t len = 1; len <= 6 && pos + len <= n; ++len) {
      int64_t index = -1;
      const int64_t legal = isLegalUTF8(p + pos, len, &index);
      check((legal == 0 || legal == 1) && index >= 1 && index <= len);
    }

  // The driver stores exactly the characters decoded before the first
  // failure, up to its capacity, the same way on its fast and generic paths.
  for (int64_t capacity : {int64_t{0}, int64_t{7}, 4 * n / 3 + 1, 4 * n}) {
    std::unique_ptr<uint8_t[]> fast(new uint8_t[capacity + 1]);
    std::unique_ptr<uint8_t[]> slow(new uint8_t[capacity + 1]);
    int64_t wf = -1, ws = -1;
    const int64_t sf = ConvertToUTF32(p, n, fast.get(), capacity, &wf, UTF8_UTF32, COPY_UTF32_SWAP);
    const int64_t ss =
        ConvertToUTF32(p, n, slow.get(), capacity, &ws, utf8_via_pointer, COPY_UTF32_SWAP);
    check(sf == ss && wf == ws && wf % 4 == 0 && wf <= capacity);
    check(wf == 0 || std::memcmp(fast.get(), slow.get(), wf) == 0);
    const size_t limit = static_cast<size_t>(capacity / 4);
    const size_t chars = std::min(limit, decoded.size());
    check(wf == static_cast<int64_t>(4 * chars));
    check(sf == (decoded.size() < limit ? stop_status : NLSSM_OK));
    check(wf == 0 || std::memcmp(fast.get(), decoded.data(), wf) == 0);
  }
}

void fuzz_utf16(const uint8_t *data, int64_t n, NLSUTFDecoder decoder) {
  auto buf = padded(data, n, 2);
  for (int64_t pos = 0; pos < n;) {
    uint32_t cp = 0;
    int64_t used = -1;
    const int64_t st = decoder(buf.get() + pos, n - pos, &cp, &used);
    check(known_status(st) && (used == 1 || used == 2 || used == 4));
    check(st == NLSSM_OK ? cp <= 0x10FFFF && (cp < 0xD800 || cp > 0xDFFF) : cp == 0xFFFD);
    pos += used;
  }
  const int64_t capacity = 2 * n + 1;
  std::unique_ptr<uint8_t[]> out(new uint8_t[capacity]);
  int64_t written = -1;
  const int64_t st =
      ConvertToUTF32(buf.get(), n, out.get(), capacity, &written, decoder, COPY_UTF32);
  check(known_status(st) && written >= 0 && written <= capacity && written % 4 == 0);
}

int64_t utf8_encode_via_pointer(uint32_t c, uint8_t *d, int64_t capacity, int64_t *written) {
  return UTF32_UTF8(c, d, capacity, written);
}

// Re-encodes the input read as 32-bit units into an odd-sized destination,
// with encoders that write short forms without a capacity check.
void fuzz_from_utf32(const uint8_t *data, int64_t n, int64_t capacity) {
  auto src = padded(data, n, 0);
  for (NLSUTFEncoder encoder : {UTF32_UTF8, UTF32_UTF16, UTF32_UTF16s_SWAP, COPY_UTF32}) {
    std::unique_ptr<uint8_t[]> out(new uint8_t[capacity + 1]);
    int64_t written = -1;
    const int64_t st =
        ConvertFromUTF32(src.get(), n, out.get(), capacity, &written, encoder, COPY_UTF32b_SWAP);
    check((st == NLSSM_OK || st == NLSSM_E_DEST_TOO_SMALL) && written >= 0 && written <= capacity);
  }
  // UTF-8 on the block path and unit by unit (through a pointer the driver
  // does not recognise) agree, whether the capacity cuts the text or not.
  for (int64_t room : {capacity, n}) {
    std::unique_ptr<uint8_t[]> fast(new uint8_t[room + 1]), slow(new uint8_t[room + 1]);
    int64_t wf = -1, ws = -1;
    const int64_t sf =
        ConvertFromUTF32(src.get(), n, fast.get(), room, &wf, UTF32_UTF8, COPY_UTF32b_SWAP);
    const int64_t ss =
        ConvertFromUTF32(src.get(), n, slow.get(), room, &ws, utf8_encode_via_pointer,
                         COPY_UTF32b_SWAP);
    check(sf == ss && wf == ws && (wf == 0 || std::memcmp(fast.get(), slow.get(), wf) == 0));
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  if (size == 0) return 0;
  const int64_t n = static_cast<int64_t>(size - 1);
  fuzz_utf8(data + 1, n);
  fuzz_utf16(data + 1, n, data[0] & 1 ? UTF16_UTF32_SWAP : UTF16_UTF32);
  fuzz_from_utf32(data + 1, n, data[0] >> 1);
  return 0;
}
