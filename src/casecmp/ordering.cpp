// Ordering comparison: NLSStringCompStr, NLSStringCompare and NLSStringCompLit
// with their S and C forms, for every encoding class.
//
// Result: 0 when equal, else k + 1 when the first operand is greater and
// -(k + 1) when it is smaller, k being the byte offset of the decision. The
// equal prefix is found by the kernel's vector compare; a member only looks
// at characters where the bytes differ.
#include <nlssm/nlssm.h>

#include <climits>

#include "casecmp/compare.hpp"
#include "module/literal.hpp"

namespace nlssm::casecmp {
namespace {

using cursor::DbcsModel;
using cursor::EucJpModel;
using cursor::EucTwModel;
using cursor::FixedModel;
using cursor::Gb18030Model;
using cursor::SbcsModel;
using cursor::Wcs2Model;

constexpr uint32_t kPad = NLSSM_OPT_PAD;
constexpr uint32_t kFoldLower = NLSSM_OPT_FOLD_LOWER;
constexpr uint32_t kFoldUpper = NLSSM_OPT_FOLD_UPPER;

// An operand: its bytes and, for modal text, the shift state it starts in.
struct Operand {
  const uint8_t *p = nullptr;
  int64_t n = 0;
  uint32_t state = cursor::kModalSingle;
};

// What a unit handler says about the first differing bytes: the order, or
// where both operands go on when their characters fold to the same one.
struct Step {
  bool decided;
  int64_t result;
  int64_t i, j;
};

Step decided(int64_t result) {
  return {true, result, 0, 0};
}
Step go_on(int64_t i, int64_t j) {
  return {false, 0, i, j};
}

const uint8_t *fold_table(const NLSSMHandle *h, uint32_t options) {
  if (options & kFoldLower) return h->lowerTable;
  if (options & kFoldUpper) return h->upperTable;
  return nullptr;
}

CaseCache::Map case_map(uint32_t options) {
  return options & kFoldLower ? CaseCache::Map::kLower : CaseCache::Map::kUpper;
}

// The comparison walk: equal prefixes by the vector compare, differences by
// the handler, then the tail of the longer operand (against the blank when
// padding, else the shorter one's end decides).
template <class H>
int64_t run_order(const Operand &a, const Operand &b, H &handler, bool pad, const Tail &tail) {
  int64_t i = 0, j = 0, result = 0;
  const bool ended = scan(a.p, a.n, b.p, b.n, i, j, [&](int64_t &x, int64_t &y) {
    const Step s = handler.at(x, y);
    result = s.result;
    x = s.i;
    y = s.j;
    return !s.decided;
  });
  if (!ended) return result;
  const int64_t restA = a.n - i, restB = b.n - j;
  if (restA == restB) return 0;
  uint32_t c = 0;
  if (restA > restB) {
    if (!pad) return j + 1;
    const int64_t k = tail.first_other(a.p, i, a.n, c);
    return k < 0 ? 0 : signed_at(c >= tail.blank, k);
  }
  if (!pad) return -(i + 1);
  const int64_t k = tail.first_other(b.p, j, b.n, c);
  return k < 0 ? 0 : signed_at(c < tail.blank, k);
}

// Raw bytes decide (the order of the byte values); `positionless` answers
// just 1 or -1.
struct RawBytes {
  const uint8_t *a, *b;
  bool positionless = false;
  Step at(int64_t i, int64_t j) const {
    const bool greater = a[i] >= b[j];
    return decided(positionless ? (greater ? 1 : -1) : signed_at(greater, i));
  }
};

// Single-byte sets: bytes whose table entries agree are equal; otherwise
// the raw bytes decide, not the folded ones.
struct TableFold {
  const uint8_t *a, *b, *table;
  Step at(int64_t i, int64_t j) const {
    if (table[a[i]] == table[b[j]]) return go_on(i + 1, j + 1);
    return RawBytes{a, b}.at(i, j);
  }
};

// Multi-byte sets: the tables fold single-byte characters only; a
// difference inside or at a double-byte character is decided by the bytes.
template <class M>
struct CharTableFold {
  const uint8_t *a, *b, *table;
  Walker<M> wa, wb;
  Step at(int64_t i, int64_t j) {
    const bool starts = wa.reach(i) && wb.reach(j);
    if (starts && wa.single_byte_here() && wb.single_byte_here() && table[a[i]] == table[b[j]]) {
      wa.step_one();
      wb.step_one();
      return go_on(i + 1, j + 1);
    }
    return RawBytes{a, b}.at(i, j);
  }
};

template <class M>
int64_t order_bytes(const NLSSMHandle *h, const M &m, const Operand &a, const Operand &b,
                    uint32_t options) {
  const bool pad = (options & kPad) != 0;
  const ModalModel *modal = nullptr;
  if constexpr (M::kModal) modal = &m;
  const Tail tail = byte_tail(h->blankChar[0], modal);
  const uint8_t *table = fold_table(h, options);
  if (table == nullptr) {
    RawBytes raw{a.p, b.p};
    return run_order(a, b, raw, pad, tail);
  }
  if constexpr (std::is_same_v<M, SbcsModel>) {
    TableFold fold{a.p, b.p, table};
    return run_order(a, b, fold, pad, tail);
  } else {
    CharTableFold<M> fold{a.p, b.p, table, Walker<M>(m, a.p, a.n, a.state),
                          Walker<M>(m, b.p, b.n, b.state)};
    return run_order(a, b, fold, pad, tail);
  }
}

// UTF-8 and UTF-EBCDIC: with folding, the characters around a difference
// are decoded and mapped (ASCII by its own letters, the rest through the
// owner's character-information query); the mapped values decide. A
// malformed sequence is compared by its bytes.
template <class Codec>
struct UtfFold {
  Operand a, b;
  bool upper;
  CaseCache cases;
  int64_t resumeA = 0, resumeB = 0;

