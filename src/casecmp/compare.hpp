// Shared machinery of the equality, inequality and ordering families: the
// operand spans, the equal-prefix scan on the kernel's vector compare, the
// character walkers that tell where in a multi-byte text a difference falls,
// the Unicode decoders and case queries, and the blank tail scans.
//
// Every comparison runs the same way: the kernel finds the first byte at
// which the two operands differ; only there does a member look at characters
// (fold through a table or a host query, or decide the order). Long equal
// texts therefore cost about what a block compare costs.
#pragma once

#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "cursor/char_model.hpp"
#include "kernel/hot.hpp"
#include "module/host_access.hpp"

namespace nlssm::casecmp {

using cursor::ModalModel;

// First offset below n at which a and b differ, or n.
inline int64_t mismatch(const uint8_t *a, const uint8_t *b, int64_t n) {
  return n > 0 ? kernel::hot().mem_mismatch(a, b, n) : 0;
}

// The vector compare from (i, j) on, to the end of the shorter operand; each
// difference goes to `at(i, j)`, which moves both offsets past it and
// answers true to go on, or false to stop there. True when an end was
// reached.
template <class At>
bool scan(const uint8_t *a, int64_t na, const uint8_t *b, int64_t nb, int64_t &i, int64_t &j,
          At at) {
  for (;;) {
    const int64_t n = std::min(na - i, nb - j);
    const int64_t d = mismatch(a + i, b + j, n);
    i += d;
    j += d;
    if (d == n) return true;
    if (!at(i, j)) return false;
  }
}

inline int64_t signed_at(bool greater, int64_t k) {
  return greater ? k + 1 : -(k + 1);
}

// ---- Operands -----------------------------------------------------------------

struct Span {
  const uint8_t *p = nullptr;
  int64_t n = 0;
};

// The text of a descriptor from byte `start` to its length; false when the
// descriptor, its buffer or the start is missing.
inline bool span_from(const NLSString *s, int64_t start, Span &out) {
  if (s == nullptr || s->buffer == nullptr || start < 0) return false;
  const auto length = static_cast<int64_t>(s->length);
  out = {s->buffer + std::min(start, length), std::max<int64_t>(length - start, 0)};
  return true;
}

// The text of each descriptor from its current character; false when
// either has none.
inline bool descriptor_spans(const NLSString *sa, const NLSString *sb, Span &a, Span &b) {
  return sa != nullptr && sb != nullptr && sa->curOffset >= 0 && sb->curOffset >= 0 &&
         span_from(sa, sa->curOffset, a) && span_from(sb, sb->curOffset, b);
}

// A raw buffer of n bytes (none below 0); false when it is missing.
inline bool raw_span(const uint8_t *p, int64_t n, Span &out) {
  if (p == nullptr && n > 0) return false;
  out = {p, std::max<int64_t>(n, 0)};
  return true;
}

// A descriptor over a converted literal, on its first character (none when
// it is empty), in single-byte shift state.
inline NLSString text_descriptor(const uint8_t *text, int64_t bytes) {
  NLSString s{};
  s.buffer = const_cast<uint8_t *>(text);
  s.length = s.capacity = static_cast<uint64_t>(bytes);
  s.curOffset = bytes > 0 ? 0 : NLSSM_POS_NONE;
  s.nextOffset = NLSSM_POS_NONE;
  s.prevOffset = NLSSM_POS_NO_PREVIOUS;
  s.charKind = cursor::kModalSingle;
  return s;
}

// A positive count limits both operands of a byte-counted comparison: when
// it does not exceed the shorter one, both are cut to it.
inline void limit_bytes(int64_t &la, int64_t &lb, int64_t count) {
  if (count > 0 && count <= std::min(la, lb)) la = lb = count;
}

// ---- Character walkers ------------------------------------------------------------

// Start mode of modal text: double-byte when the descriptor's kind says so.
inline uint32_t modal_start(const NLSString *s) {
  return s != nullptr && s->charKind != 0 && s->charKind != cursor::kModalSingle
             ? cursor::kModalDouble
             : cursor::kModalSingle;
}

// Follows the characters of one operand forward (shift sequences of modal
// text included), so that a difference found by the byte scan can be placed
// in its character. Positions only grow, so a whole comparison walks each
// operand at most once.
template <class M>
struct Walker {
  const M &model;
  const uint8_t *p;
  int64_t n;
  int64_t off = 0;
  uint32_t state;

  Walker(const M &m, const uint8_t *text, int64_t length, uint32_t start = cursor::kModalSingle)
      : model(m), p(text), n(length), state(start) {}

