// Delete: every character of a target range that occurs in a character
// list is taken out; the characters kept close up and the freed bytes at
// the end of the range are filled with blanks, so the range keeps its
// length. Characters are compared whole.
#include <nlssm/nlssm.h>

#include <array>
#include <cstring>

#include "edit/character_walk.hpp"
#include "edit/delete_byte.hpp"
#include "edit/modal_text.hpp"
#include "module/literal.hpp"
#include "module/work_buffer.hpp"

namespace nlssm::edit {
namespace {

using module::LiteralOutcome;

struct Kept {
  int64_t chars;
  int64_t bytes;
};

template <class M>
bool listed(const M &m, const uint8_t *list, int64_t listBytes, const uint8_t *c, int64_t size) {
  for (int64_t off = 0; off < listBytes;) {
    const int64_t n = whole_char(m, list + off, listBytes - off);
    if (n == size && std::memcmp(list + off, c, static_cast<size_t>(size)) == 0) return true;
    off += n;
  }
  return false;
}

// Keeps the characters `keep` accepts, closing them up from the start.
template <class M, class Keep>
Kept close_up(const NLSSMHandle *h, const M &m, uint8_t *p, int64_t bytes, Keep keep) {
  int64_t w = 0, chars = 0;
  for (int64_t r = 0; r < bytes;) {
    const int64_t size = whole_char(m, p + r, bytes - r);
    if (keep(p + r, size)) {
      if (w != r) std::memmove(p + w, p + r, static_cast<size_t>(size));
      w += size;
      ++chars;
    }
    r += size;
  }
  fill_blanks(h, p + w, bytes - w);
  return {chars, w};
}

// Single bytes: a one-byte list takes the vector path; a longer one becomes
// a table of 256 flags and closes up without branches.
Kept delete_bytes(const NLSSMHandle *h, uint8_t *p, int64_t bytes, const uint8_t *list,
                  int64_t listBytes) {
  int64_t w = 0;
  if (listBytes == 1) {
    w = delete_byte_ops.get().drop(p, bytes, list[0]);
  } else {
    std::array<bool, 256> in{};
    for (int64_t i = 0; i < listBytes; ++i) in[list[i]] = true;
    for (int64_t r = 0; r < bytes; ++r) {
      const uint8_t b = p[r];
      p[w] = b;
      w += in[b] ? 0 : 1;
    }
  }
  fill_blanks(h, p + w, bytes - w);
  return {w, w};
}

template <class M>
Kept delete_chars(const NLSSMHandle *h, const M &m, uint8_t *p, int64_t bytes, const uint8_t *list,
                  int64_t listBytes) {
  return close_up(h, m, p, bytes, [&](const uint8_t *c, int64_t size) {
    return !listed(m, list, listBytes, c, size);
  });
}

// ---- Modal text -----------------------------------------------------------

struct Entry {
  int64_t offset;
  int64_t width;
};

struct ModalRange {
  uint8_t *text;
  int64_t from, end, length;  // the range, and the end of the whole text
  bool startDbl;
};

struct ModalList {
  const uint8_t *text;
  int64_t from, end;
  bool startDbl;
};

// The freed bytes of a range whose written text ends in double-byte width.
// Blanks go in front of the last double-byte run the writer opened (where
// the width is single); without one, pairs of blank bytes (the double-byte
// blank) fill an even gap, and an odd one is closed, blanked and reopened.
void fill_double_gap(const NLSSMHandle *h, const ModalModel &m, uint8_t *p, int64_t w, int64_t end,
                     int64_t lastShiftOut) {
  const int64_t gap = end - w;
  if (lastShiftOut >= 0) {
    std::memmove(p + lastShiftOut + gap, p + lastShiftOut, static_cast<size_t>(w - lastShiftOut));
    fill_blanks(h, p + lastShiftOut, gap);
  } else if (gap % 2 != 0 && gap >= 2 * m.length + 1) {
    put_shift(m, p + w, false);
    fill_blanks(h, p + w + m.length, gap - 2 * m.length);
    put_shift(m, p + end - m.length, true);
  } else {
    std::memset(p + w, h->blankChar[0], static_cast<size_t>(gap));
  }
}

// Shift sequences of the range only set the width; a kept character gets a
// shift-out or shift-in in front of it when its width differs from the last
// one written. The written text ends in the width the range ended in when
// more text follows it, else in single-byte width (when there is room for
// the shift-in). Each shift written stands in for one the range dropped, so
// the writer never passes the reader.
int64_t delete_modal(const NLSSMHandle *h, const ModalRange &t, const ModalList &list,
                     int64_t *keptBytes) {
  const ModalModel m(h);
  const int64_t listBytes = list.end - list.from;
  module::WorkBuffer<256 * sizeof(Entry)> work;
  if (!work.reserve(h, static_cast<uint64_t>(listBytes) * sizeof(Entry)))
    return NLSSM_COUNT_NO_MEMORY;
  auto *entries = reinterpret_cast<Entry *>(work.data());
  int64_t count = 0;
  ModalWalk lw(m, list.text, list.from, list.end, list.startDbl);
  ModalItem item;
  while (lw.next(item))
    if (item.shift == 0) entries[count++] = {item.offset, item.size};
  auto listed_modal = [&](const uint8_t *c, int64_t size) {
    for (int64_t i = 0; i < count; ++i)
      if (entries[i].width == size &&
          std::memcmp(list.text + entries[i].offset, c, static_cast<size_t>(size)) == 0)
        return true;
    return false;
  };

  uint8_t *p = t.text;
  int64_t w = t.from, kept = 0, lastShiftOut = -1;
  bool wDbl = t.startDbl;
  ModalWalk walk(m, p, t.from, t.end, t.startDbl);
  while (walk.next(item)) {
    if (item.shift != 0 || listed_modal(p + item.offset, item.size)) continue;
    if (item.dbl != wDbl) {
      if (item.dbl) lastShiftOut = w;
      w += put_shift(m, p + w, item.dbl);
      wDbl = item.dbl;
    }
    std::memmove(p + w, p + item.offset, static_cast<size_t>(item.size));
    w += item.size;
    ++kept;
  }
  const bool endDbl = t.end < t.length ? walk.dbl() : false;
  if (wDbl != endDbl && w + m.length <= t.end) {
    if (endDbl) lastShiftOut = w;
    w += put_shift(m, p + w, endDbl);
    wDbl = endDbl;
  }
  store(keptBytes, w - t.from);
  if (wDbl)
    fill_double_gap(h, m, p, w, t.end, lastShiftOut);
  else
    fill_blanks(h, p + w, t.end - w);
  return kept;
}

// ---- Descriptor forms -------------------------------------------------------

// The target's first n characters and the list's first m (0 or more than
// remain: all). An unset target keeps nothing; an unset list deletes
// nothing and the count is the range's.
template <class M, class Run>
int64_t delete_plain(const M &model, NLSString *target, int64_t n, const NLSString *list, int64_t m,
                     Run run) {
  const Remaining t = remaining_of(target);
  if (t.text == nullptr) return 0;
  int64_t chars = 0;
  const int64_t bytes = span_of(model, t.text, t.bytes, n, &chars);
  const Remaining l = remaining_of(list);
  if (l.text == nullptr || l.bytes == 0) return chars;
  return run(t.text, bytes, l.text, span_of(model, l.text, l.bytes, m, nullptr)).chars;
}

template <class M>
int64_t delete_plain_with(const NLSSMHandle *h, const M &model, NLSString *target, int64_t n,
                          const NLSString *list, int64_t m) {
  return delete_plain(model, target, n, list, m,
                      [&](uint8_t *p, int64_t bytes, const uint8_t *l, int64_t lb) {
                        return delete_chars(h, model, p, bytes, l, lb);
                      });
}

template <class M>
int64_t delete_s_with(const NLSSMHandle *h, const M &model, uint8_t *p, int64_t bytes,
                      const uint8_t *list, int64_t listBytes) {
  if (p == nullptr || bytes <= 0) return 0;
  if (list == nullptr || listBytes <= 0) return bytes;
  return delete_chars(h, model, p, bytes, list, listBytes).bytes;
}

template <bool kBig>
int64_t delete_wcs2(const NLSSMHandle *h, NLSString *target, int64_t n, const NLSString *list,
                    int64_t m) {
  return delete_plain_with(h, cursor::Wcs2Model<kBig>(h), target, n, list, m);
}

template <bool kBig>
int64_t delete_wcs2_s(const NLSSMHandle *h, uint8_t *p, int64_t bytes, const uint8_t *list,
                      int64_t listBytes) {
  return delete_s_with(h, cursor::Wcs2Model<kBig>(h), p, bytes, list, listBytes);
}

// The literal in the handle's encoding; a literal that cannot be converted
// becomes an empty list, which deletes nothing. False when the work buffer
// could not be had.
template <class Literal>
bool literal_list(const NLSSMHandle *h, Literal &lit, const uint8_t *literal, int64_t bytes,
                  int64_t &length) {
  const LiteralOutcome outcome =
      literal == nullptr
          ? LiteralOutcome::kFailed
          : lit.convert(h, literal, static_cast<uint64_t>(std::max<int64_t>(0, bytes)));
  length = outcome == LiteralOutcome::kConverted || outcome == LiteralOutcome::kAsGiven
               ? static_cast<int64_t>(lit.length())
               : 0;
  return outcome != LiteralOutcome::kNoMemory;
}

using DeleteFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const NLSString *, int64_t,
                             int64_t);
using DeleteSFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t);

}  // namespace
}  // namespace nlssm::edit