  uint32_t fold(uint32_t c) {
    if (c < 0x80) {
      if (upper && c >= 'a' && c <= 'z') return c - 0x20;
      if (!upper && c >= 'A' && c <= 'Z') return c + 0x20;
      return c;
    }
    return cases.map(c);
  }
  Step at(int64_t i, int64_t j) {
    const int64_t back = back_to_start<Codec>(a.p, i, resumeA, b.p, j, resumeB);
    const int64_t sa = i - back, sb = j - back;
    const Decoded da = Codec::decode(a.p + sa, a.n - sa);
    const Decoded db = Codec::decode(b.p + sb, b.n - sb);
    if (!da.ok || !db.ok) return RawBytes{a.p, b.p}.at(i, j);
    const uint32_t fa = fold(da.cp), fb = fold(db.cp);
    if (fa != fb) return decided(signed_at(fa > fb, sa));
    resumeA = sa + da.size;
    resumeB = sb + db.size;
    return go_on(resumeA, resumeB);
  }
};

template <class Codec>
int64_t order_utf(const NLSSMHandle *h, const Operand &a, const Operand &b, uint32_t options) {
  const bool pad = (options & kPad) != 0;
  const Tail tail = byte_tail(h->blankChar[0]);
  if ((options & (kFoldLower | kFoldUpper)) == 0) {
    RawBytes raw{a.p, b.p};
    return run_order(a, b, raw, pad, tail);
  }
  const bool upper = (options & kFoldLower) == 0;
  UtfFold<Codec> fold{a, b, upper, CaseCache(h, case_map(options))};
  return run_order(a, b, fold, pad, tail);
}

// WCS2 and WCS4: units in the member's byte order, compared as unsigned
// values; in WCS2 a high surrogate equal in both is taken with the unit after
// it (the pair joined, high unit above). Folding maps differing units through
// the owner's query (a joined pair is passed as it is), and the mapped values
// decide.
template <int kWidth, bool kBig>
struct WcsUnits {
  Operand a, b;
  bool fold;
  CaseCache cases;
  int64_t resume = 0;  // a character boundary in both operands

