// Character classification: whether the current character of a string is
// in a class (upper, lower, digit, space, punctuation, blank, control,
// hexadecimal digit; the bits of the catalogue's class tables). Single
// bytes answer from the encoding's class table, double-byte characters
// from the double-byte tables, Unicode characters from the host's
// character-information query.
#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <cstring>

#include "catalogue/dbcs_records.hpp"
#include "module/host_access.hpp"

namespace nlssm::casecmp {
namespace {

constexpr int32_t kPunct = 0x10;
constexpr int32_t kLowerBit = 0x02;

bool has_current(const NLSString *s) {
  return s != nullptr && s->buffer != nullptr && s->curOffset >= 0 &&
         static_cast<uint64_t>(s->curOffset) < s->length;
}

int64_t table_says(const NLSSMHandle *h, uint8_t b, int32_t mask) {
  return h->classTable != nullptr && (h->classTable[b] & mask) != 0 ? 1 : 0;
}

int64_t sbcs_is(const NLSSMHandle *h, const NLSString *s, int32_t mask) {
  return has_current(s) ? table_says(h, s->buffer[s->curOffset], mask) : 0;
}

// ---- Multi-byte classes --------------------------------------------------------------

// The current character of multi-byte text as its kind describes it.
struct MbcsChar {
  bool present = false;
  bool single = false;
  uint8_t byte = 0;   // single-byte character
  uint16_t code = 0;  // double-byte character: lead byte high
  bool pair = false;  // exactly two bytes (a code the double-byte tables know)
};

MbcsChar mbcs_current(const NLSString *s) {
  MbcsChar c;
  if (!has_current(s) || s->charKind == 0) return c;
  c.present = true;
  c.byte = s->buffer[s->curOffset];
  // Modal text keeps the shift state there: single-byte after shift-in.
  c.single = s->charKind == NLSSM_KIND_SINGLE || s->charKind == 6;
  c.pair = s->charKind == NLSSM_KIND_DOUBLE && s->length - s->curOffset >= 2;
  if (c.pair) c.code = static_cast<uint16_t>(c.byte << 8 | s->buffer[s->curOffset + 1]);
  return c;
}

// The encoding's double-byte space, kept in the host's range record.
bool double_byte_space(const NLSSMHandle *h, const MbcsChar &c) {
  if (!c.pair || h->charRanges == nullptr) return false;
  const uint16_t space = static_cast<uint16_t>(h->charRanges[0] << 8 | h->charRanges[1]);
  return space != 0 && space == c.code;
}

template <bool kEbcdic>
int64_t mbcs_is_space(const NLSSMHandle *h, const NLSString *s, int32_t mask) {
  const MbcsChar c = mbcs_current(s);
  if (!c.present) return 0;
  if (!c.single) return double_byte_space(h, c) ? 1 : 0;
  const bool space = kEbcdic
                         ? (c.byte >= 0x0B && c.byte <= 0x0D) || c.byte == 0x05 || c.byte == 0x25
                         : c.byte >= 0x09 && c.byte <= 0x0D;
  return space ? 1 : table_says(h, c.byte, mask);
}

// ---- Unicode classes -----------------------------------------------------------------

enum class Form { kUtf, kWcs2, kWcs4 };

// The current character as a code point; false when there is none or it
// cannot be decoded (a high surrogate without its low one, a malformed
// UTF sequence).
template <Form kForm>
bool current_code_point(const NLSSMHandle *h, const NLSString *s, uint32_t &cp) {
  if (!has_current(s)) return false;
  const uint8_t *p = s->buffer + s->curOffset;
  const int64_t remaining = static_cast<int64_t>(s->length) - s->curOffset;
  if constexpr (kForm == Form::kWcs2) {
    const bool big = h->encodingNumber != NLSSM_ENC_WCS2_LE;
    auto unit = [big](const uint8_t *q) -> uint32_t {
      return big ? (q[0] << 8 | q[1]) : (q[1] << 8 | q[0]);
    };
    if (remaining < 2) return false;
    cp = unit(p);
    if ((cp & 0xFC00) != 0xD800) return true;
    if (remaining < 4 || (unit(p + 2) & 0xFC00) != 0xDC00) return false;
    cp = 0x10000 + ((cp - 0xD800) << 10) + (unit(p + 2) - 0xDC00);
    return true;
  } else if constexpr (kForm == Form::kWcs4) {
    if (remaining < 4) return false;
    cp = h->encodingNumber == NLSSM_ENC_WCS4_BE
             ? static_cast<uint32_t>(p[0] << 24 | p[1] << 16 | p[2] << 8 | p[3])
             : static_cast<uint32_t>(p[3] << 24 | p[2] << 16 | p[1] << 8 | p[0]);
    return true;
  } else {
    // The decoders read as far as the lead byte announces: decode a copy
    // that ends with the text.
    uint8_t bytes[8] = {};
    std::memcpy(bytes, p, static_cast<size_t>(remaining < 8 ? remaining : 8));
    const int64_t n =
        h->encodingNumber == NLSSM_ENC_UTF8 ? FromUTF8(h, bytes, &cp) : FromUTFE(h, bytes, &cp);
    return n > 0 && n <= remaining;
  }
}

bool char_info(const NLSSMHandle *h, uint32_t cp, NLSHostCharInfo &info) {
  if (h->owner == nullptr) return false;
  info = {};
  return host::slot<NLSHostCharInfoFn>(h->owner, NLSHOST_SLOT_NLS_CHAR_INFO)(h->owner, cp, &info) ==
         0;
}

// The class mask in the host's general-category bits: upper Lu, lower Ll,
// digit Nd, space Zl Zp, punctuation the seven P* categories, blank Zs,
// control Zl Zp Cc Cf. Both cases together take every
// letter category (Lt Lm Lo); with punctuation too, the wider alphanumeric
// and symbol set.
uint32_t category_mask(int32_t mask) {
  uint32_t t = 0;
  if (mask & 0x01) t |= 0x1;
  if (mask & 0x02) t |= 0x2;
  if (mask & 0x04) t |= 0x40;
  if (mask & 0x08) t |= 0xC00;
  if (mask & 0x10) t |= 0x3F80000;
  if (mask & 0x20) t |= 0x200;
  if (mask & 0x40) t |= 0x3C00;
  if ((mask & 0x03) == 0x03) t |= (mask & 0x10) ? 0x60004u | 0x3C460DBCu : 0x60004u;
  return t;
}

template <Form kForm>
int64_t unicode_is(const NLSSMHandle *h, const NLSString *s, int32_t mask) {
  uint32_t cp = 0;
  NLSHostCharInfo info;
  if (!current_code_point<kForm>(h, s, cp) || !char_info(h, cp, info)) return 0;
  return (info.properties & category_mask(mask)) != 0 ? 1 : 0;
}

template <Form kForm>
int64_t unicode_is_space(const NLSSMHandle *h, const NLSString *s, int64_t strict) {
  uint32_t c = 0;
  if (!current_code_point<kForm>(h, s, c) || c > 0x3000) return 0;
  const bool space = c == 0x20 || c == 0xA0 || c == 0x1680 || (c >= 0x2000 && c <= 0x200A) ||
                     c == 0x2028 || c == 0x2029 || c == 0x202F || c == 0x205F || c == 0x3000;
  const bool loose = strict == 0 && ((c >= 0x09 && c <= 0x0D) || c == 0x85);
  return space || loose ? 1 : 0;
}

template <Form kForm>
int64_t unicode_is_xdigit(const NLSSMHandle *h, const NLSString *s) {
  uint32_t c = 0;
  if (!current_code_point<kForm>(h, s, c)) return 0;
  if ((c >= 'A' && c <= 'F') || (c >= 'a' && c <= 'f') || (c >= 0xFF21 && c <= 0xFF26) ||
      (c >= 0xFF41 && c <= 0xFF46))
    return 1;
  NLSHostCharInfo info;
  return char_info(h, c, info) && (info.properties & NLSHOST_GC_ND) != 0 ? 1 : 0;
}

// Graphic: not a separator, control, format, surrogate or unassigned.
template <Form kForm>
int64_t unicode_is_graph(const NLSSMHandle *h, const NLSString *s) {
  uint32_t c = 0;
  NLSHostCharInfo info;
  if (!current_code_point<kForm>(h, s, c) || !char_info(h, c, info)) return 0;
  return (info.properties & 0x17E00u) == 0 ? 1 : 0;
}

}  // namespace
}  // namespace nlssm::casecmp