using namespace nlssm::edit;
using nlssm::module::ConvertedLiteral;

extern "C" {

int64_t NLSStringDelete_SBCS(const NLSSMHandle *h, NLSString *target, int64_t n,
                             const NLSString *list, int64_t m, int64_t) {
  return delete_plain(nlssm::cursor::SbcsModel(h), target, n, list, m,
                      [&](uint8_t *p, int64_t bytes, const uint8_t *l, int64_t lb) {
                        return delete_bytes(h, p, bytes, l, lb);
                      });
}
int64_t NLSStringDeleteS_SBCS(const NLSSMHandle *h, uint8_t *p, int64_t bytes, const uint8_t *list,
                              int64_t listBytes) {
  if (p == nullptr || bytes <= 0) return 0;
  if (list == nullptr || listBytes <= 0) return bytes;
  return delete_bytes(h, p, bytes, list, listBytes).bytes;
}

int64_t NLSStringDelete_WCS2L(const NLSSMHandle *h, NLSString *target, int64_t n,
                              const NLSString *list, int64_t m, int64_t) {
  return delete_wcs2<false>(h, target, n, list, m);
}
int64_t NLSStringDelete_WCS2B(const NLSSMHandle *h, NLSString *target, int64_t n,
                              const NLSString *list, int64_t m, int64_t) {
  return delete_wcs2<true>(h, target, n, list, m);
}
int64_t NLSStringDeleteS_WCS2L(const NLSSMHandle *h, uint8_t *p, int64_t bytes, const uint8_t *list,
                               int64_t listBytes) {
  return delete_wcs2_s<false>(h, p, bytes, list, listBytes);
}
int64_t NLSStringDeleteS_WCS2B(const NLSSMHandle *h, uint8_t *p, int64_t bytes, const uint8_t *list,
                               int64_t listBytes) {
  return delete_wcs2_s<true>(h, p, bytes, list, listBytes);
}

int64_t NLSStringDelete_WCS4(const NLSSMHandle *h, NLSString *target, int64_t n,
                             const NLSString *list, int64_t m, int64_t) {
  return delete_plain_with(h, nlssm::cursor::FixedModel(h), target, n, list, m);
}
int64_t NLSStringDeleteS_WCS4(const NLSSMHandle *h, uint8_t *p, int64_t bytes, const uint8_t *list,
                              int64_t listBytes) {
  return delete_s_with(h, nlssm::cursor::FixedModel(h), p, bytes, list, listBytes);
}

int64_t NLSStringDelete_MBCS(const NLSSMHandle *h, NLSString *target, int64_t n,
                             const NLSString *list, int64_t m, int64_t) {
  return with_multibyte_model(
      h, [&](const auto &model) { return delete_plain_with(h, model, target, n, list, m); });
}
int64_t NLSStringDeleteS_MBCS(const NLSSMHandle *h, uint8_t *p, int64_t bytes, const uint8_t *list,
                              int64_t listBytes) {
  return with_multibyte_model(
      h, [&](const auto &model) { return delete_s_with(h, model, p, bytes, list, listBytes); });
}

int64_t NLSStringDelete_MBCS_modal(const NLSSMHandle *h, NLSString *target, int64_t n,
                                   const NLSString *list, int64_t m, int64_t) {
  const Remaining t = remaining_of(target);
  if (t.bytes == 0) return 0;
  const ModalModel model(h);
  ModalRange range{target->buffer, target->curOffset, 0, static_cast<int64_t>(target->length),
                   modal_double_at(model, target->buffer, target->curOffset)};
  bool dbl = range.startDbl;
  int64_t chars = 0;
  range.end = modal_span(model, target->buffer, range.from, range.length, n, dbl, &chars);
  const Remaining l = remaining_of(list);
  if (l.text == nullptr || l.bytes == 0) return chars;
  ModalList listRange{list->buffer, list->curOffset, 0,
                      modal_double_at(model, list->buffer, list->curOffset)};
  dbl = listRange.startDbl;
  listRange.end = modal_span(model, list->buffer, listRange.from,
                             static_cast<int64_t>(list->length), m, dbl, nullptr);
  return delete_modal(h, range, listRange, nullptr);
}
int64_t NLSStringDeleteS_MBCS_modal(const NLSSMHandle *h, uint8_t *p, int64_t bytes,
                                    const uint8_t *list, int64_t listBytes) {
  if (p == nullptr || bytes <= 0) return 0;
  if (list == nullptr || listBytes <= 0) return bytes;
  int64_t kept = 0;
  const int64_t chars =
      delete_modal(h, {p, 0, bytes, bytes, false}, {list, 0, listBytes, false}, &kept);
  return chars == NLSSM_COUNT_NO_MEMORY ? chars : kept;
}

// The literal, converted into the handle's encoding, becomes the list of
// the handle's own delete.
int64_t NLSStringDeleteLit(const NLSSMHandle *h, NLSString *target, int64_t n,
                           const uint8_t *literal, int64_t literalBytes, int64_t flags) {
  ConvertedLiteral<256> lit;
  int64_t length = 0;
  if (!literal_list(h, lit, literal, literalBytes, length)) return NLSSM_COUNT_NO_MEMORY;
  NLSString list =
      descriptor_over(h, lit.text(), static_cast<uint64_t>(length), static_cast<uint64_t>(length));
  if (h->NLSStringDelete == nullptr) return 0;
  return reinterpret_cast<DeleteFn>(h->NLSStringDelete)(h, target, n, &list, 0, flags);
}

int64_t NLSStringDeleteLitS(const NLSSMHandle *h, uint8_t *target, int64_t bytes,
                            const uint8_t *literal, int64_t literalBytes, int64_t) {
  ConvertedLiteral<256> lit;
  int64_t length = 0;
  if (!literal_list(h, lit, literal, literalBytes, length)) return NLSSM_COUNT_NO_MEMORY;
  if (h->NLSStringDeleteS == nullptr) return 0;
  return reinterpret_cast<DeleteSFn>(h->NLSStringDeleteS)(h, target, bytes, lit.text(), length);
}

}  // extern "C"
