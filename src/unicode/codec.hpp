// One-character codecs between UTF-8, UTF-16 and UTF-32, as policy types
// with a static `decode` or `encode`, plus the buffer drivers that run a
// decoder and an encoder over a whole buffer. The exported C functions are
// thin wrappers over these; the drivers are templates so that a known pair
// of codecs runs inline instead of through function pointers.
//
// Statuses are the module's 32-bit codes. Out pointers may be null; a null
// one is simply not written.
#pragma once

#include <nlssm/nlssm.h>

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>

#include "unicode/tables.hpp"
#include "unicode/utf32_blocks.hpp"
#include "unicode/utf8_blocks.hpp"

namespace nlssm::unicode {

inline constexpr uint32_t kReplacement = 0xFFFD;

// ---- Byte orders ------------------------------------------------------------
enum class Order { big, little, native };

template <Order O>
inline constexpr bool kIsBig = O == Order::big ||
                               (O == Order::native && std::endian::native == std::endian::big);

// True when units of order O must be byte-swapped on this machine.
template <Order O>
inline constexpr bool kSwaps = kIsBig<O> != (std::endian::native == std::endian::big);

template <Order O>
inline uint16_t load16(const uint8_t *p) {
  uint16_t v;
  std::memcpy(&v, p, 2);
  return kSwaps<O> ? __builtin_bswap16(v) : v;
}

template <Order O>
inline uint32_t load32(const uint8_t *p) {
  uint32_t v;
  std::memcpy(&v, p, 4);
  return kSwaps<O> ? __builtin_bswap32(v) : v;
}

template <Order O>
inline void store16(uint8_t *p, uint32_t v) {
  uint16_t u = static_cast<uint16_t>(v);
  if constexpr (kSwaps<O>) u = __builtin_bswap16(u);
  std::memcpy(p, &u, 2);
}

template <Order O>
inline void store32(uint8_t *p, uint32_t v) {
  if constexpr (kSwaps<O>) v = __builtin_bswap32(v);
  std::memcpy(p, &v, 4);
}

template <typename T>
inline void put(T *out, T value) {
  if (out != nullptr) *out = value;
}

// ---- Decoders: (source, bytes remaining, code point, consumed) -> status ----

// UTF-8. Only the lead byte is judged: the continuation bytes of a valid lead
// are taken as they are (callers that need strictness use is_legal_utf8).
// After an invalid lead, continuation bytes are skipped up to the length the
// lead announces, without regard to the bytes remaining.
struct Utf8Decoder {
  static constexpr bool kBulkToUtf32 = true;  // has a bulk loop to UTF-32

  static inline uint32_t decode(const uint8_t *s, int64_t remaining, uint32_t *cp,
                                int64_t *consumed) {
    const uint8_t b = s[0];
    if (b < 0x80) {
      put(cp, uint32_t{b});
      put(consumed, int64_t{1});
      return NLSSM_OK;
    }
    const int len = kit::bytesFromUTF8[b];
    if (valid_1st_utf8[b]) {
      if (remaining < len) {
        put(cp, kReplacement);
        put(consumed, remaining > 0 ? remaining : 0);
        return NLSSM_E_TRUNCATED_SEQUENCE;
      }
      uint32_t c = b & utf8_mask[len];
      for (int i = 1; i < len; ++i) c = c << 6 | (s[i] & 0x3F);
      put(cp, c);
      put(consumed, int64_t{len});
      return NLSSM_OK;
    }
    int64_t k = 1;
    while (k < len && valid_2nd_utf8[s[k]]) ++k;
    put(cp, kReplacement);
    put(consumed, k);
    return NLSSM_E_ILL_FORMED;
  }
};

// UTF-16 in the given unit order. A truncated high surrogate is detected
// only when fewer than 2 bytes remain; with 2 or 3 the second unit is read
// from the bytes that follow.
template <Order O>
struct Utf16Decoder {
  static constexpr bool kBulkToUtf32 = false;

