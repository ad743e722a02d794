// The walks behind the case-mapping and normalization members: one per kind
// of text (byte tables with double-byte characters, shift-out/shift-in text,
// 16- and 32-bit units, UTF-8, UTF-EBCDIC). Each maps characters from a
// source to a destination (the same buffer for in-place mapping) and stops
// at a byte, character or room limit; the members differ only in the limits
// and in the rule that splits text into characters.
#pragma once

#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>

#include "catalogue/dbcs_records.hpp"
#include "cursor/char_model.hpp"
#include "module/host_access.hpp"

namespace nlssm::casecmp {

enum class Case : uint8_t { kLower, kUpper };

inline constexpr uint32_t kOptUpper = NLSSM_OPT_FOLD_LOWER;   // Normalize: upper case
inline constexpr uint32_t kOptDouble = NLSSM_OPT_FOLD_UPPER;  // map double-byte characters too
inline constexpr uint32_t kOptLimit = 7;
inline constexpr int64_t kNoLimit = INT64_MAX;
inline constexpr int64_t kOk = NLSSM_OK;
inline constexpr int64_t kBadOptions = NLSSM_E_BAD_OPTIONS;
inline constexpr int64_t kNullArgument = NLSSM_E_NULL_ARGUMENT;
inline constexpr int64_t kTooSmall = NLSSM_E_DEST_TOO_SMALL;

// A count of characters: 0 (and, read the same way, a negative count)
// means no limit.
constexpr int64_t char_limit(int64_t count) {
  return count > 0 ? count : kNoLimit;
}

inline const uint8_t *case_table(const NLSSMHandle *h, Case c) {
  return c == Case::kUpper ? h->upperTable : h->lowerTable;
}

// The host's simple case mapping of code points, 0 when it has none or the
// query fails. Answers are kept for the rest of the walk in a small
// direct-mapped cache: text repeats its characters, and the host's query
// costs far more than the lookup.
class HostCase {
 public:
  HostCase(const NLSSMHandle *h, Case c) : h_(h), upper_(c == Case::kUpper) {
    if (h->owner != nullptr)
      query_ = host::slot<NLSHostCharInfoFn>(h->owner, NLSHOST_SLOT_NLS_CHAR_INFO);
    std::fill(std::begin(key_), std::end(key_), kEmpty);
  }
  uint32_t operator()(uint32_t codePoint) {
    const uint32_t at = (codePoint ^ codePoint >> 7) % kSlots;
    if (key_[at] != codePoint) {
      key_[at] = codePoint;
      value_[at] = ask(codePoint);
    }
    return value_[at];
  }

 private:
  static constexpr uint32_t kSlots = 64;
  static constexpr uint32_t kEmpty = 0xFFFFFFFFu;  // never asked: above every code point
  uint32_t ask(uint32_t codePoint) const {
    NLSHostCharInfo info{};
    if (query_ == nullptr || query_(h_->owner, codePoint, &info) != NLSHOST_OK) return 0;
    return upper_ ? info.upper : info.lower;
  }
  const NLSSMHandle *h_;
  bool upper_;
  NLSHostCharInfoFn query_ = nullptr;
  uint32_t key_[kSlots];
  uint32_t value_[kSlots] = {};
};

// What the table walks need of the handle: the single-byte table, and the
// double-byte records when option bit 4 asks for them.
struct ByteTables {
  const uint8_t *single;
  const catalogue::DbcsRecord *records = nullptr;
  uint64_t count = 0;
  Case c;

