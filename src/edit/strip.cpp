// Strip: the length of a text up to and including its last character that
// is not a blank (with flag bit 0: not white space). Nothing is moved. The
// plain forms count characters from the current one, the S forms answer
// bytes, the C forms take and answer characters.
#include <nlssm/nlssm.h>

#include "edit/character_walk.hpp"
#include "edit/modal_text.hpp"
#include "unicode/tables.hpp"

namespace nlssm::edit {
namespace {

constexpr int64_t kAllWhiteSpace = 1;
constexpr uint8_t kClassWhiteSpace = 0x08;

bool white_space(uint32_t c) {
  return (c >= 9 && c <= 13) || c == 0x20 || c == 0x85 || c == 0xA0 || c == 0x1680 ||
         (c >= 0x2000 && c <= 0x200A) || c == 0x2028 || c == 0x2029 || c == 0x202F || c == 0x205F ||
         c == 0x3000;
}

// Bytes left when trailing bytes that `strip` accepts are taken off.
template <class Pred>
int64_t strip_bytes(const uint8_t *p, int64_t bytes, Pred strip) {
  while (bytes > 0 && strip(p[bytes - 1])) --bytes;
  return bytes;
}

// ---- Single-byte text -------------------------------------------------------

// The blank is 0x20 in ASCII-based and 0x40 in EBCDIC-based code pages; with
// flag bit 0 every byte the class table marks as white space goes too.
int64_t strip_sbcs(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t flags) {
  if (p == nullptr || bytes <= 0) return 0;
  const uint8_t blank = (h->encodingFlags & 1u) ? 0x20 : 0x40;
  if (p[bytes - 1] != blank && (flags & kAllWhiteSpace) == 0) return bytes;
  const uint8_t *classes = (flags & kAllWhiteSpace) != 0 ? h->classTable : nullptr;
  return strip_bytes(p, bytes, [&](uint8_t b) {
    return b == blank || (classes != nullptr && (classes[b] & kClassWhiteSpace) != 0);
  });
}

// ---- UTF-8 and UTF-EBCDIC ---------------------------------------------------

// UTF-8 white space at the end of the text, recognised by its bytes. The
// two E1 sequences are the ones this operation has always stripped.
int64_t utf8_white_tail(const uint8_t *p, int64_t bytes) {
  const uint8_t last = p[bytes - 1];
  if (last == 0x20 || (last >= 9 && last <= 13)) return 1;
  if (bytes >= 2 && p[bytes - 2] == 0xC2 && (last == 0x85 || last == 0xA0)) return 2;
  if (bytes < 3) return 0;
  const uint8_t a = p[bytes - 3], b = p[bytes - 2];
  if (a == 0xE2 && b == 0x80 &&
      ((last >= 0x80 && last <= 0x8A) || last == 0xA8 || last == 0xA9 || last == 0xAF))
    return 3;
  if ((a == 0xE2 && b == 0x81 && last == 0x9F) || (a == 0xE3 && b == 0x80 && last == 0x80))
    return 3;
  if (a == 0xE1 && ((b == 0x81 && last == 0xA8) || (b == 0x82 && last == 0x8E))) return 3;
  return 0;
}

int64_t strip_utf8(const uint8_t *p, int64_t bytes, int64_t flags) {
  if ((flags & kAllWhiteSpace) == 0)
    return strip_bytes(p, bytes, [](uint8_t b) { return b == 0x20; });
  for (int64_t n; bytes > 0 && (n = utf8_white_tail(p, bytes)) != 0;) bytes -= n;
  return bytes;
}

// The code point of the UTF-EBCDIC character that ends at `bytes`, and its
// length; a lone trailing byte stands for itself (it is no white space).
uint32_t utfe_last(const uint8_t *p, int64_t bytes, int64_t *length) {
  int64_t start = bytes - 1;
  while (start > 0 && bytes - start < 5 && cursor::utfe_trailing(p[start])) --start;
  const int64_t n = cursor::kSkipUtfe[p[start]];
  if (n != bytes - start || n == 0) {
    *length = 1;
    return 0xFFFD;
  }
  *length = n;
  static constexpr uint8_t kLeadMask[] = {0, 0xFF, 0x1F, 0x0F, 0x07, 0x03};
  uint32_t c = unicode::utfe_i8s[p[start]] & kLeadMask[n];
  for (int64_t i = start + 1; i < bytes; ++i) c = c << 5 | (unicode::utfe_i8s[p[i]] & 0x1F);
  return c;
}

int64_t strip_utfe(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t flags) {
  const uint8_t blank = h->blankChar[0];
  if ((flags & kAllWhiteSpace) == 0)
    return strip_bytes(p, bytes, [&](uint8_t b) { return b == blank; });
  for (int64_t n = 0; bytes > 0 && white_space(utfe_last(p, bytes, &n));) bytes -= n;
  return bytes;
}

// Characters of UTF-8 text by the length its lead bytes announce, at most
// `limit` (0: no limit).
int64_t utf8_count(const uint8_t *p, int64_t bytes, int64_t limit) {
  int64_t off = 0, chars = 0;
  while (off < bytes && (limit <= 0 || chars < limit)) {
    off += cursor::kUtf8FormLength[p[off]];
    ++chars;
  }
  return chars;
}

// Class 1: UTF-8 strips the trailing blanks of the whole text and then
// counts up to n characters; with every white space it counts them all.
// UTF-EBCDIC applies n alike.
int64_t strip_class1_plain(const NLSSMHandle *h, const NLSString *s, int64_t n, int64_t flags) {
  const Remaining r = remaining_of(s);
  if (r.bytes == 0) return 0;
  const int64_t limit = (flags & kAllWhiteSpace) != 0 ? 0 : n;
  if (h->encodingNumber == NLSSM_ENC_UTF8)
    return utf8_count(r.text, strip_utf8(r.text, r.bytes, flags), limit);
  int64_t chars = 0;
  span_of(UtfeStepModel(h), r.text, strip_utfe(h, r.text, r.bytes, flags), limit, &chars);
  return chars;
}

// ---- Wide text --------------------------------------------------------------

template <int kWidth>
uint32_t wide_unit(const uint8_t *p, bool big) {
  if constexpr (kWidth == 2)
    return big ? uint32_t(p[0]) << 8 | p[1] : uint32_t(p[1]) << 8 | p[0];
  else
    return big ? uint32_t(p[0]) << 24 | uint32_t(p[1]) << 16 | uint32_t(p[2]) << 8 | p[3]
               : uint32_t(p[3]) << 24 | uint32_t(p[2]) << 16 | uint32_t(p[1]) << 8 | p[0];
}

struct WideRule {
  bool big;
  bool all;
  bool strippable(uint32_t c) const { return all ? white_space(c) : c == 0x20; }
};

WideRule wide_rule(const NLSSMHandle *h, int64_t flags) {
  return {wide_big_endian(h), (flags & kAllWhiteSpace) != 0};
}

// Walks forward over the first `limit` characters (all when 0), counting
// them and the run of strippable ones at the end; answers the difference.
template <int kWidth>
int64_t wide_count_kept(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t limit,
                        int64_t flags) {
  const WideRule rule = wide_rule(h, flags);
  int64_t off = 0, chars = 0, run = 0;
  while (off + kWidth <= bytes && (limit <= 0 || chars < limit)) {
    const uint32_t c = wide_unit<kWidth>(p + off, rule.big);
    int64_t size = kWidth;
    if (kWidth == 2 && (c & 0xFC00) == 0xD800 && off + 4 <= bytes &&
        (wide_unit<kWidth>(p + off + 2, rule.big) & 0xFC00) == 0xDC00)
      size = 4;
    run = size == kWidth && rule.strippable(c) ? run + 1 : 0;
    ++chars;
    off += size;
  }
  return chars - run;
}

template <int kWidth>
int64_t wide_strip_s(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t flags) {
  if (p == nullptr || bytes <= 0) return 0;
  const WideRule rule = wide_rule(h, flags);
  // Units are read back from the end, so a length that is not a whole
  // number of units keeps its odd bytes at the start.
  while (bytes >= kWidth && rule.strippable(wide_unit<kWidth>(p + bytes - kWidth, rule.big)))
    bytes -= kWidth;
  return bytes;
}

template <int kWidth>
int64_t wide_strip_plain(const NLSSMHandle *h, const NLSString *s, int64_t n, int64_t flags) {
  const Remaining r = remaining_of(s);
  return r.bytes == 0 ? 0 : wide_count_kept<kWidth>(h, r.text, r.bytes, n, flags);
}

template <int kWidth>
int64_t wide_strip_c(const NLSSMHandle *h, const uint8_t *p, int64_t chars, int64_t flags) {
  if (p == nullptr || chars <= 0) return 0;
  return wide_count_kept<kWidth>(h, p, INT64_MAX / 2, chars, flags);
}

// ---- Multi-byte non-modal text -----------------------------------------------

// Blanks and the white-space controls are single bytes that never serve as
// the second byte of a character here, so they are taken off the end byte
// by byte.
int64_t strip_multibyte(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t flags) {
  const uint8_t blank = h->blankChar[0];
  const bool all = (flags & kAllWhiteSpace) != 0;
  return strip_bytes(p, bytes, [&](uint8_t b) { return b == blank || (all && b >= 9 && b <= 13); });
}

// The first `limit` characters (all when 0), stripped, counted again.
int64_t multibyte_kept(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t limit,
                       int64_t flags) {
  return with_multibyte_model(h, [&](const auto &m) {
    const int64_t range = span_of(m, p, bytes, limit, nullptr);
    int64_t chars = 0;
    span_of(m, p, strip_multibyte(h, p, range, flags), 0, &chars);
    return chars;
  });
}

// ---- Modal text -------------------------------------------------------------

struct ModalKept {
  int64_t chars;  // characters counted less the trailing run of blanks
  int64_t bytes;  // up to the last character that is not a blank, with the
                  // shift sequences that follow it
};

// Follows the shift sequences; in single-byte width the handle's blank byte
// extends the run of trailing blanks, in double-byte width two bytes are one
// character (as the cursor steps modal text, so that the count agrees with
// the characters a caller counted). Stops after `limit` characters (0: no
// limit).
ModalKept modal_walk_kept(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t limit,
                          bool dbl) {
  const ModalModel m(h);
  const uint8_t blank = h->blankChar[0];
  int64_t off = 0, chars = 0, run = 0, keep = 0;
  while (off < bytes && (limit <= 0 || chars < limit)) {
    const int shift = m.shift_at(p + off, bytes - off);
    if (shift != 0) {
      dbl = shift > 0;
      off += m.length;
      if (run == 0) keep = off;
      continue;
    }
    const int64_t size = dbl && off + 2 <= bytes ? 2 : 1;
    run = !dbl && p[off] == blank ? run + 1 : 0;
    ++chars;
    off += size;
    if (run == 0) keep = off;
  }
  return {chars - run, keep};
}

// With every white space: the trailing bytes 0x40, 0x0E and 0x0F go,
// whatever the shift state.
int64_t modal_strip_raw(const uint8_t *p, int64_t bytes) {
  return strip_bytes(p, bytes, [](uint8_t b) { return b == 0x40 || b == 0x0E || b == 0x0F; });
}

int64_t modal_count(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, bool dbl) {
  int64_t chars = 0;
  modal_span(ModalModel(h), p, 0, bytes, 0, dbl, &chars);
  return chars;
}

int64_t modal_strip_plain(const NLSSMHandle *h, const NLSString *s, int64_t n, int64_t flags) {
  const Remaining r = remaining_of(s);
  if (r.bytes == 0) return 0;
  const bool dbl = modal_double_at(ModalModel(h), s->buffer, s->curOffset);
  if ((flags & kAllWhiteSpace) != 0)
    return modal_count(h, r.text, modal_strip_raw(r.text, r.bytes), dbl);
  return modal_walk_kept(h, r.text, r.bytes, n, dbl).chars;
}

// Byte extent of `chars` characters of text whose byte length is unknown.
template <class M>
int64_t extent_of(const M &m, const uint8_t *p, int64_t chars) {
  return span_of(m, p, INT64_MAX / 2, chars, nullptr);
}

}  // namespace
}  // namespace nlssm::edit

