// Hand-built handles for the cursor tests: the fields and slots that the
// stepping and counting members read or call through, per encoding.
#pragma once

#include <nlssm/nlssm.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace cursor_test {

enum class Enc {
  kSbcs,
  kUtf8,
  kUtfe,
  kWcs2Le,
  kWcs2Be,
  kWcs4Le,
  kWcs4Be,
  kModal,
  kDbcs,
  kEucJp,
  kEucTw,
  kGb18030,
};

std::string enc_name(Enc e);

struct TestHandle {
  NLSSMHandle h{};
  uint8_t ranges[64]{};  // the host record's range block
};

// A handle for `e`. Double-byte code pages take their lead (0x44) and trail
// (0x08) flags from `flags` (256 bytes); without them, Shift-JIS ranges.
std::unique_ptr<TestHandle> make_handle(Enc e, const uint8_t *flags = nullptr);

// Calls through the handle's slots, as callers of the module do.
template <typename Fn>
Fn *as(NLSSlot s) {
  return reinterpret_cast<Fn *>(s);
}
inline int64_t set_pos(const NLSSMHandle *h, NLSString *s, int64_t pos, int64_t delta) {
  return as<decltype(stringSetPos_UTF8)>(h->stringSetPos)(h, s, pos, delta);
}
inline int64_t next_char(const NLSSMHandle *h, NLSString *s) {
  return as<decltype(stringNextChar_UTF8)>(h->stringNextChar)(h, s);
}
inline int64_t cur_char_size(const NLSSMHandle *h, const NLSString *s) {
  return as<decltype(stringCurCharSize_UTF8)>(h->stringCurCharSize)(h, s);
}
inline int64_t num_chars_s(const NLSSMHandle *h, const uint8_t *p, int64_t n, int64_t flags,
                           int64_t *count) {
  return as<decltype(NLSNumCharsS_UTF8)>(h->NLSNumCharsS)(h, p, n, flags, count);
}
inline int64_t num_chars(const NLSSMHandle *h, const NLSString *s, int64_t flags, int64_t *count) {
  return as<decltype(NLSNumChars_UTF8)>(h->NLSNumChars)(h, s, flags, count);
}
inline int64_t string_length(const NLSSMHandle *h, const uint8_t *text, int64_t *chars,
                             int64_t *bytes, int64_t flags = 0) {
  return as<decltype(NLSStringLength_UTF8)>(h->NLSStringLength)(h, text, chars, bytes, flags);
}
inline int64_t string_nlength(const NLSSMHandle *h, const uint8_t *text, int64_t limit,
                              int64_t *chars, int64_t *bytes) {
  return as<decltype(NLSStringNLength_UTF8)>(h->NLSStringNLength)(h, text, limit, chars, bytes);
}
inline int64_t string_blength(const NLSSMHandle *h, const uint8_t *text, int64_t count) {
  return as<decltype(NLSStringBLength_UTF8)>(h->NLSStringBLength)(h, text, count);
}
inline int64_t byte_length(const NLSSMHandle *h, const NLSString *s, int64_t limit) {
  return as<decltype(NLSStringByteLength_UTF8)>(h->NLSStringByteLength)(h, s, limit);
}
inline int64_t byte_length_c(const NLSSMHandle *h, const uint8_t *p, int64_t n, int64_t flags) {
  return as<decltype(NLSStringByteLengthC_UTF8)>(h->NLSStringByteLengthC)(h, p, n, flags);
}

// A descriptor over `bytes`, not yet positioned (as a caller builds one).
NLSString descriptor(std::vector<uint8_t> &bytes);

}  // namespace cursor_test
