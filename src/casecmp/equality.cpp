// Case-insensitive equality: NLSStringEquals with its S and C forms, for
// every encoding class. The result is 1 (equal) or 0; every failure (bad
// options, no current character, no work buffer) answers 0.
#include <nlssm/nlssm.h>

#include <type_traits>

#include "casecmp/compare.hpp"
#include "module/work_buffer.hpp"

namespace nlssm::casecmp {
namespace {

using cursor::FixedModel;
using cursor::SbcsModel;
using cursor::Wcs2Model;

// The options of the table-folding members: 0 folds through lowerTable with
// equal lengths, bit 1 through lowerTable with blank padding, bit 2 (without
// bit 1) through upperTable; anything else is refused.
struct EqualsMode {
  bool valid;
  bool pad;
  const uint8_t *table;
};

EqualsMode equals_mode(const NLSSMHandle *h, int32_t options) {
  if (options & 1) return {true, true, h->lowerTable};
  if (options & 2) return {true, false, h->upperTable};
  if (options == 0) return {true, false, h->lowerTable};
  return {false, false, nullptr};
}

// The padding check of the table-folding members: the longer operand's
// bytes from twice the common length to its end must be the blank. The bytes
// right after the common part are not looked at.
bool blank_rest(const uint8_t *longer, int64_t length, int64_t m, uint8_t blank) {
  const int64_t from = 2 * m;
  return from >= length || kernel::hot().mem_nscan(longer + from, length - from, blank) < 0;
}

// Table-folding comparison of m bytes. Equal bytes are passed by the vector
// compare; at a difference the walker says whether it falls at the start of
// a character (its first bytes differ: folded as single bytes, one byte on)
// or inside one whose first bytes agreed (not equal). Double-byte
// characters of modal text are never folded.
template <class M>
bool equal_folded(const M &m, const uint8_t *a, const uint8_t *b, int64_t n, const uint8_t *table,
                  uint32_t state) {
  Walker<M> walk(m, a, n, state);
  int64_t i = 0, j = 0;
  return scan(a, n, b, n, i, j, [&](int64_t &x, int64_t &y) {
    if constexpr (!std::is_same_v<M, SbcsModel>) {
      if (!walk.reach(x)) return false;
      if (M::kModal && cursor::modal_double(walk.state)) return false;
      walk.step_one();
    }
    if (table == nullptr || table[a[x]] != table[b[x]]) return false;
    y = ++x;
    return true;
  });
}

template <class M>
int64_t equals_bytes(const NLSSMHandle *h, const M &m, Span a, Span b, int64_t count,
                     int32_t options, uint32_t state = cursor::kModalSingle) {
  const EqualsMode mode = equals_mode(h, options);
  if (!mode.valid) return 0;
  limit_bytes(a.n, b.n, count);
  if (!mode.pad && a.n != b.n) return 0;
  const int64_t common = std::min(a.n, b.n);
  if (!equal_folded(m, a.p, b.p, common, mode.table, state)) return 0;
  if (!mode.pad) return 1;
  const Span &longer = a.n >= b.n ? a : b;
  return blank_rest(longer.p, longer.n, common, h->blankChar[0]) ? 1 : 0;
}

bool raw_spans(const uint8_t *pa, int64_t la, const uint8_t *pb, int64_t lb, Span &a, Span &b) {
  return raw_span(pa, la, a) && raw_span(pb, lb, b);
}

// Character counts of the C forms become byte lengths (no byte limit).
template <class M>
bool char_spans(const M &m, const uint8_t *pa, int64_t ca, const uint8_t *pb, int64_t cb, Span &a,
                Span &b) {
  if (!raw_spans(pa, ca, pb, cb, a, b)) return false;
  a.n = a.n > 0 ? bytes_of_chars(m, pa, INT64_MAX, a.n) : 0;
  b.n = b.n > 0 ? bytes_of_chars(m, pb, INT64_MAX, b.n) : 0;
  return true;
}

// UTF-8 and UTF-EBCDIC: characters whose bytes agree are equal; others are
// decoded and compared through the host's case folding. Only option bit 1
// (blank padding) is read. A malformed sequence equals only the same bytes.
template <class Codec>
int64_t equals_utf(const NLSSMHandle *h, Span a, Span b, int32_t options) {
  int64_t i = 0, j = 0, floorA = 0, floorB = 0;
  CaseCache folded(h, CaseCache::Map::kFold);
  const bool ended = scan(a.p, a.n, b.p, b.n, i, j, [&](int64_t &x, int64_t &y) {
    const int64_t back = back_to_start<Codec>(a.p, x, floorA, b.p, y, floorB);
    const Decoded da = Codec::decode(a.p + x - back, a.n - (x - back));
    const Decoded db = Codec::decode(b.p + y - back, b.n - (y - back));
    if (!da.ok || !db.ok || folded.map(da.cp) != folded.map(db.cp)) return false;
    floorA = x = x - back + da.size;
    floorB = y = y - back + db.size;
    return true;
  });
  if (!ended) return 0;
  if (a.n - i == b.n - j) return 1;
  if ((options & 1) == 0) return 0;
  const Span &rest = a.n - i > b.n - j ? Span{a.p + i, a.n - i} : Span{b.p + j, b.n - j};
  return kernel::hot().mem_nscan(rest.p, rest.n, h->blankChar[0]) < 0 ? 1 : 0;
}

template <class Codec>
int64_t equals_utf_counted(const NLSSMHandle *h, Span a, Span b, int64_t count, int32_t options) {
  if (count > 0) {
    const UtfModel<Codec> m;
    a.n = bytes_of_chars(m, a.p, a.n, count);
    b.n = bytes_of_chars(m, b.p, b.n, count);
  }
  return equals_utf<Codec>(h, a, b, options);
}

template <class Codec>
int64_t equals_utf_c(const NLSSMHandle *h, const uint8_t *pa, int64_t ca, const uint8_t *pb,
                     int64_t cb, int32_t options) {
  Span a, b;
  if (!char_spans(UtfModel<Codec>(), pa, ca, pb, cb, a, b)) return 0;
  return equals_utf<Codec>(h, a, b, options);
}

// WCS2 and WCS4: both operands are copied into work buffers (1024 bytes on
// the stack each, else the handle's pool) and lower-cased there through the
// owner's character query wherever they differ; the copies must then agree
// byte for byte. Surrogates have no case and stay as they are. Two empty
// operands are not equal here.
int64_t equals_wide(const NLSSMHandle *h, Span a, Span b, int64_t count, int32_t options) {
  const EqualsMode mode = equals_mode(h, options);
  if (!mode.valid) return 0;
  limit_bytes(a.n, b.n, count);
  const int64_t common = std::min(a.n, b.n);
  if (common == 0) return 0;
  if (!mode.pad && a.n != b.n) return 0;
  module::WorkBuffer<1024> copyA, copyB;
  if (!copyA.reserve(h, static_cast<uint64_t>(a.n)) ||
      !copyB.reserve(h, static_cast<uint64_t>(b.n)))
    return 0;
  std::memcpy(copyA.data(), a.p, static_cast<size_t>(a.n));
  std::memcpy(copyB.data(), b.p, static_cast<size_t>(b.n));
  uint8_t *ca = copyA.data(), *cb = copyB.data();
  const int width = h->encodingClass == NLSSM_CLASS_WCS4 ? 4 : 2;
  const bool big = h->encodingNumber == (width == 4 ? NLSSM_ENC_WCS4_BE : NLSSM_ENC_WCS2_BE);
  CaseCache lower(h, CaseCache::Map::kLower);
  int64_t i = 0, j = 0;
  const bool equal = scan(ca, common, cb, common, i, j, [&](int64_t &x, int64_t &y) {
    const int64_t u = x - x % width;
    if (u + width > common) return false;
    for (uint8_t *copy : {ca, cb}) {
      const uint32_t unit = load_unit(copy + u, width, big);
      if (width == 4 || (unit & 0xF800) != 0xD800)
        store_unit(copy + u, lower.map(unit), width, big);
    }
    x = y = u + width;
    return std::memcmp(ca + u, cb + u, static_cast<size_t>(width)) == 0;
  });
  if (!equal) return 0;
  if (!mode.pad) return 1;
  const Span longer = a.n >= b.n ? Span{ca, a.n} : Span{cb, b.n};
  if ((longer.n - common) % width != 0) return 0;
  const Tail tail = unit_tail(h, width, big);
  uint32_t other = 0;
  return tail.first_other(longer.p, common, longer.n, other) < 0 ? 1 : 0;
}

int64_t wide_chars_to_bytes(const NLSSMHandle *h, const uint8_t *p, int64_t chars) {
  if (chars <= 0) return 0;
  if (h->encodingClass == NLSSM_CLASS_WCS4)
    return bytes_of_chars(FixedModel(h), p, INT64_MAX, chars);
  if (h->encodingNumber == NLSSM_ENC_WCS2_BE)
    return bytes_of_chars(Wcs2Model<true>(h), p, INT64_MAX, chars);
  return bytes_of_chars(Wcs2Model<false>(h), p, INT64_MAX, chars);
}

}  // namespace
}  // namespace nlssm::casecmp