  ByteTables(const NLSSMHandle *h, Case c, uint32_t options) : single(case_table(h, c)), c(c) {
    if ((options & kOptDouble) != 0) {
      records = static_cast<const catalogue::DbcsRecord *>(h->dbcsTable);
      count = h->dbcsTableCount;
    }
  }
  // Writes the mapped form of the two bytes at `src` to `dst` (lead byte
  // first); a character without a record, or mapped to 0, is copied.
  void map_double(const uint8_t *src, uint8_t *dst) const {
    const auto code = static_cast<uint16_t>(src[0] << 8 | src[1]);
    const catalogue::DbcsRecord *r = catalogue::dbcs_find(records, count, code);
    const uint16_t to = r == nullptr ? 0 : c == Case::kUpper ? r->upper : r->lower;
    const uint16_t out = to != 0 ? to : code;
    dst[0] = static_cast<uint8_t>(out >> 8);
    dst[1] = static_cast<uint8_t>(out);
  }
};

// How a non-modal walk treats one character.
enum class Part : uint8_t { kSingle, kDouble, kOpaque };
struct Piece {
  int64_t size;
  Part part;
};

// Splitters of the non-modal classes. A double-byte character is mapped
// through the double-byte records; an opaque unit is copied unchanged. The
// trail byte is never checked.
struct LeadFlagSplit {  // double-byte code pages: the handle's lead flags
  const uint8_t *flags;
  explicit LeadFlagSplit(const NLSSMHandle *h) : flags(h->charClass) {}
  Piece operator()(const uint8_t *p, int64_t) const {
    return (flags[*p] & cursor::kLeadBit) != 0 ? Piece{2, Part::kDouble} : Piece{1, Part::kSingle};
  }
};
struct EucJpSplit {  // 0xA1-0xFE and SS2 lead pairs; SS3 units are opaque
  explicit EucJpSplit(const NLSSMHandle *) {}
  Piece operator()(const uint8_t *p, int64_t) const {
    if (*p == 0x8F) return {3, Part::kOpaque};
    if (*p == 0x8E || cursor::euc_byte(*p)) return {2, Part::kDouble};
    return {1, Part::kSingle};
  }
};
// EUC-TW: 0x8E and the two bytes after it step as one opaque three-byte unit
// (the plane byte and the character's first byte); the case walk keeps this
// step as it always has.
struct EucTwSplit {
  explicit EucTwSplit(const NLSSMHandle *) {}
  Piece operator()(const uint8_t *p, int64_t) const {
    if (*p == 0x8E) return {3, Part::kOpaque};
    if (cursor::euc_byte(*p)) return {2, Part::kDouble};
    return {1, Part::kSingle};
  }
};
struct Gb18030Split {
  explicit Gb18030Split(const NLSSMHandle *) {}
  Piece operator()(const uint8_t *p, int64_t remaining) const {
    if (*p < 0x81 || *p == 0xFF) return {1, Part::kSingle};
    if (remaining >= 4 && cursor::Gb18030Model::digit(p[1]) && p[2] >= 0x81 && p[2] <= 0xFE &&
        cursor::Gb18030Model::digit(p[3]))
      return {4, Part::kOpaque};
    return {2, Part::kDouble};
  }
};

// Bytes read and written by a walk.
struct Walked {
  int64_t read;
  int64_t written;
};

// Non-modal text: up to `limit` characters of the `n` source bytes, written
// to `dst` while they fit in `room` bytes. A character cut by the end of the
// source (a lead byte in the last position) is copied as far as it goes.
template <class Split>
Walked walk_nonmodal(const ByteTables &t, const Split &split, const uint8_t *src, uint8_t *dst,
                     int64_t n, int64_t room, int64_t limit) {
  int64_t off = 0;
  for (int64_t chars = 0; off < n && chars < limit; ++chars) {
    const Piece piece = split(src + off, n - off);
    if (piece.part == Part::kSingle) {
      if (off >= room) break;
      dst[off] = t.single[src[off]];
      ++off;
      continue;
    }
    const int64_t present = std::min(piece.size, n - off);
    if (off + present > room) break;
    if (piece.part == Part::kDouble && present == 2 && t.records != nullptr) {
      t.map_double(src + off, dst + off);
    } else if (dst != src) {
      std::memcpy(dst + off, src + off, static_cast<size_t>(present));
    }
    off += present;
  }
  return {off, off};
}

// Shift-out/shift-in text. Shift sequences are recognised only at a byte
// below 0x40 with a whole sequence left; they change the mode, are not
// counted, and are copied (kKeepShifts) or dropped. Double-byte characters
// take two bytes; a text ending inside one copies what there is.
template <bool kKeepShifts>
Walked walk_modal(const ByteTables &t, const cursor::ModalModel &m, const uint8_t *src,
                  uint8_t *dst, int64_t n, int64_t room, int64_t limit, bool doubleByte) {
  int64_t r = 0, w = 0;
  for (int64_t chars = 0; r < n && chars < limit; ++chars) {
    for (int s; r < n && (s = m.shift_at(src + r, n - r)) != 0;) {
      if constexpr (kKeepShifts) {
        if (w + m.length > room) return {r, w};
        std::memmove(dst + w, src + r, static_cast<size_t>(m.length));
        w += m.length;
      }
      r += m.length;
      doubleByte = s > 0;
    }
    if (r >= n) break;
    if (!doubleByte) {
      if (w >= room) break;
      dst[w++] = t.single[src[r++]];
      continue;
    }
    const int64_t present = std::min<int64_t>(2, n - r);
    if (w + present > room) break;
    if (present == 2 && t.records != nullptr) {
      t.map_double(src + r, dst + w);
    } else if (dst + w != src + r) {
      std::memmove(dst + w, src + r, static_cast<size_t>(present));
    }
    r += present;
    w += present;
  }
  return {r, w};
}

// 16-bit units in place, up to `limit` characters of the `n` bytes. A high
// surrogate followed by a low one is a pair: one character, never mapped.
// Every other unit, a lone surrogate included, goes to the host.
template <bool kBig>
void walk_wcs2(const NLSSMHandle *h, Case c, uint8_t *p, int64_t n, int64_t limit) {
  using M = cursor::Wcs2Model<kBig>;
  HostCase host_case(h, c);
  int64_t off = 0;
  for (int64_t chars = 0; n - off >= 2 && chars < limit; ++chars) {
    const uint16_t u = M::unit_at(p + off);
    if (M::high(u) && n - off >= 4 && M::low(M::unit_at(p + off + 2))) {
      off += 4;
      continue;
    }
    const uint32_t to = host_case(u);
    if (to != 0) {
      p[off + (kBig ? 0 : 1)] = static_cast<uint8_t>(to >> 8);
      p[off + (kBig ? 1 : 0)] = static_cast<uint8_t>(to);
    }
    off += 2;
  }
}

// `units` 32-bit units in place, each one a character.
template <bool kBig>
void walk_wcs4(const NLSSMHandle *h, Case c, uint8_t *p, int64_t units) {
  HostCase host_case(h, c);
  for (int64_t i = 0; i < units; ++i) {
    uint8_t *q = p + 4 * i;
    const uint32_t u =
        kBig ? uint32_t{q[0]} << 24 | uint32_t{q[1]} << 16 | uint32_t{q[2]} << 8 | q[3]
             : uint32_t{q[3]} << 24 | uint32_t{q[2]} << 16 | uint32_t{q[1]} << 8 | q[0];
    const uint32_t to = host_case(u);
    if (to == 0) continue;
    for (int k = 0; k < 4; ++k) q[kBig ? 3 - k : k] = static_cast<uint8_t>(to >> (8 * k));
  }
}

}  // namespace nlssm::casecmp