  uint32_t unit(const uint8_t *p, int64_t off) const { return load_unit(p + off, kWidth, kBig); }
  Step at(int64_t i, int64_t j) {
    const int64_t u = i - i % kWidth;
    if (u + kWidth > a.n || u + kWidth > b.n) return RawBytes{a.p, b.p}.at(i, j);
    int64_t start = u;
    uint32_t va = unit(a.p, u), vb = unit(b.p, u);
    if constexpr (kWidth == 2) {
      int64_t highs = 0;
      for (int64_t q = u - 2; q >= resume && high_surrogate(unit(a.p, q)); q -= 2) ++highs;
      if (highs & 1) {
        start = u - 2;
        const uint32_t high = unit(a.p, start) << 16;
        va |= high;
        vb |= high;
      }
    }
    if (fold) {
      const uint32_t fa = cases.map(va), fb = cases.map(vb);
      if (fa == fb) {
        resume = u + kWidth;
        return go_on(resume, resume);
      }
      return decided(signed_at(fa > fb, start));
    }
    return decided(signed_at(va > vb, start));
  }
};

template <int kWidth, bool kBig>
int64_t order_units(const NLSSMHandle *h, const Operand &a, const Operand &b, uint32_t options) {
  const bool fold = (options & (kFoldLower | kFoldUpper)) != 0;
  WcsUnits<kWidth, kBig> units{a, b, fold, CaseCache(h, case_map(options))};
  return run_order(a, b, units, (options & kPad) != 0, unit_tail(h, kWidth, kBig));
}

// ---- Members by character model ----------------------------------------------------

// How each class measures and compares its text.
template <class M>
struct ByteClass {
  static int64_t order(const NLSSMHandle *h, const Operand &a, const Operand &b, uint32_t o) {
    return order_bytes(h, M(h), a, b, o);
  }
  static M model(const NLSSMHandle *h) { return M(h); }
};
template <class Codec>
struct UtfClass {
  static int64_t order(const NLSSMHandle *h, const Operand &a, const Operand &b, uint32_t o) {
    return order_utf<Codec>(h, a, b, o);
  }
  static UtfModel<Codec> model(const NLSSMHandle *) { return {}; }
};
template <int kWidth, bool kBig>
struct WcsClass {
  static int64_t order(const NLSSMHandle *h, const Operand &a, const Operand &b, uint32_t o) {
    return order_units<kWidth, kBig>(h, a, b, o);
  }
  static auto model(const NLSSMHandle *h) {
    if constexpr (kWidth == 2)
      return Wcs2Model<kBig>(h);
    else
      return FixedModel(h);
  }
};

using Sbcs = ByteClass<SbcsModel>;
using Modal = ByteClass<ModalModel>;
using Dbcs = ByteClass<DbcsModel>;
using EucJp = ByteClass<EucJpModel>;
using EucTw = ByteClass<EucTwModel>;
using Gb18030 = ByteClass<Gb18030Model>;
using Utf8 = UtfClass<Utf8Codec>;
using Utfe = UtfClass<UtfeCodec>;
using Wcs2L = WcsClass<2, false>;
using Wcs2B = WcsClass<2, true>;
using Wcs4L = WcsClass<4, false>;
using Wcs4B = WcsClass<4, true>;

// A descriptor operand from its current character (or, for the SBCS
// Compare member, from its character index). Without a current character it
// is empty when padding, and the comparison does not take place otherwise.
template <class C>
bool operand(const NLSString *s, bool pad, bool fromIndex, Operand &out) {
  if (s == nullptr || s->buffer == nullptr) return false;
  if (s->curOffset < 0 && !pad) return false;
  const int64_t start = s->curOffset < 0 ? static_cast<int64_t>(s->length)
                        : fromIndex      ? s->charIndex
                                         : s->curOffset;
  Span span;
  if (!span_from(s, start, span)) return false;
  out = {span.p, span.n, cursor::kModalSingle};
  if constexpr (std::is_same_v<C, Modal>) out.state = modal_start(s);
  return true;
}

// Descriptor forms. SBCS counts bytes; the other classes count characters
// of each operand.
template <class C>
int64_t comp_str(const NLSSMHandle *h, const NLSString *sa, const NLSString *sb, int64_t count,
                 uint32_t options, bool fromIndex = false) {
  const bool pad = (options & kPad) != 0;
  Operand a, b;
  if (!operand<C>(sa, pad, fromIndex, a) || !operand<C>(sb, pad, fromIndex, b)) return 0;
  if constexpr (std::is_same_v<C, Sbcs>) {
    limit_bytes(a.n, b.n, count);
  } else if (count > 0) {
    const auto m = C::model(h);
    a.n = bytes_of_chars(m, a.p, a.n, count, a.state);
    b.n = bytes_of_chars(m, b.p, b.n, count, b.state);
  }
  return C::order(h, a, b, options);
}

// Raw buffers with byte lengths.
template <class C>
int64_t compare_s(const NLSSMHandle *h, const uint8_t *a, int64_t la, const uint8_t *b, int64_t lb,
                  uint32_t options) {
  if ((a == nullptr && la > 0) || (b == nullptr && lb > 0)) return 0;
  return C::order(h, {a, std::max<int64_t>(la, 0)}, {b, std::max<int64_t>(lb, 0)}, options);
}

// Raw buffers with lengths in characters.
template <class C>
int64_t comp_str_c(const NLSSMHandle *h, const uint8_t *a, int64_t ca, const uint8_t *b, int64_t cb,
                   uint32_t options) {
  if (a == nullptr || b == nullptr) return 0;
  const auto m = C::model(h);
  const int64_t la = ca > 0 ? bytes_of_chars(m, a, INT64_MAX, ca) : 0;
  const int64_t lb = cb > 0 ? bytes_of_chars(m, b, INT64_MAX, cb) : 0;
  return C::order(h, {a, la}, {b, lb}, options);
}

// NLSStringCompare of single-byte sets: from the character index; without
// folding, padding uses the set's own blank (0x20 ASCII, 0x40 EBCDIC), and in
// EBCDIC a difference in the common part answers only its sign.
int64_t compare_sbcs(const NLSSMHandle *h, const NLSString *sa, const NLSString *sb, int64_t count,
                     uint32_t options) {
  const bool pad = (options & kPad) != 0;
  if (!pad || fold_table(h, options) != nullptr)
    return comp_str<Sbcs>(h, sa, sb, count, options, true);
  Operand a, b;
  if (!operand<Sbcs>(sa, pad, true, a) || !operand<Sbcs>(sb, pad, true, b)) return 0;
  limit_bytes(a.n, b.n, count);
  const bool ascii = (h->encodingFlags & 1u) != 0;
  RawBytes raw{a.p, b.p, !ascii};
  return run_order(a, b, raw, pad, byte_tail(ascii ? 0x20 : 0x40));
}

// ---- Literal forms -------------------------------------------------------------------

// Converts the literal into the handle's encoding and runs `compare` on
// it; the sign-bit value when no work buffer can be had or the conversion
// fails.
template <class Run>
int64_t with_literal(const NLSSMHandle *h, const uint8_t *literal, int64_t length, Run compare) {
  if (literal == nullptr || length <= 0) return 0;
  module::ConvertedLiteral<2048> text;
  const auto outcome = text.convert(h, literal, static_cast<uint64_t>(length));
  if (outcome == module::LiteralOutcome::kNoMemory || outcome == module::LiteralOutcome::kFailed)
    return NLSSM_COUNT_NO_MEMORY;
  return compare(text.text(), static_cast<int64_t>(text.length()));
}

using CompStrFn = int64_t (*)(const NLSSMHandle *, const NLSString *, const NLSString *, int64_t,
                              uint32_t);
using CompareSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                               int64_t, uint32_t);

// The literal as a descriptor on its first character, compared through
// `compStr` with the literal's length (its characters) as the count.
int64_t comp_lit(const NLSSMHandle *h, const NLSString *a, const uint8_t *literal, int64_t length,
                 uint32_t options, CompStrFn compStr) {
  if (a == nullptr || a->buffer == nullptr || compStr == nullptr) return 0;
  return with_literal(h, literal, length, [&](const uint8_t *text, int64_t bytes) {
    NLSString lit = text_descriptor(text, bytes);
    if (bytes > 0 && h->encodingClass != NLSSM_CLASS_SBCS && h->encodingClass != NLSSM_CLASS_WCS4 &&
        h->stringSetPos != nullptr)
      reinterpret_cast<int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t)>(
          h->stringSetPos)(h, &lit, 0, 0);
    return compStr(h, a, &lit, length, options);
  });
}

