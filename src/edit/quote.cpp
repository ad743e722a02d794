// Add quotes: copy text between two quote characters, doubling every quote
// character inside it, so that the result reads back as the original text.
// A destination too small holds what fits in whole characters (modal text
// closed in single-byte width) and the result length is the negated length
// the whole quoted text needs, for a retry with enough room.
#include <type_traits>

#include "edit/text_model.hpp"
#include "module/work_buffer.hpp"

namespace nlssm::edit {
namespace {

// Work buffers of add-quotes: 2048 bytes on the stack, the handle's pool
// beyond that; a pool that refuses cuts the room to the stack area.
constexpr int64_t kStackRoom = 2048;

struct Quote {
  uint8_t bytes[4];
  int64_t width;
};

template <class T>
Quote quote_of(const NLSSMHandle *h) {
  Quote q{};
  std::memcpy(q.bytes, h->quoteChar, 4);
  q.width = h->quoteWidth == 2 || h->quoteWidth == 4 ? static_cast<int64_t>(h->quoteWidth) : 1;
  if (T::kModal || std::is_same_v<T, SbcsText>) q.width = 1;
  return q;
}

bool overlap(const uint8_t *a, int64_t an, const uint8_t *b, int64_t bn) {
  const auto x = reinterpret_cast<uintptr_t>(a), y = reinterpret_cast<uintptr_t>(b);
  return an > 0 && bn > 0 && x < y + static_cast<uintptr_t>(bn) &&
         y < x + static_cast<uintptr_t>(an);
}

struct Quoted {
  int64_t status;
  int64_t written;  // bytes in the destination
  int64_t result;   // the written length, or minus the length needed
};

// Builds the quoted text in `out` (`room` bytes).
template <class T>
Quoted build(const T &text, const Quote &q, const uint8_t *src, int64_t n, uint8_t *out,
             int64_t room) {
  const int64_t shift = text.shift_length();
  int64_t off = 0, quotes = 0;
  bool dbl = false, stopped = room < q.width, wroteDbl = false;
  auto put = [&](const uint8_t *p, int64_t size) {
    std::memcpy(out + off, p, static_cast<size_t>(size));
    off += size;
  };
  if (!stopped) put(q.bytes, q.width);
  for (int64_t at = 0; at < n;) {
    const Item it = text.item(src + at, n - at, dbl);
    const bool isQuote = it.shift == 0 && !dbl && it.size == q.width &&
                         std::memcmp(src + at, q.bytes, static_cast<size_t>(q.width)) == 0;
    quotes += isQuote;
    if (!stopped) {
      int64_t need = isQuote ? 2 * it.size : it.size;
      if (it.shift > 0) {
        // A shift-out goes only with the character behind it and the
        // shift-in that will close the run.
        const int64_t next = at + it.size;
        if (next < n) {
          const Item behind = text.item(src + next, n - next, true);
          if (behind.shift == 0) need += behind.size;
        }
        need += shift;
      } else if (dbl && it.shift == 0) {
        need += shift;  // the run keeps room for its shift-in
      }
      if (off + need > room) {
        stopped = true;
      } else {
        if (isQuote) put(q.bytes, q.width);
        put(src + at, it.size);
      }
    }
    if (it.shift != 0) dbl = it.shift > 0;
    if (!stopped) wroteDbl = dbl;
    at += it.size;
  }
  int64_t needed = 2 * q.width + n + quotes * q.width;
  if constexpr (T::kModal) {
    if (dbl) needed += shift;  // the source leaves its run open
    if (wroteDbl) {
      std::memcpy(out + off, text.model.shift_in, static_cast<size_t>(shift));
      off += shift;
    }
  }
  if (!stopped && off + q.width <= room) {
    put(q.bytes, q.width);
    return {kOk, off, off};
  }
  return {kTooSmall, off, -needed};
}

template <class T>
Quoted add_quotes(const NLSSMHandle *h, const T &text, const uint8_t *src, int64_t n, uint8_t *dst,
                  int64_t room) {
  const Quote q = quote_of<T>(h);
  if (!overlap(src, n, dst, room)) return build(text, q, src, n, dst, room);
  module::WorkBuffer<kStackRoom> work;
  if (!work.reserve(h, static_cast<uint64_t>(room))) {
    work.use_stack();
    room = kStackRoom;
  }
  const Quoted r = build(text, q, src, n, work.data(), room);
  copy_bytes(work.data(), dst, r.written);
  return r;
}

template <class Pick>
int64_t add_quotes_s(const NLSSMHandle *h, const uint8_t *src, int64_t n, uint8_t *dst,
                     int64_t room, int64_t *result) {
  n = std::max<int64_t>(n, 0);
  room = std::max<int64_t>(room, 0);
  if ((src == nullptr && n > 0) || (dst == nullptr && room > 0)) return kNullArgument;
  const Quoted r =
      Pick::with(h, [&](const auto &text) { return add_quotes(h, text, src, n, dst, room); });
  store(result, r.result);
  return r.status;
}

// The descriptor form quotes `chars` characters from the source's current
// character (0 or more than there are: all of them) into the destination
// from its buffer's start, and sets the destination's length to the bytes
// written.
template <class Pick>
int64_t add_quotes_plain(const NLSSMHandle *h, const NLSString *src, int64_t chars, NLSString *dst,
                         int64_t *result) {
  if (src == nullptr || dst == nullptr) return kNullArgument;
  const uint8_t *from = nullptr;
  int64_t n = 0;
  if (src->buffer != nullptr && src->curOffset >= 0 &&
      src->curOffset < static_cast<int64_t>(src->length)) {
    from = src->buffer + src->curOffset;
    n = static_cast<int64_t>(src->length) - src->curOffset;
  }
  if (chars > 0 && n > 0)
    n = Pick::with(h, [&](const auto &text) { return bytes_of_chars(text, from, chars, n); });
  const int64_t room = static_cast<int64_t>(dst->capacity);
  if (dst->buffer == nullptr && room > 0) return kNullArgument;
  const Quoted r = Pick::with(
      h, [&](const auto &text) { return add_quotes(h, text, from, n, dst->buffer, room); });
  dst->length = static_cast<uint64_t>(r.written);
  store(result, r.result);
  return r.status;
}

}  // namespace
}  // namespace nlssm::edit

