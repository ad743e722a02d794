// NLSVisualOrderFormat and NLSLogicalOrderFormat: one line of text put into
// display order, or a displayed line back into reading order, in the
// handle's own encoding. A text front end per class decodes characters and
// gives their classes, paired brackets and mirror images; the level
// resolution (uba.cpp) is the same for all.
#include <nlssm/nlssm.h>

#include <cstdint>
#include <cstring>

#include "bidi/host_classes.hpp"
#include "bidi/pairs.hpp"
#include "bidi/uba.hpp"
#include "catalogue/catalogue.hpp"
#include "module/out_value.hpp"
#include "module/work_buffer.hpp"
#include "unicode/codec.hpp"

namespace nlssm::bidi {
namespace {

// The stand-in for ill-formed input.
using unicode::kReplacement;

struct Decoded {
  uint32_t character;
  int64_t size;
  int64_t status;  // NLSSM_OK, NLSSM_E_ILL_FORMED or NLSSM_E_TRUNCATED_SEQUENCE
};

// ---- Text front ends ---------------------------------------------------------
// Each answers: kMinSize (bytes of the shortest character), decode(p,
// remaining), encode(character, out) (bytes written, at most 5), and the
// properties (class, bracket word, mirror image) of a decoded character.

// The Unicode front ends take the properties of a character from the host.
struct UnicodeProperties : HostProperties {
  using HostProperties::HostProperties;
  const CharProperties &properties(uint32_t c) { return (*this)(c); }
};

// A code point (at most U+10FFFF) in an 8-byte area through the module's
// own encoder.
template <typename Encoder>
int64_t encode_with(uint32_t c, uint8_t *out) {
  int64_t size = 0;
  Encoder::encode(c, out, 8, &size);
  return size;
}

struct Utf8Text : UnicodeProperties {
  static constexpr int64_t kMinSize = 1;
  using UnicodeProperties::UnicodeProperties;

  // Well-formed UTF-8 only; an ill-formed sequence is replaced as one
  // character spanning its longest well-formed start (at least one byte).
  static Decoded decode(const uint8_t *p, int64_t remaining) {
    const uint8_t b = p[0];
    if (b < 0x80) return {b, 1, NLSSM_OK};
    int64_t size;
    uint32_t c;
    uint8_t low = 0x80, high = 0xBF;  // range of the second byte
    if (b >= 0xC2 && b <= 0xDF) {
      size = 2, c = b & 0x1Fu;
    } else if (b >= 0xE0 && b <= 0xEF) {
      size = 3, c = b & 0x0Fu;
      if (b == 0xE0) low = 0xA0;
      if (b == 0xED) high = 0x9F;
    } else if (b >= 0xF0 && b <= 0xF4) {
      size = 4, c = b & 0x07u;
      if (b == 0xF0) low = 0x90;
      if (b == 0xF4) high = 0x8F;
    } else {
      return {kReplacement, 1, NLSSM_E_ILL_FORMED};
    }
    for (int64_t k = 1; k < size; ++k) {
      if (k >= remaining) return {kReplacement, k, NLSSM_E_TRUNCATED_SEQUENCE};
      const uint8_t lo = k == 1 ? low : 0x80, hi = k == 1 ? high : 0xBF;
      if (p[k] < lo || p[k] > hi) return {kReplacement, k, NLSSM_E_ILL_FORMED};
      c = c << 6 | (p[k] & 0x3Fu);
    }
    return {c, size, NLSSM_OK};
  }
  static int64_t encode(uint32_t c, uint8_t *out) {
    return encode_with<unicode::Utf8Encoder>(c, out);
  }
};

// UTF-EBCDIC: each byte maps to an I8 byte, and I8 is UTF-8 with five-bit
// trailing bytes (A0-BF) and single bytes up to 9F.
struct UtfeText : UnicodeProperties {
  static constexpr int64_t kMinSize = 1;
  using UnicodeProperties::UnicodeProperties;