int64_t comp_lit_s(const NLSSMHandle *h, const uint8_t *a, int64_t la, const uint8_t *literal,
                   int64_t length, uint32_t options, CompareSFn compare, bool charLengths) {
  if (compare == nullptr) return 0;
  return with_literal(h, literal, length, [&](const uint8_t *text, int64_t bytes) {
    return compare(h, a, la, text, charLengths ? length : bytes, options);
  });
}

template <typename Fn>
Fn slot_as(NLSSlot s) {
  return reinterpret_cast<Fn>(s);
}

}  // namespace
}  // namespace nlssm::casecmp

namespace cc = nlssm::casecmp;

// ---- Exported members ----------------------------------------------------------------

#define NLSSM_ORDER_MEMBERS(SUFFIX, CLASS)                                                       \
  int64_t NLSStringCompStr##SUFFIX(const NLSSMHandle *h, const NLSString *a, const NLSString *b, \
                                   int64_t count, uint32_t options) {                            \
    return cc::comp_str<cc::CLASS>(h, a, b, count, options);                                     \
  }                                                                                              \
  int64_t NLSStringCompareS##SUFFIX(const NLSSMHandle *h, const uint8_t *a, int64_t la,          \
                                    const uint8_t *b, int64_t lb, uint32_t options) {            \
    return cc::compare_s<cc::CLASS>(h, a, la, b, lb, options);                                   \
  }

