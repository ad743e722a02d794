// Fill: repeat one character over a destination, in whole characters. The
// descriptor forms write from the destination's current character and grow
// its length; the raw forms fill the buffer from its start. The literal
// forms convert their character first and call the handle's own fill.
#include "edit/literal_char.hpp"
#include "edit/text_model.hpp"

namespace nlssm::edit {
namespace {

// The fill character's bytes and width; modal double-byte characters are
// written inside a shift-out/shift-in pair.
struct FillChar {
  const uint8_t *bytes = nullptr;
  int64_t width = 0;
  bool wrapped = false;
};

// The first character of modal text at `p`: its shift sequences are
// followed, not repeated.
FillChar modal_char(const ModalText &text, const uint8_t *p, int64_t n, bool dbl) {
  int64_t off = 0;
  while (off < n) {
    const Item it = text.item(p + off, n - off, dbl);
    if (it.shift == 0) return {p + off, it.size, dbl && it.size == 2};
    dbl = it.shift > 0;
    off += it.size;
  }
  return {};
}

// How many characters of `width` bytes a request of `length` bytes gets in
// `room` bytes, with `overhead` bytes of shift sequences around them: a
// length too short for one character means all the room. Short of room, or
// room left over that no whole character fills, is 0x803fe807.
struct Plan {
  int64_t chars;
  int64_t status;
};

Plan plan(int64_t length, int64_t room, int64_t width, int64_t overhead) {
  const int64_t roomChars = room > overhead ? (room - overhead) / width : 0;
  if (length >= overhead + width) {
    const int64_t asked = (length - overhead) / width;
    const int64_t chars = std::min(asked, roomChars);
    return {chars, asked > roomChars || chars == 0 ? kTooSmall : kOk};
  }
  const bool leftover = room <= overhead || (room - overhead) % width != 0;
  return {roomChars, leftover || roomChars == 0 ? kTooSmall : kOk};
}

// Writes `chars` copies of the character at `p` (inside shift sequences when
// wrapped); answers the bytes written.
template <class T>
int64_t write_fill(const T &text, uint8_t *p, const FillChar &c, int64_t chars) {
  if (chars <= 0) return 0;
  if constexpr (T::kModal) {
    if (c.wrapped) {
      const auto shift = static_cast<size_t>(text.shift_length());
      std::memcpy(p, text.model.shift_out, shift);
      const int64_t body = repeat(p + shift, chars * c.width, c.bytes, c.width);
      std::memcpy(p + shift + body, text.model.shift_in, shift);
      return body + 2 * static_cast<int64_t>(shift);
    }
  }
  return repeat(p, chars * c.width, c.bytes, c.width);
}

template <class T>
FillChar char_at(const T &text, const NLSString &fill) {
  const auto length = static_cast<int64_t>(fill.length);
  const int64_t at = fill.curOffset;
  if (fill.buffer == nullptr || at < 0 || at >= length) return {};
  if constexpr (T::kModal) {
    return modal_char(text, fill.buffer + at, length - at, double_at(text, fill.buffer, at));
  } else {
    return {fill.buffer + at, text.item(fill.buffer + at, length - at, false).size, false};
  }
}

// The descriptor forms of every class but SBCS: from the current character
// (the end of the text when unset), counted in characters.
template <class T>
int64_t fill_descriptor(const NLSSMHandle *, const T &text, NLSString *dst, int64_t length,
                        const NLSString *fill, int64_t *written) {
  if (dst == nullptr || fill == nullptr) return kNullArgument;
  FillChar c = char_at(text, *fill);
  if (c.width == 0) return kOk;
  if (c.width > 4) c.width = 4;
  const int64_t from = dst->curOffset >= 0 ? dst->curOffset : static_cast<int64_t>(dst->length);
  const int64_t room = std::max<int64_t>(static_cast<int64_t>(dst->capacity) - from, 0);
  if (dst->buffer == nullptr && room > 0) return kNullArgument;
  const int64_t overhead = c.wrapped ? 2 * text.shift_length() : 0;
  const Plan p = plan(std::max<int64_t>(length, 0), room, c.width, overhead);
  const int64_t bytes = write_fill(text, dst->buffer + from, c, p.chars);
  dst->length = std::max<uint64_t>(dst->length, static_cast<uint64_t>(from + bytes));
  store(written, p.chars);
  return p.status;
}

// The raw forms: the whole fill buffer is the character (modal text: its
// first character), repeated over `length` bytes from the start.
template <class T>
int64_t fill_raw(const T &text, uint8_t *dst, int64_t length, const uint8_t *fill,
                 int64_t fillLength, int64_t cap, int64_t *written) {
  if (fill == nullptr || fillLength <= 0) return kNullArgument;
  length = std::max<int64_t>(length, 0);
  if (dst == nullptr && length > 0) return kNullArgument;
  FillChar c{fill, std::min(fillLength, cap), false};
  if constexpr (T::kModal) c = modal_char(text, fill, fillLength, false);
  if (c.width == 0) return kNullArgument;
  if (c.width == 1) {
    skMemSet(dst, c.bytes[0], length);
    store(written, length);
    return kOk;
  }
  const int64_t overhead = c.wrapped ? 2 * text.shift_length() : 0;
  const int64_t chars = length > overhead ? (length - overhead) / c.width : 0;
  const int64_t bytes = write_fill(text, dst, c, chars);
  store(written, bytes);
  return bytes == length ? kOk : kTooSmall;
}

// Single-byte descriptors are written from the byte offset of charIndex.
int64_t fill_sbcs(NLSString *dst, int64_t length, const NLSString *fill, int64_t *written) {
  if (dst == nullptr || fill == nullptr) return kNullArgument;
  if (fill->buffer == nullptr || fill->curOffset < 0 ||
      fill->curOffset >= static_cast<int64_t>(fill->length))
    return kOk;
  const int64_t from = std::max<int64_t>(dst->charIndex, 0);
  const int64_t room = std::max<int64_t>(static_cast<int64_t>(dst->capacity) - from, 0);
  if (dst->buffer == nullptr && room > 0) return kNullArgument;
  length = std::max<int64_t>(length, 0);
  const int64_t count = length == 0 ? room : std::min(length, room);
  skMemSet(dst->buffer + from, fill->buffer[fill->curOffset], count);
  dst->length = std::max<uint64_t>(dst->length, static_cast<uint64_t>(from + count));
  store(written, count);
  return length > room ? kTooSmall : kOk;
}

// The literal's first character in the handle's encoding; an empty literal
// is a caller error.
int64_t convert_first(const NLSSMHandle *h, LiteralChar &c, const uint8_t *literal, int64_t n) {
  if (literal == nullptr || n <= 0) return kNullArgument;
  const int64_t status = convert_first_char(h, c, literal);
  if (status != kOk) return status;
  return c.length() > 0 ? kOk : kNullArgument;
}

}  // namespace
}  // namespace nlssm::edit

