// What the writing edits (move, fill, concatenate, justify, add quotes) need
// to know about text of each class: where one character ends, where shift
// sequences stand in modal text, and how to write blanks, shift sequences
// and whole characters into a bounded destination. The sizing comes from the
// cursor's character models, so an edit never disagrees with stepping or
// counting about what a character is.
#pragma once

#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "cursor/char_model.hpp"
#include "edit/statuses.hpp"
#include "module/out_value.hpp"

namespace nlssm::edit {

using module::store;

// Copies through the kernel's overlap-safe primitive: block copy for long
// disjoint ranges, pairs of bytes for short ones.
inline void copy_bytes(const uint8_t *from, uint8_t *to, int64_t n) {
  if (n > 0) skMemSCpy(from, to, n);
}

// One item of text: a character, or (modal text) a shift sequence.
struct Item {
  int64_t size;
  int shift;  // +1 shift-out, -1 shift-in, 0 a character
};

// Character sizing per class, on top of the cursor models. `size` never
// exceeds `remaining` (a character cut off by the end of the text is what is
// left of it) and is at least 1.
template <class M>
struct Text {
  static constexpr bool kModal = M::kModal;
  M model;
  explicit Text(const NLSSMHandle *h) : model(h) {}

  Item item(const uint8_t *p, int64_t remaining, bool dbl) const {
    if constexpr (kModal) {
      const int s = model.shift_at(p, remaining);
      if (s != 0) return {model.length, s};
      return {std::min<int64_t>(dbl ? 2 : 1, remaining), 0};
    } else {
      (void)dbl;
      return {std::clamp<int64_t>(model.unit(p, remaining, 0).size, 1, remaining), 0};
    }
  }
  // A character boundary at or before `limit`, near it when the bytes
  // before it show that no character can run across (no byte within reach
  // starts a character long enough); 0 when none is found close by.
  int64_t boundary_before(const uint8_t *p, int64_t limit) const {
    for (int64_t q = limit; q > 0 && limit - q < 64; --q) {
      bool clear = true;
      for (int64_t i = 1; i <= 3 && i <= q && clear; ++i) clear = model.max_size(p[q - i]) <= i;
      if (clear) return q;
    }
    return 0;
  }
  int64_t shift_length() const {
    if constexpr (kModal) return model.length;
    return 0;
  }
};

// The variable-width models also answer the most bytes a character that
// starts with a given byte can take (max_size), which lets a move find a
// character boundary near the end of its room without walking the text.

// UTF-EBCDIC: the skip table sizes a character; a trailing byte or an
// unused lead is a character of its own.
struct UtfeModel : cursor::StatelessModel {
  explicit UtfeModel(const NLSSMHandle * = nullptr) {}
  cursor::Unit unit(const uint8_t *p, int64_t remaining, uint32_t) const {
    const int64_t n = cursor::kSkipUtfe[*p];
    return n == 0 || n > remaining ? cursor::Unit{1, n != 0} : cursor::Unit{n, false};
  }
  int64_t max_size(uint8_t b) const { return std::max<int64_t>(cursor::kSkipUtfe[b], 1); }
};

// UTF-8 as the edits size it: the lead-length table, a rejected byte or a
// sequence cut off by the end of the text counting as one byte.
struct Utf8Model : cursor::Utf8StepModel {
  using Utf8StepModel::Utf8StepModel;
  int64_t max_size(uint8_t b) const { return std::max<int64_t>(cursor::kUtf8LeadLength[b], 1); }
};

// Double-byte code pages: a lead byte opens a two-byte character.
struct DbcsLeadModel : cursor::DbcsModel {
  using DbcsModel::DbcsModel;
  cursor::Unit unit(const uint8_t *p, int64_t remaining, uint32_t) const {
    return {lead(*p) && remaining >= 2 ? 2 : 1, false};
  }
  int64_t max_size(uint8_t b) const { return lead(b) ? 2 : 1; }
};

struct EucJpEditModel : cursor::EucJpModel {
  using EucJpModel::EucJpModel;
  int64_t max_size(uint8_t b) const {
    return b == 0x8F ? 3 : b == 0x8E || cursor::euc_byte(b) ? 2 : 1;
  }
};
struct EucTwEditModel : cursor::EucTwModel {
  using EucTwModel::EucTwModel;
  int64_t max_size(uint8_t b) const { return b == 0x8E ? 4 : cursor::euc_byte(b) ? 2 : 1; }
};
struct Gb18030EditModel : cursor::Gb18030Model {
  using Gb18030Model::Gb18030Model;
  int64_t max_size(uint8_t b) const { return b >= 0x81 && b <= 0xFE ? 4 : 1; }
};

// Whole units of `width` bytes (SBCS, WCS4).
template <int kWidth>
struct UnitModel : cursor::StatelessModel {
  explicit UnitModel(const NLSSMHandle * = nullptr) {}
  cursor::Unit unit(const uint8_t *, int64_t, uint32_t) const { return {kWidth, false}; }
};

using SbcsText = Text<UnitModel<1>>;
using Wcs4Text = Text<UnitModel<4>>;
template <bool kBig>
using Wcs2Text = Text<cursor::Wcs2Model<kBig>>;
using Utf8Text = Text<Utf8Model>;
using UtfeText = Text<UtfeModel>;
using DbcsText = Text<DbcsLeadModel>;
using EucJpText = Text<EucJpEditModel>;
using EucTwText = Text<EucTwEditModel>;
using Gb18030Text = Text<Gb18030EditModel>;
using ModalText = Text<cursor::ModalModel>;

// Calls fn with the text model of the handle's encoding in class kClass
// (class 1: UTF-8 or UTF-EBCDIC; class 5: the double-byte variant by the
// encoding number).
template <int kClass, class Fn>
decltype(auto) with_text(const NLSSMHandle *h, Fn &&fn) {
  const uint32_t number = h->encodingNumber;
  if constexpr (kClass == NLSSM_CLASS_SBCS) {
    return fn(SbcsText(h));
  } else if constexpr (kClass == NLSSM_CLASS_UTF8) {
    return number == NLSSM_ENC_UTF8 ? fn(Utf8Text(h)) : fn(UtfeText(h));
  } else if constexpr (kClass == NLSSM_CLASS_WCS2) {
    return number == NLSSM_ENC_WCS2_BE ? fn(Wcs2Text<true>(h)) : fn(Wcs2Text<false>(h));
  } else if constexpr (kClass == NLSSM_CLASS_WCS4) {
    return fn(Wcs4Text(h));
  } else if constexpr (kClass == NLSSM_CLASS_MBCS_MODAL) {
    return fn(ModalText(h));
  } else {
    if (number == NLSSM_ENC_EUC_JP) return fn(EucJpText(h));
    if (number == 119 || number == 120 || number == 159) return fn(EucTwText(h));
    if (number == NLSSM_ENC_GB18030) return fn(Gb18030Text(h));
    return fn(DbcsText(h));
  }
}

// Text-model choosers for members: one fixed model, or the model of the
// handle's encoding within a class (a member that serves several variants).
template <class T>
struct FixedText {
  template <class Fn>
  static decltype(auto) with(const NLSSMHandle *h, Fn &&fn) {
    return fn(T(h));
  }
};
template <int kClass>
struct ClassText {
  template <class Fn>
  static decltype(auto) with(const NLSSMHandle *h, Fn &&fn) {
    return with_text<kClass>(h, fn);
  }
};

// The blank as the handle stores it: 1, 2 or 4 bytes.
struct Blank {
  uint8_t bytes[4];
  int64_t width;
  explicit Blank(const NLSSMHandle *h) {
    width = cursor::blank_width(h);
    std::memcpy(bytes, h->blankChar, 4);
  }
  Blank(uint8_t byte) : bytes{byte}, width(1) {}
  bool at(const uint8_t *p, int64_t remaining) const {
    return remaining >= width && std::memcmp(p, bytes, static_cast<size_t>(width)) == 0;
  }
};

// Repeats `unit` (`width` bytes) over whole units of `count` bytes; a
// one-byte unit is a block fill. Answers the bytes written.
inline int64_t repeat(uint8_t *p, int64_t count, const uint8_t *unit, int64_t width) {
  if (count <= 0 || width <= 0) return 0;
  if (width == 1) {
    skMemSet(p, unit[0], count);
    return count;
  }
  const int64_t whole = count - count % width;
  if (whole == 0) return 0;
  std::memcpy(p, unit, static_cast<size_t>(width));
  // Doubling copies: each pass copies everything written so far.
  int64_t done = width;
  while (done < whole) {
    const int64_t n = std::min(done, whole - done);
    std::memcpy(p + done, p, static_cast<size_t>(n));
    done += n;
  }
  return whole;
}

inline int64_t pad_blanks(uint8_t *p, int64_t count, const Blank &blank) {
  return repeat(p, count, blank.bytes, blank.width);
}

// Shift state at `offset` of modal text that starts in single-byte width.
template <class T>
bool double_at(const T &text, const uint8_t *p, int64_t offset) {
  bool dbl = false;
  for (int64_t off = 0; off < offset;) {
    const Item it = text.item(p + off, offset - off, dbl);
    if (it.shift != 0) dbl = it.shift > 0;
    off += it.size;
  }
  return dbl;
}

// Bytes of the first `chars` characters (shift sequences between them
// included); the text must hold them. Used where a length counts
// characters.
template <class T>
int64_t bytes_of_chars(const T &text, const uint8_t *p, int64_t chars, int64_t limit) {
  int64_t off = 0;
  bool dbl = false;
  for (int64_t n = 0; n < chars && off < limit;) {
    const Item it = text.item(p + off, limit - off, dbl);
    if (it.shift != 0) {
      dbl = it.shift > 0;
    } else {
      ++n;
    }
    off += it.size;
  }
  if constexpr (T::kModal) {
    // A shift-in closing the last character belongs to it.
    if (dbl && off < limit && text.item(p + off, limit - off, dbl).shift < 0)
      off += text.shift_length();
  }
  return off;
}

}  // namespace nlssm::edit