  static uint8_t i8(uint8_t b) { return unicode::utfe_i8s[b]; }
  static Decoded decode(const uint8_t *p, int64_t remaining) {
    const uint8_t lead = i8(p[0]);
    if (lead < 0xA0) return {lead, 1, NLSSM_OK};
    const int64_t size = unicode::bytesFromI8S[lead] + 1;
    if (size <= 0) return {kReplacement, 1, NLSSM_E_ILL_FORMED};
    uint32_t c = lead & (0xFFu >> (size + 1));
    for (int64_t k = 1; k < size; ++k) {
      if (k >= remaining) return {kReplacement, k, NLSSM_E_TRUNCATED_SEQUENCE};
      const uint8_t trail = i8(p[k]);
      if (trail < 0xA0 || trail > 0xBF) return {kReplacement, k, NLSSM_E_ILL_FORMED};
      c = c << 5 | (trail & 0x1Fu);
    }
    if (unicode::utfe_length(c) != size || c > 0x10FFFF || (c & 0xFFFFF800) == 0xD800)
      return {kReplacement, size, NLSSM_E_ILL_FORMED};
    return {c, size, NLSSM_OK};
  }
  static int64_t encode(uint32_t c, uint8_t *out) {
    const int64_t size = unicode::utfe_length(c);
    if (size == 1) {
      out[0] = unicode::i8s_utfe[c];
      return 1;
    }
    static constexpr uint8_t kLead[6] = {0, 0, 0xC0, 0xE0, 0xF0, 0xF8};
    for (int64_t k = size - 1; k > 0; --k, c >>= 5) out[k] = unicode::i8s_utfe[0xA0 | (c & 0x1F)];
    out[0] = unicode::i8s_utfe[kLead[size] | c];
    return size;
  }
};

template <bool kBig>
struct Utf16Text : UnicodeProperties {
  static constexpr int64_t kMinSize = 2;
  static constexpr unicode::Order kOrder = kBig ? unicode::Order::big : unicode::Order::little;
  using UnicodeProperties::UnicodeProperties;

  static uint32_t unit(const uint8_t *p) { return unicode::load16<kOrder>(p); }
  static Decoded decode(const uint8_t *p, int64_t remaining) {
    if (remaining < 2) return {kReplacement, remaining, NLSSM_E_TRUNCATED_SEQUENCE};
    const uint32_t u = unit(p);
    if ((u & 0xF800) != 0xD800) return {u, 2, NLSSM_OK};
    if ((u & 0xFC00) == 0xD800 && remaining >= 4 && (unit(p + 2) & 0xFC00) == 0xDC00)
      return {0x10000 + ((u & 0x3FF) << 10 | (unit(p + 2) & 0x3FF)), 4, NLSSM_OK};
    return {kReplacement, 2, NLSSM_E_ILL_FORMED};
  }
  static int64_t encode(uint32_t c, uint8_t *out) {
    return encode_with<unicode::Utf16Encoder<kOrder>>(c, out);
  }
};

template <bool kBig>
struct Utf32Text : UnicodeProperties {
  static constexpr int64_t kMinSize = 4;
  static constexpr unicode::Order kOrder = kBig ? unicode::Order::big : unicode::Order::little;
  using UnicodeProperties::UnicodeProperties;

  static Decoded decode(const uint8_t *p, int64_t remaining) {
    if (remaining < 4) return {kReplacement, remaining, NLSSM_E_TRUNCATED_SEQUENCE};
    const uint32_t c = unicode::load32<kOrder>(p);
    if (c > 0x10FFFF || (c & 0xFFFFF800) == 0xD800) return {kReplacement, 4, NLSSM_E_ILL_FORMED};
    return {c, 4, NLSSM_OK};
  }
  static int64_t encode(uint32_t c, uint8_t *out) {
    unicode::store32<kOrder>(out, c);
    return 4;
  }
};

// Single-byte right-to-left code pages: the reordering categories of the
// page's bidirectional table, its ( ) [ ] { } as paired brackets and its
// eight bracket-like characters as mirror images. A page without a table
// has no right-to-left characters: every byte is taken as L.
struct SbcsText {
  static constexpr int64_t kMinSize = 1;
  const catalogue::BidiTable *table;

  explicit SbcsText(const NLSSMHandle *handle)
      : table(reinterpret_cast<const catalogue::BidiTable *>(handle->bidiTable)) {
    for (uint32_t b = 0; b < 256; ++b) byByte[b] = {class_of(b), bracket(b), mirror(b)};
  }
  static Decoded decode(const uint8_t *p, int64_t) { return {p[0], 1, NLSSM_OK}; }
  static int64_t encode(uint32_t c, uint8_t *out) {
    out[0] = static_cast<uint8_t>(c);
    return 1;
  }
  const CharProperties &properties(uint32_t byte) const { return byByte[byte]; }

  CharProperties byByte[256];