#define NLSSM_ORDER_COMPARE(SUFFIX, CLASS)                                                       \
  int64_t NLSStringCompare##SUFFIX(const NLSSMHandle *h, const NLSString *a, const NLSString *b, \
                                   int64_t count, uint32_t options) {                            \
    return cc::comp_str<cc::CLASS>(h, a, b, count, options);                                     \
  }

#define NLSSM_ORDER_C(SUFFIX, CLASS)                                                    \
  int64_t NLSStringCompStrC##SUFFIX(const NLSSMHandle *h, const uint8_t *a, int64_t la, \
                                    const uint8_t *b, int64_t lb, uint32_t options) {   \
    return cc::comp_str_c<cc::CLASS>(h, a, la, b, lb, options);                         \
  }

NLSSM_ORDER_MEMBERS(_SBCS, Sbcs)
NLSSM_ORDER_C(_SBCS, Sbcs)
int64_t NLSStringCompare_SBCS(const NLSSMHandle *h, const NLSString *a, const NLSString *b,
                              int64_t count, uint32_t options) {
  return cc::compare_sbcs(h, a, b, count, options);
}

NLSSM_ORDER_MEMBERS(_UTF8, Utf8)
NLSSM_ORDER_COMPARE(_UTF8, Utf8)
NLSSM_ORDER_MEMBERS(_UTFE, Utfe)
NLSSM_ORDER_COMPARE(_UTFE, Utfe)
// Class 1 has one C member: it reads UTF-EBCDIC text on UTF-EBCDIC handles.
int64_t NLSStringCompStrC_UTF8(const NLSSMHandle *h, const uint8_t *a, int64_t la, const uint8_t *b,
                               int64_t lb, uint32_t options) {
  return h->encodingNumber == NLSSM_ENC_UTF8 ? cc::comp_str_c<cc::Utf8>(h, a, la, b, lb, options)
                                             : cc::comp_str_c<cc::Utfe>(h, a, la, b, lb, options);
}

