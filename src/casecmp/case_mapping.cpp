// NLSStringLower and NLSStringUpper in every encoding class: the plain form
// on a descriptor (from its current character, at most `count` characters,
// 0 = to the end), the S form on a whole buffer, the C form on exactly
// `count` characters of a buffer (no byte limit: the caller vouches for
// them).
#include <nlssm/nlssm.h>

#include <emmintrin.h>

#include <type_traits>

#include "casecmp/case_walk.hpp"
#include "casecmp/table_map.hpp"
#include "kernel/hot.hpp"
#include "unicode/codec.hpp"
#include "unicode/tables.hpp"

namespace nlssm::casecmp {
namespace {

// ---- The span a form works on ---------------------------------------------

// The bytes from a descriptor's current character to its end; false when
// there is nothing to do (no text, no current character).
bool descriptor_span(const NLSString *s, uint8_t *&p, int64_t &n) {
  const auto length = static_cast<int64_t>(s->length);
  if (length == 0 || s->curOffset < 0 || s->curOffset >= length) return false;
  p = s->buffer + s->curOffset;
  n = length - s->curOffset;
  return true;
}

// Each form checks its arguments the same way: a missing descriptor or
// buffer is a null argument, anything else empty is success.
template <typename Body>
int64_t plain_form(NLSString *s, Body body) {
  if (s == nullptr || (s->buffer == nullptr && s->length != 0)) return kNullArgument;
  uint8_t *p = nullptr;
  int64_t n = 0;
  if (!descriptor_span(s, p, n)) return kOk;
  body(p, n);
  return kOk;
}
template <typename Body>
int64_t buffer_form(uint8_t *p, int64_t n, Body body) {
  if (n <= 0) return kOk;
  if (p == nullptr) return kNullArgument;
  body(p, n);
  return kOk;
}

// ---- Single-byte code pages -------------------------------------------------
// The case table; options unused. The C form's count is a byte count here.

int64_t sbcs_plain(const NLSSMHandle *h, NLSString *s, int64_t count, uint32_t, Case c) {
  return plain_form(s, [&](uint8_t *p, int64_t n) {
    map_bytes(case_table(h, c), p, p, count > 0 && count < n ? count : n);
  });
}
int64_t sbcs_bytes(const NLSSMHandle *h, uint8_t *p, int64_t n, uint32_t, Case c) {
  return buffer_form(p, n, [&](uint8_t *q, int64_t m) { map_bytes(case_table(h, c), q, q, m); });
}

// ---- Non-modal multi-byte text ------------------------------------------------
// The EUC-TW and GB18030 members refuse options above 7; the others take any.

template <class Split>
constexpr bool refuses_high_options() {
  return std::is_same_v<Split, EucTwSplit> || std::is_same_v<Split, Gb18030Split>;
}

template <class Split>
int64_t nonmodal(const NLSSMHandle *h, uint8_t *p, int64_t n, int64_t limit, uint32_t options,
                 Case c) {
  walk_nonmodal(ByteTables(h, c, options), Split(h), p, p, n, n, limit);
  return kOk;
}
template <class Split>
int64_t nonmodal_plain(const NLSSMHandle *h, NLSString *s, int64_t count, uint32_t options,
                       Case c) {
  if (refuses_high_options<Split>() && options > kOptLimit) return kBadOptions;
  return plain_form(
      s, [&](uint8_t *p, int64_t n) { nonmodal<Split>(h, p, n, char_limit(count), options, c); });
}
template <class Split>
int64_t nonmodal_bytes(const NLSSMHandle *h, uint8_t *p, int64_t n, uint32_t options, Case c) {
  if (refuses_high_options<Split>() && options > kOptLimit) return kBadOptions;
  return buffer_form(
      p, n, [&](uint8_t *q, int64_t m) { nonmodal<Split>(h, q, m, kNoLimit, options, c); });
}
template <class Split>
int64_t nonmodal_chars(const NLSSMHandle *h, uint8_t *p, int64_t count, uint32_t options, Case c) {
  if (refuses_high_options<Split>() && options > kOptLimit) return kBadOptions;
  return buffer_form(
      p, count, [&](uint8_t *q, int64_t m) { nonmodal<Split>(h, q, kNoLimit, m, options, c); });
}

// ---- Shift-out/shift-in text -------------------------------------------------
// The plain form starts in double-byte mode unless the current character's
// kind says single byte; the S and C forms start in single-byte mode.

void modal(const NLSSMHandle *h, uint8_t *p, int64_t n, int64_t limit, uint32_t options, Case c,
           bool doubleByte) {
  walk_modal<true>(ByteTables(h, c, options), cursor::ModalModel(h), p, p, n, n, limit, doubleByte);
}
int64_t modal_plain(const NLSSMHandle *h, NLSString *s, int64_t count, uint32_t options, Case c) {
  return plain_form(s, [&](uint8_t *p, int64_t n) {
    modal(h, p, n, char_limit(count), options, c, s->charKind != NLSSM_KIND_SINGLE);
  });
}
int64_t modal_bytes(const NLSSMHandle *h, uint8_t *p, int64_t n, uint32_t options, Case c) {
  return buffer_form(p, n,
                     [&](uint8_t *q, int64_t m) { modal(h, q, m, kNoLimit, options, c, false); });
}
int64_t modal_chars(const NLSSMHandle *h, uint8_t *p, int64_t count, uint32_t options, Case c) {
  return buffer_form(p, count,
                     [&](uint8_t *q, int64_t m) { modal(h, q, kNoLimit, m, options, c, false); });
}

// ---- 16- and 32-bit units -----------------------------------------------------
// Options unused. 32-bit plain form: `count` units when fewer than the text
// holds, else the whole remainder.

template <bool kBig>
int64_t wcs2_plain(const NLSSMHandle *h, NLSString *s, int64_t count, uint32_t, Case c) {
  return plain_form(s,
                    [&](uint8_t *p, int64_t n) { walk_wcs2<kBig>(h, c, p, n, char_limit(count)); });
}
template <bool kBig>
int64_t wcs2_bytes(const NLSSMHandle *h, uint8_t *p, int64_t n, uint32_t, Case c) {
  return buffer_form(p, n, [&](uint8_t *q, int64_t m) { walk_wcs2<kBig>(h, c, q, m, kNoLimit); });
}
template <bool kBig>
int64_t wcs2_chars(const NLSSMHandle *h, uint8_t *p, int64_t count, uint32_t, Case c) {
  return buffer_form(p, count,
                     [&](uint8_t *q, int64_t m) { walk_wcs2<kBig>(h, c, q, kNoLimit, m); });
}
template <bool kBig>
int64_t wcs4_plain(const NLSSMHandle *h, NLSString *s, int64_t count, uint32_t, Case c) {
  return plain_form(s, [&](uint8_t *p, int64_t n) {
    const int64_t units = n / 4;
    walk_wcs4<kBig>(h, c, p, count > 0 && count < units ? count : units);
  });
}
template <bool kBig>
int64_t wcs4_bytes(const NLSSMHandle *h, uint8_t *p, int64_t n, uint32_t, Case c) {
  return buffer_form(p, n, [&](uint8_t *q, int64_t m) { walk_wcs4<kBig>(h, c, q, m / 4); });
}
template <bool kBig>
int64_t wcs4_chars(const NLSSMHandle *h, uint8_t *p, int64_t count, uint32_t, Case c) {
  return buffer_form(p, count, [&](uint8_t *q, int64_t m) { walk_wcs4<kBig>(h, c, q, m); });
}

// ---- UTF-8 -------------------------------------------------------------------

// The ASCII range of UTF-8 text changes only at A-Z (lower) and a-z (upper):
// whole runs of it go through the kernel's vector case flip. Everything
// above it goes through the host.

// Bytes below 0x80 from p on, at most n.
int64_t ascii_run(const uint8_t *p, int64_t n) {
  int64_t i = 0;
  for (; i + 16 <= n; i += 16) {
    const auto mask = static_cast<unsigned>(
        _mm_movemask_epi8(_mm_loadu_si128(reinterpret_cast<const __m128i *>(p + i))));
    if (mask != 0) return i + __builtin_ctz(mask);
  }
  while (i < n && p[i] < 0x80) ++i;
  return i;
}

enum class Utf8Form : uint8_t { kSpan, kChars };

// Up to `limit` characters of the `n` bytes at p, read at r and written at
// w: a mapping of another length moves the rest of the text up or down.
// The walk ends at a character that does not decode (its lead byte or its
// length), and before a write that would pass the end of the text. In the
// span forms the bytes a shorter mapping freed at the end are blanked, so
// the text keeps its length; the C form decodes at most 4 bytes per
// character and blanks nothing.
void walk_utf8(const NLSSMHandle *h, Case c, uint8_t *p, int64_t n, int64_t limit, Utf8Form form) {
  HostCase host_case(h, c);
  int64_t r = 0, w = 0;
  for (int64_t chars = 0; r < n && chars < limit; ++chars) {
    const uint8_t b = p[r];
    if (b < 0x80) {  // a run of ASCII characters at once
      const int64_t run = ascii_run(p + r, std::min(n - std::max(r, w), limit - chars));
      if (run == 0) break;  // no room left at the write position
      if (w != r) std::memmove(p + w, p + r, static_cast<size_t>(run));
      (c == Case::kUpper ? kernel::hot().str_up : kernel::hot().str_low)(p + w, run);
      w += run;
      r += run;
      chars += run - 1;
      continue;
    }
    const int64_t available = form == Utf8Form::kChars ? 4 : n - r;
    const int64_t announced = cursor::kUtf8LeadLength[b];
    uint32_t cp = 0;
    int64_t consumed = 0;
    if (announced == 0 || announced > available ||
        UTF8_UTF32(p + r, available, &cp, &consumed) != NLSSM_OK)
      break;
    const uint32_t to = host_case(cp);
    const int64_t size = to != 0 ? unicode::utf8_length_of(to) : consumed;
    if (size > n - w) break;
    if (to != 0) {
      int64_t written = 0;
      UTF32_UTF8(to, p + w, size, &written);
    } else if (w != r) {
      std::memmove(p + w, p + r, static_cast<size_t>(consumed));
    }
    w += size;
    r += consumed;
  }
  if (form == Utf8Form::kSpan && w < r) std::memset(p + w, 0x20, static_cast<size_t>(r - w));
}

// ---- UTF-EBCDIC ----------------------------------------------------------------

// Each character is decoded and, when the host maps it, encoded back in
// place; the new form's length is the step. A byte that starts no
// character, or a character cut by the end of the text, ends the walk; a
// mapping that would run past the end leaves its character as it is.
void walk_utfe(const NLSSMHandle *h, Case c, uint8_t *p, int64_t n, int64_t limit) {
  HostCase host_case(h, c);
  int64_t off = 0;
  for (int64_t chars = 0; off < n && chars < limit; ++chars) {
    const int64_t announced = cursor::kSkipUtfe[p[off]];
    uint32_t cp = 0;
    if (announced == 0 || announced > n - off) break;
    int64_t step = FromUTFE(h, p + off, &cp);
    if (step == 0) break;
    const uint32_t to = host_case(cp);
    if (to != 0 && unicode::utfe_length(to) <= n - off) step = ToUTFE(h, to, p + off);
    off += step;
  }
}

int64_t utf8_plain(const NLSSMHandle *h, NLSString *s, int64_t count, uint32_t, Case c) {
  return plain_form(
      s, [&](uint8_t *p, int64_t n) { walk_utf8(h, c, p, n, char_limit(count), Utf8Form::kSpan); });
}
int64_t utf8_bytes(const NLSSMHandle *h, uint8_t *p, int64_t n, uint32_t, Case c) {
  return buffer_form(
      p, n, [&](uint8_t *q, int64_t m) { walk_utf8(h, c, q, m, kNoLimit, Utf8Form::kSpan); });
}
int64_t utf8_chars(const NLSSMHandle *h, uint8_t *p, int64_t count, uint32_t, Case c) {
  return buffer_form(
      p, count, [&](uint8_t *q, int64_t m) { walk_utf8(h, c, q, kNoLimit, m, Utf8Form::kChars); });
}

// UTF-EBCDIC refuses options above 7. Lower stops after `count` characters;
// Upper always walks the whole text.
int64_t utfe_plain(const NLSSMHandle *h, NLSString *s, int64_t limit, uint32_t options, Case c) {
  if (options > kOptLimit) return kBadOptions;
  return plain_form(s, [&](uint8_t *p, int64_t n) { walk_utfe(h, c, p, n, limit); });
}
int64_t utfe_bytes(const NLSSMHandle *h, uint8_t *p, int64_t n, uint32_t options, Case c) {
  if (options > kOptLimit) return kBadOptions;
  return buffer_form(p, n, [&](uint8_t *q, int64_t m) { walk_utfe(h, c, q, m, kNoLimit); });
}

}  // namespace
}  // namespace nlssm::casecmp