 private:
  uint8_t class_of(uint32_t byte) const {
    if (table == nullptr) return L;
    switch (table->reorder[byte]) {
      case catalogue::kBidiL:
        return L;
      case catalogue::kBidiR:
        return R;
      case catalogue::kBidiAL:
        return AL;
      case catalogue::kBidiEN:
        return EN;
      case catalogue::kBidiET:
      case catalogue::kBidiAsciiET:
        return ET;
      case catalogue::kBidiCS:
      case catalogue::kBidiAsciiCS:
        return CS;
      case catalogue::kBidiWS:
        return WS;
      default:
        return ON;
    }
  }
  uint32_t bracket(uint32_t byte) const {
    if (table == nullptr || byte == 0) return 0;
    for (int k = 0; k < 6; ++k)
      if (table->brackets[k] == byte)
        return bracket_word(table->brackets[k & ~1], k & 1 ? kClosingBracket : kOpeningBracket);
    return 0;
  }
  uint32_t mirror(uint32_t byte) const {
    if (table == nullptr || byte == 0) return 0;
    for (int k = 0; k < 8; ++k)
      if (table->brackets[k] == byte) return table->mirrors[k];
    return 0;
  }
};

// ---- The operation -------------------------------------------------------------

// Attempts, the first included, that a logical-order request makes before it
// settles for its first.
constexpr int kAttempts = 8;

// A line's characters in some order: position i shows source character
// from[i], as its mirror image when mirrored[i].
struct Arrangement {
  uint32_t *from;
  uint8_t *mirrored;
};

template <typename Text>
class Reorderer {
 public:
  Reorderer(const NLSSMHandle *handle, const uint8_t *source) : text_(handle), source_(source) {}

  // Room for a line of up to `most` characters; false when the pool refuses.
  bool reserve(const NLSSMHandle *handle, uint64_t most) {
    // 4-byte words first (an even count keeps the resolution's work 8-byte
    // aligned), then the work, then the bytes.
    // Words: the offsets (most + 1), characters, order, brackets and the
    // three arrangements' sources (most each). Bytes: the classes, levels
    // and the three arrangements' mirror marks (most each).
    const uint64_t words = (7 * most + 2) & ~uint64_t{1};
    if (!buffer_.reserve(handle, 4 * words + work_bytes(most) + 5 * most)) return false;
    auto *w = reinterpret_cast<uint32_t *>(buffer_.data());
    offsets_ = w, chars_ = w + most + 1, order_ = w + 2 * most + 1, brackets_ = w + 3 * most + 1;
    work_ = w + words;
    uint8_t *b = static_cast<uint8_t *>(work_) + work_bytes(most);
    classes_ = b, levels_ = b + most;
    for (int k = 0; k < 3; ++k) sets_[k] = {w + (4 + k) * most + 1, b + (2 + k) * most};
    return true;
  }

  // Decodes the source, with the classes and brackets of the characters as
  // they stand: the first status of ill-formed input, else 0.
  int64_t decode(int64_t sourceBytes) {
    int64_t status = NLSSM_OK;
    n_ = 0;
    for (int64_t at = 0; at < sourceBytes; ++n_) {
      const Decoded d = Text::decode(source_ + at, sourceBytes - at);
      offsets_[n_] = static_cast<uint32_t>(at);
      chars_[n_] = d.character;
      classes_[n_] = ON;
      brackets_[n_] = 0;
      if (d.status != NLSSM_OK) {
        if (status == NLSSM_OK) status = d.status;
        chars_[n_] |= kIllFormed;
      } else {
        const CharProperties &p = text_.properties(d.character);
        classes_[n_] = p.bidiClass;
        brackets_[n_] = p.bracket;
      }
      at += d.size;
    }
    offsets_[n_] = static_cast<uint32_t>(sourceBytes);
    return status;
  }

  // Reading order to display order: the source as it stands, resolved.
  int visual(int direction, Arrangement &shown) {
    const int paragraph =
        bidi::resolve({classes_, brackets_, n_}, direction, levels_, order_, work_);
    display(identity(), shown);
    return paragraph;
  }

  // Display order to reading order: an arrangement of the line that
  // displays as the line. The first attempt is the line resolved as if it
  // were in reading order and its runs reversed back; each next one undoes
  // the display order the previous attempt resolved to. When none of them
  // displays as the line, the first attempt stands.
  int logical(int direction, Arrangement *&result) {
    Arrangement &first = sets_[1];
    const int paragraph = visual(direction, first);
    Arrangement *attempt = &first, *next = &sets_[0];
    result = &first;
    for (int k = 0; k < kAttempts; ++k) {
      resolve_arrangement(*attempt, paragraph);
      bool displaysAsLine = true;
      for (uint32_t v = 0; v < n_ && displaysAsLine; ++v)
        displaysAsLine = shown_at(*attempt, order_[v]) == point(v);
      if (displaysAsLine) {
        result = attempt;
        break;
      }
      bool moved = false;
      for (uint32_t v = 0; v < n_; ++v) {
        const uint32_t i = order_[v];
        const uint8_t mirrored = (levels_[i] & 1) && mirror(point(v)) != 0;
        moved = moved || attempt->from[i] != v || attempt->mirrored[i] != mirrored;
        next->from[i] = v;
        next->mirrored[i] = mirrored;
      }
      if (!moved) break;
      attempt = next;
      next = attempt == &sets_[0] ? &sets_[2] : &sets_[0];
    }
    return paragraph;
  }