  static inline uint32_t decode(const uint8_t *s, int64_t remaining, uint32_t *cp,
                                int64_t *consumed) {
    const uint32_t u = load16<O>(s);
    if ((u & 0xFC00) != 0xD800) {
      const bool lone_low = (u & 0xFC00) == 0xDC00;
      put(cp, lone_low ? kReplacement : u);
      put(consumed, int64_t{2});
      return lone_low ? NLSSM_E_ILL_FORMED : NLSSM_OK;
    }
    if (remaining < 2) {
      put(cp, kReplacement);
      put(consumed, int64_t{1});
      return NLSSM_E_TRUNCATED_SEQUENCE;
    }
    const uint32_t v = load16<O>(s + 2);
    put(consumed, int64_t{4});
    if ((v & 0xFC00) != 0xDC00) {
      put(cp, kReplacement);
      return NLSSM_E_ILL_FORMED;
    }
    put(cp, (((u & 0x3FF) << 10) | (v & 0x3FF)) + 0x10000);
    return NLSSM_OK;
  }
};

// One 32-bit unit in the given order; never fails.
template <Order O>
struct Utf32Decoder {
  static constexpr bool kBulkToUtf32 = false;
  // Plain units the encoding driver may hand to a block step.
  static constexpr bool kPlainUnits = true;
  static constexpr bool kBigEndian = kIsBig<O>;

  static inline uint32_t decode(const uint8_t *s, int64_t, uint32_t *cp, int64_t *consumed) {
    put(cp, load32<O>(s));
    put(consumed, int64_t{4});
    return NLSSM_OK;
  }
};

// ---- Encoders: (code point, destination, capacity, written) -> status -------

// UTF-8. ASCII is written without looking at the capacity. Every value from
// 0x10000 up takes the four-byte form, whatever its lead byte becomes.
struct Utf8Encoder {
  static constexpr bool kFixedWidth4 = false;
  // Bytes it may write without looking at the capacity.
  static constexpr int64_t kUncheckedBytes = 1;
  // The form a block step writes for it.
  static constexpr Utf32BlockForm kBlockForm = Utf32BlockForm::utf8;

  static inline uint32_t encode(uint32_t c, uint8_t *d, int64_t capacity, int64_t *written) {
    if (c < 0x80) {
      d[0] = static_cast<uint8_t>(c);
      put(written, int64_t{1});
      return NLSSM_OK;
    }
    const int len = c < 0x800 ? 2 : c < 0x10000 ? 3 : 4;
    if (capacity < len) {
      put(written, int64_t{0});
      return NLSSM_E_DEST_TOO_SMALL;
    }
    static constexpr uint8_t kMarker[5] = {0, 0, 0xC0, 0xE0, 0xF0};
    for (int i = len - 1; i > 0; --i) {
      d[i] = static_cast<uint8_t>(0x80 + (c & 0x3F));
      c >>= 6;
    }
    d[0] = static_cast<uint8_t>(kMarker[len] + c);
    put(written, int64_t{len});
    return NLSSM_OK;
  }
};

// One UTF-16 unit: a surrogate becomes its own three-byte sequence.
struct Utf16UnitToUtf8Encoder {
  static constexpr bool kFixedWidth4 = false;
  static constexpr int64_t kUncheckedBytes = 1;

  static inline uint32_t encode(uint32_t c, uint8_t *d, int64_t capacity, int64_t *written) {
    return Utf8Encoder::encode(c & 0xFFFF, d, capacity, written);
  }
};

// The low 16 bits as one unit, without a capacity check.
template <Order O>
struct Utf16UnitEncoder {
  static constexpr bool kFixedWidth4 = false;
  static constexpr int64_t kUncheckedBytes = 2;

  static inline uint32_t encode(uint32_t c, uint8_t *d, int64_t, int64_t *written) {
    store16<O>(d, c);
    put(written, int64_t{2});
    return NLSSM_OK;
  }
};

// UTF-16 with surrogate pairs. A BMP unit is written without a capacity
// check; a pair that does not fit leaves `written` untouched.
template <Order O>
struct Utf16Encoder {
  static constexpr bool kFixedWidth4 = false;
  static constexpr int64_t kUncheckedBytes = 2;
  static constexpr Utf32BlockForm kBlockForm =
      kIsBig<O> ? Utf32BlockForm::utf16_big : Utf32BlockForm::utf16_little;

  static inline uint32_t encode(uint32_t c, uint8_t *d, int64_t capacity, int64_t *written) {
    if (c < 0x10000) {
      store16<O>(d, c);
      put(written, int64_t{2});
      return NLSSM_OK;
    }
    if (capacity < 4) return NLSSM_E_DEST_TOO_SMALL;
    store16<O>(d, (((c - 0x10000) & 0xFFC00) >> 10) | 0xD800);
    store16<O>(d + 2, (c & 0x3FF) | 0xDC00);
    put(written, int64_t{4});
    return NLSSM_OK;
  }
};

// One 32-bit unit in the given order.
template <Order O>
struct Utf32Encoder {
  static constexpr bool kFixedWidth4 = true;
  static constexpr int64_t kUncheckedBytes = 0;
  static constexpr bool kBigEndian = kIsBig<O>;