  // Bytes of the character at `off`, never past the end of the text (a
  // wide unit or a lead byte cut off by the end is what is left of it).
  int64_t size_here() const { return std::min(model.unit(p + off, n - off, state).size, n - off); }
  // Moves to the character that holds byte i; true when it starts at i.
  bool reach(int64_t i) {
    for (;;) {
      model.skip_shifts(p, off, n, state);
      if (off >= i) return off == i;
      const int64_t size = size_here();
      if (off + size > i) return false;
      state = model.kind(size, state);
      off += size;
    }
  }
  // True when the character at `off` is one byte in single-byte mode, the
  // only characters that the 256-byte case tables fold.
  bool single_byte_here() const {
    if (M::kModal && cursor::modal_double(state)) return false;
    return off < n && size_here() == 1;
  }
  void step_one() {
    state = model.kind(1, state);
    ++off;
  }
};

// Bytes of the first `count` characters of a text of n bytes (n may be
// unbounded for the character-counted forms).
template <class M>
int64_t bytes_of_chars(const M &m, const uint8_t *p, int64_t n, int64_t count,
                       uint32_t state = cursor::kModalSingle) {
  int64_t off = 0;
  for (int64_t c = 0; c < count; ++c) {
    m.skip_shifts(p, off, n, state);
    if (off >= n) break;
    const int64_t size = m.unit(p + off, n - off, state).size;
    state = m.kind(size, state);
    off += size;
  }
  return std::min(off, n);
}

// Non-modal multi-byte sets: lead and trail bytes from the handle, or the
// fixed length rules of EUC-JP, EUC-TW and GB18030 chosen by encoding number.
using cursor::with_nonmodal_model;

// ---- Unicode decoding and case queries -------------------------------------------

struct Decoded {
  uint32_t cp;
  int64_t size;
  bool ok;
};

// UTF-8: a valid lead byte and its continuation bytes, all within the text.
struct Utf8Codec {
  static int64_t length(uint8_t b) {
    const int64_t n = cursor::kUtf8LeadLength[b];
    return n == 0 ? 1 : n;
  }
  static bool continuation(uint8_t b) { return cursor::utf8_continuation(b); }
  static bool counts(uint8_t b) { return cursor::kUtf8LeadLength[b] != 0 || b == 0; }
  static Decoded decode(const uint8_t *p, int64_t remaining) {
    const int64_t n = cursor::kUtf8LeadLength[*p];
    if (*p < 0x80) return {*p, 1, true};
    if (n == 0 || n > remaining) return {*p, 1, false};
    static constexpr uint8_t kLeadBits[5] = {0, 0, 0x1F, 0x0F, 0x07};
    uint32_t cp = *p & kLeadBits[n];
    for (int64_t k = 1; k < n; ++k) {
      if (!continuation(p[k])) return {*p, 1, false};
      cp = cp << 6 | (p[k] & 0x3F);
    }
    return {cp, n, true};
  }
};

// UTF-EBCDIC: bytes map to I8 form, whose leads announce 0-4 trailing bytes
// of five bits each.
struct UtfeCodec {
  static int64_t length(uint8_t b) { return cursor::utfe_char_length(b); }
  static bool continuation(uint8_t b) { return cursor::utfe_trailing(b); }
  static bool counts(uint8_t) { return true; }
  static Decoded decode(const uint8_t *p, int64_t remaining) {
    const int64_t n = cursor::kSkipUtfe[*p];
    if (n == 0 || n > remaining) return {*p, 1, false};
    static constexpr uint8_t kLeadBits[6] = {0, 0xFF, 0x1F, 0x0F, 0x07, 0x03};
    uint32_t cp = unicode::utfe_i8s[*p] & kLeadBits[n];
    for (int64_t k = 1; k < n; ++k) {
      if (!continuation(p[k])) return {*p, 1, false};
      cp = cp << 5 | (unicode::utfe_i8s[p[k]] & 0x1F);
    }
    return {cp, n, true};
  }
};

// How far before the differing bytes a[i] and b[j] their characters start:
// back over trailing bytes (at most four), never before the offsets where the
// operands last met on a character boundary.
template <class Codec>
int64_t back_to_start(const uint8_t *a, int64_t i, int64_t floorA, const uint8_t *b, int64_t j,
                      int64_t floorB) {
  int64_t back = 0;
  while (back < 4 && i - back > floorA && j - back > floorB &&
         (Codec::continuation(a[i - back]) || Codec::continuation(b[j - back])))
    ++back;
  return back;
}

// Lead-length model of a UTF codec, for walking characters by count.
template <class Codec>
struct UtfModel : cursor::StatelessModel {
  cursor::Unit unit(const uint8_t *p, int64_t remaining, uint32_t) const {
    return {std::min(Codec::length(*p), std::max<int64_t>(remaining, 1)), false};
  }
};

// The owner's lower (or upper) case mapping of a character; the character
// itself when the query fails or knows no mapping.
inline uint32_t case_of(const NLSSMHandle *h, uint32_t c, bool upper) {
  if (h->owner == nullptr) return c;
  NLSHostCharInfo info{};
  const auto query = host::slot<NLSHostCharInfoFn>(h->owner, NLSHOST_SLOT_NLS_CHAR_INFO);
  if (query(h->owner, c, &info) != 0) return c;
  const uint32_t mapped = upper ? info.upper : info.lower;
  return mapped != 0 ? mapped : c;
}

// The host's default case folding of a character (through the exported
// service object's character object); the character itself without a host.
inline uint32_t host_fold(uint32_t c) {
  void *service = Exported_QVHandle;
  if (service == nullptr) return c;
  void *chars = static_cast<void **>(service)[NLSHOST_SERVICE_WORD_CHAR_OBJECT];
  if (chars == nullptr) return c;
  return host::slot<NLSHostFoldCharFn>(chars, NLSHOST_SLOT_FOLD_CHAR)(chars, c,
                                                                      NLSHOST_FOLD_DEFAULT);
}

// Case mappings as one comparison asks for them: the owner's lower or upper
// mapping, or the host's folding. The first 256 code points are asked once
// each and remembered, so that text differing in case throughout costs one
// query per distinct Latin-1 character.
class CaseCache {
 public:
  enum class Map : uint8_t { kLower, kUpper, kFold };
  CaseCache(const NLSSMHandle *h, Map map) : h_(h), map_(map) {}
  uint32_t map(uint32_t c) {
    if (c >= 256) return ask(c);
    if (!known_[c]) {
      value_[c] = ask(c);
      known_[c] = true;
    }
    return value_[c];
  }

