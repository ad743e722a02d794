// The character model of every encoding class: how many bytes the character
// at an offset takes, whether it is a broken multi-byte sequence, and, for
// modal text, how shift sequences move the shift state. Stepping,
// positioning, counting and the families built on them all measure text
// through these types, so every class has exactly one definition of what a
// character is.
#pragma once

#include <nlssm/nlssm.h>

#include <array>
#include <cstdint>
#include <cstring>

#include "unicode/tables.hpp"

namespace nlssm::cursor {

inline constexpr int64_t kNone = NLSSM_POS_NONE;
inline constexpr int64_t kNoPrevious = NLSSM_POS_NO_PREVIOUS;
inline constexpr int64_t kOutside = NLSSM_POS_OUTSIDE;
inline constexpr int64_t kCurrent = NLSSM_POS_CURRENT;
inline constexpr int64_t kLast = NLSSM_POS_LAST;
inline constexpr int64_t kNoSize = NLSSM_SIZE_NONE;

inline constexpr int64_t kBadCharacter = NLSSM_E_BAD_CHARACTER;
inline constexpr int64_t kNullArgument = NLSSM_E_NULL_ARGUMENT;
inline constexpr int64_t kDestTooSmall = NLSSM_E_DEST_TOO_SMALL;

// Flag bit of the counting members: broken sequences are not counted.
inline constexpr int64_t kSkipBroken = 4;

inline constexpr uint8_t kLeadBit = 0x04;
inline constexpr uint8_t kTrailBit = 0x08;

// Character kinds of the multi-byte classes, by byte size.
constexpr uint32_t kind_of(int64_t size) {
  return size == 2   ? NLSSM_KIND_DOUBLE
         : size == 3 ? NLSSM_KIND_THREE
         : size == 4 ? NLSSM_KIND_FOUR
                     : NLSSM_KIND_SINGLE;
}

namespace detail {
template <typename Fn>
constexpr std::array<uint8_t, 256> by_byte(Fn rule) {
  std::array<uint8_t, 256> table{};
  for (unsigned b = 0; b < 256; ++b) table[b] = static_cast<uint8_t>(rule(b));
  return table;
}
}  // namespace detail

// Lead-length table of the stepping members: 0 for a byte that cannot start
// a well-formed character (0x00, 0x80-0xC1, 0xF5-0xFF).
inline constexpr std::array<uint8_t, 256> kUtf8LeadLength = detail::by_byte([](unsigned b) {
  return b == 0 ? 0 : b < 0x80 ? 1 : b < 0xC2 ? 0 : b < 0xE0 ? 2 : b < 0xF0 ? 3 : b < 0xF5 ? 4 : 0;
});

// Sequence length announced by the form of a byte, in the wide (up to six
// byte) scheme; continuation bytes answer 1. This is the exported u8Length.
inline constexpr std::array<uint8_t, 256> kUtf8FormLength = detail::by_byte([](unsigned b) {
  return b < 0xC0 ? 1 : b < 0xE0 ? 2 : b < 0xF0 ? 3 : b < 0xF8 ? 4 : b < 0xFC ? 5 : 6;
});

constexpr bool utf8_continuation(uint8_t b) {
  return (b & 0xC0) == 0x80;
}

// UTF-EBCDIC: bytes of the character a byte starts, 0 for a trailing byte
// or an unused lead (the skip table).
inline constexpr std::array<uint8_t, 256> kSkipUtfe = detail::by_byte([](unsigned b) {
  const int32_t trailing = unicode::bytesFromI8S[unicode::utfe_i8s[b]];
  return trailing < 0 ? 0 : trailing + 1;
});

constexpr bool utfe_trailing(uint8_t b) {
  const uint8_t i8 = unicode::utfe_i8s[b];
  return i8 >= 0xA0 && i8 < 0xC0;
}

// One character as the counting members see it: its bytes, and whether it
// is a broken multi-byte sequence (a lead byte without its trail bytes),
// which they report and either count as one byte or skip.
struct Unit {
  int64_t size;
  bool broken;
};

// Shift state words of modal text, as the modal members keep them in the
// kind fields of a descriptor.
inline constexpr uint32_t kModalSingle = 1;  // single-byte character seen
inline constexpr uint32_t kModalShiftOut = 2;
inline constexpr uint32_t kModalDouble = 4;  // double-byte character seen
inline constexpr uint32_t kModalShiftIn = 6;

constexpr bool modal_double(uint32_t state) {
  return state == kModalShiftOut || state == kModalDouble;
}

// ---- Models --------------------------------------------------------------
// Every model answers:
//   step(p, remaining, state): bytes of the character at p as the stepping
//     members size it (may exceed `remaining` for a truncated character);
//   unit(p, remaining, state): the counting members' view;
//   skip_shifts(base, offset, length, state): moves over shift sequences
//     (modal text only) and updates the state;
//   kind(size, state): the kind word stored for a character.

struct StatelessModel {
  static constexpr bool kModal = false;
  void skip_shifts(const uint8_t *, int64_t &, int64_t, uint32_t &) const {}
  uint32_t kind(int64_t size, uint32_t) const { return kind_of(size); }
};

struct SbcsModel : StatelessModel {
  explicit SbcsModel(const NLSSMHandle *) {}
  int64_t step(const uint8_t *, int64_t, uint32_t) const { return 1; }
  Unit unit(const uint8_t *, int64_t, uint32_t) const { return {1, false}; }
};

// Fixed-width units (WCS4): the handle's unit width, 4 when unset.
struct FixedModel : StatelessModel {
  int64_t width;
  explicit FixedModel(const NLSSMHandle *h)
      : width(h != nullptr && h->unitWidth ? h->unitWidth : 4) {}
  int64_t step(const uint8_t *, int64_t, uint32_t) const { return width; }
  Unit unit(const uint8_t *, int64_t, uint32_t) const { return {width, false}; }
};

// 16-bit units; a high surrogate followed by a low surrogate is one
// character. Encoding 24 is big-endian, every other one little-endian.
template <bool kBig>
struct Wcs2Model : StatelessModel {
  explicit Wcs2Model(const NLSSMHandle * = nullptr) {}
  static uint16_t unit_at(const uint8_t *p) {
    return kBig ? static_cast<uint16_t>(p[0] << 8 | p[1]) : static_cast<uint16_t>(p[1] << 8 | p[0]);
  }
  static bool high(uint16_t u) { return (u & 0xFC00) == 0xD800; }
  static bool low(uint16_t u) { return (u & 0xFC00) == 0xDC00; }
  int64_t step(const uint8_t *p, int64_t remaining, uint32_t) const {
    return remaining >= 4 && high(unit_at(p)) && low(unit_at(p + 2)) ? 4 : 2;
  }
  Unit unit(const uint8_t *p, int64_t remaining, uint32_t s) const {
    return {step(p, remaining, s), false};
  }
};

// Bytes of the handle's blank: 2 or 4 where it says so, else 1.
inline int64_t blank_width(const NLSSMHandle *h) {
  return h->blankWidth == 2 || h->blankWidth == 4 ? static_cast<int64_t>(h->blankWidth) : 1;
}

// Bytes of the UTF-EBCDIC character a byte starts by the skip table; a
// trailing byte or an unused lead stands alone.
constexpr int64_t utfe_char_length(uint8_t b) {
  const int64_t n = kSkipUtfe[b];
  return n == 0 ? 1 : n;
}

// Stepping view of UTF-EBCDIC by its skip table.
struct UtfeStepModel : StatelessModel {
  explicit UtfeStepModel(const NLSSMHandle * = nullptr) {}
  int64_t step(const uint8_t *p, int64_t, uint32_t) const { return utfe_char_length(*p); }
};

// Stepping view of UTF-8 (and of UTF-EBCDIC, which class 1 steps alike):
// the lead-length table; a byte it rejects is a one-byte character.
struct Utf8StepModel : StatelessModel {
  explicit Utf8StepModel(const NLSSMHandle * = nullptr) {}
  int64_t step(const uint8_t *p, int64_t, uint32_t) const {
    const int64_t n = kUtf8LeadLength[*p];
    return n == 0 ? 1 : n;
  }
  Unit unit(const uint8_t *p, int64_t remaining, uint32_t s) const {
    const int64_t n = step(p, remaining, s);
    return n > remaining ? Unit{1, true} : Unit{n, false};
  }
};

// Double-byte code pages: the handle's lead (0x04) and trail (0x08) flags.
// Stepping decides by the lead flag alone; counting also wants the trail.
struct DbcsModel : StatelessModel {
  const uint8_t *flags;
  explicit DbcsModel(const NLSSMHandle *h) : flags(h->charClass) {}
  bool lead(uint8_t b) const { return (flags[b] & kLeadBit) != 0; }
  bool trail(uint8_t b) const { return (flags[b] & kTrailBit) != 0; }
  int64_t step(const uint8_t *p, int64_t, uint32_t) const { return lead(*p) ? 2 : 1; }
  Unit unit(const uint8_t *p, int64_t remaining, uint32_t) const {
    if (!lead(*p)) return {1, false};
    return remaining >= 2 && trail(p[1]) ? Unit{2, false} : Unit{1, true};
  }
};

constexpr bool euc_byte(uint8_t b) {
  return b >= 0xA1 && b <= 0xFE;
}

// EUC-JP: two bytes in 0xA1-0xFE; SS2 0x8E + one; SS3 0x8F + two.
struct EucJpModel : StatelessModel {
  explicit EucJpModel(const NLSSMHandle * = nullptr) {}
  Unit unit(const uint8_t *p, int64_t remaining, uint32_t) const {
    const uint8_t b = *p;
    if (b == 0x8F)
      return remaining >= 3 && euc_byte(p[1]) && euc_byte(p[2]) ? Unit{3, false} : Unit{1, true};
    if (b == 0x8E || euc_byte(b))
      return remaining >= 2 && euc_byte(p[1]) ? Unit{2, false} : Unit{1, true};
    return {1, false};
  }
  int64_t step(const uint8_t *p, int64_t remaining, uint32_t s) const {
    return unit(p, remaining, s).size;
  }
};

// EUC-TW: two bytes in 0xA1-0xFE; 0x8E + plane 0xA2-0xAD + two.
struct EucTwModel : StatelessModel {
  explicit EucTwModel(const NLSSMHandle * = nullptr) {}
  Unit unit(const uint8_t *p, int64_t remaining, uint32_t) const {
    const uint8_t b = *p;
    if (b == 0x8E)
      return remaining >= 4 && p[1] >= 0xA2 && p[1] <= 0xAD && euc_byte(p[2]) && euc_byte(p[3])
                 ? Unit{4, false}
                 : Unit{1, true};
    if (euc_byte(b)) return remaining >= 2 && euc_byte(p[1]) ? Unit{2, false} : Unit{1, true};
    return {1, false};
  }
  int64_t step(const uint8_t *p, int64_t remaining, uint32_t s) const {
    return unit(p, remaining, s).size;
  }
};

// GB18030: 0x81-0xFE leads a two-byte (second 0x40-0x7E, 0x80-0xFE) or a
// four-byte (digit, 0x81-0xFE, digit) character.
struct Gb18030Model : StatelessModel {
  explicit Gb18030Model(const NLSSMHandle * = nullptr) {}
  static bool digit(uint8_t b) { return b >= 0x30 && b <= 0x39; }
  Unit unit(const uint8_t *p, int64_t remaining, uint32_t) const {
    const uint8_t b = *p;
    if (b < 0x81 || b == 0xFF) return {1, false};
    if (remaining >= 2) {
      const uint8_t c = p[1];
      if ((c >= 0x40 && c <= 0x7E) || (c >= 0x80 && c <= 0xFE)) return {2, false};
      if (digit(c) && remaining >= 4 && p[2] >= 0x81 && p[2] <= 0xFE && digit(p[3]))
        return {4, false};
    }
    return {1, true};
  }
  int64_t step(const uint8_t *p, int64_t remaining, uint32_t s) const {
    return unit(p, remaining, s).size;
  }
};

// Shift-out/shift-in text. The sequences and their length come from the
// handle's range record; a handle without one uses 0x0E and 0x0F.
struct ModalModel {
  static constexpr bool kModal = true;
  uint8_t shift_out[4] = {0x0E};
  uint8_t shift_in[4] = {0x0F};
  int64_t length = 1;