namespace cc = nlssm::casecmp;
using cc::Span;

int64_t NLSStringEquals_SBCS(const NLSSMHandle *h, const NLSString *sa, const NLSString *sb,
                             int64_t count, int32_t options) {
  Span a, b;
  if (!cc::descriptor_spans(sa, sb, a, b)) return 0;
  return cc::equals_bytes(h, cc::SbcsModel(h), a, b, count, options);
}
int64_t NLSStringEqualsS_SBCS(const NLSSMHandle *h, const uint8_t *pa, int64_t la,
                              const uint8_t *pb, int64_t lb, int32_t options) {
  Span a, b;
  if (!cc::raw_spans(pa, la, pb, lb, a, b)) return 0;
  return cc::equals_bytes(h, cc::SbcsModel(h), a, b, 0, options);
}
int64_t NLSStringEqualsC_SBCS(const NLSSMHandle *h, const uint8_t *pa, int64_t la,
                              const uint8_t *pb, int64_t lb, int32_t options) {
  return NLSStringEqualsS_SBCS(h, pa, la, pb, lb, options);
}

int64_t NLSStringEquals_MBCS_nonmodal(const NLSSMHandle *h, const NLSString *sa,
                                      const NLSString *sb, int64_t count, int32_t options) {
  Span a, b;
  if (!cc::descriptor_spans(sa, sb, a, b)) return 0;
  return cc::with_nonmodal_model(
      h, [&](const auto &m) { return cc::equals_bytes(h, m, a, b, count, options); });
}
int64_t NLSStringEqualsS_MBCS_nonmodal(const NLSSMHandle *h, const uint8_t *pa, int64_t la,
                                       const uint8_t *pb, int64_t lb, int32_t options) {
  Span a, b;
  if (!cc::raw_spans(pa, la, pb, lb, a, b)) return 0;
  return cc::with_nonmodal_model(
      h, [&](const auto &m) { return cc::equals_bytes(h, m, a, b, 0, options); });
}
int64_t NLSStringEqualsC_MBCS_nonmodal(const NLSSMHandle *h, const uint8_t *pa, int64_t ca,
                                       const uint8_t *pb, int64_t cb, int32_t options) {
  return cc::with_nonmodal_model(h, [&](const auto &m) -> int64_t {
    Span a, b;
    if (!cc::char_spans(m, pa, ca, pb, cb, a, b)) return 0;
    return cc::equals_bytes(h, m, a, b, 0, options);
  });
}