using nlssm::casecmp::Case;
namespace cm = nlssm::casecmp;

// Each line defines the Lower and the Upper member of one form.
#define NLSSM_CASE_PAIR(suffix, params, impl, ...) \
  int64_t NLSStringLower##suffix params {          \
    return impl(__VA_ARGS__, Case::kLower);        \
  }                                                \
  int64_t NLSStringUpper##suffix params {          \
    return impl(__VA_ARGS__, Case::kUpper);        \
  }
#define NLSSM_PLAIN (const NLSSMHandle *h, NLSString *s, int64_t count, uint32_t options)
#define NLSSM_BYTES (const NLSSMHandle *h, uint8_t *p, int64_t n, uint32_t options)
#define NLSSM_CHARS (const NLSSMHandle *h, uint8_t *p, int64_t count, uint32_t options)

extern "C" {

NLSSM_CASE_PAIR(_SBCS, NLSSM_PLAIN, cm::sbcs_plain, h, s, count, options)
NLSSM_CASE_PAIR(S_SBCS, NLSSM_BYTES, cm::sbcs_bytes, h, p, n, options)
NLSSM_CASE_PAIR(C_SBCS, NLSSM_CHARS, cm::sbcs_bytes, h, p, count, options)

NLSSM_CASE_PAIR(_MBCS_nonmodal, NLSSM_PLAIN, cm::nonmodal_plain<cm::LeadFlagSplit>, h, s, count,
                options)
NLSSM_CASE_PAIR(S_MBCS_nonmodal, NLSSM_BYTES, cm::nonmodal_bytes<cm::LeadFlagSplit>, h, p, n,
                options)
NLSSM_CASE_PAIR(C_MBCS_nonmodal, NLSSM_CHARS, cm::nonmodal_chars<cm::LeadFlagSplit>, h, p, count,
                options)
NLSSM_CASE_PAIR(_MBCS_nonmodal_EUC_JP, NLSSM_PLAIN, cm::nonmodal_plain<cm::EucJpSplit>, h, s, count,
                options)
NLSSM_CASE_PAIR(S_MBCS_nonmodal_EUC_JP, NLSSM_BYTES, cm::nonmodal_bytes<cm::EucJpSplit>, h, p, n,
                options)
NLSSM_CASE_PAIR(C_MBCS_nonmodal_EUC_JP, NLSSM_CHARS, cm::nonmodal_chars<cm::EucJpSplit>, h, p,
                count, options)
NLSSM_CASE_PAIR(_MBCS_nonmodal_EUC_TW, NLSSM_PLAIN, cm::nonmodal_plain<cm::EucTwSplit>, h, s, count,
                options)
NLSSM_CASE_PAIR(S_MBCS_nonmodal_EUC_TW, NLSSM_BYTES, cm::nonmodal_bytes<cm::EucTwSplit>, h, p, n,
                options)
NLSSM_CASE_PAIR(C_MBCS_nonmodal_EUC_TW, NLSSM_CHARS, cm::nonmodal_chars<cm::EucTwSplit>, h, p,
                count, options)
NLSSM_CASE_PAIR(_MBCS_nonmodal_GB18030, NLSSM_PLAIN, cm::nonmodal_plain<cm::Gb18030Split>, h, s,
                count, options)
NLSSM_CASE_PAIR(S_MBCS_nonmodal_GB18030, NLSSM_BYTES, cm::nonmodal_bytes<cm::Gb18030Split>, h, p, n,
                options)
NLSSM_CASE_PAIR(C_MBCS_nonmodal_GB18030, NLSSM_CHARS, cm::nonmodal_chars<cm::Gb18030Split>, h, p,
                count, options)

NLSSM_CASE_PAIR(_MBCS_modal, NLSSM_PLAIN, cm::modal_plain, h, s, count, options)
NLSSM_CASE_PAIR(S_MBCS_modal, NLSSM_BYTES, cm::modal_bytes, h, p, n, options)
NLSSM_CASE_PAIR(C_MBCS_modal, NLSSM_CHARS, cm::modal_chars, h, p, count, options)

NLSSM_CASE_PAIR(_WCS2L, NLSSM_PLAIN, cm::wcs2_plain<false>, h, s, count, options)
NLSSM_CASE_PAIR(S_WCS2L, NLSSM_BYTES, cm::wcs2_bytes<false>, h, p, n, options)
NLSSM_CASE_PAIR(C_WCS2L, NLSSM_CHARS, cm::wcs2_chars<false>, h, p, count, options)
NLSSM_CASE_PAIR(_WCS2B, NLSSM_PLAIN, cm::wcs2_plain<true>, h, s, count, options)
NLSSM_CASE_PAIR(S_WCS2B, NLSSM_BYTES, cm::wcs2_bytes<true>, h, p, n, options)
NLSSM_CASE_PAIR(C_WCS2B, NLSSM_CHARS, cm::wcs2_chars<true>, h, p, count, options)
NLSSM_CASE_PAIR(_WCS4L, NLSSM_PLAIN, cm::wcs4_plain<false>, h, s, count, options)
NLSSM_CASE_PAIR(S_WCS4L, NLSSM_BYTES, cm::wcs4_bytes<false>, h, p, n, options)
NLSSM_CASE_PAIR(C_WCS4L, NLSSM_CHARS, cm::wcs4_chars<false>, h, p, count, options)
NLSSM_CASE_PAIR(_WCS4B, NLSSM_PLAIN, cm::wcs4_plain<true>, h, s, count, options)
NLSSM_CASE_PAIR(S_WCS4B, NLSSM_BYTES, cm::wcs4_bytes<true>, h, p, n, options)
NLSSM_CASE_PAIR(C_WCS4B, NLSSM_CHARS, cm::wcs4_chars<true>, h, p, count, options)

NLSSM_CASE_PAIR(_UTF8, NLSSM_PLAIN, cm::utf8_plain, h, s, count, options)
NLSSM_CASE_PAIR(S_UTF8, NLSSM_BYTES, cm::utf8_bytes, h, p, n, options)
NLSSM_CASE_PAIR(C_UTF8, NLSSM_CHARS, cm::utf8_chars, h, p, count, options)

// UTF-EBCDIC: Upper ignores the count.
int64_t NLSStringLower_UTFE NLSSM_PLAIN {
  return cm::utfe_plain(h, s, cm::char_limit(count), options, Case::kLower);
}
int64_t NLSStringUpper_UTFE NLSSM_PLAIN {
  (void)count;
  return cm::utfe_plain(h, s, cm::kNoLimit, options, Case::kUpper);
}
NLSSM_CASE_PAIR(S_UTFE, NLSSM_BYTES, cm::utfe_bytes, h, p, n, options)

}  // extern "C"