  explicit ModalModel(const NLSSMHandle *h) {
    if (h != nullptr && h->charRanges != nullptr && h->shiftLength >= 1 && h->shiftLength <= 4) {
      length = h->shiftLength;
      std::memcpy(shift_out, h->charRanges + 26, 4);
      std::memcpy(shift_in, h->charRanges + 30, 4);
    }
  }
  // +1 for a shift-out sequence at p, -1 for shift-in, 0 for a character.
  // Only a byte below 0x40 can start a sequence.
  int shift_at(const uint8_t *p, int64_t remaining) const {
    if (*p >= 0x40 || remaining < length) return 0;
    if (std::memcmp(p, shift_out, static_cast<size_t>(length)) == 0) return 1;
    if (std::memcmp(p, shift_in, static_cast<size_t>(length)) == 0) return -1;
    return 0;
  }
  void skip_shifts(const uint8_t *base, int64_t &offset, int64_t end, uint32_t &state) const {
    while (offset < end) {
      const int s = shift_at(base + offset, end - offset);
      if (s == 0) return;
      state = s > 0 ? kModalShiftOut : kModalShiftIn;
      offset += length;
    }
  }
  int64_t step(const uint8_t *, int64_t, uint32_t state) const {
    return modal_double(state) ? 2 : 1;
  }
  Unit unit(const uint8_t *, int64_t remaining, uint32_t state) const {
    if (!modal_double(state)) return {1, false};
    return remaining >= 2 ? Unit{2, false} : Unit{1, true};
  }
  uint32_t kind(int64_t, uint32_t state) const {
    return modal_double(state) ? kModalDouble : kModalSingle;
  }
};

// Calls fn with the character model of a non-modal multi-byte handle: the
// fixed length rules of EUC-JP, EUC-TW (119, 120, 159) and GB18030 by
// encoding number, the handle's lead and trail flags for every other set.
template <class Fn>
decltype(auto) with_nonmodal_model(const NLSSMHandle *h, Fn &&fn) {
  switch (h->encodingNumber) {
    case NLSSM_ENC_EUC_JP:
      return fn(EucJpModel(h));
    case 119:
    case 120:
    case 159:
      return fn(EucTwModel(h));
    case NLSSM_ENC_GB18030:
      return fn(Gb18030Model(h));
    default:
      return fn(DbcsModel(h));
  }
}

}  // namespace nlssm::cursor