using namespace nlssm::casecmp;

// ---- Single-byte sets ------------------------------------------------------------------

extern "C" int64_t NLSStringIs_SBCS(const NLSSMHandle *h, const NLSString *s, int64_t,
                                    int32_t mask) {
  return sbcs_is(h, s, mask);
}

extern "C" int64_t NLSStringIsSpace_ASCII(const NLSSMHandle *h, const NLSString *s, int64_t,
                                          int32_t mask) {
  if (!has_current(s)) return 0;
  const uint8_t b = s->buffer[s->curOffset];
  return b >= 0x09 && b <= 0x0D ? 1 : table_says(h, b, mask);
}

extern "C" int64_t NLSStringIsSpace_EBCDIC(const NLSSMHandle *h, const NLSString *s, int64_t,
                                           int32_t mask) {
  if (!has_current(s)) return 0;
  const uint8_t b = s->buffer[s->curOffset];
  return b >= 0x0B && b <= 0x0D ? 1 : table_says(h, b, mask);
}

// ---- Multi-byte classes (modal and non-modal) ----------------------------------------

// Every double-byte character counts as a member of every class but
// punctuation; the byte 0x80 alone is in none.
extern "C" int64_t NLSStringIs_MBCS(const NLSSMHandle *h, const NLSString *s, int64_t,
                                    int32_t mask) {
  const MbcsChar c = mbcs_current(s);
  if (!c.present) return 0;
  if (!c.single) return mask != kPunct ? 1 : 0;
  return c.byte == 0x80 ? 0 : table_says(h, c.byte, mask);
}