// Modal text: both operands must start in the same shift state.
int64_t NLSStringEquals_MBCS_modal(const NLSSMHandle *h, const NLSString *sa, const NLSString *sb,
                                   int64_t count, int32_t options) {
  Span a, b;
  if (!cc::descriptor_spans(sa, sb, a, b)) return 0;
  const uint32_t state = cc::modal_start(sa);
  if (state != cc::modal_start(sb) && std::min(a.n, b.n) > 0) return 0;
  return cc::equals_bytes(h, cc::ModalModel(h), a, b, count, options, state);
}
int64_t NLSStringEqualsS_MBCS_modal(const NLSSMHandle *h, const uint8_t *pa, int64_t la,
                                    const uint8_t *pb, int64_t lb, int32_t options) {
  Span a, b;
  if (!cc::raw_spans(pa, la, pb, lb, a, b)) return 0;
  return cc::equals_bytes(h, cc::ModalModel(h), a, b, 0, options);
}
int64_t NLSStringEqualsC_MBCS_modal(const NLSSMHandle *h, const uint8_t *pa, int64_t ca,
                                    const uint8_t *pb, int64_t cb, int32_t options) {
  const cc::ModalModel m(h);
  Span a, b;
  if (!cc::char_spans(m, pa, ca, pb, cb, a, b)) return 0;
  return cc::equals_bytes(h, m, a, b, 0, options);
}

