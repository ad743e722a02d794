// The exported UTF codecs and drivers: thin C wrappers over codec.hpp.
#include <nlssm/nlssm.h>

#include <cstring>

#include "unicode/codec.hpp"

namespace u = nlssm::unicode;
using u::Order;

#define NLSSM_UTF_DECODER(name, policy)                                                  \
  extern "C" int64_t name(const uint8_t *source, int64_t remaining, uint32_t *codePoint, \
                          int64_t *consumed) {                                           \
    return policy::decode(source, remaining, codePoint, consumed);                       \
  }
#define NLSSM_UTF_ENCODER(name, policy)                                               \
  extern "C" int64_t name(uint32_t codePoint, uint8_t *destination, int64_t capacity, \
                          int64_t *written) {                                         \
    return policy::encode(codePoint, destination, capacity, written);                 \
  }

NLSSM_UTF_DECODER(UTF8_UTF32, u::Utf8Decoder)
NLSSM_UTF_DECODER(UTF16_UTF32, u::Utf16Decoder<Order::big>)
NLSSM_UTF_DECODER(UTF16_UTF32_SWAP, u::Utf16Decoder<Order::little>)
NLSSM_UTF_DECODER(COPY_UTF32b, u::Utf32Decoder<Order::big>)
NLSSM_UTF_DECODER(COPY_UTF32b_SWAP, u::Utf32Decoder<Order::native>)

NLSSM_UTF_ENCODER(UTF32_UTF8, u::Utf8Encoder)
NLSSM_UTF_ENCODER(UTF16_UTF8, u::Utf16UnitToUtf8Encoder)
NLSSM_UTF_ENCODER(COPY_UTF32, u::Utf32Encoder<Order::big>)
NLSSM_UTF_ENCODER(COPY_UTF32_SWAP, u::Utf32Encoder<Order::little>)
NLSSM_UTF_ENCODER(UTF32_UTF16, u::Utf16UnitEncoder<Order::little>)
NLSSM_UTF_ENCODER(UTF32_UTF16_SWAP, u::Utf16UnitEncoder<Order::big>)
NLSSM_UTF_ENCODER(UTF32_UTF16s, u::Utf16Encoder<Order::little>)
NLSSM_UTF_ENCODER(UTF32_UTF16s_SWAP, u::Utf16Encoder<Order::big>)

extern "C" int64_t UTF8_UTF16(const uint8_t *source, int64_t remaining, uint16_t *units,
                              int64_t *consumed) {
  return u::utf8_to_utf16_units(source, remaining, units, consumed);
}

extern "C" int64_t COPY_UTF(const uint8_t *source, int64_t sourceBytes, uint8_t *destination,
                            int64_t capacity, int64_t *written) {
  const int64_t n = std::max<int64_t>(0, std::min(sourceBytes, capacity));
  if (n > 0) std::memmove(destination, source, static_cast<size_t>(n));
  u::put(written, n);
  return sourceBytes > capacity ? NLSSM_E_DEST_TOO_SMALL : NLSSM_OK;
}

extern "C" uint16_t Byte2Word(const uint8_t *bytes) {
  return u::load16<Order::little>(bytes);
}
extern "C" uint16_t Byte2Word_swap(const uint8_t *bytes) {
  return u::load16<Order::big>(bytes);
}
extern "C" uint32_t Byte2DWord(const uint8_t *bytes) {
  return u::load32<Order::little>(bytes);
}
extern "C" uint32_t Byte2DWord_swap(const uint8_t *bytes) {
  return u::load32<Order::big>(bytes);
}
extern "C" uint32_t BYTE_UTF16_UTF32(const uint8_t *bytes) {
  return u::load16<Order::big>(bytes);
}
extern "C" uint32_t BYTE_UTF16_UTF32_SWAP(const uint8_t *bytes) {
  return u::load16<Order::little>(bytes);
}

