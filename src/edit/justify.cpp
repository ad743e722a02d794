// Justify: move the text of a field (what lies between its leading and
// trailing blanks) to the field's left edge, right edge or centre, in place,
// and blank the places it left. Blanks are whole blank characters of the
// handle; in modal text only single-byte blanks count, so a double-byte run
// and its shift sequences move as part of the text.
#include <limits>
#include <type_traits>

#include "edit/text_model.hpp"

namespace nlssm::edit {
namespace {

struct Justified {
  int64_t textBytes = 0, textChars = 0, startBytes = 0, startChars = 0;
};

struct Field {
  int64_t leading = 0;  // bytes of leading blanks
  int64_t textEnd = 0;  // end of the last character that is not a blank
  int64_t textChars = 0;
};

template <class T>
Field measure(const T &text, const Blank &blank, const uint8_t *p, int64_t n) {
  Field f;
  bool dbl = false, inText = false;
  int64_t chars = 0;
  for (int64_t off = 0; off < n;) {
    const Item it = text.item(p + off, n - off, dbl);
    const bool isBlank =
        it.shift == 0 && !dbl && it.size == blank.width && blank.at(p + off, n - off);
    if (it.shift != 0) dbl = it.shift > 0;
    off += it.size;
    if (isBlank && !inText) {
      f.leading = off;
      continue;
    }
    inText = true;
    if (it.shift == 0) ++chars;
    if (!isBlank) {
      f.textEnd = off;
      f.textChars = chars;
    }
  }
  if (!inText) f.leading = f.textEnd = n;
  return f;
}

// The new start of text of `t` bytes that has `spare` blank bytes around it.
bool new_start(uint32_t align, int64_t leading, int64_t spare, int64_t width, int64_t &start) {
  switch (align & 0xFF) {
    case 'L':
    case 'l':
      start = 0;
      return true;
    case 'R':
    case 'r':
      start = spare;
      return true;
    case 'C':
    case 'c':
      start = spare / width / 2 * width;  // an odd spare blank goes to the right
      return true;
    case 'N':
    case 'n':
      start = leading;
      return true;
    default:
      start = leading;
      return false;
  }
}

template <class T>
int64_t justify(const T &text, const Blank &blank, uint8_t *p, int64_t n, uint32_t align,
                Justified &out) {
  out = {};
  if (n <= 0) return kOk;
  if (p == nullptr) return kNullArgument;
  const Field f = measure(text, blank, p, n);
  if (f.leading >= n) return kOk;  // empty or all blank: nothing moves
  const int64_t t = f.textEnd - f.leading;
  int64_t start = 0;
  const bool valid = new_start(align, f.leading, n - t, blank.width, start);
  out = {t, f.textChars, start, start / blank.width};
  if (!valid) return NLSSM_E_BAD_ALIGNMENT;
  if (start == f.leading) return kOk;
  copy_bytes(p + f.leading, p + start, t);
  if (start < f.leading) {
    pad_blanks(p + start + t, f.leading - start, blank);
  } else {
    pad_blanks(p + f.leading, start - f.leading, blank);
  }
  return kOk;
}

// Single-byte and modal members blank with the first byte of blankChar.
template <class T>
Blank blank_of(const NLSSMHandle *h) {
  if (T::kModal || std::is_same_v<T, SbcsText>) return Blank(h->blankChar[0]);
  return Blank(h);
}

template <class Pick>
int64_t justify_s(const NLSSMHandle *h, uint8_t *p, int64_t n, uint32_t align, int64_t *textBytes,
                  int64_t *textChars, int64_t *startBytes, int64_t *startChars) {
  Justified r;
  const int64_t status = Pick::with(h, [&](const auto &text) {
    return justify(text, blank_of<std::decay_t<decltype(text)>>(h), p, n, align, r);
  });
  store(textBytes, r.textBytes);
  store(textChars, r.textChars);
  store(startBytes, r.startBytes);
  store(startChars, r.startChars);
  return status;
}

// The character form: the field's length counts characters.
template <class Pick>
int64_t justify_c(const NLSSMHandle *h, uint8_t *p, int64_t chars, uint32_t align,
                  int64_t *textBytes, int64_t *textChars, int64_t *startBytes,
                  int64_t *startChars) {
  int64_t n = 0;
  if (chars > 0 && p != nullptr)
    n = Pick::with(h, [&](const auto &text) {
      return bytes_of_chars(text, p, chars, std::numeric_limits<int64_t>::max() / 8);
    });
  return justify_s<Pick>(h, p, n, align, textBytes, textChars, startBytes, startChars);
}

// The descriptor form justifies the whole used text; a cursor that is not
// on the first character is moved there.
template <class Pick>
int64_t justify_plain(const NLSSMHandle *h, NLSString *s, uint32_t align, int64_t *textLength,
                      int64_t *textStart) {
  if (s == nullptr) return kNullArgument;
  if (s->charIndex != 0) {
    s->charIndex = 0;
    s->curOffset = 0;
  }
  return justify_s<Pick>(h, s->buffer, static_cast<int64_t>(s->length), align, textLength, nullptr,
                         textStart, nullptr);
}

}  // namespace
}  // namespace nlssm::edit

