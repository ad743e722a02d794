// Upper case, lower case and case folding of UTF-8 text, by the simple
// (one code point to one) or the full (one to several, U+00DF to "SS")
// mappings, independent of language and context.
#include <nlssm/nlssm.h>

#include "kernel/u8/case_map.hpp"

namespace {

using kernel::u8::CaseKind;

// Maps src into dst one character at a time; a character's mapping is
// stored whole or not at all, and once one does not fit nothing more is
// stored. With `needed` the whole text is mapped to count its length.
int64_t map_text(CaseKind kind, uint8_t *dst, int64_t capacity, const uint8_t *src,
                 int64_t byteLength, uint32_t options, int64_t *written, int64_t *needed) {
  if (written != nullptr) *written = 0;
  if (needed != nullptr) *needed = 0;
  if (capacity < 0 || byteLength < 0) return NLSSM_E_NUMBER_TOO_LONG;
  if ((src == nullptr && byteLength > 0) || (dst == nullptr && capacity > 0))
    return NLSSM_E_NULL_ARGUMENT;
  if ((options & ~uint32_t{QVZSU8_FULL}) != 0) return NLSSM_E_BAD_OPTIONS;
  const bool full = (options & QVZSU8_FULL) != 0;
  int64_t out = 0;    // bytes stored
  int64_t total = 0;  // bytes the mapping takes
  bool fits = true;
  bool illFormed = false;
  uint8_t piece[kernel::u8::kCaseFullMax];
  for (int64_t in = 0; in < byteLength;) {
    if (fits && in + 8 <= byteLength && out + 8 <= capacity && kernel::u8::ascii_word(src + in)) {
      uint64_t w;
      std::memcpy(&w, src + in, 8);
      w = kernel::u8::ascii_case_word(kind, w);
      std::memcpy(dst + out, &w, 8);
      in += 8;
      out += 8;
      total += 8;
      continue;
    }
    if (fits && src[in] < 0x80 && out < capacity) {  // ASCII maps in place, one byte to one
      dst[out++] = kernel::u8::ascii_case(kind, src[in++]);
      ++total;
      continue;
    }
    const kernel::u8::Mapped m = kernel::u8::map_char(kind, full, src + in, byteLength - in, piece);
    in += m.consumed;
    illFormed |= m.illFormed;
    if (fits && out + m.length <= capacity) {
      std::memcpy(dst + out, piece, static_cast<size_t>(m.length));
      out += m.length;
    } else {
      fits = false;
      if (needed == nullptr) break;
    }
    total += m.length;
  }
  if (written != nullptr) *written = out;
  if (needed != nullptr) *needed = total;
  if (!fits) return NLSSM_E_DEST_TOO_SMALL;
  return illFormed ? NLSSM_E_ILL_FORMED : NLSSM_OK;
}

}  // namespace

int64_t qvzsu8Upper(uint8_t *dst, int64_t capacity, const uint8_t *src, int64_t byteLength,
                    uint32_t options, int64_t *written, int64_t *needed) {
  return map_text(CaseKind::upper, dst, capacity, src, byteLength, options, written, needed);
}
int64_t qvzsu8Lower(uint8_t *dst, int64_t capacity, const uint8_t *src, int64_t byteLength,
                    uint32_t options, int64_t *written, int64_t *needed) {
  return map_text(CaseKind::lower, dst, capacity, src, byteLength, options, written, needed);
}
int64_t qvzsu8Fold(uint8_t *dst, int64_t capacity, const uint8_t *src, int64_t byteLength,
                   uint32_t options, int64_t *written, int64_t *needed) {
  return map_text(CaseKind::fold, dst, capacity, src, byteLength, options, written, needed);
}

uint32_t qvzsu8UpperChar(uint32_t cp) {
  return kernel::u8::simple_case(CaseKind::upper, cp);
}
uint32_t qvzsu8LowerChar(uint32_t cp) {
  return kernel::u8::simple_case(CaseKind::lower, cp);
}
uint32_t qvzsu8FoldChar(uint32_t cp) {
  return kernel::u8::simple_case(CaseKind::fold, cp);
}
