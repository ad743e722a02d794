// One step of UTF-8 decoding and encoding, shared by the toolkit's members.
//
// Decoding follows Unicode's well-formedness rule (no overlong forms, no
// surrogates, nothing above U+10FFFF). An ill-formed stretch is taken as its
// maximal subpart: the longest start of a well-formed sequence that it is,
// or one byte when even its first byte cannot start one. That is how many
// bytes a decoder replaces by one U+FFFD, so every member counts and copies
// bad input the same way.
#pragma once

#include <cstdint>
#include <cstring>

#include "kernel/cpu.hpp"

namespace kernel::u8 {

struct Step {
  int32_t cp;      // the code point, or -1 for an ill-formed stretch
  int32_t length;  // bytes taken
};

// Decodes the character at p; n (at least 1) bytes are available.
inline Step step(const uint8_t *p, int64_t n) {
  const uint8_t lead = p[0];
  if (lead < 0x80) return {lead, 1};
  int32_t more;
  uint32_t cp;
  uint8_t lo = 0x80, hi = 0xBF;  // the range of the byte after the lead
  if (lead < 0xC2) {
    return {-1, 1};
  } else if (lead < 0xE0) {
    more = 1;
    cp = lead & 0x1Fu;
  } else if (lead < 0xF0) {
    more = 2;
    cp = lead & 0x0Fu;
    if (lead == 0xE0) lo = 0xA0;  // overlong below U+0800
    if (lead == 0xED) hi = 0x9F;  // surrogates
  } else if (lead < 0xF5) {
    more = 3;
    cp = lead & 0x07u;
    if (lead == 0xF0) lo = 0x90;  // overlong below U+10000
    if (lead == 0xF4) hi = 0x8F;  // above U+10FFFF
  } else {
    return {-1, 1};
  }
  for (int32_t i = 1; i <= more; ++i) {
    if (i >= n || p[i] < lo || p[i] > hi) return {-1, i};
    cp = (cp << 6) | (p[i] & 0x3Fu);
    lo = 0x80;
    hi = 0xBF;
  }
  return {static_cast<int32_t>(cp), more + 1};
}

// Writes the UTF-8 form of a code point (at most U+10FFFF) and returns its
// length.
inline int32_t encode(uint32_t cp, uint8_t *out) {
  if (cp < 0x80) {
    out[0] = static_cast<uint8_t>(cp);
    return 1;
  }
  if (cp < 0x800) {
    out[0] = static_cast<uint8_t>(0xC0 | (cp >> 6));
    out[1] = static_cast<uint8_t>(0x80 | (cp & 0x3F));
    return 2;
  }
  if (cp < 0x10000) {
    out[0] = static_cast<uint8_t>(0xE0 | (cp >> 12));
    out[1] = static_cast<uint8_t>(0x80 | ((cp >> 6) & 0x3F));
    out[2] = static_cast<uint8_t>(0x80 | (cp & 0x3F));
    return 3;
  }
  out[0] = static_cast<uint8_t>(0xF0 | (cp >> 18));
  out[1] = static_cast<uint8_t>(0x80 | ((cp >> 12) & 0x3F));
  out[2] = static_cast<uint8_t>(0x80 | ((cp >> 6) & 0x3F));
  out[3] = static_cast<uint8_t>(0x80 | (cp & 0x3F));
  return 4;
}

inline bool ascii_word(const uint8_t *p) {
  uint64_t w;
  std::memcpy(&w, p, 8);
  return (w & 0x8080808080808080ull) == 0;
}

// The scalar rule: the length of the longest well-formed prefix of p[0, n).
inline int64_t valid_prefix_scalar(const uint8_t *p, int64_t n) {
  int64_t i = 0;
  while (i < n) {
    if (i + 8 <= n && ascii_word(p + i)) {
      i += 8;
      continue;
    }
    if (p[i] < 0x80) {
      ++i;
      continue;
    }
    const Step s = step(p + i, n - i);
    if (s.cp < 0) return i;
    i += s.length;
  }
  return n;
}

// Validation variants: the AVX2 one classifies 32 bytes at a time; the
// baseline one is the scalar rule.
struct ValidateOps {
  int64_t (*valid_prefix)(const uint8_t *p, int64_t n);
};
namespace avx2 {
extern const ValidateOps kValidateOps;
}
inline constexpr ValidateOps kScalarValidateOps{&valid_prefix_scalar};

inline constinit cpu::Dispatch<ValidateOps, 2> validate_ops{
    {{{cpu::Isa::avx2, &avx2::kValidateOps}, {cpu::Isa::sse2, &kScalarValidateOps}}}};

inline int64_t valid_prefix(const uint8_t *p, int64_t n) {
  return validate_ops.get().valid_prefix(p, n);
}

}  // namespace kernel::u8