extern "C" int64_t NLSStringIsDigit_MBCS(const NLSSMHandle *h, const NLSString *s, int64_t,
                                         int32_t mask) {
  const MbcsChar c = mbcs_current(s);
  return c.present && c.single ? table_says(h, c.byte, mask) : 0;
}

// A double-byte character is lower (upper) case when the double-byte case
// table has it as its own lower (upper) form.
extern "C" int64_t NLSStringIsLower_MBCS(const NLSSMHandle *h, const NLSString *s, int64_t,
                                         int32_t mask) {
  const MbcsChar c = mbcs_current(s);
  if (!c.present) return 0;
  if (c.single) return table_says(h, c.byte, mask);
  if (!c.pair) return 0;
  const auto *record = nlssm::catalogue::dbcs_find(
      static_cast<const nlssm::catalogue::DbcsRecord *>(h->dbcsTable), h->dbcsTableCount, c.code);
  if (record == nullptr) return 0;
  return ((mask & kLowerBit) ? record->lower : record->upper) == c.code ? 1 : 0;
}

extern "C" int64_t NLSStringIsXDigit_MBCS(const NLSSMHandle *h, const NLSString *s, int64_t,
                                          int32_t mask) {
  const MbcsChar c = mbcs_current(s);
  if (!c.present) return 0;
  if (c.single) return table_says(h, c.byte, mask);
  return c.pair && nlssm::catalogue::dbcs_in_ranges(
                       static_cast<const nlssm::catalogue::DbcsRange *>(h->dbcsExtTable),
                       h->dbcsExtCount, c.code)
             ? 1
             : 0;
}

// Double-byte characters are graphic, except the double-byte space.
extern "C" int64_t NLSStringIsGraph_MBCS(const NLSSMHandle *h, const NLSString *s, int64_t,
                                         int32_t mask) {
  const MbcsChar c = mbcs_current(s);
  if (!c.present) return 0;
  if (c.single) return table_says(h, c.byte, mask);
  return double_byte_space(h, c) ? 0 : 1;
}

extern "C" int64_t NLSStringIsSpace_MBCS_ASCII(const NLSSMHandle *h, const NLSString *s, int64_t,
                                               int32_t mask) {
  return mbcs_is_space<false>(h, s, mask);
}

extern "C" int64_t NLSStringIsSpace_MBCS_EBCDIC(const NLSSMHandle *h, const NLSString *s, int64_t,
                                                int32_t mask) {
  return mbcs_is_space<true>(h, s, mask);
}

// ---- Unicode ---------------------------------------------------------------------------
// The UTF-8 members also serve UTF-EBCDIC handles (decoding by the
// handle's encoding).

#define NLSSM_UNICODE_CLASSES(suffix, form)                                                        \
  extern "C" int64_t NLSStringIs_##suffix(const NLSSMHandle *h, const NLSString *s, int64_t,       \
                                          int32_t mask) {                                          \
    return unicode_is<form>(h, s, mask);                                                           \
  }                                                                                                \
  extern "C" int64_t NLSStringIsSpace_##suffix(const NLSSMHandle *h, const NLSString *s,           \
                                               int64_t strict) {                                   \
    return unicode_is_space<form>(h, s, strict);                                                   \
  }                                                                                                \
  extern "C" int64_t NLSStringIsXDigit_##suffix(const NLSSMHandle *h, const NLSString *s, int64_t, \
                                                int32_t) {                                         \
    return unicode_is_xdigit<form>(h, s);                                                          \
  }                                                                                                \
  extern "C" int64_t NLSStringIsGraph_##suffix(const NLSSMHandle *h, const NLSString *s, int64_t,  \
                                               int32_t) {                                          \
    return unicode_is_graph<form>(h, s);                                                           \
  }

NLSSM_UNICODE_CLASSES(UTF8, Form::kUtf)
NLSSM_UNICODE_CLASSES(WCS2, Form::kWcs2)
NLSSM_UNICODE_CLASSES(WCS4, Form::kWcs4)
#undef NLSSM_UNICODE_CLASSES

// ---- stringAnyNot ----------------------------------------------------------------------

// Whether any of `count` characters (0: all) from the current one is
// outside the class, asked of the handle's NLSStringIs slot character by
// character; the descriptor itself does not move.
extern "C" int64_t stringAnyNot(const NLSSMHandle *h, const NLSString *s, int64_t count,
                                int32_t mask) {
  if (h == nullptr || s == nullptr || h->NLSStringIs == nullptr || h->stringNextChar == nullptr)
    return 0;
  using Is = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int32_t);
  using Next = int64_t (*)(const NLSSMHandle *, NLSString *);
  NLSString c = *s;
  for (int64_t n = 0; has_current(&c) && (count <= 0 || n < count); ++n) {
    if (reinterpret_cast<Is>(h->NLSStringIs)(h, &c, 0, mask) == 0) return 1;
    const int64_t before = c.curOffset;
    reinterpret_cast<Next>(h->stringNextChar)(h, &c);
    if (c.curOffset >= 0 && c.curOffset <= before) break;
  }
  return 0;
}
