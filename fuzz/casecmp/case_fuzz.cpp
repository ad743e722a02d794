// Fuzzes the case-mapping and normalization members of every class but
// UTF-EBCDIC (whose codec needs a host's transcoders): arbitrary bytes,
// positions, counts and options on buffers of exactly the stated size, so
// AddressSanitizer reports any access outside them. Handles are built here
// from the catalogue and the module's own slot filling; their owner answers
// the character-information query with a few mappings that change a
// character's length. The C forms are left out: they trust the caller.
#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <cstdlib>
#include <cstring>
#include <memory>

#include "module/encoding_tables.hpp"
#include "module/operation_table.hpp"

namespace {

using PlainFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, uint32_t);
using BytesFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t);
using NormalizeFn = int64_t (*)(const NLSSMHandle *, const NLSString *, NLSString *, int64_t,
                                uint32_t);
using NormalizeSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                                 int64_t *, uint32_t);

int64_t char_info(void *, uint32_t c, NLSHostCharInfo *info) {
  if (c > 0x10FFFF) return 1;
  std::memset(info, 0, sizeof *info);
  if (c >= 'a' && c <= 'z') info->upper = c - 32;
  if (c >= 'A' && c <= 'Z') info->lower = c + 32;
  if (c == 0x17F) info->upper = 'S';     // two bytes to one
  if (c == 0x23A) info->lower = 0x2C65;  // two bytes to three
  if (c == 0x2C65) info->upper = 0x23A;
  if (c == 0x1E9E) info->lower = 0xDF;  // three bytes to two
  if (c == 0x10400) info->lower = 0x10428;
  return 0;
}

void *owner_words[64] = {};

struct Encoding {
  int number;
  uint32_t cls;
  uint32_t unitWidth;
  uint8_t leadLow[2], leadHigh[2];
};
constexpr Encoding kEncodings[] = {
    {78, 0, 1, {}, {}},
    {29, 0, 1, {}, {}},
    {20, 1, 1, {}, {}},
    {24, 2, 2, {}, {}},
    {25, 2, 2, {}, {}},
    {26, 3, 4, {}, {}},
    {27, 3, 4, {}, {}},
    {129, 4, 1, {}, {}},
    {135, 5, 1, {0x81, 0xE0}, {0x9F, 0xFC}},
    {134, 5, 1, {0x8E, 0xA1}, {0x8F, 0xFE}},
    {119, 5, 1, {0x8E, 0xA1}, {0x8E, 0xFE}},
    {205, 5, 1, {0x81, 0x81}, {0xFE, 0xFE}},
};

struct Handles {
  NLSSMHandle h[std::size(kEncodings)] = {};
  uint8_t ranges[64] = {};
  Handles() {
    owner_words[NLSHOST_SLOT_NLS_CHAR_INFO] = reinterpret_cast<void *>(&char_info);
    ranges[26] = 0x0E;
    ranges[30] = 0x0F;
    for (size_t i = 0; i < std::size(kEncodings); ++i) {
      const Encoding &e = kEncodings[i];
      NLSSMHandle &x = h[i];
      x.owner = owner_words;
      x.encodingNumber = static_cast<uint32_t>(e.number);
      x.encodingClass = e.cls;
      x.unitWidth = e.unitWidth;
      nlssm::module::attach_encoding_tables(x);
      x.shiftLength = 1;
      x.charRanges = ranges;
      for (int r = 0; r < 2; ++r)
        for (int b = e.leadLow[r]; e.leadLow[r] != 0 && b <= e.leadHigh[r]; ++b)
          x.charClass[b] |= 0x44;
      nlssm::module::fill_operation_slots(x);
    }
  }
};

bool known(int64_t s) {
  return s == NLSSM_OK || s == NLSSM_E_DEST_TOO_SMALL || s == NLSSM_E_BAD_OPTIONS ||
         s == NLSSM_E_NULL_ARGUMENT;
}
void check(bool ok) {
  if (!ok) std::abort();
}
std::unique_ptr<uint8_t[]> exactly(const uint8_t *data, size_t n, size_t capacity) {
  std::unique_ptr<uint8_t[]> p(new uint8_t[capacity == 0 ? 1 : capacity]);
  std::memset(p.get(), 0x40, capacity);
  if (n > 0) std::memcpy(p.get(), data, n);
  return p;
}
NLSString over(uint8_t *p, size_t n, size_t capacity, int64_t offset, uint32_t kind) {
  NLSString s{};
  s.buffer = p;
  s.length = n;
  s.capacity = capacity;
  s.curOffset = offset;
  s.charKind = kind & 7;
  s.prevKind = kind >> 4;
  return s;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  static const Handles handles;
  if (size < 4) return 0;
  const NLSSMHandle *h = &handles.h[data[0] % std::size(kEncodings)];
  const uint32_t options = data[1] % 10;
  const int64_t count = data[2] % 8;
  const uint32_t kind = data[3];
  data += 4;
  size -= 4;
  const int64_t offset = size == 0 ? NLSSM_POS_NONE : static_cast<int64_t>(kind % (size + 1));
  for (NLSSlot slot : {h->NLSStringLower, h->NLSStringUpper}) {
    auto t = exactly(data, size, size);
    NLSString s = over(t.get(), size, size, offset, kind);
    check(known(reinterpret_cast<PlainFn>(slot)(h, &s, count, options)));
  }
  for (NLSSlot slot : {h->NLSStringLowerS, h->NLSStringUpperS}) {
    auto t = exactly(data, size, size);
    check(known(reinterpret_cast<BytesFn>(slot)(h, t.get(), static_cast<int64_t>(size), options)));
  }
  for (const size_t capacity : {size / 2, size + 3}) {  // smaller and larger than the source
    auto from = exactly(data, size, size);
    auto to = exactly(data, size / 3, capacity);
    NLSString src = over(from.get(), size, size, offset, kind);
    NLSString dst = over(to.get(), size / 3, capacity, static_cast<int64_t>(kind % 5), kind >> 2);
    check(
        known(reinterpret_cast<NormalizeFn>(h->NLSStringNormalize)(h, &src, &dst, count, options)));
    check(dst.length <= capacity);
    auto out = exactly(data, 0, capacity);
    int64_t written = -1;
    check(known(reinterpret_cast<NormalizeSFn>(h->NLSStringNormalizeS)(
        h, from.get(), static_cast<int64_t>(size), out.get(), static_cast<int64_t>(capacity),
        &written, options)));
    check(written <= static_cast<int64_t>(size > capacity ? size : capacity));
  }
  return 0;
}