#define NLSSM_JUSTIFY(NAME, PICK)                                                     \
  extern "C" int64_t NAME(const NLSSMHandle *h, NLSString *string, uint32_t align,    \
                          int64_t *textLength, int64_t *textStart) {                  \
    return nlssm::edit::justify_plain<PICK>(h, string, align, textLength, textStart); \
  }
#define NLSSM_JUSTIFY_S(NAME, PICK)                                                               \
  extern "C" int64_t NAME(const NLSSMHandle *h, uint8_t *buffer, int64_t length, uint32_t align,  \
                          int64_t *textLength, int64_t *textStart) {                              \
    return nlssm::edit::justify_s<PICK>(h, buffer, length, align, textLength, nullptr, textStart, \
                                        nullptr);                                                 \
  }
#define NLSSM_JUSTIFY_C(NAME, PICK)                                                              \
  extern "C" int64_t NAME(const NLSSMHandle *h, uint8_t *buffer, int64_t length, uint32_t align, \
                          int64_t *textBytes, int64_t *textChars, int64_t *startBytes,           \
                          int64_t *startChars) {                                                 \
    return nlssm::edit::justify_c<PICK>(h, buffer, length, align, textBytes, textChars,          \
                                        startBytes, startChars);                                 \
  }
#define NLSSM_JUSTIFY_MEMBERS(SUFFIX, PICK)         \
  NLSSM_JUSTIFY(NLSStringJustify_##SUFFIX, PICK)    \
  NLSSM_JUSTIFY_S(NLSStringJustifyS_##SUFFIX, PICK) \
  NLSSM_JUSTIFY_C(NLSStringJustifyC_##SUFFIX, PICK)

using nlssm::edit::FixedText;
using nlssm::edit::SbcsText;

NLSSM_JUSTIFY(NLSStringJustify, FixedText<SbcsText>)
NLSSM_JUSTIFY_S(NLSStringJustifyS, FixedText<SbcsText>)
NLSSM_JUSTIFY_C(NLSStringJustifyC, FixedText<SbcsText>)
NLSSM_JUSTIFY(NLSStringJustify_UTF8, FixedText<nlssm::edit::Utf8Text>)
NLSSM_JUSTIFY_S(NLSStringJustifyS_UTF8, FixedText<nlssm::edit::Utf8Text>)
NLSSM_JUSTIFY(NLSStringJustify_UTFE, FixedText<nlssm::edit::UtfeText>)
NLSSM_JUSTIFY_S(NLSStringJustifyS_UTFE, FixedText<nlssm::edit::UtfeText>)
// One character-form member serves UTF-8 and UTF-EBCDIC.
NLSSM_JUSTIFY_C(NLSStringJustifyC_UTF8, nlssm::edit::ClassText<NLSSM_CLASS_UTF8>)
// The two-byte members read the byte order from the encoding number.
NLSSM_JUSTIFY_MEMBERS(WCS2, nlssm::edit::ClassText<NLSSM_CLASS_WCS2>)
NLSSM_JUSTIFY_MEMBERS(WCS4, FixedText<nlssm::edit::Wcs4Text>)
NLSSM_JUSTIFY_MEMBERS(MBCS_modal, FixedText<nlssm::edit::ModalText>)
NLSSM_JUSTIFY_MEMBERS(MBCS_nonmodal, FixedText<nlssm::edit::DbcsText>)
NLSSM_JUSTIFY_MEMBERS(MBCS_nonmodal_EUC_JP, FixedText<nlssm::edit::EucJpText>)
NLSSM_JUSTIFY_MEMBERS(MBCS_nonmodal_EUC_TW, FixedText<nlssm::edit::EucTwText>)
NLSSM_JUSTIFY_MEMBERS(MBCS_nonmodal_GB18030, FixedText<nlssm::edit::Gb18030Text>)