int64_t NLSStringEqualsS_UTF8(const NLSSMHandle *h, const uint8_t *pa, int64_t la,
                              const uint8_t *pb, int64_t lb, int32_t options) {
  Span a, b;
  if (!cc::raw_spans(pa, la, pb, lb, a, b)) return 0;
  return cc::equals_utf<cc::Utf8Codec>(h, a, b, options);
}
int64_t NLSStringEquals_UTF8(const NLSSMHandle *h, const NLSString *sa, const NLSString *sb,
                             int64_t count, int32_t options) {
  Span a, b;
  if (!cc::descriptor_spans(sa, sb, a, b)) return 0;
  if (count <= 0) return NLSStringEqualsS_UTF8(h, a.p, a.n, b.p, b.n, options);
  return cc::equals_utf_counted<cc::Utf8Codec>(h, a, b, count, options);
}
// Class 1 has one C member: it reads UTF-EBCDIC text on UTF-EBCDIC handles.
int64_t NLSStringEqualsC_UTF8(const NLSSMHandle *h, const uint8_t *pa, int64_t ca,
                              const uint8_t *pb, int64_t cb, int32_t options) {
  if (h->encodingNumber == NLSSM_ENC_UTF8)
    return cc::equals_utf_c<cc::Utf8Codec>(h, pa, ca, pb, cb, options);
  return cc::equals_utf_c<cc::UtfeCodec>(h, pa, ca, pb, cb, options);
}

int64_t NLSStringEquals(const NLSSMHandle *h, const NLSString *sa, const NLSString *sb,
                        int64_t count, int32_t options) {
  Span a, b;
  if (!cc::descriptor_spans(sa, sb, a, b)) return 0;
  return cc::equals_wide(h, a, b, count, options);
}
int64_t NLSStringEqualsS(const NLSSMHandle *h, const uint8_t *pa, int64_t la, const uint8_t *pb,
                         int64_t lb, int32_t options) {
  Span a, b;
  if (!cc::raw_spans(pa, la, pb, lb, a, b)) return 0;
  return cc::equals_wide(h, a, b, 0, options);
}
int64_t NLSStringEqualsC(const NLSSMHandle *h, const uint8_t *pa, int64_t ca, const uint8_t *pb,
                         int64_t cb, int32_t options) {
  Span a, b;
  if (!cc::raw_spans(pa, ca, pb, cb, a, b)) return 0;
  a.n = cc::wide_chars_to_bytes(h, pa, ca);
  b.n = cc::wide_chars_to_bytes(h, pb, cb);
  return cc::equals_wide(h, a, b, 0, options);
}