namespace e = nlssm::edit;

namespace {

template <class Pick>
int64_t fill_member(const NLSSMHandle *h, NLSString *destination, int64_t length,
                    const NLSString *fillChar, int64_t *written) {
  return Pick::with(h, [&](const auto &text) {
    return e::fill_descriptor(h, text, destination, length, fillChar, written);
  });
}

// Four-byte units cap the fill character at one unit.
template <class Pick, bool kUnitCap>
int64_t fill_s_member(const NLSSMHandle *h, uint8_t *destination, int64_t length,
                      const uint8_t *fillChar, int64_t fillLength, int64_t *written) {
  return Pick::with(h, [&](const auto &text) {
    return e::fill_raw(text, destination, length, fillChar, fillLength, kUnitCap ? 4 : fillLength,
                       written);
  });
}

// The member shared by UTF-8, UTF-EBCDIC and the double-byte non-modal
// encodings sizes characters by the handle's class.
struct MultiByteText {
  template <class Fn>
  static int64_t with(const NLSSMHandle *h, Fn &&fn) {
    return h->encodingClass == NLSSM_CLASS_UTF8 ? e::with_text<NLSSM_CLASS_UTF8>(h, fn)
                                                : e::with_text<NLSSM_CLASS_MBCS_NONMODAL>(h, fn);
  }
};

// The literal forms call the handle's own fill with the converted character.
using FillFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const NLSString *, int64_t *);
using FillSFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t,
                            int64_t *);

}  // namespace

#define NLSSM_FILL_MEMBERS(SUFFIX, PICK, UNIT_CAP)                                               \
  extern "C" int64_t NLSStringFill_##SUFFIX(const NLSSMHandle *h, NLSString *destination,        \
                                            int64_t length, const NLSString *fillChar,           \
                                            int64_t *written) {                                  \
    return fill_member<PICK>(h, destination, length, fillChar, written);                         \
  }                                                                                              \
  extern "C" int64_t NLSStringFillS_##SUFFIX(const NLSSMHandle *h, uint8_t *destination,         \
                                             int64_t length, const uint8_t *fillChar,            \
                                             int64_t fillLength, int64_t *written) {             \
    return fill_s_member<PICK, UNIT_CAP>(h, destination, length, fillChar, fillLength, written); \
  }

// The single-byte descriptor member writes from charIndex (fill_sbcs).
extern "C" int64_t NLSStringFill_SBCS(const NLSSMHandle *, NLSString *destination, int64_t length,
                                      const NLSString *fillChar, int64_t *written) {
  return e::fill_sbcs(destination, length, fillChar, written);
}
extern "C" int64_t NLSStringFillS_SBCS(const NLSSMHandle *h, uint8_t *destination, int64_t length,
                                       const uint8_t *fillChar, int64_t fillLength,
                                       int64_t *written) {
  return fill_s_member<e::FixedText<e::SbcsText>, false>(h, destination, length, fillChar,
                                                         fillLength, written);
}
NLSSM_FILL_MEMBERS(MBCS, MultiByteText, false)
NLSSM_FILL_MEMBERS(WCS2, e::ClassText<NLSSM_CLASS_WCS2>, false)
NLSSM_FILL_MEMBERS(WCS4, e::FixedText<e::Wcs4Text>, true)
NLSSM_FILL_MEMBERS(MBCS_modal, e::FixedText<e::ModalText>, false)

extern "C" {

int64_t NLSStringFillLit(const NLSSMHandle *h, NLSString *destination, int64_t length,
                         const uint8_t *literal, int64_t literalLength, int64_t *written) {
  e::LiteralChar c;
  if (const int64_t status = e::convert_first(h, c, literal, literalLength); status != 0)
    return status;
  NLSString fill{};
  fill.buffer = const_cast<uint8_t *>(c.text());
  fill.length = fill.capacity = c.length();
  fill.curOffset = 0;
  fill.nextOffset = NLSSM_POS_NONE;
  fill.prevOffset = NLSSM_POS_NO_PREVIOUS;
  return reinterpret_cast<FillFn>(h->NLSStringFill)(h, destination, length, &fill, written);
}

int64_t NLSStringFillLitS(const NLSSMHandle *h, uint8_t *destination, int64_t length,
                          const uint8_t *literal, int64_t literalLength, int64_t *written) {
  e::LiteralChar c;
  if (const int64_t status = e::convert_first(h, c, literal, literalLength); status != 0)
    return status;
  return reinterpret_cast<FillSFn>(h->NLSStringFillS)(h, destination, length, c.text(),
                                                      static_cast<int64_t>(c.length()), written);
}

}  // extern "C"