NLSSM_ORDER_MEMBERS(_WCS2L, Wcs2L)
NLSSM_ORDER_COMPARE(_WCS2L, Wcs2L)
NLSSM_ORDER_C(_WCS2L, Wcs2L)
NLSSM_ORDER_MEMBERS(_WCS2B, Wcs2B)
NLSSM_ORDER_COMPARE(_WCS2B, Wcs2B)
NLSSM_ORDER_C(_WCS2B, Wcs2B)
NLSSM_ORDER_MEMBERS(_WCS4L, Wcs4L)
NLSSM_ORDER_COMPARE(_WCS4L, Wcs4L)
NLSSM_ORDER_C(_WCS4L, Wcs4L)
NLSSM_ORDER_MEMBERS(_WCS4B, Wcs4B)
NLSSM_ORDER_COMPARE(_WCS4B, Wcs4B)
NLSSM_ORDER_C(_WCS4B, Wcs4B)
NLSSM_ORDER_MEMBERS(_MBCS_modal, Modal)
NLSSM_ORDER_COMPARE(_MBCS_modal, Modal)
NLSSM_ORDER_C(_MBCS_modal, Modal)
NLSSM_ORDER_MEMBERS(_MBCS_nonmodal, Dbcs)
NLSSM_ORDER_COMPARE(_MBCS_nonmodal, Dbcs)
NLSSM_ORDER_C(_MBCS_nonmodal, Dbcs)
NLSSM_ORDER_MEMBERS(_MBCS_nonmodal_EUC_JP, EucJp)
NLSSM_ORDER_COMPARE(_MBCS_nonmodal_EUC_JP, EucJp)
NLSSM_ORDER_C(_MBCS_nonmodal_EUC_JP, EucJp)
NLSSM_ORDER_MEMBERS(_MBCS_nonmodal_EUC_TW, EucTw)
NLSSM_ORDER_COMPARE(_MBCS_nonmodal_EUC_TW, EucTw)
NLSSM_ORDER_C(_MBCS_nonmodal_EUC_TW, EucTw)
NLSSM_ORDER_MEMBERS(_MBCS_nonmodal_GB18030, Gb18030)
NLSSM_ORDER_COMPARE(_MBCS_nonmodal_GB18030, Gb18030)
NLSSM_ORDER_C(_MBCS_nonmodal_GB18030, Gb18030)

#undef NLSSM_ORDER_MEMBERS
#undef NLSSM_ORDER_COMPARE
#undef NLSSM_ORDER_C

// Literal forms: the common members go through the handle's slots; the
// SBCS and modal members call their own class's comparison directly.
int64_t NLSStringCompLit(const NLSSMHandle *h, const NLSString *a, const uint8_t *literal,
                         int64_t length, uint32_t options) {
  return cc::comp_lit(h, a, literal, length, options,
                      cc::slot_as<cc::CompStrFn>(h->NLSStringCompStr));
}
int64_t NLSStringCompLitS(const NLSSMHandle *h, const uint8_t *a, int64_t la,
                          const uint8_t *literal, int64_t length, uint32_t options) {
  return cc::comp_lit_s(h, a, la, literal, length, options,
                        cc::slot_as<cc::CompareSFn>(h->NLSStringCompareS), false);
}
int64_t NLSStringCompLitC(const NLSSMHandle *h, const uint8_t *a, int64_t la,
                          const uint8_t *literal, int64_t length, uint32_t options) {
  return cc::comp_lit_s(h, a, la, literal, length, options,
                        cc::slot_as<cc::CompareSFn>(h->NLSStringCompStrC), true);
}
int64_t NLSStringCompLit_SBCS(const NLSSMHandle *h, const NLSString *a, const uint8_t *literal,
                              int64_t length, uint32_t options) {
  return cc::comp_lit(h, a, literal, length, options, &NLSStringCompStr_SBCS);
}
int64_t NLSStringCompLitS_SBCS(const NLSSMHandle *h, const uint8_t *a, int64_t la,
                               const uint8_t *literal, int64_t length, uint32_t options) {
  return cc::comp_lit_s(h, a, la, literal, length, options, &NLSStringCompareS_SBCS, false);
}
int64_t NLSStringCompLitC_SBCS(const NLSSMHandle *h, const uint8_t *a, int64_t la,
                               const uint8_t *literal, int64_t length, uint32_t options) {
  return cc::comp_lit_s(h, a, la, literal, length, options, &NLSStringCompStrC_SBCS, true);
}
int64_t NLSStringCompLit_MBCS_modal(const NLSSMHandle *h, const NLSString *a,
                                    const uint8_t *literal, int64_t length, uint32_t options) {
  return cc::comp_lit(h, a, literal, length, options, &NLSStringCompStr_MBCS_modal);
}
int64_t NLSStringCompLitS_MBCS_modal(const NLSSMHandle *h, const uint8_t *a, int64_t la,
                                     const uint8_t *literal, int64_t length, uint32_t options) {
  return cc::comp_lit_s(h, a, la, literal, length, options, &NLSStringCompareS_MBCS_modal, false);
}
int64_t NLSStringCompLitC_MBCS_modal(const NLSSMHandle *h, const uint8_t *a, int64_t la,
                                     const uint8_t *literal, int64_t length, uint32_t options) {
  return cc::comp_lit_s(h, a, la, literal, length, options, &NLSStringCompStrC_MBCS_modal, true);
}