  // Room for the display order of a visual request.
  Arrangement &scratch() { return sets_[2]; }

  // Writes an arrangement: what fits, no character split. NLSSM_OK or
  // NLSSM_E_DEST_TOO_SMALL, with `out` the bytes written.
  int64_t write(const Arrangement &a, uint8_t *destination, int64_t capacity, int64_t &out) {
    out = 0;
    for (uint32_t i = 0; i < n_; ++i) {
      const uint32_t j = a.from[i];
      const uint32_t c = a.mirrored[i] ? mirror(point(j)) : point(j);
      uint8_t encoded[8];
      const uint8_t *bytes = source_ + offsets_[j];
      int64_t size = offsets_[j + 1] - offsets_[j];
      if (c != chars_[j]) {  // a mirror image, or the stand-in for ill-formed input
        size = Text::encode(c, encoded);
        bytes = encoded;
      }
      if (size > capacity - out) return NLSSM_E_DEST_TOO_SMALL;
      std::memcpy(destination + out, bytes, static_cast<std::size_t>(size));
      out += size;
    }
    return NLSSM_OK;
  }

 private:
  static constexpr uint32_t kIllFormed = 0x80000000u;

  uint32_t point(uint32_t j) const { return chars_[j] & ~kIllFormed; }
  uint32_t mirror(uint32_t c) { return text_.properties(c).mirror; }
  uint32_t character(const Arrangement &a, uint32_t i) {
    return a.mirrored[i] ? mirror(point(a.from[i])) : point(a.from[i]);
  }
  // What position i of a resolved arrangement shows.
  uint32_t shown_at(const Arrangement &a, uint32_t i) {
    const uint32_t c = character(a, i);
    const uint32_t m = (levels_[i] & 1) ? mirror(c) : 0;
    return m != 0 ? m : c;
  }

  Arrangement &identity() {
    Arrangement &a = sets_[0];
    for (uint32_t i = 0; i < n_; ++i) a.from[i] = i, a.mirrored[i] = 0;
    return a;
  }

  // Classes and brackets of the characters as arranged, then their levels
  // and display order. Ill-formed input counts as ON.
  int resolve_arrangement(const Arrangement &a, int direction) {
    for (uint32_t i = 0; i < n_; ++i) {
      const bool illFormed = chars_[a.from[i]] & kIllFormed;
      const CharProperties &p = text_.properties(character(a, i));
      classes_[i] = illFormed ? uint8_t{ON} : p.bidiClass;
      brackets_[i] = illFormed ? 0 : p.bracket;
    }
    return bidi::resolve({classes_, brackets_, n_}, direction, levels_, order_, work_);
  }

  // The display order of a resolved arrangement, odd levels mirrored.
  void display(const Arrangement &a, Arrangement &shown) {
    for (uint32_t v = 0; v < n_; ++v) {
      const uint32_t i = order_[v];
      const bool mirrorHere = (levels_[i] & 1) && mirror(character(a, i)) != 0;
      shown.from[v] = a.from[i];
      shown.mirrored[v] = a.mirrored[i] != mirrorHere;
    }
  }