  static inline uint32_t encode(uint32_t c, uint8_t *d, int64_t capacity, int64_t *written) {
    if (capacity < 4) {
      put(written, int64_t{0});
      return NLSSM_E_DEST_TOO_SMALL;
    }
    store32<O>(d, c);
    put(written, int64_t{4});
    return NLSSM_OK;
  }
};

// One UTF-8 character into UTF-16 units of native order; the caller's
// buffer takes up to two units. Every failure stores a single 0xFFFD.
inline uint32_t utf8_to_utf16_units(const uint8_t *s, int64_t remaining, uint16_t *units,
                                    int64_t *consumed) {
  uint32_t c = 0;
  if (Utf8Decoder::decode(s, remaining, &c, consumed) != NLSSM_OK) {
    units[0] = static_cast<uint16_t>(kReplacement);
    return NLSSM_E_ILL_FORMED;
  }
  if (c < 0x10000) {
    units[0] = static_cast<uint16_t>(c);
  } else {
    units[0] = static_cast<uint16_t>(((c - 0x10000) >> 10) | 0xD800);
    units[1] = static_cast<uint16_t>((c & 0x3FF) | 0xDC00);
  }
  return NLSSM_OK;
}

// ---- Buffer drivers ----------------------------------------------------------

// Adapters so that the drivers take either a policy type or a pointer to a
// function of the exported decoder or encoder signature.
template <typename Policy>
struct PolicyDecoder {
  static constexpr bool kBulkToUtf32 = Policy::kBulkToUtf32;
  // False where the policy does not say.
  static constexpr bool kPlainUnits = requires { requires Policy::kPlainUnits; };
  static constexpr bool kBigEndian = requires { requires Policy::kBigEndian; };
  // The block step of the bulk loop (decoders with kBulkToUtf32).
  Utf8BlockStep block_step() const { return utf8_best_block_step(); }
  uint32_t operator()(const uint8_t *s, int64_t n, uint32_t *cp, int64_t *consumed) const {
    return Policy::decode(s, n, cp, consumed);
  }
};
template <typename Policy>
struct PolicyEncoder {
  static constexpr bool kFixedWidth4 = Policy::kFixedWidth4;
  static constexpr bool kBigEndian = [] {
    if constexpr (Policy::kFixedWidth4)
      return Policy::kBigEndian;
    else
      return false;
  }();
  static constexpr Utf32BlockForm kBlockForm = [] {
    if constexpr (requires { Policy::kBlockForm; })
      return Policy::kBlockForm;
    else
      return Utf32BlockForm::none;
  }();
  // The block step of the encoding driver (encoders with a block form).
  Utf32BlockStep block_step() const { return utf32_best_block_step(); }
  static constexpr int64_t unchecked_bytes() { return Policy::kUncheckedBytes; }
  uint32_t operator()(uint32_t c, uint8_t *d, int64_t capacity, int64_t *written) const {
    return Policy::encode(c, d, capacity, written);
  }
};
struct PointerDecoder {
  static constexpr bool kBulkToUtf32 = false;
  static constexpr bool kPlainUnits = false;
  NLSUTFDecoder fn;
  uint32_t operator()(const uint8_t *s, int64_t n, uint32_t *cp, int64_t *consumed) const {
    return static_cast<uint32_t>(fn(s, n, cp, consumed));
  }
};
struct PointerEncoder {
  static constexpr bool kFixedWidth4 = false;
  static constexpr Utf32BlockForm kBlockForm = Utf32BlockForm::none;
  NLSUTFEncoder fn;
  // What the function may write without looking at the capacity: known for
  // the module's own encoders, 0 (it checks) for any other.
  int64_t unchecked = 0;
  int64_t unchecked_bytes() const { return unchecked; }
  uint32_t operator()(uint32_t c, uint8_t *d, int64_t capacity, int64_t *written) const {
    return static_cast<uint32_t>(fn(c, d, capacity, written));
  }
};

// Decodes `source` character by character and encodes each code point into a
// 4-byte slot of `destination`: at most capacity / 4 characters. Stops at the
// first failing decode or encode and returns its status; `written` receives
// 4 bytes per character stored.
template <typename Decoder, typename Encoder>
uint32_t convert_to_utf32(const uint8_t *source, int64_t source_bytes, uint8_t *destination,
                          int64_t capacity, int64_t *written, Decoder decode, Encoder encode) {
  if (source_bytes == 0) {
    put(written, int64_t{0});
    return NLSSM_OK;
  }
  const int64_t limit = capacity / 4;
  int64_t chars = 0;
  int64_t consumed = 0;
  int64_t room = capacity;
  uint32_t status = NLSSM_OK;
  while (chars < limit && consumed < source_bytes) {
    if constexpr (Decoder::kBulkToUtf32 && Encoder::kFixedWidth4) {
      const int64_t before = chars;
      utf8_to_utf32_bulk(decode.block_step(), source, source_bytes, destination, limit,
                         Encoder::kBigEndian, consumed, chars);
      room -= 4 * (chars - before);
      if (chars == limit || consumed == source_bytes) break;
    }
    uint32_t c = 0;
    int64_t used = 0;
    status = decode(source + consumed, source_bytes - consumed, &c, &used);
    if (status != NLSSM_OK) break;
    consumed += used;
    int64_t out = 0;
    status = encode(c, destination + 4 * chars, room, &out);
    if (status != NLSSM_OK) break;
    ++chars;
    room -= out;
  }
  put(written, chars * 4);
  return status;
}

// Reads 32-bit units from `source` through `decode` (whose status is not
// consulted: a unit always yields a value) and encodes each straight into
// `destination` at the running offset, with the capacity that remains, until
// the units or the capacity run out.
//
// Some encoders write a short form without looking at the capacity; when
// less room remains than such a form takes, the loop stops with "destination
// too small" before calling the encoder, so that nothing lands past the
// capacity.
template <typename Decoder, typename Encoder>
uint32_t convert_from_utf32(const uint8_t *source, int64_t source_bytes, uint8_t *destination,
                            int64_t capacity, int64_t *written, Encoder encode, Decoder decode) {
  if (source_bytes <= 3) {
    put(written, int64_t{0});
    return NLSSM_OK;
  }
  const int64_t units = source_bytes / 4;
  int64_t total = 0;
  int64_t i = 0;
  if constexpr (Decoder::kPlainUnits && Encoder::kBlockForm != Utf32BlockForm::none) {
    if (const Utf32BlockStep step = encode.block_step())
      step(source, units, Decoder::kBigEndian, Encoder::kBlockForm, destination, capacity, i,
           total);
  }
  int64_t room = capacity - total;
  uint32_t status = NLSSM_OK;
  for (; i < units && room > 0; ++i) {
    uint32_t c = 0;
    int64_t used = 0;
    decode(source + 4 * i, source_bytes - 4 * i, &c, &used);
    if (room < encode.unchecked_bytes()) {
      status = NLSSM_E_DEST_TOO_SMALL;
      break;
    }
    int64_t out = 0;
    status = encode(c, destination + total, room, &out);
    if (status != NLSSM_OK) break;
    total += out;
    room -= out;
  }
  put(written, total);
  return status;
}

// ---- UTF-8 legality and length ------------------------------------------------

// 1 when the `length` bytes form one well-formed UTF-8 character (lengths
// other than 1..4 count as legal); `bad_index` receives the lowest failing
// continuation position found, or `length`.
inline int64_t is_legal_utf8(const uint8_t *s, int64_t length, int64_t *bad_index) {
  put(bad_index, length);
  if (length < 1 || length > 4) return 1;
  int64_t legal = 1;
  auto continuation = [](uint8_t b) { return b >= 0x80 && b <= 0xBF; };
  if (length == 4 && !continuation(s[3])) {
    put(bad_index, int64_t{3});
    legal = 0;
  }
  if (length >= 3 && !continuation(s[2])) {
    put(bad_index, int64_t{2});
    legal = 0;
  }
  if (length >= 2) {
    if (!continuation(s[1])) {
      put(bad_index, int64_t{1});
      legal = 0;
    } else if ((s[0] == 0xE0 && s[1] < 0xA0) || (s[0] == 0xED && s[1] > 0x9F) ||
               (s[0] == 0xF0 && s[1] < 0x90)) {
      legal = 0;
    }
  }
  if ((s[0] >= 0x80 && s[0] <= 0xC1) || s[0] > 0xF4) legal = 0;
  return legal;
}

// Total UTF-8 bytes of `count` 32-bit characters: 1, 2, 3 or 4 each.
constexpr int64_t utf8_length_of(uint32_t c) {
  return c <= 0x7F ? 1 : c <= 0x7FF ? 2 : c < 0x10000 ? 3 : 4;
}
int64_t utf8_length_scalar(const uint32_t *chars, int64_t count);
int64_t utf8_length_sse2(const uint32_t *chars, int64_t count);
int64_t utf8_length_avx2(const uint32_t *chars, int64_t count);  // needs an AVX2 processor
bool avx2_usable();
int64_t utf8_length(const uint32_t *chars, int64_t count);  // best variant for this processor

}  // namespace nlssm::unicode