 private:
  uint32_t ask(uint32_t c) const {
    return map_ == Map::kFold ? host_fold(c) : case_of(h_, c, map_ == Map::kUpper);
  }
  const NLSSMHandle *h_;
  Map map_;
  bool known_[256] = {};
  uint32_t value_[256];
};

// ---- Wide units --------------------------------------------------------------------

inline uint32_t load_unit(const uint8_t *p, int width, bool big) {
  uint32_t v = 0;
  if (big) {
    for (int k = 0; k < width; ++k) v = v << 8 | p[k];
  } else {
    for (int k = width; k-- > 0;) v = v << 8 | p[k];
  }
  return v;
}

inline void store_unit(uint8_t *p, uint32_t v, int width, bool big) {
  for (int k = 0; k < width; ++k) p[big ? width - 1 - k : k] = static_cast<uint8_t>(v >> (8 * k));
}

inline bool high_surrogate(uint32_t u) {
  return (u & 0xFFFFFC00u) == 0xD800;
}

// ---- Blank tails -----------------------------------------------------------------

// The blank that pads the shorter operand, and where the first unit that is
// not one lies in the rest of the longer operand. Units are `width` bytes in
// the text's byte order; shift sequences of modal text are passed over.
struct Tail {
  int width = 1;
  bool big = false;
  uint32_t blank = 0x20;
  const ModalModel *modal = nullptr;

  // Offset of the first unit from `from` to `end` that is not a blank, with
  // its value; -1 when the rest is all blanks.
  int64_t first_other(const uint8_t *p, int64_t from, int64_t end, uint32_t &value) const {
    if (width == 1 && modal == nullptr) {
      const int64_t k =
          from < end ? kernel::hot().mem_nscan(p + from, end - from, static_cast<uint8_t>(blank))
                     : -1;
      if (k < 0) return -1;
      value = p[from + k];
      return from + k;
    }
    for (int64_t off = from; off < end;) {
      if (modal != nullptr) {
        if (const int s = modal->shift_at(p + off, end - off); s != 0) {
          off += modal->length;
          continue;
        }
      }
      const int64_t w = std::min<int64_t>(width, end - off);
      value = w == width ? load_unit(p + off, width, big) : p[off];
      if (w != width || value != blank) return off;
      off += width;
    }
    return -1;
  }
};

inline Tail byte_tail(uint8_t blank, const ModalModel *modal = nullptr) {
  return {1, false, blank, modal};
}

inline Tail unit_tail(const NLSSMHandle *h, int width, bool big) {
  return {width, big, load_unit(h->blankChar, width, big), nullptr};
}

}  // namespace nlssm::casecmp