  Text text_;
  const uint8_t *source_;
  module::WorkBuffer<2048> buffer_;
  uint32_t n_ = 0;
  uint32_t *offsets_ = nullptr, *chars_ = nullptr, *order_ = nullptr, *brackets_ = nullptr;
  uint8_t *classes_ = nullptr, *levels_ = nullptr;
  void *work_ = nullptr;
  Arrangement sets_[3] = {};
};

template <typename Text, bool kLogical>
int64_t reorder(const NLSSMHandle *handle, const uint8_t *source, int64_t sourceBytes,
                uint8_t *destination, int64_t capacity, int64_t *written, uint8_t *direction) {
  module::store(written, 0);
  if (handle == nullptr || direction == nullptr) return NLSSM_E_NULL_ARGUMENT;
  if (sourceBytes < 0) sourceBytes = 0;
  if (capacity < 0) capacity = 0;
  if ((source == nullptr && sourceBytes > 0) || (destination == nullptr && capacity > 0))
    return NLSSM_E_NULL_ARGUMENT;
  const int requested = *direction;
  *direction = requested == 1 ? 1 : 0;
  if (sourceBytes == 0) return NLSSM_OK;
  if (sourceBytes >= 0x7FFFFFFF) return NLSSM_E_NO_MEMORY;  // offsets are 32-bit

  Reorderer<Text> line(handle, source);
  if (!line.reserve(handle,
                    static_cast<uint64_t>((sourceBytes + Text::kMinSize - 1) / Text::kMinSize)))
    return NLSSM_E_NO_MEMORY;
  const int64_t decoded = line.decode(sourceBytes);
  Arrangement *result = &line.scratch();
  const int paragraph =
      kLogical ? line.logical(requested, result) : line.visual(requested, *result);
  *direction = static_cast<uint8_t>(paragraph);
  int64_t out = 0;
  const int64_t status = line.write(*result, destination, capacity, out);
  module::store(written, out);
  return status != NLSSM_OK ? status : decoded;
}

using Reorder = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                            int64_t *, uint8_t *);

// The member for a handle: UTF-8 (encoding 20) or UTF-EBCDIC in class 1,
// big-endian units for encodings 24 and 26.
template <bool kLogical>
Reorder utf_member(const NLSSMHandle *handle) {
  return handle != nullptr && handle->encodingNumber != NLSSM_ENC_UTF8
             ? &reorder<UtfeText, kLogical>
             : &reorder<Utf8Text, kLogical>;
}
template <bool kLogical>
Reorder wcs2_member(const NLSSMHandle *handle) {
  return handle != nullptr && handle->encodingNumber == NLSSM_ENC_WCS2_BE
             ? &reorder<Utf16Text<true>, kLogical>
             : &reorder<Utf16Text<false>, kLogical>;
}
template <bool kLogical>
Reorder wcs4_member(const NLSSMHandle *handle) {
  return handle != nullptr && handle->encodingNumber == NLSSM_ENC_WCS4_BE
             ? &reorder<Utf32Text<true>, kLogical>
             : &reorder<Utf32Text<false>, kLogical>;
}

}  // namespace
}  // namespace nlssm::bidi

extern "C" {

int64_t NLSVisualOrderFormat_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                  int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                  int64_t *written, uint8_t *direction) {
  return nlssm::bidi::reorder<nlssm::bidi::SbcsText, false>(
      handle, source, sourceBytes, destination, capacity, written, direction);
}
int64_t NLSLogicalOrderFormat_SBCS(const NLSSMHandle *handle, const uint8_t *source,
                                   int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                   int64_t *written, uint8_t *direction) {
  return nlssm::bidi::reorder<nlssm::bidi::SbcsText, true>(handle, source, sourceBytes, destination,
                                                           capacity, written, direction);
}
int64_t NLSVisualOrderFormat_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                  int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                  int64_t *written, uint8_t *direction) {
  return nlssm::bidi::utf_member<false>(handle)(handle, source, sourceBytes, destination, capacity,
                                                written, direction);
}
int64_t NLSLogicalOrderFormat_UTF8(const NLSSMHandle *handle, const uint8_t *source,
                                   int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                   int64_t *written, uint8_t *direction) {
  return nlssm::bidi::utf_member<true>(handle)(handle, source, sourceBytes, destination, capacity,
                                               written, direction);
}
int64_t NLSVisualOrderFormat_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                  int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                  int64_t *written, uint8_t *direction) {
  return nlssm::bidi::wcs2_member<false>(handle)(handle, source, sourceBytes, destination, capacity,
                                                 written, direction);
}
int64_t NLSLogicalOrderFormat_WCS2(const NLSSMHandle *handle, const uint8_t *source,
                                   int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                   int64_t *written, uint8_t *direction) {
  return nlssm::bidi::wcs2_member<true>(handle)(handle, source, sourceBytes, destination, capacity,
                                                written, direction);
}
int64_t NLSVisualOrderFormat_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                  int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                  int64_t *written, uint8_t *direction) {
  return nlssm::bidi::wcs4_member<false>(handle)(handle, source, sourceBytes, destination, capacity,
                                                 written, direction);
}
int64_t NLSLogicalOrderFormat_WCS4(const NLSSMHandle *handle, const uint8_t *source,
                                   int64_t sourceBytes, uint8_t *destination, int64_t capacity,
                                   int64_t *written, uint8_t *direction) {
  return nlssm::bidi::wcs4_member<true>(handle)(handle, source, sourceBytes, destination, capacity,
                                                written, direction);
}

}  // extern "C"