using namespace nlssm::edit;

extern "C" {

// Single-byte: only the first n bytes from the current one are looked at.
int64_t NLSStringStrip_SBCS(const NLSSMHandle *h, const NLSString *s, int64_t n, int64_t flags) {
  const Remaining r = remaining_of(s);
  return strip_sbcs(h, r.text, n > 0 && n < r.bytes ? n : r.bytes, flags);
}
int64_t NLSStringStripS_SBCS(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t flags) {
  return strip_sbcs(h, p, bytes, flags);
}
int64_t NLSStringStripC_SBCS(const NLSSMHandle *h, const uint8_t *p, int64_t chars, int64_t flags) {
  return strip_sbcs(h, p, chars, flags);
}

int64_t NLSStringStrip_UTF8(const NLSSMHandle *h, const NLSString *s, int64_t n, int64_t flags) {
  return strip_class1_plain(h, s, n, flags);
}
int64_t NLSStringStrip_UTFE(const NLSSMHandle *h, const NLSString *s, int64_t n, int64_t flags) {
  return strip_class1_plain(h, s, n, flags);
}
int64_t NLSStringStripS_UTF8(const NLSSMHandle *, const uint8_t *p, int64_t bytes, int64_t flags) {
  return p == nullptr || bytes <= 0 ? 0 : strip_utf8(p, bytes, flags);
}
int64_t NLSStringStripS_UTFE(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t flags) {
  return p == nullptr || bytes <= 0 ? 0 : strip_utfe(h, p, bytes, flags);
}
// Serves UTF-8 and UTF-EBCDIC handles, each by its own rule.
int64_t NLSStringStripC_UTF8(const NLSSMHandle *h, const uint8_t *p, int64_t chars, int64_t flags) {
  if (p == nullptr || chars <= 0) return 0;
  if (h->encodingNumber == NLSSM_ENC_UTF8) {
    const int64_t bytes = extent_of(nlssm::cursor::Utf8StepModel(h), p, chars);
    return utf8_count(p, strip_utf8(p, bytes, flags), 0);
  }
  const UtfeStepModel m(h);
  int64_t kept = 0;
  span_of(m, p, strip_utfe(h, p, extent_of(m, p, chars), flags), 0, &kept);
  return kept;
}

int64_t NLSStringStrip_WCS2(const NLSSMHandle *h, const NLSString *s, int64_t n, int64_t flags) {
  return wide_strip_plain<2>(h, s, n, flags);
}
int64_t NLSStringStripS_WCS2(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t flags) {
  return wide_strip_s<2>(h, p, bytes, flags);
}
int64_t NLSStringStripC_WCS2(const NLSSMHandle *h, const uint8_t *p, int64_t chars, int64_t flags) {
  return wide_strip_c<2>(h, p, chars, flags);
}

int64_t NLSStringStrip_WCS4(const NLSSMHandle *h, const NLSString *s, int64_t n, int64_t flags) {
  return wide_strip_plain<4>(h, s, n, flags);
}
int64_t NLSStringStripS_WCS4(const NLSSMHandle *h, const uint8_t *p, int64_t bytes, int64_t flags) {
  return wide_strip_s<4>(h, p, bytes, flags);
}
int64_t NLSStringStripC_WCS4(const NLSSMHandle *h, const uint8_t *p, int64_t chars, int64_t flags) {
  return wide_strip_c<4>(h, p, chars, flags);
}

int64_t NLSStringStrip_MBCS_modal(const NLSSMHandle *h, const NLSString *s, int64_t n,
                                  int64_t flags) {
  return modal_strip_plain(h, s, n, flags);
}
int64_t NLSStringStripS_MBCS_modal(const NLSSMHandle *h, const uint8_t *p, int64_t bytes,
                                   int64_t flags) {
  if (p == nullptr || bytes <= 0) return 0;
  if ((flags & 1) != 0) return modal_strip_raw(p, bytes);
  return modal_walk_kept(h, p, bytes, 0, false).bytes;
}
// The byte length of modal text of `chars` characters is found by walking
// them (shift sequences are not characters).
int64_t NLSStringStripC_MBCS_modal(const NLSSMHandle *h, const uint8_t *p, int64_t chars,
                                   int64_t flags) {
  if (p == nullptr || chars <= 0) return 0;
  bool dbl = false;
  const int64_t bytes = modal_span(ModalModel(h), p, 0, INT64_MAX / 2, chars, dbl, nullptr);
  if ((flags & 1) != 0) return modal_count(h, p, modal_strip_raw(p, bytes), false);
  return modal_walk_kept(h, p, bytes, 0, false).chars;
}

int64_t NLSStringStrip_MBCS_nonmodal(const NLSSMHandle *h, const NLSString *s, int64_t n,
                                     int64_t flags) {
  const Remaining r = remaining_of(s);
  return r.bytes == 0 ? 0 : multibyte_kept(h, r.text, r.bytes, n, flags);
}
int64_t NLSStringStripS_MBCS_nonmodal(const NLSSMHandle *h, const uint8_t *p, int64_t bytes,
                                      int64_t flags) {
  return p == nullptr || bytes <= 0 ? 0 : strip_multibyte(h, p, bytes, flags);
}
int64_t NLSStringStripC_MBCS_nonmodal(const NLSSMHandle *h, const uint8_t *p, int64_t chars,
                                      int64_t flags) {
  if (p == nullptr || chars <= 0) return 0;
  return with_multibyte_model(
      h, [&](const auto &m) { return multibyte_kept(h, p, extent_of(m, p, chars), 0, flags); });
}

}  // extern "C"