#define NLSSM_ADD_QUOTES(NAME, NAME_S, PICK)                                                   \
  extern "C" int64_t NAME(const NLSSMHandle *h, const NLSString *source, int64_t n,            \
                          NLSString *destination, int64_t *resultLength) {                     \
    return nlssm::edit::add_quotes_plain<PICK>(h, source, n, destination, resultLength);       \
  }                                                                                            \
  extern "C" int64_t NAME_S(const NLSSMHandle *h, const uint8_t *source, int64_t sourceLength, \
                            uint8_t *destination, int64_t destinationLength,                   \
                            int64_t *resultLength) {                                           \
    return nlssm::edit::add_quotes_s<PICK>(h, source, sourceLength, destination,               \
                                           destinationLength, resultLength);                   \
  }
#define NLSSM_ADD_QUOTES_MEMBERS(SUFFIX, PICK) \
  NLSSM_ADD_QUOTES(NLSStringAddQuotes_##SUFFIX, NLSStringAddQuotesS_##SUFFIX, PICK)

using nlssm::edit::FixedText;

NLSSM_ADD_QUOTES(NLSStringAddQuotes, NLSStringAddQuotesS, FixedText<nlssm::edit::SbcsText>)
NLSSM_ADD_QUOTES_MEMBERS(UTF8, FixedText<nlssm::edit::Utf8Text>)
NLSSM_ADD_QUOTES_MEMBERS(UTFE, FixedText<nlssm::edit::UtfeText>)
// The two-byte members read the byte order from the encoding number.
NLSSM_ADD_QUOTES_MEMBERS(WCS2, nlssm::edit::ClassText<NLSSM_CLASS_WCS2>)
NLSSM_ADD_QUOTES_MEMBERS(WCS4, FixedText<nlssm::edit::Wcs4Text>)
NLSSM_ADD_QUOTES_MEMBERS(MBCS_modal, FixedText<nlssm::edit::ModalText>)
NLSSM_ADD_QUOTES_MEMBERS(MBCS_nonmodal, FixedText<nlssm::edit::DbcsText>)
NLSSM_ADD_QUOTES_MEMBERS(MBCS_nonmodal_EUC_JP, FixedText<nlssm::edit::EucJpText>)
NLSSM_ADD_QUOTES_MEMBERS(MBCS_nonmodal_EUC_TW, FixedText<nlssm::edit::EucTwText>)
NLSSM_ADD_QUOTES_MEMBERS(MBCS_nonmodal_GB18030, FixedText<nlssm::edit::Gb18030Text>)
