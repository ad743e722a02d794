// Case mapping of one character for the UTF-8 toolkit: the simple mapping
// of a code point, and the UTF-8 text that a character maps to under the
// simple or the full mappings.
#pragma once

#include <cstdint>
#include <cstring>

#include "kernel/u8/case_tables.hpp"
#include "kernel/u8/utf8.hpp"

namespace kernel::u8 {

enum class CaseKind { upper, lower, fold };

inline int32_t simple_delta(CaseKind kind, const CaseRecord &r) {
  return kind == CaseKind::upper ? r.upper : kind == CaseKind::lower ? r.lower : r.fold;
}
inline uint16_t full_text(CaseKind kind, const CaseRecord &r) {
  return kind == CaseKind::upper ? r.fullUpper : kind == CaseKind::lower ? r.fullLower : r.fullFold;
}

inline uint32_t simple_case(CaseKind kind, uint32_t cp) {
  return static_cast<uint32_t>(static_cast<int32_t>(cp) + simple_delta(kind, case_record(cp)));
}

inline uint8_t ascii_case(CaseKind kind, uint8_t b) {
  if (kind == CaseKind::upper) return (b >= 'a' && b <= 'z') ? static_cast<uint8_t>(b - 32) : b;
  return (b >= 'A' && b <= 'Z') ? static_cast<uint8_t>(b + 32) : b;
}

// Eight ASCII bytes mapped at once: adding 0x80 - first to each byte sets
// its bit 7 from `first` up, and adding 0x80 - last - 1 from past `last`, so
// bit 7 of the difference marks the letters whose bit 5 flips. No byte
// carries into the next since each is below 0x80.
inline uint64_t ascii_case_word(CaseKind kind, uint64_t w) {
  constexpr uint64_t kOnes = 0x0101010101010101ull;
  const uint64_t first = kind == CaseKind::upper ? 'a' : 'A';
  const uint64_t from = w + kOnes * (0x80 - first);
  const uint64_t past = w + kOnes * (0x80 - first - 26);
  return w ^ (((from & ~past) & (kOnes * 0x80)) >> 2);
}

// The text that the character at p (n bytes available) maps to, in out
// (kCaseFullMax bytes at least). An ill-formed stretch maps to itself.
struct Mapped {
  int32_t length;    // bytes written to out
  int32_t consumed;  // bytes of input taken
  bool illFormed;
};

inline Mapped map_char(CaseKind kind, bool full, const uint8_t *p, int64_t n, uint8_t *out) {
  if (p[0] < 0x80) {
    out[0] = ascii_case(kind, p[0]);
    return {1, 1, false};
  }
  const Step s = step(p, n);
  if (s.cp < 0) {
    std::memcpy(out, p, static_cast<size_t>(s.length));
    return {s.length, s.length, true};
  }
  const CaseRecord &r = case_record(static_cast<uint32_t>(s.cp));
  if (full) {
    if (const uint16_t text = full_text(kind, r); text != 0) {
      const int32_t length = kCaseFullText[text];
      std::memcpy(out, kCaseFullText + text + 1, static_cast<size_t>(length));
      return {length, s.length, false};
    }
  }
  return {encode(static_cast<uint32_t>(s.cp + simple_delta(kind, r)), out), s.length, false};
}

}  // namespace kernel::u8