namespace {

// Bytes the module's own encoders write without looking at the capacity.
int64_t unchecked_bytes_of(NLSUTFEncoder encoder) {
  if (encoder == &UTF32_UTF16 || encoder == &UTF32_UTF16_SWAP || encoder == &UTF32_UTF16s ||
      encoder == &UTF32_UTF16s_SWAP)
    return 2;
  if (encoder == &UTF32_UTF8 || encoder == &UTF16_UTF8) return 1;
  return 0;
}

// The drivers compile their loop for the common codecs (recognised by the
// address of their exported function) and call any other through its pointer.
template <typename Decoder>
int64_t to_utf32_encoding(const uint8_t *s, int64_t n, uint8_t *d, int64_t capacity,
                          int64_t *written, Decoder decode, NLSUTFEncoder encoder) {
  if (encoder == &COPY_UTF32_SWAP)
    return u::convert_to_utf32(s, n, d, capacity, written, decode,
                               u::PolicyEncoder<u::Utf32Encoder<Order::little>>{});
  if (encoder == &COPY_UTF32)
    return u::convert_to_utf32(s, n, d, capacity, written, decode,
                               u::PolicyEncoder<u::Utf32Encoder<Order::big>>{});
  return u::convert_to_utf32(s, n, d, capacity, written, decode,
                             u::PointerEncoder{encoder, unchecked_bytes_of(encoder)});
}

template <typename Decoder>
int64_t from_utf32_encoding(const uint8_t *s, int64_t n, uint8_t *d, int64_t capacity,
                            int64_t *written, NLSUTFEncoder encoder, Decoder decode) {
  if (encoder == &UTF32_UTF8)
    return u::convert_from_utf32(s, n, d, capacity, written, u::PolicyEncoder<u::Utf8Encoder>{},
                                 decode);
  if (encoder == &UTF32_UTF16s)
    return u::convert_from_utf32(s, n, d, capacity, written,
                                 u::PolicyEncoder<u::Utf16Encoder<Order::little>>{}, decode);
  if (encoder == &UTF32_UTF16s_SWAP)
    return u::convert_from_utf32(s, n, d, capacity, written,
                                 u::PolicyEncoder<u::Utf16Encoder<Order::big>>{}, decode);
  return u::convert_from_utf32(s, n, d, capacity, written,
                               u::PointerEncoder{encoder, unchecked_bytes_of(encoder)}, decode);
}

}  // namespace

extern "C" int64_t ConvertToUTF32(const void *source, int64_t sourceBytes, void *destination,
                                  int64_t capacity, int64_t *written, NLSUTFDecoder decoder,
                                  NLSUTFEncoder encoder) {
  const auto *s = static_cast<const uint8_t *>(source);
  auto *d = static_cast<uint8_t *>(destination);
  if (decoder == &UTF8_UTF32)
    return to_utf32_encoding(s, sourceBytes, d, capacity, written,
                             u::PolicyDecoder<u::Utf8Decoder>{}, encoder);
  if (decoder == &UTF16_UTF32)
    return to_utf32_encoding(s, sourceBytes, d, capacity, written,
                             u::PolicyDecoder<u::Utf16Decoder<Order::big>>{}, encoder);
  if (decoder == &UTF16_UTF32_SWAP)
    return to_utf32_encoding(s, sourceBytes, d, capacity, written,
                             u::PolicyDecoder<u::Utf16Decoder<Order::little>>{}, encoder);
  return to_utf32_encoding(s, sourceBytes, d, capacity, written, u::PointerDecoder{decoder},
                           encoder);
}

extern "C" int64_t ConvertFromUTF32(const void *source, int64_t sourceBytes, void *destination,
                                    int64_t capacity, int64_t *written, NLSUTFEncoder encoder,
                                    NLSUTFDecoder decoder) {
  const auto *s = static_cast<const uint8_t *>(source);
  auto *d = static_cast<uint8_t *>(destination);
  if (decoder == &COPY_UTF32b_SWAP)
    return from_utf32_encoding(s, sourceBytes, d, capacity, written, encoder,
                               u::PolicyDecoder<u::Utf32Decoder<Order::native>>{});
  if (decoder == &COPY_UTF32b)
    return from_utf32_encoding(s, sourceBytes, d, capacity, written, encoder,
                               u::PolicyDecoder<u::Utf32Decoder<Order::big>>{});
  return from_utf32_encoding(s, sourceBytes, d, capacity, written, encoder,
                             u::PointerDecoder{decoder});
}

extern "C" int64_t isLegalUTF8(const uint8_t *bytes, int64_t length, int64_t *badIndex) {
  return u::is_legal_utf8(bytes, length, badIndex);
}

extern "C" int64_t GET_UTF8_LEN_FROM_QVCHAR(const uint32_t *chars, int64_t count) {
  return u::utf8_length(chars, count);
}
